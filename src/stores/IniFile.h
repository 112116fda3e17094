#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "platform/ProfileApi.h"

namespace cv {

// Typed entries (section, item, value) of one INI file, each read with a
// default that comes back when the entry is missing. Every read and write
// goes through the profile functions at once, so two objects on one file, or
// two programs, see each other's writes as soon as they return; the profile
// functions keep the parsed file, so reading a file key by key stays cheap.
//
// Stored text: Long as decimal text; Double as invariant number text (period,
// at most 15 significant digits, ".5"); Boolean as "1" or "0", read back as a
// Long where -1 and 1 are true and 0 false; String as given, optionally in
// single quotes so that blanks around it survive the read.
//
// Reads see at most 254 bytes of a value (the 255-byte buffer of the profile
// functions); with EncryptedFile that is 127 bytes of plain text. Writing
// back what a read gave of a longer value leaves that value whole, so a
// value is never cut by being read and saved again. A stored
// number beyond the 32-bit range reads as the nearest end of that range
// before any clamping.
//
// Scrambling (EncryptedFile): section names, item names, values and defaults
// are stored as Encrypt gives them, two letters from c-i and p-x per byte.
// An empty Key scrambles with zero bytes, so the letters still hide nothing
// but stay letters. Decrypt reads pairs and ignores a last unpaired letter;
// any character other than those letters counts as 0.
//
// Failures are silent: a missing file reads as defaults, a write that cannot
// be stored is lost. Window thread only.
class IniFile {
  public:
    static constexpr int32_t kBufferSize = 255;
    static constexpr const char* kDefaultKey = "rQmPvLkD";

    explicit IniFile(platform::ProfileApi& cProfiles);

    const std::string& FileName() const { return msFileName; }
    void SetFileName(std::string sFileName) { msFileName = std::move(sFileName); }
    void SetEncryptedFile(bool bEncryptedFile) { mbEncryptedFile = bEncryptedFile; }
    void SetKey(std::string sKey) { msKey = std::move(sKey); }

    std::string Encrypt(std::string_view sSourceString) const;
    std::string Decrypt(std::string_view sSourceString) const;

    void EraseSection(const std::string& sSection);
    void EraseItem(const std::string& sSection, const std::string& sItem);

    int32_t ReadLong(const std::string& sSection, const std::string& sItem, int32_t lDefault,
                     int32_t lMin, int32_t lMax) const;
    void WriteLong(const std::string& sSection, const std::string& sItem, int32_t lValue);
    double ReadDouble(const std::string& sSection, const std::string& sItem, double dDefault) const;
    void WriteDouble(const std::string& sSection, const std::string& sItem, double dValue);
    std::string ReadString(const std::string& sSection, const std::string& sItem,
                           const std::string& sDefault) const;
    void WriteString(const std::string& sSection, const std::string& sItem,
                     const std::string& sValue, bool bEncloseInQuotes = false);
    // Writes a text so that ReadString gives it back whole: one a read would
    // strip (blanks at either end, one pair of enclosing quotes) goes in
    // single quotes, which the read takes off again; any other text is
    // stored as it is.
    void WriteText(const std::string& sSection, const std::string& sItem,
                   const std::string& sValue);
    bool ReadBoolean(const std::string& sSection, const std::string& sItem, bool bDefault) const;
    void WriteBoolean(const std::string& sSection, const std::string& sItem, bool bValue);

    // Gathers the writes to the file from construction to End (or
    // destruction) into one replacement of the file, for a whole-document
    // save. Reads in this program see the writes at once; other programs see
    // them only when the batch ends, and none of them if it cannot be stored
    // (or the program dies first), while the file stays as it was. Keep
    // batches short: nothing is on disk until they end.
    class Batch {
      public:
        explicit Batch(IniFile& cIniFile);
        ~Batch();
        Batch(const Batch&) = delete;
        Batch& operator=(const Batch&) = delete;

        // Stores the writes now; true when they all reached the file. A write
        // the file refused (a value with a line break) fails the whole batch,
        // which then stores nothing. Only the first call stores; later calls
        // return false.
        [[nodiscard]] bool End();

      private:
        platform::ProfileApi& mcProfiles;
        std::string msFileName;
        bool mbOpen = true;
    };

  private:
    std::string ReadEntry(const std::string& sSection, const std::string& sItem,
                          const std::string& sDefault, int32_t lBufferSize = kBufferSize) const;
    bool IsCutOfStored(const std::string& sSection, const std::string& sItem,
                       const std::string& sValue) const;
    void WriteEntry(const std::string& sSection, const std::optional<std::string>& sItem,
                    const std::optional<std::string>& sValue);
    std::string Stored(const std::string& sText) const;
    unsigned char KeyAt(size_t lPosition) const;

    platform::ProfileApi& mcProfiles;
    std::string msFileName;
    std::string msKey = kDefaultKey;
    bool mbEncryptedFile = false;
};

}  // namespace cv
