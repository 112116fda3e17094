#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "ua/encoding/Decoder.h"
#include "ua/encoding/Encoder.h"
#include "ua/services/ServiceHeaders.h"

namespace cv::ua {

// "Read" for the encoding id of ReadRequest; "request" for unknown ids.
std::string_view ServiceName(uint16_t requestEncodingId);

// A message body: the structure's encoding id, then the structure.
template <class T>
std::string EncodeMessage(const T& message) {
    std::string body;
    Encoder encoder(body);
    encoder(NodeId(0, uint32_t{T::kEncodingId}));
    encoder(message);
    return body;
}

// The error for a response whose service result is bad or for a fault.
Error ServiceError(std::string_view service, StatusCode result);

// Reads the answer to a request of the named service: the expected response
// (whose service result must not be bad) or a ServiceFault, which becomes
// the error it carries.
template <class Response>
Result<Response> DecodeResponse(std::string_view body, std::string_view service,
                                const DecodeLimits& limits) {
    Decoder decoder(body, limits);
    NodeId typeId;
    decoder(typeId);
    if (typeId == NodeId(0, uint32_t{ServiceFault::kEncodingId})) {
        ServiceFault fault;
        decoder(fault);
        return decoder.Ok() ? ServiceError(service, fault.header.serviceResult) : decoder.Failure();
    }
    if (decoder.Ok() && typeId != NodeId(0, uint32_t{Response::kEncodingId})) {
        return Error{status::BadUnknownResponse, "The server answered the " + std::string(service) +
                                                     " request with a message of another type."};
    }
    Response response;
    decoder(response);
    if (decoder.Ok() && decoder.Remaining() != 0) {
        decoder.Fail("there are bytes after the end of the response");
    }
    if (!decoder.Ok()) {
        return decoder.Failure();
    }
    if (response.header.serviceResult.IsBad()) {
        return ServiceError(service, response.header.serviceResult);
    }
    return response;
}

}  // namespace cv::ua
