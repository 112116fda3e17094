#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "ua/services/DiscoveryServices.h"

namespace cv::ua {

struct SignatureData {
    std::string algorithm;
    ByteString signature;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.algorithm);
        v(s.signature);
    }
};

struct SignedSoftwareCertificate {
    ByteString certificateData;
    ByteString signature;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.certificateData);
        v(s.signature);
    }
};

struct CreateSessionRequest {
    static constexpr uint16_t kEncodingId = 461;
    RequestHeader header;
    ApplicationDescription clientDescription;
    std::string serverUri;
    std::string endpointUrl;
    std::string sessionName;
    ByteString clientNonce;
    ByteString clientCertificate;
    // Milliseconds.
    double requestedSessionTimeout = 0;
    uint32_t maxResponseMessageSize = 0;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.clientDescription);
        v(s.serverUri);
        v(s.endpointUrl);
        v(s.sessionName);
        v(s.clientNonce);
        v(s.clientCertificate);
        v(s.requestedSessionTimeout);
        v(s.maxResponseMessageSize);
    }
};

struct CreateSessionResponse {
    static constexpr uint16_t kEncodingId = 464;
    ResponseHeader header;
    NodeId sessionId;
    NodeId authenticationToken;
    double revisedSessionTimeout = 0;
    ByteString serverNonce;
    ByteString serverCertificate;
    std::vector<EndpointDescription> serverEndpoints;
    std::vector<SignedSoftwareCertificate> serverSoftwareCertificates;
    SignatureData serverSignature;
    uint32_t maxRequestMessageSize = 0;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.sessionId);
        v(s.authenticationToken);
        v(s.revisedSessionTimeout);
        v(s.serverNonce);
        v(s.serverCertificate);
        v(s.serverEndpoints);
        v(s.serverSoftwareCertificates);
        v(s.serverSignature);
        v(s.maxRequestMessageSize);
    }
};

struct AnonymousIdentityToken {
    static constexpr uint16_t kEncodingId = 321;
    std::string policyId;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.policyId);
    }
};

struct UserNameIdentityToken {
    static constexpr uint16_t kEncodingId = 324;
    std::string policyId;
    std::string userName;
    // Encrypted as encryptionAlgorithm names; the UTF-8 text when it is empty.
    ByteString password;
    std::string encryptionAlgorithm;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.policyId);
        v(s.userName);
        v(s.password);
        v(s.encryptionAlgorithm);
    }
};

struct ActivateSessionRequest {
    static constexpr uint16_t kEncodingId = 467;
    RequestHeader header;
    SignatureData clientSignature;
    std::vector<SignedSoftwareCertificate> clientSoftwareCertificates;
    std::vector<std::string> localeIds;
    ExtensionObject userIdentityToken;
    SignatureData userTokenSignature;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.clientSignature);
        v(s.clientSoftwareCertificates);
        v(s.localeIds);
        v(s.userIdentityToken);
        v(s.userTokenSignature);
    }
};

struct ActivateSessionResponse {
    static constexpr uint16_t kEncodingId = 470;
    ResponseHeader header;
    ByteString serverNonce;
    std::vector<StatusCode> results;
    std::vector<DiagnosticInfo> diagnosticInfos;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.serverNonce);
        v(s.results);
        v(s.diagnosticInfos);
    }
};

struct CloseSessionRequest {
    static constexpr uint16_t kEncodingId = 473;
    RequestHeader header;
    bool deleteSubscriptions = true;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.deleteSubscriptions);
    }
};

struct CloseSessionResponse {
    static constexpr uint16_t kEncodingId = 476;
    ResponseHeader header;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
    }
};

}  // namespace cv::ua
