// Every class of the core group, from one minimal valid document each: the
// document reads and writes; leaving out any required attribute or required
// element is refused on reading (25 / 21) and an object without it is refused
// on writing (46); and a read, write, read, write cycle gives the same bytes
// twice.
//
// A class is told here by its shape: its attributes, its children in table
// order, and its text, each marked required or not. The failing documents
// are derived from the minimal one by leaving out one required member.
#include <gtest/gtest.h>

#include <cstddef>
#include <set>
#include <string>
#include <vector>

#include <cxf/v3/cxf3.h>

#include "bound_reads.h"

namespace {

using lmx::elmx_error;
using tessarine_test::read;

const std::string k_ns = std::string("xmlns:cc=\"") + cc::k_namespace_uri + "\"";

// An element that is in no table of the group.
const std::string k_stray = "<cc:Stray/>";

struct s_member {
    std::string text; // an attribute as name="value", or a child element
    bool is_required;
};

struct s_shape {
    std::vector<s_member> attributes;
    std::vector<s_member> children; // in table order
    std::string text;               // simple content
    // cc:ColorValues, cc:ColorDifferenceValues and cc:DeviceColorValues
    // write an empty element when they hold no item.
    bool is_written_without_items = false;
};

// The document of a class: its own element, in the core namespace, with
// the members of the shape, less the attribute or the child at a_index as
// a_skip says, and ar_extra_child after the children.
enum e_skip { skip_none, skip_attribute, skip_child };

std::string document(const char *ac_element, const s_shape &ar_shape, e_skip a_skip = skip_none,
                     std::size_t a_index = 0, const std::string &ar_extra_child = "") {
    std::string text = std::string("<") + ac_element + " " + k_ns;
    for (std::size_t i = 0; i < ar_shape.attributes.size(); ++i)
        if (a_skip != skip_attribute || i != a_index)
            text += " " + ar_shape.attributes[i].text;
    std::string body;
    for (std::size_t i = 0; i < ar_shape.children.size(); ++i)
        if (a_skip != skip_child || i != a_index)
            body += ar_shape.children[i].text;
    body += ar_extra_child + ar_shape.text;
    if (body.empty())
        return text + "/>";
    return text + ">" + body + "</" + ac_element + ">";
}

struct c_text_holder {
    std::string m_text;
};

// A reader that lets reading go on past a missing required member, so that
// the object ends up as the document less that member.
class c_forgiving_reader : private c_text_holder, public lmx::c_xml_reader_memory {
public:
    explicit c_forgiving_reader(const std::string &ar_text)
        : c_text_holder{ar_text}, c_xml_reader_memory(m_text) {}
    elmx_error user_handle_error(elmx_error a_error) override {
        if (a_error == lmx::elmx_required_attribute_missing || a_error == lmx::elmx_mandatory_element_missing ||
            a_error == lmx::elmx_unexpected_empty_element) {
            ++m_count;
            return lmx::elmx_ok;
        }
        return a_error;
    }
    int m_count = 0;
};

// The object read from ar_text past its missing member cannot be written:
// nothing is written and the verdict is 46.
template <typename T> void expect_not_written(const std::string &ar_text, const s_shape &ar_shape) {
    c_forgiving_reader reader(ar_text);
    T object;
    ASSERT_EQ(object.unmarshal(reader), lmx::elmx_ok) << ar_text;
    EXPECT_GE(reader.m_count, 1);
    std::string out = "untouched";
    if (ar_shape.is_written_without_items) {
        EXPECT_TRUE(object.is_occurs_ok());
        EXPECT_EQ(object.marshal(out), lmx::elmx_ok);
        return;
    }
    EXPECT_FALSE(object.is_occurs_ok());
    EXPECT_EQ(object.marshal(out), lmx::elmx_marshal_occurs_error);
    EXPECT_EQ(out, "untouched");
}

template <typename T> void expect_read_verdict(const std::string &ar_text, elmx_error a_expected) {
    T object;
    lmx::s_debug_error debug;
    EXPECT_EQ(read(object, ar_text, &debug), a_expected) << ar_text << "\n" << debug;
}

template <typename T> void check_required_members(const s_shape &ar_shape) {
    const char *element = T::k_element_name;
    {
        T object;
        lmx::s_debug_error debug;
        const std::string text = document(element, ar_shape);
        ASSERT_EQ(read(object, text, &debug), lmx::elmx_ok) << text << "\n" << debug;
        EXPECT_TRUE(object.is_occurs_ok());
        std::string out;
        EXPECT_EQ(object.marshal(out), lmx::elmx_ok);
    }
    for (std::size_t i = 0; i < ar_shape.attributes.size(); ++i) {
        if (!ar_shape.attributes[i].is_required)
            continue;
        SCOPED_TRACE("without " + ar_shape.attributes[i].text);
        const std::string text = document(element, ar_shape, skip_attribute, i);
        expect_read_verdict<T>(text, lmx::elmx_required_attribute_missing);
        expect_not_written<T>(text, ar_shape);
    }
    for (std::size_t i = 0; i < ar_shape.children.size(); ++i) {
        if (!ar_shape.children[i].is_required)
            continue;
        SCOPED_TRACE("without " + ar_shape.children[i].text);
        const std::string text = document(element, ar_shape, skip_child, i);
        if (text.compare(text.size() - 2, 2, "/>") == 0) {
            // Nothing left in the element: the driver refuses an empty
            // element whose content is required before the class looks at
            // it. With something else in it, the class reports the missing
            // child (and then the stray element would fail the end check,
            // so the object is made from the empty element).
            expect_read_verdict<T>(text, lmx::elmx_unexpected_empty_element);
            expect_not_written<T>(text, ar_shape);
            const std::string with_stray = document(element, ar_shape, skip_child, i, k_stray);
            expect_read_verdict<T>(with_stray, lmx::elmx_mandatory_element_missing);
        } else {
            expect_read_verdict<T>(text, lmx::elmx_mandatory_element_missing);
            expect_not_written<T>(text, ar_shape);
        }
    }
}

template <typename T> void check_round_trip(const s_shape &ar_shape) {
    const std::string text = document(T::k_element_name, ar_shape);
    T first;
    lmx::s_debug_error debug;
    ASSERT_EQ(read(first, text, &debug), lmx::elmx_ok) << text << "\n" << debug;
    std::string written;
    ASSERT_EQ(first.marshal(written), lmx::elmx_ok);
    T second;
    ASSERT_EQ(read(second, written, &debug), lmx::elmx_ok) << written << "\n" << debug;
    std::string rewritten;
    ASSERT_EQ(second.marshal(rewritten), lmx::elmx_ok);
    EXPECT_EQ(rewritten, written);
}

struct s_class_row {
    const char *name;
    s_shape shape;
    void (*check_required)(const s_shape &);
    void (*check_round_trip)(const s_shape &);
};

template <typename T> s_class_row row(const s_shape &ar_shape) {
    return {T::k_element_name, ar_shape, &check_required_members<T>, &check_round_trip<T>};
}

s_member req(const std::string &ar_text) { return {ar_text, true}; }
s_member opt(const std::string &ar_text) { return {ar_text, false}; }

// Children used in more than one shape.
const std::string k_creation_date = "<cc:CreationDate>2024-01-02T03:04:05Z</cc:CreationDate>";
const std::string k_reference = R"(ColorSpecification="cs")";
const std::string k_lab = R"(<cc:ColorCIELab ColorSpecification="cs"><cc:L>50</cc:L><cc:A>1</cc:A><cc:B>2</cc:B></cc:ColorCIELab>)";
const std::string k_spot_color = "<cc:SpotColor><cc:Name>Gold</cc:Name><cc:Percentage>40</cc:Percentage></cc:SpotColor>";
const std::string k_geometry_choice = "<cc:GeometryChoice><cc:SphereGeometry>Diffuse</cc:SphereGeometry></cc:GeometryChoice>";
const std::string k_measurement = "<cc:MeasurementSpec><cc:MeasurementType>Spectrum_Reflectance</cc:MeasurementType>" +
                                       k_geometry_choice + "</cc:MeasurementSpec>";
const std::string k_profile_choice = "<cc:ProfileChoice><cc:ProfileURI>http://example.com/p.icc</cc:ProfileURI></cc:ProfileChoice>";
const std::string k_value_choice = "<cc:ValueChoice><cc:DoubleValue>1.5</cc:DoubleValue></cc:ValueChoice>";
const std::string k_brdf_angle =
    R"(<cc:BRDFAngle Notation="n"><cc:IlluminationAngle>45</cc:IlluminationAngle><cc:Aspecular>15</cc:Aspecular></cc:BRDFAngle>)";

// Children named ar_names, each with the text ar_value, all required.
std::vector<s_member> required_values(const std::vector<std::string> &ar_names, const std::string &ar_value) {
    std::vector<s_member> children;
    for (const std::string &name : ar_names)
        children.push_back(req("<cc:" + name + ">" + ar_value + "</cc:" + name + ">"));
    return children;
}

s_shape simple(const std::string &ar_text) { return {{}, {}, ar_text}; }
s_shape simple_with(const std::string &ar_attribute, const std::string &ar_text) {
    return {{req(ar_attribute)}, {}, ar_text};
}
// A colour with a required ColorSpecification and the named required children.
s_shape colour(const std::vector<std::string> &ar_children, const std::string &ar_value = "10") {
    return {{req(k_reference)}, required_values(ar_children, ar_value), ""};
}

// ---------------------------------------------------------------- the shapes, area by area

std::vector<s_class_row> file_and_object_rows() {
    const std::string object = R"(<cc:Object ObjectType="Target" Name="o" Id="o1">)" + k_creation_date + "</cc:Object>";
    return {
        row<cc::CxF>({}),
        row<cc::FileInformation>({}),
        row<cc::Tag>({{req(R"(Name="n")"), req(R"(Value="v")")}, {}, ""}),
        row<cc::Resources>({}),
        row<cc::ObjectCollection>({{}, {req(object)}, ""}),
        row<cc::Object>({{req(R"(ObjectType="Target")"), req(R"(Name="o")"), req(R"(Id="o1")"), opt(R"(GUID="g")")},
                         {req(k_creation_date)},
                         ""}),
        row<cc::TagCollection>({{req(R"(Name="tc")")}, {}, ""}),
        row<cc::CreationDate>(simple("2024-01-02T03:04:05Z")),
        row<cc::PhysicalAttributes>({}),
        row<cc::TargetType>(simple("Other")),
        row<cc::FinishType>(simple("Matte")),
        row<cc::SubstrateType>(simple("Paper")),
        row<cc::Quantity>(simple("2")),
        row<cc::Height>(simple_with(R"(Units="mm")", "1.5")),
        row<cc::Width>(simple_with(R"(Units="mm")", "1.5")),
        row<cc::Length>(simple_with(R"(Units="mm")", "1.5")),
        row<cc::Thickness>(simple_with(R"(Units="mm")", "1.5")),
        row<cc::Gloss>(simple("50")),
        row<cc::Opacity>(simple("50")),
        row<cc::CustomAttributeString>({{req(R"(Label="l")"), opt(R"(Method="m")")}, {}, "text"}),
        row<cc::CustomAttributeValue>({{req(R"(Label="l")"), opt(R"(Method="m")")}, {}, "2.5"}),
        row<cc::Substrate>(simple("Paper")),
        row<cc::Process>(simple("Offset")),
        row<cc::ImageType>({{opt(R"(Label="l")"), req(R"(ImageFileName="i.png")")}, {}, "AAEC"}),
        row<cc::Image>({{opt(R"(Label="l")"), req(R"(ImageFileName="i.png")")}, {}, "AAEC"}),
    };
}

std::vector<s_class_row> colour_value_rows() {
    const std::string spectrum_value = "0.1 0.2 0.3";
    const s_shape spectrum = {{opt(R"(Name="s")"), req(k_reference)}, {}, spectrum_value};
    const s_shape private_value = {{req(R"(KeyID="k")"), req(k_reference)}, {}, "AAEC"};
    s_shape density = colour({"Density"}, "1.2");
    density.children.push_back(req("<cc:Status>A</cc:Status>"));
    density.children.push_back(req("<cc:Filter>Visual</cc:Filter>"));
    return {
        row<cc::ReflectanceSpectrum>(spectrum),
        row<cc::TransmittanceSpectrum>(spectrum),
        row<cc::EmissiveSpectrum>(spectrum),
        row<cc::SpectralPoint>(simple_with(R"(WL="400")", "0.5")),
        row<cc::CustomSpectrum>(
            {{req(k_reference)}, {req(R"(<cc:SpectralPoint WL="400">0.5</cc:SpectralPoint>)")}, ""}),
        row<cc::ColorSRGB>(colour({"R", "G", "B"})),
        row<cc::ColorAdobeRGB>(colour({"R", "G", "B"})),
        row<cc::ColorCIELab>(colour({"L", "A", "B"})),
        row<cc::ColorCIELCh>(colour({"L", "C", "H"})),
        row<cc::ColorCIEXYZ>(colour({"X", "Y", "Z"})),
        row<cc::ColorEmissiveCIEXYZ>(colour({"X", "Y", "Z"})),
        row<cc::ColorCIExyY>(colour({"x", "y", "Y"}, "0.25")),
        row<cc::ColorEmissiveCIExyY>(colour({"x", "y", "Y"}, "0.25")),
        row<cc::ColorCIELuv>(colour({"L", "U", "V"})),
        row<cc::ColorDensity>(density),
        row<cc::PrivateSpectrum>(private_value),
        row<cc::PrivateColorValues>(private_value),
        row<cc::CustomDataType>(simple_with(R"(Label="l")", "3")),
        row<cc::CustomColorSpace>(
            {{req(R"(Name="c")"), req(k_reference)}, {req(R"(<cc:Value Label="l">3</cc:Value>)")}, ""}),
        row<cc::ColorValues>({{}, {req(k_lab)}, "", true}),
    };
}

std::vector<s_class_row> colour_difference_rows() {
    const s_shape delta = {{req(k_reference), req(R"(StandardRef="std")")}, {}, ""};
    return {
        row<cc::DEcmcType>(simple_with(R"(LRatio="2")", "0.5")),
        row<cc::DE94Type>(simple_with(R"(LRatio="2")", "0.5")),
        row<cc::DE2000Type>(simple_with(R"(LRatio="2")", "0.5")),
        row<cc::DeltaCIELab>(delta),
        row<cc::CustomDeltaType>(simple_with(R"(Label="l")", "0.5")),
        row<cc::DeltaCustom>(delta),
        row<cc::ColorDifferenceValues>(
            {{}, {req(R"(<cc:DeltaCIELab ColorSpecification="cs" StandardRef="std"/>)")}, "", true}),
    };
}

std::vector<s_class_row> device_colour_rows() {
    const std::vector<std::string> cmyk = {"Cyan", "Magenta", "Yellow", "Black"};
    const std::vector<std::string> hexachrome = {"Cyan", "Magenta", "Yellow", "Black", "Orange", "Green"};
    const s_shape spot = {{}, {req("<cc:Name>Gold</cc:Name>"), req("<cc:Percentage>40</cc:Percentage>")}, ""};
    return {
        row<cc::ColorHTML>({{req(R"(HTML="#FFCC00")"), req(k_reference)}, {}, ""}),
        row<cc::ColorNotation>({{req(R"(Notation="N")"), req(R"(Name="n")"), req(k_reference)}, {}, ""}),
        row<cc::ColorRGB>(colour({"R", "G", "B"})),
        row<cc::ColorHSL>(colour({"Hue", "Saturation", "Lightness"})),
        row<cc::ColorCMYK>(colour(cmyk)),
        row<cc::SpotColorType>(spot),
        row<cc::SpotColor>(spot),
        row<cc::ColorCMYKPlusN>(colour(cmyk)),
        row<cc::ColorCustom>({{req(R"(Name="c")"), req(k_reference)}, {req(k_spot_color)}, ""}),
        row<cc::ColorPantoneHexachrome>(colour(hexachrome)),
        row<cc::Density>(simple("1.2")),
        row<cc::Colorant>({{req(R"(Name="c")")}, {req("<cc:Value>12</cc:Value>")}, ""}),
        row<cc::ColorRecipe>({{req(R"(Units="%")"), req(R"(Name="r")")},
                              {req(k_creation_date), req(R"(<cc:Colorant Name="c"><cc:Value>12</cc:Value></cc:Colorant>)")},
                              ""}),
        row<cc::DeviceColorValues>(
            {{}, {req(R"(<cc:ColorHTML HTML="#FFCC00" ColorSpecification="cs"/>)")}, "", true}),
    };
}

std::vector<s_class_row> measurement_condition_rows() {
    const s_shape geometry = {{}, {req("<cc:SphereGeometry>Diffuse</cc:SphereGeometry>")}, ""};
    return {
        row<cc::ColorSpecificationCollection>(
            {{}, {req(R"(<cc:ColorSpecification Id="cs">)" + k_measurement + "</cc:ColorSpecification>")}, ""}),
        row<cc::ColorSpecification>({{req(R"(Id="cs")")}, {req(k_measurement)}, ""}),
        row<cc::TristimulusSpec>({{},
                                  {req("<cc:Illuminant>D50</cc:Illuminant>"), req("<cc:Observer>2_Degree</cc:Observer>"),
                                   req("<cc:Method>E308_Table5</cc:Method>")},
                                  ""}),
        row<cc::Illuminant>(simple("D50")),
        row<cc::CustomIlluminant>({}),
        row<cc::Observer>(simple("2_Degree")),
        row<cc::Method>(simple("E308_Table5")),
        row<cc::MeasurementSpec>(
            {{}, {req("<cc:MeasurementType>Spectrum_Reflectance</cc:MeasurementType>"), req(k_geometry_choice)}, ""}),
        row<cc::MeasurementType>(simple("Spectrum_Reflectance")),
        row<cc::LuminanceUnitsType>(simple("cd/m2")),
        row<cc::WavelengthRange>({{req(R"(StartWL="400")"), req(R"(Increment="10")")}, {}, ""}),
        row<cc::GeometryChoiceType>(geometry),
        row<cc::GeometryChoice>(geometry),
        row<cc::SingleAngleType>({{},
                                  {req("<cc:SingleAngleConfiguration>Annular</cc:SingleAngleConfiguration>"),
                                   req("<cc:IlluminationAngle>45</cc:IlluminationAngle>"),
                                   req("<cc:MeasurementAngle>0</cc:MeasurementAngle>")},
                                  ""}),
        row<cc::SingleAngleConfiguration>(simple("Annular")),
        row<cc::MultiAngleType>({{}, {req(k_brdf_angle)}, ""}),
        row<cc::BRDFAngle>({{req(R"(Notation="n")")},
                            {req("<cc:IlluminationAngle>45</cc:IlluminationAngle>"), req("<cc:Aspecular>15</cc:Aspecular>")},
                            ""}),
        row<cc::Device>({}),
        row<cc::SerialNumber>({}),
        row<cc::DeviceClass>(simple("DeviceClass_Spot")),
        row<cc::DeviceFilterType>(simple("Filter_None")),
        row<cc::DeviceFilter>(simple("Filter_None")),
        row<cc::DeviceIllumination>(simple("LED")),
    };
}

std::vector<s_class_row> profile_and_resource_rows() {
    const s_shape profile = {{req(R"(Id="p")"), req(R"(Direction="Profile_Input")")}, {req(k_profile_choice)}, ""};
    return {
        row<cc::CustomResources>({}),
        row<cc::ProfileCollection>({}),
        row<cc::ProfileType>(profile),
        row<cc::Profile>(profile),
        row<cc::ProfileChoice>({{}, {req("<cc:ProfileURI>http://example.com/p.icc</cc:ProfileURI>")}, ""}),
        row<cc::ProfileFile>({{opt(R"(ProfileName="p")")}, {}, "AAEC"}),
        row<cc::Parameters>({{}, {req("<cc:Name>a</cc:Name>"), req(k_value_choice)}, ""}),
        row<cc::ValueChoice>({{}, {req("<cc:DoubleValue>1.5</cc:DoubleValue>")}, ""}),
    };
}

void check_required(const std::vector<s_class_row> &ar_rows) {
    for (const s_class_row &class_row : ar_rows) {
        SCOPED_TRACE(class_row.name);
        class_row.check_required(class_row.shape);
    }
}

void check_round_trips(const std::vector<s_class_row> &ar_rows) {
    for (const s_class_row &class_row : ar_rows) {
        SCOPED_TRACE(class_row.name);
        class_row.check_round_trip(class_row.shape);
    }
}

// ---------------------------------------------------------------- required members

TEST(BindingCcRequiredMembers, FileAndObjectClassesRefuseAMissingRequiredMember) {
    check_required(file_and_object_rows());
}

TEST(BindingCcRequiredMembers, ColourValueClassesRefuseAMissingRequiredMember) {
    check_required(colour_value_rows());
}

TEST(BindingCcRequiredMembers, ColourDifferenceClassesRefuseAMissingRequiredMember) {
    check_required(colour_difference_rows());
}

TEST(BindingCcRequiredMembers, DeviceColourClassesRefuseAMissingRequiredMember) {
    check_required(device_colour_rows());
}

TEST(BindingCcRequiredMembers, MeasurementConditionClassesRefuseAMissingRequiredMember) {
    check_required(measurement_condition_rows());
}

TEST(BindingCcRequiredMembers, ProfileAndResourceClassesRefuseAMissingRequiredMember) {
    check_required(profile_and_resource_rows());
}

// ---------------------------------------------------------------- round trips

TEST(BindingCcRoundTrip, FileAndObjectClassesWriteTheSameBytesTwice) { check_round_trips(file_and_object_rows()); }

TEST(BindingCcRoundTrip, ColourValueClassesWriteTheSameBytesTwice) { check_round_trips(colour_value_rows()); }

TEST(BindingCcRoundTrip, ColourDifferenceClassesWriteTheSameBytesTwice) {
    check_round_trips(colour_difference_rows());
}

TEST(BindingCcRoundTrip, DeviceColourClassesWriteTheSameBytesTwice) { check_round_trips(device_colour_rows()); }

TEST(BindingCcRoundTrip, MeasurementConditionClassesWriteTheSameBytesTwice) {
    check_round_trips(measurement_condition_rows());
}

TEST(BindingCcRoundTrip, ProfileAndResourceClassesWriteTheSameBytesTwice) {
    check_round_trips(profile_and_resource_rows());
}

// Every class of the group is in one of the tables above, once.
TEST(BindingCcRoundTrip, TablesCoverEveryClassOfTheGroupOnce) {
    std::set<std::string> names;
    std::size_t count = 0;
    for (const auto &rows : {file_and_object_rows(), colour_value_rows(), colour_difference_rows(),
                             device_colour_rows(), measurement_condition_rows(), profile_and_resource_rows()})
        for (const s_class_row &class_row : rows) {
            names.insert(class_row.name);
            ++count;
        }
    EXPECT_EQ(names.size(), count);
    // The classes of the header less the six group items (inner_* and
    // anon_Illuminant), which have no element of their own.
    EXPECT_EQ(count, 97u);
}

} // namespace
