#pragma once

#include <string>
#include <utility>
#include <variant>

#include "ua/types/StatusCode.h"

namespace cv::ua {

// Why an operation failed: a status code and a sentence for the user that
// says what happened ("The server did not answer the Read request within
// 200 ms.").
struct Error {
    StatusCode status;
    std::string text;

    bool operator==(const Error&) const = default;
};

// The value of an operation that worked, or the error of one that did not.
template <class T>
class Result {
  public:
    Result(T value) : state_(std::move(value)) {}
    Result(Error error) : state_(std::move(error)) {}

    bool Ok() const { return state_.index() == 0; }
    explicit operator bool() const { return Ok(); }

    const T& Value() const& { return std::get<0>(state_); }
    T& Value() & { return std::get<0>(state_); }
    T Value() && { return std::get<0>(std::move(state_)); }
    const Error& Failure() const { return std::get<1>(state_); }

  private:
    std::variant<T, Error> state_;
};

// For operations that give back nothing but success.
struct Done {
    bool operator==(const Done&) const = default;
};

}  // namespace cv::ua
