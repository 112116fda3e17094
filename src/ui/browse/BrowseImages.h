#pragma once

#include <map>
#include <string>

#include <QIcon>

namespace cv {

// The pictures of the browsers' trees, by the names the trees use
// ("OpcServer", "ClosedFolder", "Domain", ...). They are drawn as SVG, so
// they stay sharp at any screen scale. An unknown name gives no picture.
class BrowseImages {
  public:
    QIcon Image(const std::string& key);

    // Every name there is a picture for.
    static const std::map<std::string, const char*>& Files();

  private:
    std::map<std::string, QIcon> loaded_;
};

}  // namespace cv
