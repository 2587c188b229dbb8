#include "cli/TraceText.h"

#include <fmt/format.h>

#include <ctime>

namespace cli {

std::string hexText(ByteView bytes) {
    std::string text;
    for (const std::uint8_t byte : bytes) {
        if (!text.empty()) text += ' ';
        text += fmt::format("{:02X}", byte);
    }
    return text;
}

std::string traceText(const runtime::TraceEvent& event) {
    using std::chrono::milliseconds;
    const auto sinceEpoch = event.realTime.time_since_epoch();
    const auto ms = std::chrono::duration_cast<milliseconds>(sinceEpoch).count() % 1000;
    const std::time_t seconds = std::chrono::system_clock::to_time_t(event.realTime);
    std::tm local{};
    localtime_r(&seconds, &local);
    const bool sent = event.direction == runtime::TraceDirection::Sent;
    return fmt::format("{:02}:{:02}:{:02}.{:03} {} {} {}{}", local.tm_hour, local.tm_min,
                       local.tm_sec, ms, event.port, sent ? '>' : '<', hexText(event.bytes),
                       event.complete ? "" : " (cut)");
}

}  // namespace cli
