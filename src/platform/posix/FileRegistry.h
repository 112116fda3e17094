#pragma once

#include <array>
#include <functional>
#include <map>
#include <string>
#include <vector>

#include "platform/RegistryApi.h"
#include "platform/posix/ConfigFolder.h"
#include "platform/posix/FileStamp.h"
#include "platform/posix/RegistryKey.h"

namespace cv::posix {

// The registry kept in text files in the settings folder, one per root:
// "HKEY_CURRENT_USER.registry" and "HKEY_LOCAL_MACHINE.registry" (their form
// is described in RegistryFile.h).
//
// - A call that changes something reads the file afresh under its lock,
//   applies the change and replaces the file atomically (AtomicFile), so
//   running copies of the program never lose each other's writes and a crash
//   never leaves a torn file. A change that changes nothing (a key that
//   exists, a value with the same type and bytes) writes nothing.
// - Reads use the version read last while the file's stamp is unchanged and
//   read the file again once another process has replaced it.
// - A damaged file yields what can safely be read of it (see RegistryFile)
//   and is copied aside as "<file>.damaged-<time>" before the first write
//   replaces it. A file that exists but cannot be read yields no keys, and
//   writes to it are refused (kErrorAccessDenied) rather than replace what
//   could not be read.
// - The folder and its missing parents are created (0700) by the first
//   write, files are created readable by their owner only (0600); reading
//   never creates anything.
// - HKEY_LOCAL_MACHINE holds the machine's settings and is read-only unless
//   the constructor allows writing, as for a user without administrator
//   rights: creating a missing key, setting a value and opening for writing
//   then give kErrorAccessDenied. Other root codes give kErrorInvalidHandle.
// - A handle is a small positive number naming a key by its path, so it
//   stays good when another process rewrites the file; a value set under a
//   key that vanished meanwhile creates the key again. A handle opened
//   without KEY_SET_VALUE or KEY_CREATE_SUB_KEY access cannot write.
// - Sub-keys are enumerated sorted by name, compared in upper case.
//
// For the window thread only.
class FileRegistry : public platform::RegistryApi {
  public:
    enum class MachineAccess { ReadOnly, ReadWrite };

    static constexpr const char* kCurrentUserFile = "HKEY_CURRENT_USER.registry";
    static constexpr const char* kLocalMachineFile = "HKEY_LOCAL_MACHINE.registry";

    explicit FileRegistry(std::string folder = ConfigFolder(),
                          MachineAccess machine = MachineAccess::ReadOnly);

    int32_t OpenKey(Key key, const std::string& subKey, int32_t access, Key& result) override;
    int32_t CreateKey(Key key, const std::string& subKey, int32_t access, Key& result) override;
    int32_t QueryValue(Key key, const std::string& name, int32_t& type, std::string& data,
                       int32_t& byteCount) override;
    int32_t SetValue(Key key, const std::string& name, int32_t type,
                     const std::string& data) override;
    int32_t EnumKey(Key key, int32_t index, std::string& name, int32_t bufferSize) override;
    int32_t CloseKey(Key key) override;

  private:
    struct Root {
        int32_t code = 0;
        std::string name;
        std::string path;
        bool writable = false;
        RegistryKey tree;
        FileStamp stamp;
    };
    // Where a key handle points.
    struct Location {
        Root* owner = nullptr;
        std::vector<std::string> path;
        bool writable = false;
    };

    bool Locate(Key key, Location& location);
    static bool Descend(Location& location, const std::string& subKey);
    const RegistryKey* Find(const Location& location);
    void Refresh(Root& root);
    // Applies change (which says whether it changed anything) to the file's
    // current tree under the lock and writes the result.
    int32_t Change(Root& root, const std::function<bool(RegistryKey&)>& change);
    Key NewHandle(Location location);

    std::string folder_;
    std::array<Root, 2> roots_;
    std::map<Key, Location> handles_;
    Key nextHandle_ = 1;
};

}  // namespace cv::posix
