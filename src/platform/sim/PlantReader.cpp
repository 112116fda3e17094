#include "platform/sim/PlantReader.h"

#include <algorithm>
#include <limits>

#include "platform/AsciiCase.h"
#include "platform/sim/ItemIdSyntax.h"

namespace cv::sim {

namespace {

std::string PointerToken(const std::string& key) {
    std::string token;
    for (const char c : key) {
        token += c == '~' ? "~0" : c == '/' ? "~1" : std::string(1, c);
    }
    return token;
}

bool IsPrintableText(const std::string& text) {
    return !text.empty() && std::none_of(text.begin(), text.end(), [](char c) {
        return static_cast<unsigned char>(c) < ' ' || c == 0x7F;
    });
}

bool ContainsIgnoringCase(const std::vector<std::string>& names, const std::string& name) {
    return std::any_of(names.begin(), names.end(),
                       [&](const std::string& entry) { return EqualsIgnoringCase(entry, name); });
}

}  // namespace

PlantReader::Node PlantReader::Node::Key(const std::string& key) const {
    const json* child = nullptr;
    if (value != nullptr && value->is_object()) {
        const auto found = value->find(key);
        child = found == value->end() ? nullptr : &*found;
    }
    return {child, pointer + "/" + PointerToken(key), path.empty() ? key : path + "." + key};
}

PlantReader::Node PlantReader::Node::At(size_t index) const {
    const std::string number = std::to_string(index);
    return {&(*value)[index], pointer + "/" + number, path + "[" + number + "]"};
}

void PlantReader::Fail(const Node& node, const std::string& problem) {
    throw Fault{node.pointer, node.path, problem};
}

std::string PlantReader::Message(const Fault& fault) const {
    // A missing value has no line: take the one of the value that holds it.
    std::string pointer = fault.pointer;
    int line = document_.LineOf(pointer);
    while (line == 0 && !pointer.empty()) {
        pointer.erase(pointer.rfind('/'));
        line = document_.LineOf(pointer);
    }
    return source_ + ", line " + std::to_string(line) + ": " +
           (fault.path.empty() ? "" : fault.path + ": ") + fault.problem;
}

bool PlantReader::Read(PlantDescription& plant) {
    try {
        const Node root{&document_.Root(), "", ""};
        ExpectObject(root, {"network", "computers", "templates", "servers", "ddeApplications"});
        templates_ = root.Key("templates");
        if (templates_.value != nullptr && !templates_->is_object()) {
            Fail(templates_, "needs an object of item lists, one per template name");
        }
        plant.source = source_;
        if (Has(root, "network")) {
            ReadNetwork(root.Key("network"), plant);
        }
        ReadServers(root.Key("servers"), plant);
        ReadComputers(root.Key("computers"), plant);
        if (Has(root, "ddeApplications")) {
            ReadDdeApps(root.Key("ddeApplications"), plant);
        }
        return true;
    } catch (const Fault& fault) {
        error_ = Message(fault);
        return false;
    }
}

void PlantReader::ExpectObject(const Node& node, std::initializer_list<const char*> allowed) {
    if (!node->is_object()) {
        Fail(node, "needs an object ({...})");
    }
    for (auto entry = node->begin(); entry != node->end(); ++entry) {
        const std::string& key = entry.key();
        const bool known = std::any_of(allowed.begin(), allowed.end(),
                                       [&](const char* name) { return key == name; });
        if (!known) {
            std::string list;
            for (const char* name : allowed) {
                list += (list.empty() ? "" : ", ") + std::string(name);
            }
            Fail(node.Key(key), "unknown key \"" + key + "\"; this object knows " + list);
        }
    }
}

void PlantReader::ExpectArray(const Node& node) {
    if (!node->is_array()) {
        Fail(node, "needs a list ([...])");
    }
}

bool PlantReader::Has(const Node& node, const char* key) {
    return node.Key(key).value != nullptr;
}

std::string PlantReader::Text(const Node& node, const char* key, const std::string& fallback) {
    const Node child = node.Key(key);
    if (child.value == nullptr) {
        return fallback;
    }
    if (!child->is_string()) {
        Fail(child, "needs a text in double quotes");
    }
    return child->get<std::string>();
}

std::string PlantReader::RequiredText(const Node& node, const char* key) {
    if (!Has(node, key)) {
        Fail(node, "the key \"" + std::string(key) + "\" is missing");
    }
    return Text(node, key, {});
}

std::string PlantReader::Name(const Node& node, const char* key) {
    std::string name = RequiredText(node, key);
    if (!IsWellFormedName(name)) {
        Fail(node.Key(key), "\"" + name +
                                "\" is not a usable name: it needs printable characters, "
                                "without blanks or dots");
    }
    return name;
}

bool PlantReader::Flag(const Node& node, const char* key, bool fallback) {
    const Node child = node.Key(key);
    if (child.value == nullptr) {
        return fallback;
    }
    if (!child->is_boolean()) {
        Fail(child, "needs true or false");
    }
    return child->get<bool>();
}

uint32_t PlantReader::Millis(const Node& node, const char* key, uint32_t fallback, uint32_t least) {
    const Node child = node.Key(key);
    if (child.value == nullptr) {
        return fallback;
    }
    constexpr uint64_t most = std::numeric_limits<uint32_t>::max();
    if (!child->is_number_unsigned() || child->get<uint64_t>() < least ||
        child->get<uint64_t>() > most) {
        Fail(child,
             "needs a whole number from " + std::to_string(least) + " to " + std::to_string(most));
    }
    return static_cast<uint32_t>(child->get<uint64_t>());
}

std::vector<std::string> PlantReader::Names(const Node& node, const char* key) {
    const Node list = node.Key(key);
    std::vector<std::string> names;
    if (list.value == nullptr) {
        return names;
    }
    ExpectArray(list);
    for (size_t i = 0; i < list->size(); ++i) {
        const Node entry = list.At(i);
        if (!entry->is_string() || !IsPrintableText(entry->get<std::string>())) {
            Fail(entry, "needs a text of printable characters");
        }
        if (ContainsIgnoringCase(names, entry->get<std::string>())) {
            Fail(entry, "\"" + entry->get<std::string>() + "\" appears twice");
        }
        names.push_back(entry->get<std::string>());
    }
    return names;
}

void PlantReader::ReadNetwork(const Node& node, PlantDescription& plant) {
    ExpectObject(node, {"providers"});
    const Node providers = node.Key("providers");
    if (providers.value == nullptr) {
        return;
    }
    ExpectArray(providers);
    std::vector<std::string> domains;
    for (size_t i = 0; i < providers->size(); ++i) {
        const Node entry = providers.At(i);
        ExpectObject(entry, {"name", "domains"});
        ProviderSpec provider{RequiredText(entry, "name"), Names(entry, "domains")};
        for (size_t d = 0; d < provider.domains.size(); ++d) {
            if (ContainsIgnoringCase(domains, provider.domains[d])) {
                Fail(entry.Key("domains").At(d), "another provider lists this domain already");
            }
            domains.push_back(provider.domains[d]);
        }
        plant.providers.push_back(std::move(provider));
    }
}

void PlantReader::ReadComputers(const Node& node, PlantDescription& plant) {
    if (node.value == nullptr) {
        Fail({nullptr, "", ""}, "the key \"computers\" is missing");
    }
    ExpectArray(node);
    for (size_t i = 0; i < node->size(); ++i) {
        ComputerSpec computer = ReadComputer(node.At(i), plant);
        if (plant.FindComputer(computer.name) != nullptr) {
            Fail(node.At(i).Key("name"), "the computer \"" + computer.name + "\" appears twice");
        }
        if (computer.local && plant.LocalComputer() != nullptr) {
            Fail(node.At(i).Key("local"), "only one computer can be this computer");
        }
        plant.computers.push_back(std::move(computer));
    }
    if (plant.LocalComputer() == nullptr) {
        Fail(node, "no computer is marked \"local\": true (this computer)");
    }
}

ComputerSpec PlantReader::ReadComputer(const Node& node, const PlantDescription& plant) {
    ExpectObject(node, {"name", "domain", "comment", "local", "access", "answerAfterMs", "servers",
                        "shares"});
    ComputerSpec computer;
    computer.name = Name(node, "name");
    computer.domain = Text(node, "domain", {});
    const bool listed = std::any_of(
        plant.providers.begin(), plant.providers.end(), [&](const ProviderSpec& provider) {
            return ContainsIgnoringCase(provider.domains, computer.domain);
        });
    if (!computer.domain.empty() && !listed) {
        Fail(node.Key("domain"),
             "no provider of the network lists the domain \"" + computer.domain + "\"");
    }
    computer.comment = Text(node, "comment", {});
    computer.local = Flag(node, "local", false);
    const std::string access = Text(node, "access", "open");
    if (access != "open" && access != "denied" && access != "silent") {
        Fail(node.Key("access"), "unknown access \"" + access + "\"; use open, denied or silent");
    }
    computer.access = access == "denied"   ? ComputerAccess::Denied
                      : access == "silent" ? ComputerAccess::Silent
                                           : ComputerAccess::Open;
    computer.answerAfterMs = Millis(node, "answerAfterMs", computer.answerAfterMs, 0);
    computer.servers = Names(node, "servers");
    for (size_t i = 0; i < computer.servers.size(); ++i) {
        if (plant.FindServer(computer.servers[i]) == nullptr) {
            Fail(node.Key("servers").At(i),
                 "no server is called \"" + computer.servers[i] + "\" in \"servers\"");
        }
    }
    computer.shares = Names(node, "shares");
    return computer;
}

void PlantReader::ReadServers(const Node& node, PlantDescription& plant) {
    if (node.value == nullptr) {
        Fail({nullptr, "", ""}, "the key \"servers\" is missing");
    }
    ExpectArray(node);
    for (size_t i = 0; i < node->size(); ++i) {
        ServerSpec server = ReadServer(node.At(i));
        if (plant.FindServer(server.id) != nullptr) {
            Fail(node.At(i).Key("id"), "the server \"" + server.id + "\" appears twice");
        }
        plant.servers.push_back(std::move(server));
    }
}

ServerSpec PlantReader::ReadServer(const Node& node) {
    ExpectObject(node, {"id", "running", "browse", "subscribe", "callDelayMs", "shutdownAfterMs",
                        "shutdownReason", "minUpdateRateMs", "namespace"});
    ServerSpec server;
    server.id = RequiredText(node, "id");
    if (!IsWellFormedItemId(server.id)) {
        Fail(node.Key("id"), "\"" + server.id +
                                 "\" is not a usable server ID: it needs printable characters "
                                 "without blanks, names joined by single dots");
    }
    server.running = Flag(node, "running", true);
    server.browsable = Flag(node, "browse", true);
    server.subscribable = Flag(node, "subscribe", true);
    server.callDelayMs = Millis(node, "callDelayMs", 0, 0);
    server.shutdownAfterMs = Millis(node, "shutdownAfterMs", 0, 0);
    server.shutdownReason = Text(node, "shutdownReason", "The server is shutting down.");
    server.minUpdateRateMs = Millis(node, "minUpdateRateMs", server.minUpdateRateMs, 1);
    if (Has(node, "namespace")) {
        ReadBranch(node.Key("namespace"), {}, 0, server, server.root);
    }
    return server;
}

void PlantReader::ReadBranch(const Node& node, const std::string& prefix, size_t depth,
                             ServerSpec& server, BranchSpec& branch) {
    if (depth > kMaxBranchDepth) {
        Fail(node, "branches nest deeper than " + std::to_string(kMaxBranchDepth) + " levels");
    }
    if (depth == 0) {
        ExpectObject(node, {"branches", "items", "template"});
    } else {
        ExpectObject(node, {"name", "branches", "items", "template"});
        branch.name = Name(node, "name");
    }
    const std::string itemPrefix = depth == 0 ? prefix : prefix + branch.name + ".";
    ReadBranchItems(node, itemPrefix, server, branch);
    const Node children = node.Key("branches");
    if (children.value == nullptr) {
        return;
    }
    ExpectArray(children);
    for (size_t i = 0; i < children->size(); ++i) {
        BranchSpec child;
        ReadBranch(children.At(i), itemPrefix, depth + 1, server, child);
        const bool taken = std::any_of(branch.branches.begin(), branch.branches.end(),
                                       [&](const BranchSpec& sibling) {
                                           return EqualsIgnoringCase(sibling.name, child.name);
                                       });
        if (taken) {
            Fail(children.At(i).Key("name"), "the branch \"" + child.name + "\" appears twice");
        }
        branch.branches.push_back(std::move(child));
    }
}

void PlantReader::ReadBranchItems(const Node& node, const std::string& prefix, ServerSpec& server,
                                  BranchSpec& branch) {
    struct Entry {
        ItemSpec item;
        Node node;
        bool fromTemplate;
    };
    std::vector<Entry> entries;
    if (Has(node, "template")) {
        const std::string name = RequiredText(node, "template");
        const Node list = templates_.Key(name);
        if (list.value == nullptr) {
            Fail(node.Key("template"), "no template is called \"" + name + "\"");
        }
        ExpectArray(list);
        for (size_t i = 0; i < list->size(); ++i) {
            entries.push_back({ReadItem(list.At(i), prefix), list.At(i), true});
        }
    }
    const Node items = node.Key("items");
    if (items.value != nullptr) {
        ExpectArray(items);
        for (size_t i = 0; i < items->size(); ++i) {
            Entry entry{ReadItem(items.At(i), prefix), items.At(i), false};
            const auto same = std::find_if(entries.begin(), entries.end(), [&](const Entry& e) {
                return EqualsIgnoringCase(e.item.name, entry.item.name);
            });
            if (same == entries.end()) {
                entries.push_back(std::move(entry));
            } else if (same->fromTemplate) {
                *same = std::move(entry);
            } else {
                Fail(items.At(i).Key("name"),
                     "the item \"" + entry.item.name + "\" appears twice in this branch");
            }
        }
    }
    for (Entry& entry : entries) {
        AddItem(std::move(entry.item), entry.node, server, branch);
    }
}

void PlantReader::AddItem(ItemSpec item, const Node& node, ServerSpec& server, BranchSpec& branch) {
    if (++itemCount_ > kMaxItems) {
        Fail(node, "the plant has more than " + std::to_string(kMaxItems) + " items");
    }
    server.items.push_back(std::move(item));
    const size_t index = server.items.size() - 1;
    if (!server.IndexItem(index)) {
        Fail(node, "the item ID \"" + server.items[index].itemId + "\" appears twice");
    }
    branch.items.push_back(index);
}

}  // namespace cv::sim
