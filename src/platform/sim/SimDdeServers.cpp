#include "platform/sim/SimDdeServers.h"

#include <algorithm>
#include <cctype>
#include <utility>

#include "platform/sim/SimDdeLink.h"

namespace cv::sim {

namespace {

std::string Upper(std::string text) {
    std::transform(text.begin(), text.end(), text.begin(),
                   [](unsigned char c) { return static_cast<char>(std::toupper(c)); });
    return text;
}

}  // namespace

SimDdeServers::State::State(std::shared_ptr<const PlantDescription> plantToUse,
                            platform::EventLoop& eventLoop)
    : plant(std::move(plantToUse)), events(eventLoop) {
    for (const DdeAppSpec& app : plant->ddeApps) {
        for (const DdeTopicSpec& topic : app.topics) {
            for (const auto& [item, text] : topic.items) {
                texts[Key(app.name, topic.name, item)] = text;
            }
        }
    }
}

const DdeAppSpec* SimDdeServers::State::FindApp(const std::string& name) const {
    const std::string wanted = Upper(name);
    for (const DdeAppSpec& app : plant->ddeApps) {
        if (Upper(app.name) == wanted) {
            return &app;
        }
    }
    return nullptr;
}

std::string SimDdeServers::State::Key(const std::string& app, const std::string& topic,
                                      const std::string& item) {
    return Upper(app + "|" + topic + "!" + item);
}

SimDdeServers::SimDdeServers(std::shared_ptr<const PlantDescription> plant,
                             platform::EventLoop& events)
    : state_(std::make_shared<State>(std::move(plant), events)) {}

std::shared_ptr<platform::DdeLink> SimDdeServers::CreateDdeLink() {
    return std::make_shared<SimDdeLink>(state_);
}

std::optional<std::string> SimDdeServers::ItemText(const std::string& app, const std::string& topic,
                                                   const std::string& item) const {
    const auto found = state_->texts.find(State::Key(app, topic, item));
    if (found == state_->texts.end()) {
        return std::nullopt;
    }
    return found->second;
}

bool SimDdeServers::SetItemText(const std::string& app, const std::string& topic,
                                const std::string& item, const std::string& text) {
    const auto found = state_->texts.find(State::Key(app, topic, item));
    if (found == state_->texts.end()) {
        return false;
    }
    found->second = text;
    return true;
}

}  // namespace cv::sim
