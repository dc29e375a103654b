#include "entry/description_file.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>

#include <sys/stat.h>

int jobNumberFromDescriptionPath(const char* impinfoPath) {
    if (!impinfoPath) return -1;
    const char* slash = std::strrchr(impinfoPath, '/');
    if (!slash) return -1;
    int number = -1;
    if (std::sscanf(slash + 1, "job%d.impinfo", &number) != 1) return -1;
    return number;
}

namespace {
void reportUnversioned() {
    std::fputs("Invalid or absent xml buffer file, continuing as unversioned job... \n", stderr);
}
}  // namespace

bool readDescriptionFile(const char* path, char** buffer, long* length) {
    *buffer = nullptr;
    *length = 0;
    FILE* in = path ? std::fopen(path, "rb") : nullptr;
    if (!in) {
        reportUnversioned();
        return true;
    }
    long size = -1;
    struct stat info {};
    bool regular = ::fstat(::fileno(in), &info) == 0 && S_ISREG(info.st_mode);
    if (regular && std::fseek(in, 0, SEEK_END) == 0) size = std::ftell(in);
    std::rewind(in);
    if (size < 0) {
        // Not a regular file (a folder, a pipe): no description can be read from it.
        std::fclose(in);
        reportUnversioned();
        return true;
    }
    auto* bytes = static_cast<char*>(std::calloc(static_cast<size_t>(size) + 16, 1));
    if (!bytes) {
        std::fclose(in);
        std::fputs("Not enough memory!\n", stderr);
        return false;
    }
    size_t got = std::fread(bytes, 1, static_cast<size_t>(size), in);
    std::fclose(in);
    *buffer = bytes;
    *length = static_cast<long>(got);  // a file that shrank meanwhile yields only what was read
    return true;
}
