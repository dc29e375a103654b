// A mixed batch of generated jobs for running side by side: a layer-mode ticket job whose PDF is
// converted, a spot-mode ticket job, a PDF-only job and an ink scan. Each job lives in its own
// folder and goes through the public C API. Shared by the concurrency test and benchmark.
#pragma once

#include <filesystem>
#include <functional>
#include <map>
#include <string>
#include <vector>

namespace concurrency_test {

struct MixedJob {
    std::string name;
    std::function<void(const std::filesystem::path& root)> prepare;  // writes the job's inputs
    std::function<int(const std::filesystem::path& root)> run;       // runs it; its result code
    int expected = 0;                                                 // the result it should give
    std::string writes;  // one file it must write, relative to its folder
};

// The four kinds of job; pages scales the PDFs (and the layer-mode ticket) to make jobs longer.
std::vector<MixedJob> mixedJobs(int pages = 4);

// Every file under root with its bytes, by path relative to root.
std::map<std::string, std::string> folderContents(const std::filesystem::path& root);

// Sets up the process for the batch before any thread starts: a job store under root (all jobs
// are job 1 and share it) and a fixed time for the tickets' time stamps.
void prepareProcess(const std::filesystem::path& root);

}  // namespace concurrency_test
