// Hosts that plan block reads by the engine's answers alone.
#pragma once

#include <algorithm>
#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

#include "platform/IProtocol.h"

namespace poll_test {

using Value = std::vector<std::uint8_t>;

/// One tag's place in a block's image.
struct Placed {
    const ITag* tag;
    int byte;
};
using HostBlock = std::vector<Placed>;  ///< The first one begins it.

inline int lengthOf(const HostBlock& block) {
    int length = 0;
    for (const Placed& placed : block)
        length = std::max(length, placed.byte + placed.tag->PackedLen());
    return length;
}

/// @return the bits from the first tag's first to the last bit of any.
inline int bitsOf(const HostBlock& block) {
    int end = 0;
    for (const Placed& placed : block)
        end =
            std::max(end, placed.byte * 8 + placed.tag->GetBitIndex() + placed.tag->GetVarLength());
    return end - block.front().tag->GetBitIndex();
}

/// Sorts tags into groups that share blocks, each in the order of IsBefore(). Tags that share none,
/// not even with themselves, are alone in theirs.
inline std::vector<std::vector<const ITag*>> groupsOf(IProtocol4& engine,
                                                      const std::vector<const ITag*>& tags) {
    std::vector<std::vector<const ITag*>> groups;
    for (const ITag* tag : tags) {
        const auto home = std::find_if(groups.begin(), groups.end(), [&](const auto& group) {
            return engine.CanBeOptimized(group.front(), tag, false);
        });
        if (home == groups.end()) {
            groups.push_back({tag});
        } else {
            home->push_back(tag);
        }
    }
    for (auto& group : groups)
        std::stable_sort(group.begin(), group.end(),
                         [&](const ITag* a, const ITag* b) { return engine.IsBefore(a, b); });
    return groups;
}

/// Spans gaps: tags of a group share a block as long as no gap is wider than MaxUnusedGap() and
/// `mostGap` bytes, and the image no longer than `mostBytes`. It knows how many bytes an item of
/// each area has.
struct SpanningHost {
    int mostGap;
    int mostBytes;

    static int itemBytes(IProtocol4& engine, const ITag* tag) {
        if (engine.CanReadBitBlock(tag)) return 1;  // Byte offsets are bytes there.
        return std::string_view(tag->GetVarName()).find("?LONG?") != std::string_view::npos ? 4 : 2;
    }

    std::vector<HostBlock> plan(IProtocol4& engine, const std::vector<const ITag*>& group) const {
        std::vector<HostBlock> blocks;
        for (const ITag* tag : group) {
            if (!blocks.empty() && joins(engine, blocks.back(), tag)) continue;
            blocks.push_back({{tag, 0}});
        }
        return blocks;
    }

    bool joins(IProtocol4& engine, HostBlock& block, const ITag* tag) const {
        const ITag* first = block.front().tag;
        const long items =
            static_cast<long>(tag->GetByteOffset()) - static_cast<long>(first->GetByteOffset());
        const int byte = static_cast<int>(items) * itemBytes(engine, tag);
        const int gap = byte - lengthOf(block);
        if (gap > std::min(mostGap, engine.MaxUnusedGap(first))) return false;
        if (byte + tag->PackedLen() > mostBytes) return false;
        block.push_back({tag, byte});
        return true;
    }
};

/// Joins what touches: each tag of a block ends where the next one begins, IsAdjacent() says. It
/// knows nothing of items: what comes behind a tag lies behind its bytes.
struct ChainingHost {
    static std::vector<HostBlock> plan(IProtocol4& engine, const std::vector<const ITag*>& group) {
        std::vector<HostBlock> blocks;
        for (const ITag* tag : group) {
            if (!blocks.empty() && engine.IsAdjacent(tag, blocks.back().back().tag)) {
                const Placed& last = blocks.back().back();
                blocks.back().push_back({tag, byteBehind(engine, last, tag)});
            } else {
                blocks.push_back({{tag, 0}});
            }
        }
        return blocks;
    }

    static int byteBehind(IProtocol4& engine, const Placed& last, const ITag* tag) {
        if (engine.CanReadBitBlock(tag) || tag->GetByteOffset() == last.tag->GetByteOffset())
            return last.byte + static_cast<int>(tag->GetByteOffset() - last.tag->GetByteOffset());
        return last.byte + last.tag->PackedLen();
    }
};

/// @return the tag's value, nothing when the driver or a conversion refuses.
inline std::optional<Value> readAlone(IProtocol4& engine, const ITag* tag) {
    Value value(static_cast<std::size_t>(std::max(0, tag->GetVarLength())));
    if (engine.Read(tag, value.data()) == 0) return std::nullopt;
    return value;
}

/// @return the block's values, in its order. A block of one tag is read as a tag.
inline std::vector<std::optional<Value>> readBlock(IProtocol4& engine, const HostBlock& block) {
    const ITag* first = block.front().tag;
    if (block.size() == 1) return {readAlone(engine, first)};
    std::vector<std::optional<Value>> values(block.size());
    Value image(static_cast<std::size_t>(lengthOf(block)));
    const int done = engine.CanReadBitBlock(first)
                         ? engine.ReadBitBlock(first, image.data(), bitsOf(block))
                         : engine.ReadBlock(first, image.data(), lengthOf(block));
    if (done == 0) return values;
    for (std::size_t index = 0; index < block.size(); ++index) {
        const auto [tag, byte] = block[index];
        Value value(static_cast<std::size_t>(tag->GetVarLength()));
        // What lies in front of the image belongs to no tag that a right answer let join.
        if (byte >= 0 && tag->ConvertVariable(image.data() + byte, value.data(), false))
            values[index] = std::move(value);
    }
    return values;
}

}  // namespace poll_test
