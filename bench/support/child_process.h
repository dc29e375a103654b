// Measuring work in a process of its own, so that its time and peak memory are its alone.
#pragma once

#include <functional>
#include <string>
#include <vector>

namespace vorlan::bench {

struct ChildRun {
    double seconds = 0;     // wall time from fork to exit
    double cpuSeconds = 0;  // user + system time of the child
    long peakKb = 0;        // the child's peak resident memory
    int status = -1;        // exit status; -1 when killed by a signal
};

// Runs work() in a forked child whose exit status is work's result. The child starts with the
// caller's resident pages, so measure memory this way only from a small parent.
ChildRun runInChild(const std::function<int()>& work);
// Runs a program (argv[0] searched on PATH) in a fresh process.
ChildRun runProgram(const std::vector<std::string>& argv);

double median(std::vector<double> values);

}  // namespace vorlan::bench
