#pragma once

#include <compare>
#include <cstdint>

namespace cv::ua {

// A status code as it travels: the severity in the top two bits (00 good,
// 01 uncertain, 10 and 11 bad), the code in bits 16-29 and flags below.
struct StatusCode {
    uint32_t code = 0;

    constexpr bool IsGood() const { return (code & 0xC0000000u) == 0; }
    constexpr bool IsUncertain() const { return (code & 0xC0000000u) == 0x40000000u; }
    constexpr bool IsBad() const { return (code & 0x80000000u) != 0; }
    // The code without the info bits, for comparing with the table.
    constexpr StatusCode WithoutInfoBits() const { return {code & 0xFFFF0000u}; }
    auto operator<=>(const StatusCode&) const = default;
};

// The codes this library produces or acts on. Names follow the OPC UA table.
namespace status {
inline constexpr StatusCode Good{0x00000000};
inline constexpr StatusCode GoodLocalOverride{0x00960000};
inline constexpr StatusCode Uncertain{0x40000000};
inline constexpr StatusCode Bad{0x80000000};
inline constexpr StatusCode BadUnexpectedError{0x80010000};
inline constexpr StatusCode BadInternalError{0x80020000};
inline constexpr StatusCode BadCommunicationError{0x80050000};
inline constexpr StatusCode BadEncodingError{0x80060000};
inline constexpr StatusCode BadDecodingError{0x80070000};
inline constexpr StatusCode BadEncodingLimitsExceeded{0x80080000};
inline constexpr StatusCode BadUnknownResponse{0x80090000};
inline constexpr StatusCode BadTimeout{0x800A0000};
inline constexpr StatusCode BadServiceUnsupported{0x800B0000};
inline constexpr StatusCode BadShutdown{0x800C0000};
inline constexpr StatusCode BadServerNotConnected{0x800D0000};
inline constexpr StatusCode BadServerHalted{0x800E0000};
inline constexpr StatusCode BadNothingToDo{0x800F0000};
inline constexpr StatusCode BadCertificateInvalid{0x80120000};
inline constexpr StatusCode BadSecurityChecksFailed{0x80130000};
inline constexpr StatusCode BadCertificateTimeInvalid{0x80140000};
inline constexpr StatusCode BadCertificateHostNameInvalid{0x80160000};
inline constexpr StatusCode BadCertificateUriInvalid{0x80170000};
inline constexpr StatusCode BadCertificateUseNotAllowed{0x80180000};
inline constexpr StatusCode BadCertificateUntrusted{0x801A0000};
inline constexpr StatusCode BadUserAccessDenied{0x801F0000};
inline constexpr StatusCode BadIdentityTokenInvalid{0x80200000};
inline constexpr StatusCode BadIdentityTokenRejected{0x80210000};
inline constexpr StatusCode BadSecureChannelIdInvalid{0x80220000};
inline constexpr StatusCode BadNonceInvalid{0x80240000};
inline constexpr StatusCode BadSessionIdInvalid{0x80250000};
inline constexpr StatusCode BadSessionClosed{0x80260000};
inline constexpr StatusCode BadSessionNotActivated{0x80270000};
inline constexpr StatusCode BadSubscriptionIdInvalid{0x80280000};
inline constexpr StatusCode BadRequestCancelledByClient{0x802C0000};
inline constexpr StatusCode BadNodeIdInvalid{0x80330000};
inline constexpr StatusCode BadNodeIdUnknown{0x80340000};
inline constexpr StatusCode BadNotReadable{0x803A0000};
inline constexpr StatusCode BadNotWritable{0x803B0000};
inline constexpr StatusCode BadOutOfRange{0x803C0000};
inline constexpr StatusCode BadNotSupported{0x803D0000};
inline constexpr StatusCode BadContinuationPointInvalid{0x804A0000};
inline constexpr StatusCode BadSecurityModeRejected{0x80540000};
inline constexpr StatusCode BadSecurityPolicyRejected{0x80550000};
inline constexpr StatusCode BadUserSignatureInvalid{0x80570000};
inline constexpr StatusCode BadApplicationSignatureInvalid{0x80580000};
inline constexpr StatusCode BadTypeMismatch{0x80740000};
inline constexpr StatusCode BadTooManyPublishRequests{0x80780000};
inline constexpr StatusCode BadNoSubscription{0x80790000};
inline constexpr StatusCode BadSequenceNumberUnknown{0x807A0000};
inline constexpr StatusCode BadMessageNotAvailable{0x807B0000};
inline constexpr StatusCode BadTcpMessageTypeInvalid{0x807E0000};
inline constexpr StatusCode BadTcpSecureChannelUnknown{0x807F0000};
inline constexpr StatusCode BadTcpMessageTooLarge{0x80800000};
inline constexpr StatusCode BadTcpInternalError{0x80820000};
inline constexpr StatusCode BadTcpEndpointUrlInvalid{0x80830000};
inline constexpr StatusCode BadRequestInterrupted{0x80840000};
inline constexpr StatusCode BadRequestTimeout{0x80850000};
inline constexpr StatusCode BadSecureChannelClosed{0x80860000};
inline constexpr StatusCode BadSecureChannelTokenUnknown{0x80870000};
inline constexpr StatusCode BadSequenceNumberInvalid{0x80880000};
inline constexpr StatusCode BadNotConnected{0x808A0000};
inline constexpr StatusCode BadInvalidArgument{0x80AB0000};
inline constexpr StatusCode BadConnectionRejected{0x80AC0000};
inline constexpr StatusCode BadConnectionClosed{0x80AE0000};
inline constexpr StatusCode BadInvalidState{0x80AF0000};
inline constexpr StatusCode BadRequestTooLarge{0x80B80000};
inline constexpr StatusCode BadResponseTooLarge{0x80B90000};
inline constexpr StatusCode BadProtocolVersionUnsupported{0x80BE0000};
}  // namespace status

}  // namespace cv::ua
