// What follows from a command's description.
#include "cli/CommandSpec.h"

#include <sstream>
#include <utility>

namespace cli {

std::vector<std::string> OptionSpec::nameList() const {
    std::vector<std::string> list;
    std::istringstream stream(names);
    for (std::string name; std::getline(stream, name, ',');)
        list.push_back(name);
    return list;
}

bool OptionSpec::isPositional() const {
    return !names.starts_with('-');
}

bool OptionSpec::takesValue() const {
    return !std::holds_alternative<bool*>(target) &&
           !std::holds_alternative<std::monostate>(target);
}

bool OptionSpec::isRepeated() const {
    return std::holds_alternative<std::vector<int>*>(target) ||
           std::holds_alternative<std::vector<std::string>*>(target);
}

std::string OptionSpec::shownValueName() const {
    if (!takesValue() || !valueName.empty()) return valueName;
    const bool number =
        std::holds_alternative<int*>(target) || std::holds_alternative<std::vector<int>*>(target);
    return number ? "INT" : "TEXT";
}

void CommandSpec::addGroup(const char* group, std::vector<OptionSpec> more) {
    for (OptionSpec& option : more) {
        option.group = group;
        options.push_back(std::move(option));
    }
}

std::vector<OptionSpec> CommandSpec::allOptions() const {
    std::vector<OptionSpec> all{
        {.names = "-h,--help", .target = {}, .help = "Print this help message and exit"}};
    if (!version.empty())
        all.push_back({.names = "--version",
                       .target = {},
                       .help = "Display program version information and exit"});
    all.insert(all.end(), options.begin(), options.end());
    return all;
}

}  // namespace cli
