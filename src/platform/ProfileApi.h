#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace cv::platform {

// Private-profile (INI) files as the Windows functions GetPrivateProfileStringA
// and WritePrivateProfileStringA offer them, plus batches that gather many
// writes into one replacement of the file.
//
// Names are C strings: a section, key, value or default is taken up to its
// first NUL. Section and key names are compared without regard to ASCII case
// and with blanks around them ignored.
class ProfileApi {
  public:
    virtual ~ProfileApi() = default;

    // The value of key in section: blanks around it and one pair of enclosing
    // quotes (' or ") removed, cut to bufferSize - 1 bytes. When the file,
    // section or key is missing (or the file cannot be read), defaultValue
    // with its trailing blanks removed, cut the same way. The text may hold a
    // NUL the file held; callers that want a C string cut it there.
    virtual std::string GetPrivateProfileString(const std::string& section, const std::string& key,
                                                const std::string& defaultValue, int32_t bufferSize,
                                                const std::string& fileName) = 0;

    // Sets key to value in section, creating the file, the section and the
    // key as needed. No key erases the whole section; a key without a value
    // erases that key. Returns false when the write was refused or could not
    // be stored; the file then stays as it was.
    virtual bool WritePrivateProfileString(const std::string& section,
                                           const std::optional<std::string>& key,
                                           const std::optional<std::string>& value,
                                           const std::string& fileName) = 0;

    // Whether fileName names a file that can be read: false when it is
    // missing, a folder, or cannot be read (no permission, an I/O error). An
    // empty file can be read.
    virtual bool FileReadable(const std::string& fileName) = 0;

    // From BeginBatch to its matching EndBatch, writes to fileName are held in
    // memory: every read through this object sees them at once, other programs
    // see them only when the outermost EndBatch stores them all with one
    // replacement of the file. Batches nest. EndBatch returns false when the
    // store failed or a write of the batch was refused (a batch is stored
    // whole or not at all); the batch's writes are then lost and the file is
    // unchanged.
    virtual void BeginBatch(const std::string& fileName) = 0;
    virtual bool EndBatch(const std::string& fileName) = 0;
};

}  // namespace cv::platform
