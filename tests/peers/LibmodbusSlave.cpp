#include <modbus.h>
#include <poll.h>
#include <unistd.h>

#include <stdexcept>

#include "OtherSlaves.h"

namespace peers {

namespace {

constexpr int kItems = 300;

}  // namespace

struct LibmodbusSlave::Memory {
    modbus_t* line;
    modbus_mapping_t* items;
};

LibmodbusSlave::LibmodbusSlave(int node)
    : memory_(new Memory{modbus_new_rtu(line_.right().c_str(), 19200, 'N', 8, 1),
                         modbus_mapping_new(kItems, kItems, kItems, kItems)}) {
    modbus_set_slave(memory_->line, node);
    if (modbus_connect(memory_->line) != 0 || pipe(stop_.data()) != 0)
        throw std::runtime_error("the libmodbus slave has no line");
    for (int address = 0; address < kItems; ++address) {
        memory_->items->tab_bits[address] = address % 3 == 0 ? 1 : 0;
        memory_->items->tab_input_bits[address] = address % 4 == 1 ? 1 : 0;
        memory_->items->tab_registers[address] = static_cast<std::uint16_t>(2000 + address);
        memory_->items->tab_input_registers[address] = static_cast<std::uint16_t>(50000 + address);
    }
    thread_ = std::thread(&LibmodbusSlave::serve, this);
}

LibmodbusSlave::~LibmodbusSlave() {
    if (thread_.joinable()) end();
    modbus_mapping_free(memory_->items);
    modbus_close(memory_->line);
    modbus_free(memory_->line);
    delete memory_;
    close(stop_[0]);
}

void LibmodbusSlave::serve() const {
    constexpr int kForEver = -1;
    for (;;) {
        std::array<pollfd, 2> waits{pollfd{modbus_get_socket(memory_->line), POLLIN, 0},
                                    pollfd{stop_[0], POLLIN, 0}};
        poll(waits.data(), waits.size(), kForEver);
        if (waits[1].revents != 0) return;
        std::array<std::uint8_t, MODBUS_RTU_MAX_ADU_LENGTH> request{};
        const int length = modbus_receive(memory_->line, request.data());
        if (length > 0) modbus_reply(memory_->line, request.data(), length, memory_->items);
    }
}

Written LibmodbusSlave::end() {
    close(stop_[1]);
    thread_.join();
    const modbus_mapping_t& items = *memory_->items;
    return {{items.tab_bits + 100, items.tab_bits + 120},
            {items.tab_registers + 100, items.tab_registers + 120}};
}

}  // namespace peers
