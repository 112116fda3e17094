#include "stores/RegClass.h"

#include <algorithm>

#include "stores/InvariantNumber.h"

namespace cv {

namespace {

using namespace platform;

// The text buffer handed with every string or name query: 256 bytes less
// one, so data of up to 255 bytes (a text of 254 and its NUL) can be read.
constexpr int32_t kTextBufferBytes = RegClass::kMaxTextBytes + 1;
constexpr int32_t kDwordBytes = 4;

bool HasType(int32_t lWanted, int32_t lGot, size_t lSize) {
    if (lWanted == kRegDword) {
        return lGot == kRegDword && lSize == kDwordBytes;
    }
    return lGot == kRegSz || lGot == kRegExpandSz;
}

std::string DwordBytes(int32_t lValue) {
    const auto bits = static_cast<uint32_t>(lValue);
    std::string bytes;
    for (int shift = 0; shift < 32; shift += 8) {
        bytes += static_cast<char>((bits >> shift) & 0xFF);
    }
    return bytes;
}

int32_t DwordValue(const std::string& sBytes) {
    uint32_t bits = 0;
    for (int i = kDwordBytes - 1; i >= 0; --i) {
        bits = (bits << 8) | static_cast<unsigned char>(sBytes[static_cast<size_t>(i)]);
    }
    return static_cast<int32_t>(bits);
}

}  // namespace

RegClass::RegClass(RegistryApi& cRegistry) : mcRegistry(cRegistry) {}

bool RegClass::Query(const std::string& sSection, const std::string& sItem, int32_t lType,
                     std::string& sData) {
    RegistryApi::Key key = 0;
    mlErrorReply = mcRegistry.OpenKey(mlMainKey, sSection, kKeyRead, key);
    if (mlErrorReply != kErrorSuccess) {
        return false;
    }
    int32_t type = 0;
    int32_t count = lType == kRegDword ? kDwordBytes : kTextBufferBytes;
    mlErrorReply = mcRegistry.QueryValue(key, sItem, type, sData, count);
    mcRegistry.CloseKey(key);
    if (mlErrorReply == kErrorSuccess && !HasType(lType, type, sData.size())) {
        mlErrorReply = kErrorInvalidData;
    }
    return mlErrorReply == kErrorSuccess;
}

int32_t RegClass::Set(const std::string& sSection, const std::string& sItem, int32_t lType,
                      const std::string& sData) {
    RegistryApi::Key key = 0;
    mlErrorReply = mcRegistry.CreateKey(mlMainKey, sSection, kKeyAllAccess, key);
    if (mlErrorReply != kErrorSuccess) {
        return mlErrorReply;
    }
    mlErrorReply = mcRegistry.SetValue(key, sItem, lType, sData);
    mcRegistry.CloseKey(key);
    return mlErrorReply;
}

int32_t RegClass::ReadLong(const std::string& sSection, const std::string& sItem, int32_t lDefault,
                           int32_t lMin, int32_t lMax) {
    std::string data;
    int32_t value = Query(sSection, sItem, kRegDword, data) ? DwordValue(data) : lDefault;
    if (lMin != lMax) {
        value = value > lMax ? lMax : value;
        value = value < lMin ? lMin : value;
    }
    return value;
}

int32_t RegClass::WriteLong(const std::string& sSection, const std::string& sItem, int32_t lValue) {
    return Set(sSection, sItem, kRegDword, DwordBytes(lValue));
}

std::string RegClass::ReadString(const std::string& sSection, const std::string& sItem,
                                 const std::string& sDefault) {
    std::string data;
    if (!Query(sSection, sItem, kRegSz, data)) {
        return sDefault;
    }
    return data.substr(0, data.find('\0'));
}

int32_t RegClass::WriteString(const std::string& sSection, const std::string& sItem,
                              const std::string& sValue) {
    return Set(sSection, sItem, kRegSz, sValue + '\0');
}

bool RegClass::ReadBoolean(const std::string& sSection, const std::string& sItem, bool bDefault) {
    const std::string text = ReadString(sSection, sItem, bDefault ? "1" : "0");
    if (text == "0") {
        return false;
    }
    if (text == "1" || text == "-1") {
        return true;
    }
    return bDefault;
}

int32_t RegClass::WriteBoolean(const std::string& sSection, const std::string& sItem, bool bValue) {
    return WriteString(sSection, sItem, bValue ? "1" : "0");
}

double RegClass::ReadDouble(const std::string& sSection, const std::string& sItem,
                            double dDefault) {
    const std::string text = ReadString(sSection, sItem, InvariantText(dDefault));
    return mlErrorReply == kErrorSuccess ? InvariantNumber(text) : dDefault;
}

int32_t RegClass::WriteDouble(const std::string& sSection, const std::string& sItem,
                              double dValue) {
    return WriteString(sSection, sItem, InvariantText(dValue));
}

void RegClass::SetNumberEnumKeys(int32_t lCount) {
    mvSlots.assign(static_cast<size_t>(std::clamp(lCount, 0, kMaxEnumSlots)), EnumSlot());
}

RegClass::EnumSlot* RegClass::Slot(int32_t lIndex) {
    if (lIndex < 1 || lIndex > static_cast<int32_t>(mvSlots.size())) {
        mlErrorReply = kErrorInvalidParameter;
        return nullptr;
    }
    return &mvSlots[static_cast<size_t>(lIndex - 1)];
}

void RegClass::SetEnumKey(int32_t lIndex, const std::string& sFromKey) {
    EnumSlot* slot = Slot(lIndex);
    if (slot != nullptr) {
        *slot = EnumSlot{0, sFromKey};
    }
}

bool RegClass::EnumKey(int32_t lIndex, std::string& sSubKeyName) {
    EnumSlot* slot = Slot(lIndex);
    if (slot == nullptr) {
        return false;
    }
    RegistryApi::Key key = mlMainKey;
    const bool open = !slot->KeyPath.empty();
    mlErrorReply = open ? mcRegistry.OpenKey(mlMainKey, slot->KeyPath, kKeyRead, key) : 0;
    if (mlErrorReply != kErrorSuccess) {
        return false;
    }
    std::string name;
    mlErrorReply = mcRegistry.EnumKey(key, slot->NextIndex, name, kTextBufferBytes);
    if (mlErrorReply == kErrorSuccess) {
        sSubKeyName = name.substr(0, name.find('\0'));
        ++slot->NextIndex;
    }
    if (open) {
        mcRegistry.CloseKey(key);
    }
    return mlErrorReply == kErrorSuccess;
}

}  // namespace cv
