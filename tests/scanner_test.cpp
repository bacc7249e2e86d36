// Tests of the XML scanner, lmx::c_xml: events, the XML declaration,
// comments, processing instructions, CDATA, DOCTYPE placement, attribute and
// namespace capture, whitespace modes, element values, skipping and capture
// of whole elements, and the nesting limit of the recursive scans.
//
// The scanner is built here over a c_read_memory with a c_error of our own,
// so that the message words of every report can be checked.

#include <gtest/gtest.h>

#include <lmx/lmxparse.h>

#include <sstream>
#include <string>
#include <utility>
#include <vector>

namespace {

using lmx::elmx_error;
using lmx::elmx_error_type;

struct reported_error {
    elmx_error_type type;
    elmx_error code;
    std::string message;
};

// Keeps every report the scanner makes.
class recording_error : public lmx::c_error {
public:
    void report_error(elmx_error_type a_type, elmx_error a_code, const char * /*ap_file*/, int /*a_line*/,
                      const char *ap_msg) override {
        reports.push_back({a_type, a_code, ap_msg ? ap_msg : ""});
    }

    bool has(elmx_error_type a_type, elmx_error a_code, const std::string &ar_message) const {
        for (const reported_error &r : reports)
            if (r.type == a_type && r.code == a_code && r.message == ar_message)
                return true;
        return false;
    }
    bool has_code(elmx_error a_code) const {
        for (const reported_error &r : reports)
            if (r.code == a_code)
                return true;
        return false;
    }
    std::string dump() const {
        std::ostringstream out;
        out << reports.size() << " report(s)";
        for (const reported_error &r : reports)
            out << "\n  type " << r.type << ", code " << r.code << ": " << r.message;
        return out.str();
    }

    std::vector<reported_error> reports;
};

// A scanner over a text it owns, with a namespace scope for its start tags.
struct scanner {
    explicit scanner(std::string a_text, bool a_is_reading_xsd = true)
        : text(std::move(a_text)), source(text.data(), text.size()), xml(source, errors, a_is_reading_xsd) {}

    // The next event at the element level, with `local` as the scope.
    int next() { return xml.get_element_name(&local, &name); }

    // Passes the attributes of the current start tag; gives the event that
    // ended them.
    int finish_tag() {
        std::string attribute;
        int event;
        while ((event = xml.get_attribute_name(&attribute)) == lmx::xe_name)
            xml.skip_attribute_value();
        return event;
    }

    // The attributes of the current start tag, values read in a_mode.
    std::vector<std::pair<std::string, std::string>> attributes(lmx::elmx_whitespace a_mode = lmx::ws_preserve) {
        std::vector<std::pair<std::string, std::string>> result;
        std::string attribute, value;
        while (xml.get_attribute_name(&attribute) == lmx::xe_name) {
            value.clear();
            EXPECT_TRUE(xml.get_attribute_value(&value, a_mode)) << attribute;
            result.emplace_back(attribute, value);
        }
        return result;
    }

    std::string text;
    lmx::c_read_memory source;
    recording_error errors;
    lmx::c_xml xml;
    lmx::c_xml_local local;
    std::string name;
};

using attribute_list = std::vector<std::pair<std::string, std::string>>;

std::string nested(int a_levels) {
    std::string text;
    text.reserve(static_cast<std::size_t>(a_levels) * 7);
    for (int i = 0; i < a_levels; ++i)
        text += "<e>";
    for (int i = 0; i < a_levels; ++i)
        text += "</e>";
    return text;
}

// Reads the one attribute of the root element in a_mode.
std::string attribute_value(const std::string &ar_document, lmx::elmx_whitespace a_mode, bool a_is_reading_xsd) {
    scanner s(ar_document, a_is_reading_xsd);
    EXPECT_EQ(s.next(), lmx::xe_name);
    std::string attribute, value;
    EXPECT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_name);
    EXPECT_TRUE(s.xml.get_attribute_value(&value, a_mode));
    return value;
}

// Reads the value of the root element in a_mode, entities expanded.
std::string element_value(const std::string &ar_document, lmx::elmx_whitespace a_mode, bool a_is_reading_xsd) {
    scanner s(ar_document, a_is_reading_xsd);
    EXPECT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    std::string value;
    EXPECT_TRUE(s.xml.get_element_value(&value, a_mode, true)) << s.errors.dump();
    return value;
}

// ------------------------------------------------------------- event codes

TEST(Scanner, EventCodesHaveFixedValues) {
    EXPECT_EQ(lmx::xe_end_of_input, 0);
    EXPECT_EQ(lmx::xe_unknown, 1);
    EXPECT_EQ(lmx::xe_error, 2);
    EXPECT_EQ(lmx::xe_fatal, 3);
    EXPECT_EQ(lmx::xe_start_tag_end, 4);
    EXPECT_EQ(lmx::xe_text, 5);
    EXPECT_EQ(lmx::xe_end_tag, 6);
    EXPECT_EQ(lmx::xe_name, 7);
    EXPECT_EQ(lmx::xe_xsi_type, 8);
    EXPECT_EQ(lmx::xe_xsi_nil, 9);
    EXPECT_EQ(lmx::xe_xsi_schema_location, 10);
    EXPECT_EQ(lmx::xe_xsi_no_namespace_schema_location, 11);
    EXPECT_EQ(lmx::xe_first_user_token, 12);
    EXPECT_EQ(lmx::ws_preserve, 0);
    EXPECT_EQ(lmx::ws_replace, 1);
    EXPECT_EQ(lmx::ws_collapse, 2);
    EXPECT_EQ(lmx::c_xml::tag_start, 0);
    EXPECT_EQ(lmx::c_xml::tag_other, 1);
    EXPECT_EQ(lmx::c_xml::tag_end, 2);
    EXPECT_EQ(lmx::c_xml::tag_bad, 3);
}

TEST(Scanner, ErrorEventsAreErrorAndFatal) {
    EXPECT_TRUE(lmx::c_xml::is_error_event(lmx::xe_error));
    EXPECT_TRUE(lmx::c_xml::is_error_event(lmx::xe_fatal));
    EXPECT_FALSE(lmx::c_xml::is_error_event(lmx::xe_end_of_input));
    EXPECT_FALSE(lmx::c_xml::is_error_event(lmx::xe_name));
    EXPECT_FALSE(lmx::c_xml::is_error_event(lmx::xe_end_tag));
}

TEST(Scanner, NameCharacterClasses) {
    EXPECT_TRUE(lmx::is_xml_name_start_char('a'));
    EXPECT_TRUE(lmx::is_xml_name_start_char('Z'));
    EXPECT_TRUE(lmx::is_xml_name_start_char('_'));
    EXPECT_TRUE(lmx::is_xml_name_start_char(':'));
    EXPECT_TRUE(lmx::is_xml_name_start_char(0xC3)); // lead byte of a UTF-8 letter
    EXPECT_TRUE(lmx::is_xml_name_start_char(0xA9)); // continuation byte
    EXPECT_FALSE(lmx::is_xml_name_start_char('1'));
    EXPECT_FALSE(lmx::is_xml_name_start_char('-'));
    EXPECT_FALSE(lmx::is_xml_name_start_char('.'));
    EXPECT_FALSE(lmx::is_xml_name_start_char(' '));
    EXPECT_FALSE(lmx::is_xml_name_start_char(-1));

    EXPECT_TRUE(lmx::is_xml_name_char('1'));
    EXPECT_TRUE(lmx::is_xml_name_char('-'));
    EXPECT_TRUE(lmx::is_xml_name_char('.'));
    EXPECT_TRUE(lmx::is_xml_name_char(':'));
    EXPECT_FALSE(lmx::is_xml_name_char('='));
    EXPECT_FALSE(lmx::is_xml_name_char('>'));

    EXPECT_TRUE(lmx::is_xml_NCname_char('a'));
    EXPECT_TRUE(lmx::is_xml_NCname_char('9'));
    EXPECT_FALSE(lmx::is_xml_NCname_char(':'));
}

TEST(Scanner, SimpleDocumentGivesStartTagTextAndEndTag) {
    scanner s("<a x=\"1\">hello</a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "a");
    EXPECT_EQ(s.attributes(), (attribute_list{{"x", "1"}}));
    // After the attributes the tag is over.
    ASSERT_EQ(s.next(), lmx::xe_text);
    EXPECT_EQ(s.name, "hello");
    ASSERT_EQ(s.next(), lmx::xe_end_tag);
    EXPECT_EQ(s.name, "a");
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, TextEventLosesLeadingWhiteSpace) {
    scanner s("<a>  \n x  y  </a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    ASSERT_EQ(s.next(), lmx::xe_text);
    EXPECT_EQ(s.name, "x  y  ");
    EXPECT_EQ(s.next(), lmx::xe_end_tag);
}

TEST(Scanner, WhiteSpaceBetweenTagsGivesNoTextEvent) {
    scanner s("<a>\n  <b/>\n\t</a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "b");
    ASSERT_EQ(s.finish_tag(), lmx::xe_end_tag);
    ASSERT_EQ(s.next(), lmx::xe_end_tag);
    EXPECT_EQ(s.name, "a");
}

TEST(Scanner, TextStartingWithEntityIsOneTextEvent) {
    scanner s("<a>&lt;x&gt; y</a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    ASSERT_EQ(s.next(), lmx::xe_text);
    EXPECT_EQ(s.name, "<x> y");
    EXPECT_EQ(s.next(), lmx::xe_end_tag);
}

TEST(Scanner, EntityHoldingMarkupInContentYieldsTheElement) {
    scanner s("<!DOCTYPE a [<!ENTITY b \"<b/>\">]><a>&b;</a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "a");
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "b");
    EXPECT_EQ(s.finish_tag(), lmx::xe_end_tag);
    ASSERT_EQ(s.next(), lmx::xe_end_tag);
    EXPECT_EQ(s.name, "a");
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

// ------------------------------------------------------- XML declaration

TEST(Scanner, XmlDeclarationIsAccepted) {
    scanner s("<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"yes\"?>\n<a/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "a");
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, XmlDeclarationWithBareEncodingIsAccepted) {
    scanner s("<?xml version=\"1.0\" encoding?><a/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "a");
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, XmlDeclarationStandaloneValueIsIgnored) {
    scanner s("<?xml version='1.0' standalone='whatever'?><a/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, XmlVersionOnePointOneIsAccepted) {
    scanner s("<?xml version=\"1.1\"?><a/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, XmlVersionOnePointTwoIsUnsupported) {
    scanner s("<?xml version=\"1.2\"?><a/>");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_unsupported_xml_version, "XML version 1.2 not understood"))
        << s.errors.dump();
    EXPECT_EQ(s.errors.get_last_error(), lmx::elmx_unsupported_xml_version);
}

TEST(Scanner, XmlDeclarationWithoutVersionIsBad) {
    scanner s("<?xml encoding=\"UTF-8\"?><a/>");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_bad_xml_decl, "Version not present in XML Decl"))
        << s.errors.dump();
}

TEST(Scanner, XmlDeclarationVersionWithoutEqualsIsBad) {
    scanner s("<?xml version \"1.0\"?><a/>");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_bad_xml_decl, "Version not present in XML Decl"))
        << s.errors.dump();
}

TEST(Scanner, XmlDeclarationWithoutClosingFailsSilently) {
    scanner s("<?xml version=\"1.0\" ?<a/>");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, CommentBeforeXmlDeclarationIsAccepted) {
    scanner s("<!-- first --><?xml version=\"1.0\"?><a/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "a");
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, ProcessingInstructionBeforeXmlDeclarationIsAccepted) {
    scanner s("<?app data?><?xml version=\"1.0\"?><a/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, WhiteSpaceBeforeXmlDeclarationIsAccepted) {
    scanner s("\n  <?xml version=\"1.0\"?><a/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, ElementBeforeXmlDeclarationIsFatal) {
    scanner s("<a/><?xml version=\"1.0\"?>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_end_tag);
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(
        s.errors.has(lmx::elmx_type_fatal, lmx::elmx_bad_xml_decl, "XML declaration not at start of document"))
        << s.errors.dump();
    EXPECT_TRUE(s.errors.is_fatal_errored());
    // The stream is dead from here on.
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
}

TEST(Scanner, XmlDeclarationInsideElementIsFatal) {
    scanner s("<a><?xml version=\"1.0\"?></a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(
        s.errors.has(lmx::elmx_type_fatal, lmx::elmx_bad_xml_decl, "XML declaration not at start of document"))
        << s.errors.dump();
}

TEST(Scanner, TextBeforeXmlDeclarationMakesItMisplaced) {
    scanner s(" x<?xml version=\"1.0\"?><a/>");
    ASSERT_EQ(s.next(), lmx::xe_text);
    EXPECT_EQ(s.name, "x");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has_code(lmx::elmx_bad_xml_decl)) << s.errors.dump();
}

TEST(Scanner, FailedMarkupDoesNotCountAsContent) {
    // "<!X" fails without a record; it does not set the seen-content state,
    // so a declaration after it is still taken as the first thing.
    scanner s("<!X><?xml version=\"1.0\"?><a/>");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "a");
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, RewindForgetsSeenContentAndNamespaces) {
    scanner s("<?xml version=\"1.0\"?><a/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_end_tag);
    ASSERT_EQ(s.next(), lmx::xe_end_of_input);
    EXPECT_EQ(s.xml.add_namespace("urn:added"), 1000);

    s.xml.rewind();
    EXPECT_EQ(s.xml.find_enumerated_namespace("urn:added"), 0);
    EXPECT_EQ(s.xml.find_enumerated_namespace(lmx::k_xsi_namespace_uri), lmx::ns_xsi);
    // The declaration is at the start again.
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "a");
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

// ------------------------------------------------- processing instructions

TEST(Scanner, StylesheetProcessingInstructionIsSkipped) {
    scanner s("<?xml version=\"1.0\"?>\n<?xml-stylesheet type=\"text/xsl\" href=\"s.xsl\"?>\n<a/>"
              "<?xml-stylesheet href=\"after.xsl\"?>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "a");
    ASSERT_EQ(s.finish_tag(), lmx::xe_end_tag);
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, ProcessingInstructionInContentIsSkipped) {
    scanner s("<a>x<?pi some data?>z</a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    ASSERT_EQ(s.next(), lmx::xe_text);
    EXPECT_EQ(s.name, "x");
    ASSERT_EQ(s.next(), lmx::xe_text);
    EXPECT_EQ(s.name, "z");
    EXPECT_EQ(s.next(), lmx::xe_end_tag);
}

TEST(Scanner, UnterminatedProcessingInstructionFails) {
    scanner s("<a><?pi data");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_EQ(s.next(), lmx::xe_fatal);
}

// ---------------------------------------------------------------- comments

TEST(Scanner, CommentEndingInThreeDashesWarns) {
    scanner s("<!--x---><a/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "a");
    ASSERT_EQ(s.errors.reports.size(), 1u) << s.errors.dump();
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_warning, lmx::elmx_bad_comment, "End of comment not Well-Formed"))
        << s.errors.dump();
    EXPECT_EQ(s.errors.get_warning_count(), 1);
    EXPECT_FALSE(s.errors.is_fatal_errored());
}

TEST(Scanner, CommentEndingInThreeDashesInsideValueWarnsAndGoesOn) {
    scanner s("<a>1<!--x--->2</a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    std::string value;
    ASSERT_TRUE(s.xml.get_element_value(&value, lmx::ws_preserve, true));
    EXPECT_EQ(value, "12");
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_warning, lmx::elmx_bad_comment, "End of comment not Well-Formed"))
        << s.errors.dump();
}

TEST(Scanner, DoubleDashInsideCommentIsTolerated) {
    scanner s("<!-- a -- b - c --><a/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, UnterminatedCommentFails) {
    scanner s("<a><!-- never closed");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_EQ(s.next(), lmx::xe_fatal);
}

TEST(Scanner, CommentInsideValueIsDropped) {
    scanner s("<a>text<!--c-->more</a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    std::string value;
    ASSERT_TRUE(s.xml.get_element_value(&value, lmx::ws_preserve, true));
    EXPECT_EQ(value, "textmore");
    EXPECT_TRUE(s.xml.is_element_end_tag("a"));
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

// ------------------------------------------------------------------- CDATA

TEST(Scanner, CdataKeepsBlanksInEveryWhitespaceMode) {
    for (lmx::elmx_whitespace mode : {lmx::ws_preserve, lmx::ws_replace, lmx::ws_collapse}) {
        for (bool xsd : {false, true}) {
            EXPECT_EQ(element_value("<a><![CDATA[ x ]]></a>", mode, xsd), " x ") << "mode " << mode;
            EXPECT_EQ(element_value("<a><![CDATA[\t\n]]></a>", mode, xsd), "\t\n") << "mode " << mode;
        }
    }
}

TEST(Scanner, CdataIsOneTextEvent) {
    scanner s("<a> <![CDATA[ <b>&amp; ]]></a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    ASSERT_EQ(s.next(), lmx::xe_text);
    EXPECT_EQ(s.name, " <b>&amp; ");
    EXPECT_EQ(s.next(), lmx::xe_end_tag);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, CdataEndsAtTwoBracketsAndGreaterThan) {
    EXPECT_EQ(element_value("<a><![CDATA[x]]]></a>", lmx::ws_preserve, true), "x]");
    EXPECT_EQ(element_value("<a><![CDATA[a]>b]]></a>", lmx::ws_preserve, true), "a]>b");
    EXPECT_EQ(element_value("<a><![CDATA[a]]b]]></a>", lmx::ws_preserve, true), "a]]b");
}

TEST(Scanner, CdataJoinsTextInValue) {
    EXPECT_EQ(element_value("<a>x<![CDATA[<y>]]>z</a>", lmx::ws_preserve, true), "x<y>z");
}

TEST(Scanner, BadCdataOpeningIsNotWellFormed) {
    scanner s("<a><![CDAT[x]]></a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_not_well_formed, "XML not Well-Formed"))
        << s.errors.dump();
}

TEST(Scanner, BadCdataOpeningInValueIsNotWellFormed) {
    scanner s("<a>x<![CDAX[y]]></a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    std::string value;
    EXPECT_FALSE(s.xml.get_element_value(&value, lmx::ws_preserve, true));
    EXPECT_EQ(s.errors.get_last_error(), lmx::elmx_not_well_formed) << s.errors.dump();
}

TEST(Scanner, UnterminatedCdataIsTextUntilTheEndIsSought) {
    scanner s("<a><![CDATA[abc");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    ASSERT_EQ(s.next(), lmx::xe_text);
    EXPECT_EQ(s.name, "abc");
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
    // Only looking for the element's end finds that the input is over.
    EXPECT_FALSE(s.xml.is_element_end_tag("a"));
}

TEST(Scanner, UnterminatedCdataDropsTrailingBrackets) {
    scanner s("<a><![CDATA[abc]]");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    ASSERT_EQ(s.next(), lmx::xe_text);
    EXPECT_EQ(s.name, "abc");
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
}

TEST(Scanner, UnterminatedCdataInValueComplainsAboutTheEnd) {
    scanner s("<a><![CDATA[abc");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    std::string value;
    EXPECT_FALSE(s.xml.get_element_value(&value, lmx::ws_preserve, true));
    ASSERT_EQ(s.errors.reports.size(), 1u) << s.errors.dump();
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_unexpected_end_of_message,
                             "Premature end of file encountered"))
        << s.errors.dump();
}

// ---------------------------------------------------------------- end tags

TEST(Scanner, EndTagCutOffAtEndOfInputIsNotWellFormed) {
    scanner s("<a></a");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_not_well_formed, "XML not Well-Formed"))
        << s.errors.dump();
}

TEST(Scanner, StartTagNameCutOffAtEndOfInputIsNotWellFormed) {
    scanner s("<a><bcd");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_not_well_formed, "XML not Well-Formed"))
        << s.errors.dump();
}

TEST(Scanner, EndTagWithJunkBeforeCloseIsNotWellFormed) {
    scanner s("<a></a x>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_not_well_formed, "XML not Well-Formed"))
        << s.errors.dump();
}

TEST(Scanner, EndTagWithoutNameFailsWithoutRecord) {
    scanner s("<a></>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, EndTagAllowsWhiteSpaceBeforeClose) {
    scanner s("<a></a \n >");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    ASSERT_EQ(s.next(), lmx::xe_end_tag);
    EXPECT_EQ(s.name, "a");
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
}

TEST(Scanner, LessThanBeforeJunkIsNotWellFormedAndSkipsTheTag) {
    scanner s("<a>< b=\">\"></a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_not_well_formed, "XML not Well-Formed"))
        << s.errors.dump();
    // The broken tag was passed over up to its unquoted ">".
    ASSERT_EQ(s.next(), lmx::xe_end_tag);
    EXPECT_EQ(s.name, "a");
}

TEST(Scanner, IsElementEndTagMatchesTheExactName) {
    {
        scanner s("<a>  </a \t>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
        EXPECT_TRUE(s.xml.is_element_end_tag("a"));
        EXPECT_EQ(s.next(), lmx::xe_end_of_input);
    }
    {
        scanner s("<a></b>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
        EXPECT_FALSE(s.xml.is_element_end_tag("a"));
    }
    {
        scanner s("<a></ab>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
        EXPECT_FALSE(s.xml.is_element_end_tag("a"));
    }
    {
        scanner s("<ab></a>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
        EXPECT_FALSE(s.xml.is_element_end_tag("ab"));
    }
    {
        scanner s("<a>x</a>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
        EXPECT_FALSE(s.xml.is_element_end_tag("a"));
    }
    {
        scanner s("<p:a></p:a>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
        EXPECT_TRUE(s.xml.is_element_end_tag("p:a"));
    }
}

// ------------------------------------------------------ attribute capture

TEST(Scanner, AttributeValueMayHoldLessThan) {
    scanner s("<a b=\"1<2\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "a");
    std::string attribute, value;
    ASSERT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_name);
    EXPECT_EQ(attribute, "b");
    ASSERT_TRUE(s.xml.get_attribute_value(&value, lmx::ws_preserve));
    EXPECT_EQ(value, "1<2");
    EXPECT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_end_tag);
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, AttributesComeBackInDocumentOrder) {
    scanner s("<a z=\"1\" y='2' x = \"3\"\n w=\"\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.attributes(), (attribute_list{{"z", "1"}, {"y", "2"}, {"x", "3"}, {"w", ""}}));
}

TEST(Scanner, EitherQuoteDelimitsAValue) {
    scanner s("<a b='x\"y' c=\"p'q\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.attributes(), (attribute_list{{"b", "x\"y"}, {"c", "p'q"}}));
}

TEST(Scanner, AttributeValueExpandsEntitiesWhenRead) {
    scanner s("<a b=\"&lt;&amp;&#65;&#x42;\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.attributes(), (attribute_list{{"b", "<&AB"}}));
}

TEST(Scanner, AttributeValueWithUnknownEntityFails) {
    scanner s("<a b=\"x&nope;y\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    std::string attribute, value;
    ASSERT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_name);
    EXPECT_FALSE(s.xml.get_attribute_value(&value, lmx::ws_preserve));
}

TEST(Scanner, SkippedAttributeValueMovesToTheNextAttribute) {
    scanner s("<a b=\"1\" c=\"2\" d=\"3\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    std::string attribute, value;
    ASSERT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_name);
    EXPECT_EQ(attribute, "b");
    s.xml.skip_attribute_value();
    ASSERT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_name);
    EXPECT_EQ(attribute, "c");
    ASSERT_TRUE(s.xml.get_attribute_value(&value, lmx::ws_preserve));
    EXPECT_EQ(value, "2");
    ASSERT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_name);
    EXPECT_EQ(attribute, "d");
    s.xml.skip_attribute_value();
    EXPECT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_end_tag);
}

TEST(Scanner, AttributeWithoutEqualsIsFatal) {
    scanner s("<a b/>");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_fatal, lmx::elmx_not_well_formed,
                             "Schema is not Well Formed (expected '=', got '/')"))
        << s.errors.dump();
    EXPECT_TRUE(s.errors.is_fatal_errored());
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
}

TEST(Scanner, AttributeValueWithoutQuoteIsFatal) {
    scanner s("<a b=1/>");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_fatal, lmx::elmx_not_well_formed,
                             "Schema is not Well Formed (expected '\"' or ''', got 1)"))
        << s.errors.dump();
}

TEST(Scanner, AttributeCutOffBeforeEqualsIsUnexpectedEnd) {
    scanner s("<a b");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_fatal, lmx::elmx_unexpected_end_of_message, "Unexpected end of file"))
        << s.errors.dump();
}

TEST(Scanner, AttributeValueCutOffIsFatal) {
    scanner s("<a b=\"1");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    ASSERT_FALSE(s.errors.reports.empty());
    const reported_error &r = s.errors.reports.front();
    EXPECT_EQ(r.type, lmx::elmx_type_fatal);
    EXPECT_EQ(r.code, lmx::elmx_not_well_formed);
    EXPECT_EQ(r.message.rfind("Schema is not Well Formed (expected '\"' or ''', got ", 0), 0u) << r.message;
}

TEST(Scanner, AttributeNamedXmlnsSomethingIsOrdinary) {
    scanner s("<a xmlnsfoo=\"1\" xmlns.x=\"2\" xmlns-y=\"3\" xmln=\"4\" xml:lang=\"en\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.attributes(),
              (attribute_list{{"xmlnsfoo", "1"}, {"xmlns.x", "2"}, {"xmlns-y", "3"}, {"xmln", "4"}, {"xml:lang", "en"}}));
    std::string ns_attribute;
    EXPECT_FALSE(s.xml.get_namespace_attribute_name(&ns_attribute));
    EXPECT_EQ(s.xml.find_enumerated_namespace("1"), 0);
    EXPECT_EQ(s.local.find_namespace_id(""), lmx::ns_none);
}

// ----------------------------------------------------------- get_attribute_name

TEST(Scanner, AttributeNamesEndAtStartTagEnd) {
    scanner s("<a x=\"1\">");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
}

TEST(Scanner, AttributeNamesEndAtEmptyElementEnd) {
    {
        scanner s("<a/>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        EXPECT_EQ(s.finish_tag(), lmx::xe_end_tag);
    }
    {
        scanner s("<a x=\"1\" / >");
        ASSERT_EQ(s.next(), lmx::xe_name);
        EXPECT_EQ(s.finish_tag(), lmx::xe_end_tag);
    }
}

TEST(Scanner, JunkAfterAttributesIsNotWellFormed) {
    scanner s("<a x=\"1\" =>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.finish_tag(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_not_well_formed, "XML not well-formed"))
        << s.errors.dump();
}

TEST(Scanner, JunkAfterSlashIsNotWellFormed) {
    scanner s("<a / x>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.finish_tag(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_not_well_formed, "XML not well-formed"))
        << s.errors.dump();
}

TEST(Scanner, QuestionMarkEndsOnlyADeclarationLikeTag) {
    {
        scanner s("<a x=\"1\" ?>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        EXPECT_EQ(s.finish_tag(), lmx::xe_fatal);
        EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_not_well_formed, "XML not well-formed"))
            << s.errors.dump();
    }
    {
        scanner s("<a x=\"1\" ?>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        std::string attribute;
        ASSERT_EQ(s.xml.get_attribute_name(&attribute, true), lmx::xe_name);
        s.xml.skip_attribute_value();
        EXPECT_EQ(s.xml.get_attribute_name(&attribute, true), lmx::xe_end_tag);
        EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
    }
    {
        scanner s("<a x=\"1\"/>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        std::string attribute;
        ASSERT_EQ(s.xml.get_attribute_name(&attribute, true), lmx::xe_name);
        s.xml.skip_attribute_value();
        EXPECT_EQ(s.xml.get_attribute_name(&attribute, true), lmx::xe_fatal);
        EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_not_well_formed, "XML not well-formed"))
            << s.errors.dump();
    }
}

TEST(Scanner, StartTagCutOffAfterAttributesFails) {
    scanner s("<a x=\"1\"  ");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    // The attribute captured before the end is still there; the tag's end is not.
    std::string attribute;
    ASSERT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_name);
    EXPECT_EQ(attribute, "x");
    s.xml.skip_attribute_value();
    EXPECT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_not_well_formed, "XML not well-formed"))
        << s.errors.dump();
}

// ------------------------------------------------- namespace declarations

TEST(Scanner, NamespaceDeclarationsApplyToTheWholeTag) {
    scanner s("<p:a x=\"1\" p:z=\"3\" xmlns:p=\"urn:p\" y=\"2\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "p:a");
    int id = s.xml.find_enumerated_namespace("urn:p");
    EXPECT_GE(id, 1000);
    EXPECT_EQ(s.local.find_namespace_id("p"), id);
    EXPECT_EQ(s.xml.get_ns_id(&s.local, "p:a"), id);
    EXPECT_EQ(s.xml.get_ns_id(&s.local, "p:z"), id);
    EXPECT_EQ(s.xml.find_namespace_from_id(id), std::string("urn:p"));
    // Declarations are not attributes; the others keep their order.
    EXPECT_EQ(s.attributes(), (attribute_list{{"x", "1"}, {"p:z", "3"}, {"y", "2"}}));
}

TEST(Scanner, NamespaceDeclarationsAreReadSeparately) {
    scanner s("<a xmlns=\"urn:d\" b=\"1\" xmlns:p=\"  urn:p  \"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    std::string name, value;
    ASSERT_TRUE(s.xml.get_namespace_attribute_name(&name));
    EXPECT_EQ(name, "xmlns");
    ASSERT_TRUE(s.xml.get_namespace_attribute_value(&value));
    EXPECT_EQ(value, "urn:d");
    ASSERT_TRUE(s.xml.get_namespace_attribute_name(&name));
    EXPECT_EQ(name, "xmlns:p");
    value.clear();
    ASSERT_TRUE(s.xml.get_namespace_attribute_value(&value));
    EXPECT_EQ(value, "urn:p"); // always collapsed
    EXPECT_FALSE(s.xml.get_namespace_attribute_name(&name));
    EXPECT_EQ(s.attributes(), (attribute_list{{"b", "1"}}));
}

TEST(Scanner, SkippedNamespaceValueMovesToTheNextDeclaration) {
    scanner s("<a xmlns:p=\"urn:p\" xmlns:q=\"urn:q\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    std::string name, value;
    ASSERT_TRUE(s.xml.get_namespace_attribute_name(&name));
    EXPECT_EQ(name, "xmlns:p");
    s.xml.skip_namespace_attribute_value();
    ASSERT_TRUE(s.xml.get_namespace_attribute_name(&name));
    EXPECT_EQ(name, "xmlns:q");
    ASSERT_TRUE(s.xml.get_namespace_attribute_value(&value));
    EXPECT_EQ(value, "urn:q");
}

TEST(Scanner, WithoutScopeNamespaceDeclarationsAreOrdinaryAttributes) {
    scanner s("<a xmlns:p=\"urn:p\" b=\"1\"/>");
    ASSERT_EQ(s.xml.get_element_name(nullptr, &s.name), lmx::xe_name);
    EXPECT_EQ(s.attributes(), (attribute_list{{"xmlns:p", "urn:p"}, {"b", "1"}}));
    EXPECT_EQ(s.xml.find_enumerated_namespace("urn:p"), 0);
}

TEST(Scanner, EmptyNamespaceDeclarationsUndeclare) {
    scanner s("<a xmlns=\"\" xmlns:p=\"\"/>");
    lmx::c_xml_local outer;
    outer.add_namespace("", 1000);
    outer.add_namespace("p", 1001);
    lmx::c_xml_local inner(&outer);
    ASSERT_EQ(s.xml.get_element_name(&inner, &s.name), lmx::xe_name);
    EXPECT_EQ(inner.find_namespace_id(""), lmx::ns_none);
    EXPECT_EQ(inner.find_namespace_id("p"), lmx::ns_not_found);
    EXPECT_EQ(outer.find_namespace_id(""), 1000);
    EXPECT_EQ(outer.find_namespace_id("p"), 1001);
    EXPECT_EQ(s.xml.get_ns_id(&inner, "a"), lmx::ns_none);
    EXPECT_EQ(s.xml.get_ns_id(&inner, "p:a"), lmx::ns_not_found);
}

TEST(Scanner, NamespaceValueEntitiesAreExpanded) {
    scanner s("<p:a xmlns:p=\"urn:a&amp;b\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    int id = s.xml.find_enumerated_namespace("urn:a&b");
    EXPECT_GE(id, 1000);
    EXPECT_EQ(s.local.find_namespace_id("p"), id);
}

TEST(Scanner, SameUriGetsTheSameIdWhateverThePrefix) {
    scanner s("<a xmlns:p=\"urn:same\" xmlns:q=\"urn:same\" xmlns:r=\"urn:other\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.local.find_namespace_id("p"), s.local.find_namespace_id("q"));
    EXPECT_NE(s.local.find_namespace_id("p"), s.local.find_namespace_id("r"));
    EXPECT_GE(s.local.find_namespace_id("r"), 1000);
}

TEST(Scanner, NsIdOfFixedAndUnknownPrefixes) {
    scanner s("<a xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.xml.get_ns_id(&s.local, "xml:lang"), lmx::ns_xml);
    EXPECT_EQ(s.xml.get_ns_id(&s.local, "q:x"), lmx::ns_not_found);
    EXPECT_EQ(s.xml.get_ns_id(&s.local, "x"), lmx::ns_none);
    EXPECT_EQ(s.xml.get_ns_id(&s.local, "xsi:type"), lmx::ns_xsi);
    EXPECT_TRUE(s.xml.is_xsi_attribute(&s.local, "xsi:type"));
    EXPECT_FALSE(s.xml.is_xsi_attribute(&s.local, "type"));
    EXPECT_FALSE(s.xml.is_xsi_attribute(&s.local, "q:type"));
}

TEST(Scanner, LocalNameAndPrefixSplitAtTheFirstColon) {
    std::string part;
    lmx::c_xml::get_local_name("p:a:b", &part);
    EXPECT_EQ(part, "a:b");
    lmx::c_xml::get_namespace_prefix("p:a:b", &part);
    EXPECT_EQ(part, "p");
    lmx::c_xml::get_local_name("a", &part);
    EXPECT_EQ(part, "a");
    lmx::c_xml::get_namespace_prefix("a", &part);
    EXPECT_EQ(part, "");
}

TEST(Scanner, NamedAttributeAndXsiTypeAreFoundByNamespace) {
    scanner s("<a xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" xmlns:p=\"urn:p\""
              " b=\"1\" p:c=\"2\" xsi:type=\"p:T\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    int p = s.xml.find_enumerated_namespace("urn:p");
    std::string value;
    EXPECT_TRUE(s.xml.get_named_attribute(&s.local, lmx::ns_none, "b", &value));
    EXPECT_EQ(value, "1");
    value.clear();
    EXPECT_TRUE(s.xml.get_named_attribute(&s.local, p, "c", &value));
    EXPECT_EQ(value, "2");
    value.clear();
    EXPECT_FALSE(s.xml.get_named_attribute(&s.local, lmx::ns_none, "c", &value));
    EXPECT_FALSE(s.xml.get_named_attribute(&s.local, p, "b", &value));

    int type_ns = 0;
    std::string type_name;
    ASSERT_TRUE(s.xml.get_xsi_type(&s.local, &type_ns, &type_name));
    EXPECT_EQ(type_ns, p);
    EXPECT_EQ(type_name, "T");

    // The search leaves the attributes to be read from the start.
    EXPECT_EQ(s.attributes(), (attribute_list{{"b", "1"}, {"p:c", "2"}, {"xsi:type", "p:T"}}));
}

// ---------------------------------------------------------- whitespace modes

TEST(Scanner, AttributeValueWhitespaceModes) {
    const std::string raw = "  a \t b\n c  ";
    scanner s("<a p=\"" + raw + "\" r=\"" + raw + "\" c=\"" + raw + "\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    std::string attribute, value;
    ASSERT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_name);
    ASSERT_TRUE(s.xml.get_attribute_value(&value, lmx::ws_preserve));
    EXPECT_EQ(value, "  a \t b\n c  ");
    value.clear();
    ASSERT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_name);
    ASSERT_TRUE(s.xml.get_attribute_value(&value, lmx::ws_replace));
    EXPECT_EQ(value, "  a   b  c  ");
    value.clear();
    ASSERT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_name);
    ASSERT_TRUE(s.xml.get_attribute_value(&value, lmx::ws_collapse));
    EXPECT_EQ(value, "a b c");
}

TEST(Scanner, ElementValueWhitespaceModes) {
    const std::string document = "<a>\t a \n\n b \t</a>";
    EXPECT_EQ(element_value(document, lmx::ws_preserve, true), "\t a \n\n b \t");
    EXPECT_EQ(element_value(document, lmx::ws_replace, true), "  a    b  ");
    EXPECT_EQ(element_value(document, lmx::ws_collapse, true), "a b");
    EXPECT_EQ(element_value("<a>   </a>", lmx::ws_collapse, true), "");
}

TEST(Scanner, CharacterReferencesKeepTheirWhiteSpaceOutsideSchemaReading) {
    const std::string attribute = "<a v=\" x&#9;y&#32;&#32;z&#10;\"/>";
    const std::string element = "<a> x&#9;y&#32;&#32;z&#10;</a>";

    // Preserve: everything as it is, either way.
    for (bool xsd : {false, true}) {
        EXPECT_EQ(attribute_value(attribute, lmx::ws_preserve, xsd), " x\ty  z\n") << xsd;
        EXPECT_EQ(element_value(element, lmx::ws_preserve, xsd), " x\ty  z\n") << xsd;
    }

    // Replace: white from a character reference stays unless reading for a schema.
    EXPECT_EQ(attribute_value(attribute, lmx::ws_replace, false), " x\ty  z\n");
    EXPECT_EQ(attribute_value(attribute, lmx::ws_replace, true), " x y  z ");
    EXPECT_EQ(element_value(element, lmx::ws_replace, false), " x\ty  z\n");
    EXPECT_EQ(element_value(element, lmx::ws_replace, true), " x y  z ");

    // Collapse: only a referenced blank counts as white unless reading for a schema.
    EXPECT_EQ(attribute_value(attribute, lmx::ws_collapse, false), "x\ty z\n");
    EXPECT_EQ(attribute_value(attribute, lmx::ws_collapse, true), "x y z");
    EXPECT_EQ(element_value(element, lmx::ws_collapse, false), "x\ty z\n");
    EXPECT_EQ(element_value(element, lmx::ws_collapse, true), "x y z");
}

TEST(Scanner, AddCharWspFollowsTheMode) {
    std::string text = " ";
    lmx::c_read_memory source(text.data(), text.size());
    recording_error errors;
    lmx::c_xml xml(source, errors, false);

    std::string value;
    xml.set_ws_mode(lmx::ws_collapse);
    EXPECT_EQ(xml.get_ws_mode(), lmx::ws_collapse);
    for (char c : std::string("  a  b  "))
        xml.add_char_wsp(&value, c);
    EXPECT_EQ(value, "a b");

    value.clear();
    xml.set_ws_mode(lmx::ws_replace);
    for (char c : std::string("a\tb\n"))
        xml.add_char_wsp(&value, c);
    EXPECT_EQ(value, "a b ");
    value.clear();
    xml.add_char_wsp(&value, '\t', true);
    EXPECT_EQ(value, "\t");

    value.clear();
    xml.set_ws_mode(lmx::ws_preserve);
    for (char c : std::string(" a\t"))
        xml.add_char_wsp(&value, c);
    EXPECT_EQ(value, " a\t");
}

// ------------------------------------------------------------ element value

TEST(Scanner, ElementValueSkipsProcessingInstructions) {
    EXPECT_EQ(element_value("<a>x<?pi y?>z</a>", lmx::ws_preserve, true), "xz");
}

TEST(Scanner, ElementValueExpandsEntitiesOnlyWhenAsked) {
    {
        scanner s("<a>x&amp;y&#65;</a>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
        std::string value;
        ASSERT_TRUE(s.xml.get_element_value(&value, lmx::ws_preserve, true));
        EXPECT_EQ(value, "x&yA");
    }
    {
        scanner s("<a>x&amp;y&#65;</a>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
        std::string value;
        ASSERT_TRUE(s.xml.get_element_value(&value, lmx::ws_preserve, false));
        EXPECT_EQ(value, "x&amp;y&#65;");
    }
}

TEST(Scanner, ElementValueWithUnknownEntityFails) {
    scanner s("<a>x&nope;y</a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    std::string value;
    EXPECT_FALSE(s.xml.get_element_value(&value, lmx::ws_preserve, true));
}

TEST(Scanner, ElementValueRejectsOtherMarkupDeclarations) {
    for (const char *document : {"<a>x<!DOCTYPE y>z</a>", "<a>x<!-y-->z</a>", "<a>x<!ELEMENT y></a>"}) {
        scanner s(document);
        ASSERT_EQ(s.next(), lmx::xe_name);
        ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
        std::string value;
        EXPECT_FALSE(s.xml.get_element_value(&value, lmx::ws_preserve, true)) << document;
        EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_not_well_formed, "XML not well-formed"))
            << document << ": " << s.errors.dump();
    }
}

TEST(Scanner, ElementValueAtEndOfInputIsPrematureEnd) {
    scanner s("<a>abc");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    std::string value;
    EXPECT_FALSE(s.xml.get_element_value(&value, lmx::ws_preserve, true));
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_unexpected_end_of_message,
                             "Premature end of file encountered"))
        << s.errors.dump();
}

TEST(Scanner, ElementValueStopsBeforeAChildAndLeavesItToBeRead) {
    scanner s("<a>x<b/></a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    std::string value;
    ASSERT_TRUE(s.xml.get_element_value(&value, lmx::ws_preserve, true));
    EXPECT_EQ(value, "x");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "b");
}

TEST(Scanner, EmptyElementValue) {
    scanner s("<a></a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    std::string value = "old";
    ASSERT_TRUE(s.xml.get_element_value(&value, lmx::ws_preserve, true));
    EXPECT_EQ(value, "");
    EXPECT_TRUE(s.xml.is_element_end_tag("a"));
}

TEST(Scanner, NestedValueHandsBackTheEndTagNameUncompared) {
    scanner s("<a>x<b k='1'>y</b><!-- c --></c>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    std::string value, end_name;
    ASSERT_TRUE(s.xml.get_nested_element_value(&value, &end_name, lmx::ws_preserve, false)) << s.errors.dump();
    EXPECT_EQ(value, "x<b k='1'>y</b>");
    EXPECT_EQ(end_name, "c");
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
}

// ------------------------------------------------------ start tag end

TEST(Scanner, StartTagEndIgnoresQuotedMarkup) {
    scanner s(" x=\"a>b\" y='/>'>rest");
    bool is_end = true;
    EXPECT_TRUE(s.xml.move_to_start_tag_end(&is_end));
    EXPECT_FALSE(is_end);
    ASSERT_EQ(s.next(), lmx::xe_text);
    EXPECT_EQ(s.name, "rest");
}

TEST(Scanner, StartTagEndFindsEmptyElement) {
    scanner s(" x=\"1\" / >rest");
    bool is_end = false;
    EXPECT_TRUE(s.xml.move_to_start_tag_end(&is_end));
    EXPECT_TRUE(is_end);
    ASSERT_EQ(s.next(), lmx::xe_text);
    EXPECT_EQ(s.name, "rest");
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, StartTagEndWithJunkAfterSlashIsEndTagSyntax) {
    scanner s(" x=\"1\" / zz>rest");
    bool is_end = false;
    EXPECT_FALSE(s.xml.move_to_start_tag_end(&is_end));
    EXPECT_TRUE(is_end);
    ASSERT_EQ(s.errors.reports.size(), 1u) << s.errors.dump();
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_end_tag_syntax,
                             "Illegal character(s) after / at end of tag - z"))
        << s.errors.dump();
}

TEST(Scanner, StartTagEndAtEndOfInputFails) {
    scanner s(" x=\"1\" ");
    bool is_end = false;
    EXPECT_FALSE(s.xml.move_to_start_tag_end(&is_end));
}

TEST(Scanner, SkipStartTagFinishesACapturedTag) {
    {
        scanner s("<a x=\"1\">t</a>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        bool is_end = true;
        EXPECT_TRUE(s.xml.skip_start_tag(&is_end));
        EXPECT_FALSE(is_end);
        ASSERT_EQ(s.next(), lmx::xe_text);
        EXPECT_EQ(s.name, "t");
    }
    {
        scanner s("<a x=\"1\"/><b/>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        bool is_end = false;
        EXPECT_TRUE(s.xml.skip_start_tag(&is_end));
        EXPECT_TRUE(is_end);
        ASSERT_EQ(s.next(), lmx::xe_name);
        EXPECT_EQ(s.name, "b");
    }
}

// ----------------------------------------------------------- skipping

TEST(Scanner, SkipElementBodyPassesNestedContent) {
    scanner s("<a>t<b x=\"1\">u<c/><![CDATA[</b>]]><!-- </b> --></b><d></d></a><z/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_TRUE(s.xml.skip_element_body("a")) << s.errors.dump();
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "z");
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, SkipElementBodyWithMismatchedEndTagFails) {
    scanner s("<a></b>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_FALSE(s.xml.skip_element_body("a"));
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_not_well_formed,
                             "Element start tag (a) and end tag (b) do not match"))
        << s.errors.dump();
}

TEST(Scanner, SkipElementBodyMatchesEveryNestedName) {
    scanner s("<a><b><c></d></b></a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_FALSE(s.xml.skip_element_body("a"));
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_not_well_formed,
                             "Element start tag (c) and end tag (d) do not match"))
        << s.errors.dump();
}

TEST(Scanner, SkipElementBodyAtEndOfInputFails) {
    scanner s("<a><b>text");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_FALSE(s.xml.skip_element_body("a"));
}

TEST(Scanner, SkipRestOfElementPassesTagAndBody) {
    {
        scanner s("<a x=\"1\"><b/>t</a><z/>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        EXPECT_TRUE(s.xml.skip_rest_of_element("a"));
        ASSERT_EQ(s.next(), lmx::xe_name);
        EXPECT_EQ(s.name, "z");
    }
    {
        scanner s("<a x=\"1\"/><z/>");
        ASSERT_EQ(s.next(), lmx::xe_name);
        EXPECT_TRUE(s.xml.skip_rest_of_element("a"));
        ASSERT_EQ(s.next(), lmx::xe_name);
        EXPECT_EQ(s.name, "z");
    }
}

// ------------------------------------------------------- any-element capture

TEST(Scanner, AnyElementCaptureIsExact) {
    scanner s("<r><p:any a='1&amp;2' xmlns:p=\"urn:p\" b=\"2\">\n"
              "  <p:child  c=\"3\" />text<!-- comment --><?pi x?><![CDATA[ <raw> ]]>\n"
              "  <q:c xmlns:q=\"urn:q\" d='4'/>\n"
              "  <p:inner>v</p:inner>\n"
              "</p:any><z/></r>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.name, "p:any");
    std::string value;
    ASSERT_TRUE(s.xml.get_any_element("p:any", &value, lmx::ws_preserve, false)) << s.errors.dump();
    EXPECT_EQ(value, "<p:any xmlns:p=\"urn:p\" a='1&amp;2' b=\"2\">"
                     "<p:child c=\"3\"/>"
                     "text"
                     "<![CDATA[ <raw> ]]>"
                     "<q:c xmlns:q=\"urn:q\" d='4'/>"
                     "<p:inner>v</p:inner>"
                     "</p:any>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "z");
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, AnyElementCaptureOfEmptyElement) {
    scanner s("<x:e k=\"v\" xmlns:x=\"urn:x\"/><z/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    std::string value;
    ASSERT_TRUE(s.xml.get_any_element("x:e", &value, lmx::ws_preserve, false)) << s.errors.dump();
    EXPECT_EQ(value, "<x:e xmlns:x=\"urn:x\" k=\"v\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "z");
}

TEST(Scanner, AnyElementCaptureDropsWhiteSpaceBeforeTags) {
    scanner s("<a>\n  <b>x</b>\n  <c/>\n</a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    std::string value;
    ASSERT_TRUE(s.xml.get_any_element("a", &value, lmx::ws_preserve, false)) << s.errors.dump();
    EXPECT_EQ(value, "<a><b>x</b><c/></a>");
}

TEST(Scanner, AnyElementCaptureWithMismatchedEndTagFails) {
    scanner s("<a><b></c></a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    std::string value;
    EXPECT_FALSE(s.xml.get_any_element("a", &value, lmx::ws_preserve, false));
}

TEST(Scanner, AnyElementCaptureAtEndOfInputFails) {
    scanner s("<a><b>text");
    ASSERT_EQ(s.next(), lmx::xe_name);
    std::string value;
    EXPECT_FALSE(s.xml.get_any_element("a", &value, lmx::ws_preserve, false));
}

// ------------------------------------------------------- DOCTYPE placement

TEST(Scanner, DoctypeWithExternalIdentifierIsAcceptedAndIgnored) {
    scanner s("<?xml version=\"1.0\"?><!-- c --><!DOCTYPE r SYSTEM \"x.dtd\"><r/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "r");
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, DoctypeInternalEntityIsUsedInContent) {
    EXPECT_EQ(element_value("<!DOCTYPE a [<!ENTITY e \"v\">]><a>&e;</a>", lmx::ws_preserve, true), "v");
}

TEST(Scanner, DoctypeAfterContentIsBad) {
    scanner s("<a/><!DOCTYPE a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_end_tag);
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_bad_dtd,
                             "Document Type Declaration not at start of document"))
        << s.errors.dump();
}

TEST(Scanner, SecondDoctypeIsBad) {
    scanner s("<!DOCTYPE a><!DOCTYPE a><a/>");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_error, lmx::elmx_bad_dtd, "Document Type Declaration already read"))
        << s.errors.dump();
}

TEST(Scanner, MisspelledDoctypeFailsWithoutRecord) {
    scanner s("<!DOCTYPO a><a/>");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, MalformedCommentOpeningFailsWithoutRecord) {
    scanner s("<!-x--><a/>");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

// ------------------------------------------------------------ nesting depth

TEST(Scanner, SkipElementBodyRefusesNestingBeyondTheLimit) {
    scanner s(nested(1001));
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_FALSE(s.xml.skip_element_body("e"));
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_fatal, lmx::elmx_not_well_formed, "Element nesting too deep"))
        << s.errors.dump();
    EXPECT_TRUE(s.errors.is_fatal_errored());
}

TEST(Scanner, SkipElementBodyAcceptsDeepLegalNesting) {
    scanner s(nested(999) + "<z/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    EXPECT_TRUE(s.xml.skip_element_body("e")) << s.errors.dump();
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.name, "z");
}

TEST(Scanner, AnyElementCaptureRefusesNestingBeyondTheLimit) {
    scanner s(nested(1001));
    ASSERT_EQ(s.next(), lmx::xe_name);
    std::string value;
    EXPECT_FALSE(s.xml.get_any_element("e", &value, lmx::ws_preserve, false));
    EXPECT_TRUE(s.errors.has(lmx::elmx_type_fatal, lmx::elmx_not_well_formed, "Element nesting too deep"))
        << s.errors.dump();
}

TEST(Scanner, AnyElementCaptureAcceptsDeepLegalNesting) {
    const std::string document = nested(999);
    scanner s(document);
    ASSERT_EQ(s.next(), lmx::xe_name);
    std::string value;
    ASSERT_TRUE(s.xml.get_any_element("e", &value, lmx::ws_preserve, false)) << s.errors.dump();
    EXPECT_EQ(value, document);
    EXPECT_TRUE(s.errors.reports.empty()) << s.errors.dump();
}

TEST(Scanner, HundredThousandNestedLevelsDoNotCrash) {
    const std::string document = nested(100000);
    {
        scanner s(document);
        ASSERT_EQ(s.next(), lmx::xe_name);
        ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
        EXPECT_FALSE(s.xml.skip_element_body("e"));
        EXPECT_EQ(s.errors.get_last_error(), lmx::elmx_not_well_formed);
    }
    {
        scanner s(document);
        ASSERT_EQ(s.next(), lmx::xe_name);
        std::string value;
        EXPECT_FALSE(s.xml.get_any_element("e", &value, lmx::ws_preserve, false));
        EXPECT_EQ(s.errors.get_last_error(), lmx::elmx_not_well_formed);
    }
    {
        // The plain event loop is not recursive: it reads every level.
        scanner s(document);
        int starts = 0, ends = 0;
        for (int event = s.next(); event != lmx::xe_end_of_input; event = s.next()) {
            ASSERT_NE(event, lmx::xe_fatal) << s.errors.dump();
            if (event == lmx::xe_name) {
                ++starts;
                ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
            } else if (event == lmx::xe_end_tag) {
                ++ends;
            }
        }
        EXPECT_EQ(starts, 100000);
        EXPECT_EQ(ends, 100000);
    }
}

} // namespace
