#include "itemtest/TestReadCommandLine.h"

#include <cctype>
#include <charconv>
#include <cmath>
#include <functional>
#include <map>

namespace cv {

namespace {

using Command = TestReadCommand;

std::optional<double> Number(const std::string& text) {
    double value = 0;
    const char* end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data(), end, value);
    if (text.empty() || error != std::errc() || stop != end || !std::isfinite(value)) {
        return std::nullopt;
    }
    return value;
}

std::optional<TestReadScale> Scale(const std::string& text) {
    std::vector<double> values;
    size_t start = 0;
    for (;;) {
        const size_t colon = text.find(':', start);
        const auto value = Number(text.substr(start, colon - start));
        if (!value || values.size() == 4) {
            return std::nullopt;
        }
        values.push_back(*value);
        if (colon == std::string::npos) {
            break;
        }
        start = colon + 1;
    }
    if (values.size() != 4) {
        return std::nullopt;
    }
    return TestReadScale{values[0], values[1], values[2], values[3]};
}

// A range the main window would accept: minimum below maximum, at least
// 0.05 apart.
bool RangeOk(double dMin, double dMax) {
    return dMin <= dMax && dMax - dMin >= 0.05;
}

std::string Choice(const char* option, const std::string& value,
                   const std::vector<std::string>& choices, std::string& field) {
    for (const std::string& choice : choices) {
        if (choice == value) {
            field = value;
            return {};
        }
    }
    std::string names;
    for (const std::string& choice : choices) {
        names += (names.empty() ? "" : ", ") + choice;
    }
    return std::string(option) + " must be one of " + names + ", not \"" + value + "\"";
}

// A SHA-1 thumbprint in hexadecimal, with or without colons, in upper case.
std::optional<std::string> Thumbprint(const std::string& text) {
    std::string digits;
    for (const char c : text) {
        if (std::isxdigit(static_cast<unsigned char>(c))) {
            digits += static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
        } else if (c != ':') {
            return std::nullopt;
        }
    }
    return digits.size() == 40 ? std::optional(digits) : std::nullopt;
}

using Setter = std::function<std::string(TestReadOptions&, const std::string&)>;

const std::map<std::string, Setter>& Setters() {
    static const std::map<std::string, Setter> setters = {
        {"--test-read",
         [](TestReadOptions& o, const std::string& v) {
             o.nodeAndServer = v;
             return v.empty() ? std::string("--test-read needs a server") : "";
         }},
        {"--item",
         [](TestReadOptions& o, const std::string& v) {
             o.itemId = v;
             return v.empty() ? std::string("--item needs an item ID") : "";
         }},
        {"--access-path",
         [](TestReadOptions& o, const std::string& v) {
             o.accessPath = v;
             return std::string();
         }},
        {"--count",
         [](TestReadOptions& o, const std::string& v) {
             const auto n = Number(v);
             if (!n || *n < 1 || *n > 1e9 || *n != std::floor(*n)) {
                 return "--count must be a whole number from 1 to 1000000000, not \"" + v + "\"";
             }
             o.count = static_cast<int32_t>(*n);
             return std::string();
         }},
        {"--interval",
         [](TestReadOptions& o, const std::string& v) {
             const auto s = Number(v);
             if (!s || *s < 0.1 || *s > 61) {
                 return "--interval must be from 0.1 to 61 seconds, not \"" + v + "\"";
             }
             o.intervalSec = *s;
             return std::string();
         }},
        {"--scale",
         [](TestReadOptions& o, const std::string& v) {
             o.scale = Scale(v);
             if (!o.scale) {
                 return "--scale must be INSTMIN:INSTMAX:ENGMIN:ENGMAX, not \"" + v + "\"";
             }
             if (!RangeOk(o.scale->instMin, o.scale->instMax) ||
                 !RangeOk(o.scale->engMin, o.scale->engMax)) {
                 return std::string("--scale: each minimum must be at least .05 below its maximum");
             }
             return std::string();
         }},
        {"--timeout",
         [](TestReadOptions& o, const std::string& v) {
             const auto s = Number(v);
             if (!s || *s < 0.1 || *s > 86400) {
                 return "--timeout must be from 0.1 to 86400 seconds, not \"" + v + "\"";
             }
             o.timeoutSec = *s;
             return std::string();
         }},
        {"--plant",
         [](TestReadOptions& o, const std::string& v) {
             o.plantFile = v;
             return v.empty() ? std::string("--plant needs a file") : "";
         }},
        {"--security-mode",
         [](TestReadOptions& o, const std::string& v) {
             return Choice("--security-mode", v, {"None", "Sign", "SignAndEncrypt"},
                           o.securityMode);
         }},
        {"--security-policy",
         [](TestReadOptions& o, const std::string& v) {
             return Choice("--security-policy", v, {"Basic256Sha256", "Aes128_Sha256_RsaOaep"},
                           o.securityPolicy);
         }},
        {"--user",
         [](TestReadOptions& o, const std::string& v) {
             o.userName = v;
             return v.empty() ? std::string("--user needs a user name") : "";
         }},
        {"--trust",
         [](TestReadOptions& o, const std::string& v) {
             const auto thumbprint = Thumbprint(v);
             o.trustThumbprint = thumbprint.value_or("");
             return thumbprint ? std::string()
                               : "--trust must be a certificate thumbprint of 40 hexadecimal "
                                 "digits, not \"" +
                                     v + "\"";
         }},
    };
    return setters;
}

Command Usage(std::string error) {
    Command command;
    command.error = std::move(error);
    return command;
}

}  // namespace

bool WantsTestRead(const std::vector<std::string>& arguments) {
    for (const std::string& argument : arguments) {
        if (argument == "--test-read" || argument.rfind("--test-read=", 0) == 0 ||
            argument == "--version") {
            return true;
        }
    }
    return false;
}

TestReadCommand ParseTestReadCommand(const std::vector<std::string>& arguments) {
    Command command;
    command.action = Command::Action::Run;
    for (size_t i = 0; i < arguments.size(); ++i) {
        std::string name = arguments[i];
        std::optional<std::string> value;
        if (const size_t equals = name.find('='); name.rfind("--", 0) == 0 && equals != name.npos) {
            value = name.substr(equals + 1);
            name.resize(equals);
        }
        if (name == "--help" || name == "-h") {
            command.action = Command::Action::Help;
            return command;
        }
        if (name == "--version") {
            command.action = Command::Action::Version;
            return command;
        }
        if (name == "--verbose") {
            if (value) {
                return Usage("--verbose takes no value");
            }
            command.options.verbose = true;
            continue;
        }
        const auto setter = Setters().find(name);
        if (setter == Setters().end()) {
            return Usage("unknown option \"" + arguments[i] + "\"");
        }
        if (!value) {
            if (i + 1 >= arguments.size()) {
                return Usage(name + " needs a value");
            }
            value = arguments[++i];
        }
        if (std::string error = setter->second(command.options, *value); !error.empty()) {
            return Usage(error);
        }
    }
    if (command.options.nodeAndServer.empty() || command.options.itemId.empty()) {
        return Usage("--test-read and --item are both needed");
    }
    if (command.options.securityMode == "None" && !command.options.securityPolicy.empty()) {
        return Usage("--security-policy needs --security-mode Sign or SignAndEncrypt");
    }
    return command;
}

std::string TestReadUsage() {
    return "usage: cvopctestclient --test-read '\\\\Node\\Server' --item ID [options]\n"
           "       cvopctestclient --help | --version\n"
           "\n"
           "Reads one OPC item on the simulated plant or an OPC UA server without a\n"
           "window and prints one line per value, tab-separated: the server's time\n"
           "stamp, the raw value, the scaled value, the quality in words (with the\n"
           "server's own name for its status where it has one) and the source time\n"
           "stamp where the server sends one. Time stamps are ISO 8601 with\n"
           "milliseconds and the zone (2025-01-01T08:00:01.250+01:00, or Z for UTC).\n"
           "A bad value has its line too, without a scaled value, before the test\n"
           "ends. Standard error first says which kind of server answered:\n"
           "\"Backend: OPC UA\" or \"Backend: simulated plant\".\n"
           "\n"
           "  --test-read SERVER   the OPC server: an OPC UA endpoint URL\n"
           "                       (opc.tcp://host:port/path), \\\\Node\\Server or a\n"
           "                       server ID of the simulated plant\n"
           "  --item ID            the item ID (for OPC UA a NodeId: ns=1;s=Name)\n"
           "  --access-path P      the item's access path\n"
           "  --count N            values to print (default 1)\n"
           "  --interval S         sample interval in seconds, 0.1 to 61 (default 1)\n"
           "  --scale A:B:C:D      scale from the instrument range A..B to the\n"
           "                       engineering range C..D (default: no scaling)\n"
           "  --timeout S          wait for the server and the first value (default:\n"
           "                       the wait remembered by the test window, 10 s at first);\n"
           "                       also the longest one attempt to connect to an OPC UA\n"
           "                       server may take, however slowly it answers (10 s\n"
           "                       without --timeout)\n"
           "  --plant FILE         simulate the plant FILE describes\n"
           "  --verbose            while waiting, print each answer of the server to\n"
           "                       standard error (\"The server answered: ...\")\n"
           "\n"
           "OPC UA servers (opc.tcp://host:port/path) are reached as chosen for them in\n"
           "the window (at first the most secure way they offer), unless told here:\n"
           "  --security-mode M    None, Sign or SignAndEncrypt\n"
           "  --security-policy P  Basic256Sha256 or Aes128_Sha256_RsaOaep\n"
           "  --user NAME          log on as NAME; the password is read from the\n"
           "                       environment variable CVOPCTESTCLIENT_PASSWORD, or\n"
           "                       else from standard input (it is never stored)\n"
           "                       With a user name and no --security-mode, a server\n"
           "                       that offers only None is refused: no password goes\n"
           "                       to a server nobody can check. With --security-mode\n"
           "                       None the password is encrypted to the server's\n"
           "                       trusted certificate, never sent in clear text.\n"
           "  --trust THUMBPRINT   trust the server certificate with this SHA-1\n"
           "                       thumbprint for this run; any other certificate that\n"
           "                       is not trusted already is refused, and the reason and\n"
           "                       its thumbprint are printed\n"
           "\n"
           "Numbers are written with a point. Exit status: 0 every value was read,\n"
           "1 the test failed (the reason is printed), 2 the command line is wrong,\n"
           "3 the plant file cannot be used.\n";
}

}  // namespace cv
