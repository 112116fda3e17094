#include "platform/sim/ServerInstance.h"

#include <cmath>

#include "platform/opc/OpcResult.h"
#include "platform/sim/Connection.h"
#include "platform/sim/Generator.h"
#include "platform/sim/PlantLocale.h"
#include "platform/sim/PlantRuntime.h"

namespace cv::sim {

namespace {

using namespace platform::OpcResult;

// Equality in which a not-a-number equals itself, so that a value that is
// not a number does not count as changed at every look.
bool SameValue(const Variant& a, const Variant& b) {
    if (a.VarType() != b.VarType()) {
        return false;
    }
    if (a.VarType() == VT_R4 && std::isnan(a.AsR4()) && std::isnan(b.AsR4())) {
        return true;
    }
    if (a.VarType() == VT_R8 && std::isnan(a.AsR8()) && std::isnan(b.AsR8())) {
        return true;
    }
    if (a.IsArray()) {
        if (a.LowerBound() != b.LowerBound() || a.ElementCount() != b.ElementCount()) {
            return false;
        }
        for (size_t i = 0; i < a.ElementCount(); ++i) {
            if (!SameValue(a.Element(i), b.Element(i))) {
                return false;
            }
        }
        return true;
    }
    return a == b;
}

// The value converted to the item's type for a write: 0, or OPC_E_BADTYPE
// when it cannot be converted, OPC_E_RANGE when it does not fit.
int32_t ConvertForWrite(const Variant& value, uint16_t type, Variant& converted) {
    if (value.IsEmpty() || value.IsNull() || value.IsArray() != ((type & VT_ARRAY) != 0)) {
        return OPC_E_BADTYPE;
    }
    if (value.IsArray()) {
        const auto element = static_cast<uint16_t>(type & ~VT_ARRAY);
        std::vector<Variant> elements(value.ElementCount());
        for (size_t i = 0; i < elements.size(); ++i) {
            if (const int32_t code = ConvertForWrite(value.Element(i), element, elements[i])) {
                return code;
            }
        }
        converted = Variant::Array(element, std::move(elements), value.LowerBound());
        return 0;
    }
    const ErrorInfo error = ChangeType(converted, value, type, PlantLocale());
    return !error ? 0 : error.Number == kErrOverflow ? OPC_E_RANGE : OPC_E_BADTYPE;
}

}  // namespace

ServerInstance::ServerInstance(PlantRuntime& runtime, const ServerSpec& server)
    : runtime_(runtime),
      server_(server),
      callDelayMs_(server.callDelayMs),
      items_(server.items.size()),
      seen_(server.items.size(), false) {}

ServerInstance::~ServerInstance() {
    runtime_.Events().StopTimer(shutdownTimer_);
}

void ServerInstance::Start(const std::shared_ptr<ServerInstance>& self) {
    if (running_) {
        return;
    }
    running_ = true;
    if (server_.shutdownAfterMs > 0) {
        std::weak_ptr<ServerInstance> weak = self;
        shutdownTimer_ = runtime_.Events().StartTimer(server_.shutdownAfterMs, false, [weak] {
            if (const auto instance = weak.lock()) {
                instance->shutdownTimer_ = 0;
                instance->ShutDown(instance->server_.shutdownReason);
            }
        });
    }
}

void ServerInstance::Attach(const std::shared_ptr<Connection>& connection) {
    clients_.push_back(connection);
}

void ServerInstance::Detach(const Connection& connection) {
    std::erase_if(clients_, [&](const std::weak_ptr<Connection>& client) {
        const auto locked = client.lock();
        return !locked || locked.get() == &connection;
    });
}

std::vector<std::string> ServerInstance::ClientNames() const {
    std::vector<std::string> names;
    for (const auto& client : clients_) {
        if (const auto connection = client.lock()) {
            names.push_back(connection->ClientName());
        }
    }
    return names;
}

void ServerInstance::ShutDown(const std::string& reason) {
    End(RPC_E_DISCONNECTED, &reason);
}

void ServerInstance::Drop() {
    End(RPC_S_SERVER_UNAVAILABLE, nullptr);
}

void ServerInstance::End(int32_t code, const std::string* reason) {
    running_ = false;
    runtime_.Events().StopTimer(shutdownTimer_);
    shutdownTimer_ = 0;
    std::vector<std::weak_ptr<Connection>> clients;
    clients.swap(clients_);
    for (const auto& client : clients) {
        if (const auto connection = client.lock()) {
            connection->ServerEnded(code, reason);
        }
    }
}

const ItemRuntime& ServerInstance::Observe(size_t item) {
    ItemRuntime& runtime = items_[item];
    const ItemSpec& described = server_.items[item];
    if (!seen_[item]) {
        seen_[item] = true;
        runtime.value = described.value;
        runtime.quality = described.quality;
        runtime.stampMs = runtime_.Clock().NowMs();
        runtime.version = 1;
    }
    if (!runtime.fixed && described.generator.MovesWithTime()) {
        GeneratedSample sample = Generate(described, runtime_.Clock().NowMs());
        Update(runtime, std::move(sample.value), runtime.forcedQuality.value_or(sample.quality));
    }
    return runtime;
}

const ItemRuntime& ServerInstance::Last(size_t item) {
    return seen_[item] ? items_[item] : Observe(item);
}

int32_t ServerInstance::Write(size_t item, const Variant& value) {
    if (!server_.items[item].writable) {
        return OPC_E_BADRIGHTS;
    }
    Variant converted;
    if (const int32_t code = ConvertForWrite(value, server_.items[item].type, converted)) {
        return code;
    }
    Force(item, std::move(converted));
    return 0;
}

void ServerInstance::Force(size_t item, Variant value) {
    ItemRuntime& runtime = items_[item];
    Observe(item);
    runtime.fixed = true;
    Update(runtime, std::move(value), runtime.quality);
}

void ServerInstance::ForceQuality(size_t item, uint16_t quality) {
    ItemRuntime& runtime = items_[item];
    Observe(item);
    runtime.forcedQuality = quality;
    Update(runtime, Variant(runtime.value), quality);
}

void ServerInstance::Update(ItemRuntime& runtime, Variant value, uint16_t quality) {
    if (SameValue(value, runtime.value) && quality == runtime.quality) {
        return;
    }
    runtime.value = std::move(value);
    runtime.quality = quality;
    runtime.stampMs = runtime_.Clock().NowMs();
    ++runtime.version;
}

}  // namespace cv::sim
