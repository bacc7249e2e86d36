// The enumerations of the bound CxF3 classes, core and branded library alike:
// every text of every enumeration read through a class that carries it,
// numbered from 1 in table order, stored by number, refused in another case,
// and refused on writing when a text outside the table was set as text.
#include <gtest/gtest.h>

#include <cctype>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include <cxf/v3/cxf3-Lumivera_v1.h>
#include <cxf/v3/cxf3.h>

#include "bound_reads.h"

namespace {

using lmx::elmx_error;

const std::string k_cc = std::string("xmlns:cc=\"") + cc::k_namespace_uri + "\"";
const std::string k_lv = std::string("xmlns=\"") + lumivera::k_namespace_uri + "\"";

std::wstring widen(const std::string &ar_text) { return std::wstring(ar_text.begin(), ar_text.end()); }

// The document with its one '@' replaced by the text.
std::string with_text(const std::string &ar_document, const std::string &ar_text) {
    std::string out = ar_document;
    std::string::size_type at = out.find('@');
    if (at != std::string::npos)
        out.replace(at, 1, ar_text);
    return out;
}

std::string in_case(const std::string &ar_text, bool a_upper) {
    std::string out = ar_text;
    for (char &c : out)
        c = static_cast<char>(a_upper ? std::toupper(static_cast<unsigned char>(c))
                                      : std::tolower(static_cast<unsigned char>(c)));
    return out;
}

// ---------------------------------------------------------------- carriers

// An object of a class that holds one enumerated value, seen through that
// value alone: its text, its number, reading and writing the whole object.
class c_carrier {
public:
    virtual ~c_carrier() = default;
    virtual elmx_error read(const std::string &ar_xml) = 0;
    virtual elmx_error write(std::string &ar_out) const = 0;
    virtual std::wstring text() = 0;
    virtual void set_text(const std::wstring &ar_text) = 0;
    virtual int number() = 0;
    virtual bool set_number(int a_number) = 0;
};

typedef std::function<std::unique_ptr<c_carrier>()> t_make_carrier;

// T is the class read and written; Target leads from it to the object of
// class Inner whose accessors hold the value.
template <typename T, typename Target, typename Inner, typename R, typename Enum>
class t_carrier : public c_carrier {
public:
    typedef R (Inner::*t_get)() const;
    typedef elmx_error (Inner::*t_set)(const std::wstring &);
    typedef Enum (Inner::*t_getenum)() const;
    typedef bool (Inner::*t_setenum)(Enum);

    t_carrier(Target a_target, t_get ap_get, t_set ap_set, t_getenum ap_getenum, t_setenum ap_setenum)
        : m_target(a_target), p_get(ap_get), p_set(ap_set), p_getenum(ap_getenum), p_setenum(ap_setenum) {}

    elmx_error read(const std::string &ar_xml) override { return tessarine_test::read(m_object, ar_xml); }
    elmx_error write(std::string &ar_out) const override { return m_object.marshal(ar_out); }
    std::wstring text() override { return (inner().*p_get)(); }
    void set_text(const std::wstring &ar_text) override { (inner().*p_set)(ar_text); }
    int number() override { return static_cast<int>((inner().*p_getenum)()); }
    // A number outside the table is handed over as it is: refusing it is
    // the accessor's business.
    bool set_number(int a_number) override { return (inner().*p_setenum)(static_cast<Enum>(a_number)); }

private:
    Inner &inner() { return m_target(m_object); }

    T m_object;
    Target m_target;
    t_get p_get;
    t_set p_set;
    t_getenum p_getenum;
    t_setenum p_setenum;
};

template <typename T, typename Target, typename Inner, typename R, typename Enum>
t_make_carrier carrier(Target a_target, R (Inner::*ap_get)() const, elmx_error (Inner::*ap_set)(const std::wstring &),
                       Enum (Inner::*ap_getenum)() const, bool (Inner::*ap_setenum)(Enum)) {
    return [=]() -> std::unique_ptr<c_carrier> {
        return std::make_unique<t_carrier<T, Target, Inner, R, Enum>>(a_target, ap_get, ap_set, ap_getenum,
                                                                       ap_setenum);
    };
}

// The value is a member of the class read.
const auto k_self = [](auto &ar_object) -> auto & { return ar_object; };

// The four accessors of an enumerated member.
#define TESSARINE_ENUM_MEMBERS(Class, Member)                                                                         \
    &Class::get_##Member, &Class::set_##Member, &Class::getenum_##Member, &Class::setenum_##Member

// ---------------------------------------------------------------- the table

struct s_enumeration {
    const char *enumeration;
    const char *carried_by;
    std::vector<std::string> texts;
    // The named constants, in table order.
    std::vector<int> numbers;
    // A document of the carrying class, '@' where the text goes.
    std::string document;
    t_make_carrier make;
};

const std::vector<std::string> k_target_types = {"IT8.7/1", "IT8.7/2", "IT8.7/3", "IT8.7/4", "ECI2002", "Other"};
const std::vector<std::string> k_finish_types = {"Coated", "Uncoated", "Matte", "Polished",
                                                 "Glossy", "Satin",    "Other"};
const std::vector<std::string> k_substrate_types = {"Film",    "Leather", "Metal", "Paint", "Paper", "Plastic",
                                                    "Textile", "Tile",    "Vinyl", "Wood",  "Other"};
const std::vector<std::string> k_statuses = {"A",   "E",  "I",   "M",      "T",  "SpectralX", "Spectral", "HiFi",
                                             "Hex", "Txp", "Ex", "DIN", "DIN-NB", "PD", "APD"};
const std::vector<std::string> k_filters = {"Visual", "Cyan", "Magenta", "Yellow", "Black",
                                            "Red",    "Green", "Blue",   "A",      "B"};
const std::vector<std::string> k_illuminants = {"A",   "B",   "C",   "D50", "D55",  "D60",  "D65",  "D75",
                                                "E",   "F2",  "F3",  "F7",  "F9",   "F10",  "F11",  "F12",
                                                "9300", "TL84", "TL83", "UL30", "UL35", "UL50", "Custom"};
const std::vector<std::string> k_observers = {"2_Degree", "10_Degree", "Custom_CMF"};
const std::vector<std::string> k_methods = {"E308_Table5", "E308_Table6", "E308_1nm", "unknown"};
const std::vector<std::string> k_measurement_types = {
    "Spectrum_Reflectance",     "Spectrum_Transmittance",     "Spectrum_TotalTransmittance", "Spectrum_Emissive",
    "Colorimetric_Reflectance", "Colorimetric_Transmittance", "Colorimetric_Emissive",       "Spectrum_Custom"};
const std::vector<std::string> k_luminance_units = {"normalized", "fL", "cd/ft2", "cd/m2"};
const std::vector<std::string> k_emissive_modes = {"EmissiveMode_Diffuser", "EmissiveMode_Reflected",
                                                   "EmissiveMode_Other"};
const std::vector<std::string> k_sphere_geometries = {"Specular_Included", "Specular_Excluded", "Diffuse"};
const std::vector<std::string> k_single_angle_configurations = {"Annular", "Uniplanar"};
const std::vector<std::string> k_device_classes = {"DeviceClass_Spot", "DeviceClass_Scanning", "DeviceClass_Other"};
const std::vector<std::string> k_device_filters = {"Filter_None", "Filter_UVExcluded", "Filter_UVD65",
                                                   "Filter_Partial", "Filter_Custom"};
const std::vector<std::string> k_device_illuminations = {"M0_Incandescent", "M1_Daylight", "M2_UVExcluded",
                                                         "M3_Polarized",    "Flash",       "LED",
                                                         "Ambient",         "Custom"};
const std::vector<std::string> k_directions = {"Profile_Input", "Profile_Output", "Profile_Both"};
const std::vector<std::string> k_library_types = {"Library", "Palette", "Other"};

const std::vector<int> k_target_type_numbers = {cc::Eenum_TargetType_IT8_7_1, cc::Eenum_TargetType_IT8_7_2,
                                                cc::Eenum_TargetType_IT8_7_3, cc::Eenum_TargetType_IT8_7_4,
                                                cc::Eenum_TargetType_ECI2002, cc::Eenum_TargetType_Other};
const std::vector<int> k_finish_type_numbers = {
    cc::Eenum_FinishType_Coated, cc::Eenum_FinishType_Uncoated, cc::Eenum_FinishType_Matte,
    cc::Eenum_FinishType_Polished, cc::Eenum_FinishType_Glossy, cc::Eenum_FinishType_Satin,
    cc::Eenum_FinishType_Other};
const std::vector<int> k_substrate_type_numbers = {
    cc::Eenum_SubstrateType_Film,    cc::Eenum_SubstrateType_Leather, cc::Eenum_SubstrateType_Metal,
    cc::Eenum_SubstrateType_Paint,   cc::Eenum_SubstrateType_Paper,   cc::Eenum_SubstrateType_Plastic,
    cc::Eenum_SubstrateType_Textile, cc::Eenum_SubstrateType_Tile,    cc::Eenum_SubstrateType_Vinyl,
    cc::Eenum_SubstrateType_Wood,    cc::Eenum_SubstrateType_Other};
const std::vector<int> k_status_numbers = {
    cc::Eenum_Status_A,   cc::Eenum_Status_E,   cc::Eenum_Status_I,      cc::Eenum_Status_M,
    cc::Eenum_Status_T,   cc::Eenum_Status_SpectralX, cc::Eenum_Status_Spectral, cc::Eenum_Status_HiFi,
    cc::Eenum_Status_Hex, cc::Eenum_Status_Txp, cc::Eenum_Status_Ex,     cc::Eenum_Status_DIN,
    cc::Eenum_Status_DIN_NB, cc::Eenum_Status_PD, cc::Eenum_Status_APD};
const std::vector<int> k_filter_numbers = {cc::Eenum_Filter_Visual, cc::Eenum_Filter_Cyan,  cc::Eenum_Filter_Magenta,
                                           cc::Eenum_Filter_Yellow, cc::Eenum_Filter_Black, cc::Eenum_Filter_Red,
                                           cc::Eenum_Filter_Green,  cc::Eenum_Filter_Blue,  cc::Eenum_Filter_A,
                                           cc::Eenum_Filter_B};
const std::vector<int> k_illuminant_numbers = {
    cc::Eenum_Illuminant_A,    cc::Eenum_Illuminant_B,    cc::Eenum_Illuminant_C,    cc::Eenum_Illuminant_D50,
    cc::Eenum_Illuminant_D55,  cc::Eenum_Illuminant_D60,  cc::Eenum_Illuminant_D65,  cc::Eenum_Illuminant_D75,
    cc::Eenum_Illuminant_E,    cc::Eenum_Illuminant_F2,   cc::Eenum_Illuminant_F3,   cc::Eenum_Illuminant_F7,
    cc::Eenum_Illuminant_F9,   cc::Eenum_Illuminant_F10,  cc::Eenum_Illuminant_F11,  cc::Eenum_Illuminant_F12,
    cc::Eenum_Illuminant_9300, cc::Eenum_Illuminant_TL84, cc::Eenum_Illuminant_TL83, cc::Eenum_Illuminant_UL30,
    cc::Eenum_Illuminant_UL35, cc::Eenum_Illuminant_UL50, cc::Eenum_Illuminant_Custom};
const std::vector<int> k_observer_numbers = {cc::Eenum_Observer_2_Degree, cc::Eenum_Observer_10_Degree,
                                             cc::Eenum_Observer_Custom_CMF};
const std::vector<int> k_method_numbers = {cc::Eenum_Method_E308_Table5, cc::Eenum_Method_E308_Table6,
                                           cc::Eenum_Method_E308_1nm, cc::Eenum_Method_unknown};
const std::vector<int> k_measurement_type_numbers = {
    cc::Eenum_MeasurementType_Spectrum_Reflectance,       cc::Eenum_MeasurementType_Spectrum_Transmittance,
    cc::Eenum_MeasurementType_Spectrum_TotalTransmittance, cc::Eenum_MeasurementType_Spectrum_Emissive,
    cc::Eenum_MeasurementType_Colorimetric_Reflectance,   cc::Eenum_MeasurementType_Colorimetric_Transmittance,
    cc::Eenum_MeasurementType_Colorimetric_Emissive,      cc::Eenum_MeasurementType_Spectrum_Custom};
const std::vector<int> k_luminance_unit_numbers = {
    cc::Eenum_LuminanceUnitsType_normalized, cc::Eenum_LuminanceUnitsType_fL, cc::Eenum_LuminanceUnitsType_cd_ft2,
    cc::Eenum_LuminanceUnitsType_cd_m2};
const std::vector<int> k_emissive_mode_numbers = {cc::Eenum_EmissiveMode_EmissiveMode_Diffuser,
                                                  cc::Eenum_EmissiveMode_EmissiveMode_Reflected,
                                                  cc::Eenum_EmissiveMode_EmissiveMode_Other};
const std::vector<int> k_sphere_geometry_numbers = {cc::Eenum_SphereGeometry_Specular_Included,
                                                    cc::Eenum_SphereGeometry_Specular_Excluded,
                                                    cc::Eenum_SphereGeometry_Diffuse};
const std::vector<int> k_single_angle_configuration_numbers = {cc::Eenum_SingleAngleConfiguration_Annular,
                                                               cc::Eenum_SingleAngleConfiguration_Uniplanar};
const std::vector<int> k_device_class_numbers = {cc::Eenum_DeviceClass_DeviceClass_Spot,
                                                 cc::Eenum_DeviceClass_DeviceClass_Scanning,
                                                 cc::Eenum_DeviceClass_DeviceClass_Other};
const std::vector<int> k_device_filter_numbers = {
    cc::Eenum_DeviceFilterType_Filter_None, cc::Eenum_DeviceFilterType_Filter_UVExcluded,
    cc::Eenum_DeviceFilterType_Filter_UVD65, cc::Eenum_DeviceFilterType_Filter_Partial,
    cc::Eenum_DeviceFilterType_Filter_Custom};
const std::vector<int> k_device_illumination_numbers = {
    cc::Eenum_DeviceIllumination_M0_Incandescent, cc::Eenum_DeviceIllumination_M1_Daylight,
    cc::Eenum_DeviceIllumination_M2_UVExcluded,   cc::Eenum_DeviceIllumination_M3_Polarized,
    cc::Eenum_DeviceIllumination_Flash,           cc::Eenum_DeviceIllumination_LED,
    cc::Eenum_DeviceIllumination_Ambient,         cc::Eenum_DeviceIllumination_Custom};
const std::vector<int> k_direction_numbers = {cc::Eenum_Direction_Profile_Input, cc::Eenum_Direction_Profile_Output,
                                              cc::Eenum_Direction_Profile_Both};
const std::vector<int> k_library_type_numbers = {::Eenum_LVType_Library, ::Eenum_LVType_Palette,
                                                 ::Eenum_LVType_Other};

// A library of one colour, every required member present.
const std::string k_library = "<LVLibrary " + k_lv +
                              " LVType=\"@\" name=\"Fandeck\" Status=\"1\" Revision=\"2\" GUID=\"g-1\">"
                              "<LVColor ref=\"r1\" Tint=\"100\" Status=\"1\" Revision=\"1\" Code=\"C-1\">"
                              "<MasterStandard name=\"m\">ms</MasterStandard>"
                              "<DependentStandard name=\"d\">ds</DependentStandard>"
                              "<Substrate name=\"s\">paper</Substrate>"
                              "<PrintingCondition name=\"p\" type=\"offset\">pc</PrintingCondition>"
                              "<WorkingStandard name=\"w\">ws</WorkingStandard>"
                              "<Finish name=\"f\">matte</Finish>"
                              "</LVColor></LVLibrary>";

const std::vector<s_enumeration> &enumerations() {
    static const std::vector<s_enumeration> s_rows = {
        {"Eenum_TargetType", "cc:TargetType", k_target_types, k_target_type_numbers,
         "<cc:TargetType " + k_cc + ">@</cc:TargetType>",
         carrier<cc::TargetType>(k_self, TESSARINE_ENUM_MEMBERS(cc::TargetType, value))},
        {"Eenum_FinishType", "cc:FinishType", k_finish_types, k_finish_type_numbers,
         "<cc:FinishType " + k_cc + " OtherType=\"x\">@</cc:FinishType>",
         carrier<cc::FinishType>(k_self, TESSARINE_ENUM_MEMBERS(cc::FinishType, value))},
        {"Eenum_SubstrateType", "cc:SubstrateType", k_substrate_types, k_substrate_type_numbers,
         "<cc:SubstrateType " + k_cc + ">@</cc:SubstrateType>",
         carrier<cc::SubstrateType>(k_self, TESSARINE_ENUM_MEMBERS(cc::SubstrateType, value))},
        {"Eenum_Status", "cc:Status of cc:ColorDensity", k_statuses, k_status_numbers,
         "<cc:ColorDensity " + k_cc +
             " ColorSpecification=\"cs\"><cc:Density>1.25</cc:Density><cc:Status>@</cc:Status>"
             "<cc:Filter>Visual</cc:Filter></cc:ColorDensity>",
         carrier<cc::ColorDensity>(k_self, TESSARINE_ENUM_MEMBERS(cc::ColorDensity, Status))},
        {"Eenum_Filter", "cc:Filter of cc:ColorDensity", k_filters, k_filter_numbers,
         "<cc:ColorDensity " + k_cc +
             " ColorSpecification=\"cs\"><cc:Density>1.25</cc:Density><cc:Status>T</cc:Status>"
             "<cc:Filter>@</cc:Filter><cc:BaseOffset>0</cc:BaseOffset></cc:ColorDensity>",
         carrier<cc::ColorDensity>(k_self, TESSARINE_ENUM_MEMBERS(cc::ColorDensity, Filter))},
        {"Eenum_Illuminant", "cc:Illuminant", k_illuminants, k_illuminant_numbers,
         "<cc:Illuminant " + k_cc + " Name=\"n\">@</cc:Illuminant>",
         carrier<cc::Illuminant>(k_self, TESSARINE_ENUM_MEMBERS(cc::Illuminant, value))},
        {"Eenum_Observer", "cc:Observer", k_observers, k_observer_numbers,
         "<cc:Observer " + k_cc + " Angle=\"2\">@</cc:Observer>",
         carrier<cc::Observer>(k_self, TESSARINE_ENUM_MEMBERS(cc::Observer, value))},
        {"Eenum_Method", "cc:Method of cc:TristimulusSpec", k_methods, k_method_numbers,
         "<cc:TristimulusSpec " + k_cc +
             "><cc:Illuminant>D50</cc:Illuminant><cc:Observer>2_Degree</cc:Observer>"
             "<cc:Method>@</cc:Method></cc:TristimulusSpec>",
         carrier<cc::TristimulusSpec>(k_self, TESSARINE_ENUM_MEMBERS(cc::TristimulusSpec, Method))},
        {"Eenum_Method", "cc:Method", k_methods, k_method_numbers, "<cc:Method " + k_cc + ">@</cc:Method>",
         carrier<cc::Method>(k_self, TESSARINE_ENUM_MEMBERS(cc::Method, value))},
        {"Eenum_MeasurementType", "cc:MeasurementType of cc:MeasurementSpec", k_measurement_types,
         k_measurement_type_numbers,
         "<cc:MeasurementSpec " + k_cc +
             "><cc:MeasurementType>@</cc:MeasurementType>"
             "<cc:GeometryChoice><cc:SphereGeometry>Diffuse</cc:SphereGeometry></cc:GeometryChoice>"
             "</cc:MeasurementSpec>",
         carrier<cc::MeasurementSpec>(k_self, TESSARINE_ENUM_MEMBERS(cc::MeasurementSpec, MeasurementType))},
        {"Eenum_MeasurementType", "cc:MeasurementType", k_measurement_types, k_measurement_type_numbers,
         "<cc:MeasurementType " + k_cc + ">@</cc:MeasurementType>",
         carrier<cc::MeasurementType>(k_self, TESSARINE_ENUM_MEMBERS(cc::MeasurementType, value))},
        {"Eenum_LuminanceUnitsType", "cc:LuminanceUnitsType of cc:MeasurementSpec", k_luminance_units,
         k_luminance_unit_numbers,
         "<cc:MeasurementSpec " + k_cc +
             "><cc:MeasurementType>Spectrum_Emissive</cc:MeasurementType>"
             "<cc:GeometryChoice><cc:EmissiveMode>EmissiveMode_Other</cc:EmissiveMode></cc:GeometryChoice>"
             "<cc:LuminanceUnitsType>@</cc:LuminanceUnitsType></cc:MeasurementSpec>",
         carrier<cc::MeasurementSpec>(k_self, TESSARINE_ENUM_MEMBERS(cc::MeasurementSpec, LuminanceUnitsType))},
        {"Eenum_LuminanceUnitsType", "cc:LuminanceUnitsType", k_luminance_units, k_luminance_unit_numbers,
         "<cc:LuminanceUnitsType " + k_cc + ">@</cc:LuminanceUnitsType>",
         carrier<cc::LuminanceUnitsType>(k_self, TESSARINE_ENUM_MEMBERS(cc::LuminanceUnitsType, value))},
        {"Eenum_EmissiveMode", "cc:EmissiveMode of cc:GeometryChoice", k_emissive_modes, k_emissive_mode_numbers,
         "<cc:GeometryChoice " + k_cc + "><cc:EmissiveMode>@</cc:EmissiveMode></cc:GeometryChoice>",
         carrier<cc::GeometryChoice>(k_self, TESSARINE_ENUM_MEMBERS(cc::GeometryChoice, EmissiveMode))},
        {"Eenum_SphereGeometry", "cc:SphereGeometry of cc:GeometryChoice", k_sphere_geometries,
         k_sphere_geometry_numbers,
         "<cc:GeometryChoice " + k_cc + "><cc:SphereGeometry>@</cc:SphereGeometry></cc:GeometryChoice>",
         carrier<cc::GeometryChoice>(k_self, TESSARINE_ENUM_MEMBERS(cc::GeometryChoice, SphereGeometry))},
        {"Eenum_SingleAngleConfiguration", "cc:SingleAngleConfiguration of cc:SingleAngle",
         k_single_angle_configurations, k_single_angle_configuration_numbers,
         "<cc:GeometryChoice " + k_cc +
             "><cc:SingleAngle><cc:SingleAngleConfiguration>@</cc:SingleAngleConfiguration>"
             "<cc:IlluminationAngle>45</cc:IlluminationAngle><cc:MeasurementAngle>0</cc:MeasurementAngle>"
             "</cc:SingleAngle></cc:GeometryChoice>",
         carrier<cc::GeometryChoice>(
             [](cc::GeometryChoice &ar_choice) -> cc::SingleAngleType & { return ar_choice.get_SingleAngle(); },
             TESSARINE_ENUM_MEMBERS(cc::SingleAngleType, SingleAngleConfiguration))},
        {"Eenum_SingleAngleConfiguration", "cc:SingleAngleConfiguration", k_single_angle_configurations,
         k_single_angle_configuration_numbers, "<cc:SingleAngleConfiguration " + k_cc + ">@</cc:SingleAngleConfiguration>",
         carrier<cc::SingleAngleConfiguration>(k_self, TESSARINE_ENUM_MEMBERS(cc::SingleAngleConfiguration, value))},
        {"Eenum_DeviceClass", "cc:DeviceClass of cc:Device", k_device_classes, k_device_class_numbers,
         "<cc:Device " + k_cc + "><cc:Model>m</cc:Model><cc:DeviceClass>@</cc:DeviceClass></cc:Device>",
         carrier<cc::Device>(k_self, TESSARINE_ENUM_MEMBERS(cc::Device, DeviceClass))},
        {"Eenum_DeviceClass", "cc:DeviceClass", k_device_classes, k_device_class_numbers,
         "<cc:DeviceClass " + k_cc + ">@</cc:DeviceClass>",
         carrier<cc::DeviceClass>(k_self, TESSARINE_ENUM_MEMBERS(cc::DeviceClass, value))},
        {"Eenum_DeviceFilterType", "cc:DeviceFilter", k_device_filters, k_device_filter_numbers,
         "<cc:DeviceFilter " + k_cc + " FilterPosition=\"2\">@</cc:DeviceFilter>",
         carrier<cc::DeviceFilter>(k_self, TESSARINE_ENUM_MEMBERS(cc::DeviceFilterType, value))},
        {"Eenum_DeviceFilterType", "cc:DeviceFilter of cc:Device", k_device_filters, k_device_filter_numbers,
         "<cc:Device " + k_cc + "><cc:DeviceFilter>@</cc:DeviceFilter></cc:Device>",
         carrier<cc::Device>([](cc::Device &ar_device) -> cc::DeviceFilterType & { return ar_device.get_DeviceFilter(); },
                             TESSARINE_ENUM_MEMBERS(cc::DeviceFilterType, value))},
        {"Eenum_DeviceIllumination", "cc:DeviceIllumination", k_device_illuminations, k_device_illumination_numbers,
         "<cc:DeviceIllumination " + k_cc + " CustomType=\"t\">@</cc:DeviceIllumination>",
         carrier<cc::DeviceIllumination>(k_self, TESSARINE_ENUM_MEMBERS(cc::DeviceIllumination, value))},
        {"Eenum_DeviceIllumination", "cc:DeviceIllumination of cc:Device", k_device_illuminations,
         k_device_illumination_numbers,
         "<cc:Device " + k_cc + "><cc:DeviceIllumination>@</cc:DeviceIllumination></cc:Device>",
         carrier<cc::Device>(
             [](cc::Device &ar_device) -> cc::DeviceIllumination & { return ar_device.get_DeviceIllumination(); },
             TESSARINE_ENUM_MEMBERS(cc::DeviceIllumination, value))},
        {"Eenum_Direction", "Direction of cc:Profile", k_directions, k_direction_numbers,
         "<cc:Profile " + k_cc +
             " Id=\"p1\" Direction=\"@\"><cc:ProfileChoice><cc:ProfileURI>file:///p.icc</cc:ProfileURI>"
             "</cc:ProfileChoice></cc:Profile>",
         carrier<cc::Profile>(k_self, TESSARINE_ENUM_MEMBERS(cc::ProfileType, Direction))},
        {"Eenum_LVType", "LVType of LVLibrary", k_library_types, k_library_type_numbers, k_library,
         carrier<c_LVLibrary>(k_self, TESSARINE_ENUM_MEMBERS(c_LVLibrary, LVType))},
    };
    return s_rows;
}

#undef TESSARINE_ENUM_MEMBERS

std::string trace(const s_enumeration &ar_row) { return std::string(ar_row.enumeration) + " in " + ar_row.carried_by; }

// ---------------------------------------------------------------- tests

TEST(BindingEnumerations, TableCoversEveryEnumeration) {
    const char *const names[] = {"Eenum_TargetType",
                                 "Eenum_FinishType",
                                 "Eenum_SubstrateType",
                                 "Eenum_Status",
                                 "Eenum_Filter",
                                 "Eenum_Illuminant",
                                 "Eenum_Observer",
                                 "Eenum_Method",
                                 "Eenum_MeasurementType",
                                 "Eenum_LuminanceUnitsType",
                                 "Eenum_EmissiveMode",
                                 "Eenum_SphereGeometry",
                                 "Eenum_SingleAngleConfiguration",
                                 "Eenum_DeviceClass",
                                 "Eenum_DeviceFilterType",
                                 "Eenum_DeviceIllumination",
                                 "Eenum_Direction",
                                 "Eenum_LVType"};
    for (const char *name : names) {
        bool is_found = false;
        for (const s_enumeration &row : enumerations())
            is_found = is_found || std::string(row.enumeration) == name;
        EXPECT_TRUE(is_found) << name;
    }
}

TEST(BindingEnumerations, NamedConstantsNumberTheTextsFromOne) {
    for (const s_enumeration &row : enumerations()) {
        SCOPED_TRACE(trace(row));
        ASSERT_EQ(row.numbers.size(), row.texts.size());
        for (std::size_t i = 0; i < row.numbers.size(); ++i)
            EXPECT_EQ(row.numbers[i], static_cast<int>(i + 1)) << row.texts[i];
    }
    EXPECT_EQ(cc::Eenum_Status_not_set, 0);
    EXPECT_EQ(cc::Eenum_Illuminant_not_set, 0);
    EXPECT_EQ(cc::Eenum_Direction_not_set, 0);
    EXPECT_EQ(::Eenum_LVType_not_set, 0);
}

TEST(BindingEnumerations, EveryTextReadsAsItsNumber) {
    for (const s_enumeration &row : enumerations()) {
        SCOPED_TRACE(trace(row));
        for (std::size_t i = 0; i < row.texts.size(); ++i) {
            SCOPED_TRACE(row.texts[i]);
            std::unique_ptr<c_carrier> object = row.make();
            ASSERT_EQ(object->read(with_text(row.document, row.texts[i])), lmx::elmx_ok);
            EXPECT_EQ(object->text(), widen(row.texts[i]));
            EXPECT_EQ(object->number(), static_cast<int>(i + 1));
        }
    }
}

TEST(BindingEnumerations, EveryNumberStoresItsTextAndIsWritten) {
    for (const s_enumeration &row : enumerations()) {
        SCOPED_TRACE(trace(row));
        const int count = static_cast<int>(row.texts.size());
        for (int number = 1; number <= count; ++number) {
            const std::string &text = row.texts[static_cast<std::size_t>(number - 1)];
            SCOPED_TRACE(text);
            std::unique_ptr<c_carrier> object = row.make();
            // Start from the text of another row, so that the number is seen to change it.
            ASSERT_EQ(object->read(with_text(row.document, row.texts[static_cast<std::size_t>(count - number)])),
                      lmx::elmx_ok);
            EXPECT_TRUE(object->set_number(number));
            EXPECT_EQ(object->text(), widen(text));
            EXPECT_EQ(object->number(), number);

            std::string written;
            ASSERT_EQ(object->write(written), lmx::elmx_ok);
            EXPECT_TRUE(written.find(">" + text + "<") != std::string::npos ||
                        written.find("=\"" + text + "\"") != std::string::npos)
                << written;
            std::unique_ptr<c_carrier> again = row.make();
            ASSERT_EQ(again->read(written), lmx::elmx_ok);
            EXPECT_EQ(again->number(), number);
        }
    }
}

TEST(BindingEnumerations, TextInAnotherCaseIsNotEnumerated) {
    for (const s_enumeration &row : enumerations()) {
        SCOPED_TRACE(trace(row));
        int tried = 0;
        for (const std::string &text : row.texts) {
            for (bool upper : {false, true}) {
                const std::string other = in_case(text, upper);
                bool is_a_text = false;
                for (const std::string &known : row.texts)
                    is_a_text = is_a_text || known == other;
                if (is_a_text) // "9300", "A": no other case, or the same text
                    continue;
                SCOPED_TRACE(other);
                ++tried;
                std::unique_ptr<c_carrier> object = row.make();
                EXPECT_EQ(object->read(with_text(row.document, other)), lmx::elmx_value_not_enumerated);
            }
        }
        EXPECT_GT(tried, 0);
    }
}

TEST(BindingEnumerations, IlluminantTextInLowerCaseIsNotEnumerated) {
    cc::Illuminant illuminant;
    lmx::s_debug_error debug;
    EXPECT_EQ(tessarine_test::read(illuminant, "<cc:Illuminant " + k_cc + ">d65</cc:Illuminant>", &debug),
              lmx::elmx_value_not_enumerated);
    EXPECT_EQ(tessarine_test::read(illuminant, "<cc:Illuminant " + k_cc + ">D65</cc:Illuminant>"), lmx::elmx_ok);
    EXPECT_EQ(illuminant.getenum_value(), cc::Eenum_Illuminant_D65);
}

TEST(BindingEnumerations, StatusTextInLowerCaseIsNotEnumerated) {
    const std::string open = "<cc:ColorDensity " + k_cc + " ColorSpecification=\"cs\"><cc:Density>1</cc:Density>";
    const std::string close = "<cc:Filter>A</cc:Filter></cc:ColorDensity>";
    cc::ColorDensity density;
    EXPECT_EQ(tessarine_test::read(density, open + "<cc:Status>din-nb</cc:Status>" + close),
              lmx::elmx_value_not_enumerated);
    ASSERT_EQ(tessarine_test::read(density, open + "<cc:Status>DIN-NB</cc:Status>" + close), lmx::elmx_ok);
    EXPECT_EQ(density.getenum_Status(), cc::Eenum_Status_DIN_NB);
    // "A" is a text of both enumerations of the class, each with its own number.
    EXPECT_EQ(density.getenum_Filter(), cc::Eenum_Filter_A);
    EXPECT_TRUE(density.setenum_Status(cc::Eenum_Status_A));
    EXPECT_EQ(density.getenum_Status(), cc::Eenum_Status_A);
}

// Texts that begin with a digit have named constants of their own.
TEST(BindingEnumerations, TextsBeginningWithADigitRead) {
    cc::Illuminant illuminant;
    ASSERT_EQ(tessarine_test::read(illuminant, "<cc:Illuminant " + k_cc + ">9300</cc:Illuminant>"), lmx::elmx_ok);
    EXPECT_EQ(illuminant.getenum_value(), cc::Eenum_Illuminant_9300);
    cc::Observer observer;
    ASSERT_EQ(tessarine_test::read(observer, "<cc:Observer " + k_cc + ">2_Degree</cc:Observer>"), lmx::elmx_ok);
    EXPECT_EQ(observer.getenum_value(), cc::Eenum_Observer_2_Degree);
    ASSERT_EQ(tessarine_test::read(observer, "<cc:Observer " + k_cc + ">10_Degree</cc:Observer>"), lmx::elmx_ok);
    EXPECT_EQ(observer.getenum_value(), cc::Eenum_Observer_10_Degree);
    EXPECT_TRUE(observer.setenum_value(cc::Eenum_Observer_2_Degree));
    EXPECT_EQ(observer.get_value(), L"2_Degree");
}

TEST(BindingEnumerations, UnknownTextHasNumberZero) {
    for (const s_enumeration &row : enumerations()) {
        SCOPED_TRACE(trace(row));
        std::unique_ptr<c_carrier> object = row.make();
        ASSERT_EQ(object->read(with_text(row.document, row.texts[0])), lmx::elmx_ok);
        for (const std::string &unknown : {std::string("d65"), in_case(row.texts.back(), true) + "x", std::string()}) {
            SCOPED_TRACE(unknown);
            object->set_text(widen(unknown));
            EXPECT_EQ(object->text(), widen(unknown));
            EXPECT_EQ(object->number(), 0);
        }
    }
}

TEST(BindingEnumerations, UnknownNumberIsRefusedAndChangesNothing) {
    for (const s_enumeration &row : enumerations()) {
        SCOPED_TRACE(trace(row));
        const int count = static_cast<int>(row.texts.size());
        std::unique_ptr<c_carrier> object = row.make();
        ASSERT_EQ(object->read(with_text(row.document, row.texts.back())), lmx::elmx_ok);
        std::string before;
        ASSERT_EQ(object->write(before), lmx::elmx_ok);
        for (int number : {0, count + 1}) {
            SCOPED_TRACE(number);
            EXPECT_FALSE(object->set_number(number));
            EXPECT_EQ(object->text(), widen(row.texts.back()));
            EXPECT_EQ(object->number(), count);
        }
        std::string after;
        ASSERT_EQ(object->write(after), lmx::elmx_ok);
        EXPECT_EQ(after, before);
    }
}

TEST(BindingEnumerations, TextOutsideTheTableIsNotWritten) {
    for (const s_enumeration &row : enumerations()) {
        SCOPED_TRACE(trace(row));
        for (const std::string &bad : {in_case(row.texts[0], true) + "_", std::string("d65"), std::string("")}) {
            SCOPED_TRACE(bad);
            std::unique_ptr<c_carrier> object = row.make();
            ASSERT_EQ(object->read(with_text(row.document, row.texts[0])), lmx::elmx_ok);
            object->set_text(widen(bad));
            std::string out;
            EXPECT_EQ(object->write(out), lmx::elmx_value_not_enumerated);
        }
    }
}

} // namespace
