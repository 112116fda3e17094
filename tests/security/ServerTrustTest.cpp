#include <openssl/x509.h>

#include <gtest/gtest.h>

#include <filesystem>

#include "platform/posix/FilePki.h"
#include "security/CertificateFacts.h"
#include "security/ServerTrust.h"
#include "support/TempFolder.h"
#include "ua/support/TestCredentials.h"
#include "ua/types/PlainText.h"

namespace cv::security {
namespace {

using platform::CertificateProblem;
using Problems = std::vector<CertificateProblem>;
using ua::test::MakeCredentials;
using ua::test::Resigned;

constexpr int64_t kDayTicks = 86'400'000LL * ua::DateTime::kTicksPerMillisecond;
const std::string kUrl = "opc.tcp://plant-pc:4840/UA";

ua::crypto::Credentials Dated(const std::string& name, int fromDays, int toDays) {
    ua::crypto::CertificateRequest request;
    request.applicationUri = "urn:test:" + name;
    request.applicationName = name;
    request.hostName = "plant-pc";
    request.notBefore = {ua::DateTime::Now().ticks + fromDays * kDayTicks};
    request.notAfter = {ua::DateTime::Now().ticks + toDays * kDayTicks};
    return ua::crypto::CreateSelfSigned(request).Value();
}

class ServerTrustTest : public ::testing::Test {
  protected:
    Problems ProblemsOf(const ua::crypto::Certificate& certificate,
                        const std::string& url = kUrl) const {
        return trust_.Examine(certificate, url, ua::DateTime::Now()).problems;
    }
    size_t FilesIn(const char* folder) const {
        std::error_code ec;
        const auto it = std::filesystem::directory_iterator(folder_.Path() + "/pki/" + folder, ec);
        return ec ? 0 : static_cast<size_t>(std::distance(it, {}));
    }

    test::TempFolder folder_;
    posix::FilePki pki_{folder_.Path() + "/pki"};
    ServerTrust trust_{pki_};
    const ua::crypto::Credentials server_ = MakeCredentials("Plant Server", 2048, "plant-pc");
};

TEST_F(ServerTrustTest, AnUnknownCertificateNeedsTheUsersWord) {
    EXPECT_EQ(ProblemsOf(server_.certificate), Problems{CertificateProblem::Untrusted});
    trust_.TrustForSession(server_.certificate);
    EXPECT_TRUE(ProblemsOf(server_.certificate).empty());
    ServerTrust nextRun(pki_);
    EXPECT_EQ(nextRun.Examine(server_.certificate, kUrl, ua::DateTime::Now()).problems,
              Problems{CertificateProblem::Untrusted})
        << "trust for the session is not stored";
}

TEST_F(ServerTrustTest, TrustingAlwaysStoresItAndRejectingMovesIt) {
    ASSERT_FALSE(trust_.TrustAlways(server_.certificate));
    EXPECT_EQ(FilesIn("trusted/certs"), 1u);
    EXPECT_TRUE(std::filesystem::exists(folder_.Path() + "/pki/trusted/certs/" +
                                        ServerTrust::FileName(server_.certificate)));
    EXPECT_TRUE(
        ServerTrust(pki_).Examine(server_.certificate, kUrl, ua::DateTime::Now()).problems.empty());
    ASSERT_FALSE(trust_.Reject(server_.certificate));
    EXPECT_EQ(FilesIn("trusted/certs"), 0u);
    EXPECT_EQ(FilesIn("rejected/certs"), 1u);
    EXPECT_EQ(ProblemsOf(server_.certificate), Problems{CertificateProblem::Rejected});
    ASSERT_FALSE(trust_.TrustAlways(server_.certificate));
    EXPECT_EQ(FilesIn("rejected/certs"), 0u);
    EXPECT_TRUE(ProblemsOf(server_.certificate).empty());
}

// The certificate with another common name, of any length and any bytes
// (as a hostile server may send it), signed again with its own key.
ua::crypto::Certificate WithCommonName(const ua::crypto::Credentials& made,
                                       const std::string& commonName) {
    X509* x509 = X509_dup(made.certificate.Get());
    X509_NAME* name = X509_NAME_new();
    X509_NAME_add_entry_by_NID(name, NID_commonName, V_ASN1_UTF8STRING,
                               reinterpret_cast<const unsigned char*>(commonName.data()),
                               static_cast<int>(commonName.size()), -1, 0);
    X509_set_subject_name(x509, name);
    X509_set_issuer_name(x509, name);
    X509_NAME_free(name);
    X509_sign(x509, made.key.Get(), EVP_sha256());
    unsigned char* der = nullptr;
    const int size = i2d_X509(x509, &der);
    const std::string bytes(reinterpret_cast<char*>(der), static_cast<size_t>(size));
    OPENSSL_free(der);
    X509_free(x509);
    return ua::crypto::Certificate::FromDer(bytes).Value();
}

TEST_F(ServerTrustTest, EveryCommonNameGivesAFileTheStoreFindsAgain) {
    std::string accents = "x";
    for (int i = 0; i < 200; ++i) {
        accents += "\xc3\xa9";
    }
    const std::vector<std::pair<const char*, std::string>> names = {
        {"hidden", ".Plant Server"},
        {"parent folder", ".."},
        {"climbing out", "../../evil"},
        {"long", std::string(300, 'x')},
        {"long, cut inside a character", accents},
        {"controls and separators", "Plant\x1b[2J\nServer\\a/b"},
    };
    for (const auto& [what, commonName] : names) {
        SCOPED_TRACE(what);
        const ua::crypto::Certificate certificate = WithCommonName(server_, commonName);
        ASSERT_EQ(certificate.CommonName(), commonName);
        const std::string file = ServerTrust::FileName(certificate);
        EXPECT_FALSE(file.starts_with('.')) << file;
        EXPECT_LE(file.size(), 120u) << file;
        EXPECT_EQ(file.find_first_of("/\\"), std::string::npos) << file;
        EXPECT_EQ(ua::PlainText(file), file) << "controls or a character cut in two";
        ASSERT_FALSE(trust_.TrustAlways(certificate));
        EXPECT_TRUE(
            ServerTrust(pki_).Examine(certificate, kUrl, ua::DateTime::Now()).problems.empty())
            << "trusted always, yet asked again: " << file;
        ASSERT_FALSE(trust_.Reject(certificate));
        EXPECT_EQ(ServerTrust(pki_).Examine(certificate, kUrl, ua::DateTime::Now()).problems,
                  Problems{CertificateProblem::Rejected})
            << "rejected, yet not remembered: " << file;
    }
    EXPECT_EQ(FilesIn("trusted/certs"), 0u);
    EXPECT_EQ(FilesIn("rejected/certs"), names.size());
}

TEST_F(ServerTrustTest, FindsEachProblemOfATrustedCertificate) {
    const ua::crypto::Credentials expired = Dated("Old Server", -60, -1);
    const ua::crypto::Credentials future = Dated("New Server", 1, 60);
    const ua::crypto::Credentials authority = Resigned(MakeCredentials("Plant CA"), {}, true);
    const ua::crypto::Credentials issued =
        Resigned(MakeCredentials("Issued Server", 2048, "plant-pc"), authority, false);
    std::string broken = server_.certificate.Der();
    broken[broken.size() - 5] ^= 1;
    for (const auto* trusted : {&expired, &future, &server_}) {
        ASSERT_FALSE(pki_.Write(platform::PkiFolder::Trusted,
                                ServerTrust::FileName(trusted->certificate),
                                trusted->certificate.Der()));
    }
    ASSERT_FALSE(pki_.Write(platform::PkiFolder::Issuers, "ca.der", authority.certificate.Der()));
    const struct {
        const char* name;
        ua::crypto::Certificate certificate;
        std::string url;
        Problems problems;
    } cases[] = {
        {"trusted and right", server_.certificate, kUrl, {}},
        {"host differs in case only", server_.certificate, "opc.tcp://PLANT-PC:4840", {}},
        {"another host",
         server_.certificate,
         "opc.tcp://10.0.0.7:4840",
         {CertificateProblem::HostMismatch}},
        {"expired", expired.certificate, kUrl, {CertificateProblem::Expired}},
        {"not yet valid", future.certificate, kUrl, {CertificateProblem::NotYetValid}},
        {"issuer only helps", issued.certificate, kUrl, {CertificateProblem::Untrusted}},
        {"broken signature",
         ua::crypto::Certificate::FromDer(broken).Value(),
         kUrl,
         {CertificateProblem::Invalid}},
    };
    for (const auto& c : cases) {
        EXPECT_EQ(ProblemsOf(c.certificate, c.url), c.problems) << c.name;
    }
    ASSERT_FALSE(pki_.Write(platform::PkiFolder::Trusted, "ca.der", authority.certificate.Der()));
    EXPECT_TRUE(ProblemsOf(issued.certificate).empty()) << "issued by a trusted authority";
}

TEST_F(ServerTrustTest, TellsTheUserWhoTheServerIsAndWhatToCheck) {
    const ua::crypto::Credentials expired = Dated("Old Server", -60, -1);
    const platform::TrustQuestion question =
        trust_.Examine(expired.certificate, "opc.tcp://10.0.0.7:4840", ua::DateTime::Now());
    EXPECT_EQ(question.facts.subject, "DC=plant-pc,CN=Old Server");
    EXPECT_EQ(question.facts.applicationUri, "urn:test:Old Server");
    EXPECT_EQ(question.facts.thumbprint, ThumbprintText(expired.certificate));
    EXPECT_EQ(question.facts.thumbprint.size(), 40u);
    EXPECT_EQ(question.facts.host, "10.0.0.7");
    EXPECT_FALSE(question.facts.hostMatches);
    EXPECT_EQ(question.facts.hostNames, std::vector<std::string>{"plant-pc"});
    EXPECT_EQ(question.facts.validTo, TimeText(expired.certificate.NotAfter()));
    const std::string rejected = folder_.Path() + "/pki/rejected/certs/";
    EXPECT_EQ(question.diagnosis,
              "The certificate of the server at \"opc.tcp://10.0.0.7:4840\" needs your decision "
              "before the program connects.\r\n\r\n"
              "1. It is not trusted yet. Check that this is the server you meant: "
              "\"DC=plant-pc,CN=Old Server\", application \"urn:test:Old Server\", thumbprint " +
                  question.facts.thumbprint +
                  ".\r\n"
                  "2. It expired on " +
                  question.facts.validTo +
                  ". Check the clocks of this computer and of the server, or ask the server's "
                  "administrator for a new certificate.\r\n"
                  "3. It does not name the host \"10.0.0.7\"; it names \"plant-pc\". Check the "
                  "server address, or connect by a name the certificate lists.");
}

TEST(CertificateFacts, MatchesHostsAsCertificatesNameThem) {
    const ua::crypto::Credentials byAddress = MakeCredentials("a", 2048, "192.168.1.5");
    const ua::crypto::Credentials byName = MakeCredentials("b", 2048, "*.plant.example");
    const struct {
        const ua::crypto::Credentials& credentials;
        std::string host;
        bool named;
    } cases[] = {
        {byAddress, "192.168.1.5", true},    {byAddress, "192.168.1.50", false},
        {byName, "pc1.plant.example", true}, {byName, "PC1.Plant.Example", true},
        {byName, "plant.example", false},    {byName, "a.pc1.plant.example", false},
    };
    for (const auto& c : cases) {
        EXPECT_EQ(NamesHost(c.credentials.certificate, c.host), c.named) << c.host;
    }
    EXPECT_EQ(TimeText(ua::DateTime::FromUnixMilliseconds(1'704'175'200'000)),
              "2024-01-02 06:00:00 UTC");
}

}  // namespace
}  // namespace cv::security
