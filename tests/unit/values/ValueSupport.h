// Helpers of the tests about values.
#pragma once

#include <string>
#include <string_view>

#include "values/ValueError.h"
#include "values/Values.h"

namespace values_test {

/// @return the complaint about a text that is no value; "accepted" when there is none.
inline std::string refusal(values::ValueShape shape, std::string_view text) {
    try {
        values::parseValue(shape, text);
    } catch (const values::ValueError& error) {
        return error.what();
    }
    return "accepted";
}

inline values::Bytes bytesOf(std::string_view text) {
    return {text.begin(), text.end()};
}

}  // namespace values_test
