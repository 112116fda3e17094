#pragma once

#include <QMessageBox>
#include <QPointer>
#include <map>
#include <string>

#include "platform/ModelessMessages.h"

namespace cv::qtui {

// Modeless message windows as message boxes that do not block: each stays
// open until the user presses its button or its owner closes it.
class QtModelessMessages : public platform::ModelessMessages {
  public:
    explicit QtModelessMessages(std::string defaultTitle);
    ~QtModelessMessages() override;
    QtModelessMessages(const QtModelessMessages&) = delete;
    QtModelessMessages& operator=(const QtModelessMessages&) = delete;

    WindowId Launch(const std::string& sTitle, const std::string& sText,
                    const std::string& sButton) override;
    void Close(WindowId id) override;

  private:
    std::string defaultTitle_;
    std::map<WindowId, QPointer<QMessageBox>> windows_;
    WindowId lastId_ = 0;
};

}  // namespace cv::qtui
