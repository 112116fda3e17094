#include "platform/posix/FilePki.h"

#include <algorithm>
#include <filesystem>

#include "platform/posix/AtomicFile.h"
#include "platform/posix/ConfigFolder.h"

namespace cv::posix {
namespace {

const char* SubFolder(platform::PkiFolder folder) {
    switch (folder) {
        case platform::PkiFolder::OwnCertificate:
            return "own/certs";
        case platform::PkiFolder::OwnPrivateKey:
            return "own/private";
        case platform::PkiFolder::Trusted:
            return "trusted/certs";
        case platform::PkiFolder::Rejected:
            return "rejected/certs";
        case platform::PkiFolder::Issuers:
            break;
    }
    return "issuers/certs";
}

// AtomicFile's temporary files and copies of damaged files are no members.
bool IsStoreFile(const std::string& name) {
    return !name.empty() && name.front() != '.';
}

}  // namespace

FilePki::FilePki(std::string root, SystemCalls& calls) : root_(std::move(root)), calls_(calls) {}

std::string FilePki::DefaultRoot() {
    return ConfigFolder() + "/pki";
}

std::string FilePki::FolderOf(platform::PkiFolder folder) const {
    return root_ + "/" + SubFolder(folder);
}

std::string FilePki::PathOf(platform::PkiFolder folder, const std::string& name) const {
    return FolderOf(folder) + "/" + name;
}

std::vector<platform::PkiFile> FilePki::List(platform::PkiFolder folder) {
    std::vector<std::string> names;
    std::error_code ec;
    for (std::filesystem::directory_iterator it(FolderOf(folder), ec), end; !ec && it != end;
         it.increment(ec)) {
        const std::string name = it->path().filename().string();
        if (IsStoreFile(name) && it->is_regular_file(ec)) {
            names.push_back(name);
        }
    }
    std::sort(names.begin(), names.end());
    std::vector<platform::PkiFile> files;
    for (const std::string& name : names) {
        if (auto bytes = Read(folder, name)) {
            files.push_back({name, std::move(*bytes)});
        }
    }
    return files;
}

std::optional<std::string> FilePki::Read(platform::PkiFolder folder, const std::string& name) {
    const FileRead read = AtomicFile(PathOf(folder, name), NewFileMode::OwnerOnly, calls_).Read();
    if (read.status != ReadStatus::Read) {
        return std::nullopt;
    }
    return read.text;
}

std::error_code FilePki::Write(platform::PkiFolder folder, const std::string& name,
                               std::string_view bytes) {
    if (const std::error_code made = AtomicFile::MakeFolders(FolderOf(folder))) {
        return made;
    }
    return AtomicFile(PathOf(folder, name), NewFileMode::OwnerOnly, calls_).Replace(bytes);
}

std::error_code FilePki::Remove(platform::PkiFolder folder, const std::string& name) {
    std::error_code ec;
    std::filesystem::remove(PathOf(folder, name), ec);
    return ec;
}

}  // namespace cv::posix
