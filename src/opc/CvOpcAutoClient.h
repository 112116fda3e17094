#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "document/TunerType.h"
#include "opc/ServedChannels.h"
#include "platform/ErrorInfo.h"
#include "platform/Variant.h"
#include "platform/opc/OPCGroup.h"
#include "platform/opc/OPCServer.h"

namespace cv {

class Channel;
struct Platform;

// One connection to one OPC server on one computer, with its two groups and
// the channels whose items it serves. Group 1, the main group, sends change
// notifications once advised; group 2, the extra group, holds the items of
// channels of specific type 13 and is read only on request. Groups are named
// after the tuner kind ("Corvalent", "Corvalent2").
//
// Results are ErrorInfo: number 0 for success, else an HRESULT of the
// server or the client's own CannotCreateServer / CannotSubscribe. Every
// call on the server objects is first written to the platform's trace.
//
// Calls into the server let events run while they wait, so notifications,
// the server's shutdown and user actions may reach this client (and even
// destroy it) meanwhile. A member that resumes after such a wait finds out
// whether its client went offline or away, and then touches nothing of it
// and answers RPC_E_DISCONNECTED.
class CvOpcAutoClient {
  public:
    explicit CvOpcAutoClient(Platform& platform);
    // Goes offline: nothing handed to the server can call back any more.
    ~CvOpcAutoClient();
    CvOpcAutoClient(const CvOpcAutoClient&) = delete;
    CvOpcAutoClient& operator=(const CvOpcAutoClient&) = delete;

    // True while the client holds a server: from CreateServerAndGroup until
    // it goes offline (which its server's shutdown makes it do).
    bool IsConnected() const { return mcOpcServer != nullptr; }
    // The server's ID and computer; empty without a server.
    std::string ServerID() const;
    std::string ServerNode() const;
    // Which kind of server it talks to ("OPC UA", "simulated plant"); empty
    // without a server.
    std::string BackendName() const { return mcOpcServer ? mcOpcServer->BackendName() : ""; }
    // Group 2 for 2, else group 1.
    ErrorInfo UpdateRate(int32_t lGroup, int32_t lRate);
    // Group 1: active or not. Group 2: subscribed or not (and inactive).
    // A failure is not reported.
    void Advise(int32_t lGroup, bool bValue);
    // The busy notice for calls into this server (application-wide).
    void PriorToConnect(const std::string& sServerID, const std::string& sComputer);
    // Connects (sComputer empty for this computer) and adds group 1,
    // inactive and subscribed. Call once; a second call ends the first
    // connection.
    ErrorInfo CreateServerAndGroup(const std::string& sServerID, const std::string& sComputer);
    ErrorInfo AddExtraGroup();
    // Removes group 2 and its items, and stops serving its channels. Steps
    // that fail are not reported.
    void RemoveExtraGroup();
    // Adds the channel's item to its group (made inactive until advised
    // again) and serves the channel: sets its OpcServerHandle, OpcItem and
    // OpcClient. A refused item leaves the channel out.
    ErrorInfo AddChannel(Channel& cChannel);
    // Removes the items and groups, takes every channel offline and
    // disconnects. Everything ends even when the server's calls fail (a
    // server that shut down); the first failure is answered.
    ErrorInfo GoOffline();

    // One read from the device of every channel of the group (in the order
    // added), or of one channel. Values go to the channels as one-shot
    // values; a group read stops at the first item error (answered) or
    // after the first channel that is not online once it has its value.
    ErrorInfo SingleShotReadGroup(int32_t lGroup);
    ErrorInfo SingleShotReadOneItem(Channel& cChannel);
    // The server's own text for a code it gave (GetErrorString).
    ErrorInfo ServerErrorString(int32_t lCode, std::string& sText);
    // Writes sValue to the channel's item, converted to the item's type.
    // Answers the server's message for an item error (error then stays as
    // any one-shot read before the write left it), or an empty text with
    // error set when a call failed. error starts at 0.
    std::string SendValue(Channel& cChannel, const std::string& sValue, ErrorInfo& error);

    // The groups' DataChange: each value goes to the channel of its client
    // handle; a handle of no channel of the group ends the notification.
    void mcOpcGroup1_DataChange(const platform::DataChangeArgs& args);
    void mcOpcGroup2_DataChange(const platform::DataChangeArgs& args);
    // The server's shutdown: goes offline and says so once; the channels it
    // served learn why they are offline (Channel::ServerShutDown).
    void mcOpcServer_ServerShutDown(const std::string& sReason);

    // The channels served, in the order added.
    const ServedChannels& Channels() const { return mcChannels; }

  private:
    using GroupPtr = std::shared_ptr<platform::OPCGroup>;

    // Shared with the members that wait: destruction clears alive, and each
    // GoOffline starts a new connection number.
    struct Life {
        bool alive = true;
        uint64_t connection = 0;
    };
    // Whether the client a member serves went away or offline since the
    // member began.
    class Watch {
      public:
        explicit Watch(const std::shared_ptr<Life>& life)
            : life_(life), connection_(life->connection) {}
        bool Ended() const { return !life_->alive || life_->connection != connection_; }

      private:
        std::shared_ptr<Life> life_;
        uint64_t connection_;
    };

    // What GoOffline takes from the client before it waits on the server.
    struct Connection {
        std::shared_ptr<platform::OPCServer> server;
        GroupPtr group1;
        GroupPtr group2;
        std::vector<ServedChannels::Entry> channels;
    };

    // These touch only what they are given, so a client destroyed while
    // they wait leaves them nothing to trip over.
    static void Trace(Platform& platform, std::string sLabel);
    static void AdviseGroup(Platform& platform, GroupPtr group, int32_t lGroup, bool bValue);
    static void RemoveGroupItems(Platform& platform, GroupPtr group, int32_t lGroup,
                                 const std::vector<int32_t>& handles);
    static ErrorInfo EndConnection(Platform& platform, Connection gone);

    void Trace(std::string sLabel) const { Trace(mPlatform, std::move(sLabel)); }
    Watch Watching() const { return Watch(mpLife); }
    GroupPtr Group(int32_t lGroup) const { return lGroup == 2 ? mcOpcGroup2 : mcOpcGroup1; }
    std::string GroupName(int32_t lGroup) const;
    std::string ClientName() const;
    ErrorInfo Connect(const std::string& sServerID, const std::string& sComputer);
    ErrorInfo AddGroup(int32_t lGroup);
    void Unlink(const ServedChannels::Entry& entry);

    // AddChannel's steps (CvOpcAutoClient_items.cpp).
    struct ItemAddress {
        std::string itemId;
        std::string accessPath;
    };
    ErrorInfo PrepareGroup(int32_t lGroup, GroupPtr& group, const Watch& watch);
    ErrorInfo AddItem(const GroupPtr& group, const ItemAddress& address, int32_t lClientHandle,
                      int32_t& lServerHandle, int32_t& lItemError, const Watch& watch);
    ErrorInfo ActivateItem(const GroupPtr& group, int32_t lServerHandle, bool bActive,
                           const ItemAddress& address, std::shared_ptr<platform::OPCItem>& cItem,
                           const Watch& watch);
    bool SharesItemWithServed(const ItemAddress& address) const;
    void DropItem(const GroupPtr& group, int32_t lServerHandle);

    // Reads, writes and notifications (CvOpcAutoClient_data.cpp, _write.cpp).
    void ChannelDataChange(int32_t lGroup, const platform::DataChangeArgs& args);
    // What a SyncRead answers.
    struct ReadAnswer {
        platform::OneBased<Variant> values;
        platform::OneBased<int32_t> errors;
        platform::OneBased<int32_t> qualities;
        platform::OneBased<double> stamps;
        platform::OneBased<platform::ValueDetail> details;
        // Every array but the details (which a server may leave out) holds
        // lCount entries.
        bool Covers(int32_t lCount) const;
        platform::ValueDetail Detail(int32_t i) const;
    };
    ErrorInfo SyncRead(const GroupPtr& group, const std::vector<int32_t>& handles,
                       ReadAnswer& answer, const Watch& watch);
    ErrorInfo DeliverRead(const std::vector<ServedChannels::Entry>& targets, int32_t lGroup,
                          const ReadAnswer& answer, const Watch& watch);
    int16_t KnownItemType(const Channel& cChannel) const;
    Variant ValueToWrite(const std::string& sValue, int16_t iVarType) const;
    std::string ServerMessage(int32_t lItemError, ErrorInfo& error, const Watch& watch);

    Platform& mPlatform;
    TunerType mcTunerType;
    std::shared_ptr<platform::OPCServer> mcOpcServer;
    GroupPtr mcOpcGroup1;
    GroupPtr mcOpcGroup2;
    ServedChannels mcChannels;
    std::shared_ptr<Life> mpLife = std::make_shared<Life>();
};

}  // namespace cv
