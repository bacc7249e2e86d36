#include "lmxscanner.h"

#include <cstring>

namespace lmx {

const std::string c_xml::k_non_namespace;
const std::string c_xml::k_namespace_not_found(" ");

namespace {

std::string describe(int a_c) { return a_c == -1 ? std::string("end of input") : std::string(1, static_cast<char>(a_c)); }

// Where a run of character data whose white space is folded must stop: at
// "<", "&", white space, and what needs the careful path (NUL, line ends,
// bytes of 0x80 and up).
struct s_folded_text_table {
    unsigned char stops[256];

    s_folded_text_table() : stops() {
        for (int c = 0; c < 256; ++c)
            stops[c] = c == 0 || c >= 0x80 || c == '<' || c == '&' || is_white(c);
    }
};

const s_folded_text_table k_folded_text_table;

// Runs of character data, of names and of quoted values.
const s_run_stops k_text_stops = {nullptr, '<', '&', false};
const s_run_stops k_folded_text_stops = {k_folded_text_table.stops, 0, 0, false};
const s_run_stops k_name_stops = {nullptr, 0, 0, true};
const s_run_stops k_double_quoted_stops = {nullptr, '"', '"', false};
const s_run_stops k_single_quoted_stops = {nullptr, '\'', '\'', false};

// White space is folded in every mode but ws_preserve.
const s_run_stops &text_stops(elmx_whitespace a_mode) {
    return a_mode == ws_preserve ? k_text_stops : k_folded_text_stops;
}

} // namespace

c_xml::c_xml(c_read &ar_reader, c_error &ar_error, bool a_is_reading_xsd)
    : c_get_for_xml(ar_reader, ar_error, a_is_reading_xsd), m_dtd(*this) {}

void c_xml::p_bad_well_formed(const char *ap_message) { error(elmx_type_error, elmx_not_well_formed, ap_message); }

bool c_xml::is_too_deep(int a_depth) {
    if (a_depth <= k_max_element_depth)
        return false;
    error(elmx_type_fatal, elmx_not_well_formed, "Element nesting too deep");
    return true;
}

// ---------------------------------------------------------------- events

elxp_xml_event c_xml::get_element_name(c_xml_local *ap_local_control, std::string *ap_name) {
    for (;;) {
        ap_name->clear();
        int c = get_non_ws(); // white space before text is lost here
        if (c == -1) {
            m_seen_content = true;
            return xe_end_of_input;
        }
        if (c == '&') {
            c_entity_name_reader_for_c_get reader(*this);
            reader.set_is_markup_possible_in_entity(true);
            if (!select_general_entity(reader, ap_name))
                return xe_fatal;
            if (ap_name->empty())
                continue; // the entity was opened as input: scan it like the document
            m_seen_content = true;
            return p_get_xml_text(ap_name);
        }
        if (c != '<') {
            ap_name->push_back(static_cast<char>(c));
            m_seen_content = true;
            return p_get_xml_text(ap_name);
        }
        bool again = false;
        elxp_xml_event event = p_handle_lt(ap_local_control, ap_name, &again);
        if (!again)
            return event;
    }
}

elxp_xml_event c_xml::p_handle_lt(c_xml_local *ap_local_control, std::string *ap_name, bool *ap_again) {
    // A plain first character of a name is taken with the rest of the name.
    int next = peek_plain_input();
    int c = next != -1 && is_xml_name_start_char(next) ? next : get();
    if (is_xml_name_start_char(c)) {
        if (!(c == next ? p_read_name_tail(ap_name) : p_read_name(c, ap_name))) {
            p_bad_well_formed("XML not Well-Formed");
            return xe_fatal;
        }
        if (!p_capture_attributes(ap_local_control))
            return xe_fatal;
        m_seen_content = true;
        return xe_name;
    }
    if (c == '/') {
        c = get();
        if (!is_xml_name_char(c))
            return xe_fatal;
        p_read_name(c, ap_name);
        if (get_non_ws() != '>') {
            p_bad_well_formed("XML not Well-Formed");
            return xe_fatal;
        }
        m_seen_content = true;
        return xe_end_tag;
    }
    if (c == '?') {
        if (!p_handle_lt_qmark())
            return xe_fatal;
        *ap_again = true;
        return xe_fatal;
    }
    if (c == '!')
        return p_handle_lt_pling(ap_name, ap_again);
    p_bad_well_formed("XML not Well-Formed");
    bool is_end;
    move_to_start_tag_end(&is_end);
    return xe_fatal;
}

// Reads a name whose first character has been read; the character after it
// is pushed back. False at the end of input.
bool c_xml::p_read_name(int a_first, std::string *ap_name) {
    ap_name->push_back(static_cast<char>(a_first));
    return p_read_name_tail(ap_name);
}

// Reads on to the end of a name.
bool c_xml::p_read_name_tail(std::string *ap_name) {
    for (;;) {
        take_name_run(k_name_stops, ap_name);
        // A plain terminator can stay where it is; reading and pushing it
        // back would change nothing.
        int next = peek_plain_input();
        if (next != -1 && !is_xml_name_char(next))
            return true;
        int c = get();
        if (!is_xml_name_char(c)) {
            unget(c);
            return c != -1;
        }
        ap_name->push_back(static_cast<char>(c));
    }
}

bool c_xml::p_handle_lt_qmark() {
    int c = 0;
    bool is_declaration = true;
    for (const char *p = "xml"; *p && is_declaration; ++p)
        is_declaration = (c = get()) == *p;
    if (is_declaration)
        is_declaration = is_white(c = get());
    if (is_declaration) {
        if (m_seen_content) {
            error(elmx_type_fatal, elmx_bad_xml_decl, "XML declaration not at start of document");
            return false;
        }
        return read_xml_decl();
    }
    // Any other processing instruction is skipped up to the first "?>".
    if (c == -1)
        return false;
    if (c == '?') {
        int next = get();
        if (next == '>')
            return true;
        unget(next);
    }
    return skip_PI();
}

elxp_xml_event c_xml::p_handle_lt_pling(std::string *ap_name, bool *ap_again) {
    int c = get();
    bool is_end;
    if (c == '[') {
        ap_name->clear();
        if (!p_read_cdata(ap_name))
            return xe_fatal;
        m_seen_content = true;
        return xe_text;
    }
    if (c == '-') {
        if (get() != '-') {
            move_to_start_tag_end(&is_end);
            return xe_fatal;
        }
        if (!skip_comment())
            return xe_fatal;
        *ap_again = true;
        return xe_fatal;
    }
    if (c == 'D') {
        if (!read_specified_string_from_input("OCTYPE")) {
            move_to_start_tag_end(&is_end);
            return xe_fatal;
        }
        if (m_seen_content) {
            error(elmx_type_error, elmx_bad_dtd, "Document Type Declaration not at start of document");
            return xe_fatal;
        }
        if (m_have_doctype) {
            error(elmx_type_error, elmx_bad_dtd, "Document Type Declaration already read");
            return xe_fatal;
        }
        if (!m_dtd.read_doctype_decl())
            return xe_fatal;
        m_have_doctype = true;
        *ap_again = true;
        return xe_fatal;
    }
    move_to_start_tag_end(&is_end);
    return xe_fatal;
}

elxp_xml_event c_xml::p_get_xml_text(std::string *ap_name) {
    pending_whitespace = false;
    const s_run_stops &stops = text_stops(get_ws_mode());
    for (;;) {
        take_text_run(stops, ap_name);
        int c = get();
        if (c == -1 || c == '<') {
            unget(c);
            return xe_text;
        }
        if (c == '&') {
            c_entity_name_reader_for_c_get reader(*this);
            reader.set_is_markup_possible_in_entity(true);
            if (!select_general_entity(reader, ap_name))
                return xe_fatal;
        } else {
            add_char_wsp(ap_name, c);
        }
    }
}

bool c_xml::p_read_cdata(std::string *ap_value) {
    if (!read_specified_string_from_input("CDATA[")) {
        p_bad_well_formed("XML not Well-Formed");
        return false;
    }
    int brackets = 0;
    for (;;) {
        int c = get();
        if (c == -1)
            return true; // an unterminated section ends with the input
        if (c == ']') {
            ++brackets;
        } else if (c == '>' && brackets >= 2) {
            ap_value->append(static_cast<std::size_t>(brackets - 2), ']');
            return true;
        } else {
            ap_value->append(static_cast<std::size_t>(brackets), ']');
            ap_value->push_back(static_cast<char>(c));
            brackets = 0;
        }
    }
}

// ---------------------------------------------------------------- attributes

bool c_xml::p_capture_attributes(c_xml_local *ap_local_control) {
    m_attributes.clear();
    m_ns_attributes.clear();
    std::string &name = m_scratch;
    for (;;) {
        name.clear();
        skip_white_run();
        // A plain name that cannot be a namespace declaration is taken whole.
        int next = peek_plain_input();
        if (next != -1 && next != 'x' && is_xml_name_start_char(next)) {
            p_read_name_tail(&name); // the end of input is reported with the value
            if (!p_capture_ordinary_attribute(name))
                return false;
            continue;
        }
        int c = get_non_ws();
        if (!is_xml_name_start_char(c)) {
            unget(c);
            m_attributes.mark_segment_end();
            return c != -1;
        }
        static const char k_xmlns[] = "xmlns";
        int matched = 0;
        while (matched < 5 && c == k_xmlns[matched]) {
            name.push_back(static_cast<char>(c));
            ++matched;
            c = get();
        }
        if (ap_local_control && matched == 5 && (c == ':' || !is_xml_name_char(c))) {
            std::string &prefix = m_prefix_scratch;
            prefix.clear();
            if (c == ':') {
                name.push_back(':');
                while (is_xml_NCname_char(c = get()))
                    prefix.push_back(static_cast<char>(c));
                name += prefix;
            }
            unget(c);
            m_ns_attributes.append(name);
            m_ns_attributes.mark_segment_end();
            std::size_t value_index;
            if (!p_capture_attribute_value(&m_ns_attributes, &value_index) ||
                !p_register_namespace(ap_local_control, prefix, value_index))
                return false;
            continue;
        }
        if (is_xml_name_char(c))
            p_read_name(c, &name);
        else
            unget(c);
        if (!p_capture_ordinary_attribute(name))
            return false;
    }
}

bool c_xml::p_capture_ordinary_attribute(const std::string &ar_name) {
    m_attributes.append(ar_name);
    m_attributes.mark_segment_end();
    std::size_t value_index;
    return p_capture_attribute_value(&m_attributes, &value_index);
}

bool c_xml::p_capture_attribute_value(c_attribute_data *ap_data, std::size_t *ap_value_index) {
    int c = get_non_ws();
    if (c == -1) {
        error(elmx_type_fatal, elmx_unexpected_end_of_message, "Unexpected end of file");
        return false;
    }
    if (c != '=') {
        error(elmx_type_fatal, elmx_not_well_formed,
              "Schema is not Well Formed (expected '=', got '" + describe(c) + "')");
        return false;
    }
    int quote = get_non_ws();
    if (quote == '"' || quote == '\'') {
        ap_data->put(static_cast<char>(quote));
        *ap_value_index = ap_data->size();
        const s_run_stops &stops = quote == '"' ? k_double_quoted_stops : k_single_quoted_stops;
        std::string &bytes = ap_data->bytes();
        for (;;) {
            take_name_run(stops, &bytes);
            c = get();
            if (c == quote) {
                ap_data->mark_segment_end();
                return true;
            }
            if (c == -1)
                break;
            bytes.push_back(static_cast<char>(c));
        }
    } else {
        c = quote;
    }
    error(elmx_type_fatal, elmx_not_well_formed,
          "Schema is not Well Formed (expected '\"' or ''', got " + describe(c) + ")");
    return false;
}

bool c_xml::p_register_namespace(c_xml_local *ap_local_control, const std::string &ar_prefix,
                                 std::size_t a_value_index) {
    const char *p_value = m_ns_attributes.bytes().c_str() + a_value_index;
    std::string &uri = m_scratch;
    uri.clear();
    if (std::strchr(p_value, '&')) {
        c_entity_name_reader_for_c_str reader(p_value);
        for (int c = reader.get(); c != -1; c = reader.get()) {
            if (c != '&')
                uri.push_back(static_cast<char>(c));
            else if (!select_general_entity(reader, &uri))
                return false;
        }
    } else {
        uri = p_value;
    }
    if (uri.empty())
        ap_local_control->add_namespace(ar_prefix, ar_prefix.empty() ? ns_none : ns_not_found);
    else
        ap_local_control->add_namespace(ar_prefix, m_namespaces.add_namespace(uri));
    return true;
}

elxp_xml_event c_xml::get_attribute_name(std::string *ap_name, bool a_in_xml_decl) {
    if (!m_attributes.is_eof()) {
        const char *p_name = m_attributes.get_str();
        std::size_t length = std::strlen(p_name);
        m_attributes.set_index(m_attributes.get_index() + length + 1); // past the name's NUL
        ap_name->assign(p_name, length);
        return xe_name;
    }
    int c = get_non_ws();
    if (c == '>')
        return xe_start_tag_end;
    if ((c == '/' && !a_in_xml_decl) || (c == '?' && a_in_xml_decl)) {
        if (get_non_ws() == '>')
            return xe_end_tag;
    }
    p_bad_well_formed("XML not well-formed");
    return xe_fatal;
}

bool c_xml::p_get_segment_value(c_attribute_data *ap_data, std::string *ap_value, elmx_whitespace a_ws_mode) {
    set_ws_mode(a_ws_mode);
    ap_value->clear();
    ap_data->next(); // the stored quote
    if (a_ws_mode == ws_preserve) {
        // Plain runs up to the next reference are copied whole.
        const char *p_segment = ap_data->get_str();
        std::size_t plain = std::strcspn(p_segment, "&");
        ap_value->append(p_segment, plain);
        ap_data->set_index(ap_data->get_index() + plain);
    }
    c_entity_name_reader_for_attribute_data reader(*ap_data);
    for (int c = ap_data->get(); c != -1; c = ap_data->get()) {
        if (c == '&') {
            if (!select_general_entity(reader, ap_value))
                return false;
        } else {
            add_char_wsp(ap_value, c);
        }
    }
    ap_data->next_segment();
    return true;
}

bool c_xml::get_attribute_value(std::string *ap_value, elmx_whitespace a_ws_mode) {
    return p_get_segment_value(&m_attributes, ap_value, a_ws_mode);
}

bool c_xml::get_namespace_attribute_name(std::string *ap_name) {
    if (m_ns_attributes.is_eof())
        return false;
    ap_name->assign(m_ns_attributes.get_str());
    m_ns_attributes.next_segment();
    return true;
}

bool c_xml::get_namespace_attribute_value(std::string *ap_value) {
    return p_get_segment_value(&m_ns_attributes, ap_value, ws_collapse);
}

bool c_xml::get_named_attribute(c_xml_local *ap_xml_local, int a_ns_id, const std::string &ar_local_name,
                                std::string *ap_value) {
    std::size_t saved = m_attributes.get_index();
    bool found = false;
    std::string name, local_name;
    while (!found && !m_attributes.is_eof()) {
        name.assign(m_attributes.get_str());
        m_attributes.next_segment();
        get_local_name(name, &local_name);
        bool has_prefix = name.find(':') != std::string::npos;
        int ns_id = has_prefix ? get_ns_id(ap_xml_local, name) : ns_none;
        if (ns_id == a_ns_id && local_name == ar_local_name)
            found = get_attribute_value(ap_value, ws_preserve);
        else
            skip_attribute_value();
    }
    m_attributes.set_index(saved);
    return found;
}

bool c_xml::get_xsi_type(c_xml_local *ap_xml_local, int *ap_type_ns_id, std::string *ap_type_local_name) {
    std::string value;
    if (!get_named_attribute(ap_xml_local, ns_xsi, "type", &value))
        return false;
    *ap_type_ns_id = get_ns_id(ap_xml_local, value);
    get_local_name(value, ap_type_local_name);
    return true;
}

// ---------------------------------------------------------------- content

bool c_xml::get_element_value(std::string *ap_value, elmx_whitespace a_ws_mode, bool a_expand_entities) {
    ap_value->clear();
    set_ws_mode(a_ws_mode);
    const s_run_stops &stops = text_stops(a_ws_mode);
    for (;;) {
        take_text_run(stops, ap_value);
        int c = get();
        if (c == -1) {
            error(elmx_type_error, elmx_unexpected_end_of_message, "Premature end of file encountered");
            return false;
        }
        if (c == '&' && a_expand_entities) {
            c_entity_name_reader_for_c_get reader(*this);
            reader.set_is_markup_possible_in_entity(true);
            if (!select_general_entity(reader, ap_value))
                return false;
            continue;
        }
        if (c != '<') {
            add_char_wsp(ap_value, c);
            continue;
        }
        int next = get();
        if (next == '!') {
            next = get();
            if (next == '-' && get() == '-') {
                skip_comment();
                continue;
            }
            if (next == '[') {
                if (!p_read_cdata(ap_value))
                    return false;
                continue;
            }
            p_bad_well_formed("XML not well-formed");
            return false;
        }
        if (next == '?') {
            skip_PI();
            continue;
        }
        unget(next);
        unget(c);
        return true;
    }
}

bool c_xml::is_element_end_tag(const std::string &ar_name) {
    if (get_non_ws() != '<' || get() != '/' || !read_specified_string_from_input(ar_name.c_str()))
        return false;
    return get_non_ws() == '>';
}

bool c_xml::skip_rest_of_element(const std::string &ar_name) {
    bool is_empty;
    if (!move_to_start_tag_end(&is_empty))
        return false;
    return is_empty || skip_element_body(ar_name);
}

bool c_xml::skip_rest_of_empty_element(const std::string &ar_name) { return skip_element_body(ar_name); }

bool c_xml::skip_element_body(const std::string &ar_name) { return p_skip_element_body(ar_name, 1); }

bool c_xml::p_skip_element_body(const std::string &ar_name, int a_depth) {
    if (is_too_deep(a_depth))
        return false;
    c_xml_local local;
    std::string name;
    for (;;) {
        switch (get_element_name(&local, &name)) {
        case xe_text:
            break;
        case xe_name: {
            bool is_empty;
            if (!move_to_start_tag_end(&is_empty))
                return false;
            if (!is_empty && !p_skip_element_body(name, a_depth + 1))
                return false;
            break;
        }
        case xe_end_tag:
            if (name != ar_name) {
                p_bad_well_formed(
                    ("Element start tag (" + ar_name + ") and end tag (" + name + ") do not match").c_str());
                return false;
            }
            return true;
        default:
            return false;
        }
    }
}

bool c_xml::get_any_element(const std::string &ar_name, std::string *ap_value, elmx_whitespace a_ws_mode,
                            bool a_expand_entities) {
    ap_value->clear();
    set_ws_mode(a_ws_mode);
    return p_get_any_element(ar_name, ap_value, a_expand_entities, 1);
}

bool c_xml::get_nested_element_value(std::string *ap_value, std::string *ap_end_tag_name,
                                     elmx_whitespace a_ws_mode, bool a_expand_entities) {
    ap_value->clear();
    set_ws_mode(a_ws_mode);
    return p_nested_content(ap_value, ap_end_tag_name, a_expand_entities, 1);
}

bool c_xml::p_get_any_element(const std::string &ar_name, std::string *ap_value, bool a_expand_entities,
                              int a_depth) {
    if (is_too_deep(a_depth))
        return false;
    ap_value->push_back('<');
    ap_value->append(ar_name);
    for (c_attribute_data *p_data : {&m_ns_attributes, &m_attributes}) {
        p_data->rewind();
        while (!p_data->is_eof()) {
            ap_value->push_back(' ');
            ap_value->append(p_data->get_str());
            p_data->next_segment();
            ap_value->push_back('=');
            const char *p_quoted = p_data->get_str(); // the opening quote, then the raw value
            ap_value->append(p_quoted);
            ap_value->push_back(p_quoted[0]);
            p_data->next_segment();
        }
        p_data->clear();
    }
    bool is_empty;
    if (!p_copy_rest_of_start_tag(ap_value, &is_empty))
        return false;
    if (is_empty)
        return true;
    std::string end_name;
    if (!p_nested_content(ap_value, &end_name, a_expand_entities, a_depth) || end_name != ar_name)
        return false;
    ap_value->append("</");
    ap_value->append(ar_name);
    ap_value->push_back('>');
    return true;
}

bool c_xml::p_copy_rest_of_start_tag(std::string *ap_value, bool *ap_is_empty) {
    int c = skip_to_tag_char(true, ap_value);
    if (c == '>') {
        ap_value->push_back('>');
        *ap_is_empty = false;
        return true;
    }
    while (c != '>') {
        if (c == -1)
            return false;
        c = get();
    }
    ap_value->append("/>");
    *ap_is_empty = true;
    return true;
}

bool c_xml::p_nested_content(std::string *ap_value, std::string *ap_end_tag_name, bool a_expand_entities,
                             int a_depth) {
    std::string name;
    for (;;) {
        switch (p_get_any_tag_data(ap_value, &name, a_expand_entities)) {
        case tag_other:
            break;
        case tag_start:
            if (!p_get_any_element(name, ap_value, a_expand_entities, a_depth + 1))
                return false;
            break;
        case tag_end:
            *ap_end_tag_name = name;
            return true;
        case tag_bad:
            return false;
        }
    }
}

c_xml::e_tag_type c_xml::p_get_any_tag_data(std::string *ap_value, std::string *ap_name, bool a_expand_entities) {
    ap_name->clear();
    int c = get();
    if (c == -1)
        return tag_bad;
    if (c != '<') {
        // Text; white space that stands directly before a tag is dropped.
        std::size_t start = ap_value->size();
        const s_run_stops &stops = text_stops(get_ws_mode());
        unget(c);
        for (;;) {
            take_text_run(stops, ap_value);
            c = get();
            if (c == -1 || c == '<')
                break;
            if (c == '&' && a_expand_entities) {
                c_entity_name_reader_for_c_get reader(*this);
                if (!select_general_entity(reader, ap_value))
                    return tag_bad;
            } else {
                add_char_wsp(ap_value, c);
            }
        }
        unget(c);
        std::size_t end = ap_value->size();
        while (end > start && is_white(static_cast<unsigned char>((*ap_value)[end - 1])))
            --end;
        ap_value->resize(end);
        return tag_other;
    }
    c = get();
    if (is_xml_name_start_char(c)) {
        c_xml_local local;
        if (!p_read_name(c, ap_name) || !p_capture_attributes(&local))
            return tag_bad;
        return tag_start;
    }
    if (c == '/') {
        c = get();
        if (!is_xml_name_char(c))
            return tag_bad;
        p_read_name(c, ap_name);
        return get_non_ws() == '>' ? tag_end : tag_bad;
    }
    if (c == '?')
        return skip_PI() ? tag_other : tag_bad;
    if (c == '!') {
        c = get();
        if (c == '-')
            return get() == '-' && skip_comment() ? tag_other : tag_bad;
        if (c == '[') {
            std::string content;
            if (!p_read_cdata(&content))
                return tag_bad;
            ap_value->append("<![CDATA[");
            ap_value->append(content);
            ap_value->append("]]>");
            return tag_other;
        }
    }
    return tag_bad;
}

// ---------------------------------------------------------------- names

void c_xml::get_local_name(const std::string &ar_name, std::string *ap_local_name_out) {
    std::string::size_type colon = ar_name.find(':');
    if (colon == std::string::npos)
        *ap_local_name_out = ar_name;
    else
        ap_local_name_out->assign(ar_name, colon + 1, std::string::npos);
}

void c_xml::get_namespace_prefix(const std::string &ar_name, std::string *ap_namespace_prefix_out) {
    std::string::size_type colon = ar_name.find(':');
    if (colon == std::string::npos)
        ap_namespace_prefix_out->clear();
    else
        ap_namespace_prefix_out->assign(ar_name, 0, colon);
}

int c_xml::get_ns_id(const c_xml_local *ap_xml_local, const std::string &ar_name) {
    get_namespace_prefix(ar_name, &m_prefix_scratch);
    return ap_xml_local->find_namespace_id(m_prefix_scratch);
}

void c_xml::rewind() {
    m_namespaces.clear();
    m_have_doctype = false;
    m_seen_content = false;
    m_attributes.clear();
    m_ns_attributes.clear();
    c_get_for_xml::rewind();
}

} // namespace lmx
