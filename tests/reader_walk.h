// Helpers shared by the tests of the reading side of the XML runtime.
//
//  - recording_error: a c_error that keeps every report it is handed, with
//    the message words, so that tests can check what the low layers said.
//  - getter_over_text: a decoding getter (or a layer on it) over an input of
//    its own, reporting to a recording_error of its own.
//  - text_reader: a memory reader that keeps its own copy of the text;
//    long_hook_reader and short_hook_reader write down what their error hooks
//    are handed and may swallow codes.
//  - next_event_is, at_root_with_code_location: the first steps of a test on
//    a reader.
//  - expect_debug_error, expect_code_location: the fields of an s_debug_error.
//  - walk_traced: the complete reader walk of tools/xml_walk.h (the walk that
//    xmlcheck does) with a visitor that writes down what it met as a trace:
//        <name>      a start tag
//        [name=value] an attribute, after its start tag
//        text        a text run, as delivered
//        </name>     the end of an element, "/>" included
//    so that <r a="1"><x>t</x><y/></r> walks to "<r>[a=1]<x>t</x><y></y></r>".
//    document_walk keeps the reader of such a walk for the test to question;
//    expect_walk checks how a walk ended and what it met, expect_clean_walk a
//    table row of a document that walks without error.
//  - scan_document: the same walk one layer down, on c_xml with a c_error of
//    the test's own, for tests that need the messages of a whole document;
//    expect_scan_report checks how such a scan ended and what it reported.
//  - expect_constants: enumerators and the values they must keep.
//  - nested_elements, temp_file: documents and files to read.
#ifndef TESSARINE_TESTS_READER_WALK_H
#define TESSARINE_TESTS_READER_WALK_H

#include <cstddef>
#include <filesystem>
#include <fstream>
#include <initializer_list>
#include <optional>
#include <random>
#include <string>
#include <system_error>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include <lmx/lmxparse.h>

#include "tools/xml_walk.h"

namespace tessarine_test {

// ---------------------------------------------------------------------------
// Error records and readers
// ---------------------------------------------------------------------------

struct reported_error {
    lmx::elmx_error_type type;
    lmx::elmx_error code;
    bool has_file;
    std::string file;
    int line;
    std::string message;
};

// Keeps every report_error call.
class recording_error : public lmx::c_error {
public:
    void report_error(lmx::elmx_error_type a_type, lmx::elmx_error a_code, const char *ap_file, int a_line,
                      const char *ap_msg) override {
        m_reports.push_back(
            {a_type, a_code, ap_file != nullptr, ap_file ? ap_file : "", a_line, ap_msg ? ap_msg : ""});
    }

    const std::vector<reported_error> &reports() const { return m_reports; }

    // True if some report has this code (and exactly this message, and this type).
    bool reported(lmx::elmx_error a_code) const {
        for (const reported_error &r : m_reports)
            if (r.code == a_code)
                return true;
        return false;
    }
    bool reported(lmx::elmx_error a_code, const std::string &ar_message) const {
        for (const reported_error &r : m_reports)
            if (r.code == a_code && r.message == ar_message)
                return true;
        return false;
    }
    bool reported(lmx::elmx_error_type a_type, lmx::elmx_error a_code, const std::string &ar_message) const {
        for (const reported_error &r : m_reports)
            if (r.type == a_type && r.code == a_code && r.message == ar_message)
                return true;
        return false;
    }

    // All reports, one a line, for failure messages.
    std::string describe() const {
        std::string text;
        for (const reported_error &r : m_reports)
            text += "type " + std::to_string(r.type) + " code " + std::to_string(r.code) + " line " +
                    std::to_string(r.line) + ": " + r.message + "\n";
        return text.empty() ? "(no reports)" : text;
    }

private:
    std::vector<reported_error> m_reports;
};

namespace detail {
// Comes before the reader among the bases, so that the text is there first.
struct owned_text {
    std::string m_text;
};
} // namespace detail

// A memory reader over its own copy of the text, which lives as long as the reader.
class text_reader : private detail::owned_text, public lmx::c_xml_reader_memory {
public:
    explicit text_reader(std::string a_text)
        : detail::owned_text{std::move(a_text)}, lmx::c_xml_reader_memory(m_text) {}
};

// A reader whose long error hook writes down every call; it answers elmx_ok
// to the code in `swallowed` and passes any other on to the default hook.
class long_hook_reader : public text_reader {
public:
    using text_reader::text_reader;

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
        return text_reader::user_handle_error(a_error, ar_item_name, ap_prog_file, a_prog_line);
    }
    using text_reader::user_handle_error;

    lmx::elmx_error swallowed = lmx::elmx_ok;
    std::vector<hook_call> calls;
};

// A reader that only overrides the short error hook, which the default long
// hook asks. It writes down every code and answers elmx_ok to the code in
// `swallowed`, or to every code with swallow_all.
class short_hook_reader : public text_reader {
public:
    using text_reader::text_reader;

    lmx::elmx_error user_handle_error(lmx::elmx_error a_error) override {
        seen.push_back(a_error);
        return swallow_all || a_error == swallowed ? lmx::elmx_ok : a_error;
    }
    using text_reader::user_handle_error;

    bool swallow_all = false;
    lmx::elmx_error swallowed = lmx::elmx_ok;
    std::vector<lmx::elmx_error> seen;
};

// A getter (c_get_as_utf8 or a layer on it) over its own copy of an input,
// reporting to a record of its own.
template <typename G> class getter_over_text {
public:
    // a_getter_arguments follow the source and the record in G's constructor.
    template <typename... A>
    explicit getter_over_text(std::string a_input, A... a_getter_arguments)
        : m_input(std::move(a_input)), m_source(m_input.data(), m_input.size()),
          m_getter(m_source, m_error, a_getter_arguments...) {}

    G &getter() { return m_getter; }
    recording_error &error() { return m_error; }

    // Everything up to the first -1, as bytes.
    std::string read_to_end() {
        std::string out;
        for (std::size_t guard = 0; guard < (1u << 26); ++guard) {
            int c = m_getter.get();
            if (c == -1)
                break;
            EXPECT_GE(c, 0);
            EXPECT_LE(c, 255);
            out.push_back(static_cast<char>(c));
        }
        return out;
    }

private:
    std::string m_input;
    lmx::c_read_memory m_source;
    recording_error m_error;
    G m_getter;
};

// The item, program file and program line of an error record.
inline void expect_code_location(const lmx::s_debug_error &ar_debug, const std::string &ar_item,
                                 const char *ap_prog_file, int a_prog_line) {
    EXPECT_EQ(ar_debug.item_name, ar_item);
    EXPECT_STREQ(ar_debug.p_prog_file, ap_prog_file);
    EXPECT_EQ(ar_debug.prog_line, a_prog_line);
}

// Every field of an error record.
inline void expect_debug_error(const lmx::s_debug_error &ar_debug, lmx::elmx_error a_error,
                               const std::string &ar_item, const char *ap_prog_file, int a_prog_line,
                               int a_xml_line) {
    EXPECT_EQ(ar_debug.error, a_error);
    expect_code_location(ar_debug, ar_item, ap_prog_file, a_prog_line);
    EXPECT_EQ(ar_debug.xml_line, a_xml_line);
}

// Reads the next element event in the form a reading test calls it: with or
// without a table of events, into the reader's own name or into *ap_name. The
// event must be a_expected.
inline ::testing::AssertionResult next_event_is(lmx::c_xml_reader &ar_reader, int a_expected,
                                                const lmx::s_event_map *ap_events = nullptr,
                                                std::string *ap_name = nullptr) {
    lmx::elmx_error error = lmx::elmx_ok;
    int event;
    if (ap_events)
        event = ap_name ? ar_reader.get_element_event(ap_events, &error, ap_name)
                        : ar_reader.get_element_event(ap_events, &error);
    else
        event = ap_name ? ar_reader.get_element_event(&error, ap_name) : ar_reader.get_element_event(&error);
    if (event == a_expected)
        return ::testing::AssertionSuccess();
    return ::testing::AssertionFailure() << "element event " << event << " (error " << error << "), expected "
                                         << a_expected;
}

// Puts the reader on the root's start tag with the code location that
// generated reading code sets before it reports about the element.
inline ::testing::AssertionResult at_root_with_code_location(lmx::c_xml_reader &ar_reader, const char *ap_code_file,
                                                             int a_code_line) {
    ::testing::AssertionResult at_root = next_event_is(ar_reader, lmx::xe_name);
    ar_reader.set_code_file(ap_code_file);
    ar_reader.set_code_line(a_code_line);
    return at_root;
}

// ---------------------------------------------------------------------------
// The reader walk
// ---------------------------------------------------------------------------

// Writes down what the walk meets.
class trace_visitor : public tessarine_tools::xml_walk_visitor {
public:
    void on_start(lmx::c_xml_reader &, const std::string &ar_name) override {
        trace += "<" + ar_name + ">";
        elements.push_back(ar_name);
    }
    void on_attribute(lmx::c_xml_reader &, const std::string &ar_name, const std::string &ar_value) override {
        trace += "[" + ar_name + "=" + ar_value + "]";
        attributes.emplace_back(ar_name, ar_value);
    }
    void on_text(lmx::c_xml_reader &, const std::string &ar_text) override {
        trace += ar_text;
        texts.push_back(ar_text);
    }
    void on_end(lmx::c_xml_reader &, const std::string &ar_name) override { trace += "</" + ar_name + ">"; }

    std::string trace;
    std::vector<std::string> elements;
    std::vector<std::pair<std::string, std::string>> attributes;
    std::vector<std::string> texts;
};

struct traced_walk {
    tessarine_tools::xml_walk_result result;
    trace_visitor seen;

    lmx::elmx_error error() const { return result.error; }
    const std::string &trace() const { return seen.trace; }
};

// Walks the document the reader stands at the start of.
inline traced_walk walk_traced(lmx::c_xml_reader &ar_reader) {
    traced_walk walk;
    walk.result = tessarine_tools::walk_xml(ar_reader, &walk.seen);
    return walk;
}

// Walks a document held in memory with a reader of its own.
inline traced_walk walk_traced(const std::string &ar_document) {
    lmx::c_xml_reader_memory reader(ar_document);
    return walk_traced(reader);
}

// A document walked by a memory reader of its own; the reader stays for the
// test to question.
struct document_walk {
    explicit document_walk(const std::string &ar_document) : reader(ar_document), walk(walk_traced(reader)) {}

    text_reader reader;
    traced_walk walk;
};

// The walk ended with a_error (and met what ar_trace says).
inline void expect_walk(const traced_walk &ar_walk, lmx::elmx_error a_error) {
    EXPECT_EQ(ar_walk.error(), a_error) << ar_walk.result.message;
}
inline void expect_walk(const traced_walk &ar_walk, lmx::elmx_error a_error, const std::string &ar_trace) {
    expect_walk(ar_walk, a_error);
    EXPECT_EQ(ar_walk.trace(), ar_trace);
}

// A document that walks without error with a reader of its own, what the walk
// meets and the state the reader is left in. What is left empty is not checked.
struct clean_walk_row {
    const char *name;
    std::string document;
    const char *trace = nullptr;
    int line = 0;                               // the reader's line number at the end
    std::optional<lmx::e_encoding_mode> mode{}; // the encoding the reader settled on
};

inline void expect_clean_walk(const clean_walk_row &ar_row) {
    SCOPED_TRACE(ar_row.name);
    document_walk w(ar_row.document);
    expect_walk(w.walk, lmx::elmx_ok);
    if (ar_row.trace) {
        EXPECT_EQ(w.walk.trace(), ar_row.trace);
    }
    if (ar_row.line != 0) {
        EXPECT_EQ(w.reader.get_line_no(), ar_row.line);
    }
    if (ar_row.mode) {
        EXPECT_EQ(w.reader.get_encoding_mode(), *ar_row.mode);
    }
}

// ---------------------------------------------------------------------------
// The scanner walk
// ---------------------------------------------------------------------------

// The outcome of a walk at the scanner level.
struct scan_result {
    // The event that ended the scan: xe_end_of_input when it ran to the end.
    int last_event = lmx::xe_end_of_input;
    // An attribute value could not be read (the scan stopped there).
    bool value_failed = false;
    // As the trace of walk_traced, except that end tags are written as met
    // and "/>" as "</>".
    std::string trace;
    // Start tags met, and elements still open at the end.
    int elements = 0;
    int open = 0;

    // Ran to the end of input with every element closed.
    bool ok() const {
        return last_event == lmx::xe_end_of_input && !value_failed && elements > 0 && open == 0;
    }
};

// Pulls every event from the scanner: element names, attributes with their
// values (read in a_ws_mode), text, end tags, until the end of input or an
// error event.
inline scan_result scan_all(lmx::c_xml &ar_xml, lmx::elmx_whitespace a_ws_mode = lmx::ws_preserve) {
    scan_result result;
    lmx::c_xml_local scope;
    std::string name;
    std::string value;
    for (;;) {
        scope.clear();
        int event = ar_xml.get_element_name(&scope, &name);
        switch (event) {
        case lmx::xe_text:
            result.trace += name;
            break;
        case lmx::xe_end_tag:
            result.trace += "</" + name + ">";
            --result.open;
            break;
        case lmx::xe_name: {
            result.trace += "<" + name + ">";
            ++result.elements;
            for (;;) {
                std::string attribute;
                int attribute_event = ar_xml.get_attribute_name(&attribute);
                if (attribute_event == lmx::xe_name) {
                    if (!ar_xml.get_attribute_value(&value, a_ws_mode)) {
                        result.value_failed = true;
                        result.last_event = attribute_event;
                        return result;
                    }
                    result.trace += "[" + attribute + "=" + value + "]";
                    continue;
                }
                if (attribute_event == lmx::xe_end_tag) {
                    result.trace += "</>";
                } else if (attribute_event == lmx::xe_start_tag_end) {
                    ++result.open;
                } else {
                    result.last_event = attribute_event;
                    return result;
                }
                break;
            }
            break;
        }
        default: // xe_end_of_input, xe_fatal, xe_error
            result.last_event = event;
            return result;
        }
    }
}

// Scans a document held in memory, reporting to the caller's c_error. The
// scanner is built as the reader builds it (character references counted as
// literal characters for whitespace handling).
inline scan_result scan_document(const std::string &ar_document, lmx::c_error &ar_error,
                                 lmx::elmx_whitespace a_ws_mode = lmx::ws_preserve) {
    lmx::c_read_memory source(ar_document.data(), ar_document.size());
    lmx::c_xml xml(source, ar_error, true);
    return scan_all(xml, a_ws_mode);
}

// How the scan of a whole document must end.
enum class scan_end {
    ok,          // scan_result::ok()
    fails,       // not ok()
    value_fails, // an attribute value could not be read
};

// Scans the document with a record of its own: the scan ends as a_end says and
// the record holds a report of a_type and a_code with exactly ar_message.
inline void expect_scan_report(const std::string &ar_document, scan_end a_end, lmx::elmx_error_type a_type,
                               lmx::elmx_error a_code, const std::string &ar_message) {
    recording_error error;
    const scan_result scan = scan_document(ar_document, error);
    switch (a_end) {
    case scan_end::ok:
        EXPECT_TRUE(scan.ok());
        break;
    case scan_end::fails:
        EXPECT_FALSE(scan.ok());
        break;
    case scan_end::value_fails:
        EXPECT_TRUE(scan.value_failed);
        break;
    }
    EXPECT_TRUE(error.reported(a_type, a_code, ar_message)) << error.describe();
}

// ---------------------------------------------------------------------------
// Constants, documents and files
// ---------------------------------------------------------------------------

// An enumerator, by name, and the value it must keep.
struct constant_row {
    const char *name;
    long long value;
    long long expected;
};
#define TESSARINE_CONSTANT(a_constant, a_expected)                                                                 \
    tessarine_test::constant_row { #a_constant, static_cast<long long>(a_constant), a_expected }

inline void expect_constants(std::initializer_list<constant_row> a_rows) {
    for (const constant_row &row : a_rows) {
        SCOPED_TRACE(row.name);
        EXPECT_EQ(row.value, row.expected);
    }
}

// a_levels elements "e", each the only child of the one before.
inline std::string nested_elements(int a_levels) {
    std::string text;
    text.reserve(static_cast<std::size_t>(a_levels) * 7);
    for (int i = 0; i < a_levels; ++i)
        text += "<e>";
    for (int i = 0; i < a_levels; ++i)
        text += "</e>";
    return text;
}

// A file under the temporary directory, removed again at the end of the test.
class temp_file {
public:
    explicit temp_file(const std::string &ar_content) {
        m_path = std::filesystem::temp_directory_path() / unique_name(".xml");
        write(m_path, ar_content);
    }
    // A file whose name is given as UTF-8.
    temp_file(const std::string &ar_content, const std::string &ar_utf8_name) {
        m_path = std::filesystem::temp_directory_path() / std::filesystem::u8path(ar_utf8_name);
        write(m_path, ar_content);
    }
    ~temp_file() {
        std::error_code ignored;
        std::filesystem::remove(m_path, ignored);
    }
    temp_file(const temp_file &) = delete;
    temp_file &operator=(const temp_file &) = delete;

    std::string path() const { return m_path.string(); }
    const std::filesystem::path &fs_path() const { return m_path; }

    // A name no other file of this run has.
    static std::string unique_name(const std::string &ar_suffix) {
        static unsigned counter = 0;
        static const unsigned salt = std::random_device{}();
        return "tessarine_test_" + std::to_string(salt) + "_" + std::to_string(++counter) + ar_suffix;
    }

private:
    static void write(const std::filesystem::path &ar_path, const std::string &ar_content) {
        std::ofstream out(ar_path, std::ios::binary | std::ios::trunc);
        out.write(ar_content.data(), static_cast<std::streamsize>(ar_content.size()));
        ASSERT_TRUE(out.good()) << "cannot write " << ar_path.string();
    }

    std::filesystem::path m_path;
};

} // namespace tessarine_test

#endif
