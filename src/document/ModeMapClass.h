#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace cv {

// Maps the texts a controller reports on its mode channel (keys) to the
// modes they mean (values). Keys are stored without DDE line terminators;
// neither two keys nor two values repeat. Positions count from 1.
class ModeMapClass {
  public:
    void AddModeMapItem(const std::string& sKey, const std::string& sValue);
    void AddModeMapItem2(const std::string& sKey, const std::string& sValue, int32_t lValidity);

    std::string GetModeMapKey(const std::string& sValue) const;
    std::string GetModeMapKeyByPos(int16_t iPosition) const;
    int16_t GetModeMapSize() const;
    std::string GetModeMapValue(const std::string& sKey) const;
    int32_t GetModeMapValidity(const std::string& sKey) const;
    std::string GetModeMapValueByPos(int16_t iPosition) const;
    std::string GetModeMapValueFromLeftKeySubString(const std::string& sText) const;

    void ReInitializeModeMap();
    bool KeyExists(const std::string& sKey) const;
    void UpdateModeMapKey(const std::string& sNewKey, const std::string& sValue);
    void UpdateModeMapValue(const std::string& sKey, const std::string& sNewValue);

    // Trims spaces and removes every CR, LF and tab.
    static std::string StripDDETerminators(const std::string& sText);

  private:
    struct Entry {
        std::string sKey;
        std::string sValue;
        int32_t lValidity = 0;
    };

    const Entry* FindKey(const std::string& sKey) const;
    Entry* FindKey(const std::string& sKey);
    bool ValueExists(const std::string& sValue) const;
    const Entry* AtPosition(int16_t iPosition) const;

    std::vector<Entry> maEntries;
};

}  // namespace cv
