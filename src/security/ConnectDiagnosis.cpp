#include "security/ConnectDiagnosis.h"

#include <initializer_list>

namespace cv::security {
namespace {

std::string Quoted(const std::string& text) {
    return "\"" + text + "\"";
}

std::string Lines(std::initializer_list<std::string> lines) {
    std::string text;
    for (const std::string& line : lines) {
        text += (text.empty() ? "" : "\r\n") + line;
    }
    return text;
}

}  // namespace

std::string DescribeUnoffered(const std::string& endpointUrl, const std::string& offered) {
    return Lines({"The server at " + Quoted(endpointUrl) +
                      " does not offer the security chosen "
                      "for it.",
                  "", "1. " + offered,
                  "2. Choose another security mode, policy or user for this server."});
}

std::string DescribeSecurityRefusal(const std::string& endpointUrl, const std::string& reason,
                                    const std::string& certificatePath,
                                    const std::string& thumbprint) {
    return Lines({"The secured connection to " + Quoted(endpointUrl) + " failed. " + reason, "",
                  "1. A server refuses a client it does not know yet: ask its administrator "
                  "to trust the program's certificate " +
                      Quoted(certificatePath) + " (thumbprint " + thumbprint + ").",
                  "2. Then connect again."});
}

std::string DescribeUserRefusal(const std::string& endpointUrl, const std::string& userName,
                                const std::string& reason) {
    return Lines({"The server at " + Quoted(endpointUrl) + " refused the user name " +
                      Quoted(userName) + ". " + reason,
                  "", "1. Check the user name and the password.",
                  "2. Check that this user may log on to the server."});
}

std::string DescribeUnsecuredServer(const std::string& endpointUrl, const std::string& userName) {
    return Lines(
        {"The program did not send the password of " + Quoted(userName) + " to " +
             Quoted(endpointUrl) + ": the server offers only connections without security, " +
             "so nothing proves that the computer answering is the server.",
         "",
         "1. Ask the server's administrator to offer a secured endpoint (Sign or "
         "SignAndEncrypt).",
         "2. On a network you trust, you may choose the security mode None for this server on "
         "purpose (Security... beside the server, or --security-mode None); the password is "
         "then encrypted to a server certificate you trust, and never sent in clear text."});
}

std::string DescribeClearPassword(const std::string& endpointUrl, const std::string& userName) {
    return Lines({"The program did not send the password of " + Quoted(userName) + " to " +
                      Quoted(endpointUrl) +
                      ": this endpoint would take it in clear text, readable on the network.",
                  "",
                  "1. Choose the security mode SignAndEncrypt for this server, or ask its "
                  "administrator to encrypt passwords (a user token security policy)."});
}

std::string DescribeDoubtfulServer(const std::string& endpointUrl, const std::string& reason) {
    return Lines({"The program stopped connecting to " + Quoted(endpointUrl) +
                      ": the server answering is not the one whose certificate was checked. " +
                      reason,
                  "", "1. No password and no value was taken from it.",
                  "2. Check that the address leads to the server itself, and that no other "
                  "computer answers in its place."});
}

std::string DescribeNoUserName(const std::string& endpointUrl) {
    return Lines({"No user name is set for the server at " + Quoted(endpointUrl) + ".", "",
                  "1. Enter a user name for this server, or log on anonymously."});
}

std::string DescribeNoPassword(const std::string& endpointUrl, const std::string& userName) {
    return "The program did not connect to " + Quoted(endpointUrl) +
           ": no password was given for the user name " + Quoted(userName) + ".";
}

std::string DescribeOwnCertificateFailure(const std::string& reason, const std::string& folder) {
    return Lines({"The program has no certificate for secured connections. " + reason, "",
                  "1. Check that the folder " + Quoted(folder) + " can be written."});
}

}  // namespace cv::security
