// A bulk OPC UA server on open62541 for ua_bulk_bench: a folder Bulk of N
// Double variables (ns=1;s=Bulk.V0 to Bulk.V<N-1>), every one rewritten
// every P ms with a new value and source timestamp.
//
//   ua_bulk_server <N> <P> [--port <port>] [--seconds <s>] [--exit-with-pid <pid>]
//
// Listens on 127.0.0.1 only (a free port unless one is given), prints
// "READY <url>" once it listens, and ends by itself after the given seconds
// (600 by default) or as soon as the given process has gone.

#include <arpa/inet.h>
#include <netinet/in.h>
#include <open62541/plugin/log_stdout.h>
#include <open62541/server.h>
#include <open62541/server_config_default.h>
#include <signal.h>
#include <sys/socket.h>
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

namespace {

struct Options {
    uint32_t items = 0;
    double periodMs = 0;
    uint16_t port = 0;
    double seconds = 600;
    pid_t watched = 0;
};

bool Parse(int argc, char** argv, Options& options) {
    if (argc < 3) {
        return false;
    }
    options.items = static_cast<uint32_t>(std::strtoul(argv[1], nullptr, 10));
    options.periodMs = std::strtod(argv[2], nullptr);
    for (int i = 3; i + 1 < argc; i += 2) {
        const std::string name = argv[i];
        if (name == "--port") {
            options.port = static_cast<uint16_t>(std::strtoul(argv[i + 1], nullptr, 10));
        } else if (name == "--seconds") {
            options.seconds = std::strtod(argv[i + 1], nullptr);
        } else if (name == "--exit-with-pid") {
            options.watched = static_cast<pid_t>(std::strtol(argv[i + 1], nullptr, 10));
        } else {
            return false;
        }
    }
    return options.items > 0 && options.periodMs > 0 && argc % 2 == 1;
}

// A port of 127.0.0.1 that nobody listens on now.
uint16_t FreePort() {
    const int s = socket(AF_INET, SOCK_STREAM, 0);
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    socklen_t length = sizeof address;
    uint16_t port = 0;
    if (s >= 0 && bind(s, reinterpret_cast<sockaddr*>(&address), sizeof address) == 0 &&
        getsockname(s, reinterpret_cast<sockaddr*>(&address), &length) == 0) {
        port = ntohs(address.sin_port);
    }
    if (s >= 0) {
        close(s);
    }
    return port;
}

// The values live here; each variable's node points at its own (an external
// value source), so a rewrite costs the server nothing but the new values.
struct Bulk {
    explicit Bulk(uint32_t count) : values(count), dataValues(count), pointers(count) {
        for (uint32_t i = 0; i < count; ++i) {
            values[i] = i;
            UA_DataValue& dataValue = dataValues[i];
            UA_DataValue_init(&dataValue);
            UA_Variant_setScalar(&dataValue.value, &values[i], &UA_TYPES[UA_TYPES_DOUBLE]);
            dataValue.value.storageType = UA_VARIANT_DATA_NODELETE;
            dataValue.hasValue = true;
            dataValue.hasSourceTimestamp = true;
            pointers[i] = &dataValue;
        }
    }

    UA_Server* server = nullptr;
    std::vector<UA_Double> values;
    std::vector<UA_DataValue> dataValues;
    std::vector<UA_DataValue*> pointers;
    uint64_t tick = 0;
};

UA_NodeId AddFolder(UA_Server* server) {
    UA_ObjectAttributes attributes = UA_ObjectAttributes_default;
    attributes.displayName = UA_LOCALIZEDTEXT(const_cast<char*>(""), const_cast<char*>("Bulk"));
    UA_NodeId folder = UA_NODEID_STRING(1, const_cast<char*>("Bulk"));
    UA_Server_addObjectNode(
        server, folder, UA_NODEID_NUMERIC(0, UA_NS0ID_OBJECTSFOLDER),
        UA_NODEID_NUMERIC(0, UA_NS0ID_ORGANIZES), UA_QUALIFIEDNAME(1, const_cast<char*>("Bulk")),
        UA_NODEID_NUMERIC(0, UA_NS0ID_FOLDERTYPE), attributes, nullptr, nullptr);
    return folder;
}

bool AddVariables(Bulk& bulk) {
    const UA_NodeId folder = AddFolder(bulk.server);
    for (size_t i = 0; i < bulk.values.size(); ++i) {
        std::string name = "V" + std::to_string(i);
        std::string id = "Bulk." + name;
        UA_VariableAttributes attributes = UA_VariableAttributes_default;
        UA_Variant_setScalar(&attributes.value, &bulk.values[i], &UA_TYPES[UA_TYPES_DOUBLE]);
        attributes.dataType = UA_TYPES[UA_TYPES_DOUBLE].typeId;
        attributes.displayName = UA_LOCALIZEDTEXT(const_cast<char*>(""), name.data());
        const UA_NodeId node = UA_NODEID_STRING(1, id.data());
        if (UA_Server_addVariableNode(bulk.server, node, folder,
                                      UA_NODEID_NUMERIC(0, UA_NS0ID_ORGANIZES),
                                      UA_QUALIFIEDNAME(1, name.data()),
                                      UA_NODEID_NUMERIC(0, UA_NS0ID_BASEDATAVARIABLETYPE),
                                      attributes, nullptr, nullptr) != UA_STATUSCODE_GOOD ||
            UA_Server_setVariableNode_externalValueSource(bulk.server, node, &bulk.pointers[i],
                                                          nullptr) != UA_STATUSCODE_GOOD) {
            return false;
        }
    }
    return true;
}

// Every variable gets a value it did not have before.
void Rewrite(UA_Server*, void* data) {
    Bulk& bulk = *static_cast<Bulk*>(data);
    ++bulk.tick;
    const UA_DateTime now = UA_DateTime_now();
    for (size_t i = 0; i < bulk.values.size(); ++i) {
        bulk.values[i] = static_cast<double>(bulk.tick) + static_cast<double>(i) * 1e-6;
        bulk.dataValues[i].sourceTimestamp = now;
    }
}

bool Watched(pid_t pid) {
    return pid == 0 || kill(pid, 0) == 0;
}

volatile sig_atomic_t stopped = 0;

void Stop(int) {
    stopped = 1;
}

}  // namespace

int main(int argc, char** argv) {
    Options options;
    if (!Parse(argc, argv, options)) {
        std::fprintf(stderr,
                     "usage: ua_bulk_server <items> <period ms> [--port <port>] "
                     "[--seconds <s>] [--exit-with-pid <pid>]\n");
        return 2;
    }
    const uint16_t port = options.port ? options.port : FreePort();
    const std::string url = "opc.tcp://127.0.0.1:" + std::to_string(port);
    Bulk bulk(options.items);
    UA_ServerConfig config;
    std::memset(&config, 0, sizeof config);
    config.logging = UA_Log_Stdout_new(UA_LOGLEVEL_ERROR);
    UA_ServerConfig_setMinimal(&config, port, nullptr);
    UA_Array_delete(config.serverUrls, config.serverUrlsSize, &UA_TYPES[UA_TYPES_STRING]);
    UA_String listen = UA_STRING(const_cast<char*>(url.c_str()));
    UA_Array_copy(&listen, 1, reinterpret_cast<void**>(&config.serverUrls),
                  &UA_TYPES[UA_TYPES_STRING]);
    config.serverUrlsSize = 1;
    bulk.server = UA_Server_newWithConfig(&config);
    if (!AddVariables(bulk) ||
        UA_Server_addRepeatedCallback(bulk.server, Rewrite, &bulk, options.periodMs, nullptr) !=
            UA_STATUSCODE_GOOD ||
        UA_Server_run_startup(bulk.server) != UA_STATUSCODE_GOOD) {
        std::fprintf(stderr, "The bulk server could not start on %s\n", url.c_str());
        UA_Server_delete(bulk.server);
        return 1;
    }
    signal(SIGTERM, Stop);
    signal(SIGINT, Stop);
    std::printf("READY %s\n", url.c_str());
    std::fflush(stdout);
    const auto end = std::chrono::steady_clock::now() +
                     std::chrono::milliseconds(static_cast<int64_t>(options.seconds * 1000));
    auto nextLook = std::chrono::steady_clock::now();
    while (!stopped) {
        UA_Server_run_iterate(bulk.server, true);
        const auto now = std::chrono::steady_clock::now();
        if (now >= nextLook) {
            if (now >= end || !Watched(options.watched)) {
                break;
            }
            nextLook = now + std::chrono::milliseconds(200);
        }
    }
    UA_Server_run_shutdown(bulk.server);
    UA_Server_delete(bulk.server);
    return 0;
}
