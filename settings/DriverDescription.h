// What a driver says about itself: the protocol description as values.
//
// Every driver of the family carries one; nothing here is particular to one driver.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace settings {

/// One key that a configuration may hold.
struct ParameterInfo {
    std::string key;
    std::string display;
    std::string type;                         ///< "prop_integer", "prop_list" ...
    std::string preset;                       ///< What a tool fills in.
    std::optional<std::string> defaultValue;  ///< What the driver takes when the key is missing.
    bool ofNode;                              ///< May be given for one node ("Node3::key=...").
    bool mandatory;
    bool distinct;  ///< Every node has its own.
    std::string group;
    std::string listType;  ///< Type of the choices; empty without choices.
    std::vector<std::string> choices;
    std::optional<long> min;
    std::optional<long> max;
    std::string disabledBy;      ///< The key that may disable this one; empty for none.
    std::string disablingValue;  ///< With this value.

    [[nodiscard]] bool isNumber() const;
};

/// One addressable area of a device.
struct AreaInfo {
    std::string name;
    std::string display;
    std::string naturalType;  ///< The type of one item, as a tag URI writes it.
    std::uint32_t types;      ///< Mask of the data types that tags may have.
    bool bitWrite;
    bool bitArrayWrite;
    bool bitRead;
    bool readOnly;
    int readCount;  ///< Items that one request may carry.
    int writeCount;
    long min;  ///< Addresses, both included; a model may have its own.
    long max;
};

struct TagFieldInfo {
    std::string name;
    std::string display;
    std::string preset;
};

struct AreaOffer {
    std::string area;
    long min;
    long max;
};

struct ModelInfo {
    std::string name;
    std::string display;
    std::vector<AreaOffer> offers;
};

struct ConversionInfo {
    std::string name;
    std::string display;
    std::uint32_t types;  ///< Mask of the data types that it applies to.
};

struct Description {
    std::vector<std::pair<std::string, std::string>> facts;  ///< Name and value, in order.
    std::vector<ParameterInfo> parameters;
    std::vector<AreaInfo> areas;
    std::vector<TagFieldInfo> tagFields;
    std::vector<ModelInfo> models;
    std::vector<ConversionInfo> conversions;

    /// @return null when there is no such entry.
    [[nodiscard]] const ParameterInfo* parameter(std::string_view key) const;
    [[nodiscard]] const AreaInfo* area(std::string_view name) const;
    [[nodiscard]] const ModelInfo* model(std::string_view name) const;
    [[nodiscard]] const ConversionInfo* conversion(std::string_view name) const;
    /// @return the fact's value, empty when there is none.
    [[nodiscard]] std::string fact(std::string_view name) const;
};

/// @param document  The inflated document, with or without a byte order mark.
/// Errors: DescriptionError when it is not well-formed or its root is another one.
Description parseDescription(const std::string& document);

}  // namespace settings
