// Scan throughput: the lmx reader against xmllint --noout --stream on the same
// generated CxF3 file, in the same run. Each tool runs in a child process of
// its own, so that its peak memory is its own; the best of several runs counts.
//
// usage: scan_bench [OBJECTS] [RUNS]   (defaults: 100000 objects, 5 runs)
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>

#include "bench/bench_process.h"
#include "bench/cxf_generator.h"
#include "tools/xml_walk.h"

using tessarine_bench::measure_once;
using tessarine_bench::run_figures;

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

    tessarine_bench::print_figures("lmx reader (full walk)", lmx_scan, megabytes);
    tessarine_bench::print_figures("xmllint --noout --stream", xmllint, megabytes);
    double ratio = xmllint.seconds / lmx_scan.seconds;
    std::printf("ratio lmx / xmllint: %.2fx (target at least 1.5x)\n", ratio);
    std::filesystem::remove(path);
    return lmx_scan.ok && xmllint.ok ? 0 : 1;
}
