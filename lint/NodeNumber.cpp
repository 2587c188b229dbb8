#include "lint/NodeNumber.h"

#include <fmt/format.h>

#include "settings/NodeNumbers.h"

namespace lint {
namespace {

constexpr long kAllDevices = 0;

}  // namespace

std::string nodeFault(long node) {
    if (node == kAllDevices) {
        return "node 0 is all devices at once: reads are refused, and no device answers a write";
    }
    if (node == settings::kNodeOff)
        return "node 255 stands for a disabled node: every access is refused";
    if (node > 0 && node < settings::kNodeOff) return {};
    const long sent = node & 0xFF;
    const std::string text =
        fmt::format("node {} does not fit into a request, which goes to node {}", node, sent);
    if (sent == settings::kNodeOff) return text + ": every access is refused";
    return sent == kAllDevices ? text + ", all devices at once" : text;
}

}  // namespace lint
