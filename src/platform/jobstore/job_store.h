// A durable store of named text attributes per job number: one file per job in a folder.
// Writes are atomic (temporary file, fsync, rename) under an advisory lock, so concurrent writers
// and crashes lose nothing.
#pragma once

#include <cstdint>
#include <filesystem>
#include <map>
#include <optional>
#include <string>

namespace vorlan::jobstore {

class JobAttributeStore {
public:
    explicit JobAttributeStore(std::filesystem::path folder);

    // The folder from $VORLAN_JOB_STORE, else $XDG_STATE_HOME/vorlan/jobs, else
    // ~/.local/state/vorlan/jobs.
    static std::filesystem::path defaultFolder();

    // Creates the folder when missing; false when it cannot be made.
    bool open();

    std::optional<std::string> get(int64_t job, const std::string& name) const;
    bool set(int64_t job, const std::string& name, const std::string& value);
    // Every attribute of a job (empty when it has none or cannot be read).
    std::map<std::string, std::string> all(int64_t job) const;

    const std::filesystem::path& folder() const { return folder_; }

private:
    std::filesystem::path jobFile(int64_t job) const;
    std::filesystem::path lockFile(int64_t job) const;

    std::filesystem::path folder_;
};

// The file format: one attribute per line, "name<TAB>value", with \\, \t, \n and \r escaped.
std::string encodeAttributes(const std::map<std::string, std::string>& attributes);
std::map<std::string, std::string> decodeAttributes(const std::string& text);

}  // namespace vorlan::jobstore
