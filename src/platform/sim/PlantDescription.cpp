#include "platform/sim/PlantDescription.h"

#include <algorithm>

#include "platform/AsciiCase.h"

namespace cv::sim {

const ItemSpec* ServerSpec::FindItem(std::string_view itemId) const {
    const auto found = byId_.find(AsciiLower(itemId));
    return found == byId_.end() ? nullptr : &items[found->second];
}

bool ServerSpec::IndexItem(size_t index) {
    return byId_.emplace(AsciiLower(items[index].itemId), index).second;
}

const ComputerSpec* PlantDescription::FindComputer(std::string_view name) const {
    const auto found = std::find_if(computers.begin(), computers.end(), [&](const auto& computer) {
        return EqualsIgnoringCase(computer.name, name);
    });
    return found == computers.end() ? nullptr : &*found;
}

const ComputerSpec* PlantDescription::LocalComputer() const {
    const auto found = std::find_if(computers.begin(), computers.end(),
                                    [](const auto& computer) { return computer.local; });
    return found == computers.end() ? nullptr : &*found;
}

const ServerSpec* PlantDescription::FindServer(std::string_view id) const {
    const auto found = std::find_if(servers.begin(), servers.end(), [&](const auto& server) {
        return EqualsIgnoringCase(server.id, id);
    });
    return found == servers.end() ? nullptr : &*found;
}

}  // namespace cv::sim
