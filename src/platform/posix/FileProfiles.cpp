#include "platform/posix/FileProfiles.h"

#include "platform/posix/ProfilePath.h"

namespace cv::posix {

namespace {

// The text a C string argument would carry: up to its first NUL.
std::string CString(const std::string& text) {
    return text.substr(0, text.find('\0'));
}

std::optional<std::string> CString(const std::optional<std::string>& text) {
    return text ? std::optional<std::string>(CString(*text)) : std::nullopt;
}

bool IsUtf16(const std::string& text) {
    return text.starts_with("\xFF\xFE") || text.starts_with("\xFE\xFF");
}

std::string WithoutTrailingBlanks(std::string text) {
    text.erase(text.find_last_not_of(" \t") + 1);
    return text;
}

}  // namespace

FileProfiles::FileProfiles(std::string configFolder, SystemCalls& calls)
    : configFolder_(std::move(configFolder)), calls_(calls) {}

FileProfiles::Profile* FileProfiles::Open(const std::string& fileName) {
    const std::string path = ProfilePath(CString(fileName), configFolder_);
    if (path.empty()) {
        return nullptr;
    }
    const auto found = profiles_.find(path);
    if (found != profiles_.end()) {
        return &found->second;
    }
    const bool settings = IsInConfigFolder(path, configFolder_);
    Profile& profile =
        profiles_
            .try_emplace(path, path, settings ? NewFileMode::OwnerOnly : NewFileMode::UmaskDefault,
                         calls_)
            .first->second;
    profile.inConfigFolder = settings;
    return &profile;
}

void FileProfiles::Load(Profile& profile) {
    if (!profile.loaded || !(profile.file.Stamp() == profile.stamp)) {
        Reload(profile);
    }
}

void FileProfiles::Reload(Profile& profile) {
    FileRead read = profile.file.Read();
    profile.status = read.status;
    profile.stamp = std::move(read.stamp);
    profile.foreign = read.status == ReadStatus::Read && IsUtf16(read.text);
    const bool usable = read.status == ReadStatus::Read && !profile.foreign;
    profile.document = usable ? IniDocument::Parse(read.text) : IniDocument();
    profile.dirty = false;
    for (const Edit& edit : profile.pending) {
        profile.dirty = Apply(profile.document, edit) || profile.dirty;
    }
    profile.loaded = true;
}

bool FileProfiles::Apply(IniDocument& document, const Edit& edit) {
    if (!edit.key) {
        return document.EraseSection(edit.section);
    }
    if (!edit.value) {
        return document.EraseKey(edit.section, *edit.key);
    }
    return document.SetValue(edit.section, *edit.key, *edit.value);
}

std::string FileProfiles::GetPrivateProfileString(const std::string& section,
                                                  const std::string& key,
                                                  const std::string& defaultValue,
                                                  int32_t bufferSize, const std::string& fileName) {
    if (bufferSize <= 0) {
        return {};
    }
    std::optional<std::string> value;
    if (Profile* profile = Open(fileName)) {
        Load(*profile);
        value = profile->document.Value(CString(section), CString(key));
    }
    std::string result = value ? std::move(*value) : WithoutTrailingBlanks(CString(defaultValue));
    if (result.size() >= static_cast<size_t>(bufferSize)) {
        result.resize(static_cast<size_t>(bufferSize) - 1);
    }
    return result;
}

bool FileProfiles::WritePrivateProfileString(const std::string& section,
                                             const std::optional<std::string>& key,
                                             const std::optional<std::string>& value,
                                             const std::string& fileName) {
    Edit edit{CString(section), CString(key), key ? CString(value) : std::nullopt};
    Profile* profile = Open(fileName);
    if (profile == nullptr) {
        return false;
    }
    if (!IniDocument::IsSectionName(edit.section) ||
        (edit.key && !IniDocument::IsKeyName(*edit.key)) ||
        (edit.value && !IniDocument::IsValueText(*edit.value))) {
        profile->refused = profile->refused || profile->batchDepth > 0;
        return false;
    }
    if (profile->batchDepth == 0) {
        return Store(*profile, &edit);
    }
    Load(*profile);
    profile->dirty = Apply(profile->document, edit) || profile->dirty;
    profile->pending.push_back(std::move(edit));
    return true;
}

bool FileProfiles::FileReadable(const std::string& fileName) {
    Profile* profile = Open(fileName);
    if (profile == nullptr) {
        return false;
    }
    Load(*profile);
    return profile->status == ReadStatus::Read;
}

void FileProfiles::BeginBatch(const std::string& fileName) {
    if (Profile* profile = Open(fileName)) {
        ++profile->batchDepth;
    }
}

bool FileProfiles::EndBatch(const std::string& fileName) {
    Profile* profile = Open(fileName);
    if (profile == nullptr || profile->batchDepth == 0) {
        return false;
    }
    if (--profile->batchDepth > 0) {
        return true;
    }
    // A batch whose writes were not all taken stores none of them.
    const bool stored = !profile->refused && (profile->pending.empty() || Store(*profile, nullptr));
    profile->loaded = profile->loaded && !profile->refused;
    profile->pending.clear();
    profile->dirty = false;
    profile->refused = false;
    return stored;
}

bool FileProfiles::Store(Profile& profile, const Edit* edit) {
    if (profile.inConfigFolder && AtomicFile::MakeFolders(configFolder_)) {
        return false;
    }
    if (profile.file.Lock()) {
        return false;
    }
    const bool stored = StoreLocked(profile, edit);
    profile.file.Unlock();
    if (!stored) {
        profile.loaded = false;
    }
    return stored;
}

bool FileProfiles::StoreLocked(Profile& profile, const Edit* edit) {
    Load(profile);
    if (profile.status == ReadStatus::Unreadable) {
        return false;
    }
    const bool changed = edit != nullptr ? Apply(profile.document, *edit) : profile.dirty;
    if (!changed) {
        return true;
    }
    std::string aside;
    if (profile.foreign && profile.file.SetAside(aside)) {
        return false;
    }
    if (profile.file.Replace(profile.document.Serialise())) {
        return false;
    }
    // The document now matches the file; a read under the lock gives the
    // stamp that pins the version written.
    FileRead written = profile.file.Read();
    profile.status = written.status;
    profile.stamp = std::move(written.stamp);
    profile.foreign = false;
    profile.dirty = false;
    return true;
}

}  // namespace cv::posix
