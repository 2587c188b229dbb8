// Prints what became of each tag, as lines or as one JSON array.
#include "cli/Results.h"

#include <fmt/format.h>

#include <ostream>

#include "poll/Scaling.h"
#include "values/JsonValues.h"
#include "values/ValueTypes.h"

namespace cli {
namespace {

using poll::ListedTag;
using values::ByteView;
using values::Json;
using values::ValueShape;

const std::string kNoReason = "refused";

/// In one line. URIs, complaints and file names may hold any bytes.
std::string dumped(const Json& document) {
    return document.dump(-1, ' ', false, Json::error_handler_t::replace);
}

/// @return the members that say which tag it is.
Json identity(const ListedTag& tag) {
    Json object{{"uri", tag.uri}};
    if (tag.name != tag.uri) object["name"] = tag.name;
    return object;
}

}  // namespace

void Results::value(const ListedTag& tag, ValueShape shape, ByteView value) {
    this->value(tag, shape, value, false);
}

void Results::value(const ListedTag& tag, ValueShape shape, ByteView value, bool broadcast) {
    const poll::Scaling scaling(tag);
    if (!json_) {
        context_.out << tag.name << " = " << scaling.textOf(shape, value)
                     << (tag.unit.empty() ? "" : " " + tag.unit) << '\n';
        return;
    }
    Json object = identity(tag);
    object["type"] = values::typeName(shape);
    object["value"] = scaling.jsonOf(shape, value);
    if (!scaling.isPlain()) object["raw"] = values::jsonValue(shape, value);
    if (!tag.unit.empty()) object["unit"] = tag.unit;
    if (broadcast) object["broadcast"] = true;
    member(object);
}

void Results::member(const Json& object) {
    members_.push_back(dumped(object));
}

void Results::broadcast(const ListedTag& tag, ValueShape shape, ByteView value) {
    this->value(tag, shape, value, true);
    complain(context_, tag.name + ": a broadcast: no answer is expected");
}

void Results::failure(const ListedTag& tag, const Failure& failure) {
    const runtime::ChannelError& error = failure.error;
    first_.note(failure.code);
    // The driver's own areas refuse a value without a word.
    const std::string& text = error.text.empty() ? kNoReason : error.text;
    if (json_) {
        Json object = identity(tag);
        object["error"] = {{"code", error.code}, {"text", text}};
        member(object);
    } else {
        complain(context_, fmt::format("{}: error {}: {}", tag.name, error.code, text));
    }
}

void Results::finish() {
    context_.exitCode = first_.code();
    if (!json_) return;
    // One line for each tag: short enough to read, and long arrays do not run down the screen.
    const char* separator = "[\n  ";
    for (const std::string& result : members_) {
        context_.out << separator << result;
        separator = ",\n  ";
    }
    context_.out << "\n]\n";
}

std::string errorDocument(ExitCode code, const std::vector<std::string>& complaints) {
    return dumped({{"exitCode", static_cast<int>(code)}, {"errors", complaints}}) + '\n';
}

}  // namespace cli
