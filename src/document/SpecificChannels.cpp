#include "document/SpecificChannels.h"

#include <new>

#include "document/CorvalentIni.h"
#include "document/TunFile.h"

namespace cv {

namespace {

constexpr const char* kFilterSection = "DDE";
constexpr const char* kFilterKey = "Read_Write_Filter";

}  // namespace

SpecificChannels::SpecificChannels(Platform& platform) : mPlatform(platform) {}

int32_t SpecificChannels::FinalChannel() const {
    return mbFilterReadWrite ? SpecificType::SendFilter : SpecificType::SendMode;
}

Channel* SpecificChannels::Add(int32_t lType) {
    try {
        maChannels.push_back(std::make_unique<Channel>(mPlatform));
    } catch (const std::bad_alloc&) {
        return nullptr;
    }
    Channel* cChannel = maChannels.back().get();
    cChannel->SetNumber(static_cast<int32_t>(maChannels.size()));
    cChannel->SetSpecificChannelType(lType);
    return cChannel;
}

void SpecificChannels::Clear() {
    maChannels.clear();
    mbFilterReadWrite = false;
    mbFilterChannelsExist = false;
}

void SpecificChannels::SetDefaults(TunFile&) {
    Clear();
    for (int32_t lType = SpecificType::P; lType <= SpecificType::SendMode; ++lType) {
        if (Channel* cChannel = Add(lType)) {
            cChannel->SetComType(ComTypeCode::Opc);
        }
    }
}

void SpecificChannels::ReadFromDisk(TunFile& cTunFile) {
    Clear();
    cv::TunerType& cTuner = cTunFile.TunerTypeObj();
    if (!cTuner.HasFaceplate()) {
        return;
    }
    mbFilterChannelsExist = cTuner.ReadWriteFilter();
    int32_t lLast = SpecificType::SendMode;
    if (mbFilterChannelsExist) {
        lLast = SpecificType::SendFilter;
        mbFilterReadWrite = cTunFile.IniFileObject().ReadBoolean(kFilterSection, kFilterKey, false);
    }
    IniFile cShared = CorvalentIni(mPlatform);
    for (int32_t lType = SpecificType::P; lType <= lLast; ++lType) {
        if (Channel* cChannel = Add(lType)) {
            cChannel->ReadFromDisk(cShared, cTunFile);
        }
    }
}

void SpecificChannels::WriteToDisk(TunFile& cTunFile) {
    cv::TunerType& cTuner = cTunFile.TunerTypeObj();
    if (!cTuner.HasFaceplate()) {
        return;
    }
    IniFile cShared = CorvalentIni(mPlatform);
    for (const auto& cChannel : maChannels) {
        cChannel->WriteToDisk(cShared, cTunFile.IniFileObject(), cTuner);
    }
    if (mbFilterChannelsExist) {
        cTunFile.IniFileObject().WriteBoolean(kFilterSection, kFilterKey, mbFilterReadWrite);
    }
}

Channel* SpecificChannels::Item(int32_t lType) const {
    for (const auto& c : maChannels) {
        if (c->SpecificChannelType() == lType) {
            return c.get();
        }
    }
    return nullptr;
}

}  // namespace cv
