#include "security/CertificateFacts.h"

#include <cstdio>
#include <ctime>

#include "platform/AsciiCase.h"
#include "ua/types/PlainText.h"

namespace cv::security {
namespace {

bool SameHost(const std::string& pattern, const std::string& host) {
    if (EqualsIgnoringCase(pattern, host)) {
        return true;
    }
    if (!pattern.starts_with("*.")) {
        return false;
    }
    const size_t dot = host.find('.');
    return dot != std::string::npos && dot > 0 &&
           EqualsIgnoringCase(pattern.substr(1), host.substr(dot));
}

}  // namespace

std::string ThumbprintText(const ua::crypto::Certificate& certificate) {
    std::string text;
    for (const char byte : certificate.Thumbprint()) {
        char digits[3];
        std::snprintf(digits, sizeof digits, "%02X", static_cast<unsigned char>(byte));
        text += digits;
    }
    return text;
}

std::string TimeText(ua::DateTime time) {
    const std::time_t seconds = static_cast<std::time_t>(
        (time.ticks - ua::DateTime::kUnixEpochTicks) / (ua::DateTime::kTicksPerMillisecond * 1000));
    std::tm parts{};
    gmtime_r(&seconds, &parts);
    char text[32];
    std::strftime(text, sizeof text, "%Y-%m-%d %H:%M:%S UTC", &parts);
    return text;
}

bool NamesHost(const ua::crypto::Certificate& certificate, const std::string& host) {
    for (const std::string& address : certificate.IpAddresses()) {
        if (address == host) {
            return true;
        }
    }
    for (const std::string& name : certificate.DnsNames()) {
        if (SameHost(name, host)) {
            return true;
        }
    }
    return false;
}

platform::CertificateFacts FactsOf(const ua::crypto::Certificate& certificate,
                                   const std::string& host) {
    // The names come from the server: they are shown plain.
    platform::CertificateFacts facts;
    facts.subject = ua::PlainText(certificate.Subject());
    facts.applicationUri = ua::PlainText(certificate.ApplicationUri());
    facts.thumbprint = ThumbprintText(certificate);
    facts.validFrom = TimeText(certificate.NotBefore());
    facts.validTo = TimeText(certificate.NotAfter());
    facts.host = host;
    facts.hostMatches = NamesHost(certificate, host);
    for (const std::string& name : certificate.DnsNames()) {
        facts.hostNames.push_back(ua::PlainText(name));
    }
    for (const std::string& address : certificate.IpAddresses()) {
        facts.hostNames.push_back(address);
    }
    return facts;
}

}  // namespace cv::security
