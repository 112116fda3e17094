#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "ua/services/ChannelServices.h"

namespace cv::ua {

enum class ApplicationType : int32_t {
    Server = 0,
    Client = 1,
    ClientAndServer = 2,
    DiscoveryServer = 3
};

struct ApplicationDescription {
    std::string applicationUri;
    std::string productUri;
    LocalizedText applicationName;
    ApplicationType applicationType = ApplicationType::Server;
    std::string gatewayServerUri;
    std::string discoveryProfileUri;
    std::vector<std::string> discoveryUrls;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.applicationUri);
        v(s.productUri);
        v(s.applicationName);
        v(s.applicationType);
        v(s.gatewayServerUri);
        v(s.discoveryProfileUri);
        v(s.discoveryUrls);
    }
};

enum class UserTokenType : int32_t { Anonymous = 0, UserName = 1, Certificate = 2, Issued = 3 };

struct UserTokenPolicy {
    std::string policyId;
    UserTokenType tokenType = UserTokenType::Anonymous;
    std::string issuedTokenType;
    std::string issuerEndpointUrl;
    std::string securityPolicyUri;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.policyId);
        v(s.tokenType);
        v(s.issuedTokenType);
        v(s.issuerEndpointUrl);
        v(s.securityPolicyUri);
    }
};

struct EndpointDescription {
    std::string endpointUrl;
    ApplicationDescription server;
    ByteString serverCertificate;
    MessageSecurityMode securityMode = MessageSecurityMode::None;
    std::string securityPolicyUri;
    std::vector<UserTokenPolicy> userIdentityTokens;
    std::string transportProfileUri;
    uint8_t securityLevel = 0;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.endpointUrl);
        v(s.server);
        v(s.serverCertificate);
        v(s.securityMode);
        v(s.securityPolicyUri);
        v(s.userIdentityTokens);
        v(s.transportProfileUri);
        v(s.securityLevel);
    }
};

struct GetEndpointsRequest {
    static constexpr uint16_t kEncodingId = 428;
    RequestHeader header;
    std::string endpointUrl;
    std::vector<std::string> localeIds;
    std::vector<std::string> profileUris;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.endpointUrl);
        v(s.localeIds);
        v(s.profileUris);
    }
};

struct GetEndpointsResponse {
    static constexpr uint16_t kEncodingId = 431;
    ResponseHeader header;
    std::vector<EndpointDescription> endpoints;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.endpoints);
    }
};

struct FindServersRequest {
    static constexpr uint16_t kEncodingId = 422;
    RequestHeader header;
    std::string endpointUrl;
    std::vector<std::string> localeIds;
    std::vector<std::string> serverUris;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.endpointUrl);
        v(s.localeIds);
        v(s.serverUris);
    }
};

struct FindServersResponse {
    static constexpr uint16_t kEncodingId = 425;
    ResponseHeader header;
    std::vector<ApplicationDescription> servers;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.servers);
    }
};

}  // namespace cv::ua
