#include "document/LoopCollection.h"

#include <algorithm>
#include <new>
#include <utility>

#include "document/TunFile.h"

namespace cv {

namespace {

constexpr const char* kCountSection = "ArchiveTuner";
constexpr const char* kCountKey = "NumberOfLoops";

}  // namespace

LoopCollection::LoopCollection(Platform& platform) : mPlatform(platform) {}

void LoopCollection::SetCurrentLoop(int32_t lLoop) {
    if (lLoop <= Count()) {
        mlCurrentLoop = lLoop;
    }
}

int32_t LoopCollection::PVChannelNumber(int32_t lLoop) const {
    const LoopClass* cLoop = Item(lLoop);
    return cLoop == nullptr ? 0 : cLoop->PVChannel();
}

int32_t LoopCollection::COChannelNumber(int32_t lLoop) const {
    const LoopClass* cLoop = Item(lLoop);
    return cLoop == nullptr ? 0 : cLoop->COChannel();
}

int32_t LoopCollection::SPChannelNumber(int32_t lLoop) const {
    const LoopClass* cLoop = Item(lLoop);
    return cLoop == nullptr ? 0 : cLoop->SPChannel();
}

LoopClass* LoopCollection::Add(int32_t /*lNumber*/, bool& bFailed) {
    try {
        maLoops.push_back(std::make_unique<LoopClass>(mPlatform));
    } catch (const std::bad_alloc&) {
        bFailed = true;
        return nullptr;
    }
    bFailed = false;
    LoopClass* cLoop = maLoops.back().get();
    cLoop->SetNumber(Count());
    if (mlCurrentLoop == 0) {
        mlCurrentLoop = cLoop->Number();
    }
    return cLoop;
}

void LoopCollection::Remove(LoopClass*& cLoop) {
    if (cLoop == nullptr) {
        return;
    }
    const int32_t lNumber = cLoop->Number();
    const auto found = std::find_if(maLoops.begin(), maLoops.end(),
                                    [lNumber](const auto& p) { return p->Number() == lNumber; });
    if (found == maLoops.end()) {
        return;
    }
    cLoop = nullptr;
    maLoops.erase(found);
    for (const auto& p : maLoops) {
        if (p->Number() > lNumber) {
            p->SetNumber(p->Number() - 1);
        }
    }
    mlCurrentLoop = std::min(mlCurrentLoop, Count());
}

LoopClass* LoopCollection::Item(int32_t lLoop) {
    return const_cast<LoopClass*>(std::as_const(*this).Item(lLoop));
}

const LoopClass* LoopCollection::Item(int32_t lLoop) const {
    for (const auto& p : maLoops) {
        if (p->Number() == lLoop) {
            return p.get();
        }
    }
    return nullptr;
}

void LoopCollection::ReadFromDisk(TunFile& cTunFile) {
    int32_t lCount = cTunFile.IniFileObject().ReadLong(kCountSection, kCountKey, 0, 0, kMaxLoops);
    if (lCount < 1 && cTunFile.TunerTypeObj().HasFaceplate()) {
        lCount = 1;
    }
    for (int32_t k = 1; k <= lCount; ++k) {
        bool bFailed = false;
        LoopClass* cLoop = Add(k, bFailed);
        if (!bFailed) {
            cLoop->ReadFromDisk(cTunFile);
        }
    }
}

void LoopCollection::WriteToDisk(TunFile& cTunFile) {
    IniFile& ini = cTunFile.IniFileObject();
    IniFile::Batch batch(ini);
    for (const auto& p : maLoops) {
        p->WriteToDisk(cTunFile);
    }
    const int32_t lCount = Count();
    const int32_t lStored = ini.ReadLong(kCountSection, kCountKey, 0, 0, 0);
    if (lCount == lStored) {
        return;
    }
    ini.WriteLong(kCountSection, kCountKey, lCount);
    // Sections beyond kMaxLoops are never read, so a wild stored count costs
    // no more than that many erasures.
    for (int32_t k = lCount + 1; k <= std::min(lStored, kMaxLoops); ++k) {
        ini.EraseSection(LoopClass::SectionName(k));
    }
}

void LoopCollection::SetDefaults() {
    bool bFailed = false;
    if (LoopClass* cLoop = Add(0, bFailed)) {
        cLoop->SetDescription("Faceplate");
    }
}

std::unique_ptr<LoopCollection> LoopCollection::Copy() const {
    auto cCopy = std::make_unique<LoopCollection>(mPlatform);
    for (const auto& p : maLoops) {
        bool bFailed = false;
        if (LoopClass* cLoop = cCopy->Add(0, bFailed)) {
            cLoop->CopyFrom(p.get());
        }
    }
    cCopy->mlCurrentLoop = mlCurrentLoop;
    return cCopy;
}

}  // namespace cv
