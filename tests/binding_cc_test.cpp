// The generated classes of the core group: cc::FileInformation with its
// cc::Tag children read from text, written back, and refused where the
// format says so.
#include <gtest/gtest.h>

#include <memory>
#include <string>

#include <cxf/v3/cxf3.h>

#include "bound_reads.h"

namespace {

using lmx::elmx_error;
using tessarine_test::read;

const std::string k_ns = std::string("xmlns:cc=\"") + cc::k_namespace_uri + "\"";
const std::string k_prolog = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n";
const std::string k_xsi_uri = "http://www.w3.org/2001/XMLSchema-instance";

// What the writer makes of a full cc:FileInformation: the layout of the
// writer, so that reading it and writing it again gives the same bytes.
const std::string k_written = k_prolog + "<cc:FileInformation xmlns:cc=\"" + cc::k_namespace_uri + "\"\n" +
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

TEST(BindingCcFileInformation, ReadsChildrenAndTags) {
    const std::string text = "<cc:FileInformation " + k_ns +
                             ">\n"
                             "  <cc:Creator>Tessarine &amp; co</cc:Creator>\n"
                             "  <cc:CreationDate> 2024-05-06T07:08:09Z </cc:CreationDate>\n"
                             "  <cc:Description>  two  spaces </cc:Description>\n"
                             "  <cc:Comment/>\n"
                             "  <cc:Tag Value=\"v1\" Name=\"n1\"/>\n"
                             "  <cc:Tag Name=\"n2\" Value=\"v2\"></cc:Tag>\n"
                             "</cc:FileInformation>";
    elmx_error error = lmx::elmx_ok;
    cc::FileInformation info(text, &error);
    ASSERT_EQ(error, lmx::elmx_ok);
    EXPECT_EQ(info.get_Creator(), L"Tessarine & co");
    EXPECT_TRUE(info.isset_CreationDate());
    EXPECT_EQ(info.get_Description(), L"  two  spaces ");
    EXPECT_TRUE(info.isset_Comment());
    EXPECT_EQ(info.get_Comment(), L"");
    ASSERT_EQ(info.size_Tag(), 2u);
    EXPECT_EQ(info.get_Tag(0).get_Name(), L"n1");
    EXPECT_EQ(info.get_Tag(0).get_Value(), L"v1");
    EXPECT_EQ(info.get_Tag(1).get_Name(), L"n2");

    std::string out;
    ASSERT_EQ(info.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, k_written);
}

TEST(BindingCcFileInformation, RoundTripIsByteForByte) {
    cc::FileInformation info;
    ASSERT_EQ(read(info, k_written), lmx::elmx_ok);
    std::string out;
    ASSERT_EQ(info.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, k_written);

    // A copy owns its own tags and writes the same.
    cc::FileInformation copy(info);
    info.get_Tag(0).set_Value(L"changed");
    std::string from_copy;
    ASSERT_EQ(copy.marshal(from_copy), lmx::elmx_ok);
    EXPECT_EQ(from_copy, k_written);
}

TEST(BindingCcFileInformation, BuiltThroughAccessorsWritesAndReadsBack) {
    cc::FileInformation info;
    EXPECT_TRUE(info.is_occurs_ok());
    EXPECT_EQ(info.set_Creator(L"me"), lmx::elmx_ok);
    cc::Tag &tag = info.append_Tag();
    tag.set_Name(L"k");
    tag.set_Value(L"v");
    cc::Tag second;
    second.set_Name(L"k2");
    second.set_Value(L"v2");
    info.append_Tag(second);
    info.insert_Tag(0, second);
    info.delete_Tag(0);
    ASSERT_EQ(info.size_Tag(), 2u);

    std::string out;
    ASSERT_EQ(info.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, k_prolog + "<cc:FileInformation xmlns:cc=\"" + cc::k_namespace_uri + "\"\n\t\txmlns:xsi=\"" +
                       k_xsi_uri +
                       "\">\n\t<cc:Creator>me</cc:Creator>\n"
                       "\t<cc:Tag Name=\"k\"\n\t\t\tValue=\"v\"/>\n"
                       "\t<cc:Tag Name=\"k2\"\n\t\t\tValue=\"v2\"/>\n</cc:FileInformation>\n");
    cc::FileInformation again;
    ASSERT_EQ(read(again, out), lmx::elmx_ok);
    EXPECT_EQ(again.get_Creator(), L"me");
    EXPECT_FALSE(again.isset_Comment());
    EXPECT_EQ(again.get_Tag(1).get_Value(), L"v2");

    again.unset_Creator();
    again.clear_Tag();
    EXPECT_FALSE(again.isset_Creator());
    EXPECT_EQ(again.size_Tag(), 0u);
}

TEST(BindingCcFileInformation, EmptyElementIsAccepted) {
    cc::FileInformation info;
    EXPECT_EQ(read(info, "<cc:FileInformation " + k_ns + "/>"), lmx::elmx_ok);
    EXPECT_EQ(read(info, "<cc:FileInformation " + k_ns + "></cc:FileInformation>"), lmx::elmx_ok);
    std::string out;
    ASSERT_EQ(info.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, k_prolog + "<cc:FileInformation xmlns:cc=\"" + cc::k_namespace_uri + "\"\n\t\txmlns:xsi=\"" +
                       k_xsi_uri + "\"/>\n");
}

// Each row is one read that fails: its verdict and the item of the debug
// record.
TEST(BindingCcFileInformation, ErrorPaths) {
    const std::string open = "<cc:FileInformation " + k_ns + ">";
    const std::string close = "</cc:FileInformation>";
    const tessarine_test::s_read_row rows[] = {
        {"tag without Name", open + "<cc:Tag Value=\"v\"/>" + close, lmx::elmx_required_attribute_missing, "Tag"},
        {"tag without Value", open + "<cc:Tag Name=\"n\"/>" + close, lmx::elmx_required_attribute_missing, "Tag"},
        {"unknown child", open + "<cc:Creator>a</cc:Creator><cc:Unknown/>" + close, lmx::elmx_bad_end_of_element,
         "cc:FileInformation"},
        {"child out of order", open + "<cc:Comment>c</cc:Comment><cc:Creator>a</cc:Creator>" + close,
         lmx::elmx_bad_end_of_element, "cc:FileInformation"},
        {"unknown attribute", "<cc:FileInformation " + k_ns + " Extra=\"1\"/>", lmx::elmx_unexpected_attribute,
         "@Extra"},
        {"unknown attribute of a tag", open + "<cc:Tag Name=\"n\" Value=\"v\" X=\"1\"/>" + close,
         lmx::elmx_unexpected_attribute, "@X"},
        {"content in a tag", open + "<cc:Tag Name=\"n\" Value=\"v\"><cc:Comment/></cc:Tag>" + close,
         lmx::elmx_bad_end_of_element, "cc:Tag"},
        {"other root", "<cc:Tag " + k_ns + " Name=\"n\" Value=\"v\"/>", lmx::elmx_element_not_found, "cc:Tag"},
    };
    tessarine_test::expect_reads<cc::FileInformation>(rows);
}

TEST(BindingCcTag, MissingRequiredAttributeIsNotWritten) {
    cc::Tag tag;
    tag.set_Name(L"n");
    EXPECT_FALSE(tag.is_occurs_ok());
    std::string out = "untouched";
    EXPECT_EQ(tag.marshal(out), lmx::elmx_marshal_occurs_error);
    EXPECT_EQ(out, "untouched");

    // Inside a file information, the whole write fails.
    cc::FileInformation info;
    info.append_Tag(tag);
    EXPECT_EQ(info.marshal(out), lmx::elmx_marshal_occurs_error);

    tag.set_Value(L"v");
    EXPECT_TRUE(tag.is_occurs_ok());
    ASSERT_EQ(tag.marshal(out), lmx::elmx_ok);
    EXPECT_EQ(out, k_prolog + "<cc:Tag xmlns:cc=\"" + cc::k_namespace_uri + "\"\n\t\txmlns:xsi=\"" + k_xsi_uri +
                       "\"\n\t\tName=\"n\"\n\t\tValue=\"v\"/>\n");
}

TEST(BindingCcTag, CloneAndSwap) {
    elmx_error error = lmx::elmx_ok;
    cc::Tag tag("<cc:Tag " + k_ns + " Name=\"n\" Value=\"v\"/>", &error);
    ASSERT_EQ(error, lmx::elmx_ok);
    std::unique_ptr<cc::Tag> copy(tag.clone());
    cc::Tag other;
    other.swap(tag);
    EXPECT_EQ(other.get_Name(), L"n");
    EXPECT_EQ(copy->get_Value(), L"v");
    EXPECT_FALSE(tag.is_occurs_ok());
}

} // namespace
