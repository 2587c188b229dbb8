// A line, its devices and its clock, all of which do what they are told.
#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "poll/BlockReader.h"
#include "poll/Clock.h"
#include "poll/LineMachine.h"
#include "poll/LineSetup.h"

namespace poll {

using std::chrono::milliseconds;
using std::chrono::seconds;

/// Moves only when told.
class FakeClock final : public Clock {
  public:
    TimePoint now() override { return now_; }
    WallTime wall() override {
        return WallTime{std::chrono::duration_cast<WallTime::duration>(now_.time_since_epoch())};
    }
    void advance(std::chrono::nanoseconds by) { now_ += by; }

  private:
    TimePoint now_{seconds{1000}};
};

inline const ReadError kSilent{-4, "No response"};
inline const ReadError kNoise{-6, "Incorrect response checksum"};
inline const ReadError kRefused{-6, "Exception: Illegal data address"};

/// What the devices do, shared with the test. A read that succeeds brings its own number.
struct FakeDevices {
    bool isPresent = true;  ///< The port.
    std::string whyNot;     ///< When it can't be opened.
    milliseconds answer{10};
    milliseconds timeout{300};  ///< What a dead node costs, repetitions included.
    std::set<int> dead;
    std::set<int> noisy;
    std::set<long> refused;                    ///< Items; a read that touches one is refused.
    std::vector<std::pair<long, long>> reads;  ///< First item and number, as they came ...
    bool isRecording = true;                   ///< ... unless told not to.
    std::vector<int> nodes;                    ///< Of these reads.
    std::vector<std::size_t> writes;           ///< Tags.
    std::vector<std::string> order;            ///< "r<first>", "w<tag>", "open", "close".
    std::uint64_t count = 0;                   ///< Of reads that were answered.

    void note(const std::string& what) {
        if (isRecording) order.push_back(what);
    }
};

class FakeSource final : public BlockSource {
  public:
    FakeSource(FakeDevices& devices, FakeClock& clock) : devices_(devices), clock_(clock) {}

    std::vector<TagReading> read(const Block& block) override {
        if (devices_.isRecording) {
            devices_.reads.emplace_back(block.first, block.items);
            devices_.nodes.push_back(block.node);
            devices_.note("r" + std::to_string(block.first));
        }
        return answer(block);
    }
    std::optional<ReadError> write(std::size_t tag, std::span<const std::uint8_t>) override {
        devices_.writes.push_back(tag);
        devices_.note("w" + std::to_string(tag));
        clock_.advance(devices_.answer);
        return std::nullopt;
    }
    bool open() override {
        devices_.note("open");
        return devices_.isPresent;
    }
    void close() override { devices_.note("close"); }
    bool gone() const override { return !devices_.isPresent; }
    std::string fault() const override { return devices_.whyNot; }

  private:
    std::vector<TagReading> answer(const Block& block) {
        if (block.requests == 0) return all(block, {}, milliseconds{0});
        if (!devices_.isPresent) return all(block, {-1, "I/O error"}, milliseconds{0});
        if (devices_.dead.contains(block.node)) return all(block, kSilent, devices_.timeout);
        if (devices_.noisy.contains(block.node)) return all(block, kNoise, devices_.timeout);
        const auto touched = devices_.refused.lower_bound(block.first);
        if (touched != devices_.refused.end() && *touched < block.first + block.items)
            return all(block, kRefused, devices_.answer);
        ++devices_.count;
        return all(block, {}, devices_.answer);
    }
    std::vector<TagReading> all(const Block& block, const ReadError& error, milliseconds taken) {
        clock_.advance(taken);
        TagReading one{error.code == 0, {}, error};
        if (one.good) one.value = {static_cast<std::uint8_t>(devices_.count & 0xFF)};
        return std::vector<TagReading>(block.tags.size(), one);
    }

    FakeDevices& devices_;
    FakeClock& clock_;
};

/// Builds a setup block by block; tag n is named "t<n>".
class SetupBuilder {
  public:
    /// A block of `tags` registers, one behind the other.
    SetupBuilder& block(int node, long first, std::size_t tags, milliseconds period) {
        Block block;
        block.node = node;
        block.area = "HREG";
        block.first = first;
        block.period = period;
        for (std::size_t tag = 0; tag < tags; ++tag)
            block.tags.push_back(addTag(node, first + static_cast<long>(tag), period));
        block.items = static_cast<long>(tags);
        setup_.blocks.push_back(block);
        return *this;
    }
    LineSetup& setup() { return setup_; }
    std::shared_ptr<const LineSetup> shared() const {
        return std::make_shared<const LineSetup>(setup_);
    }

    explicit SetupBuilder(const std::string& line = "com1") { setup_.name = line; }

  private:
    std::size_t addTag(int node, long item, milliseconds period) {
        const std::size_t tag = setup_.places.size();
        TagPlace place;
        place.node = node;
        place.area = "HREG";
        place.first = item;
        place.period = period;
        setup_.places.push_back(place);
        setup_.tagNames.push_back("t" + std::to_string(tag));
        setup_.uris.push_back(std::to_string(node) + "?HREG?" + std::to_string(item));
        return tag;
    }

    LineSetup setup_;
};

/// A machine with all that it needs, driven without waiting.
class FakeLine {
  public:
    explicit FakeLine(const SetupBuilder& builder)
        : machine(builder.shared(), std::make_unique<FakeSource>(devices, clock), clock,
                  [this](const FaultEvent& event) { events.push_back(text(event)); }) {}

    /// Steps until the time has passed; what is in progress then is finished.
    void run(std::chrono::nanoseconds time) {
        const auto end = clock.now() + time;
        while (clock.now() < end) {
            const auto next = machine.step();
            const auto until = std::min(next, end);
            if (until > clock.now()) clock.advance(until - clock.now());
        }
    }
    /// Steps until nothing is due.
    void settle() {
        for (auto next = machine.step(); next <= clock.now();)
            next = machine.step();
    }
    TagState tag(std::size_t index) const { return machine.snapshot().tags.at(index); }
    NodeState node(std::size_t index) const { return machine.snapshot().nodes.at(index); }

    static std::string text(const FaultEvent& event) {
        static constexpr const char* kKinds[] = {"begins", "changes", "ends"};
        return event.subject + " " + kKinds[static_cast<int>(event.kind)] + ": " + event.text;
    }

    FakeClock clock;
    FakeDevices devices;
    std::vector<std::string> events;
    LineMachine machine;
};

}  // namespace poll
