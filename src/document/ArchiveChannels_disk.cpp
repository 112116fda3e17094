#include <algorithm>
#include <string>

#include "document/ArchiveChannels.h"
#include "document/CorvalentIni.h"
#include "document/TunFile.h"

namespace cv {

namespace {

constexpr const char* kTrendSection = "Trend";
constexpr const char* kCountKey = "NumberOfChannels";

std::string ChannelSection(int32_t lNumber) {
    return "Channel" + std::to_string(lNumber);
}

// How many channels a file's count gives: at least PV and CO (and SP with a
// faceplate), exactly PV, CO and SP for kinds without extra trends, and never
// more than the collection holds.
int32_t ChannelsToRead(int32_t lStored, cv::TunerType& cTuner) {
    const int32_t lMinimum = cTuner.HasFaceplate() ? 3 : 2;
    int32_t lCount = std::clamp(lStored, lMinimum, ArchiveChannels::kMaxChannels);
    if (!cTuner.HasExtraTrends()) {
        lCount = 3;
    }
    return lCount;
}

}  // namespace

void ArchiveChannels::SetDefaults(TunFile&) {
    maChannels.clear();
    IniFile cShared = CorvalentIni(mPlatform);
    for (int32_t lNumber = 1; lNumber <= 3; ++lNumber) {
        bool bError = false;
        if (Channel* cChannel = Add(lNumber, bError)) {
            cChannel->SetComType(ComTypeCode::Opc);
            std::string sRole;
            int32_t lColour = 0;
            cChannel->ReadCorvalentIni(cShared, sRole, lColour);
        }
    }
}

bool ArchiveChannels::ReadFromDisk(TunFile& cTunFile) {
    maChannels.clear();
    const int32_t lStored = cTunFile.IniFileObject().ReadLong(kTrendSection, kCountKey, 3, 0, 0);
    const int32_t lCount = ChannelsToRead(lStored, cTunFile.TunerTypeObj());
    maChannels.reserve(static_cast<size_t>(lCount));
    IniFile cShared = CorvalentIni(mPlatform);
    for (int32_t lNumber = 1; lNumber <= lCount; ++lNumber) {
        bool bError = false;
        if (Channel* cChannel = Add(lNumber, bError)) {
            cChannel->ReadFromDisk(cShared, cTunFile);
        }
    }
    return true;
}

void ArchiveChannels::WriteToDisk(IniFile& cIni, cv::TunerType& cTunerType) {
    IniFile cShared = CorvalentIni(mPlatform);
    for (const auto& cChannel : maChannels) {
        cChannel->WriteToDisk(cShared, cIni, cTunerType);
    }
    const int32_t lWritten = Count();
    const int32_t lStored = cIni.ReadLong(kTrendSection, kCountKey, 0, 0, 0);
    if (lStored == lWritten) {
        return;
    }
    cIni.WriteLong(kTrendSection, kCountKey, lWritten);
    const int32_t lLastStale = std::min(lStored, kMaxChannels);
    for (int32_t lNumber = lWritten + 1; lNumber <= lLastStale; ++lNumber) {
        cIni.EraseSection(ChannelSection(lNumber));
    }
}

void ArchiveChannels::WriteDisplayDataToDisk(IniFile& cIni, cv::TunerType& cTunerType) {
    IniFile cShared = CorvalentIni(mPlatform);
    for (const auto& cChannel : maChannels) {
        cChannel->WriteDisplayDataToDisk(ChannelSection(cChannel->Number()), cShared, cIni,
                                         cTunerType);
    }
}

void ArchiveChannels::WriteSpansToDisk(IniFile& cIni, cv::TunerType& cTunerType) {
    for (const auto& cChannel : maChannels) {
        if (cChannel->Number() < 4) {
            cChannel->WriteSpansToDisk(ChannelSection(cChannel->Number()), cIni, cTunerType);
        }
    }
}

}  // namespace cv
