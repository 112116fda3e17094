#include "opc/CvOpcAutoClient.h"

#include <algorithm>
#include <string>

#include "channel/Channel.h"
#include "opc/ClientErrors.h"
#include "platform/Platform.h"
#include "platform/opc/OpcResult.h"

namespace cv {

using platform::OneBased;

namespace {

std::string SyncReadLabel(int32_t lGroup, size_t lCount) {
    return std::string(lGroup == 2 ? "Group2" : "Group") +
           ".SyncRead , Items=" + std::to_string(lCount);
}

}  // namespace

bool CvOpcAutoClient::ReadAnswer::Covers(int32_t lCount) const {
    return std::min({values.Count(), errors.Count(), qualities.Count(), stamps.Count()}) >= lCount;
}

platform::ValueDetail CvOpcAutoClient::ReadAnswer::Detail(int32_t i) const {
    return i <= details.Count() ? details(i) : platform::ValueDetail{};
}

ErrorInfo CvOpcAutoClient::SingleShotReadGroup(int32_t lGroup) {
    const Watch watch = Watching();
    std::vector<ServedChannels::Entry> targets;
    std::vector<int32_t> handles;
    for (const ServedChannels::Entry& entry : mcChannels.InOrder()) {
        if (entry.group == lGroup) {
            targets.push_back(entry);
            handles.push_back(entry.serverHandle);
        }
    }
    Trace(SyncReadLabel(lGroup, handles.size()));
    ReadAnswer answer;
    if (ErrorInfo error = SyncRead(Group(lGroup), handles, answer, watch)) {
        return error;
    }
    return DeliverRead(targets, lGroup, answer, watch);
}

// A device read of the handles; a server gone meanwhile is told as such.
ErrorInfo CvOpcAutoClient::SyncRead(const GroupPtr& group, const std::vector<int32_t>& handles,
                                    ReadAnswer& answer, const Watch& watch) {
    if (!group) {
        return ClientErrors::NoObject();
    }
    const ErrorInfo call =
        group->SyncRead(platform::OpcDataSource::Device, static_cast<int32_t>(handles.size()),
                        OneBased<int32_t>(handles), answer.values, answer.errors, answer.qualities,
                        answer.stamps, answer.details);
    if (watch.Ended()) {
        return ClientErrors::Disconnected();
    }
    if (call) {
        return call;
    }
    return answer.Covers(static_cast<int32_t>(handles.size())) ? ErrorInfo{}
                                                               : ClientErrors::IncompleteAnswer();
}

// Each value goes to the channel whose item was asked for in its place,
// while that channel is still served: a channel removed meanwhile ends the
// delivery instead of passing its value to another.
ErrorInfo CvOpcAutoClient::DeliverRead(const std::vector<ServedChannels::Entry>& targets,
                                       int32_t lGroup, const ReadAnswer& answer,
                                       const Watch& watch) {
    const auto lCount = static_cast<int32_t>(targets.size());
    for (int32_t i = 1; i <= lCount; ++i) {
        if (answer.errors(i) != 0) {
            return ClientErrors::ItemError(answer.errors(i));
        }
        const int32_t lHandle = targets[static_cast<size_t>(i) - 1].clientHandle;
        Channel* const* cFound = mcChannels.Find(lHandle, lGroup);
        if (cFound == nullptr || *cFound == nullptr) {
            return {};
        }
        (*cFound)->OpcSetRawValue(answer.values(i), answer.qualities(i), answer.stamps(i), true,
                                  answer.Detail(i));
        if (watch.Ended()) {
            return {};
        }
        cFound = mcChannels.Find(lHandle, lGroup);
        if (cFound == nullptr || *cFound == nullptr || !(*cFound)->IsOnline()) {
            return {};
        }
    }
    return {};
}

ErrorInfo CvOpcAutoClient::SingleShotReadOneItem(Channel& cChannel) {
    const Watch watch = Watching();
    const ServedChannels::Entry* found = mcChannels.FindEntry(cChannel);
    if (found == nullptr) {
        return ClientErrors::NotServed();
    }
    const ServedChannels::Entry entry = *found;
    Trace(SyncReadLabel(entry.group, 1));
    ReadAnswer answer;
    if (ErrorInfo error = SyncRead(Group(entry.group), {entry.serverHandle}, answer, watch)) {
        return error;
    }
    if (answer.errors(1) != 0) {
        return ClientErrors::ItemError(answer.errors(1));
    }
    if (Channel* cRead = entry.Get()) {
        cRead->OpcSetRawValue(answer.values(1), answer.qualities(1), answer.stamps(1), true,
                              answer.Detail(1));
    }
    return {};
}

void CvOpcAutoClient::mcOpcGroup1_DataChange(const platform::DataChangeArgs& args) {
    ChannelDataChange(1, args);
}

void CvOpcAutoClient::mcOpcGroup2_DataChange(const platform::DataChangeArgs& args) {
    ChannelDataChange(2, args);
}

// A handle no served channel of the group carries ends the notification; a
// channel destroyed while served is passed over. Only the items that every
// array of the notification covers are delivered.
void CvOpcAutoClient::ChannelDataChange(int32_t lGroup, const platform::DataChangeArgs& args) {
    const Watch watch = Watching();
    const int32_t lCount =
        std::min({args.NumItems, args.ClientHandles.Count(), args.ItemValues.Count(),
                  args.Qualities.Count(), args.TimeStamps.Count()});
    for (int32_t i = 1; i <= lCount; ++i) {
        Channel* const* cFound = mcChannels.Find(args.ClientHandles(i), lGroup);
        if (cFound == nullptr) {
            return;
        }
        if (*cFound == nullptr) {
            continue;
        }
        const platform::ValueDetail detail =
            i <= args.Details.Count() ? args.Details(i) : platform::ValueDetail{};
        (*cFound)->OpcSetRawValue(args.ItemValues(i), args.Qualities(i), args.TimeStamps(i), false,
                                  detail);
        if (watch.Ended()) {
            return;
        }
    }
}

void CvOpcAutoClient::mcOpcServer_ServerShutDown(const std::string&) {
    platform::Dialogs& dialogs = mPlatform.dialogs;
    for (const ServedChannels::Entry& entry : mcChannels.InOrder()) {
        if (Channel* cChannel = entry.Get()) {
            cChannel->OpcServerShutDown();
        }
    }
    // The server's calls fail from now on; the client ends all the same.
    (void)GoOffline();
    dialogs.MsgBox("The OPC Server has been shutdown", MsgBoxStyle::OKOnly, "");
}

}  // namespace cv
