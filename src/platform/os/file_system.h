// File-system services (what the Win32 file calls did), on std::filesystem.
#pragma once

#include <cstdint>
#include <filesystem>
#include <functional>
#include <string>
#include <vector>

namespace vorlan::os {

inline constexpr uint32_t FILE_ATTRIBUTE_FOLDER = 16;
inline constexpr uint32_t FILE_ATTRIBUTE_PLAIN = 128;
inline constexpr uint32_t FILE_ATTRIBUTE_COMPRESSED = 2048;
inline constexpr uint32_t FILE_ATTRIBUTES_INVALID = 0xFFFFFFFFu;

// Attribute word of a path: a folder gives 16, a regular file 128, anything else that exists 0,
// and a path that cannot be examined all bits set. POSIX has no compressed attribute.
uint32_t fileAttributes(const std::filesystem::path& path);

struct FolderEntry {
    std::string name;   // as listed
    bool isFolder;      // a real folder; a symbolic link to a folder is not one (no loops)
};

// The entries of a folder sorted by name (byte order), without "." and ".."; empty when the folder
// cannot be listed.
std::vector<FolderEntry> listFolder(const std::filesystem::path& folder);

// The folder the library's support files live in: $VORLAN_HOME when set, else the folder of the
// running executable.
std::filesystem::path homeFolder();

// Copies a file, replacing the target. False on failure.
bool copyFile(const std::filesystem::path& from, const std::filesystem::path& to);

// Replaces path atomically with what `write` puts into the open file descriptor it is given: a
// new file in the same folder (the mode of the file it replaces, else rw-r--r--), flushed to disk
// and renamed over the target. False when `write` returns false or throws, or the file cannot be
// made, flushed or renamed: the target is then untouched and no temporary file is left.
bool replaceFileAtomically(const std::filesystem::path& path, const std::function<bool(int fd)>& write);

// Writes bytes to path through replaceFileAtomically.
bool writeFileAtomically(const std::filesystem::path& path, const std::string& bytes);

// A new empty file with a name no other file has (prefix followed by six random characters) in
// a folder, removed when the object dies. path() is empty when the file could not be created.
class TemporaryFile {
public:
    TemporaryFile(const std::filesystem::path& folder, const std::string& prefix);
    ~TemporaryFile() { remove(); }
    TemporaryFile(const TemporaryFile&) = delete;
    TemporaryFile& operator=(const TemporaryFile&) = delete;

    const std::string& path() const { return path_; }
    // Removes the file now (also when something else replaced it meanwhile); path() becomes empty.
    void remove();

private:
    std::string path_;
};

}  // namespace vorlan::os
