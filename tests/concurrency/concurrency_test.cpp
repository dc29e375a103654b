// Jobs side by side: four different jobs on four threads of one process write exactly the files
// that each writes when it runs alone. Built under ThreadSanitizer by the tsan preset as well.
#include <atomic>
#include <filesystem>
#include <thread>

#include <gtest/gtest.h>

#include "mixed_jobs.h"
#include "test_support.h"

namespace fs = std::filesystem;
using namespace concurrency_test;

TEST(Concurrency, JobsOnSeparateThreadsWriteWhatEachWritesAlone) {
    vorlan::test::TempDir tmp;
    prepareProcess(tmp.path());
    const std::vector<MixedJob> jobs = mixedJobs();
    auto folder = [&](size_t i) { return tmp / ("job" + std::to_string(i)); };

    std::vector<int> aloneResults;
    std::vector<std::map<std::string, std::string>> alone;
    for (size_t i = 0; i < jobs.size(); ++i) {
        jobs[i].prepare(folder(i));
        aloneResults.push_back(jobs[i].run(folder(i)));
        alone.push_back(folderContents(folder(i)));
        EXPECT_EQ(aloneResults.back(), jobs[i].expected) << jobs[i].name;
        std::string written;
        for (const auto& file : alone.back()) written += " " + file.first;
        EXPECT_EQ(alone.back().count(jobs[i].writes), 1u) << jobs[i].name << " wrote only" << written;
    }

    // All threads start together so the jobs overlap; a few rounds give them more chances to.
    for (int round = 0; round < 3; ++round) {
        SCOPED_TRACE("round " + std::to_string(round));
        for (size_t i = 0; i < jobs.size(); ++i) {
            fs::remove_all(folder(i));
            jobs[i].prepare(folder(i));
        }
        std::vector<int> results(jobs.size(), -100);
        std::atomic<int> waiting{static_cast<int>(jobs.size())};
        std::vector<std::thread> threads;
        for (size_t i = 0; i < jobs.size(); ++i)
            threads.emplace_back([&, i] {
                --waiting;
                while (waiting.load() > 0) std::this_thread::yield();
                results[i] = jobs[i].run(folder(i));
            });
        for (std::thread& thread : threads) thread.join();

        for (size_t i = 0; i < jobs.size(); ++i) {
            EXPECT_EQ(results[i], aloneResults[i]) << jobs[i].name;
            const auto together = folderContents(folder(i));
            ASSERT_EQ(together.size(), alone[i].size()) << jobs[i].name;
            for (const auto& [path, bytes] : alone[i]) {
                auto found = together.find(path);
                ASSERT_NE(found, together.end()) << jobs[i].name << ": " << path << " missing";
                EXPECT_TRUE(found->second == bytes) << jobs[i].name << ": " << path << " differs";
            }
        }
    }
}
