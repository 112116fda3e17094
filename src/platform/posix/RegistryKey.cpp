#include "platform/posix/RegistryKey.h"

#include <iterator>

#include "platform/AsciiCase.h"

namespace cv::posix {

std::string RegistryKey::Folded(std::string_view name) {
    return AsciiUpper(name);
}

bool RegistryKey::SplitPath(std::string_view path, std::vector<std::string>& names) {
    names.clear();
    while (!path.empty()) {
        const size_t slash = path.find('\\');
        const std::string_view name = path.substr(0, slash);
        if (!name.empty()) {
            if (name.size() > kMaxNameBytes || names.size() == kMaxDepth) {
                return false;
            }
            names.emplace_back(name);
        }
        path = slash == std::string_view::npos ? std::string_view() : path.substr(slash + 1);
    }
    return true;
}

RegistryKey* RegistryKey::Find(const std::vector<std::string>& path) {
    RegistryKey* key = this;
    for (const std::string& name : path) {
        const auto found = key->subKeys_.find(Folded(name));
        if (found == key->subKeys_.end()) {
            return nullptr;
        }
        key = found->second.get();
    }
    return key;
}

const RegistryKey* RegistryKey::Find(const std::vector<std::string>& path) const {
    return const_cast<RegistryKey*>(this)->Find(path);
}

RegistryKey& RegistryKey::Make(const std::vector<std::string>& path) {
    RegistryKey* key = this;
    for (const std::string& name : path) {
        key = &key->MakeSubKey(name);
    }
    return *key;
}

RegistryKey& RegistryKey::MakeSubKey(const std::string& name) {
    auto& slot = subKeys_[Folded(name)];
    if (!slot) {
        slot = std::make_unique<RegistryKey>(name);
    }
    return *slot;
}

const RegistryKey* RegistryKey::SubKey(size_t index) const {
    if (index >= subKeys_.size()) {
        return nullptr;
    }
    return std::next(subKeys_.begin(), static_cast<std::ptrdiff_t>(index))->second.get();
}

const RegistryValue* RegistryKey::Value(std::string_view name) const {
    const auto found = valueIndex_.find(Folded(name));
    return found == valueIndex_.end() ? nullptr : &values_[found->second].second;
}

bool RegistryKey::SetValue(std::string_view name, RegistryValue value) {
    const auto [found, added] = valueIndex_.try_emplace(Folded(name), values_.size());
    if (added) {
        values_.emplace_back(std::string(name), std::move(value));
        return true;
    }
    RegistryValue& held = values_[found->second].second;
    if (held == value) {
        return false;
    }
    held = std::move(value);
    return true;
}

}  // namespace cv::posix
