#include "lmxreader.h"

namespace lmx {

// ---------------------------------------------------------------- scopes

c_xml_reader_local::c_xml_reader_local(c_xml_reader &ar_reader)
    : c_xml_local(ar_reader.get_reader_local()), ar_reader(ar_reader), p_previous(ar_reader.get_reader_local()) {
    ar_reader.set_reader_local(this);
}

c_xml_reader_local::c_xml_reader_local(c_xml_reader &ar_reader, root_tag)
    : c_xml_local(nullptr), ar_reader(ar_reader), p_previous(nullptr), m_is_root(true) {}

c_xml_reader_local::~c_xml_reader_local() {
    if (!m_is_root)
        ar_reader.set_reader_local(p_previous);
}

// ---------------------------------------------------------------- reader

c_xml_reader::c_xml_reader(c_read &ar_reader)
    : c_xml(ar_reader, m_error, true), m_root_scope(*this, c_xml_reader_local::root_tag()) {
    p_current_scope = &m_root_scope;
}

elmx_error c_xml_reader::user_handle_error(elmx_error a_error, const std::string &, const char *, int) {
    return user_handle_error(a_error);
}

elmx_error c_xml_reader::user_handle_error(elmx_error a_error) { return a_error; }

void c_xml_reader::get_error_message(std::string *ap_message) const { *ap_message = m_debug_error.to_string(); }

elmx_error c_xml_reader::capture_error(elmx_error a_error, const std::string &ar_item_name, const char *ap_prog_file,
                                       int a_prog_line) {
    // Input that ended because a low layer gave up reports the real cause.
    if (a_error == elmx_unexpected_end_of_message && m_error.is_fatal_errored())
        a_error = m_error.get_last_error();
    m_debug_error.set(a_error, ar_item_name, ap_prog_file, a_prog_line, get_line_num());
    return a_error;
}

elmx_error c_xml_reader::handle_error(elmx_error a_error, const std::string &ar_item_name, const char *ap_prog_file,
                                      int a_prog_line) {
    elmx_error captured = capture_error(a_error, ar_item_name, ap_prog_file, a_prog_line);
    return user_handle_error(captured, ar_item_name, ap_prog_file, a_prog_line);
}

elmx_error c_xml_reader::handle_error(elmx_error a_error) {
    return handle_error(a_error, m_name, m_code_location.p_prog_file, m_code_location.prog_line);
}

elmx_error c_xml_reader::handle_error(elmx_error a_error, int a_prog_line) {
    return handle_error(a_error, m_name, m_code_location.p_prog_file, a_prog_line);
}

elmx_error c_xml_reader::handle_attribute_error(elmx_error a_error) {
    return handle_error(a_error, "@" + m_name, m_code_location.p_prog_file, m_code_location.prog_line);
}

// ---------------------------------------------------------------- namespaces

void c_xml_reader::set_ns_map(const s_ns_map *ap_ns_map) {
    // Only the URI counts: an instance document may use any prefix.
    for (const s_ns_map *p_row = ap_ns_map; p_row && p_row->p_uri; ++p_row)
        add_namespace(p_row->p_uri, p_row->id);
    for (const s_user_ns_prefix_map &mapping : m_user_ns_prefix_map)
        m_root_scope.add_namespace(mapping.prefix, add_namespace(mapping.uri));
}

void c_xml_reader::add_namespace_mapping(const std::string &ar_ns_prefix, const std::string &ar_namespace) {
    m_user_ns_prefix_map.push_back({ar_ns_prefix, ar_namespace});
}

void c_xml_reader::get_namespace(const std::string &ar_name, std::string *ap_namespace_out) const {
    std::string prefix;
    c_xml::get_namespace_prefix(ar_name, &prefix);
    int id = p_current_scope->find_namespace_id(prefix);
    const char *p_uri = id == ns_not_found ? nullptr : find_namespace_from_id(id);
    *ap_namespace_out = p_uri ? p_uri : k_namespace_not_found;
}

bool c_xml_reader::is_xsi_attribute() const {
    return m_cracked_name.has_prefix() && p_current_scope->find_namespace_id(m_cracked_name.get_prefix()) == ns_xsi;
}

bool c_xml_reader::is_valid_qname(const std::string &ar_value) const {
    c_cracked_name name;
    name.set(*p_current_scope, ar_value);
    if (name.has_prefix() && name.get_ns_id() == ns_not_found)
        return false;
    auto is_ncname = [](const std::string &ar_part) {
        if (ar_part.empty() || !is_xml_name_start_char(static_cast<unsigned char>(ar_part[0])) || ar_part[0] == ':')
            return false;
        for (char c : ar_part)
            if (!is_xml_NCname_char(static_cast<unsigned char>(c)))
                return false;
        return true;
    };
    return (!name.has_prefix() || is_ncname(name.get_prefix())) && is_ncname(name.get_local_name());
}

// ---------------------------------------------------------------- events

void c_xml_reader::p_crack(const std::string &ar_name, elxp_attr_elem a_type) {
    if (a_type == ea_attribute)
        m_cracked_name.set_for_attribute(*p_current_scope, ar_name);
    else
        m_cracked_name.set(*p_current_scope, ar_name);
}

bool c_xml_reader::p_is_known_element() const {
    const std::string &local = m_cracked_name.get_local_name();
    int id = m_cracked_name.get_element_ns_id();
    for (const s_known_elements *p_row = p_known_elements; p_row->p_name; ++p_row) {
        if (p_row->ns_id == id && p_row->p_name[0] == local[0] && p_row->name_length == local.size() &&
            local.compare(0, local.size(), p_row->p_name, p_row->name_length) == 0)
            return true;
    }
    return false;
}

int c_xml_reader::get_element_event(elmx_error *ap_error, std::string *ap_name) {
    for (;;) {
        *ap_error = elmx_ok;
        p_current_scope->clear(); // the previous sibling's declarations must not stay
        m_current_event = get_element_name(p_current_scope, ap_name);
        switch (m_current_event) {
        case xe_error:
        case xe_fatal:
            *ap_error = m_error.get_last_error();
            break;
        case xe_end_of_input:
            *ap_error = elmx_unexpected_end_of_message;
            break;
        case xe_name:
            p_crack(*ap_name, ea_element);
            break;
        default:
            break;
        }
        if (!p_known_elements || m_current_event != xe_name || p_is_known_element())
            return m_current_event;
        if (!skip_rest_of_element(*ap_name)) {
            *ap_error = elmx_xml_badly_formed;
            return m_current_event;
        }
    }
}

int c_xml_reader::get_element_event(const s_event_map *ac_event_map, elmx_error *ap_error, std::string *ap_name) {
    c_known_elements_selector no_known_elements(*this, nullptr);
    get_element_event(ap_error, ap_name);
    if (m_current_event == xe_name && ac_event_map)
        tokenise(ac_event_map, ea_element);
    return m_current_event;
}

bool c_xml_reader::get_attribute_event(const s_event_map *ac_event_map, elmx_error *ap_error, std::string *ap_name) {
    m_current_event = get_attribute_name(ap_name);
    switch (m_current_event) {
    case xe_error:
    case xe_fatal:
        *ap_error = m_error.get_last_error();
        return true;
    case xe_end_of_input:
        *ap_error = elmx_unexpected_end_of_message;
        return true;
    case xe_name:
        *ap_error = elmx_ok;
        p_crack(*ap_name, ea_attribute);
        if (ac_event_map)
            tokenise(ac_event_map, ea_attribute);
        return true;
    default:
        return false; // the start tag is over
    }
}

int c_xml_reader::get_attribute_event(const s_event_map *ac_event_map, std::string *ap_name) {
    elmx_error ignored;
    get_attribute_event(ac_event_map, &ignored, ap_name);
    return m_current_event;
}

void c_xml_reader::tokenise(const s_event_map *ac_event_map, elxp_attr_elem a_type) {
    if (!is_current_event_tokenisable())
        return;
    int id = m_cracked_name.get_ns_id();
    if (!m_cracked_name.has_prefix() && a_type == ea_attribute)
        id = ns_none;
    const std::string &local = m_cracked_name.get_local_name();
    if (id == ns_xsi) {
        if (local == "type")
            m_current_event = xe_xsi_type;
        else if (local == "nil")
            m_current_event = xe_xsi_nil;
        else if (local == "noNamespaceSchemaLocation")
            m_current_event = xe_xsi_no_namespace_schema_location;
        else if (local == "schemaLocation")
            m_current_event = xe_xsi_schema_location;
        else
            m_current_event = xe_unknown;
        return;
    }
    // Cheap tests first: namespace, first byte, length, then the bytes.
    const char first = local.empty() ? '\0' : local[0];
    for (const s_event_map *p_row = ac_event_map; p_row->p_name; ++p_row) {
        if (p_row->ns_id == id && p_row->p_name[0] == first && p_row->name_length == local.size() &&
            local.compare(0, local.size(), p_row->p_name, p_row->name_length) == 0) {
            m_current_event = p_row->event;
            return;
        }
    }
    m_current_event = xe_unknown;
}

void c_xml_reader::tokenise(const s_event_map *ac_event_map, const std::string &ar_name, elxp_attr_elem a_type) {
    p_crack(ar_name, a_type);
    tokenise(ac_event_map, a_type);
}

bool c_xml_reader::skip_start_tag(bool *ap_is_end_of_element) {
    *ap_is_end_of_element = false;
    bool is_ok = move_to_start_tag_end(ap_is_end_of_element);
    m_current_event = *ap_is_end_of_element ? xe_end_tag : xe_start_tag_end;
    return is_ok;
}

bool c_xml_reader::is_element_end_tag() {
    return m_current_event == xe_end_tag || c_xml::is_element_end_tag(m_name);
}

elmx_error c_xml_reader::ignore_element(const s_event_map *ac_event_map) {
    bool is_skipped = true;
    if (m_current_event == xe_start_tag_end)
        is_skipped = skip_element_body(m_name);
    else if (m_current_event != xe_end_tag) // the start tag is still open
        is_skipped = skip_rest_of_element(m_name);
    if (!is_skipped)
        return elmx_xml_badly_formed;
    elmx_error error;
    if (ac_event_map)
        get_element_event(ac_event_map, &error, &m_name);
    else
        get_element_event(&error, &m_name);
    return error;
}

bool c_xml_reader::get_end_tag(const s_event_map *ac_event_map, const std::string &ar_name, int *ap_event,
                               elmx_error *ap_error) {
    elmx_error error;
    *ap_event = ac_event_map ? get_element_event(ac_event_map, &error, &m_end_tag_name)
                             : get_element_event(&error, &m_end_tag_name);
    if (*ap_event == xe_end_of_input) {
        p_stops(elmx_unexpected_end_of_message, ar_name, ap_error);
        return false;
    }
    if (*ap_event != xe_end_tag || m_end_tag_name != ar_name)
        return !p_stops(elmx_bad_end_of_element, ar_name, ap_error);
    *ap_error = elmx_ok;
    return true;
}

// ---------------------------------------------------------------- values

bool c_xml_reader::get_element_value(std::string *ap_value, elmx_whitespace a_ws_mode) {
    if (m_current_event == xe_end_tag) {
        ap_value->clear();
        return true;
    }
    bool is_read = c_xml::get_element_value(ap_value, a_ws_mode, true);
    m_current_event = xe_text;
    return is_read;
}

bool c_xml_reader::get_nested_element_value(std::string *ap_value, std::string *ap_end_tag_name,
                                            elmx_whitespace a_ws_mode, bool a_expand_entities) {
    bool is_read = c_xml::get_nested_element_value(ap_value, ap_end_tag_name, a_ws_mode, a_expand_entities);
    m_current_event = xe_end_tag;
    return is_read;
}

// Finishes the start tag unless the attribute reading already did; tells
// whether the element was empty.
bool c_xml_reader::p_finish_start_tag(bool *ap_is_empty_element) {
    if (m_current_event == xe_start_tag_end || m_current_event == xe_end_tag) {
        *ap_is_empty_element = m_current_event == xe_end_tag;
        return true;
    }
    return skip_start_tag(ap_is_empty_element);
}

// Reports a failed step of reading ar_name; true when the handler let the
// error stand and the caller must stop.
bool c_xml_reader::p_stops(elmx_error a_error, const std::string &ar_name, elmx_error *ap_error) {
    *ap_error = handle_error(a_error, ar_name, m_code_location.p_prog_file, m_code_location.prog_line);
    return *ap_error != elmx_ok;
}

bool c_xml_reader::get_simple_type_value(const std::string &ar_name, elmx_whitespace a_ws_mode,
                                         std::string *ap_value, elmx_error *ap_error, bool *ap_is_empty_element) {
    *ap_error = elmx_ok;
    ap_value->clear();
    if (!p_finish_start_tag(ap_is_empty_element) && p_stops(elmx_bad_start_tag_end, ar_name, ap_error))
        return false;
    if (*ap_is_empty_element)
        return true;
    if (!c_xml::get_element_value(ap_value, a_ws_mode, true) &&
        p_stops(elmx_unable_to_read_element, ar_name, ap_error))
        return false;
    bool is_end = c_xml::is_element_end_tag(ar_name);
    m_current_event = xe_end_tag;
    return is_end || !p_stops(elmx_bad_end_of_element, ar_name, ap_error);
}

bool c_xml_reader::get_element_ur_value(const std::string &ar_name, std::string *ap_value, elmx_error *ap_error,
                                        bool *ap_is_empty_element) {
    *ap_error = elmx_ok;
    ap_value->clear();
    if (!p_finish_start_tag(ap_is_empty_element) && p_stops(elmx_bad_start_tag_end, ar_name, ap_error))
        return false;
    if (*ap_is_empty_element)
        return true;
    if (!get_nested_element_value(ap_value, &m_end_tag_name, ws_preserve, false))
        return !p_stops(elmx_unable_to_read_element, ar_name, ap_error);
    return m_end_tag_name == ar_name || !p_stops(elmx_bad_end_of_element, ar_name, ap_error);
}

} // namespace lmx
