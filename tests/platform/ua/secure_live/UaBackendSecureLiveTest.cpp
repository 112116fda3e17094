#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "platform/ServerCallWait.h"
#include "platform/fake/RecordingBusyNotice.h"
#include "platform/fake/RecordingCertificateTrust.h"
#include "platform/fake/ScriptedPasswordPrompt.h"
#include "platform/opc/OPCServer.h"
#include "platform/posix/FilePki.h"
#include "platform/posix/FileRegistry.h"
#include "platform/posix/SteadyEventLoop.h"
#include "platform/ua/UaBackend.h"
#include "security/UaSecurity.h"
#include "support/TempFolder.h"
#include "ua/live/PeerSession.h"

namespace cv::uaopc {
namespace {

using platform::TrustAnswer;

// The backend as the program builds it: every connect goes through the run's
// security, against a peer started with --secure that also offers None.
struct SecureBackend {
    explicit SecureBackend(TrustAnswer answer) { question.answer = answer; }

    test::TempFolder folder;
    posix::FileRegistry registry{folder.Path()};
    posix::FilePki pki{folder.Path() + "/pki"};
    fake::RecordingCertificateTrust question;
    fake::ScriptedPasswordPrompt prompt;
    UaOptions options;
    security::UaSecurity security{
        registry,
        pki,
        {options.session.applicationUri, options.session.applicationName, "localhost"},
        &question,
        &prompt};
    posix::SteadyEventLoop events;
    fake::RecordingBusyNotice busy;
    platform::ServerCallWait wait{events, busy};
    UaBackend backend{wait, [this] {
                          UaOptions chosen = options;
                          chosen.security = &security;
                          return chosen;
                      }()};
};

TEST(UaBackendSecureLiveTest, UnknownServerCertificateConnectsOnlyWithTheUsersWord) {
    const std::string url = ua::test::PeerUrl();
    ASSERT_FALSE(url.empty());
    struct Row {
        TrustAnswer answer;
        bool connects;
    };
    const std::vector<Row> rows = {
        {TrustAnswer::Refuse, false},
        {TrustAnswer::TrustForSession, true},
        {TrustAnswer::TrustAlways, true},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(static_cast<int>(row.answer));
        SecureBackend run(row.answer);
        std::unique_ptr<platform::OPCServer> server;
        ASSERT_FALSE(run.backend.CreateServer(server));
        const ErrorInfo connected = server->Connect(url, "");
        EXPECT_EQ(!connected, row.connects) << connected.Description;
        ASSERT_EQ(run.question.questions.size(), 1u);
        EXPECT_EQ(run.question.questions[0].endpointUrl, url);
        if (row.connects) {
            std::shared_ptr<platform::OPCGroup> group;
            EXPECT_FALSE(server->OPCGroups().Add("Secured", group));
            EXPECT_FALSE(server->Disconnect());
        }
    }
}

}  // namespace
}  // namespace cv::uaopc
