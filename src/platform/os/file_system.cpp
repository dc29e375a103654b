#include "platform/os/file_system.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <utility>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace fs = std::filesystem;

namespace vorlan::os {

uint32_t fileAttributes(const fs::path& path) {
    std::error_code ec;
    fs::file_status st = fs::status(path, ec);
    if (ec || !fs::exists(st)) return FILE_ATTRIBUTES_INVALID;
    if (fs::is_directory(st)) return FILE_ATTRIBUTE_FOLDER;
    if (fs::is_regular_file(st)) return FILE_ATTRIBUTE_PLAIN;
    return 0;
}

std::vector<FolderEntry> listFolder(const fs::path& folder) {
    std::vector<FolderEntry> entries;
    std::error_code ec;
    fs::directory_iterator it(folder, ec), end;
    if (ec) return entries;
    for (; it != end; it.increment(ec)) {
        if (ec) break;
        std::error_code typeEc;
        bool isFolder = it->symlink_status(typeEc).type() == fs::file_type::directory;
        entries.push_back({it->path().filename().string(), isFolder && !typeEc});
    }
    std::sort(entries.begin(), entries.end(),
              [](const FolderEntry& a, const FolderEntry& b) { return a.name < b.name; });
    return entries;
}

fs::path homeFolder() {
    if (const char* home = std::getenv("VORLAN_HOME"); home && *home) return fs::path(home);
    std::error_code ec;
    fs::path exe = fs::read_symlink("/proc/self/exe", ec);
    return ec ? fs::current_path(ec) : exe.parent_path();
}

bool copyFile(const fs::path& from, const fs::path& to) {
    std::error_code ec;
    fs::copy_file(from, to, fs::copy_options::overwrite_existing, ec);
    return !ec;
}

bool replaceFileAtomically(const fs::path& path, const std::function<bool(int fd)>& write) {
    fs::path folder = path.has_parent_path() ? path.parent_path() : fs::path(".");
    std::string pattern = (folder / ("." + path.filename().string() + ".tmpXXXXXX")).string();
    int fd = ::mkstemp(pattern.data());
    if (fd < 0) return false;
    // mkstemp makes the file private: keep the mode of the file being replaced, else an ordinary
    // file's.
    struct stat st {};
    ::fchmod(fd, ::stat(path.c_str(), &st) == 0 ? (st.st_mode & 07777) : 0644);
    bool ok = false;
    try {
        ok = write(fd);
    } catch (...) {
        ok = false;
    }
    ok = ok && ::fsync(fd) == 0;
    ok = (::close(fd) == 0) && ok;
    if (ok) ok = ::rename(pattern.c_str(), path.c_str()) == 0;
    if (!ok) ::unlink(pattern.c_str());
    return ok;
}

bool writeFileAtomically(const fs::path& path, const std::string& bytes) {
    return replaceFileAtomically(path, [&bytes](int fd) {
        size_t written = 0;
        while (written < bytes.size()) {
            ssize_t n = ::write(fd, bytes.data() + written, bytes.size() - written);
            if (n < 0 && errno == EINTR) continue;
            if (n <= 0) return false;
            written += static_cast<size_t>(n);
        }
        return true;
    });
}

TemporaryFile::TemporaryFile(const fs::path& folder, const std::string& prefix) {
    std::string pattern = (folder / (prefix + "XXXXXX")).string();
    int fd = ::mkstemp(pattern.data());
    if (fd < 0) return;
    ::close(fd);
    path_ = std::move(pattern);
}

void TemporaryFile::remove() {
    if (path_.empty()) return;
    ::unlink(path_.c_str());
    path_.clear();
}

}  // namespace vorlan::os
