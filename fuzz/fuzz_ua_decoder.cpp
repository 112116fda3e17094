// Feeds arbitrary bytes to the OPC UA decoding paths: the first byte picks
// the path, the rest is a received byte stream (cut into frames, joined into
// messages, decoded as every response the client knows) or one encoded
// value. Checks that what decodes encodes to a form that decodes to the
// same encoding again, that the reasons a server sends come out plain, that
// the memory a decoded value was charged is the least it decodes with, and
// that a decoded value survives the mapping to the automation interface (a
// ByteString as one buffer that maps back).

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

#include "platform/ua/UaValueMap.h"
#include "ua/encoding/Decoder.h"
#include "ua/encoding/Encoder.h"
#include "ua/secure/ChunkAssembler.h"
#include "ua/secure/NoneSecurityPolicy.h"
#include "ua/services/AttributeServices.h"
#include "ua/services/MonitoredItemServices.h"
#include "ua/services/ServiceMessages.h"
#include "ua/services/SessionServices.h"
#include "ua/services/SubscriptionServices.h"
#include "ua/services/ViewServices.h"
#include "ua/transport/TcpMessages.h"
#include "ua/types/PlainText.h"

namespace {

using namespace cv::ua;

void Check(bool bCondition) {
    if (!bCondition) {
        std::abort();
    }
}

DecodeLimits Limits() {
    DecodeLimits limits;
    limits.maxStringLength = 1u << 16;
    limits.maxArrayLength = 1u << 16;
    limits.maxAllocation = 1u << 20;
    return limits;
}

// Nothing of a plain text can steer a terminal, and making it plain again
// changes nothing (so it is well-formed UTF-8, without C1 or bidi controls).
void CheckPlain(std::string_view text) {
    const std::string plain = PlainText(text);
    Check(PlainText(plain) == plain);
    Check(std::none_of(plain.begin(), plain.end(),
                       [](char c) { return static_cast<unsigned char>(c) < 0x20 || c == 0x7F; }));
}

// One byte less than a value was charged refuses it.
template <class T>
void CheckCharge(std::string_view bytes) {
    Decoder decoder(bytes, Limits());
    T value{};
    decoder(value);
    if (!decoder.Ok() || decoder.Allocated() == 0) {
        return;
    }
    DecodeLimits tighter = Limits();
    tighter.maxAllocation = decoder.Allocated() - 1;
    Decoder refused(bytes, tighter);
    T again{};
    refused(again);
    Check(refused.Failure().status == status::BadEncodingLimitsExceeded);
}

template <class T>
void RoundTrip(std::string_view bytes) {
    auto decoded = Decode<T>(bytes, Limits());
    if (!decoded) {
        return;
    }
    const std::string encoded = Encode(decoded.Value());
    auto again = Decode<T>(encoded, Limits());
    Check(again.Ok());
    Check(Encode(again.Value()) == encoded);
    CheckCharge<T>(bytes);
}

void Map(std::string_view bytes) {
    auto decoded = Decode<Variant>(bytes, Limits());
    if (!decoded) {
        return;
    }
    const cv::Variant mapped = cv::uaopc::ToAutomation(decoded.Value());
    const ByteString* value = decoded.Value().Get<ByteString>();
    if (value == nullptr) {
        return;
    }
    if (value->bytes.size() > cv::uaopc::kMaxAutomationBytes) {
        Check(mapped.VarType() == cv::VT_BSTR);
        return;
    }
    Check(mapped.AsBytes().size() == value->bytes.size());
    Check(cv::uaopc::FromAutomation(mapped) == decoded.Value());
}

template <class... Responses>
void DecodeResponses(std::string_view body) {
    (DecodeResponse<Responses>(body, "fuzz", Limits()), ...);
}

void Stream(std::string_view bytes) {
    NoneSecurityPolicy policy;
    ChunkAssembler assembler(policy);
    // Small enough for a fuzzed stream to reach every limit.
    assembler.SetLimits(1u << 14, 64, 1u << 15);
    assembler.AcceptToken(1);
    FrameReader reader(1u << 16);
    reader.Append(bytes);
    for (;;) {
        auto frame = reader.Next();
        if (!frame || !frame.Value()) {
            return;
        }
        const MessageKind kind = frame.Value()->header.kind;
        if (kind == MessageKind::Acknowledge || kind == MessageKind::Error ||
            kind == MessageKind::Hello) {
            RoundTrip<AcknowledgeMessage>(
                std::string_view(frame.Value()->bytes).substr(kFrameHeaderSize));
            RoundTrip<ErrorMessage>(
                std::string_view(frame.Value()->bytes).substr(kFrameHeaderSize));
            if (auto error = Decode<ErrorMessage>(
                    std::string_view(frame.Value()->bytes).substr(kFrameHeaderSize), Limits())) {
                CheckPlain(error.Value().reason);
            }
            continue;
        }
        auto outcome = assembler.Add(std::move(*frame.Value()));
        if (!outcome) {
            return;
        }
        if (outcome.Value().aborted) {
            CheckPlain(outcome.Value().aborted->error.text);
        }
        if (outcome.Value().message) {
            DecodeResponses<OpenSecureChannelResponse, GetEndpointsResponse, FindServersResponse,
                            CreateSessionResponse, ActivateSessionResponse, CloseSessionResponse,
                            BrowseResponse, BrowseNextResponse, TranslateBrowsePathsResponse,
                            ReadResponse, WriteResponse, CreateSubscriptionResponse,
                            ModifySubscriptionResponse, DeleteSubscriptionsResponse,
                            CreateMonitoredItemsResponse, SetMonitoringModeResponse,
                            DeleteMonitoredItemsResponse, PublishResponse, RepublishResponse>(
                outcome.Value().message->body);
        }
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size == 0) {
        return 0;
    }
    const std::string_view bytes(reinterpret_cast<const char*>(data) + 1, size - 1);
    switch (data[0] % 4) {
        case 0:
            Stream(bytes);
            break;
        case 1:
            RoundTrip<Variant>(bytes);
            Map(bytes);
            break;
        case 2:
            RoundTrip<DataValue>(bytes);
            break;
        default:
            RoundTrip<PublishResponse>(bytes);
            break;
    }
    return 0;
}
