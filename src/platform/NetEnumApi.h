#pragma once

#include <cstdint>
#include <string>

namespace cv::platform {

// Scopes (RESOURCE_CONNECTED, RESOURCE_GLOBALNET, RESOURCE_REMEMBERED).
inline constexpr int32_t kResourceConnected = 1;
inline constexpr int32_t kResourceGlobalNet = 2;
inline constexpr int32_t kResourceRemembered = 3;

// Resource types (RESOURCETYPE_ANY, _DISK, _PRINT).
inline constexpr int32_t kResourceTypeAny = 0;
inline constexpr int32_t kResourceTypeDisk = 1;
inline constexpr int32_t kResourceTypePrint = 2;

// Usages, added together (RESOURCEUSAGE_CONNECTABLE, _CONTAINER, _ATTACHED,
// and _ALL for all three).
inline constexpr int32_t kResourceUsageConnectable = 0x01;
inline constexpr int32_t kResourceUsageContainer = 0x02;
inline constexpr int32_t kResourceUsageAttached = 0x10;
inline constexpr int32_t kResourceUsageAll = 0x13;

// How a resource is shown (RESOURCEDISPLAYTYPE_GENERIC, _DOMAIN, _SERVER,
// _SHARE, _NETWORK).
inline constexpr int32_t kDisplayTypeGeneric = 0;
inline constexpr int32_t kDisplayTypeDomain = 1;
inline constexpr int32_t kDisplayTypeServer = 2;
inline constexpr int32_t kDisplayTypeShare = 3;
inline constexpr int32_t kDisplayTypeNetwork = 6;

// Result codes of the network calls, with what they mean here.
inline constexpr int32_t kNetSuccess = 0;
// The computer refuses this user:
inline constexpr int32_t kNetErrorAccessDenied = 5;
// Not an open enumeration:
inline constexpr int32_t kNetErrorInvalidHandle = 6;
// The computer cannot be found or does not answer:
inline constexpr int32_t kNetErrorBadNetPath = 53;
// A scope, type or usage the enumeration does not know:
inline constexpr int32_t kNetErrorInvalidParameter = 87;
// The next record does not fit the caller's buffer:
inline constexpr int32_t kNetErrorMoreData = 234;
// The enumeration has given every record:
inline constexpr int32_t kNetErrorNoMoreItems = 259;
// No network provider by that name:
inline constexpr int32_t kNetErrorBadProvider = 1204;
// The resource holds no other resources:
inline constexpr int32_t kNetErrorNotContainer = 1207;
// The container is not on the network:
inline constexpr int32_t kNetErrorNoNetwork = 1222;

// One network resource as the enumeration hands it out (NETRESOURCE). An
// empty text stands for a null pointer. The record with every field zero or
// empty names the top of the network.
struct NetResourceRecord {
    int32_t dwScope = 0;
    int32_t dwType = 0;
    int32_t dwDisplayType = 0;
    int32_t dwUsage = 0;
    std::string lpLocalName;
    std::string lpRemoteName;
    std::string lpComment;
    std::string lpProvider;

    // The bytes the record takes in a caller's buffer: the fixed part of 32
    // bytes, then each text that is set with its terminating NUL.
    int32_t ByteSize() const;
    bool operator==(const NetResourceRecord&) const = default;
};

// The network enumeration functions (WNetOpenEnum, WNetEnumResource,
// WNetCloseEnum), with their result codes.
class NetEnumApi {
  public:
    // An open enumeration; 0 is none.
    using Handle = int32_t;

    virtual ~NetEnumApi() = default;

    // Starts listing what the container holds. A container that cannot be
    // reached may keep the caller waiting (events run meanwhile) and then
    // fails.
    virtual int32_t OpenEnum(int32_t lScope, int32_t lType, int32_t lUsage,
                             const NetResourceRecord& container, Handle& hEnum) = 0;
    // Hands out the next record when lCount is at least 1 and the record
    // fits lBufferSize bytes: then lCount is 1 and record holds it. When it
    // does not fit: kNetErrorMoreData, with lBufferSize set to the bytes it
    // needs and the record kept for the next call. kNetErrorNoMoreItems with
    // lCount 0 after the last record.
    virtual int32_t EnumResource(Handle hEnum, int32_t& lCount, NetResourceRecord& record,
                                 int32_t& lBufferSize) = 0;
    virtual int32_t CloseEnum(Handle hEnum) = 0;
};

}  // namespace cv::platform
