// Scan throughput: the lmx reader against xmllint --noout --stream on the same
// generated CxF3 file, in the same run. Each tool runs in a child process of
// its own, so that its peak memory is its own; the best of several runs counts.
//
// usage: scan_bench [OBJECTS] [RUNS]   (defaults: 100000 objects, 5 runs)
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>

#include "bench/cxf_generator.h"
#include "tools/xml_walk.h"

namespace {

struct run_figures {
    double seconds = 0;   // best wall time, 0 before the first run
    long peak_rss_kb = 0; // largest peak resident set of any run
    bool ok = true;
};

// Runs a_child once in a forked process and folds its figures in.
template <typename F> void measure_once(run_figures *ap_figures, F a_child) {
    std::fflush(nullptr);
    auto start = std::chrono::steady_clock::now();
    pid_t pid = fork();
    if (pid == 0)
        _exit(a_child());
    int status = 0;
    rusage usage{};
    wait4(pid, &status, 0, &usage);
    double seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    ap_figures->ok = ap_figures->ok && WIFEXITED(status) && WEXITSTATUS(status) == 0;
    ap_figures->seconds = ap_figures->seconds == 0 ? seconds : std::min(ap_figures->seconds, seconds);
    ap_figures->peak_rss_kb = std::max(ap_figures->peak_rss_kb, usage.ru_maxrss);
}

void print(const char *ap_name, const run_figures &ar_figures, double a_megabytes) {
    std::printf("%-28s %8.1f MB/s  %7.3f s  peak RSS %7.1f MB%s\n", ap_name, a_megabytes / ar_figures.seconds,
                ar_figures.seconds, ar_figures.peak_rss_kb / 1024.0, ar_figures.ok ? "" : "  (FAILED)");
}

} // namespace

int main(int argc, char **argv) {
    int objects = argc > 1 ? std::atoi(argv[1]) : 100000;
    int runs = argc > 2 ? std::atoi(argv[2]) : 5;
    std::string path = (std::filesystem::temp_directory_path() / "tessarine_scan_bench.cxf").string();
    if (!tessarine_bench::write_cxf3_document(path, objects)) {
        std::fprintf(stderr, "scan_bench: cannot write %s\n", path.c_str());
        return 1;
    }
    double megabytes = static_cast<double>(std::filesystem::file_size(path)) / 1e6;
    std::printf("file: %s, %d objects, %.1f MB, best of %d runs\n", path.c_str(), objects, megabytes, runs);

    tessarine_tools::xml_walk_result counts = tessarine_tools::walk_xml_file(path);
    std::printf("delivered: %zu elements, %zu attributes, %zu text runs\n", counts.elements, counts.attributes,
                counts.text_runs);

    // The tools take turns, so that a change in machine speed during the run
    // touches both alike.
    run_figures lmx_scan, xmllint;
    for (int i = 0; i < runs; ++i) {
        measure_once(&lmx_scan, [&] { return tessarine_tools::walk_xml_file(path).ok() ? 0 : 1; });
        measure_once(&xmllint, [&] {
            std::freopen("/dev/null", "w", stdout);
            std::freopen("/dev/null", "w", stderr);
            execlp("xmllint", "xmllint", "--noout", "--stream", path.c_str(), static_cast<char *>(nullptr));
            return 127;
        });
    }

    print("lmx reader (full walk)", lmx_scan, megabytes);
    print("xmllint --noout --stream", xmllint, megabytes);
    double ratio = xmllint.seconds / lmx_scan.seconds;
    std::printf("ratio lmx / xmllint: %.2fx (target at least 1.5x)\n", ratio);
    std::filesystem::remove(path);
    return lmx_scan.ok && xmllint.ok ? 0 : 1;
}
