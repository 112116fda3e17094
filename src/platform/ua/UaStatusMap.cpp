#include "platform/ua/UaStatusMap.h"

#include <algorithm>
#include <array>
#include <utility>

#include "platform/opc/OpcResult.h"

namespace cv::uaopc {

namespace {

using namespace platform::OpcResult;

constexpr uint32_t kSeverityMask = 0xC0000000u;
constexpr uint32_t kLimitMask = 0x00000300u;
constexpr int32_t kQualityBad = 0x00;
constexpr int32_t kQualityUncertain = 0x40;
constexpr int32_t kQualityGood = 0xC0;

constexpr std::array<std::pair<uint32_t, int32_t>, 15> kQualities = {{
    {0x00000000, 0xC0},  // Good
    {0x00960000, 0xD8},  // Good_LocalOverride
    {0x40000000, 0x40},  // Uncertain
    {0x40900000, 0x44},  // Uncertain_LastUsableValue
    {0x40930000, 0x50},  // Uncertain_SensorNotAccurate
    {0x40940000, 0x54},  // Uncertain_EngineeringUnitsExceeded
    {0x40950000, 0x58},  // Uncertain_SubNormal
    {0x80000000, 0x00},  // Bad
    {0x80890000, 0x04},  // Bad_ConfigurationError
    {0x808A0000, 0x08},  // Bad_NotConnected
    {0x808B0000, 0x0C},  // Bad_DeviceFailure
    {0x808C0000, 0x10},  // Bad_SensorFailure
    {0x80310000, 0x18},  // Bad_NoCommunication
    {0x808D0000, 0x1C},  // Bad_OutOfService
    {0x80320000, 0x20},  // Bad_WaitingForInitialData
}};

// The first code of each Data Access error is the one GetErrorString names
// when no operation has shown which of them it was.
constexpr std::array<std::pair<uint32_t, int32_t>, 8> kResults = {{
    {0x80330000, OPC_E_INVALIDITEMID},  // Bad_NodeIdInvalid
    {0x80340000, OPC_E_UNKNOWNITEMID},  // Bad_NodeIdUnknown
    {0x803A0000, OPC_E_BADRIGHTS},      // Bad_NotReadable
    {0x803B0000, OPC_E_BADRIGHTS},      // Bad_NotWritable
    {0x801F0000, OPC_E_BADRIGHTS},      // Bad_UserAccessDenied
    {0x80740000, OPC_E_BADTYPE},        // Bad_TypeMismatch
    {0x803C0000, OPC_E_RANGE},          // Bad_OutOfRange
    {0x80730000, OPC_E_NOTSUPPORTED},   // Bad_WriteNotSupported
}};

}  // namespace

int32_t QualityOf(ua::StatusCode status) {
    const uint32_t code = status.WithoutInfoBits().code;
    const auto named = std::find_if(kQualities.begin(), kQualities.end(),
                                    [code](const auto& entry) { return entry.first == code; });
    int32_t quality = kQualityBad;
    if (named != kQualities.end()) {
        quality = named->second;
    } else if ((code & kSeverityMask) == 0) {
        quality = kQualityGood;
    } else if ((code & kSeverityMask) == 0x40000000u) {
        quality = kQualityUncertain;
    }
    return quality | static_cast<int32_t>((status.code & kLimitMask) >> 8);
}

int32_t HresultOf(ua::StatusCode status) {
    if (!status.IsBad()) {
        return 0;
    }
    const uint32_t code = status.WithoutInfoBits().code;
    const auto named = std::find_if(kResults.begin(), kResults.end(),
                                    [code](const auto& entry) { return entry.first == code; });
    return named != kResults.end() ? named->second : platform::Hresult(code);
}

bool IsOperationError(ua::StatusCode status) {
    const uint32_t code = status.WithoutInfoBits().code;
    return std::any_of(kResults.begin(), kResults.end(),
                       [code](const auto& entry) { return entry.first == code; });
}

std::optional<ua::StatusCode> StatusOfHresult(int32_t hresult) {
    const auto named = std::find_if(kResults.begin(), kResults.end(), [hresult](const auto& entry) {
        return entry.second == hresult;
    });
    if (named != kResults.end()) {
        return ua::StatusCode{named->first};
    }
    // UA codes have nothing in their low 16 bits once passed on (bad ones
    // as results, any as the status behind a value's quality); COM and Data
    // Access errors do.
    const ua::StatusCode status{static_cast<uint32_t>(hresult)};
    if (status.code == 0 || status.WithoutInfoBits() != status) {
        return std::nullopt;
    }
    return status;
}

std::optional<std::string> OwnErrorText(int32_t hresult) {
    switch (hresult) {
        case OPC_E_INVALIDHANDLE:
            return "The handle is not valid.";
        case OPC_E_UNKNOWNPATH:
            return "OPC UA servers have no access paths; leave the access path empty.";
        case OPC_E_DUPLICATENAME:
            return "The name is already in use.";
        case E_FAIL:
            return "The server cannot be reached or refused the connection.";
        case E_INVALIDARG:
            return "One or more arguments are not valid.";
        case RPC_E_DISCONNECTED:
            return "The connection to the server has ended.";
        case RPC_E_TIMEOUT:
            return "The server did not answer in time.";
        default:
            return std::nullopt;
    }
}

}  // namespace cv::uaopc
