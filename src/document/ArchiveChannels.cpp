#include "document/ArchiveChannels.h"

#include <algorithm>
#include <new>

namespace cv {

ArchiveChannels::ArchiveChannels(Platform& platform) : mPlatform(platform) {}

Channel* ArchiveChannels::Add(int32_t lNumber, bool& bError) {
    bError = true;
    if (Count() >= kMaxChannels) {
        return nullptr;
    }
    try {
        maChannels.push_back(std::make_unique<Channel>(mPlatform));
    } catch (const std::bad_alloc&) {
        return nullptr;
    }
    Channel* cChannel = maChannels.back().get();
    cChannel->SetNumber(lNumber);
    cChannel->SetSpecificChannelType(0);
    bError = false;
    return cChannel;
}

void ArchiveChannels::Remove(Channel*& cChannel) {
    if (cChannel == nullptr) {
        return;
    }
    const int32_t lNumber = cChannel->Number();
    const auto found = std::find_if(maChannels.rbegin(), maChannels.rend(),
                                    [lNumber](const auto& c) { return c->Number() == lNumber; });
    if (found == maChannels.rend()) {
        return;
    }
    maChannels.erase(std::next(found).base());
    cChannel = nullptr;
    for (const auto& c : maChannels) {
        if (c->Number() > lNumber) {
            c->SetNumber(c->Number() - 1);
        }
    }
}

std::unique_ptr<ArchiveChannels> ArchiveChannels::Copy() const {
    auto cCopy = std::make_unique<ArchiveChannels>(mPlatform);
    for (const auto& cSource : maChannels) {
        bool bError = false;
        if (Channel* cNew = cCopy->Add(cSource->Number(), bError)) {
            cNew->CopyFrom(*cSource);
        }
    }
    return cCopy;
}

void ArchiveChannels::CopyFrom(std::unique_ptr<ArchiveChannels>& cArchives) {
    if (cArchives == nullptr || cArchives.get() == this) {
        return;
    }
    for (const auto& cSource : cArchives->maChannels) {
        const int32_t lPosition = cSource->Number();
        if (lPosition >= 1 && lPosition <= Count()) {
            maChannels[static_cast<size_t>(lPosition - 1)]->CopyFrom(*cSource);
        }
    }
    cArchives->maChannels.clear();
    cArchives.reset();
}

Channel* ArchiveChannels::Item(int32_t lNumber) const {
    for (const auto& c : maChannels) {
        if (c->Number() == lNumber) {
            return c.get();
        }
    }
    return nullptr;
}

int32_t ArchiveChannels::FindChannel(const std::string& sDescription, int32_t lStart) const {
    for (int32_t k = std::max(lStart, 1); k <= Count(); ++k) {
        const Channel* cChannel = Item(k);
        if (cChannel != nullptr && cChannel->Description() == sDescription) {
            return k;
        }
    }
    return 0;
}

void ArchiveChannels::SetPVSPDisplayLimitsEqual(int32_t lMaster) {
    Channel* cMaster = lMaster == 1 ? PVChannel() : lMaster == 3 ? SPChannel() : nullptr;
    Channel* cFollower = lMaster == 1 ? SPChannel() : lMaster == 3 ? PVChannel() : nullptr;
    if (cMaster == nullptr || cFollower == nullptr) {
        return;
    }
    cFollower->SetRange(RangeType::Display, cMaster->DisplayMin(), cMaster->DisplayMax());
    cFollower->SetEngUnits(cMaster->EngUnits());
}

}  // namespace cv
