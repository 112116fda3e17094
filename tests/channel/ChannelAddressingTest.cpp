#include <gtest/gtest.h>

#include "channel/Channel.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

TEST(ChannelAddressing, NodeServerAppAndTopicSplitAndJoin) {
    test::TestPlatform tp;
    Channel channel(tp.platform);
    channel.SetOpcNodeAndServer("\\\\\\N1\\Srv.1");
    EXPECT_EQ(channel.OpcComputer(), "N1");
    EXPECT_EQ(channel.OpcServerID(), "Srv.1");
    EXPECT_EQ(channel.OpcNodeAndServer(), "\\\\N1\\Srv.1");
    channel.SetOpcNodeAndServer("\\\\N1\\A\\B");  // splits at the first backslash
    EXPECT_EQ(channel.OpcServerID(), "A\\B");
    channel.SetOpcNodeAndServer("Srv.2");
    EXPECT_EQ(channel.OpcComputer(), "");
    EXPECT_EQ(channel.OpcNodeAndServer(), "Srv.2");
    channel.SetOpcNodeAndServer("\\\\");
    EXPECT_EQ(channel.OpcServerID(), "");

    channel.SetDdeAppTopic("  Excel|Sheet1 ");
    EXPECT_EQ(channel.DdeApplication(), "Excel");
    EXPECT_EQ(channel.DdeAppTopic(), "Excel|Sheet1");
    channel.SetOpcAccessPath("Path");  // shares the topic
    EXPECT_EQ(channel.TopicName(), "Path");
    channel.SetDdeAppTopic(channel.DdeApplication());
    EXPECT_EQ(channel.DdeAppTopic(), "Excel|");
    channel.SetDdeAppTopic("");
    EXPECT_EQ(channel.DdeAppTopic(), "|");
}

}  // namespace
}  // namespace cv
