// The value facets of the bound CxF3 classes: every bounded member read at
// its bound, just inside it and just outside it, and the bounds kept again
// when a value set through an accessor is written.
#include <gtest/gtest.h>

#include <functional>
#include <limits>
#include <string>
#include <vector>

#include <cxf/v3/cxf3-Lumivera_v1.h>
#include <cxf/v3/cxf3.h>
#include <cxf/v3/cxf3_colorpage.h>

#include "bound_reads.h"

namespace {

using lmx::elmx_error;

const elmx_error k_ok = lmx::elmx_ok;
const elmx_error k_above = lmx::elmx_value_above_maximum;
const elmx_error k_below = lmx::elmx_value_below_minimum;
const elmx_error k_format = lmx::elmx_invalid_value_format;
const elmx_error k_too_short = lmx::elmx_length_too_short;
const elmx_error k_too_long = lmx::elmx_length_too_long;

const std::string k_cc = std::string("xmlns:cc=\"") + cc::k_namespace_uri + "\"";
const std::string k_cp = std::string("xmlns:cp=\"") + cp::k_namespace_uri + "\"";
const std::string k_lv = std::string("xmlns=\"") + lumivera::k_namespace_uri + "\"";
const std::string k_cs = " ColorSpecification=\"cs\"";

const double k_nan = std::numeric_limits<double>::quiet_NaN();
const double k_inf = std::numeric_limits<double>::infinity();

// The document with its one '@' replaced by the text.
std::string with_text(const std::string &ar_document, const std::string &ar_text) {
    std::string out = ar_document;
    std::string::size_type at = out.find('@');
    if (at != std::string::npos)
        out.replace(at, 1, ar_text);
    return out;
}

typedef std::function<elmx_error(const std::string &)> t_read;

template <typename T> t_read reads() {
    return [](const std::string &ar_xml) {
        T object;
        return tessarine_test::read(object, ar_xml);
    };
}

// ---------------------------------------------------------------- documents

std::string element(const std::string &ar_name, const std::string &ar_text) {
    return "<cc:" + ar_name + ">" + ar_text + "</cc:" + ar_name + ">";
}

std::string lab(const std::string &l, const std::string &a, const std::string &b) {
    return "<cc:ColorCIELab " + k_cc + k_cs + ">" + element("L", l) + element("A", a) + element("B", b) +
           "</cc:ColorCIELab>";
}
std::string lch(const std::string &l, const std::string &c, const std::string &h) {
    return "<cc:ColorCIELCh " + k_cc + k_cs + ">" + element("L", l) + element("C", c) + element("H", h) +
           "</cc:ColorCIELCh>";
}
std::string luv(const std::string &l) {
    return "<cc:ColorCIELuv " + k_cc + k_cs + ">" + element("L", l) + element("U", "-3") + element("V", "4") +
           "</cc:ColorCIELuv>";
}
// cc:ColorCIEXYZ or cc:ColorEmissiveCIEXYZ.
std::string xyz(const std::string &ar_tag, const std::string &x, const std::string &y, const std::string &z) {
    return "<cc:" + ar_tag + " " + k_cc + k_cs + ">" + element("X", x) + element("Y", y) + element("Z", z) +
           "</cc:" + ar_tag + ">";
}
// cc:ColorCIExyY or cc:ColorEmissiveCIExyY.
std::string xyy(const std::string &ar_tag, const std::string &x, const std::string &y, const std::string &big_y) {
    return "<cc:" + ar_tag + " " + k_cc + k_cs + ">" + element("x", x) + element("y", y) + element("Y", big_y) +
           "</cc:" + ar_tag + ">";
}
std::string hsl(const std::string &h, const std::string &s, const std::string &l) {
    return "<cc:ColorHSL " + k_cc + k_cs + ">" + element("Hue", h) + element("Saturation", s) +
           element("Lightness", l) + "</cc:ColorHSL>";
}
// cc:ColorSRGB, cc:ColorAdobeRGB or cc:ColorRGB; an alpha only for Adobe RGB.
std::string rgb(const std::string &ar_tag, const std::string &max, const std::string &r, const std::string &g,
                const std::string &b, const std::string &alpha = "") {
    return "<cc:" + ar_tag + " " + k_cc + k_cs + ">" + element("MaxRange", max) + element("R", r) +
           element("G", g) + element("B", b) + (alpha.empty() ? "" : element("Alpha", alpha)) + "</cc:" + ar_tag +
           ">";
}
std::string spot(const std::string &ar_name, const std::string &ar_percentage) {
    return "<cc:SpotColor>" + element("Name", ar_name) + element("Percentage", ar_percentage) + "</cc:SpotColor>";
}
std::string cmyk(const std::string &c, const std::string &m, const std::string &y, const std::string &k) {
    return "<cc:ColorCMYK " + k_cc + k_cs + ">" + element("Cyan", c) + element("Magenta", m) +
           element("Yellow", y) + element("Black", k) + "</cc:ColorCMYK>";
}
std::string cmyk_plus_n(const std::string &c, const std::string &m, const std::string &y, const std::string &k,
                        const std::string &ar_spot = spot("Orange", "20")) {
    return "<cc:ColorCMYKPlusN " + k_cc + k_cs + ">" + element("Cyan", c) + element("Magenta", m) +
           element("Yellow", y) + element("Black", k) + ar_spot + "</cc:ColorCMYKPlusN>";
}
std::string custom_color(const std::string &ar_spot) {
    return "<cc:ColorCustom " + k_cc + k_cs + " Name=\"inks\">" + ar_spot + "</cc:ColorCustom>";
}
std::string spot_color(const std::string &ar_name, const std::string &ar_percentage) {
    return "<cc:SpotColor " + k_cc + ">" + element("Name", ar_name) + element("Percentage", ar_percentage) +
           "</cc:SpotColor>";
}
std::string hexachrome(const std::string &c, const std::string &m, const std::string &y, const std::string &k,
                       const std::string &o, const std::string &g) {
    return "<cc:ColorPantoneHexachrome " + k_cc + k_cs + ">" + element("Cyan", c) + element("Magenta", m) +
           element("Yellow", y) + element("Black", k) + element("Orange", o) + element("Green", g) +
           "</cc:ColorPantoneHexachrome>";
}
std::string custom_illuminant(const std::string &ar_start, const std::string &ar_increment,
                              const std::string &ar_spd) {
    return "<cc:TristimulusSpec " + k_cc + "><cc:CustomIlluminant WLStart=\"" + ar_start + "\" List_Increment=\"" +
           ar_increment + "\">" + element("SPDList", ar_spd) +
           "</cc:CustomIlluminant><cc:Observer>2_Degree</cc:Observer><cc:Method>E308_1nm</cc:Method>"
           "</cc:TristimulusSpec>";
}
std::string custom_illuminant_alone(const std::string &ar_spd) {
    return "<cc:CustomIlluminant " + k_cc + ">" + element("SPDList", ar_spd) + "</cc:CustomIlluminant>";
}
std::string observer(const std::string &ar_angle, const std::string &ar_age) {
    return "<cc:Observer " + k_cc + " Angle=\"" + ar_angle + "\" Age=\"" + ar_age + "\">10_Degree</cc:Observer>";
}
std::string measurement(const std::string &ar_after_geometry) {
    return "<cc:MeasurementSpec " + k_cc +
           "><cc:MeasurementType>Spectrum_Reflectance</cc:MeasurementType>"
           "<cc:GeometryChoice><cc:SphereGeometry>Diffuse</cc:SphereGeometry></cc:GeometryChoice>" +
           ar_after_geometry + "</cc:MeasurementSpec>";
}
std::string wavelength_range(const std::string &ar_start, const std::string &ar_increment) {
    return measurement("<cc:WavelengthRange StartWL=\"" + ar_start + "\" Increment=\"" + ar_increment + "\"/>");
}
// cc:ReflectanceSpectrum, cc:TransmittanceSpectrum or cc:EmissiveSpectrum.
std::string spectrum(const std::string &ar_tag, const std::string &ar_start, const std::string &ar_date) {
    return "<cc:" + ar_tag + " " + k_cc + k_cs + " StartWL=\"" + ar_start + "\" MeasureDate=\"" + ar_date +
           "\">0.1 0.2 0.3</cc:" + ar_tag + ">";
}
std::string private_spectrum(const std::string &ar_start, const std::string &ar_date, const std::string &ar_data) {
    return "<cc:PrivateSpectrum " + k_cc + k_cs + " KeyID=\"k\" StartWL=\"" + ar_start + "\" MeasureDate=\"" +
           ar_date + "\">" + ar_data + "</cc:PrivateSpectrum>";
}
std::string private_values(const std::string &ar_date, const std::string &ar_data) {
    return "<cc:PrivateColorValues " + k_cc + k_cs + " KeyID=\"k\" MeasureDate=\"" + ar_date + "\">" + ar_data +
           "</cc:PrivateColorValues>";
}
std::string custom_spectrum(const std::string &ar_date) {
    return "<cc:CustomSpectrum " + k_cc + k_cs + " MeasureDate=\"" + ar_date +
           "\"><cc:SpectralPoint WL=\"400\">0.5</cc:SpectralPoint></cc:CustomSpectrum>";
}
std::string profile(const std::string &ar_file, const std::string &ar_created) {
    return "<cc:Profile " + k_cc +
           " Id=\"p1\" Direction=\"Profile_Input\"><cc:ProfileChoice><cc:ProfileFile ProfileName=\"p.icc\">" +
           ar_file + "</cc:ProfileFile></cc:ProfileChoice>" + element("Created", ar_created) + "</cc:Profile>";
}
std::string image(const std::string &ar_data) {
    return "<cc:Image " + k_cc + " ImageFileName=\"swatch.png\">" + ar_data + "</cc:Image>";
}
std::string geometry_unknown(const std::string &ar_text) {
    return "<cc:GeometryChoice " + k_cc + ">" + element("UnknownGeometry", ar_text) + "</cc:GeometryChoice>";
}
std::string parameters(const std::string &ar_name, const std::string &ar_value = element("DoubleValue", "1.5")) {
    return "<cc:Parameters " + k_cc + ">" + element("Name", ar_name) + element("ValueChoice", ar_value) +
           "</cc:Parameters>";
}
std::string integer_value(const std::string &ar_text) { return parameters("k", element("IntegerValue", ar_text)); }
std::string recipe(const std::string &ar_date, const std::string &ar_is_base) {
    return "<cc:ColorRecipe " + k_cc + " Units=\"%\" Name=\"r\">" + element("CreationDate", ar_date) +
           "<cc:Colorant Name=\"white\" isBase=\"" + ar_is_base + "\">" + element("Value", "12.5") +
           "</cc:Colorant></cc:ColorRecipe>";
}
std::string device(const std::string &ar_polarization) {
    return "<cc:Device " + k_cc + ">" + element("DevicePolarization", ar_polarization) + "</cc:Device>";
}
std::string file_information(const std::string &ar_date) {
    return "<cc:FileInformation " + k_cc + ">" + element("CreationDate", ar_date) + "</cc:FileInformation>";
}
std::string object(const std::string &ar_date) {
    return "<cc:Object " + k_cc + " ObjectType=\"Target\" Name=\"o\" Id=\"o1\">" + element("CreationDate", ar_date) +
           "</cc:Object>";
}
std::string color_page(const std::string &ar_pages, const std::string &ar_rows, const std::string &ar_columns,
                       const std::string &ar_body = "") {
    return "<cp:ColorPage " + k_cp + " Name=\"fan\" NumPages=\"" + ar_pages + "\" MaxRows=\"" + ar_rows +
           "\" MaxColumns=\"" + ar_columns + "\">" + ar_body + "</cp:ColorPage>";
}
std::string page(const std::string &ar_rows) {
    return color_page("1", "2", "3", "<cp:Page Name=\"p1\" NumRows=\"" + ar_rows + "\"/>");
}
std::string row(const std::string &ar_columns) {
    return color_page("1", "2", "3",
                      "<cp:Page Name=\"p1\" NumRows=\"1\"><cp:Row Name=\"r1\" NumColumns=\"" + ar_columns +
                          "\"/></cp:Page>");
}
const std::string k_standards = "<MasterStandard name=\"m\">ms</MasterStandard>"
                                "<DependentStandard name=\"d\">ds</DependentStandard>"
                                "<Substrate name=\"s\">paper</Substrate>"
                                "<PrintingCondition name=\"p\" type=\"offset\">pc</PrintingCondition>"
                                "<WorkingStandard name=\"w\">ws</WorkingStandard>"
                                "<Finish name=\"f\">matte</Finish>";
std::string lv_color(const std::string &ar_status, const std::string &ar_revision, const std::string &ar_batch) {
    return "<LVColor " + k_lv + " ref=\"r1\" Tint=\"100\" Status=\"" + ar_status + "\" Revision=\"" + ar_revision +
           "\" Code=\"C-1\" LibraryUpdateBatch=\"" + ar_batch + "\">" + k_standards + "</LVColor>";
}
std::string lv_library(const std::string &ar_status, const std::string &ar_revision) {
    return "<LVLibrary " + k_lv + " LVType=\"Library\" name=\"fan\" Status=\"" + ar_status + "\" Revision=\"" +
           ar_revision + "\" GUID=\"g-1\"><LVColor ref=\"r1\" Tint=\"100\" Status=\"1\" Revision=\"1\" Code=\"C\">" +
           k_standards + "</LVColor></LVLibrary>";
}

// ---------------------------------------------------------------- tables

struct s_value {
    const char *text;
    elmx_error error;
};

struct s_field {
    const char *name;
    // A document with '@' where the value goes, every other value valid.
    std::string document;
    t_read read;
};

struct s_facet {
    const char *facet;
    std::vector<s_field> fields;
    std::vector<s_value> values;
};

const std::vector<s_facet> &facets() {
    static const std::vector<s_facet> s_facets = {
        {"double>=0",
         {
             {"cc:L of cc:ColorCIELab", lab("@", "1", "1"), reads<cc::ColorCIELab>()},
             {"cc:L of cc:ColorCIELCh", lch("@", "1", "1"), reads<cc::ColorCIELCh>()},
             {"cc:C of cc:ColorCIELCh", lch("1", "@", "1"), reads<cc::ColorCIELCh>()},
             {"cc:X of cc:ColorCIEXYZ", xyz("ColorCIEXYZ", "@", "1", "1"), reads<cc::ColorCIEXYZ>()},
             {"cc:Y of cc:ColorCIEXYZ", xyz("ColorCIEXYZ", "1", "@", "1"), reads<cc::ColorCIEXYZ>()},
             {"cc:Z of cc:ColorCIEXYZ", xyz("ColorCIEXYZ", "1", "1", "@"), reads<cc::ColorCIEXYZ>()},
             {"cc:X of cc:ColorEmissiveCIEXYZ", xyz("ColorEmissiveCIEXYZ", "@", "1", "1"),
              reads<cc::ColorEmissiveCIEXYZ>()},
             {"cc:Y of cc:ColorEmissiveCIEXYZ", xyz("ColorEmissiveCIEXYZ", "1", "@", "1"),
              reads<cc::ColorEmissiveCIEXYZ>()},
             {"cc:Z of cc:ColorEmissiveCIEXYZ", xyz("ColorEmissiveCIEXYZ", "1", "1", "@"),
              reads<cc::ColorEmissiveCIEXYZ>()},
             {"cc:Y of cc:ColorCIExyY", xyy("ColorCIExyY", "0.3", "0.3", "@"), reads<cc::ColorCIExyY>()},
             {"cc:Y of cc:ColorEmissiveCIExyY", xyy("ColorEmissiveCIExyY", "0.3", "0.3", "@"),
              reads<cc::ColorEmissiveCIExyY>()},
             {"cc:L of cc:ColorCIELuv", luv("@"), reads<cc::ColorCIELuv>()},
             {"cc:Saturation of cc:ColorHSL", hsl("1", "@", "1"), reads<cc::ColorHSL>()},
             {"cc:Lightness of cc:ColorHSL", hsl("1", "1", "@"), reads<cc::ColorHSL>()},
         },
         {{"0", k_ok},
          {"-0", k_ok},
          {"0.0", k_ok},
          {"1e-9", k_ok},
          {"1E300", k_ok},
          {"INF", k_ok},
          {"-1e-9", k_below},
          {"-1", k_below},
          {"-INF", k_below},
          {"NaN", k_below},
          {"abc", k_format}}},
        {"double>=0<=1",
         {
             {"cc:Alpha of cc:ColorAdobeRGB", rgb("ColorAdobeRGB", "255", "1", "2", "3", "@"),
              reads<cc::ColorAdobeRGB>()},
             {"cc:x of cc:ColorCIExyY", xyy("ColorCIExyY", "@", "0.3", "1"), reads<cc::ColorCIExyY>()},
             {"cc:y of cc:ColorCIExyY", xyy("ColorCIExyY", "0.3", "@", "1"), reads<cc::ColorCIExyY>()},
             {"cc:x of cc:ColorEmissiveCIExyY", xyy("ColorEmissiveCIExyY", "@", "0.3", "1"),
              reads<cc::ColorEmissiveCIExyY>()},
             {"cc:y of cc:ColorEmissiveCIExyY", xyy("ColorEmissiveCIExyY", "0.3", "@", "1"),
              reads<cc::ColorEmissiveCIExyY>()},
         },
         {{"0", k_ok},
          {"1", k_ok},
          {"1.0", k_ok},
          {"1e-9", k_ok},
          {"0.999999999", k_ok},
          {"-1e-9", k_below},
          {"1.000000001", k_above},
          {"2", k_above},
          {"INF", k_above},
          {"-INF", k_below}}},
        {"double>=0<=100",
         {
             {"cc:Cyan of cc:ColorCMYK", cmyk("@", "1", "1", "1"), reads<cc::ColorCMYK>()},
             {"cc:Magenta of cc:ColorCMYK", cmyk("1", "@", "1", "1"), reads<cc::ColorCMYK>()},
             {"cc:Yellow of cc:ColorCMYK", cmyk("1", "1", "@", "1"), reads<cc::ColorCMYK>()},
             {"cc:Black of cc:ColorCMYK", cmyk("1", "1", "1", "@"), reads<cc::ColorCMYK>()},
             {"cc:Cyan of cc:ColorCMYKPlusN", cmyk_plus_n("@", "1", "1", "1"), reads<cc::ColorCMYKPlusN>()},
             {"cc:Magenta of cc:ColorCMYKPlusN", cmyk_plus_n("1", "@", "1", "1"), reads<cc::ColorCMYKPlusN>()},
             {"cc:Yellow of cc:ColorCMYKPlusN", cmyk_plus_n("1", "1", "@", "1"), reads<cc::ColorCMYKPlusN>()},
             {"cc:Black of cc:ColorCMYKPlusN", cmyk_plus_n("1", "1", "1", "@"), reads<cc::ColorCMYKPlusN>()},
             {"cc:Percentage of a cc:SpotColor of cc:ColorCMYKPlusN",
              cmyk_plus_n("1", "1", "1", "1", spot("Orange", "@")), reads<cc::ColorCMYKPlusN>()},
             {"cc:Percentage of a cc:SpotColor of cc:ColorCustom", custom_color(spot("Orange", "@")),
              reads<cc::ColorCustom>()},
             {"cc:Percentage of cc:SpotColor", spot_color("Orange", "@"), reads<cc::SpotColor>()},
             {"cc:Cyan of cc:ColorPantoneHexachrome", hexachrome("@", "1", "1", "1", "1", "1"),
              reads<cc::ColorPantoneHexachrome>()},
             {"cc:Magenta of cc:ColorPantoneHexachrome", hexachrome("1", "@", "1", "1", "1", "1"),
              reads<cc::ColorPantoneHexachrome>()},
             {"cc:Yellow of cc:ColorPantoneHexachrome", hexachrome("1", "1", "@", "1", "1", "1"),
              reads<cc::ColorPantoneHexachrome>()},
             {"cc:Black of cc:ColorPantoneHexachrome", hexachrome("1", "1", "1", "@", "1", "1"),
              reads<cc::ColorPantoneHexachrome>()},
             {"cc:Orange of cc:ColorPantoneHexachrome", hexachrome("1", "1", "1", "1", "@", "1"),
              reads<cc::ColorPantoneHexachrome>()},
             {"cc:Green of cc:ColorPantoneHexachrome", hexachrome("1", "1", "1", "1", "1", "@"),
              reads<cc::ColorPantoneHexachrome>()},
         },
         {{"0", k_ok},
          {"100", k_ok},
          {"1e-9", k_ok},
          {"99.9999999", k_ok},
          {"-1e-9", k_below},
          {"100.0000001", k_above},
          {"101", k_above},
          {"INF", k_above}}},
        {"double>=0<=360",
         {
             {"cc:H of cc:ColorCIELCh", lch("1", "1", "@"), reads<cc::ColorCIELCh>()},
             {"cc:Hue of cc:ColorHSL", hsl("@", "1", "1"), reads<cc::ColorHSL>()},
         },
         {{"0", k_ok},
          {"360", k_ok},
          {"1e-9", k_ok},
          {"359.999999", k_ok},
          {"-1e-9", k_below},
          {"360.000001", k_above},
          {"720", k_above}}},
        {"double>0 (items of a list)",
         {
             {"cc:SPDList of cc:CustomIlluminant", custom_illuminant("380", "10", "@"), reads<cc::TristimulusSpec>()},
             {"cc:SPDList of cc:CustomIlluminant, among other items", custom_illuminant("380", "10", "0.5 @ 1.5"),
              reads<cc::TristimulusSpec>()},
             {"cc:SPDList of cc:CustomIlluminant read alone", custom_illuminant_alone("1 2 @"),
              reads<cc::CustomIlluminant>()},
         },
         {{"1e-300", k_ok},
          {"0.000001", k_ok},
          {"INF", k_ok},
          {"0", k_below},
          {"0.0", k_below},
          {"-0", k_below},
          {"-1e-9", k_below},
          {"NaN", k_below}}},
        {"short",
         {
             {"cc:MaxRange of cc:ColorSRGB", rgb("ColorSRGB", "@", "1", "2", "3"), reads<cc::ColorSRGB>()},
             {"cc:R of cc:ColorSRGB", rgb("ColorSRGB", "255", "@", "2", "3"), reads<cc::ColorSRGB>()},
             {"cc:G of cc:ColorSRGB", rgb("ColorSRGB", "255", "1", "@", "3"), reads<cc::ColorSRGB>()},
             {"cc:B of cc:ColorSRGB", rgb("ColorSRGB", "255", "1", "2", "@"), reads<cc::ColorSRGB>()},
             {"cc:MaxRange of cc:ColorAdobeRGB", rgb("ColorAdobeRGB", "@", "1", "2", "3"), reads<cc::ColorAdobeRGB>()},
             {"cc:R of cc:ColorAdobeRGB", rgb("ColorAdobeRGB", "255", "@", "2", "3"), reads<cc::ColorAdobeRGB>()},
             {"cc:G of cc:ColorAdobeRGB", rgb("ColorAdobeRGB", "255", "1", "@", "3"), reads<cc::ColorAdobeRGB>()},
             {"cc:B of cc:ColorAdobeRGB", rgb("ColorAdobeRGB", "255", "1", "2", "@"), reads<cc::ColorAdobeRGB>()},
             {"cc:MaxRange of cc:ColorRGB", rgb("ColorRGB", "@", "1", "2", "3"), reads<cc::ColorRGB>()},
             {"cc:R of cc:ColorRGB", rgb("ColorRGB", "255", "@", "2", "3"), reads<cc::ColorRGB>()},
             {"cc:G of cc:ColorRGB", rgb("ColorRGB", "255", "1", "@", "3"), reads<cc::ColorRGB>()},
             {"cc:B of cc:ColorRGB", rgb("ColorRGB", "255", "1", "2", "@"), reads<cc::ColorRGB>()},
             {"WLStart of cc:CustomIlluminant", custom_illuminant("@", "10", "1"), reads<cc::TristimulusSpec>()},
             {"List_Increment of cc:CustomIlluminant", custom_illuminant("380", "@", "1"),
              reads<cc::TristimulusSpec>()},
             {"Angle of cc:Observer", observer("@", "30"), reads<cc::Observer>()},
             {"Age of cc:Observer", observer("10", "@"), reads<cc::Observer>()},
             {"Increment of cc:WavelengthRange", wavelength_range("380", "@"), reads<cc::MeasurementSpec>()},
             {"NumPages of cp:ColorPage", color_page("@", "2", "3"), reads<cp::ColorPage>()},
             {"MaxRows of cp:ColorPage", color_page("1", "@", "3"), reads<cp::ColorPage>()},
             {"MaxColumns of cp:ColorPage", color_page("1", "2", "@"), reads<cp::ColorPage>()},
             {"NumRows of cp:Page", page("@"), reads<cp::ColorPage>()},
             {"NumColumns of cp:Row", row("@"), reads<cp::ColorPage>()},
         },
         {{"-32768", k_ok},
          {"32767", k_ok},
          {"-32767", k_ok},
          {"32766", k_ok},
          {"0", k_ok},
          {"-32769", k_below},
          {"32768", k_above},
          {"40000", k_above},
          {"99999999999999999999", k_above},
          {"1.5", k_format},
          {"x", k_format}}},
        {"int",
         {
             {"cc:IntegerValue of cc:Parameters", integer_value("@"), reads<cc::Parameters>()},
             {"cc:IntegerValue of cc:ValueChoice",
              "<cc:ValueChoice " + k_cc + ">" + element("IntegerValue", "@") + "</cc:ValueChoice>",
              reads<cc::ValueChoice>()},
         },
         {{"-2147483648", k_ok},
          {"2147483647", k_ok},
          {"-2147483647", k_ok},
          {"2147483646", k_ok},
          {"-2147483649", k_below},
          {"2147483648", k_above},
          {"99999999999999999999", k_above},
          {"1.5", k_format}}},
        {"ushort>=360<=400",
         {
             {"StartWL of cc:ReflectanceSpectrum", spectrum("ReflectanceSpectrum", "@", "2024-05-06T07:08:09Z"),
              reads<cc::ReflectanceSpectrum>()},
             {"StartWL of cc:TransmittanceSpectrum", spectrum("TransmittanceSpectrum", "@", "2024-05-06T07:08:09Z"),
              reads<cc::TransmittanceSpectrum>()},
             {"StartWL of cc:EmissiveSpectrum", spectrum("EmissiveSpectrum", "@", "2024-05-06T07:08:09Z"),
              reads<cc::EmissiveSpectrum>()},
             {"StartWL of cc:PrivateSpectrum", private_spectrum("@", "2024-05-06T07:08:09Z", "AAEC"),
              reads<cc::PrivateSpectrum>()},
             {"StartWL of cc:WavelengthRange", wavelength_range("@", "10"), reads<cc::MeasurementSpec>()},
         },
         {{"360", k_ok},
          {"400", k_ok},
          {"361", k_ok},
          {"399", k_ok},
          {"359", k_below},
          {"401", k_above},
          {"0", k_below},
          {"-1", k_below},
          {"65536", k_above},
          {"380.5", k_format}}},
        {"string not empty",
         {
             {"cc:UnknownGeometry of cc:GeometryChoice", geometry_unknown("@"), reads<cc::GeometryChoice>()},
             {"cc:Name of a cc:SpotColor of cc:ColorCMYKPlusN", cmyk_plus_n("1", "1", "1", "1", spot("@", "20")),
              reads<cc::ColorCMYKPlusN>()},
             {"cc:Name of a cc:SpotColor of cc:ColorCustom", custom_color(spot("@", "20")), reads<cc::ColorCustom>()},
             {"cc:Name of cc:SpotColor", spot_color("@", "20"), reads<cc::SpotColor>()},
         },
         {{"a", k_ok}, {"Pantone 021 C", k_ok}, {" ", k_ok}, {"", k_too_short}}},
        {"string not empty, at most one character",
         {
             {"cc:Name of cc:Parameters", parameters("@"), reads<cc::Parameters>()},
         },
         // "\xC3\xA9" is one character in two bytes.
         {{"a", k_ok}, {"\xC3\xA9", k_ok}, {"", k_too_short}, {"ab", k_too_long}, {"\xC3\xA9\xC3\xA9", k_too_long}}},
        {"bigint",
         {
             {"Status of LVColor", lv_color("@", "1", "1"), reads<c_LVColor>()},
             {"Revision of LVColor", lv_color("1", "@", "1"), reads<c_LVColor>()},
             {"LibraryUpdateBatch of LVColor", lv_color("1", "1", "@"), reads<c_LVColor>()},
             {"Status of LVLibrary", lv_library("@", "1"), reads<c_LVLibrary>()},
             {"Revision of LVLibrary", lv_library("1", "@"), reads<c_LVLibrary>()},
         },
         {{"0", k_ok},
          {"-1", k_ok},
          {"+7", k_ok},
          {"2147483648", k_ok},
          {"123456789012345678901234567890", k_ok},
          {"-98765432109876543210987654321", k_ok},
          {"abc", k_format},
          {"1.5", k_format},
          {"", k_format}}},
        {"boolean",
         {
             {"isBase of cc:Colorant", recipe("2024-05-06T07:08:09Z", "@"), reads<cc::ColorRecipe>()},
             {"cc:BandpassCorrected of cc:MeasurementSpec", measurement(element("BandpassCorrected", "@")),
              reads<cc::MeasurementSpec>()},
             {"cc:DevicePolarization of cc:Device", device("@"), reads<cc::Device>()},
         },
         {{"true", k_ok},
          {"false", k_ok},
          {"1", k_ok},
          {"0", k_ok},
          {"yes", k_format},
          {"TRUE", k_format},
          {"2", k_format}}},
        {"dateTime",
         {
             {"cc:CreationDate of cc:FileInformation", file_information("@"), reads<cc::FileInformation>()},
             {"cc:CreationDate of cc:Object", object("@"), reads<cc::Object>()},
             {"cc:CreationDate of cc:ColorRecipe", recipe("@", "true"), reads<cc::ColorRecipe>()},
             {"cc:CreationDate", "<cc:CreationDate " + k_cc + ">@</cc:CreationDate>", reads<cc::CreationDate>()},
             {"cc:Created of cc:Profile", profile("AAEC", "@"), reads<cc::Profile>()},
             {"MeasureDate of cc:ReflectanceSpectrum", spectrum("ReflectanceSpectrum", "380", "@"),
              reads<cc::ReflectanceSpectrum>()},
             {"MeasureDate of cc:TransmittanceSpectrum", spectrum("TransmittanceSpectrum", "380", "@"),
              reads<cc::TransmittanceSpectrum>()},
             {"MeasureDate of cc:EmissiveSpectrum", spectrum("EmissiveSpectrum", "380", "@"),
              reads<cc::EmissiveSpectrum>()},
             {"MeasureDate of cc:CustomSpectrum", custom_spectrum("@"), reads<cc::CustomSpectrum>()},
             {"MeasureDate of cc:PrivateSpectrum", private_spectrum("380", "@", "AAEC"), reads<cc::PrivateSpectrum>()},
             {"MeasureDate of cc:PrivateColorValues", private_values("@", "AAEC"), reads<cc::PrivateColorValues>()},
         },
         {{"2024-05-06T07:08:09Z", k_ok},
          {"2024-05-06T07:08:09", k_ok},
          {"2024-05-06T07:08:09.125+02:00", k_ok},
          {"2024-05-06", k_format},
          {"07:08:09", k_format},
          {"yesterday", k_format}}},
        {"base64Binary",
         {
             {"cc:PrivateSpectrum", private_spectrum("380", "2024-05-06T07:08:09Z", "@"), reads<cc::PrivateSpectrum>()},
             {"cc:PrivateColorValues", private_values("2024-05-06T07:08:09Z", "@"), reads<cc::PrivateColorValues>()},
             {"cc:ProfileFile of cc:Profile", profile("@", "2024-05-06T07:08:09Z"), reads<cc::Profile>()},
             {"cc:Image", image("@"), reads<cc::Image>()},
         },
         {{"AAEC", k_ok}, {"AA==", k_ok}, {"AAE=", k_ok}, {"", k_ok}, {"A", k_format}, {"!!!!", k_format}}},
    };
    return s_facets;
}

// ---------------------------------------------------------------- reading

TEST(BindingFacets, EveryBoundedMemberReadsAtItsBounds) {
    for (const s_facet &facet : facets()) {
        SCOPED_TRACE(facet.facet);
        for (const s_field &field : facet.fields) {
            SCOPED_TRACE(field.name);
            for (const s_value &value : facet.values) {
                SCOPED_TRACE(std::string("value \"") + value.text + "\"");
                EXPECT_EQ(field.read(with_text(field.document, value.text)), value.error);
            }
        }
    }
}

// Members without a facet take what their type takes.
TEST(BindingFacets, UnboundedDoublesTakeAnySign) {
    const std::string values[] = {"-1E300", "-0.5", "0", "1000", "-INF"};
    for (const std::string &value : values) {
        SCOPED_TRACE(value);
        cc::ColorCIELab lab_color;
        EXPECT_EQ(tessarine_test::read(lab_color, lab("50", value, value)), k_ok);
        cc::ColorCIELuv luv_color;
        EXPECT_EQ(tessarine_test::read(luv_color, "<cc:ColorCIELuv " + k_cc + k_cs + ">" + element("L", "1") +
                                                      element("U", value) + element("V", value) + "</cc:ColorCIELuv>"),
                  k_ok);
    }
}

TEST(BindingFacets, ValuesAtTheBoundsAreKept) {
    cc::ColorCIELCh color;
    ASSERT_EQ(tessarine_test::read(color, lch("0", "0", "360")), k_ok);
    EXPECT_EQ(color.get_L(), 0.0);
    EXPECT_EQ(color.get_H(), 360.0);
    cc::ColorSRGB srgb;
    ASSERT_EQ(tessarine_test::read(srgb, rgb("ColorSRGB", "32767", "-32768", "0", "1")), k_ok);
    EXPECT_EQ(srgb.get_MaxRange(), 32767);
    EXPECT_EQ(srgb.get_R(), -32768);
    cc::ValueChoice choice;
    ASSERT_EQ(tessarine_test::read(choice, "<cc:ValueChoice " + k_cc + ">" + element("IntegerValue", "-2147483648") +
                                               "</cc:ValueChoice>"),
              k_ok);
    EXPECT_EQ(choice.getchosen(), cc::ValueChoice::EIntegerValue);
    EXPECT_EQ(choice.get_IntegerValue(), std::numeric_limits<int>::min());
    cc::ReflectanceSpectrum reflectance;
    ASSERT_EQ(tessarine_test::read(reflectance, spectrum("ReflectanceSpectrum", "400", "2024-05-06T07:08:09Z")), k_ok);
    EXPECT_EQ(reflectance.get_StartWL(), 400);
    c_LVColor lv;
    ASSERT_EQ(tessarine_test::read(lv, lv_color("123456789012345678901234567890", "-5", "0")), k_ok);
    EXPECT_EQ(lv.get_Status().get_as_string(), "123456789012345678901234567890");
    EXPECT_TRUE(lv.get_Revision() == "-5");
    cc::Parameters parameter;
    ASSERT_EQ(tessarine_test::read(parameter, parameters("\xC3\xA9")), k_ok);
    EXPECT_EQ(parameter.get_Name(), L"\u00e9");
}

TEST(BindingFacets, PageOfFortyThousandRowsIsAboveTheMaximum) {
    cp::ColorPage color_page_object;
    lmx::s_debug_error debug;
    EXPECT_EQ(tessarine_test::read(color_page_object, page("40000"), &debug), k_above);
}

// ---------------------------------------------------------------- writing

struct s_written_value {
    double value;
    elmx_error error;
};

// Writes an object read from a valid document after one member was set
// through its accessor; returns the verdict of the write.
typedef std::function<elmx_error(double, std::string *)> t_write;

template <typename T, typename Set> t_write writes(const std::string &ar_document, Set a_set) {
    return [ar_document, a_set](double a_value, std::string *ap_out) {
        T object;
        elmx_error error = tessarine_test::read(object, ar_document);
        EXPECT_EQ(error, k_ok) << ar_document;
        if (error != k_ok)
            return error;
        a_set(object, a_value);
        return object.marshal(*ap_out);
    };
}

struct s_written_field {
    const char *name;
    t_write write;
    t_read read;
};

struct s_written_facet {
    const char *facet;
    std::vector<s_written_field> fields;
    std::vector<s_written_value> values;
};

#define TESSARINE_SET(Accessor) [](auto &ar_object, double a_value) { ar_object.Accessor(a_value); }

const std::vector<s_written_facet> &written_facets() {
    static const std::vector<s_written_facet> s_facets = {
        {"double>=0",
         {
             {"cc:L of cc:ColorCIELab", writes<cc::ColorCIELab>(lab("1", "1", "1"), TESSARINE_SET(set_L)),
              reads<cc::ColorCIELab>()},
             {"cc:L of cc:ColorCIELCh", writes<cc::ColorCIELCh>(lch("1", "1", "1"), TESSARINE_SET(set_L)),
              reads<cc::ColorCIELCh>()},
             {"cc:C of cc:ColorCIELCh", writes<cc::ColorCIELCh>(lch("1", "1", "1"), TESSARINE_SET(set_C)),
              reads<cc::ColorCIELCh>()},
             {"cc:X of cc:ColorCIEXYZ",
              writes<cc::ColorCIEXYZ>(xyz("ColorCIEXYZ", "1", "1", "1"), TESSARINE_SET(set_X)),
              reads<cc::ColorCIEXYZ>()},
             {"cc:Y of cc:ColorCIEXYZ",
              writes<cc::ColorCIEXYZ>(xyz("ColorCIEXYZ", "1", "1", "1"), TESSARINE_SET(set_Y)),
              reads<cc::ColorCIEXYZ>()},
             {"cc:Z of cc:ColorCIEXYZ",
              writes<cc::ColorCIEXYZ>(xyz("ColorCIEXYZ", "1", "1", "1"), TESSARINE_SET(set_Z)),
              reads<cc::ColorCIEXYZ>()},
             {"cc:X of cc:ColorEmissiveCIEXYZ",
              writes<cc::ColorEmissiveCIEXYZ>(xyz("ColorEmissiveCIEXYZ", "1", "1", "1"), TESSARINE_SET(set_X)),
              reads<cc::ColorEmissiveCIEXYZ>()},
             {"cc:Y of cc:ColorEmissiveCIEXYZ",
              writes<cc::ColorEmissiveCIEXYZ>(xyz("ColorEmissiveCIEXYZ", "1", "1", "1"), TESSARINE_SET(set_Y)),
              reads<cc::ColorEmissiveCIEXYZ>()},
             {"cc:Z of cc:ColorEmissiveCIEXYZ",
              writes<cc::ColorEmissiveCIEXYZ>(xyz("ColorEmissiveCIEXYZ", "1", "1", "1"), TESSARINE_SET(set_Z)),
              reads<cc::ColorEmissiveCIEXYZ>()},
             {"cc:Y of cc:ColorCIExyY",
              writes<cc::ColorCIExyY>(xyy("ColorCIExyY", "0.3", "0.3", "1"), TESSARINE_SET(set_Y)),
              reads<cc::ColorCIExyY>()},
             {"cc:Y of cc:ColorEmissiveCIExyY",
              writes<cc::ColorEmissiveCIExyY>(xyy("ColorEmissiveCIExyY", "0.3", "0.3", "1"), TESSARINE_SET(set_Y)),
              reads<cc::ColorEmissiveCIExyY>()},
             {"cc:L of cc:ColorCIELuv", writes<cc::ColorCIELuv>(luv("1"), TESSARINE_SET(set_L)),
              reads<cc::ColorCIELuv>()},
             {"cc:Saturation of cc:ColorHSL", writes<cc::ColorHSL>(hsl("1", "1", "1"), TESSARINE_SET(set_Saturation)),
              reads<cc::ColorHSL>()},
             {"cc:Lightness of cc:ColorHSL", writes<cc::ColorHSL>(hsl("1", "1", "1"), TESSARINE_SET(set_Lightness)),
              reads<cc::ColorHSL>()},
         },
         {{0.0, k_ok}, {1e-9, k_ok}, {1e300, k_ok}, {-1e-9, k_below}, {-k_inf, k_below}, {k_nan, k_below}}},
        {"double>=0<=1",
         {
             {"cc:Alpha of cc:ColorAdobeRGB",
              writes<cc::ColorAdobeRGB>(rgb("ColorAdobeRGB", "255", "1", "2", "3", "0.5"), TESSARINE_SET(set_Alpha)),
              reads<cc::ColorAdobeRGB>()},
             {"cc:x of cc:ColorCIExyY",
              writes<cc::ColorCIExyY>(xyy("ColorCIExyY", "0.3", "0.3", "1"), TESSARINE_SET(set_x)),
              reads<cc::ColorCIExyY>()},
             {"cc:y of cc:ColorCIExyY",
              writes<cc::ColorCIExyY>(xyy("ColorCIExyY", "0.3", "0.3", "1"), TESSARINE_SET(set_y)),
              reads<cc::ColorCIExyY>()},
             {"cc:x of cc:ColorEmissiveCIExyY",
              writes<cc::ColorEmissiveCIExyY>(xyy("ColorEmissiveCIExyY", "0.3", "0.3", "1"), TESSARINE_SET(set_x)),
              reads<cc::ColorEmissiveCIExyY>()},
             {"cc:y of cc:ColorEmissiveCIExyY",
              writes<cc::ColorEmissiveCIExyY>(xyy("ColorEmissiveCIExyY", "0.3", "0.3", "1"), TESSARINE_SET(set_y)),
              reads<cc::ColorEmissiveCIExyY>()},
         },
         {{0.0, k_ok}, {1.0, k_ok}, {0.999999, k_ok}, {-1e-9, k_below}, {1.000001, k_above}, {k_inf, k_above}}},
        {"double>=0<=100",
         {
             {"cc:Cyan of cc:ColorCMYK", writes<cc::ColorCMYK>(cmyk("1", "1", "1", "1"), TESSARINE_SET(set_Cyan)),
              reads<cc::ColorCMYK>()},
             {"cc:Magenta of cc:ColorCMYK",
              writes<cc::ColorCMYK>(cmyk("1", "1", "1", "1"), TESSARINE_SET(set_Magenta)), reads<cc::ColorCMYK>()},
             {"cc:Yellow of cc:ColorCMYK", writes<cc::ColorCMYK>(cmyk("1", "1", "1", "1"), TESSARINE_SET(set_Yellow)),
              reads<cc::ColorCMYK>()},
             {"cc:Black of cc:ColorCMYK", writes<cc::ColorCMYK>(cmyk("1", "1", "1", "1"), TESSARINE_SET(set_Black)),
              reads<cc::ColorCMYK>()},
             {"cc:Cyan of cc:ColorCMYKPlusN",
              writes<cc::ColorCMYKPlusN>(cmyk_plus_n("1", "1", "1", "1"), TESSARINE_SET(set_Cyan)),
              reads<cc::ColorCMYKPlusN>()},
             {"cc:Magenta of cc:ColorCMYKPlusN",
              writes<cc::ColorCMYKPlusN>(cmyk_plus_n("1", "1", "1", "1"), TESSARINE_SET(set_Magenta)),
              reads<cc::ColorCMYKPlusN>()},
             {"cc:Yellow of cc:ColorCMYKPlusN",
              writes<cc::ColorCMYKPlusN>(cmyk_plus_n("1", "1", "1", "1"), TESSARINE_SET(set_Yellow)),
              reads<cc::ColorCMYKPlusN>()},
             {"cc:Black of cc:ColorCMYKPlusN",
              writes<cc::ColorCMYKPlusN>(cmyk_plus_n("1", "1", "1", "1"), TESSARINE_SET(set_Black)),
              reads<cc::ColorCMYKPlusN>()},
             {"cc:Percentage of a cc:SpotColor of cc:ColorCMYKPlusN",
              writes<cc::ColorCMYKPlusN>(cmyk_plus_n("1", "1", "1", "1"),
                                         [](cc::ColorCMYKPlusN &ar_color, double a_value) {
                                             ar_color.get_SpotColor(0).set_Percentage(a_value);
                                         }),
              reads<cc::ColorCMYKPlusN>()},
             {"cc:Percentage of a cc:SpotColor of cc:ColorCustom",
              writes<cc::ColorCustom>(custom_color(spot("Orange", "20")),
                                      [](cc::ColorCustom &ar_color, double a_value) {
                                          ar_color.get_SpotColor(0).set_Percentage(a_value);
                                      }),
              reads<cc::ColorCustom>()},
             {"cc:Percentage of cc:SpotColor",
              writes<cc::SpotColor>(spot_color("Orange", "20"), TESSARINE_SET(set_Percentage)),
              reads<cc::SpotColor>()},
             {"cc:Cyan of cc:ColorPantoneHexachrome",
              writes<cc::ColorPantoneHexachrome>(hexachrome("1", "1", "1", "1", "1", "1"), TESSARINE_SET(set_Cyan)),
              reads<cc::ColorPantoneHexachrome>()},
             {"cc:Magenta of cc:ColorPantoneHexachrome",
              writes<cc::ColorPantoneHexachrome>(hexachrome("1", "1", "1", "1", "1", "1"),
                                                 TESSARINE_SET(set_Magenta)),
              reads<cc::ColorPantoneHexachrome>()},
             {"cc:Yellow of cc:ColorPantoneHexachrome",
              writes<cc::ColorPantoneHexachrome>(hexachrome("1", "1", "1", "1", "1", "1"), TESSARINE_SET(set_Yellow)),
              reads<cc::ColorPantoneHexachrome>()},
             {"cc:Black of cc:ColorPantoneHexachrome",
              writes<cc::ColorPantoneHexachrome>(hexachrome("1", "1", "1", "1", "1", "1"), TESSARINE_SET(set_Black)),
              reads<cc::ColorPantoneHexachrome>()},
             {"cc:Orange of cc:ColorPantoneHexachrome",
              writes<cc::ColorPantoneHexachrome>(hexachrome("1", "1", "1", "1", "1", "1"), TESSARINE_SET(set_Orange)),
              reads<cc::ColorPantoneHexachrome>()},
             {"cc:Green of cc:ColorPantoneHexachrome",
              writes<cc::ColorPantoneHexachrome>(hexachrome("1", "1", "1", "1", "1", "1"), TESSARINE_SET(set_Green)),
              reads<cc::ColorPantoneHexachrome>()},
         },
         {{0.0, k_ok}, {100.0, k_ok}, {99.99999, k_ok}, {-1e-9, k_below}, {100.00001, k_above}, {k_inf, k_above}}},
        {"double>=0<=360",
         {
             {"cc:H of cc:ColorCIELCh", writes<cc::ColorCIELCh>(lch("1", "1", "1"), TESSARINE_SET(set_H)),
              reads<cc::ColorCIELCh>()},
             {"cc:Hue of cc:ColorHSL", writes<cc::ColorHSL>(hsl("1", "1", "1"), TESSARINE_SET(set_Hue)),
              reads<cc::ColorHSL>()},
         },
         {{0.0, k_ok}, {360.0, k_ok}, {359.9999, k_ok}, {-1e-9, k_below}, {360.0001, k_above}}},
        {"double>0 (items of a list)",
         {
             {"cc:SPDList of cc:CustomIlluminant",
              writes<cc::CustomIlluminant>(custom_illuminant_alone("1 2 3"),
                                           [](cc::CustomIlluminant &ar_illuminant, double a_value) {
                                               ar_illuminant.set_SPDList(1, a_value);
                                           }),
              reads<cc::CustomIlluminant>()},
             {"cc:SPDList of cc:CustomIlluminant, an item appended",
              writes<cc::CustomIlluminant>(custom_illuminant_alone("1 2 3"),
                                           [](cc::CustomIlluminant &ar_illuminant, double a_value) {
                                               ar_illuminant.append_SPDList(a_value);
                                           }),
              reads<cc::CustomIlluminant>()},
         },
         {{1e-300, k_ok}, {0.5, k_ok}, {0.0, k_below}, {-0.0, k_below}, {-1.0, k_below}, {k_nan, k_below}}},
    };
    return s_facets;
}

#undef TESSARINE_SET

TEST(BindingFacets, EveryBoundedDoubleIsCheckedOnWriting) {
    for (const s_written_facet &facet : written_facets()) {
        SCOPED_TRACE(facet.facet);
        for (const s_written_field &field : facet.fields) {
            SCOPED_TRACE(field.name);
            for (const s_written_value &value : facet.values) {
                SCOPED_TRACE(testing::Message() << "value " << value.value);
                std::string out;
                EXPECT_EQ(field.write(value.value, &out), value.error);
                if (value.error == k_ok) {
                    EXPECT_EQ(field.read(out), k_ok) << out;
                }
            }
        }
    }
}

TEST(BindingFacets, StartWavelengthIsCheckedOnWriting) {
    const std::string document = spectrum("ReflectanceSpectrum", "380", "2024-05-06T07:08:09Z");
    const s_written_value values[] = {{360, k_ok}, {400, k_ok}, {359, k_below}, {401, k_above}, {0, k_below}};
    for (const s_written_value &value : values) {
        SCOPED_TRACE(value.value);
        const unsigned short wavelength = static_cast<unsigned short>(value.value);
        cc::ReflectanceSpectrum reflectance;
        ASSERT_EQ(tessarine_test::read(reflectance, document), k_ok);
        reflectance.set_StartWL(wavelength);
        std::string out;
        EXPECT_EQ(reflectance.marshal(out), value.error);

        cc::WavelengthRange range;
        range.set_StartWL(wavelength);
        range.set_Increment(10);
        EXPECT_EQ(range.marshal(out), value.error);
    }
}

TEST(BindingFacets, EmptyTextOfANonEmptyStringIsNotWritten) {
    cc::SpotColor spot_object;
    ASSERT_EQ(tessarine_test::read(spot_object, spot_color("Orange", "20")), k_ok);
    spot_object.set_Name(L"");
    std::string out;
    EXPECT_EQ(spot_object.marshal(out), k_too_short);

    cc::GeometryChoice geometry;
    geometry.set_UnknownGeometry(L"");
    EXPECT_EQ(geometry.marshal(out), k_too_short);
    geometry.set_UnknownGeometry(L"45/0 by hand");
    EXPECT_EQ(geometry.marshal(out), k_ok);
}

TEST(BindingFacets, ParameterNameLengthIsCheckedOnWriting) {
    cc::Parameters parameter;
    ASSERT_EQ(tessarine_test::read(parameter, parameters("k")), k_ok);
    std::string out;
    parameter.set_Name(L"ab");
    EXPECT_EQ(parameter.marshal(out), k_too_long);
    parameter.set_Name(L"");
    EXPECT_EQ(parameter.marshal(out), k_too_short);
    parameter.set_Name(L"\u00e9");
    EXPECT_EQ(parameter.marshal(out), k_ok);
}

} // namespace
