#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>

#include "platform/DdeLink.h"
#include "platform/EventLoop.h"
#include "platform/sim/PlantDescription.h"

namespace cv::sim {

// The DDE applications of the simulated plant: each answers a conversation
// as its plant entry says (at once, never, or too late) on the topics and
// items it declares, and keeps the texts poked to its items. Names compare
// without regard to letter case. Links share the applications' state, so
// they may outlive this object.
class SimDdeServers : public platform::DdeLinkFactory {
  public:
    // What the links share: the plant's applications and their item texts.
    struct State {
        State(std::shared_ptr<const PlantDescription> plantToUse, platform::EventLoop& eventLoop);
        const DdeAppSpec* FindApp(const std::string& name) const;
        // Key of an item: "APP|TOPIC!ITEM" in upper case.
        static std::string Key(const std::string& app, const std::string& topic,
                               const std::string& item);
        std::shared_ptr<const PlantDescription> plant;
        platform::EventLoop& events;
        std::map<std::string, std::string> texts;
    };

    SimDdeServers(std::shared_ptr<const PlantDescription> plant, platform::EventLoop& events);
    std::shared_ptr<platform::DdeLink> CreateDdeLink() override;

    // The item's text now, or nothing for an undeclared item.
    std::optional<std::string> ItemText(const std::string& app, const std::string& topic,
                                        const std::string& item) const;
    // Changes a declared item as its application would; false for others.
    bool SetItemText(const std::string& app, const std::string& topic, const std::string& item,
                     const std::string& text);

  private:
    std::shared_ptr<State> state_;
};

}  // namespace cv::sim
