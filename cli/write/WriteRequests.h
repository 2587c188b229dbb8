// Into which requests the driver cuts a write, as far as the command has to know it to tell the
// truth about what was written.
#pragma once

#include "cli/Session.h"

namespace cli {

/// Tells whether the tag is an array of coils that function 5 writes, one coil a request. Of such
/// an array the driver sends every coil one of the first eight values.
bool isArrayOfSingleCoils(const Session& session, const ITag& tag);

/// Tells whether one request carries the whole value. A broadcast that takes several ends with the
/// first of them, since nobody answers it.
bool goesInOneRequest(const Session& session, const ITag& tag);

}  // namespace cli
