#pragma once

#include <string>

namespace cv::security {

// Why a connection the user asked for did not come about, in plain words:
// a headline that quotes the names in use, an empty line, numbered lines of
// what to check (CR LF between lines).

// The server offers nothing that fits the choices for it; offered is the
// library's text of what it does offer.
std::string DescribeUnoffered(const std::string& endpointUrl, const std::string& offered);
// A secured connection failed for a security reason, perhaps because the
// server does not trust the program's certificate yet.
std::string DescribeSecurityRefusal(const std::string& endpointUrl, const std::string& reason,
                                    const std::string& certificatePath,
                                    const std::string& thumbprint);
std::string DescribeUserRefusal(const std::string& endpointUrl, const std::string& userName,
                                const std::string& reason);
// The most secure choice found only endpoints without security, so a
// password would go to a server nobody can check.
std::string DescribeUnsecuredServer(const std::string& endpointUrl, const std::string& userName);
// The endpoint would take the password in clear text.
std::string DescribeClearPassword(const std::string& endpointUrl, const std::string& userName);
// The server answering is not the one whose certificate was checked.
std::string DescribeDoubtfulServer(const std::string& endpointUrl, const std::string& reason);
std::string DescribeNoUserName(const std::string& endpointUrl);
std::string DescribeNoPassword(const std::string& endpointUrl, const std::string& userName);
std::string DescribeOwnCertificateFailure(const std::string& reason, const std::string& folder);

}  // namespace cv::security
