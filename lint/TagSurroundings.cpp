// What the configuration means for its tags.
#include "lint/LintTags.h"
#include "settings/ConfigScan.h"
#include "settings/ConfigText.h"

namespace lint {

using settings::ModelInfo;

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

TagSurroundings surroundingsOf(const std::string& configText,
                               const settings::Description& description) {
    const settings::ScannedConfig config = settings::scanConfig({}, configText);
    const auto valueOf = [&config](const std::string& name) {
        return settings::itemOf(config, name);
    };
    const auto presetOf = [&description](const char* key) {
        const settings::ParameterInfo* parameter = description.parameter(key);
        return parameter != nullptr ? parameter->preset : std::string();
    };
    TagSurroundings around{description, {}, {}, valueOf("model").value_or(""), {}, {}};
    if (around.model.empty()) around.model = presetOf("model");
    around.coilFunction = valueOf("forceFunction").value_or(presetOf("forceFunction"));
    for (const int node : settings::nodesOf(config)) {
        const std::string prefix = "Node" + std::to_string(node) + "::";
        around.nodes.insert(node);
        around.models[node] = valueOf(prefix + "model").value_or(around.model);
        const auto coils = valueOf(prefix + "forceFunction");
        if (coils) around.coilFunctions[node] = *coils;
    }
    return around;
}

}  // namespace lint
