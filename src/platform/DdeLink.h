#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "platform/ErrorInfo.h"

namespace cv::platform {

// Link modes of a DDE link.
namespace DdeLinkMode {
inline constexpr int32_t None = 0;
inline constexpr int32_t Automatic = 1;  // the server sends every change
inline constexpr int32_t Manual = 2;     // values come only on request
}  // namespace DdeLinkMode

// Error numbers of a DDE conversation.
namespace DdeError {
inline constexpr int32_t NoAnswer = 282;      // no application answered the initiate
inline constexpr int32_t ItemRefused = 285;   // the application refused the item
inline constexpr int32_t TimedOut = 286;      // no answer within the link time-out
inline constexpr int32_t TopicUnknown = 297;  // the application does not know the topic
}  // namespace DdeError

// One DDE client link, as a label element holds it: a topic
// ("Application|Topic"), an item, a time-out, a mode and the element's text.
// Changing the mode from none starts the conversation; a request or an
// automatic link fills the text with the item's value; a poke sends the text.
// Calls that wait for the application let events run meanwhile.
class DdeLink {
  public:
    virtual ~DdeLink() = default;
    virtual ErrorInfo SetLinkTopic(const std::string& sTopic) = 0;
    virtual ErrorInfo SetLinkItem(const std::string& sItem) = 0;
    // In tenths of a second.
    virtual void SetLinkTimeout(int32_t lTenths) = 0;
    virtual ErrorInfo SetLinkMode(int32_t lMode) = 0;
    virtual ErrorInfo LinkRequest() = 0;
    virtual void SetText(const std::string& sText) = 0;
    virtual ErrorInfo LinkPoke() = 0;
    // The last value received (the automatic link's current value).
    virtual std::string Text() const = 0;
};

// Makes DDE links for channels and windows.
class DdeLinkFactory {
  public:
    virtual ~DdeLinkFactory() = default;
    virtual std::shared_ptr<DdeLink> CreateDdeLink() = 0;
};

}  // namespace cv::platform
