// What a terminal sends as the keys that were pressed. Pure.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cli {

enum class KeyKind : std::uint8_t {
    Character,  ///< Key::text holds it.
    Up,
    Down,
    PageUp,
    PageDown,
    Home,
    End,
    Enter,
    Backspace,
    Escape,
    Redraw,  ///< Ctrl-L.
};

struct Key {
    KeyKind kind = KeyKind::Character;
    std::string text{};  ///< One UTF-8 character.
    bool operator==(const Key&) const = default;
};

/// Bytes may come one by one: what is not whole waits for the rest.
class KeyDecoder {
  public:
    /// @return the keys that are whole now.
    std::vector<Key> feed(std::string_view bytes);
    /// Nothing has come for a while.
    /// @return Escape when that key was pressed alone; what else was begun is thrown away.
    std::optional<Key> idle();
    /// Tells whether idle() would change anything.
    [[nodiscard]] bool waiting() const { return !pending_.empty(); }

  private:
    std::string pending_;
};

}  // namespace cli
