// What a command says about each tag: lines for people, or one JSON array.
#pragma once

#include <string>
#include <vector>

#include "cli/Command.h"
#include "cli/Session.h"
#include "poll/TagList.h"
#include "values/Json.h"
#include "values/LittleEndian.h"
#include "values/ValueTypes.h"

namespace cli {

/// Values go to context.out as "NAME = value unit", failures to context.err as
/// "mrtu: NAME: error CODE: text". With `json` both become members of an array that finish() prints
/// on context.out: {"uri", "type", "value"} or {"uri", "error": {"code", "text"}}; a tag whose name
/// is not its URI also has "name", one with a unit "unit", and a scaled value stands beside "raw".
class Results {
  public:
    Results(CommandContext& context, bool json) : context_(context), json_(json) {}

    void value(const poll::ListedTag& tag, values::ValueShape shape, values::ByteView value);

    /// A value that was sent to every node, of which none answers.
    void broadcast(const poll::ListedTag& tag, values::ValueShape shape, values::ByteView value);

    /// The failure's code decides the exit code when it is the first.
    void failure(const poll::ListedTag& tag, const Failure& failure);

    /// Prints the array and stores the first failure's code in the context.
    void finish();

  private:
    void value(const poll::ListedTag& tag, values::ValueShape shape, values::ByteView value,
               bool broadcast);
    void member(const values::Json& object);

    CommandContext& context_;
    bool json_;
    std::vector<std::string> members_;
    FirstFailure first_;
};

/// @return the JSON document of a command that ended before it had one of its own.
std::string errorDocument(ExitCode code, const std::vector<std::string>& complaints);

}  // namespace cli
