#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "channel/Channel.h"
#include "platform/ModelessMessages.h"

namespace cv {

class IniFile;
class TunFile;
class TunerType;
struct Platform;

// The charted channels of a tuning document: channel 1 is the PV, 2 the CO,
// 3 the SP, higher numbers are extra charted channels. The collection owns
// its channels and keeps them numbered 1..Count in list order; the pointers
// it hands out stay valid until the channel is removed or the collection goes.
class ArchiveChannels {
  public:
    // The most channels one collection holds. A file may claim any count;
    // reading takes at most this many, Add refuses more, and writing erases
    // stale sections only up to this number.
    static constexpr int32_t kMaxChannels = 1000;

    explicit ArchiveChannels(Platform& platform);
    // Goes offline first.
    ~ArchiveChannels();
    ArchiveChannels(const ArchiveChannels&) = delete;
    ArchiveChannels& operator=(const ArchiveChannels&) = delete;

    // Appends a channel numbered lNumber; nullptr with bError set when the
    // collection is full or memory runs out.
    Channel* Add(int32_t lNumber, bool& bError);
    // Removes the last channel carrying cChannel's number, numbers the
    // channels above it down by one and nulls the caller's pointer. A number
    // not in the list changes nothing.
    void Remove(Channel*& cChannel);

    // Replaces the channels by PV, CO and SP, OPC channels with the shared
    // file's display defaults.
    void SetDefaults(TunFile& cTunFile);
    // Replaces the channels by those of the document's tuning file.
    bool ReadFromDisk(TunFile& cTunFile);
    // Writes every channel and the count, erasing the sections of channels
    // the file held beyond the new count.
    void WriteToDisk(IniFile& cIni, cv::TunerType& cTunerType);
    void WriteDisplayDataToDisk(IniFile& cIni, cv::TunerType& cTunerType);
    // Only PV, CO and SP write their spans.
    void WriteSpansToDisk(IniFile& cIni, cv::TunerType& cTunerType);

    std::unique_ptr<ArchiveChannels> Copy() const;
    // Each channel of the source is copied onto the channel at the position
    // of its number (if there is one); the source is then emptied and
    // released, and the caller's pointer is null.
    void CopyFrom(std::unique_ptr<ArchiveChannels>& cArchives);

    // The first channel numbered lNumber, or nullptr.
    Channel* Item(int32_t lNumber) const;
    // The first number from lStart on whose channel has exactly this
    // description; 0 when none has.
    int32_t FindChannel(const std::string& sDescription, int32_t lStart) const;
    Channel* PVChannel() const { return Item(1); }
    Channel* COChannel() const { return Item(2); }
    Channel* SPChannel() const { return Item(3); }
    int32_t Count() const { return static_cast<int32_t>(maChannels.size()); }
    const std::vector<std::unique_ptr<Channel>>& Collection() const { return maChannels; }

    // lMaster 1: SP takes PV's display range and units; 3: the reverse.
    void SetPVSPDisplayLimitsEqual(int32_t lMaster);

    // Online together. A PV or CO that fails is fatal: the collection goes
    // offline and the failure is shown modally. SP and extra channels that
    // fail are reported and the rest goes on; once every channel was seen
    // online, each such channel's failure shows in one modeless window of
    // its own. 0 offline, 1 waiting, 2 online.
    int32_t Online(bool bTimedOut);
    bool IsOnline() { return Online(false) == OnlineState::Online; }
    bool CreateCommsObjects(TunFile& cTunFile, bool bSilent);
    bool GoOnline(TunFile& cTunFile, bool bSilent);
    // Every channel offline and every message window closed.
    void GoOffline();
    bool SingleShotRead(TunFile& cTunFile);

  private:
    using Step = bool (Channel::*)(TunFile&, int32_t&, std::string&, bool);
    bool EveryChannel(Step step, TunFile& cTunFile, bool bSilent);
    bool ReportDropOut(Channel& cChannel);
    void CloseMessageWindows();

    Platform& mPlatform;
    std::vector<std::unique_ptr<Channel>> maChannels;
    // One modeless window per channel number; a single slot until every
    // channel was first seen online.
    std::vector<platform::ModelessMessages::WindowId> maMessageWindows{0};
};

}  // namespace cv
