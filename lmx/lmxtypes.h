// Value types of the lmx XML runtime: the classes behind the XML Schema simple
// types, their lexical checks and text forms, the conversions between the
// runtime's narrow UTF-8 strings and the binding's wide UTF-16 strings, and
// (through lmxvalidation.h) the validation specs that bound classes hand to
// the reader and writer.
//
// Nothing here depends on the reader. Lexical checks are hand-written
// scanners: no regular expressions. Text-to-value conversions never fail;
// they rely on the lexical check having run first.
//
// Number output never goes through a fresh stream: values are formatted into
// a small buffer with std::to_chars, which gives the text of a stream in its
// default notation at the same precision, always with "." as decimal point.
#ifndef LMX_LMXTYPES_H
#define LMX_LMXTYPES_H

#include <cstddef>
#include <cstdint>
#include <ostream>
#include <string>
#include <vector>

#include "lmxentities.h"
#include "lmxerror.h"

namespace lmx {

class c_xml_reader;

// Selects overloads by value type and storage type.
template <typename T, typename V> struct c_handling {};

// ---------------------------------------------------------------- scanning helpers
// Cursor helpers of the hand-written lexical scanners. Each takes the cursor
// by reference and moves it past what it accepts; none reads past a NUL.

// Skips decimal digits; the number skipped.
std::size_t skip_digits(const char *&ar_p);
// Skips decimal digits and folds them into *ap_value (wrapping, as unsigned
// arithmetic does); the number of digits.
std::size_t get_digits(const char *&ar_p, unsigned long *ap_value);
// Skips digits, an optional "." and more digits; the number of digits, so a
// lone "." counts as 0.
std::size_t skip_decimal(const char *&ar_p);
// As skip_decimal, and converts what was skipped with atofloat.
std::size_t get_decimal(const char *&ar_p, double *ap_value);
// Skips ap_const if the text starts with it.
bool skip_const(const char *&ar_p, const char *ap_const);
// Requires "+" or "-"; *ap_is_negative tells which. False, not moving, if neither.
bool get_sign(const char *&ar_p, bool *ap_is_negative);
// Requires "+" or "-" and skips it.
bool skip_sign(const char *&ar_p);
// Skips a "+" or "-" if there is one; true if it was "-".
bool skip_opt_sign(const char *&ar_p);

// ---------------------------------------------------------------- lexical checks

// "true", "1", "false", "0".
bool is_valid_bool(const std::string &ar_text);
// Optional sign, at least one digit, nothing else.
bool is_valid_integer(const std::string &ar_text);
// "INF", "-INF", "NaN", or: optional sign, digits with an optional "." (at
// least one digit), optional exponent with optional sign and at least one digit.
bool is_valid_float(const std::string &ar_text);

// ---------------------------------------------------------------- numbers as text

// Text to double: "NaN", "INF" and "-INF" give the special values, anything
// else what atof gives, whatever the decimal point of the current locale.
double atofloat(const char *ap_text);
double atofloat(const std::string &ar_text);

// Room for the longest text of a float or double.
constexpr std::size_t k_float_text_size = 32;
// The XML text of a float (7 significant digits) or a double (14): "NaN",
// "INF", "-INF", "-0.0", "0.0", or what a stream writes in its default
// notation at that precision in the classic locale. Writes no NUL; gives the
// length. ap_buffer must hold k_float_text_size bytes.
std::size_t to_xml_chars(char *ap_buffer, float a_value);
std::size_t to_xml_chars(char *ap_buffer, double a_value);

// ---------------------------------------------------------------- c_big_int
// An integer of any size, held as its decimal digits: an optional "-", no
// leading zeros, "0" for zero.
class c_big_int {
public:
    c_big_int() : m_value("0") {}
    c_big_int(const char *ap_text) { p_init(ap_text); }
    c_big_int(const std::string &ar_text) { p_init(ar_text.c_str()); }
    c_big_int(int a_value);

    c_big_int &operator=(const char *ap_text) {
        p_init(ap_text);
        return *this;
    }
    c_big_int &operator=(const std::string &ar_text) {
        p_init(ar_text.c_str());
        return *this;
    }
    c_big_int &operator=(int a_value) { return *this = c_big_int(a_value); }

    // The value as a 32-bit signed number. On overflow *ap_overflow is set
    // and the result wraps; it is not clamped.
    long get(bool *ap_overflow = nullptr) const;
    // The same, unsigned 32-bit.
    unsigned long get_unsigned(bool *ap_overflow = nullptr) const;
    double get_as_float() const;
    const std::string &get_as_string() const { return m_value; }
    bool is_negative() const { return m_value[0] == '-'; }

    // Three-way comparison with a text: <0, 0, >0. A null text counts as "0";
    // an empty text is never equal and never greater.
    int compare(const char *ap_text) const;
    int compare(const std::string &ar_text) const { return compare(ar_text.c_str()); }
    int compare(const c_big_int &ar_other) const { return compare(ar_other.m_value.c_str()); }

    bool operator==(const char *ap_text) const { return compare(ap_text) == 0; }
    bool operator!=(const char *ap_text) const { return compare(ap_text) != 0; }
    bool operator<(const char *ap_text) const { return compare(ap_text) < 0; }
    bool operator<=(const char *ap_text) const { return compare(ap_text) <= 0; }
    bool operator>(const char *ap_text) const { return compare(ap_text) > 0; }
    bool operator>=(const char *ap_text) const { return compare(ap_text) >= 0; }
    bool operator==(const std::string &ar_text) const { return compare(ar_text) == 0; }
    bool operator!=(const std::string &ar_text) const { return compare(ar_text) != 0; }
    bool operator<(const std::string &ar_text) const { return compare(ar_text) < 0; }
    bool operator<=(const std::string &ar_text) const { return compare(ar_text) <= 0; }
    bool operator>(const std::string &ar_text) const { return compare(ar_text) > 0; }
    bool operator>=(const std::string &ar_text) const { return compare(ar_text) >= 0; }
    bool operator==(const c_big_int &ar_other) const { return m_value == ar_other.m_value; }
    bool operator!=(const c_big_int &ar_other) const { return m_value != ar_other.m_value; }
    bool operator<(const c_big_int &ar_other) const { return compare(ar_other) < 0; }
    bool operator<=(const c_big_int &ar_other) const { return compare(ar_other) <= 0; }
    bool operator>(const c_big_int &ar_other) const { return compare(ar_other) > 0; }
    bool operator>=(const c_big_int &ar_other) const { return compare(ar_other) >= 0; }

private:
    void p_init(const char *ap_text);
    std::string m_value;
};

std::ostream &operator<<(std::ostream &ar_os, const c_big_int &ar_value);

// ---------------------------------------------------------------- c_decimal
// A decimal number of any size and precision: sign, integral digits and
// fractional digits.
class c_decimal {
public:
    c_decimal() = default;
    c_decimal(const char *ap_text) { p_init(ap_text); }
    c_decimal(const std::string &ar_text) { p_init(ar_text.c_str()); }
    // a_integral "." the decimal digits of a_fractional: (3, 14) is 3.14,
    // (-2, 5) is -2.5. The sign is the integral part's.
    c_decimal(int a_integral, int a_fractional);
    // The double with a_precision fractional digits, 0 to 15.
    c_decimal(double a_value, int a_precision);

    c_decimal &operator=(const char *ap_text) {
        p_init(ap_text);
        return *this;
    }
    c_decimal &operator=(const std::string &ar_text) {
        p_init(ar_text.c_str());
        return *this;
    }
    void set(const char *ap_text) { p_init(ap_text); }
    void set(const std::string &ar_text) { p_init(ar_text.c_str()); }

    // Optional sign, digits with an optional "." (at least one digit).
    static bool is_valid(const std::string &ar_text);

    bool is_negative() const { return m_is_negative; }
    void set_negative(bool a_is_negative) { m_is_negative = a_is_negative; }
    // The integral part as a signed 32-bit number.
    long get_integral(bool *ap_overflow = nullptr) const;
    // Sets the integral part and the sign; the fraction stays.
    void set_integral(long a_value);
    void set_integral(const c_big_int &ar_value);
    // The first a_digits fractional digits as a number, padded with zeros:
    // 1.05 gives 5 for 2 digits, 50 for 3.
    long get_fractional(unsigned a_digits, bool *ap_overflow = nullptr) const;
    // The fraction from a number of a_digits digits: (5, 2) gives ".05".
    void set_fractional(unsigned long a_value, unsigned a_digits);
    // The value times 10^a_digits, truncated, signed 32-bit.
    long get_scaled(unsigned a_digits, bool *ap_overflow = nullptr) const;
    // The value a_value / 10^a_digits.
    void set_scaled(long a_value, unsigned a_digits);
    double get_as_float() const;
    const c_big_int &get_integral_digits() const { return m_integral; }
    const std::string &get_fractional_digits() const { return m_fractional; }
    // "-" if negative, the integral part (left out if it is zero and there is
    // a fraction: ".5"), "." and the fraction if there is one.
    std::string get_as_string() const;

    int compare(const c_decimal &ar_other) const;
    bool operator==(const c_decimal &ar_other) const;
    bool operator!=(const c_decimal &ar_other) const { return !(*this == ar_other); }
    bool operator<(const c_decimal &ar_other) const { return compare(ar_other) < 0; }
    bool operator<=(const c_decimal &ar_other) const { return compare(ar_other) <= 0; }
    bool operator>(const c_decimal &ar_other) const { return compare(ar_other) > 0; }
    bool operator>=(const c_decimal &ar_other) const { return compare(ar_other) >= 0; }

private:
    void p_init(const char *ap_text);
    // Fractions compared as if padded with zeros to the same length.
    static int p_fraction_comp(const std::string &ar_lhs, const std::string &ar_rhs);
    bool m_is_negative = false;
    c_big_int m_integral;
    std::string m_fractional;
};

std::ostream &operator<<(std::ostream &ar_os, const c_decimal &ar_value);

// ---------------------------------------------------------------- c_binary
// Bytes, written as hex or as base64.
class c_binary {
public:
    c_binary() = default;
    c_binary(const unsigned char *ap_data, std::size_t a_size) { set(ap_data, a_size); }
    explicit c_binary(const std::vector<unsigned char> &ar_data) : m_data(ar_data) {}

    // Even length, hex digits in either case.
    static bool is_valid_hex(const std::string &ar_text);
    // Base64 with optional white space and "=" padding; empty is valid.
    static bool is_valid_base64(const std::string &ar_text);

    void set(const unsigned char *ap_data, std::size_t a_size) { m_data.assign(ap_data, ap_data + a_size); }
    void set(const std::vector<unsigned char> &ar_data) { m_data = ar_data; }
    // Replaces the bytes by those of the text.
    void from_hex(const std::string &ar_text);
    void from_base64(const std::string &ar_text);
    // Two upper-case digits a byte; the stream's flags are left as they were.
    std::ostream &out_hex(std::ostream &ar_os) const;
    // Groups of four characters with "=" padding, never a line break.
    std::ostream &out_base64(std::ostream &ar_os) const;
    std::string get_as_string() const;

    void append(unsigned char a_byte) { m_data.push_back(a_byte); }
    void append(const unsigned char *ap_data, std::size_t a_size) { m_data.insert(m_data.end(), ap_data, ap_data + a_size); }
    void append(const c_binary &ar_other) { m_data.insert(m_data.end(), ar_other.m_data.begin(), ar_other.m_data.end()); }
    c_binary &operator+=(unsigned char a_byte) {
        append(a_byte);
        return *this;
    }
    c_binary &operator+=(const c_binary &ar_other) {
        append(ar_other);
        return *this;
    }
    unsigned char &operator[](std::size_t a_index) { return m_data[a_index]; }
    unsigned char operator[](std::size_t a_index) const { return m_data[a_index]; }
    unsigned char &at(std::size_t a_index) { return m_data.at(a_index); }
    unsigned char at(std::size_t a_index) const { return m_data.at(a_index); }
    std::size_t size() const { return m_data.size(); }
    bool empty() const { return m_data.empty(); }
    const std::vector<unsigned char> &get() const { return m_data; }
    std::vector<unsigned char> &get() { return m_data; }
    bool equal(const c_binary &ar_other) const { return m_data == ar_other.m_data; }
    bool operator==(const c_binary &ar_other) const { return equal(ar_other); }
    bool operator!=(const c_binary &ar_other) const { return !equal(ar_other); }

private:
    std::vector<unsigned char> m_data;
};

// ---------------------------------------------------------------- c_duration
// An xs:duration. Comparison follows the schema's partial order: durations
// whose months make their lengths in days overlap (P1M against P30D) are
// indeterminate, and then ==, <, <= and > are all false and != is true.
class c_duration {
public:
    c_duration() = default;
    c_duration(const char *ap_text) { p_init(ap_text); }
    c_duration(const std::string &ar_text) { p_init(ar_text.c_str()); }
    c_duration(bool a_is_negative, unsigned a_years, unsigned a_months, unsigned a_days, unsigned a_hours,
               unsigned a_minutes, float a_seconds)
        : m_is_negative(a_is_negative), m_years(a_years), m_months(a_months), m_days(a_days), m_hours(a_hours),
          m_minutes(a_minutes), m_seconds(a_seconds) {}

    // Replaces every field; a text that is not valid is read up to its first
    // mismatch, keeping what was read.
    c_duration &operator=(const char *ap_text) {
        p_init(ap_text);
        return *this;
    }
    c_duration &operator=(const std::string &ar_text) {
        p_init(ar_text.c_str());
        return *this;
    }

    // Optional sign, "P", then each optional: number "Y", number "M", number
    // "D", and after an optional "T": number "H", number "M", decimal "S".
    static bool is_valid(const std::string &ar_text);

    bool is_negative() const { return m_is_negative; }
    std::uint32_t get_years() const { return m_years; }
    std::uint32_t get_months() const { return m_months; }
    std::uint32_t get_days() const { return m_days; }
    std::uint32_t get_hours() const { return m_hours; }
    std::uint32_t get_minutes() const { return m_minutes; }
    float get_seconds() const { return m_seconds; }
    void set_negative(bool a_is_negative) { m_is_negative = a_is_negative; }
    void set_years(std::uint32_t a_value) { m_years = a_value; }
    void set_months(std::uint32_t a_value) { m_months = a_value; }
    void set_days(std::uint32_t a_value) { m_days = a_value; }
    void set_hours(std::uint32_t a_value) { m_hours = a_value; }
    void set_minutes(std::uint32_t a_value) { m_minutes = a_value; }
    void set_seconds(float a_value) { m_seconds = a_value; }

    // Carries seconds into minutes, minutes into hours, hours into days and
    // months into years. Days are not carried into months.
    void normalize();
    // "-" if negative, "P", each non-zero field with its letter, "T" only
    // before a non-zero time field. A zero duration is "P".
    std::string get_as_string() const;

    // True when the order of the two cannot be told.
    bool is_indeterminate(const c_duration &ar_other) const;
    bool operator==(const c_duration &ar_other) const;
    bool operator!=(const c_duration &ar_other) const { return !(*this == ar_other); }
    bool operator<(const c_duration &ar_other) const;
    bool operator<=(const c_duration &ar_other) const { return *this < ar_other || *this == ar_other; }
    bool operator>(const c_duration &ar_other) const { return ar_other < *this; }
    // Not less: true also when the order is indeterminate.
    bool operator>=(const c_duration &ar_other) const { return !(*this < ar_other); }

private:
    void p_init(const char *ap_text);
    // <0, 0, >0 for two durations whose order can be told.
    int p_compare(const c_duration &ar_other) const;

    bool m_is_negative = false;
    std::uint32_t m_years = 0;
    std::uint32_t m_months = 0;
    std::uint32_t m_days = 0;
    std::uint32_t m_hours = 0;
    std::uint32_t m_minutes = 0;
    float m_seconds = 0.0f;
};

std::ostream &operator<<(std::ostream &ar_os, const c_duration &ar_value);

// ---------------------------------------------------------------- dates and times
// The fields shared by xs:dateTime, xs:date, xs:time and the g-types. The
// classes derived from it differ only in their lexical form. Ranges are not
// checked (month 13 passes); comparison is field by field and ignores the
// time zone.
class c_datetime_base {
public:
    std::int32_t get_year() const { return m_year; }
    std::uint32_t get_month() const { return m_month; }
    std::uint32_t get_day() const { return m_day; }
    std::uint32_t get_hours() const { return m_hours; }
    std::uint32_t get_minutes() const { return m_minutes; }
    float get_seconds() const { return m_seconds; }
    // Offset of the time zone from UTC, in minutes.
    std::int32_t get_tz_offset() const { return m_tz_offset; }
    bool is_utc() const { return m_is_utc; }
    void set_year(std::int32_t a_value) { m_year = a_value; }
    void set_month(std::uint32_t a_value) { m_month = a_value; }
    void set_day(std::uint32_t a_value) { m_day = a_value; }
    void set_hours(std::uint32_t a_value) { m_hours = a_value; }
    void set_minutes(std::uint32_t a_value) { m_minutes = a_value; }
    void set_seconds(float a_value) { m_seconds = a_value; }
    void set_tz_offset(std::int32_t a_minutes) { m_tz_offset = a_minutes; }
    void set_utc(bool a_is_utc) { m_is_utc = a_is_utc; }

    int compare(const c_datetime_base &ar_other) const;
    bool operator==(const c_datetime_base &ar_other) const { return compare(ar_other) == 0; }
    bool operator!=(const c_datetime_base &ar_other) const { return compare(ar_other) != 0; }
    bool operator<(const c_datetime_base &ar_other) const { return compare(ar_other) < 0; }
    bool operator<=(const c_datetime_base &ar_other) const { return compare(ar_other) <= 0; }
    bool operator>(const c_datetime_base &ar_other) const { return compare(ar_other) > 0; }
    bool operator>=(const c_datetime_base &ar_other) const { return compare(ar_other) >= 0; }

    // The lexical forms.
    enum e_form { f_datetime, f_date, f_time, f_gyearmonth, f_gyear, f_gmonthday, f_gday, f_gmonth };

protected:
    c_datetime_base() = default;
    static bool p_is_valid(e_form a_form, const char *ap_text);
    // Reads the fields in the form's order, stopping at the first mismatch
    // and leaving the fields not reached as they were.
    void p_init(e_form a_form, const char *ap_text);
    std::string p_get_as_string(e_form a_form) const;
    std::ostream &p_output(e_form a_form, std::ostream &ar_os) const;

private:
    std::int32_t m_year = 1;
    std::uint32_t m_month = 0;
    std::uint32_t m_day = 0;
    std::uint32_t m_hours = 0;
    std::uint32_t m_minutes = 0;
    float m_seconds = 0.0f;
    std::int32_t m_tz_offset = 0;
    bool m_is_utc = false;
};

// One class per form; yyyy is at least four digits with an optional sign, dd
// exactly two, and the zone is nothing, "Z", or "+hh:mm" or "-hh:mm".
#define LMX_DATETIME_CLASS(class_name, form)                                                                       \
    class class_name : public c_datetime_base {                                                                    \
    public:                                                                                                        \
        class_name() = default;                                                                                    \
        class_name(const char *ap_text) { p_init(form, ap_text); }                                                 \
        class_name(const std::string &ar_text) { p_init(form, ar_text.c_str()); }                                  \
        class_name &operator=(const char *ap_text) {                                                               \
            p_init(form, ap_text);                                                                                 \
            return *this;                                                                                          \
        }                                                                                                          \
        class_name &operator=(const std::string &ar_text) {                                                        \
            p_init(form, ar_text.c_str());                                                                         \
            return *this;                                                                                          \
        }                                                                                                          \
        static bool is_valid(const std::string &ar_text) { return p_is_valid(form, ar_text.c_str()); }             \
        std::string get_as_string() const { return p_get_as_string(form); }                                        \
        std::ostream &output(std::ostream &ar_os) const { return p_output(form, ar_os); }                          \
    };                                                                                                             \
    inline std::ostream &operator<<(std::ostream &ar_os, const class_name &ar_value) { return ar_value.output(ar_os); }

// yyyy-mm-ddThh:mm:ss[.digits]zone
LMX_DATETIME_CLASS(c_datetime, f_datetime)
// yyyy-mm-ddzone
LMX_DATETIME_CLASS(c_date, f_date)
// hh:mm:ss[.digits]zone; the check also lets a leading sign pass, which
// assignment does not read.
LMX_DATETIME_CLASS(c_time, f_time)
// yyyy-mmzone
LMX_DATETIME_CLASS(c_gyearmonth, f_gyearmonth)
// yyyyzone
LMX_DATETIME_CLASS(c_gyear, f_gyear)
// --mm-ddzone
LMX_DATETIME_CLASS(c_gmonthday, f_gmonthday)
// ---ddzone
LMX_DATETIME_CLASS(c_gday, f_gday)
// --mm--zone
LMX_DATETIME_CLASS(c_gmonth, f_gmonth)

#undef LMX_DATETIME_CLASS

// ---------------------------------------------------------------- qualified names and empty content

template <typename S> class ct_qname {
public:
    ct_qname() = default;
    ct_qname(const std::string &ar_namespace, const S &ar_name) : m_namespace(ar_namespace), m_name(ar_name) {}
    const std::string &get_namespace() const { return m_namespace; }
    const S &get_name() const { return m_name; }
    void set_namespace(const std::string &ar_namespace) { m_namespace = ar_namespace; }
    void set_name(const S &ar_name) { m_name = ar_name; }
    bool operator==(const ct_qname &ar_other) const {
        return m_namespace == ar_other.m_namespace && m_name == ar_other.m_name;
    }
    bool operator!=(const ct_qname &ar_other) const { return !(*this == ar_other); }

private:
    std::string m_namespace;
    S m_name;
};

// Stores namespace and name. A plain string has no room for the namespace
// and takes the local name alone.
void make_qname(ct_qname<std::string> &ar_qname, const std::string &ar_namespace, const std::string &ar_local);
void make_qname(ct_qname<std::wstring> &ar_qname, const std::string &ar_namespace, const std::string &ar_local);
void make_qname(std::string &ar_qname, const std::string &ar_namespace, const std::string &ar_local);
void make_qname(std::wstring &ar_qname, const std::string &ar_namespace, const std::string &ar_local);

// The value of an element that has no content.
class c_empty {
public:
    bool operator==(const c_empty &) const { return true; }
    bool operator!=(const c_empty &) const { return false; }
};

// ---------------------------------------------------------------- narrow and wide text
// Narrow strings are UTF-8; wide strings hold UTF-16 code units, one per
// wchar_t, with surrogate pairs above U+FFFF.

// UTF-8 to UTF-16, replacing ar_out. Stops silently, keeping what is done, at
// an invalid lead byte, a truncated sequence, a bad continuation byte, a code
// point above U+10FFFF, or an encoded high surrogate that is not followed by
// an encoded low one.
void vtostring(std::wstring &ar_out, const std::string &ar_in);
// Copies.
void vtostring(std::string &ar_out, const std::string &ar_in);
// UTF-16 to UTF-8, replacing ar_out. A lone surrogate passes as a code point
// of its own.
void convert(std::string &ar_out, const std::wstring &ar_in);
// Same as vtostring.
void convert(std::wstring &ar_out, const std::string &ar_in);
void convert(std::string &ar_out, const std::string &ar_in);
void convert(std::wstring &ar_out, const std::wstring &ar_in);
// The wide form of a UTF-8 constant, for the enumeration texts of a binding.
void inittowstring(std::wstring &ar_out, const char *ap_text);
std::wstring inittowstring(const char *ap_text);
// Appends the UTF-8 bytes of one code point.
void unicode_char_to_utf8(std::string &ar_out, unsigned long a_code_point);

// ---------------------------------------------------------------- length and digit facets

// Characters of UTF-8 text; an encoded surrogate pair (six bytes) counts as
// one, a bad lead byte ends the count.
std::size_t length(const std::string &ar_text);
bool is_min_length_ok(const std::string &ar_text, std::size_t a_min);
bool is_max_length_ok(const std::string &ar_text, std::size_t a_max);
// Digit characters; digit characters after the first ".".
std::size_t total_digits(const std::string &ar_text);
std::size_t fraction_digits(const std::string &ar_text);

// ---------------------------------------------------------------- list values
// Splits an xs:list text into its items at white space.
class c_xml_list_tokeniser {
public:
    c_xml_list_tokeniser() = default;
    explicit c_xml_list_tokeniser(const std::string &ar_text) : m_text(ar_text) {}
    // Starts again over a new text.
    void set(const std::string &ar_text) {
        m_text = ar_text;
        m_position = 0;
    }
    // The next item; false at the end.
    bool get(std::string *ap_out);
    bool get(std::string &ar_out) { return get(&ar_out); }

private:
    std::string m_text;
    std::size_t m_position = 0;
};

// ---------------------------------------------------------------- output

// Text in XML: """ "&quot;", "'" "&apos;", "&" "&amp;", "<" "&lt;", and ">"
// "&gt;" only after "]" at index 2 or later. Nothing else changes. Wide
// text is written as UTF-8; a high surrogate at the end or without its low
// surrogate ends the output of the string.
std::ostream &output_convert_to_escaped(std::ostream &ar_os, const std::string &ar_text);
std::ostream &output_convert_to_escaped(std::ostream &ar_os, const std::wstring &ar_text);
// Appends the escaped text to a string.
void append_escaped(std::string &ar_out, const char *ap_text, std::size_t a_size);

// Values as XML text: numbers by their rules above, strings escaped, the
// classes in their lexical form.
std::ostream &output_convert_to_xml(std::ostream &ar_os, float a_value);
std::ostream &output_convert_to_xml(std::ostream &ar_os, double a_value);
std::ostream &output_convert_to_xml(std::ostream &ar_os, const std::string &ar_text);
std::ostream &output_convert_to_xml(std::ostream &ar_os, const std::wstring &ar_text);
std::ostream &output_convert_to_xml(std::ostream &ar_os, const char *ap_text);
// Upper-case hex of the bytes.
std::ostream &output_convert_to_hex(std::ostream &ar_os, const c_binary &ar_value);
// "1" or "0".
std::ostream &output_convert_to_bool_digit(std::ostream &ar_os, bool a_value);
// Wide text with "." for every unit above 127.
std::ostream &output_convert_to_ascii(std::ostream &ar_os, const std::wstring &ar_text);
// Base64 of the bytes.
std::ostream &o_to_v_base64(std::ostream &ar_os, const c_binary &ar_value);

// Text to value and value to XML text, for every type of the member
// templates: bool, int, unsigned int, short, unsigned short, signed char,
// unsigned char, float, double, std::string, std::wstring, c_big_int,
// c_decimal, c_duration, the eight date and time classes and c_binary
// (base64). Integers are read with atoi and narrowed to the type; the range
// checks work on the text before (lmxvalidation.h).
template <typename T> void v_to_o(T &ar_o, const std::string &ar_v);
template <typename T> std::ostream &o_to_v(std::ostream &ar_os, const T &ar_o);

#define LMX_VALUE_TYPE(type)                                                                                       \
    template <> void v_to_o<type>(type & ar_o, const std::string &ar_v);                                           \
    template <> std::ostream &o_to_v<type>(std::ostream & ar_os, const type &ar_o);
LMX_VALUE_TYPE(bool)
LMX_VALUE_TYPE(int)
LMX_VALUE_TYPE(unsigned int)
LMX_VALUE_TYPE(short)
LMX_VALUE_TYPE(unsigned short)
LMX_VALUE_TYPE(signed char)
LMX_VALUE_TYPE(unsigned char)
LMX_VALUE_TYPE(float)
LMX_VALUE_TYPE(double)
LMX_VALUE_TYPE(std::string)
LMX_VALUE_TYPE(std::wstring)
LMX_VALUE_TYPE(c_big_int)
LMX_VALUE_TYPE(c_decimal)
LMX_VALUE_TYPE(c_duration)
LMX_VALUE_TYPE(c_datetime)
LMX_VALUE_TYPE(c_date)
LMX_VALUE_TYPE(c_time)
LMX_VALUE_TYPE(c_gyearmonth)
LMX_VALUE_TYPE(c_gyear)
LMX_VALUE_TYPE(c_gmonthday)
LMX_VALUE_TYPE(c_gday)
LMX_VALUE_TYPE(c_gmonth)
LMX_VALUE_TYPE(c_binary)
#undef LMX_VALUE_TYPE

// Hex and base64 forms of c_binary, for specs that want the other one.
void v_to_o_hex(c_binary &ar_o, const std::string &ar_v);
std::ostream &o_to_v_hex(std::ostream &ar_os, const c_binary &ar_o);
void v_to_o_base64(c_binary &ar_o, const std::string &ar_v);

// Every other value: its own text form through o_to_v.
template <typename T> std::ostream &output_convert_to_xml(std::ostream &ar_os, const T &ar_value) {
    return o_to_v<T>(ar_os, ar_value);
}

// The text of a value, unescaped: strings as their UTF-8, everything else as
// its XML form.
template <typename T> void as_string(std::string &ar_out, const T &ar_value);
template <> void as_string<std::string>(std::string &ar_out, const std::string &ar_value);
template <> void as_string<std::wstring>(std::string &ar_out, const std::wstring &ar_value);
template <> void as_string<bool>(std::string &ar_out, const bool &ar_value);
template <> void as_string<float>(std::string &ar_out, const float &ar_value);
template <> void as_string<double>(std::string &ar_out, const double &ar_value);
template <> void as_string<int>(std::string &ar_out, const int &ar_value);
template <> void as_string<unsigned int>(std::string &ar_out, const unsigned int &ar_value);
template <typename T> void as_string(std::string &ar_out, const T &ar_value) { ar_out = ar_value.get_as_string(); }
template <> inline void as_string<short>(std::string &ar_out, const short &ar_value) {
    as_string<int>(ar_out, ar_value);
}
template <> inline void as_string<unsigned short>(std::string &ar_out, const unsigned short &ar_value) {
    as_string<unsigned int>(ar_out, ar_value);
}
template <> inline void as_string<signed char>(std::string &ar_out, const signed char &ar_value) {
    as_string<int>(ar_out, ar_value);
}
template <> inline void as_string<unsigned char>(std::string &ar_out, const unsigned char &ar_value) {
    as_string<unsigned int>(ar_out, ar_value);
}

// ---------------------------------------------------------------- manipulators
// For stream insertion: os << as_xml(value), os << c_as_base64(binary), ...
// Each holds a reference to the value and writes it when inserted.

template <typename T> class c_as_xml {
public:
    explicit c_as_xml(const T &ar_value) : ar_value(ar_value) {}
    friend std::ostream &operator<<(std::ostream &ar_os, const c_as_xml &ar_m) {
        return output_convert_to_xml(ar_os, ar_m.ar_value);
    }

private:
    const T &ar_value;
};
template <typename T> c_as_xml<T> as_xml(const T &ar_value) { return c_as_xml<T>(ar_value); }

// Escaped narrow or wide text.
template <typename S> class c_as_escaped {
public:
    explicit c_as_escaped(const S &ar_value) : ar_value(ar_value) {}
    friend std::ostream &operator<<(std::ostream &ar_os, const c_as_escaped &ar_m) {
        return output_convert_to_escaped(ar_os, ar_m.ar_value);
    }

private:
    const S &ar_value;
};

class c_as_base64 {
public:
    explicit c_as_base64(const c_binary &ar_value) : ar_value(ar_value) {}
    friend std::ostream &operator<<(std::ostream &ar_os, const c_as_base64 &ar_m) {
        return ar_m.ar_value.out_base64(ar_os);
    }

private:
    const c_binary &ar_value;
};

class c_as_hex {
public:
    explicit c_as_hex(const c_binary &ar_value) : ar_value(ar_value) {}
    friend std::ostream &operator<<(std::ostream &ar_os, const c_as_hex &ar_m) { return ar_m.ar_value.out_hex(ar_os); }

private:
    const c_binary &ar_value;
};

class c_as_bool_digit {
public:
    explicit c_as_bool_digit(bool a_value) : m_value(a_value) {}
    friend std::ostream &operator<<(std::ostream &ar_os, const c_as_bool_digit &ar_m) {
        return output_convert_to_bool_digit(ar_os, ar_m.m_value);
    }

private:
    bool m_value;
};

class c_as_ascii {
public:
    explicit c_as_ascii(const std::wstring &ar_value) : ar_value(ar_value) {}
    friend std::ostream &operator<<(std::ostream &ar_os, const c_as_ascii &ar_m) {
        return output_convert_to_ascii(ar_os, ar_m.ar_value);
    }

private:
    const std::wstring &ar_value;
};

// A narrow or wide string as its UTF-8 text, unescaped: for text that is
// already XML.
template <typename S> class c_as_xml_string {
public:
    explicit c_as_xml_string(const S &ar_value) : ar_value(ar_value) {}
    friend std::ostream &operator<<(std::ostream &ar_os, const c_as_xml_string &ar_m) {
        return p_write(ar_os, ar_m.ar_value);
    }

private:
    static std::ostream &p_write(std::ostream &ar_os, const std::string &ar_text) {
        return ar_os.write(ar_text.data(), static_cast<std::streamsize>(ar_text.size()));
    }
    static std::ostream &p_write(std::ostream &ar_os, const std::wstring &ar_text) {
        std::string narrow;
        convert(narrow, ar_text);
        return p_write(ar_os, narrow);
    }
    const S &ar_value;
};

} // namespace lmx

#include "lmxvalidation.h"

#endif
