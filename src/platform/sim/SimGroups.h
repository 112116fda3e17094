#pragma once

#include <memory>

#include "platform/opc/OPCGroups.h"
#include "platform/sim/Connection.h"

namespace cv::sim {

// The OPCGroups of a simulated server object.
class SimGroups : public platform::OPCGroups {
  public:
    explicit SimGroups(std::shared_ptr<Connection> connection)
        : connection_(std::move(connection)) {}

    int32_t Count() const override { return connection_->GroupCount(); }
    ErrorInfo Add(const std::string& sName, std::shared_ptr<platform::OPCGroup>& cGroup) override;
    ErrorInfo Remove(const std::string& sName) override;
    ErrorInfo RemoveAll() override;

  private:
    std::shared_ptr<Connection> connection_;
};

}  // namespace cv::sim
