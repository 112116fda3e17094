#include "ua/types/StatusCodeTable.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstdio>

namespace cv::ua {
namespace {

struct Entry {
    uint32_t code;
    std::string_view name;
    std::string_view text;
};

// Sorted by code for the binary search below.
constexpr std::array kEntries = std::to_array<Entry>({
    {0x00000000, "Good", "The operation succeeded."},
    {0x002D0000, "Good_SubscriptionTransferred", "The subscription was moved to another session."},
    {0x002E0000, "Good_CompletesAsynchronously", "The operation will finish later."},
    {0x002F0000, "Good_Overload", "Sampling slowed down because the server is overloaded."},
    {0x00300000, "Good_Clamped", "The written value was clamped to the allowed range."},
    {0x00960000, "Good_LocalOverride", "The value is overridden locally."},
    {0x40000000, "Uncertain", "The value is uncertain; no reason is given."},
    {0x408F0000, "Uncertain_NoCommunicationLastUsableValue",
     "Communication failed; this is the last value that could be used."},
    {0x40900000, "Uncertain_LastUsableValue",
     "The source stopped updating; this is the last value that could be used."},
    {0x40910000, "Uncertain_SubstituteValue", "The value is a substitute for the real one."},
    {0x40920000, "Uncertain_InitialValue", "The value is an initial value, not yet measured."},
    {0x40930000, "Uncertain_SensorNotAccurate", "The sensor reading is not accurate."},
    {0x40940000, "Uncertain_EngineeringUnitsExceeded",
     "The value lies outside its engineering range."},
    {0x40950000, "Uncertain_SubNormal", "The value comes from fewer sources than needed."},
    {0x80000000, "Bad", "The value is bad; no reason is given."},
    {0x80010000, "Bad_UnexpectedError", "An unexpected error occurred."},
    {0x80020000, "Bad_InternalError", "An internal error occurred in the software."},
    {0x80030000, "Bad_OutOfMemory", "There was not enough memory for the operation."},
    {0x80040000, "Bad_ResourceUnavailable", "A resource the operation needs is unavailable."},
    {0x80050000, "Bad_CommunicationError", "A low-level communication error occurred."},
    {0x80060000, "Bad_EncodingError", "The message could not be encoded."},
    {0x80070000, "Bad_DecodingError", "The message could not be decoded."},
    {0x80080000, "Bad_EncodingLimitsExceeded", "The message exceeds an encoding limit."},
    {0x80090000, "Bad_UnknownResponse", "The response does not belong to a request sent."},
    {0x800A0000, "Bad_Timeout", "The operation timed out."},
    {0x800B0000, "Bad_ServiceUnsupported", "The server does not support the service."},
    {0x800C0000, "Bad_Shutdown", "The operation stopped because the server is shutting down."},
    {0x800D0000, "Bad_ServerNotConnected", "The server is not connected."},
    {0x800E0000, "Bad_ServerHalted", "The server has stopped and cannot handle requests."},
    {0x800F0000, "Bad_NothingToDo", "The request asked for nothing."},
    {0x80100000, "Bad_TooManyOperations", "The request asks for too many operations."},
    {0x80110000, "Bad_DataTypeIdUnknown", "The data type is not known to the server."},
    {0x80120000, "Bad_CertificateInvalid", "The certificate is not valid."},
    {0x80130000, "Bad_SecurityChecksFailed", "A security check failed."},
    {0x80140000, "Bad_CertificateTimeInvalid", "The certificate has expired or is not valid yet."},
    {0x80160000, "Bad_CertificateHostNameInvalid",
     "The certificate does not name the host used to reach the server."},
    {0x80170000, "Bad_CertificateUriInvalid",
     "The application URI does not match the one in the certificate."},
    {0x80180000, "Bad_CertificateUseNotAllowed", "The certificate may not be used for this."},
    {0x801A0000, "Bad_CertificateUntrusted", "The certificate is not trusted."},
    {0x801F0000, "Bad_UserAccessDenied", "The user has no right to do this."},
    {0x80200000, "Bad_IdentityTokenInvalid", "The user identity token is not valid."},
    {0x80210000, "Bad_IdentityTokenRejected", "The server refused the user identity token."},
    {0x80220000, "Bad_SecureChannelIdInvalid", "The secure channel id is not valid."},
    {0x80230000, "Bad_InvalidTimestamp", "The time stamp lies outside the allowed range."},
    {0x80240000, "Bad_NonceInvalid", "The nonce is missing, too short or used before."},
    {0x80250000, "Bad_SessionIdInvalid", "The session is not known to the server."},
    {0x80260000, "Bad_SessionClosed", "The session was closed."},
    {0x80270000, "Bad_SessionNotActivated", "The session has not been activated."},
    {0x80280000, "Bad_SubscriptionIdInvalid", "The subscription is not known to the server."},
    {0x802A0000, "Bad_RequestHeaderInvalid", "The request header is missing or not valid."},
    {0x802B0000, "Bad_TimestampsToReturnInvalid", "The time stamps to return are not valid."},
    {0x802C0000, "Bad_RequestCancelledByClient", "The client cancelled the request."},
    {0x80310000, "Bad_NoCommunication", "There is no communication with the data source."},
    {0x80320000, "Bad_WaitingForInitialData", "The server is waiting for the first value."},
    {0x80330000, "Bad_NodeIdInvalid", "The node id is not well formed."},
    {0x80340000, "Bad_NodeIdUnknown", "The node id refers to a node that does not exist."},
    {0x80350000, "Bad_AttributeIdInvalid", "The node has no such attribute."},
    {0x80360000, "Bad_IndexRangeInvalid", "The index range is not well formed."},
    {0x80370000, "Bad_IndexRangeNoData", "The index range selects no data."},
    {0x80380000, "Bad_DataEncodingInvalid", "The data encoding is not valid."},
    {0x80390000, "Bad_DataEncodingUnsupported", "The server does not offer this encoding."},
    {0x803A0000, "Bad_NotReadable", "The access level does not allow reading."},
    {0x803B0000, "Bad_NotWritable", "The access level does not allow writing."},
    {0x803C0000, "Bad_OutOfRange", "The value is out of range."},
    {0x803D0000, "Bad_NotSupported", "The server does not support this."},
    {0x803E0000, "Bad_NotFound", "Nothing was found."},
    {0x803F0000, "Bad_ObjectDeleted", "The object has been deleted."},
    {0x80400000, "Bad_NotImplemented", "The server has not implemented this."},
    {0x80410000, "Bad_MonitoringModeInvalid", "The monitoring mode is not valid."},
    {0x80420000, "Bad_MonitoredItemIdInvalid", "The monitored item is not known."},
    {0x80430000, "Bad_MonitoredItemFilterInvalid", "The monitoring filter is not valid."},
    {0x80440000, "Bad_MonitoredItemFilterUnsupported", "The server does not offer the filter."},
    {0x80450000, "Bad_FilterNotAllowed", "A filter cannot be used here."},
    {0x804A0000, "Bad_ContinuationPointInvalid", "The continuation point is no longer valid."},
    {0x804B0000, "Bad_NoContinuationPoints", "The server has no continuation points left."},
    {0x804C0000, "Bad_ReferenceTypeIdInvalid", "The reference type is not valid."},
    {0x804D0000, "Bad_BrowseDirectionInvalid", "The browse direction is not valid."},
    {0x804E0000, "Bad_NodeNotInView", "The node is not part of the view."},
    {0x80530000, "Bad_RequestTypeInvalid", "The security token request type is not valid."},
    {0x80540000, "Bad_SecurityModeRejected", "The server refused the security mode."},
    {0x80550000, "Bad_SecurityPolicyRejected", "The server refused the security policy."},
    {0x80560000, "Bad_TooManySessions", "The server has reached its number of sessions."},
    {0x80570000, "Bad_UserSignatureInvalid", "The user token signature is missing or not valid."},
    {0x80580000, "Bad_ApplicationSignatureInvalid",
     "The signature of the application is missing or not valid."},
    {0x80600000, "Bad_BrowseNameInvalid", "The browse name is not valid."},
    {0x806F0000, "Bad_NoMatch", "No node matches the browse path."},
    {0x80700000, "Bad_MaxAgeInvalid", "The maximum age is not valid."},
    {0x80730000, "Bad_WriteNotSupported",
     "The server does not support writing this combination of value, status and time stamps."},
    {0x80740000, "Bad_TypeMismatch", "The value does not have the data type of the node."},
    {0x80770000, "Bad_TooManySubscriptions", "The session has too many subscriptions."},
    {0x80780000, "Bad_TooManyPublishRequests", "The server holds too many publish requests."},
    {0x80790000, "Bad_NoSubscription", "The session has no subscription."},
    {0x807A0000, "Bad_SequenceNumberUnknown", "The sequence number is not known to the server."},
    {0x807B0000, "Bad_MessageNotAvailable", "The requested message is no longer available."},
    {0x807D0000, "Bad_TcpServerTooBusy", "The server is too busy to accept the connection."},
    {0x807E0000, "Bad_TcpMessageTypeInvalid", "The message type is not valid."},
    {0x807F0000, "Bad_TcpSecureChannelUnknown", "The secure channel is not known."},
    {0x80800000, "Bad_TcpMessageTooLarge", "The message is larger than agreed."},
    {0x80810000, "Bad_TcpNotEnoughResources", "There are not enough resources for the request."},
    {0x80820000, "Bad_TcpInternalError", "An internal error occurred in the transport."},
    {0x80830000, "Bad_TcpEndpointUrlInvalid", "The server does not know the endpoint URL."},
    {0x80840000, "Bad_RequestInterrupted", "The request was interrupted by a network error."},
    {0x80850000, "Bad_RequestTimeout", "The request timed out."},
    {0x80860000, "Bad_SecureChannelClosed", "The secure channel was closed."},
    {0x80870000, "Bad_SecureChannelTokenUnknown", "The security token is not known or expired."},
    {0x80880000, "Bad_SequenceNumberInvalid", "The sequence number is not valid."},
    {0x80890000, "Bad_ConfigurationError", "The data source is not configured correctly."},
    {0x808A0000, "Bad_NotConnected", "The data source is not connected."},
    {0x808B0000, "Bad_DeviceFailure", "The device has failed."},
    {0x808C0000, "Bad_SensorFailure", "The sensor has failed."},
    {0x808D0000, "Bad_OutOfService", "The data source is out of service."},
    {0x80AB0000, "Bad_InvalidArgument", "An argument is not valid."},
    {0x80AC0000, "Bad_ConnectionRejected", "The server refused the connection."},
    {0x80AD0000, "Bad_Disconnect", "The connection was closed on purpose."},
    {0x80AE0000, "Bad_ConnectionClosed", "The connection was closed."},
    {0x80AF0000, "Bad_InvalidState", "The operation is not allowed in this state."},
    {0x80B80000, "Bad_RequestTooLarge", "The request is larger than the server accepts."},
    {0x80B90000, "Bad_ResponseTooLarge", "The response is larger than the client accepts."},
    {0x80BE0000, "Bad_ProtocolVersionUnsupported", "The protocol version is not supported."},
});

static_assert(std::is_sorted(kEntries.begin(), kEntries.end(),
                             [](const Entry& a, const Entry& b) { return a.code < b.code; }));

const Entry* Find(StatusCode status) {
    const uint32_t code = status.WithoutInfoBits().code;
    const auto* it = std::lower_bound(kEntries.begin(), kEntries.end(), code,
                                      [](const Entry& e, uint32_t c) { return e.code < c; });
    return it != kEntries.end() && it->code == code ? it : nullptr;
}

}  // namespace

std::string_view StatusCodeName(StatusCode status) {
    const Entry* entry = Find(status);
    if (entry) {
        return entry->name;
    }
    return status.IsGood() ? "Good" : status.IsUncertain() ? "Uncertain" : "Bad";
}

std::string_view StatusCodeText(StatusCode status) {
    const Entry* entry = Find(status);
    return entry ? entry->text : "The code is not known to this program.";
}

std::string DescribeStatusCode(StatusCode status) {
    if (Find(status)) {
        return std::string(StatusCodeName(status)) + ": " + std::string(StatusCodeText(status));
    }
    char hex[16];
    std::snprintf(hex, sizeof hex, "0x%08X", status.code);
    return std::string(StatusCodeName(status)) + " (" + hex +
           "): " + std::string(StatusCodeText(status));
}

}  // namespace cv::ua
