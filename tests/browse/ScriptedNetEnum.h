#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "platform/NetEnumApi.h"

namespace cv::test {

// A network enumeration that lists what the test wrote down for each
// container (by remote name), fails where it was told to, and records every
// call.
class ScriptedNetEnum : public platform::NetEnumApi {
  public:
    struct Container {
        int32_t openResult = platform::kNetSuccess;
        std::vector<platform::NetResourceRecord> records;
        // Fetching the record at this position fails with failResult.
        size_t failAt = SIZE_MAX;
        int32_t failResult = 0;
    };
    struct EnumCall {
        int32_t count;
        int32_t bufferSize;
    };

    std::map<std::string, Container> containers;
    std::vector<std::string> opened;  // the remote name of each container opened
    std::vector<EnumCall> enumCalls;
    int closed = 0;

    static platform::NetResourceRecord Record(int32_t displayType, std::string remoteName) {
        platform::NetResourceRecord record;
        record.dwScope = platform::kResourceGlobalNet;
        record.dwDisplayType = displayType;
        record.dwUsage = platform::kResourceUsageContainer;
        record.lpRemoteName = std::move(remoteName);
        return record;
    }

    int OpenHandles() const { return static_cast<int>(open_.size()); }

    int32_t OpenEnum(int32_t, int32_t, int32_t, const platform::NetResourceRecord& container,
                     Handle& hEnum) override {
        opened.push_back(container.lpRemoteName);
        const auto found = containers.find(container.lpRemoteName);
        if (found == containers.end()) {
            return platform::kNetErrorBadNetPath;
        }
        if (found->second.openResult != platform::kNetSuccess) {
            return found->second.openResult;
        }
        hEnum = nextHandle_++;
        open_[hEnum] = {&found->second, 0};
        return platform::kNetSuccess;
    }

    int32_t EnumResource(Handle hEnum, int32_t& lCount, platform::NetResourceRecord& record,
                         int32_t& lBufferSize) override {
        enumCalls.push_back({lCount, lBufferSize});
        auto& [container, next] = open_.at(hEnum);
        if (next == container->failAt) {
            return container->failResult;
        }
        if (next >= container->records.size()) {
            lCount = 0;
            return platform::kNetErrorNoMoreItems;
        }
        if (lBufferSize < container->records[next].ByteSize()) {
            lBufferSize = container->records[next].ByteSize();
            return platform::kNetErrorMoreData;
        }
        record = container->records[next++];
        lCount = 1;
        return platform::kNetSuccess;
    }

    int32_t CloseEnum(Handle hEnum) override {
        ++closed;
        return open_.erase(hEnum) == 1 ? platform::kNetSuccess : platform::kNetErrorInvalidHandle;
    }

  private:
    std::map<Handle, std::pair<Container*, size_t>> open_;
    Handle nextHandle_ = 1;
};

}  // namespace cv::test
