// Entity and character references, the internal DTD subset, and the limits
// that keep entity expansion from exhausting memory or stack.
#include <chrono>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include <lmx/lmxparse.h>

#include "reader_walk.h"

namespace {

using tessarine_test::recording_error;
using tessarine_test::scan_document;
using tessarine_test::scan_result;
using tessarine_test::traced_walk;
using tessarine_test::walk_traced;

// ---------------------------------------------------------------------------
// Helpers
// ---------------------------------------------------------------------------

// The entity layer over an input of its own, reporting to its own record.
class entity_stream {
public:
    explicit entity_stream(bool a_is_reading_xsd = true, std::string a_input = std::string())
        : m_input(std::move(a_input)), m_source(m_input.data(), m_input.size()),
          m_getter(m_source, m_error, a_is_reading_xsd) {}

    lmx::c_get_for_xml &getter() { return m_getter; }
    recording_error &error() { return m_error; }

    // Expands the reference whose "&" has just been read; ar_rest is what follows it.
    bool expand(const std::string &ar_rest, std::string *ap_value, bool a_markup_possible = false,
                std::size_t *ap_consumed = nullptr) {
        lmx::c_entity_name_reader_for_c_str reader(ar_rest.c_str());
        reader.set_is_markup_possible_in_entity(a_markup_possible);
        bool result = m_getter.select_general_entity(reader, ap_value);
        if (ap_consumed)
            *ap_consumed = reader.get_index();
        return result;
    }
    // Expands the character reference whose "&#" has just been read.
    bool character(const std::string &ar_rest, std::string *ap_value, std::size_t *ap_consumed = nullptr) {
        lmx::c_entity_name_reader_for_c_str reader(ar_rest.c_str());
        bool result = m_getter.insert_character_entity(reader, ap_value);
        if (ap_consumed)
            *ap_consumed = reader.get_index();
        return result;
    }
    // What the stream delivers up to its end.
    std::string read_to_end() {
        std::string out;
        for (int c = m_getter.get(), guard = 0; c != -1 && guard < (1 << 24); c = m_getter.get(), ++guard)
            out.push_back(static_cast<char>(c));
        return out;
    }

private:
    std::string m_input;
    lmx::c_read_memory m_source;
    recording_error m_error;
    lmx::c_get_for_xml m_getter;
};

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

    traced_walk walk = walk_traced(std::string("<r a=\"&#x41;\">&#x41;&#x62;</r>"));
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[a=A]Ab</r>");
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

    traced_walk walk = walk_traced(std::string("<r a=\"&#65\">&#65</r>"));
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[a=A]A</r>");

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
    traced_walk walk = walk_traced(std::string("<r a=\"&#X41;\"/>"));
    EXPECT_EQ(walk.error(), lmx::elmx_unable_to_read_attribute);
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
    for (const auto &row : rows) {
        SCOPED_TRACE(row.first);
        entity_stream stream;
        std::string value;
        EXPECT_TRUE(stream.character(row.first, &value));
        EXPECT_EQ(value, row.second);
    }
    traced_walk walk = walk_traced(std::string("<r a=\"&#xE9;&#8364;\">&#x1F600;</r>"));
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[a=\xC3\xA9\xE2\x82\xAC]\xF0\x9F\x98\x80</r>");
}

TEST(Entities, NelAndLineSeparatorReferencesBecomeNewline) {
    for (const char *rest : {"x85;", "133;", "x2028;", "8232;"}) {
        SCOPED_TRACE(rest);
        entity_stream stream;
        std::string value;
        EXPECT_TRUE(stream.character(rest, &value));
        EXPECT_EQ(value, "\n");
    }
}

TEST(Entities, WhiteSpaceFromCharacterReferencesCountsAsLiteralWhenReadingForTheSchema) {
    entity_stream literal(true);
    literal.getter().set_ws_mode(lmx::ws_collapse);
    std::string value = "a";
    ASSERT_TRUE(literal.character("10;", &value));
    literal.getter().add_char_wsp(&value, 'b');
    EXPECT_EQ(value, "a b");

    literal.getter().set_ws_mode(lmx::ws_replace);
    value = "a";
    ASSERT_TRUE(literal.character("9;", &value));
    EXPECT_EQ(value, "a ");
}

TEST(Entities, WhiteSpaceFromCharacterReferencesIsKeptOtherwise) {
    entity_stream kept(false);
    kept.getter().set_ws_mode(lmx::ws_collapse);
    std::string value = "a";
    ASSERT_TRUE(kept.character("10;", &value));
    kept.getter().add_char_wsp(&value, 'b');
    EXPECT_EQ(value, "a\nb");

    kept.getter().set_ws_mode(lmx::ws_replace);
    value = "a";
    ASSERT_TRUE(kept.character("9;", &value));
    EXPECT_EQ(value, "a\t");
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
    traced_walk walk = walk_traced(std::string("<r a=\"&lt;&gt;&amp;&apos;&quot;\">&lt;&gt;&amp;&apos;&quot;</r>"));
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[a=<>&'\"]<>&'\"</r>");

    std::string text;
    EXPECT_EQ(read_root_value("<r>1 &lt; 2 &amp;&amp; 3 &gt; 2</r>", &text), lmx::elmx_ok);
    EXPECT_EQ(text, "1 < 2 && 3 > 2");
}

TEST(Entities, PredefinedNamesCannotBeRedefined) {
    const std::string document = with_subset("<!ENTITY amp \"x\"><!ENTITY lt \"y\">", "<r a=\"&amp;\">&lt;</r>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[a=&]<</r>");
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

    traced_walk walk = walk_traced(std::string("<r a=\"&lt x\">a&gt b</r>"));
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[a=< x]a> b</r>");
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

    const std::string document = "<r>x&nope;y</r>";
    lmx::c_xml_reader_memory reader(document);
    traced_walk walk = walk_traced(reader);
    EXPECT_NE(walk.error(), lmx::elmx_ok);
    EXPECT_NE(walk.error(), lmx::elmx_entity_not_found);
    EXPECT_EQ(reader.get_error(), lmx::elmx_ok);
}

TEST(Entities, UnknownEntityInAttributeCannotBeRead) {
    const std::string document = "<r a=\"x&nope;y\"/>";
    lmx::c_xml_reader_memory reader(document);
    traced_walk walk = walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_unable_to_read_attribute);
    EXPECT_EQ(reader.get_debug_error().item_name, "@a");
    EXPECT_EQ(reader.get_error(), lmx::elmx_ok);
}

// ---------------------------------------------------------------------------
// General entities
// ---------------------------------------------------------------------------

TEST(Entities, DefinedEntityExpandsInTextAndAttributes) {
    const std::string document = with_subset("<!ENTITY who \"world\">", "<r a=\"hello &who;\">hello &who;!</r>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[a=hello world]hello world!</r>");

    std::string text;
    EXPECT_EQ(read_root_value(with_subset("<!ENTITY who \"world\">", "<r>hello &who;!</r>"), &text), lmx::elmx_ok);
    EXPECT_EQ(text, "hello world!");
}

TEST(Entities, LastDefinitionWins) {
    const std::string document =
        with_subset("<!ENTITY e \"first\"><!ENTITY e \"second\">", "<r a=\"&e;\">&e;</r>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[a=second]second</r>");
}

TEST(Entities, EntityHoldingAnElementYieldsTheElementInContent) {
    const std::string document = with_subset("<!ENTITY b \"<b/>\">", "<r>&b;</r>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r><b></b></r>");
    EXPECT_EQ(walk.seen.elements, (std::vector<std::string>{"r", "b"}));
}

TEST(Entities, EntityHoldingMixedContentIsScannedLikeTheDocument) {
    const std::string document = with_subset("<!ENTITY m \"x<c k='v'>y</c>z\">", "<r>&m;</r>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>x<c>[k=v]y</c>z</r>");
}

TEST(Entities, EntityWithLessThanInAttributeValueIsText) {
    const std::string document =
        with_subset("<!ENTITY e \"1<2\"><!ENTITY b \"<b/>\">", "<r a=\"&e;\" b=\"&b;\"/>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[a=1<2][b=<b/>]</r>");
}

TEST(Entities, NestedReferencesInAttributeValuesExpand) {
    const std::string document =
        with_subset("<!ENTITY in \"i\"><!ENTITY out \"(&in;&amp;&#x41;)\">", "<r a=\"&out;\">&out;</r>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[a=(i&A)](i&A)</r>");
}

TEST(Entities, GeneralReferenceInEntityValueIsExpandedWhenUsed) {
    const std::string document = with_subset("<!ENTITY a \"A\"><!ENTITY e \"(&a;)\"><!ENTITY a \"Z\">",
                                             "<r v=\"&e;\">&e;</r>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[v=(Z)](Z)</r>");
}

TEST(Entities, CharacterReferenceInEntityValueIsExpandedAtDefinition) {
    // "&#60;" is "<" by the time the entity is used, so the text is markup.
    const std::string document = with_subset("<!ENTITY e \"&#60;b/>\">", "<r>&e;</r>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r><b></b></r>");
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
    const std::string document = "<r a=\"&me;\">&me;</r>";
    lmx::c_xml_reader_memory reader(document);
    reader.add_general_entity(std::string("me"), std::string("value"));
    traced_walk walk = walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[a=value]value</r>");
}

TEST(Entities, RewindForgetsEntityDefinitions) {
    const std::string document = with_subset("<!ENTITY e \"v\">", "<r>&e;</r>");
    lmx::c_xml_reader_memory reader(document);
    reader.add_general_entity(std::string("me"), std::string("value"));
    traced_walk first = walk_traced(reader);
    ASSERT_EQ(first.error(), lmx::elmx_ok) << first.result.message;
    const char *text = nullptr;
    EXPECT_TRUE(reader.get_general_entity("e", &text));
    reader.rewind();
    EXPECT_FALSE(reader.get_general_entity("e", &text));
    EXPECT_FALSE(reader.get_general_entity("me", &text));
    // The document defines its own again.
    traced_walk second = walk_traced(reader);
    EXPECT_EQ(second.error(), lmx::elmx_ok) << second.result.message;
    EXPECT_EQ(second.trace(), "<r>v</r>");
}

TEST(Entities, NewlinesFromEntityTextAreNotCounted) {
    // The line end inside the declaration is counted; read again from the
    // entity, it is not.
    const std::string document = "<!DOCTYPE r [<!ENTITY nl \"a\nb\">]><r>&nl;&nl;</r>";
    lmx::c_xml_reader_memory reader(document);
    traced_walk walk = walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>a\nba\nb</r>");
    EXPECT_EQ(reader.get_line_no(), 2);
}

TEST(Entities, EntityTextIsNotLineEndFolded) {
    const std::string document = with_subset("<!ENTITY cr \"a&#13;b\">", "<r v=\"&cr;\">&cr;</r>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[v=a\rb]a\rb</r>");
}

// ---------------------------------------------------------------------------
// The internal DTD subset
// ---------------------------------------------------------------------------

TEST(EntityDtd, DoctypeWithSystemIdentifierIsAcceptedAndIgnored) {
    const std::string document = "<!DOCTYPE r SYSTEM \"x.dtd\"><r>t</r>";
    lmx::c_xml_reader_memory reader(document);
    traced_walk walk = walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>t</r>");
    EXPECT_EQ(reader.get_error(), lmx::elmx_ok);

    recording_error error;
    EXPECT_TRUE(scan_document(document, error).ok());
    EXPECT_TRUE(error.reports().empty()) << error.describe();
}

TEST(EntityDtd, DoctypeWithPublicIdentifierAndInternalSubset) {
    const std::string document =
        "<!DOCTYPE r PUBLIC \"-//Tessarine//DTD r//EN\" \"r.dtd\" [<!ENTITY e \"v\">]><r>&e;</r>";
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>v</r>");
}

TEST(EntityDtd, DeclarationsOtherThanEntitiesAreSkipped) {
    const std::string document = with_subset("\n"
                                             "  <!-- <!ENTITY fake \"no\"> -->\n"
                                             "  <?pi <!ENTITY fake \"no\">?>\n"
                                             "  <!ELEMENT r (#PCDATA)>\n"
                                             "  <!ATTLIST r a CDATA \"x>y\" b CDATA 'p>q'>\n"
                                             "  <!NOTATION n SYSTEM \"n\">\n"
                                             "  <!ENTITY e \"v\">\n",
                                             "<r>&e;</r>");
    lmx::c_xml_reader_memory reader(document);
    traced_walk walk = walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>v</r>");
    const char *text = nullptr;
    EXPECT_FALSE(reader.get_general_entity("fake", &text));
}

TEST(EntityDtd, WhiteSpaceAroundTheSubsetIsAllowed) {
    const std::string document = "<!DOCTYPE r [ \n <!ENTITY e \"v\"> \n ] ><r>&e;</r>";
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>v</r>");
}

TEST(EntityDtd, EntityValueInSingleQuotesMayHoldDoubleQuotes) {
    const std::string document = with_subset("<!ENTITY e 'say \"hi\"'>", "<r>&e;</r>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>say \"hi\"</r>");
}

TEST(EntityDtd, ParameterEntityCanDeclareEntities) {
    const std::string document =
        with_subset("<!ENTITY % decl \"<!ENTITY e 'from a parameter entity'>\"> %decl; ", "<r>&e;</r>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>from a parameter entity</r>");
}

TEST(EntityDtd, ParameterEntityExpandsInEntityValue) {
    const std::string document = with_subset("<!ENTITY % p \"mid\"><!ENTITY e \"start-%p;-end\">", "<r>&e;</r>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>start-mid-end</r>");
}

TEST(EntityDtd, QuoteInsideParameterEntityDoesNotEndTheValue) {
    const std::string document =
        with_subset("<!ENTITY % q 'say \"hi\"'><!ENTITY e \"%q;!\">", "<r a='&e;'>&e;</r>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[a=say \"hi\"!]say \"hi\"!</r>");
}

TEST(EntityDtd, ParameterEntityIsNotAGeneralEntity) {
    std::string text;
    EXPECT_EQ(read_root_value(with_subset("<!ENTITY % p \"v\">", "<r>&p;</r>"), &text),
              lmx::elmx_unable_to_read_element);
}

TEST(EntityDtd, UnknownParameterEntityIsReportedAndReadingGoesOn) {
    const std::string document = with_subset(" %nope; <!ENTITY e \"v\"> ", "<r>&e;</r>");
    lmx::c_xml_reader_memory reader(document);
    traced_walk walk = walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>v</r>");
    EXPECT_EQ(reader.get_error(), lmx::elmx_entity_not_found);
    EXPECT_FALSE(reader.get_error_record().is_fatal_errored());

    recording_error error;
    EXPECT_TRUE(scan_document(document, error).ok());
    EXPECT_TRUE(error.reported(lmx::elmx_type_error, lmx::elmx_entity_not_found, "Entity '%nope' not found"))
        << error.describe();
}

TEST(EntityDtd, ExternalEntityWarnsAndReadsAsItsKeyword) {
    const std::string document =
        with_subset("<!ENTITY ext SYSTEM \"ext.xml\"><!ENTITY pub PUBLIC \"-//T//E\" \"pub.xml\">",
                    "<r a=\"&ext;\">&pub;</r>");
    lmx::c_xml_reader_memory reader(document);
    traced_walk walk = walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>[a=SYSTEM]PUBLIC</r>");
    EXPECT_EQ(reader.get_error(), lmx::elmx_external_entity);
    EXPECT_EQ(reader.get_error_record().get_warning_count(), 2);
    EXPECT_FALSE(reader.get_error_record().is_fatal_errored());

    recording_error error;
    EXPECT_TRUE(scan_document(document, error).ok());
    EXPECT_TRUE(error.reported(lmx::elmx_type_warning, lmx::elmx_external_entity,
                               "External Entity definitions not supported"))
        << error.describe();
}

TEST(EntityDtd, UnexpectedWordInEntityDefinitionIsAnError) {
    const std::string document = with_subset("<!ENTITY e bogus>", "<r>&e;</r>");
    recording_error error;
    scan_document(document, error);
    EXPECT_TRUE(error.reported(lmx::elmx_type_error, lmx::elmx_unexpected_entity,
                               "Unexpected value in Entity definition: bogus"))
        << error.describe();
    EXPECT_FALSE(error.is_fatal_errored());

    lmx::c_xml_reader_memory reader(document);
    traced_walk walk = walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>bogus</r>");
    EXPECT_EQ(reader.get_error(), lmx::elmx_unexpected_entity);
}

TEST(EntityDtd, JunkAfterTheSubsetIsFatal) {
    const std::string document = "<!DOCTYPE r [<!ENTITY e \"v\">] x><r/>";
    lmx::c_xml_reader_memory reader(document);
    traced_walk walk = walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_bad_dtd) << walk.result.message;
    EXPECT_EQ(reader.get_error(), lmx::elmx_bad_dtd);
    EXPECT_TRUE(reader.get_error_record().is_fatal_errored());

    recording_error error;
    EXPECT_FALSE(scan_document(document, error).ok());
    EXPECT_TRUE(
        error.reported(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, "DTD not Well Formed (expected '>', got x)"))
        << error.describe();
}

TEST(EntityDtd, JunkInsideTheSubsetIsFatal) {
    const std::string document = "<!DOCTYPE r [ <!ENTITY e \"v\"> x ]><r/>";
    lmx::c_xml_reader_memory reader(document);
    traced_walk walk = walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_bad_dtd) << walk.result.message;
    EXPECT_TRUE(reader.get_error_record().is_fatal_errored());

    recording_error error;
    EXPECT_FALSE(scan_document(document, error).ok());
    EXPECT_TRUE(error.reported(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, "DTD not Well Formed (got x)"))
        << error.describe();
}

TEST(EntityDtd, UnterminatedDoctypeFails) {
    for (const std::string &document : {std::string("<!DOCTYPE r [<!ENTITY e \"v\">"), std::string("<!DOCTYPE r"),
                                        std::string("<!DOCTYPE r [<!ENTITY e \"v")}) {
        SCOPED_TRACE(document);
        traced_walk walk = walk_traced(document);
        EXPECT_NE(walk.error(), lmx::elmx_ok);
    }
}

TEST(EntityDtd, DoctypeAfterContentIsRejected) {
    for (const std::string &document : {std::string("<r/><!DOCTYPE r>"), std::string("<r><!DOCTYPE r></r>")}) {
        SCOPED_TRACE(document);
        traced_walk walk = walk_traced(document);
        EXPECT_EQ(walk.error(), lmx::elmx_bad_dtd) << walk.result.message;

        recording_error error;
        EXPECT_FALSE(scan_document(document, error).ok());
        EXPECT_TRUE(error.reported(lmx::elmx_type_error, lmx::elmx_bad_dtd,
                                   "Document Type Declaration not at start of document"))
            << error.describe();
    }
}

TEST(EntityDtd, SecondDoctypeIsRejected) {
    const std::string document = "<!DOCTYPE r><!DOCTYPE r><r/>";
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_bad_dtd) << walk.result.message;

    recording_error error;
    EXPECT_FALSE(scan_document(document, error).ok());
    EXPECT_TRUE(error.reported(lmx::elmx_type_error, lmx::elmx_bad_dtd, "Document Type Declaration already read"))
        << error.describe();
}

TEST(EntityDtd, DoctypeAfterXmlDeclarationCommentAndPiIsAccepted) {
    const std::string document =
        "<?xml version=\"1.0\"?>\n<!-- c -->\n<?pi x?>\n<!DOCTYPE r [<!ENTITY e \"v\">]>\n<r>&e;</r>";
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<r>v</r>");
}

// ---------------------------------------------------------------------------
// Recursion and expansion limits
// ---------------------------------------------------------------------------

TEST(EntityLimits, SelfReferenceInTextIsFatalRecursion) {
    const std::string document = with_subset("<!ENTITY a \"&a;\">", "<r>&a;</r>");
    lmx::c_xml_reader_memory reader(document);
    traced_walk walk = walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_bad_dtd) << walk.result.message;
    EXPECT_EQ(reader.get_error(), lmx::elmx_bad_dtd);
    EXPECT_TRUE(reader.get_error_record().is_fatal_errored());

    recording_error error;
    EXPECT_FALSE(scan_document(document, error).ok());
    EXPECT_TRUE(error.reported(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, "Recursive entity definition for: &a;"))
        << error.describe();
}

TEST(EntityLimits, MutualRecursionInTextIsFatal) {
    const std::string document = with_subset("<!ENTITY a \"&b;\"><!ENTITY b \"&a;\">", "<r>&a;</r>");
    traced_walk walk = walk_traced(document);
    EXPECT_EQ(walk.error(), lmx::elmx_bad_dtd) << walk.result.message;

    recording_error error;
    EXPECT_FALSE(scan_document(document, error).ok());
    // The message quotes the replacement text of the entity met again.
    EXPECT_TRUE(error.reported(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, "Recursive entity definition for: &b;"))
        << error.describe();
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

TEST(EntityLimits, SelfReferenceInAttributeIsFatalWithoutStackOverflow) {
    const std::string document = with_subset("<!ENTITY a \"&a;\">", "<r v=\"&a;\"/>");
    lmx::c_xml_reader_memory reader(document);
    traced_walk walk = walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_unable_to_read_attribute) << walk.result.message;
    EXPECT_EQ(reader.get_error(), lmx::elmx_bad_dtd);
    EXPECT_TRUE(reader.get_error_record().is_fatal_errored());

    recording_error error;
    scan_result scan = scan_document(document, error);
    EXPECT_TRUE(scan.value_failed);
    EXPECT_TRUE(error.reported(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, "Recursive entity definition for: &a;"))
        << error.describe();
}

TEST(EntityLimits, MutualRecursionInAttributeIsFatal) {
    const std::string document = with_subset("<!ENTITY a \"x&b;\"><!ENTITY b \"y&a;\">", "<r v=\"&a;\"/>");
    lmx::c_xml_reader_memory reader(document);
    traced_walk walk = walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_unable_to_read_attribute) << walk.result.message;
    EXPECT_EQ(reader.get_error(), lmx::elmx_bad_dtd);
    EXPECT_TRUE(reader.get_error_record().is_fatal_errored());
}

TEST(EntityLimits, SelfReferenceInNamespaceDeclarationIsFatal) {
    const std::string document = with_subset("<!ENTITY a \"&a;\">", "<r xmlns:p=\"&a;\"/>");
    lmx::c_xml_reader_memory reader(document);
    traced_walk walk = walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_bad_dtd) << walk.result.message;
    EXPECT_EQ(reader.get_error(), lmx::elmx_bad_dtd);
}

TEST(EntityLimits, BillionLaughsInTextFailsFast) {
    const std::string document = billion_laughs("<r>&lol10;</r>");
    lmx::elmx_error walk_error = lmx::elmx_ok;
    lmx::elmx_error reader_error = lmx::elmx_ok;
    const double seconds = seconds_for([&] {
        lmx::c_xml_reader_memory reader(document);
        walk_error = walk_traced(reader).error();
        reader_error = reader.get_error();
    });
    EXPECT_EQ(walk_error, lmx::elmx_bad_dtd);
    EXPECT_EQ(reader_error, lmx::elmx_bad_dtd);
    EXPECT_LT(seconds, k_fast_seconds);

    recording_error error;
    EXPECT_FALSE(scan_document(document, error).ok());
    EXPECT_TRUE(error.reported(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, k_limit_message)) << error.describe();
}

TEST(EntityLimits, BillionLaughsInAttributeFailsFast) {
    const std::string document = billion_laughs("<r a=\"&lol10;\"/>");
    lmx::elmx_error walk_error = lmx::elmx_ok;
    lmx::elmx_error reader_error = lmx::elmx_ok;
    const double seconds = seconds_for([&] {
        lmx::c_xml_reader_memory reader(document);
        walk_error = walk_traced(reader).error();
        reader_error = reader.get_error();
    });
    EXPECT_EQ(walk_error, lmx::elmx_unable_to_read_attribute);
    EXPECT_EQ(reader_error, lmx::elmx_bad_dtd);
    EXPECT_LT(seconds, k_fast_seconds);

    recording_error error;
    EXPECT_TRUE(scan_document(document, error).value_failed);
    EXPECT_TRUE(error.reported(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, k_limit_message)) << error.describe();
}

TEST(EntityLimits, QuadraticBlowUpInTextFailsFast) {
    const std::string document = quadratic_blow_up(false);
    lmx::elmx_error walk_error = lmx::elmx_ok;
    lmx::elmx_error reader_error = lmx::elmx_ok;
    const double seconds = seconds_for([&] {
        lmx::c_xml_reader_memory reader(document);
        walk_error = walk_traced(reader).error();
        reader_error = reader.get_error();
    });
    EXPECT_EQ(walk_error, lmx::elmx_bad_dtd);
    EXPECT_EQ(reader_error, lmx::elmx_bad_dtd);
    EXPECT_LT(seconds, k_fast_seconds);

    recording_error error;
    EXPECT_FALSE(scan_document(document, error).ok());
    EXPECT_TRUE(error.reported(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, k_limit_message)) << error.describe();
}

TEST(EntityLimits, QuadraticBlowUpInAttributeFailsFast) {
    const std::string document = quadratic_blow_up(true);
    lmx::elmx_error walk_error = lmx::elmx_ok;
    lmx::elmx_error reader_error = lmx::elmx_ok;
    const double seconds = seconds_for([&] {
        lmx::c_xml_reader_memory reader(document);
        walk_error = walk_traced(reader).error();
        reader_error = reader.get_error();
    });
    EXPECT_EQ(walk_error, lmx::elmx_unable_to_read_attribute);
    EXPECT_EQ(reader_error, lmx::elmx_bad_dtd);
    EXPECT_LT(seconds, k_fast_seconds);

    recording_error error;
    EXPECT_TRUE(scan_document(document, error).value_failed);
    EXPECT_TRUE(error.reported(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, k_limit_message)) << error.describe();
}

TEST(EntityLimits, ExpansionBelowTheLimitIsReadInFull) {
    // 100 references to 50,000 bytes: 5,000,000 bytes, under 10 MiB.
    for (bool in_attribute : {false, true}) {
        SCOPED_TRACE(in_attribute ? "attribute" : "text");
        const std::string document = quadratic_blow_up(in_attribute, 100);
        lmx::c_xml_reader_memory reader(document);
        traced_walk walk = walk_traced(reader);
        ASSERT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
        EXPECT_EQ(reader.get_error(), lmx::elmx_ok);
        const std::string &value = in_attribute ? walk.seen.attributes.at(0).second : walk.seen.texts.at(0);
        EXPECT_EQ(value.size(), 5000000u);
        EXPECT_EQ(value.find_first_not_of('x'), std::string::npos);
    }
}

TEST(EntityLimits, NestingOf64EntitiesIsAllowed) {
    const std::string expected = "x" + std::string(63, '.');
    traced_walk text = walk_traced(entity_chain(64, "<r>&e64;</r>"));
    EXPECT_EQ(text.error(), lmx::elmx_ok) << text.result.message;
    EXPECT_EQ(text.trace(), "<r>" + expected + "</r>");

    traced_walk attribute = walk_traced(entity_chain(64, "<r a=\"&e64;\"/>"));
    EXPECT_EQ(attribute.error(), lmx::elmx_ok) << attribute.result.message;
    EXPECT_EQ(attribute.trace(), "<r>[a=" + expected + "]</r>");
}

TEST(EntityLimits, NestingOver64EntitiesIsFatal) {
    {
        const std::string document = entity_chain(65, "<r>&e65;</r>");
        lmx::c_xml_reader_memory reader(document);
        traced_walk walk = walk_traced(reader);
        EXPECT_EQ(walk.error(), lmx::elmx_bad_dtd) << walk.result.message;
        EXPECT_EQ(reader.get_error(), lmx::elmx_bad_dtd);

        recording_error error;
        EXPECT_FALSE(scan_document(document, error).ok());
        EXPECT_TRUE(error.reported(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, k_limit_message)) << error.describe();
    }
    {
        const std::string document = entity_chain(65, "<r a=\"&e65;\"/>");
        lmx::c_xml_reader_memory reader(document);
        traced_walk walk = walk_traced(reader);
        EXPECT_EQ(walk.error(), lmx::elmx_unable_to_read_attribute) << walk.result.message;
        EXPECT_EQ(reader.get_error(), lmx::elmx_bad_dtd);

        recording_error error;
        EXPECT_TRUE(scan_document(document, error).value_failed);
        EXPECT_TRUE(error.reported(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, k_limit_message)) << error.describe();
    }
}

TEST(EntityLimits, DeepChainOfDistinctEntitiesNeverOverflowsTheStack) {
    for (const char *body : {"<r>&e5000;</r>", "<r a=\"&e5000;\"/>"}) {
        SCOPED_TRACE(body);
        const std::string document = entity_chain(5000, body);
        lmx::c_xml_reader_memory reader(document);
        traced_walk walk = walk_traced(reader);
        EXPECT_NE(walk.error(), lmx::elmx_ok);
        EXPECT_EQ(reader.get_error(), lmx::elmx_bad_dtd);
    }
}

} // namespace
