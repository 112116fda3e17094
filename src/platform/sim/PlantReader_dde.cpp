#include "platform/sim/PlantReader.h"

namespace cv::sim {

void PlantReader::ReadDdeApps(const Node& node, PlantDescription& plant) {
    ExpectArray(node);
    for (size_t i = 0; i < node->size(); ++i) {
        DdeAppSpec app = ReadDdeApp(node.At(i));
        for (const DdeAppSpec& other : plant.ddeApps) {
            if (other.name == app.name) {
                Fail(node.At(i).Key("name"), "\"" + app.name + "\" appears twice");
            }
        }
        plant.ddeApps.push_back(std::move(app));
    }
}

DdeAppSpec PlantReader::ReadDdeApp(const Node& node) {
    ExpectObject(node, {"name", "answers", "topics"});
    DdeAppSpec app;
    app.name = Name(node, "name");
    const std::string answers = Text(node, "answers", "always");
    if (answers == "never") {
        app.answer = DdeAnswer::Never;
    } else if (answers == "late") {
        app.answer = DdeAnswer::Late;
    } else if (answers != "always") {
        Fail(node.Key("answers"), "needs \"always\", \"never\" or \"late\"");
    }
    const Node topics = node.Key("topics");
    if (topics.value != nullptr) {
        ExpectArray(topics);
        for (size_t i = 0; i < topics->size(); ++i) {
            app.topics.push_back(ReadDdeTopic(topics.At(i)));
        }
    }
    return app;
}

DdeTopicSpec PlantReader::ReadDdeTopic(const Node& node) {
    ExpectObject(node, {"name", "items"});
    DdeTopicSpec topic;
    topic.name = Name(node, "name");
    const Node items = node.Key("items");
    if (items.value == nullptr) {
        return topic;
    }
    if (!items->is_object()) {
        Fail(items, "needs an object of item names and their texts");
    }
    for (const auto& [name, value] : items->items()) {
        if (!value.is_string()) {
            Fail(items.Key(name), "needs a text in double quotes");
        }
        topic.items.emplace_back(name, value.get<std::string>());
    }
    return topic;
}

}  // namespace cv::sim
