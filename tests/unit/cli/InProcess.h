// The command's sub-commands run within the test program.
#pragma once

#include <sstream>
#include <string>
#include <vector>

#include "cli/Command.h"

namespace cli {

struct Outcome {
    int code;
    std::string out;
    std::string err;
};

/// Runs `mrtu` with these words.
inline Outcome runInProcess(std::vector<std::string> words) {
    words.insert(words.begin(), "mrtu");
    std::vector<const char*> argv;
    argv.reserve(words.size());
    for (const std::string& word : words)
        argv.push_back(word.c_str());
    std::ostringstream out;
    std::ostringstream err;
    const int code = runCommandLine(static_cast<int>(argv.size()), argv.data(), out, err);
    return {code, out.str(), err.str()};
}

}  // namespace cli
