// Small helpers shared by the host's commands.
#pragma once

#include <string>
#include <vector>

namespace vorlan::cli {

using Args = std::vector<std::string>;

// True when args holds --help or -h.
bool wantsHelp(const Args& args);
// Removes "--name VALUE" (or "--name=VALUE") from args; fallback when absent.
std::string takeOption(Args& args, const std::string& name, const std::string& fallback);
// Removes "--name" from args; true when it was there.
bool takeFlag(Args& args, const std::string& name);
// The exit status of a result code (255 for -1).
int exitStatus(int code);

// While it lives, what is written to standard output goes to standard error: the library's own
// lines stay off a machine-readable standard output.
class StdoutToStderr {
public:
    explicit StdoutToStderr(bool active);
    ~StdoutToStderr();
    StdoutToStderr(const StdoutToStderr&) = delete;
    StdoutToStderr& operator=(const StdoutToStderr&) = delete;

private:
    int saved_ = -1;
};
// Escapes text for a JSON string literal.
std::string jsonString(const std::string& text);

// Writes nested lists and records to standard output, either as indented text or as JSON.
class Report {
public:
    explicit Report(bool json) : json_(json) {}

    void beginObject(const std::string& key = "") { open(key, '{'); }
    void beginArray(const std::string& key) { open(key, '['); }
    void end();
    void field(const std::string& key, const std::string& text) { emit(key, json_ ? jsonString(text) : text); }
    void field(const std::string& key, const wchar_t* text);
    void field(const std::string& key, long long value) { emit(key, std::to_string(value)); }
    void field(const std::string& key, double value);
    void flag(const std::string& key, bool value) { emit(key, value ? "true" : "false"); }
    // The result code: fields result, name and meaning (JSON), or "result: CODE NAME (MEANING)".
    void result(int code);

private:
    struct Level {
        bool array;
        bool first;
    };
    std::string indent() const { return std::string(stack_.size() * 2, ' '); }
    void separator();
    void open(const std::string& key, char bracket);
    void emit(const std::string& key, const std::string& value);

    bool json_;
    std::vector<Level> stack_;
};

}  // namespace vorlan::cli
