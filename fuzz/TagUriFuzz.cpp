// Any text as a tag URI: a tag whose address the line can carry, or a message.
#include <cstdlib>
#include <memory>
#include <string>

#include "mrtu/Protocol_MRTU.h"
#include "mrtu/Tag_MRTU.h"

namespace {

std::unique_ptr<Protocol_MRTU> configured() {
    auto protocol = std::make_unique<Protocol_MRTU>();
    const bool ok = protocol->Config(
        "CfgVer=1 defNodeId=1 uart=com1 baudrate=9600 parity=none stopbits=1 mode=RS-232 "
        "txMode=RTU model=3 Node2::model=2");
    if (!ok) std::abort();
    return protocol;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const std::unique_ptr<Protocol_MRTU> protocol = configured();
    const std::string uri(reinterpret_cast<const char*>(data), size);
    const std::unique_ptr<ITag> tag(protocol->CreateTagBase(uri.c_str()));
    if (tag == nullptr) {
        if (*protocol->GetLastErrorString() == '\0') std::abort();
        return 0;
    }
    const int offset = static_cast<const Tag_MRTU&>(*tag).offset();
    if (offset < 0 || offset > 65535) std::abort();
    tag->PackedLen();
    return 0;
}
