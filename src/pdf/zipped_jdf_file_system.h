// The per-job file context: carries the PDF session's started flag and gives minizip access to a job
// that arrives as a zip archive (entry listing and entry look-up).
#pragma once

#include <cstdint>
#include <cstdio>

// Marks a live context; every file-access function refuses a handle without it.
inline constexpr uint32_t kZipFileSystemSignature[2] = {200u, 0x7f2a3f00u};

// The archive access functions, in the order the context keeps them. The zip reader gets them
// through a zlib_filefunc64_def built from this table (see zipped_jdf_file_system.cpp).
struct ZipFileAccessTable {
    void* (*open)(void* opaque, const void* fileName, int mode);
    unsigned long (*read)(void* opaque, void* stream, void* buffer, unsigned long size);
    unsigned long (*write)(void* opaque, void* stream, const void* buffer, unsigned long size);
    int (*close)(void* opaque, void* stream);
    long (*seek)(void* opaque, void* stream, unsigned long offset, int origin);
    long (*seek64)(void* opaque, void* stream, unsigned long long offset, int origin);
    long (*tell)(void* opaque, void* stream);
    unsigned long long (*tell64)(void* opaque, void* stream);
};

struct ZipDirectoryEntry;  // one listed archive entry (reader's information and name)

struct ZippedJDFFileSystem {
    char* path = nullptr;            // narrow copy of the data-file path (owned)
    const char* fileName = nullptr;  // into path, after its last separator (whole path when none)
    uint32_t signature[2] = {0, 0};
    ZipFileAccessTable access{};
    std::FILE* openFile = nullptr;   // the stream while the archive is read
    int64_t writtenExtent = 0;       // largest position a write reached
    void* zip = nullptr;             // minizip handle (unzFile), opened on first use
    ZipDirectoryEntry* directory = nullptr;  // entry listing, built on first use (owned)
    int32_t directoryCount = 0;      // entries in the listing; -1 when the listing failed
    bool pdfLibraryStarted = false;
};

// Builds the context for a data-file path; null when the path is null or memory runs out.
ZippedJDFFileSystem* createZippedJDFFileSystem(const char* dataFile);
// Stops the PDF session if it was started, frees the listing, closes the archive and its stream,
// and frees the context. Null is ignored.
void destroyZippedJDFFileSystem(ZippedJDFFileSystem* fs);

// Number of archive entries: -2 when the data file cannot be opened as an archive, -1 when the
// listing failed part way.
int32_t getZipEntryCount(ZippedJDFFileSystem* fs);
// Name of entry `index` (owned by the listing), or null for a number outside it.
const char* getZipEntryName(ZippedJDFFileSystem* fs, int32_t index);
// Position of the entry named exactly `name` (byte for byte), or -1.
int32_t findZipEntry(ZippedJDFFileSystem* fs, const char* name);

// Starts the PDF session under this context unless its flag says it already runs.
void ensurePdfLibraryStarted(ZippedJDFFileSystem* fs);
