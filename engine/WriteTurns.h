// Who may write where at the same time.
#pragma once

#include <atomic>
#include <mutex>
#include <string_view>
#include <thread>

namespace engine {

/// What a read-modify-write keeps other writers out of: one memory area of one configured node.
struct WritePlace {
    int node;
    std::string_view area;  ///< The memory type's name; lives longer than the turn.

    bool operator==(const WritePlace&) const = default;
};

/// The order of the writers. Requests to one place go side by side; a change (read, modify, write
/// back) has its place to itself. At each place everybody has the turn in the order of arrival, so
/// that no stream of requests keeps a change waiting for ever, nor the other way round. Different
/// places know nothing of each other.
/// A thread that has a turn at a place gets any further one there at once.
/// Takes no memory: the turns are a list of what lies on the stacks of the writers.
/// Threads: any.
class WriteTurns {
  public:
    enum class Kind {
        Free,     ///< Waits for nobody, and nobody for it.
        Request,  ///< One request that writes whole items.
        Change,   ///< A read, and the write back that depends on it.
    };

    /// Has the turn from its construction, which waits for it, to its destruction.
    class Turn {
      public:
        Turn(WriteTurns& turns, const WritePlace& place, Kind kind);
        ~Turn();
        Turn(const Turn&) = delete;
        Turn& operator=(const Turn&) = delete;

      private:
        friend class WriteTurns;

        WriteTurns& turns_;
        const WritePlace place_;
        const Kind kind_;
        const std::thread::id thread_ = std::this_thread::get_id();
        Turn* next_ = nullptr;
        std::atomic<int> granted_ = 0;
    };

    /// @return how many turns are waited for at this moment.
    int waiting() const;

  private:
    void enlist(Turn& turn);
    void strike(const Turn& turn);
    bool mayHave(const Turn& turn) const;

    mutable std::mutex mutex_;
    Turn* first_ = nullptr;  // In order of arrival: those that have the turn and those that wait.
};

}  // namespace engine
