#include "platform/fake/ScriptedOpc.h"

#include <algorithm>

#include "platform/fake/ScriptedOpcServer.h"

namespace cv::fake {

ErrorInfo ScriptedOpc::CreateServer(std::unique_ptr<platform::OPCServer>& cServer) {
    if (ErrorInfo error = Call("CreateServer")) {
        return error;
    }
    cServer = std::make_unique<ScriptedOpcServer>(*this);
    return {};
}

ErrorInfo ScriptedOpc::Call(const std::string& name) {
    calls.push_back(name);
    if (!interruptAt.empty() && name == interruptAt) {
        interruptAt.clear();
        interruption();
    }
    const auto failure = failures.find(name);
    if (failure == failures.end()) {
        return {};
    }
    return {failure->second, "Scripted failure of " + name};
}

int ScriptedOpc::Count(const std::string& name) const {
    return static_cast<int>(std::count(calls.begin(), calls.end(), name));
}

}  // namespace cv::fake
