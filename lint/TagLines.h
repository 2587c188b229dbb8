// Tag URIs with their places, and what the driver made of each. Pure.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "lint/Finding.h"
#include "platform/ICU_Type.h"

namespace lint {

/// What came of a conversion that the driver applied to a value of the tag's length.
struct ConversionFacts {
    std::string name;
    bool reads;   ///< It worked on the way from the device.
    bool writes;  ///< And to the device.
    int items;
    int changedItems;  ///< By a read.
};

/// What the driver says of a tag that it has accepted; see ITag.
struct TagFacts {
    int node;
    unsigned byteOffset;
    int bitIndex;
    ICU_Type type;
    ICU_Type itemType;
    int length;
    bool readOnly;
    std::vector<ConversionFacts> conversions;  ///< As the URI lists them; may be missing.
};

/// A field of a URI without the blanks around it.
struct UriField {
    std::string text;
    int column;
};

/// What a list says of a tag beside its URI.
struct ListFacts {
    std::string name;                 ///< Empty for a tag without one of its own.
    std::optional<long long> period;  ///< Milliseconds.
    settings::Place periodPlace{};
    const char* scaledBy = nullptr;  ///< What asks for a number: "the scale"; null: nothing does.
    settings::Place scalePlace{};
    std::optional<double> low{};
    std::optional<double> high{};
    settings::Place limitsPlace{};
};

struct TagLine {
    std::string uri;  ///< As written.
    settings::Place place;
    std::vector<UriField> fields;   ///< Four in a well-formed URI: node, area, address, data type;
                                    ///< the data type with conversions for a byte order by name.
    std::optional<TagFacts> facts;  ///< Nothing when the driver refused the tag.
    std::string driverUri;          ///< The URI with conversions for a byte order by name.
    std::string orderRefusal;       ///< Why the named byte order can't be; empty for most.
    ListFacts listed{};

    [[nodiscard]] bool wellFormed() const { return fields.size() == 4; }
    [[nodiscard]] const std::string& node() const { return fields[0].text; }
    [[nodiscard]] const std::string& area() const { return fields[1].text; }
    [[nodiscard]] const std::string& dataType() const { return fields[3].text; }
    /// The address in front of ".", and what stands behind it.
    [[nodiscard]] std::string address() const;
    [[nodiscard]] std::optional<std::string> subIndex() const;
    /// @return the place of a field, of the URI where there is none.
    [[nodiscard]] settings::Place placeOf(std::size_t field) const;
};

/// @param column  Of the URI's first character.
TagLine tagLine(std::string_view uri, const std::string& source, int line, int column);

/// A data type taken apart: "float-4(swap2, swap4)".
struct DataTypeText {
    std::string name;  ///< With the "-" of an array, without the count: "float-".
    std::vector<std::string> conversions;
};
DataTypeText dataTypeText(std::string_view text);

}  // namespace lint
