#include "stores/IniFile.h"

#include <algorithm>
#include <limits>

#include "stores/InvariantNumber.h"

namespace cv {

namespace {

// Nibbles 0-8 are the letters p-x, 9-15 the letters c-i.
char NibbleLetter(unsigned int lNibble) {
    return static_cast<char>(lNibble <= 8 ? 112 + lNibble : 90 + lNibble);
}

unsigned int LetterNibble(char cLetter) {
    const char lower =
        (cLetter >= 'A' && cLetter <= 'Z') ? static_cast<char>(cLetter + 32) : cLetter;
    if (lower >= 'p' && lower <= 'x') {
        return static_cast<unsigned int>(lower - 'p');
    }
    if (lower >= 'c' && lower <= 'i') {
        return static_cast<unsigned int>(lower - 'c') + 9;
    }
    return 0;
}

// The blanks a read strips from either end of a value.
bool IsBlank(char cChar) {
    return cChar == ' ' || cChar == '\t' || cChar == '\r' || cChar == '\v' || cChar == '\f';
}

}  // namespace

IniFile::IniFile(platform::ProfileApi& cProfiles) : mcProfiles(cProfiles) {}

unsigned char IniFile::KeyAt(size_t lPosition) const {
    return msKey.empty() ? 0 : static_cast<unsigned char>(msKey[lPosition % msKey.size()]);
}

std::string IniFile::Encrypt(std::string_view sSourceString) const {
    std::string scrambled;
    scrambled.reserve(sSourceString.size() * 2);
    for (size_t position = 0; position < sSourceString.size(); ++position) {
        const unsigned int x =
            static_cast<unsigned char>(sSourceString[position]) ^ KeyAt(position);
        scrambled += NibbleLetter(x & 15);
        scrambled += NibbleLetter(x >> 4);
    }
    return scrambled;
}

std::string IniFile::Decrypt(std::string_view sSourceString) const {
    std::string plain;
    plain.reserve(sSourceString.size() / 2);
    for (size_t pair = 0; pair + 1 < sSourceString.size(); pair += 2) {
        const unsigned int x =
            16 * LetterNibble(sSourceString[pair + 1]) + LetterNibble(sSourceString[pair]);
        plain += static_cast<char>(x ^ KeyAt(pair / 2));
    }
    return plain;
}

std::string IniFile::Stored(const std::string& sText) const {
    return mbEncryptedFile ? Encrypt(sText) : sText;
}

std::string IniFile::ReadEntry(const std::string& sSection, const std::string& sItem,
                               const std::string& sDefault, int32_t lBufferSize) const {
    std::string value = mcProfiles.GetPrivateProfileString(
        Stored(sSection), Stored(sItem), Stored(sDefault), lBufferSize, msFileName);
    value.resize(std::min(value.size(), value.find('\0')));
    return mbEncryptedFile ? Decrypt(value) : value;
}

// Whether sValue is what a read gives of a longer stored value: its first
// bytes, cut by the read buffer.
bool IniFile::IsCutOfStored(const std::string& sSection, const std::string& sItem,
                            const std::string& sValue) const {
    const auto lReadLimit =
        static_cast<size_t>(mbEncryptedFile ? (kBufferSize - 1) / 2 : kBufferSize - 1);
    if (sValue.size() != lReadLimit) {
        return false;
    }
    const std::string sWhole = ReadEntry(sSection, sItem, "", std::numeric_limits<int32_t>::max());
    return sWhole.size() > sValue.size() && sWhole.compare(0, sValue.size(), sValue) == 0;
}

void IniFile::WriteEntry(const std::string& sSection, const std::optional<std::string>& sItem,
                         const std::optional<std::string>& sValue) {
    const auto stored = [this](const std::optional<std::string>& sText) {
        return sText ? std::optional<std::string>(Stored(*sText)) : std::nullopt;
    };
    mcProfiles.WritePrivateProfileString(Stored(sSection), stored(sItem), stored(sValue),
                                         msFileName);
}

void IniFile::EraseSection(const std::string& sSection) {
    WriteEntry(sSection, std::nullopt, std::nullopt);
}

void IniFile::EraseItem(const std::string& sSection, const std::string& sItem) {
    WriteEntry(sSection, sItem, std::nullopt);
}

int32_t IniFile::ReadLong(const std::string& sSection, const std::string& sItem, int32_t lDefault,
                          int32_t lMin, int32_t lMax) const {
    int32_t value = InvariantInt32(ReadEntry(sSection, sItem, std::to_string(lDefault)));
    if (lMin != lMax) {
        if (value > lMax) {
            value = lMax;
        }
        if (value < lMin) {
            value = lMin;
        }
    }
    return value;
}

void IniFile::WriteLong(const std::string& sSection, const std::string& sItem, int32_t lValue) {
    WriteEntry(sSection, sItem, std::to_string(lValue));
}

double IniFile::ReadDouble(const std::string& sSection, const std::string& sItem,
                           double dDefault) const {
    return InvariantNumber(ReadEntry(sSection, sItem, InvariantText(dDefault)));
}

void IniFile::WriteDouble(const std::string& sSection, const std::string& sItem, double dValue) {
    WriteEntry(sSection, sItem, InvariantText(dValue));
}

std::string IniFile::ReadString(const std::string& sSection, const std::string& sItem,
                                const std::string& sDefault) const {
    return ReadEntry(sSection, sItem, sDefault);
}

void IniFile::WriteString(const std::string& sSection, const std::string& sItem,
                          const std::string& sValue, bool bEncloseInQuotes) {
    if (IsCutOfStored(sSection, sItem, sValue)) {
        return;
    }
    WriteEntry(sSection, sItem, bEncloseInQuotes ? "'" + sValue + "'" : sValue);
}

void IniFile::WriteText(const std::string& sSection, const std::string& sItem,
                        const std::string& sValue) {
    const bool bQuoted = sValue.size() >= 2 && sValue.front() == sValue.back() &&
                         (sValue.front() == '\'' || sValue.front() == '"');
    const bool bNeedsQuotes =
        !sValue.empty() && (IsBlank(sValue.front()) || IsBlank(sValue.back()) || bQuoted);
    WriteString(sSection, sItem, sValue, bNeedsQuotes);
}

bool IniFile::ReadBoolean(const std::string& sSection, const std::string& sItem,
                          bool bDefault) const {
    switch (ReadLong(sSection, sItem, bDefault ? 1 : 0, 0, 0)) {
        case -1:
        case 1:
            return true;
        case 0:
            return false;
        default:
            return bDefault;
    }
}

void IniFile::WriteBoolean(const std::string& sSection, const std::string& sItem, bool bValue) {
    WriteEntry(sSection, sItem, bValue ? "1" : "0");
}

IniFile::Batch::Batch(IniFile& cIniFile)
    : mcProfiles(cIniFile.mcProfiles), msFileName(cIniFile.msFileName) {
    mcProfiles.BeginBatch(msFileName);
}

// A batch dropped without End still stores its writes; a caller that must
// know whether they reached the file calls End.
IniFile::Batch::~Batch() {
    static_cast<void>(End());
}

bool IniFile::Batch::End() {
    if (!mbOpen) {
        return false;
    }
    mbOpen = false;
    return mcProfiles.EndBatch(msFileName);
}

}  // namespace cv
