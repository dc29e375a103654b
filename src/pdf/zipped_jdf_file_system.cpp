// The per-job file context and the zip entry listing on minizip.
#include "pdf/zipped_jdf_file_system.h"

#include <unzip.h>

#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <new>
#include <system_error>

#include "pdf/pdf_session.h"

// One listed entry: the reader's information, then the name (at most 259 bytes).
struct ZipDirectoryEntry {
    unz_file_info64 info;
    char name[260];
};

namespace {

ZippedJDFFileSystem* checked(void* opaque) {
    auto* fs = static_cast<ZippedJDFFileSystem*>(opaque);
    if (!fs || fs->signature[0] != kZipFileSystemSignature[0] ||
        fs->signature[1] != kZipFileSystemSignature[1])
        return nullptr;
    return fs;
}

std::FILE* checkedStream(void* opaque, void* stream) {
    ZippedJDFFileSystem* fs = checked(opaque);
    if (!fs || !stream || stream != fs->openFile) return nullptr;
    return static_cast<std::FILE*>(stream);
}

int stdioOrigin(int origin) {
    switch (origin) {
        case ZLIB_FILEFUNC_SEEK_SET: return SEEK_SET;
        case ZLIB_FILEFUNC_SEEK_CUR: return SEEK_CUR;
        case ZLIB_FILEFUNC_SEEK_END: return SEEK_END;
        default: return -1;
    }
}

void* zipOpen(void* opaque, const void* /*fileName*/, int mode) {
    ZippedJDFFileSystem* fs = checked(opaque);
    if (!fs || !fs->path || fs->openFile) return nullptr;
    const char* stdioMode = nullptr;
    if ((mode & ZLIB_FILEFUNC_MODE_READWRITEFILTER) == ZLIB_FILEFUNC_MODE_READ) {
        stdioMode = "rb";
    } else if (mode & ZLIB_FILEFUNC_MODE_EXISTING) {
        stdioMode = "r+b";
    } else if (mode & ZLIB_FILEFUNC_MODE_CREATE) {
        std::error_code ec;
        std::filesystem::path parent = std::filesystem::path(fs->path).parent_path();
        if (!parent.empty()) std::filesystem::create_directories(parent, ec);
        stdioMode = "wb";
    }
    if (!stdioMode) return nullptr;
    fs->openFile = std::fopen(fs->path, stdioMode);
    fs->writtenExtent = 0;
    return fs->openFile;
}

unsigned long zipRead(void* opaque, void* stream, void* buffer, unsigned long size) {
    std::FILE* f = checkedStream(opaque, stream);
    return f ? std::fread(buffer, 1, size, f) : 0;
}

unsigned long zipWrite(void* opaque, void* stream, const void* buffer, unsigned long size) {
    std::FILE* f = checkedStream(opaque, stream);
    if (!f) return 0;
    unsigned long written = std::fwrite(buffer, 1, size, f);
    ZippedJDFFileSystem* fs = checked(opaque);
    long position = std::ftell(f);
    if (position > fs->writtenExtent) fs->writtenExtent = position;
    return written;
}

int zipClose(void* opaque, void* stream) {
    std::FILE* f = checkedStream(opaque, stream);
    if (!f) return -1;
    checked(opaque)->openFile = nullptr;
    return std::fclose(f);
}

long zipSeek64(void* opaque, void* stream, unsigned long long offset, int origin) {
    std::FILE* f = checkedStream(opaque, stream);
    int whence = stdioOrigin(origin);
    if (!f || whence < 0 || offset > static_cast<unsigned long long>(INT64_MAX)) return -1;
    return fseeko(f, static_cast<off_t>(offset), whence) == 0 ? 0 : -1;
}

long zipSeek(void* opaque, void* stream, unsigned long offset, int origin) {
    return zipSeek64(opaque, stream, offset, origin);
}

unsigned long long zipTell64(void* opaque, void* stream) {
    std::FILE* f = checkedStream(opaque, stream);
    if (!f) return static_cast<unsigned long long>(-1);
    off_t position = ftello(f);
    return position < 0 ? static_cast<unsigned long long>(-1) : static_cast<unsigned long long>(position);
}

long zipTell(void* opaque, void* stream) { return static_cast<long>(zipTell64(opaque, stream)); }

int zipError(void* opaque, void* stream) {
    std::FILE* f = checkedStream(opaque, stream);
    return f ? std::ferror(f) : -1;
}

// The table handed to minizip, built from the context's own table.
zlib_filefunc64_def readerFunctions(ZippedJDFFileSystem* fs) {
    zlib_filefunc64_def def{};
    def.zopen64_file = fs->access.open;
    def.zread_file = fs->access.read;
    def.zwrite_file = fs->access.write;
    def.ztell64_file = fs->access.tell64;
    def.zseek64_file = fs->access.seek64;
    def.zclose_file = fs->access.close;
    def.zerror_file = zipError;
    def.opaque = fs;
    return def;
}

bool openArchive(ZippedJDFFileSystem* fs) {
    if (fs->zip) return true;
    zlib_filefunc64_def def = readerFunctions(fs);
    fs->zip = unzOpen2_64(fs->path, &def);
    if (!fs->zip && fs->openFile) {  // minizip gave up without closing what it opened
        std::fclose(fs->openFile);
        fs->openFile = nullptr;
    }
    return fs->zip != nullptr;
}

// Reads the archive's entry list into fs->directory; the count, or -1 when moving on failed.
int32_t buildDirectory(ZippedJDFFileSystem* fs) {
    unz_global_info64 global{};
    if (unzGetGlobalInfo64(fs->zip, &global) != UNZ_OK) return -1;
    // The count comes from the archive: every entry takes at least 46 bytes of its central
    // directory, so a count the file cannot hold is damage, not a reason to allocate.
    std::error_code ec;
    const uintmax_t fileSize = std::filesystem::file_size(fs->path, ec);
    if (ec || global.number_entry > fileSize / 46 || global.number_entry > INT32_MAX) return -1;
    const auto count = static_cast<int32_t>(global.number_entry);
    fs->directory = static_cast<ZipDirectoryEntry*>(std::calloc(count ? count : 1, sizeof(ZipDirectoryEntry)));
    if (!fs->directory) return -1;
    if (count == 0) return 0;
    if (unzGoToFirstFile(fs->zip) != UNZ_OK) return -1;
    for (int32_t i = 0; i < count; ++i) {
        ZipDirectoryEntry& entry = fs->directory[i];
        if (unzGetCurrentFileInfo64(fs->zip, &entry.info, entry.name, sizeof entry.name - 1, nullptr,
                                    0, nullptr, 0) != UNZ_OK)
            return -1;
        if (i + 1 < count) {
            int code = unzGoToNextFile(fs->zip);
            if (code != UNZ_OK) {
                std::printf("error %d with zipfile in unzGoToNextFile\n", code);
                return -1;
            }
        }
    }
    return count;
}

}  // namespace

ZippedJDFFileSystem* createZippedJDFFileSystem(const char* dataFile) {
    if (!dataFile) return nullptr;
    auto* fs = new (std::nothrow) ZippedJDFFileSystem;
    if (!fs) return nullptr;
    fs->path = strdup(dataFile);
    if (!fs->path) {
        delete fs;
        return nullptr;
    }
    const char* cut = std::strrchr(fs->path, '\\');
    const char* slash = std::strrchr(fs->path, '/');
    if (!cut || (slash && slash > cut)) cut = slash;
    fs->fileName = cut ? cut + 1 : fs->path;
    fs->signature[0] = kZipFileSystemSignature[0];
    fs->signature[1] = kZipFileSystemSignature[1];
    fs->access = {zipOpen, zipRead, zipWrite, zipClose, zipSeek, zipSeek64, zipTell, zipTell64};
    return fs;
}

void destroyZippedJDFFileSystem(ZippedJDFFileSystem* fs) {
    if (!fs) return;
    if (fs->pdfLibraryStarted) {
        stopPDFLibrary();
        fs->pdfLibraryStarted = false;
    }
    std::free(fs->directory);
    if (fs->zip) unzClose(fs->zip);  // closes the stream through zipClose
    if (fs->openFile) std::fclose(fs->openFile);
    std::free(fs->path);
    fs->signature[0] = fs->signature[1] = 0;
    delete fs;
}

int32_t getZipEntryCount(ZippedJDFFileSystem* fs) {
    if (!checked(fs)) return -2;
    if (!openArchive(fs)) return -2;
    if (!fs->directory && fs->directoryCount >= 0) fs->directoryCount = buildDirectory(fs);
    return fs->directoryCount;
}

const char* getZipEntryName(ZippedJDFFileSystem* fs, int32_t index) {
    if (getZipEntryCount(fs) < 1 || index < 0 || index >= fs->directoryCount) return nullptr;
    return fs->directory[index].name;
}

int32_t findZipEntry(ZippedJDFFileSystem* fs, const char* name) {
    if (!name) return -1;
    int32_t count = getZipEntryCount(fs);
    for (int32_t i = 0; i < count; ++i)
        if (std::strcmp(fs->directory[i].name, name) == 0) return i;
    return -1;
}

void ensurePdfLibraryStarted(ZippedJDFFileSystem* fs) {
    if (!fs || fs->pdfLibraryStarted) return;
    startPDFLibrary();  // its result is not checked: a failed start shows in the next PDF call
    fs->pdfLibraryStarted = true;
}
