#pragma once

#include <compare>
#include <cstdint>
#include <string>
#include <variant>

#include "ua/types/Guid.h"

namespace cv::ua {

// An opaque identifier, kept apart from a string identifier of the same bytes.
struct ByteString {
    std::string bytes;
    auto operator<=>(const ByteString&) const = default;
};

// A node's identity in its server: a namespace index and a numeric, string,
// GUID or opaque identifier.
struct NodeId {
    enum class Kind : uint8_t { Numeric, String, Guid, Opaque };

    uint16_t namespaceIndex = 0;
    std::variant<uint32_t, std::string, Guid, ByteString> identifier{uint32_t{0}};

    NodeId() = default;
    NodeId(uint16_t ns, uint32_t id) : namespaceIndex(ns), identifier(id) {}
    NodeId(uint16_t ns, std::string id) : namespaceIndex(ns), identifier(std::move(id)) {}
    NodeId(uint16_t ns, Guid id) : namespaceIndex(ns), identifier(id) {}
    NodeId(uint16_t ns, ByteString id) : namespaceIndex(ns), identifier(std::move(id)) {}

    Kind IdKind() const { return static_cast<Kind>(identifier.index()); }
    bool IsNull() const;
    // The numeric identifier, 0 for other kinds.
    uint32_t Numeric() const;

    auto operator<=>(const NodeId&) const = default;
    bool operator==(const NodeId&) const = default;
};

// A NodeId that may name its namespace by URI and its server by index.
struct ExpandedNodeId {
    NodeId nodeId;
    std::string namespaceUri;
    uint32_t serverIndex = 0;

    auto operator<=>(const ExpandedNodeId&) const = default;
    bool operator==(const ExpandedNodeId&) const = default;
};

}  // namespace cv::ua
