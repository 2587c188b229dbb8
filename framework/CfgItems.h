// The items of a configuration text, found by name in a time that does not grow with the text.
#pragma once

#include <cstddef>
#include <optional>
#include <string_view>
#include <vector>

/// Holds places, not characters: every look-up gets the text that was indexed. A value type.
class CfgItems {
  public:
    /// No items.
    CfgItems() = default;
    /// Indexes every piece between white space that holds a "=".
    explicit CfgItems(std::string_view text);

    /// @param text  The text that was indexed.
    /// @param name  Neither "=" nor white space in it; see isName().
    /// @return the raw value of the first item called `name`; nothing when there is none.
    std::optional<std::string_view> find(std::string_view text, std::string_view name) const;

    /// @return whether an item can be called so. The first "=" of an item ends its name.
    static bool isName(std::string_view name);

  private:
    struct Item {
        std::size_t hash;  ///< Of the name.
        std::size_t begin;
        std::size_t nameLength;
        std::size_t end;
    };
    static bool standsBefore(const Item& a, const Item& b);
    void addItem(std::string_view text, std::size_t begin, std::size_t end);

    std::vector<Item> items_;  ///< By hash, and in the order of the text where hashes are equal.
};
