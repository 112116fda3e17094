#pragma once

#include <cstdint>
#include <string>

namespace cv {

// Message box styles, added together: one button set plus one icon.
namespace MsgBoxStyle {
inline constexpr int32_t OKOnly = 0;
inline constexpr int32_t OKCancel = 1;
inline constexpr int32_t AbortRetryIgnore = 2;
inline constexpr int32_t YesNoCancel = 3;
inline constexpr int32_t YesNo = 4;
inline constexpr int32_t RetryCancel = 5;
inline constexpr int32_t Critical = 16;
inline constexpr int32_t Question = 32;
inline constexpr int32_t Exclamation = 48;
inline constexpr int32_t Information = 64;
}  // namespace MsgBoxStyle

// The button the user pressed.
namespace MsgBoxResult {
inline constexpr int32_t OK = 1;
inline constexpr int32_t Cancel = 2;
inline constexpr int32_t Abort = 3;
inline constexpr int32_t Retry = 4;
inline constexpr int32_t Ignore = 5;
inline constexpr int32_t Yes = 6;
inline constexpr int32_t No = 7;
}  // namespace MsgBoxResult

namespace platform {

// Modal message boxes. Texts use CR LF line breaks; an empty title means the
// program's default caption.
class Dialogs {
  public:
    virtual ~Dialogs() = default;
    virtual int32_t MsgBox(const std::string& text, int32_t style, const std::string& title) = 0;
};

}  // namespace platform
}  // namespace cv
