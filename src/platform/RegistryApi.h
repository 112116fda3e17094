#pragma once

#include <cstdint>
#include <string>

namespace cv::platform {

// Predefined root keys (HKEY_CURRENT_USER, HKEY_LOCAL_MACHINE) as the signed
// 32-bit codes callers hold.
inline constexpr int32_t kHkeyCurrentUser = static_cast<int32_t>(0x80000001u);
inline constexpr int32_t kHkeyLocalMachine = static_cast<int32_t>(0x80000002u);

// Value types (REG_SZ, REG_EXPAND_SZ, REG_BINARY, REG_DWORD).
inline constexpr int32_t kRegSz = 1;
inline constexpr int32_t kRegExpandSz = 2;
inline constexpr int32_t kRegBinary = 3;
inline constexpr int32_t kRegDword = 4;

// Access rights (KEY_READ, KEY_SET_VALUE, KEY_CREATE_SUB_KEY, KEY_ALL_ACCESS).
inline constexpr int32_t kKeyRead = 0x20019;
inline constexpr int32_t kKeySetValue = 0x0002;
inline constexpr int32_t kKeyCreateSubKey = 0x0004;
inline constexpr int32_t kKeyAllAccess = 0xF003F;

// Windows system error codes, with what they mean here.
inline constexpr int32_t kErrorSuccess = 0;
// No such key or value:
inline constexpr int32_t kErrorFileNotFound = 2;
// The root or the file cannot be written:
inline constexpr int32_t kErrorAccessDenied = 5;
// Neither a root nor an open key:
inline constexpr int32_t kErrorInvalidHandle = 6;
// Not from the registry: the store's answer to a value of another type than asked for:
inline constexpr int32_t kErrorInvalidData = 13;
// A key or value name that cannot exist, or a caller's index out of range:
inline constexpr int32_t kErrorInvalidParameter = 87;
inline constexpr int32_t kErrorDiskFull = 112;
// Data longer than the caller's buffer:
inline constexpr int32_t kErrorMoreData = 234;
// Enumeration past the last sub-key:
inline constexpr int32_t kErrorNoMoreItems = 259;
// Any other storage failure:
inline constexpr int32_t kErrorRegistryIoFailed = 1016;

// The registry functions the settings store rests on (RegOpenKeyEx,
// RegCreateKeyEx, RegQueryValueEx, RegSetValueEx, RegEnumKey, RegCloseKey),
// with their result codes. Key paths are relative to the key handed in and
// use "\" between names; names match without regard to case. Every call
// returns a code above, 0 for success.
class RegistryApi {
  public:
    // A root code above or a handle from OpenKey or CreateKey.
    using Key = int32_t;

    virtual ~RegistryApi() = default;

    // Opens an existing key; an empty path opens hKey itself again.
    virtual int32_t OpenKey(Key hKey, const std::string& sSubKey, int32_t lAccess,
                            Key& hResult) = 0;
    // Opens the key, creating it and every missing key above it.
    virtual int32_t CreateKey(Key hKey, const std::string& sSubKey, int32_t lAccess,
                              Key& hResult) = 0;
    // lByteCount carries the caller's buffer size in and the value's size
    // out. Data that does not fit gives kErrorMoreData with the type and the
    // needed size set and sData left alone.
    virtual int32_t QueryValue(Key hKey, const std::string& sName, int32_t& lType,
                               std::string& sData, int32_t& lByteCount) = 0;
    // Stores the bytes as given, with their type; "" names the key's default value.
    virtual int32_t SetValue(Key hKey, const std::string& sName, int32_t lType,
                             const std::string& sData) = 0;
    // The name of sub-key lIndex (from 0) when it fits, with a terminating
    // NUL, in lBufferSize bytes; kErrorNoMoreItems past the last one.
    virtual int32_t EnumKey(Key hKey, int32_t lIndex, std::string& sName, int32_t lBufferSize) = 0;
    virtual int32_t CloseKey(Key hKey) = 0;
};

}  // namespace cv::platform
