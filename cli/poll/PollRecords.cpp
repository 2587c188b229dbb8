// Compares what is known of tags to what was told.
#include "cli/poll/PollRecords.h"

#include <fmt/chrono.h>
#include <fmt/format.h>

#include "cli/poll/LiveTable.h"
#include "values/Json.h"
#include "values/JsonValues.h"

namespace cli {
namespace {

using poll::Quality;
using poll::TagState;
using values::Json;

bool hasValue(const TagState& state) {
    return state.quality == Quality::Good || state.quality == Quality::Stale;
}

/// The moment that a line tells of: of the read that brought the value, or now.
std::chrono::system_clock::time_point momentOf(const TagState& state,
                                               std::chrono::system_clock::time_point now) {
    if (state.quality == Quality::Good) return state.at;
    return state.quality == Quality::Stale && state.staleSince ? *state.staleSince : now;
}

/// Source: RFC 4180, 2.
std::string csvField(const std::string& text) {
    if (text.find_first_of(",\"\r\n") == std::string::npos) return text;
    std::string quoted = "\"";
    for (const char letter : text) {
        if (letter == '"') quoted += '"';
        quoted += letter;
    }
    return quoted + '"';
}

std::string csvLine(const ShownTags& tags, std::size_t tag, const TagState& state,
                    const std::string& time) {
    return fmt::format("{},{},{},{},{},{},{}\n", time, csvField(tags.name(tag)),
                       hasValue(state) ? csvField(tags.valueText(tag, state.value)) : "",
                       csvField(tags.unit(tag)), qualityName(state.quality),
                       state.error.code == 0 ? "" : std::to_string(state.error.code),
                       csvField(state.error.code == 0 ? "" : state.error.text));
}

std::string jsonLine(const ShownTags& tags, std::size_t tag, const TagState& state,
                     const std::string& time) {
    Json object{{"time", time},
                {"name", tags.name(tag)},
                {"uri", tags.uri(tag)},
                {"quality", qualityName(state.quality)},
                {"count", state.count}};
    if (hasValue(state)) {
        object["value"] = tags.jsonValue(tag, state.value);
        object["raw"] = values::jsonValue(tags.shape(tag), state.value);
        object["read"] = timeText(state.at);
    }
    if (!tags.unit(tag).empty()) object["unit"] = tags.unit(tag);
    if (state.error.code != 0)
        object["error"] = {{"code", state.error.code}, {"text", state.error.text}};
    return object.dump(-1, ' ', false, Json::error_handler_t::replace) + '\n';
}

}  // namespace

std::string timeText(std::chrono::system_clock::time_point time) {
    using namespace std::chrono;
    const auto whole = floor<seconds>(time);
    const auto ms = duration_cast<milliseconds>(time - whole).count();
    return fmt::format("{:%Y-%m-%dT%H:%M:%S}.{:03}Z", fmt::gmtime(system_clock::to_time_t(whole)),
                       ms);
}

std::string PollRecords::header() const {
    return form_ == RecordForm::Csv ? "time,name,value,unit,quality,code,error\n" : "";
}

bool PollRecords::isNews(const Told& told, const TagState& state) const {
    if (state.quality != told.quality || state.error.code != told.error) return true;
    if (state.count == told.count) return false;
    return when_ == RecordWhen::Read || state.value != told.value;
}

std::string PollRecords::news(const ShownTags& tags, const poll::Snapshot& snapshot,
                              std::chrono::system_clock::time_point now) {
    std::string lines;
    told_.resize(snapshot.tags.size());
    for (std::size_t tag = 0; tag < snapshot.tags.size(); ++tag) {
        const TagState& state = snapshot.tags[tag];
        Told& told = told_[tag];
        if (!isNews(told, state)) continue;
        told = {state.quality, state.error.code, state.count, state.value};
        const std::string time = timeText(momentOf(state, now));
        lines += form_ == RecordForm::Csv ? csvLine(tags, tag, state, time)
                                          : jsonLine(tags, tag, state, time);
    }
    return lines;
}

}  // namespace cli
