#include "itemtest/QualityWords.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <cstdio>

namespace cv {

namespace {

// Sub-status names of bad (0), uncertain (1) and good (3) values.
std::string SubStatus(int32_t lLevel, int32_t lSub) {
    static const std::array<const char*, 16> bad = {"",
                                                    "configuration error",
                                                    "not connected",
                                                    "device failure",
                                                    "sensor failure",
                                                    "last known value",
                                                    "communication failure",
                                                    "out of service"};
    static const std::array<const char*, 16> uncertain = {
        "",          "last usable value",   "",
        "",          "sensor not accurate", "engineering units exceeded",
        "sub-normal"};
    static const std::array<const char*, 16> good = {"", "", "", "", "", "", "local override"};
    const auto& names = lLevel == 0 ? bad : lLevel == 1 ? uncertain : good;
    const char* name = names[static_cast<size_t>(lSub)];
    if (name != nullptr && *name != '\0') {
        return std::string(", ") + name;
    }
    if (lSub == 0) {
        return "";
    }
    char text[32];
    std::snprintf(text, sizeof text, ", sub-status %d", static_cast<int>(lSub));
    return text;
}

}  // namespace

std::string QualityWords(int32_t lQuality) {
    const int32_t lLevel = (lQuality >> 6) & 3;
    static const std::array<const char*, 4> levels = {"bad", "uncertain", "not a quality", "good"};
    std::string sWords = levels[static_cast<size_t>(lLevel)];
    if (lLevel != 2) {
        sWords += SubStatus(lLevel, (lQuality >> 2) & 0xF);
    }
    static const std::array<const char*, 4> limits = {"", ", low limited", ", high limited",
                                                      ", constant"};
    return sWords + limits[static_cast<size_t>(lQuality & 3)];
}

QualityLevel LevelOf(int32_t lQuality) {
    switch (lQuality & 0xC0) {
        case 0xC0:
            return QualityLevel::Good;
        case 0x40:
            return QualityLevel::Uncertain;
        default:
            return QualityLevel::Bad;
    }
}

std::string StatusNameOf(const std::string& sServerText) {
    constexpr size_t kMaxLength = 80;
    std::string sName;
    for (const char c : sServerText) {
        if (c >= ' ' && c <= '~') {
            sName += c;
        }
    }
    const size_t colon = sName.find(':');
    const bool bNamed =
        colon != std::string::npos && colon > 0 &&
        std::all_of(sName.begin(), sName.begin() + static_cast<long>(colon),
                    [](char c) { return std::isalnum(static_cast<unsigned char>(c)) || c == '_'; });
    if (bNamed) {
        sName.resize(colon);
    }
    if (sName.size() > kMaxLength) {
        sName.resize(kMaxLength);
    }
    return sName;
}

}  // namespace cv
