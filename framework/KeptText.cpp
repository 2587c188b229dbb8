#include "framework/KeptText.h"

#include <cstring>
#include <limits>
#include <new>

#include "framework/PlainMemory.h"

KeptText::KeptText(const KeptText& other) noexcept {
    set(other.get());
}

KeptText::~KeptText() {
    for (Copy* copy = copies_.load(); copy != nullptr;) {
        const PlainMemory gone(copy);
        copy = copy->next;
    }
}

bool KeptText::set(std::string_view text) noexcept {
    if (const char* known = find(text)) {
        show(known);
        return true;
    }
    Copy* copy = copyOf(text);
    if (copy == nullptr) return false;

    // Two threads may add the same text at once; one copy too many does no harm.
    copy->next = copies_.load(std::memory_order_relaxed);
    while (!copies_.compare_exchange_weak(copy->next, copy, std::memory_order_release,
                                          std::memory_order_relaxed)) {
    }
    show(copy->text);
    return true;
}

/// @return null when there is no memory.
KeptText::Copy* KeptText::copyOf(std::string_view text) noexcept {
    if (text.size() > std::numeric_limits<std::size_t>::max() - sizeof(Copy) - 1) return nullptr;
    PlainMemory memory = takePlainMemory(sizeof(Copy) + text.size() + 1);
    if (memory == nullptr) return nullptr;
    char* characters = static_cast<char*>(memory.get()) + sizeof(Copy);
    std::memcpy(characters, text.data(), text.size());
    characters[text.size()] = '\0';
    return new (memory.release()) Copy{nullptr, text.size(), characters};
}

const char* KeptText::find(std::string_view text) const noexcept {
    if (text.empty()) return "";
    for (const Copy* copy = copies_.load(std::memory_order_acquire); copy != nullptr;
         copy = copy->next) {
        if (text == std::string_view(copy->text, copy->length)) return copy->text;
    }
    return nullptr;
}
