// What the configuration means for its tags.
#include "cli/ConfigText.h"
#include "cli/check/LintTags.h"

namespace cli {

const ModelInfo* TagSurroundings::modelOf(int node) const {
    if (description.models.empty()) return nullptr;
    const auto own = models.find(node);
    const ModelInfo* found = description.model(own != models.end() ? own->second : model);
    return found != nullptr ? found : &description.models.front();
}

TagSurroundings surroundingsOf(const std::string& configText, const Description& description) {
    TagSurroundings surroundings{description, {}, {}, itemOf(configText, "model").value_or("")};
    if (surroundings.model.empty()) {
        const ParameterInfo* parameter = description.parameter("model");
        if (parameter != nullptr) surroundings.model = parameter->preset;
    }
    for (const int node : nodesOf(configText)) {
        surroundings.nodes.insert(node);
        const auto own = itemOf(configText, "Node" + std::to_string(node) + "::model");
        surroundings.models[node] = own.value_or(surroundings.model);
    }
    return surroundings;
}

}  // namespace cli
