#include "opc/ServedChannels.h"

#include <algorithm>
#include <utility>

namespace cv {

int32_t ServedChannels::NewHandle() {
    slots_.emplace_back();
    return static_cast<int32_t>(slots_.size());
}

void ServedChannels::Add(Entry entry) {
    slots_.at(static_cast<size_t>(entry.clientHandle) - 1) = Slot{entry.channel, entry.group};
    entries_.push_back(std::move(entry));
}

const ServedChannels::Entry* ServedChannels::FindEntry(const Channel& cChannel) const {
    const auto found = std::find_if(entries_.begin(), entries_.end(),
                                    [&](const Entry& entry) { return entry.Get() == &cChannel; });
    return found == entries_.end() ? nullptr : &*found;
}

std::vector<int32_t> ServedChannels::ServerHandles(int32_t group) const {
    std::vector<int32_t> handles;
    for (const Entry& entry : entries_) {
        if (entry.group == group) {
            handles.push_back(entry.serverHandle);
        }
    }
    return handles;
}

std::vector<ServedChannels::Entry> ServedChannels::RemoveGroup(int32_t group) {
    std::vector<Entry> removed;
    std::vector<Entry> kept;
    for (Entry& entry : entries_) {
        if (entry.group == group) {
            slots_[static_cast<size_t>(entry.clientHandle) - 1] = Slot{};
            removed.push_back(std::move(entry));
        } else {
            kept.push_back(std::move(entry));
        }
    }
    entries_ = std::move(kept);
    return removed;
}

std::vector<ServedChannels::Entry> ServedChannels::TakeAll() {
    for (const Entry& entry : entries_) {
        slots_[static_cast<size_t>(entry.clientHandle) - 1] = Slot{};
    }
    return std::exchange(entries_, {});
}

}  // namespace cv
