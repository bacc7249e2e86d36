// Entity and character references, the internal DTD subset, and the limits
// that keep entity expansion from exhausting memory or stack.
#include <chrono>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include <lmx/lmxparse.h>

#include "reader_walk.h"

namespace {

using tessarine_test::clean_walk_row;
using tessarine_test::document_walk;
using tessarine_test::expect_clean_walk;
using tessarine_test::expect_scan_report;
using tessarine_test::expect_walk;
using tessarine_test::recording_error;
using tessarine_test::scan_document;
using tessarine_test::scan_end;
using tessarine_test::text_reader;
using tessarine_test::traced_walk;
using tessarine_test::walk_traced;

// ---------------------------------------------------------------------------
// Helpers
// ---------------------------------------------------------------------------

// The entity layer over an input of its own, reporting to its own record.
class entity_stream : public tessarine_test::getter_over_text<lmx::c_get_for_xml> {
public:
    explicit entity_stream(bool a_is_reading_xsd = true, std::string a_input = std::string())
        : getter_over_text(std::move(a_input), a_is_reading_xsd) {}

    // Expands the reference whose "&" has just been read; ar_rest is what follows it.
    bool expand(const std::string &ar_rest, std::string *ap_value, bool a_markup_possible = false,
                std::size_t *ap_consumed = nullptr) {
        lmx::c_entity_name_reader_for_c_str reader(ar_rest.c_str());
        reader.set_is_markup_possible_in_entity(a_markup_possible);
        bool result = getter().select_general_entity(reader, ap_value);
        if (ap_consumed)
            *ap_consumed = reader.get_index();
        return result;
    }
    // Expands the character reference whose "&#" has just been read.
    bool character(const std::string &ar_rest, std::string *ap_value, std::size_t *ap_consumed = nullptr) {
        lmx::c_entity_name_reader_for_c_str reader(ar_rest.c_str());
        bool result = getter().insert_character_entity(reader, ap_value);
        if (ap_consumed)
            *ap_consumed = reader.get_index();
        return result;
    }
};

// A fresh stream expands the character reference "&#" + ar_rest to ar_expected.
void expect_character(const std::string &ar_rest, const std::string &ar_expected) {
    SCOPED_TRACE(ar_rest);
    entity_stream stream;
    std::string value;
    EXPECT_TRUE(stream.character(ar_rest, &value));
    EXPECT_EQ(value, ar_expected);
}

// Reads the root element as a simple value, as bound code does; gives the
// error code of the value read.
lmx::elmx_error read_root_value(const std::string &ar_document, std::string *ap_value,
                                lmx::elmx_whitespace a_ws_mode = lmx::ws_preserve) {
    lmx::c_xml_reader_memory reader(ar_document);
    lmx::elmx_error error = lmx::elmx_ok;
    std::string name;
    int event = reader.get_element_event(&error, &name);
    if (event != lmx::xe_name) {
        ADD_FAILURE() << "no root element, event " << event;
        return error != lmx::elmx_ok ? error : lmx::elmx_element_not_found;
    }
    bool is_empty = false;
    lmx::elmx_error value_error = lmx::elmx_ok;
    if (!reader.get_simple_type_value(name, a_ws_mode, ap_value, &value_error, &is_empty))
        return value_error != lmx::elmx_ok ? value_error : lmx::elmx_undefined_error;
    return value_error;
}

std::string with_subset(const std::string &ar_subset, const std::string &ar_body) {
    return "<?xml version=\"1.0\"?>\n<!DOCTYPE r [" + ar_subset + "]>\n" + ar_body;
}

// Ten entities, each referring ten times to the one before.
std::string billion_laughs(const std::string &ar_body) {
    std::string subset = "\n  <!ENTITY lol0 \"lol\">\n";
    for (int level = 1; level <= 10; ++level) {
        subset += "  <!ENTITY lol" + std::to_string(level) + " \"";
        for (int i = 0; i < 10; ++i)
            subset += "&lol" + std::to_string(level - 1) + ";";
        subset += "\">\n";
    }
    return with_subset(subset, ar_body);
}

// One entity of about 50 KB, referred to 1000 times.
std::string quadratic_blow_up(bool a_in_attribute, int a_references = 1000) {
    std::string references;
    for (int i = 0; i < a_references; ++i)
        references += "&big;";
    const std::string body = a_in_attribute ? "<r a=\"" + references + "\"/>" : "<r>" + references + "</r>";
    return with_subset("<!ENTITY big \"" + std::string(50000, 'x') + "\">", body);
}

// Entities e1 to e<a_depth>: e1 is "x", every other one refers to the one
// before and adds a dot after the reference, so that each stays open while
// the inner one is read.
std::string entity_chain(int a_depth, const std::string &ar_body) {
    std::string subset = "<!ENTITY e1 \"x\">";
    for (int i = 2; i <= a_depth; ++i)
        subset += "<!ENTITY e" + std::to_string(i) + " \"&e" + std::to_string(i - 1) + ";.\">";
    return with_subset(subset, ar_body);
}

template <typename F> double seconds_for(F a_function) {
    const auto start = std::chrono::steady_clock::now();
    a_function();
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

// Generous enough for sanitizer builds; an unguarded expansion takes far longer.
constexpr double k_fast_seconds = 20.0;

const char *const k_limit_message = "Entity expansion limit exceeded";

// What a scan of the document must report, and how the scan ends.
struct scan_expectation {
    scan_end end;
    lmx::elmx_error_type type;
    lmx::elmx_error code;
    const char *message;
};

// A document the reader refuses: how the walk ends, what the reader's record
// holds and what a scan of the same document reports. What is left empty is
// not checked.
struct refusal_row {
    const char *name;
    std::string document;
    lmx::elmx_error walk_error;
    std::optional<lmx::elmx_error> reader_error;
    std::optional<bool> fatal; // the reader's record is fatally errored
    std::optional<scan_expectation> scan;
};

void expect_refusal(const refusal_row &ar_row) {
    SCOPED_TRACE(ar_row.name);
    document_walk w(ar_row.document);
    expect_walk(w.walk, ar_row.walk_error);
    if (ar_row.reader_error) {
        EXPECT_EQ(w.reader.get_error(), *ar_row.reader_error);
    }
    if (ar_row.fatal) {
        EXPECT_EQ(w.reader.get_error_record().is_fatal_errored(), *ar_row.fatal);
    }
    if (ar_row.scan) {
        const scan_expectation &scan = *ar_row.scan;
        expect_scan_report(ar_row.document, scan.end, scan.type, scan.code, scan.message);
    }
}

// ---------------------------------------------------------------------------
// Character references
// ---------------------------------------------------------------------------

TEST(Entities, HexCharacterReferenceGivesTheCharacter) {
    entity_stream stream;
    std::string value;
    EXPECT_TRUE(stream.character("x41;", &value));
    EXPECT_EQ(value, "A");
    value.clear();
    EXPECT_TRUE(stream.expand("#x41;", &value));
    EXPECT_EQ(value, "A");

    expect_walk(walk_traced(std::string("<r a=\"&#x41;\">&#x41;&#x62;</r>")), lmx::elmx_ok, "<r>[a=A]Ab</r>");
}

TEST(Entities, DecimalCharacterReferenceWithoutSemicolonGivesTheCharacter) {
    entity_stream stream;
    std::string value;
    std::size_t consumed = 0;
    EXPECT_TRUE(stream.character("65", &value, &consumed));
    EXPECT_EQ(value, "A");
    EXPECT_EQ(consumed, 2u);
    value.clear();
    EXPECT_TRUE(stream.character("65<", &value, &consumed));
    EXPECT_EQ(value, "A");
    EXPECT_EQ(consumed, 2u); // the "<" is left for the caller

    expect_walk(walk_traced(std::string("<r a=\"&#65\">&#65</r>")), lmx::elmx_ok, "<r>[a=A]A</r>");

    std::string text;
    EXPECT_EQ(read_root_value("<r>&#65</r>", &text), lmx::elmx_ok);
    EXPECT_EQ(text, "A");
}

TEST(Entities, UpperCaseXDoesNotMarkAHexReference) {
    entity_stream stream;
    std::string value;
    EXPECT_FALSE(stream.character("X41;", &value));
    EXPECT_FALSE(stream.expand("#X41;", &value));

    std::string text;
    EXPECT_EQ(read_root_value("<r>&#X41;</r>", &text), lmx::elmx_unable_to_read_element);
    expect_walk(walk_traced(std::string("<r a=\"&#X41;\"/>")), lmx::elmx_unable_to_read_attribute);
}

TEST(Entities, CharacterReferenceAboveTheLimitFails) {
    entity_stream stream;
    std::string value;
    EXPECT_FALSE(stream.character("1048577;", &value));
    EXPECT_FALSE(stream.character("x100001;", &value));
    EXPECT_FALSE(stream.character("x10FFFF;", &value));
    value.clear();
    EXPECT_TRUE(stream.character("1048576;", &value));
    EXPECT_EQ(value, "\xF4\x80\x80\x80");
    value.clear();
    EXPECT_TRUE(stream.character("x100000;", &value));
    EXPECT_EQ(value, "\xF4\x80\x80\x80");

    std::string text;
    EXPECT_EQ(read_root_value("<r>&#1048577;</r>", &text), lmx::elmx_unable_to_read_element);
}

TEST(Entities, CharacterReferenceWithoutDigitsFails) {
    for (const char *rest : {";", "x;", "a;", "", "x", "-1;", " 65;"}) {
        SCOPED_TRACE(rest);
        entity_stream stream;
        std::string value;
        EXPECT_FALSE(stream.character(rest, &value));
    }
}

TEST(Entities, CharacterReferencesAreEncodedAsUtf8) {
    const std::pair<const char *, const char *> rows[] = {
        {"x41;", "A"},
        {"x7F;", "\x7F"},
        {"60;", "<"},
        {"x26;", "&"},
        {"xE9;", "\xC3\xA9"},
        {"xe9;", "\xC3\xA9"},
        {"233;", "\xC3\xA9"},
        {"8364;", "\xE2\x82\xAC"},
        {"x1F600;", "\xF0\x9F\x98\x80"},
    };
    for (const auto &row : rows)
        expect_character(row.first, row.second);
    expect_walk(walk_traced(std::string("<r a=\"&#xE9;&#8364;\">&#x1F600;</r>")), lmx::elmx_ok,
                "<r>[a=\xC3\xA9\xE2\x82\xAC]\xF0\x9F\x98\x80</r>");
}

TEST(Entities, NelAndLineSeparatorReferencesBecomeNewline) {
    for (const char *rest : {"x85;", "133;", "x2028;", "8232;"})
        expect_character(rest, "\n");
}

// A referenced line feed in collapse mode, then a referenced tab in replace
// mode, on a stream that reads for a schema or not.
void expect_white_space_from_references(bool a_is_reading_xsd, const char *ap_collapsed, const char *ap_replaced) {
    entity_stream stream(a_is_reading_xsd);
    stream.getter().set_ws_mode(lmx::ws_collapse);
    std::string value = "a";
    ASSERT_TRUE(stream.character("10;", &value));
    stream.getter().add_char_wsp(&value, 'b');
    EXPECT_EQ(value, ap_collapsed);

    stream.getter().set_ws_mode(lmx::ws_replace);
    value = "a";
    ASSERT_TRUE(stream.character("9;", &value));
    EXPECT_EQ(value, ap_replaced);
}

TEST(Entities, WhiteSpaceFromCharacterReferencesCountsAsLiteralWhenReadingForTheSchema) {
    expect_white_space_from_references(true, "a b", "a ");
}

TEST(Entities, WhiteSpaceFromCharacterReferencesIsKeptOtherwise) {
    expect_white_space_from_references(false, "a\nb", "a\t");
}

// ---------------------------------------------------------------------------
// Predefined entities
// ---------------------------------------------------------------------------

TEST(Entities, PredefinedEntitiesExpandEverywhere) {
    const std::pair<const char *, const char *> rows[] = {
        {"lt;", "<"}, {"gt;", ">"}, {"amp;", "&"}, {"apos;", "'"}, {"quot;", "\""},
    };
    for (const auto &row : rows) {
        SCOPED_TRACE(row.first);
        entity_stream stream;
        std::string value;
        EXPECT_TRUE(stream.expand(row.first, &value));
        EXPECT_EQ(value, row.second);
        EXPECT_EQ(stream.getter().get_entity_stack_depth(), 0u);
    }
    expect_walk(walk_traced(std::string("<r a=\"&lt;&gt;&amp;&apos;&quot;\">&lt;&gt;&amp;&apos;&quot;</r>")),
                lmx::elmx_ok, "<r>[a=<>&'\"]<>&'\"</r>");

    std::string text;
    EXPECT_EQ(read_root_value("<r>1 &lt; 2 &amp;&amp; 3 &gt; 2</r>", &text), lmx::elmx_ok);
    EXPECT_EQ(text, "1 < 2 && 3 > 2");
}

TEST(Entities, NamesThatOnlyStartLikePredefinedOnesAreNotPredefined) {
    entity_stream stream;
    std::string value;
    EXPECT_FALSE(stream.expand("ltx;", &value));
    EXPECT_EQ(value, "&ltx;");
    value.clear();
    EXPECT_FALSE(stream.expand("am;", &value));
    EXPECT_EQ(value, "&am;");
}

TEST(Entities, MissingSemicolonIsTolerated) {
    entity_stream stream;
    std::string value;
    std::size_t consumed = 0;
    EXPECT_TRUE(stream.expand("lt x", &value, false, &consumed));
    EXPECT_EQ(value, "<");
    EXPECT_EQ(consumed, 2u);
    value.clear();
    EXPECT_TRUE(stream.expand("amp", &value));
    EXPECT_EQ(value, "&");

    expect_walk(walk_traced(std::string("<r a=\"&lt x\">a&gt b</r>")), lmx::elmx_ok, "<r>[a=< x]a> b</r>");
}

TEST(Entities, PredefinedEntityIsAppendedPastWhitespaceHandling) {
    entity_stream stream;
    stream.getter().set_ws_mode(lmx::ws_collapse);
    std::string value = "a";
    stream.getter().add_char_wsp(&value, ' ');
    EXPECT_TRUE(stream.expand("lt;", &value));
    EXPECT_EQ(value, "a<");
}

// ---------------------------------------------------------------------------
// Unknown entities
// ---------------------------------------------------------------------------

TEST(Entities, UnknownEntityIsRefusedAndKeptAsWritten) {
    entity_stream stream;
    std::string value = "pre";
    EXPECT_FALSE(stream.expand("nope;", &value));
    EXPECT_EQ(value, "pre&nope;");
    value.clear();
    EXPECT_FALSE(stream.expand("nope x", &value));
    EXPECT_EQ(value, "&nope");
    // Outside the DTD an unknown entity is no recorded error.
    EXPECT_TRUE(stream.error().reports().empty()) << stream.error().describe();
}

TEST(Entities, UnknownEntityInElementTextCannotBeRead) {
    std::string text;
    EXPECT_EQ(read_root_value("<r>x&nope;y</r>", &text), lmx::elmx_unable_to_read_element);

    document_walk w("<r>x&nope;y</r>");
    EXPECT_NE(w.walk.error(), lmx::elmx_ok);
    EXPECT_NE(w.walk.error(), lmx::elmx_entity_not_found);
    EXPECT_EQ(w.reader.get_error(), lmx::elmx_ok);
}

TEST(Entities, UnknownEntityInAttributeCannotBeRead) {
    document_walk w("<r a=\"x&nope;y\"/>");
    expect_walk(w.walk, lmx::elmx_unable_to_read_attribute);
    EXPECT_EQ(w.reader.get_debug_error().item_name, "@a");
    EXPECT_EQ(w.reader.get_error(), lmx::elmx_ok);
}

// ---------------------------------------------------------------------------
// General entities
// ---------------------------------------------------------------------------

TEST(Entities, DefinedEntityExpandsInTextAndAttributes) {
    expect_walk(walk_traced(with_subset("<!ENTITY who \"world\">", "<r a=\"hello &who;\">hello &who;!</r>")),
                lmx::elmx_ok, "<r>[a=hello world]hello world!</r>");

    std::string text;
    EXPECT_EQ(read_root_value(with_subset("<!ENTITY who \"world\">", "<r>hello &who;!</r>"), &text), lmx::elmx_ok);
    EXPECT_EQ(text, "hello world!");
}

TEST(Entities, EntityHoldingAnElementYieldsTheElementInContent) {
    const traced_walk walk = walk_traced(with_subset("<!ENTITY b \"<b/>\">", "<r>&b;</r>"));
    expect_walk(walk, lmx::elmx_ok, "<r><b></b></r>");
    EXPECT_EQ(walk.seen.elements, (std::vector<std::string>{"r", "b"}));
}

TEST(Entities, ReferencesExpandWhereTheyAreUsed) {
    const clean_walk_row rows[] = {
        {"predefined names cannot be redefined",
         with_subset("<!ENTITY amp \"x\"><!ENTITY lt \"y\">", "<r a=\"&amp;\">&lt;</r>"), "<r>[a=&]<</r>"},
        {"last definition wins", with_subset("<!ENTITY e \"first\"><!ENTITY e \"second\">", "<r a=\"&e;\">&e;</r>"),
         "<r>[a=second]second</r>"},
        {"entity holding mixed content is scanned like the document",
         with_subset("<!ENTITY m \"x<c k='v'>y</c>z\">", "<r>&m;</r>"), "<r>x<c>[k=v]y</c>z</r>"},
        {"entity with less-than in an attribute value is text",
         with_subset("<!ENTITY e \"1<2\"><!ENTITY b \"<b/>\">", "<r a=\"&e;\" b=\"&b;\"/>"),
         "<r>[a=1<2][b=<b/>]</r>"},
        {"nested references in attribute values expand",
         with_subset("<!ENTITY in \"i\"><!ENTITY out \"(&in;&amp;&#x41;)\">", "<r a=\"&out;\">&out;</r>"),
         "<r>[a=(i&A)](i&A)</r>"},
        {"general reference in an entity value is expanded when used",
         with_subset("<!ENTITY a \"A\"><!ENTITY e \"(&a;)\"><!ENTITY a \"Z\">", "<r v=\"&e;\">&e;</r>"),
         "<r>[v=(Z)](Z)</r>"},
        // "&#60;" is "<" by the time the entity is used, so the text is markup.
        {"character reference in an entity value is expanded at definition",
         with_subset("<!ENTITY e \"&#60;b/>\">", "<r>&e;</r>"), "<r><b></b></r>"},
        // The line end inside the declaration is counted; read again from the
        // entity, it is not.
        {"newlines from entity text are not counted", "<!DOCTYPE r [<!ENTITY nl \"a\nb\">]><r>&nl;&nl;</r>",
         "<r>a\nba\nb</r>", 2},
        {"entity text is not line end folded", with_subset("<!ENTITY cr \"a&#13;b\">", "<r v=\"&cr;\">&cr;</r>"),
         "<r>[v=a\rb]a\rb</r>"},
    };
    for (const clean_walk_row &row : rows)
        expect_clean_walk(row);
}

TEST(Entities, ReferenceWhereMarkupIsPossibleBecomesInput) {
    entity_stream stream;
    stream.getter().add_general_entity("e", "text");
    std::string value;
    EXPECT_TRUE(stream.expand("e;", &value, true));
    EXPECT_EQ(value, "");
    EXPECT_EQ(stream.getter().get_entity_stack_depth(), 1u);
    EXPECT_EQ(stream.read_to_end(), "text");
    EXPECT_EQ(stream.getter().get_entity_stack_depth(), 0u);
}

TEST(Entities, ReferenceWithoutMarkupIsAppendedToTheValue) {
    entity_stream stream;
    stream.getter().add_general_entity("e", "te&amp;xt");
    std::string value = ">";
    EXPECT_TRUE(stream.expand("e;", &value, false));
    EXPECT_EQ(value, ">te&xt");
    EXPECT_EQ(stream.getter().get_entity_stack_depth(), 0u);
}

TEST(Entities, DefinitionsCanBeAddedAndLookedUp) {
    entity_stream stream;
    stream.getter().add_general_entity("g", "general");
    stream.getter().add_parameter_entity("p", "parameter");
    const char *text = nullptr;
    ASSERT_TRUE(stream.getter().get_general_entity("g", &text));
    EXPECT_STREQ(text, "general");
    ASSERT_TRUE(stream.getter().get_parameter_entity("p", &text));
    EXPECT_STREQ(text, "parameter");
    EXPECT_FALSE(stream.getter().get_general_entity("p", &text));
    EXPECT_FALSE(stream.getter().get_parameter_entity("g", &text));
    stream.getter().add_general_entity("g", "replaced");
    ASSERT_TRUE(stream.getter().get_general_entity("g", &text));
    EXPECT_STREQ(text, "replaced");
}

TEST(Entities, ApplicationCanPredefineEntitiesOnTheReader) {
    text_reader reader("<r a=\"&me;\">&me;</r>");
    reader.add_general_entity(std::string("me"), std::string("value"));
    expect_walk(walk_traced(reader), lmx::elmx_ok, "<r>[a=value]value</r>");
}

TEST(Entities, RewindForgetsEntityDefinitions) {
    text_reader reader(with_subset("<!ENTITY e \"v\">", "<r>&e;</r>"));
    reader.add_general_entity(std::string("me"), std::string("value"));
    traced_walk first = walk_traced(reader);
    ASSERT_EQ(first.error(), lmx::elmx_ok) << first.result.message;
    const char *text = nullptr;
    EXPECT_TRUE(reader.get_general_entity("e", &text));
    reader.rewind();
    EXPECT_FALSE(reader.get_general_entity("e", &text));
    EXPECT_FALSE(reader.get_general_entity("me", &text));
    // The document defines its own again.
    expect_walk(walk_traced(reader), lmx::elmx_ok, "<r>v</r>");
}

// ---------------------------------------------------------------------------
// The internal DTD subset
// ---------------------------------------------------------------------------

TEST(EntityDtd, DoctypeWithSystemIdentifierIsAcceptedAndIgnored) {
    const std::string document = "<!DOCTYPE r SYSTEM \"x.dtd\"><r>t</r>";
    document_walk w(document);
    expect_walk(w.walk, lmx::elmx_ok, "<r>t</r>");
    EXPECT_EQ(w.reader.get_error(), lmx::elmx_ok);

    recording_error error;
    EXPECT_TRUE(scan_document(document, error).ok());
    EXPECT_TRUE(error.reports().empty()) << error.describe();
}

TEST(EntityDtd, DeclarationsOtherThanEntitiesAreSkipped) {
    document_walk w(with_subset("\n"
                                "  <!-- <!ENTITY fake \"no\"> -->\n"
                                "  <?pi <!ENTITY fake \"no\">?>\n"
                                "  <!ELEMENT r (#PCDATA)>\n"
                                "  <!ATTLIST r a CDATA \"x>y\" b CDATA 'p>q'>\n"
                                "  <!NOTATION n SYSTEM \"n\">\n"
                                "  <!ENTITY e \"v\">\n",
                                "<r>&e;</r>"));
    expect_walk(w.walk, lmx::elmx_ok, "<r>v</r>");
    const char *text = nullptr;
    EXPECT_FALSE(w.reader.get_general_entity("fake", &text));
}

TEST(EntityDtd, InternalSubsetsDeclareTheEntitiesOfTheDocument) {
    const clean_walk_row rows[] = {
        {"DOCTYPE with public identifier and internal subset",
         "<!DOCTYPE r PUBLIC \"-//Tessarine//DTD r//EN\" \"r.dtd\" [<!ENTITY e \"v\">]><r>&e;</r>", "<r>v</r>"},
        {"white space around the subset is allowed", "<!DOCTYPE r [ \n <!ENTITY e \"v\"> \n ] ><r>&e;</r>",
         "<r>v</r>"},
        {"entity value in single quotes may hold double quotes",
         with_subset("<!ENTITY e 'say \"hi\"'>", "<r>&e;</r>"), "<r>say \"hi\"</r>"},
        {"parameter entity can declare entities",
         with_subset("<!ENTITY % decl \"<!ENTITY e 'from a parameter entity'>\"> %decl; ", "<r>&e;</r>"),
         "<r>from a parameter entity</r>"},
        {"parameter entity expands in an entity value",
         with_subset("<!ENTITY % p \"mid\"><!ENTITY e \"start-%p;-end\">", "<r>&e;</r>"), "<r>start-mid-end</r>"},
        {"quote inside a parameter entity does not end the value",
         with_subset("<!ENTITY % q 'say \"hi\"'><!ENTITY e \"%q;!\">", "<r a='&e;'>&e;</r>"),
         "<r>[a=say \"hi\"!]say \"hi\"!</r>"},
        {"DOCTYPE after XML declaration, comment and processing instruction is accepted",
         "<?xml version=\"1.0\"?>\n<!-- c -->\n<?pi x?>\n<!DOCTYPE r [<!ENTITY e \"v\">]>\n<r>&e;</r>", "<r>v</r>"},
    };
    for (const clean_walk_row &row : rows)
        expect_clean_walk(row);
}

TEST(EntityDtd, ParameterEntityIsNotAGeneralEntity) {
    std::string text;
    EXPECT_EQ(read_root_value(with_subset("<!ENTITY % p \"v\">", "<r>&p;</r>"), &text),
              lmx::elmx_unable_to_read_element);
}

TEST(EntityDtd, UnknownParameterEntityIsReportedAndReadingGoesOn) {
    const std::string document = with_subset(" %nope; <!ENTITY e \"v\"> ", "<r>&e;</r>");
    document_walk w(document);
    expect_walk(w.walk, lmx::elmx_ok, "<r>v</r>");
    EXPECT_EQ(w.reader.get_error(), lmx::elmx_entity_not_found);
    EXPECT_FALSE(w.reader.get_error_record().is_fatal_errored());
    expect_scan_report(document, scan_end::ok, lmx::elmx_type_error, lmx::elmx_entity_not_found,
                       "Entity '%nope' not found");
}

TEST(EntityDtd, ExternalEntityWarnsAndReadsAsItsKeyword) {
    const std::string document =
        with_subset("<!ENTITY ext SYSTEM \"ext.xml\"><!ENTITY pub PUBLIC \"-//T//E\" \"pub.xml\">",
                    "<r a=\"&ext;\">&pub;</r>");
    document_walk w(document);
    expect_walk(w.walk, lmx::elmx_ok, "<r>[a=SYSTEM]PUBLIC</r>");
    EXPECT_EQ(w.reader.get_error(), lmx::elmx_external_entity);
    EXPECT_EQ(w.reader.get_error_record().get_warning_count(), 2);
    EXPECT_FALSE(w.reader.get_error_record().is_fatal_errored());
    expect_scan_report(document, scan_end::ok, lmx::elmx_type_warning, lmx::elmx_external_entity,
                       "External Entity definitions not supported");
}

TEST(EntityDtd, UnexpectedWordInEntityDefinitionIsAnError) {
    const std::string document = with_subset("<!ENTITY e bogus>", "<r>&e;</r>");
    recording_error error;
    scan_document(document, error);
    EXPECT_TRUE(error.reported(lmx::elmx_type_error, lmx::elmx_unexpected_entity,
                               "Unexpected value in Entity definition: bogus"))
        << error.describe();
    EXPECT_FALSE(error.is_fatal_errored());

    document_walk w(document);
    expect_walk(w.walk, lmx::elmx_ok, "<r>bogus</r>");
    EXPECT_EQ(w.reader.get_error(), lmx::elmx_unexpected_entity);
}

TEST(EntityDtd, MisplacedOrMalformedDoctypesAreRefused) {
    const char *const not_at_start = "Document Type Declaration not at start of document";
    const refusal_row rows[] = {
        {"junk after the subset is fatal", "<!DOCTYPE r [<!ENTITY e \"v\">] x><r/>", lmx::elmx_bad_dtd,
         lmx::elmx_bad_dtd, true,
         scan_expectation{scan_end::fails, lmx::elmx_type_fatal, lmx::elmx_bad_dtd,
                          "DTD not Well Formed (expected '>', got x)"}},
        {"junk inside the subset is fatal", "<!DOCTYPE r [ <!ENTITY e \"v\"> x ]><r/>", lmx::elmx_bad_dtd,
         std::nullopt, true,
         scan_expectation{scan_end::fails, lmx::elmx_type_fatal, lmx::elmx_bad_dtd, "DTD not Well Formed (got x)"}},
        {"DOCTYPE after the root element", "<r/><!DOCTYPE r>", lmx::elmx_bad_dtd, std::nullopt, std::nullopt,
         scan_expectation{scan_end::fails, lmx::elmx_type_error, lmx::elmx_bad_dtd, not_at_start}},
        {"DOCTYPE inside the root element", "<r><!DOCTYPE r></r>", lmx::elmx_bad_dtd, std::nullopt, std::nullopt,
         scan_expectation{scan_end::fails, lmx::elmx_type_error, lmx::elmx_bad_dtd, not_at_start}},
        {"second DOCTYPE", "<!DOCTYPE r><!DOCTYPE r><r/>", lmx::elmx_bad_dtd, std::nullopt, std::nullopt,
         scan_expectation{scan_end::fails, lmx::elmx_type_error, lmx::elmx_bad_dtd,
                          "Document Type Declaration already read"}},
    };
    for (const refusal_row &row : rows)
        expect_refusal(row);
}

TEST(EntityDtd, UnterminatedDoctypeFails) {
    for (const std::string &document : {std::string("<!DOCTYPE r [<!ENTITY e \"v\">"), std::string("<!DOCTYPE r"),
                                        std::string("<!DOCTYPE r [<!ENTITY e \"v")}) {
        SCOPED_TRACE(document);
        traced_walk walk = walk_traced(document);
        EXPECT_NE(walk.error(), lmx::elmx_ok);
    }
}

// ---------------------------------------------------------------------------
// Recursion and expansion limits
// ---------------------------------------------------------------------------

TEST(EntityLimits, RecursionAndDeepNestingAreFatal) {
    const char *const recursion_a = "Recursive entity definition for: &a;";
    const refusal_row rows[] = {
        {"self reference in text is fatal recursion", with_subset("<!ENTITY a \"&a;\">", "<r>&a;</r>"),
         lmx::elmx_bad_dtd, lmx::elmx_bad_dtd, true,
         scan_expectation{scan_end::fails, lmx::elmx_type_fatal, lmx::elmx_bad_dtd, recursion_a}},
        // The message quotes the replacement text of the entity met again.
        {"mutual recursion in text is fatal", with_subset("<!ENTITY a \"&b;\"><!ENTITY b \"&a;\">", "<r>&a;</r>"),
         lmx::elmx_bad_dtd, std::nullopt, std::nullopt,
         scan_expectation{scan_end::fails, lmx::elmx_type_fatal, lmx::elmx_bad_dtd,
                          "Recursive entity definition for: &b;"}},
        {"self reference in an attribute is fatal without stack overflow",
         with_subset("<!ENTITY a \"&a;\">", "<r v=\"&a;\"/>"), lmx::elmx_unable_to_read_attribute, lmx::elmx_bad_dtd,
         true, scan_expectation{scan_end::value_fails, lmx::elmx_type_fatal, lmx::elmx_bad_dtd, recursion_a}},
        {"mutual recursion in an attribute is fatal",
         with_subset("<!ENTITY a \"x&b;\"><!ENTITY b \"y&a;\">", "<r v=\"&a;\"/>"), lmx::elmx_unable_to_read_attribute,
         lmx::elmx_bad_dtd, true, std::nullopt},
        {"self reference in a namespace declaration is fatal",
         with_subset("<!ENTITY a \"&a;\">", "<r xmlns:p=\"&a;\"/>"),
         lmx::elmx_bad_dtd, lmx::elmx_bad_dtd, std::nullopt, std::nullopt},
        {"nesting over 64 entities in text", entity_chain(65, "<r>&e65;</r>"), lmx::elmx_bad_dtd, lmx::elmx_bad_dtd,
         std::nullopt, scan_expectation{scan_end::fails, lmx::elmx_type_fatal, lmx::elmx_bad_dtd, k_limit_message}},
        {"nesting over 64 entities in an attribute", entity_chain(65, "<r a=\"&e65;\"/>"),
         lmx::elmx_unable_to_read_attribute, lmx::elmx_bad_dtd, std::nullopt,
         scan_expectation{scan_end::value_fails, lmx::elmx_type_fatal, lmx::elmx_bad_dtd, k_limit_message}},
    };
    for (const refusal_row &row : rows)
        expect_refusal(row);
}

TEST(EntityLimits, TextAlreadyBeingReadIsRefusedAsInput) {
    entity_stream stream;
    stream.getter().add_general_entity("a", "&a;");
    const char *text = nullptr;
    ASSERT_TRUE(stream.getter().get_general_entity("a", &text));
    EXPECT_TRUE(stream.getter().set_input_entity_value(text));
    EXPECT_FALSE(stream.getter().set_input_entity_value(text));
    EXPECT_TRUE(stream.error().is_fatal_errored());
    EXPECT_TRUE(
        stream.error().reported(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, "Recursive entity definition for: &a;"))
        << stream.error().describe();
}

struct blow_up_row {
    const char *name;
    std::string document;
    lmx::elmx_error walk_error; // the reader's record holds bad_dtd
    scan_end scan;
};

TEST(EntityLimits, ExpansionBeyondTheLimitFailsFast) {
    const blow_up_row rows[] = {
        {"billion laughs in text", billion_laughs("<r>&lol10;</r>"), lmx::elmx_bad_dtd, scan_end::fails},
        {"billion laughs in an attribute", billion_laughs("<r a=\"&lol10;\"/>"), lmx::elmx_unable_to_read_attribute,
         scan_end::value_fails},
        {"quadratic blow-up in text", quadratic_blow_up(false), lmx::elmx_bad_dtd, scan_end::fails},
        {"quadratic blow-up in an attribute", quadratic_blow_up(true), lmx::elmx_unable_to_read_attribute,
         scan_end::value_fails},
    };
    for (const blow_up_row &row : rows) {
        SCOPED_TRACE(row.name);
        lmx::elmx_error walk_error = lmx::elmx_ok;
        lmx::elmx_error reader_error = lmx::elmx_ok;
        const double seconds = seconds_for([&] {
            lmx::c_xml_reader_memory reader(row.document);
            walk_error = walk_traced(reader).error();
            reader_error = reader.get_error();
        });
        EXPECT_EQ(walk_error, row.walk_error);
        EXPECT_EQ(reader_error, lmx::elmx_bad_dtd);
        EXPECT_LT(seconds, k_fast_seconds);
        expect_scan_report(row.document, row.scan, lmx::elmx_type_fatal, lmx::elmx_bad_dtd, k_limit_message);
    }
}

TEST(EntityLimits, ExpansionBelowTheLimitIsReadInFull) {
    // 100 references to 50,000 bytes: 5,000,000 bytes, under 10 MiB.
    for (bool in_attribute : {false, true}) {
        SCOPED_TRACE(in_attribute ? "attribute" : "text");
        document_walk w(quadratic_blow_up(in_attribute, 100));
        ASSERT_EQ(w.walk.error(), lmx::elmx_ok) << w.walk.result.message;
        EXPECT_EQ(w.reader.get_error(), lmx::elmx_ok);
        const std::string &value = in_attribute ? w.walk.seen.attributes.at(0).second : w.walk.seen.texts.at(0);
        EXPECT_EQ(value.size(), 5000000u);
        EXPECT_EQ(value.find_first_not_of('x'), std::string::npos);
    }
}

TEST(EntityLimits, NestingOf64EntitiesIsAllowed) {
    const std::string expected = "x" + std::string(63, '.');
    expect_walk(walk_traced(entity_chain(64, "<r>&e64;</r>")), lmx::elmx_ok, "<r>" + expected + "</r>");
    expect_walk(walk_traced(entity_chain(64, "<r a=\"&e64;\"/>")), lmx::elmx_ok, "<r>[a=" + expected + "]</r>");
}

TEST(EntityLimits, DeepChainOfDistinctEntitiesNeverOverflowsTheStack) {
    for (const char *body : {"<r>&e5000;</r>", "<r a=\"&e5000;\"/>"}) {
        SCOPED_TRACE(body);
        document_walk w(entity_chain(5000, body));
        EXPECT_NE(w.walk.error(), lmx::elmx_ok);
        EXPECT_EQ(w.reader.get_error(), lmx::elmx_bad_dtd);
    }
}

} // namespace
