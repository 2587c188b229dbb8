// A serial line whose clock moves only while somebody waits.
#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>
#include <cstdint>
#include <deque>
#include <optional>
#include <vector>

#include "runtime/Line.h"

/// Bytes arrive and room appears at moments of the script, in ms from the line's start.
class FakeLine final : public runtime::Line {
  public:
    using Ms = std::chrono::milliseconds;

    /// Received bytes, in the order of their time.
    void arrive(int atMs, std::vector<std::uint8_t> bytes) {
        arrivals_.push_back({at(atMs), std::move(bytes)});
    }
    /// One byte every `everyMs` for ever.
    void drip(int everyMs) { dripEvery_ = Ms{everyMs}; }
    void vanish(int atMs) { goneAt_ = at(atMs); }
    /// At most `bytes` are taken by one write, and the next one has to wait `pauseMs`.
    void takeSlowly(std::size_t bytes, int pauseMs) {
        writeLimit_ = bytes;
        writePause_ = Ms{pauseMs};
    }
    /// From now on nothing is taken.
    void jam() { writeLimit_ = 0; }
    /// Each byte that was taken leaves the queue `perByteMs` after the one before it.
    void transmitSlowly(int perByteMs) { perByte_ = Ms{perByteMs}; }
    /// Every read takes this long, as on a machine that is busy elsewhere.
    void readSlowly(int ms) { readCost_ = Ms{ms}; }

    int elapsedMs() const {
        return static_cast<int>(std::chrono::duration_cast<Ms>(now_ - start_).count());
    }
    const std::vector<std::uint8_t>& sent() const { return sent_; }
    bool outputDiscarded() const { return outputDiscarded_; }
    int waits() const { return waits_; }
    /// What a line with a descriptor would ask its system for; the clock costs nothing.
    int calls() const { return calls_; }

    TimePoint now() override { return now_; }

    runtime::WaitResult waitReadable(TimePoint until) override {
        feedDrip(until);
        const auto next = arrivals_.empty() ? std::nullopt : std::optional(arrivals_.front().when);
        return wait(next, until);
    }
    runtime::WaitResult waitWritable(TimePoint until) override {
        return wait(writeLimit_ == 0 ? std::nullopt : std::optional(roomAt_), until);
    }
    void sleepUntil(TimePoint until) override {
        countWait();
        now_ = std::max(now_, until);
    }

    runtime::Moved read(std::span<std::uint8_t> buffer) override {
        EXPECT_FALSE(buffer.empty());
        ++calls_;
        now_ += readCost_;
        if (isGone()) return {0, true};
        std::size_t count = 0;
        while (count < buffer.size() && !arrivals_.empty() && arrivals_.front().when <= now_) {
            std::vector<std::uint8_t>& bytes = arrivals_.front().bytes;
            buffer[count++] = bytes.front();
            bytes.erase(bytes.begin());
            if (bytes.empty()) arrivals_.pop_front();
        }
        return {count, false};
    }
    runtime::Moved write(std::span<const std::uint8_t> data) override {
        ++calls_;
        if (isGone()) return {0, true};
        const std::size_t count = std::min(data.size(), writeLimit_);
        sent_.insert(sent_.end(), data.begin(), data.begin() + static_cast<std::ptrdiff_t>(count));
        roomAt_ = now_ + writePause_;
        emptyAt_ = std::max(emptyAt_, now_) + perByte_ * static_cast<int>(count);
        return {count, false};
    }
    std::size_t unsent() override {
        ++calls_;
        if (emptyAt_ <= now_ || perByte_ == Ms{0}) return 0;
        return static_cast<std::size_t>((emptyAt_ - now_ + perByte_ - Ms{1}) / perByte_);
    }
    void discardInput() override { arrivals_.clear(); }
    void discardOutput() override { outputDiscarded_ = true; }

  private:
    struct Arrival {
        TimePoint when;
        std::vector<std::uint8_t> bytes;
    };

    TimePoint at(int ms) const { return start_ + Ms{ms}; }
    bool isGone() const { return goneAt_ && *goneAt_ <= now_; }

    void feedDrip(TimePoint until) {
        if (dripEvery_ == Ms{0}) return;
        while (lastDrip_ + dripEvery_ <= until) {
            lastDrip_ += dripEvery_;
            arrivals_.push_back({lastDrip_, {0x55}});
        }
    }

    /// Time moves to whatever comes first: the event, the end of the line, or `until`.
    runtime::WaitResult wait(std::optional<TimePoint> event, TimePoint until) {
        countWait();
        const TimePoint last = std::max(until, now_);
        const bool eventFirst = event && *event <= last && (!goneAt_ || *event < *goneAt_);
        if (!isGone() && eventFirst) {
            now_ = std::max(now_, *event);
            return runtime::WaitResult::Ready;
        }
        if (goneAt_ && *goneAt_ <= last) {
            now_ = std::max(now_, *goneAt_);
            return runtime::WaitResult::Gone;
        }
        now_ = last;
        return runtime::WaitResult::TimedOut;
    }

    void countWait() {
        ++waits_;
        ++calls_;
        ASSERT_LT(waits_, 100'000) << "the caller spins";
    }

    TimePoint start_ = TimePoint{} + std::chrono::hours{1};
    TimePoint now_ = start_;
    std::deque<Arrival> arrivals_;
    std::optional<TimePoint> goneAt_;
    Ms dripEvery_{0};
    TimePoint lastDrip_ = start_;
    std::size_t writeLimit_ = SIZE_MAX;
    Ms writePause_{0};
    Ms perByte_{0};
    Ms readCost_{0};
    TimePoint roomAt_ = start_;
    TimePoint emptyAt_ = start_;
    std::vector<std::uint8_t> sent_;
    bool outputDiscarded_ = false;
    int waits_ = 0;
    int calls_ = 0;
};
