#include "description/GetXml.h"

#include <algorithm>
#include <iterator>

namespace {

constexpr unsigned char kBlock[] = {
#include "description/DescriptionBlock.inc"
};

constexpr auto kMarkerEnd = std::find(std::begin(kBlock), std::end(kBlock), 0);
static_assert(kMarkerEnd != std::end(kBlock), "the marker line must end in a zero byte");

}  // namespace

const unsigned char* GetXml_MRTU() {
    return std::next(kMarkerEnd);
}
