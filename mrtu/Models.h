// The device models: how a family of devices numbers its items.
#pragma once

#include <array>
#include <string_view>

namespace _MRTU {

struct ModelRow {
    std::string_view name;  ///< As the configuration's "model" names it.
    bool zeroBased;         ///< Numbers its items from 0; else from 1.
    bool longRegisters;     ///< Has 32-bit registers, as Enron's devices.
};

/// In the order in which they are registered. The first serves a node whose model is unknown.
inline constexpr std::array kModels{
    ModelRow{.name = "1", .zeroBased = false, .longRegisters = false},
    ModelRow{.name = "2", .zeroBased = true, .longRegisters = false},
    ModelRow{.name = "3", .zeroBased = false, .longRegisters = true},
    ModelRow{.name = "4", .zeroBased = true, .longRegisters = true},
};

/// @return the row of the model called `name`, or null.
constexpr const ModelRow* modelRow(std::string_view name) {
    for (const ModelRow& row : kModels)
        if (row.name == name) return &row;
    return nullptr;
}

}  // namespace _MRTU
