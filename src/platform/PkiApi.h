#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <system_error>
#include <vector>

namespace cv::platform {

// The folders of the program's certificate store, in the layout OPC UA
// applications share (below the store's root):
enum class PkiFolder {
    OwnCertificate,  // own/certs: the program's certificate (DER)
    OwnPrivateKey,   // own/private: its private key (PEM)
    Trusted,         // trusted/certs: server certificates (or authorities) the user trusts
    Rejected,        // rejected/certs: server certificates the user refused
    Issuers,         // issuers/certs: authorities that only help to build chains
};

struct PkiFile {
    std::string name;
    std::string bytes;
};

// The files of the certificate store. Files are written whole (a reader
// never sees half of one) and readable by their owner only.
class PkiApi {
  public:
    virtual ~PkiApi() = default;

    // Every readable file of the folder, by name; none for a missing folder.
    virtual std::vector<PkiFile> List(PkiFolder folder) = 0;
    // Nothing when the file is missing or cannot be read.
    virtual std::optional<std::string> Read(PkiFolder folder, const std::string& name) = 0;
    // Creates the folder when needed.
    virtual std::error_code Write(PkiFolder folder, const std::string& name,
                                  std::string_view bytes) = 0;
    // A missing file is no error.
    virtual std::error_code Remove(PkiFolder folder, const std::string& name) = 0;
    // Where the file is or would be, for texts that send the user there.
    virtual std::string PathOf(PkiFolder folder, const std::string& name) const = 0;
};

}  // namespace cv::platform
