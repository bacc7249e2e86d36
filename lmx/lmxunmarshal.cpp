#include "lmxunmarshal.h"

namespace lmx {

// ---------------------------------------------------------------- helper

c_unmarshal_helper::c_unmarshal_helper(c_xml_reader &ar_reader)
    : ar_reader(ar_reader), m_name(ar_reader.get_element_name_stack(), ar_reader.get_name()) {}

elmx_error c_unmarshal_helper::p_handle_error(elmx_error a_error) {
    return ar_reader.handle_error(a_error, m_name.get_str(), p_prog_file, m_prog_line);
}

bool c_unmarshal_helper::p_is_own_end_tag() const {
    return ar_reader.get_current_event() == xe_end_tag && m_name == ar_reader.get_name();
}

// Every driver starts here: the location for reports, the depth limit, and
// the attributes.
elmx_error c_unmarshal_helper::p_start(const char *ap_prog_file, int a_prog_line) {
    p_prog_file = ap_prog_file;
    m_prog_line = a_prog_line;
    // Each element read by a bound class has its name on the stack, so the
    // stack's size is the nesting depth; reading deeper would cost a stack
    // frame per level with no end.
    if (ar_reader.is_too_deep(static_cast<int>(ar_reader.get_element_name_stack().size())))
        return p_handle_error(elmx_not_well_formed);
    elmx_error error = unmarshal_attributes();
    // The attribute walk leaves the last attribute's name behind; the end tag
    // of an element closed by "/>" has the element's own name.
    ar_reader.set_name(m_name.get_str());
    return error;
}

elmx_error c_unmarshal_helper::unmarshal_empty_content(const char *ap_prog_file, int a_prog_line) {
    if (elmx_error error = p_start(ap_prog_file, a_prog_line))
        return error;
    return unmarshal_empty_content_case();
}

elmx_error c_unmarshal_helper::unmarshal_simple_content(const char *ap_prog_file, int a_prog_line) {
    if (elmx_error error = p_start(ap_prog_file, a_prog_line))
        return error;
    return unmarshal_simple_content_case();
}

elmx_error c_unmarshal_helper::unmarshal_complex_content(const char *ap_prog_file, int a_prog_line) {
    if (elmx_error error = p_start(ap_prog_file, a_prog_line))
        return error;
    return unmarshal_complex_content_case();
}

// ---------------------------------------------------------------- attributes

elmx_error c_unmarshal_helper::unmarshal_attributes() {
    std::string &name = ar_reader.get_name_buffer();
    for (;;) {
        elmx_error error = elmx_ok;
        if (!ar_reader.get_attribute_event(nullptr, &error, &name))
            break;
        if (error) {
            if (elmx_error verdict = ar_reader.handle_error(error, name, p_prog_file, m_prog_line))
                return verdict;
            // A swallowed error at the end of the input must not loop.
            if (ar_reader.get_current_event() != xe_name)
                break;
            continue;
        }
        bool is_taken = unmarshal_attribute(&error);
        if (error)
            return error;
        if (is_taken)
            continue;
        if (ar_reader.is_xsi_attribute()) {
            // xsi:schemaLocation and its kin are allowed anywhere and dropped.
            ar_reader.skip_attribute_value();
        } else if (p_any_attributes) {
            std::string value;
            if (!ar_reader.get_attribute_value(&value, ws_preserve)) {
                if (elmx_error verdict =
                        ar_reader.handle_error(elmx_unable_to_read_attribute, "@" + name, p_prog_file, m_prog_line))
                    return verdict;
                continue;
            }
            // A default namespace does not apply to attributes.
            std::string ns = c_xml::k_non_namespace;
            if (ar_reader.get_cracked_name().has_prefix())
                ar_reader.get_namespace(name, &ns);
            p_any_attributes->push_back(new c_any_info(ns, name, value));
        } else {
            if (!ar_reader.is_auto_versioning())
                if (elmx_error verdict =
                        ar_reader.handle_error(elmx_unexpected_attribute, "@" + name, p_prog_file, m_prog_line))
                    return verdict;
            ar_reader.skip_attribute_value();
        }
    }
    return unmarshal_attributes_check();
}

// ---------------------------------------------------------------- content cases

elmx_error c_unmarshal_helper::verify_element_end() {
    // Only a start tag that is still the current event lets the next event
    // be fetched: text or a child already seen is content, and content of a
    // nil element is refused here.
    if (ar_reader.get_current_event() == xe_start_tag_end) {
        elmx_error error;
        ar_reader.get_element_event(&error);
        if (error)
            if (elmx_error verdict = p_handle_error(error))
                return verdict;
    }
    if (!p_is_own_end_tag())
        return p_handle_error(elmx_bad_end_of_element);
    return elmx_ok;
}

// Passes over elements that a newer schema may have added.
elmx_error c_unmarshal_helper::p_skip_unknown_elements() {
    while (ar_reader.is_current_event_tokenisable()) {
        if (!ar_reader.skip_rest_of_element(ar_reader.get_name()))
            if (elmx_error verdict = p_handle_error(elmx_bad_end_of_element))
                return verdict;
        elmx_error error;
        ar_reader.get_element_event(&error);
        if (error)
            if (elmx_error verdict = p_handle_error(error))
                return verdict;
    }
    return elmx_ok;
}

elmx_error c_unmarshal_helper::unmarshal_complex_content_case() {
    c_xml_reader_local scope(ar_reader);
    const bool is_closed = ar_reader.get_current_event() == xe_end_tag;
    if (is_closed && m_body_can_be_empty)
        return elmx_ok;
    if (!is_closed) {
        elmx_error error;
        ar_reader.get_element_event(&error);
        if (error)
            if (elmx_error verdict = p_handle_error(error))
                return verdict;
    }
    if (is_nil())
        return verify_element_end();
    if (ar_reader.get_current_event() == xe_end_tag) {
        if (!m_body_can_be_empty)
            if (elmx_error verdict = p_handle_error(elmx_unexpected_empty_element))
                return verdict;
        if (m_name != ar_reader.get_name())
            return p_handle_error(elmx_bad_end_of_element);
        return elmx_ok;
    }
    elmx_error error = elmx_ok;
    unmarshal_complex_body(&error);
    if (error)
        return error;
    if (ar_reader.is_auto_versioning() && ar_reader.get_current_event() != xe_end_tag &&
        is_not_choice_or_choice_is_not_set())
        if (elmx_error verdict = p_skip_unknown_elements())
            return verdict;
    if (!p_is_own_end_tag())
        return p_handle_error(elmx_bad_end_of_element);
    return elmx_ok;
}

elmx_error c_unmarshal_helper::unmarshal_empty_content_case() {
    c_xml_reader_local scope(ar_reader);
    if (ar_reader.get_current_event() == xe_end_tag)
        return elmx_ok;
    elmx_error error;
    ar_reader.get_element_event(&error);
    if (error)
        if (elmx_error verdict = p_handle_error(error))
            return verdict;
    if (ar_reader.is_auto_versioning() && ar_reader.get_current_event() != xe_end_tag)
        if (elmx_error verdict = p_skip_unknown_elements())
            return verdict;
    if (!p_is_own_end_tag())
        return p_handle_error(elmx_bad_end_of_element);
    return elmx_ok;
}

elmx_error c_unmarshal_helper::unmarshal_simple_content_case() {
    ar_reader.set_name(m_name.get_str());
    if (!is_nil()) {
        elmx_error error = elmx_ok;
        unmarshal_simple_body(&error);
        return error;
    }
    if (!ar_reader.is_element_end_tag())
        return p_handle_error(elmx_bad_end_of_element);
    return elmx_ok;
}

// ---------------------------------------------------------------- looking ahead

bool get_instance_namespace(c_xml_reader &ar_reader, std::string *ap_ns) {
    bool is_found = false;
    {
        c_xml_reader_local scope(ar_reader);
        c_known_elements_selector all_elements(ar_reader, nullptr);
        elmx_error error;
        std::string name;
        if (ar_reader.get_element_event(&error, &name) == xe_name) {
            std::string ns;
            ar_reader.get_namespace(name, &ns);
            if (ns != c_xml::k_namespace_not_found) {
                *ap_ns = ns;
                is_found = true;
            }
        }
    }
    ar_reader.rewind();
    return is_found;
}

namespace {

// One element whose start tag is the current event, and all it holds.
elmx_must_understand p_has_must_understand(c_xml_reader &ar_reader, const std::string &ar_ns,
                                           const std::string &ar_name, t_must_understand_test a_test,
                                           const std::string &ar_element, int a_depth) {
    if (ar_reader.is_too_deep(a_depth))
        return mu_unknown;
    std::string attribute;
    std::string value;
    std::string ns;
    for (;;) {
        elmx_error error = elmx_ok;
        if (!ar_reader.get_attribute_event(nullptr, &error, &attribute))
            break;
        if (error)
            return mu_unknown;
        if (ar_reader.get_local_name() != ar_name) {
            ar_reader.skip_attribute_value();
            continue;
        }
        ns = c_xml::k_non_namespace;
        if (ar_reader.get_cracked_name().has_prefix())
            ar_reader.get_namespace(attribute, &ns);
        if (ns != ar_ns) {
            ar_reader.skip_attribute_value();
            continue;
        }
        if (!ar_reader.get_attribute_value(&value, ws_collapse))
            return mu_unknown;
        elmx_must_understand answer = a_test(value);
        if (answer != mu_no)
            return answer;
    }
    if (ar_reader.get_current_event() == xe_end_tag)
        return mu_no; // closed by "/>"
    c_xml_reader_local scope(ar_reader);
    std::string child;
    for (;;) {
        elmx_error error;
        switch (ar_reader.get_element_event(&error, &child)) {
        case xe_text:
            break;
        case xe_name: {
            elmx_must_understand answer =
                p_has_must_understand(ar_reader, ar_ns, ar_name, a_test, child, a_depth + 1);
            if (answer != mu_no)
                return answer;
            break;
        }
        case xe_end_tag:
            return child == ar_element ? mu_no : mu_unknown;
        default:
            return mu_unknown;
        }
    }
}

} // namespace

elmx_must_understand has_must_understand(c_xml_reader &ar_reader, const std::string &ar_ns,
                                         const std::string &ar_name, t_must_understand_test a_test) {
    c_known_elements_selector all_elements(ar_reader, nullptr);
    std::string element;
    elmx_error error;
    {
        c_xml_reader_local scope(ar_reader);
        if (ar_reader.get_element_event(&error, &element) != xe_name)
            return mu_unknown;
    }
    ar_reader.rewind();
    c_xml_reader_local scope(ar_reader);
    if (ar_reader.get_element_event(&error, &element) != xe_name)
        return mu_unknown;
    return p_has_must_understand(ar_reader, ar_ns, ar_name, a_test, element, 1);
}

elmx_must_understand bool_must_understand(const std::string &ar_value) {
    if (ar_value == "1" || ar_value == "true")
        return mu_yes;
    if (ar_value == "0" || ar_value == "false")
        return mu_no;
    return mu_unknown;
}

} // namespace lmx
