#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include <nlohmann/json.hpp>

namespace cv::sim {

// A JSON text read into nlohmann::json that remembers the line of every
// value, so that a fault found later in the content can name its line.
// Comments (// and /* */) are allowed; a key that appears twice in one object
// and nesting deeper than kMaxDepth are faults, like bad syntax.
class JsonDocument {
  public:
    static constexpr size_t kMaxDepth = 64;

    struct SyntaxError {
        int line = 0;
        int column = 0;
        std::string problem;
    };

    // False with error filled when the text is not sound JSON.
    bool Parse(std::string_view text, SyntaxError& error);

    const nlohmann::json& Root() const { return root_; }
    // The line (from 1) where the value at a JSON pointer ("/servers/0/id")
    // starts; 0 for a pointer that names no value.
    int LineOf(const std::string& pointer) const;
    // The line and column (from 1) of a byte offset in the text.
    void Locate(size_t offset, int& line, int& column) const;

  private:
    friend class JsonDocumentBuilder;

    nlohmann::json root_;
    std::vector<size_t> newlines_;
    std::unordered_map<std::string, int> lines_;
};

}  // namespace cv::sim
