#include "document/ModeMapClass.h"

#include <algorithm>
#include <utility>

#include "platform/AsciiCase.h"

namespace cv {

namespace {

const char* const kUnknown = "unknown";

std::string TrimSpaces(const std::string& sText) {
    const size_t first = sText.find_first_not_of(' ');
    if (first == std::string::npos) {
        return "";
    }
    const size_t last = sText.find_last_not_of(' ');
    return sText.substr(first, last - first + 1);
}

bool IsTerminator(char c) {
    return c == '\n' || c == '\r' || c == '\t';
}

}  // namespace

std::string ModeMapClass::StripDDETerminators(const std::string& sText) {
    std::string result = TrimSpaces(sText);
    if (std::none_of(result.begin(), result.end(), IsTerminator)) {
        return result;
    }
    std::erase_if(result, IsTerminator);
    return TrimSpaces(result);
}

void ModeMapClass::AddModeMapItem(const std::string& sKey, const std::string& sValue) {
    AddModeMapItem2(sKey, sValue, 0);
}

void ModeMapClass::AddModeMapItem2(const std::string& sKey, const std::string& sValue,
                                   int32_t lValidity) {
    std::string sClean = StripDDETerminators(sKey);
    if (FindKey(sClean) != nullptr || ValueExists(sValue)) {
        return;
    }
    maEntries.push_back({std::move(sClean), sValue, lValidity});
}

std::string ModeMapClass::GetModeMapKey(const std::string& sValue) const {
    const std::string sWanted = AsciiUpper(sValue);
    for (const Entry& entry : maEntries) {
        if (AsciiUpper(entry.sValue) == sWanted) {
            return entry.sKey;
        }
    }
    return kUnknown;
}

std::string ModeMapClass::GetModeMapKeyByPos(int16_t iPosition) const {
    const Entry* entry = AtPosition(iPosition);
    return entry != nullptr ? entry->sKey : kUnknown;
}

int16_t ModeMapClass::GetModeMapSize() const {
    return static_cast<int16_t>(maEntries.size());
}

std::string ModeMapClass::GetModeMapValue(const std::string& sKey) const {
    const Entry* entry = FindKey(StripDDETerminators(sKey));
    return entry != nullptr ? entry->sValue : kUnknown;
}

int32_t ModeMapClass::GetModeMapValidity(const std::string& sKey) const {
    const Entry* entry = FindKey(StripDDETerminators(sKey));
    return entry != nullptr ? entry->lValidity : 0;
}

std::string ModeMapClass::GetModeMapValueByPos(int16_t iPosition) const {
    const Entry* entry = AtPosition(iPosition);
    return entry != nullptr ? entry->sValue : kUnknown;
}

// Compares the text with as many leading characters of each key as the text
// has; a key shorter than the text is compared whole and so never matches.
std::string ModeMapClass::GetModeMapValueFromLeftKeySubString(const std::string& sText) const {
    const std::string sWanted = AsciiUpper(sText);
    for (const Entry& entry : maEntries) {
        if (AsciiUpper(entry.sKey.substr(0, sWanted.size())) == sWanted) {
            return entry.sValue;
        }
    }
    return kUnknown;
}

void ModeMapClass::ReInitializeModeMap() {
    maEntries.clear();
}

bool ModeMapClass::KeyExists(const std::string& sKey) const {
    return FindKey(sKey) != nullptr;
}

void ModeMapClass::UpdateModeMapKey(const std::string& sNewKey, const std::string& sValue) {
    auto found = std::find_if(maEntries.begin(), maEntries.end(),
                              [&](const Entry& entry) { return entry.sValue == sValue; });
    if (found != maEntries.end()) {
        found->sKey = StripDDETerminators(sNewKey);
    }
}

void ModeMapClass::UpdateModeMapValue(const std::string& sKey, const std::string& sNewValue) {
    Entry* entry = FindKey(StripDDETerminators(sKey));
    if (entry != nullptr) {
        entry->sValue = sNewValue;
    }
}

const ModeMapClass::Entry* ModeMapClass::FindKey(const std::string& sKey) const {
    auto found = std::find_if(maEntries.begin(), maEntries.end(),
                              [&](const Entry& entry) { return entry.sKey == sKey; });
    return found != maEntries.end() ? &*found : nullptr;
}

ModeMapClass::Entry* ModeMapClass::FindKey(const std::string& sKey) {
    return const_cast<Entry*>(std::as_const(*this).FindKey(sKey));
}

bool ModeMapClass::ValueExists(const std::string& sValue) const {
    return std::any_of(maEntries.begin(), maEntries.end(),
                       [&](const Entry& entry) { return entry.sValue == sValue; });
}

const ModeMapClass::Entry* ModeMapClass::AtPosition(int16_t iPosition) const {
    if (iPosition < 1 || iPosition > GetModeMapSize()) {
        return nullptr;
    }
    return &maEntries[static_cast<size_t>(iPosition - 1)];
}

}  // namespace cv
