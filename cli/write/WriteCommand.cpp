// The sub-command `mrtu write`.
#include <fmt/format.h>

#include <memory>

#include "cli/Commands.h"
#include "cli/Results.h"
#include "cli/Session.h"
#include "cli/TagNames.h"
#include "cli/UsageErrors.h"
#include "cli/override/OverrideNotice.h"
#include "cli/override/Overrides.h"
#include "cli/write/Assignment.h"
#include "cli/write/WriteRequests.h"
#include "poll/Scaling.h"
#include "values/Values.h"

namespace cli {
namespace {

using values::ValueShape;

constexpr const char* kFooter =
    R"(Values are written as `mrtu read` prints them: numbers (0x... too), 0 or 1 (false, true), arrays as
comma lists, strings with or without double quotes, binary as 0x and two digits a byte. All values
are looked at first: when one is wrong, nothing is sent. Every written tag gets a line
"URI = value", with --verify the value that was read back. `mrtu read --help` tells the byte orders.
With --tags, NAME=VALUE takes a value in the unit of the list, which has to lie within its low and high.

Examples:
  mrtu write --sim '1?HREG?400001?short=-5' '1?OUTP?1?boolean-4=1,0,0,1'
  mrtu write --sim --verify '1?HREG?400010?float@ABCD=3.25' '1?HREG?400020?string-8@AB="Pump 1"'
  mrtu write --sim --tags tags.csv setpoint=21.5
  mrtu write --port /dev/ttyUSB0 --set presetFunction=06 '1?HREG?400001?unsignedShort=0xFFFF')";

struct WriteOptions {
    LineOptions line;
    bool json = false;
    bool verify = false;
    std::string tagsFile;
    std::vector<std::string> assignments;
};

constexpr std::uint8_t kBroadcast = 0;

struct Job {
    poll::ListedTag listed;
    const ITag* tag;
    values::Bytes value;
};

/// @return the address that the tag's node has on the line unless an override gives it another.
std::uint8_t addressOf(const Session& session, const ITag& tag) {
    return static_cast<std::uint8_t>(session.nodeOf(tag));
}

void refuseUnwritable(Session& session, const ITag& tag, bool verify) {
    if (tag.IsReadOnly()) throw CommandError(ExitCode::Usage, "can only be read");
    if (addressOf(session, tag) != kBroadcast) return;
    if (verify)
        throw CommandError(ExitCode::Usage, "a broadcast can't be read back: not with --verify");
    if (!goesInOneRequest(session, tag))
        throw CommandError(ExitCode::Usage, "a broadcast must fit into one request");
}

Job prepare(Session& session, const TagNames& names, const std::string& text, bool verify) {
    const Assignment assignment = parseAssignment(text);
    const poll::ListedTag listed = names.tag(assignment.uri);
    const auto tag = session.createTag(listed.uri);
    try {
        if (!tag) throw CommandError(tag.error().code, tag.error().error.text);
        refuseUnwritable(session, *tag.value(), verify);
        const ValueShape shape = values::shapeOf(*tag.value());
        return {listed, tag.value(), withUsageErrors([&] {
                    return poll::Scaling(listed).rawOf(shape, assignment.value);
                })};
    } catch (const CommandError& error) {
        throw CommandError(error.code(), listed.name + ": " + error.what());
    }
}

/// Complains about every assignment that is wrong, then ends the command.
std::vector<Job> prepareAll(CommandContext& context, Session& session, const TagNames& names,
                            const WriteOptions& options) {
    std::vector<Job> jobs;
    for (const std::string& text : options.assignments) {
        try {
            jobs.push_back(prepare(session, names, text, options.verify));
        } catch (const CommandError& error) {
            complain(context, error.what());
        }
    }
    if (jobs.size() != options.assignments.size()) {
        throw CommandError(ExitCode::Usage, "nothing was sent");
    }
    return jobs;
}

void verifyOne(Session& session, const Job& job, Results& results) {
    const auto back = session.read(*job.tag);
    if (!back) return results.failure(job.listed, back.error());
    const ValueShape shape = values::shapeOf(*job.tag);
    if (back.value() != job.value) {
        // Raw: rounded to its decimals, the one might look like the other.
        const std::string text = fmt::format(
            "wrote {}{} but read back {}", poll::Scaling(job.listed).isPlain() ? "" : "raw ",
            values::formatValue(shape, job.value), values::formatValue(shape, back.value()));
        return results.failure(job.listed, {{0, text}, ExitCode::Other});
    }
    results.value(job.listed, shape, back.value());
}

runtime::Result<runtime::Done, Failure> send(Session& session, const Job& job) {
    if (!isArrayOfSingleCoils(session, *job.tag)) return session.write(*job.tag, job.value);
    std::size_t written = 0;
    auto done = session.writeItems(*job.tag, job.value, written);
    if (done || written == 0) return done;
    Failure failure = done.error();
    failure.error.text += fmt::format(" (the first {} coils were written)", written);
    return failure;
}

/// A broadcast is sent and waited for like any write, but its silence is no failure; of one that
/// takes several requests only the first was sent.
bool wasBroadcast(Session& session, const ITag& tag, const Failure& failure) {
    return failure.code == ExitCode::NoResponse && goesInOneRequest(session, tag) &&
           Overrides(session).address(session.nodeOf(tag)) == kBroadcast;
}

void writeOne(Session& session, const Job& job, bool verify, Results& results) {
    const auto done = send(session, job);
    const ValueShape shape = values::shapeOf(*job.tag);
    if (!done && wasBroadcast(session, *job.tag, done.error()) && !verify)
        return results.broadcast(job.listed, shape, job.value);
    if (!done) return results.failure(job.listed, done.error());
    if (verify) return verifyOne(session, job, results);
    results.value(job.listed, shape, job.value);
}

void write(CommandContext& context, const WriteOptions& options) {
    const TagNames names(context, options.tagsFile);
    Session session(context, options.line);
    const std::vector<Job> jobs = prepareAll(context, session, names, options);
    announceOverrides(context, session, options.line);
    session.start();
    Results results(context, options.json);
    for (const Job& job : jobs)
        writeOne(session, job, options.verify, results);
    results.finish();
    if (session.portGone()) complain(context, "the port is gone");
    session.checkStorage();
}

}  // namespace

CommandSpec writeCommand(CommandContext& context) {
    const auto options = std::make_shared<WriteOptions>();
    CommandSpec command{.name = "write", .summary = "Write values into tags", .footer = kFooter};
    addLineOptions(command, options->line, context);
    command.options.push_back(
        {.names = "--json", .target = &options->json, .help = "Print one JSON array"});
    command.options.push_back({.names = "--verify",
                               .target = &options->verify,
                               .help = "Read back what was written and compare"});
    addTagsOption(command, options->tagsFile);
    command.options.push_back({.names = "URI=VALUE",
                               .target = &options->assignments,
                               .help = "Tags and their values; with --tags also NAME=VALUE",
                               .required = true});
    command.action = [options, &context] { write(context, *options); };
    return command;
}

}  // namespace cli
