#include "lmxxmlinput.h"

namespace lmx {

bool c_get_for_xml::read_specified_string_from_input(const char *ap_input_string_to_be_read) {
    for (const char *p = ap_input_string_to_be_read; *p; ++p)
        if (get() != static_cast<unsigned char>(*p))
            return false;
    return true;
}

bool c_get_for_xml::get_simple_quoted_value(std::string *ap_value) {
    ap_value->clear();
    int quote = get_non_ws();
    if (quote != '"' && quote != '\'')
        return false;
    for (int c = get(); c != quote; c = get()) {
        if (c == -1)
            return false;
        ap_value->push_back(static_cast<char>(c));
    }
    return true;
}

bool c_get_for_xml::read_xml_decl() {
    std::string value;
    if (get_non_ws() != 'v' || !read_specified_string_from_input("ersion") || get_non_ws() != '=' ||
        !get_simple_quoted_value(&value)) {
        error(elmx_type_error, elmx_bad_xml_decl, "Version not present in XML Decl");
        return false;
    }
    if (value != "1.0" && value != "1.1") {
        error(elmx_type_error, elmx_unsupported_xml_version, "XML version " + value + " not understood");
        return false;
    }
    int c = get_non_ws();
    if (c == 'e') {
        if (!read_specified_string_from_input("ncoding"))
            return false;
        c = get_non_ws();
        if (c == '=') { // "encoding" without a value passes
            if (!get_simple_quoted_value(&value) || !set_encoding(value.c_str()))
                return false;
            c = get_non_ws();
        }
    }
    if (c == 's') {
        if (!read_specified_string_from_input("tandalone"))
            return false;
        c = get_non_ws();
        if (c == '=') { // whatever it says, it changes nothing
            if (!get_simple_quoted_value(&value))
                return false;
            c = get_non_ws();
        }
    }
    return c == '?' && get() == '>';
}

bool c_get_for_xml::skip_comment() {
    int dashes = 0;
    for (;;) {
        int c = get();
        if (c == -1)
            return false;
        if (c == '-') {
            ++dashes;
        } else if (c == '>' && dashes >= 2) {
            if (dashes > 2)
                error(elmx_type_warning, elmx_bad_comment, "End of comment not Well-Formed");
            return true;
        } else {
            dashes = 0;
        }
    }
}

bool c_get_for_xml::skip_PI() {
    bool after_question_mark = false;
    for (;;) {
        int c = get();
        if (c == -1)
            return false;
        if (c == '>' && after_question_mark)
            return true;
        after_question_mark = c == '?';
    }
}

int c_get_for_xml::skip_to_tag_char(bool a_stop_at_slash, std::string *ap_copy) {
    int quote = 0;
    for (;;) {
        int c = get();
        if (c == -1)
            return -1;
        if (quote) {
            if (c == quote)
                quote = 0;
        } else if (c == '"' || c == '\'') {
            quote = c;
        } else if (c == '>' || (c == '/' && a_stop_at_slash)) {
            return c;
        }
        if (ap_copy)
            ap_copy->push_back(static_cast<char>(c));
    }
}

bool c_get_for_xml::move_to_start_tag_end(bool *ap_end_of_element) {
    int c = skip_to_tag_char(true);
    if (c == -1)
        return false;
    if (c == '>') {
        *ap_end_of_element = false;
        return true;
    }
    bool is_errored = false;
    for (c = get(); c != '>'; c = get()) {
        if (c == -1)
            return false;
        if (!is_white(c) && !is_errored) {
            error(elmx_type_error, elmx_end_tag_syntax,
                  std::string("Illegal character(s) after / at end of tag - ") + static_cast<char>(c));
            is_errored = true;
        }
    }
    *ap_end_of_element = true;
    return !is_errored;
}

} // namespace lmx
