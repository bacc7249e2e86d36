// Write throughput: a generated CxF3 document of many objects written through
// the lmx writer, the way bound classes write themselves, into a string and
// into a file. The object model is built first; only the writing is timed,
// and the best of several runs counts.
//
// Each object is shaped like those of bench/cxf_generator.h: attributes
// ObjectType, Name and Id; a ReflectanceSpectrum of 36 values written as one
// list; a ColorCIELab with L, A and B. The values carry the decimals that
// instruments report (4 for reflectance, 2 for Lab), and in a second document
// all the digits a double has, which makes every number 14 digits long.
//
// usage: write_bench [OBJECTS] [RUNS]   (defaults: 100000 objects, 5 runs)
#include <sys/resource.h>

#include <chrono>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <random>
#include <string>
#include <vector>

#include "lmx/lmxparse.h"

namespace {

// ------------------------------------------------------------------ members
//
// The member containers of bound classes.

template <typename T> using value_member = lmx::ct_simple_non_pod_single<T>;
template <typename T> using list_member = lmx::ct_simple_pod_list_single<T>;

// ------------------------------------------------------------------ specs

// L* of CIELab lies between 0 and 100.
lmx::elmx_error value_0_to_100(lmx::c_xml_reader &ar_reader, const double &ar_value) {
    if (lmx::elmx_error error = lmx::check_min_inclusive(ar_reader, ar_value, 0))
        return error;
    return lmx::check_max_inclusive(ar_reader, ar_value, 100);
}

template <typename T>
lmx::ct_typed_validation_spec<T>
make_spec(lmx::elmx_whitespace a_whitespace,
          typename lmx::ct_typed_validation_spec<T>::t_value_validator ap_value = lmx::value_validator_none<T>) {
    return lmx::ct_typed_validation_spec<T>(a_whitespace, "", lmx::lexical_validator_none, ap_value, lmx::v_to_o<T>,
                                            lmx::o_to_v<T>);
}

const auto k_string_spec = make_spec<std::wstring>(lmx::ws_preserve);
const auto k_double_spec = make_spec<double>(lmx::ws_collapse);
const auto k_double_list_spec = make_spec<double>(lmx::ws_preserve);
const auto k_lightness_spec = make_spec<double>(lmx::ws_collapse, value_0_to_100);
const auto k_int_spec = make_spec<int>(lmx::ws_collapse);
const auto k_datetime_spec = make_spec<lmx::c_datetime>(lmx::ws_collapse);

const lmx::s_ns_map k_ns_map_writer[] = {
    {1000, "cc", "http://colorexchangeformat.com/CxF3-core"},
    {0, nullptr, nullptr},
};

// ------------------------------------------------------------------ classes
//
// Each writes itself as a generated class does: a scope object, the start
// tag, the namespace declarations (written once, on the root), the
// attributes, the children, the end tag. write_element does the frame; the
// content is the class's own.

template <typename Content>
lmx::elmx_error write_element(lmx::c_xml_writer &ar_writer, const char *ac_name, Content a_content) {
    lmx::c_xml_writer_local local(ar_writer);
    ar_writer.start_element(ac_name);
    ar_writer.conditionally_select_ns_map(k_ns_map_writer);
    ar_writer.conditionally_write_ns_attrs(true);
    if (lmx::elmx_error error = a_content())
        return error;
    ar_writer.end_element(ac_name);
    return lmx::elmx_ok;
}

struct reflectance_spectrum {
    value_member<std::wstring> color_specification;
    value_member<int> start_wl;
    list_member<double> values;

    lmx::elmx_error marshal(lmx::c_xml_writer &ar_writer, const char *ac_name) const {
        return write_element(ar_writer, ac_name, [&]() -> lmx::elmx_error {
            if (lmx::elmx_error error =
                    ar_writer.marshal_attribute("ColorSpecification", color_specification, k_string_spec))
                return error;
            if (lmx::elmx_error error = ar_writer.marshal_attribute("StartWL", start_wl, k_int_spec))
                return error;
            return ar_writer.marshal_element_body_list(ac_name, values, k_double_list_spec);
        });
    }
};

struct color_cielab {
    value_member<std::wstring> color_specification;
    value_member<double> l, a, b;

    lmx::elmx_error marshal(lmx::c_xml_writer &ar_writer, const char *ac_name) const {
        return write_element(ar_writer, ac_name, [&]() -> lmx::elmx_error {
            if (lmx::elmx_error error =
                    ar_writer.marshal_attribute("ColorSpecification", color_specification, k_string_spec))
                return error;
            if (lmx::elmx_error error = ar_writer.marshal_element("cc:L", l, k_lightness_spec, nullptr))
                return error;
            if (lmx::elmx_error error = ar_writer.marshal_element("cc:A", a, k_double_spec, nullptr))
                return error;
            return ar_writer.marshal_element("cc:B", b, k_double_spec, nullptr);
        });
    }
};

struct color_object {
    value_member<std::wstring> object_type, name, id;
    reflectance_spectrum spectrum;
    color_cielab lab;

    lmx::elmx_error marshal(lmx::c_xml_writer &ar_writer, const char *ac_name) const {
        return write_element(ar_writer, ac_name, [&]() -> lmx::elmx_error {
            if (lmx::elmx_error error = ar_writer.marshal_attribute("ObjectType", object_type, k_string_spec))
                return error;
            if (lmx::elmx_error error = ar_writer.marshal_attribute("Name", name, k_string_spec))
                return error;
            if (lmx::elmx_error error = ar_writer.marshal_attribute("Id", id, k_string_spec))
                return error;
            return write_element(ar_writer, "cc:ColorValues", [&]() -> lmx::elmx_error {
                if (lmx::elmx_error error = spectrum.marshal(ar_writer, "cc:ReflectanceSpectrum"))
                    return error;
                return lab.marshal(ar_writer, "cc:ColorCIELab");
            });
        });
    }
};

struct document {
    value_member<std::wstring> creator, description;
    value_member<lmx::c_datetime> creation_date;
    std::vector<color_object> objects;

    lmx::elmx_error marshal(lmx::c_xml_writer &ar_writer, const char *ac_name) const {
        return write_element(ar_writer, ac_name, [&]() -> lmx::elmx_error {
            if (lmx::elmx_error error = write_element(ar_writer, "cc:FileInformation", [&]() -> lmx::elmx_error {
                    if (lmx::elmx_error error =
                            ar_writer.marshal_element("cc:Creator", creator, k_string_spec, nullptr))
                        return error;
                    if (lmx::elmx_error error =
                            ar_writer.marshal_element("cc:CreationDate", creation_date, k_datetime_spec, nullptr))
                        return error;
                    return ar_writer.marshal_element("cc:Description", description, k_string_spec, nullptr);
                }))
                return error;
            return write_element(ar_writer, "cc:Resources", [&] {
                return write_element(ar_writer, "cc:ObjectCollection", [&]() -> lmx::elmx_error {
                    for (const color_object &object : objects)
                        if (lmx::elmx_error error = object.marshal(ar_writer, "cc:Object"))
                            return error;
                    return lmx::elmx_ok;
                });
            });
        });
    }
    lmx::elmx_error marshal(lmx::c_xml_writer &ar_writer) const { return marshal(ar_writer, "cc:CxF"); }
};

double rounded(double a_value, double a_scale) { return std::round(a_value * a_scale) / a_scale; }

// The same seed and distributions as bench/cxf_generator.h.
document make_document(int a_objects, bool a_is_rounded) {
    std::mt19937 random(20261123u);
    std::uniform_real_distribution<double> reflectance(0.02, 0.95);
    std::uniform_real_distribution<double> lightness(5.0, 98.0);
    std::uniform_real_distribution<double> chroma(-80.0, 80.0);
    auto pick = [&](std::uniform_real_distribution<double> &ar_distribution, double a_scale) {
        double value = ar_distribution(random);
        return a_is_rounded ? rounded(value, a_scale) : value;
    };
    document doc;
    doc.creator.set(L"Tessarine benchmark");
    lmx::c_datetime date;
    lmx::v_to_o(date, std::string("2026-11-23T12:00:00"));
    doc.creation_date.set(date);
    doc.description.set(L"Generated colour library");
    doc.objects.resize(static_cast<std::size_t>(a_objects));
    for (int i = 0; i < a_objects; ++i) {
        color_object &object = doc.objects[static_cast<std::size_t>(i)];
        object.object_type.set(L"Standard");
        object.name.set(L"Colour " + std::to_wstring(i + 1));
        object.id.set(L"o" + std::to_wstring(i + 1));
        object.spectrum.color_specification.set(L"cs1");
        object.spectrum.start_wl.set(380);
        for (int w = 0; w < 36; ++w)
            object.spectrum.values.append(pick(reflectance, 1e4));
        object.lab.color_specification.set(L"cs1");
        object.lab.l.set(pick(lightness, 1e2));
        object.lab.a.set(pick(chroma, 1e2));
        object.lab.b.set(pick(chroma, 1e2));
    }
    return doc;
}

// The best time of a_run over a_runs runs; a_prepare runs untimed before each.
template <typename P, typename F> double best_seconds(int a_runs, P a_prepare, F a_run) {
    double best = 0;
    for (int i = 0; i < a_runs; ++i) {
        a_prepare();
        auto start = std::chrono::steady_clock::now();
        if (!a_run()) {
            std::fprintf(stderr, "write_bench: writing failed\n");
            std::exit(1);
        }
        double seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
        best = i == 0 ? seconds : std::min(best, seconds);
    }
    return best;
}

double peak_rss_megabytes() {
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return usage.ru_maxrss / 1024.0;
}

void print(const char *ap_name, double a_megabytes, double a_seconds) {
    std::printf("%-34s %8.1f MB/s  %7.3f s  %7.1f MB\n", ap_name, a_megabytes / a_seconds, a_seconds, a_megabytes);
}

} // namespace

int main(int argc, char **argv) {
    int objects = argc > 1 ? std::atoi(argv[1]) : 100000;
    int runs = argc > 2 ? std::atoi(argv[2]) : 5;
    std::string path = (std::filesystem::temp_directory_path() / "tessarine_write_bench.cxf").string();
    std::printf("%d objects, best of %d runs (target: at least 300 MB/s)\n", objects, runs);

    for (bool is_rounded : {true, false}) {
        const char *p_kind = is_rounded ? "measured decimals" : "full precision";
        document doc = make_document(objects, is_rounded);
        double model_rss = peak_rss_megabytes();
        std::string text;
        double string_seconds = best_seconds(
            runs, [&] { std::string().swap(text); }, [&] { return lmx::marshal(doc, text) == lmx::elmx_ok; });
        double megabytes = static_cast<double>(text.size()) / 1e6;
        std::string().swap(text);
        double file_seconds = best_seconds(
            runs, [&] { std::filesystem::remove(path); },
            [&] { return lmx::marshal(doc, path.c_str()) == lmx::elmx_ok; });
        if (std::filesystem::file_size(path) != static_cast<std::uintmax_t>(megabytes * 1e6 + 0.5)) {
            std::fprintf(stderr, "write_bench: the file and the string differ in size\n");
            return 1;
        }
        std::string label = std::string("to string, ") + p_kind;
        print(label.c_str(), megabytes, string_seconds);
        label = std::string("to file, ") + p_kind;
        print(label.c_str(), megabytes, file_seconds);
        std::printf("peak RSS %.1f MB once the object model was built, %.1f MB after writing\n", model_rss,
                    peak_rss_megabytes());
    }
    std::filesystem::remove(path);
    return 0;
}
