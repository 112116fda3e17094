#pragma once

#include <string>

#include "platform/PkiApi.h"
#include "platform/posix/SystemCalls.h"

namespace cv::posix {

// The certificate store as folders below root (normally "pki" in the
// settings folder): own/certs, own/private, trusted/certs, rejected/certs,
// issuers/certs. Files are replaced atomically through AtomicFile and
// created readable by the owner only (0600), folders 0700.
class FilePki : public platform::PkiApi {
  public:
    explicit FilePki(std::string root, SystemCalls& calls = SystemCalls::Real());

    // <settings folder>/pki.
    static std::string DefaultRoot();

    std::vector<platform::PkiFile> List(platform::PkiFolder folder) override;
    std::optional<std::string> Read(platform::PkiFolder folder, const std::string& name) override;
    std::error_code Write(platform::PkiFolder folder, const std::string& name,
                          std::string_view bytes) override;
    std::error_code Remove(platform::PkiFolder folder, const std::string& name) override;
    std::string PathOf(platform::PkiFolder folder, const std::string& name) const override;

  private:
    std::string FolderOf(platform::PkiFolder folder) const;

    std::string root_;
    SystemCalls& calls_;
};

}  // namespace cv::posix
