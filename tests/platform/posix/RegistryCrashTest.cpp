#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <random>

#include <gtest/gtest.h>

#include "platform/posix/FileRegistry.h"
#include "platform/posix/RegistryFile.h"
#include "support/TempFolder.h"
#include "support/TestFiles.h"

namespace cv::posix {
namespace {

using namespace platform;

// Long enough that a replace takes a while, and checkable for tearing.
std::string Pattern(int32_t lRound) {
    std::string text = "round " + std::to_string(lRound) + ":";
    for (int i = 0; i < 4000; ++i) {
        text += static_cast<char>('a' + (lRound * 7 + i) % 26);
    }
    return text + '\0';
}

std::string DwordBytes(int32_t lValue) {
    return std::string(reinterpret_cast<char*>(&lValue), 4);
}

int32_t Put(FileRegistry& cRegistry, int32_t lRoot, const std::string& sName, int32_t lType,
            const std::string& sData) {
    RegistryApi::Key key = 0;
    int32_t result = cRegistry.CreateKey(lRoot, "Software\\Stress", kKeyAllAccess, key);
    if (result == kErrorSuccess) {
        result = cRegistry.SetValue(key, sName, lType, sData);
        cRegistry.CloseKey(key);
    }
    return result;
}

// The child: from round lFirst on, writes the counter and the pattern to the
// user's file and the round to the machine's file, then reports the round
// as done. Runs until killed.
[[noreturn]] void WriteRounds(const std::string& sFolder, int32_t lFirst, int iReport) {
    FileRegistry registry(sFolder, FileRegistry::MachineAccess::ReadWrite);
    for (int32_t round = lFirst;; ++round) {
        if (Put(registry, kHkeyCurrentUser, "Counter", kRegDword, DwordBytes(round)) != 0 ||
            Put(registry, kHkeyCurrentUser, "State", kRegSz, Pattern(round)) != 0 ||
            Put(registry, kHkeyLocalMachine, "Round", kRegDword, DwordBytes(round)) != 0 ||
            ::write(iReport, &round, sizeof round) != sizeof round) {
            ::_exit(1);
        }
    }
}

// Reads one root's file strictly: it must be whole and undamaged.
RegistryKey ReadWhole(const std::string& sPath) {
    bool damaged = true;
    RegistryKey root = RegistryFile::Parse(test::Slurp(sPath), damaged);
    EXPECT_FALSE(damaged) << sPath;
    return root;
}

std::string DataAt(const RegistryKey& cRoot, const std::string& sName, int32_t lType) {
    const RegistryKey* key = cRoot.Find({"Software", "Stress"});
    const RegistryValue* value = key == nullptr ? nullptr : key->Value(sName);
    if (value == nullptr || value->type != lType) {
        ADD_FAILURE() << sName << " missing";
        return {};
    }
    return value->data;
}

int32_t DwordAt(const RegistryKey& cRoot, const std::string& sName) {
    const std::string data = DataAt(cRoot, sName, kRegDword);
    int32_t number = -100;
    EXPECT_EQ(data.size(), 4u) << sName;
    std::copy_n(data.begin(), std::min<size_t>(data.size(), 4), reinterpret_cast<char*>(&number));
    return number;
}

int32_t PatternRound(const RegistryKey& cRoot) {
    const std::string data = DataAt(cRoot, "State", kRegSz);
    const int32_t round = data.size() > 6 ? std::stoi(data.substr(6)) : -100;
    EXPECT_EQ(data, Pattern(round)) << "a torn value";
    return round;
}

// Starts a writer, lets it finish a random number of rounds, kills it at a
// random moment of the next one; returns the last round it reported.
int32_t RunAndKill(const std::string& sFolder, int32_t lFirst, std::mt19937& cRandom) {
    int report[2];
    EXPECT_EQ(::pipe(report), 0);
    const pid_t child = ::fork();
    if (child == 0) {
        ::close(report[0]);
        WriteRounds(sFolder, lFirst, report[1]);
    }
    ::close(report[1]);
    const int wanted = std::uniform_int_distribution<int>(1, 6)(cRandom);
    int32_t last = lFirst - 1;
    for (int got = 0; got < wanted; ++got) {
        EXPECT_EQ(::read(report[0], &last, sizeof last), static_cast<ssize_t>(sizeof last));
    }
    volatile int spin = 0;
    for (int i = std::uniform_int_distribution<int>(0, 400000)(cRandom); i > 0; --i) {
        spin = spin + 1;
    }
    ::kill(child, SIGKILL);
    int status = 0;
    ::waitpid(child, &status, 0);
    // Rounds it reported while this process spun are reported all the same.
    for (int32_t more = 0; ::read(report[0], &more, sizeof more) == sizeof more;) {
        last = more;
    }
    ::close(report[0]);
    EXPECT_TRUE(WIFSIGNALED(status)) << "the writer failed by itself";
    return last;
}

TEST(RegistryCrash, AKilledWriterLeavesWholeFilesAndKeepsEveryReportedWrite) {
    test::TempFolder folder;
    const unsigned seed = std::random_device{}();
    SCOPED_TRACE("seed " + std::to_string(seed));
    std::mt19937 random(seed);
    const std::string user = folder.File(FileRegistry::kCurrentUserFile);
    const std::string machine = folder.File(FileRegistry::kLocalMachineFile);
    int32_t next = 0;
    for (int run = 0; run < 30 && !HasFailure(); ++run) {
        const int32_t reported = RunAndKill(folder.Path(), next, random);
        const RegistryKey userRoot = ReadWhole(user);
        const int32_t counter = DwordAt(userRoot, "Counter");
        const int32_t state = PatternRound(userRoot);
        const int32_t round = DwordAt(ReadWhole(machine), "Round");
        EXPECT_TRUE(counter == reported || counter == reported + 1) << counter << " " << reported;
        EXPECT_TRUE(state == counter || state == counter - 1) << state << " " << counter;
        EXPECT_TRUE(round == state || round == state - 1) << round << " " << state;
        EXPECT_GE(round, reported);
        next = counter + 1;
    }
    for (const auto& entry : std::filesystem::directory_iterator(folder.Path())) {
        const std::string name = entry.path().filename().string();
        EXPECT_TRUE(entry.path() == user || entry.path() == machine ||
                    name.find(".cv-tmp") != std::string::npos)
            << name;
    }
}

TEST(RegistryCrash, TwoWritersOfOneStoreLoseNothingOfEachOther) {
    test::TempFolder folder;
    int go[2];
    ASSERT_EQ(::pipe(go), 0);
    for (const char tag : {'A', 'B'}) {
        if (::fork() == 0) {
            ::close(go[1]);
            char start = 0;
            FileRegistry registry(folder.Path());
            bool good = ::read(go[0], &start, 1) == 1;
            for (int32_t i = 0; i < 60 && good; ++i) {
                good = Put(registry, kHkeyCurrentUser, tag + std::to_string(i), kRegDword,
                           DwordBytes(i)) == kErrorSuccess;
            }
            ::_exit(good ? 0 : 1);
        }
    }
    ASSERT_EQ(::write(go[1], "gg", 2), 2);
    ::close(go[1]);
    ::close(go[0]);
    for (int child = 0; child < 2; ++child) {
        int status = -1;
        ::wait(&status);
        EXPECT_EQ(status, 0);
    }
    const RegistryKey root = ReadWhole(folder.File(FileRegistry::kCurrentUserFile));
    for (const char tag : {'A', 'B'}) {
        for (int32_t i = 0; i < 60; ++i) {
            EXPECT_EQ(DwordAt(root, tag + std::to_string(i)), i);
        }
    }
}

}  // namespace
}  // namespace cv::posix
