#include "security/ServerSettings.h"

#include <array>
#include <utility>

#include "stores/RegClass.h"

namespace cv::security {
namespace {

constexpr const char* kServersKey = "Software\\Corvalent\\TestClient\\UaServers\\";

constexpr std::array kModes = {
    std::pair{ua::MessageSecurityMode::Invalid, "Best"},
    std::pair{ua::MessageSecurityMode::None, "None"},
    std::pair{ua::MessageSecurityMode::Sign, "Sign"},
    std::pair{ua::MessageSecurityMode::SignAndEncrypt, "SignAndEncrypt"},
};
constexpr std::array kIdentities = {
    std::pair{ua::UserTokenType::Anonymous, "Anonymous"},
    std::pair{ua::UserTokenType::UserName, "UserName"},
};

template <class Table>
auto FromText(const Table& table, const std::string& text) {
    for (const auto& [value, name] : table) {
        if (text == name) {
            return value;
        }
    }
    return table.front().first;
}

template <class Table, class Value>
std::string ToText(const Table& table, Value value) {
    for (const auto& [known, name] : table) {
        if (known == value) {
            return name;
        }
    }
    return table.front().second;
}

}  // namespace

ServerSettings::ServerSettings(platform::RegistryApi& registry) : registry_(registry) {}

std::string ServerSettings::KeyOf(const std::string& endpointUrl) {
    std::string key = kServersKey;
    for (const char c : endpointUrl) {
        key += c == '\\' ? "%5C" : c == '%' ? "%25" : std::string(1, c);
    }
    return key;
}

ServerSecurity ServerSettings::Read(const std::string& endpointUrl) {
    RegClass registry(registry_);
    registry.SetMainKey(platform::kHkeyCurrentUser);
    const std::string key = KeyOf(endpointUrl);
    ServerSecurity security;
    security.mode = FromText(kModes, registry.ReadString(key, "SecurityMode", "Best"));
    security.policyUri = registry.ReadString(key, "SecurityPolicy", "");
    security.identity = FromText(kIdentities, registry.ReadString(key, "Identity", "Anonymous"));
    security.userName = registry.ReadString(key, "UserName", "");
    if (run_.mode) {
        security.mode = *run_.mode;
        security.policyUri = run_.policyUri;
    }
    if (!run_.userName.empty()) {
        security.identity = ua::UserTokenType::UserName;
        security.userName = run_.userName;
    }
    return security;
}

void ServerSettings::Write(const std::string& endpointUrl, const ServerSecurity& security) {
    RegClass registry(registry_);
    registry.SetMainKey(platform::kHkeyCurrentUser);
    const std::string key = KeyOf(endpointUrl);
    registry.WriteString(key, "SecurityMode", ToText(kModes, security.mode));
    registry.WriteString(key, "SecurityPolicy", security.policyUri);
    registry.WriteString(key, "Identity", ToText(kIdentities, security.identity));
    registry.WriteString(key, "UserName", security.userName);
}

}  // namespace cv::security
