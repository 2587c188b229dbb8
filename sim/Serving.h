// What the simulator's thread does while it serves one opened line.
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <optional>
#include <vector>

#include "sim/Departure.h"
#include "sim/LineEvent.h"
#include "sim/PtyLine.h"
#include "sim/Receiver.h"
#include "sim/SimulatorOptions.h"
#include "sim/Slave.h"
#include "sim/Turnaround.h"
#include "sim/Turns.h"

namespace sim {

enum class End : std::uint8_t { Stopped, HungUp };

/// One loop that sleeps until the next thing is due: a request's last character, a reply's next
/// one, a turnaround's end. Nothing in it waits for anything else, so that it goes on hearing while
/// it speaks and a stop is never far.
class Serving {
  public:
    using Record = std::function<void(LineEvent::Kind, wire::Bytes raw)>;

    /// All that is given must live as long as this object.
    /// @param stopEvent  A descriptor that becomes readable when serving shall end.
    Serving(const SimulatorOptions& options, Slave& slave, FaultQueue& faults, PtyLine& line,
            int stopEvent, Record record);

    /// @return why it ended; the line is left open when a fault demands the hang-up.
    End run();

  private:
    /// A reply that waits for its instant.
    struct Answer {
        std::uint8_t node;
        Instant at;
        Transmission transmission;
    };

    enum class Wake : std::uint8_t { Due, Bytes, Stop };
    Wake wait(Instant now) const;
    Instant nextDue(Instant now) const;
    bool mayRead(Instant now) const;
    bool hear();
    bool send(Instant now);
    bool startSending(Instant now);
    void sendReply(Answer answer);
    void finishSending();
    bool receive(Instant now);
    void beginRequests();
    void respond(const Request& request);
    std::optional<wire::Bytes> replyTo(const Request& request, const Fault& fault);
    Nanos sinceStart(Instant at) const { return at - started_; }

    const SimulatorOptions& options_;
    Slave& slave_;
    FaultQueue& faults_;
    PtyLine& line_;
    int stopEvent_;
    Record record_;
    Instant started_ = Clock::now();
    bool hungUp_ = false;

    Receiver receiver_;
    Turns turns_;
    std::map<std::uint8_t, Turnarounds> turnarounds_;
    std::vector<Answer> answers_;
    std::optional<Departure> departure_;
    std::uint8_t sender_ = 0;  // Whose reply departs.
    Instant lineFreeFrom_{};   // For the next reply.
};

}  // namespace sim
