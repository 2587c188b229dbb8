// The plug-in as a host uses it: loaded, on a real port.
//
//   peers_plugin PORT BAUD WORK COUNT silence|length|length-at-once PLUGIN
//
// "length-at-once" keeps no silence in front of a request: what a transaction costs without its
// waiting.
#include <cstdio>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "bench/peers/Work.h"
#include "runtime/Channel.h"
#include "runtime/ModbusReplies.h"
#include "runtime/Module.h"
#include "runtime/PluginLibrary.h"
#include "runtime/PosixMultiTask.h"
#include "runtime/PosixSerialFactory.h"
#include "runtime/ServiceFactory.h"

namespace {

using bench::Task;
using bench::Work;
using Values = std::vector<std::uint16_t>;

class RulesWithoutSilence final : public runtime::ReplyRules {
  public:
    std::optional<std::uint8_t> addressee(runtime::ByteView request) const override {
        return rules_.addressee(request);
    }
    std::size_t replyLength(runtime::ByteView request, runtime::ByteView received) const override {
        return rules_.replyLength(request, received);
    }
    bool isWhole(runtime::ByteView request, runtime::ByteView received) const override {
        return rules_.isWhole(request, received);
    }
    runtime::Answer answers(runtime::ByteView request, runtime::ByteView frame) const override {
        return rules_.answers(request, frame);
    }
    bool confusable(runtime::ByteView one, runtime::ByteView other) const override {
        return rules_.confusable(one, other);
    }
    std::chrono::nanoseconds silence(runtime::ByteView /*request*/, int /*baud*/,
                                     int /*characterBits*/) const override {
        return std::chrono::nanoseconds{0};
    }

  private:
    runtime::ModbusReplies rules_;
};

template <class Value, class Error>
Value valueOf(runtime::Result<Value, Error> result) {
    if (!result) throw std::runtime_error(result.error().text);
    return std::move(result).value();
}

std::shared_ptr<const runtime::ReplyRules> rulesFor(const std::string& waiting) {
    if (waiting == "length-at-once") return std::make_shared<RulesWithoutSilence>();
    return std::make_shared<runtime::ModbusReplies>();
}

std::string uriOf(const Work& work) {
    const std::string address = std::to_string(work.address + 1);
    const std::string count = std::to_string(work.count);
    if (work.kind == Work::ReadCoils) return "1?OUTP?" + address + "?boolean-" + count;
    const std::string register1 = std::to_string(400001 + work.address);
    const std::string type = work.count == 1 ? "unsignedShort" : "unsignedShort-" + count;
    return "1?HREG?" + register1 + "?" + type;
}

class Transactions {
  public:
    Transactions(runtime::Channel& channel, const Work& work)
        : channel_(channel),
          work_(work),
          tag_(*valueOf(channel.createTag(uriOf(work)))),
          bytes_(static_cast<std::size_t>(work.count) * (work.kind == Work::ReadCoils ? 1 : 2)) {
        for (int index = 0; work.kind == Work::WriteRegisters && index < work.count; ++index) {
            const std::uint16_t value = bench::valueToWrite(index);
            bytes_[static_cast<std::size_t>(2 * index)] = static_cast<std::uint8_t>(value & 0xFF);
            bytes_[static_cast<std::size_t>(2 * index + 1)] = static_cast<std::uint8_t>(value >> 8);
        }
    }

    bool transact(Values& values) {
        if (work_.kind != Work::WriteRegisters) return read(values);
        return static_cast<bool>(channel_.write(tag_, bytes_));
    }

    bool read(Values& values) {
        if (!channel_.readInto(tag_, bytes_)) return false;
        if (work_.kind == Work::ReadCoils) {
            values.assign(bytes_.begin(), bytes_.end());
            return true;
        }
        for (std::size_t index = 0; index < values.size(); ++index)
            values[index] =
                static_cast<std::uint16_t>(bytes_[2 * index] | bytes_[2 * index + 1] << 8);
        return true;
    }

  private:
    runtime::Channel& channel_;
    Work work_;
    const ITag& tag_;
    std::vector<std::uint8_t> bytes_;
};

int run(const Task& task, const std::string& plugin) {
    runtime::PosixMultiTask multiTask;
    runtime::PosixSerialFactory serial;
    serial.mapPort("com1", task.port);
    serial.setReplyRules(rulesFor(task.waiting));
    if (task.waiting != "silence") serial.setFrameEnd(runtime::FrameEndBy::Length);
    runtime::ServiceFactory services(multiTask, serial);

    const auto library = valueOf(runtime::PluginLibrary::load(plugin));
    const auto module = valueOf(runtime::Module::bind(library, services));
    runtime::Channel channel(valueOf(module.createProtocol("MRTU")));
    valueOf(
        channel.configure("CfgVer=1 defNodeId=1 uart=com1 parity=none bits=8 stopbits=1 "
                          "mode=RS-232 txMode=RTU repeat=0 timeout=1000 baudrate=" +
                          std::to_string(task.baud)));
    valueOf(channel.start());
    Transactions transactions(channel, task.work);
    return bench::measure(
        task, [&](Values& values) { return transactions.transact(values); },
        [&](Values& values) { return transactions.read(values); });
}

}  // namespace

int main(int count, char** arguments) {
    try {
        const std::vector<std::string> words(arguments + 1, arguments + count);
        const Task task = bench::taskFrom(words);
        return run(task, words.at(5));
    } catch (const std::exception& error) {
        return std::fprintf(stderr, "peers_plugin: %s\n", error.what()), 2;
    }
}
