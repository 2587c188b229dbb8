// Any text as a configuration: parsed or refused with a message.
#include <cstdlib>
#include <string>

#include "mrtu/Params.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(reinterpret_cast<const char*>(data), size);
    _MRTU::ParamManager manager;
    const bool ok = manager.parse(text.c_str());
    if (ok == (*manager.getLastError() != '\0')) std::abort();
    if (manager.getNodeParams(1) == nullptr) std::abort();
    return 0;
}
