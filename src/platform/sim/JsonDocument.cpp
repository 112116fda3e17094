#include "platform/sim/JsonDocument.h"

#include <algorithm>
#include <iterator>

namespace cv::sim {

namespace {

using nlohmann::json;

// Hands the parser one byte at a time and notes the offset of the byte it
// read last, so that each value can be given the line the parser is on.
class TrackingIterator {
  public:
    using iterator_category = std::input_iterator_tag;
    using value_type = char;
    using difference_type = std::ptrdiff_t;
    using pointer = const char*;
    using reference = const char&;

    TrackingIterator(const char* at, const char* begin, size_t* lastRead)
        : at_(at), begin_(begin), lastRead_(lastRead) {}

    reference operator*() const {
        *lastRead_ = static_cast<size_t>(at_ - begin_);
        return *at_;
    }
    TrackingIterator& operator++() {
        ++at_;
        return *this;
    }
    TrackingIterator operator++(int) {
        TrackingIterator before = *this;
        ++at_;
        return before;
    }
    bool operator==(const TrackingIterator& other) const { return at_ == other.at_; }

  private:
    const char* at_;
    const char* begin_;
    size_t* lastRead_;
};

std::string PointerToken(const std::string& key) {
    std::string token;
    for (const char c : key) {
        token += c == '~' ? "~0" : c == '/' ? "~1" : std::string(1, c);
    }
    return token;
}

// The parser's own words for a fault, without its prefix and position.
std::string ParserProblem(const std::string& what) {
    std::string problem = what;
    if (!problem.empty() && problem.front() == '[') {
        const size_t end = problem.find("] ");
        problem = end == std::string::npos ? problem : problem.substr(end + 2);
    }
    if (problem.rfind("parse error", 0) == 0) {
        const size_t colon = problem.find(": ");
        problem = colon == std::string::npos ? problem : problem.substr(colon + 2);
    }
    return problem;
}

}  // namespace

// Builds the document from the parser's events, noting each value's line.
class JsonDocumentBuilder {
  public:
    JsonDocumentBuilder(JsonDocument& document, const size_t& lastRead)
        : document_(document), lastRead_(lastRead) {}

    bool null() { return Value(nullptr); }
    bool boolean(bool value) { return Value(value); }
    bool number_integer(json::number_integer_t value) { return Value(value); }
    bool number_unsigned(json::number_unsigned_t value) { return Value(value); }
    bool number_float(json::number_float_t value, const json::string_t&) { return Value(value); }
    bool string(json::string_t& value) { return Value(std::move(value)); }
    bool binary(json::binary_t&) { return Fail(lastRead_, "binary values are not JSON"); }
    bool start_object(size_t) { return Open(json::object()); }
    bool start_array(size_t) { return Open(json::array()); }
    bool end_object() { return Close(); }
    bool end_array() { return Close(); }

    bool key(json::string_t& name) {
        Frame& top = stack_.back();
        if (top.value->contains(name)) {
            return Fail(lastRead_, "the key \"" + name + "\" appears twice in one object");
        }
        top.key = std::move(name);
        return true;
    }

    bool parse_error(size_t position, const std::string&, const nlohmann::detail::exception& ex) {
        return Fail(position > 0 ? position - 1 : 0, ParserProblem(ex.what()));
    }

    bool Failed() const { return failed_; }
    const JsonDocument::SyntaxError& Error() const { return error_; }

  private:
    struct Frame {
        json* value;
        std::string pointer;
        std::string key;
    };

    // The place of the next value in the container being read.
    json* Slot(std::string& pointer) {
        if (stack_.empty()) {
            pointer.clear();
            return &document_.root_;
        }
        Frame& top = stack_.back();
        if (top.value->is_array()) {
            pointer = top.pointer + "/" + std::to_string(top.value->size());
            top.value->push_back(nullptr);
            return &top.value->back();
        }
        pointer = top.pointer + "/" + PointerToken(top.key);
        return &(*top.value)[top.key];
    }

    json* Place(json value, std::string& pointer) {
        json* slot = Slot(pointer);
        *slot = std::move(value);
        int column = 0;
        document_.Locate(lastRead_, document_.lines_[pointer], column);
        return slot;
    }

    bool Value(json value) {
        std::string pointer;
        Place(std::move(value), pointer);
        return true;
    }

    bool Open(json container) {
        if (stack_.size() >= JsonDocument::kMaxDepth) {
            return Fail(lastRead_, "values nest deeper than " +
                                       std::to_string(JsonDocument::kMaxDepth) + " levels");
        }
        std::string pointer;
        json* slot = Place(std::move(container), pointer);
        stack_.push_back({slot, std::move(pointer), {}});
        return true;
    }

    bool Close() {
        stack_.pop_back();
        return true;
    }

    bool Fail(size_t offset, std::string problem) {
        failed_ = true;
        document_.Locate(offset, error_.line, error_.column);
        error_.problem = std::move(problem);
        return false;
    }

    JsonDocument& document_;
    const size_t& lastRead_;
    std::vector<Frame> stack_;
    bool failed_ = false;
    JsonDocument::SyntaxError error_;
};

bool JsonDocument::Parse(std::string_view text, SyntaxError& error) {
    root_ = nullptr;
    lines_.clear();
    newlines_.clear();
    for (size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '\n') {
            newlines_.push_back(i);
        }
    }
    size_t lastRead = 0;
    const char* begin = text.data();
    JsonDocumentBuilder builder(*this, lastRead);
    const bool parsed = json::sax_parse(TrackingIterator(begin, begin, &lastRead),
                                        TrackingIterator(begin + text.size(), begin, &lastRead),
                                        &builder, json::input_format_t::json, true, true);
    if (parsed && !builder.Failed()) {
        return true;
    }
    error = builder.Failed() ? builder.Error() : SyntaxError{1, 1, "the text is not JSON"};
    root_ = nullptr;
    return false;
}

int JsonDocument::LineOf(const std::string& pointer) const {
    const auto found = lines_.find(pointer);
    return found == lines_.end() ? 0 : found->second;
}

void JsonDocument::Locate(size_t offset, int& line, int& column) const {
    const auto after = std::lower_bound(newlines_.begin(), newlines_.end(), offset);
    line = static_cast<int>(after - newlines_.begin()) + 1;
    const size_t lineStart = after == newlines_.begin() ? 0 : *(after - 1) + 1;
    column = static_cast<int>(offset - lineStart) + 1;
}

}  // namespace cv::sim
