#include "document/TunerType.h"

#include <array>

#include "platform/Platform.h"

namespace cv {

// One kind of the family of tuning programs, by its code.
struct TunerKindRow {
    int32_t lCode;
    const char* sName;
    bool bHasFaceplate;
    bool bReadWriteFilter;
    bool bUsesCvIni;
    bool bAutoFaceplateSetup;
    bool bFullEditScreen;
    bool bHasExtraTrends;
    bool bWeReadControllerInfo;
    const char* sInterface;
    const char* sProgramFileName;
    const char* sInstallDir;
};

namespace {

constexpr bool Y = true;
constexpr bool N = false;

// Kind 12 has no product name of its own and is called by its title; kind 4
// reaches the plant through the Wonderware software, which names its interface.
constexpr std::array<TunerKindRow, 12> kRows{{
    {1, "Corvalent DDE Tuner", Y, Y, Y, N, Y, Y, N, "DDE", "cvddetuner", "DdeTuner"},
    {2, "Fenwarden", Y, Y, Y, Y, N, Y, Y, "OPC and DDE", "fenwarden", "Fenwarden"},
    {3, "Brindlemoor", Y, Y, Y, Y, N, Y, Y, "Brindlemoor", "brindlemoor", "Brindlemoor"},
    {4, "Corvalent for Wonderware", Y, N, Y, Y, N, N, N, "Wonderware", "cvwonderware",
     "Wonderware"},
    {5, "Corvalent Archive Tuner", N, N, N, N, N, Y, N, "ASCII", "cvarchivetuner", "ArchiveTuner"},
    {6, "Oxbrook", N, N, N, N, N, Y, N, "A/D Converter", "oxbrook", "Oxbrook"},
    {7, "Corvalent PLC32 Tuner", Y, N, Y, Y, N, N, Y, "PLC/Controller", "cvplc32tuner",
     "Plc32Tuner"},
    {8, "Tessaline for Fix Dynamics", Y, N, Y, Y, N, N, N, "ActiveX", "tessaline", "Tessaline"},
    {9, "Corvalent OPC Tuner", Y, Y, Y, Y, Y, Y, N, "OPC", "cvopctuner", "OpcTuner"},
    {10, "Quillon for Think and Do", Y, N, N, Y, N, N, Y, "OPC", "quillontd", "QuillonThinkAndDo"},
    {11, "Quillon for ProcessLogix", Y, N, N, Y, N, N, Y, "OPC", "quillonplx",
     "QuillonProcessLogix"},
    {12, "Sallowmere", N, N, N, N, N, Y, N, "OPC or PI", "sallowmere", "Sallowmere"},
}};

constexpr bool RowsInCodeOrder() {
    for (size_t i = 0; i < kRows.size(); ++i) {
        if (kRows[i].lCode != static_cast<int32_t>(i + 1)) {
            return false;
        }
    }
    return true;
}
static_assert(RowsInCodeOrder(), "the kind table is looked up by code - 1");

}  // namespace

TunerType::TunerType(Platform& platform) : mPlatform(platform) {}

const TunerKindRow* TunerType::FindRow() const {
    if (mlTuner < 1 || mlTuner > static_cast<int32_t>(kRows.size())) {
        return nullptr;
    }
    return &kRows[static_cast<size_t>(mlTuner - 1)];
}

void TunerType::ShowError(const char* sProperty) const {
    mPlatform.dialogs.MsgBox(std::string("Error: TunerType.") + sProperty, MsgBoxStyle::OKOnly, "");
}

bool TunerType::Flag(bool TunerKindRow::*pFlag, const char* sProperty) const {
    const TunerKindRow* row = FindRow();
    if (row == nullptr) {
        ShowError(sProperty);
        return false;
    }
    return row->*pFlag;
}

std::string TunerType::Text(const char* TunerKindRow::*pText, const char* sProperty) const {
    const TunerKindRow* row = FindRow();
    if (row == nullptr) {
        ShowError(sProperty);
        return "???";
    }
    return row->*pText;
}

bool TunerType::HasFaceplate() const {
    return Flag(&TunerKindRow::bHasFaceplate, "HasFaceplate");
}

bool TunerType::ReadWriteFilter() const {
    return Flag(&TunerKindRow::bReadWriteFilter, "ReadWriteFilter");
}

bool TunerType::UsesCvIni() const {
    return Flag(&TunerKindRow::bUsesCvIni, "UsesCvIni");
}

bool TunerType::AutoFaceplateSetup() const {
    return Flag(&TunerKindRow::bAutoFaceplateSetup, "AutoFaceplateSetup");
}

bool TunerType::FullEditScreen() const {
    return Flag(&TunerKindRow::bFullEditScreen, "FullEditScreen");
}

bool TunerType::HasExtraTrends() const {
    return Flag(&TunerKindRow::bHasExtraTrends, "HasExtraTrends");
}

bool TunerType::WeReadControllerInfo() const {
    const TunerKindRow* row = FindRow();
    return row != nullptr && row->bWeReadControllerInfo;
}

std::string TunerType::Name() const {
    return Text(&TunerKindRow::sName, "Name");
}

std::string TunerType::TitleBarName() const {
    switch (mlTuner) {
        case 2:
            return "Fenwarden";
        case 3:
            return "Brindlemoor";
        case 12:
            return "Sallowmere";
        default:
            return "Corvalent";
    }
}

std::string TunerType::RegistryName() const {
    const bool bCorvalent = (mlTuner >= 1 && mlTuner <= 9) || mlTuner == 12;
    return bCorvalent ? "Corvalent" : "Wrong";
}

std::string TunerType::DefaultController() const {
    return RegistryName() + " Simulation";
}

std::string TunerType::ProgramFileName() const {
    return Text(&TunerKindRow::sProgramFileName, "ProgramFileName");
}

std::string TunerType::InstallDir() const {
    return Text(&TunerKindRow::sInstallDir, "InstallDir");
}

std::string TunerType::Interface() const {
    return Text(&TunerKindRow::sInterface, "Interface");
}

}  // namespace cv
