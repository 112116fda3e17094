#include "document/TunFile.h"

#include "platform/Platform.h"
#include "platform/Variant.h"

namespace cv {

int32_t TunFile::ArchiveNumber(int32_t lNumber) const {
    return lNumber > mcArchives->Count() ? 0 : lNumber;
}

Channel* TunFile::ArchiveObj(int32_t lNumber) const {
    return lNumber < 1 ? nullptr : mcArchives->Item(lNumber);
}

int32_t TunFile::CurrentPVChannel() const {
    return ArchiveNumber(mcLoops->PVChannelNumber(mcLoops->CurrentLoop()));
}

int32_t TunFile::CurrentCOChannel() const {
    return ArchiveNumber(mcLoops->COChannelNumber(mcLoops->CurrentLoop()));
}

int32_t TunFile::CurrentSPChannel() const {
    return ArchiveNumber(mcLoops->SPChannelNumber(mcLoops->CurrentLoop()));
}

Channel* TunFile::CurrentPVChannelObj() const {
    return ArchiveObj(CurrentPVChannel());
}

Channel* TunFile::CurrentCOChannelObj() const {
    return ArchiveObj(CurrentCOChannel());
}

Channel* TunFile::CurrentSPChannelObj() const {
    return ArchiveObj(CurrentSPChannel());
}

std::string TunFile::ModeValue() {
    Channel* cMode = mcSpecifics->Item(SpecificType::Mode);
    if (cMode == nullptr || cMode->Online(false) != OnlineState::Online) {
        return "Unknown";
    }
    return mcModeMap.GetModeMapValue(TextOf(cMode->RawValue(), mPlatform.locale));
}

}  // namespace cv
