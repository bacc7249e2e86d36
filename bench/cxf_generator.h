// Writes large, realistic CxF3 documents for the benchmarks: objects with a
// 36-point reflectance spectrum and a CIELab value, from a fixed seed so that
// every run measures the same bytes.
#ifndef TESSARINE_BENCH_CXF_GENERATOR_H
#define TESSARINE_BENCH_CXF_GENERATOR_H

#include <cstdio>
#include <random>
#include <string>

namespace tessarine_bench {

// Writes a document of a_objects objects to ar_path; false if it cannot.
inline bool write_cxf3_document(const std::string &ar_path, int a_objects, unsigned a_seed = 20261123u) {
    std::FILE *p_file = std::fopen(ar_path.c_str(), "wb");
    if (!p_file)
        return false;
    std::mt19937 random(a_seed);
    std::uniform_real_distribution<double> reflectance(0.02, 0.95);
    std::uniform_real_distribution<double> lightness(5.0, 98.0);
    std::uniform_real_distribution<double> chroma(-80.0, 80.0);
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
    char number[32];
    for (int i = 1; i <= a_objects; ++i) {
        out += "\t\t\t<cc:Object ObjectType=\"Standard\" Name=\"Colour ";
        out += std::to_string(i);
        out += "\" Id=\"o";
        out += std::to_string(i);
        out += "\">\n\t\t\t\t<cc:CreationDate>2026-11-23T12:00:00</cc:CreationDate>\n"
               "\t\t\t\t<cc:ColorValues>\n"
               "\t\t\t\t\t<cc:ReflectanceSpectrum ColorSpecification=\"cs1\" StartWL=\"380\">";
        for (int w = 0; w < 36; ++w) {
            std::snprintf(number, sizeof number, w ? " %.4f" : "%.4f", reflectance(random));
            out += number;
        }
        out += "</cc:ReflectanceSpectrum>\n"
               "\t\t\t\t\t<cc:ColorCIELab ColorSpecification=\"cs1\">\n";
        std::snprintf(number, sizeof number, "%.2f", lightness(random));
        out += "\t\t\t\t\t\t<cc:L>";
        out += number;
        std::snprintf(number, sizeof number, "%.2f", chroma(random));
        out += "</cc:L>\n\t\t\t\t\t\t<cc:A>";
        out += number;
        std::snprintf(number, sizeof number, "%.2f", chroma(random));
        out += "</cc:A>\n\t\t\t\t\t\t<cc:B>";
        out += number;
        out += "</cc:B>\n\t\t\t\t\t</cc:ColorCIELab>\n\t\t\t\t</cc:ColorValues>\n\t\t\t</cc:Object>\n";
        if (out.size() > (1 << 16) - 2048) {
            std::fwrite(out.data(), 1, out.size(), p_file);
            out.clear();
        }
    }
    out += "\t\t</cc:ObjectCollection>\n"
           "\t\t<cc:ColorSpecificationCollection>\n"
           "\t\t\t<cc:ColorSpecification Id=\"cs1\">\n"
           "\t\t\t\t<cc:TristimulusSpec>\n"
           "\t\t\t\t\t<cc:Illuminant>D50</cc:Illuminant>\n"
           "\t\t\t\t\t<cc:Observer>2_Degree</cc:Observer>\n"
           "\t\t\t\t\t<cc:Method>E308_Table5</cc:Method>\n"
           "\t\t\t\t</cc:TristimulusSpec>\n"
           "\t\t\t\t<cc:MeasurementSpec>\n"
           "\t\t\t\t\t<cc:MeasurementType>Spectrum_Reflectance</cc:MeasurementType>\n"
           "\t\t\t\t\t<cc:GeometryChoice>\n"
           "\t\t\t\t\t\t<cc:SingleAngle>\n"
           "\t\t\t\t\t\t\t<cc:SingleAngleConfiguration>Annular</cc:SingleAngleConfiguration>\n"
           "\t\t\t\t\t\t\t<cc:IlluminationAngle>45</cc:IlluminationAngle>\n"
           "\t\t\t\t\t\t\t<cc:MeasurementAngle>0</cc:MeasurementAngle>\n"
           "\t\t\t\t\t\t</cc:SingleAngle>\n"
           "\t\t\t\t\t</cc:GeometryChoice>\n"
           "\t\t\t\t\t<cc:WavelengthRange StartWL=\"380\" Increment=\"10\"/>\n"
           "\t\t\t\t</cc:MeasurementSpec>\n"
           "\t\t\t</cc:ColorSpecification>\n"
           "\t\t</cc:ColorSpecificationCollection>\n"
           "\t</cc:Resources>\n"
           "</cc:CxF>\n";
    bool is_written = std::fwrite(out.data(), 1, out.size(), p_file) == out.size();
    return std::fclose(p_file) == 0 && is_written;
}

} // namespace tessarine_bench

#endif
