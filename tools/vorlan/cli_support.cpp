#include "cli_support.h"

#include <algorithm>
#include <cstdio>

#include "entry/result_codes.h"

namespace vorlan::cli {

bool wantsHelp(const Args& args) {
    return std::any_of(args.begin(), args.end(), [](const std::string& a) { return a == "--help" || a == "-h"; });
}

std::string takeOption(Args& args, const std::string& name, const std::string& fallback) {
    for (size_t i = 0; i < args.size(); ++i) {
        if (args[i] == name && i + 1 < args.size()) {
            std::string value = args[i + 1];
            args.erase(args.begin() + static_cast<long>(i), args.begin() + static_cast<long>(i) + 2);
            return value;
        }
        if (args[i].rfind(name + "=", 0) == 0) {
            std::string value = args[i].substr(name.size() + 1);
            args.erase(args.begin() + static_cast<long>(i));
            return value;
        }
    }
    return fallback;
}

bool takeFlag(Args& args, const std::string& name) {
    auto it = std::find(args.begin(), args.end(), name);
    if (it == args.end()) return false;
    args.erase(it);
    return true;
}

std::string jsonString(const std::string& text) {
    std::string out = "\"";
    for (unsigned char c : text) {
        if (c == '"' || c == '\\') {
            out += '\\';
            out += static_cast<char>(c);
        } else if (c < 0x20) {
            char escaped[8];
            std::snprintf(escaped, sizeof escaped, "\\u%04x", c);
            out += escaped;
        } else {
            out += static_cast<char>(c);
        }
    }
    return out + "\"";
}

int reportResult(int code, bool json) {
    if (json)
        std::printf("{\"result\": %d, \"name\": %s, \"meaning\": %s}\n", code, jsonString(resultName(code)).c_str(),
                    jsonString(resultMeaning(code)).c_str());
    else
        std::printf("result: %d %s (%s)\n", code, resultName(code), resultMeaning(code));
    return code < 0 ? 255 : code;
}

}  // namespace vorlan::cli
