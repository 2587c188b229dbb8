// Prints what became of each tag, as lines or as one JSON array.
#include "cli/Results.h"

#include <fmt/format.h>

#include <ostream>

#include "values/JsonValues.h"
#include "values/Values.h"

namespace cli {
namespace {

using values::ByteView;
using values::Json;
using values::ValueShape;

const std::string kNoReason = "refused";

/// In one line. URIs, complaints and file names may hold any bytes.
std::string dumped(const Json& document) {
    return document.dump(-1, ' ', false, Json::error_handler_t::replace);
}

}  // namespace

void Results::value(const std::string& uri, ValueShape shape, ByteView value) {
    this->value(uri, shape, value, false);
}

void Results::value(const std::string& uri, ValueShape shape, ByteView value, bool broadcast) {
    if (json_) {
        Json object{{"uri", uri},
                    {"type", values::typeName(shape)},
                    {"value", values::jsonValue(shape, value)}};
        if (broadcast) object["broadcast"] = true;
        member(object);
    } else {
        context_.out << uri << " = " << values::formatValue(shape, value) << '\n';
    }
}

void Results::member(const Json& object) {
    members_.push_back(dumped(object));
}

void Results::broadcast(const std::string& uri, ValueShape shape, ByteView value) {
    this->value(uri, shape, value, true);
    complain(context_, uri + ": a broadcast: no answer is expected");
}

void Results::failure(const std::string& uri, const Failure& failure) {
    const runtime::ChannelError& error = failure.error;
    first_.note(failure.code);
    // The driver's own areas refuse a value without a word.
    const std::string& text = error.text.empty() ? kNoReason : error.text;
    if (json_) {
        member({{"uri", uri}, {"error", {{"code", error.code}, {"text", text}}}});
    } else {
        complain(context_, fmt::format("{}: error {}: {}", uri, error.code, text));
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
