// Where the libraries are that another one needs.
#pragma once

#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include "cli/inspect/ElfLibrary.h"

namespace cli {

/// @return the folders to look in for what the library at `path` needs, in this order: its run
/// paths, its own folder, Debian's folders for its architecture.
std::vector<std::filesystem::path> searchPlaces(const std::string& path, const ElfLibrary& library);

/// @return the first library called `name` in one of the places that is for the architecture;
/// files that are something else are passed over, as the system's loader does.
std::optional<std::filesystem::path> findLibrary(const std::string& name,
                                                 const std::vector<std::filesystem::path>& places,
                                                 const Architecture& architecture);

}  // namespace cli
