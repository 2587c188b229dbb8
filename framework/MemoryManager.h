// The memory map of a driver: memory types, grouped into models, in one registry.
#pragma once

#include <string>
#include <vector>

#include "platform/ICU_Type.h"

/// One addressable area of a device. A value type.
class MemoryType {
  public:
    void setName(const std::string& name) { name_ = name; }
    void setNaturalType(ICU_Type type) { naturalType_ = type; }
    void setIcomTypes(int mask) { icomTypes_ = mask; }
    void setSwap2(bool on) { swap2_ = on; }
    void setSwap4(bool on) { swap4_ = on; }
    void setSwap8(bool on) { swap8_ = on; }
    void setBitWrite(bool on) { bitWrite_ = on; }
    void setBitArrayWrite(bool on) { bitArrayWrite_ = on; }
    void setReadOnly(bool on) { readOnly_ = on; }
    void setInDatagram(bool on) { inDatagram_ = on; }
    void setInternalConversion(bool on) { internalConversion_ = on; }
    void setBlockReadCount(int count) { blockReadCount_ = count; }
    void setBlockWriteCount(int count) { blockWriteCount_ = count; }
    void setMinIndex(int index) { minIndex_ = index; }
    void setMaxIndex(int index) { maxIndex_ = index; }
    void setBitRead(bool on) { bitRead_ = on; }

    std::string getName() const { return name_; }
    /// The name without a copy, for the paths that must not allocate.
    const std::string& nameRef() const { return name_; }
    /// The type of one item of the area.
    ICU_Type getNaturalType() const { return naturalType_; }
    /// The data types that tags in the area may have, a type mask.
    int getIcomTypes() const { return icomTypes_; }
    /// The most items that one read or write request may carry.
    int getBlockReadCount() const { return blockReadCount_; }
    int getBlockWriteCount() const { return blockWriteCount_; }
    bool isSwap2() const { return swap2_; }
    bool isSwap4() const { return swap4_; }
    bool isSwap8() const { return swap8_; }
    /// Single bits, and arrays of bits, may be written.
    bool isBitWrite() const { return bitWrite_; }
    bool isBitArrayWrite() const { return bitArrayWrite_; }
    bool isReadOnly() const { return readOnly_; }
    bool isWriteOnly() const { return writeOnly_; }
    bool isInDatagram() const { return inDatagram_; }
    bool hasInternalConversion() const { return internalConversion_; }
    int getMinIndex() const { return minIndex_; }
    int getMaxIndex() const { return maxIndex_; }
    /// The area must be read bit-wise.
    bool isBitRead() const { return bitRead_; }

  private:
    std::string name_;
    ICU_Type naturalType_ = ICU_Type::boolean;
    int icomTypes_ = 0x3fffff;  // types 1..22
    bool swap2_ = false;
    bool swap4_ = false;
    bool swap8_ = false;
    bool bitWrite_ = false;
    bool bitArrayWrite_ = false;
    bool readOnly_ = false;
    bool writeOnly_ = false;
    bool inDatagram_ = false;
    bool internalConversion_ = false;
    int blockReadCount_ = 0;
    int blockWriteCount_ = 0;
    int minIndex_ = 0;
    int maxIndex_ = 0;
    bool bitRead_ = false;
};

/// One family of device addressing: a name and its memory types in the order added. A value type.
class Model {
  public:
    explicit Model(const std::string& name) : name_(name) {}

    const std::string& getName() const { return name_; }
    int getMaxDatagramItems() const { return maxDatagramItems_; }
    int getMaxDatagramLength() const { return maxDatagramLength_; }
    const std::vector<MemoryType>& getMemoryTypes() const { return memoryTypes_; }

    void setMaxDatagramItems(int items) { maxDatagramItems_ = items; }
    void setMaxDatagramLength(int bytes) { maxDatagramLength_ = bytes; }
    /// Appends a copy, unless the model has a memory type of that name already.
    void addMemoryType(const MemoryType& type);

  private:
    std::string name_;
    int maxDatagramItems_ = 0;
    int maxDatagramLength_ = 0;
    std::vector<MemoryType> memoryTypes_;
};

/// The registry, filled once in a protocol's constructor. The pointers that it returns stay valid
/// as long as nothing is added.
class MemoryManager {
  public:
    /// Appends a copy; names are not checked for duplicates.
    void addModel(const Model& model);

    /// @return the first model of that name; when there is none the first model of all, so that a
    /// node with an unknown model name addresses its device as the first model; null when empty.
    const Model* getModel(const std::string& name) const;

    /// @return the memory type, or null when model or memory type is unknown (no fallback here).
    const MemoryType* getMemoryType(const std::string& model, const std::string& type) const;

    const std::vector<Model>& getModels() const { return models_; }

  private:
    std::vector<Model> models_;
};
