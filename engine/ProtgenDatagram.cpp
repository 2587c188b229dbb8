// Datagram reads of the engine: they only translate between the host's tags and the engine's.
#include <algorithm>
#include <memory>
#include <new>

#include "engine/ProtgenProtocol.h"

namespace {

// @return `count` zeroes, null when there was no memory.
template <class Element>
std::unique_ptr<Element[]> zeroes(int count) {
    const auto size = static_cast<std::size_t>(std::max(count, 0));
    return std::unique_ptr<Element[]>(new (std::nothrow) Element[size]());
}

}  // namespace

int ProtgenProtocol::ReadDatagram(const ITag* const* tags, int count, unsigned char* data) {
    const auto status = zeroes<idal_error_t>(count);
    if (status == nullptr) return fail(-1, "Out of memory");
    return ReadDatagramWithStatus(tags, count, data, status.get());
}

int ProtgenProtocol::ReadDatagramWithStatus(const ITag* const* tags, int count, unsigned char* data,
                                            idal_error_t* status) {
    const auto own = zeroes<const ProtgenTag*>(count);
    if (own == nullptr) return fail(-1, "Out of memory");
    for (int i = 0; i < count; ++i)
        own[static_cast<std::size_t>(i)] = static_cast<const ProtgenTag*>(tags[i]);
    return doReadDatagram(own.get(), count, data, status) ? 1 : 0;
}

bool ProtgenProtocol::doReadDatagram(const ProtgenTag* const* /*tags*/, int /*count*/,
                                     unsigned char* /*data*/, idal_error_t* /*status*/) {
    SetError(-3, "Datagrams not supported");
    return false;
}
