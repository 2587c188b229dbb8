// Which tags `mrtu check` looks at, and what their list says of them.
#pragma once

#include <string>
#include <vector>

#include "cli/Command.h"
#include "lint/Finding.h"
#include "lint/TagLines.h"

namespace cli {

struct CheckedTags {
    std::vector<lint::TagLine> tags;
    lint::Findings findings;  ///< Errors: what the list's reader complained of.
};

/// @param file   The list's; empty: none.
/// @param words  Names of the list and URIs. None: the whole list, which is also taken when it has
/// mistakes, since names may be missing from it then.
/// Errors: CommandError (Usage) for a file that can't be read and for unknown names.
CheckedTags checkedTags(CommandContext& context, const std::string& file,
                        const std::vector<std::string>& words);

}  // namespace cli
