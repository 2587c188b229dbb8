// The sub-command `mrtu read`.
#include <algorithm>
#include <memory>

#include "cli/Commands.h"
#include "cli/Results.h"
#include "cli/Session.h"
#include "cli/override/OverrideNotice.h"

namespace cli {
namespace {

constexpr const char* kFooter =
    R"(A URI is node?area?address?type, e.g. 1?HREG?400010?float@ABCD or 1?OUTP?1?boolean-8; the shell
needs quotes around it. Each URI gets a line "URI = value"; one that fails gets its error on
standard error and does not stop the others.

Byte order: named behind the type, as the bytes travel; A is the most significant byte. Most devices
send ABCD. Without a name and without conversions it is CDAB, GHEFCDAB, and BA for texts.

                              32 bits      as conversions        64 bits          as conversions
  usual, high word first      float@ABCD   float(swap2,swap4)    double@ABCDEFGH  double(swap2,swap8)
  low word first              float@CDAB   float                 double@GHEFCDAB  double
  all bytes reversed          float@DCBA   float(swap2)          double@HGFEDCBA  double(swap2)
  high word, bytes swapped    float@BADC   float(swap4)          double@BADCFEHG  double(swap8)
  text, usual                 string-8@AB  string-8(swap2)

Examples:
  mrtu read --sim '1?HREG?400001?unsignedShort'
  mrtu read --sim --json '1?IREG?300001?float@ABCD' '1?INP?100001?boolean-8'
  mrtu read --port /dev/ttyUSB0 --baud 9600 --parity even --trace '1?HREG?400001?int-10@ABCD'
  mrtu read --config line.cfg --port com1=/dev/ttyUSB0 --port com2=/dev/ttyUSB1 '3?OUTP?17?boolean')";

struct ReadOptions {
    LineOptions line;
    bool json = false;
    std::vector<std::string> uris;
};

using TagResult = runtime::Result<ITag*, Failure>;

std::vector<TagResult> createTags(Session& session, const std::vector<std::string>& uris) {
    std::vector<TagResult> tags;
    tags.reserve(uris.size());
    for (const std::string& uri : uris)
        tags.push_back(session.createTag(uri));
    return tags;
}

void readOne(Session& session, const std::string& uri, const TagResult& tag, Results& results) {
    if (!tag) return results.failure(uri, tag.error());
    const auto value = session.read(*tag.value());
    if (!value) return results.failure(uri, value.error());
    results.value(uri, values::shapeOf(*tag.value()), value.value());
}

void read(CommandContext& context, const ReadOptions& options) {
    Session session(context, options.line);
    const std::vector<TagResult> tags = createTags(session, options.uris);
    // A line that nothing is asked on need not be there.
    const bool anyTag = std::any_of(tags.begin(), tags.end(), [](auto& tag) { return tag.ok(); });
    if (anyTag) {
        announceOverrides(context, session, options.line);
        session.start();
    }
    Results results(context, options.json);
    for (std::size_t i = 0; i < tags.size(); ++i) {
        readOne(session, options.uris[i], tags[i], results);
    }
    results.finish();
    if (session.portGone()) complain(context, "the port is gone");
}

}  // namespace

CommandSpec readCommand(CommandContext& context) {
    const auto options = std::make_shared<ReadOptions>();
    CommandSpec command{
        .name = "read", .summary = "Read tags and print their values", .footer = kFooter};
    addLineOptions(command, options->line, context);
    command.options.push_back(
        {.names = "--json", .target = &options->json, .help = "Print one JSON array"});
    command.options.push_back(
        {.names = "URI", .target = &options->uris, .help = "Tags to read", .required = true});
    command.action = [options, &context] { read(context, *options); };
    return command;
}

}  // namespace cli
