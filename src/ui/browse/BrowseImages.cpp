#include "ui/browse/BrowseImages.h"

namespace cv {

const std::map<std::string, const char*>& BrowseImages::Files() {
    static const std::map<std::string, const char*> files = {
        {"AllOpcServers", ":/browse/all-opc-servers.svg"},
        {"ClosedFolder", ":/browse/closed-folder.svg"},
        {"Domain", ":/browse/domain.svg"},
        {"EntireNetwork", ":/browse/entire-network.svg"},
        {"ItemID", ":/browse/item-id.svg"},
        {"MyComputer", ":/browse/my-computer.svg"},
        {"NetNeighbor", ":/browse/net-neighbor.svg"},
        {"OpcServer", ":/browse/opc-server.svg"},
        {"OpenFolder", ":/browse/open-folder.svg"},
        {"Server", ":/browse/server.svg"},
    };
    return files;
}

QIcon BrowseImages::Image(const std::string& key) {
    const auto loaded = loaded_.find(key);
    if (loaded != loaded_.end()) {
        return loaded->second;
    }
    const auto file = Files().find(key);
    QIcon icon = file == Files().end() ? QIcon() : QIcon(QString::fromLatin1(file->second));
    loaded_.emplace(key, icon);
    return icon;
}

}  // namespace cv
