// A tag of the Modbus driver: a parsed address with its function codes.
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "engine/ProtgenTag.h"
#include "mrtu/MemoryMap.h"
#include "mrtu/Params.h"

class Protocol_MRTU;

/// URI: nodeid?memorytype?arrayindex.subindex?datatype, e.g. 1?HREG?400010?unsignedShort.
/// A tag and its clones keep the node's parameters that were in force when the tag was made, since
/// address and function codes were chosen by them. The line's parameters, model and memory type are
/// the protocol's and valid as long as it lives.
class Tag_MRTU final : public ProtgenTag {
  public:
    Tag_MRTU(const char* uri, const char* const* fieldNames);
    ~Tag_MRTU() override = default;
    ITag* Clone() const override;

    /// Takes the URI apart, checks it against the node's model and completes the tag.
    /// @return false with the tag's error text set.
    bool parseTagUrl(Protocol_MRTU* protocol);

    /// Turns the model's address into the 0-based Modbus address.
    /// @return false when the address lies outside the area; the offset of a 0-based model then
    /// keeps the 1 that was added to it.
    bool normalizeModbusOffset();

    /// Sets the function codes after the memory type and the node's choice.
    void getCodes();

    const _MRTU::NodeParams* nodeParams() const { return nodeParams_.get(); }
    /// The line's parameters now in force, whatever they were when the tag was made.
    const _MRTU::CommonParams* commonParams() const { return commonParams_; }
    /// Modbus function codes; the write function is 0 where writing is not possible.
    std::uint8_t readFunction() const { return readFunction_; }
    std::uint8_t writeFunction() const { return writeFunction_; }
    /// The driver's own area that the tag addresses, `None` for areas of the device.
    _MRTU::DriverArea driverArea() const { return driverArea_; }

  private:
    Tag_MRTU(const Tag_MRTU&) = default;

    bool refuse(const char* message);
    bool refuseType(const std::string& text);
    bool resolveArea(const Protocol_MRTU& protocol, const std::string& node,
                     const std::string& area);
    bool resolveType(const std::string& text);

    std::shared_ptr<const _MRTU::NodeParams> nodeParams_;
    const _MRTU::CommonParams* commonParams_ = nullptr;
    std::uint8_t readFunction_ = 0;
    std::uint8_t writeFunction_ = 0;
    _MRTU::DriverArea driverArea_ = _MRTU::DriverArea::None;
};
