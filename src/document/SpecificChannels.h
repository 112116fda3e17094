#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "channel/Channel.h"

namespace cv {

class TunFile;
struct Platform;

// Loop-specific channel types (Channel::SpecificChannelType).
namespace SpecificType {
inline constexpr int32_t P = 1;
inline constexpr int32_t I = 2;
inline constexpr int32_t D = 3;
inline constexpr int32_t Mode = 4;
inline constexpr int32_t SendCO = 5;
inline constexpr int32_t SendSP = 6;
inline constexpr int32_t SendP = 7;
inline constexpr int32_t SendI = 8;
inline constexpr int32_t SendD = 9;
inline constexpr int32_t SendMode = 10;
inline constexpr int32_t Filter = 11;
inline constexpr int32_t SendFilter = 12;
}  // namespace SpecificType

// The channels through which a faceplate tuner reads a controller's P, I, D,
// mode and filter settings and writes new ones: one channel per type, types
// 1 to 10 always, the filter pair 11 and 12 only for tuner kinds with a
// read/write filter. Channel k of the collection has Number k.
class SpecificChannels {
  public:
    explicit SpecificChannels(Platform& platform);
    SpecificChannels(const SpecificChannels&) = delete;
    SpecificChannels& operator=(const SpecificChannels&) = delete;

    const std::vector<std::unique_ptr<Channel>>& Collection() const { return maChannels; }

    // The filter pair takes part in scanning; can be true only while the
    // filter channels exist.
    bool FilterReadWrite() const { return mbFilterReadWrite; }
    void SetFilterReadWrite(bool bValue) { mbFilterReadWrite = bValue && mbFilterChannelsExist; }
    bool FilterChannelsExist() const { return mbFilterChannelsExist; }
    // The highest type scanning visits: 12 with the filter, else 10.
    int32_t FinalChannel() const;

    // Replaces the channels by types 1 to 10, OPC channels, without filter.
    void SetDefaults(TunFile& cTunFile);
    // Replaces the channels by those of the document's tuning file; a tuner
    // kind without faceplate has none.
    void ReadFromDisk(TunFile& cTunFile);
    // Nothing for a tuner kind without faceplate.
    void WriteToDisk(TunFile& cTunFile);

    // The first channel of that type, or nullptr.
    Channel* Item(int32_t lType) const;

    // Online together, with the read channel of each setting deciding for
    // the next: no P, no I and D. Channel failures are reported by the
    // channels with what they disable; the collection itself never fails to
    // go online. 0 offline, 1 waiting, 2 online.
    int32_t Online(bool bTimedOut);
    bool IsOnline() { return Online(false) == OnlineState::Online; }
    bool CreateCommsObjects(TunFile& cTunFile, bool bSilent);
    bool GoOnline(TunFile& cTunFile, bool bSilent);
    void GoOffline();
    bool SingleShotRead(TunFile& cTunFile);

  private:
    bool CreateOne(Channel* cChannel, TunFile& cTunFile, const std::string& sMessage, bool bSilent);
    bool GoOnlineOne(Channel* cChannel, TunFile& cTunFile, const std::string& sMessage,
                     bool bSilent);
    void ReportDropOut(Channel& cChannel);
    Channel* Add(int32_t lType);
    void Clear();

    Platform& mPlatform;
    std::vector<std::unique_ptr<Channel>> maChannels;
    bool mbFilterReadWrite = false;
    bool mbFilterChannelsExist = false;
};

}  // namespace cv
