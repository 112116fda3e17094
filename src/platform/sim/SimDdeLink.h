#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "platform/DdeLink.h"
#include "platform/sim/SimDdeServers.h"

namespace cv::sim {

// A DDE client link to the simulated applications. A conversation starts
// when the mode leaves none: an application that is missing or does not
// answer fails with 282, a topic it does not have with 297. An item it does
// not have fails with 285 on an automatic link, a request or a poke; an
// application that answers late lets them wait the link's time-out (events
// run meanwhile) and fail with 286.
class SimDdeLink : public platform::DdeLink {
  public:
    explicit SimDdeLink(std::shared_ptr<SimDdeServers::State> state) : state_(std::move(state)) {}

    ErrorInfo SetLinkTopic(const std::string& sTopic) override;
    ErrorInfo SetLinkItem(const std::string& sItem) override;
    void SetLinkTimeout(int32_t lTenths) override { timeoutTenths_ = lTenths; }
    ErrorInfo SetLinkMode(int32_t lMode) override;
    ErrorInfo LinkRequest() override;
    void SetText(const std::string& sText) override { text_ = sText; }
    ErrorInfo LinkPoke() override;
    std::string Text() const override;

  private:
    ErrorInfo Initiate();
    // The item's key when the application answers in time and has it.
    ErrorInfo Reach(std::string& key);

    std::shared_ptr<SimDdeServers::State> state_;
    std::string topic_;
    std::string item_;
    int32_t timeoutTenths_ = 50;
    int32_t mode_ = platform::DdeLinkMode::None;
    std::string text_;
    const DdeAppSpec* app_ = nullptr;
    std::string topicName_;
};

}  // namespace cv::sim
