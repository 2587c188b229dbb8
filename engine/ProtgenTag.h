// The generic engine's tag: it takes a tag URI's address apart and supplies every length.
#pragma once

#include <string>
#include <vector>

#include "framework/MemoryManager.h"
#include "framework/TagBase.h"

/// Addresses. In *bit memories* (natural type boolean) an item is a bit: GetByteOffset() is the
/// offset / 8 and GetBitIndex() the offset % 8. In *register memories* GetByteOffset() is the
/// address of the first item and GetBitIndex() the sub-index as written: the first bit of a boolean
/// tag, counted from the least significant bit of the first item on. Other types begin with the
/// first item's first byte, whatever the sub-index.
/// The constructor throws nothing, since the driver that derives from it is another library: who
/// makes a tag asks isComplete().
/// Threads: the setters belong to the creation of the tag; then it does not change.
class ProtgenTag : public TagBase {
  public:
    /// Finds the field called "arrayindex.subindex" and reads offset (automatic base) and sub-index
    /// from it, 0 where there is none.
    /// @param uri         Copied.
    /// @param fieldNames  The names of the URI's fields, ended by a null pointer.
    ProtgenTag(const char* uri, const char* const* fieldNames);
    /// Whether there was memory for the tag; else it must not be used.
    bool isComplete() const { return complete_; }

    ITag* Clone() const override;
    unsigned int GetByteOffset() const override;
    int GetBitIndex() const override;
    const char* GetVarName() const override { return uri_.c_str(); }
    ICU_Type GetVarType() const override { return type_; }
    int GetVarLength() const override { return length_; }
    ICU_Type GetItemType() const override { return itemType_; }
    /// Covers whole bytes from the first item's first byte to the tag's last bit.
    int PackedLen() const override;
    bool IsReadOnly() const override;

    int offset() const { return offset_; }
    void setOffset(int offset) { offset_ = offset; }
    int subIndex() const { return subIndex_; }
    int nodeId() const { return nodeId_; }
    void setNodeId(int nodeId) { nodeId_ = nodeId; }

    /// @return false, with nothing set, when there was no memory for the conversions.
    [[nodiscard]] bool setDataType(ICU_Type type, ICU_Type itemType, int length,
                                   std::vector<std::string> conversions);

    /// The memory area and its model, owned by the protocol's MemoryManager; null before they are
    /// set.
    const MemoryType* memoryType() const { return memoryType_; }
    void setMemoryType(const MemoryType* memoryType) { memoryType_ = memoryType; }
    const Model* model() const { return model_; }
    void setModel(const Model* model) { model_ = model; }

    /// Whether one item of the tag's memory is a bit.
    bool inBitMemory() const;
    /// Bytes of one item of the tag's memory: 1 for bit memories.
    int memoryItemLength() const;

  protected:
    ProtgenTag(const ProtgenTag&) = default;

  private:
    void takeAddress(const char* const* fieldNames);

    bool complete_ = false;
    std::string uri_;
    int nodeId_ = 0;
    int offset_ = 0;
    int subIndex_ = 0;
    ICU_Type type_ = ICU_Type::none;
    ICU_Type itemType_ = ICU_Type::none;
    int length_ = 0;
    const MemoryType* memoryType_ = nullptr;
    const Model* model_ = nullptr;
};
