// What is told beside the values: faults of the line, files that were not taken, traces.
#pragma once

#include <iosfwd>
#include <mutex>
#include <ostream>
#include <streambuf>
#include <string>

namespace cli {

/// Hands whole lines on to a stream and keeps the last of them. Threads: any.
class NoticeBoard {
  public:
    /// @param err  Outlives the board.
    explicit NoticeBoard(std::ostream& err) : err_(err) {}

    /// Keeps lines from the stream while a table covers the screen that it goes to.
    void hold(bool held);
    /// Tells "mrtu: " and the text.
    void tell(const std::string& text);
    /// @param line  Without its end.
    void line(const std::string& line);
    /// @return the last line without "mrtu: ".
    [[nodiscard]] std::string last() const;

  private:
    std::ostream& err_;
    mutable std::mutex mutex_;
    std::string last_;
    bool held_ = false;
};

/// A stream whose whole lines go to a board. Threads: one at a time.
class NoticeStream final : public std::ostream {
  public:
    /// @param board  Outlives the stream.
    explicit NoticeStream(NoticeBoard& board) : std::ostream(nullptr), lines_(board) {
        rdbuf(&lines_);
    }

  private:
    class Lines final : public std::streambuf {
      public:
        explicit Lines(NoticeBoard& board) : board_(board) {}

      protected:
        int_type overflow(int_type letter) override;

      private:
        NoticeBoard& board_;
        std::string line_;
    };
    Lines lines_;
};

}  // namespace cli
