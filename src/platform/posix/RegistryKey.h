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
    int32_t type = 0;
    std::string data;  // the bytes exactly as set
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
    explicit RegistryKey(std::string name) : name_(std::move(name)) {}

    const std::string& Name() const { return name_; }

    // Splits "A\B\C" into its names, skipping empty ones; false when a name
    // or the depth exceeds the limits.
    static bool SplitPath(std::string_view path, std::vector<std::string>& names);

    RegistryKey* Find(const std::vector<std::string>& path);
    const RegistryKey* Find(const std::vector<std::string>& path) const;
    // Finds the key, creating it and the keys above it as needed.
    RegistryKey& Make(const std::vector<std::string>& path);

    size_t SubKeyCount() const { return subKeys_.size(); }
    // In enumeration order; nullptr past the end.
    const RegistryKey* SubKey(size_t index) const;
    template <typename Visit>
    void ForEachSubKey(Visit&& visit) const {
        for (const auto& entry : subKeys_) {
            visit(*entry.second);
        }
    }

    const RegistryValue* Value(std::string_view name) const;
    // True when this changed the key (a new value, or a new type or data).
    bool SetValue(std::string_view name, RegistryValue value);
    const std::vector<NamedValue>& Values() const { return values_; }

  private:
    static std::string Folded(std::string_view name);
    RegistryKey& MakeSubKey(const std::string& name);

    std::string name_;
    std::map<std::string, std::unique_ptr<RegistryKey>> subKeys_;  // by folded name
    std::vector<NamedValue> values_;
    std::map<std::string, size_t> valueIndex_;  // folded name to position in values_
};

}  // namespace cv::posix
