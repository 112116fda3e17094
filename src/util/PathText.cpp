#include "util/PathText.h"

namespace cv {

namespace {

std::string TrimBlanks(const std::string& text) {
    const size_t first = text.find_first_not_of(' ');
    if (first == std::string::npos) {
        return {};
    }
    return text.substr(first, text.find_last_not_of(' ') - first + 1);
}

}  // namespace

std::string FolderOfPath(const std::string& path) {
    const size_t separator = path.find_last_of("\\/");
    if (separator != std::string::npos) {
        return path.substr(0, separator + 1);
    }
    const size_t colon = path.find(':');
    return colon != std::string::npos ? path.substr(0, colon + 1) : std::string();
}

void SplitPath(const std::string& path, std::string& folder, std::string& name) {
    folder = FolderOfPath(path);
    name = TrimBlanks(path.substr(folder.size()));
}

int16_t LastPosOf(const std::string& text, const std::string& character) {
    if (character.empty()) {
        return 0;
    }
    const size_t found = text.rfind(character[0]);
    if (found == std::string::npos || found >= INT16_MAX) {
        return 0;
    }
    return static_cast<int16_t>(found + 1);
}

void SplitAppTopic(const std::string& text, std::string& application, std::string& topic) {
    application.clear();
    topic.clear();
    const std::string trimmed = TrimBlanks(text);
    const size_t bar = trimmed.find('|');
    if (bar == std::string::npos) {
        application = trimmed;
        return;
    }
    application = trimmed.substr(0, bar);
    topic = trimmed.substr(bar + 1);
}

std::string RemoveSecondDot(const std::string& text, bool insertZero) {
    const std::string trimmed = TrimBlanks(text);
    const size_t first = trimmed.find('.');
    if (trimmed.size() <= 3 || first == std::string::npos) {
        return trimmed;
    }
    const size_t second = trimmed.find('.', first + 1);
    if (second == std::string::npos) {
        return trimmed;
    }
    const std::string after = trimmed.substr(second + 1);
    return trimmed.substr(0, second) + (after.size() == 1 && insertZero ? "0" : "") + after;
}

}  // namespace cv
