#include <fmt/format.h>

#include <CLI/CLI.hpp>
#include <memory>

#include "cli/Assignment.h"
#include "cli/Commands.h"
#include "cli/Results.h"
#include "cli/Session.h"
#include "cli/Values.h"

namespace cli {
namespace {

constexpr const char* kFooter =
    R"(Values are written as `mrtu read` prints them: numbers (0x... too), 0 or 1 (false, true), arrays as
comma lists, strings with or without double quotes, binary as 0x and two digits a byte. All values
are looked at first: when one is wrong, nothing is sent. Every written tag gets a line
"URI = value", with --verify the value that was read back.

Examples:
  mrtu write --sim '1?HREG?400001?short=-5' '1?OUTP?1?boolean-4=1,0,0,1'
  mrtu write --sim --verify '1?HREG?400010?float=3.25' '1?HREG?400020?string-8="Pump 1"'
  mrtu write --port /dev/ttyUSB0 --set presetFunction=06 '1?HREG?400001?unsignedShort=0xFFFF')";

struct WriteOptions {
    LineOptions line;
    bool json = false;
    bool verify = false;
    std::vector<std::string> assignments;
};

struct Job {
    std::string uri;
    const ITag* tag;
    Bytes value;
};

Job prepare(runtime::Channel& channel, const std::string& text) {
    const Assignment assignment = parseAssignment(text);
    const auto tag = channel.createTag(assignment.uri);
    if (!tag) throw CommandError(ExitCode::Usage, tag.error().text);
    try {
        if (tag.value()->IsReadOnly()) throw CommandError(ExitCode::Usage, "can only be read");
        return {assignment.uri, tag.value(), parseValue(shapeOf(*tag.value()), assignment.value)};
    } catch (const CommandError& error) {
        throw CommandError(error.code(), assignment.uri + ": " + error.what());
    }
}

/// Complains about every assignment that is wrong, then ends the command.
std::vector<Job> prepareAll(CommandContext& context, runtime::Channel& channel,
                            const std::vector<std::string>& assignments) {
    std::vector<Job> jobs;
    for (const std::string& text : assignments) {
        try {
            jobs.push_back(prepare(channel, text));
        } catch (const CommandError& error) {
            complain(context, error.what());
        }
    }
    if (jobs.size() != assignments.size()) {
        throw CommandError(ExitCode::Usage, "nothing was sent");
    }
    return jobs;
}

void verifyOne(Session& session, const Job& job, Results& results) {
    const auto back = session.channel().read(*job.tag);
    if (!back) return results.failure(job.uri, back.error(), session.exitCodeFor(back.error()));
    const ValueShape shape = shapeOf(*job.tag);
    if (back.value() != job.value) {
        const std::string text =
            fmt::format("wrote {} but read back {}", formatValue(shape, job.value),
                        formatValue(shape, back.value()));
        return results.failure(job.uri, {0, text}, ExitCode::Other);
    }
    results.value(job.uri, shape, back.value());
}

void writeOne(Session& session, const Job& job, bool verify, Results& results) {
    const auto done = session.channel().write(*job.tag, job.value);
    if (!done) return results.failure(job.uri, done.error(), session.exitCodeFor(done.error()));
    if (verify) return verifyOne(session, job, results);
    results.value(job.uri, shapeOf(*job.tag), job.value);
}

void write(CommandContext& context, const WriteOptions& options) {
    Session session(context, options.line);
    const std::vector<Job> jobs = prepareAll(context, session.channel(), options.assignments);
    session.start();
    Results results(context, options.json);
    for (const Job& job : jobs)
        writeOne(session, job, options.verify, results);
    results.finish();
    if (session.portGone()) complain(context, "the port is gone");
    session.checkStorage();
}

}  // namespace

void addWriteCommand(CLI::App& app, CommandContext& context) {
    const auto options = std::make_shared<WriteOptions>();
    CLI::App* const command = app.add_subcommand("write", "Write values into tags");
    addLineOptions(*command, options->line, context);
    command->add_flag("--json", options->json, "Print one JSON array");
    command->add_flag("--verify", options->verify, "Read back what was written and compare");
    command->add_option("URI=VALUE", options->assignments, "Tags and their values")->required();
    command->footer(kFooter);
    command->callback([options, &context] { write(context, *options); });
}

}  // namespace cli
