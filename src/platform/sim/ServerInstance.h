#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/EventLoop.h"
#include "platform/Variant.h"
#include "platform/sim/PlantDescription.h"

namespace cv::sim {

class Connection;
class PlantRuntime;

// What the server knows of one item: its value and quality as last seen,
// since when (plant milliseconds), and a count that grows with each change.
struct ItemRuntime {
    Variant value;
    uint16_t quality = 0;
    uint64_t stampMs = 0;
    uint64_t version = 0;
    bool fixed = false;  // written or set: the generator no longer moves it
    std::optional<uint16_t> forcedQuality;
};

// One server of the plant on one computer, as a running process would be:
// started by the first Connect, serving its clients until it shuts down or
// disappears. Item values live here, shared by all its clients, and stay
// across restarts; so do the settings that tests change.
class ServerInstance {
  public:
    ServerInstance(PlantRuntime& runtime, const ServerSpec& server);
    ~ServerInstance();
    ServerInstance(const ServerInstance&) = delete;
    ServerInstance& operator=(const ServerInstance&) = delete;

    const ServerSpec& Described() const { return server_; }
    uint32_t CallDelay() const { return callDelayMs_; }
    void SetCallDelay(uint32_t ms) { callDelayMs_ = ms; }

    // Starts the server when it is not running; a server that shuts down
    // after a while counts that while from here.
    void Start(const std::shared_ptr<ServerInstance>& self);
    void Attach(const std::shared_ptr<Connection>& connection);
    void Detach(const Connection& connection);
    // The names its connected clients gave themselves.
    std::vector<std::string> ClientNames() const;
    // Tells every client that the server goes down (from the event loop),
    // then ends: their calls fail with RPC_E_DISCONNECTED.
    void ShutDown(const std::string& reason);
    // Ends without a word: every call of its clients fails with
    // RPC_S_SERVER_UNAVAILABLE, as when a server process dies.
    void Drop();

    // The item as it is now (a device read).
    const ItemRuntime& Observe(size_t item);
    // The item as last seen (a cache read); seen now when it never was.
    const ItemRuntime& Last(size_t item);
    // A client's write: an OPC result code, 0 when the value was taken.
    int32_t Write(size_t item, const Variant& value);
    // A test's change, past rights and conversions.
    void Force(size_t item, Variant value);
    void ForceQuality(size_t item, uint16_t quality);

  private:
    void End(int32_t code, const std::string* reason);
    void Update(ItemRuntime& runtime, Variant value, uint16_t quality);

    PlantRuntime& runtime_;
    const ServerSpec& server_;
    uint32_t callDelayMs_;
    bool running_ = false;
    platform::EventLoop::TimerId shutdownTimer_ = 0;
    std::vector<std::weak_ptr<Connection>> clients_;
    std::vector<ItemRuntime> items_;
    std::vector<bool> seen_;
};

}  // namespace cv::sim
