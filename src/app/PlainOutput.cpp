#include "app/PlainOutput.h"

#include "ua/types/PlainText.h"

namespace cv {

PlainOutput::~PlainOutput() {
    Pass(true);
    target_.flush();
}

PlainOutput::int_type PlainOutput::overflow(int_type c) {
    if (traits_type::eq_int_type(c, traits_type::eof())) {
        return traits_type::not_eof(c);
    }
    held_ += traits_type::to_char_type(c);
    Pass(false);
    return c;
}

std::streamsize PlainOutput::xsputn(const char* text, std::streamsize size) {
    held_.append(text, static_cast<size_t>(size));
    Pass(false);
    return size;
}

int PlainOutput::sync() {
    Pass(true);
    target_.flush();
    return target_ ? 0 : -1;
}

void PlainOutput::Pass(bool all) {
    const size_t lastBreak = held_.rfind('\n');
    const size_t end = all ? held_.size() : lastBreak == std::string::npos ? 0 : lastBreak + 1;
    if (end == 0) {
        return;
    }
    target_ << ua::PlainText(std::string_view(held_).substr(0, end), ua::TextLines::Many);
    held_.erase(0, end);
}

}  // namespace cv
