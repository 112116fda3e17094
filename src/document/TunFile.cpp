#include "document/TunFile.h"

#include "opc/CvOpcAutoClient.h"

#include "document/CorvalentIni.h"

namespace cv {

TunFile::TunFile(Platform& platform)
    : mPlatform(platform),
      mcArchives(std::make_unique<ArchiveChannels>(platform)),
      mcSpecifics(std::make_unique<SpecificChannels>(platform)),
      mcLoops(std::make_unique<LoopCollection>(platform)),
      mcIniFile(platform.profiles),
      mcTunerType(platform),
      mcGeneral(std::make_unique<TunFileGeneral>(platform)) {}

TunFile::~TunFile() {
    GoOffline();
}

void TunFile::SetDefaults(int32_t lTuner) {
    mcTunerType.SetTuner(lTuner);
    mcArchives->SetDefaults(*this);
    mcSpecifics->SetDefaults(*this);
    if (mcTunerType.HasFaceplate()) {
        CopyFaceplateRanges();
    }
    mcLoops->SetDefaults();
    mcIniFile.SetFileName(DefaultPath());
}

bool TunFile::ReadFromDisk(int32_t lTuner, const std::string& sPath) {
    if (!mcIniFile.FileName().empty()) {
        ShowError("Error: TunFile.ReadFromDisk(1)");
        return false;
    }
    if (sPath.empty()) {
        ShowError("Error: TunFile.ReadFromDisk(2)");
        return false;
    }
    // A mistyped or unreadable path would otherwise read as a document of
    // defaults, and the next save would create a file under that name.
    if (!mPlatform.profiles.FileReadable(sPath)) {
        ShowError("Error: TunFile.ReadFromDisk(3)\r\n\r\nThe tuning file \"" + sPath +
                  "\" is missing or cannot be read.");
        return false;
    }
    mcTunerType.SetTuner(lTuner);
    mcIniFile.SetFileName(sPath);
    ConvertFileFormat();
    mcGeneral->ReadFromDisk(mcIniFile);
    mcArchives->ReadFromDisk(*this);
    mcSpecifics->ReadFromDisk(*this);
    if (mcTunerType.HasFaceplate()) {
        CopyFaceplateRanges();
    }
    mcLoops->ReadFromDisk(*this);
    return true;
}

bool TunFile::WriteToDisk(const std::string& sPath) {
    if (sPath.empty()) {
        ShowError("Error: TunFile.WriteToDisk");
        return false;
    }
    std::string sFormerPath = mcIniFile.FileName();
    mcIniFile.SetFileName(sPath);
    IniFile cShared = CorvalentIni(mPlatform);
    IniFile::Batch cSharedBatch(cShared);
    IniFile::Batch cBatch(mcIniFile);
    mcGeneral->WriteToDisk(mcIniFile, mcTunerType);
    mcArchives->WriteToDisk(mcIniFile, mcTunerType);
    if (mcTunerType.HasFaceplate()) {
        mcSpecifics->WriteToDisk(*this);
    }
    mcLoops->WriteToDisk(*this);
    const bool bSharedStored = cSharedBatch.End();
    const bool bStored = cBatch.End();
    if (!bStored) {
        mcIniFile.SetFileName(std::move(sFormerPath));
    }
    if (!bStored || !bSharedStored) {
        ShowError("Error: TunFile.WriteToDisk");
        return false;
    }
    return true;
}

void TunFile::SetArchives(std::unique_ptr<ArchiveChannels> cArchives) {
    if (cArchives != nullptr) {
        mcArchives = std::move(cArchives);
    }
}

void TunFile::SetGeneral(std::unique_ptr<TunFileGeneral> cGeneral) {
    if (cGeneral != nullptr) {
        mcGeneral = std::move(cGeneral);
    }
}

void TunFile::SetLoops(std::unique_ptr<LoopCollection> cLoops) {
    if (cLoops != nullptr) {
        mcLoops = std::move(cLoops);
    }
}

// Faceplate kinds send CO and SP in the ranges of the charted CO and PV.
void TunFile::CopyFaceplateRanges() {
    Channel* cSendCO = mcSpecifics->Item(SpecificType::SendCO);
    Channel* cSendSP = mcSpecifics->Item(SpecificType::SendSP);
    if (cSendCO != nullptr && mcArchives->COChannel() != nullptr) {
        cSendCO->CopyRangeValuesFrom(*mcArchives->COChannel());
    }
    if (cSendSP != nullptr && mcArchives->PVChannel() != nullptr) {
        cSendSP->CopyRangeValuesFrom(*mcArchives->PVChannel());
    }
}

void TunFile::ShowError(const std::string& sText) {
    mPlatform.dialogs.MsgBox(sText, MsgBoxStyle::OKOnly, "");
}

}  // namespace cv
