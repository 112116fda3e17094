#include "platform/sim/SimNetEnum.h"

#include <algorithm>
#include <climits>

#include "platform/AsciiCase.h"
#include "platform/sim/PlantRuntime.h"

namespace cv::sim {

using namespace platform;

namespace {

bool KnownType(int32_t lType) {
    return lType == kResourceTypeAny || lType == kResourceTypeDisk || lType == kResourceTypePrint;
}

// Containers are listed whatever type is asked for, as they may hold it.
bool Wanted(const NetResourceRecord& record, int32_t lType, int32_t lUsage) {
    const int32_t usage = lUsage & (kResourceUsageConnectable | kResourceUsageContainer);
    if (usage != 0 && (record.dwUsage & usage) == 0) {
        return false;
    }
    const bool container = (record.dwUsage & kResourceUsageContainer) != 0;
    return lType == kResourceTypeAny || container || record.dwType == lType;
}

NetResourceRecord Container(int32_t displayType, std::string remoteName, std::string comment,
                            std::string provider) {
    return {kResourceGlobalNet, kResourceTypeAny,      displayType,        kResourceUsageContainer,
            std::string(),      std::move(remoteName), std::move(comment), std::move(provider)};
}

}  // namespace

SimNetEnum::SimNetEnum(std::shared_ptr<PlantRuntime> runtime) : runtime_(std::move(runtime)) {}

int32_t SimNetEnum::OpenEnum(int32_t lScope, int32_t lType, int32_t lUsage,
                             const NetResourceRecord& container, Handle& hEnum) {
    hEnum = 0;
    if (!KnownType(lType) || (lUsage & ~kResourceUsageAll) != 0) {
        return kNetErrorInvalidParameter;
    }
    Records records;
    if (lScope == kResourceGlobalNet) {
        if (const int32_t result = List(container, records); result != kNetSuccess) {
            return result;
        }
    } else if (lScope != kResourceConnected && lScope != kResourceRemembered) {
        return kNetErrorInvalidParameter;
    }
    Listing listing;
    std::copy_if(records.begin(), records.end(), std::back_inserter(listing.records),
                 [&](const NetResourceRecord& record) { return Wanted(record, lType, lUsage); });
    hEnum = nextHandle_;
    nextHandle_ = nextHandle_ == INT32_MAX ? 1 : nextHandle_ + 1;
    open_[hEnum] = std::move(listing);
    return kNetSuccess;
}

int32_t SimNetEnum::EnumResource(Handle hEnum, int32_t& lCount, NetResourceRecord& record,
                                 int32_t& lBufferSize) {
    const auto found = open_.find(hEnum);
    if (found == open_.end()) {
        return kNetErrorInvalidHandle;
    }
    if (lCount < 1) {
        return kNetErrorInvalidParameter;
    }
    Listing& listing = found->second;
    if (listing.next >= listing.records.size()) {
        lCount = 0;
        return kNetErrorNoMoreItems;
    }
    const NetResourceRecord& next = listing.records[listing.next];
    if (lBufferSize < next.ByteSize()) {
        lBufferSize = next.ByteSize();
        return kNetErrorMoreData;
    }
    record = next;
    lCount = 1;
    ++listing.next;
    return kNetSuccess;
}

int32_t SimNetEnum::CloseEnum(Handle hEnum) {
    return open_.erase(hEnum) == 1 ? kNetSuccess : kNetErrorInvalidHandle;
}

int32_t SimNetEnum::List(const NetResourceRecord& container, Records& records) {
    const std::string& remote = container.lpRemoteName;
    if (!container.lpProvider.empty() && FindProvider(container.lpProvider) == nullptr) {
        return kNetErrorBadProvider;
    }
    if (remote.empty()) {
        records = Providers();
        return kNetSuccess;
    }
    if (remote.rfind("\\\\", 0) == 0) {
        return ListComputer(remote.substr(2), records);
    }
    if (const ProviderSpec* provider = FindProvider(remote)) {
        records = Domains(*provider);
        return kNetSuccess;
    }
    if (ProviderOfDomain(remote) != nullptr) {
        records = Computers(remote);
        return kNetSuccess;
    }
    return kNetErrorBadNetPath;
}

int32_t SimNetEnum::ListComputer(const std::string& name, Records& records) {
    const size_t slash = name.find('\\');
    const std::string computerName = name.substr(0, slash);
    const ComputerSpec* computer =
        computerName.empty() ? nullptr : runtime_->ResolveComputer(computerName);
    if (computer == nullptr) {
        return kNetErrorBadNetPath;
    }
    if (slash != std::string::npos) {
        return kNetErrorNotContainer;  // a share holds files, not resources
    }
    if (computer->access == ComputerAccess::Denied) {
        return kNetErrorAccessDenied;
    }
    if (computer->access == ComputerAccess::Silent) {
        // Whether the wait ends at the answer time or at the call limit, the
        // computer was not found.
        (void)runtime_->Delay(computer->answerAfterMs);
        return kNetErrorBadNetPath;
    }
    records = Shares(*computer);
    return kNetSuccess;
}

SimNetEnum::Records SimNetEnum::Providers() const {
    Records records;
    for (const ProviderSpec& provider : runtime_->Plant().providers) {
        records.push_back(
            Container(kDisplayTypeNetwork, provider.name, std::string(), provider.name));
    }
    return records;
}

SimNetEnum::Records SimNetEnum::Domains(const ProviderSpec& provider) const {
    Records records;
    for (const std::string& domain : provider.domains) {
        records.push_back(Container(kDisplayTypeDomain, domain, std::string(), provider.name));
    }
    return records;
}

SimNetEnum::Records SimNetEnum::Computers(const std::string& domain) const {
    const std::string& provider = ProviderOfDomain(domain)->name;
    Records records;
    for (const ComputerSpec& computer : runtime_->Plant().computers) {
        if (!computer.domain.empty() && EqualsIgnoringCase(computer.domain, domain)) {
            records.push_back(Container(kDisplayTypeServer, "\\\\" + NameOf(computer),
                                        computer.comment, provider));
        }
    }
    return records;
}

SimNetEnum::Records SimNetEnum::Shares(const ComputerSpec& computer) const {
    const ProviderSpec* provider = ProviderOfDomain(computer.domain);
    Records records;
    for (const std::string& share : computer.shares) {
        records.push_back({kResourceGlobalNet, kResourceTypeDisk, kDisplayTypeShare,
                           kResourceUsageConnectable, std::string(),
                           "\\\\" + NameOf(computer) + "\\" + share, std::string(),
                           provider != nullptr ? provider->name : std::string()});
    }
    return records;
}

const ProviderSpec* SimNetEnum::FindProvider(const std::string& name) const {
    const auto& providers = runtime_->Plant().providers;
    const auto found = std::find_if(providers.begin(), providers.end(), [&](const auto& provider) {
        return EqualsIgnoringCase(provider.name, name);
    });
    return found == providers.end() ? nullptr : &*found;
}

const ProviderSpec* SimNetEnum::ProviderOfDomain(const std::string& domain) const {
    for (const ProviderSpec& provider : runtime_->Plant().providers) {
        for (const std::string& name : provider.domains) {
            if (EqualsIgnoringCase(name, domain)) {
                return &provider;
            }
        }
    }
    return nullptr;
}

std::string SimNetEnum::NameOf(const ComputerSpec& computer) const {
    return computer.local ? runtime_->LocalName() : computer.name;
}

}  // namespace cv::sim
