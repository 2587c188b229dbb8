// How storages hand out texts.
#include "runtime/Storage.h"

#include <cstring>
#include <vector>

namespace runtime {

const char* Storage::keptForThread(const std::string& text) {
    thread_local std::vector<char> kept;
    kept.assign(text.c_str(), text.c_str() + text.size() + 1);
    return kept.data();
}

int Storage::copyInto(const std::string& text, char* buffer, int size) {
    const std::size_t needed = std::strlen(text.c_str()) + 1;
    if (buffer == nullptr || size < 0 || needed > static_cast<std::size_t>(size)) return 0;
    std::memcpy(buffer, text.c_str(), needed);
    return 1;
}

}  // namespace runtime
