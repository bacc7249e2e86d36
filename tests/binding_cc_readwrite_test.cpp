// How every generated class of the core group reads and writes: the root
// element, required attributes, the walk of the content in table order and
// its end check, value checks on reading, enumerations and choices on
// writing, and the event numbers shared across the group.
#include <gtest/gtest.h>

#include <cstring>
#include <string>

#include <cxf/v3/cxf3.h>

#include "bound_reads.h"

namespace {

using lmx::elmx_error;
using tessarine_test::read;

const std::string k_ns = std::string("xmlns:cc=\"") + cc::k_namespace_uri + "\"";
const std::string k_prolog = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n";
const std::string k_xsi_uri = "http://www.w3.org/2001/XMLSchema-instance";

std::string open(const std::string &ar_element, const std::string &ar_attributes = "") {
    return "<cc:" + ar_element + " " + k_ns + (ar_attributes.empty() ? "" : " " + ar_attributes) + ">";
}
std::string close(const std::string &ar_element) { return "</cc:" + ar_element + ">"; }

const std::string k_creation_date = "<cc:CreationDate>2024-01-02T03:04:05Z</cc:CreationDate>";
const std::string k_geometry_choice =
    "<cc:GeometryChoice><cc:SphereGeometry>Diffuse</cc:SphereGeometry></cc:GeometryChoice>";
const std::string k_measurement_type = "<cc:MeasurementType>Spectrum_Reflectance</cc:MeasurementType>";

std::string lab(const std::string &ar_lightness) {
    return open("ColorCIELab", R"(ColorSpecification="cs")") + "<cc:L>" + ar_lightness +
           "</cc:L><cc:A>1</cc:A><cc:B>2</cc:B>" + close("ColorCIELab");
}

// ---------------------------------------------------------------- the root

TEST(BindingCcRoot, EmptyCxFReadsAndWritesBackEmpty) {
    cc::CxF root;
    lmx::s_debug_error debug;
    ASSERT_EQ(read(root, "<cc:CxF " + k_ns + "/>", &debug), lmx::elmx_ok) << debug;
    EXPECT_FALSE(root.isset_FileInformation());
    EXPECT_FALSE(root.isset_Resources());
    EXPECT_FALSE(root.isset_CustomResources());
    std::string out;
    ASSERT_EQ(root.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, k_prolog + "<cc:CxF xmlns:cc=\"" + cc::k_namespace_uri + "\"\n\t\txmlns:xsi=\"" + k_xsi_uri +
                       "\"/>\n");
}

TEST(BindingCcRoot, OtherNamespaceOrNameIsElementNotFound) {
    const tessarine_test::s_read_row rows[] = {
        {"other namespace", "<cc:CxF xmlns:cc=\"urn:other\"/>", lmx::elmx_element_not_found, "cc:CxF"},
        {"no namespace", "<CxF/>", lmx::elmx_element_not_found, "CxF"},
        {"other name", "<cc:CxF3 " + k_ns + "/>", lmx::elmx_element_not_found, "cc:CxF3"},
        {"a child as root", "<cc:Resources " + k_ns + "/>", lmx::elmx_element_not_found, "cc:Resources"},
    };
    tessarine_test::expect_reads<cc::CxF>(rows);
}

// cc:Resources is row 2 of cc:CxF: after it the walk looks no further back,
// and cc:FileInformation is left to the end check.
TEST(BindingCcRoot, ResourcesBeforeFileInformationIsBadEndOfElement) {
    const tessarine_test::s_read_row rows[] = {
        {"resources first", open("CxF") + "<cc:Resources/><cc:FileInformation/>" + close("CxF"),
         lmx::elmx_bad_end_of_element, "cc:CxF"},
    };
    tessarine_test::expect_reads<cc::CxF>(rows);
    cc::CxF root;
    EXPECT_EQ(read(root, open("CxF") + "<cc:FileInformation/><cc:Resources/>" + close("CxF")), lmx::elmx_ok);
}

// ---------------------------------------------------------------- required attributes

TEST(BindingCcColorCIELab, MissingColorSpecificationIsRequiredAttributeMissing) {
    const tessarine_test::s_read_row rows[] = {
        {"no attribute", open("ColorCIELab") + "<cc:L>1</cc:L><cc:A>1</cc:A><cc:B>2</cc:B>" + close("ColorCIELab"),
         lmx::elmx_required_attribute_missing, "ColorCIELab"},
        {"name only",
         open("ColorCIELab", R"(Name="n")") + "<cc:L>1</cc:L><cc:A>1</cc:A><cc:B>2</cc:B>" + close("ColorCIELab"),
         lmx::elmx_required_attribute_missing, "ColorCIELab"},
    };
    tessarine_test::expect_reads<cc::ColorCIELab>(rows);
}

TEST(BindingCcColorCIELab, WithoutColorSpecificationIsNotWritten) {
    cc::ColorCIELab colour;
    colour.set_L(50);
    colour.set_A(1);
    colour.set_B(2);
    EXPECT_FALSE(colour.is_occurs_ok());
    std::string out = "untouched";
    lmx::s_debug_error debug;
    EXPECT_EQ(lmx::marshal(colour, out, &debug), lmx::elmx_marshal_occurs_error);
    EXPECT_EQ(out, "untouched");

    // Inside the colour values of an object, the whole object is refused.
    cc::Object object;
    ASSERT_EQ(read(object, open("Object", R"(ObjectType="Target" Name="o" Id="o1")") + k_creation_date +
                               close("Object")),
              lmx::elmx_ok);
    object.get_ColorValues().append_inner_ColorValues().assign_ColorCIELab(colour);
    EXPECT_EQ(object.marshal(out), lmx::elmx_marshal_occurs_error);
    EXPECT_EQ(out, "untouched");

    colour.set_ColorSpecification(L"cs");
    EXPECT_TRUE(colour.is_occurs_ok());
    EXPECT_EQ(colour.marshal(out), lmx::elmx_ok);
}

// ---------------------------------------------------------------- the walk of the content

TEST(BindingCcObject, SecondCommentIsBadEndOfElement) {
    cc::Object object;
    lmx::s_debug_error debug;
    EXPECT_EQ(read(object,
                   open("Object", R"(ObjectType="Target" Name="o" Id="o1")") + k_creation_date +
                       "<cc:Comment>1</cc:Comment><cc:Comment>2</cc:Comment>" + close("Object"),
                   &debug),
              lmx::elmx_bad_end_of_element);
    EXPECT_EQ(debug.item_name, "cc:Object");
    EXPECT_EQ(object.get_Comment(), L"1");
}

// After a row is read, only the rows after it are looked for: an element of
// an earlier row is not read but left to the end check.
TEST(BindingCcTailMatching, EarlierRowAfterLaterRowIsBadEndOfElement) {
    const std::string measurement_open = open("MeasurementSpec") + k_measurement_type + k_geometry_choice;
    const tessarine_test::s_read_row measurement_rows[] = {
        {"aperture after backing",
         measurement_open + "<cc:Backing>white</cc:Backing><cc:Aperture>8mm</cc:Aperture>" + close("MeasurementSpec"),
         lmx::elmx_bad_end_of_element, "cc:MeasurementSpec"},
        {"type again at the end", measurement_open + k_measurement_type + close("MeasurementSpec"),
         lmx::elmx_bad_end_of_element, "cc:MeasurementSpec"},
    };
    tessarine_test::expect_reads<cc::MeasurementSpec>(measurement_rows);

    const tessarine_test::s_read_row lab_rows[] = {
        {"lightness again after b",
         open("ColorCIELab", R"(ColorSpecification="cs")") + "<cc:L>1</cc:L><cc:A>1</cc:A><cc:B>2</cc:B><cc:L>3</cc:L>" +
             close("ColorCIELab"),
         lmx::elmx_bad_end_of_element, "cc:ColorCIELab"},
    };
    tessarine_test::expect_reads<cc::ColorCIELab>(lab_rows);

    cc::MeasurementSpec measurement;
    EXPECT_EQ(read(measurement, measurement_open + "<cc:Aperture>8mm</cc:Aperture><cc:Backing>white</cc:Backing>" +
                             close("MeasurementSpec")),
              lmx::elmx_ok);
}

// ---------------------------------------------------------------- values

TEST(BindingCcColorCIELab, LightnessValueChecks) {
    const tessarine_test::s_read_row rows[] = {
        {"below zero", lab("-0.5"), lmx::elmx_value_below_minimum, "cc:L"},
        {"not a number", lab("abc"), lmx::elmx_invalid_value_format, "cc:L"},
    };
    tessarine_test::expect_reads<cc::ColorCIELab>(rows);
}

// A setter takes any text; the enumeration is checked when the object is
// written.
TEST(BindingCcEnumerations, BadTextIsTakenBySetterAndRefusedByWriter) {
    cc::ColorDensity density;
    ASSERT_EQ(read(density, open("ColorDensity", R"(ColorSpecification="cs")") +
                                "<cc:Density>1</cc:Density><cc:Status>A</cc:Status><cc:Filter>Visual</cc:Filter>" +
                                close("ColorDensity")),
              lmx::elmx_ok);
    EXPECT_EQ(density.set_Status(L"din-nb"), lmx::elmx_ok);
    EXPECT_EQ(density.get_Status(), L"din-nb");
    EXPECT_EQ(density.getenum_Status(), cc::Eenum_Status_not_set);
    std::string out = "untouched";
    EXPECT_EQ(density.marshal(out), lmx::elmx_value_not_enumerated);
    EXPECT_EQ(out, "untouched");

    // The numbered setter refuses a number that is in no row and keeps the
    // text it had.
    EXPECT_FALSE(density.setenum_Status(static_cast<cc::Eenum_Status>(99)));
    EXPECT_EQ(density.get_Status(), L"din-nb");
    EXPECT_TRUE(density.setenum_Status(cc::Eenum_Status_DIN_NB));
    EXPECT_EQ(density.get_Status(), L"DIN-NB");
    EXPECT_EQ(density.marshal(out), lmx::elmx_ok);

    // The same for a text content and an attribute.
    cc::Illuminant illuminant;
    EXPECT_EQ(illuminant.set_value(L"D51"), lmx::elmx_ok);
    EXPECT_EQ(illuminant.marshal(out), lmx::elmx_value_not_enumerated);
    cc::Profile profile;
    ASSERT_EQ(read(profile, open("Profile", R"(Id="p" Direction="Profile_Input")") +
                                "<cc:ProfileChoice><cc:ProfileURI>u</cc:ProfileURI></cc:ProfileChoice>" +
                                close("Profile")),
              lmx::elmx_ok);
    EXPECT_EQ(profile.set_Direction(L"both"), lmx::elmx_ok);
    EXPECT_EQ(profile.marshal(out), lmx::elmx_value_not_enumerated);
}

// ---------------------------------------------------------------- choices

TEST(BindingCcChoices, UnchosenIlluminantIsBadChoiceOnWriting) {
    cc::TristimulusSpec tristimulus;
    tristimulus.get_anon_Illuminant(); // there, with no alternative chosen
    tristimulus.get_Observer().set_value(L"2_Degree");
    tristimulus.set_Method(L"E308_Table5");
    EXPECT_EQ(tristimulus.get_anon_Illuminant().getchosen(), cc::anon_Illuminant::Echoice_not_set);
    std::string out = "untouched";
    lmx::s_debug_error debug;
    EXPECT_EQ(lmx::marshal(tristimulus, out, &debug), lmx::elmx_bad_choice);
    EXPECT_EQ(debug.error, lmx::elmx_bad_choice);
    EXPECT_EQ(debug.item_name, "{anonymous compositor}");
    EXPECT_EQ(out, "untouched");

    tristimulus.get_anon_Illuminant().select_Illuminant();
    tristimulus.get_anon_Illuminant().get_Illuminant().set_value(L"D50");
    EXPECT_EQ(lmx::marshal(tristimulus, out, &debug), lmx::elmx_ok);
}

// ---------------------------------------------------------------- event numbers

int event_of(const lmx::s_event_map *ap_map, const char *ac_name) {
    for (const lmx::s_event_map *p_row = ap_map; p_row->p_name; ++p_row)
        if (std::strcmp(p_row->p_name, ac_name) == 0)
            return p_row->event;
    return -1;
}

// One number per local name across the group: cc:L is the same event in
// every class that has it.
TEST(BindingCcEvents, LocalNameHasOneEventAcrossTheGroup) {
    const int lab_l = event_of(cc::ColorCIELab::elem_event_map(), "L");
    ASSERT_NE(lab_l, -1);
    EXPECT_EQ(event_of(cc::ColorCIELCh::elem_event_map(), "L"), lab_l);
    EXPECT_EQ(event_of(cc::ColorCIELuv::elem_event_map(), "L"), lab_l);
    EXPECT_NE(event_of(cc::ColorCIELab::elem_event_map(), "A"), lab_l);

    // cc:B of cc:ColorCIELab and of the RGB colours.
    const int lab_b = event_of(cc::ColorCIELab::elem_event_map(), "B");
    ASSERT_NE(lab_b, -1);
    EXPECT_EQ(event_of(cc::ColorSRGB::elem_event_map(), "B"), lab_b);
    EXPECT_EQ(event_of(cc::ColorRGB::elem_event_map(), "B"), lab_b);

    // Attributes and elements share the numbering: the Name attribute of
    // cc:Tag and the cc:Name element of a spot colour.
    const int tag_name = event_of(cc::Tag::attr_event_map(), "Name");
    ASSERT_NE(tag_name, -1);
    EXPECT_EQ(event_of(cc::SpotColorType::elem_event_map(), "Name"), tag_name);
}

} // namespace
