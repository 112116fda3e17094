#pragma once

#include <cstdint>
#include <initializer_list>
#include <string>

#include <nlohmann/json.hpp>

#include "platform/sim/JsonDocument.h"
#include "platform/sim/PlantDescription.h"

namespace cv::sim {

// Turns a parsed plant file into a PlantDescription, checking every rule of
// the format (resources/sim/README.md). The first fault ends the reading;
// its message names the source, the line and the JSON path of the value.
class PlantReader {
  public:
    static constexpr size_t kMaxBranchDepth = 16;
    static constexpr size_t kMaxItems = 200000;
    static constexpr size_t kMaxArrayElements = 2000000;

    PlantReader(const JsonDocument& document, std::string source)
        : document_(document), source_(std::move(source)) {}

    bool Read(PlantDescription& plant);
    const std::string& Error() const { return error_; }

  private:
    using json = nlohmann::json;

    // A value of the document with where it is, for messages.
    struct Node {
        const json* value = nullptr;
        std::string pointer;
        std::string path;

        Node Key(const std::string& key) const;
        Node At(size_t index) const;
        const json& operator*() const { return *value; }
        const json* operator->() const { return value; }
    };

    struct Fault {
        std::string pointer;
        std::string path;
        std::string problem;
    };

    [[noreturn]] static void Fail(const Node& node, const std::string& problem);
    std::string Message(const Fault& fault) const;

    // Checks that node is an object holding only the allowed keys.
    static void ExpectObject(const Node& node, std::initializer_list<const char*> allowed);
    static void ExpectArray(const Node& node);
    static bool Has(const Node& node, const char* key);
    static std::string Text(const Node& node, const char* key, const std::string& fallback);
    static std::string RequiredText(const Node& node, const char* key);
    static std::string Name(const Node& node, const char* key);
    static bool Flag(const Node& node, const char* key, bool fallback);
    static uint32_t Millis(const Node& node, const char* key, uint32_t fallback, uint32_t least);
    static std::vector<std::string> Names(const Node& node, const char* key);

    void ReadNetwork(const Node& node, PlantDescription& plant);
    // DDE applications (PlantReader_dde.cpp).
    void ReadDdeApps(const Node& node, PlantDescription& plant);
    static DdeAppSpec ReadDdeApp(const Node& node);
    static DdeTopicSpec ReadDdeTopic(const Node& node);
    void ReadComputers(const Node& node, PlantDescription& plant);
    ComputerSpec ReadComputer(const Node& node, const PlantDescription& plant);
    void ReadServers(const Node& node, PlantDescription& plant);
    ServerSpec ReadServer(const Node& node);
    void ReadBranch(const Node& node, const std::string& prefix, size_t depth, ServerSpec& server,
                    BranchSpec& branch);
    void ReadBranchItems(const Node& node, const std::string& prefix, ServerSpec& server,
                         BranchSpec& branch);
    void AddItem(ItemSpec item, const Node& node, ServerSpec& server, BranchSpec& branch);

    // Items, values and generators (PlantReader_items.cpp).
    ItemSpec ReadItem(const Node& node, const std::string& prefix);
    static uint16_t ReadType(const Node& node);
    Variant ReadValue(const Node& node, uint16_t type);
    static Variant ReadScalar(const Node& node, uint16_t type);
    static Variant DefaultScalar(uint16_t type);
    static uint16_t ReadQuality(const Node& node);
    GeneratorSpec ReadGenerator(const Node& node, uint16_t type);
    static double GeneratorBound(const Node& node, const char* key, double fallback, uint16_t type);

    const JsonDocument& document_;
    std::string source_;
    std::string error_;
    Node templates_;
    size_t itemCount_ = 0;
    size_t arrayElements_ = 0;
};

}  // namespace cv::sim
