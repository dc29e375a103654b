#include "platform/jobstore/job_store.h"

#include <cstdlib>
#include <fstream>
#include <sstream>

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

#include "platform/os/file_system.h"

namespace fs = std::filesystem;

namespace vorlan::jobstore {
namespace {

// Holds an advisory lock on a lock file for the lifetime of the object.
class FileLock {
public:
    FileLock(const fs::path& path, bool exclusive) {
        fd_ = ::open(path.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0644);
        if (fd_ >= 0 && ::flock(fd_, exclusive ? LOCK_EX : LOCK_SH) != 0) {
            ::close(fd_);
            fd_ = -1;
        }
    }
    ~FileLock() {
        if (fd_ >= 0) ::close(fd_);  // closing releases the lock
    }
    FileLock(const FileLock&) = delete;
    FileLock& operator=(const FileLock&) = delete;
    bool held() const { return fd_ >= 0; }

private:
    int fd_ = -1;
};

std::string escape(const std::string& text) {
    std::string out;
    for (char c : text) {
        switch (c) {
            case '\\': out += "\\\\"; break;
            case '\t': out += "\\t"; break;
            case '\n': out += "\\n"; break;
            case '\r': out += "\\r"; break;
            default: out += c;
        }
    }
    return out;
}

std::string unescape(const std::string& text) {
    std::string out;
    for (size_t i = 0; i < text.size(); ++i) {
        if (text[i] != '\\' || i + 1 == text.size()) {
            out += text[i];
            continue;
        }
        char c = text[++i];
        out += c == 't' ? '\t' : c == 'n' ? '\n' : c == 'r' ? '\r' : c;
    }
    return out;
}

std::map<std::string, std::string> readAttributes(const fs::path& file) {
    std::ifstream in(file, std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    return decodeAttributes(text.str());
}

}  // namespace

std::string encodeAttributes(const std::map<std::string, std::string>& attributes) {
    std::string out;
    for (const auto& [name, value] : attributes) out += escape(name) + '\t' + escape(value) + '\n';
    return out;
}

std::map<std::string, std::string> decodeAttributes(const std::string& text) {
    std::map<std::string, std::string> attributes;
    std::istringstream lines(text);
    std::string line;
    while (std::getline(lines, line)) {
        size_t tab = line.find('\t');
        if (tab == std::string::npos) continue;  // a damaged line never hides the others
        attributes[unescape(line.substr(0, tab))] = unescape(line.substr(tab + 1));
    }
    return attributes;
}

JobAttributeStore::JobAttributeStore(fs::path folder) : folder_(std::move(folder)) {}

fs::path JobAttributeStore::defaultFolder() {
    if (const char* store = std::getenv("VORLAN_JOB_STORE"); store && *store) return store;
    if (const char* state = std::getenv("XDG_STATE_HOME"); state && *state)
        return fs::path(state) / "vorlan" / "jobs";
    const char* home = std::getenv("HOME");
    return fs::path(home && *home ? home : "/tmp") / ".local" / "state" / "vorlan" / "jobs";
}

bool JobAttributeStore::open() {
    std::error_code ec;
    fs::create_directories(folder_, ec);
    return fs::is_directory(folder_, ec);
}

fs::path JobAttributeStore::jobFile(int64_t job) const {
    return folder_ / ("job" + std::to_string(job) + ".attributes");
}

fs::path JobAttributeStore::lockFile(int64_t job) const {
    return folder_ / ("job" + std::to_string(job) + ".lock");
}

std::map<std::string, std::string> JobAttributeStore::all(int64_t job) const {
    FileLock lock(lockFile(job), false);
    if (!lock.held()) return {};
    return readAttributes(jobFile(job));
}

std::optional<std::string> JobAttributeStore::get(int64_t job, const std::string& name) const {
    auto attributes = all(job);
    auto it = attributes.find(name);
    if (it == attributes.end()) return std::nullopt;
    return it->second;
}

bool JobAttributeStore::set(int64_t job, const std::string& name, const std::string& value) {
    FileLock lock(lockFile(job), true);
    if (!lock.held()) return false;
    auto attributes = readAttributes(jobFile(job));
    attributes[name] = value;
    return os::writeFileAtomically(jobFile(job), encodeAttributes(attributes));
}

}  // namespace vorlan::jobstore
