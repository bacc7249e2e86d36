#include "lmxdtd.h"

namespace lmx {

namespace {

std::string describe(int a_c) { return a_c == -1 ? std::string("end of input") : std::string(1, static_cast<char>(a_c)); }

bool is_name_byte(int a_c) {
    return a_c > 127 || (a_c >= 'a' && a_c <= 'z') || (a_c >= 'A' && a_c <= 'Z') || (a_c >= '0' && a_c <= '9') ||
           a_c == '_' || a_c == ':' || a_c == '.' || a_c == '-';
}

} // namespace

bool c_dtd_util::p_skip_ws_get(int *ap_c) {
    *ap_c = ar_getter.get_non_ws();
    return *ap_c != -1;
}

bool c_dtd_util::get_entity_value(std::string *ap_value) {
    ap_value->clear();
    int c;
    if (!p_skip_ws_get(&c))
        return false;
    while (c != -1 && !is_white(c) && c != '>') {
        if (c == '%') {
            if (!select_parameter_entity())
                return false;
        } else {
            ap_value->push_back(static_cast<char>(c));
        }
        c = get();
    }
    unget(c);
    return c != -1;
}

bool c_dtd_util::get_quoted_entity_value(int a_quote, std::string *ap_value) {
    ap_value->clear();
    const std::size_t depth = ar_getter.get_entity_stack_depth();
    for (;;) {
        int c = get();
        if (c == -1)
            return false;
        // A quote inside an expanded parameter entity does not end the value.
        if (c == a_quote && ar_getter.get_entity_stack_depth() == depth)
            return true;
        if (c == '%') {
            if (!select_parameter_entity())
                return false;
        } else if (c == '&') {
            int next = get();
            if (next == '#') {
                c_entity_name_reader_for_c_get reader(ar_getter);
                if (!ar_getter.insert_character_entity(reader, ap_value))
                    return false;
            } else { // general references are expanded where the entity is used
                ap_value->push_back('&');
                unget(next);
            }
        } else {
            ap_value->push_back(static_cast<char>(c));
        }
    }
}

bool c_dtd_util::select_parameter_entity() {
    std::string name;
    int c;
    while (is_name_byte(c = get()))
        name.push_back(static_cast<char>(c));
    if (c != ';')
        unget(c); // a missing ";" is tolerated
    const char *p_text = nullptr;
    if (ar_getter.get_parameter_entity(name.c_str(), &p_text))
        return ar_getter.set_input_entity_value(p_text);
    ar_getter.error(elmx_type_error, elmx_entity_not_found, "Entity '%" + name + "' not found");
    return true;
}

bool c_internal_dtd::read_doctype_decl() {
    // The name and any external identifier are passed over unread.
    for (;;) {
        int c = get();
        if (c == -1)
            return false;
        if (c == '>')
            return true;
        if (c == '[')
            break;
    }
    for (;;) {
        int c = getter().get_non_ws();
        if (c == '<') {
            std::string name;
            if (!p_get_markupdecl_name(&name))
                return false;
            if (name == "!--") {
                if (!getter().skip_comment())
                    return false;
            } else if (name == "!ENTITY") {
                if (!p_read_dtd_entity())
                    return false;
            } else if (!name.empty() && name[0] == '?') {
                if (name.size() > 1 && name.back() == '?') {
                    if (get() != '>' && !getter().skip_PI())
                        return false;
                } else if (!getter().skip_PI()) {
                    return false;
                }
            } else if (!p_skip_to_end_of_markupdecl()) {
                return false;
            }
        } else if (c == '%') {
            if (!select_parameter_entity())
                return false;
        } else if (c == ']') {
            c = getter().get_non_ws();
            if (c == '>')
                return true;
            getter().error(elmx_type_fatal, elmx_bad_dtd,
                           "DTD not Well Formed (expected '>', got " + describe(c) + ")");
            return false;
        } else {
            getter().error(elmx_type_fatal, elmx_bad_dtd, "DTD not Well Formed (got " + describe(c) + ")");
            return false;
        }
    }
}

bool c_internal_dtd::p_get_markupdecl_name(std::string *ap_name) {
    ap_name->clear();
    for (;;) {
        int c = get();
        if (c == -1)
            return false;
        if (is_white(c) || c == '[' || c == '>') {
            unget(c);
            return true;
        }
        ap_name->push_back(static_cast<char>(c));
        if (*ap_name == "!--")
            return true;
    }
}

bool c_internal_dtd::p_read_dtd_entity() {
    int c = getter().get_non_ws();
    bool is_parameter = c == '%';
    if (!is_parameter)
        unget(c);
    std::string name, text;
    bool is_read = get_entity_value(&name);
    if (is_read) {
        c = getter().get_non_ws();
        if (c == '"' || c == '\'') {
            is_read = get_quoted_entity_value(c, &text);
        } else {
            while (c != -1 && !is_white(c) && c != '>') {
                text.push_back(static_cast<char>(c));
                c = get();
            }
            unget(c);
            if (text == "SYSTEM" || text == "PUBLIC")
                getter().error(elmx_type_warning, elmx_external_entity, "External Entity definitions not supported");
            else
                getter().error(elmx_type_error, elmx_unexpected_entity, "Unexpected value in Entity definition: " + text);
        }
    }
    if (is_read) {
        // A name defined again takes the new text.
        if (is_parameter)
            getter().add_parameter_entity(name.c_str(), text.c_str());
        else
            getter().add_general_entity(name.c_str(), text.c_str());
    }
    return p_skip_to_end_of_markupdecl() && is_read;
}

bool c_internal_dtd::p_skip_to_end_of_markupdecl() { return getter().skip_to_tag_char(false) != -1; }

} // namespace lmx
