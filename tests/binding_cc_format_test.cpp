// What the core CxF3 format asks of the generated classes, area by area:
// objects and their physical attributes, colour values, the measurement
// conditions, custom resources and profiles. Each test reads (or builds
// and writes) one case and asserts the exact verdict.
#include <gtest/gtest.h>

#include <string>

#include <cxf/v3/cxf3.h>

#include "bound_reads.h"

namespace {

using lmx::elmx_error;
using tessarine_test::read;

const std::string k_ns = std::string("xmlns:cc=\"") + cc::k_namespace_uri + "\"";
const std::string k_prolog = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n";
const std::string k_xsi_uri = "http://www.w3.org/2001/XMLSchema-instance";

// The opening tag of a document whose root is ac_element, with ar_attributes.
std::string open(const std::string &ar_element, const std::string &ar_attributes = "") {
    return "<cc:" + ar_element + " " + k_ns + (ar_attributes.empty() ? "" : " " + ar_attributes) + ">";
}
std::string close(const std::string &ar_element) { return "</cc:" + ar_element + ">"; }

// What the writer makes of an element without attributes or content.
std::string written_empty(const std::string &ar_element) {
    return k_prolog + "<cc:" + ar_element + " xmlns:cc=\"" + cc::k_namespace_uri + "\"\n\t\txmlns:xsi=\"" + k_xsi_uri +
           "\"/>\n";
}

const std::string k_creation_date = "<cc:CreationDate>2024-01-02T03:04:05Z</cc:CreationDate>";
const std::string k_object_attributes = R"(ObjectType="Target" Name="o" Id="o1")";
const std::string k_lab_body = "<cc:L>50</cc:L><cc:A>1</cc:A><cc:B>2</cc:B>";
const std::string k_lab = R"(<cc:ColorCIELab ColorSpecification="cs">)" + k_lab_body + "</cc:ColorCIELab>";
const std::string k_spot_color = "<cc:SpotColor><cc:Name>Gold</cc:Name><cc:Percentage>40</cc:Percentage></cc:SpotColor>";
const std::string k_geometry_choice =
    "<cc:GeometryChoice><cc:SphereGeometry>Diffuse</cc:SphereGeometry></cc:GeometryChoice>";
const std::string k_measurement_type = "<cc:MeasurementType>Spectrum_Reflectance</cc:MeasurementType>";
const std::string k_measurement = "<cc:MeasurementSpec>" + k_measurement_type + k_geometry_choice +
                                       "</cc:MeasurementSpec>";
const std::string k_tristimulus = "<cc:TristimulusSpec><cc:Illuminant>D50</cc:Illuminant>"
                                       "<cc:Observer>2_Degree</cc:Observer><cc:Method>E308_Table5</cc:Method>"
                                       "</cc:TristimulusSpec>";
const std::string k_brdf_angle = R"(<cc:BRDFAngle Notation="n"><cc:IlluminationAngle>45</cc:IlluminationAngle>)"
                                 "<cc:Aspecular>15</cc:Aspecular></cc:BRDFAngle>";
const std::string k_profile_choice =
    "<cc:ProfileChoice><cc:ProfileURI>http://example.com/p.icc</cc:ProfileURI></cc:ProfileChoice>";
const std::string k_value_choice = "<cc:ValueChoice><cc:DoubleValue>1.5</cc:DoubleValue></cc:ValueChoice>";

// ---------------------------------------------------------------- objects

// cc:Gloss, cc:Opacity, cc:CustomAttributeString, cc:CustomAttributeValue and
// cc:Image are the repeated rows of cc:PhysicalAttributes.
TEST(BindingCcPhysicalAttributes, RepeatedChildrenReadAnyNumberInTableOrder) {
    const std::string text = open("PhysicalAttributes") +
                             R"(<cc:Gloss Method="60deg">10</cc:Gloss><cc:Gloss>20</cc:Gloss><cc:Gloss>30</cc:Gloss>)"
                             "<cc:Opacity>0.5</cc:Opacity><cc:Opacity>0.75</cc:Opacity>"
                             R"(<cc:CustomAttributeString Label="s1">a</cc:CustomAttributeString>)"
                             R"(<cc:CustomAttributeString Label="s2">b</cc:CustomAttributeString>)"
                             R"(<cc:CustomAttributeValue Label="v1">1</cc:CustomAttributeValue>)"
                             R"(<cc:CustomAttributeValue Label="v2">2</cc:CustomAttributeValue>)"
                             R"(<cc:CustomAttributeValue Label="v3">3</cc:CustomAttributeValue>)"
                             R"(<cc:Image ImageFileName="a.png">AAEC</cc:Image>)"
                             R"(<cc:Image ImageFileName="b.png">AAEC</cc:Image>)" +
                             close("PhysicalAttributes");
    cc::PhysicalAttributes attributes;
    lmx::s_debug_error debug;
    ASSERT_EQ(read(attributes, text, &debug), lmx::elmx_ok) << debug;
    ASSERT_EQ(attributes.size_Gloss(), 3u);
    EXPECT_EQ(attributes.get_Gloss(0).get_Method(), L"60deg");
    EXPECT_EQ(attributes.get_Gloss(2).get_value(), 30.0);
    ASSERT_EQ(attributes.size_Opacity(), 2u);
    EXPECT_EQ(attributes.get_Opacity(1).get_value(), 0.75);
    ASSERT_EQ(attributes.size_CustomAttributeString(), 2u);
    EXPECT_EQ(attributes.get_CustomAttributeString(1).get_Label(), L"s2");
    ASSERT_EQ(attributes.size_CustomAttributeValue(), 3u);
    EXPECT_EQ(attributes.get_CustomAttributeValue(2).get_value(), 3.0);
    ASSERT_EQ(attributes.size_Image(), 2u);
    EXPECT_EQ(attributes.get_Image(1).get_ImageFileName(), L"b.png");

    // Written back in the same order and number.
    std::string out;
    ASSERT_EQ(attributes.marshal(out), lmx::elmx_ok);
    cc::PhysicalAttributes again;
    ASSERT_EQ(read(again, out), lmx::elmx_ok);
    EXPECT_EQ(again.size_Gloss(), 3u);
    EXPECT_EQ(again.size_Opacity(), 2u);
    EXPECT_EQ(again.size_CustomAttributeString(), 2u);
    EXPECT_EQ(again.size_CustomAttributeValue(), 3u);
    EXPECT_EQ(again.size_Image(), 2u);
    EXPECT_EQ(again.get_CustomAttributeValue(0).get_Label(), L"v1");
}

TEST(BindingCcPhysicalAttributes, RepeatedChildOutOfTableOrderIsBadEndOfElement) {
    const tessarine_test::s_read_row rows[] = {
        {"opacity before gloss",
         open("PhysicalAttributes") + "<cc:Opacity>1</cc:Opacity><cc:Gloss>2</cc:Gloss>" + close("PhysicalAttributes"),
         lmx::elmx_bad_end_of_element, "cc:PhysicalAttributes"},
        {"image before custom value",
         open("PhysicalAttributes") + R"(<cc:Image ImageFileName="a.png">AAEC</cc:Image>)" +
             R"(<cc:CustomAttributeValue Label="v">1</cc:CustomAttributeValue>)" + close("PhysicalAttributes"),
         lmx::elmx_bad_end_of_element, "cc:PhysicalAttributes"},
    };
    tessarine_test::expect_reads<cc::PhysicalAttributes>(rows);
}

TEST(BindingCcPhysicalAttributes, EmptyElementIsValid) {
    cc::PhysicalAttributes attributes;
    EXPECT_EQ(read(attributes, "<cc:PhysicalAttributes " + k_ns + "/>"), lmx::elmx_ok);
    EXPECT_EQ(read(attributes, open("PhysicalAttributes") + close("PhysicalAttributes")), lmx::elmx_ok);
    EXPECT_TRUE(attributes.is_occurs_ok());
    EXPECT_EQ(attributes.size_Gloss(), 0u);
    std::string out;
    ASSERT_EQ(attributes.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, written_empty("PhysicalAttributes"));
}

TEST(BindingCcPhysicalAttributes, HeightWithoutUnitsIsRequiredAttributeMissing) {
    const tessarine_test::s_read_row rows[] = {
        {"in physical attributes",
         open("PhysicalAttributes") + "<cc:Height>1</cc:Height>" + close("PhysicalAttributes"),
         lmx::elmx_required_attribute_missing, "Height"},
    };
    tessarine_test::expect_reads<cc::PhysicalAttributes>(rows);
    cc::Height height;
    EXPECT_EQ(read(height, open("Height") + "1" + close("Height")), lmx::elmx_required_attribute_missing);
    EXPECT_EQ(read(height, open("Height", R"(Units="mm")") + "1" + close("Height")), lmx::elmx_ok);
}

TEST(BindingCcObject, MissingCreationDateIsMandatoryElementMissing) {
    cc::Object object;
    lmx::s_debug_error debug;
    EXPECT_EQ(read(object, open("Object", k_object_attributes) + "<cc:Comment>c</cc:Comment>" + close("Object"), &debug),
              lmx::elmx_mandatory_element_missing);
    EXPECT_EQ(debug.item_name, "cc:CreationDate");
    EXPECT_EQ(read(object, open("Object", k_object_attributes) + k_creation_date + "<cc:Comment>c</cc:Comment>" +
                               close("Object")),
              lmx::elmx_ok);
}

TEST(BindingCcObject, WithoutCreationDateIsNotWritten) {
    cc::Object object;
    object.set_ObjectType(L"Target");
    object.set_Name(L"o");
    object.set_Id(L"o1");
    object.set_Comment(L"c");
    EXPECT_FALSE(object.is_occurs_ok());
    std::string out = "untouched";
    EXPECT_EQ(object.marshal(out), lmx::elmx_marshal_occurs_error);
    EXPECT_EQ(out, "untouched");

    // With its date read in, the same object is written.
    cc::Object dated;
    ASSERT_EQ(read(dated, open("Object", k_object_attributes) + k_creation_date + close("Object")), lmx::elmx_ok);
    object.set_CreationDate(dated.get_CreationDate());
    EXPECT_TRUE(object.is_occurs_ok());
    EXPECT_EQ(object.marshal(out), lmx::elmx_ok);
}

TEST(BindingCcTagCollection, MissingNameIsRequiredAttributeMissing) {
    const tessarine_test::s_read_row rows[] = {
        {"empty", "<cc:TagCollection " + k_ns + "/>", lmx::elmx_required_attribute_missing, "TagCollection"},
        {"with a tag", open("TagCollection") + R"(<cc:Tag Name="n" Value="v"/>)" + close("TagCollection"),
         lmx::elmx_required_attribute_missing, "TagCollection"},
    };
    tessarine_test::expect_reads<cc::TagCollection>(rows);
}

TEST(BindingCcTagCollection, EmptyWithNameIsValid) {
    cc::TagCollection tags;
    EXPECT_EQ(read(tags, "<cc:TagCollection " + k_ns + " Name=\"tc\"/>"), lmx::elmx_ok);
    EXPECT_EQ(read(tags, open("TagCollection", R"(Name="tc")") + close("TagCollection")), lmx::elmx_ok);
    EXPECT_EQ(tags.get_Name(), L"tc");
    EXPECT_EQ(tags.size_Tag(), 0u);
    EXPECT_TRUE(tags.is_occurs_ok());
}

// ---------------------------------------------------------------- colour values

TEST(BindingCcColorValues, ContentWithoutColourValueIsMandatoryElementMissing) {
    const tessarine_test::s_read_row rows[] = {
        {"a comment", open("ColorValues") + "<cc:Comment>c</cc:Comment>" + close("ColorValues"),
         lmx::elmx_mandatory_element_missing, "inner_ColorValues"},
        {"a device colour",
         open("ColorValues") + R"(<cc:ColorHTML HTML="#FFCC00" ColorSpecification="cs"/>)" + close("ColorValues"),
         lmx::elmx_mandatory_element_missing, "inner_ColorValues"},
    };
    tessarine_test::expect_reads<cc::ColorValues>(rows);
}

// The reading driver refuses an empty element whose content is required
// before the class looks at it.
TEST(BindingCcColorValues, EmptyElementIsUnexpectedEmptyElement) {
    const tessarine_test::s_read_row rows[] = {
        {"closed start tag", "<cc:ColorValues " + k_ns + "/>", lmx::elmx_unexpected_empty_element, "cc:ColorValues"},
        {"end tag", open("ColorValues") + close("ColorValues"), lmx::elmx_unexpected_empty_element,
         "cc:ColorValues"},
    };
    tessarine_test::expect_reads<cc::ColorValues>(rows);
}

// The three value holders of an object stay writable with no item.
TEST(BindingCcColorValues, EmptyHoldersWriteAnEmptyElement) {
    std::string out;
    cc::ColorValues values;
    EXPECT_TRUE(values.is_occurs_ok());
    ASSERT_EQ(values.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, written_empty("ColorValues"));

    cc::ColorDifferenceValues differences;
    EXPECT_TRUE(differences.is_occurs_ok());
    ASSERT_EQ(differences.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, written_empty("ColorDifferenceValues"));

    cc::DeviceColorValues device;
    EXPECT_TRUE(device.is_occurs_ok());
    ASSERT_EQ(device.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, written_empty("DeviceColorValues"));

    // Inside an object as well.
    cc::Object object;
    ASSERT_EQ(read(object, open("Object", k_object_attributes) + k_creation_date + close("Object")), lmx::elmx_ok);
    object.get_ColorValues();
    object.get_ColorDifferenceValues();
    object.get_DeviceColorValues();
    EXPECT_TRUE(object.is_occurs_ok());
    ASSERT_EQ(object.marshal(out), lmx::elmx_ok);
    EXPECT_NE(out.find("\t<cc:ColorValues/>\n\t<cc:ColorDifferenceValues/>\n\t<cc:DeviceColorValues/>\n"),
              std::string::npos)
        << out;
}

TEST(BindingCcColorCIELab, LightnessFromZeroWithoutUpperBound) {
    cc::ColorCIELab lab;
    ASSERT_EQ(read(lab, open("ColorCIELab", R"(ColorSpecification="cs")") + "<cc:L>0</cc:L><cc:A>1</cc:A><cc:B>2</cc:B>" +
                            close("ColorCIELab")),
              lmx::elmx_ok);
    EXPECT_EQ(lab.get_L(), 0.0);
    ASSERT_EQ(read(lab, open("ColorCIELab", R"(ColorSpecification="cs")") +
                            "<cc:L>120</cc:L><cc:A>1</cc:A><cc:B>2</cc:B>" + close("ColorCIELab")),
              lmx::elmx_ok);
    EXPECT_EQ(lab.get_L(), 120.0);

    cc::ColorCIELCh lch;
    ASSERT_EQ(read(lch, open("ColorCIELCh", R"(ColorSpecification="cs")") + "<cc:L>0</cc:L><cc:C>1</cc:C><cc:H>2</cc:H>" +
                            close("ColorCIELCh")),
              lmx::elmx_ok);
    EXPECT_EQ(lch.get_L(), 0.0);
    ASSERT_EQ(read(lch, open("ColorCIELCh", R"(ColorSpecification="cs")") +
                            "<cc:L>120</cc:L><cc:C>1</cc:C><cc:H>2</cc:H>" + close("ColorCIELCh")),
              lmx::elmx_ok);
    EXPECT_EQ(lch.get_L(), 120.0);
}

std::string color_density(const std::string &ar_children) {
    return open("ColorDensity", R"(ColorSpecification="cs")") + ar_children + close("ColorDensity");
}

TEST(BindingCcColorDensity, StatusAndFilterAreRequired) {
    const tessarine_test::s_read_row rows[] = {
        {"no status", color_density("<cc:Density>1</cc:Density><cc:Filter>Visual</cc:Filter>"),
         lmx::elmx_mandatory_element_missing, "cc:Status"},
        {"no filter", color_density("<cc:Density>1</cc:Density><cc:Status>A</cc:Status>"),
         lmx::elmx_mandatory_element_missing, "cc:Filter"},
        {"no filter before the offset",
         color_density("<cc:Density>1</cc:Density><cc:Status>A</cc:Status><cc:BaseOffset>0</cc:BaseOffset>"),
         lmx::elmx_mandatory_element_missing, "cc:Filter"},
    };
    tessarine_test::expect_reads<cc::ColorDensity>(rows);
}

TEST(BindingCcColorDensity, StatusIsMatchedExactly) {
    cc::ColorDensity density;
    ASSERT_EQ(read(density,
                   color_density("<cc:Density>1</cc:Density><cc:Status>DIN-NB</cc:Status><cc:Filter>Visual</cc:Filter>")),
              lmx::elmx_ok);
    EXPECT_EQ(density.get_Status(), L"DIN-NB");
    EXPECT_EQ(density.getenum_Status(), cc::Eenum_Status_DIN_NB);
    EXPECT_EQ(density.getenum_Filter(), cc::Eenum_Filter_Visual);

    const tessarine_test::s_read_row rows[] = {
        {"lower case status",
         color_density("<cc:Density>1</cc:Density><cc:Status>din-nb</cc:Status><cc:Filter>Visual</cc:Filter>"),
         lmx::elmx_value_not_enumerated, "cc:Status"},
    };
    tessarine_test::expect_reads<cc::ColorDensity>(rows);
}

// Consecutive cc:PrivateSpectrum elements are one item of the group; any
// other element between them ends the item.
TEST(BindingCcColorValues, PrivateSpectrumRunsAreSplitByOtherElements) {
    const std::string spectrum = R"(<cc:PrivateSpectrum KeyID="k" ColorSpecification="cs">AAEC</cc:PrivateSpectrum>)";
    cc::ColorValues values;
    lmx::s_debug_error debug;
    ASSERT_EQ(read(values, open("ColorValues") + spectrum + spectrum + k_lab + spectrum + close("ColorValues"), &debug),
              lmx::elmx_ok)
        << debug;
    ASSERT_EQ(values.size_inner_ColorValues(), 3u);
    EXPECT_EQ(values.get_inner_ColorValues(0).getchosen(), cc::inner_ColorValues::EPrivateSpectrum);
    EXPECT_EQ(values.get_inner_ColorValues(0).size_PrivateSpectrum(), 2u);
    EXPECT_EQ(values.get_inner_ColorValues(1).getchosen(), cc::inner_ColorValues::EColorCIELab);
    EXPECT_EQ(values.get_inner_ColorValues(2).getchosen(), cc::inner_ColorValues::EPrivateSpectrum);
    EXPECT_EQ(values.get_inner_ColorValues(2).size_PrivateSpectrum(), 1u);

    // Written back, the runs are the same.
    std::string out;
    ASSERT_EQ(values.marshal(out), lmx::elmx_ok);
    cc::ColorValues again;
    ASSERT_EQ(read(again, out), lmx::elmx_ok);
    ASSERT_EQ(again.size_inner_ColorValues(), 3u);
    EXPECT_EQ(again.get_inner_ColorValues(0).size_PrivateSpectrum(), 2u);
    EXPECT_EQ(again.get_inner_ColorValues(2).size_PrivateSpectrum(), 1u);
}

std::string color_custom(const std::string &ar_children) {
    const std::string attributes = R"(Name="c" ColorSpecification="cs")";
    if (ar_children.empty())
        return "<cc:ColorCustom " + k_ns + " " + attributes + "/>";
    return open("ColorCustom", attributes) + ar_children + close("ColorCustom");
}

TEST(BindingCcColorCustom, OneOrMoreSpotColorsAreValid) {
    cc::ColorCustom custom;
    ASSERT_EQ(read(custom, color_custom(k_spot_color)), lmx::elmx_ok);
    EXPECT_EQ(custom.size_SpotColor(), 1u);
    ASSERT_EQ(read(custom, color_custom(k_spot_color + k_spot_color + k_spot_color)), lmx::elmx_ok);
    EXPECT_EQ(custom.size_SpotColor(), 3u);
    EXPECT_EQ(custom.get_SpotColor(2).get_Name(), L"Gold");
}

// Without a spot colour: content that is no spot colour is reported as the
// missing spot colour; an empty element is refused by the driver, as for
// any element whose content is required.
TEST(BindingCcColorCustom, WithoutSpotColorIsRefused) {
    const tessarine_test::s_read_row rows[] = {
        {"other content", color_custom("<cc:Comment>c</cc:Comment>"), lmx::elmx_mandatory_element_missing,
         "cc:SpotColor"},
        {"empty", color_custom(""), lmx::elmx_unexpected_empty_element, "cc:ColorCustom"},
    };
    tessarine_test::expect_reads<cc::ColorCustom>(rows);

    cc::ColorCustom custom;
    custom.set_Name(L"c");
    custom.set_ColorSpecification(L"cs");
    EXPECT_FALSE(custom.is_occurs_ok());
    std::string out = "untouched";
    EXPECT_EQ(custom.marshal(out), lmx::elmx_marshal_occurs_error);
    EXPECT_EQ(out, "untouched");
}

// cc:Cyan belongs to the CMYK colours, not to cc:ColorCustom: alone it
// leaves the spot colour missing; after a spot colour it fails the end
// check.
TEST(BindingCcColorCustom, CyanIsNotContent) {
    const tessarine_test::s_read_row rows[] = {
        {"cyan alone", color_custom("<cc:Cyan>10</cc:Cyan>"), lmx::elmx_mandatory_element_missing, "cc:SpotColor"},
        {"cyan after a spot colour", color_custom(k_spot_color + "<cc:Cyan>10</cc:Cyan>"),
         lmx::elmx_bad_end_of_element, "cc:ColorCustom"},
    };
    tessarine_test::expect_reads<cc::ColorCustom>(rows);
}

// ---------------------------------------------------------------- measurement conditions

std::string measurement(const std::string &ar_children) {
    return open("MeasurementSpec") + ar_children + close("MeasurementSpec");
}

TEST(BindingCcMeasurementSpec, TypeThenGeometryIsValid) {
    cc::MeasurementSpec measurement_read;
    ASSERT_EQ(read(measurement_read, measurement(k_measurement_type + k_geometry_choice)), lmx::elmx_ok);
    const cc::MeasurementSpec &read_measurement = measurement_read;
    EXPECT_EQ(read_measurement.getenum_MeasurementType(), cc::Eenum_MeasurementType_Spectrum_Reflectance);
    ASSERT_NE(read_measurement.get_GeometryChoice(), nullptr);
    EXPECT_EQ(read_measurement.get_GeometryChoice()->getchosen(), cc::GeometryChoiceType::ESphereGeometry);
    EXPECT_EQ(read_measurement.get_GeometryChoice()->getenum_SphereGeometry(), cc::Eenum_SphereGeometry_Diffuse);
}

TEST(BindingCcMeasurementSpec, MissingOrMisplacedTypeOrGeometryIsMandatoryElementMissing) {
    const tessarine_test::s_read_row rows[] = {
        {"no measurement type", measurement(k_geometry_choice), lmx::elmx_mandatory_element_missing,
         "cc:MeasurementType"},
        {"geometry before type", measurement(k_geometry_choice + k_measurement_type),
         lmx::elmx_mandatory_element_missing, "cc:MeasurementType"},
        {"no geometry", measurement(k_measurement_type), lmx::elmx_mandatory_element_missing,
         "cc:GeometryChoice"},
        {"no geometry before the device", measurement(k_measurement_type + "<cc:Device/>"),
         lmx::elmx_mandatory_element_missing, "cc:GeometryChoice"},
    };
    tessarine_test::expect_reads<cc::MeasurementSpec>(rows);
}

std::string geometry_choice(const std::string &ar_child) {
    return open("GeometryChoice") + ar_child + close("GeometryChoice");
}

TEST(BindingCcGeometryChoice, UnknownGeometryWithEmptyTextIsLengthTooShort) {
    const tessarine_test::s_read_row rows[] = {
        {"end tag", geometry_choice("<cc:UnknownGeometry></cc:UnknownGeometry>"), lmx::elmx_length_too_short,
         "cc:UnknownGeometry"},
        {"closed start tag", geometry_choice("<cc:UnknownGeometry/>"), lmx::elmx_length_too_short,
         "cc:UnknownGeometry"},
    };
    tessarine_test::expect_reads<cc::GeometryChoice>(rows);
    cc::GeometryChoice choice;
    ASSERT_EQ(read(choice, geometry_choice("<cc:UnknownGeometry>g</cc:UnknownGeometry>")), lmx::elmx_ok);
    EXPECT_EQ(choice.get_UnknownGeometry(), L"g");
}

TEST(BindingCcGeometryChoice, MultiAngleWithoutBRDFAngleIsRefused) {
    cc::GeometryChoice choice;
    ASSERT_EQ(read(choice, geometry_choice("<cc:MultiAngle>" + k_brdf_angle + k_brdf_angle + "</cc:MultiAngle>")),
              lmx::elmx_ok);
    const cc::GeometryChoice &read_choice = choice;
    ASSERT_NE(read_choice.get_MultiAngle(), nullptr);
    EXPECT_EQ(read_choice.get_MultiAngle()->size_inner_MultiAngleType(), 2u);

    const tessarine_test::s_read_row rows[] = {
        {"angle of the item without the item",
         geometry_choice("<cc:MultiAngle><cc:IlluminationAngle>45</cc:IlluminationAngle></cc:MultiAngle>"),
         lmx::elmx_mandatory_element_missing, "inner_MultiAngleType"},
        {"empty", geometry_choice("<cc:MultiAngle/>"), lmx::elmx_unexpected_empty_element, "cc:MultiAngle"},
    };
    tessarine_test::expect_reads<cc::GeometryChoice>(rows);
}

TEST(BindingCcGeometryChoice, MultiAngleWithoutBRDFAngleIsNotWritten) {
    cc::MultiAngleType angles;
    EXPECT_FALSE(angles.is_occurs_ok());
    std::string out = "untouched";
    EXPECT_EQ(angles.marshal(out), lmx::elmx_marshal_occurs_error);
    EXPECT_EQ(out, "untouched");

    cc::GeometryChoice choice;
    choice.select_MultiAngle();
    EXPECT_EQ(choice.marshal(out), lmx::elmx_marshal_occurs_error);
    EXPECT_EQ(out, "untouched");

    cc::BRDFAngle &angle = choice.get_MultiAngle().append_inner_MultiAngleType().get_BRDFAngle();
    angle.set_Notation(L"n");
    angle.set_IlluminationAngle(45);
    angle.set_Aspecular(15);
    EXPECT_EQ(choice.marshal(out), lmx::elmx_ok);
}

TEST(BindingCcBRDFAngle, MissingNotationIsRequiredAttributeMissing) {
    const tessarine_test::s_read_row rows[] = {
        {"alone",
         open("BRDFAngle") + "<cc:IlluminationAngle>45</cc:IlluminationAngle><cc:Aspecular>15</cc:Aspecular>" +
             close("BRDFAngle"),
         lmx::elmx_required_attribute_missing, "BRDFAngle"},
    };
    tessarine_test::expect_reads<cc::BRDFAngle>(rows);
    cc::GeometryChoice choice;
    EXPECT_EQ(read(choice, geometry_choice("<cc:MultiAngle><cc:BRDFAngle><cc:IlluminationAngle>45</cc:IlluminationAngle>"
                                           "<cc:Aspecular>15</cc:Aspecular></cc:BRDFAngle></cc:MultiAngle>")),
              lmx::elmx_required_attribute_missing);
}

std::string conditions(const std::string &ar_children) {
    return open("ColorSpecification", R"(Id="cs")") + ar_children + close("ColorSpecification");
}

TEST(BindingCcColorSpecification, TristimulusSpecMayBeLeftOut) {
    cc::ColorSpecification read_conditions;
    ASSERT_EQ(read(read_conditions, conditions(k_measurement)), lmx::elmx_ok);
    EXPECT_FALSE(read_conditions.isset_TristimulusSpec());
    ASSERT_EQ(read(read_conditions, conditions(k_tristimulus + k_measurement)), lmx::elmx_ok);
    EXPECT_TRUE(read_conditions.isset_TristimulusSpec());
}

TEST(BindingCcColorSpecification, MissingMeasurementSpecIsMandatoryElementMissing) {
    const tessarine_test::s_read_row rows[] = {
        {"tristimulus only", conditions(k_tristimulus), lmx::elmx_mandatory_element_missing,
         "cc:MeasurementSpec"},
        {"physical attributes only", conditions("<cc:PhysicalAttributes/>"),
         lmx::elmx_mandatory_element_missing, "cc:MeasurementSpec"},
    };
    tessarine_test::expect_reads<cc::ColorSpecification>(rows);
}

// ---------------------------------------------------------------- custom resources

TEST(BindingCcCustomResources, EmptyElementIsValid) {
    cc::CustomResources resources;
    EXPECT_EQ(read(resources, "<cc:CustomResources " + k_ns + "/>"), lmx::elmx_ok);
    EXPECT_EQ(read(resources, open("CustomResources") + close("CustomResources")), lmx::elmx_ok);
    EXPECT_EQ(resources.size_inner_CustomResources(), 0u);
    std::string out;
    ASSERT_EQ(resources.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, written_empty("CustomResources"));
}

TEST(BindingCcCustomResources, AnyAttributesAreKeptAndWrittenBack) {
    cc::CustomResources resources;
    lmx::s_debug_error debug;
    ASSERT_EQ(read(resources, "<cc:CustomResources " + k_ns + R"( xmlns:x="urn:x" x:a="1" b="two"/>)", &debug),
              lmx::elmx_ok)
        << debug;
    ASSERT_EQ(resources.getany_attributes().size(), 2u);
    EXPECT_EQ(resources.getany_attributes()[0].get_namespace(), "urn:x");
    EXPECT_EQ(resources.getany_attributes()[0].get_name(), "x:a");
    EXPECT_EQ(resources.getany_attributes()[0].get_value(), "1");
    EXPECT_EQ(resources.getany_attributes()[1].get_name(), "b");
    EXPECT_EQ(resources.getany_attributes()[1].get_value(), "two");

    std::string out;
    ASSERT_EQ(resources.marshal(out), lmx::elmx_ok);
    EXPECT_NE(out.find("x:a=\"1\""), std::string::npos) << out;
    EXPECT_NE(out.find("b=\"two\""), std::string::npos) << out;
}

// The written document is read again with the same attributes, the
// prefixed one still in its namespace.
TEST(BindingCcCustomResources, AnyAttributesReadBackFromTheWrittenDocument) {
    cc::CustomResources resources;
    ASSERT_EQ(read(resources, "<cc:CustomResources " + k_ns + R"( xmlns:x="urn:x" x:a="1" b="two"/>)"), lmx::elmx_ok);
    std::string out;
    ASSERT_EQ(resources.marshal(out), lmx::elmx_ok);
    cc::CustomResources again;
    lmx::s_debug_error debug;
    ASSERT_EQ(read(again, out, &debug), lmx::elmx_ok) << debug;
    ASSERT_EQ(again.getany_attributes().size(), 2u);
    EXPECT_EQ(again.getany_attributes()[0].get_namespace(), "urn:x") << out;
    EXPECT_EQ(again.getany_attributes()[0].get_value(), "1");
    EXPECT_EQ(again.getany_attributes()[1].get_value(), "two");
}

// A cc: element is no foreign content: the walk of the content stops at it
// and the end check of cc:CustomResources reports it.
TEST(BindingCcCustomResources, CoreChildIsBadEndOfElement) {
    const tessarine_test::s_read_row rows[] = {
        {"alone", open("CustomResources") + "<cc:Comment>c</cc:Comment>" + close("CustomResources"),
         lmx::elmx_bad_end_of_element, "cc:CustomResources"},
        {"after a foreign child",
         open("CustomResources", R"(xmlns:x="urn:x")") + "<x:one/><cc:Comment>c</cc:Comment>" +
             close("CustomResources"),
         lmx::elmx_bad_end_of_element, "cc:CustomResources"},
    };
    tessarine_test::expect_reads<cc::CustomResources>(rows);
}

const std::string k_two_foreign_children = open("CustomResources", R"(xmlns:x="urn:x")") +
                                           R"(<x:one k="v">t<x:in/></x:one><y:two xmlns:y="urn:y"/>)" +
                                           close("CustomResources");

TEST(BindingCcCustomResources, ForeignChildrenComeBackInOrderWithTheirNamespaces) {
    cc::CustomResources resources;
    lmx::s_debug_error debug;
    ASSERT_EQ(read(resources, k_two_foreign_children, &debug), lmx::elmx_ok) << debug;
    ASSERT_EQ(resources.size_inner_CustomResources(), 2u);
    std::string ns;
    std::string name;
    std::string value;
    EXPECT_EQ(resources.get_inner_CustomResources(0).getchosen(), cc::inner_CustomResources::Eany);
    resources.get_inner_CustomResources(0).get_any(&ns, &name, value);
    EXPECT_EQ(ns, "urn:x");
    EXPECT_EQ(name, "x:one");
    EXPECT_EQ(value, R"(<x:one k="v">t<x:in/></x:one>)");
    resources.get_inner_CustomResources(1).get_any(&ns, &name, value);
    EXPECT_EQ(ns, "urn:y");
    EXPECT_EQ(name, "y:two");
    EXPECT_EQ(value, R"(<y:two xmlns:y="urn:y"/>)");
}

// Written and read again, each child is still in its namespace, including
// the one whose prefix was declared on cc:CustomResources.
TEST(BindingCcCustomResources, ForeignChildrenReadBackFromTheWrittenDocument) {
    cc::CustomResources resources;
    ASSERT_EQ(read(resources, k_two_foreign_children), lmx::elmx_ok);
    std::string out;
    ASSERT_EQ(resources.marshal(out), lmx::elmx_ok);
    cc::CustomResources again;
    lmx::s_debug_error debug;
    ASSERT_EQ(read(again, out, &debug), lmx::elmx_ok) << debug;
    ASSERT_EQ(again.size_inner_CustomResources(), 2u);
    std::string ns;
    std::string name;
    std::string value;
    again.get_inner_CustomResources(0).get_any(&ns, &name, value);
    EXPECT_EQ(ns, "urn:x") << out;
    EXPECT_EQ(name, "x:one");
    again.get_inner_CustomResources(1).get_any(&ns, &name, value);
    EXPECT_EQ(ns, "urn:y") << out;
    EXPECT_EQ(name, "y:two");
}

// ---------------------------------------------------------------- profiles

std::string parameters(const std::string &ar_name) {
    return open("Parameters") + ar_name + k_value_choice + close("Parameters");
}

TEST(BindingCcParameters, NameIsOneCharacter) {
    cc::Parameters parameter;
    ASSERT_EQ(read(parameter, parameters("<cc:Name>a</cc:Name>")), lmx::elmx_ok);
    EXPECT_EQ(parameter.get_Name(), L"a");

    const tessarine_test::s_read_row rows[] = {
        {"two characters", parameters("<cc:Name>ab</cc:Name>"), lmx::elmx_length_too_long, "cc:Name"},
        {"none, end tag", parameters("<cc:Name></cc:Name>"), lmx::elmx_length_too_short, "cc:Name"},
        {"none, closed start tag", parameters("<cc:Name/>"), lmx::elmx_length_too_short, "cc:Name"},
    };
    tessarine_test::expect_reads<cc::Parameters>(rows);
}

TEST(BindingCcProfileCollection, EmptyElementIsValid) {
    cc::ProfileCollection profiles;
    EXPECT_EQ(read(profiles, "<cc:ProfileCollection " + k_ns + "/>"), lmx::elmx_ok);
    EXPECT_EQ(profiles.size_Profile(), 0u);
    std::string out;
    ASSERT_EQ(profiles.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, written_empty("ProfileCollection"));
}

std::string profile(const std::string &ar_direction, const std::string &ar_children) {
    return open("Profile", R"(Id="p" Direction=")" + ar_direction + "\"") + ar_children + close("Profile");
}

TEST(BindingCcProfile, DirectionIsMatchedExactly) {
    cc::Profile read_profile;
    ASSERT_EQ(read(read_profile, profile("Profile_Both", k_profile_choice)), lmx::elmx_ok);
    EXPECT_EQ(read_profile.getenum_Direction(), cc::Eenum_Direction_Profile_Both);

    const tessarine_test::s_read_row rows[] = {
        {"lower case", profile("both", k_profile_choice), lmx::elmx_value_not_enumerated, "Direction"},
    };
    tessarine_test::expect_reads<cc::Profile>(rows);
}

TEST(BindingCcProfile, MissingProfileChoiceIsMandatoryElementMissing) {
    const tessarine_test::s_read_row rows[] = {
        {"parameters only", profile("Profile_Input", "<cc:Parameters><cc:Name>a</cc:Name>" + k_value_choice +
                                                         "</cc:Parameters>"),
         lmx::elmx_mandatory_element_missing, "cc:ProfileChoice"},
        {"creation time only", profile("Profile_Input", "<cc:Created>2024-01-02T03:04:05Z</cc:Created>"),
         lmx::elmx_mandatory_element_missing, "cc:ProfileChoice"},
    };
    tessarine_test::expect_reads<cc::Profile>(rows);
}

} // namespace
