#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "platform/RegistryApi.h"

namespace cv {

// Typed settings under one registry root. Every read takes a default that
// comes back when the key or value cannot be read; every write creates the
// key path it needs. No key stays open between calls. ErrorReply holds the
// result code of the last registry call an operation made.
//
// Stored forms: Long as REG_DWORD; String as REG_SZ with its terminating NUL;
// Boolean as the REG_SZ "1" or "0" (read back from "1", "-1" or "0"); Double
// as REG_SZ in the invariant number text (stores/InvariantNumber.h).
// A REG_SZ of more than 255 bytes with its NUL cannot be read
// (kErrorMoreData) and gives the default. A value of another type than the
// one read (a REG_DWORD read as text, a text read as Long) also gives the
// default, with ErrorReply kErrorInvalidData, instead of raw bytes.
//
// Enumeration slots 1..n are independent cursors over the sub-keys of a
// key. A slot index outside 1..n is the caller's error: SetEnumKey then does
// nothing, EnumKey returns false, and both set ErrorReply to
// kErrorInvalidParameter.
class RegClass {
  public:
    // Larger slot counts are cut to this.
    static constexpr int32_t kMaxEnumSlots = 4096;
    // The longest text ReadString gives back, in bytes.
    static constexpr int32_t kMaxTextBytes = 254;

    explicit RegClass(platform::RegistryApi& cRegistry);

    void SetMainKey(int32_t lMainKey) { mlMainKey = lMainKey; }
    int32_t ErrorReply() const { return mlErrorReply; }

    // Clamped to lMin..lMax only when they differ (the default too).
    int32_t ReadLong(const std::string& sSection, const std::string& sItem, int32_t lDefault,
                     int32_t lMin, int32_t lMax);
    int32_t WriteLong(const std::string& sSection, const std::string& sItem, int32_t lValue);
    std::string ReadString(const std::string& sSection, const std::string& sItem,
                           const std::string& sDefault);
    int32_t WriteString(const std::string& sSection, const std::string& sItem,
                        const std::string& sValue);
    bool ReadBoolean(const std::string& sSection, const std::string& sItem, bool bDefault);
    int32_t WriteBoolean(const std::string& sSection, const std::string& sItem, bool bValue);
    // A value that cannot be read gives dDefault exactly; a stored text
    // without a leading number gives 0.
    double ReadDouble(const std::string& sSection, const std::string& sItem, double dDefault);
    int32_t WriteDouble(const std::string& sSection, const std::string& sItem, double dValue);

    // Discards every slot and creates slots 1..lCount, each at the start of MainKey.
    void SetNumberEnumKeys(int32_t lCount);
    // The slot lists the sub-keys of sFromKey (empty: MainKey itself) from the first.
    void SetEnumKey(int32_t lIndex, const std::string& sFromKey);
    // The slot's next sub-key name; false (sSubKeyName unchanged) past the last one.
    bool EnumKey(int32_t lIndex, std::string& sSubKeyName);

  private:
    struct EnumSlot {
        int32_t NextIndex = 0;
        std::string KeyPath;
    };

    bool Query(const std::string& sSection, const std::string& sItem, int32_t lType,
               std::string& sData);
    int32_t Set(const std::string& sSection, const std::string& sItem, int32_t lType,
                const std::string& sData);
    EnumSlot* Slot(int32_t lIndex);

    platform::RegistryApi& mcRegistry;
    int32_t mlMainKey = platform::kHkeyLocalMachine;
    int32_t mlErrorReply = 0;
    std::vector<EnumSlot> mvSlots;
};

}  // namespace cv
