// The storage of the overrides as a command uses it: opened where it can be had, and without what
// can't be an override.
#pragma once

#include <memory>
#include <string>

#include "cli/Command.h"
#include "cli/LineOptions.h"
#include "runtime/Storage.h"

namespace cli {

/// What a command wants of the storage.
enum class StorageNeed {
    Use,   ///< Takes what is there and goes on without, with a warning, when there can't be any.
    Keep,  ///< Changes what it holds: without a storage there is nothing to do.
};

/// Opens what --storage names, or the default file. One that is missing is not made before it is
/// written. What overrideFault() finds is kept from its readers.
/// @return null where overrides are not kept: with "none", with --sim unless it names a file, and,
/// after a warning, where no file can be.
/// Errors: CommandError (Other) for a file that is there and can't be used.
std::unique_ptr<runtime::Storage> openOverrides(CommandContext& context, const LineOptions& options,
                                                StorageNeed need);

/// @return why a stored value can't be the override that its key names, e.g. "300 is not one of 0
/// to 255"; empty when it can, and for keys that name none. Pure.
std::string overrideFault(const std::string& key, const runtime::StoredValue& value);

/// Complains about the values of a section that are there and not used.
void reportUnused(CommandContext& context, runtime::Storage& storage, const std::string& section);

}  // namespace cli
