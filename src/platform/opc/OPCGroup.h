#pragma once

#include <cstdint>
#include <functional>
#include <string>

#include "platform/ErrorInfo.h"
#include "platform/Variant.h"
#include "platform/opc/OPCItems.h"
#include "platform/opc/OneBased.h"
#include "platform/opc/ValueDetail.h"

namespace cv::platform {

// What a group's DataChange event carries: one entry per changed item.
// Time stamps are OLE dates in local time: the server's time stamp of each
// value. Details may hold fewer entries than items (none from a Data Access
// server): an item without one has no detail.
struct DataChangeArgs {
    int32_t TransactionID = 0;
    int32_t NumItems = 0;
    OneBased<int32_t> ClientHandles;
    OneBased<Variant> ItemValues;
    OneBased<int32_t> Qualities;
    OneBased<double> TimeStamps;
    OneBased<ValueDetail> Details;
};

// A group of items on a server. DataChange fires only while the group is
// active and subscribed, at most once per update rate, for the items whose
// value or quality changed, and always from the window thread's event loop
// (never from inside a call the handler's owner made).
class OPCGroup {
  public:
    using DataChangeHandler = std::function<void(const DataChangeArgs&)>;

    virtual ~OPCGroup() = default;
    virtual const std::string& Name() const = 0;
    virtual ErrorInfo IsActive(bool& bActive) const = 0;
    virtual ErrorInfo SetIsActive(bool bActive) = 0;
    virtual ErrorInfo IsSubscribed(bool& bSubscribed) const = 0;
    virtual ErrorInfo SetIsSubscribed(bool bSubscribed) = 0;
    // Milliseconds; the server may revise the rate it was asked for.
    virtual ErrorInfo UpdateRate(int32_t& lRate) const = 0;
    virtual ErrorInfo SetUpdateRate(int32_t lRate) = 0;
    virtual platform::OPCItems& OPCItems() = 0;

    // Reads lNumItems items from the cache or the device (OpcDataSource).
    // The first four output arrays get one entry per item; an item whose
    // error is not 0 has no value. Details, as in DataChangeArgs, may stay
    // shorter.
    virtual ErrorInfo SyncRead(int16_t iSource, int32_t lNumItems,
                               const OneBased<int32_t>& ServerHandles, OneBased<Variant>& Values,
                               OneBased<int32_t>& Errors, OneBased<int32_t>& Qualities,
                               OneBased<double>& TimeStamps, OneBased<ValueDetail>& Details) = 0;
    virtual ErrorInfo SyncWrite(int32_t lNumItems, const OneBased<int32_t>& ServerHandles,
                                const OneBased<Variant>& Values, OneBased<int32_t>& Errors) = 0;

    // Replaces the handler; an empty one stops delivery.
    virtual void SetDataChangeHandler(DataChangeHandler handler) = 0;
};

}  // namespace cv::platform
