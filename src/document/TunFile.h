#pragma once

#include <cstdint>

#include "document/TunFileGeneral.h"
#include "document/TunerType.h"
#include "platform/Platform.h"
#include "stores/IniFile.h"

namespace cv {

// The tuning document: owns the tuner kind and the general settings, and is
// the hub every collection and channel receives by reference. It is neither
// copied nor moved, since its parts keep references to it.
class TunFile {
  public:
    explicit TunFile(Platform& platform);
    TunFile(const TunFile&) = delete;
    TunFile& operator=(const TunFile&) = delete;

    // The tuner-kind code, forwarded to the tuner kind.
    int32_t TunerType() const { return mcTunerType.Tuner(); }
    void SetTunerType(int32_t lTuner) { mcTunerType.SetTuner(lTuner); }
    cv::TunerType& TunerTypeObj() { return mcTunerType; }
    const cv::TunerType& TunerTypeObj() const { return mcTunerType; }

    TunFileGeneral& General() { return mcGeneral; }
    const TunFileGeneral& General() const { return mcGeneral; }

    // The INI store of the tuning file; its file name is the file's path.
    IniFile& IniFileObject() { return mcIniFile; }
    const IniFile& IniFileObject() const { return mcIniFile; }

  private:
    IniFile mcIniFile;
    cv::TunerType mcTunerType;
    TunFileGeneral mcGeneral;
};

}  // namespace cv
