// The error model of the XML runtime: the code table, c_error and its
// freezing at the first fatal error, s_debug_error and its text form, and the
// reader's capture and handling of errors.
#include <cstring>
#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include <lmx/lmxparse.h>

#include "reader_walk.h"

namespace {

using tessarine_test::recording_error;
using tessarine_test::reported_error;

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
    {1008, "User defined error 9"},
};

lmx::elmx_error code_of(int a_value) { return static_cast<lmx::elmx_error>(a_value); }

// Keeps the document alive for as long as the reader built over it.
struct owned_document {
    std::string m_document;
};

// A reader whose error hooks record what they are given and may swallow one code.
class hooked_reader : private owned_document, public lmx::c_xml_reader_memory {
public:
    explicit hooked_reader(const std::string &ar_document)
        : owned_document{ar_document}, lmx::c_xml_reader_memory(m_document) {}

    struct hook_call {
        lmx::elmx_error code;
        std::string item;
        std::string file;
        int line;
    };

    lmx::elmx_error user_handle_error(lmx::elmx_error a_error, const std::string &ar_item_name,
                                      const char *ap_prog_file, int a_prog_line) override {
        calls.push_back({a_error, ar_item_name, ap_prog_file ? ap_prog_file : "", a_prog_line});
        if (a_error == swallowed)
            return lmx::elmx_ok;
        return lmx::c_xml_reader_memory::user_handle_error(a_error, ar_item_name, ap_prog_file, a_prog_line);
    }
    using lmx::c_xml_reader_memory::user_handle_error;

    lmx::elmx_error swallowed = lmx::elmx_ok;
    std::vector<hook_call> calls;
};

// A reader that only overrides the short hook.
class short_hook_reader : private owned_document, public lmx::c_xml_reader_memory {
public:
    explicit short_hook_reader(const std::string &ar_document)
        : owned_document{ar_document}, lmx::c_xml_reader_memory(m_document) {}

    lmx::elmx_error user_handle_error(lmx::elmx_error a_error) override {
        seen.push_back(a_error);
        return a_error == lmx::elmx_unexpected_attribute ? lmx::elmx_ok : a_error;
    }
    using lmx::c_xml_reader_memory::user_handle_error;

    std::vector<lmx::elmx_error> seen;
};

class custom_message_reader : private owned_document, public lmx::c_xml_reader_memory {
public:
    explicit custom_message_reader(const std::string &ar_document)
        : owned_document{ar_document}, lmx::c_xml_reader_memory(m_document) {}
    void get_error_message(std::string *ap_message) const override { *ap_message = "custom message"; }
};

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
    EXPECT_EQ(lmx::elmx_ok, 0);
    EXPECT_EQ(lmx::elmx_unable_to_open_file, 1);
    EXPECT_EQ(lmx::elmx_xml_badly_formed, 5);
    EXPECT_EQ(lmx::elmx_encoding_not_supported, 6);
    EXPECT_EQ(lmx::elmx_bad_dtd, 9);
    EXPECT_EQ(lmx::elmx_encoding_mismatch, 15);
    EXPECT_EQ(lmx::elmx_external_entity, 17);
    EXPECT_EQ(lmx::elmx_not_well_formed, 23);
    EXPECT_EQ(lmx::elmx_recursive_entity, 24);
    EXPECT_EQ(lmx::elmx_unexpected_end_of_message, 34);
    EXPECT_EQ(lmx::elmx_entity_not_found, 41);
    EXPECT_EQ(lmx::elmx_marshal_occurs_error, 46);
    EXPECT_EQ(lmx::elmx_user_defined_1, 1000);
    EXPECT_EQ(lmx::elmx_user_defined_9, 1008);
    EXPECT_EQ(lmx::elmx_type_fatal, 0);
    EXPECT_EQ(lmx::elmx_type_error, 1);
    EXPECT_EQ(lmx::elmx_type_warning, 2);
    EXPECT_EQ(lmx::elmx_type_notice, 3);
    EXPECT_EQ(lmx::elmx_type_none, 4);
}

TEST(ErrorTable, CodeAfterTheLastRuntimeCodeHasNoText) {
    EXPECT_STREQ(lmx::get_error_description(code_of(47)), "");
}

TEST(ErrorTable, CodeJustBelowTheUserRangeHasNoText) {
    EXPECT_STREQ(lmx::get_error_description(code_of(999)), "");
}

TEST(ErrorTable, LastUserCodeIsUserDefinedErrorNine) {
    EXPECT_STREQ(lmx::get_error_description(code_of(1008)), "User defined error 9");
}

TEST(ErrorTable, CodesOutsideTheTableGiveEmptyTextNeverNull) {
    for (int code : {-1, 47, 100, 998, 999, 1009, 2000, 0x7fffffff}) {
        SCOPED_TRACE(code);
        const char *text = lmx::get_error_description(code_of(code));
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
    EXPECT_EQ(error.get_fatal_count(), 0);
    EXPECT_EQ(error.get_error_count(), 0);
    EXPECT_EQ(error.get_warning_count(), 0);
    EXPECT_EQ(error.get_notice_count(), 0);
}

TEST(ErrorRecord, GetErrorInfoOnFreshRecordIsFalseAndLeavesOutputsAlone) {
    lmx::c_error error;
    lmx::elmx_error_type type = lmx::elmx_type_notice;
    lmx::elmx_error code = lmx::elmx_user_defined_5;
    int line = 4711;
    EXPECT_FALSE(error.get_error_info(&type, &code, &line));
    EXPECT_EQ(type, lmx::elmx_type_notice);
    EXPECT_EQ(code, lmx::elmx_user_defined_5);
    EXPECT_EQ(line, 4711);
}

TEST(ErrorRecord, GetErrorInfoGivesTypeCodeAndLineOfTheLastError) {
    lmx::c_error error;
    error.error(lmx::elmx_type_error, lmx::elmx_not_well_formed, "doc.xml", 17, "message");
    lmx::elmx_error_type type = lmx::elmx_type_none;
    lmx::elmx_error code = lmx::elmx_ok;
    int line = 0;
    EXPECT_TRUE(error.get_error_info(&type, &code, &line));
    EXPECT_EQ(type, lmx::elmx_type_error);
    EXPECT_EQ(code, lmx::elmx_not_well_formed);
    EXPECT_EQ(line, 17);
}

TEST(ErrorRecord, GetErrorInfoIsFalseWhenTheLastCodeIsOk) {
    lmx::c_error error;
    error.error(lmx::elmx_type_warning, lmx::elmx_ok, "doc.xml", 3, "nothing wrong");
    lmx::elmx_error_type type = lmx::elmx_type_none;
    lmx::elmx_error code = lmx::elmx_user_defined_1;
    int line = 99;
    EXPECT_FALSE(error.get_error_info(&type, &code, &line));
    EXPECT_EQ(code, lmx::elmx_user_defined_1);
    EXPECT_EQ(line, 99);
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
        EXPECT_EQ(error.get_fatal_count(), row.fatal);
        EXPECT_EQ(error.get_error_count(), row.errors);
        EXPECT_EQ(error.get_warning_count(), row.warnings);
        EXPECT_EQ(error.get_notice_count(), row.notices);
        EXPECT_EQ(error.is_fatal_errored(), row.fatal > 0);
        EXPECT_EQ(error.get_last_error(), lmx::elmx_bad_comment);
        lmx::elmx_error_type type = lmx::elmx_type_fatal;
        lmx::elmx_error code = lmx::elmx_ok;
        int line = 0;
        EXPECT_TRUE(error.get_error_info(&type, &code, &line));
        EXPECT_EQ(type, row.type);
    }
}

TEST(ErrorRecord, CountersAccumulateOverNonFatalErrors) {
    lmx::c_error error;
    error.error(lmx::elmx_type_error, lmx::elmx_not_well_formed, "f", 1, "a");
    error.error(lmx::elmx_type_error, lmx::elmx_bad_xml_decl, "f", 2, "b");
    error.error(lmx::elmx_type_warning, lmx::elmx_bad_comment, "f", 3, "c");
    error.error(lmx::elmx_type_notice, lmx::elmx_external_entity, "f", 4, "d");
    EXPECT_EQ(error.get_fatal_count(), 0);
    EXPECT_EQ(error.get_error_count(), 2);
    EXPECT_EQ(error.get_warning_count(), 2);
    EXPECT_EQ(error.get_notice_count(), 1);
    EXPECT_FALSE(error.is_fatal_errored());
}

TEST(ErrorRecord, LaterNonFatalErrorOverwritesEarlierOne) {
    lmx::c_error error;
    error.error(lmx::elmx_type_error, lmx::elmx_not_well_formed, "f", 5, "first");
    error.error(lmx::elmx_type_warning, lmx::elmx_bad_comment, "f", 9, "second");
    lmx::elmx_error_type type = lmx::elmx_type_none;
    lmx::elmx_error code = lmx::elmx_ok;
    int line = 0;
    ASSERT_TRUE(error.get_error_info(&type, &code, &line));
    EXPECT_EQ(type, lmx::elmx_type_warning);
    EXPECT_EQ(code, lmx::elmx_bad_comment);
    EXPECT_EQ(line, 9);
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
        EXPECT_EQ(error.get_fatal_count(), 1);
        EXPECT_EQ(error.get_error_count(), 1);
        EXPECT_EQ(error.get_warning_count(), 0);
        EXPECT_EQ(error.get_notice_count(), 0);
        lmx::elmx_error_type type = lmx::elmx_type_none;
        lmx::elmx_error code = lmx::elmx_ok;
        int line = 0;
        ASSERT_TRUE(error.get_error_info(&type, &code, &line));
        EXPECT_EQ(type, lmx::elmx_type_fatal);
        EXPECT_EQ(code, lmx::elmx_bad_dtd);
        EXPECT_EQ(line, 7);
    }
}

TEST(ErrorRecord, ErrorWithoutBoundGetterHasNoFileAndLineMinusOne) {
    recording_error error;
    error.error(lmx::elmx_type_warning, lmx::elmx_bad_comment, "no getter");
    ASSERT_EQ(error.reports().size(), 1u);
    EXPECT_FALSE(error.reports()[0].has_file);
    EXPECT_EQ(error.reports()[0].line, -1);
    lmx::elmx_error_type type = lmx::elmx_type_none;
    lmx::elmx_error code = lmx::elmx_ok;
    int line = 0;
    ASSERT_TRUE(error.get_error_info(&type, &code, &line));
    EXPECT_EQ(line, -1);
}

// Reads values until the line counter shows a_line.
void advance_to_line(lmx::c_get_as_utf8 &ar_getter, int a_line) {
    while (ar_getter.get_line_num() < a_line)
        ASSERT_NE(ar_getter.get(), -1);
}

TEST(ErrorRecord, ErrorTakesSourceIdAndLineFromTheBoundGetter) {
    recording_error error;
    const std::string input = "<\n\n\n";
    {
        lmx::c_read_memory source(input.data(), input.size());
        lmx::c_get_as_utf8 getter(source, error);
        advance_to_line(getter, 3);
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
    const std::string outer_input = "<\n\n\n\n";
    const std::string inner_input = "<\n";
    lmx::c_read_memory outer_source(outer_input.data(), outer_input.size());
    lmx::c_get_as_utf8 outer(outer_source, error);
    advance_to_line(outer, 5);
    {
        lmx::c_read_memory inner_source(inner_input.data(), inner_input.size());
        lmx::c_get_as_utf8 inner(inner_source, error);
        advance_to_line(inner, 2);
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
    const std::string first_input = "<\n\n\n";
    const std::string second_input = "<";
    lmx::c_read_memory first_source(first_input.data(), first_input.size());
    lmx::c_get_as_utf8 first(first_source, error);
    advance_to_line(first, 4);
    lmx::c_read_memory second_source(second_input.data(), second_input.size());
    lmx::c_get_as_utf8 second(second_source, error); // now bound: line 1

    error.error(lmx::elmx_type_notice, lmx::elmx_bad_comment, "second");
    ASSERT_EQ(error.reports().size(), 1u);
    EXPECT_EQ(error.reports().back().line, 1);
    {
        lmx::c_getter_error_binder binder(error);
        EXPECT_EQ(binder.get_getter(), nullptr);
        binder.bind(&first);
        binder.bind(&second); // already bound: no effect
        EXPECT_EQ(binder.get_getter(), &first);
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
    const std::string input = "<a\nb\n";
    lmx::c_read_memory source(input.data(), input.size());
    lmx::c_get_as_utf8 getter(source, error);
    advance_to_line(getter, 2);
    getter.error(lmx::elmx_type_error, lmx::elmx_not_well_formed, "from the format form");
    getter.error(lmx::elmx_type_warning, lmx::elmx_bad_comment, std::string("from the string form"));
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
    EXPECT_EQ(debug.error, lmx::elmx_ok);
    EXPECT_EQ(debug.item_name, "");
    ASSERT_NE(debug.p_prog_file, nullptr);
    EXPECT_STREQ(debug.p_prog_file, "(not set)");
    EXPECT_EQ(debug.prog_line, -1);
    EXPECT_EQ(debug.xml_line, -1);
}

TEST(DebugError, SetStoresEveryField) {
    lmx::s_debug_error debug;
    debug.set(lmx::elmx_bad_end_of_element, "Object", "reader.cpp", 120, 33);
    EXPECT_EQ(debug.error, lmx::elmx_bad_end_of_element);
    EXPECT_EQ(debug.item_name, "Object");
    EXPECT_STREQ(debug.p_prog_file, "reader.cpp");
    EXPECT_EQ(debug.prog_line, 120);
    EXPECT_EQ(debug.xml_line, 33);
}

TEST(DebugError, ClearResetsEveryField) {
    lmx::s_debug_error debug;
    debug.set(lmx::elmx_bad_end_of_element, "Object", "reader.cpp", 120, 33);
    debug.clear();
    EXPECT_EQ(debug.error, lmx::elmx_ok);
    EXPECT_EQ(debug.item_name, "");
    EXPECT_STREQ(debug.p_prog_file, "(not set)");
    EXPECT_EQ(debug.prog_line, -1);
    EXPECT_EQ(debug.xml_line, -1);
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

TEST(DebugError, OkCodeStopsTheTextAfterTheFirstLineWhateverTheOtherFields) {
    lmx::s_debug_error debug;
    debug.set(lmx::elmx_ok, "item", "file.cpp", 10, 20);
    EXPECT_EQ(debug.to_string(), "Error: No Error\n");
}

TEST(DebugError, FullTextFormWithXmlLine) {
    lmx::s_debug_error debug;
    debug.set(lmx::elmx_unexpected_attribute, "@colour", "cxf3.cpp", 4711, 42);
    EXPECT_EQ(debug.to_string(), "Error: Unexpected attribute\n"
                                 "Item: @colour\n"
                                 "Program file: cxf3.cpp\n"
                                 "Program line: 4711\n"
                                 "XML line: 42\n");
}

TEST(DebugError, TextFormWithoutXmlLineWhenItIsMinusOne) {
    lmx::s_debug_error debug;
    debug.set(lmx::elmx_mandatory_element_missing, "Object", "writer.cpp", 8, -1);
    EXPECT_EQ(debug.to_string(), "Error: Mandatory element missing\n"
                                 "Item: Object\n"
                                 "Program file: writer.cpp\n"
                                 "Program line: 8\n");
}

TEST(DebugError, TextFormWithEmptyItemAndNegativeProgramLine) {
    lmx::s_debug_error debug;
    debug.set(lmx::elmx_user_defined_9, "", "(not set)", -1, 0);
    EXPECT_EQ(debug.to_string(), "Error: User defined error 9\n"
                                 "Item: \n"
                                 "Program file: (not set)\n"
                                 "Program line: -1\n"
                                 "XML line: 0\n");
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

TEST(ReaderErrors, FreshReaderHasNoError) {
    const std::string document = "<a/>";
    lmx::c_xml_reader_memory reader(document);
    EXPECT_EQ(reader.get_error(), lmx::elmx_ok);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_ok);
    EXPECT_EQ(reader.get_error_message(), "Error: No Error\n");
    EXPECT_STREQ(reader.get_code_location().p_prog_file, "<unspecified>");
    EXPECT_EQ(reader.get_code_location().prog_line, -1);
}

TEST(ReaderErrors, EncodingMismatchInXmlDeclarationEndsWithThatCodeEverywhere) {
    const std::string document = "<?xml version=\"1.0\" encoding=\"UTF-16\"?><a><b/></a>";
    lmx::c_xml_reader_memory reader(document);
    tessarine_test::traced_walk walk = tessarine_test::walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_encoding_mismatch);
    EXPECT_EQ(reader.get_error(), lmx::elmx_encoding_mismatch);
    EXPECT_TRUE(reader.get_error_record().is_fatal_errored());
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_encoding_mismatch);
    EXPECT_EQ(walk.seen.elements.size(), 0u);
}

TEST(ReaderErrors, EndOfInputAfterEncodingMismatchIsReportedAsTheMismatch) {
    const std::string document = "<?xml version=\"1.0\" encoding=\"UTF-16\"?><a><b/></a>";
    lmx::c_xml_reader_memory reader(document);
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
    const std::string document = "<a/>";
    lmx::c_xml_reader_memory reader(document);
    EXPECT_EQ(reader.capture_error(lmx::elmx_unexpected_end_of_message, "a", "capture.cpp", 10),
              lmx::elmx_unexpected_end_of_message);
    const lmx::s_debug_error &debug = reader.get_debug_error();
    EXPECT_EQ(debug.error, lmx::elmx_unexpected_end_of_message);
    EXPECT_EQ(debug.item_name, "a");
    EXPECT_STREQ(debug.p_prog_file, "capture.cpp");
    EXPECT_EQ(debug.prog_line, 10);
    EXPECT_EQ(debug.xml_line, 1);
    // Capture writes the debug record only.
    EXPECT_EQ(reader.get_error(), lmx::elmx_ok);
}

TEST(ReaderErrors, CaptureKeepsUnexpectedEndAfterANonFatalError) {
    const std::string document = "<a/>";
    lmx::c_xml_reader_memory reader(document);
    reader.get_error_record().error(lmx::elmx_type_error, lmx::elmx_not_well_formed, nullptr, 1, "not fatal");
    EXPECT_EQ(reader.capture_error(lmx::elmx_unexpected_end_of_message, "a", "capture.cpp", 10),
              lmx::elmx_unexpected_end_of_message);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_unexpected_end_of_message);
}

TEST(ReaderErrors, CaptureReplacesUnexpectedEndByTheFatalCause) {
    const std::string document = "<a/>";
    lmx::c_xml_reader_memory reader(document);
    reader.get_error_record().error(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, nullptr, 1, "fatal");
    EXPECT_EQ(reader.capture_error(lmx::elmx_unexpected_end_of_message, "a", "capture.cpp", 11), lmx::elmx_bad_dtd);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_bad_dtd);
    EXPECT_EQ(reader.get_debug_error().item_name, "a");
    EXPECT_EQ(reader.get_debug_error().prog_line, 11);
}

TEST(ReaderErrors, CaptureLeavesOtherCodesAloneWhenFatalErrored) {
    const std::string document = "<a/>";
    lmx::c_xml_reader_memory reader(document);
    reader.get_error_record().error(lmx::elmx_type_fatal, lmx::elmx_bad_dtd, nullptr, 1, "fatal");
    EXPECT_EQ(reader.capture_error(lmx::elmx_bad_end_of_element, "a", "capture.cpp", 12),
              lmx::elmx_bad_end_of_element);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_bad_end_of_element);
    EXPECT_EQ(reader.get_error(), lmx::elmx_bad_dtd);
}

TEST(ReaderErrors, CaptureKeepsTheLastCapture) {
    const std::string document = "<a/>";
    lmx::c_xml_reader_memory reader(document);
    reader.capture_error(lmx::elmx_bad_end_of_element, "first", "one.cpp", 1);
    reader.capture_error(lmx::elmx_unexpected_attribute, "second", "two.cpp", 2);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_unexpected_attribute);
    EXPECT_EQ(reader.get_debug_error().item_name, "second");
    EXPECT_STREQ(reader.get_debug_error().p_prog_file, "two.cpp");
}

TEST(ReaderErrors, CaptureRecordsTheScannerLine) {
    const std::string document = "\n\n<a/>";
    lmx::c_xml_reader_memory reader(document);
    lmx::elmx_error error = lmx::elmx_ok;
    ASSERT_EQ(reader.get_element_event(&error), lmx::xe_name);
    reader.capture_error(lmx::elmx_element_not_found, "a", "capture.cpp", 3);
    EXPECT_EQ(reader.get_debug_error().xml_line, 3);
    EXPECT_EQ(reader.get_line_no(), 3);
}

TEST(ReaderErrors, HandleErrorTakesNameAndCodeLocationFromTheReader) {
    const std::string document = "<abc/>";
    lmx::c_xml_reader_memory reader(document);
    lmx::elmx_error error = lmx::elmx_ok;
    ASSERT_EQ(reader.get_element_event(&error), lmx::xe_name);
    reader.set_code_file("generated.cpp");
    reader.set_code_line(77);
    EXPECT_EQ(reader.handle_error(lmx::elmx_element_not_found), lmx::elmx_element_not_found);
    const lmx::s_debug_error &debug = reader.get_debug_error();
    EXPECT_EQ(debug.error, lmx::elmx_element_not_found);
    EXPECT_EQ(debug.item_name, "abc");
    EXPECT_STREQ(debug.p_prog_file, "generated.cpp");
    EXPECT_EQ(debug.prog_line, 77);
    EXPECT_EQ(debug.xml_line, 1);
}

TEST(ReaderErrors, HandleErrorWithLineTakesTheLineFromTheArgument) {
    const std::string document = "<abc/>";
    lmx::c_xml_reader_memory reader(document);
    lmx::elmx_error error = lmx::elmx_ok;
    ASSERT_EQ(reader.get_element_event(&error), lmx::xe_name);
    reader.set_code_file("generated.cpp");
    reader.set_code_line(77);
    EXPECT_EQ(reader.handle_error(lmx::elmx_bad_choice, 88), lmx::elmx_bad_choice);
    EXPECT_EQ(reader.get_debug_error().item_name, "abc");
    EXPECT_STREQ(reader.get_debug_error().p_prog_file, "generated.cpp");
    EXPECT_EQ(reader.get_debug_error().prog_line, 88);
}

TEST(ReaderErrors, HandleErrorBeforeAnyCodeLocationUsesTheUnspecifiedFile) {
    const std::string document = "<abc/>";
    lmx::c_xml_reader_memory reader(document);
    lmx::elmx_error error = lmx::elmx_ok;
    ASSERT_EQ(reader.get_element_event(&error), lmx::xe_name);
    reader.handle_error(lmx::elmx_element_not_found);
    EXPECT_STREQ(reader.get_debug_error().p_prog_file, "<unspecified>");
    EXPECT_EQ(reader.get_debug_error().prog_line, -1);
}

TEST(ReaderErrors, HandleErrorWithAllArgumentsUsesThem) {
    const std::string document = "<abc/>";
    lmx::c_xml_reader_memory reader(document);
    EXPECT_EQ(reader.handle_error(lmx::elmx_value_above_maximum, "Value", "values.cpp", 5),
              lmx::elmx_value_above_maximum);
    EXPECT_EQ(reader.get_debug_error().item_name, "Value");
    EXPECT_STREQ(reader.get_debug_error().p_prog_file, "values.cpp");
    EXPECT_EQ(reader.get_debug_error().prog_line, 5);
}

TEST(ReaderErrors, HandleAttributeErrorPutsAtSignBeforeTheCurrentName) {
    const std::string document = "<Colour/>";
    lmx::c_xml_reader_memory reader(document);
    lmx::elmx_error error = lmx::elmx_ok;
    ASSERT_EQ(reader.get_element_event(&error), lmx::xe_name);
    reader.set_code_file("attributes.cpp");
    reader.set_code_line(9);
    EXPECT_EQ(reader.handle_attribute_error(lmx::elmx_unexpected_attribute), lmx::elmx_unexpected_attribute);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_unexpected_attribute);
    EXPECT_EQ(reader.get_debug_error().item_name, "@Colour");
    EXPECT_STREQ(reader.get_debug_error().p_prog_file, "attributes.cpp");
    EXPECT_EQ(reader.get_debug_error().prog_line, 9);
}

TEST(ReaderErrors, UnreadableAttributeIsReportedWithAtSignAndItsName) {
    const std::string document = "<a colour=\"&undefined;\"/>";
    lmx::c_xml_reader_memory reader(document);
    tessarine_test::traced_walk walk = tessarine_test::walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_unable_to_read_attribute);
    EXPECT_EQ(reader.get_debug_error().item_name, "@colour");
}

TEST(ReaderErrors, ErrorMessageIsTheTextFormOfTheDebugRecord) {
    const std::string document = "<a/>";
    lmx::c_xml_reader_memory reader(document);
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
    const std::string document = "<a>\n<b>";
    lmx::c_xml_reader_memory reader(document);
    tessarine_test::traced_walk walk = tessarine_test::walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_unexpected_end_of_message);
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_unexpected_end_of_message);
    EXPECT_EQ(reader.get_debug_error().xml_line, 2);
    const std::string message = reader.get_error_message();
    EXPECT_EQ(message.rfind("Error: Unexpected end of message\nItem: ", 0), 0u) << message;
    EXPECT_NE(message.find("\nXML line: 2\n"), std::string::npos) << message;
    // No low layer complained: the end of input is the cause.
    EXPECT_EQ(reader.get_error(), lmx::elmx_ok);
}

TEST(ReaderErrors, UserHookSeesTheCaptureArgumentsAndItsVerdictIsReturned) {
    hooked_reader reader("<a/>");
    EXPECT_EQ(reader.handle_error(lmx::elmx_bad_choice, "Choice", "hook.cpp", 31), lmx::elmx_bad_choice);
    ASSERT_EQ(reader.calls.size(), 1u);
    EXPECT_EQ(reader.calls[0].code, lmx::elmx_bad_choice);
    EXPECT_EQ(reader.calls[0].item, "Choice");
    EXPECT_EQ(reader.calls[0].file, "hook.cpp");
    EXPECT_EQ(reader.calls[0].line, 31);
}

TEST(ReaderErrors, UserHookReturningOkSwallowsTheError) {
    hooked_reader reader("<a/>");
    reader.swallowed = lmx::elmx_unexpected_attribute;
    EXPECT_EQ(reader.handle_error(lmx::elmx_unexpected_attribute, "@x", "hook.cpp", 1), lmx::elmx_ok);
    // The capture happened before the hook was asked.
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_unexpected_attribute);
    EXPECT_EQ(reader.get_debug_error().item_name, "@x");
    // Other codes still come through.
    EXPECT_EQ(reader.handle_error(lmx::elmx_bad_choice, "c", "hook.cpp", 2), lmx::elmx_bad_choice);
}

TEST(ReaderErrors, ShortFormsAndAttributeFormReachTheUserHook) {
    hooked_reader reader("<abc/>");
    lmx::elmx_error error = lmx::elmx_ok;
    ASSERT_EQ(reader.get_element_event(&error), lmx::xe_name);
    reader.set_code_file("generated.cpp");
    reader.set_code_line(5);
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
    EXPECT_EQ(reader.handle_error(lmx::elmx_unexpected_attribute, "@x", "hook.cpp", 1), lmx::elmx_ok);
    EXPECT_EQ(reader.handle_error(lmx::elmx_bad_end_of_element, "a", "hook.cpp", 2), lmx::elmx_bad_end_of_element);
    ASSERT_EQ(reader.seen.size(), 2u);
    EXPECT_EQ(reader.seen[0], lmx::elmx_unexpected_attribute);
    EXPECT_EQ(reader.seen[1], lmx::elmx_bad_end_of_element);
}

TEST(ReaderErrors, DefaultHooksReturnTheCode) {
    const std::string document = "<a/>";
    lmx::c_xml_reader_memory reader(document);
    EXPECT_EQ(reader.user_handle_error(lmx::elmx_bad_choice), lmx::elmx_bad_choice);
    EXPECT_EQ(reader.user_handle_error(lmx::elmx_bad_choice, "x", "f.cpp", 1), lmx::elmx_bad_choice);
    // The hooks alone capture nothing.
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_ok);
}

TEST(ReaderErrors, SwallowedErrorLetsTheWalkCarryOn) {
    // Text after the root is refused by the walk; a reader that swallows
    // that refusal reads on to the end.
    hooked_reader reader("<a><b/></a>trailing");
    reader.swallowed = lmx::elmx_xml_badly_formed;
    tessarine_test::traced_walk walk = tessarine_test::walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<a><b></b></a>");
    EXPECT_EQ(reader.get_debug_error().error, lmx::elmx_xml_badly_formed);
    ASSERT_EQ(reader.calls.size(), 1u);
    EXPECT_EQ(reader.calls[0].code, lmx::elmx_xml_badly_formed);
}

TEST(ReaderErrors, RewindKeepsTheErrorState) {
    const std::string document = "<?xml version=\"1.0\" encoding=\"UTF-16\"?><a/>";
    lmx::c_xml_reader_memory reader(document);
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
    const std::string document = "<a><!-- comment ---><b/></a>";
    lmx::c_xml_reader_memory reader(document);
    tessarine_test::traced_walk walk = tessarine_test::walk_traced(reader);
    EXPECT_EQ(walk.error(), lmx::elmx_ok) << walk.result.message;
    EXPECT_EQ(walk.trace(), "<a><b></b></a>");
    EXPECT_EQ(reader.get_error(), lmx::elmx_bad_comment);
    EXPECT_FALSE(reader.get_error_record().is_fatal_errored());
    EXPECT_EQ(reader.get_error_record().get_warning_count(), 1);
}

} // namespace
