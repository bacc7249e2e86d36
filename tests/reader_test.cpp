// Tests of the pull reader, lmx::c_xml_reader, and of the pieces it is made
// of: namespace numbering and scopes, cracked names, tokenising against a
// binding's tables, the event and value calls, error capture and handling,
// the file and memory readers, and the full document walk that
// tools/xmlcheck runs (tools/xml_walk.h) over our own test documents and the
// shared corpus of CxF files.

#include <gtest/gtest.h>

#include <lmx/lmxparse.h>

#include <cstring>
#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "reader_walk.h"

#ifndef TESSARINE_SOURCE_DIR
#define TESSARINE_SOURCE_DIR "."
#endif
#ifndef TESSARINE_CORPUS_DIR
#define TESSARINE_CORPUS_DIR "../shared/corpus"
#endif

namespace {

namespace fs = std::filesystem;
using lmx::elmx_error;
using tessarine_test::at_root_with_code_location;
using tessarine_test::expect_code_location;
using tessarine_test::expect_debug_error;
using tessarine_test::long_hook_reader;
using tessarine_test::nested_elements;
using tessarine_test::next_event_is;
using tessarine_test::short_hook_reader;
using tessarine_test::temp_file;
using tessarine_test::text_reader;

const char *const k_xsi = "http://www.w3.org/2001/XMLSchema-instance";

// Reads the attributes of the current start tag without a map; gives the
// event they ended on.
int finish_attributes(lmx::c_xml_reader &ar_reader) {
    elmx_error error = lmx::elmx_ok;
    std::string name;
    while (ar_reader.get_attribute_event(nullptr, &error, &name)) {
        EXPECT_EQ(error, lmx::elmx_ok) << name;
        if (error != lmx::elmx_ok)
            break;
        ar_reader.skip_attribute_value();
    }
    return ar_reader.get_current_event();
}

// Reads the next element event as next_event_is does (it must be a_event),
// then the attributes of the start tag, which must end with a_tag_end.
::testing::AssertionResult read_start_tag(lmx::c_xml_reader &ar_reader, int a_event, int a_tag_end,
                                          const lmx::s_event_map *ap_events = nullptr,
                                          std::string *ap_name = nullptr) {
    ::testing::AssertionResult event = next_event_is(ar_reader, a_event, ap_events, ap_name);
    if (!event)
        return event;
    const int tag_end = finish_attributes(ar_reader);
    if (tag_end != a_tag_end)
        return ::testing::AssertionFailure() << "start tag ended with " << tag_end << ", expected " << a_tag_end;
    return ::testing::AssertionSuccess();
}

// ------------------------------------------------------------------ tables

const lmx::s_ns_map k_ns_u[] = {{1000, "cc", "urn:u"}, {0, nullptr, nullptr}};

const lmx::s_event_map k_x_events[] = {
    {1000, "x", 1, 20},
    {1, "x", 1, 21},
    {0, nullptr, 0, 0},
};

// =================================================== namespaces in the reader

TEST(ReaderNamespaces, PrefixIsMatchedByUriWhateverItIs) {
    for (const char *text : {"<p:x xmlns:p=\"urn:u\"/>", "<cc:x xmlns:cc=\"urn:u\"/>", "<x xmlns=\"urn:u\"/>",
                             "<any:x xmlns:any='urn:u' xmlns:p='urn:other'/>"}) {
        text_reader reader(text);
        reader.set_ns_map(k_ns_u);
        elmx_error error = lmx::elmx_bad_dtd;
        std::string name;
        EXPECT_EQ(reader.get_element_event(k_x_events, &error, &name), 20) << text;
        EXPECT_EQ(error, lmx::elmx_ok) << text;
        EXPECT_EQ(reader.get_element_ns_id(), 1000) << text;
        EXPECT_EQ(reader.get_local_name(), "x") << text;
    }
}

TEST(ReaderNamespaces, TablePrefixIsNotBoundInTheDocument) {
    // The table's preferred prefix means nothing to the document.
    text_reader reader("<cc:x/>");
    reader.set_ns_map(k_ns_u);
    std::string name;
    elmx_error error = lmx::elmx_ok;
    EXPECT_EQ(reader.get_element_event(k_x_events, &error, &name), lmx::xe_unknown);
    EXPECT_EQ(reader.get_cracked_name().get_ns_id(), lmx::ns_not_found);
}

TEST(ReaderNamespaces, UnprefixedElementWithoutDefaultNamespaceIsInNoNamespace) {
    text_reader reader("<x/>");
    reader.set_ns_map(k_ns_u);
    std::string name;
    elmx_error error = lmx::elmx_ok;
    EXPECT_EQ(reader.get_element_event(k_x_events, &error, &name), 21);
    EXPECT_EQ(reader.get_element_ns_id(), lmx::ns_none);
}

TEST(ReaderNamespaces, EmptyDefaultDeclarationUndeclaresToNoNamespace) {
    const lmx::s_event_map events[] = {
        {1000, "x", 1, 20},
        {1000, "y", 1, 21},
        {1, "y", 1, 22},
        {0, nullptr, 0, 0},
    };
    text_reader reader("<x xmlns=\"urn:u\"><y xmlns=\"\"/><y/></x>");
    reader.set_ns_map(k_ns_u);
    std::string name;
    elmx_error error = lmx::elmx_ok;
    ASSERT_TRUE(read_start_tag(reader, 20, lmx::xe_start_tag_end, events, &name));
    {
        lmx::c_xml_reader_local scope(reader);
        EXPECT_EQ(reader.get_element_event(events, &error, &name), 22);
        EXPECT_EQ(reader.get_element_ns_id(), lmx::ns_none);
        ASSERT_EQ(finish_attributes(reader), lmx::xe_end_tag);
        // The sibling is back in the default namespace of the parent.
        EXPECT_EQ(reader.get_element_event(events, &error, &name), 21);
        ASSERT_EQ(finish_attributes(reader), lmx::xe_end_tag);
        EXPECT_EQ(reader.get_element_event(events, &error, &name), lmx::xe_end_tag);
        EXPECT_EQ(name, "x");
    }
}

TEST(ReaderNamespaces, SiblingRedeclarationsResolveSeparately) {
    const lmx::s_ns_map ns[] = {{1000, "one", "urn:one"}, {1001, "two", "urn:two"}, {0, nullptr, nullptr}};
    const lmx::s_event_map events[] = {
        {1, "r", 1, 30},
        {1000, "a", 1, 31},
        {1001, "a", 1, 32},
        {0, nullptr, 0, 0},
    };
    text_reader reader("<r><p:a xmlns:p=\"urn:one\"/><p:a xmlns:p=\"urn:two\"/><p:a/></r>");
    reader.set_ns_map(ns);
    std::string name, uri;
    elmx_error error = lmx::elmx_ok;
    ASSERT_TRUE(read_start_tag(reader, 30, lmx::xe_start_tag_end, events, &name));
    lmx::c_xml_reader_local scope(reader);

    EXPECT_EQ(reader.get_element_event(events, &error, &name), 31);
    reader.get_namespace(name, &uri);
    EXPECT_EQ(uri, "urn:one");
    ASSERT_EQ(finish_attributes(reader), lmx::xe_end_tag);

    EXPECT_EQ(reader.get_element_event(events, &error, &name), 32);
    reader.get_namespace(name, &uri);
    EXPECT_EQ(uri, "urn:two");
    ASSERT_EQ(finish_attributes(reader), lmx::xe_end_tag);

    // A declaration of a sibling does not stay for the next one.
    EXPECT_EQ(reader.get_element_event(events, &error, &name), lmx::xe_unknown);
    reader.get_namespace(name, &uri);
    EXPECT_EQ(uri, lmx::c_xml::k_namespace_not_found);
    ASSERT_EQ(finish_attributes(reader), lmx::xe_end_tag);

    EXPECT_EQ(reader.get_element_event(events, &error, &name), lmx::xe_end_tag);
}

TEST(ReaderNamespaces, XsiAttributesGiveTheirOwnEventsEvenWhenATableNamesThem) {
    const lmx::s_event_map attributes[] = {
        {5, "type", 4, 40},
        {5, "nil", 3, 41},
        {5, "other", 5, 42},
        {0, nullptr, 0, 0},
    };
    text_reader reader(std::string("<x xmlns:xsi=\"") + k_xsi +
                       "\" xsi:type=\"T\" xsi:nil=\"true\" xsi:schemaLocation=\"a b\""
                       " xsi:noNamespaceSchemaLocation=\"c\" xsi:other=\"d\"/>");
    std::string name;
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name, nullptr, &name));

    const int expected[] = {lmx::xe_xsi_type, lmx::xe_xsi_nil, lmx::xe_xsi_schema_location,
                            lmx::xe_xsi_no_namespace_schema_location, lmx::xe_unknown};
    for (int event : expected) {
        EXPECT_EQ(reader.get_attribute_event(attributes, &name), event) << name;
        EXPECT_EQ(reader.get_current_event(), event) << name;
        EXPECT_TRUE(reader.is_xsi_attribute()) << name;
        reader.skip_attribute_value();
    }
    EXPECT_EQ(reader.get_attribute_event(attributes, &name), lmx::xe_end_tag);
}

TEST(ReaderNamespaces, UndeclaredXsiPrefixGivesUnknown) {
    const lmx::s_event_map attributes[] = {
        {5, "type", 4, 40},
        {5, "nil", 3, 41},
        {0, nullptr, 0, 0},
    };
    text_reader reader("<x xsi:type=\"T\" xsi:nil=\"true\"/>");
    std::string name;
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name, nullptr, &name));
    EXPECT_EQ(reader.get_attribute_event(attributes, &name), lmx::xe_unknown);
    EXPECT_EQ(name, "xsi:type");
    EXPECT_FALSE(reader.is_xsi_attribute());
    reader.skip_attribute_value();
    EXPECT_EQ(reader.get_attribute_event(attributes, &name), lmx::xe_unknown);
    EXPECT_EQ(name, "xsi:nil");
    reader.skip_attribute_value();
    EXPECT_EQ(reader.get_attribute_event(attributes, &name), lmx::xe_end_tag);
}

TEST(ReaderNamespaces, UnprefixedTypeAttributeIsOrdinaryInADefaultNamespace) {
    const lmx::s_event_map attributes[] = {
        {1000, "type", 4, 50},
        {1, "type", 4, 51},
        {0, nullptr, 0, 0},
    };
    text_reader reader(std::string("<x xmlns=\"urn:u\" xmlns:xsi=\"") + k_xsi + "\" type=\"a\"/>");
    reader.set_ns_map(k_ns_u);
    std::string name;
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name, nullptr, &name));
    EXPECT_EQ(reader.get_element_ns_id(), 1000);
    EXPECT_EQ(reader.get_attribute_event(attributes, &name), 51);
    EXPECT_EQ(reader.get_cracked_name().get_ns_id(), lmx::ns_none);
    EXPECT_FALSE(reader.is_xsi_attribute());
}

TEST(ReaderNamespaces, UserPrefixMappingIsBoundBySetNsMap) {
    const lmx::s_ns_map ns[] = {{1000, "c", "urn:core"}, {0, nullptr, nullptr}};
    const lmx::s_event_map events[] = {{1000, "a", 1, 20}, {0, nullptr, 0, 0}};
    text_reader reader("<x:a/>");
    reader.add_namespace_mapping("x", "urn:core");
    reader.add_namespace_mapping("y", "urn:user");
    reader.set_ns_map(ns);
    EXPECT_GE(reader.find_enumerated_namespace("urn:user"), 1001);
    // Reading code opens a scope of its own before the first element.
    lmx::c_xml_reader_local scope(reader);
    elmx_error error = lmx::elmx_ok;
    std::string name;
    EXPECT_EQ(reader.get_element_event(events, &error, &name), 20);
    std::string uri;
    reader.get_namespace("y:b", &uri);
    EXPECT_EQ(uri, "urn:user");
}

TEST(ReaderNamespaces, SetNsMapDefinesTheIdsOfTheTable) {
    const lmx::s_ns_map ns[] = {{1000, "a", "urn:a"}, {1005, "b", "urn:b"}, {0, nullptr, nullptr}};
    text_reader reader("<x/>");
    reader.set_ns_map(ns);
    EXPECT_EQ(reader.find_enumerated_namespace("urn:a"), 1000);
    EXPECT_EQ(reader.find_enumerated_namespace("urn:b"), 1005);
    EXPECT_EQ(reader.add_namespace("urn:new"), 1006);
}

TEST(ReaderNamespaces, GetNamespaceResolvesInTheCurrentScope) {
    text_reader reader("<r xmlns:p=\"urn:p\" xmlns:e=\"\"/>");
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name));
    std::string uri = "old";
    reader.get_namespace("p:x", &uri);
    EXPECT_EQ(uri, "urn:p");
    reader.get_namespace("x", &uri);
    EXPECT_EQ(uri, lmx::c_xml::k_non_namespace);
    EXPECT_EQ(uri, "");
    reader.get_namespace("q:x", &uri);
    EXPECT_EQ(uri, lmx::c_xml::k_namespace_not_found);
    EXPECT_EQ(uri, " ");
    reader.get_namespace("e:x", &uri);
    EXPECT_EQ(uri, " ");
    reader.get_namespace("xml:lang", &uri);
    EXPECT_EQ(uri, lmx::k_xml_namespace_uri);

    std::string prefix;
    reader.get_namespace_prefix("p:x", &prefix);
    EXPECT_EQ(prefix, "p");
    reader.get_namespace_prefix("x", &prefix);
    EXPECT_EQ(prefix, "");
}

TEST(ReaderNamespaces, DefaultNamespaceResolvesUnprefixedNames) {
    text_reader reader("<r xmlns=\"urn:d\"/>");
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name));
    std::string uri;
    reader.get_namespace("x", &uri);
    EXPECT_EQ(uri, "urn:d");
}

TEST(ReaderNamespaces, ValidQualifiedNames) {
    text_reader reader("<r xmlns:p=\"urn:p\"/>");
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name));
    EXPECT_TRUE(reader.is_valid_qname("p:x"));
    EXPECT_TRUE(reader.is_valid_qname("p:x-y.z_1"));
    EXPECT_TRUE(reader.is_valid_qname("x"));
    EXPECT_TRUE(reader.is_valid_qname("_x"));
    EXPECT_TRUE(reader.is_valid_qname("xml:lang"));
    EXPECT_FALSE(reader.is_valid_qname("q:x"));  // undeclared prefix
    EXPECT_FALSE(reader.is_valid_qname("p:"));   // empty local part
    EXPECT_FALSE(reader.is_valid_qname(""));
    EXPECT_FALSE(reader.is_valid_qname("p:1x"));  // local part starts with a digit
    EXPECT_FALSE(reader.is_valid_qname("p:x:y")); // a second colon
    EXPECT_FALSE(reader.is_valid_qname("1x"));
    EXPECT_FALSE(reader.is_valid_qname("p:x y"));
}

TEST(ReaderNamespaces, NamespaceContextTakesInnerDeclarationsOverOuter) {
    text_reader reader("<r xmlns:a=\"urn:1\" xmlns:b=\"urn:2\"><c xmlns:a=\"urn:3\"/></r>");
    ASSERT_TRUE(read_start_tag(reader, lmx::xe_name, lmx::xe_start_tag_end));
    lmx::c_xml_reader_local scope(reader);
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name));
    EXPECT_EQ(reader.get_name(), "c");

    lmx::c_namespace_context context;
    reader.extract_namespace_context(&context);
    ASSERT_EQ(context.size(), 2u);
    EXPECT_EQ(context.get_ns_prefix(0), "a");
    EXPECT_EQ(context.get_ns_uri(0), "urn:3");
    EXPECT_EQ(context.get_ns_prefix(1), "b");
    EXPECT_EQ(context.get_ns_uri(1), "urn:2");
}

TEST(ReaderNamespaces, ReaderScopesFollowTheirLifetime) {
    text_reader reader("<r/>");
    lmx::c_xml_reader_local *root = reader.get_reader_local();
    ASSERT_NE(root, nullptr);
    {
        lmx::c_xml_reader_local outer(reader);
        EXPECT_EQ(reader.get_reader_local(), &outer);
        EXPECT_EQ(outer.get_parent(), root);
        {
            lmx::c_xml_reader_local inner(reader);
            EXPECT_EQ(reader.get_reader_local(), &inner);
            EXPECT_EQ(inner.get_parent(), &outer);
        }
        EXPECT_EQ(reader.get_reader_local(), &outer);
    }
    EXPECT_EQ(reader.get_reader_local(), root);
}

// ====================================================== namespace numbering

TEST(EnumeratedNamespaces, IdsStartAtOneThousand) {
    lmx::c_enumerated_namespaces namespaces;
    EXPECT_EQ(namespaces.add_namespace("urn:a"), 1000);
    EXPECT_EQ(namespaces.add_namespace("urn:a"), 1000);
    EXPECT_EQ(namespaces.add_namespace("urn:b"), 1001);
    EXPECT_EQ(namespaces.find_namespace("urn:a"), 1000);
    EXPECT_EQ(namespaces.find_namespace("urn:b"), 1001);
    EXPECT_EQ(namespaces.find_namespace("urn:unknown"), 0);
}

TEST(EnumeratedNamespaces, FixedEntriesAreDefined) {
    lmx::c_enumerated_namespaces namespaces;
    EXPECT_STREQ(lmx::k_xsi_namespace_uri, "http://www.w3.org/2001/XMLSchema-instance");
    EXPECT_STREQ(lmx::k_xml_namespace_uri, "http://www.w3.org/XML/1998/namespace");
    EXPECT_EQ(namespaces.find_namespace(lmx::k_xsi_namespace_uri), lmx::ns_xsi);
    EXPECT_EQ(namespaces.find_namespace(lmx::k_xml_namespace_uri), lmx::ns_xml);
    EXPECT_STREQ(namespaces.find_namespace_from_id(lmx::ns_xsi), lmx::k_xsi_namespace_uri);
    EXPECT_STREQ(namespaces.find_namespace_from_id(lmx::ns_xml), lmx::k_xml_namespace_uri);
    ASSERT_NE(namespaces.find_namespace_from_id(lmx::ns_none), nullptr);
    EXPECT_STREQ(namespaces.find_namespace_from_id(lmx::ns_none), "");
    EXPECT_EQ(namespaces.find_namespace_from_id(4242), nullptr);
}

TEST(EnumeratedNamespaces, AddWithIdRaisesTheNextId) {
    lmx::c_enumerated_namespaces namespaces;
    namespaces.add_namespace("urn:c", 2000);
    EXPECT_EQ(namespaces.find_namespace("urn:c"), 2000);
    EXPECT_STREQ(namespaces.find_namespace_from_id(2000), "urn:c");
    EXPECT_EQ(namespaces.add_namespace("urn:d"), 2001);
    // An id below the next one does not lower it.
    namespaces.add_namespace("urn:e", 1500);
    EXPECT_EQ(namespaces.find_namespace("urn:e"), 1500);
    EXPECT_EQ(namespaces.add_namespace("urn:f"), 2002);
}

TEST(EnumeratedNamespaces, AddWithIdKeepsAKnownUri) {
    lmx::c_enumerated_namespaces namespaces;
    EXPECT_EQ(namespaces.add_namespace("urn:a"), 1000);
    namespaces.add_namespace("urn:a", 1200);
    EXPECT_EQ(namespaces.find_namespace("urn:a"), 1000);
}

TEST(EnumeratedNamespaces, ClearGoesBackToTheFixedEntries) {
    lmx::c_enumerated_namespaces namespaces;
    namespaces.add_namespace("urn:a");
    namespaces.add_namespace("urn:b", 3000);
    namespaces.clear();
    EXPECT_EQ(namespaces.find_namespace("urn:a"), 0);
    EXPECT_EQ(namespaces.find_namespace("urn:b"), 0);
    EXPECT_EQ(namespaces.find_namespace(lmx::k_xsi_namespace_uri), lmx::ns_xsi);
    EXPECT_EQ(namespaces.add_namespace("urn:x"), 1000);
}

TEST(EnumeratedNamespaces, KnownNamespaceIdValues) {
    tessarine_test::expect_constants({
        TESSARINE_CONSTANT(lmx::ns_not_found, 0),
        TESSARINE_CONSTANT(lmx::ns_none, 1),
        TESSARINE_CONSTANT(lmx::ns_xml, 2),
        TESSARINE_CONSTANT(lmx::ns_xsi, 5),
        TESSARINE_CONSTANT(lmx::ea_attribute, 0),
        TESSARINE_CONSTANT(lmx::ea_element, 1),
    });
}

// =========================================================== namespace scopes

TEST(NamespaceScope, XmlPrefixIsAlwaysTwo) {
    lmx::c_xml_local scope;
    EXPECT_EQ(scope.find_namespace_id("xml"), lmx::ns_xml);
    lmx::c_xml_local declaring;
    declaring.add_namespace("p", 1000);
    lmx::c_xml_local inner(&declaring);
    EXPECT_EQ(inner.find_namespace_id("xml"), lmx::ns_xml);
}

TEST(NamespaceScope, UnknownEmptyPrefixIsNoNamespaceOtherIsNotFound) {
    lmx::c_xml_local scope;
    EXPECT_EQ(scope.find_namespace_id(""), lmx::ns_none);
    EXPECT_EQ(scope.find_namespace_id("p"), lmx::ns_not_found);
}

TEST(NamespaceScope, LookupWalksOutwardThroughDeclaringScopes) {
    lmx::c_xml_local outer;
    outer.add_namespace("p", 1000);
    outer.add_namespace("", 1001);
    lmx::c_xml_local middle(&outer); // declares nothing
    lmx::c_xml_local inner(&middle);
    inner.add_namespace("p", 1002);
    lmx::c_xml_local innermost(&inner);

    EXPECT_EQ(middle.find_namespace_id("p"), 1000);
    EXPECT_EQ(middle.find_namespace_id(""), 1001);
    EXPECT_EQ(inner.find_namespace_id("p"), 1002);
    EXPECT_EQ(inner.find_namespace_id(""), 1001);
    EXPECT_EQ(innermost.find_namespace_id("p"), 1002);
    EXPECT_EQ(innermost.find_namespace_id("q"), lmx::ns_not_found);
    EXPECT_EQ(outer.find_namespace_id("p"), 1000);
    EXPECT_EQ(innermost.get_parent(), &inner);
}

TEST(NamespaceScope, ClearForgetsTheScopesDeclarations) {
    lmx::c_xml_local outer;
    outer.add_namespace("p", 1000);
    lmx::c_xml_local inner(&outer);
    inner.add_namespace("p", 1001);
    EXPECT_EQ(inner.find_namespace_id("p"), 1001);
    inner.clear();
    EXPECT_EQ(inner.find_namespace_id("p"), 1000);
}

TEST(NamespaceScope, PrefixOfAnIdInnermostOrOutermost) {
    lmx::c_xml_local outer;
    outer.add_namespace("a", 1000);
    lmx::c_xml_local inner(&outer);
    inner.add_namespace("b", 1000);
    inner.add_namespace("c", 1001);

    EXPECT_STREQ(inner.find_namespace_prefix(1000), "b");
    EXPECT_STREQ(inner.find_first_namespace_prefix(1000), "a");
    EXPECT_STREQ(inner.find_namespace_prefix(1001), "c");
    EXPECT_STREQ(inner.find_first_namespace_prefix(1001), "c");
    EXPECT_STREQ(outer.find_namespace_prefix(1000), "a");
    EXPECT_STREQ(inner.find_namespace_prefix(lmx::ns_xml), "xml");
    EXPECT_STREQ(inner.find_first_namespace_prefix(lmx::ns_xml), "xml");
    EXPECT_EQ(inner.find_namespace_prefix(4242), nullptr);
    EXPECT_EQ(inner.find_first_namespace_prefix(4242), nullptr);
}

// ============================================================= cracked names

TEST(CrackedName, PrefixedNameIsSplitAndResolved) {
    lmx::c_xml_local scope;
    scope.add_namespace("p", 1000);
    lmx::c_cracked_name name;
    name.set(scope, "p:x");
    EXPECT_EQ(name.get_full_name(), "p:x");
    EXPECT_TRUE(name.has_prefix());
    EXPECT_EQ(name.get_ns_id(), 1000);
    EXPECT_EQ(name.get_element_ns_id(), 1000);
    EXPECT_EQ(name.get_local_name(), "x");
    EXPECT_EQ(name.get_prefix(), "p");
}

TEST(CrackedName, FirstColonSplits) {
    lmx::c_xml_local scope;
    lmx::c_cracked_name name;
    name.set(scope, "a:b:c");
    EXPECT_EQ(name.get_prefix(), "a");
    EXPECT_EQ(name.get_local_name(), "b:c");
    EXPECT_EQ(name.get_ns_id(), lmx::ns_not_found);
}

TEST(CrackedName, UnprefixedElementTakesTheDefaultNamespace) {
    lmx::c_xml_local scope;
    lmx::c_cracked_name name;
    name.set(scope, "x");
    EXPECT_FALSE(name.has_prefix());
    EXPECT_EQ(name.get_ns_id(), lmx::ns_none);
    EXPECT_EQ(name.get_prefix(), "");
    EXPECT_EQ(name.get_local_name(), "x");

    scope.add_namespace("", 1000);
    name.set(scope, "x");
    EXPECT_EQ(name.get_ns_id(), 1000);
    EXPECT_EQ(name.get_element_ns_id(), 1000);
}

TEST(CrackedName, UnprefixedAttributeIsInNoNamespace) {
    lmx::c_xml_local scope;
    scope.add_namespace("", 1000);
    scope.add_namespace("p", 1001);
    lmx::c_cracked_name name;
    name.set_for_attribute(scope, "x");
    EXPECT_EQ(name.get_ns_id(), lmx::ns_none);
    EXPECT_FALSE(name.has_prefix());
    name.set_for_attribute(scope, "p:x");
    EXPECT_EQ(name.get_ns_id(), 1001);
    EXPECT_TRUE(name.has_prefix());
}

TEST(CrackedName, UndeclaredPrefixIsNotFound) {
    lmx::c_xml_local scope;
    lmx::c_cracked_name name;
    name.set(scope, "q:x");
    EXPECT_EQ(name.get_ns_id(), lmx::ns_not_found);
    EXPECT_EQ(name.get_element_ns_id(), lmx::ns_not_found);
}

TEST(CrackedName, ElementIdOfUnprefixedNotFoundIsNoNamespace) {
    lmx::c_xml_local scope;
    lmx::c_cracked_name name;
    name.set(scope, "x");
    name.set_ns_id(lmx::ns_not_found);
    EXPECT_EQ(name.get_element_ns_id(), lmx::ns_none);
}

// ================================================================ tokenising

class Tokenise : public ::testing::Test {
protected:
    // Reads the start tag of a_text and tokenises its name with a_table.
    int element_token(const std::string &ar_text, const lmx::s_event_map *ap_table,
                      const lmx::s_ns_map *ap_ns = k_ns_u) {
        m_reader = std::make_unique<text_reader>(ar_text);
        m_reader->set_ns_map(ap_ns);
        elmx_error error = lmx::elmx_ok;
        std::string name;
        EXPECT_EQ(m_reader->get_element_event(&error, &name), lmx::xe_name);
        m_reader->tokenise(ap_table, lmx::ea_element);
        return m_reader->get_current_event();
    }
    std::unique_ptr<text_reader> m_reader;
};

TEST_F(Tokenise, FirstMatchingRowWins) {
    const lmx::s_event_map table[] = {{1, "x", 1, 20}, {1, "x", 1, 21}, {0, nullptr, 0, 0}};
    EXPECT_EQ(element_token("<x/>", table), 20);
}

TEST_F(Tokenise, NamespaceIdMustMatch) {
    EXPECT_EQ(element_token("<x/>", k_x_events), 21);
    EXPECT_EQ(element_token("<x xmlns=\"urn:u\"/>", k_x_events), 20);
    EXPECT_EQ(element_token("<q:x xmlns:q=\"urn:u\"/>", k_x_events), 20);
    EXPECT_EQ(element_token("<q:x xmlns:q=\"urn:not-in-table\"/>", k_x_events), lmx::xe_unknown);
}

TEST_F(Tokenise, LengthAndBytesMustMatch) {
    const lmx::s_event_map table[] = {
        {1, "xy", 2, 20},
        {1, "y", 1, 21},
        {1, "xz", 2, 22},
        {1, "xyz", 3, 23},
        {0, nullptr, 0, 0},
    };
    EXPECT_EQ(element_token("<x/>", table), lmx::xe_unknown);
    EXPECT_EQ(element_token("<xy/>", table), 20);
    EXPECT_EQ(element_token("<xz/>", table), 22);
    EXPECT_EQ(element_token("<xyz/>", table), 23);
    EXPECT_EQ(element_token("<xyzz/>", table), lmx::xe_unknown);
}

TEST_F(Tokenise, EmptyTableGivesUnknown) {
    const lmx::s_event_map table[] = {{0, nullptr, 0, 0}};
    EXPECT_EQ(element_token("<x/>", table), lmx::xe_unknown);
}

TEST_F(Tokenise, XsiNamesNeverConsultTheTable) {
    const lmx::s_event_map table[] = {
        {5, "type", 4, 40},
        {5, "nil", 3, 41},
        {5, "foo", 3, 42},
        {0, nullptr, 0, 0},
    };
    const std::string declare = std::string(" xmlns:xsi=\"") + k_xsi + "\"/>";
    EXPECT_EQ(element_token("<xsi:type" + declare, table), lmx::xe_xsi_type);
    EXPECT_EQ(element_token("<xsi:nil" + declare, table), lmx::xe_xsi_nil);
    EXPECT_EQ(element_token("<xsi:schemaLocation" + declare, table), lmx::xe_xsi_schema_location);
    EXPECT_EQ(element_token("<xsi:noNamespaceSchemaLocation" + declare, table),
              lmx::xe_xsi_no_namespace_schema_location);
    EXPECT_EQ(element_token("<xsi:foo" + declare, table), lmx::xe_unknown);
    EXPECT_EQ(element_token("<i:type xmlns:i=\"" + std::string(k_xsi) + "\"/>", table), lmx::xe_xsi_type);
}

TEST_F(Tokenise, OnlyNameEventsAreTokenised) {
    element_token("<x/>", k_x_events);
    lmx::c_xml_reader &reader = *m_reader;

    reader.restore_event(lmx::xe_text);
    reader.tokenise(k_x_events, lmx::ea_element);
    EXPECT_EQ(reader.get_current_event(), lmx::xe_text);

    reader.restore_event(lmx::xe_end_tag);
    reader.tokenise(k_x_events, lmx::ea_element);
    EXPECT_EQ(reader.get_current_event(), lmx::xe_end_tag);

    reader.restore_event(lmx::xe_unknown);
    reader.tokenise(k_x_events, lmx::ea_element);
    EXPECT_EQ(reader.get_current_event(), 21);

    reader.restore_event(99);
    reader.tokenise(k_x_events, lmx::ea_element);
    EXPECT_EQ(reader.get_current_event(), 21);
}

TEST_F(Tokenise, GivenNameIsTokenised) {
    const lmx::s_event_map table[] = {{1, "x", 1, 20}, {1, "y", 1, 22}, {0, nullptr, 0, 0}};
    EXPECT_EQ(element_token("<x/>", table), 20);
    m_reader->restore_event(lmx::xe_name);
    m_reader->tokenise(table, "y", lmx::ea_element);
    EXPECT_EQ(m_reader->get_current_event(), 22);
}

TEST_F(Tokenise, UnprefixedAttributeCountsAsNoNamespace) {
    const lmx::s_event_map table[] = {{1000, "x", 1, 20}, {1, "x", 1, 21}, {0, nullptr, 0, 0}};
    text_reader reader("<r xmlns=\"urn:u\" x=\"1\"/>");
    reader.set_ns_map(k_ns_u);
    elmx_error error = lmx::elmx_ok;
    std::string name;
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name, nullptr, &name));
    ASSERT_TRUE(reader.get_attribute_event(nullptr, &error, &name));
    EXPECT_EQ(reader.get_current_event(), lmx::xe_name); // no map, no token
    reader.tokenise(table, lmx::ea_attribute);
    EXPECT_EQ(reader.get_current_event(), 21);
}

TEST(Reader, TokenisableEvents) {
    text_reader reader("<x/>");
    struct case_t {
        int event;
        bool tokenisable;
    };
    for (case_t c : {case_t{lmx::xe_name, true}, case_t{lmx::xe_unknown, true}, case_t{lmx::xe_first_user_token, true},
                     case_t{250, true}, case_t{lmx::xe_end_of_input, false}, case_t{lmx::xe_error, false},
                     case_t{lmx::xe_fatal, false}, case_t{lmx::xe_start_tag_end, false}, case_t{lmx::xe_text, false},
                     case_t{lmx::xe_end_tag, false}, case_t{lmx::xe_xsi_type, false}, case_t{lmx::xe_xsi_nil, false},
                     case_t{lmx::xe_xsi_schema_location, false},
                     case_t{lmx::xe_xsi_no_namespace_schema_location, false}}) {
        reader.restore_event(c.event);
        EXPECT_EQ(reader.get_current_event(), c.event);
        EXPECT_EQ(reader.is_current_event_tokenisable(), c.tokenisable) << c.event;
    }
}

// ============================================================ element events

TEST(Reader, ElementEventWithoutMapGivesTheName) {
    text_reader reader("<x a=\"1\">t</x>");
    elmx_error error = lmx::elmx_bad_dtd;
    std::string name;
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_name);
    EXPECT_EQ(error, lmx::elmx_ok);
    EXPECT_EQ(name, "x");
    EXPECT_EQ(reader.get_current_event(), lmx::xe_name);
    ASSERT_EQ(finish_attributes(reader), lmx::xe_start_tag_end);
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_text);
    EXPECT_EQ(name, "t");
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_end_tag);
    EXPECT_EQ(name, "x");
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_end_of_input);
    EXPECT_EQ(error, lmx::elmx_unexpected_end_of_message);
}

TEST(Reader, ElementEventVariantsUseTheNameBuffer) {
    {
        text_reader reader("<x/>");
        elmx_error error = lmx::elmx_ok;
        EXPECT_EQ(reader.get_element_event(&error), lmx::xe_name);
        EXPECT_EQ(reader.get_name(), "x");
    }
    {
        text_reader reader("<x/>");
        elmx_error error = lmx::elmx_ok;
        EXPECT_EQ(reader.get_element_event(k_x_events, &error), 21);
        EXPECT_EQ(reader.get_name(), "x");
    }
    {
        text_reader reader("<x/>");
        std::string name;
        EXPECT_EQ(reader.get_element_event(k_x_events, &name), 21);
        EXPECT_EQ(name, "x");
    }
    {
        text_reader reader("<x/>");
        elmx_error error = lmx::elmx_ok;
        std::string name;
        EXPECT_EQ(reader.get_known_element_event(k_x_events, &error, &name), 21);
        EXPECT_EQ(name, "x");
        EXPECT_EQ(reader.get_current_event(), 21);
    }
}

TEST(Reader, ElementEventReportsScannerErrors) {
    {
        // A failure that records nothing comes with code ok.
        text_reader reader("<a><!X></a>");
        elmx_error error = lmx::elmx_ok;
        std::string name;
        ASSERT_TRUE(read_start_tag(reader, lmx::xe_name, lmx::xe_start_tag_end, nullptr, &name));
        EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_fatal);
        EXPECT_EQ(error, lmx::elmx_ok);
    }
    {
        text_reader reader("<a></a");
        elmx_error error = lmx::elmx_ok;
        std::string name;
        ASSERT_TRUE(read_start_tag(reader, lmx::xe_name, lmx::xe_start_tag_end, nullptr, &name));
        EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_fatal);
        EXPECT_EQ(error, lmx::elmx_not_well_formed);
        EXPECT_EQ(reader.get_error(), lmx::elmx_not_well_formed);
    }
}

TEST(Reader, ElementEventWithMapIgnoresKnownElementsTable) {
    const lmx::s_known_elements known[] = {{1, "other", 5}, {0, nullptr, 0}};
    text_reader reader("<x/>");
    reader.set_known_elements(known);
    elmx_error error = lmx::elmx_ok;
    std::string name;
    EXPECT_EQ(reader.get_element_event(k_x_events, &error, &name), 21);
    EXPECT_EQ(name, "x");
    EXPECT_EQ(reader.get_known_elements(), known);
}

TEST(Reader, KnownElementsTableSkipsUnknownElementsSilently) {
    const lmx::s_known_elements known[] = {{1, "r", 1}, {1, "b", 1}, {0, nullptr, 0}};
    text_reader reader("<r><a x=\"1\"><deep><deeper/></deep>t</a><p:b xmlns:p=\"urn:p\"/><b/></r>");
    reader.set_known_elements(known);
    elmx_error error = lmx::elmx_ok;
    std::string name;
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name, nullptr, &name));
    EXPECT_EQ(name, "r");
    ASSERT_EQ(finish_attributes(reader), lmx::xe_start_tag_end);
    lmx::c_xml_reader_local scope(reader);
    ASSERT_EQ(reader.get_element_event(&error, &name), lmx::xe_name);
    EXPECT_EQ(error, lmx::elmx_ok);
    EXPECT_EQ(name, "b");
    EXPECT_EQ(reader.get_element_ns_id(), lmx::ns_none);
    ASSERT_EQ(finish_attributes(reader), lmx::xe_end_tag);
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_end_tag);
    EXPECT_EQ(name, "r");
}

TEST(Reader, KnownElementsTableFailedSkipIsBadlyFormed) {
    const lmx::s_known_elements known[] = {{1, "r", 1}, {0, nullptr, 0}};
    text_reader reader("<r><a><b></c></a></r>");
    reader.set_known_elements(known);
    elmx_error error = lmx::elmx_ok;
    std::string name;
    ASSERT_TRUE(read_start_tag(reader, lmx::xe_name, lmx::xe_start_tag_end, nullptr, &name));
    lmx::c_xml_reader_local scope(reader);
    reader.get_element_event(&error, &name);
    EXPECT_EQ(error, lmx::elmx_xml_badly_formed);
}

TEST(Reader, KnownElementsSelectorRestoresTheTable) {
    const lmx::s_known_elements first[] = {{1, "a", 1}, {0, nullptr, 0}};
    const lmx::s_known_elements second[] = {{1, "b", 1}, {0, nullptr, 0}};
    text_reader reader("<a/>");
    EXPECT_EQ(reader.get_known_elements(), nullptr);
    {
        lmx::c_known_elements_selector outer(reader, first);
        EXPECT_EQ(reader.get_known_elements(), first);
        {
            lmx::c_known_elements_selector inner(reader, second);
            EXPECT_EQ(reader.get_known_elements(), second);
        }
        EXPECT_EQ(reader.get_known_elements(), first);
    }
    EXPECT_EQ(reader.get_known_elements(), nullptr);
}

// ========================================================== attribute events

TEST(Reader, AttributeEventWithoutMapCracksTheName) {
    text_reader reader("<a p:x=\"1\" y=\"2\" xmlns:p=\"urn:p\"/>");
    elmx_error error = lmx::elmx_ok;
    std::string name, value;
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name, nullptr, &name));
    int p = reader.find_enumerated_namespace("urn:p");

    ASSERT_TRUE(reader.get_attribute_event(nullptr, &error, &name));
    EXPECT_EQ(error, lmx::elmx_ok);
    EXPECT_EQ(name, "p:x");
    EXPECT_EQ(reader.get_current_event(), lmx::xe_name);
    EXPECT_EQ(reader.get_cracked_name().get_ns_id(), p);
    EXPECT_EQ(reader.get_local_name(), "x");
    ASSERT_TRUE(reader.get_attribute_value(&value, lmx::ws_preserve));
    EXPECT_EQ(value, "1");

    ASSERT_TRUE(reader.get_attribute_event(nullptr, &error, &name));
    EXPECT_EQ(name, "y");
    EXPECT_EQ(reader.get_cracked_name().get_ns_id(), lmx::ns_none);
    value.clear();
    ASSERT_TRUE(reader.get_attribute_value(&value, lmx::ws_preserve));
    EXPECT_EQ(value, "2");

    EXPECT_FALSE(reader.get_attribute_event(nullptr, &error, &name));
    EXPECT_EQ(reader.get_current_event(), lmx::xe_end_tag);
}

TEST(Reader, AttributeEventWithMapTokenises) {
    const lmx::s_event_map attributes[] = {{1, "b", 1, 30}, {0, nullptr, 0, 0}};
    text_reader reader("<a b=\"1\" c=\"2\">");
    elmx_error error = lmx::elmx_ok;
    std::string name;
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name, nullptr, &name));
    ASSERT_TRUE(reader.get_attribute_event(attributes, &error, &name));
    EXPECT_EQ(reader.get_current_event(), 30);
    reader.skip_attribute_value();
    ASSERT_TRUE(reader.get_attribute_event(attributes, &error, &name));
    EXPECT_EQ(reader.get_current_event(), lmx::xe_unknown);
    reader.skip_attribute_value();
    EXPECT_FALSE(reader.get_attribute_event(attributes, &error, &name));
    EXPECT_EQ(reader.get_current_event(), lmx::xe_start_tag_end);
}

TEST(Reader, AttributeErrorEventsGiveTrueWithTheCode) {
    text_reader reader("<a x=\"1\" =>");
    elmx_error error = lmx::elmx_ok;
    std::string name;
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name, nullptr, &name));
    ASSERT_TRUE(reader.get_attribute_event(nullptr, &error, &name));
    reader.skip_attribute_value();
    EXPECT_TRUE(reader.get_attribute_event(nullptr, &error, &name));
    EXPECT_EQ(reader.get_current_event(), lmx::xe_fatal);
    EXPECT_EQ(error, lmx::elmx_not_well_formed);
}

// ==================================================================== end tag

const lmx::s_event_map k_a_events[] = {{1, "a", 1, 20}, {0, nullptr, 0, 0}};

TEST(Reader, EndTagIsCheckedAgainstTheElementsName) {
    struct row {
        const char *name;
        const char *document;
        bool accepted;
        std::optional<int> event; // what get_end_tag leaves in its event
        elmx_error error;
        std::optional<elmx_error> captured; // what the reader's debug record holds
    };
    const row rows[] = {
        {"the right name is accepted", "<a></a>", true, lmx::xe_end_tag, lmx::elmx_ok, std::nullopt},
        {"end of input is an unexpected end", "<a>", false, lmx::xe_end_of_input, lmx::elmx_unexpected_end_of_message,
         std::nullopt},
        {"another name is a bad end of element", "<a></b>", false, std::nullopt, lmx::elmx_bad_end_of_element,
         lmx::elmx_bad_end_of_element},
        {"a child is a bad end of element", "<a><c/></a>", false, std::nullopt, lmx::elmx_bad_end_of_element,
         lmx::elmx_bad_end_of_element},
        {"text is a bad end of element", "<a>text</a>", false, std::nullopt, lmx::elmx_bad_end_of_element,
         lmx::elmx_bad_end_of_element},
    };
    for (const row &r : rows) {
        SCOPED_TRACE(r.name);
        text_reader reader(r.document);
        std::string name;
        ASSERT_TRUE(read_start_tag(reader, 20, lmx::xe_start_tag_end, k_a_events, &name));
        int event = -1;
        elmx_error error = lmx::elmx_bad_dtd;
        EXPECT_EQ(reader.get_end_tag(k_a_events, "a", &event, &error), r.accepted);
        if (r.event) {
            EXPECT_EQ(event, *r.event);
        }
        EXPECT_EQ(error, r.error);
        if (r.captured) {
            EXPECT_EQ(reader.get_debug_error().error, *r.captured);
        }
    }
}

TEST(Reader, UnterminatedCdataIsReportedWhenTheEndTagIsSought) {
    text_reader reader("<a><![CDATA[abc");
    elmx_error error = lmx::elmx_ok;
    std::string name;
    ASSERT_TRUE(read_start_tag(reader, 20, lmx::xe_start_tag_end, k_a_events, &name));
    EXPECT_EQ(reader.get_element_event(k_a_events, &error, &name), lmx::xe_text);
    EXPECT_EQ(name, "abc");
    EXPECT_EQ(error, lmx::elmx_ok);
    EXPECT_EQ(reader.get_error(), lmx::elmx_ok);
    int event = -1;
    EXPECT_FALSE(reader.get_end_tag(k_a_events, "a", &event, &error));
    EXPECT_EQ(event, lmx::xe_end_of_input);
    EXPECT_EQ(error, lmx::elmx_unexpected_end_of_message);
}

TEST(Reader, SwallowedBadEndTagCountsAsAccepted) {
    short_hook_reader reader("<a></b>");
    reader.swallow_all = true;
    elmx_error error = lmx::elmx_ok;
    std::string name;
    ASSERT_TRUE(read_start_tag(reader, 20, lmx::xe_start_tag_end, k_a_events, &name));
    int event = -1;
    EXPECT_TRUE(reader.get_end_tag(k_a_events, "a", &event, &error));
    EXPECT_EQ(error, lmx::elmx_ok);
    EXPECT_EQ(reader.seen, (std::vector<elmx_error>{lmx::elmx_bad_end_of_element}));
    // The capture happened before the hook swallowed it.
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_bad_end_of_element);
}

// ====================================================================== values

TEST(Reader, ElementValueOfEmptyElementIsEmpty) {
    text_reader reader("<a/>");
    ASSERT_TRUE(read_start_tag(reader, lmx::xe_name, lmx::xe_end_tag));
    std::string value = "old";
    EXPECT_TRUE(reader.get_element_value(&value, lmx::ws_preserve));
    EXPECT_EQ(value, "");
    EXPECT_TRUE(reader.is_element_end_tag());
}

TEST(Reader, ElementValueExpandsEntitiesAndLeavesTextEvent) {
    text_reader reader("<a>t&lt;u  v</a>");
    elmx_error error = lmx::elmx_ok;
    ASSERT_TRUE(read_start_tag(reader, lmx::xe_name, lmx::xe_start_tag_end));
    std::string value;
    EXPECT_TRUE(reader.get_element_value(&value, lmx::ws_collapse));
    EXPECT_EQ(value, "t<u v");
    EXPECT_EQ(reader.get_current_event(), lmx::xe_text);
    EXPECT_TRUE(reader.is_element_end_tag());
    EXPECT_EQ(reader.get_element_event(&error), lmx::xe_end_of_input);
}

TEST(Reader, IsElementEndTagChecksAgainstTheCurrentName) {
    text_reader reader("<a>x</b>");
    ASSERT_TRUE(read_start_tag(reader, lmx::xe_name, lmx::xe_start_tag_end));
    std::string value;
    ASSERT_TRUE(reader.get_element_value(&value, lmx::ws_preserve));
    EXPECT_FALSE(reader.is_element_end_tag());
}

TEST(Reader, NestedElementValueGivesTheEndTagName) {
    text_reader reader("<a>x<b c='1'>y</b></a>");
    ASSERT_TRUE(read_start_tag(reader, lmx::xe_name, lmx::xe_start_tag_end));
    std::string value, end_name;
    EXPECT_TRUE(reader.get_nested_element_value(&value, &end_name, lmx::ws_preserve, false));
    EXPECT_EQ(value, "x<b c='1'>y</b>");
    EXPECT_EQ(end_name, "a");
    EXPECT_EQ(reader.get_current_event(), lmx::xe_end_tag);
}

// A root element read as one value, simple or ur-type, and what the call
// gives. What is left empty is not checked.
struct whole_value_row {
    const char *name;
    const char *document;
    const char *value_before; // the outputs before the call
    bool is_empty_before;
    bool read;
    std::optional<std::string> value;
    std::optional<bool> is_empty;
    std::optional<elmx_error> error;
    const char *next_element;                    // the name of the element after the root
    lmx::elmx_whitespace mode = lmx::ws_preserve; // for simple type values
};

// Reads the root's start tag, then the whole element with a_read_value.
template <typename F> void expect_whole_value(const whole_value_row &ar_row, F a_read_value) {
    SCOPED_TRACE(ar_row.name);
    text_reader reader(ar_row.document);
    elmx_error error = lmx::elmx_ok;
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name));
    std::string value = ar_row.value_before;
    bool is_empty = ar_row.is_empty_before;
    EXPECT_EQ(a_read_value(reader, &value, &error, &is_empty), ar_row.read);
    if (ar_row.value) {
        EXPECT_EQ(value, *ar_row.value);
    }
    if (ar_row.is_empty) {
        EXPECT_EQ(is_empty, *ar_row.is_empty);
    }
    if (ar_row.error) {
        EXPECT_EQ(error, *ar_row.error);
    }
    if (ar_row.next_element) {
        EXPECT_EQ(reader.get_element_event(&error), lmx::xe_name);
        EXPECT_EQ(reader.get_name(), ar_row.next_element);
    }
}

TEST(Reader, SimpleTypeValueReadsTheWholeElement) {
    const whole_value_row rows[] = {
        {"white space collapsed", "<a x=\"1\"> v  w </a><z/>", "", true, true, "v w", false, lmx::elmx_ok, "z",
         lmx::ws_collapse},
        {"empty element", "<a x=\"1\"/>", "old", false, true, "", true, lmx::elmx_ok, nullptr},
        {"wrong end tag", "<a>v</b>", "", false, false, std::nullopt, std::nullopt, lmx::elmx_bad_end_of_element,
         nullptr},
        {"end of input", "<a>v", "", false, false, std::nullopt, std::nullopt, lmx::elmx_unable_to_read_element,
         nullptr},
        {"junk after slash", "<a / x>v</a>", "", false, false, std::nullopt, std::nullopt,
         lmx::elmx_bad_start_tag_end, nullptr},
    };
    for (const whole_value_row &row : rows) {
        expect_whole_value(row, [&row](lmx::c_xml_reader &ar_reader, std::string *ap_value, elmx_error *ap_error,
                                       bool *ap_is_empty) {
            return ar_reader.get_simple_type_value("a", row.mode, ap_value, ap_error, ap_is_empty);
        });
    }
}

TEST(Reader, UrValueKeepsTheContentAsText) {
    const whole_value_row rows[] = {
        {"content with markup", "<a>x&amp;<b c='1'>y</b></a>", "", true, true, "x&amp;<b c='1'>y</b>", false,
         lmx::elmx_ok, nullptr},
        {"empty element", "<a/>", "old", false, true, "", true, std::nullopt, nullptr},
        {"wrong end tag is a bad end of element", "<a>x</z>", "", false, false, std::nullopt, std::nullopt,
         lmx::elmx_bad_end_of_element, nullptr},
    };
    for (const whole_value_row &row : rows) {
        expect_whole_value(row, [](lmx::c_xml_reader &ar_reader, std::string *ap_value, elmx_error *ap_error,
                                   bool *ap_is_empty) {
            return ar_reader.get_element_ur_value("a", ap_value, ap_error, ap_is_empty);
        });
    }
}

// =========================================================== skipping elements

const lmx::s_event_map k_ignore_events[] = {
    {1, "r", 1, 20},
    {1, "a", 1, 21},
    {1, "c", 1, 22},
    {0, nullptr, 0, 0},
};

// A child of <r> that ignore_element passes over, and what it leaves behind.
// What is left empty is not checked.
struct ignore_row {
    const char *name;
    std::string document;
    int child;                  // the child's event with k_ignore_events
    std::optional<int> tag_end; // how the child's start tag ends, when its attributes are read first
    elmx_error result;
    std::optional<int> event_after; // the current event afterwards
    const char *name_after;         // the reader's name afterwards
    std::optional<elmx_error> reader_error;
    bool fatal; // the reader's record must be fatally errored
};

void expect_ignored(const ignore_row &ar_row) {
    SCOPED_TRACE(ar_row.name);
    text_reader reader(ar_row.document);
    ASSERT_TRUE(read_start_tag(reader, 20, lmx::xe_start_tag_end, k_ignore_events));
    lmx::c_xml_reader_local scope(reader);
    if (ar_row.tag_end) {
        ASSERT_TRUE(read_start_tag(reader, ar_row.child, *ar_row.tag_end, k_ignore_events));
    } else {
        ASSERT_TRUE(next_event_is(reader, ar_row.child, k_ignore_events));
    }
    EXPECT_EQ(reader.ignore_element(k_ignore_events), ar_row.result);
    if (ar_row.event_after) {
        EXPECT_EQ(reader.get_current_event(), *ar_row.event_after);
    }
    if (ar_row.name_after) {
        EXPECT_EQ(reader.get_name(), ar_row.name_after);
    }
    if (ar_row.reader_error) {
        EXPECT_EQ(reader.get_error(), *ar_row.reader_error);
    }
    if (ar_row.fatal) {
        EXPECT_TRUE(reader.get_error_record().is_fatal_errored());
    }
}

TEST(Reader, IgnoreElementPassesOverTheElement) {
    const ignore_row rows[] = {
        {"from its name", "<r><a x=\"1\"><b/>t</a><c/></r>", 21, std::nullopt, lmx::elmx_ok, 22, nullptr,
         std::nullopt, false},
        {"after its attributes", "<r><a x=\"1\"><b/>t</a><c/></r>", 21, lmx::xe_start_tag_end, lmx::elmx_ok, 22,
         nullptr, std::nullopt, false},
        {"empty element", "<r><a x=\"1\"/><c/></r>", 21, lmx::xe_end_tag, lmx::elmx_ok, 22, nullptr, std::nullopt,
         false},
        {"element that cannot be skipped is badly formed", "<r><a><b></c></a><c/></r>", 21, std::nullopt,
         lmx::elmx_xml_badly_formed, std::nullopt, nullptr, std::nullopt, false},
        {"stops at the nesting limit", "<r>" + nested_elements(1001) + "</r>", lmx::xe_unknown, std::nullopt,
         lmx::elmx_xml_badly_formed, std::nullopt, nullptr, lmx::elmx_not_well_formed, true},
        {"passes deep legal nesting", "<r>" + nested_elements(999) + "</r>", lmx::xe_unknown, std::nullopt,
         lmx::elmx_ok, lmx::xe_end_tag, "r", std::nullopt, false},
    };
    for (const ignore_row &row : rows)
        expect_ignored(row);
}

TEST(Reader, HundredThousandNestedLevelsDoNotCrashTheReader) {
    expect_ignored({"ignore_element", "<r>" + nested_elements(100000) + "</r>", lmx::xe_unknown, std::nullopt,
                    lmx::elmx_xml_badly_formed, std::nullopt, nullptr, lmx::elmx_not_well_formed, false});

    text_reader any("<r>" + nested_elements(100000) + "</r>");
    ASSERT_TRUE(next_event_is(any, lmx::xe_name));
    std::string value;
    EXPECT_FALSE(any.get_any_element("r", &value, lmx::ws_preserve, false));
    EXPECT_EQ(any.get_error(), lmx::elmx_not_well_formed);
}

TEST(Reader, SkipStartTagSetsTheCurrentEvent) {
    struct row {
        const char *document;
        bool skipped;
        bool is_end;
        int event;
        std::optional<elmx_error> error;
    };
    const row rows[] = {
        {"<a x=\"1\">t</a>", true, false, lmx::xe_start_tag_end, std::nullopt},
        {"<a x=\"1\"/>", true, true, lmx::xe_end_tag, std::nullopt},
        // A failure still leaves the event the tag's end implies.
        {"<a / x>", false, true, lmx::xe_end_tag, lmx::elmx_end_tag_syntax},
    };
    for (const row &r : rows) {
        SCOPED_TRACE(r.document);
        text_reader reader(r.document);
        ASSERT_TRUE(next_event_is(reader, lmx::xe_name));
        bool is_end = !r.is_end;
        EXPECT_EQ(reader.skip_start_tag(&is_end), r.skipped);
        EXPECT_EQ(is_end, r.is_end);
        EXPECT_EQ(reader.get_current_event(), r.event);
        if (r.error) {
            EXPECT_EQ(reader.get_error(), *r.error);
        }
    }
}

TEST(Reader, RestoreEventPutsAnEventBack) {
    text_reader reader("<a/>");
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name));
    reader.restore_event(lmx::xe_start_tag_end);
    EXPECT_EQ(reader.get_current_event(), lmx::xe_start_tag_end);
    reader.restore_event(77);
    EXPECT_EQ(reader.get_current_event(), 77);
}

TEST(Reader, AnyElementCaptureThroughTheReader) {
    text_reader reader("<r xmlns:p=\"urn:p\"><p:x a=\"1\"><p:y/>t</p:x></r>");
    ASSERT_TRUE(read_start_tag(reader, lmx::xe_name, lmx::xe_start_tag_end));
    lmx::c_xml_reader_local scope(reader);
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name));
    const std::string name = reader.get_name();
    std::string value;
    ASSERT_TRUE(reader.get_any_element(name, &value, lmx::ws_preserve, false));
    EXPECT_EQ(value, "<p:x a=\"1\"><p:y/>t</p:x>");
    std::string uri;
    reader.get_namespace("p:x", &uri);
    EXPECT_EQ(uri, "urn:p");
    lmx::c_namespace_context context;
    reader.extract_namespace_context(&context);
    ASSERT_EQ(context.size(), 1u);
    EXPECT_EQ(context.get_ns_prefix(0), "p");
    EXPECT_EQ(context.get_ns_uri(0), "urn:p");
}

// ============================================================= small types

TEST(StringStack, PushAndPop) {
    lmx::c_string_stack stack;
    EXPECT_TRUE(stack.empty());
    stack.push("ab");
    stack.push("");
    stack.push("cde");
    ASSERT_EQ(stack.size(), 3u);
    EXPECT_STREQ(stack.get(0), "ab");
    EXPECT_EQ(stack.get_length(0), 2u);
    EXPECT_STREQ(stack.get(1), "");
    EXPECT_EQ(stack.get_length(1), 0u);
    EXPECT_STREQ(stack.get(2), "cde");
    EXPECT_EQ(stack.get_length(2), 3u);
    stack.pop();
    ASSERT_EQ(stack.size(), 2u);
    EXPECT_STREQ(stack.get(0), "ab");
    stack.pop();
    stack.pop();
    EXPECT_TRUE(stack.empty());
    stack.pop(); // popping an empty stack does nothing
    EXPECT_TRUE(stack.empty());
}

TEST(StringStack, NodePushesForItsLifetime) {
    lmx::c_string_stack stack;
    {
        lmx::c_string_stack_node outer(stack, "outer");
        EXPECT_EQ(stack.size(), 1u);
        EXPECT_STREQ(outer.get_str(), "outer");
        {
            lmx::c_string_stack_node inner(stack, "in");
            EXPECT_EQ(stack.size(), 2u);
            EXPECT_STREQ(inner.get_str(), "in");
            EXPECT_TRUE(inner == "in");
            EXPECT_FALSE(inner == "inn");
            EXPECT_FALSE(inner == "i");
            EXPECT_TRUE(inner != "out");
            EXPECT_STREQ(outer.get_str(), "outer");
        }
        EXPECT_EQ(stack.size(), 1u);
        EXPECT_TRUE(outer == "outer");
        EXPECT_TRUE(outer != "outer2");
        EXPECT_TRUE(outer != "");
    }
    EXPECT_TRUE(stack.empty());
}

TEST(StringStack, ReaderHasOne) {
    text_reader reader("<a/>");
    lmx::c_string_stack &stack = reader.get_element_name_stack();
    EXPECT_TRUE(stack.empty());
    {
        lmx::c_string_stack_node node(stack, "a");
        EXPECT_EQ(reader.get_element_name_stack().size(), 1u);
    }
    EXPECT_TRUE(reader.get_element_name_stack().empty());
}

TEST(Repository, SetReplacesAndKeepsOrder) {
    lmx::c_repository<int> repository;
    EXPECT_TRUE(repository.empty());
    repository.set("a", 1);
    repository.set("b", 2);
    repository.set("a", 3);
    int value = 0;
    EXPECT_TRUE(repository.get("a", &value));
    EXPECT_EQ(value, 3);
    EXPECT_TRUE(repository.get(std::string("b"), &value));
    EXPECT_EQ(value, 2);
    EXPECT_FALSE(repository.get("c", &value));
    EXPECT_TRUE(repository.is_defined("a"));
    EXPECT_FALSE(repository.is_defined("c"));

    std::vector<std::pair<std::string, int>> entries;
    for (auto it = repository.begin(); it != repository.end(); ++it)
        entries.emplace_back(lmx::c_repository<int>::get_key(it), lmx::c_repository<int>::get_value(it));
    EXPECT_EQ(entries, (std::vector<std::pair<std::string, int>>{{"a", 3}, {"b", 2}}));
}

TEST(Repository, ReverseLookupFindsTheFirstKey) {
    lmx::c_repository<int> repository;
    repository.set("x", 7);
    repository.set("y", 8);
    repository.set("z", 7);
    EXPECT_STREQ(repository.reverse_lookup(7), "x");
    EXPECT_STREQ(repository.reverse_lookup(8), "y");
    EXPECT_EQ(repository.reverse_lookup(9), nullptr);
}

TEST(Repository, ClearEmptiesIt) {
    lmx::c_repository<int> repository;
    repository.set("x", 1);
    repository.clear();
    EXPECT_TRUE(repository.empty());
    EXPECT_FALSE(repository.is_defined("x"));
    repository.set("x", 2);
    int value = 0;
    EXPECT_TRUE(repository.get("x", &value));
    EXPECT_EQ(value, 2);
}

TEST(Repository, TextValuesAreCopied) {
    lmx::c_repository<const char *> repository;
    char key[] = "name";
    char text[] = "first";
    repository.set(key, text);
    std::strcpy(text, "xxxxx");
    std::strcpy(key, "zzzz");
    const char *value = nullptr;
    ASSERT_TRUE(repository.get("name", &value));
    EXPECT_STREQ(value, "first");
    EXPECT_NE(value, text);

    repository.set("name", "second");
    ASSERT_TRUE(repository.get("name", &value));
    EXPECT_STREQ(value, "second");
    // Text values compare by content.
    char probe[] = "second";
    EXPECT_STREQ(repository.reverse_lookup(probe), "name");
}

TEST(NamespaceContext, AddReplacesTheUriOfAKnownPrefix) {
    lmx::c_namespace_context context;
    EXPECT_EQ(context.size(), 0u);
    context.add("a", "urn:1");
    context.add("b", "urn:2");
    context.add("a", "urn:3");
    ASSERT_EQ(context.size(), 2u);
    EXPECT_EQ(context.get_ns_prefix(0), "a");
    EXPECT_EQ(context.get_ns_uri(0), "urn:3");
    EXPECT_EQ(context.get_ns_prefix(1), "b");
    EXPECT_EQ(context.get_ns_uri(1), "urn:2");
}

TEST(NamespaceContext, CopyAssignAndSwap) {
    lmx::c_namespace_context first;
    first.add("a", "urn:1");
    lmx::c_namespace_context second;
    second.add("b", "urn:2");
    second.add("c", "urn:3");

    lmx::c_namespace_context copy;
    copy = first;
    EXPECT_TRUE(copy == first);
    EXPECT_FALSE(copy == second);

    first.swap(second);
    ASSERT_EQ(first.size(), 2u);
    EXPECT_EQ(first.get_ns_prefix(0), "b");
    ASSERT_EQ(second.size(), 1u);
    EXPECT_EQ(second.get_ns_uri(0), "urn:1");
    EXPECT_TRUE(copy == second);
}

TEST(AnyInfo, AccessorsAndSetters) {
    lmx::c_any_info info("urn:x", "p:e", "<p:e/>");
    EXPECT_EQ(info.get_namespace(), "urn:x");
    EXPECT_EQ(info.get_name(), "p:e");
    EXPECT_EQ(info.get_value(), "<p:e/>");
    EXPECT_EQ(info.get_namespace_context().size(), 0u);

    lmx::c_namespace_context context;
    context.add("p", "urn:x");
    lmx::c_any_info other;
    EXPECT_EQ(other.get_name(), "");
    other.set_namespace("urn:x");
    other.set_name("p:e");
    other.set_value("<p:e/>");
    EXPECT_TRUE(other == info);
    other.set_namespace_context(context);
    EXPECT_FALSE(other == info);
    ASSERT_EQ(other.get_namespace_context().size(), 1u);
    EXPECT_EQ(other.get_namespace_context().get_ns_uri(0), "urn:x");
    info.set_namespace_context(context);
    EXPECT_TRUE(other == info);
    other.set_value("<p:e>x</p:e>");
    EXPECT_FALSE(other == info);
}

// ========================================================== errors in the reader

TEST(ReaderErrorCapture, HandleErrorFormsAndItemNames) {
    long_hook_reader reader("<a/>");
    ASSERT_TRUE(at_root_with_code_location(reader, "gen.cpp", 42));
    EXPECT_STREQ(reader.get_code_location().p_prog_file, "gen.cpp");
    EXPECT_EQ(reader.get_code_location().prog_line, 42);

    EXPECT_EQ(reader.handle_error(lmx::elmx_value_not_enumerated), lmx::elmx_value_not_enumerated);
    expect_debug_error(reader.get_debug_error(), lmx::elmx_value_not_enumerated, "a", "gen.cpp", 42, 1);
    EXPECT_EQ(reader.get_error_message(), "Error: Value does not match enumerations\n"
                                          "Item: a\n"
                                          "Program file: gen.cpp\n"
                                          "Program line: 42\n"
                                          "XML line: 1\n");

    EXPECT_EQ(reader.handle_error(lmx::elmx_length_too_long, 77), lmx::elmx_length_too_long);
    expect_code_location(reader.get_debug_error(), "a", "gen.cpp", 77);

    EXPECT_EQ(reader.handle_error(lmx::elmx_value_above_maximum, "item", "f.cpp", 9),
              lmx::elmx_value_above_maximum);
    expect_code_location(reader.get_debug_error(), "item", "f.cpp", 9);

    EXPECT_EQ(reader.handle_attribute_error(lmx::elmx_unable_to_read_attribute),
              lmx::elmx_unable_to_read_attribute);
    EXPECT_EQ(reader.get_debug_error().item_name, "@a");
    EXPECT_EQ(reader.get_debug_error().prog_line, 42);

    ASSERT_EQ(reader.calls.size(), 4u);
    EXPECT_EQ(reader.calls[0].code, lmx::elmx_value_not_enumerated);
    EXPECT_EQ(reader.calls[0].item, "a");
    EXPECT_EQ(reader.calls[0].file, "gen.cpp");
    EXPECT_EQ(reader.calls[0].line, 42);
    EXPECT_EQ(reader.calls[2].item, "item");
    EXPECT_EQ(reader.calls[2].file, "f.cpp");
    EXPECT_EQ(reader.calls[2].line, 9);
    EXPECT_EQ(reader.calls[3].item, "@a");
}

TEST(ReaderErrorCapture, CaptureDoesNotCallTheHook) {
    long_hook_reader reader("<a/>");
    EXPECT_EQ(reader.capture_error(lmx::elmx_bad_choice, "it", "c.cpp", 5), lmx::elmx_bad_choice);
    EXPECT_TRUE(reader.calls.empty());
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_bad_choice);
    expect_code_location(reader.get_debug_error(), "it", "c.cpp", 5);
}

TEST(ReaderErrorCapture, ShortHookFormIsReachedThroughTheLongOne) {
    short_hook_reader reader("<a/>");
    reader.swallow_all = true;
    EXPECT_EQ(reader.handle_error(lmx::elmx_bad_choice, "x", "f.cpp", 1), lmx::elmx_ok);
    EXPECT_EQ(reader.handle_error(lmx::elmx_length_too_short), lmx::elmx_ok);
    EXPECT_EQ(reader.handle_attribute_error(lmx::elmx_unexpected_attribute), lmx::elmx_ok);
    EXPECT_EQ(reader.seen, (std::vector<elmx_error>{lmx::elmx_bad_choice, lmx::elmx_length_too_short,
                                                    lmx::elmx_unexpected_attribute}));
    // The record keeps the last capture even though the error was swallowed.
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_unexpected_attribute);
}

TEST(ReaderErrorCapture, DefaultCodeLocationIsUnspecified) {
    text_reader reader("<a/>");
    EXPECT_STREQ(reader.get_code_location().p_prog_file, "<unspecified>");
    EXPECT_EQ(reader.get_code_location().prog_line, -1);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_ok);
    EXPECT_EQ(reader.get_error_message(), "Error: No Error\n");
    std::string message;
    reader.get_error_message(&message);
    EXPECT_EQ(message, "Error: No Error\n");
    EXPECT_FALSE(reader.is_auto_versioning());
    reader.set_auto_versioning(true);
    EXPECT_TRUE(reader.is_auto_versioning());
}

TEST(ReaderErrorCapture, DebugErrorCarriesTheXmlLine) {
    const lmx::s_event_map events[] = {{1, "r", 1, 20}, {1, "a", 1, 21}, {0, nullptr, 0, 0}};
    text_reader reader("<r>\n\n<a>v</b>\n</r>");
    elmx_error error = lmx::elmx_ok;
    ASSERT_TRUE(read_start_tag(reader, 20, lmx::xe_start_tag_end, events));
    lmx::c_xml_reader_local scope(reader);
    ASSERT_TRUE(read_start_tag(reader, 21, lmx::xe_start_tag_end, events));
    std::string value;
    ASSERT_TRUE(reader.get_element_value(&value, lmx::ws_preserve));
    int event = -1;
    EXPECT_FALSE(reader.get_end_tag(events, "a", &event, &error));
    EXPECT_EQ(error, lmx::elmx_bad_end_of_element);
    EXPECT_EQ(reader.get_line_no(), 3);
    EXPECT_EQ(reader.get_debug_error().xml_line, 3);
    const std::string message = reader.get_error_message();
    EXPECT_EQ(message.rfind("Error: Bad end of element\nItem: ", 0), 0u) << message;
    EXPECT_NE(message.find("\nXML line: 3\n"), std::string::npos) << message;
}

TEST(ReaderErrorCapture, EndOfInputAfterFatalErrorReportsTheRealCause) {
    text_reader reader("<?xml version=\"1.0\" encoding=\"UTF-16\"?><a/>");
    elmx_error error = lmx::elmx_ok;
    std::string name;
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_fatal);
    EXPECT_EQ(error, lmx::elmx_encoding_mismatch);
    EXPECT_EQ(reader.get_error(), lmx::elmx_encoding_mismatch);
    EXPECT_EQ(reader.handle_error(lmx::elmx_unexpected_end_of_message), lmx::elmx_encoding_mismatch);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_encoding_mismatch);
    // The stream is over.
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_end_of_input);
}

// ============================================================ file and memory

// A path under the temporary directory where no file is.
fs::path missing_file() { return fs::temp_directory_path() / temp_file::unique_name("_missing.xml"); }

TEST(ReaderSources, FileReaderReadsAFile) {
    temp_file file("<?xml version=\"1.0\"?>\n<a x=\"1\">t<b/></a>\n");
    lmx::c_xml_reader_file reader(file.path().c_str());
    ASSERT_TRUE(reader.is_open());
    elmx_error error = lmx::elmx_ok;
    std::string name;
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name, nullptr, &name));
    EXPECT_EQ(name, "a");
    ASSERT_TRUE(reader.get_attribute_event(nullptr, &error, &name));
    std::string value;
    ASSERT_TRUE(reader.get_attribute_value(&value, lmx::ws_preserve));
    EXPECT_EQ(value, "1");
    EXPECT_FALSE(reader.get_attribute_event(nullptr, &error, &name));
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_text);
    EXPECT_EQ(name, "t");
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_name);
    EXPECT_EQ(name, "b");
    EXPECT_EQ(finish_attributes(reader), lmx::xe_end_tag);
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_end_tag);
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_end_of_input);
    EXPECT_EQ(reader.get_line_no(), 3);
}

TEST(ReaderSources, FileReaderByWidePath) {
    temp_file file("<a/>");
    lmx::c_xml_reader_file reader(file.fs_path().wstring().c_str());
    ASSERT_TRUE(reader.is_open());
    elmx_error error = lmx::elmx_ok;
    std::string name;
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_name);
    EXPECT_EQ(name, "a");
}

TEST(ReaderSources, FileReaderOverLargeFileCrossesBlocks) {
    std::string content = "<a>";
    for (int i = 0; i < 20000; ++i)
        content += "<b n=\"" + std::to_string(i) + "\">value " + std::to_string(i) + "</b>\n";
    content += "</a>";
    temp_file file(content);
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(file.path());
    EXPECT_TRUE(result.ok()) << result.message;
    EXPECT_EQ(result.elements, 20001u);
    EXPECT_EQ(result.attributes, 20000u);
    EXPECT_EQ(result.text_runs, 20000u);
}

TEST(ReaderSources, MissingFileIsNotOpen) {
    const fs::path path = missing_file();
    lmx::c_xml_reader_file reader(path.string().c_str());
    EXPECT_FALSE(reader.is_open());
    elmx_error error = lmx::elmx_ok;
    std::string name;
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_end_of_input);
    EXPECT_EQ(error, lmx::elmx_unexpected_end_of_message);
}

TEST(ReaderSources, MemoryReaderReadsOnlyTheGivenLength) {
    const char data[] = "<a/><b/>";
    lmx::c_xml_reader_memory reader(data, 4);
    elmx_error error = lmx::elmx_ok;
    std::string name;
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name, nullptr, &name));
    EXPECT_EQ(name, "a");
    EXPECT_EQ(finish_attributes(reader), lmx::xe_end_tag);
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_end_of_input);
}

TEST(ReaderSources, MemoryReaderFromString) {
    const std::string text = "<doc>x</doc>";
    lmx::c_xml_reader_memory reader(text);
    std::string name;
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name, nullptr, &name));
    EXPECT_EQ(name, "doc");
}

// ================================================================ the walk

// Collects everything the walk visits.
class collector : public tessarine_tools::xml_walk_visitor {
public:
    void on_start(lmx::c_xml_reader &ar_reader, const std::string &ar_name) override {
        starts.push_back(ar_name);
        std::string uri;
        ar_reader.get_namespace(ar_name, &uri);
        namespaces.push_back(uri);
    }
    void on_attribute(lmx::c_xml_reader &, const std::string &ar_name, const std::string &ar_value) override {
        attributes.emplace_back(ar_name, ar_value);
    }
    void on_text(lmx::c_xml_reader &, const std::string &ar_text) override { texts.push_back(ar_text); }
    void on_end(lmx::c_xml_reader &, const std::string &ar_name) override { ends.push_back(ar_name); }

    std::vector<std::string> starts, namespaces, texts, ends;
    std::vector<std::pair<std::string, std::string>> attributes;
};

using strings = std::vector<std::string>;
using pairs = std::vector<std::pair<std::string, std::string>>;

std::string data_file(const char *ap_name) { return std::string(TESSARINE_SOURCE_DIR) + "/tests/data/" + ap_name; }

TEST(XmlWalk, NamespacesDocument) {
    collector seen;
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(data_file("namespaces.xml"), &seen);
    ASSERT_TRUE(result.ok()) << result.message;
    EXPECT_TRUE(result.message.empty());
    EXPECT_EQ(result.elements, 6u);
    EXPECT_EQ(result.attributes, 5u);
    EXPECT_EQ(result.text_runs, 3u);
    EXPECT_EQ(seen.starts, (strings{"r:root", "item", "item", "r:group", "r:member", "plain"}));
    EXPECT_EQ(seen.namespaces, (strings{"urn:tessarine:root", "urn:tessarine:default", "urn:tessarine:other",
                                        "urn:tessarine:redeclared", "urn:tessarine:redeclared", ""}));
    EXPECT_EQ(seen.attributes, (pairs{{"xsi:schemaLocation", "urn:tessarine:root root.xsd"},
                                      {"id", "1"},
                                      {"r:kind", "a"},
                                      {"id", "2"},
                                      {"xsi:nil", "true"}}));
    EXPECT_EQ(seen.texts, (strings{"first", "second", "none"}));
    EXPECT_EQ(seen.ends, (strings{"item", "item", "r:member", "plain", "r:group", "r:root"}));
}

// What the walk of a file in tests/data meets. What is left empty is not checked.
struct data_file_row {
    const char *file;
    std::size_t elements;
    std::optional<std::size_t> attributes;
    std::optional<std::size_t> text_runs;
    std::optional<strings> starts;
    std::optional<pairs> attribute_values;
    strings texts;
};

TEST(XmlWalk, DataDocuments) {
    const std::string creme_brulee = "Cr\xC3\xA8me br\xC3\xBBl\xC3\xA9" "e";
    const data_file_row rows[] = {
        {"entities.xml", 7, 2u, 5u, strings{"doc", "p", "p", "p", "p", "s", "p"},
         pairs{{"title", "a < b, Tessarine & Co"}, {"n", "1"}},
         {"<>&'\"", "ABC", "caf\xC3\xA9 \xE2\x82\xAC", "inner", "Tessarine & Co"}},
        {"cdata.xml", 4, 0u, 5u, std::nullopt, std::nullopt,
         {"if (a < b && c > d) { return \"]]\"; }", "one", "two", "three", "   "}},
        // UTF-16 little endian with byte order mark.
        {"utf16le.xml", 3, 1u, 2u, std::nullopt, pairs{{"lang", "fr"}},
         {creme_brulee, "\xE2\x82\xAC \xF0\x9D\x84\x9E"}},
        // UTF-16 big endian without byte order mark.
        {"utf16be.xml", 3, std::nullopt, std::nullopt, std::nullopt, std::nullopt,
         {creme_brulee, "\xE2\x82\xAC \xF0\x9D\x84\x9E"}},
        // UCS-2 declared.
        {"ucs2le.xml", 3, std::nullopt, std::nullopt, std::nullopt, std::nullopt, {creme_brulee, "\xE2\x82\xAC"}},
        // ISO-8859-1 declared.
        {"latin1.xml", 1, 1u, 1u, std::nullopt, pairs{{"title", "caf\xC3\xA9"}}, {"na\xC3\xAFve \xC2\xA9"}},
        // UTF-8 with byte order mark.
        {"utf8bom.xml", 1, std::nullopt, std::nullopt, std::nullopt, std::nullopt, {"\xC3\xA9t\xC3\xA9"}},
    };
    for (const data_file_row &row : rows) {
        SCOPED_TRACE(row.file);
        collector seen;
        const tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(data_file(row.file), &seen);
        ASSERT_TRUE(result.ok()) << result.message;
        EXPECT_EQ(result.elements, row.elements);
        if (row.attributes) {
            EXPECT_EQ(result.attributes, *row.attributes);
        }
        if (row.text_runs) {
            EXPECT_EQ(result.text_runs, *row.text_runs);
        }
        if (row.starts) {
            EXPECT_EQ(seen.starts, *row.starts);
        }
        if (row.attribute_values) {
            EXPECT_EQ(seen.attributes, *row.attribute_values);
        }
        EXPECT_EQ(seen.texts, row.texts);
    }
}

// Walks every file with the extension in the directory (the Iterator says
// whether subdirectories count too); each must walk without error and have
// elements, and with a_quiet also without any message. Gives the number of files.
template <typename Iterator>
int expect_every_file_walks(const fs::path &ar_directory, const char *ap_extension, bool a_quiet) {
    int files = 0;
    for (const fs::directory_entry &entry : Iterator(ar_directory)) {
        if (!entry.is_regular_file() || entry.path().extension() != ap_extension)
            continue;
        ++files;
        tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(entry.path().string());
        EXPECT_TRUE(result.ok()) << entry.path() << "\n" << result.message;
        EXPECT_GT(result.elements, 0u) << entry.path();
        if (a_quiet) {
            EXPECT_TRUE(result.message.empty()) << entry.path();
        }
    }
    return files;
}

TEST(XmlWalk, EveryDataFileWalks) {
    const fs::path directory = fs::path(TESSARINE_SOURCE_DIR) / "tests" / "data";
    ASSERT_TRUE(fs::is_directory(directory)) << directory;
    EXPECT_GE(expect_every_file_walks<fs::directory_iterator>(directory, ".xml", false), 8);
}

TEST(XmlWalk, EveryCorpusFileWalks) {
    const fs::path corpus(TESSARINE_CORPUS_DIR);
    if (!fs::is_directory(corpus))
        GTEST_SKIP() << "no corpus at " << corpus;
    EXPECT_GT(expect_every_file_walks<fs::recursive_directory_iterator>(corpus, ".cxf", true), 0)
        << "no .cxf file under " << corpus;
}

TEST(XmlWalk, CountsOfASmallDocument) {
    const std::string text = "<?xml version=\"1.0\"?>\n<!-- c -->\n"
                             "<a x=\"1\" y='2' xmlns:p=\"urn:p\">\n"
                             "  <p:b/>text<c z=\"&amp;\">more</c>\n"
                             "  <![CDATA[raw]]>\n"
                             "</a>\n";
    collector seen;
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_text(text, &seen);
    ASSERT_TRUE(result.ok()) << result.message;
    EXPECT_EQ(result.elements, 3u);
    EXPECT_EQ(result.attributes, 3u);
    EXPECT_EQ(result.text_runs, 3u);
    EXPECT_EQ(seen.attributes, (pairs{{"x", "1"}, {"y", "2"}, {"z", "&"}}));
    EXPECT_EQ(seen.ends, (strings{"p:b", "c", "a"}));
}

TEST(XmlWalk, CommentWarningIsNoFailure) {
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_text("<a><!--x---></a>");
    EXPECT_TRUE(result.ok()) << result.message;
}

TEST(XmlWalk, HundredThousandNestedLevelsWalk) {
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_text(nested_elements(100000));
    EXPECT_TRUE(result.ok()) << result.message;
    EXPECT_EQ(result.elements, 100000u);
}

struct walk_failure {
    const char *text;
    elmx_error code;
    const char *item; // null: not checked
};

TEST(XmlWalk, FailuresGiveTheirCodes) {
    const walk_failure failures[] = {
        {"<a><b></a>", lmx::elmx_bad_end_of_element, "b"},
        {"<a>", lmx::elmx_unexpected_end_of_message, "a"},
        {"<a><b>text", lmx::elmx_unexpected_end_of_message, "b"},
        {" ", lmx::elmx_unexpected_end_of_message, ""},
        {"<!-- only a comment -->", lmx::elmx_unexpected_end_of_message, ""},
        {"<a/><b/>", lmx::elmx_xml_badly_formed, "b"},
        {"<a/>text", lmx::elmx_xml_badly_formed, nullptr},
        {"<a></a", lmx::elmx_not_well_formed, nullptr},
        {"<a><!X></a>", lmx::elmx_xml_badly_formed, nullptr},
        {"<a x=\"&nope;\"/>", lmx::elmx_unable_to_read_attribute, "@x"},
        {"<a b/>", lmx::elmx_not_well_formed, nullptr},
        {"<?xml version=\"1.2\"?><a/>", lmx::elmx_unsupported_xml_version, nullptr},
        {"<?xml version=\"1.0\" encoding=\"UTF-16\"?><a/>", lmx::elmx_encoding_mismatch, nullptr},
        {"<a/><!DOCTYPE a>", lmx::elmx_bad_dtd, nullptr},
        {"<a/><?xml version=\"1.0\"?>", lmx::elmx_bad_xml_decl, nullptr},
    };
    for (const walk_failure &f : failures) {
        tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_text(f.text);
        EXPECT_FALSE(result.ok()) << f.text;
        EXPECT_EQ(result.error, f.code) << f.text << "\n" << result.message;
        EXPECT_EQ(result.message.rfind(std::string("Error: ") + lmx::get_error_description(f.code) + "\n", 0), 0u)
            << f.text << "\n" << result.message;
        if (f.item) {
            EXPECT_NE(result.message.find(std::string("\nItem: ") + f.item + "\n"), std::string::npos)
                << f.text << "\n" << result.message;
        }
        EXPECT_NE(result.message.find("\nXML line: "), std::string::npos) << f.text << "\n" << result.message;
    }
}

TEST(XmlWalk, UnknownEntityInContentFails) {
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_text("<a>&nope;</a>");
    EXPECT_FALSE(result.ok());
}

TEST(XmlWalk, TruncatedDocumentsFail) {
    const std::string whole = "<a x=\"1\"><b>text</b><![CDATA[c]]><!-- d --></a>";
    for (std::size_t length = 0; length < whole.size(); ++length) {
        tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_text(whole.substr(0, length));
        EXPECT_FALSE(result.ok()) << "length " << length;
    }
    EXPECT_TRUE(tessarine_tools::walk_xml_text(whole).ok());
}

TEST(XmlWalk, LoneHighSurrogateEndsWithEncodingError) {
    // UTF-16 LE: "<a>", then U+D800 followed by "x" instead of a low surrogate.
    const std::string text("\xFF\xFE<\0a\0>\0\x00\xD8x\0<\0/\0a\0>\0", 20);
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_text(text);
    EXPECT_FALSE(result.ok());
    EXPECT_EQ(result.error, lmx::elmx_encoding_not_supported) << result.message;
}

TEST(XmlWalk, MissingFileCannotBeOpened) {
    tessarine_tools::xml_walk_result result =
        tessarine_tools::walk_xml_file(missing_file().string());
    EXPECT_EQ(result.error, lmx::elmx_unable_to_open_file);
    EXPECT_EQ(result.message.rfind("Error: Unable to open file\n", 0), 0u) << result.message;
}

TEST(XmlWalk, SwallowedFailureLetsTheWalkGoOn) {
    short_hook_reader reader("<a><b></a></b></a>");
    reader.swallow_all = true;
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml(reader);
    EXPECT_TRUE(result.ok()) << result.message;
    EXPECT_EQ(result.elements, 2u);
    EXPECT_EQ(reader.seen, (std::vector<elmx_error>{lmx::elmx_bad_end_of_element}));
}

} // namespace
