// Blocks and single tags over a loaded driver.
#include <algorithm>

#include "platform/IProtocol.h"
#include "poll/BlockReader.h"

namespace poll {
namespace {

/// What the driver says of a value that a tag's conversions refuse.
const ReadError kConversionRefused{-9, "read conversion error"};

std::size_t imageBytes(const Block& block, const ITag& first) {
    if (!block.bits) return static_cast<std::size_t>(block.items * block.itemBytes);
    return static_cast<std::size_t>((first.GetBitIndex() + block.items + 7) / 8);
}

/// The byte of the block's image with which the tag's own image begins.
long imageOffset(const Block& block, const ITag& first, const ITag& tag) {
    const long bytesOfOffset = block.bits ? 1 : block.itemBytes;
    return (static_cast<long>(tag.GetByteOffset()) - static_cast<long>(first.GetByteOffset())) *
           bytesOfOffset;
}

}  // namespace

ChannelSource::ChannelSource(runtime::Channel& channel, std::vector<const ITag*> tags, Port port)
    : channel_(channel), tags_(std::move(tags)), port_(std::move(port)) {}

std::vector<TagReading> ChannelSource::read(const Block& block) {
    if (block.tags.empty()) return {};
    if (block.tags.size() == 1) return {readAlone(*tags_.at(block.tags.front()))};
    if (!readImage(block))
        return std::vector<TagReading>(block.tags.size(), {.error = lastError()});
    std::vector<TagReading> readings;
    readings.reserve(block.tags.size());
    for (const std::size_t tag : block.tags)
        readings.push_back(slice(block, *tags_.at(tag)));
    return readings;
}

std::vector<TagReading> ChannelSource::probe(const Block& block, std::chrono::milliseconds wait) {
    if (port_.limitWait) port_.limitWait(wait);
    std::vector<TagReading> readings = read(block);
    if (port_.limitWait) port_.limitWait(std::chrono::milliseconds{0});
    return readings;
}

TagReading ChannelSource::readAlone(const ITag& tag) {
    auto value = channel_.read(tag);
    if (!value) return {.error = {value.error().code, value.error().text}};
    return {.good = true, .value = std::move(value).value()};
}

bool ChannelSource::readImage(const Block& block) {
    const ITag& first = *tags_.at(block.tags.front());
    image_.assign(imageBytes(block, first), 0);
    IProtocol& driver = channel_.protocol();
    if (!block.bits)
        return driver.ReadBlock(&first, image_.data(), static_cast<int>(image_.size())) != 0;
    auto* bits = channel_.as<IProtocol4>("IProtocol4");
    return bits != nullptr &&
           bits->ReadBitBlock(&first, image_.data(), static_cast<int>(block.items)) != 0;
}

TagReading ChannelSource::slice(const Block& block, const ITag& tag) const {
    const long begin = imageOffset(block, *tags_.at(block.tags.front()), tag);
    const long end = begin + tag.PackedLen();
    if (begin < 0 || end > static_cast<long>(image_.size()))
        return {.error = {-1, "the tag lies outside its block"}};
    TagReading reading{.good = true};
    reading.value.resize(static_cast<std::size_t>(std::max(0, tag.GetVarLength())));
    if (!tag.ConvertVariable(image_.data() + begin, reading.value.data(), false))
        return {.error = kConversionRefused};
    return reading;
}

std::optional<ReadError> ChannelSource::write(std::size_t tag,
                                              std::span<const std::uint8_t> value) {
    const auto done = channel_.write(*tags_.at(tag), value);
    if (done) return std::nullopt;
    return ReadError{done.error().code, done.error().text};
}

bool ChannelSource::open() {
    fault_.clear();
    if (channel_.started()) return true;
    const auto started = channel_.start();
    if (started) return true;
    fault_ = port_.whyNotOpen ? port_.whyNotOpen() : std::string();
    if (fault_.empty()) fault_ = started.error().text;
    return false;
}

void ChannelSource::close() {
    channel_.stop();
}

bool ChannelSource::gone() const {
    return channel_.started() && port_.gone && port_.gone();
}

ReadError ChannelSource::lastError() const {
    const runtime::ChannelError error = channel_.lastError();
    return {error.code, error.text};
}

}  // namespace poll
