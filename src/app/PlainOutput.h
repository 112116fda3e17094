#pragma once

#include <ostream>
#include <streambuf>
#include <string>

namespace cv {

// A stream buffer in front of a terminal's stream that lets no control
// character through but line breaks and tabs: whatever a server's text
// holds, it cannot move the cursor, clear the screen or retitle the
// window. Text goes on at each line break and each flush.
class PlainOutput : public std::streambuf {
  public:
    explicit PlainOutput(std::ostream& target) : target_(target) {}
    ~PlainOutput() override;
    PlainOutput(const PlainOutput&) = delete;
    PlainOutput& operator=(const PlainOutput&) = delete;

  protected:
    int_type overflow(int_type c) override;
    std::streamsize xsputn(const char* text, std::streamsize size) override;
    int sync() override;

  private:
    // Passes on the complete lines held, or everything with all.
    void Pass(bool all);

    std::ostream& target_;
    std::string held_;
};

}  // namespace cv
