// The name of JSON documents, for headers. The library itself takes seconds to compile: only who
// makes or reads a document includes values/JsonValues.h.
#pragma once

#include <nlohmann/json_fwd.hpp>

namespace values {

/// The order of the members is the order of their creation.
using Json = nlohmann::ordered_json;

}  // namespace values
