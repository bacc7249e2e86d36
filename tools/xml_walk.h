// A complete walk over an XML document through lmx::c_xml_reader: every
// element, every attribute (name and value) and every run of text.
//
// tools/xmlcheck and the tests share this walk, so that what the tool reports
// for a file is exactly what the tests check.
//
// The walk is iterative, so a deeply nested document costs heap, not stack.
// It opens one namespace scope per open element, as the generated reading
// code does, so that a visitor can resolve names with get_namespace().
//
// Counting rules:
//   - an element is counted when its start tag is met;
//   - an attribute is counted when its value has been read (in ws_preserve);
//     namespace declarations (xmlns, xmlns:p) are not attributes here;
//   - a text run is one xe_text event: character data up to the next markup,
//     or one CDATA section. White space standing before a tag is not text.
//
// The walk fails with
//   - the scanner's code when an event is an error event and a code was
//     recorded, else elmx_xml_badly_formed;
//   - elmx_unable_to_read_attribute when a value cannot be expanded;
//   - elmx_bad_end_of_element when an end tag does not close the open element;
//   - elmx_xml_badly_formed for a second root element or text outside the root;
//   - elmx_unexpected_end_of_message when the input ends before the root has
//     ended (the reader replaces it by the real cause after a fatal error);
//   - elmx_unable_to_open_file for a file that cannot be opened.
// Every failure goes through c_xml_reader::handle_error, so a derived reader
// may swallow it; the walk then carries on.
#ifndef TESSARINE_TOOLS_XML_WALK_H
#define TESSARINE_TOOLS_XML_WALK_H

#include <cstddef>
#include <deque>
#include <string>
#include <vector>

#include <lmx/lmxparse.h>

namespace tessarine_tools {

struct xml_walk_result {
    std::size_t elements = 0;
    std::size_t attributes = 0;
    std::size_t text_runs = 0;
    // elmx_ok when the whole document was walked.
    lmx::elmx_error error = lmx::elmx_ok;
    // The reader's error report (code, item, program file and line, XML line);
    // empty on success.
    std::string message;

    bool ok() const { return error == lmx::elmx_ok; }
};

// Optional observer of the walk. The reader is passed so that a visitor can
// ask for namespaces, line numbers and the like at each step.
class xml_walk_visitor {
public:
    virtual ~xml_walk_visitor() = default;
    // A start tag; its namespace declarations are in force.
    virtual void on_start(lmx::c_xml_reader & /*ar_reader*/, const std::string & /*ar_name*/) {}
    virtual void on_attribute(lmx::c_xml_reader & /*ar_reader*/, const std::string & /*ar_name*/,
                              const std::string & /*ar_value*/) {}
    virtual void on_text(lmx::c_xml_reader & /*ar_reader*/, const std::string & /*ar_text*/) {}
    // The end of an element, "/>" included.
    virtual void on_end(lmx::c_xml_reader & /*ar_reader*/, const std::string & /*ar_name*/) {}
};

namespace detail {

inline const char *xml_walk_file_name() { return "tools/xml_walk.h"; }

class xml_walker {
public:
    xml_walker(lmx::c_xml_reader &ar_reader, xml_walk_visitor *ap_visitor)
        : m_reader(ar_reader), p_visitor(ap_visitor) {}

    xml_walk_result run() {
        m_reader.set_code_file(xml_walk_file_name());
        for (;;) {
            lmx::elmx_error error = lmx::elmx_ok;
            int event = m_reader.get_element_event(&error, &m_name);
            switch (event) {
            case lmx::xe_name:
                if (!p_element())
                    return p_finish();
                break;
            case lmx::xe_text:
                if (m_depth == 0) {
                    if (p_fail(lmx::elmx_xml_badly_formed, "", __LINE__))
                        return p_finish();
                    break;
                }
                ++m_result.text_runs;
                if (p_visitor)
                    p_visitor->on_text(m_reader, m_name);
                break;
            case lmx::xe_end_tag:
                if (m_depth == 0 || m_open[m_depth - 1] != m_name) {
                    if (p_fail(lmx::elmx_bad_end_of_element, m_depth == 0 ? m_name : m_open[m_depth - 1], __LINE__))
                        return p_finish();
                    break;
                }
                p_close();
                break;
            case lmx::xe_end_of_input:
                if (m_depth != 0 || !m_root_done) {
                    p_fail(lmx::elmx_unexpected_end_of_message, m_depth == 0 ? std::string() : m_open[m_depth - 1],
                           __LINE__);
                    return p_finish();
                }
                // Input that ends because the decoder gave up is no success.
                if (m_reader.get_error_record().is_fatal_errored())
                    p_fail(m_reader.get_error(), "", __LINE__);
                return p_finish();
            default: // xe_fatal, xe_error and anything the reader should not give here
                if (p_fail(error != lmx::elmx_ok ? error : lmx::elmx_xml_badly_formed,
                           m_depth == 0 ? m_name : m_open[m_depth - 1], __LINE__))
                    return p_finish();
                break;
            }
        }
    }

private:
    // A start tag and its attributes; false when the walk must stop.
    bool p_element() {
        if (m_root_done && m_depth == 0) {
            if (p_fail(lmx::elmx_xml_badly_formed, m_name, __LINE__))
                return false;
        }
        ++m_result.elements;
        // The name goes on the stack of open elements; its strings are reused.
        if (m_open.size() == m_depth)
            m_open.emplace_back();
        std::string &element_name = m_open[m_depth];
        element_name.swap(m_name); // m_name is refilled by the next event
        if (p_visitor)
            p_visitor->on_start(m_reader, element_name);

        for (;;) {
            lmx::elmx_error error = lmx::elmx_ok;
            // No map: the name is cracked but not tokenised. False means the
            // tag is over, on xe_start_tag_end or xe_end_tag.
            if (!m_reader.get_attribute_event(nullptr, &error, &m_attribute_name))
                break;
            int event = m_reader.get_current_event();
            if (lmx::c_xml::is_error_event(event) || event == lmx::xe_end_of_input || error != lmx::elmx_ok) {
                lmx::elmx_error code = error != lmx::elmx_ok ? error : lmx::elmx_xml_badly_formed;
                if (p_fail(code, element_name, __LINE__))
                    return false;
                if (event == lmx::xe_end_of_input)
                    break;
                continue;
            }
            if (!m_reader.get_attribute_value(&m_value, lmx::ws_preserve)) {
                if (p_fail(lmx::elmx_unable_to_read_attribute, "@" + m_attribute_name, __LINE__))
                    return false;
                m_reader.skip_attribute_value();
                continue;
            }
            ++m_result.attributes;
            if (p_visitor)
                p_visitor->on_attribute(m_reader, m_attribute_name, m_value);
        }

        if (m_reader.get_current_event() == lmx::xe_start_tag_end) {
            ++m_depth;
            // Children are read in a scope of their own, inside this element's.
            m_scopes.emplace_back(m_reader);
        } else {
            // "/>": the element is complete.
            if (p_visitor)
                p_visitor->on_end(m_reader, element_name);
            if (m_depth == 0)
                m_root_done = true;
        }
        return true;
    }

    void p_close() {
        // Scopes must go innermost first, which the back of the deque gives.
        if (!m_scopes.empty())
            m_scopes.pop_back();
        --m_depth;
        if (p_visitor)
            p_visitor->on_end(m_reader, m_open[m_depth]);
        if (m_depth == 0)
            m_root_done = true;
    }

    // Reports through the reader; true when the walk must stop (the verdict
    // was not swallowed).
    bool p_fail(lmx::elmx_error a_code, const std::string &ar_item, int a_line) {
        lmx::elmx_error verdict = m_reader.handle_error(a_code, ar_item, xml_walk_file_name(), a_line);
        if (verdict == lmx::elmx_ok)
            return false;
        m_result.error = verdict;
        m_result.message = m_reader.get_error_message();
        return true;
    }

    xml_walk_result p_finish() {
        // Close the scopes innermost first before the reader sees them go.
        while (!m_scopes.empty())
            m_scopes.pop_back();
        return m_result;
    }

    lmx::c_xml_reader &m_reader;
    xml_walk_visitor *p_visitor;
    xml_walk_result m_result;
    // Names of the open elements: the first m_depth entries.
    std::vector<std::string> m_open;
    std::size_t m_depth = 0;
    // One scope per open element; a deque keeps their addresses stable.
    std::deque<lmx::c_xml_reader_local> m_scopes;
    bool m_root_done = false;
    std::string m_name;
    std::string m_attribute_name;
    std::string m_value;
};

} // namespace detail

// Walks the document the reader stands at the start of.
inline xml_walk_result walk_xml(lmx::c_xml_reader &ar_reader, xml_walk_visitor *ap_visitor = nullptr) {
    detail::xml_walker walker(ar_reader, ap_visitor);
    return walker.run();
}

// Walks a document held in memory; the text must stay alive for the call.
inline xml_walk_result walk_xml_text(const std::string &ar_text, xml_walk_visitor *ap_visitor = nullptr) {
    lmx::c_xml_reader_memory reader(ar_text);
    return walk_xml(reader, ap_visitor);
}

// Walks a file by its (UTF-8) path.
inline xml_walk_result walk_xml_file(const std::string &ar_path, xml_walk_visitor *ap_visitor = nullptr) {
    lmx::c_xml_reader_file reader(ar_path.c_str());
    if (!reader.is_open()) {
        xml_walk_result result;
        result.error =
            reader.handle_error(lmx::elmx_unable_to_open_file, ar_path, detail::xml_walk_file_name(), __LINE__);
        if (result.error == lmx::elmx_ok)
            result.error = lmx::elmx_unable_to_open_file; // nothing was walked
        result.message = reader.get_error_message();
        return result;
    }
    return walk_xml(reader, ap_visitor);
}

} // namespace tessarine_tools

#endif
