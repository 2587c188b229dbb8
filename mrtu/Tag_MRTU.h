// A tag of the Modbus driver: a parsed address with its function codes.
#pragma once

#include <cstdint>
#include <string>

#include "engine/ProtgenTag.h"
#include "mrtu/MemoryMap.h"
#include "mrtu/Params.h"

class Protocol_MRTU;

/// URI: nodeid?memorytype?arrayindex.subindex?datatype, e.g. 1?HREG?400010?unsignedShort.
/// What its pointers point to belongs to the protocol and stays valid until the protocol is
/// configured again or destroyed.
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

    const _MRTU::NodeParams* nodeParams() const { return nodeParams_; }
    const _MRTU::CommonParams* commonParams() const { return commonParams_; }
    /// Modbus function codes; the write function is 0 where writing is not possible.
    std::uint8_t readFunction() const { return readFunction_; }
    std::uint8_t writeFunction() const { return writeFunction_; }
    /// The driver's own area that the tag addresses, `none` for areas of the device.
    _MRTU::DriverArea driverArea() const { return driverArea_; }

  private:
    Tag_MRTU(const Tag_MRTU&) = default;

    bool refuse(const std::string& message);
    bool resolveArea(const Protocol_MRTU& protocol, const std::string& node,
                     const std::string& area);
    bool resolveType(const std::string& text);

    const _MRTU::NodeParams* nodeParams_ = nullptr;
    const _MRTU::CommonParams* commonParams_ = nullptr;
    std::uint8_t readFunction_ = 0;
    std::uint8_t writeFunction_ = 0;
    _MRTU::DriverArea driverArea_ = _MRTU::DriverArea::none;
};
