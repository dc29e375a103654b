// The durable job attribute store and the worker's attribute calls on top of it.
#include <csignal>
#include <cstdlib>
#include <thread>

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include "platform/jobstore/job_store.h"
#include "test_support.h"
#include "vorlan/LD_JDF.h"

using vorlan::jobstore::JobAttributeStore;
using vorlan::test::TempDir;

namespace {

// Points the worker's store at a temporary folder for one test.
class StoreFolder {
public:
    StoreFolder() { setenv("VORLAN_JOB_STORE", dir_.path().c_str(), 1); }
    ~StoreFolder() { unsetenv("VORLAN_JOB_STORE"); }
    const std::filesystem::path& path() const { return dir_.path(); }

private:
    TempDir dir_;
};

}  // namespace

TEST(JobStore, ValuesRoundTripIncludingAwkwardText) {
    TempDir dir;
    JobAttributeStore store(dir.path());
    ASSERT_TRUE(store.open());
    const std::string awkward = "tab\there\nnew line\\back slash \xc3\xa9";
    ASSERT_TRUE(store.set(7, "ignore_record_ progress", "1"));
    ASSERT_TRUE(store.set(7, "Note", awkward));
    ASSERT_TRUE(store.set(8, "Note", "other job"));
    JobAttributeStore reopened(dir.path());
    EXPECT_EQ(reopened.get(7, "ignore_record_ progress"), "1");
    EXPECT_EQ(reopened.get(7, "Note"), awkward);
    EXPECT_EQ(reopened.get(8, "Note"), "other job");
    EXPECT_EQ(reopened.get(7, "Absent"), std::nullopt);
    EXPECT_EQ(reopened.get(-1, "Note"), std::nullopt);
}

TEST(JobStore, ConcurrentWritersLoseNothing) {
    TempDir dir;
    constexpr int kWriters = 4, kEach = 40;
    std::vector<pid_t> children;
    for (int w = 0; w < kWriters; ++w) {
        pid_t pid = fork();
        ASSERT_GE(pid, 0);
        if (pid == 0) {
            JobAttributeStore store(dir.path());
            bool ok = store.open();
            for (int i = 0; i < kEach && ok; ++i)
                ok = store.set(1, "w" + std::to_string(w) + "_" + std::to_string(i), std::to_string(i));
            _exit(ok ? 0 : 1);
        }
        children.push_back(pid);
    }
    for (pid_t pid : children) {
        int status = 0;
        waitpid(pid, &status, 0);
        EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0);
    }
    EXPECT_EQ(JobAttributeStore(dir.path()).all(1).size(), static_cast<size_t>(kWriters * kEach));
}

TEST(JobStore, WriterKilledMidWriteLeavesOldOrNewValueNeverAMix) {
    TempDir dir;
    JobAttributeStore store(dir.path());
    ASSERT_TRUE(store.open());
    const std::string oldValue(4096, 'o');
    ASSERT_TRUE(store.set(3, "Big", oldValue));
    pid_t pid = fork();
    ASSERT_GE(pid, 0);
    if (pid == 0) {
        JobAttributeStore writer(dir.path());
        for (;;) writer.set(3, "Big", std::string(1 << 20, 'n'));
    }
    usleep(30000);
    kill(pid, SIGKILL);
    waitpid(pid, nullptr, 0);
    auto value = JobAttributeStore(dir.path()).get(3, "Big");
    ASSERT_TRUE(value.has_value());
    EXPECT_TRUE(*value == oldValue || *value == std::string(1 << 20, 'n'));
}

TEST(JobAttributes, WorkerReadsAndWritesThroughTheClientCalls) {
    StoreFolder folder;
    LD_JDF worker;
    worker.jobNumber = 42;
    char* value = nullptr;
    EXPECT_FALSE(worker.getJobAttribute("KVPrintDieLine", &value));
    ASSERT_TRUE(worker.setJobAttribute("KVPrintDieLine", "True"));
    ASSERT_TRUE(worker.getJobAttribute("KVPrintDieLine", &value));
    EXPECT_STREQ(value, "True");  // still valid after the session closed
    EXPECT_EQ(JobAttributeStore(folder.path()).get(42, "KVPrintDieLine"), "True");
}

TEST(JobAttributes, UnusableStoreIsAFailedReadNotACrash) {
    TempDir dir;
    vorlan::test::writeFile(dir / "file", "not a folder");
    setenv("VORLAN_JOB_STORE", (dir / "file" / "store").c_str(), 1);
    LD_JDF worker;
    char* value = nullptr;
    EXPECT_FALSE(worker.getJobAttribute("KVAutoDieControl", &value));
    EXPECT_FALSE(worker.setJobAttribute("KVDieDefined", "False"));
    unsetenv("VORLAN_JOB_STORE");
}
