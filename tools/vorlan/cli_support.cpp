#include "cli_support.h"

#include <unistd.h>

#include <algorithm>
#include <cstdio>

#include "host_api.h"

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

void Report::end() {
    bool wasArray = stack_.back().array;
    stack_.pop_back();
    if (json_) std::printf("\n%s%c", indent().c_str(), wasArray ? ']' : '}');
    if (stack_.empty() && json_) std::printf("\n");
}

void Report::field(const std::string& key, const wchar_t* text) { field(key, vorlan::os::toUtf8(text)); }

void Report::field(const std::string& key, double value) {
    char text[64];
    std::snprintf(text, sizeof text, "%g", value);
    emit(key, text);
}

void Report::separator() {
    if (stack_.empty()) return;
    if (json_) std::printf("%s\n", stack_.back().first ? "" : ",");
    stack_.back().first = false;
}

void Report::open(const std::string& key, char bracket) {
    separator();
    if (json_) {
        std::printf("%s", indent().c_str());
        if (!key.empty() && !stack_.empty() && !stack_.back().array) std::printf("%s: ", jsonString(key).c_str());
        std::printf("%c", bracket);
    } else if (!key.empty()) {
        std::printf("%s%s:\n", indent().c_str(), key.c_str());
    }
    stack_.push_back({bracket == '[', true});
}

void Report::emit(const std::string& key, const std::string& value) {
    separator();
    if (json_ && !stack_.empty() && stack_.back().array) std::printf("%s%s", indent().c_str(), value.c_str());
    else if (json_) std::printf("%s%s: %s", indent().c_str(), jsonString(key).c_str(), value.c_str());
    else std::printf("%s%s: %s\n", indent().c_str(), key.c_str(), value.c_str());
}

void Report::result(int code) {
    if (!json_) {
        std::printf("%sresult: %d %s (%s)\n", indent().c_str(), code, resultName(code), resultMeaning(code));
        return;
    }
    field("result", static_cast<long long>(code));
    field("name", resultName(code));
    field("meaning", resultMeaning(code));
}

int exitStatus(int code) { return code < 0 ? 255 : code; }

StdoutToStderr::StdoutToStderr(bool active) {
    if (!active) return;
    std::fflush(stdout);
    saved_ = ::dup(STDOUT_FILENO);
    if (saved_ >= 0) ::dup2(STDERR_FILENO, STDOUT_FILENO);
}

StdoutToStderr::~StdoutToStderr() {
    if (saved_ < 0) return;
    std::fflush(stdout);
    ::dup2(saved_, STDOUT_FILENO);
    ::close(saved_);
}

}  // namespace vorlan::cli
