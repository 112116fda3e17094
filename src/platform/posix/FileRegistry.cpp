#include "platform/posix/FileRegistry.h"

#include <cerrno>
#include <limits>

#include "platform/posix/AtomicFile.h"
#include "platform/posix/RegistryFile.h"

namespace cv::posix {

namespace {

using namespace platform;

int32_t RegistryCode(int iErrno) {
    switch (iErrno) {
        case 0:
            return kErrorSuccess;
        case EACCES:
        case EPERM:
        case EROFS:
            return kErrorAccessDenied;
        case ENOSPC:
        case EDQUOT:
            return kErrorDiskFull;
        default:
            return kErrorRegistryIoFailed;
    }
}

bool WantsWrite(int32_t lAccess) {
    return (lAccess & (kKeySetValue | kKeyCreateSubKey)) != 0;
}

}  // namespace

FileRegistry::FileRegistry(std::string sFolder, MachineAccess eMachine)
    : msFolder(std::move(sFolder)) {
    mvRoots[0].Code = kHkeyCurrentUser;
    mvRoots[0].Name = "HKEY_CURRENT_USER";
    mvRoots[0].Path = msFolder + "/" + kCurrentUserFile;
    mvRoots[0].Writable = true;
    mvRoots[1].Code = kHkeyLocalMachine;
    mvRoots[1].Name = "HKEY_LOCAL_MACHINE";
    mvRoots[1].Path = msFolder + "/" + kLocalMachineFile;
    mvRoots[1].Writable = eMachine == MachineAccess::ReadWrite;
}

bool FileRegistry::Locate(Key hKey, Location& cLocation) {
    for (Root& root : mvRoots) {
        if (root.Code == hKey) {
            cLocation = Location{&root, {}, root.Writable};
            return true;
        }
    }
    const auto handle = mcHandles.find(hKey);
    if (handle == mcHandles.end()) {
        return false;
    }
    cLocation = handle->second;
    return true;
}

bool FileRegistry::Descend(Location& cLocation, const std::string& sSubKey) {
    std::vector<std::string> names;
    if (!RegistryKey::SplitPath(sSubKey, names) ||
        cLocation.Path.size() + names.size() > RegistryKey::kMaxDepth) {
        return false;
    }
    cLocation.Path.insert(cLocation.Path.end(), names.begin(), names.end());
    return true;
}

const RegistryKey* FileRegistry::Find(const Location& cLocation) {
    Refresh(*cLocation.Owner);
    return cLocation.Owner->Tree.Find(cLocation.Path);
}

void FileRegistry::Refresh(Root& cRoot) {
    const AtomicFile file(cRoot.Path);
    if (file.Stamp() == cRoot.Stamp) {
        return;
    }
    FileRead read = file.Read();
    bool damaged = false;
    cRoot.Tree = RegistryFile::Parse(read.Status == ReadStatus::Read ? read.Text : "", damaged);
    cRoot.Stamp = std::move(read.Stamp);
}

int32_t FileRegistry::Change(Root& cRoot, const std::function<bool(RegistryKey&)>& fChange) {
    int error = AtomicFile::MakeFolders(msFolder);
    AtomicFile file(cRoot.Path);
    if (error == 0) {
        error = file.Lock();
    }
    FileRead read;
    if (error == 0) {
        read = file.Read();
        error = read.Status == ReadStatus::Unreadable ? read.Error : 0;
    }
    if (error != 0) {
        return RegistryCode(error);
    }
    bool damaged = false;
    RegistryKey tree = RegistryFile::Parse(read.Text, damaged);
    if (fChange(tree)) {
        std::string aside;
        error = damaged ? file.SetAside(aside) : 0;
        if (error == 0) {
            error = file.Replace(RegistryFile::Write(tree, cRoot.Name));
        }
        if (error != 0) {
            return RegistryCode(error);
        }
        read.Stamp = file.Stamp();
    }
    cRoot.Tree = std::move(tree);
    cRoot.Stamp = std::move(read.Stamp);
    return kErrorSuccess;
}

FileRegistry::Key FileRegistry::NewHandle(Location cLocation) {
    while (mcHandles.count(mlNextHandle) != 0) {
        mlNextHandle = mlNextHandle == std::numeric_limits<Key>::max() ? 1 : mlNextHandle + 1;
    }
    const Key handle = mlNextHandle;
    mcHandles.emplace(handle, std::move(cLocation));
    return handle;
}

int32_t FileRegistry::OpenKey(Key hKey, const std::string& sSubKey, int32_t lAccess, Key& hResult) {
    Location location;
    if (!Locate(hKey, location)) {
        return kErrorInvalidHandle;
    }
    if (!Descend(location, sSubKey)) {
        return kErrorFileNotFound;
    }
    if (WantsWrite(lAccess) && !location.Owner->Writable) {
        return kErrorAccessDenied;
    }
    if (Find(location) == nullptr) {
        return kErrorFileNotFound;
    }
    location.Writable = WantsWrite(lAccess);
    hResult = NewHandle(std::move(location));
    return kErrorSuccess;
}

int32_t FileRegistry::CreateKey(Key hKey, const std::string& sSubKey, int32_t lAccess,
                                Key& hResult) {
    Location location;
    if (!Locate(hKey, location)) {
        return kErrorInvalidHandle;
    }
    const bool parentWritable = location.Writable;
    if (!Descend(location, sSubKey)) {
        return kErrorInvalidParameter;
    }
    if (Find(location) == nullptr) {
        if (!parentWritable || !location.Owner->Writable) {
            return kErrorAccessDenied;
        }
        const int32_t error = Change(*location.Owner, [&location](RegistryKey& cTree) {
            const bool missing = cTree.Find(location.Path) == nullptr;
            cTree.Make(location.Path);
            return missing;
        });
        if (error != kErrorSuccess) {
            return error;
        }
    }
    if (WantsWrite(lAccess) && !location.Owner->Writable) {
        return kErrorAccessDenied;
    }
    location.Writable = WantsWrite(lAccess);
    hResult = NewHandle(std::move(location));
    return kErrorSuccess;
}

int32_t FileRegistry::QueryValue(Key hKey, const std::string& sName, int32_t& lType,
                                 std::string& sData, int32_t& lByteCount) {
    Location location;
    if (!Locate(hKey, location)) {
        return kErrorInvalidHandle;
    }
    const RegistryKey* key = Find(location);
    const RegistryValue* value = key == nullptr ? nullptr : key->Value(sName);
    if (value == nullptr) {
        return kErrorFileNotFound;
    }
    lType = value->Type;
    const auto needed = static_cast<int32_t>(value->Data.size());
    const bool fits = lByteCount >= needed;
    lByteCount = needed;
    if (!fits) {
        return kErrorMoreData;
    }
    sData = value->Data;
    return kErrorSuccess;
}

int32_t FileRegistry::SetValue(Key hKey, const std::string& sName, int32_t lType,
                               const std::string& sData) {
    Location location;
    if (!Locate(hKey, location)) {
        return kErrorInvalidHandle;
    }
    if (!location.Writable) {
        return kErrorAccessDenied;
    }
    if (sName.size() > RegistryKey::kMaxValueNameBytes) {
        return kErrorInvalidParameter;
    }
    return Change(*location.Owner, [&](RegistryKey& cTree) {
        return cTree.Make(location.Path).SetValue(sName, RegistryValue{lType, sData});
    });
}

int32_t FileRegistry::EnumKey(Key hKey, int32_t lIndex, std::string& sName, int32_t lBufferSize) {
    Location location;
    if (!Locate(hKey, location)) {
        return kErrorInvalidHandle;
    }
    const RegistryKey* key = Find(location);
    if (key == nullptr) {
        return kErrorFileNotFound;
    }
    const RegistryKey* subKey = lIndex < 0 ? nullptr : key->SubKey(static_cast<size_t>(lIndex));
    if (subKey == nullptr) {
        return kErrorNoMoreItems;
    }
    if (static_cast<int64_t>(subKey->Name().size()) + 1 > lBufferSize) {
        return kErrorMoreData;
    }
    sName = subKey->Name();
    return kErrorSuccess;
}

int32_t FileRegistry::CloseKey(Key hKey) {
    for (const Root& root : mvRoots) {
        if (root.Code == hKey) {
            return kErrorSuccess;
        }
    }
    return mcHandles.erase(hKey) == 1 ? kErrorSuccess : kErrorInvalidHandle;
}

}  // namespace cv::posix
