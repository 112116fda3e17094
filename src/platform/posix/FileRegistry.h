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

    explicit FileRegistry(std::string sFolder = ConfigFolder(),
                          MachineAccess eMachine = MachineAccess::ReadOnly);

    int32_t OpenKey(Key hKey, const std::string& sSubKey, int32_t lAccess, Key& hResult) override;
    int32_t CreateKey(Key hKey, const std::string& sSubKey, int32_t lAccess, Key& hResult) override;
    int32_t QueryValue(Key hKey, const std::string& sName, int32_t& lType, std::string& sData,
                       int32_t& lByteCount) override;
    int32_t SetValue(Key hKey, const std::string& sName, int32_t lType,
                     const std::string& sData) override;
    int32_t EnumKey(Key hKey, int32_t lIndex, std::string& sName, int32_t lBufferSize) override;
    int32_t CloseKey(Key hKey) override;

  private:
    struct Root {
        int32_t Code = 0;
        std::string Name;
        std::string Path;
        bool Writable = false;
        RegistryKey Tree;
        FileStamp Stamp;
    };
    // Where a key handle points.
    struct Location {
        Root* Owner = nullptr;
        std::vector<std::string> Path;
        bool Writable = false;
    };

    bool Locate(Key hKey, Location& cLocation);
    static bool Descend(Location& cLocation, const std::string& sSubKey);
    const RegistryKey* Find(const Location& cLocation);
    void Refresh(Root& cRoot);
    // Applies fChange (which says whether it changed anything) to the file's
    // current tree under the lock and writes the result.
    int32_t Change(Root& cRoot, const std::function<bool(RegistryKey&)>& fChange);
    Key NewHandle(Location cLocation);

    std::string msFolder;
    std::array<Root, 2> mvRoots;
    std::map<Key, Location> mcHandles;
    Key mlNextHandle = 1;
};

}  // namespace cv::posix
