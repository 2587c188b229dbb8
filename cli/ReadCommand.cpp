// The sub-command `mrtu read`.
#include <algorithm>
#include <memory>

#include "cli/Commands.h"
#include "cli/Results.h"
#include "cli/Session.h"
#include "cli/TagNames.h"
#include "cli/override/OverrideNotice.h"

namespace cli {
namespace {

constexpr const char* kFooter =
    R"(A URI is node?area?address?type, e.g. 1?HREG?400010?float@ABCD or 1?OUTP?1?boolean-8; the shell
needs quotes around it. Each URI gets a line "URI = value"; one that fails gets its error on
standard error and does not stop the others. With --tags, names of the list may stand for URIs; their
lines are "NAME = value unit", scaled as the list says. Without names, all tags of the list are read.

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
  mrtu read --sim --tags tags.csv flow pressure
  mrtu read --config line.cfg --port com1=/dev/ttyUSB0 --port com2=/dev/ttyUSB1 '3?OUTP?17?boolean')";

struct ReadOptions {
    LineOptions line;
    bool json = false;
    std::string tagsFile;
    std::vector<std::string> words;
};

using poll::ListedTag;
using TagResult = runtime::Result<ITag*, Failure>;

std::vector<TagResult> createTags(Session& session, const std::vector<ListedTag>& listed) {
    std::vector<TagResult> tags;
    tags.reserve(listed.size());
    for (const ListedTag& each : listed)
        tags.push_back(session.createTag(each.uri));
    return tags;
}

void readOne(Session& session, const ListedTag& listed, const TagResult& tag, Results& results) {
    if (!tag) return results.failure(listed, tag.error());
    const values::ValueShape shape = values::shapeOf(*tag.value());
    const auto value = session.read(*tag.value());
    if (!value) return results.failure(listed, value.error());
    results.value(listed, shape, value.value());
}

std::vector<ListedTag> tagsOf(CommandContext& context, const ReadOptions& options) {
    if (options.tagsFile.empty() && options.words.empty())
        throw CommandError(ExitCode::Usage,
                           "URI is required, or --tags FILE; 'mrtu read --help' tells more");
    return TagNames(context, options.tagsFile).tags(options.words);
}

void read(CommandContext& context, const ReadOptions& options) {
    const std::vector<ListedTag> listed = tagsOf(context, options);
    Session session(context, options.line);
    const std::vector<TagResult> tags = createTags(session, listed);
    // A line that nothing is asked on need not be there.
    const bool anyTag = std::any_of(tags.begin(), tags.end(), [](auto& tag) { return tag.ok(); });
    if (anyTag) {
        announceOverrides(context, session, options.line);
        session.start();
    }
    Results results(context, options.json);
    for (std::size_t i = 0; i < tags.size(); ++i) {
        readOne(session, listed[i], tags[i], results);
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
    addTagsOption(command, options->tagsFile);
    command.options.push_back({.names = "URI",
                               .target = &options->words,
                               .help = "Tags to read; with --tags also names of the list"});
    command.action = [options, &context] { read(context, *options); };
    return command;
}

}  // namespace cli
