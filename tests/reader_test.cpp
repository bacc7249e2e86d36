// Tests of the pull reader, lmx::c_xml_reader, and of the pieces it is made
// of: namespace numbering and scopes, cracked names, tokenising against a
// binding's tables, the event and value calls, error capture and handling,
// the file and memory readers, and the full document walk that
// tools/xmlcheck runs (tools/xml_walk.h) over our own test documents and the
// shared corpus of CxF files.

#include <gtest/gtest.h>

#include <lmx/lmxparse.h>

#include "tools/xml_walk.h"

#include <cstring>
#include <filesystem>
#include <fstream>
#include <memory>
#include <random>
#include <string>
#include <utility>
#include <vector>

#ifndef TESSARINE_SOURCE_DIR
#define TESSARINE_SOURCE_DIR "."
#endif
#ifndef TESSARINE_CORPUS_DIR
#define TESSARINE_CORPUS_DIR "../shared/corpus"
#endif

namespace {

namespace fs = std::filesystem;
using lmx::elmx_error;

const char *const k_xsi = "http://www.w3.org/2001/XMLSchema-instance";

// A reader over a text that lives as long as the reader.
struct document {
    explicit document(std::string a_text) : text(std::move(a_text)), reader(text) {}
    std::string text;
    lmx::c_xml_reader_memory reader;
};

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

std::string nested(int a_levels) {
    std::string text;
    for (int i = 0; i < a_levels; ++i)
        text += "<e>";
    for (int i = 0; i < a_levels; ++i)
        text += "</e>";
    return text;
}

// A reader that swallows every error and remembers what it was handed.
class swallowing_reader : public lmx::c_xml_reader_memory {
public:
    explicit swallowing_reader(const std::string &ar_text) : lmx::c_xml_reader_memory(ar_text) {}
    using lmx::c_xml_reader::user_handle_error;
    elmx_error user_handle_error(elmx_error a_error) override {
        handled.push_back(a_error);
        return lmx::elmx_ok;
    }
    std::vector<elmx_error> handled;
};

// A reader that records the long form of the hook and keeps the default verdict.
class recording_reader : public lmx::c_xml_reader_memory {
public:
    explicit recording_reader(const std::string &ar_text) : lmx::c_xml_reader_memory(ar_text) {}
    using lmx::c_xml_reader::user_handle_error;
    elmx_error user_handle_error(elmx_error a_error, const std::string &ar_item_name, const char *ap_prog_file,
                                 int a_prog_line) override {
        calls.push_back({a_error, ar_item_name, ap_prog_file ? ap_prog_file : "", a_prog_line});
        return lmx::c_xml_reader::user_handle_error(a_error, ar_item_name, ap_prog_file, a_prog_line);
    }
    struct call {
        elmx_error error;
        std::string item;
        std::string file;
        int line;
    };
    std::vector<call> calls;
};

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
        document d(text);
        d.reader.set_ns_map(k_ns_u);
        elmx_error error = lmx::elmx_bad_dtd;
        std::string name;
        EXPECT_EQ(d.reader.get_element_event(k_x_events, &error, &name), 20) << text;
        EXPECT_EQ(error, lmx::elmx_ok) << text;
        EXPECT_EQ(d.reader.get_element_ns_id(), 1000) << text;
        EXPECT_EQ(d.reader.get_local_name(), "x") << text;
    }
}

TEST(ReaderNamespaces, TablePrefixIsNotBoundInTheDocument) {
    // The table's preferred prefix means nothing to the document.
    document d("<cc:x/>");
    d.reader.set_ns_map(k_ns_u);
    std::string name;
    elmx_error error;
    EXPECT_EQ(d.reader.get_element_event(k_x_events, &error, &name), lmx::xe_unknown);
    EXPECT_EQ(d.reader.get_cracked_name().get_ns_id(), lmx::ns_not_found);
}

TEST(ReaderNamespaces, UnprefixedElementWithoutDefaultNamespaceIsInNoNamespace) {
    document d("<x/>");
    d.reader.set_ns_map(k_ns_u);
    std::string name;
    elmx_error error;
    EXPECT_EQ(d.reader.get_element_event(k_x_events, &error, &name), 21);
    EXPECT_EQ(d.reader.get_element_ns_id(), lmx::ns_none);
}

TEST(ReaderNamespaces, EmptyDefaultDeclarationUndeclaresToNoNamespace) {
    const lmx::s_event_map events[] = {
        {1000, "x", 1, 20},
        {1000, "y", 1, 21},
        {1, "y", 1, 22},
        {0, nullptr, 0, 0},
    };
    document d("<x xmlns=\"urn:u\"><y xmlns=\"\"/><y/></x>");
    d.reader.set_ns_map(k_ns_u);
    std::string name;
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(events, &error, &name), 20);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    {
        lmx::c_xml_reader_local scope(d.reader);
        EXPECT_EQ(d.reader.get_element_event(events, &error, &name), 22);
        EXPECT_EQ(d.reader.get_element_ns_id(), lmx::ns_none);
        ASSERT_EQ(finish_attributes(d.reader), lmx::xe_end_tag);
        // The sibling is back in the default namespace of the parent.
        EXPECT_EQ(d.reader.get_element_event(events, &error, &name), 21);
        ASSERT_EQ(finish_attributes(d.reader), lmx::xe_end_tag);
        EXPECT_EQ(d.reader.get_element_event(events, &error, &name), lmx::xe_end_tag);
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
    document d("<r><p:a xmlns:p=\"urn:one\"/><p:a xmlns:p=\"urn:two\"/><p:a/></r>");
    d.reader.set_ns_map(ns);
    std::string name, uri;
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(events, &error, &name), 30);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    lmx::c_xml_reader_local scope(d.reader);

    EXPECT_EQ(d.reader.get_element_event(events, &error, &name), 31);
    d.reader.get_namespace(name, &uri);
    EXPECT_EQ(uri, "urn:one");
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_end_tag);

    EXPECT_EQ(d.reader.get_element_event(events, &error, &name), 32);
    d.reader.get_namespace(name, &uri);
    EXPECT_EQ(uri, "urn:two");
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_end_tag);

    // A declaration of a sibling does not stay for the next one.
    EXPECT_EQ(d.reader.get_element_event(events, &error, &name), lmx::xe_unknown);
    d.reader.get_namespace(name, &uri);
    EXPECT_EQ(uri, lmx::c_xml::k_namespace_not_found);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_end_tag);

    EXPECT_EQ(d.reader.get_element_event(events, &error, &name), lmx::xe_end_tag);
}

TEST(ReaderNamespaces, XsiAttributesGiveTheirOwnEventsEvenWhenATableNamesThem) {
    const lmx::s_event_map attributes[] = {
        {5, "type", 4, 40},
        {5, "nil", 3, 41},
        {5, "other", 5, 42},
        {0, nullptr, 0, 0},
    };
    document d(std::string("<x xmlns:xsi=\"") + k_xsi +
               "\" xsi:type=\"T\" xsi:nil=\"true\" xsi:schemaLocation=\"a b\""
               " xsi:noNamespaceSchemaLocation=\"c\" xsi:other=\"d\"/>");
    elmx_error error;
    std::string name;
    ASSERT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_name);

    const int expected[] = {lmx::xe_xsi_type, lmx::xe_xsi_nil, lmx::xe_xsi_schema_location,
                            lmx::xe_xsi_no_namespace_schema_location, lmx::xe_unknown};
    for (int event : expected) {
        EXPECT_EQ(d.reader.get_attribute_event(attributes, &name), event) << name;
        EXPECT_EQ(d.reader.get_current_event(), event) << name;
        EXPECT_TRUE(d.reader.is_xsi_attribute()) << name;
        d.reader.skip_attribute_value();
    }
    EXPECT_EQ(d.reader.get_attribute_event(attributes, &name), lmx::xe_end_tag);
}

TEST(ReaderNamespaces, UndeclaredXsiPrefixGivesUnknown) {
    const lmx::s_event_map attributes[] = {
        {5, "type", 4, 40},
        {5, "nil", 3, 41},
        {0, nullptr, 0, 0},
    };
    document d("<x xsi:type=\"T\" xsi:nil=\"true\"/>");
    elmx_error error;
    std::string name;
    ASSERT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_name);
    EXPECT_EQ(d.reader.get_attribute_event(attributes, &name), lmx::xe_unknown);
    EXPECT_EQ(name, "xsi:type");
    EXPECT_FALSE(d.reader.is_xsi_attribute());
    d.reader.skip_attribute_value();
    EXPECT_EQ(d.reader.get_attribute_event(attributes, &name), lmx::xe_unknown);
    EXPECT_EQ(name, "xsi:nil");
    d.reader.skip_attribute_value();
    EXPECT_EQ(d.reader.get_attribute_event(attributes, &name), lmx::xe_end_tag);
}

TEST(ReaderNamespaces, UnprefixedTypeAttributeIsOrdinaryInADefaultNamespace) {
    const lmx::s_event_map attributes[] = {
        {1000, "type", 4, 50},
        {1, "type", 4, 51},
        {0, nullptr, 0, 0},
    };
    document d(std::string("<x xmlns=\"urn:u\" xmlns:xsi=\"") + k_xsi + "\" type=\"a\"/>");
    d.reader.set_ns_map(k_ns_u);
    elmx_error error;
    std::string name;
    ASSERT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_name);
    EXPECT_EQ(d.reader.get_element_ns_id(), 1000);
    EXPECT_EQ(d.reader.get_attribute_event(attributes, &name), 51);
    EXPECT_EQ(d.reader.get_cracked_name().get_ns_id(), lmx::ns_none);
    EXPECT_FALSE(d.reader.is_xsi_attribute());
}

TEST(ReaderNamespaces, UserPrefixMappingIsBoundBySetNsMap) {
    const lmx::s_ns_map ns[] = {{1000, "c", "urn:core"}, {0, nullptr, nullptr}};
    const lmx::s_event_map events[] = {{1000, "a", 1, 20}, {0, nullptr, 0, 0}};
    document d("<x:a/>");
    d.reader.add_namespace_mapping("x", "urn:core");
    d.reader.add_namespace_mapping("y", "urn:user");
    d.reader.set_ns_map(ns);
    EXPECT_GE(d.reader.find_enumerated_namespace("urn:user"), 1001);
    // Reading code opens a scope of its own before the first element.
    lmx::c_xml_reader_local scope(d.reader);
    elmx_error error;
    std::string name;
    EXPECT_EQ(d.reader.get_element_event(events, &error, &name), 20);
    std::string uri;
    d.reader.get_namespace("y:b", &uri);
    EXPECT_EQ(uri, "urn:user");
}

TEST(ReaderNamespaces, SetNsMapDefinesTheIdsOfTheTable) {
    const lmx::s_ns_map ns[] = {{1000, "a", "urn:a"}, {1005, "b", "urn:b"}, {0, nullptr, nullptr}};
    document d("<x/>");
    d.reader.set_ns_map(ns);
    EXPECT_EQ(d.reader.find_enumerated_namespace("urn:a"), 1000);
    EXPECT_EQ(d.reader.find_enumerated_namespace("urn:b"), 1005);
    EXPECT_EQ(d.reader.add_namespace("urn:new"), 1006);
}

TEST(ReaderNamespaces, GetNamespaceResolvesInTheCurrentScope) {
    document d("<r xmlns:p=\"urn:p\" xmlns:e=\"\"/>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    std::string uri = "old";
    d.reader.get_namespace("p:x", &uri);
    EXPECT_EQ(uri, "urn:p");
    d.reader.get_namespace("x", &uri);
    EXPECT_EQ(uri, lmx::c_xml::k_non_namespace);
    EXPECT_EQ(uri, "");
    d.reader.get_namespace("q:x", &uri);
    EXPECT_EQ(uri, lmx::c_xml::k_namespace_not_found);
    EXPECT_EQ(uri, " ");
    d.reader.get_namespace("e:x", &uri);
    EXPECT_EQ(uri, " ");
    d.reader.get_namespace("xml:lang", &uri);
    EXPECT_EQ(uri, lmx::k_xml_namespace_uri);

    std::string prefix;
    d.reader.get_namespace_prefix("p:x", &prefix);
    EXPECT_EQ(prefix, "p");
    d.reader.get_namespace_prefix("x", &prefix);
    EXPECT_EQ(prefix, "");
}

TEST(ReaderNamespaces, DefaultNamespaceResolvesUnprefixedNames) {
    document d("<r xmlns=\"urn:d\"/>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    std::string uri;
    d.reader.get_namespace("x", &uri);
    EXPECT_EQ(uri, "urn:d");
}

TEST(ReaderNamespaces, ValidQualifiedNames) {
    document d("<r xmlns:p=\"urn:p\"/>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    EXPECT_TRUE(d.reader.is_valid_qname("p:x"));
    EXPECT_TRUE(d.reader.is_valid_qname("p:x-y.z_1"));
    EXPECT_TRUE(d.reader.is_valid_qname("x"));
    EXPECT_TRUE(d.reader.is_valid_qname("_x"));
    EXPECT_TRUE(d.reader.is_valid_qname("xml:lang"));
    EXPECT_FALSE(d.reader.is_valid_qname("q:x"));  // undeclared prefix
    EXPECT_FALSE(d.reader.is_valid_qname("p:"));   // empty local part
    EXPECT_FALSE(d.reader.is_valid_qname(""));
    EXPECT_FALSE(d.reader.is_valid_qname("p:1x"));  // local part starts with a digit
    EXPECT_FALSE(d.reader.is_valid_qname("p:x:y")); // a second colon
    EXPECT_FALSE(d.reader.is_valid_qname("1x"));
    EXPECT_FALSE(d.reader.is_valid_qname("p:x y"));
}

TEST(ReaderNamespaces, NamespaceContextTakesInnerDeclarationsOverOuter) {
    document d("<r xmlns:a=\"urn:1\" xmlns:b=\"urn:2\"><c xmlns:a=\"urn:3\"/></r>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    lmx::c_xml_reader_local scope(d.reader);
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    EXPECT_EQ(d.reader.get_name(), "c");

    lmx::c_namespace_context context;
    d.reader.extract_namespace_context(&context);
    ASSERT_EQ(context.size(), 2u);
    EXPECT_EQ(context.get_ns_prefix(0), "a");
    EXPECT_EQ(context.get_ns_uri(0), "urn:3");
    EXPECT_EQ(context.get_ns_prefix(1), "b");
    EXPECT_EQ(context.get_ns_uri(1), "urn:2");
}

TEST(ReaderNamespaces, ReaderScopesFollowTheirLifetime) {
    document d("<r/>");
    lmx::c_xml_reader_local *root = d.reader.get_reader_local();
    ASSERT_NE(root, nullptr);
    {
        lmx::c_xml_reader_local outer(d.reader);
        EXPECT_EQ(d.reader.get_reader_local(), &outer);
        EXPECT_EQ(outer.get_parent(), root);
        {
            lmx::c_xml_reader_local inner(d.reader);
            EXPECT_EQ(d.reader.get_reader_local(), &inner);
            EXPECT_EQ(inner.get_parent(), &outer);
        }
        EXPECT_EQ(d.reader.get_reader_local(), &outer);
    }
    EXPECT_EQ(d.reader.get_reader_local(), root);
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
    EXPECT_EQ(lmx::ns_not_found, 0);
    EXPECT_EQ(lmx::ns_none, 1);
    EXPECT_EQ(lmx::ns_xml, 2);
    EXPECT_EQ(lmx::ns_xsi, 5);
    EXPECT_EQ(lmx::ea_attribute, 0);
    EXPECT_EQ(lmx::ea_element, 1);
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
        m_document = std::make_unique<document>(ar_text);
        m_document->reader.set_ns_map(ap_ns);
        elmx_error error;
        std::string name;
        EXPECT_EQ(m_document->reader.get_element_event(&error, &name), lmx::xe_name);
        m_document->reader.tokenise(ap_table, lmx::ea_element);
        return m_document->reader.get_current_event();
    }
    std::unique_ptr<document> m_document;
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
    lmx::c_xml_reader &reader = m_document->reader;

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
    m_document->reader.restore_event(lmx::xe_name);
    m_document->reader.tokenise(table, "y", lmx::ea_element);
    EXPECT_EQ(m_document->reader.get_current_event(), 22);
}

TEST_F(Tokenise, UnprefixedAttributeCountsAsNoNamespace) {
    const lmx::s_event_map table[] = {{1000, "x", 1, 20}, {1, "x", 1, 21}, {0, nullptr, 0, 0}};
    document d("<r xmlns=\"urn:u\" x=\"1\"/>");
    d.reader.set_ns_map(k_ns_u);
    elmx_error error;
    std::string name;
    ASSERT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_name);
    ASSERT_TRUE(d.reader.get_attribute_event(nullptr, &error, &name));
    EXPECT_EQ(d.reader.get_current_event(), lmx::xe_name); // no map, no token
    d.reader.tokenise(table, lmx::ea_attribute);
    EXPECT_EQ(d.reader.get_current_event(), 21);
}

TEST(Reader, TokenisableEvents) {
    document d("<x/>");
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
        d.reader.restore_event(c.event);
        EXPECT_EQ(d.reader.get_current_event(), c.event);
        EXPECT_EQ(d.reader.is_current_event_tokenisable(), c.tokenisable) << c.event;
    }
}

// ============================================================ element events

TEST(Reader, ElementEventWithoutMapGivesTheName) {
    document d("<x a=\"1\">t</x>");
    elmx_error error = lmx::elmx_bad_dtd;
    std::string name;
    EXPECT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_name);
    EXPECT_EQ(error, lmx::elmx_ok);
    EXPECT_EQ(name, "x");
    EXPECT_EQ(d.reader.get_current_event(), lmx::xe_name);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    EXPECT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_text);
    EXPECT_EQ(name, "t");
    EXPECT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_end_tag);
    EXPECT_EQ(name, "x");
    EXPECT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_end_of_input);
    EXPECT_EQ(error, lmx::elmx_unexpected_end_of_message);
}

TEST(Reader, ElementEventVariantsUseTheNameBuffer) {
    {
        document d("<x/>");
        elmx_error error;
        EXPECT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
        EXPECT_EQ(d.reader.get_name(), "x");
    }
    {
        document d("<x/>");
        elmx_error error;
        EXPECT_EQ(d.reader.get_element_event(k_x_events, &error), 21);
        EXPECT_EQ(d.reader.get_name(), "x");
    }
    {
        document d("<x/>");
        std::string name;
        EXPECT_EQ(d.reader.get_element_event(k_x_events, &name), 21);
        EXPECT_EQ(name, "x");
    }
    {
        document d("<x/>");
        elmx_error error;
        std::string name;
        EXPECT_EQ(d.reader.get_known_element_event(k_x_events, &error, &name), 21);
        EXPECT_EQ(name, "x");
        EXPECT_EQ(d.reader.get_current_event(), 21);
    }
}

TEST(Reader, ElementEventReportsScannerErrors) {
    {
        // A failure that records nothing comes with code ok.
        document d("<a><!X></a>");
        elmx_error error;
        std::string name;
        ASSERT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_name);
        ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
        EXPECT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_fatal);
        EXPECT_EQ(error, lmx::elmx_ok);
    }
    {
        document d("<a></a");
        elmx_error error;
        std::string name;
        ASSERT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_name);
        ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
        EXPECT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_fatal);
        EXPECT_EQ(error, lmx::elmx_not_well_formed);
        EXPECT_EQ(d.reader.get_error(), lmx::elmx_not_well_formed);
    }
}

TEST(Reader, ElementEventWithMapIgnoresKnownElementsTable) {
    const lmx::s_known_elements known[] = {{1, "other", 5}, {0, nullptr, 0}};
    document d("<x/>");
    d.reader.set_known_elements(known);
    elmx_error error;
    std::string name;
    EXPECT_EQ(d.reader.get_element_event(k_x_events, &error, &name), 21);
    EXPECT_EQ(name, "x");
    EXPECT_EQ(d.reader.get_known_elements(), known);
}

TEST(Reader, KnownElementsTableSkipsUnknownElementsSilently) {
    const lmx::s_known_elements known[] = {{1, "r", 1}, {1, "b", 1}, {0, nullptr, 0}};
    document d("<r><a x=\"1\"><deep><deeper/></deep>t</a><p:b xmlns:p=\"urn:p\"/><b/></r>");
    d.reader.set_known_elements(known);
    elmx_error error;
    std::string name;
    ASSERT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_name);
    EXPECT_EQ(name, "r");
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    lmx::c_xml_reader_local scope(d.reader);
    ASSERT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_name);
    EXPECT_EQ(error, lmx::elmx_ok);
    EXPECT_EQ(name, "b");
    EXPECT_EQ(d.reader.get_element_ns_id(), lmx::ns_none);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_end_tag);
    EXPECT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_end_tag);
    EXPECT_EQ(name, "r");
}

TEST(Reader, KnownElementsTableFailedSkipIsBadlyFormed) {
    const lmx::s_known_elements known[] = {{1, "r", 1}, {0, nullptr, 0}};
    document d("<r><a><b></c></a></r>");
    d.reader.set_known_elements(known);
    elmx_error error;
    std::string name;
    ASSERT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_name);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    lmx::c_xml_reader_local scope(d.reader);
    d.reader.get_element_event(&error, &name);
    EXPECT_EQ(error, lmx::elmx_xml_badly_formed);
}

TEST(Reader, KnownElementsSelectorRestoresTheTable) {
    const lmx::s_known_elements first[] = {{1, "a", 1}, {0, nullptr, 0}};
    const lmx::s_known_elements second[] = {{1, "b", 1}, {0, nullptr, 0}};
    document d("<a/>");
    EXPECT_EQ(d.reader.get_known_elements(), nullptr);
    {
        lmx::c_known_elements_selector outer(d.reader, first);
        EXPECT_EQ(d.reader.get_known_elements(), first);
        {
            lmx::c_known_elements_selector inner(d.reader, second);
            EXPECT_EQ(d.reader.get_known_elements(), second);
        }
        EXPECT_EQ(d.reader.get_known_elements(), first);
    }
    EXPECT_EQ(d.reader.get_known_elements(), nullptr);
}

// ========================================================== attribute events

TEST(Reader, AttributeEventWithoutMapCracksTheName) {
    document d("<a p:x=\"1\" y=\"2\" xmlns:p=\"urn:p\"/>");
    elmx_error error;
    std::string name, value;
    ASSERT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_name);
    int p = d.reader.find_enumerated_namespace("urn:p");

    ASSERT_TRUE(d.reader.get_attribute_event(nullptr, &error, &name));
    EXPECT_EQ(error, lmx::elmx_ok);
    EXPECT_EQ(name, "p:x");
    EXPECT_EQ(d.reader.get_current_event(), lmx::xe_name);
    EXPECT_EQ(d.reader.get_cracked_name().get_ns_id(), p);
    EXPECT_EQ(d.reader.get_local_name(), "x");
    ASSERT_TRUE(d.reader.get_attribute_value(&value, lmx::ws_preserve));
    EXPECT_EQ(value, "1");

    ASSERT_TRUE(d.reader.get_attribute_event(nullptr, &error, &name));
    EXPECT_EQ(name, "y");
    EXPECT_EQ(d.reader.get_cracked_name().get_ns_id(), lmx::ns_none);
    value.clear();
    ASSERT_TRUE(d.reader.get_attribute_value(&value, lmx::ws_preserve));
    EXPECT_EQ(value, "2");

    EXPECT_FALSE(d.reader.get_attribute_event(nullptr, &error, &name));
    EXPECT_EQ(d.reader.get_current_event(), lmx::xe_end_tag);
}

TEST(Reader, AttributeEventWithMapTokenises) {
    const lmx::s_event_map attributes[] = {{1, "b", 1, 30}, {0, nullptr, 0, 0}};
    document d("<a b=\"1\" c=\"2\">");
    elmx_error error;
    std::string name;
    ASSERT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_name);
    ASSERT_TRUE(d.reader.get_attribute_event(attributes, &error, &name));
    EXPECT_EQ(d.reader.get_current_event(), 30);
    d.reader.skip_attribute_value();
    ASSERT_TRUE(d.reader.get_attribute_event(attributes, &error, &name));
    EXPECT_EQ(d.reader.get_current_event(), lmx::xe_unknown);
    d.reader.skip_attribute_value();
    EXPECT_FALSE(d.reader.get_attribute_event(attributes, &error, &name));
    EXPECT_EQ(d.reader.get_current_event(), lmx::xe_start_tag_end);
}

TEST(Reader, AttributeErrorEventsGiveTrueWithTheCode) {
    document d("<a x=\"1\" =>");
    elmx_error error;
    std::string name;
    ASSERT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_name);
    ASSERT_TRUE(d.reader.get_attribute_event(nullptr, &error, &name));
    d.reader.skip_attribute_value();
    EXPECT_TRUE(d.reader.get_attribute_event(nullptr, &error, &name));
    EXPECT_EQ(d.reader.get_current_event(), lmx::xe_fatal);
    EXPECT_EQ(error, lmx::elmx_not_well_formed);
}

// ==================================================================== end tag

TEST(Reader, EndTagWithTheRightNameIsAccepted) {
    const lmx::s_event_map events[] = {{1, "a", 1, 20}, {0, nullptr, 0, 0}};
    document d("<a></a>");
    elmx_error error;
    std::string name;
    ASSERT_EQ(d.reader.get_element_event(events, &error, &name), 20);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    int event = -1;
    error = lmx::elmx_bad_dtd;
    EXPECT_TRUE(d.reader.get_end_tag(events, "a", &event, &error));
    EXPECT_EQ(event, lmx::xe_end_tag);
    EXPECT_EQ(error, lmx::elmx_ok);
}

TEST(Reader, EndTagAtEndOfInputIsUnexpectedEnd) {
    const lmx::s_event_map events[] = {{1, "a", 1, 20}, {0, nullptr, 0, 0}};
    document d("<a>");
    elmx_error error;
    std::string name;
    ASSERT_EQ(d.reader.get_element_event(events, &error, &name), 20);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    int event = -1;
    EXPECT_FALSE(d.reader.get_end_tag(events, "a", &event, &error));
    EXPECT_EQ(event, lmx::xe_end_of_input);
    EXPECT_EQ(error, lmx::elmx_unexpected_end_of_message);
}

TEST(Reader, EndTagWithWrongNameIsBadEndOfElement) {
    const lmx::s_event_map events[] = {{1, "a", 1, 20}, {0, nullptr, 0, 0}};
    for (const char *text : {"<a></b>", "<a><c/></a>", "<a>text</a>"}) {
        document d(text);
        elmx_error error;
        std::string name;
        ASSERT_EQ(d.reader.get_element_event(events, &error, &name), 20) << text;
        ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end) << text;
        int event = -1;
        EXPECT_FALSE(d.reader.get_end_tag(events, "a", &event, &error)) << text;
        EXPECT_EQ(error, lmx::elmx_bad_end_of_element) << text;
        EXPECT_EQ(d.reader.get_debug_error().error, lmx::elmx_bad_end_of_element) << text;
    }
}

TEST(Reader, UnterminatedCdataIsReportedWhenTheEndTagIsSought) {
    const lmx::s_event_map events[] = {{1, "a", 1, 20}, {0, nullptr, 0, 0}};
    document d("<a><![CDATA[abc");
    elmx_error error;
    std::string name;
    ASSERT_EQ(d.reader.get_element_event(events, &error, &name), 20);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    EXPECT_EQ(d.reader.get_element_event(events, &error, &name), lmx::xe_text);
    EXPECT_EQ(name, "abc");
    EXPECT_EQ(error, lmx::elmx_ok);
    EXPECT_EQ(d.reader.get_error(), lmx::elmx_ok);
    int event = -1;
    EXPECT_FALSE(d.reader.get_end_tag(events, "a", &event, &error));
    EXPECT_EQ(event, lmx::xe_end_of_input);
    EXPECT_EQ(error, lmx::elmx_unexpected_end_of_message);
}

TEST(Reader, SwallowedBadEndTagCountsAsAccepted) {
    const lmx::s_event_map events[] = {{1, "a", 1, 20}, {0, nullptr, 0, 0}};
    std::string text = "<a></b>";
    swallowing_reader reader(text);
    elmx_error error;
    std::string name;
    ASSERT_EQ(reader.get_element_event(events, &error, &name), 20);
    ASSERT_EQ(finish_attributes(reader), lmx::xe_start_tag_end);
    int event = -1;
    EXPECT_TRUE(reader.get_end_tag(events, "a", &event, &error));
    EXPECT_EQ(error, lmx::elmx_ok);
    ASSERT_EQ(reader.handled.size(), 1u);
    EXPECT_EQ(reader.handled[0], lmx::elmx_bad_end_of_element);
    // The capture happened before the hook swallowed it.
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_bad_end_of_element);
}

// ====================================================================== values

TEST(Reader, ElementValueOfEmptyElementIsEmpty) {
    document d("<a/>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_end_tag);
    std::string value = "old";
    EXPECT_TRUE(d.reader.get_element_value(&value, lmx::ws_preserve));
    EXPECT_EQ(value, "");
    EXPECT_TRUE(d.reader.is_element_end_tag());
}

TEST(Reader, ElementValueExpandsEntitiesAndLeavesTextEvent) {
    document d("<a>t&lt;u  v</a>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    std::string value;
    EXPECT_TRUE(d.reader.get_element_value(&value, lmx::ws_collapse));
    EXPECT_EQ(value, "t<u v");
    EXPECT_EQ(d.reader.get_current_event(), lmx::xe_text);
    EXPECT_TRUE(d.reader.is_element_end_tag());
    EXPECT_EQ(d.reader.get_element_event(&error), lmx::xe_end_of_input);
}

TEST(Reader, IsElementEndTagChecksAgainstTheCurrentName) {
    document d("<a>x</b>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    std::string value;
    ASSERT_TRUE(d.reader.get_element_value(&value, lmx::ws_preserve));
    EXPECT_FALSE(d.reader.is_element_end_tag());
}

TEST(Reader, NestedElementValueGivesTheEndTagName) {
    document d("<a>x<b c='1'>y</b></a>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    std::string value, end_name;
    EXPECT_TRUE(d.reader.get_nested_element_value(&value, &end_name, lmx::ws_preserve, false));
    EXPECT_EQ(value, "x<b c='1'>y</b>");
    EXPECT_EQ(end_name, "a");
    EXPECT_EQ(d.reader.get_current_event(), lmx::xe_end_tag);
}

TEST(Reader, SimpleTypeValueReadsTheWholeElement) {
    document d("<a x=\"1\"> v  w </a><z/>");
    elmx_error error = lmx::elmx_bad_dtd;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    std::string value;
    bool is_empty = true;
    EXPECT_TRUE(d.reader.get_simple_type_value("a", lmx::ws_collapse, &value, &error, &is_empty));
    EXPECT_EQ(value, "v w");
    EXPECT_FALSE(is_empty);
    EXPECT_EQ(error, lmx::elmx_ok);
    EXPECT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    EXPECT_EQ(d.reader.get_name(), "z");
}

TEST(Reader, SimpleTypeValueOfEmptyElement) {
    document d("<a x=\"1\"/>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    std::string value = "old";
    bool is_empty = false;
    EXPECT_TRUE(d.reader.get_simple_type_value("a", lmx::ws_preserve, &value, &error, &is_empty));
    EXPECT_EQ(value, "");
    EXPECT_TRUE(is_empty);
    EXPECT_EQ(error, lmx::elmx_ok);
}

TEST(Reader, SimpleTypeValueFailures) {
    struct case_t {
        const char *text;
        elmx_error code;
    };
    for (case_t c : {case_t{"<a>v</b>", lmx::elmx_bad_end_of_element},
                     case_t{"<a>v", lmx::elmx_unable_to_read_element},
                     case_t{"<a / x>v</a>", lmx::elmx_bad_start_tag_end}}) {
        document d(c.text);
        elmx_error error;
        ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name) << c.text;
        std::string value;
        bool is_empty = false;
        EXPECT_FALSE(d.reader.get_simple_type_value("a", lmx::ws_preserve, &value, &error, &is_empty)) << c.text;
        EXPECT_EQ(error, c.code) << c.text;
    }
}

TEST(Reader, UrValueKeepsTheContentAsText) {
    document d("<a>x&amp;<b c='1'>y</b></a>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    std::string value;
    bool is_empty = true;
    EXPECT_TRUE(d.reader.get_element_ur_value("a", &value, &error, &is_empty));
    EXPECT_EQ(value, "x&amp;<b c='1'>y</b>");
    EXPECT_FALSE(is_empty);
    EXPECT_EQ(error, lmx::elmx_ok);
}

TEST(Reader, UrValueOfEmptyElement) {
    document d("<a/>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    std::string value = "old";
    bool is_empty = false;
    EXPECT_TRUE(d.reader.get_element_ur_value("a", &value, &error, &is_empty));
    EXPECT_EQ(value, "");
    EXPECT_TRUE(is_empty);
}

TEST(Reader, UrValueWithWrongEndTagIsBadEndOfElement) {
    document d("<a>x</z>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    std::string value;
    bool is_empty = false;
    EXPECT_FALSE(d.reader.get_element_ur_value("a", &value, &error, &is_empty));
    EXPECT_EQ(error, lmx::elmx_bad_end_of_element);
}

// =========================================================== skipping elements

const lmx::s_event_map k_ignore_events[] = {
    {1, "r", 1, 20},
    {1, "a", 1, 21},
    {1, "c", 1, 22},
    {0, nullptr, 0, 0},
};

TEST(Reader, IgnoreElementFromItsName) {
    document d("<r><a x=\"1\"><b/>t</a><c/></r>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(k_ignore_events, &error), 20);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    lmx::c_xml_reader_local scope(d.reader);
    ASSERT_EQ(d.reader.get_element_event(k_ignore_events, &error), 21);
    EXPECT_EQ(d.reader.ignore_element(k_ignore_events), lmx::elmx_ok);
    EXPECT_EQ(d.reader.get_current_event(), 22);
}

TEST(Reader, IgnoreElementAfterItsAttributes) {
    document d("<r><a x=\"1\"><b/>t</a><c/></r>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(k_ignore_events, &error), 20);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    lmx::c_xml_reader_local scope(d.reader);
    ASSERT_EQ(d.reader.get_element_event(k_ignore_events, &error), 21);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    EXPECT_EQ(d.reader.ignore_element(k_ignore_events), lmx::elmx_ok);
    EXPECT_EQ(d.reader.get_current_event(), 22);
}

TEST(Reader, IgnoreEmptyElement) {
    document d("<r><a x=\"1\"/><c/></r>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(k_ignore_events, &error), 20);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    lmx::c_xml_reader_local scope(d.reader);
    ASSERT_EQ(d.reader.get_element_event(k_ignore_events, &error), 21);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_end_tag);
    EXPECT_EQ(d.reader.ignore_element(k_ignore_events), lmx::elmx_ok);
    EXPECT_EQ(d.reader.get_current_event(), 22);
}

TEST(Reader, IgnoreElementThatCannotBeSkippedIsBadlyFormed) {
    document d("<r><a><b></c></a><c/></r>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(k_ignore_events, &error), 20);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    lmx::c_xml_reader_local scope(d.reader);
    ASSERT_EQ(d.reader.get_element_event(k_ignore_events, &error), 21);
    EXPECT_EQ(d.reader.ignore_element(k_ignore_events), lmx::elmx_xml_badly_formed);
}

TEST(Reader, IgnoreElementStopsAtTheNestingLimit) {
    document d("<r>" + nested(1001) + "</r>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(k_ignore_events, &error), 20);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    lmx::c_xml_reader_local scope(d.reader);
    ASSERT_EQ(d.reader.get_element_event(k_ignore_events, &error), lmx::xe_unknown);
    EXPECT_EQ(d.reader.ignore_element(k_ignore_events), lmx::elmx_xml_badly_formed);
    EXPECT_EQ(d.reader.get_error(), lmx::elmx_not_well_formed);
    EXPECT_TRUE(d.reader.get_error_record().is_fatal_errored());
}

TEST(Reader, IgnoreElementPassesDeepLegalNesting) {
    document d("<r>" + nested(999) + "</r>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(k_ignore_events, &error), 20);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    lmx::c_xml_reader_local scope(d.reader);
    ASSERT_EQ(d.reader.get_element_event(k_ignore_events, &error), lmx::xe_unknown);
    EXPECT_EQ(d.reader.ignore_element(k_ignore_events), lmx::elmx_ok);
    EXPECT_EQ(d.reader.get_current_event(), lmx::xe_end_tag);
    EXPECT_EQ(d.reader.get_name(), "r");
}

TEST(Reader, HundredThousandNestedLevelsDoNotCrashTheReader) {
    document d("<r>" + nested(100000) + "</r>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(k_ignore_events, &error), 20);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    lmx::c_xml_reader_local scope(d.reader);
    ASSERT_EQ(d.reader.get_element_event(k_ignore_events, &error), lmx::xe_unknown);
    EXPECT_EQ(d.reader.ignore_element(k_ignore_events), lmx::elmx_xml_badly_formed);
    EXPECT_EQ(d.reader.get_error(), lmx::elmx_not_well_formed);

    document any("<r>" + nested(100000) + "</r>");
    ASSERT_EQ(any.reader.get_element_event(&error), lmx::xe_name);
    std::string value;
    EXPECT_FALSE(any.reader.get_any_element("r", &value, lmx::ws_preserve, false));
    EXPECT_EQ(any.reader.get_error(), lmx::elmx_not_well_formed);
}

TEST(Reader, SkipStartTagSetsTheCurrentEvent) {
    {
        document d("<a x=\"1\">t</a>");
        elmx_error error;
        ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
        bool is_end = true;
        EXPECT_TRUE(d.reader.skip_start_tag(&is_end));
        EXPECT_FALSE(is_end);
        EXPECT_EQ(d.reader.get_current_event(), lmx::xe_start_tag_end);
    }
    {
        document d("<a x=\"1\"/>");
        elmx_error error;
        ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
        bool is_end = false;
        EXPECT_TRUE(d.reader.skip_start_tag(&is_end));
        EXPECT_TRUE(is_end);
        EXPECT_EQ(d.reader.get_current_event(), lmx::xe_end_tag);
    }
    {
        // A failure still leaves the event the tag's end implies.
        document d("<a / x>");
        elmx_error error;
        ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
        bool is_end = false;
        EXPECT_FALSE(d.reader.skip_start_tag(&is_end));
        EXPECT_TRUE(is_end);
        EXPECT_EQ(d.reader.get_current_event(), lmx::xe_end_tag);
        EXPECT_EQ(d.reader.get_error(), lmx::elmx_end_tag_syntax);
    }
}

TEST(Reader, RestoreEventPutsAnEventBack) {
    document d("<a/>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    d.reader.restore_event(lmx::xe_start_tag_end);
    EXPECT_EQ(d.reader.get_current_event(), lmx::xe_start_tag_end);
    d.reader.restore_event(77);
    EXPECT_EQ(d.reader.get_current_event(), 77);
}

TEST(Reader, AnyElementCaptureThroughTheReader) {
    document d("<r xmlns:p=\"urn:p\"><p:x a=\"1\"><p:y/>t</p:x></r>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    lmx::c_xml_reader_local scope(d.reader);
    ASSERT_EQ(d.reader.get_element_event(&error), lmx::xe_name);
    const std::string name = d.reader.get_name();
    std::string value;
    ASSERT_TRUE(d.reader.get_any_element(name, &value, lmx::ws_preserve, false));
    EXPECT_EQ(value, "<p:x a=\"1\"><p:y/>t</p:x>");
    std::string uri;
    d.reader.get_namespace("p:x", &uri);
    EXPECT_EQ(uri, "urn:p");
    lmx::c_namespace_context context;
    d.reader.extract_namespace_context(&context);
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
    document d("<a/>");
    lmx::c_string_stack &stack = d.reader.get_element_name_stack();
    EXPECT_TRUE(stack.empty());
    {
        lmx::c_string_stack_node node(stack, "a");
        EXPECT_EQ(d.reader.get_element_name_stack().size(), 1u);
    }
    EXPECT_TRUE(d.reader.get_element_name_stack().empty());
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
    std::string text = "<a/>";
    recording_reader reader(text);
    elmx_error error;
    ASSERT_EQ(reader.get_element_event(&error), lmx::xe_name);
    reader.set_code_file("gen.cpp");
    reader.set_code_line(42);
    EXPECT_STREQ(reader.get_code_location().p_prog_file, "gen.cpp");
    EXPECT_EQ(reader.get_code_location().prog_line, 42);

    EXPECT_EQ(reader.handle_error(lmx::elmx_value_not_enumerated), lmx::elmx_value_not_enumerated);
    const lmx::s_debug_error &debug = reader.get_debug_error();
    EXPECT_EQ(debug.error, lmx::elmx_value_not_enumerated);
    EXPECT_EQ(debug.item_name, "a");
    EXPECT_STREQ(debug.p_prog_file, "gen.cpp");
    EXPECT_EQ(debug.prog_line, 42);
    EXPECT_EQ(debug.xml_line, 1);
    EXPECT_EQ(reader.get_error_message(), "Error: Value does not match enumerations\n"
                                          "Item: a\n"
                                          "Program file: gen.cpp\n"
                                          "Program line: 42\n"
                                          "XML line: 1\n");

    EXPECT_EQ(reader.handle_error(lmx::elmx_length_too_long, 77), lmx::elmx_length_too_long);
    EXPECT_EQ(reader.get_debug_error().item_name, "a");
    EXPECT_STREQ(reader.get_debug_error().p_prog_file, "gen.cpp");
    EXPECT_EQ(reader.get_debug_error().prog_line, 77);

    EXPECT_EQ(reader.handle_error(lmx::elmx_value_above_maximum, "item", "f.cpp", 9),
              lmx::elmx_value_above_maximum);
    EXPECT_EQ(reader.get_debug_error().item_name, "item");
    EXPECT_STREQ(reader.get_debug_error().p_prog_file, "f.cpp");
    EXPECT_EQ(reader.get_debug_error().prog_line, 9);

    EXPECT_EQ(reader.handle_attribute_error(lmx::elmx_unable_to_read_attribute),
              lmx::elmx_unable_to_read_attribute);
    EXPECT_EQ(reader.get_debug_error().item_name, "@a");
    EXPECT_EQ(reader.get_debug_error().prog_line, 42);

    ASSERT_EQ(reader.calls.size(), 4u);
    EXPECT_EQ(reader.calls[0].error, lmx::elmx_value_not_enumerated);
    EXPECT_EQ(reader.calls[0].item, "a");
    EXPECT_EQ(reader.calls[0].file, "gen.cpp");
    EXPECT_EQ(reader.calls[0].line, 42);
    EXPECT_EQ(reader.calls[2].item, "item");
    EXPECT_EQ(reader.calls[2].file, "f.cpp");
    EXPECT_EQ(reader.calls[2].line, 9);
    EXPECT_EQ(reader.calls[3].item, "@a");
}

TEST(ReaderErrorCapture, CaptureDoesNotCallTheHook) {
    std::string text = "<a/>";
    recording_reader reader(text);
    EXPECT_EQ(reader.capture_error(lmx::elmx_bad_choice, "it", "c.cpp", 5), lmx::elmx_bad_choice);
    EXPECT_TRUE(reader.calls.empty());
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_bad_choice);
    EXPECT_EQ(reader.get_debug_error().item_name, "it");
    EXPECT_STREQ(reader.get_debug_error().p_prog_file, "c.cpp");
    EXPECT_EQ(reader.get_debug_error().prog_line, 5);
}

TEST(ReaderErrorCapture, ShortHookFormIsReachedThroughTheLongOne) {
    std::string text = "<a/>";
    swallowing_reader reader(text);
    EXPECT_EQ(reader.handle_error(lmx::elmx_bad_choice, "x", "f.cpp", 1), lmx::elmx_ok);
    EXPECT_EQ(reader.handle_error(lmx::elmx_length_too_short), lmx::elmx_ok);
    EXPECT_EQ(reader.handle_attribute_error(lmx::elmx_unexpected_attribute), lmx::elmx_ok);
    EXPECT_EQ(reader.handled, (std::vector<elmx_error>{lmx::elmx_bad_choice, lmx::elmx_length_too_short,
                                                       lmx::elmx_unexpected_attribute}));
    // The record keeps the last capture even though the error was swallowed.
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_unexpected_attribute);
}

TEST(ReaderErrorCapture, DefaultCodeLocationIsUnspecified) {
    document d("<a/>");
    EXPECT_STREQ(d.reader.get_code_location().p_prog_file, "<unspecified>");
    EXPECT_EQ(d.reader.get_code_location().prog_line, -1);
    EXPECT_EQ(d.reader.get_debug_error().error, lmx::elmx_ok);
    EXPECT_EQ(d.reader.get_error_message(), "Error: No Error\n");
    std::string message;
    d.reader.get_error_message(&message);
    EXPECT_EQ(message, "Error: No Error\n");
    EXPECT_FALSE(d.reader.is_auto_versioning());
    d.reader.set_auto_versioning(true);
    EXPECT_TRUE(d.reader.is_auto_versioning());
}

TEST(ReaderErrorCapture, DebugErrorCarriesTheXmlLine) {
    const lmx::s_event_map events[] = {{1, "r", 1, 20}, {1, "a", 1, 21}, {0, nullptr, 0, 0}};
    document d("<r>\n\n<a>v</b>\n</r>");
    elmx_error error;
    ASSERT_EQ(d.reader.get_element_event(events, &error), 20);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    lmx::c_xml_reader_local scope(d.reader);
    ASSERT_EQ(d.reader.get_element_event(events, &error), 21);
    ASSERT_EQ(finish_attributes(d.reader), lmx::xe_start_tag_end);
    std::string value;
    ASSERT_TRUE(d.reader.get_element_value(&value, lmx::ws_preserve));
    int event = -1;
    EXPECT_FALSE(d.reader.get_end_tag(events, "a", &event, &error));
    EXPECT_EQ(error, lmx::elmx_bad_end_of_element);
    EXPECT_EQ(d.reader.get_line_no(), 3);
    EXPECT_EQ(d.reader.get_debug_error().xml_line, 3);
    const std::string message = d.reader.get_error_message();
    EXPECT_EQ(message.rfind("Error: Bad end of element\nItem: ", 0), 0u) << message;
    EXPECT_NE(message.find("\nXML line: 3\n"), std::string::npos) << message;
}

TEST(ReaderErrorCapture, EndOfInputAfterFatalErrorReportsTheRealCause) {
    document d("<?xml version=\"1.0\" encoding=\"UTF-16\"?><a/>");
    elmx_error error;
    std::string name;
    EXPECT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_fatal);
    EXPECT_EQ(error, lmx::elmx_encoding_mismatch);
    EXPECT_EQ(d.reader.get_error(), lmx::elmx_encoding_mismatch);
    EXPECT_EQ(d.reader.handle_error(lmx::elmx_unexpected_end_of_message), lmx::elmx_encoding_mismatch);
    EXPECT_EQ(d.reader.get_debug_error().error, lmx::elmx_encoding_mismatch);
    // The stream is over.
    EXPECT_EQ(d.reader.get_element_event(&error, &name), lmx::xe_end_of_input);
}

// ============================================================ file and memory

fs::path temporary_path(const std::string &ar_stem) {
    std::random_device random;
    return fs::temp_directory_path() /
           (ar_stem + "_" + std::to_string(random()) + "_" + std::to_string(random()) + ".xml");
}

// Removes the file when the test ends, whatever happens.
struct temporary_file {
    explicit temporary_file(const std::string &ar_content) : path(temporary_path("tessarine_reader")) {
        std::ofstream out(path, std::ios::binary);
        out << ar_content;
    }
    ~temporary_file() {
        std::error_code ignored;
        fs::remove(path, ignored);
    }
    fs::path path;
};

TEST(ReaderSources, FileReaderReadsAFile) {
    temporary_file file("<?xml version=\"1.0\"?>\n<a x=\"1\">t<b/></a>\n");
    lmx::c_xml_reader_file reader(file.path.string().c_str());
    ASSERT_TRUE(reader.is_open());
    elmx_error error;
    std::string name;
    ASSERT_EQ(reader.get_element_event(&error, &name), lmx::xe_name);
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
    temporary_file file("<a/>");
    lmx::c_xml_reader_file reader(file.path.wstring().c_str());
    ASSERT_TRUE(reader.is_open());
    elmx_error error;
    std::string name;
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_name);
    EXPECT_EQ(name, "a");
}

TEST(ReaderSources, FileReaderOverLargeFileCrossesBlocks) {
    std::string content = "<a>";
    for (int i = 0; i < 20000; ++i)
        content += "<b n=\"" + std::to_string(i) + "\">value " + std::to_string(i) + "</b>\n";
    content += "</a>";
    temporary_file file(content);
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(file.path.string());
    EXPECT_TRUE(result.ok()) << result.message;
    EXPECT_EQ(result.elements, 20001u);
    EXPECT_EQ(result.attributes, 20000u);
    EXPECT_EQ(result.text_runs, 20000u);
}

TEST(ReaderSources, MissingFileIsNotOpen) {
    const fs::path path = temporary_path("tessarine_missing");
    lmx::c_xml_reader_file reader(path.string().c_str());
    EXPECT_FALSE(reader.is_open());
    elmx_error error;
    std::string name;
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_end_of_input);
    EXPECT_EQ(error, lmx::elmx_unexpected_end_of_message);
}

TEST(ReaderSources, MemoryReaderReadsOnlyTheGivenLength) {
    const char data[] = "<a/><b/>";
    lmx::c_xml_reader_memory reader(data, 4);
    elmx_error error;
    std::string name;
    ASSERT_EQ(reader.get_element_event(&error, &name), lmx::xe_name);
    EXPECT_EQ(name, "a");
    EXPECT_EQ(finish_attributes(reader), lmx::xe_end_tag);
    EXPECT_EQ(reader.get_element_event(&error, &name), lmx::xe_end_of_input);
}

TEST(ReaderSources, MemoryReaderFromString) {
    const std::string text = "<doc>x</doc>";
    lmx::c_xml_reader_memory reader(text);
    elmx_error error;
    std::string name;
    ASSERT_EQ(reader.get_element_event(&error, &name), lmx::xe_name);
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

TEST(XmlWalk, EntitiesDocument) {
    collector seen;
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(data_file("entities.xml"), &seen);
    ASSERT_TRUE(result.ok()) << result.message;
    EXPECT_EQ(result.elements, 7u);
    EXPECT_EQ(result.attributes, 2u);
    EXPECT_EQ(result.text_runs, 5u);
    EXPECT_EQ(seen.starts, (strings{"doc", "p", "p", "p", "p", "s", "p"}));
    EXPECT_EQ(seen.attributes, (pairs{{"title", "a < b, Tessarine & Co"}, {"n", "1"}}));
    EXPECT_EQ(seen.texts, (strings{"<>&'\"", "ABC", "caf\xC3\xA9 \xE2\x82\xAC", "inner", "Tessarine & Co"}));
}

TEST(XmlWalk, CdataDocument) {
    collector seen;
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(data_file("cdata.xml"), &seen);
    ASSERT_TRUE(result.ok()) << result.message;
    EXPECT_EQ(result.elements, 4u);
    EXPECT_EQ(result.attributes, 0u);
    EXPECT_EQ(result.text_runs, 5u);
    EXPECT_EQ(seen.texts,
              (strings{"if (a < b && c > d) { return \"]]\"; }", "one", "two", "three", "   "}));
}

TEST(XmlWalk, Utf16LittleEndianWithByteOrderMark) {
    collector seen;
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(data_file("utf16le.xml"), &seen);
    ASSERT_TRUE(result.ok()) << result.message;
    EXPECT_EQ(result.elements, 3u);
    EXPECT_EQ(result.attributes, 1u);
    EXPECT_EQ(result.text_runs, 2u);
    EXPECT_EQ(seen.attributes, (pairs{{"lang", "fr"}}));
    EXPECT_EQ(seen.texts, (strings{"Cr\xC3\xA8"
                                   "me br\xC3\xBB"
                                   "l\xC3\xA9"
                                   "e",
                                   "\xE2\x82\xAC \xF0\x9D\x84\x9E"}));
}

TEST(XmlWalk, Utf16BigEndianWithoutByteOrderMark) {
    collector seen;
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(data_file("utf16be.xml"), &seen);
    ASSERT_TRUE(result.ok()) << result.message;
    EXPECT_EQ(result.elements, 3u);
    EXPECT_EQ(seen.texts, (strings{"Cr\xC3\xA8"
                                   "me br\xC3\xBB"
                                   "l\xC3\xA9"
                                   "e",
                                   "\xE2\x82\xAC \xF0\x9D\x84\x9E"}));
}

TEST(XmlWalk, Ucs2Declared) {
    collector seen;
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(data_file("ucs2le.xml"), &seen);
    ASSERT_TRUE(result.ok()) << result.message;
    EXPECT_EQ(result.elements, 3u);
    EXPECT_EQ(seen.texts, (strings{"Cr\xC3\xA8"
                                   "me br\xC3\xBB"
                                   "l\xC3\xA9"
                                   "e",
                                   "\xE2\x82\xAC"}));
}

TEST(XmlWalk, Latin1Declared) {
    collector seen;
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(data_file("latin1.xml"), &seen);
    ASSERT_TRUE(result.ok()) << result.message;
    EXPECT_EQ(result.elements, 1u);
    EXPECT_EQ(result.attributes, 1u);
    EXPECT_EQ(result.text_runs, 1u);
    EXPECT_EQ(seen.attributes, (pairs{{"title", "caf\xC3\xA9"}}));
    EXPECT_EQ(seen.texts, (strings{"na\xC3\xAF"
                                   "ve \xC2\xA9"}));
}

TEST(XmlWalk, Utf8WithByteOrderMark) {
    collector seen;
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(data_file("utf8bom.xml"), &seen);
    ASSERT_TRUE(result.ok()) << result.message;
    EXPECT_EQ(result.elements, 1u);
    EXPECT_EQ(seen.texts, (strings{"\xC3\xA9t\xC3\xA9"}));
}

TEST(XmlWalk, EveryDataFileWalks) {
    const fs::path directory = fs::path(TESSARINE_SOURCE_DIR) / "tests" / "data";
    ASSERT_TRUE(fs::is_directory(directory)) << directory;
    int files = 0;
    for (const fs::directory_entry &entry : fs::directory_iterator(directory)) {
        if (!entry.is_regular_file() || entry.path().extension() != ".xml")
            continue;
        ++files;
        tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(entry.path().string());
        EXPECT_TRUE(result.ok()) << entry.path() << "\n" << result.message;
        EXPECT_GT(result.elements, 0u) << entry.path();
    }
    EXPECT_GE(files, 8);
}

TEST(XmlWalk, EveryCorpusFileWalks) {
    const fs::path corpus(TESSARINE_CORPUS_DIR);
    if (!fs::is_directory(corpus))
        GTEST_SKIP() << "no corpus at " << corpus;
    int files = 0;
    for (const fs::directory_entry &entry : fs::recursive_directory_iterator(corpus)) {
        if (!entry.is_regular_file() || entry.path().extension() != ".cxf")
            continue;
        ++files;
        tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(entry.path().string());
        EXPECT_TRUE(result.ok()) << entry.path() << "\n" << result.message;
        EXPECT_GT(result.elements, 0u) << entry.path();
        EXPECT_TRUE(result.message.empty()) << entry.path();
    }
    EXPECT_GT(files, 0) << "no .cxf file under " << corpus;
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
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_text(nested(100000));
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
        tessarine_tools::walk_xml_file(temporary_path("tessarine_missing").string());
    EXPECT_EQ(result.error, lmx::elmx_unable_to_open_file);
    EXPECT_EQ(result.message.rfind("Error: Unable to open file\n", 0), 0u) << result.message;
}

TEST(XmlWalk, SwallowedFailureLetsTheWalkGoOn) {
    std::string text = "<a><b></a></b></a>";
    swallowing_reader reader(text);
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml(reader);
    EXPECT_TRUE(result.ok()) << result.message;
    EXPECT_EQ(result.elements, 2u);
    EXPECT_EQ(reader.handled, (std::vector<elmx_error>{lmx::elmx_bad_end_of_element}));
}

} // namespace
