// The error model of the XML runtime: the code table, c_error and its
// freezing at the first fatal error, s_debug_error and its text form, and the
// reader's capture and handling of errors.
#include <cstring>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include <lmx/lmxparse.h>

#include "reader_walk.h"

namespace {

using tessarine_test::at_root_with_code_location;
using tessarine_test::document_walk;
using tessarine_test::expect_code_location;
using tessarine_test::expect_debug_error;
using tessarine_test::expect_walk;
using tessarine_test::long_hook_reader;
using tessarine_test::next_event_is;
using tessarine_test::recording_error;
using tessarine_test::reported_error;
using tessarine_test::short_hook_reader;
using tessarine_test::text_reader;

struct description_row {
    int code;
    const char *text;
};

// Every row of the code table, in order.
const description_row k_descriptions[] = {
    {0, "No Error"},
    {1, "Unable to open file"},
    {2, "Violation of xs:all cardinality constraints"},
    {3, "Attribute has already been read"},
    {4, "Attributes found in anonymous compositor"},
    {5, "XML badly formed"},
    {6, "XML character encoding not supported"},
    {7, "Inappropriate choice option selected"},
    {8, "Badly formed comment"},
    {9, "Badly formed DTD"},
    {10, "Bad end of element"},
    {11, "Bad start tag end"},
    {12, "Syntax error in end tag"},
    {13, "Bad XML Decl spec"},
    {14, "Unsupported XML version"},
    {15, "Mis-match between specified char encoding and read bytes"},
    {16, "Element not found"},
    {17, "Reference to external entity"},
    {18, "Fraction digits exceeded"},
    {19, "Length too long"},
    {20, "Length too short"},
    {21, "Mandatory element missing"},
    {22, "No pattern matched"},
    {23, "Not well formed"},
    {24, "Recursive entity definition"},
    {25, "Required attribute(s) missing"},
    {26, "Element instances exceeds maxOccurs"},
    {27, "Total digits exceeded"},
    {28, "Unable to read attribute value"},
    {29, "Unable to read element value"},
    {30, "Unknown element in xs:all"},
    {31, "Unknown element in complexContent"},
    {32, "Unexpected empty element"},
    {33, "Unexpected entity"},
    {34, "Unexpected end of message"},
    {35, "Invalid value format for this type"},
    {36, "Value greater than specified maximum"},
    {37, "Value less than specified minimum"},
    {38, "Value does not match enumerations"},
    {39, "Unexpected attribute"},
    {40, "Nilled element body not empty"},
    {41, "Entity not found"},
    {42, "Undefined error"},
    {43, "Value does not match specified fixed constraint"},
    {44, "Unknown xsi:type"},
    {45, "Type not set"},
    {46, "min/max occurs error on marshaling"},
    {1000, "User defined error 1"},
    {1001, "User defined error 2"},
    {1002, "User defined error 3"},
    {1003, "User defined error 4"},
    {1004, "User defined error 5"},
    {1005, "User defined error 6"},
    {1006, "User defined error 7"},
    {1007, "User defined error 8"},
    {1008, "User defined error 9"}, // the last user code
};

lmx::elmx_error code_of(int a_value) { return static_cast<lmx::elmx_error>(a_value); }

class custom_message_reader : public text_reader {
public:
    using text_reader::text_reader;
    void get_error_message(std::string *ap_message) const override { *ap_message = "custom message"; }
};

// What get_error_info gives. The outputs start as the caller says, so that a
// test can see which of them were written.
struct error_info {
    bool found;
    lmx::elmx_error_type type;
    lmx::elmx_error code;
    int line;
};

error_info info_of(const lmx::c_error &ar_error, lmx::elmx_error_type a_type = lmx::elmx_type_none,
                   lmx::elmx_error a_code = lmx::elmx_ok, int a_line = 0) {
    error_info info{false, a_type, a_code, a_line};
    info.found = ar_error.get_error_info(&info.type, &info.code, &info.line);
    return info;
}

void expect_info(const error_info &ar_info, bool a_found, lmx::elmx_error_type a_type, lmx::elmx_error a_code,
                 int a_line) {
    EXPECT_EQ(ar_info.found, a_found);
    EXPECT_EQ(ar_info.type, a_type);
    EXPECT_EQ(ar_info.code, a_code);
    EXPECT_EQ(ar_info.line, a_line);
}

void expect_counts(const lmx::c_error &ar_error, int a_fatal, int a_errors, int a_warnings, int a_notices) {
    EXPECT_EQ(ar_error.get_fatal_count(), a_fatal);
    EXPECT_EQ(ar_error.get_error_count(), a_errors);
    EXPECT_EQ(ar_error.get_warning_count(), a_warnings);
    EXPECT_EQ(ar_error.get_notice_count(), a_notices);
}

// ---------------------------------------------------------------------------
// The code table
// ---------------------------------------------------------------------------

TEST(ErrorTable, HasFiftySixRows) {
    EXPECT_EQ(sizeof(k_descriptions) / sizeof(k_descriptions[0]), 56u);
}

TEST(ErrorTable, EveryCodeHasItsText) {
    for (const description_row &row : k_descriptions) {
        SCOPED_TRACE(row.code);
        const char *text = lmx::get_error_description(code_of(row.code));
        ASSERT_NE(text, nullptr);
        EXPECT_STREQ(text, row.text);
    }
}

TEST(ErrorTable, EnumeratorsHaveTheirValues) {
    tessarine_test::expect_constants({
        TESSARINE_CONSTANT(lmx::elmx_ok, 0),
        TESSARINE_CONSTANT(lmx::elmx_unable_to_open_file, 1),
        TESSARINE_CONSTANT(lmx::elmx_xml_badly_formed, 5),
        TESSARINE_CONSTANT(lmx::elmx_encoding_not_supported, 6),
        TESSARINE_CONSTANT(lmx::elmx_bad_dtd, 9),
        TESSARINE_CONSTANT(lmx::elmx_encoding_mismatch, 15),
        TESSARINE_CONSTANT(lmx::elmx_external_entity, 17),
        TESSARINE_CONSTANT(lmx::elmx_not_well_formed, 23),
        TESSARINE_CONSTANT(lmx::elmx_recursive_entity, 24),
        TESSARINE_CONSTANT(lmx::elmx_unexpected_end_of_message, 34),
        TESSARINE_CONSTANT(lmx::elmx_entity_not_found, 41),
        TESSARINE_CONSTANT(lmx::elmx_marshal_occurs_error, 46),
        TESSARINE_CONSTANT(lmx::elmx_user_defined_1, 1000),
        TESSARINE_CONSTANT(lmx::elmx_user_defined_9, 1008),
        TESSARINE_CONSTANT(lmx::elmx_type_fatal, 0),
        TESSARINE_CONSTANT(lmx::elmx_type_error, 1),
        TESSARINE_CONSTANT(lmx::elmx_type_warning, 2),
        TESSARINE_CONSTANT(lmx::elmx_type_notice, 3),
        TESSARINE_CONSTANT(lmx::elmx_type_none, 4),
    });
}

TEST(ErrorTable, CodesOutsideTheTableGiveEmptyTextNeverNull) {
    const std::pair<int, const char *> rows[] = {
        {-1, "negative"},
        {47, "after the last runtime code"},
        {100, "between the runtime and the user codes"},
        {998, "between the runtime and the user codes"},
        {999, "just below the user range"},
        {1009, "after the last user code"},
        {2000, "after the last user code"},
        {0x7fffffff, "the largest code"},
    };
    for (const auto &row : rows) {
        SCOPED_TRACE(std::to_string(row.first) + ", " + row.second);
        const char *text = lmx::get_error_description(code_of(row.first));
        ASSERT_NE(text, nullptr);
        EXPECT_STREQ(text, "");
    }
}

TEST(ErrorTable, LmxErrorReturnsItsArgument) {
    EXPECT_EQ(lmx::lmx_error(lmx::elmx_bad_dtd), lmx::elmx_bad_dtd);
    EXPECT_EQ(lmx::lmx_error(lmx::elmx_ok), lmx::elmx_ok);
    EXPECT_EQ(lmx::lmx_error(lmx::elmx_user_defined_3, "name", "file.cpp", 12), lmx::elmx_user_defined_3);
}

// ---------------------------------------------------------------------------
// c_error
// ---------------------------------------------------------------------------

TEST(ErrorRecord, FreshRecordIsClear) {
    lmx::c_error error;
    EXPECT_EQ(error.get_last_error(), lmx::elmx_ok);
    EXPECT_FALSE(error.is_fatal_errored());
    expect_counts(error, 0, 0, 0, 0);
}

TEST(ErrorRecord, GetErrorInfoOnFreshRecordIsFalseAndLeavesOutputsAlone) {
    lmx::c_error error;
    expect_info(info_of(error, lmx::elmx_type_notice, lmx::elmx_user_defined_5, 4711), false, lmx::elmx_type_notice,
                lmx::elmx_user_defined_5, 4711);
}

TEST(ErrorRecord, GetErrorInfoGivesTypeCodeAndLineOfTheLastError) {
    lmx::c_error error;
    error.error(lmx::elmx_type_error, lmx::elmx_not_well_formed, "doc.xml", 17, "message");
    expect_info(info_of(error), true, lmx::elmx_type_error, lmx::elmx_not_well_formed, 17);
}

TEST(ErrorRecord, GetErrorInfoIsFalseWhenTheLastCodeIsOk) {
    lmx::c_error error;
    error.error(lmx::elmx_type_warning, lmx::elmx_ok, "doc.xml", 3, "nothing wrong");
    const error_info info = info_of(error, lmx::elmx_type_none, lmx::elmx_user_defined_1, 99);
    EXPECT_FALSE(info.found);
    EXPECT_EQ(info.code, lmx::elmx_user_defined_1);
    EXPECT_EQ(info.line, 99);
    EXPECT_EQ(error.get_warning_count(), 1);
}

struct severity_row {
    lmx::elmx_error_type type;
    int fatal;
    int errors;
    int warnings;
    int notices;
};

TEST(ErrorRecord, CountersRiseBySeverity) {
    const severity_row rows[] = {
        {lmx::elmx_type_fatal, 1, 1, 0, 0},
        {lmx::elmx_type_error, 0, 1, 0, 0},
        {lmx::elmx_type_warning, 0, 0, 1, 0},
        {lmx::elmx_type_notice, 0, 0, 1, 1},
        {lmx::elmx_type_none, 0, 0, 0, 0},
    };
    for (const severity_row &row : rows) {
        SCOPED_TRACE(row.type);
        lmx::c_error error;
        error.error(row.type, lmx::elmx_bad_comment, "doc.xml", 1, "message");
        expect_counts(error, row.fatal, row.errors, row.warnings, row.notices);
        EXPECT_EQ(error.is_fatal_errored(), row.fatal > 0);
        EXPECT_EQ(error.get_last_error(), lmx::elmx_bad_comment);
        const error_info info = info_of(error, lmx::elmx_type_fatal);
        EXPECT_TRUE(info.found);
        EXPECT_EQ(info.type, row.type);
    }
}

TEST(ErrorRecord, CountersAccumulateOverNonFatalErrors) {
    lmx::c_error error;
    error.error(lmx::elmx_type_error, lmx::elmx_not_well_formed, "f", 1, "a");
    error.error(lmx::elmx_type_error, lmx::elmx_bad_xml_decl, "f", 2, "b");
    error.error(lmx::elmx_type_warning, lmx::elmx_bad_comment, "f", 3, "c");
    error.error(lmx::elmx_type_notice, lmx::elmx_external_entity, "f", 4, "d");
    expect_counts(error, 0, 2, 2, 1);
    EXPECT_FALSE(error.is_fatal_errored());
}

TEST(ErrorRecord, LaterNonFatalErrorOverwritesEarlierOne) {
    lmx::c_error error;
    error.error(lmx::elmx_type_error, lmx::elmx_not_well_formed, "f", 5, "first");
    error.error(lmx::elmx_type_warning, lmx::elmx_bad_comment, "f", 9, "second");
    expect_info(info_of(error), true, lmx::elmx_type_warning, lmx::elmx_bad_comment, 9);
    EXPECT_EQ(error.get_last_error(), lmx::elmx_bad_comment);
}

TEST(ErrorRecord, FatalErrorAfterNonFatalOnesIsRecorded) {
    lmx::c_error error;
    error.error(lmx::elmx_type_warning, lmx::elmx_bad_comment, "f", 1, "w");
    error.error(lmx::elmx_type_fatal, lmx::elmx_encoding_mismatch, "f", 2, "x");
    EXPECT_TRUE(error.is_fatal_errored());
    EXPECT_EQ(error.get_last_error(), lmx::elmx_encoding_mismatch);
    EXPECT_EQ(error.get_warning_count(), 1);
    EXPECT_EQ(error.get_fatal_count(), 1);
    EXPECT_EQ(error.get_error_count(), 1);
}

TEST(ErrorRecord, ReportErrorIsCalledWithAllFiveArguments) {
    recording_error error;
    error.error(lmx::elmx_type_error, lmx::elmx_bad_xml_decl, "doc.xml", 12, "Version not present in XML Decl");
    ASSERT_EQ(error.reports().size(), 1u);
    const reported_error &r = error.reports()[0];
    EXPECT_EQ(r.type, lmx::elmx_type_error);
    EXPECT_EQ(r.code, lmx::elmx_bad_xml_decl);
    EXPECT_TRUE(r.has_file);
    EXPECT_EQ(r.file, "doc.xml");
    EXPECT_EQ(r.line, 12);
    EXPECT_EQ(r.message, "Version not present in XML Decl");
}

// The record is up to date by the time report_error runs.
class checking_error : public lmx::c_error {
public:
    void report_error(lmx::elmx_error_type, lmx::elmx_error a_code, const char *, int, const char *) override {
        code_seen_in_report = get_last_error();
        matches = code_seen_in_report == a_code;
    }
    lmx::elmx_error code_seen_in_report = lmx::elmx_ok;
    bool matches = false;
};

TEST(ErrorRecord, RecordIsUpdatedBeforeReportErrorIsCalled) {
    checking_error error;
    error.error(lmx::elmx_type_error, lmx::elmx_unsupported_xml_version, "f", 1, "m");
    EXPECT_TRUE(error.matches);
    EXPECT_EQ(error.code_seen_in_report, lmx::elmx_unsupported_xml_version);
}

TEST(ErrorRecord, SecondErrorOfAnySeverityAfterFatalChangesNothing) {
    const lmx::elmx_error_type severities[] = {lmx::elmx_type_fatal, lmx::elmx_type_error, lmx::elmx_type_warning,
                                               lmx::elmx_type_notice, lmx::elmx_type_none};
    for (lmx::elmx_error_type severity : severities) {
        SCOPED_TRACE(severity);
        recording_error error;
        error.error(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, "first.xml", 7, "first");
        ASSERT_EQ(error.reports().size(), 1u);

        error.error(severity, lmx::elmx_not_well_formed, "second.xml", 70, "second");
        error.error(severity, lmx::elmx_unexpected_end_of_message, "second");

        EXPECT_EQ(error.reports().size(), 1u) << "report_error must not be called after a fatal error";
        EXPECT_EQ(error.get_last_error(), lmx::elmx_bad_dtd);
        expect_counts(error, 1, 1, 0, 0);
        expect_info(info_of(error), true, lmx::elmx_type_fatal, lmx::elmx_bad_dtd, 7);
    }
}

TEST(ErrorRecord, ErrorWithoutBoundGetterHasNoFileAndLineMinusOne) {
    recording_error error;
    error.error(lmx::elmx_type_warning, lmx::elmx_bad_comment, "no getter");
    ASSERT_EQ(error.reports().size(), 1u);
    EXPECT_FALSE(error.reports()[0].has_file);
    EXPECT_EQ(error.reports()[0].line, -1);
    const error_info info = info_of(error);
    ASSERT_TRUE(info.found);
    EXPECT_EQ(info.line, -1);
}

// A getter over its own input, reporting to the caller's record, which takes
// source id and line from it while it lives.
struct bound_getter {
    bound_getter(std::string a_input, lmx::c_error &ar_error)
        : input(std::move(a_input)), source(input.data(), input.size()), getter(source, ar_error) {}

    std::string input;
    lmx::c_read_memory source;
    lmx::c_get_as_utf8 getter;
};

// Reads values until the line counter shows a_line.
void advance_to_line(lmx::c_get_as_utf8 &ar_getter, int a_line) {
    while (ar_getter.get_line_num() < a_line)
        ASSERT_NE(ar_getter.get(), -1);
}

TEST(ErrorRecord, ErrorTakesSourceIdAndLineFromTheBoundGetter) {
    recording_error error;
    {
        bound_getter bound("<\n\n\n", error);
        advance_to_line(bound.getter, 3);
        error.error(lmx::elmx_type_warning, lmx::elmx_bad_comment, "while bound");
        ASSERT_EQ(error.reports().size(), 1u);
        EXPECT_TRUE(error.reports()[0].has_file);
        EXPECT_EQ(error.reports()[0].file, ""); // a memory block has an empty source id
        EXPECT_EQ(error.reports()[0].line, 3);
    }
    // The getter is gone and with it the binding.
    error.error(lmx::elmx_type_warning, lmx::elmx_bad_comment, "after");
    ASSERT_EQ(error.reports().size(), 2u);
    EXPECT_FALSE(error.reports()[1].has_file);
    EXPECT_EQ(error.reports()[1].line, -1);
}

TEST(ErrorRecord, InnerGetterBindsUntilItGoesAndTheOuterOneIsBoundAgain) {
    recording_error error;
    bound_getter outer("<\n\n\n\n", error);
    advance_to_line(outer.getter, 5);
    {
        bound_getter inner("<\n", error);
        advance_to_line(inner.getter, 2);
        error.error(lmx::elmx_type_notice, lmx::elmx_bad_comment, "inner");
        ASSERT_EQ(error.reports().size(), 1u);
        EXPECT_EQ(error.reports()[0].line, 2);
    }
    error.error(lmx::elmx_type_notice, lmx::elmx_bad_comment, "outer");
    ASSERT_EQ(error.reports().size(), 2u);
    EXPECT_EQ(error.reports()[1].line, 5);
}

TEST(ErrorRecord, BinderBindsOnceAndPutsTheOldGetterBack) {
    recording_error error;
    bound_getter first("<\n\n\n", error);
    advance_to_line(first.getter, 4);
    bound_getter second("<", error); // now bound: line 1

    error.error(lmx::elmx_type_notice, lmx::elmx_bad_comment, "second");
    ASSERT_EQ(error.reports().size(), 1u);
    EXPECT_EQ(error.reports().back().line, 1);
    {
        lmx::c_getter_error_binder binder(error);
        EXPECT_EQ(binder.get_getter(), nullptr);
        binder.bind(&first.getter);
        binder.bind(&second.getter); // already bound: no effect
        EXPECT_EQ(binder.get_getter(), &first.getter);
        error.error(lmx::elmx_type_notice, lmx::elmx_bad_comment, "first again");
        ASSERT_EQ(error.reports().size(), 2u);
        EXPECT_EQ(error.reports().back().line, 4);
    }
    error.error(lmx::elmx_type_notice, lmx::elmx_bad_comment, "second again");
    ASSERT_EQ(error.reports().size(), 3u);
    EXPECT_EQ(error.reports().back().line, 1);
}

TEST(ErrorRecord, GetterErrorFillsInSourceIdAndCurrentLine) {
    recording_error error;
    bound_getter bound("<a\nb\n", error);
    advance_to_line(bound.getter, 2);
    bound.getter.error(lmx::elmx_type_error, lmx::elmx_not_well_formed, "from the format form");
    bound.getter.error(lmx::elmx_type_warning, lmx::elmx_bad_comment, std::string("from the string form"));
    ASSERT_EQ(error.reports().size(), 2u);
    EXPECT_EQ(error.reports()[0].code, lmx::elmx_not_well_formed);
    EXPECT_EQ(error.reports()[0].message, "from the format form");
    EXPECT_EQ(error.reports()[0].line, 2);
    EXPECT_TRUE(error.reports()[0].has_file);
    EXPECT_EQ(error.reports()[0].file, "");
    EXPECT_EQ(error.reports()[1].type, lmx::elmx_type_warning);
    EXPECT_EQ(error.reports()[1].message, "from the string form");
    EXPECT_EQ(error.reports()[1].line, 2);
}

// ---------------------------------------------------------------------------
// s_debug_error
// ---------------------------------------------------------------------------

TEST(DebugError, DefaultRecordIsClear) {
    lmx::s_debug_error debug;
    ASSERT_NE(debug.p_prog_file, nullptr);
    expect_debug_error(debug, lmx::elmx_ok, "", "(not set)", -1, -1);
}

TEST(DebugError, SetStoresEveryField) {
    lmx::s_debug_error debug;
    debug.set(lmx::elmx_bad_end_of_element, "Object", "reader.cpp", 120, 33);
    expect_debug_error(debug, lmx::elmx_bad_end_of_element, "Object", "reader.cpp", 120, 33);
}

TEST(DebugError, ClearResetsEveryField) {
    lmx::s_debug_error debug;
    debug.set(lmx::elmx_bad_end_of_element, "Object", "reader.cpp", 120, 33);
    debug.clear();
    expect_debug_error(debug, lmx::elmx_ok, "", "(not set)", -1, -1);
}

TEST(DebugError, ClearedRecordPrintsOneLine) {
    lmx::s_debug_error debug;
    debug.set(lmx::elmx_bad_dtd, "x", "y", 1, 2);
    debug.clear();
    std::ostringstream os;
    debug.to_stream(os);
    EXPECT_EQ(os.str(), "Error: No Error\n");
    EXPECT_EQ(debug.to_string(), "Error: No Error\n");
}

struct text_form_row {
    const char *name;
    lmx::elmx_error error;
    const char *item;
    const char *prog_file;
    int prog_line;
    int xml_line;
    const char *text;
};

TEST(DebugError, TextFormOfASetRecord) {
    const text_form_row rows[] = {
        {"ok code stops the text after the first line whatever the other fields", lmx::elmx_ok, "item", "file.cpp",
         10, 20, "Error: No Error\n"},
        {"full text form with XML line", lmx::elmx_unexpected_attribute, "@colour", "cxf3.cpp", 4711, 42,
         "Error: Unexpected attribute\n"
         "Item: @colour\n"
         "Program file: cxf3.cpp\n"
         "Program line: 4711\n"
         "XML line: 42\n"},
        {"no XML line when it is -1", lmx::elmx_mandatory_element_missing, "Object", "writer.cpp", 8, -1,
         "Error: Mandatory element missing\n"
         "Item: Object\n"
         "Program file: writer.cpp\n"
         "Program line: 8\n"},
        {"empty item and negative program line", lmx::elmx_user_defined_9, "", "(not set)", -1, 0,
         "Error: User defined error 9\n"
         "Item: \n"
         "Program file: (not set)\n"
         "Program line: -1\n"
         "XML line: 0\n"},
    };
    for (const text_form_row &row : rows) {
        SCOPED_TRACE(row.name);
        lmx::s_debug_error debug;
        debug.set(row.error, row.item, row.prog_file, row.prog_line, row.xml_line);
        EXPECT_EQ(debug.to_string(), row.text);
    }
}

TEST(DebugError, StreamInsertionWritesTheTextForm) {
    lmx::s_debug_error debug;
    debug.set(lmx::elmx_bad_dtd, "DOCTYPE", "dtd.cpp", 3, 1);
    std::ostringstream inserted;
    inserted << debug;
    std::ostringstream streamed;
    debug.to_stream(streamed);
    EXPECT_EQ(inserted.str(), streamed.str());
    EXPECT_EQ(inserted.str(), debug.to_string());
}

TEST(DebugError, ToStreamReturnsTheStream) {
    lmx::s_debug_error debug;
    std::ostringstream os;
    std::ostream &returned = debug.to_stream(os);
    EXPECT_EQ(&returned, &os);
    std::ostream &chained = (os << debug);
    EXPECT_EQ(&chained, &os);
}

TEST(DebugError, RecordCanBeAssigned) {
    lmx::s_debug_error original;
    original.set(lmx::elmx_not_well_formed, "a", "b.cpp", 5, 6);
    lmx::s_debug_error copy;
    copy = original;
    EXPECT_EQ(copy.to_string(), original.to_string());
    original.clear();
    EXPECT_EQ(copy.error, lmx::elmx_not_well_formed);
    EXPECT_EQ(copy.item_name, "a");
}

// ---------------------------------------------------------------------------
// Reader: capture and handling
// ---------------------------------------------------------------------------

const std::string k_utf16_declared_in_utf8 = "<?xml version=\"1.0\" encoding=\"UTF-16\"?><a><b/></a>";

TEST(ReaderErrors, FreshReaderHasNoError) {
    text_reader reader("<a/>");
    EXPECT_EQ(reader.get_error(), lmx::elmx_ok);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_ok);
    EXPECT_EQ(reader.get_error_message(), "Error: No Error\n");
    EXPECT_STREQ(reader.get_code_location().p_prog_file, "<unspecified>");
    EXPECT_EQ(reader.get_code_location().prog_line, -1);
}

TEST(ReaderErrors, EncodingMismatchInXmlDeclarationEndsWithThatCodeEverywhere) {
    document_walk w(k_utf16_declared_in_utf8);
    expect_walk(w.walk, lmx::elmx_encoding_mismatch);
    EXPECT_EQ(w.reader.get_error(), lmx::elmx_encoding_mismatch);
    EXPECT_TRUE(w.reader.get_error_record().is_fatal_errored());
    EXPECT_EQ(w.reader.get_debug_error().error, lmx::elmx_encoding_mismatch);
    EXPECT_EQ(w.walk.seen.elements.size(), 0u);
}

TEST(ReaderErrors, EndOfInputAfterEncodingMismatchIsReportedAsTheMismatch) {
    text_reader reader(k_utf16_declared_in_utf8);
    lmx::elmx_error error = lmx::elmx_ok;
    std::string name;
    int event = reader.get_element_event(&error, &name);
    if (event == lmx::xe_fatal)
        EXPECT_EQ(error, lmx::elmx_encoding_mismatch);
    else
        EXPECT_EQ(event, lmx::xe_end_of_input);
    // The stream is dead: from now on the element scan only sees the end.
    event = reader.get_element_event(&error, &name);
    EXPECT_EQ(event, lmx::xe_end_of_input);
    EXPECT_EQ(error, lmx::elmx_unexpected_end_of_message);
    EXPECT_EQ(reader.handle_error(error, "a", "test.cpp", 1), lmx::elmx_encoding_mismatch);
    EXPECT_EQ(reader.get_error(), lmx::elmx_encoding_mismatch);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_encoding_mismatch);
}

TEST(ReaderErrors, CaptureKeepsUnexpectedEndWhileNotFatalErrored) {
    text_reader reader("<a/>");
    EXPECT_EQ(reader.capture_error(lmx::elmx_unexpected_end_of_message, "a", "capture.cpp", 10),
              lmx::elmx_unexpected_end_of_message);
    expect_debug_error(reader.get_debug_error(), lmx::elmx_unexpected_end_of_message, "a", "capture.cpp", 10, 1);
    // Capture writes the debug record only.
    EXPECT_EQ(reader.get_error(), lmx::elmx_ok);
}

TEST(ReaderErrors, CaptureKeepsUnexpectedEndAfterANonFatalError) {
    text_reader reader("<a/>");
    reader.get_error_record().error(lmx::elmx_type_error, lmx::elmx_not_well_formed, nullptr, 1, "not fatal");
    EXPECT_EQ(reader.capture_error(lmx::elmx_unexpected_end_of_message, "a", "capture.cpp", 10),
              lmx::elmx_unexpected_end_of_message);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_unexpected_end_of_message);
}

TEST(ReaderErrors, CaptureReplacesUnexpectedEndByTheFatalCause) {
    text_reader reader("<a/>");
    reader.get_error_record().error(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, nullptr, 1, "fatal");
    EXPECT_EQ(reader.capture_error(lmx::elmx_unexpected_end_of_message, "a", "capture.cpp", 11), lmx::elmx_bad_dtd);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_bad_dtd);
    EXPECT_EQ(reader.get_debug_error().item_name, "a");
    EXPECT_EQ(reader.get_debug_error().prog_line, 11);
}

TEST(ReaderErrors, CaptureLeavesOtherCodesAloneWhenFatalErrored) {
    text_reader reader("<a/>");
    reader.get_error_record().error(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, nullptr, 1, "fatal");
    EXPECT_EQ(reader.capture_error(lmx::elmx_bad_end_of_element, "a", "capture.cpp", 12),
              lmx::elmx_bad_end_of_element);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_bad_end_of_element);
    EXPECT_EQ(reader.get_error(), lmx::elmx_bad_dtd);
}

TEST(ReaderErrors, CaptureKeepsTheLastCapture) {
    text_reader reader("<a/>");
    reader.capture_error(lmx::elmx_bad_end_of_element, "first", "one.cpp", 1);
    reader.capture_error(lmx::elmx_unexpected_attribute, "second", "two.cpp", 2);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_unexpected_attribute);
    EXPECT_EQ(reader.get_debug_error().item_name, "second");
    EXPECT_STREQ(reader.get_debug_error().p_prog_file, "two.cpp");
}

TEST(ReaderErrors, CaptureRecordsTheScannerLine) {
    text_reader reader("\n\n<a/>");
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name));
    reader.capture_error(lmx::elmx_element_not_found, "a", "capture.cpp", 3);
    EXPECT_EQ(reader.get_debug_error().xml_line, 3);
    EXPECT_EQ(reader.get_line_no(), 3);
}

TEST(ReaderErrors, HandleErrorTakesNameAndCodeLocationFromTheReader) {
    text_reader reader("<abc/>");
    ASSERT_TRUE(at_root_with_code_location(reader, "generated.cpp", 77));
    EXPECT_EQ(reader.handle_error(lmx::elmx_element_not_found), lmx::elmx_element_not_found);
    expect_debug_error(reader.get_debug_error(), lmx::elmx_element_not_found, "abc", "generated.cpp", 77, 1);
}

TEST(ReaderErrors, HandleErrorWithLineTakesTheLineFromTheArgument) {
    text_reader reader("<abc/>");
    ASSERT_TRUE(at_root_with_code_location(reader, "generated.cpp", 77));
    EXPECT_EQ(reader.handle_error(lmx::elmx_bad_choice, 88), lmx::elmx_bad_choice);
    expect_code_location(reader.get_debug_error(), "abc", "generated.cpp", 88);
}

TEST(ReaderErrors, HandleErrorBeforeAnyCodeLocationUsesTheUnspecifiedFile) {
    text_reader reader("<abc/>");
    ASSERT_TRUE(next_event_is(reader, lmx::xe_name));
    reader.handle_error(lmx::elmx_element_not_found);
    EXPECT_STREQ(reader.get_debug_error().p_prog_file, "<unspecified>");
    EXPECT_EQ(reader.get_debug_error().prog_line, -1);
}

TEST(ReaderErrors, HandleErrorWithAllArgumentsUsesThem) {
    text_reader reader("<abc/>");
    EXPECT_EQ(reader.handle_error(lmx::elmx_value_above_maximum, "Value", "values.cpp", 5),
              lmx::elmx_value_above_maximum);
    expect_code_location(reader.get_debug_error(), "Value", "values.cpp", 5);
}

TEST(ReaderErrors, HandleAttributeErrorPutsAtSignBeforeTheCurrentName) {
    text_reader reader("<Colour/>");
    ASSERT_TRUE(at_root_with_code_location(reader, "attributes.cpp", 9));
    EXPECT_EQ(reader.handle_attribute_error(lmx::elmx_unexpected_attribute), lmx::elmx_unexpected_attribute);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_unexpected_attribute);
    expect_code_location(reader.get_debug_error(), "@Colour", "attributes.cpp", 9);
}

TEST(ReaderErrors, UnreadableAttributeIsReportedWithAtSignAndItsName) {
    document_walk w("<a colour=\"&undefined;\"/>");
    expect_walk(w.walk, lmx::elmx_unable_to_read_attribute);
    EXPECT_EQ(w.reader.get_debug_error().item_name, "@colour");
}

TEST(ReaderErrors, ErrorMessageIsTheTextFormOfTheDebugRecord) {
    text_reader reader("<a/>");
    reader.handle_error(lmx::elmx_bad_end_of_element, "item", "reading.cpp", 12);
    const std::string expected = "Error: Bad end of element\n"
                                 "Item: item\n"
                                 "Program file: reading.cpp\n"
                                 "Program line: 12\n"
                                 "XML line: 1\n";
    std::string message;
    reader.get_error_message(&message);
    EXPECT_EQ(message, expected);
    EXPECT_EQ(reader.get_error_message(), expected);
    EXPECT_EQ(reader.get_debug_error().to_string(), expected);
}

TEST(ReaderErrors, ByValueErrorMessageGoesThroughTheVirtualOne) {
    custom_message_reader reader("<a/>");
    const lmx::c_xml_reader &base = reader;
    EXPECT_EQ(base.get_error_message(), "custom message");
}

TEST(ReaderErrors, TruncatedDocumentReportsUnexpectedEndWithXmlLine) {
    document_walk w("<a>\n<b>");
    expect_walk(w.walk, lmx::elmx_unexpected_end_of_message);
    EXPECT_EQ(w.reader.get_debug_error().error, lmx::elmx_unexpected_end_of_message);
    EXPECT_EQ(w.reader.get_debug_error().xml_line, 2);
    const std::string message = w.reader.get_error_message();
    EXPECT_EQ(message.rfind("Error: Unexpected end of message\nItem: ", 0), 0u) << message;
    EXPECT_NE(message.find("\nXML line: 2\n"), std::string::npos) << message;
    // No low layer complained: the end of input is the cause.
    EXPECT_EQ(w.reader.get_error(), lmx::elmx_ok);
}

TEST(ReaderErrors, UserHookSeesTheCaptureArgumentsAndItsVerdictIsReturned) {
    long_hook_reader reader("<a/>");
    EXPECT_EQ(reader.handle_error(lmx::elmx_bad_choice, "Choice", "hook.cpp", 31), lmx::elmx_bad_choice);
    ASSERT_EQ(reader.calls.size(), 1u);
    EXPECT_EQ(reader.calls[0].code, lmx::elmx_bad_choice);
    EXPECT_EQ(reader.calls[0].item, "Choice");
    EXPECT_EQ(reader.calls[0].file, "hook.cpp");
    EXPECT_EQ(reader.calls[0].line, 31);
}

TEST(ReaderErrors, UserHookReturningOkSwallowsTheError) {
    long_hook_reader reader("<a/>");
    reader.swallowed = lmx::elmx_unexpected_attribute;
    EXPECT_EQ(reader.handle_error(lmx::elmx_unexpected_attribute, "@x", "hook.cpp", 1), lmx::elmx_ok);
    // The capture happened before the hook was asked.
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_unexpected_attribute);
    EXPECT_EQ(reader.get_debug_error().item_name, "@x");
    // Other codes still come through.
    EXPECT_EQ(reader.handle_error(lmx::elmx_bad_choice, "c", "hook.cpp", 2), lmx::elmx_bad_choice);
}

TEST(ReaderErrors, ShortFormsAndAttributeFormReachTheUserHook) {
    long_hook_reader reader("<abc/>");
    ASSERT_TRUE(at_root_with_code_location(reader, "generated.cpp", 5));
    reader.swallowed = lmx::elmx_unexpected_attribute;
    EXPECT_EQ(reader.handle_attribute_error(lmx::elmx_unexpected_attribute), lmx::elmx_ok);
    EXPECT_EQ(reader.handle_error(lmx::elmx_unexpected_attribute), lmx::elmx_ok);
    EXPECT_EQ(reader.handle_error(lmx::elmx_unexpected_attribute, 6), lmx::elmx_ok);
    ASSERT_EQ(reader.calls.size(), 3u);
    EXPECT_EQ(reader.calls[0].item, "@abc");
    EXPECT_EQ(reader.calls[0].file, "generated.cpp");
    EXPECT_EQ(reader.calls[0].line, 5);
    EXPECT_EQ(reader.calls[1].item, "abc");
    EXPECT_EQ(reader.calls[1].line, 5);
    EXPECT_EQ(reader.calls[2].line, 6);
}

TEST(ReaderErrors, LongHookForwardsToTheShortHookByDefault) {
    short_hook_reader reader("<a/>");
    reader.swallowed = lmx::elmx_unexpected_attribute;
    EXPECT_EQ(reader.handle_error(lmx::elmx_unexpected_attribute, "@x", "hook.cpp", 1), lmx::elmx_ok);
    EXPECT_EQ(reader.handle_error(lmx::elmx_bad_end_of_element, "a", "hook.cpp", 2), lmx::elmx_bad_end_of_element);
    EXPECT_EQ(reader.seen, (std::vector<lmx::elmx_error>{lmx::elmx_unexpected_attribute,
                                                         lmx::elmx_bad_end_of_element}));
}

TEST(ReaderErrors, DefaultHooksReturnTheCode) {
    text_reader reader("<a/>");
    EXPECT_EQ(reader.user_handle_error(lmx::elmx_bad_choice), lmx::elmx_bad_choice);
    EXPECT_EQ(reader.user_handle_error(lmx::elmx_bad_choice, "x", "f.cpp", 1), lmx::elmx_bad_choice);
    // The hooks alone capture nothing.
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_ok);
}

TEST(ReaderErrors, SwallowedErrorLetsTheWalkCarryOn) {
    // Text after the root is refused by the walk; a reader that swallows
    // that refusal reads on to the end.
    long_hook_reader reader("<a><b/></a>trailing");
    reader.swallowed = lmx::elmx_xml_badly_formed;
    const tessarine_test::traced_walk walk = tessarine_test::walk_traced(reader);
    expect_walk(walk, lmx::elmx_ok, "<a><b></b></a>");
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_xml_badly_formed);
    ASSERT_EQ(reader.calls.size(), 1u);
    EXPECT_EQ(reader.calls[0].code, lmx::elmx_xml_badly_formed);
}

TEST(ReaderErrors, RewindKeepsTheErrorState) {
    text_reader reader("<?xml version=\"1.0\" encoding=\"UTF-16\"?><a/>");
    tessarine_test::walk_traced(reader);
    ASSERT_EQ(reader.get_error(), lmx::elmx_encoding_mismatch);
    reader.rewind();
    EXPECT_EQ(reader.get_error(), lmx::elmx_encoding_mismatch);
    EXPECT_TRUE(reader.get_error_record().is_fatal_errored());
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_encoding_mismatch);
    lmx::elmx_error error = lmx::elmx_ok;
    EXPECT_EQ(reader.get_element_event(&error), lmx::xe_end_of_input);
}

TEST(ReaderErrors, WarningsDoNotStopTheReaderButShowInGetError) {
    document_walk w("<a><!-- comment ---><b/></a>");
    expect_walk(w.walk, lmx::elmx_ok, "<a><b></b></a>");
    EXPECT_EQ(w.reader.get_error(), lmx::elmx_bad_comment);
    EXPECT_FALSE(w.reader.get_error_record().is_fatal_errored());
    EXPECT_EQ(w.reader.get_error_record().get_warning_count(), 1);
}

} // namespace
