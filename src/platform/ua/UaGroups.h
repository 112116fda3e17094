#pragma once

#include <memory>

#include "platform/opc/OPCGroups.h"
#include "platform/ua/UaConnection.h"

namespace cv::uaopc {

// The OPCGroups of an OPC UA server object: its subscriptions.
class UaGroups : public platform::OPCGroups {
  public:
    explicit UaGroups(std::shared_ptr<UaConnection> connection)
        : connection_(std::move(connection)) {}

    int32_t Count() const override { return connection_->GroupCount(); }
    ErrorInfo Add(const std::string& sName, std::shared_ptr<platform::OPCGroup>& cGroup) override;
    ErrorInfo Remove(const std::string& sName) override;
    ErrorInfo RemoveAll() override;

  private:
    std::shared_ptr<UaConnection> connection_;
};

}  // namespace cv::uaopc
