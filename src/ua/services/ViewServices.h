#pragma once

#include <cstdint>
#include <vector>

#include "ua/services/ServiceHeaders.h"

namespace cv::ua {

enum class BrowseDirection : int32_t { Forward = 0, Inverse = 1, Both = 2 };

enum class NodeClass : int32_t {
    Unspecified = 0,
    Object = 1,
    Variable = 2,
    Method = 4,
    ObjectType = 8,
    VariableType = 16,
    ReferenceType = 32,
    DataType = 64,
    View = 128,
};

// Reference types and nodes that browsing starts from.
namespace ids {
inline constexpr uint32_t HierarchicalReferences = 33;
inline constexpr uint32_t HasSubtype = 45;
inline constexpr uint32_t HasProperty = 46;
inline constexpr uint32_t ObjectsFolder = 85;
inline constexpr uint32_t Server = 2253;
inline constexpr uint32_t ServerStatus = 2256;
inline constexpr uint32_t ServerStatusCurrentTime = 2258;
inline constexpr uint32_t ServerStatusState = 2259;
inline constexpr uint32_t SecondsTillShutdown = 2992;
inline constexpr uint32_t ShutdownReason = 2993;
}  // namespace ids

struct ViewDescription {
    NodeId viewId;
    DateTime timestamp;
    uint32_t viewVersion = 0;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.viewId);
        v(s.timestamp);
        v(s.viewVersion);
    }
};

struct BrowseDescription {
    // Every field of a reference description.
    static constexpr uint32_t kResultMaskAll = 63;

    NodeId nodeId;
    BrowseDirection browseDirection = BrowseDirection::Forward;
    NodeId referenceTypeId{0, ids::HierarchicalReferences};
    bool includeSubtypes = true;
    // Bits of NodeClass; 0 for all.
    uint32_t nodeClassMask = 0;
    uint32_t resultMask = kResultMaskAll;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.nodeId);
        v(s.browseDirection);
        v(s.referenceTypeId);
        v(s.includeSubtypes);
        v(s.nodeClassMask);
        v(s.resultMask);
    }
};

struct ReferenceDescription {
    NodeId referenceTypeId;
    bool isForward = true;
    ExpandedNodeId nodeId;
    QualifiedName browseName;
    LocalizedText displayName;
    NodeClass nodeClass = NodeClass::Unspecified;
    ExpandedNodeId typeDefinition;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.referenceTypeId);
        v(s.isForward);
        v(s.nodeId);
        v(s.browseName);
        v(s.displayName);
        v(s.nodeClass);
        v(s.typeDefinition);
    }
};

struct BrowseResult {
    StatusCode statusCode;
    // Empty when every reference came back.
    ByteString continuationPoint;
    std::vector<ReferenceDescription> references;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.statusCode);
        v(s.continuationPoint);
        v(s.references);
    }
};

struct BrowseRequest {
    static constexpr uint16_t kEncodingId = 527;
    RequestHeader header;
    ViewDescription view;
    uint32_t requestedMaxReferencesPerNode = 0;
    std::vector<BrowseDescription> nodesToBrowse;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.view);
        v(s.requestedMaxReferencesPerNode);
        v(s.nodesToBrowse);
    }
};

struct BrowseResponse {
    static constexpr uint16_t kEncodingId = 530;
    ResponseHeader header;
    std::vector<BrowseResult> results;
    std::vector<DiagnosticInfo> diagnosticInfos;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.results);
        v(s.diagnosticInfos);
    }
};

struct BrowseNextRequest {
    static constexpr uint16_t kEncodingId = 533;
    RequestHeader header;
    bool releaseContinuationPoints = false;
    std::vector<ByteString> continuationPoints;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.releaseContinuationPoints);
        v(s.continuationPoints);
    }
};

struct BrowseNextResponse {
    static constexpr uint16_t kEncodingId = 536;
    ResponseHeader header;
    std::vector<BrowseResult> results;
    std::vector<DiagnosticInfo> diagnosticInfos;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.results);
        v(s.diagnosticInfos);
    }
};

struct RelativePathElement {
    NodeId referenceTypeId{0, ids::HierarchicalReferences};
    bool isInverse = false;
    bool includeSubtypes = true;
    QualifiedName targetName;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.referenceTypeId);
        v(s.isInverse);
        v(s.includeSubtypes);
        v(s.targetName);
    }
};

struct RelativePath {
    std::vector<RelativePathElement> elements;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.elements);
    }
};

struct BrowsePath {
    NodeId startingNode;
    RelativePath relativePath;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.startingNode);
        v(s.relativePath);
    }
};

struct BrowsePathTarget {
    ExpandedNodeId targetId;
    // 0xFFFFFFFF when the whole path was followed.
    uint32_t remainingPathIndex = 0xFFFFFFFF;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.targetId);
        v(s.remainingPathIndex);
    }
};

struct BrowsePathResult {
    StatusCode statusCode;
    std::vector<BrowsePathTarget> targets;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.statusCode);
        v(s.targets);
    }
};

struct TranslateBrowsePathsRequest {
    static constexpr uint16_t kEncodingId = 554;
    RequestHeader header;
    std::vector<BrowsePath> browsePaths;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.browsePaths);
    }
};

struct TranslateBrowsePathsResponse {
    static constexpr uint16_t kEncodingId = 557;
    ResponseHeader header;
    std::vector<BrowsePathResult> results;
    std::vector<DiagnosticInfo> diagnosticInfos;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.results);
        v(s.diagnosticInfos);
    }
};

}  // namespace cv::ua
