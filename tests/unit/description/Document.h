// Reads the block that the library carries the way a configuration tool does.
#pragma once

#include <cstddef>
#include <pugixml.hpp>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace description_test {

/// The length that the block's first line declares, in bytes; 0 when the line is malformed.
std::size_t declaredStreamLength();

/// The first byte of the zlib stream.
const unsigned char* stream();

struct Inflated {
    std::string text;
    int result;            ///< zlib's code; Z_STREAM_END (1) when the stream was complete.
    std::size_t leftOver;  ///< Input bytes behind the end of the stream.
};

/// Inflates exactly the declared number of bytes.
Inflated inflateDocument();

/// The document's root element; parsed once.
pugi::xml_node root();

/// The element's own text without the white space around it.
std::string textOf(const pugi::xml_node& element);

/// The child of `parent` whose text is `text`; an empty node when there is none.
pugi::xml_node childWithText(const pugi::xml_node& parent, std::string_view text);

using Attributes = std::vector<std::pair<std::string, std::string>>;
/// The element's attributes in the order of the document.
Attributes attributesOf(const pugi::xml_node& element);

/// The texts of the element's children, in order.
std::vector<std::string> childTexts(const pugi::xml_node& parent);

}  // namespace description_test
