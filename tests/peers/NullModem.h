// Two pseudo terminals, joined back to back: what goes into one comes out of the other.
#pragma once

#include <array>
#include <string>
#include <thread>

namespace peers {

/// The devices can be opened as serial ports, by two programs that know nothing of each other.
/// They stay open inside, so that either program may come and go.
class NullModem {
  public:
    /// Errors: std::system_error when the pseudo terminals can't be had.
    NullModem();
    ~NullModem();
    NullModem(const NullModem&) = delete;
    NullModem& operator=(const NullModem&) = delete;

    const std::string& left() const { return ends_[0].path; }
    const std::string& right() const { return ends_[1].path; }

  private:
    struct End {
        int master = -1;
        int slave = -1;
        std::string path;
    };

    static End open();
    void relay() const;
    /// @return false when the end is gone.
    static bool pass(int from, int to);

    std::array<End, 2> ends_;
    std::array<int, 2> stop_{};  // A pipe.
    std::thread relay_;
};

}  // namespace peers
