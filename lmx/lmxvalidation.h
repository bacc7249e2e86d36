// Validation specs of simple values, and the checks their validators are
// made of.
//
// A binding hands one spec per simple type to the reader and the writer: the
// whitespace mode, a default text, a lexical validator that sees the text
// before conversion, a value validator that sees the value after it, and the
// two conversions. A validator reports each failed facet through the
// reader's handle_error; if the handler clears the error it goes on with the
// next facet, and it returns elmx_ok at the end. Facets are compiled into the
// validators of the binding: there is no facet interpreter and no regular
// expression engine here.
#ifndef LMX_LMXVALIDATION_H
#define LMX_LMXVALIDATION_H

#include <cstddef>
#include <ostream>
#include <string>
#include <vector>

#include "lmxentities.h"
#include "lmxerror.h"
#include "lmxtypes.h"

namespace lmx {

class c_xml_reader;

typedef elmx_error (*t_lexical_validator)(c_xml_reader &ar_reader, const std::string &ar_text);

class c_untyped_validation_spec {
public:
    c_untyped_validation_spec(elmx_whitespace a_whitespace, const char *ap_default,
                              t_lexical_validator ap_lexical_validator)
        : m_whitespace(a_whitespace), m_default(ap_default ? ap_default : ""),
          p_lexical_validator(ap_lexical_validator) {}

    elmx_whitespace get_whitespace_handling() const { return m_whitespace; }
    // Empty for none.
    const std::string &get_default() const { return m_default; }
    elmx_error is_lexical_valid(c_xml_reader &ar_reader, const std::string &ar_text) const {
        return p_lexical_validator(ar_reader, ar_text);
    }

private:
    elmx_whitespace m_whitespace;
    std::string m_default;
    t_lexical_validator p_lexical_validator;
};

template <typename T> class ct_typed_validation_spec : public c_untyped_validation_spec {
public:
    typedef elmx_error (*t_value_validator)(c_xml_reader &ar_reader, const T &ar_value);
    typedef void (*t_v_to_o)(T &ar_o, const std::string &ar_v);
    typedef std::ostream &(*t_o_to_v)(std::ostream &ar_os, const T &ar_o);

    ct_typed_validation_spec(elmx_whitespace a_whitespace, const char *ap_default,
                             t_lexical_validator ap_lexical_validator, t_value_validator ap_value_validator,
                             t_v_to_o ap_v_to_o, t_o_to_v ap_o_to_v)
        : c_untyped_validation_spec(a_whitespace, ap_default, ap_lexical_validator),
          p_value_validator(ap_value_validator), p_v_to_o(ap_v_to_o), p_o_to_v(ap_o_to_v) {}

    elmx_error is_value_valid(c_xml_reader &ar_reader, const T &ar_value) const {
        return p_value_validator(ar_reader, ar_value);
    }
    void v_to_o(T &ar_o, const std::string &ar_v) const { p_v_to_o(ar_o, ar_v); }
    std::ostream &o_to_v(std::ostream &ar_os, const T &ar_o) const { return p_o_to_v(ar_os, ar_o); }

private:
    t_value_validator p_value_validator;
    t_v_to_o p_v_to_o;
    t_o_to_v p_o_to_v;
};

// ---------------------------------------------------------------- patterns
// Room for the pattern facet (elmx_no_pattern_matched). No type of the CxF
// schemas has one, so these hold the pattern text and match nothing: a
// binding that needs patterns must bring a regular expression engine.
class c_regex {
public:
    c_regex() = default;
    explicit c_regex(const std::string &ar_pattern) : m_pattern(ar_pattern) {}
    const std::string &get_pattern() const { return m_pattern; }

private:
    std::string m_pattern;
};

class c_pattern {
public:
    c_pattern() = default;
    void add(const std::string &ar_pattern) { m_alternatives.push_back(c_regex(ar_pattern)); }
    bool empty() const { return m_alternatives.empty(); }
    std::size_t size() const { return m_alternatives.size(); }
    const c_regex &operator[](std::size_t a_index) const { return m_alternatives[a_index]; }

private:
    std::vector<c_regex> m_alternatives;
};

// The pattern of a type without a pattern facet.
class c_pattern_null : public c_pattern {};

// ---------------------------------------------------------------- facet checks
// Each check reports its code through ar_reader.handle_error when the facet
// fails and returns the handler's verdict; elmx_ok when the facet holds.

// A check that has already been made: a_is_ok false reports a_code.
elmx_error check_facet(c_xml_reader &ar_reader, bool a_is_ok, elmx_error a_code);

// Type form: elmx_invalid_value_format.
elmx_error check_integer_form(c_xml_reader &ar_reader, const std::string &ar_text);
elmx_error check_float_form(c_xml_reader &ar_reader, const std::string &ar_text);
elmx_error check_bool_form(c_xml_reader &ar_reader, const std::string &ar_text);
elmx_error check_datetime_form(c_xml_reader &ar_reader, const std::string &ar_text);
elmx_error check_base64_form(c_xml_reader &ar_reader, const std::string &ar_text);

// minLength (elmx_length_too_short): for 1 the text must not be empty,
// otherwise is_min_length_ok. maxLength (elmx_length_too_long): is_max_length_ok.
elmx_error check_min_length(c_xml_reader &ar_reader, const std::string &ar_text, std::size_t a_min);
elmx_error check_max_length(c_xml_reader &ar_reader, const std::string &ar_text, std::size_t a_max);

// Integer bounds on the text, compared as c_big_int before any conversion:
// text >= ap_min, else elmx_value_below_minimum; text <= ap_max, else
// elmx_value_above_maximum.
elmx_error check_integer_min_inclusive(c_xml_reader &ar_reader, const std::string &ar_text, const char *ap_min);
elmx_error check_integer_max_inclusive(c_xml_reader &ar_reader, const std::string &ar_text, const char *ap_max);
// The integer form, then both bounds, in that order; a cleared error goes on
// to the next check. A null bound is not checked.
elmx_error check_integer(c_xml_reader &ar_reader, const std::string &ar_text, const char *ap_min,
                         const char *ap_max);

// Bounds on a double value: value >= min (elmx_value_below_minimum), value >
// min for the exclusive form, value <= max (elmx_value_above_maximum). A NaN
// satisfies none of them.
elmx_error check_min_inclusive(c_xml_reader &ar_reader, double a_value, double a_min);
elmx_error check_min_exclusive(c_xml_reader &ar_reader, double a_value, double a_min);
elmx_error check_max_inclusive(c_xml_reader &ar_reader, double a_value, double a_max);
elmx_error check_max_exclusive(c_xml_reader &ar_reader, double a_value, double a_max);

// Equal to one of the texts, tried in turn, else elmx_value_not_enumerated.
elmx_error check_enumeration(c_xml_reader &ar_reader, const std::wstring &ar_value,
                             const std::wstring *ap_enumerations, std::size_t a_count);
template <std::size_t N>
elmx_error check_enumeration(c_xml_reader &ar_reader, const std::wstring &ar_value,
                             const std::wstring (&ar_enumerations)[N]) {
    return check_enumeration(ar_reader, ar_value, ar_enumerations, N);
}

// totalDigits (elmx_total_digits_exceeded) and fractionDigits
// (elmx_fraction_digits_exceeded) on the text.
elmx_error check_total_digits(c_xml_reader &ar_reader, const std::string &ar_text, std::size_t a_max);
elmx_error check_fraction_digits(c_xml_reader &ar_reader, const std::string &ar_text, std::size_t a_max);

// ---------------------------------------------------------------- ready-made validators

// For types without a facet.
elmx_error lexical_validator_none(c_xml_reader &ar_reader, const std::string &ar_text);
template <typename T> elmx_error value_validator_none(c_xml_reader &, const T &) { return elmx_ok; }

// For c_empty: the text must be empty, else elmx_invalid_value_format.
elmx_error lexical_validator_empty(c_xml_reader &ar_reader, const std::string &ar_text);
elmx_error value_validator_empty(c_xml_reader &ar_reader, const c_empty &ar_value);
void v_to_o_not_used(c_empty &ar_o, const std::string &ar_v);
std::ostream &o_to_v_not_used(std::ostream &ar_os, const c_empty &ar_o);

// Type form alone.
elmx_error lexical_validator_float(c_xml_reader &ar_reader, const std::string &ar_text);
elmx_error lexical_validator_bool(c_xml_reader &ar_reader, const std::string &ar_text);
elmx_error lexical_validator_datetime(c_xml_reader &ar_reader, const std::string &ar_text);
elmx_error lexical_validator_base64(c_xml_reader &ar_reader, const std::string &ar_text);
elmx_error lexical_validator_integer(c_xml_reader &ar_reader, const std::string &ar_text);
// Integer form and the range of the type.
elmx_error lexical_validator_int(c_xml_reader &ar_reader, const std::string &ar_text);
elmx_error lexical_validator_short(c_xml_reader &ar_reader, const std::string &ar_text);
elmx_error lexical_validator_unsigned_int(c_xml_reader &ar_reader, const std::string &ar_text);
elmx_error lexical_validator_unsigned_short(c_xml_reader &ar_reader, const std::string &ar_text);
elmx_error lexical_validator_byte(c_xml_reader &ar_reader, const std::string &ar_text);
elmx_error lexical_validator_unsigned_byte(c_xml_reader &ar_reader, const std::string &ar_text);

} // namespace lmx

#endif
