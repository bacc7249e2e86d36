#include "lmxentities.h"

#include <algorithm>
#include <cstring>

namespace lmx {

namespace {

bool is_digit(int a_c) { return a_c >= '0' && a_c <= '9'; }
bool is_hex_digit(int a_c) {
    return is_digit(a_c) || (a_c >= 'a' && a_c <= 'f') || (a_c >= 'A' && a_c <= 'F');
}
// Characters that go on an entity name; any byte above 127 is taken as part
// of a multi-byte character.
bool is_entity_name_char(int a_c) {
    return a_c > 127 || (a_c >= 'a' && a_c <= 'z') || (a_c >= 'A' && a_c <= 'Z') || is_digit(a_c) || a_c == '_' ||
           a_c == ':' || a_c == '.' || a_c == '-';
}

} // namespace

c_get_with_entities::c_get_with_entities(c_read &ar_reader, c_error &ar_error, bool a_is_reading_xsd)
    : c_get_as_utf8(ar_reader, ar_error), a_is_reading_xsd(a_is_reading_xsd) {}

int c_get_with_entities::p_get_from_entities() {
    while (!m_entity_stack.empty() && m_entity_stack.back().empty())
        m_entity_stack.pop_back();
    if (m_entity_stack.empty())
        return c_get_as_utf8::get();
    return m_entity_stack.back().get();
}

void c_get_with_entities::add_general_entity(const char *ap_entity_tag, const char *ap_value) {
    m_general_entities.set(ap_entity_tag, ap_value);
}

bool c_get_with_entities::get_general_entity(const char *ap_entity_tag, const char **app_entity_value_out) const {
    return m_general_entities.get(ap_entity_tag, app_entity_value_out);
}

void c_get_with_entities::add_parameter_entity(const char *ap_entity_tag, const char *ap_value) {
    m_parameter_entities.set(ap_entity_tag, ap_value);
}

bool c_get_with_entities::get_parameter_entity(const char *ap_entity_tag, const char **app_entity_value_out) const {
    return m_parameter_entities.get(ap_entity_tag, app_entity_value_out);
}

bool c_get_with_entities::p_check_expansion(const char *ap_text) {
    bool is_active = std::any_of(m_entity_stack.begin(), m_entity_stack.end(),
                                 [ap_text](const c_dtd_active_entity &e) { return e.get_start() == ap_text; }) ||
                     std::find(m_appending.begin(), m_appending.end(), ap_text) != m_appending.end();
    if (is_active) {
        error(elmx_type_fatal, elmx_bad_dtd, std::string("Recursive entity definition for: ") + ap_text);
        return false;
    }
    m_expanded_bytes += std::strlen(ap_text);
    if (m_entity_stack.size() + m_appending.size() >= k_max_entity_depth ||
        m_expanded_bytes > k_max_expansion_bytes) {
        error(elmx_type_fatal, elmx_bad_dtd, "Entity expansion limit exceeded");
        return false;
    }
    return true;
}

bool c_get_with_entities::set_input_entity_value(const char *ap_input_text) {
    if (!p_check_expansion(ap_input_text))
        return false;
    m_entity_stack.emplace_back(ap_input_text);
    return true;
}

bool c_get_with_entities::select_general_entity(c_entity_name_reader &ar_entity_tag_reader, std::string *ap_value) {
    int c = ar_entity_tag_reader.get();
    if (c == '#')
        return insert_character_entity(ar_entity_tag_reader, ap_value);
    m_entity_name.clear();
    if (c != -1) {
        m_entity_name.push_back(static_cast<char>(c));
        while (is_entity_name_char(c = ar_entity_tag_reader.get()))
            m_entity_name.push_back(static_cast<char>(c));
    }
    bool has_semicolon = c == ';';
    if (!has_semicolon)
        ar_entity_tag_reader.unget(c); // a missing ";" is tolerated
    static const struct {
        const char *name;
        char value;
    } predefined[] = {{"lt", '<'}, {"gt", '>'}, {"amp", '&'}, {"apos", '\''}, {"quot", '"'}};
    for (const auto &entity : predefined) {
        if (m_entity_name == entity.name) {
            ap_value->push_back(entity.value);
            return true;
        }
    }
    const char *p_text = nullptr;
    if (m_general_entities.get(m_entity_name, &p_text)) {
        if (ar_entity_tag_reader.get_is_markup_possible_in_entity()) {
            set_input_entity_value(p_text);
            return true;
        }
        return p_append_entity(p_text, ap_value);
    }
    ap_value->push_back('&');
    ap_value->append(m_entity_name);
    if (has_semicolon)
        ap_value->push_back(';');
    return false;
}

bool c_get_with_entities::p_append_entity(const char *ap_text, std::string *ap_value) {
    if (!p_check_expansion(ap_text))
        return false;
    m_appending.push_back(ap_text);
    const char *p = ap_text;
    bool ok = true;
    while (ok && *p) {
        char c = *p++;
        if (c == '&' || c == '%') {
            c_entity_name_reader_for_entity nested(p);
            ok = select_general_entity(nested, ap_value);
        } else {
            add_char_wsp(ap_value, static_cast<unsigned char>(c));
        }
    }
    m_appending.pop_back();
    return ok;
}

bool c_get_with_entities::insert_character_entity(c_entity_name_reader &ar_entity_tag_reader,
                                                  std::string *ap_value) {
    int c = ar_entity_tag_reader.get();
    bool is_hex = c == 'x';
    if (is_hex)
        c = ar_entity_tag_reader.get();
    else if (!is_digit(c))
        return false;
    // The value saturates just above the largest accepted one, so that any
    // number of digits is read without overflow.
    const unsigned long k_too_large = 0x100001;
    unsigned long value = 0;
    bool has_digit = false;
    while (is_hex ? is_hex_digit(c) : is_digit(c)) {
        unsigned long digit = is_digit(c) ? static_cast<unsigned long>(c - '0')
                                          : static_cast<unsigned long>((c | 0x20) - 'a' + 10);
        value = std::min(value * (is_hex ? 16 : 10) + digit, k_too_large);
        has_digit = true;
        c = ar_entity_tag_reader.get();
    }
    if (c != ';')
        ar_entity_tag_reader.unget(c); // a missing ";" is tolerated
    if (!has_digit || value > 0x100000)
        return false;
    if (value == 0x85 || value == 0x2028) {
        add_char_wsp(ap_value, '\n', true);
    } else if (value <= 127) {
        add_char_wsp(ap_value, static_cast<int>(value), true);
    } else {
        char buffer[8];
        ap_value->append(unicode_char_to_utf8(static_cast<std::uint32_t>(value), buffer));
    }
    return true;
}

void c_get_with_entities::rewind() {
    m_general_entities.clear();
    m_parameter_entities.clear();
    m_expanded_bytes = 0;
    set_ws_mode(ws_preserve);
    c_get_as_utf8::rewind();
}

std::size_t c_get_with_entities::take_text_run(const s_run_stops &ar_stops, std::string *ap_value) {
    if (!m_entity_stack.empty())
        return 0;
    bool needs_blank = m_ws_mode == ws_collapse && pending_whitespace && !ap_value->empty();
    if (needs_blank)
        ap_value->push_back(' ');
    std::size_t taken = take_raw_run(ar_stops, *ap_value);
    if (taken == 0) {
        if (needs_blank)
            ap_value->pop_back();
        return 0;
    }
    if (m_ws_mode == ws_collapse)
        pending_whitespace = false;
    return taken;
}

} // namespace lmx
