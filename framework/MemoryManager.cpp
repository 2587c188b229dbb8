// Look-ups in the memory map.
#include "framework/MemoryManager.h"

#include <algorithm>

namespace {

const MemoryType* findType(const Model& model, const std::string& name) {
    const std::vector<MemoryType>& types = model.getMemoryTypes();
    const auto found = std::find_if(types.begin(), types.end(), [&name](const MemoryType& each) {
        return each.nameRef() == name;
    });
    return found == types.end() ? nullptr : &*found;
}

const Model* findModel(const std::vector<Model>& models, const std::string& name) {
    const auto found = std::find_if(models.begin(), models.end(),
                                    [&name](const Model& each) { return each.getName() == name; });
    return found == models.end() ? nullptr : &*found;
}

}  // namespace

void Model::addMemoryType(const MemoryType& type) {
    if (findType(*this, type.nameRef()) != nullptr) return;
    memoryTypes_.push_back(type);
}

void MemoryManager::addModel(const Model& model) {
    models_.push_back(model);
}

const Model* MemoryManager::getModel(const std::string& name) const {
    if (models_.empty()) return nullptr;
    const Model* model = findModel(models_, name);
    return model != nullptr ? model : &models_.front();
}

const MemoryType* MemoryManager::getMemoryType(const std::string& model,
                                               const std::string& type) const {
    const Model* found = findModel(models_, model);
    return found == nullptr ? nullptr : findType(*found, type);
}
