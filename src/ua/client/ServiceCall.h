#pragma once

#include <functional>
#include <memory>

#include "ua/secure/SecureChannel.h"
#include "ua/services/ServiceMessages.h"

namespace cv::ua {

// Sends one typed request over a secure channel and hands back the typed
// response, or the error (time-out, fault, bad service result, broken
// connection, malformed answer). An answer that cannot be decoded, or that
// belongs to another request, also ends the connection: client and server
// no longer agree on what is being said.
inline bool IsGarbled(StatusCode status) {
    return status == status::BadDecodingError || status == status::BadEncodingLimitsExceeded ||
           status == status::BadUnknownResponse;
}

template <class Request, class Response>
void CallService(SecureChannel& channel, Request request, uint32_t timeoutMs,
                 std::function<void(Result<Response>)> done) {
    request.header.timestamp = DateTime::Now();
    request.header.timeoutHint = timeoutMs;
    const std::string_view service = ServiceName(Request::kEncodingId);
    const uint32_t handle = request.header.requestHandle;
    const DecodeLimits limits = channel.Limits();
    channel.Send(EncodeMessage(request), service, timeoutMs,
                 [weak = channel.weak_from_this(), done = std::move(done), service, handle,
                  limits](Result<std::string> body) {
                     if (!body) {
                         done(body.Failure());
                         return;
                     }
                     auto response = DecodeResponse<Response>(body.Value(), service, limits);
                     if (response && response.Value().header.requestHandle != handle) {
                         response = Error{status::BadUnknownResponse,
                                          "The server answered the " + std::string(service) +
                                              " request with another request's handle."};
                     }
                     const bool garbled = !response && IsGarbled(response.Failure().status);
                     const Error failure = response ? Error{} : response.Failure();
                     done(std::move(response));
                     if (auto open = weak.lock(); open && garbled) {
                         open->Break(failure);
                     }
                 });
}

}  // namespace cv::ua
