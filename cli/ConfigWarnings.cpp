// Keys that the driver skips in a configuration, said before it starts.
#include "cli/ConfigWarnings.h"

#include <fmt/format.h>

#include <optional>
#include <set>

#include "lint/LintConfig.h"
#include "settings/DescriptionBlock.h"
#include "settings/TextError.h"

namespace cli {
namespace {

std::optional<settings::Description> descriptionOf(const IProtocol& protocol) {
    try {
        return settings::parseDescription(settings::inflateDescription(protocol.GetXml()));
    } catch (const settings::DescriptionError&) {
        return std::nullopt;
    }
}

}  // namespace

void warnOfUnknownKeys(CommandContext& context, const IProtocol& protocol,
                       const std::string& configText) {
    const auto description = descriptionOf(protocol);
    if (!description) return;
    std::set<std::string> said;
    for (const lint::Finding& finding :
         lint::lintConfig(settings::scanConfig("", configText), *description)) {
        if (finding.rule != "unknown-key" || !said.insert(finding.message).second) continue;
        complain(context,
                 fmt::format("configuration: {}; {}", finding.message, finding.suggestion));
    }
}

}  // namespace cli
