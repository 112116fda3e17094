// Feeds any bytes to the registry file reader. Whatever it reads must write
// out as a clean file that reads back to the very same text. An odd first
// byte puts the format's first line before the rest, so the fuzzer spends
// its time on the lines after it.
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

#include "platform/posix/RegistryFile.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    using cv::posix::RegistryFile;
    using cv::posix::RegistryKey;
    std::string text(reinterpret_cast<const char*>(data), size);
    if (size > 0 && (data[0] & 1) != 0) {
        text = std::string(RegistryFile::kFirstLine) + "\n" + text.substr(1);
    }
    bool damaged = false;
    const RegistryKey root = RegistryFile::Parse(text, damaged);
    const std::string written = RegistryFile::Write(root, "HKEY_CURRENT_USER");
    bool writtenDamaged = true;
    const RegistryKey back = RegistryFile::Parse(written, writtenDamaged);
    if (writtenDamaged || RegistryFile::Write(back, "HKEY_CURRENT_USER") != written) {
        std::abort();
    }
    return 0;
}
