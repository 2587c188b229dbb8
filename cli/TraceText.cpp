// One line of text for each frame.
#include "cli/TraceText.h"

#include <fmt/format.h>

#include <ctime>

#include "values/TextEscapes.h"
#include "wire/Hex.h"

namespace cli {
namespace {

using values::ByteView;

using wire::FrameMeaning;

std::string timeOfDay(std::chrono::system_clock::time_point moment) {
    using std::chrono::milliseconds;
    const auto sinceEpoch = moment.time_since_epoch();
    const auto ms = std::chrono::duration_cast<milliseconds>(sinceEpoch).count() % 1000;
    const std::time_t seconds = std::chrono::system_clock::to_time_t(moment);
    std::tm local{};
    localtime_r(&seconds, &local);
    return fmt::format("{:02}:{:02}:{:02}.{:03}", local.tm_hour, local.tm_min, local.tm_sec, ms);
}

/// Without the line end that every whole frame has.
ByteView withoutLineEnd(ByteView bytes) {
    const std::size_t size = bytes.size();
    const bool ends = size >= 2 && bytes[size - 2] == '\r' && bytes[size - 1] == '\n';
    return ends ? bytes.first(size - 2) : bytes;
}

}  // namespace

std::string TraceText::lineOf(const runtime::TraceEvent& event) {
    const bool sent = event.direction == runtime::TraceDirection::Sent;
    return fmt::format("{} {} {} {}{}", timeOfDay(event.realTime), event.port, sent ? '>' : '<',
                       frameOf(event.bytes), endOf(event));
}

std::string TraceText::endOf(const runtime::TraceEvent& event) {
    if (!event.complete) return " (cut)";
    return event.late ? " (late, thrown away)" : meaningOf(event);
}

std::string TraceText::frameOf(ByteView bytes) const {
    const bool characters = style_.ascii && !style_.hex;
    return characters ? values::escapeText(withoutLineEnd(bytes)) : wire::hexText(bytes);
}

std::string TraceText::meaningOf(const runtime::TraceEvent& event) {
    if (!style_.meaning) return {};
    const FrameMeaning fresh(style_.ascii ? wire::Mode::Ascii : wire::Mode::Rtu);
    FrameMeaning& port = ports_.try_emplace(event.port, fresh).first->second;
    const bool sent = event.direction == runtime::TraceDirection::Sent;
    return " | " + (sent ? port.ofRequest(event.bytes) : port.ofReply(event.bytes));
}

}  // namespace cli
