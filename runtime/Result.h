// A value or the reason why there is none.
#pragma once

#include <utility>
#include <variant>

namespace runtime {

/// What an operation answers that can fail. `Value` and `Error` are different types.
template <class Value, class Error>
class [[nodiscard]] Result {
  public:
    Result(Value value) : held_(std::in_place_index<0>, std::move(value)) {}
    Result(Error error) : held_(std::in_place_index<1>, std::move(error)) {}

    bool ok() const { return held_.index() == 0; }
    explicit operator bool() const { return ok(); }

    /// REQUIRES: ok().
    Value& value() & { return std::get<0>(held_); }
    const Value& value() const& { return std::get<0>(held_); }
    Value&& value() && { return std::get<0>(std::move(held_)); }

    /// REQUIRES: not ok().
    const Error& error() const { return std::get<1>(held_); }

  private:
    std::variant<Value, Error> held_;
};

/// The value of an operation that has nothing to hand back.
struct Done {};

}  // namespace runtime
