#include "platform/posix/FileRegistry.h"

#include <cerrno>
#include <limits>

#include "platform/posix/AtomicFile.h"
#include "platform/posix/RegistryFile.h"

namespace cv::posix {

namespace {

using namespace platform;

// The registry's code for a file error (all of the generic category).
int32_t RegistryCode(const std::error_code& error) {
    if (!error) {
        return kErrorSuccess;
    }
    switch (error.value()) {
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

bool WantsWrite(int32_t access) {
    return (access & (kKeySetValue | kKeyCreateSubKey)) != 0;
}

}  // namespace

FileRegistry::FileRegistry(std::string folder, MachineAccess machine) : folder_(std::move(folder)) {
    roots_[0].code = kHkeyCurrentUser;
    roots_[0].name = "HKEY_CURRENT_USER";
    roots_[0].path = folder_ + "/" + kCurrentUserFile;
    roots_[0].writable = true;
    roots_[1].code = kHkeyLocalMachine;
    roots_[1].name = "HKEY_LOCAL_MACHINE";
    roots_[1].path = folder_ + "/" + kLocalMachineFile;
    roots_[1].writable = machine == MachineAccess::ReadWrite;
}

bool FileRegistry::Locate(Key key, Location& location) {
    for (Root& root : roots_) {
        if (root.code == key) {
            location = Location{&root, {}, root.writable};
            return true;
        }
    }
    const auto handle = handles_.find(key);
    if (handle == handles_.end()) {
        return false;
    }
    location = handle->second;
    return true;
}

bool FileRegistry::Descend(Location& location, const std::string& subKey) {
    std::vector<std::string> names;
    if (!RegistryKey::SplitPath(subKey, names) ||
        location.path.size() + names.size() > RegistryKey::kMaxDepth) {
        return false;
    }
    location.path.insert(location.path.end(), names.begin(), names.end());
    return true;
}

const RegistryKey* FileRegistry::Find(const Location& location) {
    Refresh(*location.owner);
    return location.owner->tree.Find(location.path);
}

void FileRegistry::Refresh(Root& root) {
    const AtomicFile file(root.path);
    if (file.Stamp() == root.stamp) {
        return;
    }
    FileRead read = file.Read();
    bool damaged = false;
    root.tree = RegistryFile::Parse(read.status == ReadStatus::Read ? read.text : "", damaged);
    root.stamp = std::move(read.stamp);
}

int32_t FileRegistry::Change(Root& root, const std::function<bool(RegistryKey&)>& change) {
    std::error_code error = AtomicFile::MakeFolders(folder_);
    AtomicFile file(root.path);
    if (!error) {
        error = file.Lock();
    }
    FileRead read;
    if (!error) {
        read = file.Read();
        error = read.status == ReadStatus::Unreadable ? read.error : std::error_code();
    }
    if (error) {
        return RegistryCode(error);
    }
    bool damaged = false;
    RegistryKey tree = RegistryFile::Parse(read.text, damaged);
    if (change(tree)) {
        std::string aside;
        error = damaged ? file.SetAside(aside) : std::error_code();
        if (!error) {
            error = file.Replace(RegistryFile::Write(tree, root.name));
        }
        if (error) {
            return RegistryCode(error);
        }
        read.stamp = file.Stamp();
    }
    root.tree = std::move(tree);
    root.stamp = std::move(read.stamp);
    return kErrorSuccess;
}

FileRegistry::Key FileRegistry::NewHandle(Location location) {
    while (handles_.count(nextHandle_) != 0) {
        nextHandle_ = nextHandle_ == std::numeric_limits<Key>::max() ? 1 : nextHandle_ + 1;
    }
    const Key handle = nextHandle_;
    handles_.emplace(handle, std::move(location));
    return handle;
}

int32_t FileRegistry::OpenKey(Key key, const std::string& subKey, int32_t access, Key& result) {
    Location location;
    if (!Locate(key, location)) {
        return kErrorInvalidHandle;
    }
    if (!Descend(location, subKey)) {
        return kErrorFileNotFound;
    }
    if (WantsWrite(access) && !location.owner->writable) {
        return kErrorAccessDenied;
    }
    if (Find(location) == nullptr) {
        return kErrorFileNotFound;
    }
    location.writable = WantsWrite(access);
    result = NewHandle(std::move(location));
    return kErrorSuccess;
}

int32_t FileRegistry::CreateKey(Key key, const std::string& subKey, int32_t access, Key& result) {
    Location location;
    if (!Locate(key, location)) {
        return kErrorInvalidHandle;
    }
    const bool parentWritable = location.writable;
    if (!Descend(location, subKey)) {
        return kErrorInvalidParameter;
    }
    if (Find(location) == nullptr) {
        if (!parentWritable || !location.owner->writable) {
            return kErrorAccessDenied;
        }
        const int32_t error = Change(*location.owner, [&location](RegistryKey& tree) {
            const bool missing = tree.Find(location.path) == nullptr;
            tree.Make(location.path);
            return missing;
        });
        if (error != kErrorSuccess) {
            return error;
        }
    }
    if (WantsWrite(access) && !location.owner->writable) {
        return kErrorAccessDenied;
    }
    location.writable = WantsWrite(access);
    result = NewHandle(std::move(location));
    return kErrorSuccess;
}

int32_t FileRegistry::QueryValue(Key key, const std::string& name, int32_t& type, std::string& data,
                                 int32_t& byteCount) {
    Location location;
    if (!Locate(key, location)) {
        return kErrorInvalidHandle;
    }
    const RegistryKey* found = Find(location);
    const RegistryValue* value = found == nullptr ? nullptr : found->Value(name);
    if (value == nullptr) {
        return kErrorFileNotFound;
    }
    type = value->type;
    const auto needed = static_cast<int32_t>(value->data.size());
    const bool fits = byteCount >= needed;
    byteCount = needed;
    if (!fits) {
        return kErrorMoreData;
    }
    data = value->data;
    return kErrorSuccess;
}

int32_t FileRegistry::SetValue(Key key, const std::string& name, int32_t type,
                               const std::string& data) {
    Location location;
    if (!Locate(key, location)) {
        return kErrorInvalidHandle;
    }
    if (!location.writable) {
        return kErrorAccessDenied;
    }
    if (name.size() > RegistryKey::kMaxValueNameBytes) {
        return kErrorInvalidParameter;
    }
    return Change(*location.owner, [&](RegistryKey& tree) {
        return tree.Make(location.path).SetValue(name, RegistryValue{type, data});
    });
}

int32_t FileRegistry::EnumKey(Key key, int32_t index, std::string& name, int32_t bufferSize) {
    Location location;
    if (!Locate(key, location)) {
        return kErrorInvalidHandle;
    }
    const RegistryKey* found = Find(location);
    if (found == nullptr) {
        return kErrorFileNotFound;
    }
    const RegistryKey* subKey = index < 0 ? nullptr : found->SubKey(static_cast<size_t>(index));
    if (subKey == nullptr) {
        return kErrorNoMoreItems;
    }
    if (static_cast<int64_t>(subKey->Name().size()) + 1 > bufferSize) {
        return kErrorMoreData;
    }
    name = subKey->Name();
    return kErrorSuccess;
}

int32_t FileRegistry::CloseKey(Key key) {
    for (const Root& root : roots_) {
        if (root.code == key) {
            return kErrorSuccess;
        }
    }
    return handles_.erase(key) == 1 ? kErrorSuccess : kErrorInvalidHandle;
}

}  // namespace cv::posix
