// Runs a benchmarked tool in a child process of its own, so that the peak
// resident memory the kernel reports for it is that tool's alone, and folds
// the time and memory of repeated runs into one set of figures.
//
// A child is forked from the benchmark; one that runs an external program
// calls exec in it. A child starts with the benchmark's resident pages, so
// a benchmark keeps itself small before it forks, and a run of a child that
// does nothing gives the baseline to subtract.
#ifndef TESSARINE_BENCH_BENCH_PROCESS_H
#define TESSARINE_BENCH_BENCH_PROCESS_H

#include <fcntl.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <string>
#include <type_traits>

namespace tessarine_bench {

struct run_figures {
    double seconds = 0;   // best time, 0 before the first run
    long peak_rss_kb = 0; // largest peak resident set of any run
    bool ok = true;       // every run exited with 0
};

// What a child may hand back besides its exit status, through a pipe. A child
// that times part of its work itself (leaving out what it does before and
// after) sets seconds; otherwise the wall time of the whole child counts,
// from fork to exit.
struct child_report {
    double seconds = -1;
    double figures[6] = {0, 0, 0, 0, 0, 0}; // the child's own, such as counts
};

// Runs a_child once in a forked process and folds its figures in; returns
// what the child reported. a_child is an int() or an int(child_report &); the
// int is the exit status.
template <typename F> child_report measure_once(run_figures *ap_figures, F a_child) {
    std::fflush(nullptr);
    int channel[2] = {-1, -1};
    // Close-on-exec: a program run by exec does not hold the pipe open.
    bool has_channel = pipe2(channel, O_CLOEXEC) == 0;
    auto start = std::chrono::steady_clock::now();
    pid_t pid = fork();
    if (pid == 0) {
        child_report report;
        int status = 0;
        if constexpr (std::is_invocable_v<F, child_report &>)
            status = a_child(report);
        else
            status = a_child();
        if (has_channel && write(channel[1], &report, sizeof report) != static_cast<ssize_t>(sizeof report))
            status = status ? status : 1;
        std::fflush(nullptr);
        _exit(status);
    }
    child_report report;
    if (has_channel)
        close(channel[1]);
    if (pid < 0) {
        ap_figures->ok = false;
    } else {
        int status = 0;
        rusage usage{};
        wait4(pid, &status, 0, &usage);
        double seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
        // The report is far smaller than a pipe's buffer: the child wrote it
        // whole before it exited.
        child_report received;
        if (has_channel && read(channel[0], &received, sizeof received) == static_cast<ssize_t>(sizeof received))
            report = received;
        if (report.seconds >= 0)
            seconds = report.seconds;
        ap_figures->ok = ap_figures->ok && WIFEXITED(status) && WEXITSTATUS(status) == 0;
        ap_figures->seconds = ap_figures->seconds == 0 ? seconds : std::min(ap_figures->seconds, seconds);
        ap_figures->peak_rss_kb = std::max(ap_figures->peak_rss_kb, usage.ru_maxrss);
    }
    if (has_channel)
        close(channel[0]);
    return report;
}

// One line of figures: throughput over a_megabytes, time, peak RSS, then
// ar_note.
inline void print_figures(const char *ap_name, const run_figures &ar_figures, double a_megabytes,
                          const std::string &ar_note = std::string()) {
    std::printf("%-28s %8.1f MB/s  %7.3f s  peak RSS %7.1f MB%s%s\n", ap_name, a_megabytes / ar_figures.seconds,
                ar_figures.seconds, ar_figures.peak_rss_kb / 1024.0, ar_figures.ok ? "" : "  (FAILED)",
                ar_note.c_str());
}

} // namespace tessarine_bench

#endif
