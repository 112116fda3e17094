#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "platform/NetEnumApi.h"
#include "platform/sim/PlantDescription.h"

namespace cv::sim {

class PlantRuntime;

// The plant's network as the network enumeration lists it: the providers at
// the top, a provider's domains and workgroups, a domain's computers (this
// computer under its own name), a computer's shares. A computer that refuses
// this user fails with access denied; one that does not answer keeps the
// caller waiting its answer time (events run, through the call wait) and
// then fails as not found. Only the whole network (RESOURCE_GLOBALNET) has
// anything to list; the plant has no connected or remembered resources.
class SimNetEnum : public platform::NetEnumApi {
  public:
    explicit SimNetEnum(std::shared_ptr<PlantRuntime> runtime);

    int32_t OpenEnum(int32_t lScope, int32_t lType, int32_t lUsage,
                     const platform::NetResourceRecord& container, Handle& hEnum) override;
    int32_t EnumResource(Handle hEnum, int32_t& lCount, platform::NetResourceRecord& record,
                         int32_t& lBufferSize) override;
    int32_t CloseEnum(Handle hEnum) override;

  private:
    using Records = std::vector<platform::NetResourceRecord>;
    struct Listing {
        Records records;
        size_t next = 0;
    };

    int32_t List(const platform::NetResourceRecord& container, Records& records);
    int32_t ListComputer(const std::string& name, Records& records);
    Records Providers() const;
    Records Domains(const ProviderSpec& provider) const;
    Records Computers(const std::string& domain) const;
    Records Shares(const ComputerSpec& computer) const;
    const ProviderSpec* FindProvider(const std::string& name) const;
    const ProviderSpec* ProviderOfDomain(const std::string& domain) const;
    std::string NameOf(const ComputerSpec& computer) const;

    std::shared_ptr<PlantRuntime> runtime_;
    std::map<Handle, Listing> open_;
    Handle nextHandle_ = 1;
};

}  // namespace cv::sim
