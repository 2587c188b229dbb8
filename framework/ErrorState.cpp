#include "framework/ErrorState.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <utility>

namespace {

using error_state::Parts;
using error_state::PassingPlace;

constexpr std::size_t kLongestText = std::numeric_limits<std::size_t>::max() / 4;

std::size_t lengthOf(Parts parts) {
    std::size_t length = 0;
    for (const std::string_view part : parts)
        length += part.size();
    return length;
}

bool equals(std::string_view text, Parts parts) {
    for (const std::string_view part : parts) {
        if (!text.starts_with(part)) return false;
        text.remove_prefix(part.size());
    }
    return text.empty();
}

/// Writes the parts, at most `room` characters, and a zero. A part may be an older text of the
/// same place.
void join(char* out, std::size_t room, Parts parts) {
    for (const std::string_view part : parts) {
        const std::size_t count = std::min(part.size(), room);
        if (count > 0) std::memmove(out, part.data(), count);
        out += count;
        room -= count;
    }
    *out = '\0';
}

}  // namespace

const ErrorState::Failure ErrorState::kNoFailure{};

void ErrorState::set(int code, std::string_view text) noexcept {
    const Parts parts(&text, 1);
    const std::lock_guard lock(mutex_);
    const Failure* failure = find(code, parts);
    if (failure == nullptr) failure = addLasting(code, parts);
    if (failure == nullptr) failure = addPassing(code, parts, true);
    publish(*failure);
}

bool ErrorState::setQuoting(int code, Parts parts) noexcept {
    const std::lock_guard lock(mutex_);
    const Failure* failure = find(code, parts);
    if (failure == nullptr) failure = addPassing(code, parts, false);
    if (failure == nullptr) return false;
    publish(*failure);
    return true;
}

void ErrorState::publish(const Failure& failure) noexcept {
    last_.store(&failure, std::memory_order_release);
}

const ErrorState::Failure* ErrorState::find(int code, Parts parts) noexcept {
    const auto isIt = [code, parts](const Failure& known) {
        return known.code == code && equals(known.text, parts);
    };
    const auto end = lasting_.begin() + static_cast<std::ptrdiff_t>(lastingCount_);
    const auto* const lasting = std::find_if(lasting_.begin(), end, isIt);
    if (lasting != end) return lasting;
    auto* const passing = std::find_if(
        passing_.begin(), passing_.end(),
        [&isIt](const PassingPlace& place) { return place.reported != 0 && isIt(place.failure); });
    return passing != passing_.end() ? useAgain(*passing) : nullptr;
}

/// The place takes its turn anew: those reported longer ago are overwritten before it.
const ErrorState::Failure* ErrorState::useAgain(PassingPlace& place) noexcept {
    place.reported = ++reports_;
    return &place.failure;
}

/// @return null when there is no place left for it.
const ErrorState::Failure* ErrorState::addLasting(int code, Parts parts) noexcept {
    const std::size_t length = lengthOf(parts);
    if (length > kLastingText || lastingCount_ == kLastingFailures) return nullptr;
    if (length + 1 > kLastingRoom - lastingUsed_) return nullptr;

    char* text = lastingTexts_.data() + lastingUsed_;
    join(text, length, parts);
    lastingUsed_ += length + 1;
    Failure& failure = lasting_[lastingCount_++];
    failure = {code, text};
    return &failure;
}

/// @return null when the text may not be cut and there is no memory for all of it.
const ErrorState::Failure* ErrorState::addPassing(int code, Parts parts, bool mayCut) noexcept {
    PassingPlace& place = *std::min_element(
        passing_.begin(), passing_.end(),
        [](const PassingPlace& a, const PassingPlace& b) { return a.reported < b.reported; });
    std::size_t length = lengthOf(parts);
    char* text = place.roomFor(length);
    if (text == nullptr && !mayCut) return nullptr;
    if (text == nullptr) {
        length = PassingPlace::kOwnText;
        text = place.text.data();
    }
    join(text, length, parts);
    place.failure = {code, text};
    return useAgain(place);
}

char* error_state::PassingPlace::roomFor(std::size_t length) noexcept {
    if (length <= kOwnText) return text.data();
    if (length > longTextRoom) {
        if (longTextCount == longTexts.size() || length > kLongestText) return nullptr;
        const std::size_t room = std::max(length, 2 * longTextRoom);
        PlainMemory made = takePlainMemory(room + 1);
        if (made == nullptr) return nullptr;
        longTexts[longTextCount++] = std::move(made);
        longTextRoom = room;
    }
    return static_cast<char*>(longTexts[longTextCount - 1].get());
}
