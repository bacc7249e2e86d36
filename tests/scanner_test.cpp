// Tests of the XML scanner, lmx::c_xml: events, the XML declaration,
// comments, processing instructions, CDATA, DOCTYPE placement, attribute and
// namespace capture, whitespace modes, element values, skipping and capture
// of whole elements, and the nesting limit of the recursive scans.
//
// The scanner is built here over a c_read_memory with a c_error of our own,
// so that the message words of every report can be checked.

#include <gtest/gtest.h>

#include <lmx/lmxparse.h>

#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "reader_walk.h"

namespace {

using tessarine_test::nested_elements;
using tessarine_test::recording_error;
using tessarine_test::reported_error;

// A scanner over a text it owns, with a namespace scope for its start tags.
struct scanner {
    explicit scanner(std::string a_text, bool a_is_reading_xsd = true)
        : text(std::move(a_text)), source(text.data(), text.size()), xml(source, errors, a_is_reading_xsd) {}

    // The next event at the element level, with `local` as the scope.
    int next() { return xml.get_element_name(&local, &name); }

    // The next event is a_event, with ar_name (the name or the text) in `name`.
    ::testing::AssertionResult next_is(int a_event, const std::string &ar_name) {
        const int event = next();
        if (event != a_event)
            return ::testing::AssertionFailure() << "event " << event << ", expected " << a_event;
        if (name != ar_name)
            return ::testing::AssertionFailure() << "\"" << name << "\", expected \"" << ar_name << "\"";
        return ::testing::AssertionSuccess();
    }

    // Passes the attributes of the current start tag; gives the event that
    // ended them.
    int finish_tag() {
        std::string attribute;
        int event;
        while ((event = xml.get_attribute_name(&attribute)) == lmx::xe_name)
            xml.skip_attribute_value();
        return event;
    }

    // Reads the first start tag and passes its attributes, which must end
    // with a_tag_end.
    ::testing::AssertionResult enter_root(int a_tag_end = lmx::xe_start_tag_end) {
        const int event = next();
        if (event != lmx::xe_name)
            return ::testing::AssertionFailure() << "first event " << event << ", not a start tag";
        const int tag_end = finish_tag();
        if (tag_end != a_tag_end)
            return ::testing::AssertionFailure() << "start tag ended with " << tag_end << ", not " << a_tag_end;
        return ::testing::AssertionSuccess();
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

    // The value of the element whose start tag has been read, whitespace
    // preserved, entities expanded when a_expand says.
    bool value(std::string *ap_value, bool a_expand = true) {
        return xml.get_element_value(ap_value, lmx::ws_preserve, a_expand);
    }

    // The value read as value() reads it is ar_expected.
    ::testing::AssertionResult value_is(const std::string &ar_expected, bool a_expand = true) {
        std::string read;
        if (!value(&read, a_expand))
            return ::testing::AssertionFailure() << "the value cannot be read: " << errors.describe();
        if (read != ar_expected)
            return ::testing::AssertionFailure() << "value \"" << read << "\", expected \"" << ar_expected << "\"";
        return ::testing::AssertionSuccess();
    }

    // Captures the current element whole, as the reader does for xs:any.
    bool any_element(const std::string &ar_name, std::string *ap_value) {
        return xml.get_any_element(ar_name, ap_value, lmx::ws_preserve, false);
    }

    // The capture of the current element ar_name is ar_expected.
    ::testing::AssertionResult captured_is(const std::string &ar_name, const std::string &ar_expected) {
        std::string captured;
        if (!any_element(ar_name, &captured))
            return ::testing::AssertionFailure() << ar_name << " cannot be captured: " << errors.describe();
        if (captured != ar_expected)
            return ::testing::AssertionFailure() << "captured \"" << captured << "\", expected \"" << ar_expected
                                                 << "\"";
        return ::testing::AssertionSuccess();
    }

    std::string text;
    lmx::c_read_memory source;
    recording_error errors;
    lmx::c_xml xml;
    lmx::c_xml_local local;
    std::string name;
};

using attribute_list = std::vector<std::pair<std::string, std::string>>;

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
    EXPECT_TRUE(s.xml.get_element_value(&value, a_mode, true)) << s.errors.describe();
    return value;
}

// A report the scanner must have made. A report without message stands for
// none at all; a report left out of a row is not checked.
struct expected_report {
    lmx::elmx_error_type type;
    lmx::elmx_error code;
    const char *message;
};
const expected_report k_nothing_reported = {lmx::elmx_type_none, lmx::elmx_ok, nullptr};

void expect_reported(const scanner &ar_scanner, const std::optional<expected_report> &ar_report) {
    if (!ar_report)
        return;
    if (ar_report->message) {
        EXPECT_TRUE(ar_scanner.errors.reported(ar_report->type, ar_report->code, ar_report->message))
            << ar_scanner.errors.describe();
    } else {
        EXPECT_TRUE(ar_scanner.errors.reports().empty()) << ar_scanner.errors.describe();
    }
}

// The first event of the document is fatal, with the report given.
void expect_fatal_at_once(const std::string &ar_document, const expected_report &ar_report) {
    scanner s(ar_document);
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    expect_reported(s, ar_report);
}

// After the root's start tag, ending with a_tag_end, the next event is fatal
// with the report given.
void expect_fatal_after_root(scanner &ar_scanner, int a_tag_end, const std::optional<expected_report> &ar_report) {
    ASSERT_TRUE(ar_scanner.enter_root(a_tag_end));
    EXPECT_EQ(ar_scanner.next(), lmx::xe_fatal);
    expect_reported(ar_scanner, ar_report);
}

void expect_fatal_after_root(const std::string &ar_document, int a_tag_end,
                             const std::optional<expected_report> &ar_report) {
    scanner s(ar_document);
    expect_fatal_after_root(s, a_tag_end, ar_report);
}

const expected_report k_xml_not_well_formed = {lmx::elmx_type_error, lmx::elmx_not_well_formed,
                                               "XML not Well-Formed"};
const expected_report k_xml_not_well_formed_lower = {lmx::elmx_type_error, lmx::elmx_not_well_formed,
                                                     "XML not well-formed"};
const expected_report k_declaration_not_at_start = {lmx::elmx_type_fatal, lmx::elmx_bad_xml_decl,
                                                    "XML declaration not at start of document"};
const expected_report k_premature_end = {lmx::elmx_type_error, lmx::elmx_unexpected_end_of_message,
                                         "Premature end of file encountered"};

// A document the scanner must refuse, and what it reports then.
struct refused_row {
    const char *name;
    std::string document;
    std::optional<expected_report> report;
};

// ------------------------------------------------------------- event codes

TEST(Scanner, EventCodesHaveFixedValues) {
    tessarine_test::expect_constants({
        TESSARINE_CONSTANT(lmx::xe_end_of_input, 0),
        TESSARINE_CONSTANT(lmx::xe_unknown, 1),
        TESSARINE_CONSTANT(lmx::xe_error, 2),
        TESSARINE_CONSTANT(lmx::xe_fatal, 3),
        TESSARINE_CONSTANT(lmx::xe_start_tag_end, 4),
        TESSARINE_CONSTANT(lmx::xe_text, 5),
        TESSARINE_CONSTANT(lmx::xe_end_tag, 6),
        TESSARINE_CONSTANT(lmx::xe_name, 7),
        TESSARINE_CONSTANT(lmx::xe_xsi_type, 8),
        TESSARINE_CONSTANT(lmx::xe_xsi_nil, 9),
        TESSARINE_CONSTANT(lmx::xe_xsi_schema_location, 10),
        TESSARINE_CONSTANT(lmx::xe_xsi_no_namespace_schema_location, 11),
        TESSARINE_CONSTANT(lmx::xe_first_user_token, 12),
        TESSARINE_CONSTANT(lmx::ws_preserve, 0),
        TESSARINE_CONSTANT(lmx::ws_replace, 1),
        TESSARINE_CONSTANT(lmx::ws_collapse, 2),
        TESSARINE_CONSTANT(lmx::c_xml::tag_start, 0),
        TESSARINE_CONSTANT(lmx::c_xml::tag_other, 1),
        TESSARINE_CONSTANT(lmx::c_xml::tag_end, 2),
        TESSARINE_CONSTANT(lmx::c_xml::tag_bad, 3),
    });
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
    ASSERT_TRUE(s.next_is(lmx::xe_name, "a"));
    EXPECT_EQ(s.attributes(), (attribute_list{{"x", "1"}}));
    // After the attributes the tag is over.
    ASSERT_TRUE(s.next_is(lmx::xe_text, "hello"));
    ASSERT_TRUE(s.next_is(lmx::xe_end_tag, "a"));
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
}

// The root holds one text run, ar_text, and then ends.
void expect_one_text_run(scanner &ar_scanner, const std::string &ar_text) {
    ASSERT_TRUE(ar_scanner.enter_root());
    ASSERT_TRUE(ar_scanner.next_is(lmx::xe_text, ar_text));
    EXPECT_EQ(ar_scanner.next(), lmx::xe_end_tag);
}

TEST(Scanner, TextEventLosesLeadingWhiteSpace) {
    scanner s("<a>  \n x  y  </a>");
    expect_one_text_run(s, "x  y  ");
}

TEST(Scanner, WhiteSpaceBetweenTagsGivesNoTextEvent) {
    scanner s("<a>\n  <b/>\n\t</a>");
    ASSERT_TRUE(s.enter_root());
    ASSERT_TRUE(s.next_is(lmx::xe_name, "b"));
    ASSERT_EQ(s.finish_tag(), lmx::xe_end_tag);
    ASSERT_TRUE(s.next_is(lmx::xe_end_tag, "a"));
}

TEST(Scanner, TextStartingWithEntityIsOneTextEvent) {
    scanner s("<a>&lt;x&gt; y</a>");
    expect_one_text_run(s, "<x> y");
}

TEST(Scanner, EntityHoldingMarkupInContentYieldsTheElement) {
    scanner s("<!DOCTYPE a [<!ENTITY b \"<b/>\">]><a>&b;</a>");
    ASSERT_TRUE(s.next_is(lmx::xe_name, "a"));
    ASSERT_EQ(s.finish_tag(), lmx::xe_start_tag_end);
    ASSERT_TRUE(s.next_is(lmx::xe_name, "b"));
    EXPECT_EQ(s.finish_tag(), lmx::xe_end_tag);
    ASSERT_TRUE(s.next_is(lmx::xe_end_tag, "a"));
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
}

// ------------------------------------------------------- XML declaration

struct prolog_row {
    const char *name;
    std::string document;
    const char *root; // the root's name; not checked when null
};

// The first event is the root's start tag, and nothing was reported.
void expect_prolog_accepted(const prolog_row &ar_row) {
    SCOPED_TRACE(ar_row.name);
    scanner s(ar_row.document);
    if (ar_row.root) {
        ASSERT_TRUE(s.next_is(lmx::xe_name, ar_row.root));
    } else {
        ASSERT_EQ(s.next(), lmx::xe_name);
    }
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
}

TEST(Scanner, WhatMayStandBeforeTheRootIsAccepted) {
    const prolog_row rows[] = {
        {"XML declaration", "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"yes\"?>\n<a/>", "a"},
        {"XML declaration with a bare encoding", "<?xml version=\"1.0\" encoding?><a/>", "a"},
        {"standalone value is ignored", "<?xml version='1.0' standalone='whatever'?><a/>", nullptr},
        {"XML version 1.1", "<?xml version=\"1.1\"?><a/>", nullptr},
        {"comment before the XML declaration", "<!-- first --><?xml version=\"1.0\"?><a/>", "a"},
        {"processing instruction before the XML declaration", "<?app data?><?xml version=\"1.0\"?><a/>", nullptr},
        {"white space before the XML declaration", "\n  <?xml version=\"1.0\"?><a/>", nullptr},
        {"double dash inside a comment is tolerated", "<!-- a -- b - c --><a/>", nullptr},
        {"DOCTYPE with external identifier is accepted and ignored",
         "<?xml version=\"1.0\"?><!-- c --><!DOCTYPE r SYSTEM \"x.dtd\"><r/>", "r"},
    };
    for (const prolog_row &row : rows)
        expect_prolog_accepted(row);
}

TEST(Scanner, XmlVersionOnePointTwoIsUnsupported) {
    scanner s("<?xml version=\"1.2\"?><a/>");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    expect_reported(s, expected_report{lmx::elmx_type_error, lmx::elmx_unsupported_xml_version,
                                       "XML version 1.2 not understood"});
    EXPECT_EQ(s.errors.get_last_error(), lmx::elmx_unsupported_xml_version);
}

TEST(Scanner, MarkupThatCannotStartADocumentIsFatalAtOnce) {
    const expected_report version_missing = {lmx::elmx_type_error, lmx::elmx_bad_xml_decl,
                                             "Version not present in XML Decl"};
    const refused_row rows[] = {
        {"XML declaration without version is bad", "<?xml encoding=\"UTF-8\"?><a/>", version_missing},
        {"XML declaration version without equals is bad", "<?xml version \"1.0\"?><a/>", version_missing},
        {"XML declaration without closing fails silently", "<?xml version=\"1.0\" ?<a/>", k_nothing_reported},
        {"attribute value without quote is fatal", "<a b=1/>",
         expected_report{lmx::elmx_type_fatal, lmx::elmx_not_well_formed,
                         "Schema is not Well Formed (expected '\"' or ''', got 1)"}},
        {"attribute cut off before equals is unexpected end", "<a b",
         expected_report{lmx::elmx_type_fatal, lmx::elmx_unexpected_end_of_message, "Unexpected end of file"}},
        {"second DOCTYPE is bad", "<!DOCTYPE a><!DOCTYPE a><a/>",
         expected_report{lmx::elmx_type_error, lmx::elmx_bad_dtd, "Document Type Declaration already read"}},
        {"misspelled DOCTYPE fails without record", "<!DOCTYPO a><a/>", k_nothing_reported},
        {"malformed comment opening fails without record", "<!-x--><a/>", k_nothing_reported},
    };
    for (const refused_row &row : rows) {
        SCOPED_TRACE(row.name);
        expect_fatal_at_once(row.document, *row.report);
    }
}

TEST(Scanner, ElementBeforeXmlDeclarationIsFatal) {
    scanner s("<a/><?xml version=\"1.0\"?>");
    ASSERT_NO_FATAL_FAILURE(expect_fatal_after_root(s, lmx::xe_end_tag, k_declaration_not_at_start));
    EXPECT_TRUE(s.errors.is_fatal_errored());
    // The stream is dead from here on.
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
}

TEST(Scanner, TextBeforeXmlDeclarationMakesItMisplaced) {
    scanner s(" x<?xml version=\"1.0\"?><a/>");
    ASSERT_TRUE(s.next_is(lmx::xe_text, "x"));
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.reported(lmx::elmx_bad_xml_decl)) << s.errors.describe();
}

TEST(Scanner, FailedMarkupDoesNotCountAsContent) {
    // "<!X" fails without a record; it does not set the seen-content state,
    // so a declaration after it is still taken as the first thing.
    scanner s("<!X><?xml version=\"1.0\"?><a/>");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
    ASSERT_TRUE(s.next_is(lmx::xe_name, "a"));
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
}

TEST(Scanner, RewindForgetsSeenContentAndNamespaces) {
    scanner s("<?xml version=\"1.0\"?><a/>");
    ASSERT_TRUE(s.enter_root(lmx::xe_end_tag));
    ASSERT_EQ(s.next(), lmx::xe_end_of_input);
    EXPECT_EQ(s.xml.add_namespace("urn:added"), 1000);

    s.xml.rewind();
    EXPECT_EQ(s.xml.find_enumerated_namespace("urn:added"), 0);
    EXPECT_EQ(s.xml.find_enumerated_namespace(lmx::k_xsi_namespace_uri), lmx::ns_xsi);
    // The declaration is at the start again.
    ASSERT_TRUE(s.next_is(lmx::xe_name, "a"));
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
}

// ------------------------------------------------- processing instructions

TEST(Scanner, StylesheetProcessingInstructionIsSkipped) {
    scanner s("<?xml version=\"1.0\"?>\n<?xml-stylesheet type=\"text/xsl\" href=\"s.xsl\"?>\n<a/>"
              "<?xml-stylesheet href=\"after.xsl\"?>");
    ASSERT_TRUE(s.next_is(lmx::xe_name, "a"));
    ASSERT_EQ(s.finish_tag(), lmx::xe_end_tag);
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
}

TEST(Scanner, ProcessingInstructionInContentIsSkipped) {
    scanner s("<a>x<?pi some data?>z</a>");
    ASSERT_TRUE(s.enter_root());
    ASSERT_TRUE(s.next_is(lmx::xe_text, "x"));
    ASSERT_TRUE(s.next_is(lmx::xe_text, "z"));
    EXPECT_EQ(s.next(), lmx::xe_end_tag);
}

// ---------------------------------------------------------------- comments

const expected_report k_comment_end_warning = {lmx::elmx_type_warning, lmx::elmx_bad_comment,
                                               "End of comment not Well-Formed"};

TEST(Scanner, CommentEndingInThreeDashesWarns) {
    scanner s("<!--x---><a/>");
    ASSERT_TRUE(s.next_is(lmx::xe_name, "a"));
    ASSERT_EQ(s.errors.reports().size(), 1u) << s.errors.describe();
    expect_reported(s, k_comment_end_warning);
    EXPECT_EQ(s.errors.get_warning_count(), 1);
    EXPECT_FALSE(s.errors.is_fatal_errored());
}

TEST(Scanner, CommentEndingInThreeDashesInsideValueWarnsAndGoesOn) {
    scanner s("<a>1<!--x--->2</a>");
    ASSERT_TRUE(s.enter_root());
    ASSERT_TRUE(s.value_is("12"));
    expect_reported(s, k_comment_end_warning);
}

TEST(Scanner, CommentInsideValueIsDropped) {
    scanner s("<a>text<!--c-->more</a>");
    ASSERT_TRUE(s.enter_root());
    ASSERT_TRUE(s.value_is("textmore"));
    EXPECT_TRUE(s.xml.is_element_end_tag("a"));
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
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
    ASSERT_NO_FATAL_FAILURE(expect_one_text_run(s, " <b>&amp; "));
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
}

TEST(Scanner, CdataEndsAtTwoBracketsAndGreaterThan) {
    EXPECT_EQ(element_value("<a><![CDATA[x]]]></a>", lmx::ws_preserve, true), "x]");
    EXPECT_EQ(element_value("<a><![CDATA[a]>b]]></a>", lmx::ws_preserve, true), "a]>b");
    EXPECT_EQ(element_value("<a><![CDATA[a]]b]]></a>", lmx::ws_preserve, true), "a]]b");
}

TEST(Scanner, CdataJoinsTextInValue) {
    EXPECT_EQ(element_value("<a>x<![CDATA[<y>]]>z</a>", lmx::ws_preserve, true), "x<y>z");
}

TEST(Scanner, BadCdataOpeningInValueIsNotWellFormed) {
    scanner s("<a>x<![CDAX[y]]></a>");
    ASSERT_TRUE(s.enter_root());
    std::string value;
    EXPECT_FALSE(s.value(&value));
    EXPECT_EQ(s.errors.get_last_error(), lmx::elmx_not_well_formed) << s.errors.describe();
}

// The root holds an unterminated CDATA section with "abc": it comes as a
// text event, without a report.
void expect_unterminated_cdata(scanner &ar_scanner) {
    ASSERT_TRUE(ar_scanner.enter_root());
    ASSERT_TRUE(ar_scanner.next_is(lmx::xe_text, "abc"));
    EXPECT_TRUE(ar_scanner.errors.reports().empty()) << ar_scanner.errors.describe();
}

TEST(Scanner, UnterminatedCdataIsTextUntilTheEndIsSought) {
    scanner s("<a><![CDATA[abc");
    ASSERT_NO_FATAL_FAILURE(expect_unterminated_cdata(s));
    // Only looking for the element's end finds that the input is over.
    EXPECT_FALSE(s.xml.is_element_end_tag("a"));
}

TEST(Scanner, UnterminatedCdataDropsTrailingBrackets) {
    scanner s("<a><![CDATA[abc]]");
    ASSERT_NO_FATAL_FAILURE(expect_unterminated_cdata(s));
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
}

TEST(Scanner, UnterminatedCdataInValueComplainsAboutTheEnd) {
    scanner s("<a><![CDATA[abc");
    ASSERT_TRUE(s.enter_root());
    std::string value;
    EXPECT_FALSE(s.value(&value));
    ASSERT_EQ(s.errors.reports().size(), 1u) << s.errors.describe();
    expect_reported(s, k_premature_end);
}

// ------------------------------------------------------- markup in content

TEST(Scanner, BrokenMarkupInContentIsFatal) {
    struct row {
        const char *name;
        std::string document;
        int tag_end; // how the root's start tag ends
        std::optional<expected_report> report;
    };
    const row rows[] = {
        {"XML declaration inside an element", "<a><?xml version=\"1.0\"?></a>", lmx::xe_start_tag_end,
         k_declaration_not_at_start},
        {"unterminated processing instruction", "<a><?pi data", lmx::xe_start_tag_end, std::nullopt},
        {"unterminated comment", "<a><!-- never closed", lmx::xe_start_tag_end, std::nullopt},
        {"bad CDATA opening", "<a><![CDAT[x]]></a>", lmx::xe_start_tag_end, k_xml_not_well_formed},
        {"end tag cut off at end of input", "<a></a", lmx::xe_start_tag_end, k_xml_not_well_formed},
        {"start tag name cut off at end of input", "<a><bcd", lmx::xe_start_tag_end, k_xml_not_well_formed},
        {"end tag with junk before its close", "<a></a x>", lmx::xe_start_tag_end, k_xml_not_well_formed},
        {"end tag without name fails without record", "<a></>", lmx::xe_start_tag_end, k_nothing_reported},
        {"DOCTYPE after content", "<a/><!DOCTYPE a>", lmx::xe_end_tag,
         expected_report{lmx::elmx_type_error, lmx::elmx_bad_dtd,
                         "Document Type Declaration not at start of document"}},
    };
    for (const row &r : rows) {
        SCOPED_TRACE(r.name);
        expect_fatal_after_root(r.document, r.tag_end, r.report);
    }
}

// ---------------------------------------------------------------- end tags

TEST(Scanner, EndTagAllowsWhiteSpaceBeforeClose) {
    scanner s("<a></a \n >");
    ASSERT_TRUE(s.enter_root());
    ASSERT_TRUE(s.next_is(lmx::xe_end_tag, "a"));
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
}

TEST(Scanner, LessThanBeforeJunkIsNotWellFormedAndSkipsTheTag) {
    scanner s("<a>< b=\">\"></a>");
    ASSERT_NO_FATAL_FAILURE(expect_fatal_after_root(s, lmx::xe_start_tag_end, k_xml_not_well_formed));
    // The broken tag was passed over up to its unquoted ">".
    ASSERT_TRUE(s.next_is(lmx::xe_end_tag, "a"));
}

TEST(Scanner, IsElementEndTagMatchesTheExactName) {
    {
        scanner s("<a>  </a \t>");
        ASSERT_TRUE(s.enter_root());
        EXPECT_TRUE(s.xml.is_element_end_tag("a"));
        EXPECT_EQ(s.next(), lmx::xe_end_of_input);
    }
    struct row {
        const char *document;
        const char *name;
        bool matches;
    };
    for (const row &r : {row{"<a></b>", "a", false}, row{"<a></ab>", "a", false}, row{"<ab></a>", "ab", false},
                         row{"<a>x</a>", "a", false}, row{"<p:a></p:a>", "p:a", true}}) {
        SCOPED_TRACE(r.document);
        scanner s(r.document);
        ASSERT_TRUE(s.enter_root());
        EXPECT_EQ(s.xml.is_element_end_tag(r.name), r.matches);
    }
}

// ------------------------------------------------------ attribute capture

TEST(Scanner, AttributeValueMayHoldLessThan) {
    scanner s("<a b=\"1<2\"/>");
    ASSERT_TRUE(s.next_is(lmx::xe_name, "a"));
    std::string attribute, value;
    ASSERT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_name);
    EXPECT_EQ(attribute, "b");
    ASSERT_TRUE(s.xml.get_attribute_value(&value, lmx::ws_preserve));
    EXPECT_EQ(value, "1<2");
    EXPECT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_end_tag);
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
}

TEST(Scanner, AttributesAreReadAsWritten) {
    struct row {
        const char *name;
        const char *document;
        attribute_list attributes;
    };
    const row rows[] = {
        {"attributes come back in document order", "<a z=\"1\" y='2' x = \"3\"\n w=\"\"/>",
         {{"z", "1"}, {"y", "2"}, {"x", "3"}, {"w", ""}}},
        {"either quote delimits a value", "<a b='x\"y' c=\"p'q\"/>", {{"b", "x\"y"}, {"c", "p'q"}}},
        {"attribute value expands entities when read", "<a b=\"&lt;&amp;&#65;&#x42;\"/>", {{"b", "<&AB"}}},
    };
    for (const row &r : rows) {
        SCOPED_TRACE(r.name);
        scanner s(r.document);
        ASSERT_EQ(s.next(), lmx::xe_name);
        EXPECT_EQ(s.attributes(), r.attributes);
    }
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
    expect_reported(s, expected_report{lmx::elmx_type_fatal, lmx::elmx_not_well_formed,
                                       "Schema is not Well Formed (expected '=', got '/')"});
    EXPECT_TRUE(s.errors.is_fatal_errored());
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
}

TEST(Scanner, AttributeValueCutOffIsFatal) {
    scanner s("<a b=\"1");
    EXPECT_EQ(s.next(), lmx::xe_fatal);
    ASSERT_FALSE(s.errors.reports().empty());
    const reported_error &r = s.errors.reports().front();
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

TEST(Scanner, AttributeNamesEndWithTheTag) {
    const std::pair<const char *, int> rows[] = {
        {"<a x=\"1\">", lmx::xe_start_tag_end},
        {"<a/>", lmx::xe_end_tag},
        {"<a x=\"1\" / >", lmx::xe_end_tag},
    };
    for (const auto &row : rows) {
        SCOPED_TRACE(row.first);
        scanner s(row.first);
        ASSERT_EQ(s.next(), lmx::xe_name);
        EXPECT_EQ(s.finish_tag(), row.second);
    }
}

// The attributes of the document's start tag end in a fatal event, with the
// report of a start tag that is not well-formed.
void expect_start_tag_not_well_formed(const std::string &ar_document) {
    SCOPED_TRACE(ar_document);
    scanner s(ar_document);
    ASSERT_EQ(s.next(), lmx::xe_name);
    EXPECT_EQ(s.finish_tag(), lmx::xe_fatal);
    expect_reported(s, k_xml_not_well_formed_lower);
}

TEST(Scanner, JunkAfterAttributesOrSlashIsNotWellFormed) {
    expect_start_tag_not_well_formed("<a x=\"1\" =>");
    expect_start_tag_not_well_formed("<a / x>");
}

TEST(Scanner, QuestionMarkEndsOnlyADeclarationLikeTag) {
    expect_start_tag_not_well_formed("<a x=\"1\" ?>");
    // Read as a declaration-like tag, "?>" ends it and "/>" does not.
    struct row {
        const char *document;
        int tag_end;
        expected_report report;
    };
    for (const row &r : {row{"<a x=\"1\" ?>", lmx::xe_end_tag, k_nothing_reported},
                         row{"<a x=\"1\"/>", lmx::xe_fatal, k_xml_not_well_formed_lower}}) {
        SCOPED_TRACE(r.document);
        scanner s(r.document);
        ASSERT_EQ(s.next(), lmx::xe_name);
        std::string attribute;
        ASSERT_EQ(s.xml.get_attribute_name(&attribute, true), lmx::xe_name);
        s.xml.skip_attribute_value();
        EXPECT_EQ(s.xml.get_attribute_name(&attribute, true), r.tag_end);
        expect_reported(s, r.report);
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
    expect_reported(s, k_xml_not_well_formed_lower);
}

// ------------------------------------------------- namespace declarations

TEST(Scanner, NamespaceDeclarationsApplyToTheWholeTag) {
    scanner s("<p:a x=\"1\" p:z=\"3\" xmlns:p=\"urn:p\" y=\"2\"/>");
    ASSERT_TRUE(s.next_is(lmx::xe_name, "p:a"));
    int id = s.xml.find_enumerated_namespace("urn:p");
    EXPECT_GE(id, 1000);
    EXPECT_EQ(s.local.find_namespace_id("p"), id);
    EXPECT_EQ(s.xml.get_ns_id(&s.local, "p:a"), id);
    EXPECT_EQ(s.xml.get_ns_id(&s.local, "p:z"), id);
    EXPECT_EQ(s.xml.find_namespace_from_id(id), std::string("urn:p"));
    // Declarations are not attributes; the others keep their order.
    EXPECT_EQ(s.attributes(), (attribute_list{{"x", "1"}, {"p:z", "3"}, {"y", "2"}}));
}

// The next namespace declaration of the current start tag is ar_name.
::testing::AssertionResult next_declaration_is(scanner &ar_scanner, const std::string &ar_name) {
    std::string declaration;
    if (!ar_scanner.xml.get_namespace_attribute_name(&declaration))
        return ::testing::AssertionFailure() << "no further namespace declaration";
    if (declaration != ar_name)
        return ::testing::AssertionFailure() << "declaration " << declaration << ", expected " << ar_name;
    return ::testing::AssertionSuccess();
}

TEST(Scanner, NamespaceDeclarationsAreReadSeparately) {
    scanner s("<a xmlns=\"urn:d\" b=\"1\" xmlns:p=\"  urn:p  \"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    std::string name, value;
    ASSERT_TRUE(next_declaration_is(s, "xmlns"));
    ASSERT_TRUE(s.xml.get_namespace_attribute_value(&value));
    EXPECT_EQ(value, "urn:d");
    ASSERT_TRUE(next_declaration_is(s, "xmlns:p"));
    value.clear();
    ASSERT_TRUE(s.xml.get_namespace_attribute_value(&value));
    EXPECT_EQ(value, "urn:p"); // always collapsed
    EXPECT_FALSE(s.xml.get_namespace_attribute_name(&name));
    EXPECT_EQ(s.attributes(), (attribute_list{{"b", "1"}}));
}

TEST(Scanner, SkippedNamespaceValueMovesToTheNextDeclaration) {
    scanner s("<a xmlns:p=\"urn:p\" xmlns:q=\"urn:q\"/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_TRUE(next_declaration_is(s, "xmlns:p"));
    s.xml.skip_namespace_attribute_value();
    ASSERT_TRUE(next_declaration_is(s, "xmlns:q"));
    std::string value;
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
    const std::pair<lmx::elmx_whitespace, const char *> modes[] = {
        {lmx::ws_preserve, "  a \t b\n c  "},
        {lmx::ws_replace, "  a   b  c  "},
        {lmx::ws_collapse, "a b c"},
    };
    for (const auto &mode : modes) {
        SCOPED_TRACE(mode.first);
        std::string attribute, value;
        ASSERT_EQ(s.xml.get_attribute_name(&attribute), lmx::xe_name);
        ASSERT_TRUE(s.xml.get_attribute_value(&value, mode.first));
        EXPECT_EQ(value, mode.second);
    }
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

    // Each character of ar_text added in turn to an empty value.
    auto added = [&xml](const std::string &ar_text) {
        std::string value;
        for (char c : ar_text)
            xml.add_char_wsp(&value, c);
        return value;
    };
    xml.set_ws_mode(lmx::ws_collapse);
    EXPECT_EQ(xml.get_ws_mode(), lmx::ws_collapse);
    EXPECT_EQ(added("  a  b  "), "a b");

    xml.set_ws_mode(lmx::ws_replace);
    EXPECT_EQ(added("a\tb\n"), "a b ");
    std::string value;
    xml.add_char_wsp(&value, '\t', true);
    EXPECT_EQ(value, "\t");

    xml.set_ws_mode(lmx::ws_preserve);
    EXPECT_EQ(added(" a\t"), " a\t");
}

// ------------------------------------------------------------ element value

TEST(Scanner, ElementValueSkipsProcessingInstructions) {
    EXPECT_EQ(element_value("<a>x<?pi y?>z</a>", lmx::ws_preserve, true), "xz");
}

TEST(Scanner, ElementValueExpandsEntitiesOnlyWhenAsked) {
    for (const auto &row : {std::make_pair(true, "x&yA"), std::make_pair(false, "x&amp;y&#65;")}) {
        SCOPED_TRACE(row.first ? "expanded" : "as written");
        scanner s("<a>x&amp;y&#65;</a>");
        ASSERT_TRUE(s.enter_root());
        ASSERT_TRUE(s.value_is(row.second, row.first));
    }
}

TEST(Scanner, ElementValuesThatCannotBeReadFail) {
    const refused_row rows[] = {
        {"unknown entity", "<a>x&nope;y</a>", std::nullopt},
        // Markup declarations other than comments are not content.
        {"DOCTYPE in content", "<a>x<!DOCTYPE y>z</a>", k_xml_not_well_formed_lower},
        {"comment opened with one dash", "<a>x<!-y-->z</a>", k_xml_not_well_formed_lower},
        {"ELEMENT declaration in content", "<a>x<!ELEMENT y></a>", k_xml_not_well_formed_lower},
        {"end of input is a premature end", "<a>abc", k_premature_end},
    };
    for (const refused_row &row : rows) {
        SCOPED_TRACE(row.name);
        scanner s(row.document);
        ASSERT_TRUE(s.enter_root());
        std::string value;
        EXPECT_FALSE(s.value(&value));
        expect_reported(s, row.report);
    }
}

TEST(Scanner, ElementValueStopsBeforeAChildAndLeavesItToBeRead) {
    scanner s("<a>x<b/></a>");
    ASSERT_TRUE(s.enter_root());
    ASSERT_TRUE(s.value_is("x"));
    ASSERT_TRUE(s.next_is(lmx::xe_name, "b"));
}

TEST(Scanner, EmptyElementValue) {
    scanner s("<a></a>");
    ASSERT_TRUE(s.enter_root());
    std::string value = "old";
    ASSERT_TRUE(s.value(&value));
    EXPECT_EQ(value, "");
    EXPECT_TRUE(s.xml.is_element_end_tag("a"));
}

TEST(Scanner, NestedValueHandsBackTheEndTagNameUncompared) {
    scanner s("<a>x<b k='1'>y</b><!-- c --></c>");
    ASSERT_TRUE(s.enter_root());
    std::string value, end_name;
    ASSERT_TRUE(s.xml.get_nested_element_value(&value, &end_name, lmx::ws_preserve, false)) << s.errors.describe();
    EXPECT_EQ(value, "x<b k='1'>y</b>");
    EXPECT_EQ(end_name, "c");
    EXPECT_EQ(s.next(), lmx::xe_end_of_input);
}

// ------------------------------------------------------ start tag end

// The scanner stands inside a start tag followed by the text "rest": it moves
// to the tag's end, which a_is_end says is "/>" or ">", and reads the text.
void expect_start_tag_end_before_rest(scanner &ar_scanner, bool a_is_end) {
    bool is_end = !a_is_end;
    EXPECT_TRUE(ar_scanner.xml.move_to_start_tag_end(&is_end));
    EXPECT_EQ(is_end, a_is_end);
    ASSERT_TRUE(ar_scanner.next_is(lmx::xe_text, "rest"));
}

TEST(Scanner, StartTagEndIgnoresQuotedMarkup) {
    scanner s(" x=\"a>b\" y='/>'>rest");
    expect_start_tag_end_before_rest(s, false);
}

TEST(Scanner, StartTagEndFindsEmptyElement) {
    scanner s(" x=\"1\" / >rest");
    ASSERT_NO_FATAL_FAILURE(expect_start_tag_end_before_rest(s, true));
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
}

TEST(Scanner, StartTagEndWithJunkAfterSlashIsEndTagSyntax) {
    scanner s(" x=\"1\" / zz>rest");
    bool is_end = false;
    EXPECT_FALSE(s.xml.move_to_start_tag_end(&is_end));
    EXPECT_TRUE(is_end);
    ASSERT_EQ(s.errors.reports().size(), 1u) << s.errors.describe();
    expect_reported(s, expected_report{lmx::elmx_type_error, lmx::elmx_end_tag_syntax,
                                       "Illegal character(s) after / at end of tag - z"});
}

TEST(Scanner, StartTagEndAtEndOfInputFails) {
    scanner s(" x=\"1\" ");
    bool is_end = false;
    EXPECT_FALSE(s.xml.move_to_start_tag_end(&is_end));
}

TEST(Scanner, SkipStartTagFinishesACapturedTag) {
    struct row {
        const char *document;
        bool is_end;
        int next_event; // and what it carries: the text or the name
        const char *next;
    };
    for (const row &r : {row{"<a x=\"1\">t</a>", false, lmx::xe_text, "t"},
                         row{"<a x=\"1\"/><b/>", true, lmx::xe_name, "b"}}) {
        SCOPED_TRACE(r.document);
        scanner s(r.document);
        ASSERT_EQ(s.next(), lmx::xe_name);
        bool is_end = !r.is_end;
        EXPECT_TRUE(s.xml.skip_start_tag(&is_end));
        EXPECT_EQ(is_end, r.is_end);
        ASSERT_TRUE(s.next_is(r.next_event, r.next));
    }
}

// ----------------------------------------------------------- skipping

TEST(Scanner, SkipElementBodyPassesNestedContent) {
    scanner s("<a>t<b x=\"1\">u<c/><![CDATA[</b>]]><!-- </b> --></b><d></d></a><z/>");
    ASSERT_TRUE(s.enter_root());
    EXPECT_TRUE(s.xml.skip_element_body("a")) << s.errors.describe();
    ASSERT_TRUE(s.next_is(lmx::xe_name, "z"));
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
}

TEST(Scanner, SkipElementBodyOfABrokenElementFails) {
    const refused_row rows[] = {
        {"mismatched end tag", "<a></b>",
         expected_report{lmx::elmx_type_error, lmx::elmx_not_well_formed,
                         "Element start tag (a) and end tag (b) do not match"}},
        {"every nested name is matched", "<a><b><c></d></b></a>",
         expected_report{lmx::elmx_type_error, lmx::elmx_not_well_formed,
                         "Element start tag (c) and end tag (d) do not match"}},
        {"end of input", "<a><b>text", std::nullopt},
    };
    for (const refused_row &row : rows) {
        SCOPED_TRACE(row.name);
        scanner s(row.document);
        ASSERT_TRUE(s.enter_root());
        EXPECT_FALSE(s.xml.skip_element_body("a"));
        expect_reported(s, row.report);
    }
}

TEST(Scanner, SkipRestOfElementPassesTagAndBody) {
    for (const char *document : {"<a x=\"1\"><b/>t</a><z/>", "<a x=\"1\"/><z/>"}) {
        SCOPED_TRACE(document);
        scanner s(document);
        ASSERT_EQ(s.next(), lmx::xe_name);
        EXPECT_TRUE(s.xml.skip_rest_of_element("a"));
        ASSERT_TRUE(s.next_is(lmx::xe_name, "z"));
    }
}

// ------------------------------------------------------- any-element capture

TEST(Scanner, AnyElementCaptureIsExact) {
    scanner s("<r><p:any a='1&amp;2' xmlns:p=\"urn:p\" b=\"2\">\n"
              "  <p:child  c=\"3\" />text<!-- comment --><?pi x?><![CDATA[ <raw> ]]>\n"
              "  <q:c xmlns:q=\"urn:q\" d='4'/>\n"
              "  <p:inner>v</p:inner>\n"
              "</p:any><z/></r>");
    ASSERT_TRUE(s.enter_root());
    ASSERT_TRUE(s.next_is(lmx::xe_name, "p:any"));
    ASSERT_TRUE(s.captured_is("p:any", "<p:any xmlns:p=\"urn:p\" a='1&amp;2' b=\"2\">"
                                       "<p:child c=\"3\"/>"
                                       "text"
                                       "<![CDATA[ <raw> ]]>"
                                       "<q:c xmlns:q=\"urn:q\" d='4'/>"
                                       "<p:inner>v</p:inner>"
                                       "</p:any>"));
    ASSERT_TRUE(s.next_is(lmx::xe_name, "z"));
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
}

TEST(Scanner, AnyElementCaptureOfEmptyElement) {
    scanner s("<x:e k=\"v\" xmlns:x=\"urn:x\"/><z/>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_TRUE(s.captured_is("x:e", "<x:e xmlns:x=\"urn:x\" k=\"v\"/>"));
    ASSERT_TRUE(s.next_is(lmx::xe_name, "z"));
}

TEST(Scanner, AnyElementCaptureDropsWhiteSpaceBeforeTags) {
    scanner s("<a>\n  <b>x</b>\n  <c/>\n</a>");
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_TRUE(s.captured_is("a", "<a><b>x</b><c/></a>"));
}

TEST(Scanner, AnyElementCaptureOfABrokenElementFails) {
    for (const char *document : {"<a><b></c></a>", "<a><b>text"}) {
        SCOPED_TRACE(document);
        scanner s(document);
        ASSERT_EQ(s.next(), lmx::xe_name);
        std::string value;
        EXPECT_FALSE(s.any_element("a", &value));
    }
}

// ------------------------------------------------------- DOCTYPE placement

TEST(Scanner, DoctypeInternalEntityIsUsedInContent) {
    EXPECT_EQ(element_value("<!DOCTYPE a [<!ENTITY e \"v\">]><a>&e;</a>", lmx::ws_preserve, true), "v");
}

// ------------------------------------------------------------ nesting depth

const expected_report k_nesting_too_deep = {lmx::elmx_type_fatal, lmx::elmx_not_well_formed,
                                            "Element nesting too deep"};

TEST(Scanner, SkipElementBodyRefusesNestingBeyondTheLimit) {
    scanner s(nested_elements(1001));
    ASSERT_TRUE(s.enter_root());
    EXPECT_FALSE(s.xml.skip_element_body("e"));
    expect_reported(s, k_nesting_too_deep);
    EXPECT_TRUE(s.errors.is_fatal_errored());
}

TEST(Scanner, SkipElementBodyAcceptsDeepLegalNesting) {
    scanner s(nested_elements(999) + "<z/>");
    ASSERT_TRUE(s.enter_root());
    EXPECT_TRUE(s.xml.skip_element_body("e")) << s.errors.describe();
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
    ASSERT_TRUE(s.next_is(lmx::xe_name, "z"));
}

TEST(Scanner, AnyElementCaptureRefusesNestingBeyondTheLimit) {
    scanner s(nested_elements(1001));
    ASSERT_EQ(s.next(), lmx::xe_name);
    std::string value;
    EXPECT_FALSE(s.any_element("e", &value));
    expect_reported(s, k_nesting_too_deep);
}

TEST(Scanner, AnyElementCaptureAcceptsDeepLegalNesting) {
    const std::string document = nested_elements(999);
    scanner s(document);
    ASSERT_EQ(s.next(), lmx::xe_name);
    ASSERT_TRUE(s.captured_is("e", document));
    EXPECT_TRUE(s.errors.reports().empty()) << s.errors.describe();
}

TEST(Scanner, HundredThousandNestedLevelsDoNotCrash) {
    const std::string document = nested_elements(100000);
    {
        scanner s(document);
        ASSERT_TRUE(s.enter_root());
        EXPECT_FALSE(s.xml.skip_element_body("e"));
        EXPECT_EQ(s.errors.get_last_error(), lmx::elmx_not_well_formed);
    }
    {
        scanner s(document);
        ASSERT_EQ(s.next(), lmx::xe_name);
        std::string value;
        EXPECT_FALSE(s.any_element("e", &value));
        EXPECT_EQ(s.errors.get_last_error(), lmx::elmx_not_well_formed);
    }
    {
        // The plain event loop is not recursive: it reads every level.
        scanner s(document);
        int starts = 0, ends = 0;
        for (int event = s.next(); event != lmx::xe_end_of_input; event = s.next()) {
            ASSERT_NE(event, lmx::xe_fatal) << s.errors.describe();
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
