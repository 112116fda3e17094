#include "platform/sim/SimDdeLink.h"

#include <algorithm>
#include <cctype>

namespace cv::sim {

namespace {

bool SameName(const std::string& a, const std::string& b) {
    return std::equal(a.begin(), a.end(), b.begin(), b.end(), [](unsigned char x, unsigned char y) {
        return std::toupper(x) == std::toupper(y);
    });
}

const ErrorInfo kNoAnswer{platform::DdeError::NoAnswer,
                          "No foreign application responded to a DDE initiate"};

}  // namespace

ErrorInfo SimDdeLink::SetLinkTopic(const std::string& sTopic) {
    topic_ = sTopic;
    if (mode_ == platform::DdeLinkMode::None) {
        return {};
    }
    const int32_t mode = mode_;
    mode_ = platform::DdeLinkMode::None;
    return SetLinkMode(mode);
}

ErrorInfo SimDdeLink::SetLinkItem(const std::string& sItem) {
    item_ = sItem;
    std::string key;
    return mode_ == platform::DdeLinkMode::Automatic ? Reach(key) : ErrorInfo{};
}

ErrorInfo SimDdeLink::SetLinkMode(int32_t lMode) {
    if (lMode == platform::DdeLinkMode::None) {
        mode_ = lMode;
        app_ = nullptr;
        return {};
    }
    if (mode_ == platform::DdeLinkMode::None) {
        if (ErrorInfo error = Initiate()) {
            return error;
        }
    }
    mode_ = lMode;
    std::string key;
    if (lMode == platform::DdeLinkMode::Automatic) {
        if (ErrorInfo error = Reach(key)) {
            mode_ = platform::DdeLinkMode::None;
            return error;
        }
    }
    return {};
}

ErrorInfo SimDdeLink::Initiate() {
    const size_t bar = topic_.find('|');
    const SimDdeServers::State& state = *state_;
    const DdeAppSpec* app = state.FindApp(topic_.substr(0, bar));
    if (bar == std::string::npos || app == nullptr || app->answer == DdeAnswer::Never) {
        return kNoAnswer;
    }
    const std::string topic = topic_.substr(bar + 1);
    const auto found = std::find_if(app->topics.begin(), app->topics.end(),
                                    [&](const DdeTopicSpec& t) { return SameName(t.name, topic); });
    if (found == app->topics.end()) {
        return {platform::DdeError::TopicUnknown, "The DDE application does not know the topic"};
    }
    app_ = app;
    topicName_ = found->name;
    return {};
}

ErrorInfo SimDdeLink::Reach(std::string& key) {
    if (app_ == nullptr) {
        return kNoAnswer;
    }
    if (app_->answer == DdeAnswer::Late) {
        const auto waitMs = static_cast<uint32_t>(std::max(timeoutTenths_, 0)) * 100U;
        const std::shared_ptr<SimDdeServers::State> state = state_;
        state->events.WaitUntil([] { return false; }, waitMs);
        return {platform::DdeError::TimedOut, "Timeout while waiting for DDE response"};
    }
    key = SimDdeServers::State::Key(app_->name, topicName_, item_);
    if (state_->texts.count(key) == 0) {
        return {platform::DdeError::ItemRefused, "The DDE application refused the item"};
    }
    return {};
}

ErrorInfo SimDdeLink::LinkRequest() {
    std::string key;
    if (ErrorInfo error = Reach(key)) {
        return error;
    }
    text_ = state_->texts[key];
    return {};
}

ErrorInfo SimDdeLink::LinkPoke() {
    std::string key;
    if (ErrorInfo error = Reach(key)) {
        return error;
    }
    state_->texts[key] = text_;
    return {};
}

std::string SimDdeLink::Text() const {
    if (mode_ != platform::DdeLinkMode::Automatic || app_ == nullptr) {
        return text_;
    }
    const auto found = state_->texts.find(SimDdeServers::State::Key(app_->name, topicName_, item_));
    return found == state_->texts.end() ? text_ : found->second;
}

}  // namespace cv::sim
