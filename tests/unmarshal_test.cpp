// Reading bound classes through the unmarshal driver, the typed value
// readers and the member containers.
#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <memory>
#include <sstream>
#include <stdexcept>
#include <string>

#include <lmx/lmxparse.h>

#include "bound_classes.h"
#include "bound_reads.h"

namespace {

using namespace tessarine_test;
using lmx::elmx_error;

const std::string k_ns = std::string("xmlns:cc=\"") + cc::k_core_uri + "\"";
const std::string k_xsi = "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\"";

struct c_text_holder {
    std::string m_text;
};
// A memory reader with its own copy of the text, which the plain one does
// not make.
class c_owning_reader : private c_text_holder, public lmx::c_xml_reader_memory {
public:
    explicit c_owning_reader(const std::string &ar_text) : c_text_holder{ar_text}, c_xml_reader_memory(m_text) {}
};

// ---------------------------------------------------------------- empty content: cc:Tag

TEST(UnmarshalEmptyContent, ReadsRequiredAttributesInAnyOrder) {
    cc::Tag tag;
    ASSERT_EQ(read(tag, "<cc:Tag " + k_ns + " Value=\"b\" Name=\"a\"/>"), lmx::elmx_ok);
    EXPECT_EQ(tag.get_Name(), L"a");
    EXPECT_EQ(tag.get_Value(), L"b");
    EXPECT_TRUE(tag.is_occurs_ok());
}

TEST(UnmarshalEmptyContent, AcceptsSeparateEndTag) {
    cc::Tag tag;
    EXPECT_EQ(read(tag, "<cc:Tag " + k_ns + " Name=\"a\" Value=\"b\">\n</cc:Tag>"), lmx::elmx_ok);
}

// Each row is one read of cc:Tag that fails: its verdict and the item of
// the debug record.
TEST(UnmarshalEmptyContent, ErrorsNameTheItem) {
    const tessarine_test::s_read_row rows[] = {
        {"content is bad end of element", "<cc:Tag " + k_ns + " Name=\"a\" Value=\"b\"><cc:X/></cc:Tag>",
         lmx::elmx_bad_end_of_element, "cc:Tag"},
        {"repeated attribute is already read", "<cc:Tag " + k_ns + " Name=\"a\" Name=\"c\" Value=\"b\"/>",
         lmx::elmx_attribute_already_read, "@Name"},
        {"xsi prefix without declaration is unexpected",
         "<cc:Tag " + k_ns + " xsi:schemaLocation=\"a b\" Name=\"a\" Value=\"b\"/>", lmx::elmx_unexpected_attribute,
         "@xsi:schemaLocation"},
    };
    tessarine_test::expect_reads<cc::Tag>(rows);
}


TEST(UnmarshalAttributes, UnknownAttributeIsReportedWithAtAndName) {
    cc::Tag tag;
    lmx::s_debug_error debug;
    EXPECT_EQ(read(tag, "<cc:Tag " + k_ns + " Name=\"a\" Colour=\"red\" Value=\"b\"/>", &debug),
              lmx::elmx_unexpected_attribute);
    EXPECT_EQ(debug.error, lmx::elmx_unexpected_attribute);
    EXPECT_EQ(debug.item_name, "@Colour");
    EXPECT_STREQ(debug.p_prog_file, "cxf3");
    EXPECT_EQ(debug.prog_line, 100);
}


TEST(UnmarshalAttributes, XsiAttributesAreDroppedSilently) {
    cc::Tag tag;
    EXPECT_EQ(read(tag, "<cc:Tag " + k_ns + " " + k_xsi +
                            " xsi:schemaLocation=\"a b\" Name=\"a\" xsi:noNamespaceSchemaLocation=\"x\" "
                            "xsi:type=\"cc:Tag\" Value=\"b\"/>"),
              lmx::elmx_ok);
    EXPECT_EQ(tag.get_Value(), L"b");
    cc::FileInformation info;
    EXPECT_EQ(read(info, "<cc:FileInformation " + k_ns + " " + k_xsi + " xsi:schemaLocation=\"a b\"/>"),
              lmx::elmx_ok);
}


TEST(UnmarshalAttributes, MissingRequiredAttributeNamesTheClass) {
    cc::Tag tag;
    lmx::s_debug_error debug;
    EXPECT_EQ(read(tag, "<cc:Tag " + k_ns + " Name=\"a\"/>", &debug), lmx::elmx_required_attribute_missing);
    EXPECT_EQ(debug.item_name, "Tag");
    EXPECT_EQ(tag.get_Name(), L"a"); // what was read stays
}

// A reader whose handler forgives the listed code and counts it.
class c_forgiving_reader : public c_owning_reader {
public:
    c_forgiving_reader(const std::string &ar_text, elmx_error a_forgiven)
        : c_owning_reader(ar_text), m_forgiven(a_forgiven) {}
    elmx_error user_handle_error(elmx_error a_error) override {
        if (a_error != m_forgiven)
            return a_error;
        ++m_count;
        return lmx::elmx_ok;
    }
    int m_count = 0;

private:
    elmx_error m_forgiven;
};

TEST(UnmarshalAttributes, ForgivenRepeatOverwrites) {
    std::string xml = "<cc:Tag " + k_ns + " Name=\"a\" Name=\"c\" Value=\"b\"/>";
    c_forgiving_reader reader(xml, lmx::elmx_attribute_already_read);
    cc::Tag tag;
    EXPECT_EQ(tag.unmarshal(reader), lmx::elmx_ok);
    EXPECT_EQ(reader.m_count, 1);
    EXPECT_EQ(tag.get_Name(), L"c");
}

TEST(UnmarshalAttributes, ForgivenUnknownAttributeIsSkipped) {
    std::string xml = "<cc:Tag " + k_ns + " Name=\"a\" Odd=\"1\" Value=\"b\"/>";
    c_forgiving_reader reader(xml, lmx::elmx_unexpected_attribute);
    cc::Tag tag;
    EXPECT_EQ(tag.unmarshal(reader), lmx::elmx_ok);
    EXPECT_EQ(reader.m_count, 1);
    EXPECT_EQ(tag.get_Value(), L"b");
}

TEST(UnmarshalAttributes, AutoVersioningSkipsUnknownAttributesAndElements) {
    const std::string xml = "<cc:Tag " + k_ns + " Name=\"a\" Odd=\"1\" Value=\"b\"><cc:New><x/></cc:New></cc:Tag>";
    c_owning_reader reader(xml);
    reader.set_auto_versioning(true);
    cc::Tag tag;
    EXPECT_EQ(tag.unmarshal(reader), lmx::elmx_ok);
    EXPECT_EQ(tag.get_Value(), L"b");
}

// ---------------------------------------------------------------- root element

TEST(UnmarshalRoot, OtherNameIsElementNotFound) {
    cc::Tag tag;
    EXPECT_EQ(read(tag, "<cc:Gat " + k_ns + " Name=\"a\" Value=\"b\"/>"), lmx::elmx_element_not_found);
}

TEST(UnmarshalRoot, OtherNamespaceIsElementNotFound) {
    cc::Tag tag;
    EXPECT_EQ(read(tag, "<cc:Tag xmlns:cc=\"urn:other\" Name=\"a\" Value=\"b\"/>"), lmx::elmx_element_not_found);
    EXPECT_EQ(read(tag, "<Tag Name=\"a\" Value=\"b\"/>"), lmx::elmx_element_not_found);
}

TEST(UnmarshalRoot, AnyPrefixForTheCoreUriMatches) {
    cc::Tag tag;
    EXPECT_EQ(read(tag, std::string("<p:Tag xmlns:p=\"") + cc::k_core_uri + "\" Name=\"a\" Value=\"b\"/>"),
              lmx::elmx_ok);
    EXPECT_EQ(read(tag, std::string("<Tag xmlns=\"") + cc::k_core_uri + "\" Name=\"a\" Value=\"b\"/>"),
              lmx::elmx_ok);
}

TEST(UnmarshalRoot, EmptyInputIsAnError) {
    cc::Tag tag;
    EXPECT_NE(read(tag, ""), lmx::elmx_ok);
    EXPECT_NE(read(tag, "<cc:Tag " + k_ns + " Name=\"a\""), lmx::elmx_ok);
}

// ---------------------------------------------------------------- complex content: cc:FileInformation

const std::string k_file_information = "<cc:FileInformation " + k_ns +
                                       ">\n"
                                       "\t<cc:Creator>Tessarine &amp; co</cc:Creator>\n"
                                       "\t<cc:CreationDate> 2024-05-06T07:08:09Z </cc:CreationDate>\n"
                                       "\t<cc:Description>  two  spaces </cc:Description>\n"
                                       "\t<cc:Comment/>\n"
                                       "\t<cc:Tag Name=\"n1\" Value=\"v1\"/>\n"
                                       "\t<cc:Tag Name=\"n2\" Value=\"v2\"></cc:Tag>\n"
                                       "</cc:FileInformation>";

TEST(UnmarshalComplexContent, ReadsChildrenInOrder) {
    cc::FileInformation info;
    ASSERT_EQ(read(info, k_file_information), lmx::elmx_ok);
    EXPECT_EQ(info.get_Creator(), L"Tessarine & co");
    ASSERT_TRUE(info.isset_CreationDate());
    std::ostringstream date;
    lmx::o_to_v(date, info.get_CreationDate());
    EXPECT_EQ(date.str(), "2024-05-06T07:08:09Z");
    EXPECT_EQ(info.get_Description(), L"  two  spaces "); // strings keep their spaces
    EXPECT_TRUE(info.isset_Comment());
    EXPECT_EQ(info.get_Comment(), L"");
    ASSERT_EQ(info.size_Tag(), 2u);
    EXPECT_EQ(info.get_Tag(0).get_Name(), L"n1");
    EXPECT_EQ(info.get_Tag(1).get_Value(), L"v2");
}

TEST(UnmarshalComplexContent, OptionalChildrenMayBeLeftOut) {
    cc::FileInformation info;
    ASSERT_EQ(read(info, "<cc:FileInformation " + k_ns + "><cc:Tag Name=\"a\" Value=\"b\"/></cc:FileInformation>"),
              lmx::elmx_ok);
    EXPECT_FALSE(info.isset_Creator());
    EXPECT_EQ(info.size_Tag(), 1u);
}

TEST(UnmarshalComplexContent, EmptyElementAcceptedWhenBodyCanBeEmpty) {
    cc::FileInformation info;
    EXPECT_EQ(read(info, "<cc:FileInformation " + k_ns + "/>"), lmx::elmx_ok);
    EXPECT_EQ(read(info, "<cc:FileInformation " + k_ns + "></cc:FileInformation>"), lmx::elmx_ok);
    EXPECT_EQ(read(info, "<cc:FileInformation " + k_ns + ">\n  \n</cc:FileInformation>"), lmx::elmx_ok);
}

TEST(UnmarshalComplexContent, UnknownChildIsBadEndOfElementOfTheParent) {
    cc::FileInformation info;
    lmx::s_debug_error debug;
    EXPECT_EQ(read(info, "<cc:FileInformation " + k_ns + "><cc:Creator>a</cc:Creator><cc:Unknown/></cc:FileInformation>",
                   &debug),
              lmx::elmx_bad_end_of_element);
    EXPECT_EQ(debug.item_name, "cc:FileInformation");
    EXPECT_EQ(info.get_Creator(), L"a"); // no rollback
}

TEST(UnmarshalComplexContent, OutOfOrderChildStopsTheWalk) {
    cc::FileInformation info;
    lmx::s_debug_error debug;
    EXPECT_EQ(read(info, "<cc:FileInformation " + k_ns +
                             "><cc:Comment>c</cc:Comment><cc:Creator>a</cc:Creator></cc:FileInformation>",
                   &debug),
              lmx::elmx_bad_end_of_element);
    EXPECT_EQ(debug.item_name, "cc:FileInformation");
    EXPECT_EQ(info.get_Comment(), L"c");
    EXPECT_FALSE(info.isset_Creator());
}

TEST(UnmarshalComplexContent, SecondSingleChildIsNotRead) {
    cc::FileInformation info;
    EXPECT_EQ(read(info, "<cc:FileInformation " + k_ns +
                             "><cc:Comment>1</cc:Comment><cc:Comment>2</cc:Comment></cc:FileInformation>"),
              lmx::elmx_bad_end_of_element);
    EXPECT_EQ(info.get_Comment(), L"1");
}

TEST(UnmarshalComplexContent, ForeignNamespaceChildIsBadEnd) {
    cc::FileInformation info;
    EXPECT_EQ(read(info, "<cc:FileInformation " + k_ns + " xmlns:o=\"urn:o\"><o:Creator>a</o:Creator></cc:FileInformation>"),
              lmx::elmx_bad_end_of_element);
}

TEST(UnmarshalComplexContent, ErrorInChildTravelsUp) {
    cc::FileInformation info;
    lmx::s_debug_error debug;
    EXPECT_EQ(read(info, "<cc:FileInformation " + k_ns + "><cc:Tag Name=\"a\" Value=\"b\" X=\"1\"/></cc:FileInformation>",
                   &debug),
              lmx::elmx_unexpected_attribute);
    EXPECT_EQ(debug.item_name, "@X");
    EXPECT_EQ(read(info, "<cc:FileInformation " + k_ns + "><cc:CreationDate>yesterday</cc:CreationDate></cc:FileInformation>",
                   &debug),
              lmx::elmx_invalid_value_format);
    EXPECT_EQ(debug.item_name, "cc:CreationDate");
    EXPECT_EQ(debug.prog_line, 202);
}

TEST(UnmarshalComplexContent, MismatchedEndTagIsAnError) {
    cc::FileInformation info;
    EXPECT_NE(read(info, "<cc:FileInformation " + k_ns + "><cc:Creator>a</cc:Comment></cc:FileInformation>"),
              lmx::elmx_ok);
    EXPECT_NE(read(info, "<cc:FileInformation " + k_ns + "><cc:Creator>a</cc:Creator>"), lmx::elmx_ok);
}

TEST(UnmarshalComplexContent, TextInComplexContentIsBadEnd) {
    cc::FileInformation info;
    EXPECT_EQ(read(info, "<cc:FileInformation " + k_ns + ">words</cc:FileInformation>"),
              lmx::elmx_bad_end_of_element);
}

TEST(UnmarshalComplexContent, ChildDeclarationsDoNotLeakToSiblings) {
    cc::FileInformation info;
    EXPECT_EQ(read(info, "<cc:FileInformation " + k_ns +
                             "><q:Creator xmlns:q=\"" + cc::k_core_uri +
                             "\">a</q:Creator><q:Comment>b</q:Comment></cc:FileInformation>"),
              lmx::elmx_bad_end_of_element);
    EXPECT_EQ(info.get_Creator(), L"a");
    EXPECT_FALSE(info.isset_Comment());
}

// ---------------------------------------------------------------- cc:ColorCIELab

std::string lab(const std::string &ar_body, const std::string &ar_attributes = " ColorSpecification=\"cs\"") {
    return "<cc:ColorCIELab " + k_ns + ar_attributes + ">" + ar_body + "</cc:ColorCIELab>";
}

TEST(UnmarshalColorCIELab, ReadsValues) {
    cc::ColorCIELab value;
    ASSERT_EQ(read(value, lab("<cc:L> 50.5 </cc:L><cc:A>-1e1</cc:A><cc:B>INF</cc:B>", " Name=\"n\" ColorSpecification=\"cs\"")),
              lmx::elmx_ok);
    EXPECT_EQ(value.get_ColorSpecification(), L"cs");
    EXPECT_EQ(value.get_Name(), L"n");
    EXPECT_DOUBLE_EQ(value.get_L(), 50.5);
    EXPECT_DOUBLE_EQ(value.get_A(), -10.0);
    EXPECT_TRUE(value.get_B() > 1e308);
    EXPECT_TRUE(value.is_occurs_ok());
}

// Each row is one read: its verdict, and where a row names one, the item
// of the debug record.
TEST(UnmarshalColorCIELab, ErrorsNameTheItem) {
    const tessarine_test::s_read_row rows[] = {
        {"negative L is below minimum", lab("<cc:L>-0.5</cc:L><cc:A>0</cc:A><cc:B>0</cc:B>"),
         lmx::elmx_value_below_minimum, "cc:L"},
        {"negative A has no minimum", lab("<cc:L>0</cc:L><cc:A>-0.5</cc:A><cc:B>0</cc:B>"), lmx::elmx_ok, nullptr},
        {"text that is no number is invalid format", lab("<cc:L>abc</cc:L><cc:A>0</cc:A><cc:B>0</cc:B>"),
         lmx::elmx_invalid_value_format, "cc:L"},
        {"empty number is invalid format", lab("<cc:L/><cc:A>0</cc:A><cc:B>0</cc:B>"),
         lmx::elmx_invalid_value_format, nullptr},
        {"missing first child is mandatory element missing", lab("<cc:A>0</cc:A><cc:B>0</cc:B>"),
         lmx::elmx_mandatory_element_missing, "cc:L"},
        {"missing last child is mandatory element missing", lab("<cc:L>1</cc:L><cc:A>0</cc:A>"),
         lmx::elmx_mandatory_element_missing, "cc:B"},
        {"empty element with required content is unexpected empty",
         "<cc:ColorCIELab " + k_ns + " ColorSpecification=\"cs\"/>", lmx::elmx_unexpected_empty_element,
         "cc:ColorCIELab"},
        {"element with no content is unexpected empty", lab(""), lmx::elmx_unexpected_empty_element, nullptr},
        {"missing ColorSpecification is required attribute missing",
         lab("<cc:L>1</cc:L><cc:A>0</cc:A><cc:B>0</cc:B>", ""), lmx::elmx_required_attribute_missing,
         "ColorCIELab"},
    };
    tessarine_test::expect_reads<cc::ColorCIELab>(rows);
}

TEST(UnmarshalColorCIELab, ForgivenMissingChildGoesOnWithNextRow) {
    c_forgiving_reader reader(lab("<cc:A>2</cc:A><cc:B>3</cc:B>"), lmx::elmx_mandatory_element_missing);
    cc::ColorCIELab value;
    EXPECT_EQ(value.unmarshal(reader), lmx::elmx_ok);
    EXPECT_EQ(reader.m_count, 1);
    EXPECT_DOUBLE_EQ(value.get_A(), 2.0);
    EXPECT_DOUBLE_EQ(value.get_B(), 3.0);
    EXPECT_FALSE(value.is_occurs_ok());
}

TEST(UnmarshalColorCIELab, ForgivenValueErrorKeepsTheValue) {
    c_forgiving_reader reader(lab("<cc:L>-2</cc:L><cc:A>0</cc:A><cc:B>0</cc:B>"), lmx::elmx_value_below_minimum);
    cc::ColorCIELab value;
    EXPECT_EQ(value.unmarshal(reader), lmx::elmx_ok);
    EXPECT_DOUBLE_EQ(value.get_L(), -2.0);
}

// ---------------------------------------------------------------- simple content: lists

std::string spectrum(const std::string &ar_text, const std::string &ar_attributes = " ColorSpecification=\"cs\"") {
    return "<cc:ReflectanceSpectrum " + k_ns + ar_attributes + ">" + ar_text + "</cc:ReflectanceSpectrum>";
}

TEST(UnmarshalSimpleContent, ReadsListOfDoubles) {
    cc::ReflectanceSpectrum value;
    ASSERT_EQ(read(value, spectrum("\n 0.1  0.25\t1e-2\n0 ", " StartWL=\"380\" ColorSpecification=\"cs\"")),
              lmx::elmx_ok);
    EXPECT_EQ(value.get_StartWL(), 380);
    ASSERT_EQ(value.size_value(), 4u);
    EXPECT_DOUBLE_EQ(value.get_value(0), 0.1);
    EXPECT_DOUBLE_EQ(value.get_value(2), 0.01);
    EXPECT_THROW(value.get_value(4), std::out_of_range);
}

TEST(UnmarshalSimpleContent, EmptyListIsNoError) {
    cc::ReflectanceSpectrum value;
    EXPECT_EQ(read(value, spectrum("")), lmx::elmx_ok);
    EXPECT_EQ(value.size_value(), 0u);
    EXPECT_TRUE(value.is_occurs_ok());
    EXPECT_EQ(read(value, "<cc:ReflectanceSpectrum " + k_ns + " ColorSpecification=\"cs\"/>"), lmx::elmx_ok);
    EXPECT_EQ(value.size_value(), 0u);
}

TEST(UnmarshalSimpleContent, BadItemStopsTheList) {
    cc::ReflectanceSpectrum value;
    lmx::s_debug_error debug;
    EXPECT_EQ(read(value, spectrum("1 2 x 4"), &debug), lmx::elmx_invalid_value_format);
    EXPECT_EQ(debug.item_name, "cc:ReflectanceSpectrum");
    EXPECT_EQ(value.size_value(), 2u);
}

TEST(UnmarshalSimpleContent, AttributeRangeIsCheckedOnTheText) {
    cc::ReflectanceSpectrum value;
    EXPECT_EQ(read(value, spectrum("1", " StartWL=\"401\" ColorSpecification=\"cs\"")), lmx::elmx_value_above_maximum);
    EXPECT_EQ(read(value, spectrum("1", " StartWL=\"359\" ColorSpecification=\"cs\"")), lmx::elmx_value_below_minimum);
    EXPECT_EQ(read(value, spectrum("1", " StartWL=\"99999999999999999999\" ColorSpecification=\"cs\"")),
              lmx::elmx_value_above_maximum);
    EXPECT_EQ(read(value, spectrum("1", " StartWL=\"3a\" ColorSpecification=\"cs\"")), lmx::elmx_invalid_value_format);
}

TEST(UnmarshalSimpleContent, ChildElementInSimpleContentIsAnError) {
    cc::ReflectanceSpectrum value;
    EXPECT_NE(read(value, spectrum("1 <cc:X/> 2")), lmx::elmx_ok);
}

TEST(UnmarshalSimpleContent, MissingRequiredAttributeIsReportedBeforeTheBody) {
    cc::ReflectanceSpectrum value;
    EXPECT_EQ(read(value, spectrum("1 2", "")), lmx::elmx_required_attribute_missing);
    EXPECT_EQ(value.size_value(), 0u);
}

// ---------------------------------------------------------------- typed value readers

elmx_error lexical_refuse_all(lmx::c_xml_reader &ar_reader, const std::string &) {
    return ar_reader.handle_error(lmx::elmx_invalid_value_format);
}

const lmx::ct_typed_validation_spec<double> &spec_with_default() {
    static const lmx::ct_typed_validation_spec<double> s_spec(lmx::ws_collapse, "12.5", &lexical_refuse_all,
                                                              &lmx::value_validator_none<double>,
                                                              &lmx::v_to_o<double>, &lmx::o_to_v<double>);
    return s_spec;
}
const lmx::ct_typed_validation_spec<double> &list_spec_with_default() {
    static const lmx::ct_typed_validation_spec<double> s_spec(lmx::ws_preserve, "1 x 3", &lexical_refuse_all,
                                                              &lmx::value_validator_none<double>,
                                                              &lmx::v_to_o<double>, &lmx::o_to_v<double>);
    return s_spec;
}

// Puts the reader on the first element of ar_xml, as a body walk would.
void start(lmx::c_xml_reader &ar_reader) {
    elmx_error error;
    ar_reader.get_element_event(&error);
    ASSERT_EQ(error, lmx::elmx_ok);
}

TEST(UnmarshalValue, EmptyElementTakesTheDefaultWithoutValidation) {
    for (const char *xml : {"<x/>", "<x></x>"}) {
        c_owning_reader reader{std::string(xml)};
        start(reader);
        lmx::ct_simple_pod_single<double> item;
        EXPECT_EQ(reader.unmarshal_child_element(item, spec_with_default(), nullptr), lmx::elmx_ok) << xml;
        EXPECT_TRUE(item.is_value_set());
        EXPECT_DOUBLE_EQ(item.get(), 12.5);
        EXPECT_EQ(reader.get_current_event(), lmx::xe_end_tag);
    }
}

TEST(UnmarshalValue, TextIsValidatedEvenWhenThereIsADefault) {
    c_owning_reader reader{std::string("<x>3</x>")};
    start(reader);
    lmx::ct_simple_pod_single<double> item;
    EXPECT_EQ(reader.unmarshal_child_element(item, spec_with_default(), nullptr), lmx::elmx_invalid_value_format);
    EXPECT_FALSE(item.is_value_set());
}

TEST(UnmarshalValue, ListDefaultIsTakenWithoutValidation) {
    c_owning_reader reader{std::string("<x></x>")};
    start(reader);
    lmx::ct_simple_pod_list_optional<double> item;
    EXPECT_EQ(reader.unmarshal_child_element_list(item, list_spec_with_default(), nullptr), lmx::elmx_ok);
    ASSERT_EQ(item.size(), 3u);
    EXPECT_DOUBLE_EQ(item.get(2), 3.0);
}

TEST(UnmarshalValue, ChildElementFetchesTheNextEventWithTheMap) {
    static const lmx::s_event_map map[] = {{1, "a", 1, 20}, {1, "b", 1, 21}, {0, nullptr, 0, 1}};
    c_owning_reader reader{std::string("<r><a> 1 </a><b>2</b><c/></r>")};
    start(reader);
    bool is_empty;
    reader.skip_start_tag(&is_empty);
    elmx_error error;
    reader.get_element_event(map, &error);
    ASSERT_EQ(reader.get_current_event(), 20);
    lmx::ct_simple_pod_single<double> a, b;
    EXPECT_EQ(reader.unmarshal_child_element(a, cc::spec_double(), map), lmx::elmx_ok);
    EXPECT_EQ(reader.get_current_event(), 21);
    EXPECT_EQ(reader.unmarshal_child_element(b, cc::spec_double(), map + 1), lmx::elmx_ok);
    EXPECT_EQ(reader.get_current_event(), lmx::xe_unknown); // <c/>
    EXPECT_DOUBLE_EQ(a.get(), 1.0);
    EXPECT_DOUBLE_EQ(b.get(), 2.0);
}

TEST(UnmarshalValue, AttributeListValue) {
    c_owning_reader reader{std::string("<x v=\" 1  2 3 \" w=\"\"/>")};
    start(reader);
    lmx::ct_simple_pod_list_single<double> v, w;
    elmx_error error;
    ASSERT_TRUE(reader.get_attribute_event(nullptr, &error, &reader.get_name_buffer()));
    EXPECT_EQ(reader.unmarshal_attribute_list_value(v, cc::spec_double_list()), lmx::elmx_ok);
    ASSERT_TRUE(reader.get_attribute_event(nullptr, &error, &reader.get_name_buffer()));
    EXPECT_EQ(reader.unmarshal_attribute_list_value(w, cc::spec_double_list()), lmx::elmx_ok);
    EXPECT_EQ(v.size(), 3u);
    EXPECT_TRUE(w.is_value_set());
    EXPECT_EQ(w.size(), 0u);
}

// ---------------------------------------------------------------- the driver alone

// Records which callbacks the driver made.
class c_probe_helper : public lmx::c_unmarshal_helper {
public:
    explicit c_probe_helper(lmx::c_xml_reader &ar_reader) : c_unmarshal_helper(ar_reader) {}
    bool unmarshal_attribute(elmx_error *ap_error) override {
        *ap_error = lmx::elmx_ok;
        ++m_attributes;
        return false;
    }
    elmx_error unmarshal_attributes_check() override {
        ++m_checks;
        return lmx::elmx_ok;
    }
    bool unmarshal_complex_body(elmx_error *ap_error) override {
        ++m_bodies;
        *ap_error = ar_reader.handle_error(lmx::elmx_mandatory_element_missing);
        return *ap_error == lmx::elmx_ok;
    }
    bool is_nil() const override { return m_is_nil; }
    int m_attributes = 0, m_checks = 0, m_bodies = 0;
    bool m_is_nil = false;
};

TEST(UnmarshalDriver, SelfClosedElementWithEmptyBodyAllowedCallsNothing) {
    c_owning_reader reader{std::string("<a/>")};
    start(reader);
    c_probe_helper helper(reader);
    helper.set_body_can_be_empty();
    EXPECT_EQ(helper.unmarshal_complex_content("probe", 1), lmx::elmx_ok);
    EXPECT_EQ(helper.m_bodies, 0);
    EXPECT_EQ(helper.m_checks, 1);
}

TEST(UnmarshalDriver, EmptyElementWithoutFlagIsUnexpectedEmpty) {
    for (const char *xml : {"<a/>", "<a></a>"}) {
        c_owning_reader reader{std::string(xml)};
        start(reader);
        c_probe_helper helper(reader);
        EXPECT_EQ(helper.unmarshal_complex_content("probe", 7), lmx::elmx_unexpected_empty_element) << xml;
        EXPECT_EQ(helper.m_bodies, 0);
        EXPECT_EQ(reader.get_debug_error().item_name, "a");
        EXPECT_STREQ(reader.get_debug_error().p_prog_file, "probe");
        EXPECT_EQ(reader.get_debug_error().prog_line, 7);
    }
}

TEST(UnmarshalDriver, ContentWithMissingChildIsMandatoryElementMissing) {
    c_owning_reader reader{std::string("<a><b/></a>")};
    start(reader);
    c_probe_helper helper(reader);
    helper.set_body_can_be_empty();
    EXPECT_EQ(helper.unmarshal_complex_content("probe", 1), lmx::elmx_mandatory_element_missing);
    EXPECT_EQ(helper.m_bodies, 1);
}

TEST(UnmarshalDriver, NilElementMustBeEmpty) {
    const std::string decl = " " + k_xsi + " xsi:nil=\"true\"";
    for (const std::string &xml : {"<a" + decl + "/>", "<a" + decl + "></a>"}) {
        c_owning_reader reader(xml);
        start(reader);
        c_probe_helper helper(reader);
        helper.m_is_nil = true;
        EXPECT_EQ(helper.unmarshal_complex_content("probe", 1), lmx::elmx_ok) << xml;
        EXPECT_EQ(helper.m_bodies, 0);
    }
    for (const std::string &xml : {"<a" + decl + "><b/></a>", "<a" + decl + ">text</a>"}) {
        c_owning_reader reader(xml);
        start(reader);
        c_probe_helper helper(reader);
        helper.m_is_nil = true;
        EXPECT_EQ(helper.unmarshal_complex_content("probe", 1), lmx::elmx_bad_end_of_element) << xml;
    }
}

TEST(UnmarshalDriver, NilSimpleElementChecksOnlyTheEndTag) {
    c_owning_reader reader("<a " + k_xsi + " xsi:nil=\"true\"></a>");
    start(reader);
    c_probe_helper helper(reader);
    helper.m_is_nil = true;
    EXPECT_EQ(helper.unmarshal_simple_content("probe", 1), lmx::elmx_ok);
    c_owning_reader with_text("<a " + k_xsi + " xsi:nil=\"true\">1</a>");
    start(with_text);
    c_probe_helper text_helper(with_text);
    text_helper.m_is_nil = true;
    EXPECT_EQ(text_helper.unmarshal_simple_content("probe", 1), lmx::elmx_bad_end_of_element);
}

TEST(UnmarshalDriver, AnyAttributeStoreKeepsUnknownAttributes) {
    c_owning_reader reader(std::string("<a xmlns=\"urn:default\" xmlns:p=\"urn:p\" plain=\"1 &amp; 2\" p:q=\" x \" ") +
                                    k_xsi + " xsi:type=\"t\"/>");
    start(reader);
    lmx::c_any_attribute_store store;
    c_probe_helper helper(reader);
    helper.set_body_can_be_empty();
    helper.set_anyattributes_store(&store);
    EXPECT_EQ(helper.unmarshal_complex_content("probe", 1), lmx::elmx_ok);
    ASSERT_EQ(store.size(), 2u); // xsi:type is not kept
    EXPECT_EQ(store[0].get_name(), "plain");
    EXPECT_EQ(store[0].get_value(), "1 & 2");
    EXPECT_EQ(store[0].get_namespace(), lmx::c_xml::k_non_namespace);
    EXPECT_EQ(store[1].get_name(), "p:q");
    EXPECT_EQ(store[1].get_value(), " x ");
    EXPECT_EQ(store[1].get_namespace(), "urn:p");
    lmx::c_any_attribute_store copy(store);
    EXPECT_EQ(copy[1], store[1]);
    EXPECT_NE(&copy[1], &store[1]);
}

// ---------------------------------------------------------------- wildcards and c_any_info

TEST(UnmarshalAny, CapturedElementReadsBackWithItsNamespaceContext) {
    // The prefix is declared on the outer element only.
    const std::string xml = std::string("<w xmlns:cc=\"") + cc::k_core_uri +
                            "\" xmlns:o=\"urn:o\"><cc:FileInformation><cc:Creator o:x=\"1\">me &amp; you</cc:Creator>"
                            "<cc:Tag Name=\"a\" Value=\"b\"/></cc:FileInformation><after/></w>";
    c_owning_reader reader(xml);
    start(reader);
    bool is_empty;
    reader.skip_start_tag(&is_empty);
    lmx::c_xml_reader_local scope(reader);
    elmx_error error;
    reader.get_element_event(&error);
    ASSERT_EQ(reader.get_name(), "cc:FileInformation");
    lmx::ct_simple_non_pod_single<lmx::c_any_info> item;
    static const lmx::s_event_map map[] = {{1, "after", 5, 30}, {0, nullptr, 0, 1}};
    ASSERT_EQ(reader.unmarshal_any_child_element(item, map), lmx::elmx_ok);
    EXPECT_EQ(reader.get_current_event(), 30);
    ASSERT_TRUE(item.is_value_set());
    const lmx::c_any_info &info = item.get();
    EXPECT_EQ(info.get_namespace(), cc::k_core_uri);
    EXPECT_EQ(info.get_name(), "cc:FileInformation");
    EXPECT_NE(info.get_value().find("me &amp; you"), std::string::npos); // as written
    EXPECT_EQ(info.get_value().find("xmlns:cc"), std::string::npos);
    ASSERT_GE(info.get_namespace_context().size(), 2u);

    cc::FileInformation from_any(info, &error);
    ASSERT_EQ(error, lmx::elmx_ok);
    EXPECT_EQ(from_any.get_Creator(), L"me & you");
    ASSERT_EQ(from_any.size_Tag(), 1u);

    lmx::c_any_info without_context(info.get_namespace(), info.get_name(), info.get_value());
    cc::FileInformation bare;
    EXPECT_NE(bare.unmarshal(without_context), lmx::elmx_ok);
}

// ---------------------------------------------------------------- files

struct temp_file {
    explicit temp_file(const std::string &ar_text) {
        path = ::testing::TempDir() + "unmarshal_test_" +
               ::testing::UnitTest::GetInstance()->current_test_info()->name() + ".xml";
        std::ofstream(path, std::ios::binary) << ar_text;
    }
    ~temp_file() { std::remove(path.c_str()); }
    std::string path;
};

TEST(UnmarshalFile, MissingFileIsUnableToOpenAndLeavesDebugAlone) {
    lmx::s_debug_error debug;
    debug.set(lmx::elmx_user_defined_1, "marker", "here", 42, 7);
    cc::FileInformation info;
    EXPECT_EQ(info.unmarshal("/nonexistent/dir/none.cxf", &debug), lmx::elmx_unable_to_open_file);
    EXPECT_EQ(info.unmarshal(L"/nonexistent/dir/none.cxf", &debug), lmx::elmx_unable_to_open_file);
    EXPECT_EQ(debug.error, lmx::elmx_user_defined_1);
    EXPECT_EQ(debug.item_name, "marker");
    EXPECT_EQ(debug.prog_line, 42);
    elmx_error error;
    cc::FileInformation constructed("/nonexistent/dir/none.cxf", &error, &debug);
    EXPECT_EQ(error, lmx::elmx_unable_to_open_file);
}

TEST(UnmarshalFile, ReadsNarrowAndWidePaths) {
    temp_file file("\xEF\xBB\xBF<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n" + k_file_information);
    lmx::s_debug_error debug;
    cc::FileInformation info;
    EXPECT_EQ(info.unmarshal(file.path.c_str(), &debug), lmx::elmx_ok);
    EXPECT_EQ(debug.error, lmx::elmx_ok);
    EXPECT_EQ(info.size_Tag(), 2u);
    std::wstring wide(file.path.begin(), file.path.end());
    cc::FileInformation info2;
    EXPECT_EQ(info2.unmarshal(wide.c_str()), lmx::elmx_ok);
    EXPECT_EQ(info2.get_Creator(), L"Tessarine & co");
}

TEST(UnmarshalFile, ErrorInFileIsCopiedToDebug) {
    temp_file file("<cc:Tag " + k_ns + "\n Name=\"a\"\n Bad=\"b\" Value=\"c\"/>");
    lmx::s_debug_error debug;
    cc::Tag tag;
    EXPECT_EQ(lmx::unmarshal(tag, file.path.c_str(), &debug), lmx::elmx_unexpected_attribute);
    EXPECT_EQ(debug.error, lmx::elmx_unexpected_attribute);
    EXPECT_EQ(debug.item_name, "@Bad");
}

TEST(UnmarshalMemory, ReadsABlockAndAString) {
    const std::string xml = "<cc:Tag " + k_ns + " Name=\"a\" Value=\"b\"/>trailing garbage is never read";
    cc::Tag tag;
    EXPECT_EQ(tag.unmarshal(xml.data(), xml.size()), lmx::elmx_ok);
    elmx_error error;
    cc::Tag from_block(xml.data(), xml.size(), &error);
    EXPECT_EQ(error, lmx::elmx_ok);
    cc::Tag from_string(xml, &error);
    EXPECT_EQ(error, lmx::elmx_ok);
    EXPECT_EQ(from_string.get_Value(), L"b");
}

// ---------------------------------------------------------------- looking ahead

TEST(InstanceNamespace, GivesTheRootNamespaceAndRewinds) {
    c_owning_reader reader("<?xml version=\"1.0\"?><!-- c --><p:FileInformation xmlns:p=\"" +
                                    std::string(cc::k_core_uri) + "\"/>");
    std::string ns;
    EXPECT_TRUE(lmx::get_instance_namespace(reader, &ns));
    EXPECT_EQ(ns, cc::k_core_uri);
    cc::FileInformation info;
    EXPECT_EQ(info.unmarshal(reader), lmx::elmx_ok); // read from the start again
}

TEST(InstanceNamespace, UndeclaredPrefixOrNoRootIsFalse) {
    std::string ns = "unchanged";
    c_owning_reader undeclared{std::string("<q:a/>")};
    EXPECT_FALSE(lmx::get_instance_namespace(undeclared, &ns));
    c_owning_reader nothing{std::string("")};
    EXPECT_FALSE(lmx::get_instance_namespace(nothing, &ns));
    EXPECT_EQ(ns, "unchanged");
    c_owning_reader unprefixed{std::string("<a/>")};
    EXPECT_TRUE(lmx::get_instance_namespace(unprefixed, &ns));
    EXPECT_EQ(ns, lmx::c_xml::k_non_namespace);
}

TEST(MustUnderstand, BoolForms) {
    EXPECT_EQ(lmx::bool_must_understand("1"), lmx::mu_yes);
    EXPECT_EQ(lmx::bool_must_understand("true"), lmx::mu_yes);
    EXPECT_EQ(lmx::bool_must_understand("0"), lmx::mu_no);
    EXPECT_EQ(lmx::bool_must_understand("false"), lmx::mu_no);
    EXPECT_EQ(lmx::bool_must_understand("TRUE"), lmx::mu_unknown);
    EXPECT_EQ(lmx::bool_must_understand(""), lmx::mu_unknown);
}

lmx::elmx_must_understand scan(const std::string &ar_xml) {
    c_owning_reader reader(ar_xml);
    return lmx::has_must_understand(reader, "urn:s", "mustUnderstand", &lmx::bool_must_understand);
}

TEST(MustUnderstand, FindsTheAttributeAnywhere) {
    EXPECT_EQ(scan("<e xmlns:s=\"urn:s\"><h>text<x s:mustUnderstand=\"1\"/></h></e>"), lmx::mu_yes);
    EXPECT_EQ(scan("<e xmlns:s=\"urn:s\" s:mustUnderstand=\"true\"/>"), lmx::mu_yes);
    EXPECT_EQ(scan("<e xmlns:s=\"urn:s\"><h s:mustUnderstand=\"0\">t</h><i/></e>"), lmx::mu_no);
    EXPECT_EQ(scan("<e xmlns:s=\"urn:s\"><h s:mustUnderstand=\"maybe\"/></e>"), lmx::mu_unknown);
}

TEST(MustUnderstand, OtherNamespaceOrNoNamespaceDoesNotCount) {
    EXPECT_EQ(scan("<e xmlns:t=\"urn:t\"><h t:mustUnderstand=\"1\" mustUnderstand=\"1\"/></e>"), lmx::mu_no);
    EXPECT_EQ(scan("<e><x:h xmlns:x=\"urn:s\" x:mustUnderstand=\"1\"/></e>"), lmx::mu_yes);
    EXPECT_EQ(scan("<e><x:h xmlns:x=\"urn:s\"/><h x:mustUnderstand=\"1\"/></e>"), lmx::mu_no);
}

TEST(MustUnderstand, BrokenOrEmptyDocumentIsUnknown) {
    EXPECT_EQ(scan(""), lmx::mu_unknown);
    EXPECT_EQ(scan("<e><h></e>"), lmx::mu_unknown);
    EXPECT_EQ(scan("<e><h/>"), lmx::mu_unknown);
}

// ---------------------------------------------------------------- nesting depth

std::string nodes(int a_depth, bool a_close = true) {
    std::string xml;
    xml.reserve(static_cast<std::size_t>(a_depth) * 20);
    xml += "<cc:Node " + k_ns + ">";
    for (int i = 1; i < a_depth; ++i)
        xml += "<cc:Node>";
    if (a_close)
        for (int i = 0; i < a_depth; ++i)
            xml += "</cc:Node>";
    return xml;
}

TEST(UnmarshalDepth, ThousandLevelsAreRead) {
    cc::Node node;
    ASSERT_EQ(read(node, nodes(1000)), lmx::elmx_ok);
    EXPECT_EQ(node.depth(), 1000u);
    cc::Node copy(node);
    EXPECT_EQ(copy.depth(), 1000u);
}

TEST(UnmarshalDepth, OneLevelMoreIsNotWellFormed) {
    cc::Node node;
    lmx::s_debug_error debug;
    EXPECT_EQ(read(node, nodes(1001), &debug), lmx::elmx_not_well_formed);
    EXPECT_EQ(debug.error, lmx::elmx_not_well_formed);
}

TEST(UnmarshalDepth, HundredThousandLevelsFailWithoutCrashing) {
    cc::Node node;
    EXPECT_EQ(read(node, nodes(100000)), lmx::elmx_not_well_formed);
    EXPECT_EQ(read(node, nodes(100000, false)), lmx::elmx_not_well_formed);
}

TEST(MustUnderstand, NestingLimitGivesUnknownAndRecordsTheError) {
    c_owning_reader ok_reader(nodes(1000));
    EXPECT_EQ(lmx::has_must_understand(ok_reader, "urn:s", "mustUnderstand", &lmx::bool_must_understand), lmx::mu_no);
    c_owning_reader deep_reader(nodes(1001));
    EXPECT_EQ(lmx::has_must_understand(deep_reader, "urn:s", "mustUnderstand", &lmx::bool_must_understand),
              lmx::mu_unknown);
    EXPECT_EQ(deep_reader.get_error(), lmx::elmx_not_well_formed);
    c_owning_reader huge_reader(nodes(100000, false));
    EXPECT_EQ(lmx::has_must_understand(huge_reader, "urn:s", "mustUnderstand", &lmx::bool_must_understand),
              lmx::mu_unknown);
}

// ---------------------------------------------------------------- containers

TEST(Containers, SimpleSingleAndOptional) {
    lmx::ct_simple_pod_single<int> single;
    EXPECT_FALSE(single.is_value_set());
    EXPECT_FALSE(single.is_occurs_ok());
    EXPECT_EQ(single.count(), 0u);
    single.set(5);
    EXPECT_TRUE(single.is_occurs_ok());
    EXPECT_EQ(single.count(), 1u);
    EXPECT_EQ(single.access_value(0), 5);
    single.unset();
    EXPECT_FALSE(single.is_value_set());
    EXPECT_EQ(single.get(), 0);
    lmx::ct_simple_non_pod_optional<std::wstring> optional;
    EXPECT_TRUE(optional.is_occurs_ok());
    EXPECT_FALSE(optional.is_in_mixed());
    optional.mk_new_space();
    EXPECT_TRUE(optional.is_value_set());
    optional.get_new_space_value_ref() = L"x";
    lmx::ct_simple_non_pod_optional<std::wstring> other;
    other.swap(optional);
    EXPECT_EQ(other.get(), L"x");
    EXPECT_FALSE(optional.is_value_set());
}

TEST(Containers, Lists) {
    lmx::ct_simple_pod_list_optional<double> list;
    EXPECT_FALSE(list.is_value_set());
    list.append(1);
    list.append(3);
    list.insert(1, 2);
    list.set(0, 0.5);
    EXPECT_TRUE(list.is_value_set());
    EXPECT_EQ(list.count(), 3u);
    EXPECT_DOUBLE_EQ(list.get(1), 2.0);
    EXPECT_DOUBLE_EQ(list.get(0), 0.5);
    EXPECT_THROW(list.get(3), std::out_of_range);
    EXPECT_THROW(list.insert(9, 1.0), std::out_of_range);
    list.start_new_list();
    EXPECT_EQ(list.size(), 0u);
    EXPECT_FALSE(list.is_value_set()); // an empty optional list is not written
    lmx::ct_simple_pod_list_single<double> required;
    EXPECT_FALSE(required.is_occurs_ok());
    required.start_new_list();
    EXPECT_TRUE(required.is_occurs_ok());
}

TEST(Containers, ComplexOptionalAndSingle) {
    lmx::ct_complex_optional<cc::Tag> optional;
    const auto &const_view = optional;
    EXPECT_EQ(const_view.get(), nullptr);
    EXPECT_FALSE(optional.is_value_set());
    optional.get().set_Name(L"n"); // made on first use
    EXPECT_TRUE(optional.is_value_set());
    lmx::ct_complex_optional<cc::Tag> copy(optional);
    copy.get().set_Name(L"m");
    EXPECT_EQ(optional.get().get_Name(), L"n"); // deep
    optional.unset();
    EXPECT_EQ(const_view.get(), nullptr);
    lmx::ct_complex_single<cc::Tag> single;
    EXPECT_FALSE(single.is_occurs_ok());
    cc::Tag tag;
    tag.set_Value(L"v");
    single.assign(tag);
    EXPECT_TRUE(single.is_occurs_ok());
    EXPECT_EQ(single.get().get_Value(), L"v");
    lmx::ct_complex_single<cc::Tag> empty;
    empty.swap(single);
    EXPECT_FALSE(single.is_occurs_ok());
    EXPECT_TRUE(empty.is_occurs_ok());
}

TEST(Containers, ComplexMulti) {
    lmx::ct_complex_multi<cc::Tag> multi;
    EXPECT_TRUE(multi.empty());
    EXPECT_FALSE(multi.is_occurs_ok(1));
    multi.append().set_Name(L"a");
    cc::Tag c;
    c.set_Name(L"c");
    multi.append(c);
    multi.insert(1).set_Name(L"b");
    ASSERT_EQ(multi.size(), 3u);
    EXPECT_EQ(multi.get(1).get_Name(), L"b");
    EXPECT_EQ(multi.back().get_Name(), L"c");
    EXPECT_THROW(multi.get(3), std::out_of_range);
    EXPECT_TRUE(multi.is_occurs_ok(1, 3));
    EXPECT_FALSE(multi.is_occurs_ok(1, 2));
    lmx::ct_complex_multi<cc::Tag> copy(multi);
    copy.get(0).set_Name(L"z");
    EXPECT_EQ(multi.get(0).get_Name(), L"a");
    multi.assign(0, copy.get(0));
    EXPECT_EQ(multi.get(0).get_Name(), L"z");
    EXPECT_THROW(multi.assign(5, c), std::out_of_range);
    multi.erase(0);
    EXPECT_EQ(multi.get(0).get_Name(), L"b");
    EXPECT_THROW(multi.erase(7), std::out_of_range);
    copy = multi;
    EXPECT_EQ(copy.size(), 2u);
    multi.clear();
    EXPECT_TRUE(multi.empty());
    multi.swap(copy);
    EXPECT_EQ(multi.size(), 2u);
}

TEST(Containers, NonPodContainerTakesOwnership) {
    lmx::c_any_attribute_store store;
    std::unique_ptr<lmx::c_any_info> item(new lmx::c_any_info("u", "n", "v"));
    store.push_back_w_autop(item);
    EXPECT_EQ(item.get(), nullptr);
    store.push_back(new lmx::c_any_info("u2", "n2", "v2"));
    EXPECT_EQ(store.size(), 2u);
    EXPECT_EQ(store.at(1).get_name(), "n2");
    EXPECT_EQ(store.raw_container().size(), 2u);
    EXPECT_THROW(store.at(2), std::out_of_range);
}

TEST(BoundClass, CopyResetAndClone) {
    cc::FileInformation info;
    ASSERT_EQ(read(info, k_file_information), lmx::elmx_ok);
    cc::FileInformation copy(info);
    copy.get_Tag(0).set_Name(L"changed");
    EXPECT_EQ(info.get_Tag(0).get_Name(), L"n1");
    std::unique_ptr<cc::FileInformation> clone(info.clone());
    EXPECT_EQ(clone->size_Tag(), 2u);
    cc::FileInformation assigned;
    assigned = info;
    EXPECT_EQ(assigned.get_Creator(), L"Tessarine & co");
    info.reset();
    EXPECT_EQ(info.size_Tag(), 0u);
    EXPECT_FALSE(info.isset_Creator());
}

// ---------------------------------------------------------------- round trips through the writer

const std::string k_prolog = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n";
const std::string k_xsi_uri = "http://www.w3.org/2001/XMLSchema-instance";

TEST(RoundTrip, FileInformationIsWrittenInTheWriterLayout) {
    cc::FileInformation info;
    ASSERT_EQ(read(info, k_file_information), lmx::elmx_ok);
    std::string out;
    ASSERT_EQ(info.marshal(out), lmx::elmx_ok);
    const std::string expected = k_prolog + "<cc:FileInformation xmlns:cc=\"" + cc::k_core_uri + "\"\n" +
                                 "\t\txmlns:xsi=\"" + k_xsi_uri + "\">\n" +
                                 "\t<cc:Creator>Tessarine &amp; co</cc:Creator>\n"
                                 "\t<cc:CreationDate>2024-05-06T07:08:09Z</cc:CreationDate>\n"
                                 "\t<cc:Description>  two  spaces </cc:Description>\n"
                                 "\t<cc:Comment></cc:Comment>\n"
                                 "\t<cc:Tag Name=\"n1\"\n"
                                 "\t\t\tValue=\"v1\"/>\n"
                                 "\t<cc:Tag Name=\"n2\"\n"
                                 "\t\t\tValue=\"v2\"/>\n"
                                 "</cc:FileInformation>\n";
    EXPECT_EQ(out, expected);
    // And what was written reads back to the same text.
    cc::FileInformation again;
    ASSERT_EQ(read(again, out), lmx::elmx_ok);
    std::string out2;
    ASSERT_EQ(again.marshal(out2), lmx::elmx_ok);
    EXPECT_EQ(out2, out);
}

TEST(RoundTrip, EmptyElementIsSelfClosed) {
    cc::FileInformation info;
    ASSERT_EQ(read(info, "<cc:FileInformation " + k_ns + "/>"), lmx::elmx_ok);
    std::string out;
    ASSERT_EQ(info.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, k_prolog + "<cc:FileInformation xmlns:cc=\"" + cc::k_core_uri + "\"\n\t\txmlns:xsi=\"" + k_xsi_uri +
                       "\"/>\n");
}

TEST(RoundTrip, ColorCIELabNumbersAndMissingRequiredMember) {
    cc::ColorCIELab value;
    ASSERT_EQ(read(value, lab("<cc:L>50.5</cc:L><cc:A>-0.25</cc:A><cc:B>1e-3</cc:B>")), lmx::elmx_ok);
    std::string out;
    ASSERT_EQ(value.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, k_prolog + "<cc:ColorCIELab xmlns:cc=\"" + cc::k_core_uri + "\"\n\t\txmlns:xsi=\"" + k_xsi_uri +
                       "\"\n\t\tColorSpecification=\"cs\">\n"
                       "\t<cc:L>50.5</cc:L>\n\t<cc:A>-0.25</cc:A>\n\t<cc:B>0.001</cc:B>\n</cc:ColorCIELab>\n");

    cc::ColorCIELab incomplete;
    incomplete.set_L(1);
    incomplete.set_A(2);
    incomplete.set_B(3);
    std::string nothing = "untouched";
    EXPECT_EQ(incomplete.marshal(nothing), lmx::elmx_marshal_occurs_error);
    EXPECT_EQ(nothing, "untouched");
    incomplete.set_ColorSpecification(L"cs");
    incomplete.set_L(-1);
    lmx::s_debug_error debug;
    EXPECT_EQ(incomplete.marshal(nothing, &debug), lmx::elmx_value_below_minimum);
    EXPECT_EQ(debug.item_name, "cc:L");
}

TEST(RoundTrip, SpectrumListBody) {
    cc::ReflectanceSpectrum value;
    ASSERT_EQ(read(value, spectrum(" 0.5\n 1  2.25 ", " ColorSpecification=\"cs\" StartWL=\"380\"")), lmx::elmx_ok);
    std::string out;
    ASSERT_EQ(value.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, k_prolog + "<cc:ReflectanceSpectrum xmlns:cc=\"" + cc::k_core_uri + "\"\n\t\txmlns:xsi=\"" +
                       k_xsi_uri + "\"\n\t\tStartWL=\"380\"\n\t\tColorSpecification=\"cs\">0.5 1 2.25</cc:ReflectanceSpectrum>\n");
}

TEST(RoundTrip, FileOnDiskReadsBack) {
    cc::FileInformation info;
    ASSERT_EQ(read(info, k_file_information), lmx::elmx_ok);
    temp_file file("");
    ASSERT_EQ(info.marshal(file.path.c_str()), lmx::elmx_ok);
    cc::FileInformation again;
    ASSERT_EQ(again.unmarshal(file.path.c_str()), lmx::elmx_ok);
    EXPECT_EQ(again.get_Tag(1).get_Value(), L"v2");
}

TEST(RoundTrip, DeepNodesWriteAndReadBack) {
    cc::Node node;
    ASSERT_EQ(read(node, nodes(200)), lmx::elmx_ok);
    std::string out;
    ASSERT_EQ(node.marshal(out), lmx::elmx_ok);
    cc::Node again;
    ASSERT_EQ(read(again, out), lmx::elmx_ok);
    EXPECT_EQ(again.depth(), 200u);
}

} // namespace
