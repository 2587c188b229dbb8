// How a session makes, reads and writes tags.
#include <algorithm>

#include "cli/Session.h"
#include "settings/NodeNumbers.h"
#include "values/ByteOrder.h"
#include "values/ValueError.h"
#include "values/ValueTypes.h"

namespace cli {
namespace {

using values::Bytes;
using values::ByteView;

// Codes of IProtocol::GetLastError().
constexpr int kGeneralError = -1;
constexpr int kConversionError = -9;
constexpr int kNodeRefused = -10;

/// No area holds a longer value, or one in front of it; the driver refuses such a tag when it is
/// used.
constexpr std::size_t kLongestValue = std::size_t{4} * 65536;

/// Zeroes are a value that every conversion takes which can be applied to the type at all.
bool conversionsApply(const ITag& tag) {
    const std::size_t length = values::shapeOf(tag).bytes;
    const auto packed = static_cast<std::size_t>(std::max(0, tag.PackedLen()));
    const bool possible = tag.GetBitIndex() >= 0 && std::max(length, packed) <= kLongestValue;
    if (length == 0 || !possible) return true;
    const Bytes zeroes(std::max(length, packed));
    Bytes value(length);
    return tag.ConvertVariable(zeroes.data(), value.data(), false);
}

}  // namespace

runtime::Result<ITag*, Failure> Session::createTag(const std::string& uri) {
    const auto refuse = [](runtime::ChannelError error) {
        return Failure{std::move(error), ExitCode::Usage};
    };
    try {
        const auto tag = channel().createTag(values::withoutByteOrder(uri));
        if (!tag) return refuse(tag.error());
        if (!conversionsApply(*tag.value())) {
            return refuse({kConversionError, "the conversions can't be applied to this type"});
        }
        return tag.value();
    } catch (const values::ValueError& error) {
        return refuse({kGeneralError, error.what()});
    }
}

int Session::nodeOf(const ITag& tag) const {
    const auto* const nodes = channel().as<IProtocol4>("IProtocol4");
    return nodes == nullptr ? 0 : nodes->GetNodeID(&tag);
}

std::string Session::areaOf(const ITag& tag) const {
    auto* const fields = channel().as<IProtocol7>("IProtocol7");
    if (fields == nullptr) return {};
    int length = 0;
    const char* const area =
        fields->getTagUriField(&tag, fields->getTagUriFieldPosition("memorytype"), &length);
    return area == nullptr ? "" : std::string(area, static_cast<std::size_t>(std::max(0, length)));
}

Failure Session::failureOf(const ITag& tag, const runtime::ChannelError& error, bool asked) const {
    const ExitCode code = portGone() ? ExitCode::Port : exitCodeOf(error.code);
    if (asked || code != ExitCode::Other) return {error, code};
    // The line knows the low byte of a node only.
    const int node = nodeOf(tag) & settings::kNodeOff;
    const bool addressable = node > 0 && node < settings::kNodeOff;
    if (error.code == kNodeRefused && addressable) return {error, code};
    return {error, ExitCode::Usage};
}

runtime::Result<Bytes, Failure> Session::read(const ITag& tag) {
    const std::uint64_t before = framesSent();
    const auto value = channel().read(tag);
    if (!value) return failureOf(tag, value.error(), framesSent() != before);
    return value.value();
}

runtime::Result<runtime::Done, Failure> Session::write(const ITag& tag, ByteView value) {
    const std::uint64_t before = framesSent();
    const auto done = channel().write(tag, value);
    if (!done) return failureOf(tag, done.error(), framesSent() != before);
    return done.value();
}

runtime::Result<runtime::Done, Failure> Session::writeItems(const ITag& tag, ByteView value,
                                                            std::size_t& written) {
    auto* const items = channel().as<IProtocol7>("IProtocol7");
    const std::size_t count = values::itemCount(values::shapeOf(tag));
    const std::size_t length = value.size() / std::max<std::size_t>(1, count);
    const std::uint64_t before = framesSent();
    for (written = 0; written < count; ++written) {
        const ByteView item = value.subspan(written * length, length);
        if (items == nullptr ||
            items->writeArrayItem(&tag, static_cast<int>(written), item.data()) == 0) {
            return failureOf(tag, channel().lastError(), framesSent() != before);
        }
    }
    return runtime::Done{};
}

}  // namespace cli
