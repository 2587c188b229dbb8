#include "settings/LineFormat.h"

#include "settings/ConfigText.h"
#include "settings/NumberText.h"

namespace settings {
namespace {

long numberOf(const ScannedConfig& config, const char* key, long otherwise) {
    const auto text = itemOf(config, key);
    return text ? readNumber(*text).value : otherwise;
}

}  // namespace

LineFormat lineFormatOf(const ScannedConfig& config) {
    const bool ascii = itemOf(config, "txMode") == "ASCII";
    const bool parity = itemOf(config, "parity").value_or("even") != "none";
    const long dataBits = ascii ? numberOf(config, "bits", 8) : 8;
    const long bits = 1 + dataBits + (parity ? 1 : 0) + numberOf(config, "stopbits", 1);
    return {ascii ? wire::Mode::Ascii : wire::Mode::Rtu,
            {.baud = static_cast<int>(numberOf(config, "baudrate", 0)),
             .characterBits = static_cast<int>(bits)}};
}

}  // namespace settings
