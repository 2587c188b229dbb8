// The smallest protocol and tag that stand on the framework's bases, for the tests of the bases.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "framework/ProtocolBase.h"
#include "framework/TagBase.h"

/// What a tag of the tests is like.
struct TagShape {
    ICU_Type type = ICU_Type::unsignedByteArray;
    ICU_Type itemType = ICU_Type::unsignedByte;
    int length = 1;
    unsigned int byteOffset = 0;
    int bitIndex = 0;
    std::vector<std::string> conversions = {};
};

/// A tag of any shape that counts its destruction.
class TestTag final : public TagBase {
  public:
    TestTag(std::string uri, const TagShape& shape, int* destroyed = nullptr)
        : uri_(std::move(uri)), shape_(shape), destroyed_(destroyed) {
        setConversions(shape.conversions);
    }
    TestTag(const TestTag&) = default;
    ~TestTag() override {
        if (destroyed_ != nullptr) ++*destroyed_;
    }

    /// From now on GetVarName() is null.
    void forgetUri() { hasUri_ = false; }

    ITag* Clone() const override { return new TestTag(*this); }
    unsigned int GetByteOffset() const override { return shape_.byteOffset; }
    int GetBitIndex() const override { return shape_.bitIndex; }
    const char* GetVarName() const override { return hasUri_ ? uri_.c_str() : nullptr; }
    ICU_Type GetVarType() const override { return shape_.type; }
    int GetVarLength() const override { return shape_.length; }
    ICU_Type GetItemType() const override { return shape_.itemType; }

  private:
    std::string uri_;
    TagShape shape_;
    int* destroyed_;
    bool hasUri_ = true;
};

/// An array of `length` unsigned bytes.
inline TagShape bytesShape(int length) {
    return {ICU_Type::unsignedByteArray, ICU_Type::unsignedByte, length};
}

/// Overrides the pure operations and nothing else: reads answer from `device`, writes are noted.
class TestProtocol : public ProtocolBase {
  public:
    using ProtocolBase::DeleteTags;
    using ProtocolBase::SetError;
    using ProtocolBase::SetTagError;

    std::map<std::string, TagShape> knownTags;  ///< By URI; CreateTag() refuses every other.
    int destroyedTags = 0;

    std::vector<unsigned char> device;  ///< Copied out from its start, as far as it reaches.
    int readResult = 1;
    std::vector<int> readLengths;
    int writeResult = 1;
    std::vector<std::vector<unsigned char>> written;

    const char* name = "TEST";
    const char* implementation = "TestProtocol";
    int maxTm = 1500;
    mutable bool maxTmAskedForNoTag = false;

    const char* GetImpName() const override { return implementation; }
    int GetImpVersion() const override { return 34; }
    int Config(const char*) override { return 1; }
    bool CanBeOptimized(const ITag*, const ITag*, bool) const override { return false; }
    int Write(const ITag* tag, const unsigned char* value) override {
        written.emplace_back(value, value + tag->GetVarLength());
        if (writeResult == 0) SetError(-4, "nobody answered the write");
        return writeResult;
    }
    int ReadBlock(const ITag*, unsigned char* data, int length) override {
        readLengths.push_back(length);
        if (readResult == 0) SetError(-4, "nobody answered the read");
        if (readResult != 0) answer(data, length);
        return readResult;
    }
    const char* GetName() const override { return name; }
    int GetProtocolVersion() const override { return 12; }
    int GetProtocolType() const override { return 7; }
    const char* GetProtocolName() const override { return "Test Protocol"; }
    int GetNodeID(const ITag*) const override { return 1; }
    ITag* CreateTagBase(const char* uri) override {
        const auto known = knownTags.find(uri);
        if (known != knownTags.end()) return new TestTag(uri, known->second, &destroyedTags);
        SetError(-1, "Tag URI error: no such tag");
        return nullptr;
    }
    int GetMaxTm(const ITag* tag) const override {
        maxTmAskedForNoTag = tag == nullptr;
        return maxTm;
    }

  protected:
    void answer(unsigned char* data, int length) const {
        for (int i = 0; i < length && i < static_cast<int>(device.size()); ++i)
            data[i] = device[static_cast<std::size_t>(i)];
    }
};

/// A protocol that reads bits; `device` is their image.
class BitProtocol : public TestProtocol {
  public:
    bool CanReadBitBlock(const ITag*) const override { return true; }
    int ReadBitBlock(const ITag*, unsigned char* data, int bits) override {
        bitCounts.push_back(bits);
        if (readResult != 0) answer(data, static_cast<int>(device.size()));
        return readResult;
    }
    std::vector<int> bitCounts;
};
