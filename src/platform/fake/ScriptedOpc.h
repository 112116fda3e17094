#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "platform/ErrorInfo.h"
#include "platform/Variant.h"
#include "platform/opc/OpcServerFactory.h"

namespace cv::fake {

// An automation interface scripted by the test. Every call answers at once
// (nothing waits), is recorded by name, and fails with the code the script
// gives that name. Items are always added; reads answer readValue and
// readQuality for every item, or the error the script gives its server
// handle, for at most answeredItems items when that is 0 or more. The
// first call named interruptAt runs interruption before it answers, as an
// event would while the call waits. The script must outlive the objects it
// creates.
class ScriptedOpc : public platform::OpcServerFactory {
  public:
    ErrorInfo CreateServer(std::unique_ptr<platform::OPCServer>& cServer) override;

    // Records the call; answers the failure scripted for it.
    ErrorInfo Call(const std::string& name);
    int Count(const std::string& name) const;

    std::vector<std::string> calls;
    std::map<std::string, int32_t> failures;
    std::map<int32_t, int32_t> itemErrors;
    int32_t answeredItems = -1;
    Variant readValue = Variant::R8(1);
    int32_t readQuality = 0xC0;
    std::vector<Variant> written;
    int32_t nextServerHandle = 1;
    std::string interruptAt;
    std::function<void()> interruption;
};

}  // namespace cv::fake
