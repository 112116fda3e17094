#pragma once

#include <cstdint>
#include <memory>
#include <vector>

namespace cv {

class Channel;

// The channels an OPC client serves, in the order they were added, and the
// client handles that their items carry on the server.
//
// A client handle is issued once and never again: an item the server
// refused, a channel removed or a client gone offline keeps its handle
// spent, so a value the server sends with an old handle cannot reach a
// newer channel. The handle indexes a table (constant-time look-up in
// notifications) that also records the group the item was added to, so a
// notification of one group cannot reach a channel of the other.
//
// The list does not own its channels: each entry keeps the channel's
// presence, which reads null once the channel is destroyed.
class ServedChannels {
  public:
    struct Entry {
        std::shared_ptr<Channel* const> channel;
        int32_t clientHandle = 0;
        int32_t serverHandle = 0;
        int32_t group = 0;

        // Null once the channel is destroyed.
        Channel* Get() const { return *channel; }
    };

    // A handle for an item about to be added to the server.
    int32_t NewHandle();
    // Serves the channel under a handle from NewHandle.
    void Add(Entry entry);

    // The channel an item of the group with this handle is delivered to:
    // nullptr when no served channel of that group has the handle; else the
    // channel's presence (null inside once the channel is destroyed).
    Channel* const* Find(int32_t clientHandle, int32_t group) const {
        if (clientHandle <= 0 || static_cast<size_t>(clientHandle) > slots_.size()) {
            return nullptr;
        }
        const Slot& slot = slots_[static_cast<size_t>(clientHandle) - 1];
        return slot.channel && slot.group == group ? slot.channel.get() : nullptr;
    }
    // The first entry of this channel, or nullptr.
    const Entry* FindEntry(const Channel& cChannel) const;

    const std::vector<Entry>& InOrder() const { return entries_; }
    int32_t Count() const { return static_cast<int32_t>(entries_.size()); }
    // The server handles of the group's items, in list order.
    std::vector<int32_t> ServerHandles(int32_t group) const;

    // Stops serving the group's channels and hands their entries back.
    std::vector<Entry> RemoveGroup(int32_t group);
    // Stops serving every channel and hands the entries back, in order.
    std::vector<Entry> TakeAll();

  private:
    struct Slot {
        std::shared_ptr<Channel* const> channel;
        int32_t group = 0;
    };

    std::vector<Entry> entries_;
    std::vector<Slot> slots_;  // by client handle - 1
};

}  // namespace cv
