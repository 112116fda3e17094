#include <algorithm>
#include <cerrno>
#include <chrono>
#include <cstdio>

#include "document/TunFile.h"
#include "platform/AsciiCase.h"
#include "platform/Platform.h"
#include "stores/InvariantNumber.h"
#include "util/PathText.h"

namespace cv {

namespace {

// Files of this version and before stored the mode-detect keys as the words
// True and False.
constexpr double kLastWordBooleans = 12.0799;
constexpr const char* kWordBooleanKeys[] = {"DDE_Item_AutoModeDetect", "DDE_Item_ManualModeDetect"};

std::string WithSeparator(std::string sFolder) {
    if (!sFolder.empty() && sFolder.back() != '/' && sFolder.back() != '\\') {
        sFolder += '/';
    }
    return sFolder;
}

// Whether a file can be created in the folder (given with its separator):
// creates a fresh probe file (never one that exists) and removes it again.
bool FolderIsWritable(std::string sFolder) {
    if (sFolder.empty()) {
        return false;
    }
    std::replace(sFolder.begin(), sFolder.end(), '\\', '/');
    const auto lStamp = std::chrono::steady_clock::now().time_since_epoch().count();
    for (int32_t lTry = 0; lTry < 3; ++lTry) {
        const std::string sProbe =
            sFolder + ".cvprobe-" + std::to_string(lStamp) + "-" + std::to_string(lTry);
        errno = 0;
        if (std::FILE* pFile = std::fopen(sProbe.c_str(), "wx")) {
            std::fclose(pFile);
            std::remove(sProbe.c_str());
            return true;
        }
        if (errno != EEXIST) {
            return false;
        }
    }
    return false;
}

}  // namespace

std::string TunFile::DefaultPath() const {
    std::string sFolder = WithSeparator(mPlatform.program.Folder());
    if (!FolderIsWritable(sFolder)) {
        sFolder = WithSeparator(mPlatform.program.DataFolder());
    }
    return sFolder + kDefaultFileName;
}

std::string TunFile::LoopTag() const {
    std::string sFolder;
    std::string sName;
    SplitPath(TunFilePath(), sFolder, sName);
    return sName.substr(0, sName.rfind('.'));
}

void TunFile::SetLoopTag(const std::string& sTag) {
    const std::string sCut = sTag.substr(0, sTag.rfind('.'));
    mcIniFile.SetFileName(FolderOfPath(TunFilePath()) + sCut + ".tun");
}

void TunFile::ConvertFileFormat() {
    const std::string sVersion = mcIniFile.ReadString("version", "common", "1.0");
    if (InvariantNumber(RemoveSecondDot(sVersion, true)) > kLastWordBooleans) {
        return;
    }
    for (const char* sKey : kWordBooleanKeys) {
        const std::string sValue = mcIniFile.ReadString("DDE", sKey, "");
        if (EqualsIgnoringCase(sValue, "True")) {
            mcIniFile.WriteString("DDE", sKey, "1");
        } else if (EqualsIgnoringCase(sValue, "False")) {
            mcIniFile.WriteString("DDE", sKey, "0");
        }
    }
}

}  // namespace cv
