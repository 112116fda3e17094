#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "platform/ServerCallWait.h"
#include "platform/fake/RecordingBusyNotice.h"
#include "platform/fake/VirtualEventLoop.h"
#include "platform/opc/OPCServer.h"
#include "platform/opc/OpcResult.h"
#include "platform/sim/PlantLoader.h"
#include "platform/sim/SimulatedPlant.h"

namespace cv::sim::test {

using namespace platform::OpcResult;
using platform::DataChangeArgs;
using platform::OneBased;
using platform::OPCGroup;
using platform::OPCServer;
using platform::ValueDetail;

// 2025-01-01 00:00 local time: the plant's clock starts here in tests.
inline constexpr double kStartDate = 45658.0;

// The built-in plant on a virtual clock, and short ways to use it.
struct SimFixture : ::testing::Test {
    fake::VirtualEventLoop events;
    fake::RecordingBusyNotice notice;
    platform::ServerCallWait wait{events, notice};
    SimulatedPlant plant{BuiltInPlant(), wait, PlantOptions{"MYPC", kStartDate}};

    std::unique_ptr<OPCServer> NewServer() {
        std::unique_ptr<OPCServer> server;
        EXPECT_FALSE(plant.CreateServer(server));
        return server;
    }

    std::unique_ptr<OPCServer> Connected(const std::string& id, const std::string& node = "") {
        auto server = NewServer();
        EXPECT_FALSE(server->Connect(id, node)) << id << " on " << node;
        return server;
    }

    static std::shared_ptr<OPCGroup> AddGroup(OPCServer& server, const std::string& name = "G") {
        std::shared_ptr<OPCGroup> group;
        EXPECT_FALSE(server.OPCGroups().Add(name, group));
        return group;
    }

    // Adds one item; answers its server handle (1 and up) or the item's
    // error (an HRESULT, below 0).
    static int32_t AddItem(OPCGroup& group, const std::string& itemId, int32_t clientHandle = 1,
                           const std::string& path = "") {
        OneBased<int32_t> handles;
        OneBased<int32_t> errors;
        const ErrorInfo call = group.OPCItems().AddItems(
            1, OneBased<std::string>({itemId}), OneBased<int32_t>{clientHandle},
            OneBased<std::string>({path}), handles, errors);
        EXPECT_FALSE(call);
        return errors(1) != 0 ? errors(1) : handles(1);
    }

    struct Read {
        ErrorInfo call;
        Variant value;
        int32_t error = 0;
        int32_t quality = 0;
        double stamp = 0.0;
    };

    static Read ReadOne(OPCGroup& group, int32_t handle, int16_t source = 2) {
        OneBased<Variant> values;
        OneBased<int32_t> errors;
        OneBased<int32_t> qualities;
        OneBased<double> stamps;
        OneBased<ValueDetail> details;
        Read read;
        read.call = group.SyncRead(source, 1, OneBased<int32_t>{handle}, values, errors, qualities,
                                   stamps, details);
        if (!read.call) {
            EXPECT_EQ(details.Count(), 0) << "a Data Access server tells no more";
            read = {{}, values(1), errors(1), qualities(1), stamps(1)};
        }
        return read;
    }

    static int32_t WriteOne(OPCGroup& group, int32_t handle, const Variant& value) {
        OneBased<int32_t> errors;
        const ErrorInfo call =
            group.SyncWrite(1, OneBased<int32_t>{handle}, OneBased<Variant>({value}), errors);
        return call ? call.Number : errors(1);
    }
};

// Every notification a group sent, with the virtual time it came at.
struct Notifications {
    struct Entry {
        uint32_t atMs;
        DataChangeArgs args;
    };
    std::vector<Entry> entries;

    void Listen(OPCGroup& group, const platform::EventLoop& events) {
        group.SetDataChangeHandler([this, &events](const DataChangeArgs& args) {
            entries.push_back({events.TimeGetTime(), args});
        });
    }
    size_t Count() const { return entries.size(); }
    // The client handles of the notification at index.
    std::vector<int32_t> Handles(size_t index) const {
        return entries.at(index).args.ClientHandles.Values();
    }
};

}  // namespace cv::sim::test
