#pragma once

#include <cstdint>

namespace cv::platform {

// HRESULTs of the automation interface as signed 32-bit numbers, as the
// client and the diagnosis compare them.
constexpr int32_t Hresult(uint32_t code) {
    return static_cast<int32_t>(code);
}

namespace OpcResult {
inline constexpr int32_t S_OK = 0;
inline constexpr int32_t E_NOTIMPL = Hresult(0x80004001);
inline constexpr int32_t E_FAIL = Hresult(0x80004005);
inline constexpr int32_t E_ACCESSDENIED = Hresult(0x80070005);
inline constexpr int32_t E_INVALIDARG = Hresult(0x80070057);
inline constexpr int32_t RPC_E_DISCONNECTED = Hresult(0x80010108);
inline constexpr int32_t RPC_E_TIMEOUT = Hresult(0x8001011F);
inline constexpr int32_t RPC_S_SERVER_UNAVAILABLE = Hresult(0x800706BA);
inline constexpr int32_t CO_E_SERVER_EXEC_FAILURE = Hresult(0x80080005);
inline constexpr int32_t OPC_E_INVALIDHANDLE = Hresult(0xC0040001);
inline constexpr int32_t OPC_E_BADTYPE = Hresult(0xC0040004);
inline constexpr int32_t OPC_E_PUBLIC = Hresult(0xC0040005);
inline constexpr int32_t OPC_E_BADRIGHTS = Hresult(0xC0040006);
inline constexpr int32_t OPC_E_UNKNOWNITEMID = Hresult(0xC0040007);
inline constexpr int32_t OPC_E_INVALIDITEMID = Hresult(0xC0040008);
inline constexpr int32_t OPC_E_UNKNOWNPATH = Hresult(0xC004000A);
inline constexpr int32_t OPC_E_RANGE = Hresult(0xC004000B);
inline constexpr int32_t OPC_E_DUPLICATENAME = Hresult(0xC004000C);
inline constexpr int32_t OPC_E_NOTSUPPORTED = Hresult(0xC0040406);
// The client's own codes: the server object cannot be created, and a group
// cannot be subscribed to change notifications.
inline constexpr int32_t CannotCreateServer = Hresult(0xC00400FF);
inline constexpr int32_t CannotSubscribe = Hresult(0xC00400FE);
}  // namespace OpcResult

// The data source of a synchronous read.
namespace OpcDataSource {
inline constexpr int16_t Cache = 1;
inline constexpr int16_t Device = 2;
}  // namespace OpcDataSource

}  // namespace cv::platform
