#pragma once

#include <cstdint>
#include <string>

namespace cv {

struct Platform;

// One row of the kind table; defined beside the table.
struct TunerKindRow;

// The tuner kind: turns a kind code (1 to 12) into the features and names
// the document's classes consult. Every answer is a fixed function of the
// code; codes outside the table report an error for most properties.
class TunerType {
  public:
    explicit TunerType(Platform& platform);

    int32_t Tuner() const { return mlTuner; }
    void SetTuner(int32_t lTuner) { mlTuner = lTuner; }

    bool HasFaceplate() const;
    bool ReadWriteFilter() const;
    bool UsesCvIni() const;
    bool AutoFaceplateSetup() const;
    bool FullEditScreen() const;
    bool HasExtraTrends() const;
    bool WeReadControllerInfo() const;

    std::string Name() const;
    std::string TitleBarName() const;
    std::string RegistryName() const;
    std::string DefaultController() const;
    std::string ProgramFileName() const;
    std::string InstallDir() const;
    std::string Interface() const;

  private:
    const TunerKindRow* FindRow() const;
    bool Flag(bool TunerKindRow::*pFlag, const char* sProperty) const;
    std::string Text(const char* TunerKindRow::*pText, const char* sProperty) const;
    void ShowError(const char* sProperty) const;

    Platform& mPlatform;
    int32_t mlTuner = 0;
};

}  // namespace cv
