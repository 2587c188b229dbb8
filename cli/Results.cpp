// Prints what became of each tag, as lines or as one JSON array.
#include "cli/Results.h"

#include <fmt/format.h>

#include <ostream>

#include "values/Values.h"

namespace cli {
namespace {

using values::ByteView;
using values::Json;
using values::ValueShape;

const std::string kNoReason = "refused";

}  // namespace

void Results::value(const std::string& uri, ValueShape shape, ByteView value) {
    if (json_) {
        array_.push_back({{"uri", uri},
                          {"type", values::typeName(shape)},
                          {"value", values::jsonValue(shape, value)}});
    } else {
        context_.out << uri << " = " << values::formatValue(shape, value) << '\n';
    }
}

void Results::broadcast(const std::string& uri, ValueShape shape, ByteView value) {
    this->value(uri, shape, value);
    if (json_) array_.back()["broadcast"] = true;
    complain(context_, uri + ": a broadcast: no answer is expected");
}

void Results::failure(const std::string& uri, const Failure& failure) {
    const runtime::ChannelError& error = failure.error;
    first_.note(failure.code);
    // The driver's own areas refuse a value without a word.
    const std::string& text = error.text.empty() ? kNoReason : error.text;
    if (json_) {
        array_.push_back({{"uri", uri}, {"error", {{"code", error.code}, {"text", text}}}});
    } else {
        complain(context_, fmt::format("{}: error {}: {}", uri, error.code, text));
    }
}

void Results::finish() {
    context_.exitCode = first_.code();
    if (!json_) return;
    // One line for each tag: short enough to read, and long arrays do not run down the screen.
    constexpr auto kReplace = Json::error_handler_t::replace;  // A URI may hold any bytes.
    const char* separator = "[\n  ";
    for (const Json& result : array_) {
        context_.out << separator << result.dump(-1, ' ', false, kReplace);
        separator = ",\n  ";
    }
    context_.out << "\n]\n";
}

}  // namespace cli
