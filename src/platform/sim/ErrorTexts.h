#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "platform/ErrorInfo.h"
#include "platform/opc/OpcResult.h"

namespace cv::sim {

// Results the simulated servers give besides the automation interface's own.
namespace SimResult {
// A server without a browser for its address space.
inline constexpr int32_t E_NOINTERFACE = platform::Hresult(0x80004002);
// A group that cannot be connected to the client's notifications.
inline constexpr int32_t CONNECT_E_CANNOTCONNECT = platform::Hresult(0x80040202);
}  // namespace SimResult

// The server's text for a result code, as GetErrorString answers it;
// nothing for a code the servers do not know.
std::optional<std::string> ErrorText(int32_t code);
// A failure with the server's text for it.
ErrorInfo ServerError(int32_t code);

}  // namespace cv::sim
