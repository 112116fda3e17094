#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "channel/Channel.h"
#include "document/ArchiveChannels.h"
#include "document/LoopCollection.h"
#include "document/ModeMapClass.h"
#include "document/SpecificChannels.h"
#include "document/TunFileGeneral.h"
#include "document/TunerType.h"
#include "stores/IniFile.h"

namespace cv {

struct Platform;

// The tuning document: owns the charted channels, the loop-specific
// channels, the loops, the INI store of its tuning file, the tuner kind, the
// general settings and the controller mode map, and is the hub every
// collection and channel receives by reference. It is neither copied nor
// moved, since its parts keep references to it.
//
// A default document's file is "LoopTag.tun" in the program's folder, or,
// when that folder cannot be written, in the program's data folder
// (ProgramInfo::DataFolder) under the same name.
class CvOpcAutoClient;

class TunFile {
  public:
    static constexpr const char* kDefaultFileName = "LoopTag.tun";

    explicit TunFile(Platform& platform);
    ~TunFile();
    TunFile(const TunFile&) = delete;
    TunFile& operator=(const TunFile&) = delete;

    // Builds PV, CO and SP, specific channels 1 to 10 and one loop, and
    // names the default file.
    void SetDefaults(int32_t lTuner);
    // Reads a tuning file into a fresh document; a document that already has
    // a file name, an empty path, and a file that is missing or cannot be
    // read are refused with a message, leaving the document as it was. A
    // file that merely lacks keys reads their defaults.
    bool ReadFromDisk(int32_t lTuner, const std::string& sPath);
    // Writes the document to sPath as one replacement of the file (and one
    // of the shared settings file, which holds the colours and widths of PV,
    // CO and SP): other programs see all of each file's part or none of it.
    // False with a message when the path is empty or either part could not
    // be stored whole (a text the file refuses fails its part); the document
    // keeps its old file name unless the tuning file itself was stored.
    [[nodiscard]] bool WriteToDisk(const std::string& sPath);
    // Upgrades keys that files of version 12.07.99 and before held in an
    // older form.
    void ConvertFileFormat();

    // The file name without folder and last extension; setting it cuts the
    // tag at its last "." and names "<tag>.tun" in the current folder.
    std::string LoopTag() const;
    void SetLoopTag(const std::string& sTag);
    const std::string& TunFilePath() const { return mcIniFile.FileName(); }

    ArchiveChannels& Archives() { return *mcArchives; }
    const ArchiveChannels& Archives() const { return *mcArchives; }
    // A null collection is ignored: the document always has one.
    void SetArchives(std::unique_ptr<ArchiveChannels> cArchives);
    SpecificChannels& Specifics() { return *mcSpecifics; }
    const SpecificChannels& Specifics() const { return *mcSpecifics; }
    LoopCollection& Loops() { return *mcLoops; }
    const LoopCollection& Loops() const { return *mcLoops; }
    // A null collection is ignored: the document always has one.
    void SetLoops(std::unique_ptr<LoopCollection> cLoops);

    // The INI store of the tuning file; its file name is the file's path.
    IniFile& IniFileObject() { return mcIniFile; }
    const IniFile& IniFileObject() const { return mcIniFile; }

    // The tuner-kind code, forwarded to the tuner kind.
    int32_t TunerType() const { return mcTunerType.Tuner(); }
    void SetTunerType(int32_t lTuner) { mcTunerType.SetTuner(lTuner); }
    cv::TunerType& TunerTypeObj() { return mcTunerType; }
    const cv::TunerType& TunerTypeObj() const { return mcTunerType; }

    TunFileGeneral& General() { return *mcGeneral; }
    const TunFileGeneral& General() const { return *mcGeneral; }
    // Null settings are ignored: the document always has them.
    void SetGeneral(std::unique_ptr<TunFileGeneral> cGeneral);
    // Created empty; filled by the callers through its own operations.
    ModeMapClass& ModeMap() { return mcModeMap; }
    const ModeMapClass& ModeMap() const { return mcModeMap; }

    LoopClass* FaceplateLoop() { return mcLoops->Item(1); }
    LoopClass* CurrentLoop() { return mcLoops->Item(mcLoops->CurrentLoop()); }
    // The current loop's channel numbers; 0 when beyond the archive count.
    int32_t CurrentPVChannel() const;
    int32_t CurrentCOChannel() const;
    int32_t CurrentSPChannel() const;
    // The archive channels of those numbers; nullptr below 1.
    Channel* CurrentPVChannelObj() const;
    Channel* CurrentCOChannelObj() const;
    Channel* CurrentSPChannelObj() const;

    // The controller's mode in words from the mode map, while the mode
    // channel has data; "Unknown" otherwise.
    std::string ModeValue();
    bool IsValid() const { return mcArchives->Count() >= 1; }
    bool IsSimulation() const { return false; }

    // Online as a whole: 0 offline, 1 waiting for a first value, 2 online.
    // With bTimedOut a channel still waiting fails as timed out.
    int32_t Online(bool bTimedOut);
    // Creates every channel's communications and starts the scan; a failure
    // leaves everything offline. bSilent leaves the channels' failures in
    // their error texts.
    bool GoOnline(bool bSilent);
    void GoOffline();
    // One read of every online channel; false (everything offline) on a
    // failure, or with hot links on, or with the charted channels offline.
    bool SingleShotRead();

    // The OPC clients, one per server ID and computer, in creation order;
    // they exist only while online. A client joins the list as it starts to
    // connect.
    const std::vector<std::shared_ptr<CvOpcAutoClient>>& OpcClients() const { return mcOpcClients; }
    // Serves the channel by the client of its server and computer, which is
    // created and connected first when there is none. Going offline while
    // that client connects ends it, and the channel is not served.
    ErrorInfo CreateOpcAutoObject(Channel& cChannel);
    // Every client's main group: update rate lRate (ms) and notifications on.
    void OpcAutoGoOnline(int32_t lRate);
    // Ends every client and empties the list.
    void OpcAutoGoOffline();
    // One device read of group lGroup through every connected client, up to
    // the first that fails. A client that ends while it reads stops the read
    // without a message of its own.
    ErrorInfo OpcAutoSingleShotRead(int32_t lGroup);

  private:
    std::shared_ptr<CvOpcAutoClient> FindOpcClient(const Channel& cChannel) const;
    ErrorInfo NewOpcClient(const Channel& cChannel, std::shared_ptr<CvOpcAutoClient>& cClient);
    int32_t ArchiveNumber(int32_t lNumber) const;
    Channel* ArchiveObj(int32_t lNumber) const;
    void CopyFaceplateRanges();
    std::string DefaultPath() const;
    void ShowError(const std::string& sText);

    Platform& mPlatform;
    std::unique_ptr<ArchiveChannels> mcArchives;
    std::unique_ptr<SpecificChannels> mcSpecifics;
    std::unique_ptr<LoopCollection> mcLoops;
    IniFile mcIniFile;
    cv::TunerType mcTunerType;
    std::unique_ptr<TunFileGeneral> mcGeneral;
    ModeMapClass mcModeMap;
    // Shared, so that a member waiting on a client keeps it while events
    // take it out of the list.
    std::vector<std::shared_ptr<CvOpcAutoClient>> mcOpcClients;
};

}  // namespace cv
