#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

#include "platform/ProfileApi.h"
#include "platform/posix/AtomicFile.h"
#include "platform/posix/ConfigFolder.h"
#include "platform/posix/IniDocument.h"

namespace cv::posix {

// The program's profile files: the Windows INI rules of IniDocument and the
// file names of ProfilePath, without the ways the Windows functions can lose
// data.
//
// - Every write replaces the whole file at once (AtomicFile): a crash leaves
//   the old file or the new one, never a torn one.
// - A write holds the file's lock from reading it to replacing it, so two
//   programs writing one file keep each other's values.
// - A file created in the settings folder is readable by its owner only (the
//   folder is created too, owner only); elsewhere the umask decides. An
//   existing file keeps its mode; a read-only file refuses writes.
// - A default has its trailing blanks removed, as Windows does.
//
// Damage. Every sequence of bytes reads as INI text (lines it does not
// understand are kept), so a file counts as damaged only when:
// - it cannot be read (no permission, a folder, larger than
//   AtomicFile::kMaxBytes, an I/O error): reads give the defaults and writes
//   fail, since replacing the file would lose what it holds;
// - it is UTF-16 text (it starts with the byte order mark FF FE or FE FF),
//   which these byte-wise names never match: reads give the defaults, and the
//   first write that changes it first copies it aside as
//   "<name>.damaged-<date>-<time>" and then starts a new file.
//
// Speed. Each file's parsed text is kept with the stamp of the version it
// came from. While the stamp is unchanged a read costs one stat and a look-up;
// a file another program replaced is read again. A write that changes nothing
// leaves the file alone.
//
// Batches hold their writes in this object (see ProfileApi); at the end they
// are replayed onto the file as it is then, under its lock, so writes other
// programs made meanwhile to other keys survive.
//
// Window thread only.
class FileProfiles : public platform::ProfileApi {
  public:
    // Files are reached through calls (tests make them fail).
    explicit FileProfiles(std::string configFolder = ConfigFolder(),
                          SystemCalls& calls = SystemCalls::Real());

    std::string GetPrivateProfileString(const std::string& section, const std::string& key,
                                        const std::string& defaultValue, int32_t bufferSize,
                                        const std::string& fileName) override;
    bool WritePrivateProfileString(const std::string& section,
                                   const std::optional<std::string>& key,
                                   const std::optional<std::string>& value,
                                   const std::string& fileName) override;
    bool FileReadable(const std::string& fileName) override;
    void BeginBatch(const std::string& fileName) override;
    bool EndBatch(const std::string& fileName) override;

  private:
    // One write: no key erases the section, no value erases the key.
    struct Edit {
        std::string section;
        std::optional<std::string> key;
        std::optional<std::string> value;
    };

    struct Profile {
        Profile(std::string path, NewFileMode mode, SystemCalls& calls)
            : file(std::move(path), mode, calls) {}

        AtomicFile file;
        bool inConfigFolder = false;
        // document reflects the version marked by stamp, plus pending.
        bool loaded = false;
        FileStamp stamp;
        ReadStatus status = ReadStatus::Missing;
        bool foreign = false;
        IniDocument document;
        int32_t batchDepth = 0;
        std::vector<Edit> pending;
        // Whether pending changed the document.
        bool dirty = false;
        // Whether the batch refused a write.
        bool refused = false;
    };

    Profile* Open(const std::string& fileName);
    void Load(Profile& profile);
    void Reload(Profile& profile);
    bool Store(Profile& profile, const Edit* edit);
    bool StoreLocked(Profile& profile, const Edit* edit);
    static bool Apply(IniDocument& document, const Edit& edit);

    std::string configFolder_;
    SystemCalls& calls_;
    // By resolved path.
    std::unordered_map<std::string, Profile> profiles_;
};

}  // namespace cv::posix
