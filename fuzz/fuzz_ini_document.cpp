// Feeds arbitrary bytes to the INI parser. Checks that a rewrite gives back
// every byte of the input, and that one write or erase changes what it names
// (read back after a second parse) and no other entry.

#include <cstdint>
#include <cstdlib>
#include <optional>
#include <string>
#include <string_view>

#include <fuzzer/FuzzedDataProvider.h>

#include "platform/posix/IniDocument.h"

namespace {

using cv::posix::IniDocument;

void Check(bool bCondition) {
    if (!bCondition) {
        std::abort();
    }
}

std::string_view Trimmed(std::string_view sText) {
    constexpr std::string_view kBlanks = " \t\r\v\f";
    const size_t first = sText.find_first_not_of(kBlanks);
    return first == sText.npos ? std::string_view()
                               : sText.substr(first, sText.find_last_not_of(kBlanks) - first + 1);
}

// What a read gives back for a written value: blanks around it and one pair
// of enclosing quotes removed.
std::string ReadBack(std::string_view sValue) {
    sValue = Trimmed(sValue);
    if (sValue.size() >= 2 && (sValue.front() == '"' || sValue.front() == '\'') &&
        sValue.back() == sValue.front()) {
        sValue = sValue.substr(1, sValue.size() - 2);
    }
    return std::string(sValue);
}

std::string Folded(std::string_view sName) {
    std::string text(Trimmed(sName));
    for (char& c : text) {
        c = (c >= 'A' && c <= 'Z') ? static_cast<char>(c + 32) : c;
    }
    return text;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    FuzzedDataProvider input(data, size);
    const std::string section = input.ConsumeRandomLengthString(32);
    const std::string key = input.ConsumeRandomLengthString(32);
    const std::string value = input.ConsumeRandomLengthString(64);
    const std::string otherKey = input.ConsumeRandomLengthString(32);
    const std::string otherSection = input.ConsumeRandomLengthString(32);
    const int operation = input.ConsumeIntegralInRange(0, 2);
    const std::string text = input.ConsumeRemainingBytesAsString();

    IniDocument document = IniDocument::Parse(text);
    Check(document.Serialise() == text);
    if (!IniDocument::IsSectionName(section) || !IniDocument::IsKeyName(key) ||
        !IniDocument::IsValueText(value)) {
        return 0;
    }
    const std::optional<std::string> otherBefore = document.Value(section, otherKey);
    const std::optional<std::string> elsewhereBefore = document.Value(otherSection, otherKey);
    if (operation == 0) {
        document.SetValue(section, key, value);
    } else if (operation == 1) {
        document.EraseKey(section, key);
    } else {
        document.EraseSection(section);
    }

    const std::string written = document.Serialise();
    const IniDocument reread = IniDocument::Parse(written);
    Check(reread.Serialise() == written);
    const std::optional<std::string> now = reread.Value(section, key);
    Check(operation == 0 ? now == ReadBack(value) : !now.has_value());
    if (operation != 2 && Folded(otherKey) != Folded(key)) {
        Check(reread.Value(section, otherKey) == otherBefore);
    }
    if (Folded(otherSection) != Folded(section)) {
        Check(reread.Value(otherSection, otherKey) == elsewhereBefore);
    }
    return 0;
}
