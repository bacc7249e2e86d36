// Facet checks and the ready-made validators built from them.
#include "lmxvalidation.h"

#include "lmxreader.h"

namespace lmx {

elmx_error check_facet(c_xml_reader &ar_reader, bool a_is_ok, elmx_error a_code) {
    return a_is_ok ? elmx_ok : ar_reader.handle_error(a_code);
}

// ---------------------------------------------------------------- type forms

elmx_error check_integer_form(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_facet(ar_reader, is_valid_integer(ar_text), elmx_invalid_value_format);
}

elmx_error check_float_form(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_facet(ar_reader, is_valid_float(ar_text), elmx_invalid_value_format);
}

elmx_error check_bool_form(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_facet(ar_reader, is_valid_bool(ar_text), elmx_invalid_value_format);
}

elmx_error check_datetime_form(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_facet(ar_reader, c_datetime::is_valid(ar_text), elmx_invalid_value_format);
}

elmx_error check_base64_form(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_facet(ar_reader, c_binary::is_valid_base64(ar_text), elmx_invalid_value_format);
}

// ---------------------------------------------------------------- lengths and digits

elmx_error check_min_length(c_xml_reader &ar_reader, const std::string &ar_text, std::size_t a_min) {
    bool is_ok = a_min == 1 ? !ar_text.empty() : is_min_length_ok(ar_text, a_min);
    return check_facet(ar_reader, is_ok, elmx_length_too_short);
}

elmx_error check_max_length(c_xml_reader &ar_reader, const std::string &ar_text, std::size_t a_max) {
    return check_facet(ar_reader, is_max_length_ok(ar_text, a_max), elmx_length_too_long);
}

elmx_error check_total_digits(c_xml_reader &ar_reader, const std::string &ar_text, std::size_t a_max) {
    return check_facet(ar_reader, total_digits(ar_text) <= a_max, elmx_total_digits_exceeded);
}

elmx_error check_fraction_digits(c_xml_reader &ar_reader, const std::string &ar_text, std::size_t a_max) {
    return check_facet(ar_reader, fraction_digits(ar_text) <= a_max, elmx_fraction_digits_exceeded);
}

// ---------------------------------------------------------------- bounds

// On the text, so that a number too large for its type is refused before
// atoi truncates it.
elmx_error check_integer_min_inclusive(c_xml_reader &ar_reader, const std::string &ar_text, const char *ap_min) {
    return check_facet(ar_reader, c_big_int(ar_text) >= ap_min, elmx_value_below_minimum);
}

elmx_error check_integer_max_inclusive(c_xml_reader &ar_reader, const std::string &ar_text, const char *ap_max) {
    return check_facet(ar_reader, c_big_int(ar_text) <= ap_max, elmx_value_above_maximum);
}

elmx_error check_integer(c_xml_reader &ar_reader, const std::string &ar_text, const char *ap_min,
                         const char *ap_max) {
    if (elmx_error error = check_integer_form(ar_reader, ar_text))
        return error;
    c_big_int value(ar_text);
    if (ap_min)
        if (elmx_error error = check_facet(ar_reader, value >= ap_min, elmx_value_below_minimum))
            return error;
    if (ap_max)
        if (elmx_error error = check_facet(ar_reader, value <= ap_max, elmx_value_above_maximum))
            return error;
    return elmx_ok;
}

elmx_error check_min_inclusive(c_xml_reader &ar_reader, double a_value, double a_min) {
    return check_facet(ar_reader, a_value >= a_min, elmx_value_below_minimum);
}

elmx_error check_min_exclusive(c_xml_reader &ar_reader, double a_value, double a_min) {
    return check_facet(ar_reader, a_value > a_min, elmx_value_below_minimum);
}

elmx_error check_max_inclusive(c_xml_reader &ar_reader, double a_value, double a_max) {
    return check_facet(ar_reader, a_value <= a_max, elmx_value_above_maximum);
}

elmx_error check_max_exclusive(c_xml_reader &ar_reader, double a_value, double a_max) {
    return check_facet(ar_reader, a_value < a_max, elmx_value_above_maximum);
}

elmx_error check_enumeration(c_xml_reader &ar_reader, const std::wstring &ar_value,
                             const std::wstring *ap_enumerations, std::size_t a_count) {
    for (std::size_t i = 0; i < a_count; ++i)
        if (ar_value == ap_enumerations[i])
            return elmx_ok;
    return ar_reader.handle_error(elmx_value_not_enumerated);
}

// ---------------------------------------------------------------- ready-made validators

elmx_error lexical_validator_none(c_xml_reader &, const std::string &) { return elmx_ok; }

elmx_error lexical_validator_empty(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_facet(ar_reader, ar_text.empty(), elmx_invalid_value_format);
}

elmx_error value_validator_empty(c_xml_reader &, const c_empty &) { return elmx_ok; }

void v_to_o_not_used(c_empty &, const std::string &) {}

std::ostream &o_to_v_not_used(std::ostream &ar_os, const c_empty &) { return ar_os; }

elmx_error lexical_validator_float(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_float_form(ar_reader, ar_text);
}

elmx_error lexical_validator_bool(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_bool_form(ar_reader, ar_text);
}

elmx_error lexical_validator_datetime(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_datetime_form(ar_reader, ar_text);
}

elmx_error lexical_validator_base64(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_base64_form(ar_reader, ar_text);
}

elmx_error lexical_validator_integer(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_integer_form(ar_reader, ar_text);
}

elmx_error lexical_validator_int(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_integer(ar_reader, ar_text, "-2147483648", "2147483647");
}

elmx_error lexical_validator_short(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_integer(ar_reader, ar_text, "-32768", "32767");
}

elmx_error lexical_validator_unsigned_int(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_integer(ar_reader, ar_text, "0", "4294967295");
}

elmx_error lexical_validator_unsigned_short(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_integer(ar_reader, ar_text, "0", "65535");
}

elmx_error lexical_validator_byte(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_integer(ar_reader, ar_text, "-128", "127");
}

elmx_error lexical_validator_unsigned_byte(c_xml_reader &ar_reader, const std::string &ar_text) {
    return check_integer(ar_reader, ar_text, "0", "255");
}

} // namespace lmx
