#include "cli/Results.h"

#include <fmt/format.h>

#include <ostream>

#include "cli/Values.h"

namespace cli {

void Results::value(const std::string& uri, ValueShape shape, ByteView value) {
    if (json_) {
        array_.push_back(
            {{"uri", uri}, {"type", typeName(shape)}, {"value", jsonValue(shape, value)}});
    } else {
        context_.out << uri << " = " << formatValue(shape, value) << '\n';
    }
}

void Results::failure(const std::string& uri, const runtime::ChannelError& error, ExitCode code) {
    first_.note(code);
    if (json_) {
        array_.push_back({{"uri", uri}, {"error", {{"code", error.code}, {"text", error.text}}}});
    } else {
        complain(context_, fmt::format("{}: error {}: {}", uri, error.code, error.text));
    }
}

void Results::finish() {
    constexpr auto kReplace = Json::error_handler_t::replace;  // A URI may hold any bytes.
    if (json_) context_.out << array_.dump(2, ' ', false, kReplace) << '\n';
    context_.exitCode = first_.code();
}

}  // namespace cli
