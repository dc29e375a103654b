// A scratch file for fuzz targets whose code under test reads or writes paths: made once with a
// unique name under /tmp and removed when the process exits.
#pragma once

#include <unistd.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>

namespace vorlan::fuzz {

class ScratchFile {
public:
    explicit ScratchFile(const char* prefix) : path_(std::string("/tmp/") + prefix + "-XXXXXX") {
        int fd = mkstemp(path_.data());
        if (fd < 0) std::abort();
        close(fd);
    }
    ~ScratchFile() { std::remove(path_.c_str()); }
    ScratchFile(const ScratchFile&) = delete;
    ScratchFile& operator=(const ScratchFile&) = delete;

    // Replaces the file's contents; false when it cannot be written.
    bool write(const uint8_t* data, size_t size) const {
        FILE* file = std::fopen(path_.c_str(), "wb");
        if (!file) return false;
        const bool ok = std::fwrite(data, 1, size, file) == size;
        return std::fclose(file) == 0 && ok;
    }
    const char* path() const { return path_.c_str(); }
    // A writable copy of the path's bytes, for interfaces that take char*.
    std::string& mutablePath() { return path_; }

private:
    std::string path_;
};

}  // namespace vorlan::fuzz
