#include <QtTest>

#include "support/TestPlatform.h"
#include "ui/widgets/HelpTopics.h"

class HelpTopicsTest : public QObject {
    Q_OBJECT

  private slots:
    void putsTheHelpFileInTheProgramFolderOrSaysWhyNot() {
        cv::test::TestPlatform t;
        t.run.HelpFile = "CvOpcTestClient.hlp";
        cv::SetHelpPath(t.platform);
        QCOMPARE(t.run.HelpFile, std::string("/opt/cvopctestclient/CvOpcTestClient.hlp"));
        t.run.HelpFile = "x.hlp";
        t.program.folder = "C:\\prog\\";
        cv::SetHelpPath(t.platform);
        QCOMPARE(t.run.HelpFile, std::string("C:\\prog\\x.hlp"));
        QVERIFY(t.dialogs.Messages().empty());

        t.run.HelpFile += ">StepsSub";
        cv::ShowHelpTopic(t.platform, 409);
        QCOMPARE(t.help.requests.size(), size_t{1});
        QCOMPARE(t.help.requests[0].file, std::string("C:\\prog\\x.hlp>StepsSub"));
        QCOMPARE(t.help.requests[0].context, 409);

        // Without a program folder the path cannot be set, and the user is told.
        t.run.HelpFile = "CvOpcTestClient.hlp";
        t.program.folder = "";
        cv::SetHelpPath(t.platform);
        QCOMPARE(t.dialogs.Messages().size(), size_t{1});
        QCOMPARE(t.dialogs.Last().text,
                 std::string("Error setting help path: The program's folder is unknown."));
        QCOMPARE(t.dialogs.Last().style, cv::MsgBoxStyle::OKOnly);
        QCOMPARE(t.run.HelpFile, std::string("CvOpcTestClient.hlp"));
    }
};

QTEST_MAIN(HelpTopicsTest)
#include "HelpTopicsTest.moc"
