// A text that may be replaced while other threads look at it.
#pragma once

#include <atomic>
#include <cstddef>
#include <string_view>

/// Every different text that was set is kept until the object dies, so a pointer that get() handed
/// out stays readable and never changes its text. Meant for texts out of a small set: setting one
/// again costs nothing.
/// Threads: any operation beside any other. Never throws.
class KeptText {
  public:
    KeptText() noexcept = default;
    /// Shows the same text; nothing ("") when there was no memory for it.
    KeptText(const KeptText& other) noexcept;
    KeptText& operator=(const KeptText&) = delete;
    ~KeptText();

    /// Shows a copy of the text. @return false, with the text in force as before, when there was no
    /// memory for it. Takes memory only for a text that was not set before.
    bool set(std::string_view text) noexcept;
    /// Shows a text that lives at least as long as this object; takes no memory.
    void show(const char* lasting) noexcept { shown_.store(lasting, std::memory_order_release); }

    const char* get() const noexcept { return shown_.load(std::memory_order_acquire); }

  private:
    /// The text stands right behind it, in the same piece of memory.
    struct Copy {
        Copy* next;
        std::size_t length;
        const char* text;
    };

    static Copy* copyOf(std::string_view text) noexcept;
    const char* find(std::string_view text) const noexcept;

    std::atomic<const char*> shown_{""};
    std::atomic<Copy*> copies_{nullptr};
};
