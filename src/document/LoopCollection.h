#pragma once

#include <cstdint>
#include <memory>
#include <vector>

#include "document/LoopClass.h"

namespace cv {

class TunFile;
struct Platform;

// The loops of a tuning document, numbered 1 to Count without gaps, and the
// number of the current one (0 while there is none). The collection owns
// its loops; pointers it hands out stay valid until that loop is removed or
// the collection goes.
class LoopCollection {
  public:
    // The most loops a tuning file is read with: "NumberOfLoops" is plain
    // text a user may have typed, and a count in the millions would
    // otherwise exhaust memory and time.
    static constexpr int32_t kMaxLoops = 1000;

    explicit LoopCollection(Platform& platform);
    LoopCollection(const LoopCollection&) = delete;
    LoopCollection& operator=(const LoopCollection&) = delete;

    int32_t Count() const { return static_cast<int32_t>(maLoops.size()); }

    // A new current loop is taken only when it is not above Count.
    int32_t CurrentLoop() const { return mlCurrentLoop; }
    void SetCurrentLoop(int32_t lLoop);

    // Item(lLoop)'s channel numbers; 0 when there is no such loop.
    int32_t PVChannelNumber(int32_t lLoop) const;
    int32_t COChannelNumber(int32_t lLoop) const;
    int32_t SPChannelNumber(int32_t lLoop) const;

    // Appends a new loop numbered Count (lNumber is not used) and makes that
    // new loop current when there is no current loop. bFailed is set when the loop
    // could not be made; the result is then null.
    LoopClass* Add(int32_t lNumber, bool& bFailed);

    // Removes the loop carrying cLoop's Number, renumbers the loops above it
    // down by one, lowers CurrentLoop to Count when above it, and nulls
    // cLoop. A loop whose number is not present (or no loop) is ignored.
    void Remove(LoopClass*& cLoop);

    // The loop with that number, or null.
    LoopClass* Item(int32_t lLoop);
    const LoopClass* Item(int32_t lLoop) const;

    // The loop count in section "ArchiveTuner", key "NumberOfLoops", and one
    // section per loop. Reading appends to the loops already held; writing
    // erases the sections of loops the file held beyond Count.
    void ReadFromDisk(TunFile& cTunFile);
    void WriteToDisk(TunFile& cTunFile);

    // Adds one loop described "Faceplate".
    void SetDefaults();

    // A new collection with a copy (CopyFrom) of every loop in order and the
    // same current loop.
    std::unique_ptr<LoopCollection> Copy() const;

  private:
    Platform& mPlatform;
    std::vector<std::unique_ptr<LoopClass>> maLoops;
    int32_t mlCurrentLoop = 0;
};

}  // namespace cv
