#include "platform/posix/FileProfiles.h"

#include "platform/posix/ProfilePath.h"

namespace cv::posix {

namespace {

// The text a C string argument would carry: up to its first NUL.
std::string CString(const std::string& sText) {
    return sText.substr(0, sText.find('\0'));
}

std::optional<std::string> CString(const std::optional<std::string>& sText) {
    return sText ? std::optional<std::string>(CString(*sText)) : std::nullopt;
}

bool IsUtf16(const std::string& sText) {
    return sText.starts_with("\xFF\xFE") || sText.starts_with("\xFE\xFF");
}

std::string WithoutTrailingBlanks(std::string sText) {
    sText.erase(sText.find_last_not_of(" \t") + 1);
    return sText;
}

}  // namespace

FileProfiles::FileProfiles(std::string sConfigFolder) : msConfigFolder(std::move(sConfigFolder)) {}

FileProfiles::Profile* FileProfiles::Open(const std::string& sFileName) {
    const std::string path = ProfilePath(CString(sFileName), msConfigFolder);
    if (path.empty()) {
        return nullptr;
    }
    const auto found = mcProfiles.find(path);
    if (found != mcProfiles.end()) {
        return &found->second;
    }
    const bool settings = IsInConfigFolder(path, msConfigFolder);
    Profile& profile =
        mcProfiles
            .try_emplace(path, path, settings ? NewFileMode::OwnerOnly : NewFileMode::UmaskDefault)
            .first->second;
    profile.inConfigFolder = settings;
    return &profile;
}

void FileProfiles::Load(Profile& cProfile) {
    if (!cProfile.loaded || !(cProfile.file.Stamp() == cProfile.stamp)) {
        Reload(cProfile);
    }
}

void FileProfiles::Reload(Profile& cProfile) {
    FileRead read = cProfile.file.Read();
    cProfile.status = read.Status;
    cProfile.stamp = std::move(read.Stamp);
    cProfile.foreign = read.Status == ReadStatus::Read && IsUtf16(read.Text);
    const bool usable = read.Status == ReadStatus::Read && !cProfile.foreign;
    cProfile.document = usable ? IniDocument::Parse(read.Text) : IniDocument();
    cProfile.dirty = false;
    for (const Edit& edit : cProfile.pending) {
        cProfile.dirty = Apply(cProfile.document, edit) || cProfile.dirty;
    }
    cProfile.loaded = true;
}

bool FileProfiles::Apply(IniDocument& cDocument, const Edit& tEdit) {
    if (!tEdit.key) {
        return cDocument.EraseSection(tEdit.section);
    }
    if (!tEdit.value) {
        return cDocument.EraseKey(tEdit.section, *tEdit.key);
    }
    return cDocument.SetValue(tEdit.section, *tEdit.key, *tEdit.value);
}

std::string FileProfiles::GetPrivateProfileString(const std::string& sSection,
                                                  const std::string& sKey,
                                                  const std::string& sDefault, int32_t lBufferSize,
                                                  const std::string& sFileName) {
    if (lBufferSize <= 0) {
        return {};
    }
    std::optional<std::string> value;
    if (Profile* profile = Open(sFileName)) {
        Load(*profile);
        value = profile->document.Value(CString(sSection), CString(sKey));
    }
    std::string result = value ? std::move(*value) : WithoutTrailingBlanks(CString(sDefault));
    if (result.size() >= static_cast<size_t>(lBufferSize)) {
        result.resize(static_cast<size_t>(lBufferSize) - 1);
    }
    return result;
}

bool FileProfiles::WritePrivateProfileString(const std::string& sSection,
                                             const std::optional<std::string>& sKey,
                                             const std::optional<std::string>& sValue,
                                             const std::string& sFileName) {
    Edit edit{CString(sSection), CString(sKey), sKey ? CString(sValue) : std::nullopt};
    if (!IniDocument::IsSectionName(edit.section) ||
        (edit.key && !IniDocument::IsKeyName(*edit.key)) ||
        (edit.value && !IniDocument::IsValueText(*edit.value))) {
        return false;
    }
    Profile* profile = Open(sFileName);
    if (profile == nullptr) {
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

void FileProfiles::BeginBatch(const std::string& sFileName) {
    if (Profile* profile = Open(sFileName)) {
        ++profile->batchDepth;
    }
}

bool FileProfiles::EndBatch(const std::string& sFileName) {
    Profile* profile = Open(sFileName);
    if (profile == nullptr || profile->batchDepth == 0) {
        return false;
    }
    if (--profile->batchDepth > 0) {
        return true;
    }
    const bool stored = profile->pending.empty() || Store(*profile, nullptr);
    profile->pending.clear();
    profile->dirty = false;
    return stored;
}

bool FileProfiles::Store(Profile& cProfile, const Edit* pEdit) {
    if (cProfile.inConfigFolder && AtomicFile::MakeFolders(msConfigFolder) != 0) {
        return false;
    }
    if (cProfile.file.Lock() != 0) {
        return false;
    }
    const bool stored = StoreLocked(cProfile, pEdit);
    cProfile.file.Unlock();
    if (!stored) {
        cProfile.loaded = false;
    }
    return stored;
}

bool FileProfiles::StoreLocked(Profile& cProfile, const Edit* pEdit) {
    Load(cProfile);
    if (cProfile.status == ReadStatus::Unreadable) {
        return false;
    }
    const bool changed = pEdit != nullptr ? Apply(cProfile.document, *pEdit) : cProfile.dirty;
    if (!changed) {
        return true;
    }
    std::string aside;
    if (cProfile.foreign && cProfile.file.SetAside(aside) != 0) {
        return false;
    }
    if (cProfile.file.Replace(cProfile.document.Serialise()) != 0) {
        return false;
    }
    // The document now matches the file; a read under the lock gives the
    // stamp that pins the version written.
    FileRead written = cProfile.file.Read();
    cProfile.status = written.Status;
    cProfile.stamp = std::move(written.Stamp);
    cProfile.foreign = false;
    cProfile.dirty = false;
    return true;
}

}  // namespace cv::posix
