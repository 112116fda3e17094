#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "channel/Channel.h"
#include "opc/CvOpcAutoClient.h"
#include "platform/fake/ScriptedOpc.h"
#include "platform/opc/OpcResult.h"
#include "support/TestPlatform.h"

namespace cv::test {

using namespace platform::OpcResult;
using platform::DataChangeArgs;
using platform::Hresult;
using platform::OneBased;

inline constexpr const char* kPlant = "Sim.Plant.1";
inline constexpr int32_t kGood = 0xC0;

// A client of the built-in plant on the virtual clock, the OPC channels it
// serves, and a second platform whose OPC servers are scripted.
struct OpcClientTest : ::testing::Test {
    TestPlatform tp;
    fake::ScriptedOpc script;
    Platform scripted{tp.dialogs,
                      tp.locale,
                      tp.program,
                      tp.help,
                      tp.computer,
                      tp.events,
                      tp.registry,
                      tp.profiles,
                      tp.run,
                      script,
                      tp.serverCalls,
                      tp.trace,
                      tp.plant.NetEnum(),
                      tp.plant.DdeServers(),
                      tp.modeless};
    std::vector<std::unique_ptr<Channel>> channels;

    // An OPC channel waiting for its first value; specific type 13 belongs
    // to group 2.
    Channel& NewChannel(const std::string& item, int32_t specificType = 0,
                        const std::string& path = "") {
        auto channel = std::make_unique<Channel>(tp.platform);
        channel->SetComType(ComTypeCode::Opc);
        channel->SetItemName(item);
        channel->SetOpcAccessPath(path);
        channel->SetSpecificChannelType(specificType);
        channel->SetExpectANumber(false);
        channel->MarkGoingOnline();
        channels.push_back(std::move(channel));
        return *channels.back();
    }

    // A client connected to the plant's full server.
    std::unique_ptr<CvOpcAutoClient> Connected(Platform& platform) {
        auto client = std::make_unique<CvOpcAutoClient>(platform);
        EXPECT_FALSE(client->CreateServerAndGroup(kPlant, ""));
        return client;
    }

    // The trace labels written since the last call.
    std::vector<std::string> Trace() {
        std::vector<std::string> labels;
        for (const auto& entry : tp.trace.Entries()) {
            labels.push_back(entry.label);
        }
        tp.trace.Clear();
        return labels;
    }

    // A notification with these handles; each value is its handle * 10.
    static DataChangeArgs Notification(const std::vector<int32_t>& handles) {
        DataChangeArgs args;
        args.NumItems = static_cast<int32_t>(handles.size());
        for (const int32_t handle : handles) {
            args.ClientHandles.Add(handle);
            args.ItemValues.Add(Variant::I4(handle * 10));
            args.Qualities.Add(kGood);
            args.TimeStamps.Add(TestPlatform::kStartDate);
        }
        return args;
    }

    // Each channel's value as a number; -1 when it has none.
    std::vector<int32_t> Values() {
        std::vector<int32_t> values;
        for (const auto& channel : channels) {
            values.push_back(channel && channel->IsOnline() ? channel->RawValue().AsI4() : -1);
        }
        return values;
    }
};

}  // namespace cv::test
