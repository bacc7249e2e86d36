// The XML scanner: turns the UTF-8 stream into events for a pull reader.
//
// It has no tree and no validation of its own. The attributes of a start tag
// are captured whole when the tag is met, so that the tag's namespace
// declarations are known before its own name is resolved.
#ifndef LMX_LMXSCANNER_H
#define LMX_LMXSCANNER_H

#include <string>

#include "lmxdtd.h"
#include "lmxnamespaces.h"

namespace lmx {

enum elxp_xml_event {
    xe_end_of_input = 0,
    xe_unknown = 1,
    xe_error = 2,
    xe_fatal = 3,
    xe_start_tag_end = 4,
    xe_text = 5,
    xe_end_tag = 6,
    xe_name = 7,
    xe_xsi_type = 8,
    xe_xsi_nil = 9,
    xe_xsi_schema_location = 10,
    xe_xsi_no_namespace_schema_location = 11,
    xe_first_user_token = 12
};

// Name characters, by byte. Anything above 127 counts, so every byte of a
// multi-byte UTF-8 character is a name character.
inline bool is_xml_name_start_char(int a_c) {
    return a_c > 127 || (a_c >= 'a' && a_c <= 'z') || (a_c >= 'A' && a_c <= 'Z') || a_c == '_' || a_c == ':';
}
inline bool is_xml_name_char(int a_c) {
    return is_xml_name_start_char(a_c) || (a_c >= '0' && a_c <= '9') || a_c == '.' || a_c == '-';
}
inline bool is_xml_NCname_char(int a_c) { return a_c != ':' && is_xml_name_char(a_c); }

class c_xml : public c_get_for_xml {
public:
    enum e_tag_type { tag_start = 0, tag_other = 1, tag_end = 2, tag_bad = 3 };

    // Recursive scans of element content stop at this depth, so that a hostile
    // document cannot overflow the stack.
    static constexpr int k_max_element_depth = 1000;

    // The "URI" of names in no namespace.
    static const std::string k_non_namespace;
    // What get_namespace answers for an undeclared prefix.
    static const std::string k_namespace_not_found;

    c_xml(c_read &ar_reader, c_error &ar_error, bool a_is_reading_xsd);

    // The main pull call: the next start tag name, end tag, text or the end.
    elxp_xml_event get_element_name(c_xml_local *ap_local_control, std::string *ap_name);

    // Attributes of the current start tag, as captured.
    elxp_xml_event get_attribute_name(std::string *ap_name, bool a_in_xml_decl = false);
    bool get_attribute_value(std::string *ap_value, elmx_whitespace a_ws_mode);
    void skip_attribute_value() { m_attributes.next_segment(); }
    bool get_namespace_attribute_name(std::string *ap_name);
    bool get_namespace_attribute_value(std::string *ap_value);
    void skip_namespace_attribute_value() { m_ns_attributes.next_segment(); }
    // Looks for an attribute by namespace and local name among those not yet
    // read; unprefixed names match only namespace 1. The read index is put
    // back where it was, found or not.
    bool get_named_attribute(c_xml_local *ap_xml_local, int a_ns_id, const std::string &ar_local_name,
                             std::string *ap_value);
    bool get_xsi_type(c_xml_local *ap_xml_local, int *ap_type_ns_id, std::string *ap_type_local_name);

    // Element content.
    bool get_element_value(std::string *ap_value, elmx_whitespace a_ws_mode, bool a_expand_entities);
    bool get_nested_element_value(std::string *ap_value, std::string *ap_end_tag_name,
                                  elmx_whitespace a_ws_mode, bool a_expand_entities);
    // The whole element, start tag to end tag, as text.
    bool get_any_element(const std::string &ar_name, std::string *ap_value, elmx_whitespace a_ws_mode,
                         bool a_expand_entities);

    bool is_element_end_tag(const std::string &ar_name);
    bool skip_start_tag(bool *ap_is_end) { return move_to_start_tag_end(ap_is_end); }
    // Skips what is left of an element whose start tag has been read up to
    // its attributes: the rest of the tag, and the body unless it was "/>".
    bool skip_rest_of_element(const std::string &ar_name);
    // Skips the body of an element whose start tag has been closed by ">".
    bool skip_rest_of_empty_element(const std::string &ar_name);
    // Skips content up to the end tag of ar_name, matching every nested name.
    bool skip_element_body(const std::string &ar_name);

    static void get_local_name(const std::string &ar_name, std::string *ap_local_name_out);
    static void get_namespace_prefix(const std::string &ar_name, std::string *ap_namespace_prefix_out);
    int get_ns_id(const c_xml_local *ap_xml_local, const std::string &ar_name);
    bool is_xsi_attribute(const c_xml_local *ap_xml_local, const std::string &ar_name) {
        return get_ns_id(ap_xml_local, ar_name) == ns_xsi;
    }

    int add_namespace(const std::string &ar_uri) { return m_namespaces.add_namespace(ar_uri); }
    void add_namespace(const std::string &ar_uri, int a_id) { m_namespaces.add_namespace(ar_uri, a_id); }
    int find_enumerated_namespace(const std::string &ar_uri) const { return m_namespaces.find_namespace(ar_uri); }
    const char *find_namespace_from_id(int a_id) const { return m_namespaces.find_namespace_from_id(a_id); }
    void add_general_entity(const std::string &ar_name, const std::string &ar_value) {
        c_get_with_entities::add_general_entity(ar_name.c_str(), ar_value.c_str());
    }
    void add_parameter_entity(const std::string &ar_name, const std::string &ar_value) {
        c_get_with_entities::add_parameter_entity(ar_name.c_str(), ar_value.c_str());
    }
    int get_line_num() const { return c_get_as_utf8::get_line_num(); }
    void rewind();
    static bool is_error_event(int a_event) { return a_event == xe_error || a_event == xe_fatal; }
    // For every recursive reader: true, with the fatal error recorded, once
    // a_depth passes k_max_element_depth.
    bool is_too_deep(int a_depth);

private:
    elxp_xml_event p_handle_lt(c_xml_local *ap_local_control, std::string *ap_name, bool *ap_again);
    bool p_handle_lt_qmark();
    elxp_xml_event p_handle_lt_pling(std::string *ap_name, bool *ap_again);
    elxp_xml_event p_get_xml_text(std::string *ap_name);
    bool p_read_cdata(std::string *ap_value);
    bool p_read_name(int a_first, std::string *ap_name);
    bool p_read_name_tail(std::string *ap_name);
    bool p_capture_ordinary_attribute(const std::string &ar_name);
    bool p_capture_attributes(c_xml_local *ap_local_control);
    bool p_capture_attribute_value(c_attribute_data *ap_data, std::size_t *ap_value_index);
    bool p_register_namespace(c_xml_local *ap_local_control, const std::string &ar_prefix,
                              std::size_t a_value_index);
    bool p_get_segment_value(c_attribute_data *ap_data, std::string *ap_value, elmx_whitespace a_ws_mode);
    void p_bad_well_formed(const char *ap_message);
    bool p_skip_element_body(const std::string &ar_name, int a_depth);
    bool p_get_any_element(const std::string &ar_name, std::string *ap_value, bool a_expand_entities,
                           int a_depth);
    bool p_copy_rest_of_start_tag(std::string *ap_value, bool *ap_is_empty);
    bool p_nested_content(std::string *ap_value, std::string *ap_end_tag_name, bool a_expand_entities,
                          int a_depth);
    e_tag_type p_get_any_tag_data(std::string *ap_value, std::string *ap_name, bool a_expand_entities);

    std::string m_scratch;
    c_internal_dtd m_dtd;
    c_enumerated_namespaces m_namespaces;
    bool m_have_doctype = false;
    bool m_seen_content = false;
    c_attribute_data m_attributes;
    c_attribute_data m_ns_attributes;
    std::string m_prefix_scratch;
};

} // namespace lmx

#endif
