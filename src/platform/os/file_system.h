// File-system services (what the Win32 file calls did), on std::filesystem.
#pragma once

#include <cstdint>
#include <filesystem>
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

// Writes bytes to path atomically: a temporary file in the same folder, flushed to disk and renamed
// over the target. False (and the target untouched) on failure.
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
