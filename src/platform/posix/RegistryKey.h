#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace cv::posix {

struct RegistryValue {
    int32_t Type = 0;
    std::string Data;  // the bytes exactly as set
    bool operator==(const RegistryValue&) const = default;
};

// One key of a registry tree held in memory: its name as first written, its
// values in the order they were first set, and its sub-keys. Key and value
// names match without regard to the case of ASCII letters (other bytes
// match exactly). Sub-keys are kept in the order Windows enumerates them:
// sorted by their names compared in upper case.
class RegistryKey {
  public:
    // Windows' limits: a key name holds at most 255 bytes, a path at most
    // 512 keys, a value name at most 16383 bytes.
    static constexpr size_t kMaxNameBytes = 255;
    static constexpr size_t kMaxDepth = 512;
    static constexpr size_t kMaxValueNameBytes = 16383;

    using NamedValue = std::pair<std::string, RegistryValue>;

    RegistryKey() = default;
    explicit RegistryKey(std::string sName) : msName(std::move(sName)) {}

    const std::string& Name() const { return msName; }

    // Splits "A\B\C" into its names, skipping empty ones; false when a name
    // or the depth exceeds the limits.
    static bool SplitPath(std::string_view sPath, std::vector<std::string>& vNames);

    RegistryKey* Find(const std::vector<std::string>& vPath);
    const RegistryKey* Find(const std::vector<std::string>& vPath) const;
    // Finds the key, creating it and the keys above it as needed.
    RegistryKey& Make(const std::vector<std::string>& vPath);

    size_t SubKeyCount() const { return mcSubKeys.size(); }
    // In enumeration order; nullptr past the end.
    const RegistryKey* SubKey(size_t lIndex) const;
    template <typename Visit>
    void ForEachSubKey(Visit&& fVisit) const {
        for (const auto& entry : mcSubKeys) {
            fVisit(*entry.second);
        }
    }

    const RegistryValue* Value(std::string_view sName) const;
    // True when this changed the key (a new value, or a new type or data).
    bool SetValue(std::string_view sName, RegistryValue cValue);
    const std::vector<NamedValue>& Values() const { return mvValues; }

  private:
    static std::string Folded(std::string_view sName);
    RegistryKey& MakeSubKey(const std::string& sName);

    std::string msName;
    std::map<std::string, std::unique_ptr<RegistryKey>> mcSubKeys;  // by folded name
    std::vector<NamedValue> mvValues;
    std::map<std::string, size_t> mcValueIndex;  // folded name to position in mvValues
};

}  // namespace cv::posix
