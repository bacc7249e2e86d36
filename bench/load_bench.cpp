// Loading whole CxF3 documents into the bound classes. cc::CxF::loadFile reads
// a file into the object model and checks every element, attribute and value
// on the way; set against it, in the same run and on the same file:
//
//   - pugixml: load_file into its tree, then a walk over every element and
//     attribute that converts every number with strtod (attribute values and
//     element text; a list such as a spectrum item by item), summing them so
//     that nothing is optimised away. That is the least an application on a
//     tree parser does to get at the values, with no checks at all;
//   - xmllint --noout, which builds libxml2's tree of the file and drops it.
//
// cc::CxF::writeFile of the loaded document is measured too, on the bytes it
// writes.
//
// The documents are generated from a fixed seed (bench/cxf_generator.h, full
// objects): a spectrum, a CIELab value, a CMYK device value and a tag
// collection in every object, two cc:ColorSpecification elements. Each tool
// runs in a child process of its own (bench/bench_process.h), so that its peak
// memory is its own. The memory of the loaded document is the peak of the loadFile child
// less the peak of a child that does nothing. loadFile, writeFile and the
// pugixml load and walk are timed inside their child, from the call to its
// return, so that neither the process nor the freeing of the tree is counted;
// xmllint is timed as a whole process (a child that does nothing shows what
// a process costs). The tools take turns; the best of several runs counts.
//
// usage: load_bench [RUNS] [OBJECTS ...]   (defaults: 5 runs; 10000 and 100000 objects)
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <system_error>
#include <vector>

#include <cxf/v3/cxf3.h>
#include <pugixml.hpp>

#include "bench/bench_process.h"
#include "bench/cxf_generator.h"

namespace {

using tessarine_bench::child_report;
using tessarine_bench::measure_once;
using tessarine_bench::print_figures;
using tessarine_bench::run_figures;

// Targets of the loading side.
constexpr double k_max_memory_per_byte = 2.0; // loaded document, against the file size
constexpr double k_max_time_to_pugixml = 2.0; // loadFile time, against pugixml's load and walk
constexpr double k_min_write_megabytes_per_s = 150;

double seconds_since(std::chrono::steady_clock::time_point a_start) {
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - a_start).count();
}

// ------------------------------------------------------------------ loadFile, writeFile
//
// The report of both children: figures[0] is the error code, figures[1] says
// which call returned it (0 loadFile, 1 writeFile).

int load_document(const std::string &ar_path, child_report &ar_report) {
    cc::CxF document;
    auto start = std::chrono::steady_clock::now();
    int error = static_cast<int>(document.loadFile(ar_path.c_str()));
    ar_report.seconds = seconds_since(start);
    ar_report.figures[0] = error;
    return error == 0 ? 0 : 1;
}

int load_and_write_document(const std::string &ar_path, const std::wstring &ar_written, child_report &ar_report) {
    cc::CxF document;
    int error = static_cast<int>(document.loadFile(ar_path.c_str()));
    ar_report.figures[0] = error;
    if (error != 0)
        return 1;
    auto start = std::chrono::steady_clock::now();
    error = static_cast<int>(document.writeFile(ar_written));
    ar_report.seconds = seconds_since(start);
    ar_report.figures[0] = error;
    ar_report.figures[1] = 1;
    return error == 0 ? 0 : 1;
}

// ------------------------------------------------------------------ pugixml

struct walk_totals {
    double elements = 0, attributes = 0, numbers = 0, sum = 0;
};

bool is_space(char a_c) { return a_c == ' ' || a_c == '\t' || a_c == '\n' || a_c == '\r'; }

// A value whose items, separated by white space, all convert whole with
// strtod is a number or a list of numbers: they are counted and summed. Any
// other value (a name, an id, a date) is left as text.
void add_numbers(const char *ac_value, walk_totals *ap_totals) {
    double sum = 0;
    double count = 0;
    const char *p = ac_value;
    for (;;) {
        while (is_space(*p))
            ++p;
        if (!*p)
            break;
        char *p_end = nullptr;
        double value = std::strtod(p, &p_end);
        if (p_end == p || (*p_end && !is_space(*p_end)))
            return;
        sum += value;
        ++count;
        p = p_end;
    }
    ap_totals->sum += sum;
    ap_totals->numbers += count;
}

// Every node in document order, without recursion.
walk_totals walk(const pugi::xml_document &ar_document) {
    walk_totals totals;
    pugi::xml_node node = ar_document.first_child();
    while (node) {
        switch (node.type()) {
        case pugi::node_element:
            ++totals.elements;
            for (pugi::xml_attribute attribute : node.attributes()) {
                ++totals.attributes;
                add_numbers(attribute.value(), &totals);
            }
            break;
        case pugi::node_pcdata:
        case pugi::node_cdata:
            add_numbers(node.value(), &totals);
            break;
        default:
            break;
        }
        if (pugi::xml_node child = node.first_child()) {
            node = child;
            continue;
        }
        while (node && !node.next_sibling())
            node = node.parent();
        if (node)
            node = node.next_sibling();
    }
    return totals;
}

// The report: elements, attributes, numbers, their sum, and the time of
// load_file alone.
int pugixml_load_and_walk(const std::string &ar_path, child_report &ar_report) {
    pugi::xml_document document;
    auto start = std::chrono::steady_clock::now();
    pugi::xml_parse_result result = document.load_file(ar_path.c_str());
    if (!result) {
        std::fprintf(stderr, "load_bench: pugixml: %s at byte %lld\n", result.description(),
                     static_cast<long long>(result.offset));
        return 1;
    }
    ar_report.figures[4] = seconds_since(start);
    walk_totals totals = walk(document);
    ar_report.seconds = seconds_since(start);
    ar_report.figures[0] = totals.elements;
    ar_report.figures[1] = totals.attributes;
    ar_report.figures[2] = totals.numbers;
    ar_report.figures[3] = totals.sum;
    return 0;
}

// ------------------------------------------------------------------ xmllint

int run_xmllint(const std::string &ar_path) {
    std::freopen("/dev/null", "w", stdout);
    std::freopen("/dev/null", "w", stderr);
    execlp("xmllint", "xmllint", "--noout", ar_path.c_str(), static_cast<char *>(nullptr));
    return 127;
}

// ------------------------------------------------------------------ one file

struct failure {
    int error = 0; // the code a call returned
    int call = 0;  // 0 loadFile, 1 writeFile
    bool is_set = false;
};

// Keeps the first failure of a cc::CxF child, from its report.
void note_failure(failure *ap_failure, const child_report &ar_report) {
    if (ap_failure->is_set || ar_report.figures[0] == 0)
        return;
    ap_failure->error = static_cast<int>(ar_report.figures[0]);
    ap_failure->call = static_cast<int>(ar_report.figures[1]);
    ap_failure->is_set = true;
}

std::string failure_note(const run_figures &ar_figures, const failure &ar_failure) {
    if (ar_figures.ok)
        return std::string();
    if (!ar_failure.is_set)
        return "  <<< the child did not finish";
    return std::string("  <<< ") + (ar_failure.call ? "writeFile" : "loadFile") + " returned error " +
           std::to_string(ar_failure.error);
}

// Measures every tool on a document of a_objects objects; false if a tool
// failed.
bool measure_file(int a_objects, int a_runs) {
    std::filesystem::path temp = std::filesystem::temp_directory_path();
    std::string path = (temp / ("tessarine_load_bench_" + std::to_string(a_objects) + ".cxf")).string();
    std::filesystem::path written = temp / ("tessarine_load_bench_" + std::to_string(a_objects) + "_written.cxf");
    tessarine_bench::cxf3_document_options options;
    options.start_wavelength = 400;
    options.has_full_objects = true;
    if (!tessarine_bench::write_cxf3_document(path, a_objects, options)) {
        std::fprintf(stderr, "load_bench: cannot write %s\n", path.c_str());
        return false;
    }
    double megabytes = static_cast<double>(std::filesystem::file_size(path)) / 1e6;
    std::printf("\nfile: %s, %d objects, %.1f MB, best of %d runs\n", path.c_str(), a_objects, megabytes, a_runs);

    run_figures idle, load, write, pugixml, xmllint;
    failure load_failure, write_failure;
    child_report walked;
    double pugixml_load_seconds = 0; // the best of load_file alone
    double written_megabytes = 0;
    bool is_write_missing = false;
    for (int i = 0; i < a_runs; ++i) {
        measure_once(&idle, [] { return 0; });
        note_failure(&load_failure,
                     measure_once(&load, [&](child_report &ar_report) { return load_document(path, ar_report); }));

        std::error_code ignored;
        std::filesystem::remove(written, ignored);
        note_failure(&write_failure, measure_once(&write, [&](child_report &ar_report) {
            return load_and_write_document(path, written.wstring(), ar_report);
        }));
        std::error_code error;
        std::uintmax_t written_bytes = std::filesystem::file_size(written, error);
        if (error) {
            if (write.ok)
                is_write_missing = true;
            write.ok = false;
        } else {
            written_megabytes = static_cast<double>(written_bytes) / 1e6;
        }

        walked =
            measure_once(&pugixml, [&](child_report &ar_report) { return pugixml_load_and_walk(path, ar_report); });
        if (walked.figures[4] > 0 && (pugixml_load_seconds == 0 || walked.figures[4] < pugixml_load_seconds))
            pugixml_load_seconds = walked.figures[4];
        measure_once(&xmllint, [&] { return run_xmllint(path); });
    }

    std::printf("%-28s %13s  %7.3f s  peak RSS %7.1f MB%s  (the baseline)\n", "idle child", "", idle.seconds,
                idle.peak_rss_kb / 1024.0, idle.ok ? "" : "  (FAILED)");
    if (load.ok) {
        double document_megabytes = (load.peak_rss_kb - idle.peak_rss_kb) * 1024.0 / 1e6;
        char note[160];
        std::snprintf(note, sizeof note, "\n%-28s document %.1f MB = %.2fx the file (target at most %.0fx)", "",
                      document_megabytes, document_megabytes / megabytes, k_max_memory_per_byte);
        print_figures("cc::CxF::loadFile", load, megabytes, note);
    } else {
        print_figures("cc::CxF::loadFile", load, megabytes, failure_note(load, load_failure));
    }
    if (is_write_missing) {
        print_figures("cc::CxF::writeFile", write, 0, "  <<< writeFile returned 0 but wrote no file");
    } else if (write.ok) {
        char note[160];
        std::snprintf(note, sizeof note, "\n%-28s %.1f MB written (target at least %.0f MB/s)", "", written_megabytes,
                      k_min_write_megabytes_per_s);
        print_figures("cc::CxF::writeFile", write, written_megabytes, note);
    } else {
        print_figures("cc::CxF::writeFile", write, written_megabytes, failure_note(write, write_failure));
    }
    char walk_note[240];
    std::snprintf(walk_note, sizeof walk_note,
                  "\n%-28s load_file alone %.3f s\n%-28s %.0f elements, %.0f attributes, %.0f numbers, sum %.2f", "",
                  pugixml_load_seconds, "", walked.figures[0], walked.figures[1], walked.figures[2], walked.figures[3]);
    print_figures("pugixml load_file + walk", pugixml, megabytes, walk_note);
    print_figures("xmllint --noout", xmllint, megabytes);

    if (load.ok) {
        std::printf("loadFile time / pugixml load + walk: %.2fx (target at most %.0fx)\n",
                    load.seconds / pugixml.seconds, k_max_time_to_pugixml);
        std::printf("loadFile time / xmllint --noout:     %.2fx\n", load.seconds / xmllint.seconds);
    } else {
        std::printf("LOADING FAILED: no ratios for %s\n", path.c_str());
        std::fprintf(stderr, "load_bench: cc::CxF::loadFile failed on %s%s\n", path.c_str(),
                     failure_note(load, load_failure).c_str());
    }
    std::error_code ignored;
    std::filesystem::remove(written, ignored);
    std::filesystem::remove(path, ignored);
    return idle.ok && load.ok && write.ok && pugixml.ok && xmllint.ok;
}

} // namespace

int main(int argc, char **argv) {
    int runs = argc > 1 ? std::atoi(argv[1]) : 5;
    std::vector<int> sizes;
    for (int i = 2; i < argc; ++i)
        sizes.push_back(std::atoi(argv[i]));
    if (sizes.empty())
        sizes = {10000, 100000};
    if (runs < 1) {
        std::fprintf(stderr, "usage: load_bench [RUNS] [OBJECTS ...]\n");
        return 2;
    }
    std::printf("load_bench: best of %d runs\n", runs);
    bool is_ok = true;
    for (int objects : sizes)
        is_ok = measure_file(objects, runs) && is_ok;
    if (!is_ok)
        std::fprintf(stderr, "load_bench: FAILED, see above\n");
    return is_ok ? 0 : 1;
}
