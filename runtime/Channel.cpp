// Tags, reads, writes and console commands of one protocol object.
#include "runtime/Channel.h"

#include <algorithm>

namespace runtime {
namespace {

/// The driver's texts fill a buffer up to its end and are terminated only when they are shorter.
std::string textIn(const std::vector<char>& buffer) {
    return {buffer.begin(), std::find(buffer.begin(), buffer.end(), '\0')};
}

constexpr int kParametersLimit = 256;

}  // namespace

Channel::~Channel() {
    if (protocol_.get() != nullptr) stop();
}

void Channel::setIdent(const std::string& ident) {
    protocol_->SetIdent(ident.c_str());
}

Result<Done, ChannelError> Channel::configure(const std::string& text) {
    return outcome(protocol_->Config(text.c_str()));
}

Result<Done, ChannelError> Channel::start() {
    const int accepted = protocol_->Start();
    if (accepted != 0) started_ = true;
    return outcome(accepted);
}

void Channel::stop() {
    if (!started_) return;
    protocol_->Stop();
    started_ = false;
}

Result<ITag*, ChannelError> Channel::createTag(const std::string& uri) {
    ITag* tag = protocol_->CreateTag(uri.c_str());
    if (tag == nullptr) return lastError();
    return tag;
}

void Channel::freeTag(ITag* tag) {
    protocol_->FreeTag(tag);
}

Result<std::vector<std::uint8_t>, ChannelError> Channel::read(const ITag& tag) {
    std::vector<std::uint8_t> value(static_cast<std::size_t>(std::max(0, tag.GetVarLength())));
    const auto done = readInto(tag, value);
    if (!done) return done.error();
    return value;
}

Result<Done, ChannelError> Channel::readInto(const ITag& tag, std::span<std::uint8_t> value) {
    return outcome(protocol_->Read(&tag, value.data()));
}

Result<Done, ChannelError> Channel::write(const ITag& tag, std::span<const std::uint8_t> value) {
    if (static_cast<int>(value.size()) != tag.GetVarLength()) {
        return ChannelError{-1, "the value has " + std::to_string(value.size()) +
                                    " bytes, the tag takes " + std::to_string(tag.GetVarLength())};
    }
    return outcome(protocol_->Write(&tag, value.data()));
}

std::optional<std::string> Channel::command(const std::string& line, int limit) {
    auto* console = as<IProtocol2>("IProtocol2");
    if (console == nullptr) return std::nullopt;
    std::vector<char> answer(static_cast<std::size_t>(std::max(0, limit)));
    if (console->DoCommand(line.c_str(), answer.data(), static_cast<int>(answer.size())) == 0) {
        return std::nullopt;
    }
    return textIn(answer);
}

std::optional<std::string> Channel::communicationParameters() const {
    auto* reporter = as<IProtocol6>("IProtocol6");
    if (reporter == nullptr) return std::nullopt;
    std::vector<char> text(kParametersLimit);
    if (reporter->vcsGetComParams(text.data(), kParametersLimit) == 0) return std::nullopt;
    return textIn(text);
}

ChannelError Channel::lastError() const {
    const char* text = protocol_->GetLastErrorString();
    return {protocol_->GetLastError(), text != nullptr ? text : ""};
}

Result<Done, ChannelError> Channel::outcome(int accepted) const {
    if (accepted == 0) return lastError();
    return Done{};
}

}  // namespace runtime
