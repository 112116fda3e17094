#pragma once

#include <compare>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "ua/types/NodeId.h"
#include "ua/types/StatusCode.h"

namespace cv::ua {

// 100-nanosecond intervals since 1601-01-01 UTC; 0 means "no time".
struct DateTime {
    int64_t ticks = 0;

    static constexpr int64_t kTicksPerMillisecond = 10'000;
    // Ticks from 1601-01-01 to the Unix epoch.
    static constexpr int64_t kUnixEpochTicks = 116'444'736'000'000'000;

    static DateTime Now();
    static DateTime FromUnixMilliseconds(int64_t ms) {
        return {kUnixEpochTicks + ms * kTicksPerMillisecond};
    }
    auto operator<=>(const DateTime&) const = default;
};

struct XmlElement {
    std::string text;
    auto operator<=>(const XmlElement&) const = default;
};

// A name qualified by the index of its namespace ("0:EURange").
struct QualifiedName {
    uint16_t namespaceIndex = 0;
    std::string name;
    auto operator<=>(const QualifiedName&) const = default;
};

// A text with its locale; either may be absent (empty).
struct LocalizedText {
    std::string locale;
    std::string text;
    auto operator<=>(const LocalizedText&) const = default;
};

// A structure carried as its type's binary encoding id and its encoded body,
// decoded by whoever knows the type.
struct ExtensionObject {
    enum class Encoding : uint8_t { None = 0, Binary = 1, Xml = 2 };

    NodeId typeId;
    Encoding encoding = Encoding::None;
    std::string body;
    bool operator==(const ExtensionObject&) const = default;
};

// Diagnostics a server may add to a result. The four indexes point into the
// response header's string table.
struct DiagnosticInfo {
    std::optional<int32_t> symbolicId;
    std::optional<int32_t> namespaceUri;
    std::optional<int32_t> locale;
    std::optional<int32_t> localizedText;
    std::optional<std::string> additionalInfo;
    std::optional<StatusCode> innerStatusCode;
    std::shared_ptr<const DiagnosticInfo> inner;

    bool operator==(const DiagnosticInfo& other) const;
};

}  // namespace cv::ua
