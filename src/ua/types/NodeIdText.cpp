#include "ua/types/NodeIdText.h"

#include <charconv>
#include <limits>

#include "ua/types/Base64.h"

namespace cv::ua {
namespace {

template <class T>
std::optional<T> Digits(std::string_view sText) {
    T value{};
    if (sText.empty() || sText.front() < '0' || sText.front() > '9') {
        return std::nullopt;
    }
    const auto [end, ec] = std::from_chars(sText.data(), sText.data() + sText.size(), value);
    if (ec != std::errc() || end != sText.data() + sText.size()) {
        return std::nullopt;
    }
    return value;
}

// "key=" or "key-" at the start of the text; the rest after it, which may
// not be empty.
std::optional<std::string_view> After(std::string_view sText, std::string_view sKey) {
    if (sText.size() <= sKey.size() + 1 || sText.substr(0, sKey.size()) != sKey ||
        (sText[sKey.size()] != '=' && sText[sKey.size()] != '-')) {
        return std::nullopt;
    }
    return sText.substr(sKey.size() + 1);
}

std::optional<NodeId> Identifier(uint16_t ns, std::string_view sText) {
    if (auto digits = After(sText, "i")) {
        const auto id = Digits<uint32_t>(*digits);
        return id ? std::optional<NodeId>(NodeId(ns, *id)) : std::nullopt;
    }
    if (auto text = After(sText, "s")) {
        return NodeId(ns, std::string(*text));
    }
    if (auto text = After(sText, "g")) {
        const auto guid = Guid::FromText(*text);
        return guid ? std::optional<NodeId>(NodeId(ns, *guid)) : std::nullopt;
    }
    if (auto text = After(sText, "b")) {
        auto bytes = Base64Decode(*text);
        return bytes ? std::optional<NodeId>(NodeId(ns, ByteString{std::move(*bytes)}))
                     : std::nullopt;
    }
    return std::nullopt;
}

}  // namespace

std::optional<ExpandedNodeId> ParseNodeId(std::string_view sText) {
    ExpandedNodeId result;
    uint16_t ns = 0;
    if (auto uri = After(sText, "nsu")) {
        const size_t semicolon = uri->find(';');
        if (semicolon == std::string_view::npos || semicolon == 0) {
            return std::nullopt;
        }
        result.namespaceUri = std::string(uri->substr(0, semicolon));
        sText = uri->substr(semicolon + 1);
    } else if (auto index = After(sText, "ns")) {
        const size_t semicolon = index->find(';');
        const auto value = Digits<uint16_t>(index->substr(0, semicolon));
        if (semicolon == std::string_view::npos || !value) {
            return std::nullopt;
        }
        ns = *value;
        sText = index->substr(semicolon + 1);
    }
    auto node = Identifier(ns, sText);
    if (!node) {
        return std::nullopt;
    }
    result.nodeId = std::move(*node);
    return result;
}

std::string FormatNodeId(const NodeId& node) {
    std::string text = node.namespaceIndex ? "ns=" + std::to_string(node.namespaceIndex) + ";" : "";
    switch (node.IdKind()) {
        case NodeId::Kind::Numeric:
            return text + "i=" + std::to_string(std::get<uint32_t>(node.identifier));
        case NodeId::Kind::String:
            return text + "s=" + std::get<std::string>(node.identifier);
        case NodeId::Kind::Guid:
            return text + "g=" + std::get<Guid>(node.identifier).ToText();
        case NodeId::Kind::Opaque:
            return text + "b=" + Base64Encode(std::get<ByteString>(node.identifier).bytes);
    }
    return text;
}

std::string FormatNodeId(const ExpandedNodeId& node) {
    if (node.namespaceUri.empty()) {
        return FormatNodeId(node.nodeId);
    }
    NodeId local = node.nodeId;
    local.namespaceIndex = 0;
    return "nsu=" + node.namespaceUri + ";" + FormatNodeId(local);
}

}  // namespace cv::ua
