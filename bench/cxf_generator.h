// Writes large, realistic CxF3 documents for the benchmarks: objects with a
// 36-point reflectance spectrum and a CIELab value, from a fixed seed so that
// every run measures the same bytes.
//
// The plain document (the default options) is the one of the scan benchmark.
// With has_full_objects set, every object carries what a colour library file
// from the field carries besides its measurements, and the load benchmark
// reads that:
//
//     <cc:Object ObjectType="Standard" Name="Colour 1" Id="o1" GUID="...">
//         <cc:CreationDate>...</cc:CreationDate>
//         <cc:ColorValues>
//             <cc:ReflectanceSpectrum ColorSpecification="cs1" StartWL="400">36 values</cc:ReflectanceSpectrum>
//             <cc:ColorCIELab ColorSpecification="cs2"> L, A, B </cc:ColorCIELab>
//         </cc:ColorValues>
//         <cc:DeviceColorValues>
//             <cc:ColorCMYK ColorSpecification="cs1"> Cyan, Magenta, Yellow, Black (0 to 100) </cc:ColorCMYK>
//         </cc:DeviceColorValues>
//         <cc:TagCollection Name="Production"> two cc:Tag Name=".." Value=".." </cc:TagCollection>
//     </cc:Object>
//
// and the resources hold a second cc:ColorSpecification, cs2 (D65, 10 degree
// observer, colorimetric), after cs1 (D50, 2 degree observer, spectral).
#ifndef TESSARINE_BENCH_CXF_GENERATOR_H
#define TESSARINE_BENCH_CXF_GENERATOR_H

#include <cstdio>
#include <random>
#include <string>

namespace tessarine_bench {

// What a generated document holds; the defaults give the scan benchmark's.
struct cxf3_document_options {
    unsigned seed = 20261123u;
    // StartWL of every spectrum and of the wavelength ranges.
    int start_wavelength = 380;
    // A GUID, a CMYK device value and a tag collection in every object, the
    // CIELab values under a second cc:ColorSpecification.
    bool has_full_objects = false;
};

namespace detail {

inline void append_color_specification(std::string &ar_out, const char *ac_id, const char *ac_illuminant,
                                       const char *ac_observer, const char *ac_measurement_type,
                                       int a_start_wavelength) {
    ar_out += "\t\t\t<cc:ColorSpecification Id=\"";
    ar_out += ac_id;
    ar_out += "\">\n"
              "\t\t\t\t<cc:TristimulusSpec>\n"
              "\t\t\t\t\t<cc:Illuminant>";
    ar_out += ac_illuminant;
    ar_out += "</cc:Illuminant>\n"
              "\t\t\t\t\t<cc:Observer>";
    ar_out += ac_observer;
    ar_out += "</cc:Observer>\n"
              "\t\t\t\t\t<cc:Method>E308_Table5</cc:Method>\n"
              "\t\t\t\t</cc:TristimulusSpec>\n"
              "\t\t\t\t<cc:MeasurementSpec>\n"
              "\t\t\t\t\t<cc:MeasurementType>";
    ar_out += ac_measurement_type;
    ar_out += "</cc:MeasurementType>\n"
              "\t\t\t\t\t<cc:GeometryChoice>\n"
              "\t\t\t\t\t\t<cc:SingleAngle>\n"
              "\t\t\t\t\t\t\t<cc:SingleAngleConfiguration>Annular</cc:SingleAngleConfiguration>\n"
              "\t\t\t\t\t\t\t<cc:IlluminationAngle>45</cc:IlluminationAngle>\n"
              "\t\t\t\t\t\t\t<cc:MeasurementAngle>0</cc:MeasurementAngle>\n"
              "\t\t\t\t\t\t</cc:SingleAngle>\n"
              "\t\t\t\t\t</cc:GeometryChoice>\n"
              "\t\t\t\t\t<cc:WavelengthRange StartWL=\"";
    ar_out += std::to_string(a_start_wavelength);
    ar_out += "\" Increment=\"10\"/>\n"
              "\t\t\t\t</cc:MeasurementSpec>\n"
              "\t\t\t</cc:ColorSpecification>\n";
}

// <ac_tag>value</ac_tag> on a line of its own at six tabs, the value with
// two decimals.
inline void append_value_line(std::string &ar_out, const char *ac_tag, double a_value) {
    char number[32];
    std::snprintf(number, sizeof number, "%.2f", a_value);
    ar_out += "\t\t\t\t\t\t<";
    ar_out += ac_tag;
    ar_out += '>';
    ar_out += number;
    ar_out += "</";
    ar_out += ac_tag;
    ar_out += ">\n";
}

} // namespace detail

// Writes a document of a_objects objects to ar_path; false if it cannot.
inline bool write_cxf3_document(const std::string &ar_path, int a_objects, const cxf3_document_options &ar_options) {
    std::FILE *p_file = std::fopen(ar_path.c_str(), "wb");
    if (!p_file)
        return false;
    const bool is_full = ar_options.has_full_objects;
    const std::string start_wavelength = std::to_string(ar_options.start_wavelength);
    std::mt19937 random(ar_options.seed);
    std::uniform_real_distribution<double> reflectance(0.02, 0.95);
    std::uniform_real_distribution<double> lightness(5.0, 98.0);
    std::uniform_real_distribution<double> chroma(-80.0, 80.0);
    std::uniform_real_distribution<double> coverage(0.0, 100.0);
    static const char *const substrates[] = {"Coated", "Uncoated", "Newsprint", "Film"};
    std::string out;
    out.reserve(1 << 16);
    out += "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
           "<cc:CxF xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\">\n"
           "\t<cc:FileInformation>\n"
           "\t\t<cc:Creator>Tessarine benchmark</cc:Creator>\n"
           "\t\t<cc:CreationDate>2026-11-23T12:00:00</cc:CreationDate>\n"
           "\t\t<cc:Description>Generated colour library</cc:Description>\n"
           "\t</cc:FileInformation>\n"
           "\t<cc:Resources>\n"
           "\t\t<cc:ObjectCollection>\n";
    char number[64];
    for (int i = 1; i <= a_objects; ++i) {
        out += "\t\t\t<cc:Object ObjectType=\"Standard\" Name=\"Colour ";
        out += std::to_string(i);
        out += "\" Id=\"o";
        out += std::to_string(i);
        if (is_full) {
            // A random (version 4) GUID; the draws are sequenced, so that
            // every compiler writes the same one.
            unsigned long part[6];
            for (unsigned long &r_part : part)
                r_part = random();
            std::snprintf(number, sizeof number, "%08lx-%04lx-4%03lx-%04lx-%04lx%08lx", part[0], part[1] & 0xffffu,
                          part[2] & 0xfffu, (part[3] & 0x3fffu) | 0x8000u, part[4] & 0xffffu, part[5]);
            out += "\" GUID=\"";
            out += number;
        }
        out += "\">\n\t\t\t\t<cc:CreationDate>2026-11-23T12:00:00</cc:CreationDate>\n"
               "\t\t\t\t<cc:ColorValues>\n"
               "\t\t\t\t\t<cc:ReflectanceSpectrum ColorSpecification=\"cs1\" StartWL=\"";
        out += start_wavelength;
        out += "\">";
        for (int w = 0; w < 36; ++w) {
            std::snprintf(number, sizeof number, w ? " %.4f" : "%.4f", reflectance(random));
            out += number;
        }
        out += "</cc:ReflectanceSpectrum>\n"
               "\t\t\t\t\t<cc:ColorCIELab ColorSpecification=\"";
        out += is_full ? "cs2" : "cs1";
        out += "\">\n";
        std::snprintf(number, sizeof number, "%.2f", lightness(random));
        out += "\t\t\t\t\t\t<cc:L>";
        out += number;
        std::snprintf(number, sizeof number, "%.2f", chroma(random));
        out += "</cc:L>\n\t\t\t\t\t\t<cc:A>";
        out += number;
        std::snprintf(number, sizeof number, "%.2f", chroma(random));
        out += "</cc:A>\n\t\t\t\t\t\t<cc:B>";
        out += number;
        out += "</cc:B>\n\t\t\t\t\t</cc:ColorCIELab>\n\t\t\t\t</cc:ColorValues>\n";
        if (is_full) {
            out += "\t\t\t\t<cc:DeviceColorValues>\n"
                   "\t\t\t\t\t<cc:ColorCMYK ColorSpecification=\"cs1\">\n";
            for (const char *p_ink : {"cc:Cyan", "cc:Magenta", "cc:Yellow", "cc:Black"})
                detail::append_value_line(out, p_ink, coverage(random));
            out += "\t\t\t\t\t</cc:ColorCMYK>\n"
                   "\t\t\t\t</cc:DeviceColorValues>\n"
                   "\t\t\t\t<cc:TagCollection Name=\"Production\">\n"
                   "\t\t\t\t\t<cc:Tag Name=\"Batch\" Value=\"B";
            std::snprintf(number, sizeof number, "%05d", 1 + (i - 1) / 250);
            out += number;
            out += "\"/>\n"
                   "\t\t\t\t\t<cc:Tag Name=\"Substrate\" Value=\"";
            out += substrates[random() % 4];
            out += "\"/>\n"
                   "\t\t\t\t</cc:TagCollection>\n";
        }
        out += "\t\t\t</cc:Object>\n";
        if (out.size() > (1 << 16) - 2048) {
            std::fwrite(out.data(), 1, out.size(), p_file);
            out.clear();
        }
    }
    out += "\t\t</cc:ObjectCollection>\n"
           "\t\t<cc:ColorSpecificationCollection>\n";
    detail::append_color_specification(out, "cs1", "D50", "2_Degree", "Spectrum_Reflectance",
                                       ar_options.start_wavelength);
    if (is_full)
        detail::append_color_specification(out, "cs2", "D65", "10_Degree", "Colorimetric_Reflectance",
                                           ar_options.start_wavelength);
    out += "\t\t</cc:ColorSpecificationCollection>\n"
           "\t</cc:Resources>\n"
           "</cc:CxF>\n";
    bool is_written = std::fwrite(out.data(), 1, out.size(), p_file) == out.size();
    return std::fclose(p_file) == 0 && is_written;
}

// The plain document of a_objects objects from a_seed.
inline bool write_cxf3_document(const std::string &ar_path, int a_objects, unsigned a_seed = 20261123u) {
    cxf3_document_options options;
    options.seed = a_seed;
    return write_cxf3_document(ar_path, a_objects, options);
}

} // namespace tessarine_bench

#endif
