#pragma once

#include <gtest/gtest.h>

#include <fstream>
#include <memory>
#include <sstream>
#include <string>

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "stores/IniFile.h"
#include "support/TestPlatform.h"

namespace cv::test {

// A document whose tuning file lies in a fresh folder, and the shared
// settings file "Corvalen.ini" beside it.
class ChannelDisk : public ::testing::Test {
  protected:
    ChannelDisk() {
        doc.IniFileObject().SetFileName(tp.folder.File("Loop.tun"));
        shared.SetFileName("Corvalen.ini");
    }

    IniFile& Ini() { return doc.IniFileObject(); }

    // Archive channel lNumber (lType 0) or loop-specific channel lType.
    std::unique_ptr<Channel> Make(int32_t lNumber, int32_t lType = 0) {
        auto channel = std::make_unique<Channel>(tp.platform);
        channel->SetNumber(lNumber);
        channel->SetSpecificChannelType(lType);
        return channel;
    }

    std::unique_ptr<Channel> Read(int32_t lTuner, int32_t lNumber, int32_t lType = 0) {
        doc.SetTunerType(lTuner);
        auto channel = Make(lNumber, lType);
        channel->ReadFromDisk(shared, doc);
        return channel;
    }

    void Write(int32_t lTuner, Channel& channel) {
        doc.SetTunerType(lTuner);
        channel.WriteToDisk(shared, Ini(), doc.TunerTypeObj());
    }

    // What a fresh reader finds in the file; "-" for a missing entry.
    std::string Stored(const std::string& sFile, const std::string& sSection,
                       const std::string& sItem) {
        IniFile reader(tp.profiles);
        reader.SetFileName(sFile);
        return reader.ReadString(sSection, sItem, "-");
    }
    std::string Tun(const std::string& sSection, const std::string& sItem) {
        return Stored(Ini().FileName(), sSection, sItem);
    }
    std::string Shared(const std::string& sSection, const std::string& sItem) {
        return Stored("Corvalen.ini", sSection, sItem);
    }

    std::string TunBytes() {
        std::ifstream file(Ini().FileName(), std::ios::binary);
        std::ostringstream text;
        text << file.rdbuf();
        return text.str();
    }

    TestPlatform tp;
    TunFile doc{tp.platform};
    IniFile shared{tp.profiles};
};

}  // namespace cv::test
