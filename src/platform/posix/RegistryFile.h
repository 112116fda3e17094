#pragma once

#include <string>
#include <string_view>

#include "platform/posix/RegistryKey.h"

namespace cv::posix {

// The text form of one registry root, kept in one file per root:
//
//   CvOpcTestClient registry file 1
//   ; HKEY_CURRENT_USER
//
//   [Software\Corvalent\TestClient]
//   "ServerID"="\\\\PLANT1\\Vendor.Server.1"
//   "DecPt"=dword:00000002
//   "Odd bytes"=hex(3):01,ff
//   @="the key's unnamed value"
//
// The first line names the format. Blank lines and lines starting with ";"
// are ignored. A key line gives the key's full path below the root between
// "[" and "]"; the value lines after it, up to the next key line, belong to
// that key, and value lines before any key line to the root itself. Keys
// above a named key exist implicitly; a key is written on its own line when
// it holds values or has no sub-keys.
//
// Quoted names and texts escape a backslash as \\, a quote as \" and bytes
// below 0x20 and 0x7F as \xHH; other bytes stand as they are, so UTF-8 text
// stays readable. Key lines escape those bytes and "%" as %HH instead.
// Value data: "text" is a REG_SZ whose bytes are the text and one
// terminating NUL; dword:hhhhhhhh a REG_DWORD of four bytes (as a
// little-endian number); hex(t):hh,hh,... any other type t (in hex) or data,
// byte for byte. So every value keeps its type and exact bytes.
//
// Reading accepts CRLF line ends, a UTF-8 byte order mark, blanks around
// lines, and keys or values given twice (later values win). It never throws.
// A file with a wrong first line is damaged as a whole and yields no keys. A
// malformed line marks the file damaged and is skipped; after a malformed
// key line the values up to the next key line are skipped too, so no value
// lands in the wrong key. Everything else is read, so one bad line does not
// cost the user the rest of the settings.
class RegistryFile {
  public:
    static constexpr std::string_view kFirstLine = "CvOpcTestClient registry file 1";

    static RegistryKey Parse(std::string_view text, bool& damaged);
    // rootName appears as a comment for people reading the file.
    static std::string Write(const RegistryKey& root, std::string_view rootName);
};

}  // namespace cv::posix
