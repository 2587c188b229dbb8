#include "tests/line/slow/Panel.h"

#include <array>
#include <cstring>
#include <stdexcept>
#include <utility>

namespace slow {
namespace {

using runtime::Milliseconds;
using runtime::Transfer;

struct Area {
    Items items;
    const char* tag;    ///< Behind the node: the first item.
    std::size_t bytes;  ///< Of an item; 0: it is a bit.
};

constexpr std::array kAreas{
    Area{Items::Coils, "OUTP?1?boolean", 0},
    Area{Items::Inputs, "INP?100001?boolean", 0},
    Area{Items::Holding, "HREG?400001?unsignedShort", 2},
    Area{Items::Registers, "IREG?300001?unsignedShort", 2},
    Area{Items::Longs, "LONG?5000?unsignedInt", 4},
};

const Area& areaOf(Items items) {
    return kAreas.at(static_cast<std::size_t>(items));
}

/// The driver takes and gives values as they lie in the host's memory, and bits packed behind the
/// position that the offset has in its byte.
std::size_t bitAt(int offset, std::size_t item) {
    return static_cast<std::size_t>(offset) % 8 + item;
}

Values valuesIn(const unsigned char* bytes, const Area& area, int offset, std::size_t count) {
    Values values(count);
    for (std::size_t i = 0; i < count; ++i) {
        if (area.bytes == 0) {
            const std::size_t bit = bitAt(offset, i);
            values[i] = static_cast<std::uint32_t>(bytes[bit / 8] >> bit % 8) & 1U;
        } else {
            std::memcpy(&values[i], bytes + i * area.bytes, area.bytes);
        }
    }
    return values;
}

void put(const Values& values, const Area& area, int offset, unsigned char* bytes) {
    for (std::size_t i = 0; i < values.size(); ++i) {
        if (area.bytes != 0) {
            std::memcpy(bytes + i * area.bytes, &values[i], area.bytes);
        } else if (values[i] != 0) {
            const std::size_t bit = bitAt(offset, i);
            bytes[bit / 8] = static_cast<unsigned char>(bytes[bit / 8] | 1U << bit % 8);
        }
    }
}

using Room = std::array<unsigned char, 512>;

}  // namespace

ExchangePort::ExchangePort(runtime::Line& line, runtime::ExchangeOptions options, int baud,
                           int characterBits)
    : exchange_(line, std::move(options)) {
    exchange_.setFormat(baud, characterBits);
}

int ExchangePort::receiveByte(unsigned char* byte, int timeoutMs, int) {
    return exchange_.receiveByte(*byte, Milliseconds{timeoutMs}) == Transfer::Complete ? 1 : 0;
}

int ExchangePort::send(const unsigned char* data, int length) {
    const runtime::ByteView request(data, static_cast<std::size_t>(length));
    if (!exchange_.clearToSend(request)) return 0;
    return exchange_.transmit(request, false) == Transfer::Complete ? 1 : 0;
}

int ExchangePort::receiveFrame(unsigned char* data, int maxLength, int timeoutMs, int gapMs,
                               int* received, int) {
    const runtime::FrameEnd end = exchange_.receiveFrame(
        {data, static_cast<std::size_t>(maxLength)}, Milliseconds{timeoutMs}, Milliseconds{gapMs});
    *received = static_cast<int>(end.count);
    return end.count > 0 && end.how != Transfer::Gone ? 1 : 0;
}

Panel::Panel(ISerialPort& port, const std::string& items) {
    host_.serialFactory.offer("com1", port);
    if (module_.Init(&host_) == 0) throw std::runtime_error(module_.GetLastError());
    driver_ = std::make_unique<Protocol_MRTU>();
    const std::string text = "CfgVer=1 " + items +
                             " defNodeId=1 uart=com1 baudrate=9600 parity=none bits=8 stopbits=1"
                             " mode=RS-232";
    if (driver_->Config(text.c_str()) == 0 || driver_->Start() == 0)
        throw std::runtime_error(driver_->GetLastErrorString());
}

Panel::~Panel() {
    driver_->Stop();
    driver_.reset();
    module_.Close();
}

const Tag_MRTU* Panel::tag(int node, Items area) {
    const Tag_MRTU*& known = tags_[{node, area}];
    if (known == nullptr) {
        const std::string uri = std::to_string(node) + "?" + areaOf(area).tag;
        known = static_cast<const Tag_MRTU*>(driver_->CreateTag(uri.c_str()));
        if (known == nullptr) throw std::runtime_error(driver_->GetLastErrorString());
    }
    return known;
}

std::optional<Values> Panel::read(int node, Items area, int offset, int count) {
    Room room{};
    const Tag_MRTU* const from = tag(node, area);
    if (!driver_->doReadBlock(from, from->offset() + offset, room.data(), count))
        return std::nullopt;
    return valuesIn(room.data(), areaOf(area), from->offset() + offset,
                    static_cast<std::size_t>(count));
}

bool Panel::write(int node, Items area, int offset, const Values& values) {
    Room room{};
    const Tag_MRTU* const to = tag(node, area);
    put(values, areaOf(area), to->offset() + offset, room.data());
    return driver_->doWrite(to, to->offset() + offset, room.data(),
                            static_cast<int>(values.size())) != 0;
}

}  // namespace slow
