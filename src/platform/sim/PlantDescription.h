#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

#include "platform/Variant.h"

namespace cv::sim {

// What a simulated plant holds, as read from its description file: the
// network (providers, domains, computers, shares), the computers with the
// servers registered on each, and every server with its item namespace.
// Read-only once loaded; the running plant shares it.

struct ProviderSpec {
    std::string name;
    std::vector<std::string> domains;
};

enum class ComputerAccess {
    Open,    // answers every call
    Denied,  // refuses every call with E_ACCESSDENIED
    Silent,  // does not answer: a call waits, then fails with RPC_S_SERVER_UNAVAILABLE
};

struct ComputerSpec {
    std::string name;
    std::string domain;  // empty: not seen in the network
    std::string comment;
    bool local = false;
    ComputerAccess access = ComputerAccess::Open;
    uint32_t answerAfterMs = 20000;  // how long a silent computer keeps a call waiting
    std::vector<std::string> servers;
    std::vector<std::string> shares;
};

enum class GeneratorKind { Memory, Constant, Ramp, Sine, Random, Square, Step };

// How an item's value moves with the plant's clock. Ramp, sine and square
// run from min to max once per period; random holds a value drawn from a
// fixed seed for each period; step shows its values (and qualities) in turn,
// one per period.
struct GeneratorSpec {
    GeneratorKind kind = GeneratorKind::Memory;
    double min = 0.0;
    double max = 1.0;
    uint32_t periodMs = 10000;
    uint32_t phaseMs = 0;
    uint64_t seed = 1;
    std::vector<Variant> values;
    std::vector<uint16_t> qualities;

    bool MovesWithTime() const {
        return kind != GeneratorKind::Memory && kind != GeneratorKind::Constant;
    }
};

struct ItemSpec {
    std::string itemId;  // the full dotted ID
    std::string name;    // the leaf name within its branch
    uint16_t type = VT_R8;
    Variant value;  // the initial value of memory and constant items
    uint16_t quality = 0xC0;
    bool writable = true;
    GeneratorSpec generator;
    std::vector<std::string> accessPaths;
    bool pathRequired = false;
};

struct BranchSpec {
    std::string name;
    std::vector<BranchSpec> branches;
    std::vector<size_t> items;  // positions in ServerSpec::items
};

struct ServerSpec {
    std::string id;
    bool running = true;
    bool browsable = true;
    bool subscribable = true;
    uint32_t callDelayMs = 0;
    uint32_t shutdownAfterMs = 0;  // 0: never
    std::string shutdownReason;
    uint32_t minUpdateRateMs = 50;
    std::vector<ItemSpec> items;
    BranchSpec root;

    // The item with that ID in any letter case; nullptr when there is none.
    const ItemSpec* FindItem(std::string_view itemId) const;
    size_t IndexOf(const ItemSpec& item) const { return static_cast<size_t>(&item - items.data()); }
    // Registers items[index] for FindItem; false when its ID is taken.
    bool IndexItem(size_t index);

  private:
    std::unordered_map<std::string, size_t> byId_;
};

// How a DDE application answers a conversation.
enum class DdeAnswer {
    Always,  // answers at once
    Never,   // does not answer the initiate (not running)
    Late,    // answers the initiate, then lets every request time out
};
struct DdeTopicSpec {
    std::string name;
    // Item name and initial text; other items are refused.
    std::vector<std::pair<std::string, std::string>> items;
};
struct DdeAppSpec {
    std::string name;
    DdeAnswer answer = DdeAnswer::Always;
    std::vector<DdeTopicSpec> topics;
};

struct PlantDescription {
    std::string source;  // the file it came from, for messages
    std::vector<ProviderSpec> providers;
    std::vector<ComputerSpec> computers;
    std::vector<ServerSpec> servers;
    std::vector<DdeAppSpec> ddeApps;

    // Look-ups ignore letter case; nullptr when there is no such entry.
    const ComputerSpec* FindComputer(std::string_view name) const;
    const ComputerSpec* LocalComputer() const;
    const ServerSpec* FindServer(std::string_view id) const;
};

}  // namespace cv::sim
