#include "description/GetXml.h"

#include <algorithm>
#include <iterator>

namespace {

constexpr unsigned char block[] = {
#include "description/DescriptionBlock.inc"
};

constexpr auto markerEnd = std::find(std::begin(block), std::end(block), 0);
static_assert(markerEnd != std::end(block), "the marker line must end in a zero byte");

}  // namespace

const unsigned char* GetXml_MRTU() {
    return std::next(markerEnd);
}
