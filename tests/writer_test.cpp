// The XML writer: layout byte for byte (prolog, indentation, attribute
// placement, "/>", namespace declarations), the process-wide default strings,
// typed values through their validation specs, wildcards, error capture, and
// whole documents to streams, strings and files.
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <initializer_list>
#include <limits>
#include <locale>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include <lmx/lmxparse.h>

namespace {

using lmx::c_xml_writer;
using lmx::c_xml_writer_local;
using lmx::elmx_error;

const char k_prolog[] = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n";
const char k_xsi[] = "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\"";

const lmx::s_ns_map k_ns_map[] = {
    {1000, "t", "http://example.com/test"},
    {0, nullptr, nullptr},
};

const lmx::s_ns_map k_two_ns_map[] = {
    {1000, "t", "http://example.com/test"},
    {1001, "", "http://example.com/default"},
    {0, nullptr, nullptr},
};

std::string read_file(const std::filesystem::path &ar_path) {
    std::ifstream in(ar_path, std::ios::binary);
    std::stringstream text;
    text << in.rdbuf();
    return text.str();
}

// A path in the temporary folder, removed before and after the test.
class temp_path {
public:
    explicit temp_path(const char *ap_name)
        : m_path(std::filesystem::temp_directory_path() / ap_name) {
        std::filesystem::remove(m_path);
    }
    ~temp_path() { std::filesystem::remove(m_path); }
    const std::filesystem::path &path() const { return m_path; }
    std::string string() const { return m_path.string(); }

private:
    std::filesystem::path m_path;
};

// Saves the process-wide default strings and puts them back, so that a test
// that changes them leaves the others as they expect.
class writer_defaults_test : public ::testing::Test {
protected:
    void SetUp() override {
        m_tab = c_xml_writer::get_default_tab();
        m_nl = c_xml_writer::get_default_nl();
        m_attribute_tab = c_xml_writer::get_default_attribute_tab();
        m_attribute_nl = c_xml_writer::get_default_attribute_nl();
    }
    void TearDown() override {
        c_xml_writer::set_default_attribute_tab(m_attribute_tab.c_str());
        c_xml_writer::set_default_attribute_nl(m_attribute_nl.c_str());
        // Setting the tab and newline may copy them into the attribute
        // strings, so the attribute strings are set once more afterwards.
        c_xml_writer::set_default_tab(m_tab.c_str());
        c_xml_writer::set_default_nl(m_nl.c_str());
        c_xml_writer::set_default_attribute_tab(m_attribute_tab.c_str());
        c_xml_writer::set_default_attribute_nl(m_attribute_nl.c_str());
    }

private:
    std::string m_tab, m_nl, m_attribute_tab, m_attribute_nl;
};

// ------------------------------------------------------------------ small bound classes
//
// Written the way generated classes write themselves: a scope object, the
// start tag, the namespace declarations with xsi, the attributes, the
// children, the end tag.

struct empty_child {
    elmx_error marshal(c_xml_writer &ar_writer, const char *ac_name) const {
        c_xml_writer_local local(ar_writer);
        ar_writer.start_element(ac_name);
        ar_writer.conditionally_select_ns_map(k_ns_map);
        ar_writer.conditionally_write_ns_attrs(true);
        ar_writer.end_element(ac_name);
        return lmx::elmx_ok;
    }
};

// A choice with nothing chosen: reports as generated choice classes do.
struct unchosen_choice {
    elmx_error marshal(c_xml_writer &ar_writer, const char *ac_name) const {
        c_xml_writer_local local(ar_writer);
        ar_writer.start_element(ac_name);
        ar_writer.conditionally_select_ns_map(k_ns_map);
        ar_writer.conditionally_write_ns_attrs(true);
        if (elmx_error error = ar_writer.handle_error(lmx::elmx_bad_choice, "t:Choice", "choice_source", 42))
            return error;
        ar_writer.end_element(ac_name);
        return lmx::elmx_ok;
    }
};

// A root with one attribute and one child of either kind.
struct sample_root {
    bool is_occurs_ok = true;
    bool has_unchosen_choice = false;

    elmx_error marshal(c_xml_writer &ar_writer, const char *ac_name) const {
        if (!is_occurs_ok)
            return lmx::elmx_marshal_occurs_error;
        c_xml_writer_local local(ar_writer);
        ar_writer.start_element(ac_name);
        ar_writer.conditionally_select_ns_map(k_ns_map);
        ar_writer.conditionally_write_ns_attrs(true);
        ar_writer.marshal_attribute("a", "1");
        elmx_error error = has_unchosen_choice ? unchosen_choice().marshal(ar_writer, "t:c")
                                               : empty_child().marshal(ar_writer, "t:c");
        if (error)
            return error;
        ar_writer.end_element(ac_name);
        return lmx::elmx_ok;
    }
    elmx_error marshal(c_xml_writer &ar_writer) const { return marshal(ar_writer, "t:r"); }
};

const std::string k_sample_root_body = "<t:r xmlns:t=\"http://example.com/test\"\n"
                                       "\t\t" + std::string(k_xsi) + "\n"
                                       "\t\ta=\"1\">\n"
                                       "\t<t:c/>\n"
                                       "</t:r>\n";

// Swallows every error it is handed, and counts the calls.
class forgiving_writer : public c_xml_writer {
public:
    using c_xml_writer::c_xml_writer;
    elmx_error user_handle_error(elmx_error a_error, const std::string &ar_item_name, const char *ap_prog_file,
                                 int a_prog_line) override {
        ++m_calls;
        m_last_item = ar_item_name;
        c_xml_writer::user_handle_error(a_error, ar_item_name, ap_prog_file, a_prog_line);
        return lmx::elmx_ok;
    }
    int m_calls = 0;
    std::string m_last_item;
};

// Overrides only the short hook, which the long one calls by default.
class short_hook_writer : public c_xml_writer {
public:
    using c_xml_writer::c_xml_writer;
    elmx_error user_handle_error(elmx_error a_error) override {
        m_seen = a_error;
        return lmx::elmx_user_defined_1;
    }
    elmx_error m_seen = lmx::elmx_ok;
};

// ------------------------------------------------------------------ layout

TEST(writer_layout, default_strings_lay_out_a_root_with_one_attribute_and_one_empty_child) {
    std::ostringstream os;
    c_xml_writer writer(os, c_xml_writer::include_xml_decl);
    ASSERT_EQ(sample_root().marshal(writer), lmx::elmx_ok);
    EXPECT_EQ(os.str(), k_prolog + k_sample_root_body);
}

TEST(writer_layout, first_constructor_writes_no_prolog) {
    std::ostringstream os;
    c_xml_writer writer(os);
    EXPECT_EQ(os.str(), "");
    ASSERT_EQ(sample_root().marshal(writer), lmx::elmx_ok);
    EXPECT_EQ(os.str(), k_sample_root_body);
}

TEST(writer_layout, option_bits_choose_the_prolog) {
    struct row {
        int options;
        const char *prolog;
    };
    const row rows[] = {
        {0, ""},
        {1, "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"},
        {2, "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"yes\"?>\n"},
        {3, "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"yes\"?>\n"},
        {4, ""},
    };
    for (const row &r : rows) {
        std::ostringstream os;
        c_xml_writer writer(os, r.options);
        EXPECT_EQ(os.str(), r.prolog) << "options " << r.options;
    }
    std::ostringstream os;
    c_xml_writer writer(os, c_xml_writer::include_standalone_xml_decl, "", "|");
    EXPECT_EQ(os.str(), "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"yes\"?>|");
}

TEST(writer_layout, element_with_only_attributes_ends_with_slash) {
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        writer.marshal_attribute("x", "1");
        writer.marshal_attribute("y", "2");
        writer.end_element("e");
    }
    EXPECT_EQ(os.str(), "<e x=\"1\"\n\t\ty=\"2\"/>\n");
}

TEST(writer_layout, element_with_no_content_ends_with_slash) {
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        writer.end_element("e");
    }
    EXPECT_EQ(os.str(), "<e/>\n");
}

TEST(writer_layout, empty_strings_put_the_whole_document_on_one_line) {
    std::ostringstream os;
    c_xml_writer writer(os, c_xml_writer::include_xml_decl, "", "", "", "");
    ASSERT_EQ(sample_root().marshal(writer), lmx::elmx_ok);
    EXPECT_EQ(os.str(), "<?xml version=\"1.0\" encoding=\"UTF-8\"?>"
                        "<t:r xmlns:t=\"http://example.com/test\" " + std::string(k_xsi) + " a=\"1\"><t:c/></t:r>");
}

// An empty element (e unless named) with the attributes given, under the
// layout strings given.
std::string element_with_attributes(const char *ap_tab, const char *ap_nl, const char *ap_attribute_tab,
                                    const char *ap_attribute_nl,
                                    std::initializer_list<std::pair<const char *, const char *>> a_attributes,
                                    const char *ac_element = "e") {
    std::ostringstream os;
    c_xml_writer writer(os, ap_tab, ap_nl, ap_attribute_tab, ap_attribute_nl);
    {
        c_xml_writer_local local(writer);
        writer.start_element(ac_element);
        for (const auto &attribute : a_attributes)
            writer.marshal_attribute(attribute.first, attribute.second);
        writer.end_element(ac_element);
    }
    return os.str();
}

TEST(writer_layout, attribute_tab_alone_separates_attributes_on_one_line) {
    EXPECT_EQ(element_with_attributes("\t", "\n", "  ", "", {{"x", "1"}, {"y", "2"}, {"z", "3"}}),
              "<e x=\"1\"  y=\"2\"  z=\"3\"/>\n");
}

TEST(writer_layout, attribute_newline_alone_starts_each_further_attribute_on_a_new_line) {
    EXPECT_EQ(element_with_attributes("\t", "\n", "", "\n", {{"x", "1"}, {"y", "2"}}), "<e x=\"1\"\ny=\"2\"/>\n");
}

TEST(writer_layout, further_attributes_stand_two_tabs_deeper_than_their_tag) {
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local outer(writer);
        writer.start_element("o");
        {
            c_xml_writer_local inner(writer);
            writer.start_element("i");
            writer.marshal_attribute("x", "1");
            writer.marshal_attribute("y", "2");
            writer.end_element("i");
        }
        writer.end_element("o");
    }
    EXPECT_EQ(os.str(), "<o>\n"
                        "\t<i x=\"1\"\n"
                        "\t\t\ty=\"2\"/>\n"
                        "</o>\n");
}

TEST(writer_layout, custom_strings_replace_tab_and_newline) {
    std::ostringstream os;
    c_xml_writer writer(os, "  ", "\r\n", "    ", "\r\n");
    {
        c_xml_writer_local outer(writer);
        writer.start_element("o");
        writer.marshal_attribute("a", "1");
        writer.marshal_attribute("b", "2");
        {
            c_xml_writer_local middle(writer);
            writer.start_element("m");
            writer.marshal_element("leaf", "v");
            writer.end_element("m");
        }
        writer.end_element("o");
    }
    EXPECT_EQ(os.str(), "<o a=\"1\"\r\n"
                        "        b=\"2\">\r\n"
                        "  <m>\r\n"
                        "    <leaf>v</leaf>\r\n"
                        "  </m>\r\n"
                        "</o>\r\n");
}

TEST(writer_layout, null_attribute_strings_follow_the_given_element_strings) {
    EXPECT_EQ(element_with_attributes("-", "|", nullptr, nullptr, {{"x", "1"}, {"y", "2"}}), "<e x=\"1\"|--y=\"2\"/>|");
}

TEST(writer_layout, simple_value_stands_between_its_tags_on_one_line) {
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local outer(writer);
        writer.start_element("o");
        writer.marshal_element("a", "x");
        writer.marshal_element("b", "");
        writer.end_element("o");
    }
    EXPECT_EQ(os.str(), "<o>\n"
                        "\t<a>x</a>\n"
                        "\t<b></b>\n"
                        "</o>\n");
}

TEST(writer_layout, deep_nesting_indents_one_tab_a_level) {
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local l1(writer);
        writer.start_element("a");
        {
            c_xml_writer_local l2(writer);
            writer.start_element("b");
            {
                c_xml_writer_local l3(writer);
                writer.start_element("c");
                writer.marshal_element("d", "1");
                writer.end_element("c");
            }
            writer.marshal_element("e", "2");
            writer.end_element("b");
        }
        writer.end_element("a");
    }
    EXPECT_EQ(os.str(), "<a>\n"
                        "\t<b>\n"
                        "\t\t<c>\n"
                        "\t\t\t<d>1</d>\n"
                        "\t\t</c>\n"
                        "\t\t<e>2</e>\n"
                        "\t</b>\n"
                        "</a>\n");
}

TEST(writer_layout, indent_and_undent_move_the_level_and_stop_at_zero) {
    std::ostringstream os;
    c_xml_writer writer(os);
    writer.undent();
    writer.indent();
    writer.indent();
    writer.undent();
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        writer.end_element("e");
    }
    EXPECT_EQ(os.str(), "\t<e/>\n");
}

TEST(writer_layout, end_element_with_the_level_at_zero_keeps_it_at_zero) {
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local local(writer);
        writer.end_element("x");
    }
    {
        c_xml_writer_local local(writer);
        writer.start_element("y");
        writer.end_element("y");
    }
    EXPECT_EQ(os.str(), "/>\n<y/>\n");
}

TEST(writer_layout, prepare_for_simple_body_data_closes_the_start_tag_once_without_newline) {
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        writer.marshal_attribute("a", "1");
        writer.prepare_for_simple_body_data();
        writer.prepare_for_simple_body_data();
        writer.end_element("e");
    }
    EXPECT_EQ(os.str(), "<e a=\"1\"></e>\n");
}

TEST(writer_layout, scope_objects_make_and_restore_the_current_element) {
    std::ostringstream os;
    c_xml_writer writer(os);
    c_xml_writer_local *p_root = writer.get_xml_writer_local();
    ASSERT_NE(p_root, nullptr);
    EXPECT_EQ(p_root->get_parent(), nullptr);
    EXPECT_TRUE(p_root->has_body());
    EXPECT_FALSE(p_root->has_attributes());
    EXPECT_FALSE(p_root->has_children());
    {
        c_xml_writer_local outer(writer);
        EXPECT_EQ(writer.get_xml_writer_local(), &outer);
        EXPECT_EQ(outer.get_parent(), p_root);
        EXPECT_FALSE(outer.has_body());
        {
            c_xml_writer_local inner(writer);
            EXPECT_EQ(inner.get_parent(), &outer);
            inner.set_parent_has_body();
            EXPECT_TRUE(outer.has_body());
            EXPECT_TRUE(outer.has_children());
        }
        EXPECT_EQ(writer.get_xml_writer_local(), &outer);
    }
    EXPECT_EQ(writer.get_xml_writer_local(), p_root);
}

TEST(writer_layout, set_xml_writer_local_changes_the_current_element) {
    std::ostringstream os;
    c_xml_writer writer(os);
    c_xml_writer_local *p_root = writer.get_xml_writer_local();
    c_xml_writer_local local(writer);
    writer.set_xml_writer_local(p_root);
    EXPECT_EQ(writer.get_xml_writer_local(), p_root);
    writer.set_xml_writer_local(&local);
}

TEST(writer_layout, constant_forms_escape_their_text) {
    std::ostringstream os;
    c_xml_writer writer(os, "", "");
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        writer.marshal_attribute("a", "<\"&'>]]>");
        writer.marshal_element("v", "a<b & ]]> ]>");
        writer.end_element("e");
    }
    EXPECT_EQ(os.str(), "<e a=\"&lt;&quot;&amp;&apos;>]]&gt;\"><v>a&lt;b &amp; ]]&gt; ]&gt;</v></e>");
}

TEST(writer_layout, xsi_nil_is_written_by_the_constant_attribute_form) {
    EXPECT_EQ(element_with_attributes(nullptr, nullptr, nullptr, nullptr, {{"xsi:nil", "true"}}, "t:Density"),
              "<t:Density xsi:nil=\"true\"/>\n");
}

TEST(writer_layout, writer_imbues_the_classic_locale) {
    struct comma_numpunct : std::numpunct<char> {
        char do_decimal_point() const override { return ','; }
    };
    std::ostringstream os;
    os.imbue(std::locale(std::locale::classic(), new comma_numpunct));
    c_xml_writer writer(os);
    EXPECT_TRUE(os.getloc() == std::locale::classic());
    os << 0.5;
    EXPECT_EQ(os.str(), "0.5");
}

TEST(writer_layout, stream_without_buffer_takes_output_without_failing) {
    std::ostream os(nullptr);
    c_xml_writer writer(os, c_xml_writer::include_xml_decl);
    EXPECT_EQ(sample_root().marshal(writer), lmx::elmx_ok);
}

TEST(writer_output, output_reaches_the_stream_when_the_outermost_element_ends) {
    std::ostringstream os;
    c_xml_writer writer(os, c_xml_writer::include_xml_decl);
    EXPECT_EQ(os.str(), k_prolog);
    {
        c_xml_writer_local outer(writer);
        writer.start_element("o");
        writer.marshal_element("i", "v");
        EXPECT_EQ(os.str(), k_prolog);
        writer.end_element("o");
    }
    EXPECT_EQ(os.str(), std::string(k_prolog) + "<o>\n\t<i>v</i>\n</o>\n");
}

TEST(writer_output, unfinished_output_reaches_the_stream_when_drained_or_when_the_writer_dies) {
    std::ostringstream os;
    {
        c_xml_writer writer(os);
        c_xml_writer_local local(writer);
        writer.start_element("o");
        writer.marshal_attribute("a", "1");
        EXPECT_EQ(os.str(), "");
        writer.drain_output();
        EXPECT_EQ(os.str(), "<o a=\"1\"");
        writer.marshal_element("i", "v");
    }
    EXPECT_EQ(os.str(), "<o a=\"1\">\n\t<i>v</i>\n");
}

TEST(writer_output, flushing_the_writer_stream_reaches_the_caller_stream) {
    std::ostringstream os;
    c_xml_writer writer(os);
    writer.get_stream() << "text" << std::flush;
    EXPECT_EQ(os.str(), "text");
}

TEST(writer_output, documents_larger_than_the_block_come_out_whole_and_in_order) {
    const std::size_t block = lmx::c_write_buffer::k_block_size;
    std::string expected = "<r>\n";
    std::ostringstream os;
    {
        c_xml_writer writer(os);
        c_xml_writer_local local(writer);
        writer.start_element("r");
        std::string big(block + 7, 'x');
        std::string small;
        for (std::size_t i = 0; i < 3 * block / 16; ++i) {
            small.assign(1 + i % 13, static_cast<char>('a' + i % 26));
            writer.marshal_element("s", small.c_str());
            expected += "\t<s>" + small + "</s>\n";
            if (i % 1000 == 0) {
                writer.marshal_element("b", big.c_str());
                expected += "\t<b>" + big + "</b>\n";
            }
        }
        writer.end_element("r");
        expected += "</r>\n";
    }
    EXPECT_EQ(os.str().size(), expected.size());
    EXPECT_TRUE(os.str() == expected);
}

TEST(writer_output, single_characters_fill_the_block_exactly) {
    std::ostringstream os;
    const std::size_t block = lmx::c_write_buffer::k_block_size;
    {
        c_xml_writer writer(os, "", "", "", "");
        std::ostream &out = writer.get_stream();
        for (std::size_t i = 0; i < 2 * block + 1; ++i)
            out.put(static_cast<char>('0' + i % 10));
    }
    ASSERT_EQ(os.str().size(), 2 * block + 1);
    EXPECT_EQ(os.str()[block], static_cast<char>('0' + block % 10));
}

// ------------------------------------------------------------------ namespaces

TEST(writer_namespaces, declarations_come_before_own_attributes_and_only_on_the_first_element) {
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local outer(writer);
        writer.start_element("t:o");
        writer.conditionally_select_ns_map(k_two_ns_map);
        writer.conditionally_write_ns_attrs(false);
        writer.marshal_attribute("a", "1");
        {
            c_xml_writer_local inner(writer);
            writer.start_element("t:i");
            writer.conditionally_select_ns_map(k_ns_map);
            writer.conditionally_write_ns_attrs(true);
            writer.marshal_attribute("b", "2");
            writer.end_element("t:i");
        }
        writer.end_element("t:o");
    }
    EXPECT_EQ(os.str(), "<t:o xmlns:t=\"http://example.com/test\"\n"
                        "\t\txmlns=\"http://example.com/default\"\n"
                        "\t\ta=\"1\">\n"
                        "\t<t:i b=\"2\"/>\n"
                        "</t:o>\n");
}

TEST(writer_namespaces, xsi_is_declared_only_when_asked_for_or_for_schema_locations) {
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        writer.conditionally_write_ns_attrs(false);
        writer.end_element("e");
    }
    EXPECT_EQ(os.str(), "<e/>\n");

    std::ostringstream with_xsi;
    c_xml_writer xsi_writer(with_xsi);
    {
        c_xml_writer_local local(xsi_writer);
        xsi_writer.start_element("e");
        xsi_writer.conditionally_write_ns_attrs(true);
        xsi_writer.end_element("e");
    }
    EXPECT_EQ(with_xsi.str(), "<e " + std::string(k_xsi) + "/>\n");
}

TEST(writer_namespaces, added_namespaces_follow_the_selected_table) {
    std::ostringstream os;
    c_xml_writer writer(os);
    writer.add_namespace("u", "urn:user");
    writer.add_namespace("", "urn:plain");
    {
        c_xml_writer_local local(writer);
        writer.start_element("t:e");
        writer.conditionally_select_ns_map(k_ns_map);
        writer.conditionally_write_ns_attrs(false);
        writer.end_element("t:e");
    }
    EXPECT_EQ(os.str(), "<t:e xmlns:t=\"http://example.com/test\"\n"
                        "\t\txmlns:u=\"urn:user\"\n"
                        "\t\txmlns=\"urn:plain\"/>\n");
}

// An empty element e under the given schema locations, as uri and location pairs.
std::string element_with_schema_locations(std::initializer_list<std::pair<const char *, const char *>> a_locations) {
    std::ostringstream os;
    c_xml_writer writer(os, "\t", "\n", "", "");
    for (const auto &location : a_locations)
        writer.add_schema_location(location.first, location.second);
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        writer.conditionally_write_ns_attrs(false);
        writer.end_element("e");
    }
    return os.str();
}

TEST(writer_namespaces, schema_locations_are_written_in_pairs) {
    EXPECT_EQ(element_with_schema_locations({{"urn:a", "a.xsd"}, {"urn:b", "b.xsd"}}),
              "<e " + std::string(k_xsi) + " xsi:schemaLocation=\"urn:a a.xsd urn:b b.xsd\"/>\n");
}

TEST(writer_namespaces, first_location_without_uri_gives_no_namespace_schema_location_alone) {
    EXPECT_EQ(element_with_schema_locations({{"", "plain.xsd"}, {"urn:b", "b.xsd"}}),
              "<e " + std::string(k_xsi) + " xsi:noNamespaceSchemaLocation=\"plain.xsd\"/>\n");
}

TEST(writer_namespaces, only_the_first_selected_table_counts) {
    std::ostringstream os;
    c_xml_writer writer(os);
    writer.conditionally_select_ns_map(k_ns_map);
    writer.conditionally_select_ns_map(k_two_ns_map);
    EXPECT_EQ(writer.get_namespace_prefix("http://example.com/default"), nullptr);
    ASSERT_NE(writer.get_namespace_prefix("http://example.com/test"), nullptr);
    EXPECT_STREQ(writer.get_namespace_prefix("http://example.com/test"), "t");
}

TEST(writer_namespaces, prefix_lookup_tries_the_table_then_the_added_namespaces) {
    std::ostringstream os;
    c_xml_writer writer(os);
    EXPECT_EQ(writer.get_namespace_prefix("http://example.com/test"), nullptr);
    writer.add_namespace("u", "urn:user");
    writer.add_namespace("v", "http://example.com/test");
    EXPECT_STREQ(writer.get_namespace_prefix("urn:user"), "u");
    EXPECT_STREQ(writer.get_namespace_prefix("http://example.com/test"), "v");
    writer.conditionally_select_ns_map(k_ns_map);
    EXPECT_STREQ(writer.get_namespace_prefix("http://example.com/test"), "t");
    EXPECT_EQ(writer.get_namespace_prefix("urn:none"), nullptr);
}

// ------------------------------------------------------------------ typed values

// The smallest member containers the writer takes: a value with its set flag,
// several values, and one list of values.
template <typename T> struct value_member {
    T value{};
    bool is_set = false;

    value_member() = default;
    explicit value_member(const T &ar_value) : value(ar_value), is_set(true) {}
    bool is_value_set() const { return is_set; }
    std::size_t count() const { return is_set ? 1 : 0; }
    const T &access_value(std::size_t) const { return value; }
};

template <typename T> struct multi_member {
    std::vector<T> values;
    bool is_value_set() const { return !values.empty(); }
    std::size_t count() const { return values.size(); }
    const T &access_value(std::size_t a_index) const { return values[a_index]; }
};

template <typename T> using list_member = multi_member<T>;

const std::wstring k_object_types[] = {L"Standard", L"Target", L"Trial"};

lmx::elmx_error object_type_validator(lmx::c_xml_reader &ar_reader, const std::wstring &ar_value) {
    return lmx::check_enumeration(ar_reader, ar_value, k_object_types);
}

lmx::elmx_error percent_validator(lmx::c_xml_reader &ar_reader, const double &ar_value) {
    if (lmx::elmx_error error = lmx::check_min_inclusive(ar_reader, ar_value, 0))
        return error;
    return lmx::check_max_inclusive(ar_reader, ar_value, 100);
}

template <typename T>
lmx::ct_typed_validation_spec<T> make_spec(const char *ap_default = "",
                                           typename lmx::ct_typed_validation_spec<T>::t_value_validator ap_value =
                                               lmx::value_validator_none<T>) {
    return lmx::ct_typed_validation_spec<T>(lmx::ws_collapse, ap_default, lmx::lexical_validator_none, ap_value,
                                            lmx::v_to_o<T>, lmx::o_to_v<T>);
}

const auto k_wstring_spec = make_spec<std::wstring>();
const auto k_string_spec = make_spec<std::string>();
const auto k_object_type_spec = make_spec<std::wstring>("", object_type_validator);
const auto k_percent_spec = make_spec<double>("", percent_validator);
const auto k_double_spec = make_spec<double>();
const auto k_float_spec = make_spec<float>();
const auto k_int_spec = make_spec<int>();
const auto k_bool_spec = make_spec<bool>();
const auto k_datetime_spec = make_spec<lmx::c_datetime>();
const auto k_binary_spec = make_spec<lmx::c_binary>();
const auto k_defaulted_spec = make_spec<std::wstring>("a<b");
const auto k_defaulted_list_spec = make_spec<int>("1 2");

// Writes the element "e" around what a_body writes, with no indentation.
template <typename F> std::string written_in_element(F a_body, bool *ap_is_ok = nullptr) {
    std::ostringstream os;
    c_xml_writer writer(os, "", "", "", "");
    c_xml_writer_local local(writer);
    writer.start_element("e");
    bool is_ok = a_body(writer) == lmx::elmx_ok;
    writer.end_element("e");
    if (ap_is_ok)
        *ap_is_ok = is_ok;
    return os.str();
}

TEST(writer_values, attribute_writes_its_value_through_the_spec) {
    value_member<std::wstring> name(L"Colour 1");
    value_member<double> third(1.0 / 3);
    value_member<float> tenth(0.1f);
    value_member<int> start(-380);
    value_member<bool> flag(true);
    std::string text = written_in_element([&](c_xml_writer &w) {
        elmx_error error = w.marshal_attribute("Name", name, k_wstring_spec);
        error = error ? error : w.marshal_attribute("D", third, k_double_spec);
        error = error ? error : w.marshal_attribute("F", tenth, k_float_spec);
        error = error ? error : w.marshal_attribute("I", start, k_int_spec);
        return error ? error : w.marshal_attribute("B", flag, k_bool_spec);
    });
    EXPECT_EQ(text, "<e Name=\"Colour 1\" D=\"0.33333333333333\" F=\"0.1\" I=\"-380\" B=\"true\"/>");
}

TEST(writer_values, numbers_take_their_precision_and_special_forms) {
    struct row {
        double value;
        const char *text;
    };
    const row rows[] = {
        {0.1, "0.1"},
        {1e-7, "1e-07"},
        {123456789012345.0, "1.2345678901234e+14"},
        {-0.0, "-0.0"},
        {0.0, "0.0"},
        {std::numeric_limits<double>::infinity(), "INF"},
        {-std::numeric_limits<double>::infinity(), "-INF"},
        {std::numeric_limits<double>::quiet_NaN(), "NaN"},
    };
    for (const row &r : rows) {
        value_member<double> item(r.value);
        std::string text =
            written_in_element([&](c_xml_writer &w) { return w.marshal_attribute("v", item, k_double_spec); });
        EXPECT_EQ(text, std::string("<e v=\"") + r.text + "\"/>") << r.text;
    }
    value_member<float> single(1.0f / 3);
    EXPECT_EQ(written_in_element([&](c_xml_writer &w) { return w.marshal_attribute("v", single, k_float_spec); }),
              "<e v=\"0.3333333\"/>");
}

TEST(writer_values, unset_attribute_writes_nothing) {
    value_member<std::wstring> unset;
    EXPECT_EQ(written_in_element([&](c_xml_writer &w) { return w.marshal_attribute("Name", unset, k_wstring_spec); }),
              "<e/>");
}

TEST(writer_values, text_is_escaped_alike_in_attributes_and_elements) {
    value_member<std::wstring> text(L"<a & \"b\" 'c'> ]]> ]>");
    value_member<std::wstring> leading(L"]> and ]]>");
    std::string written = written_in_element([&](c_xml_writer &w) {
        elmx_error error = w.marshal_attribute("a", text, k_wstring_spec);
        error = error ? error : w.marshal_attribute("b", leading, k_wstring_spec);
        error = error ? error : w.marshal_element("x", text, k_wstring_spec, nullptr);
        return error ? error : w.marshal_element("y", leading, k_wstring_spec, nullptr);
    });
    const char escaped[] = "&lt;a &amp; &quot;b&quot; &apos;c&apos;> ]]&gt; ]&gt;";
    EXPECT_EQ(written, std::string("<e a=\"") + escaped + "\" b=\"]> and ]]&gt;\"><x>" + escaped +
                           "</x><y>]> and ]]&gt;</y></e>");
}

TEST(writer_values, wide_text_is_written_as_utf8) {
    std::wstring wide = L"\u00e9\u20ac";
    wide += static_cast<wchar_t>(0xD83D);
    wide += static_cast<wchar_t>(0xDE00);
    value_member<std::wstring> item(wide);
    EXPECT_EQ(written_in_element(
                  [&](c_xml_writer &w) { return w.marshal_element("x", item, k_wstring_spec, nullptr); }),
              "<e><x>\xc3\xa9\xe2\x82\xac\xf0\x9f\x98\x80</x></e>");
}

TEST(writer_values, narrow_text_passes_as_utf8) {
    value_member<std::string> item("caf\xc3\xa9 & co");
    EXPECT_EQ(written_in_element([&](c_xml_writer &w) { return w.marshal_attribute("a", item, k_string_spec); }),
              "<e a=\"caf\xc3\xa9 &amp; co\"/>");
}

TEST(writer_values, attribute_or_default_writes_the_default_text_when_unset) {
    value_member<std::wstring> unset, set(L"v");
    EXPECT_EQ(written_in_element([&](c_xml_writer &w) {
                  return w.marshal_attribute_or_default("a", unset, k_defaulted_spec);
              }),
              "<e a=\"a&lt;b\"/>");
    EXPECT_EQ(written_in_element([&](c_xml_writer &w) {
                  return w.marshal_attribute_or_default("a", set, k_defaulted_spec);
              }),
              "<e a=\"v\"/>");
}

TEST(writer_values, attribute_list_holds_the_items_separated_by_blanks) {
    list_member<double> values;
    values.values = {0.5, 1.25, 100};
    list_member<double> empty;
    EXPECT_EQ(written_in_element([&](c_xml_writer &w) {
                  elmx_error error = w.marshal_attribute_list("l", values, k_double_spec);
                  return error ? error : w.marshal_attribute_list("m", empty, k_double_spec);
              }),
              "<e l=\"0.5 1.25 100\"/>");
}

TEST(writer_values, attribute_list_or_default_writes_the_default_text_when_unset) {
    list_member<int> empty, set;
    set.values = {3, 4};
    EXPECT_EQ(written_in_element([&](c_xml_writer &w) {
                  elmx_error error = w.marshal_attribute_list_or_default("l", empty, k_defaulted_list_spec);
                  return error ? error : w.marshal_attribute_list_or_default("m", set, k_defaulted_list_spec);
              }),
              "<e l=\"1 2\" m=\"3 4\"/>");
}

TEST(writer_values, element_stands_on_one_line_with_its_value) {
    value_member<double> lightness(52.5);
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local local(writer);
        writer.start_element("t:ColorCIELab");
        writer.marshal_attribute("ColorSpecification", "cs1");
        EXPECT_EQ(writer.marshal_element("t:L", lightness, k_percent_spec, nullptr), lmx::elmx_ok);
        writer.end_element("t:ColorCIELab");
    }
    EXPECT_EQ(os.str(), "<t:ColorCIELab ColorSpecification=\"cs1\">\n"
                        "\t<t:L>52.5</t:L>\n"
                        "</t:ColorCIELab>\n");
}

TEST(writer_values, element_is_written_once_for_each_value) {
    multi_member<int> none, two;
    two.values = {1, 2};
    EXPECT_EQ(written_in_element([&](c_xml_writer &w) {
                  elmx_error error = w.marshal_element("n", none, k_int_spec, nullptr);
                  return error ? error : w.marshal_element("v", two, k_int_spec, nullptr);
              }),
              "<e><v>1</v><v>2</v></e>");
}

TEST(writer_values, element_with_a_table_declares_only_if_no_earlier_element_did) {
    value_member<int> item(7);
    std::ostringstream os;
    c_xml_writer writer(os);
    EXPECT_EQ(writer.marshal_element("t:first", item, k_int_spec, k_ns_map), lmx::elmx_ok);
    EXPECT_EQ(writer.marshal_element("t:second", item, k_int_spec, k_two_ns_map), lmx::elmx_ok);
    // Declared without xsi, on the first element only.
    EXPECT_EQ(os.str(), "<t:first xmlns:t=\"http://example.com/test\">7</t:first>\n"
                        "<t:second>7</t:second>\n");
}

TEST(writer_values, element_with_a_table_after_a_declaring_parent_declares_nothing) {
    value_member<int> item(7);
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local local(writer);
        writer.start_element("t:r");
        writer.conditionally_select_ns_map(k_ns_map);
        writer.conditionally_write_ns_attrs(true);
        EXPECT_EQ(writer.marshal_element("u:x", item, k_int_spec, k_two_ns_map), lmx::elmx_ok);
        writer.end_element("t:r");
    }
    EXPECT_EQ(os.str(), "<t:r xmlns:t=\"http://example.com/test\"\n"
                        "\t\t" + std::string(k_xsi) + ">\n"
                        "\t<u:x>7</u:x>\n"
                        "</t:r>\n");
}

TEST(writer_values, element_or_default_writes_the_default_text_when_unset) {
    value_member<std::wstring> unset, set(L"v");
    const auto no_default = make_spec<std::wstring>();
    EXPECT_EQ(written_in_element([&](c_xml_writer &w) {
                  elmx_error error = w.marshal_element_or_default("d", unset, k_defaulted_spec, nullptr);
                  error = error ? error : w.marshal_element_or_default("s", set, k_defaulted_spec, nullptr);
                  return error ? error : w.marshal_element_or_default("n", unset, no_default, nullptr);
              }),
              "<e><d>a&lt;b</d><s>v</s><n></n></e>");
}

TEST(writer_values, element_list_is_one_element_with_the_items_separated_by_blanks) {
    list_member<double> values, empty;
    values.values = {0.0512, 0.9, 0.25};
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local local(writer);
        writer.start_element("o");
        EXPECT_EQ(writer.marshal_element_list("l", values, k_double_spec, nullptr), lmx::elmx_ok);
        EXPECT_EQ(writer.marshal_element_list("m", empty, k_double_spec, nullptr), lmx::elmx_ok);
        writer.end_element("o");
    }
    EXPECT_EQ(os.str(), "<o>\n\t<l>0.0512 0.9 0.25</l>\n</o>\n");
}

TEST(writer_values, element_list_or_default_writes_the_default_text_when_unset) {
    list_member<int> empty;
    EXPECT_EQ(written_in_element([&](c_xml_writer &w) {
                  return w.marshal_element_list_or_default("l", empty, k_defaulted_list_spec, nullptr);
              }),
              "<e><l>1 2</l></e>");
}

TEST(writer_values, element_list_with_a_table_declares_the_namespaces) {
    list_member<int> values;
    values.values = {1, 2};
    std::ostringstream os;
    c_xml_writer writer(os);
    EXPECT_EQ(writer.marshal_element_list("t:l", values, k_int_spec, k_ns_map), lmx::elmx_ok);
    EXPECT_EQ(os.str(), "<t:l xmlns:t=\"http://example.com/test\">1 2</t:l>\n");
}

TEST(writer_values, body_of_a_simple_content_element_follows_its_attributes) {
    value_member<std::wstring> spec_id(L"cs1");
    list_member<double> values;
    values.values = {0.1, 0.2};
    value_member<std::wstring> body(L"text");
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local outer(writer);
        writer.start_element("o");
        {
            c_xml_writer_local local(writer);
            writer.start_element("t:ReflectanceSpectrum");
            EXPECT_EQ(writer.marshal_attribute("ColorSpecification", spec_id, k_wstring_spec), lmx::elmx_ok);
            EXPECT_EQ(writer.marshal_element_body_list("t:ReflectanceSpectrum", values, k_double_spec), lmx::elmx_ok);
            writer.end_element("t:ReflectanceSpectrum");
        }
        {
            c_xml_writer_local local(writer);
            writer.start_element("t:Text");
            EXPECT_EQ(writer.marshal_element_body("t:Text", body, k_wstring_spec), lmx::elmx_ok);
            writer.end_element("t:Text");
        }
        writer.end_element("o");
    }
    EXPECT_EQ(os.str(), "<o>\n"
                        "\t<t:ReflectanceSpectrum ColorSpecification=\"cs1\">0.1 0.2</t:ReflectanceSpectrum>\n"
                        "\t<t:Text>text</t:Text>\n"
                        "</o>\n");
}

TEST(writer_values, unset_body_leaves_the_element_empty) {
    value_member<std::wstring> unset;
    list_member<double> empty;
    EXPECT_EQ(written_in_element([&](c_xml_writer &w) {
                  elmx_error error = w.marshal_element_body("e", unset, k_wstring_spec);
                  return error ? error : w.marshal_element_body_list("e", empty, k_double_spec);
              }),
              "<e/>");
}

TEST(writer_values, date_and_binary_take_their_lexical_forms) {
    value_member<lmx::c_datetime> date(lmx::c_datetime("2026-11-23T12:00:00Z"));
    const unsigned char bytes[] = {'M', 'a', 'n', 'y'};
    value_member<lmx::c_binary> data(lmx::c_binary(bytes, sizeof bytes));
    EXPECT_EQ(written_in_element([&](c_xml_writer &w) {
                  elmx_error error = w.marshal_element("d", date, k_datetime_spec, nullptr);
                  return error ? error : w.marshal_element("b", data, k_binary_spec, nullptr);
              }),
              "<e><d>2026-11-23T12:00:00Z</d><b>TWFueQ==</b></e>");
}

TEST(writer_values, output_value_writes_the_bare_text) {
    std::ostringstream os;
    c_xml_writer writer(os);
    writer.output_value(std::wstring(L"a&b"), k_wstring_spec);
    writer.output_value(2.5, k_double_spec);
    writer.drain_output();
    EXPECT_EQ(os.str(), "a&amp;b2.5");
}

TEST(writer_values, empty_strings_and_binaries_are_empty_values) {
    EXPECT_TRUE(c_xml_writer::is_value_empty(std::wstring()));
    EXPECT_TRUE(c_xml_writer::is_value_empty(std::string()));
    EXPECT_TRUE(c_xml_writer::is_value_empty(lmx::c_binary()));
    EXPECT_FALSE(c_xml_writer::is_value_empty(std::wstring(L"x")));
    EXPECT_FALSE(c_xml_writer::is_value_empty(0.0));
    EXPECT_FALSE(c_xml_writer::is_value_empty(false));
}

TEST(writer_values, member_containers_of_bound_classes_are_written) {
    lmx::ct_simple_pod_single<int> start;
    start.set(380);
    lmx::ct_simple_pod_optional<double> unset_optional;
    lmx::ct_simple_non_pod_optional<std::wstring> name;
    name.set(L"a&b");
    lmx::ct_simple_pod_list_single<double> values;
    values.append(0.25);
    values.append(0.5);
    lmx::ct_simple_pod_list_single<double> empty_but_set;
    empty_but_set.start_new_list();
    lmx::ct_simple_pod_list_optional<double> empty_optional;
    lmx::ct_non_pod_container<lmx::c_any_info> any_attributes;
    any_attributes.push_back(new lmx::c_any_info("urn:x", "x:a", "1<2"));
    lmx::ct_simple_non_pod_single<lmx::c_any_info> any_content;
    any_content.set(lmx::c_any_info("urn:q", "q:X", "<q:X/>"));

    std::ostringstream os;
    c_xml_writer writer(os, "", "", "", "");
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        EXPECT_EQ(writer.marshal_attribute("StartWL", start, k_int_spec), lmx::elmx_ok);
        EXPECT_EQ(writer.marshal_attribute("Unset", unset_optional, k_double_spec), lmx::elmx_ok);
        EXPECT_EQ(writer.marshal_attribute("Name", name, k_wstring_spec), lmx::elmx_ok);
        writer.marshal_any_attribute(any_attributes);
        EXPECT_EQ(writer.marshal_element_list("l", values, k_double_spec, nullptr), lmx::elmx_ok);
        EXPECT_EQ(writer.marshal_element_list("s", empty_but_set, k_double_spec, nullptr), lmx::elmx_ok);
        EXPECT_EQ(writer.marshal_element_list("o", empty_optional, k_double_spec, nullptr), lmx::elmx_ok);
        EXPECT_EQ(writer.marshal_element("u", unset_optional, k_double_spec, nullptr), lmx::elmx_ok);
        writer.marshal_any_element(any_content);
        writer.end_element("e");
    }
    EXPECT_EQ(os.str(), "<e StartWL=\"380\" Name=\"a&amp;b\" xmlns:x=\"urn:x\" x:a=\"1&lt;2\"><l>0.25 0.5</l><s></s><q:X/></e>");
}

// ------------------------------------------------------------------ refused values

TEST(writer_refusals, value_outside_the_enumeration_gives_not_enumerated_and_is_not_written) {
    value_member<std::wstring> type(L"Unknown");
    std::ostringstream os;
    c_xml_writer writer(os, "", "", "", "");
    writer.set_code_file("object_source");
    writer.set_code_line(17);
    {
        c_xml_writer_local local(writer);
        writer.start_element("t:Object");
        EXPECT_EQ(writer.marshal_attribute("ObjectType", type, k_object_type_spec), lmx::elmx_value_not_enumerated);
    }
    writer.drain_output();
    EXPECT_EQ(os.str(), "<t:Object");
    EXPECT_EQ(writer.get_error_message(), "Error: Value does not match enumerations\n"
                                          "Item: ObjectType\n"
                                          "Program file: object_source\n"
                                          "Program line: 17\n");
}

TEST(writer_refusals, value_in_the_enumeration_is_written) {
    value_member<std::wstring> type(L"Target");
    EXPECT_EQ(written_in_element([&](c_xml_writer &w) {
                  return w.marshal_attribute("ObjectType", type, k_object_type_spec);
              }),
              "<e ObjectType=\"Target\"/>");
}

TEST(writer_refusals, refused_element_value_writes_no_tag) {
    value_member<double> lightness(-0.5);
    bool is_ok = true;
    std::string text = written_in_element(
        [&](c_xml_writer &w) { return w.marshal_element("t:L", lightness, k_percent_spec, nullptr); }, &is_ok);
    EXPECT_FALSE(is_ok);
    EXPECT_EQ(text, "<e/>");

    std::ostringstream os;
    c_xml_writer writer(os);
    EXPECT_EQ(writer.marshal_element("t:L", lightness, k_percent_spec, nullptr), lmx::elmx_value_below_minimum);
    value_member<double> above(100.5);
    EXPECT_EQ(writer.marshal_element("t:L", above, k_percent_spec, nullptr), lmx::elmx_value_above_maximum);
    EXPECT_EQ(os.str(), "");
    EXPECT_EQ(writer.get_debug_error().item_name, "t:L");
    EXPECT_EQ(writer.get_debug_error().xml_line, -1);
}

TEST(writer_refusals, one_refused_item_stops_a_whole_list) {
    list_member<double> values;
    values.values = {1, 200, 3};
    std::ostringstream os;
    c_xml_writer writer(os);
    EXPECT_EQ(writer.marshal_element_list("t:l", values, k_percent_spec, nullptr), lmx::elmx_value_above_maximum);
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        EXPECT_EQ(writer.marshal_attribute_list("l", values, k_percent_spec), lmx::elmx_value_above_maximum);
        EXPECT_EQ(writer.marshal_element_body_list("e", values, k_percent_spec), lmx::elmx_value_above_maximum);
    }
    writer.drain_output();
    EXPECT_EQ(os.str(), "<e");
}

TEST(writer_refusals, refused_value_in_a_body_writes_nothing) {
    value_member<double> value(-1);
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        EXPECT_EQ(writer.marshal_element_body("e", value, k_percent_spec), lmx::elmx_value_below_minimum);
    }
    writer.drain_output();
    EXPECT_EQ(os.str(), "<e");
}

TEST(writer_refusals, swallowed_refusal_writes_the_value) {
    value_member<std::wstring> type(L"Unknown");
    value_member<double> lightness(-0.5);
    std::ostringstream os;
    forgiving_writer writer(os, "", "", "", "");
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        EXPECT_EQ(writer.marshal_attribute("ObjectType", type, k_object_type_spec), lmx::elmx_ok);
        EXPECT_EQ(writer.marshal_element("t:L", lightness, k_percent_spec, nullptr), lmx::elmx_ok);
        writer.end_element("e");
    }
    EXPECT_EQ(os.str(), "<e ObjectType=\"Unknown\"><t:L>-0.5</t:L></e>");
    EXPECT_EQ(writer.m_calls, 2);
    EXPECT_EQ(writer.get_debug_error().error, lmx::elmx_value_below_minimum);
}

// A root whose one attribute is checked against an enumeration.
struct typed_root {
    value_member<std::wstring> type;
    elmx_error marshal(c_xml_writer &ar_writer) const {
        c_xml_writer_local local(ar_writer);
        ar_writer.start_element("t:r");
        ar_writer.conditionally_select_ns_map(k_ns_map);
        ar_writer.conditionally_write_ns_attrs(true);
        if (elmx_error error = ar_writer.marshal_attribute("ObjectType", type, k_object_type_spec))
            return error;
        ar_writer.end_element("t:r");
        return lmx::elmx_ok;
    }
};

TEST(writer_refusals, refused_value_removes_the_file_and_reports_the_item) {
    temp_path file("tessarine_writer_refused.xml");
    typed_root root;
    root.type = value_member<std::wstring>(L"Bogus");
    lmx::s_debug_error debug;
    EXPECT_EQ(lmx::marshal(root, file.string().c_str(), &debug), lmx::elmx_value_not_enumerated);
    EXPECT_FALSE(std::filesystem::exists(file.path()));
    EXPECT_EQ(debug.error, lmx::elmx_value_not_enumerated);
    EXPECT_EQ(debug.item_name, "ObjectType");
    EXPECT_EQ(debug.xml_line, -1);

    root.type = value_member<std::wstring>(L"Standard");
    std::string text;
    EXPECT_EQ(lmx::marshal(root, text, &debug), lmx::elmx_ok);
    EXPECT_EQ(text, std::string(k_prolog) + "<t:r xmlns:t=\"http://example.com/test\"\n"
                                            "\t\t" + k_xsi + "\n"
                                            "\t\tObjectType=\"Standard\"/>\n");
}

// ------------------------------------------------------------------ wildcards

// A member holding captured elements, as the any-content container does.
struct any_member {
    std::vector<lmx::c_any_info> values;
    bool is_value_set() const { return !values.empty(); }
    std::size_t count() const { return values.size(); }
    const lmx::c_any_info &access_value(std::size_t a_index) const { return values[a_index]; }
};

TEST(writer_wildcards, any_attributes_are_written_with_escaped_values) {
    std::vector<lmx::c_any_info> store = {
        {"", "plain", "a<b&\"c\""},
        {"urn:x", "x:qualified", "]]>"},
    };
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        writer.marshal_any_attribute(store);
        writer.end_element("e");
    }
    EXPECT_EQ(os.str(), "<e plain=\"a&lt;b&amp;&quot;c&quot;\"\n\t\txmlns:x=\"urn:x\"\n\t\tx:qualified=\"]]&gt;\"/>\n");
}

TEST(writer_wildcards, any_attributes_may_be_held_by_pointer) {
    lmx::c_any_info first("", "a", "1"), second("", "b", "2");
    std::vector<const lmx::c_any_info *> store = {&first, &second};
    std::ostringstream os;
    c_xml_writer writer(os, "", "", "", "");
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        writer.marshal_any_attribute(store);
        writer.end_element("e");
    }
    EXPECT_EQ(os.str(), "<e a=\"1\" b=\"2\"/>");
}

TEST(writer_wildcards, empty_any_attribute_store_writes_nothing) {
    std::vector<lmx::c_any_info> store;
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        writer.marshal_any_attribute(store);
        writer.end_element("e");
    }
    EXPECT_EQ(os.str(), "<e/>\n");
}

TEST(writer_wildcards, captured_elements_are_written_as_they_are_one_to_a_line) {
    any_member content;
    content.values.emplace_back("urn:q", "q:X", "<q:X xmlns:q=\"urn:q\">a &amp; b</q:X>");
    content.values.emplace_back("urn:q", "q:Y", "<q:Y/>");
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local outer(writer);
        writer.start_element("o");
        {
            c_xml_writer_local local(writer);
            writer.start_element("t:CustomResources");
            writer.marshal_attribute("a", "1");
            writer.marshal_any_element(content);
            writer.end_element("t:CustomResources");
        }
        writer.end_element("o");
    }
    // The captured text follows the start tag after the indent, and the end
    // tag, with no child elements written by the writer itself, is not
    // indented.
    EXPECT_EQ(os.str(), "<o>\n"
                        "\t<t:CustomResources a=\"1\">\t\t<q:X xmlns:q=\"urn:q\">a &amp; b</q:X>\n"
                        "\t\t<q:Y/>\n"
                        "</t:CustomResources>\n"
                        "</o>\n");
}

TEST(writer_wildcards, no_captured_elements_leave_an_empty_element) {
    any_member content;
    std::ostringstream os;
    c_xml_writer writer(os);
    {
        c_xml_writer_local local(writer);
        writer.start_element("t:CustomResources");
        writer.marshal_any_element(content);
        writer.end_element("t:CustomResources");
    }
    EXPECT_EQ(os.str(), "<t:CustomResources/>\n");
}

TEST(writer_wildcards, write_any_info_writes_indent_text_and_newline) {
    std::ostringstream os;
    c_xml_writer writer(os, "  ", "|");
    writer.indent();
    writer.indent();
    writer.write_any_info(lmx::c_any_info("", "x", "<x/>"));
    writer.drain_output();
    EXPECT_EQ(os.str(), "    <x/>|");
}

// Writes each captured element in a comment instead.
class commenting_writer : public c_xml_writer {
public:
    using c_xml_writer::c_xml_writer;
    void write_any_info(const lmx::c_any_info &ar_info) override {
        get_stream() << "<!--" << ar_info.get_name() << "-->";
    }
};

TEST(writer_wildcards, captured_elements_go_through_the_overridable_write_any_info) {
    any_member content;
    content.values.emplace_back("urn:q", "q:X", "<q:X/>");
    std::ostringstream os;
    commenting_writer writer(os);
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        writer.marshal_any_element(content);
        writer.end_element("e");
    }
    EXPECT_EQ(os.str(), "<e><!--q:X--></e>\n");
}

// Puts every attribute on a line of its own, the first one too.
class attribute_per_line_writer : public c_xml_writer {
public:
    using c_xml_writer::c_xml_writer;
    void position_attribute() override { get_stream() << "\n "; }
};

TEST(writer_wildcards, attributes_are_placed_through_the_overridable_position_attribute) {
    std::ostringstream os;
    attribute_per_line_writer writer(os);
    {
        c_xml_writer_local local(writer);
        writer.start_element("e");
        writer.conditionally_select_ns_map(k_ns_map);
        writer.conditionally_write_ns_attrs(false);
        writer.marshal_attribute("a", "1");
        writer.end_element("e");
    }
    EXPECT_EQ(os.str(), "<e\n xmlns:t=\"http://example.com/test\"\n a=\"1\"/>\n");
}

// ------------------------------------------------------------------ default strings

TEST_F(writer_defaults_test, defaults_are_tab_and_newline) {
    EXPECT_STREQ(c_xml_writer::get_default_tab(), "\t");
    EXPECT_STREQ(c_xml_writer::get_default_nl(), "\n");
    EXPECT_STREQ(c_xml_writer::get_default_attribute_tab(), "\t");
    EXPECT_STREQ(c_xml_writer::get_default_attribute_nl(), "\n");
}

TEST_F(writer_defaults_test, setting_tab_and_newline_carries_the_attribute_strings_while_they_are_paired) {
    c_xml_writer::set_default_tab("  ");
    EXPECT_STREQ(c_xml_writer::get_default_tab(), "  ");
    EXPECT_STREQ(c_xml_writer::get_default_attribute_tab(), "  ");
    c_xml_writer::set_default_nl("\r\n");
    EXPECT_STREQ(c_xml_writer::get_default_nl(), "\r\n");
    EXPECT_STREQ(c_xml_writer::get_default_attribute_nl(), "\r\n");
}

TEST_F(writer_defaults_test, attribute_setters_set_their_string_alone) {
    c_xml_writer::set_default_attribute_tab(" ");
    EXPECT_STREQ(c_xml_writer::get_default_tab(), "\t");
    EXPECT_STREQ(c_xml_writer::get_default_attribute_tab(), " ");
    c_xml_writer::set_default_attribute_nl("");
    EXPECT_STREQ(c_xml_writer::get_default_nl(), "\n");
    EXPECT_STREQ(c_xml_writer::get_default_attribute_nl(), "");
}

TEST_F(writer_defaults_test, once_unpaired_tab_and_newline_leave_the_attribute_strings) {
    c_xml_writer::set_default_attribute_nl("|");
    // The newlines differ now, so neither setter carries anything over.
    c_xml_writer::set_default_tab("  ");
    EXPECT_STREQ(c_xml_writer::get_default_attribute_tab(), "\t");
    c_xml_writer::set_default_nl("\r\n");
    EXPECT_STREQ(c_xml_writer::get_default_attribute_nl(), "|");
}

TEST_F(writer_defaults_test, an_unpaired_tab_also_stops_the_newline_from_carrying_over) {
    c_xml_writer::set_default_attribute_tab(" ");
    c_xml_writer::set_default_nl("\r\n");
    EXPECT_STREQ(c_xml_writer::get_default_nl(), "\r\n");
    EXPECT_STREQ(c_xml_writer::get_default_attribute_nl(), "\n");
}

TEST_F(writer_defaults_test, new_writers_take_the_current_defaults) {
    c_xml_writer::set_default_tab(" ");
    c_xml_writer::set_default_nl("|");
    c_xml_writer::set_default_attribute_tab("_");
    std::ostringstream os;
    c_xml_writer writer(os, c_xml_writer::include_xml_decl);
    {
        c_xml_writer_local outer(writer);
        writer.start_element("o");
        writer.marshal_attribute("a", "1");
        writer.marshal_attribute("b", "2");
        writer.marshal_element("i", "v");
        writer.end_element("o");
    }
    EXPECT_EQ(os.str(), "<?xml version=\"1.0\" encoding=\"UTF-8\"?>|<o a=\"1\"|__b=\"2\">| <i>v</i>|</o>|");
}

TEST_F(writer_defaults_test, strings_given_to_the_constructor_win_over_the_defaults) {
    c_xml_writer::set_default_tab("#");
    std::ostringstream os;
    c_xml_writer writer(os, "\t", nullptr, nullptr, nullptr);
    {
        c_xml_writer_local outer(writer);
        writer.start_element("o");
        writer.marshal_attribute("a", "1");
        writer.marshal_attribute("b", "2");
        writer.marshal_element("i", "v");
        writer.end_element("o");
    }
    EXPECT_EQ(os.str(), "<o a=\"1\"\n\t\tb=\"2\">\n\t<i>v</i>\n</o>\n");
}

TEST_F(writer_defaults_test, null_given_to_a_setter_is_the_empty_string) {
    c_xml_writer::set_default_tab(nullptr);
    EXPECT_STREQ(c_xml_writer::get_default_tab(), "");
}

// ------------------------------------------------------------------ errors

TEST(writer_errors, capture_stores_no_xml_line) {
    std::ostringstream os;
    c_xml_writer writer(os);
    EXPECT_EQ(writer.capture_error(lmx::elmx_bad_choice, "t:Choice", "choice_source", 42), lmx::elmx_bad_choice);
    const lmx::s_debug_error &debug = writer.get_debug_error();
    EXPECT_EQ(debug.error, lmx::elmx_bad_choice);
    EXPECT_EQ(debug.item_name, "t:Choice");
    EXPECT_STREQ(debug.p_prog_file, "choice_source");
    EXPECT_EQ(debug.prog_line, 42);
    EXPECT_EQ(debug.xml_line, -1);
}

TEST(writer_errors, error_message_has_no_xml_line) {
    std::ostringstream os;
    c_xml_writer writer(os);
    EXPECT_EQ(writer.get_error_message(), "Error: No Error\n");
    writer.handle_error(lmx::elmx_bad_choice, "t:Choice", "choice_source", 42);
    const std::string expected = "Error: Inappropriate choice option selected\n"
                                 "Item: t:Choice\n"
                                 "Program file: choice_source\n"
                                 "Program line: 42\n";
    EXPECT_EQ(writer.get_error_message(), expected);
    std::string message = "old";
    writer.get_error_message(&message);
    EXPECT_EQ(message, expected);
}

TEST(writer_errors, capture_keeps_the_last_error) {
    std::ostringstream os;
    c_xml_writer writer(os);
    writer.capture_error(lmx::elmx_bad_choice, "first", "f", 1);
    writer.capture_error(lmx::elmx_value_not_enumerated, "second", "g", 2);
    EXPECT_EQ(writer.get_debug_error().error, lmx::elmx_value_not_enumerated);
    EXPECT_EQ(writer.get_debug_error().item_name, "second");
}

TEST(writer_errors, handle_error_returns_what_the_hook_returns) {
    std::ostringstream os;
    c_xml_writer plain(os);
    EXPECT_EQ(plain.handle_error(lmx::elmx_bad_choice, "x", "f", 1), lmx::elmx_bad_choice);

    forgiving_writer forgiving(os);
    EXPECT_EQ(forgiving.handle_error(lmx::elmx_bad_choice, "x", "f", 1), lmx::elmx_ok);
    EXPECT_EQ(forgiving.m_calls, 1);
    EXPECT_EQ(forgiving.m_last_item, "x");
    // The capture happened all the same.
    EXPECT_EQ(forgiving.get_debug_error().error, lmx::elmx_bad_choice);

    short_hook_writer short_hook(os);
    EXPECT_EQ(short_hook.handle_error(lmx::elmx_bad_choice, "x", "f", 1), lmx::elmx_user_defined_1);
    EXPECT_EQ(short_hook.m_seen, lmx::elmx_bad_choice);
}

TEST(writer_errors, unchosen_choice_leaves_its_element_open_and_reports_its_name) {
    std::ostringstream os;
    c_xml_writer writer(os);
    sample_root root;
    root.has_unchosen_choice = true;
    EXPECT_EQ(root.marshal(writer), lmx::elmx_bad_choice);
    writer.drain_output();
    EXPECT_EQ(os.str(), "<t:r xmlns:t=\"http://example.com/test\"\n"
                        "\t\t" + std::string(k_xsi) + "\n"
                        "\t\ta=\"1\">\n"
                        "\t<t:c");
    EXPECT_EQ(writer.get_debug_error().item_name, "t:Choice");
}

TEST(writer_errors, swallowed_choice_error_writes_on) {
    std::ostringstream os;
    forgiving_writer writer(os);
    sample_root root;
    root.has_unchosen_choice = true;
    EXPECT_EQ(root.marshal(writer), lmx::elmx_ok);
    EXPECT_EQ(os.str(), k_sample_root_body);
    EXPECT_EQ(writer.get_debug_error().error, lmx::elmx_bad_choice);
}

// ------------------------------------------------------------------ whole documents

TEST(writer_marshal, stream_gets_prolog_and_document) {
    std::ostringstream os;
    lmx::s_debug_error debug;
    debug.set(lmx::elmx_bad_dtd, "stale", "stale", 1, 2);
    EXPECT_EQ(lmx::marshal(sample_root(), os, &debug), lmx::elmx_ok);
    EXPECT_EQ(os.str(), k_prolog + k_sample_root_body);
    // The clear record of a writer that met no error is copied out.
    EXPECT_EQ(debug.error, lmx::elmx_ok);
    EXPECT_EQ(debug.to_string(), "Error: No Error\n");
}

TEST(writer_marshal, stream_state_is_not_consulted) {
    std::ostringstream os;
    os.setstate(std::ios_base::failbit);
    EXPECT_EQ(lmx::marshal(sample_root(), os), lmx::elmx_ok);
    EXPECT_EQ(os.str(), k_prolog + k_sample_root_body);
}

TEST(writer_marshal, named_forms_write_under_the_given_name) {
    std::ostringstream os;
    EXPECT_EQ(lmx::marshal(sample_root(), "t:other", os), lmx::elmx_ok);
    std::string expected = k_prolog + k_sample_root_body;
    expected.replace(expected.find("<t:r"), 4, "<t:other");
    expected.replace(expected.find("</t:r>"), 6, "</t:other>");
    EXPECT_EQ(os.str(), expected);

    std::string text;
    EXPECT_EQ(lmx::marshal(sample_root(), "t:other", text), lmx::elmx_ok);
    EXPECT_EQ(text, expected);

    temp_path file("tessarine_writer_named.xml");
    EXPECT_EQ(lmx::marshal(sample_root(), "t:other", file.string().c_str()), lmx::elmx_ok);
    EXPECT_EQ(read_file(file.path()), expected);
}

TEST(writer_marshal, occurs_error_is_returned_without_capture) {
    std::ostringstream os;
    lmx::s_debug_error debug;
    debug.set(lmx::elmx_bad_dtd, "stale", "stale", 1, 2);
    sample_root root;
    root.is_occurs_ok = false;
    EXPECT_EQ(lmx::marshal(root, os, &debug), lmx::elmx_marshal_occurs_error);
    EXPECT_EQ(os.str(), k_prolog);
    EXPECT_EQ(debug.error, lmx::elmx_ok);
    EXPECT_EQ(debug.item_name, "");
    EXPECT_EQ(debug.to_string(), "Error: No Error\n");
}

TEST(writer_marshal, bad_choice_is_copied_to_the_debug_record) {
    std::ostringstream os;
    lmx::s_debug_error debug;
    sample_root root;
    root.has_unchosen_choice = true;
    EXPECT_EQ(lmx::marshal(root, os, &debug), lmx::elmx_bad_choice);
    EXPECT_EQ(debug.to_string(), "Error: Inappropriate choice option selected\n"
                                 "Item: t:Choice\n"
                                 "Program file: choice_source\n"
                                 "Program line: 42\n");
}

TEST(writer_marshal, string_gets_the_document) {
    std::string text = "old";
    EXPECT_EQ(lmx::marshal(sample_root(), text), lmx::elmx_ok);
    EXPECT_EQ(text, k_prolog + k_sample_root_body);
}

TEST(writer_marshal, string_is_left_alone_on_failure) {
    std::string text = "old";
    lmx::s_debug_error debug;
    sample_root root;
    root.has_unchosen_choice = true;
    EXPECT_EQ(lmx::marshal(root, text, &debug), lmx::elmx_bad_choice);
    EXPECT_EQ(text, "old");
    EXPECT_EQ(debug.error, lmx::elmx_bad_choice);
    root.has_unchosen_choice = false;
    root.is_occurs_ok = false;
    EXPECT_EQ(lmx::marshal(root, text), lmx::elmx_marshal_occurs_error);
    EXPECT_EQ(text, "old");
}

TEST(writer_marshal, file_gets_the_document) {
    temp_path file("tessarine_writer_file.xml");
    lmx::s_debug_error debug;
    EXPECT_EQ(lmx::marshal(sample_root(), file.string().c_str(), &debug), lmx::elmx_ok);
    EXPECT_EQ(read_file(file.path()), k_prolog + k_sample_root_body);
    EXPECT_EQ(debug.error, lmx::elmx_ok);
}

TEST(writer_marshal, file_is_truncated_before_writing) {
    temp_path file("tessarine_writer_truncate.xml");
    {
        std::ofstream old(file.path());
        old << std::string(10000, 'x');
    }
    EXPECT_EQ(lmx::marshal(sample_root(), file.string().c_str()), lmx::elmx_ok);
    EXPECT_EQ(read_file(file.path()), k_prolog + k_sample_root_body);
}

TEST(writer_marshal, file_by_wide_name_gets_the_document) {
    temp_path file("tessarine_writer_wide.xml");
    std::wstring wide_name;
    for (char c : file.string())
        wide_name += static_cast<wchar_t>(static_cast<unsigned char>(c));
    EXPECT_EQ(lmx::marshal(sample_root(), wide_name.c_str()), lmx::elmx_ok);
    EXPECT_EQ(read_file(file.path()), k_prolog + k_sample_root_body);
}

TEST(writer_marshal, failed_file_marshal_removes_the_file) {
    temp_path file("tessarine_writer_failed.xml");
    lmx::s_debug_error debug;
    sample_root root;
    root.has_unchosen_choice = true;
    EXPECT_EQ(lmx::marshal(root, file.string().c_str(), &debug), lmx::elmx_bad_choice);
    EXPECT_FALSE(std::filesystem::exists(file.path()));
    EXPECT_EQ(debug.error, lmx::elmx_bad_choice);
    EXPECT_EQ(debug.item_name, "t:Choice");
    EXPECT_EQ(debug.xml_line, -1);
}

TEST(writer_marshal, occurs_error_removes_the_file_it_had_truncated) {
    temp_path file("tessarine_writer_occurs.xml");
    {
        std::ofstream old(file.path());
        old << "old content";
    }
    sample_root root;
    root.is_occurs_ok = false;
    EXPECT_EQ(lmx::marshal(root, file.string().c_str()), lmx::elmx_marshal_occurs_error);
    EXPECT_FALSE(std::filesystem::exists(file.path()));
}

TEST(writer_marshal, failed_wide_file_marshal_removes_the_file) {
    temp_path file("tessarine_writer_wide_failed.xml");
    std::wstring wide_name;
    for (char c : file.string())
        wide_name += static_cast<wchar_t>(static_cast<unsigned char>(c));
    sample_root root;
    root.has_unchosen_choice = true;
    EXPECT_EQ(lmx::marshal(root, wide_name.c_str()), lmx::elmx_bad_choice);
    EXPECT_FALSE(std::filesystem::exists(file.path()));
}

TEST(writer_marshal, unopenable_file_gives_unable_to_open_file_and_leaves_the_debug_record) {
    std::filesystem::path dir = std::filesystem::temp_directory_path() / "tessarine_writer_no_such_dir";
    std::filesystem::remove_all(dir);
    std::string path = (dir / "out.xml").string();
    lmx::s_debug_error debug;
    debug.set(lmx::elmx_bad_dtd, "kept", "kept_file", 7, 8);
    EXPECT_EQ(lmx::marshal(sample_root(), path.c_str(), &debug), lmx::elmx_unable_to_open_file);
    EXPECT_EQ(debug.error, lmx::elmx_bad_dtd);
    EXPECT_EQ(debug.item_name, "kept");
    EXPECT_EQ(debug.xml_line, 8);
    EXPECT_FALSE(std::filesystem::exists(dir));

    std::wstring wide_path;
    for (char c : path)
        wide_path += static_cast<wchar_t>(static_cast<unsigned char>(c));
    EXPECT_EQ(lmx::marshal(sample_root(), wide_path.c_str()), lmx::elmx_unable_to_open_file);
}

TEST(writer_marshal, directory_as_file_name_gives_unable_to_open_file) {
    std::string dir = std::filesystem::temp_directory_path().string();
    EXPECT_EQ(lmx::marshal(sample_root(), dir.c_str()), lmx::elmx_unable_to_open_file);
    EXPECT_TRUE(std::filesystem::is_directory(dir));
}

} // namespace
