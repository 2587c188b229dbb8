// From the words of a command line to tags: names of a list, or URIs.
#pragma once

#include <string>
#include <unordered_map>
#include <vector>

#include "cli/Command.h"
#include "cli/CommandSpec.h"
#include "poll/TagList.h"

namespace cli {

/// Declares `--tags FILE`.
/// @param file  Receives the file's name; empty: no list. Lives until the line was parsed.
void addTagsOption(CommandSpec& command, std::string& file);

/// The list that --tags names. A word of the command line is a name of the list or a URI.
class TagNames {
  public:
    /// @param file  Empty: no list; every word is a URI then.
    /// Errors: CommandError (Usage) when the file can't be read or its list is not good, after
    /// every complaint was made on the context.
    TagNames(CommandContext& context, const std::string& file);

    /// A list that was read before. @param file  For complaints; empty: no list.
    TagNames(CommandContext& context, std::string file, std::vector<poll::ListedTag> tags);

    /// @return all tags of the list, in its order.
    [[nodiscard]] const std::vector<poll::ListedTag>& all() const { return tags_; }

    /// @return the tag of that name. A word that is no name but holds a "?", and every word without
    /// a list, is a URI: name and URI of a tag of its own.
    /// Errors: CommandError (Usage), with the name that was probably meant.
    [[nodiscard]] poll::ListedTag tag(const std::string& word) const;

    /// @return the tags of the words, in their order; of the whole list when there are none.
    /// Errors: CommandError (Usage) when any word is no tag, after a complaint about each.
    [[nodiscard]] std::vector<poll::ListedTag> tags(const std::vector<std::string>& words) const;

  private:
    [[nodiscard]] std::string unknownName(const std::string& word) const;

    CommandContext& context_;
    std::string file_;
    std::vector<poll::ListedTag> tags_;
    std::unordered_map<std::string, std::size_t> places_;  ///< In `tags_`, by name.
};

/// Reads and parses a list; its complaints are the caller's.
/// Errors: CommandError (Usage) when the file can't be read.
poll::TagList readTagList(const std::string& file);

}  // namespace cli
