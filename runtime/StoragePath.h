// Where the permanent storage lies, and making the directories on the way there.
#pragma once

#include <string>

namespace runtime {

/// The default place: "$XDG_STATE_HOME/mrtu/overrides.db", else
/// "$HOME/.local/state/mrtu/overrides.db". A variable that is unset, empty or not an absolute path
/// does not count. Empty when neither does. The places are those of the XDG base directories, 0.8.
std::string defaultStoragePath();
/// The same from given values; null for an unset variable.
std::string storagePathFrom(const char* xdgStateHome, const char* home);

/// @return the directory that a file lies in; "." for a bare name.
std::string directoryOf(const std::string& path);

/// Makes the missing directories that lead to a file, each with mode 0700.
/// @return empty, or what went wrong, naming the directory.
std::string makeDirectoriesFor(const std::string& path);

}  // namespace runtime
