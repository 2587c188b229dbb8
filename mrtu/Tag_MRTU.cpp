#include "mrtu/Tag_MRTU.h"

#include <array>
#include <limits>
#include <new>
#include <string>
#include <vector>

#include "framework/DataTypes.h"
#include "framework/Guarded.h"
#include "framework/TextUtils.h"
#include "mrtu/ModbusNumbers.h"
#include "mrtu/Models.h"
#include "mrtu/Protocol_MRTU.h"

using _MRTU::DriverArea;
using _MRTU::WriteChoice;

namespace {

// What is wrong when a field is empty, in the order of the URI.
constexpr std::array kMissingField{
    "nodeID field missing",
    "memorytype field missing",
    "subIndex field missing",
    "icomType field missing",
};

bool isZeroBased(const Model& model) {
    const _MRTU::ModelRow* row = _MRTU::modelRow(model.getName());
    return row != nullptr && row->zeroBased;
}

}  // namespace

Tag_MRTU::Tag_MRTU(const char* uri, const char* const* fieldNames) : ProtgenTag(uri, fieldNames) {}

ITag* Tag_MRTU::Clone() const {
    return guarded(
        static_cast<ITag*>(nullptr), [this] { SetError("Out of memory"); },
        [this]() -> ITag* { return new Tag_MRTU(*this); });
}

bool Tag_MRTU::refuse(const char* message) {
    showError(message);
    return false;
}

bool Tag_MRTU::refuseType(const std::string& text) {
    SetError((text + ": data type unknown").c_str());
    return false;
}

bool Tag_MRTU::parseTagUrl(Protocol_MRTU* protocol) {
    std::vector<std::string> fields;
    ProtUtilsN::ParseSubstrings(GetVarName(), fields, '?');
    if (fields.size() != kMissingField.size())
        return refuse("there must be 4 tag specification fields");
    for (std::size_t index = 0; index < kMissingField.size(); ++index)
        if (fields[index].empty()) return refuse(kMissingField[index]);

    if (!resolveArea(*protocol, fields[0], fields[1])) return false;
    if (!resolveType(fields[3])) return false;
    if (driverArea_ == DriverArea::NodeOverride && GetVarType() != ICU_Type::unsignedByte)
        return refuse("invalid access to node override");
    if (!normalizeModbusOffset()) return refuse("invalid offset for this memory type");
    getCodes();

    if ((ProtUtilsN::GetTypeFlag(GetVarType()) & memoryType()->getIcomTypes()) == 0)
        return refuse("not allowed icom type");
    if (ProtUtilsN::GetDataLength(memoryType()->getNaturalType()) == 0)
        return refuse("invalid natural data type for this memory type");
    return true;
}

bool Tag_MRTU::resolveArea(const Protocol_MRTU& protocol, const std::string& node,
                           const std::string& area) {
    const _MRTU::ParamManager& params = *protocol.getParamManager();
    commonParams_ = params.getCommonParams();
    if (commonParams_ == nullptr) return refuse("Can't access protocol common parameters");

    setNodeId(ProtUtilsN::parseInteger(node.c_str()));
    nodeParams_ = params.shareNodeParams(nodeId());
    if (nodeParams_ == nullptr) return refuse("Can't access protocol node parameters");

    const MemoryManager& memory = *protocol.getMemoryManager();
    setModel(memory.getModel(nodeParams_->model));
    if (model() == nullptr) return refuse("Can't access model");

    setMemoryType(memory.getMemoryType(model()->getName(), area));
    if (memoryType() == nullptr) return refuse("Can't access memory type");

    const _MRTU::MemoryRow* row = _MRTU::memoryRow(memoryType()->nameRef());
    driverArea_ = row != nullptr ? row->area : DriverArea::None;
    return true;
}

bool Tag_MRTU::resolveType(const std::string& text) {
    ICU_Type type{};
    ICU_Type itemType{};
    int length = 0;
    std::vector<std::string> conversions;
    if (!ProtUtilsN::GetICOMType(text, type, itemType, length, conversions))
        return refuseType(text);
    // The type was looked up in this library, the tag is the engine's: it tells instead of
    // throwing.
    if (!setDataType(type, itemType, length, std::move(conversions))) throw std::bad_alloc();
    return true;
}

bool Tag_MRTU::normalizeModbusOffset() {
    // The declared index range of "NO" is 0..1, yet only index 0 can be addressed.
    if (driverArea_ != DriverArea::None) return offset() == 0;

    const _MRTU::MemoryRow* row = _MRTU::memoryRow(memoryType()->nameRef());
    const _MRTU::AddressRange* range = _MRTU::addressRange(memoryType()->nameRef());
    if (row == nullptr || range == nullptr) return false;
    const bool shifted = row->numbered && isZeroBased(*model());
    if (shifted && offset() < std::numeric_limits<int>::max()) setOffset(offset() + 1);

    if (offset() >= range->shortMin && offset() <= range->shortMax)
        setOffset(offset() - range->shortMin);
    else if (offset() >= range->longMin && offset() <= range->longMax)
        setOffset(offset() - range->longMin);
    else
        return false;
    return true;
}

void Tag_MRTU::getCodes() {
    const _MRTU::MemoryRow* row = _MRTU::memoryRow(memoryType()->nameRef());
    if (row == nullptr || row->readFunction == 0) return;
    readFunction_ = row->readFunction;
    switch (row->write) {
        case WriteChoice::Keep:
            break;
        case WriteChoice::Never:
            writeFunction_ = 0;
            break;
        case WriteChoice::Coils:
            writeFunction_ =
                nodeParams_->forceFunction == "15" ? _MRTU::kWriteCoils : _MRTU::kWriteCoil;
            break;
        case WriteChoice::Registers:
            writeFunction_ = nodeParams_->presetFunction == "16" ? _MRTU::kWriteRegisters
                                                                 : _MRTU::kWriteRegister;
            break;
        case WriteChoice::Single:
            writeFunction_ = _MRTU::kWriteRegister;
            break;
    }
}
