#include "platform/posix/RegistryKey.h"

#include <iterator>

#include "platform/AsciiCase.h"

namespace cv::posix {

std::string RegistryKey::Folded(std::string_view sName) {
    return AsciiUpper(sName);
}

bool RegistryKey::SplitPath(std::string_view sPath, std::vector<std::string>& vNames) {
    vNames.clear();
    while (!sPath.empty()) {
        const size_t slash = sPath.find('\\');
        const std::string_view name = sPath.substr(0, slash);
        if (!name.empty()) {
            if (name.size() > kMaxNameBytes || vNames.size() == kMaxDepth) {
                return false;
            }
            vNames.emplace_back(name);
        }
        sPath = slash == std::string_view::npos ? std::string_view() : sPath.substr(slash + 1);
    }
    return true;
}

RegistryKey* RegistryKey::Find(const std::vector<std::string>& vPath) {
    RegistryKey* key = this;
    for (const std::string& name : vPath) {
        const auto found = key->mcSubKeys.find(Folded(name));
        if (found == key->mcSubKeys.end()) {
            return nullptr;
        }
        key = found->second.get();
    }
    return key;
}

const RegistryKey* RegistryKey::Find(const std::vector<std::string>& vPath) const {
    return const_cast<RegistryKey*>(this)->Find(vPath);
}

RegistryKey& RegistryKey::Make(const std::vector<std::string>& vPath) {
    RegistryKey* key = this;
    for (const std::string& name : vPath) {
        key = &key->MakeSubKey(name);
    }
    return *key;
}

RegistryKey& RegistryKey::MakeSubKey(const std::string& sName) {
    auto& slot = mcSubKeys[Folded(sName)];
    if (!slot) {
        slot = std::make_unique<RegistryKey>(sName);
    }
    return *slot;
}

const RegistryKey* RegistryKey::SubKey(size_t lIndex) const {
    if (lIndex >= mcSubKeys.size()) {
        return nullptr;
    }
    return std::next(mcSubKeys.begin(), static_cast<std::ptrdiff_t>(lIndex))->second.get();
}

const RegistryValue* RegistryKey::Value(std::string_view sName) const {
    const auto found = mcValueIndex.find(Folded(sName));
    return found == mcValueIndex.end() ? nullptr : &mvValues[found->second].second;
}

bool RegistryKey::SetValue(std::string_view sName, RegistryValue cValue) {
    const auto [found, added] = mcValueIndex.try_emplace(Folded(sName), mvValues.size());
    if (added) {
        mvValues.emplace_back(std::string(sName), std::move(cValue));
        return true;
    }
    RegistryValue& held = mvValues[found->second].second;
    if (held == cValue) {
        return false;
    }
    held = std::move(cValue);
    return true;
}

}  // namespace cv::posix
