// Reading and writing a large tuning file through IniFile: 1,000 sections of
// 20 keys. The baseline reads and parses the whole file for every read, as a
// store without a cache must; FileProfiles keeps the parsed file and only
// checks its change stamp. Writes are measured one replacement per key and
// as one batch for the whole document.

#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include <benchmark/benchmark.h>

#include "platform/posix/FileProfiles.h"
#include "platform/posix/IniDocument.h"
#include "stores/IniFile.h"
#include "support/TempFolder.h"

namespace {

constexpr int kSections = 1000;
constexpr int kKeysPerSection = 20;
constexpr int kKeys = kSections * kKeysPerSection;

struct Entry {
    std::string section;
    std::string key;
};

// A temporary folder holding the tuning file, removed at exit.
class Workspace {
  public:
    Workspace() {
        for (int section = 0; section < kSections; ++section) {
            for (int key = 0; key < kKeysPerSection; ++key) {
                entries_.push_back(
                    {"Channel" + std::to_string(section), "Key" + std::to_string(key)});
            }
        }
        Reset();
    }

    // Writes the file afresh: every value is "0.125".
    void Reset() const {
        std::ofstream file(Path(), std::ios::binary | std::ios::trunc);
        for (int section = 0; section < kSections; ++section) {
            file << "[Channel" << section << "]\r\n";
            for (int key = 0; key < kKeysPerSection; ++key) {
                file << "Key" << key << "=0.125\r\n";
            }
            file << "\r\n";
        }
    }

    std::string Path() const { return folder_.File("Large.tun"); }
    std::string Config() const { return folder_.File("config"); }
    const std::vector<Entry>& Entries() const { return entries_; }

  private:
    cv::test::TempFolder folder_;
    std::vector<Entry> entries_;
};

const Workspace& Files() {
    static const Workspace workspace;
    return workspace;
}

// Profiles without a cache: every read loads and parses the whole file.
class ReparsingProfiles : public cv::platform::ProfileApi {
  public:
    std::string GetPrivateProfileString(const std::string& sSection, const std::string& sKey,
                                        const std::string& sDefault, int32_t lBufferSize,
                                        const std::string& sFileName) override {
        std::ifstream file(sFileName, std::ios::binary);
        std::ostringstream text;
        text << file.rdbuf();
        const auto value = cv::posix::IniDocument::Parse(text.str()).Value(sSection, sKey);
        return (value ? *value : sDefault).substr(0, static_cast<size_t>(lBufferSize) - 1);
    }
    bool WritePrivateProfileString(const std::string&, const std::optional<std::string>&,
                                   const std::optional<std::string>&, const std::string&) override {
        return false;
    }
    bool FileReadable(const std::string&) override { return true; }
    void BeginBatch(const std::string&) override {}
    bool EndBatch(const std::string&) override { return false; }
};

void BM_ReadReparsingEveryKey(benchmark::State& state) {
    ReparsingProfiles profiles;
    cv::IniFile ini(profiles);
    ini.SetFileName(Files().Path());
    size_t next = 0;
    for (auto _ : state) {
        const Entry& entry = Files().Entries()[next];
        benchmark::DoNotOptimize(ini.ReadDouble(entry.section, entry.key, 0));
        next = (next + 1) % kKeys;
    }
    state.SetItemsProcessed(state.iterations());
}
BENCHMARK(BM_ReadReparsingEveryKey)->Unit(benchmark::kMicrosecond);

void BM_ReadAllKeysCached(benchmark::State& state) {
    Files().Reset();
    cv::posix::FileProfiles profiles(Files().Config());
    cv::IniFile ini(profiles);
    ini.SetFileName(Files().Path());
    for (auto _ : state) {
        double sum = 0;
        for (const Entry& entry : Files().Entries()) {
            sum += ini.ReadDouble(entry.section, entry.key, 0);
        }
        benchmark::DoNotOptimize(sum);
    }
    state.SetItemsProcessed(state.iterations() * kKeys);
}
BENCHMARK(BM_ReadAllKeysCached)->Unit(benchmark::kMillisecond);

void BM_WriteEachKeyReplacingTheFile(benchmark::State& state) {
    Files().Reset();
    cv::posix::FileProfiles profiles(Files().Config());
    cv::IniFile ini(profiles);
    ini.SetFileName(Files().Path());
    int32_t value = 0;
    for (auto _ : state) {
        const Entry& entry = Files().Entries()[static_cast<size_t>(value) % kKeys];
        ini.WriteLong(entry.section, entry.key, ++value);
    }
    state.SetItemsProcessed(state.iterations());
}
BENCHMARK(BM_WriteEachKeyReplacingTheFile)->Unit(benchmark::kMicrosecond);

void BM_WriteAllKeysInOneBatch(benchmark::State& state) {
    Files().Reset();
    cv::posix::FileProfiles profiles(Files().Config());
    cv::IniFile ini(profiles);
    ini.SetFileName(Files().Path());
    int32_t value = 0;
    for (auto _ : state) {
        cv::IniFile::Batch batch(ini);
        ++value;
        for (const Entry& entry : Files().Entries()) {
            ini.WriteLong(entry.section, entry.key, value);
        }
        benchmark::DoNotOptimize(batch.End());
    }
    state.SetItemsProcessed(state.iterations() * kKeys);
}
BENCHMARK(BM_WriteAllKeysInOneBatch)->Unit(benchmark::kMillisecond);

}  // namespace
