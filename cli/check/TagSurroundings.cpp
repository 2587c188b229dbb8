// What the configuration means for its tags.
#include "cli/ConfigText.h"
#include "cli/check/ConfigScan.h"
#include "cli/check/LintTags.h"

namespace cli {

const ModelInfo* TagSurroundings::modelOf(int node) const {
    if (description.models.empty()) return nullptr;
    const auto own = models.find(node);
    const ModelInfo* found = description.model(own != models.end() ? own->second : model);
    return found != nullptr ? found : &description.models.front();
}

const std::string& TagSurroundings::coilFunctionOf(int node) const {
    const auto own = coilFunctions.find(node);
    return own != coilFunctions.end() ? own->second : coilFunction;
}

TagSurroundings surroundingsOf(const std::string& configText, const Description& description) {
    const ScannedConfig config = scanConfig({}, configText);
    const auto valueOf = [&config](const std::string& name) {
        const ScannedItem* item = config.item(name);
        return item != nullptr ? item->value : std::nullopt;
    };
    const auto presetOf = [&description](const char* key) {
        const ParameterInfo* parameter = description.parameter(key);
        return parameter != nullptr ? parameter->preset : std::string();
    };
    TagSurroundings around{description, {}, {}, valueOf("model").value_or(""), {}, {}};
    if (around.model.empty()) around.model = presetOf("model");
    around.coilFunction = valueOf("forceFunction").value_or(presetOf("forceFunction"));
    for (const int node : nodesOf(configText)) {
        const std::string prefix = "Node" + std::to_string(node) + "::";
        around.nodes.insert(node);
        around.models[node] = valueOf(prefix + "model").value_or(around.model);
        const auto coils = valueOf(prefix + "forceFunction");
        if (coils) around.coilFunctions[node] = *coils;
    }
    return around;
}

}  // namespace cli
