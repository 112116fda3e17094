#include "ua/services/ServiceMessages.h"

#include <array>
#include <utility>

#include "ua/types/StatusCodeTable.h"

namespace cv::ua {
namespace {

constexpr std::array<std::pair<uint16_t, std::string_view>, 21> kServices = {{
    {422, "FindServers"},
    {428, "GetEndpoints"},
    {446, "OpenSecureChannel"},
    {452, "CloseSecureChannel"},
    {461, "CreateSession"},
    {467, "ActivateSession"},
    {473, "CloseSession"},
    {527, "Browse"},
    {533, "BrowseNext"},
    {554, "TranslateBrowsePathsToNodeIds"},
    {631, "Read"},
    {673, "Write"},
    {751, "CreateMonitoredItems"},
    {763, "ModifyMonitoredItems"},
    {769, "SetMonitoringMode"},
    {781, "DeleteMonitoredItems"},
    {787, "CreateSubscription"},
    {793, "ModifySubscription"},
    {826, "Publish"},
    {832, "Republish"},
    {847, "DeleteSubscriptions"},
}};

}  // namespace

std::string_view ServiceName(uint16_t requestEncodingId) {
    for (const auto& [id, name] : kServices) {
        if (id == requestEncodingId) {
            return name;
        }
    }
    return "request";
}

Error ServiceError(std::string_view service, StatusCode result) {
    return Error{result, "The server refused the " + std::string(service) +
                             " request: " + DescribeStatusCode(result)};
}

}  // namespace cv::ua
