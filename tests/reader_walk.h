// Helpers shared by the tests of the reading side of the XML runtime.
//
//  - recording_error: a c_error that keeps every report it is handed, with
//    the message words, so that tests can check what the low layers said.
//  - walk_traced: the complete reader walk of tools/xml_walk.h (the walk that
//    xmlcheck does) with a visitor that writes down what it met as a trace:
//        <name>      a start tag
//        [name=value] an attribute, after its start tag
//        text        a text run, as delivered
//        </name>     the end of an element, "/>" included
//    so that <r a="1"><x>t</x><y/></r> walks to "<r>[a=1]<x>t</x><y></y></r>".
//  - scan_document: the same walk one layer down, on c_xml with a c_error of
//    the test's own, for tests that need the messages of a whole document.
#ifndef TESSARINE_TESTS_READER_WALK_H
#define TESSARINE_TESTS_READER_WALK_H

#include <cstddef>
#include <string>
#include <utility>
#include <vector>

#include <lmx/lmxparse.h>

#include "tools/xml_walk.h"

namespace tessarine_test {

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

    // True if some report has this code and exactly this message.
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

} // namespace tessarine_test

#endif
