// Feeds arbitrary bytes to the plant loader. A text it refuses must come
// with a message that names the source and a line; a plant it takes must
// run: the first servers of this computer are connected, their first items
// added, watched and read for a few virtual seconds.

#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

#include "platform/ServerCallWait.h"
#include "platform/fake/RecordingBusyNotice.h"
#include "platform/fake/VirtualEventLoop.h"
#include "platform/sim/PlantLoader.h"
#include "platform/sim/SimulatedPlant.h"

namespace {

using namespace cv;
using platform::OneBased;
using platform::ValueDetail;

void Check(bool bCondition) {
    if (!bCondition) {
        std::abort();
    }
}

void Exercise(sim::SimulatedPlant& plant, fake::VirtualEventLoop& events,
              const sim::ServerSpec& server) {
    std::unique_ptr<platform::OPCServer> client;
    Check(!plant.CreateServer(client));
    if (client->Connect(server.id, "")) {
        return;
    }
    // A server may shut down or time out at any call: that ends the run.
    std::shared_ptr<platform::OPCGroup> group;
    if (client->OPCGroups().Add("fuzz", group)) {
        return;
    }
    int32_t count = 0;
    OneBased<std::string> ids;
    OneBased<int32_t> handles;
    for (const sim::ItemSpec& item : server.items) {
        if (++count > 16) {
            break;
        }
        ids.Add(item.itemId);
        handles.Add(count);
    }
    if (ids.Count() == 0) {
        return;
    }
    OneBased<int32_t> serverHandles;
    OneBased<int32_t> errors;
    if (group->OPCItems().AddItems(ids.Count(), ids, handles, OneBased<std::string>(),
                                   serverHandles, errors)) {
        return;
    }
    Check(serverHandles.Count() == ids.Count() && errors.Count() == ids.Count());
    group->SetDataChangeHandler([](const platform::DataChangeArgs& args) {
        Check(args.NumItems > 0 && args.NumItems == args.ItemValues.Count() &&
              args.NumItems == args.Qualities.Count() && args.NumItems == args.TimeStamps.Count());
    });
    if (group->SetUpdateRate(100) || group->SetIsSubscribed(true)) {
        return;
    }
    events.Advance(3000);
    OneBased<Variant> values;
    OneBased<int32_t> qualities;
    OneBased<double> stamps;
    OneBased<ValueDetail> details;
    if (!group->SyncRead(2, serverHandles.Count(), serverHandles, values, errors, qualities, stamps,
                         details)) {
        Check(values.Count() == serverHandles.Count());
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::string_view text(reinterpret_cast<const char*>(data), size);
    sim::PlantPtr description;
    const ErrorInfo error = sim::ParsePlant(text, "fuzz.json", description);
    if (error) {
        Check(error.Description.rfind("fuzz.json, line ", 0) == 0);
        return 0;
    }
    fake::VirtualEventLoop events;
    fake::RecordingBusyNotice notice;
    platform::ServerCallWait wait(events, notice);
    wait.SetCallLimit(1000);
    sim::SimulatedPlant plant(description, wait, sim::PlantOptions{"FUZZ", 45000.0});
    const auto& servers = description->LocalComputer()->servers;
    for (size_t i = 0; i < servers.size() && i < 4; ++i) {
        Exercise(plant, events, *description->FindServer(servers[i]));
    }
    return 0;
}
