// Numbers: the scanning helpers, the lexical checks of booleans, integers and
// floats, numbers as text both ways, c_big_int and c_decimal.
#include "lmxtypes.h"

#include <charconv>
#include <clocale>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <system_error>

#include "lmxoutput.h"

namespace lmx {

namespace {

bool is_digit(char a_c) { return a_c >= '0' && a_c <= '9'; }

// A zero the compiler cannot see through, so that NaN and the infinities come
// from a division made at run time.
double float_zero() {
    static volatile double zero = 0.0;
    return zero;
}

// A text scanned by a check: valid only if the scan ended exactly at its end
// (an embedded NUL does not end it).
bool is_at_end(const std::string &ar_text, const char *ap_p) { return ap_p == ar_text.c_str() + ar_text.size(); }

template <typename T> std::ostream &write_integer(std::ostream &ar_os, T a_value) {
    char buffer[24];
    std::to_chars_result result = std::to_chars(buffer, buffer + sizeof buffer, a_value);
    return write_raw(ar_os, buffer, static_cast<std::size_t>(result.ptr - buffer));
}

// atoi, narrowed to the member type; out-of-range values wrap.
template <typename T> void read_integer(T &ar_o, const std::string &ar_v) {
    ar_o = static_cast<T>(static_cast<int>(std::strtol(ar_v.c_str(), nullptr, 10)));
}

template <typename T> std::size_t float_to_chars(char *ap_buffer, T a_value, int a_precision) {
    if (std::isnan(a_value)) {
        std::memcpy(ap_buffer, "NaN", 3);
        return 3;
    }
    if (std::isinf(a_value)) {
        if (a_value < 0) {
            std::memcpy(ap_buffer, "-INF", 4);
            return 4;
        }
        std::memcpy(ap_buffer, "INF", 3);
        return 3;
    }
    if (a_value == 0) {
        if (std::signbit(a_value)) {
            std::memcpy(ap_buffer, "-0.0", 4);
            return 4;
        }
        std::memcpy(ap_buffer, "0.0", 3);
        return 3;
    }
    // The general format at a precision is printf's "%.*g", which is what a
    // stream in its default notation writes.
    std::to_chars_result result =
        std::to_chars(ap_buffer, ap_buffer + k_float_text_size, a_value, std::chars_format::general, a_precision);
    return static_cast<std::size_t>(result.ptr - ap_buffer);
}

// A double that is the nearest double to a decimal of few places, as measured
// values are, is written from that decimal: m / 10^k == value, computed with
// IEEE division, means exactly that. Such a decimal of at most 14 significant
// digits is also what "%.14g" makes of the value: the value lies far closer to
// it than to any other 14-digit decimal. Only values from 1e-4 up to 1e14 are
// taken, which "%.14g" writes without an exponent. Gives 0 when the value is
// not of that kind, for the general conversion to do.
std::size_t short_decimal_to_chars(char *ap_buffer, double a_value) {
    static const double k_powers_of_ten[] = {1e0, 1e1, 1e2, 1e3, 1e4, 1e5, 1e6, 1e7, 1e8};
    const double k_max_digits_value = 1e14; // 14 significant digits
    double magnitude = std::fabs(a_value);
    if (!(magnitude >= 1e-4 && magnitude < k_max_digits_value))
        return 0;
    // A decimal of up to 8 places shows as a near-whole value at 8 places:
    // one look rules out values of many digits before the search.
    double probe = magnitude * k_powers_of_ten[8];
    if (probe < k_max_digits_value && std::fabs(probe - std::floor(probe + 0.5)) > 1e-9 * probe)
        return 0;
    for (int places = 0; places < 9; ++places) {
        double scaled = magnitude * k_powers_of_ten[places];
        if (scaled >= k_max_digits_value)
            return 0;
        long long digits = static_cast<long long>(scaled + 0.5);
        // A decimal that is the value's nearest lies within a few units of the
        // last place of the scaled value; the cheap test spares most divisions.
        double candidate = static_cast<double>(digits);
        if (std::fabs(scaled - candidate) > 1e-9 * scaled || candidate / k_powers_of_ten[places] != magnitude)
            continue;
        char text[24];
        std::size_t length = static_cast<std::size_t>(std::to_chars(text, text + sizeof text, digits).ptr - text);
        char *p = ap_buffer;
        if (a_value < 0)
            *p++ = '-';
        std::size_t places_count = static_cast<std::size_t>(places);
        if (places_count == 0) {
            std::memcpy(p, text, length);
            p += length;
        } else if (length > places_count) {
            std::memcpy(p, text, length - places_count);
            p += length - places_count;
            *p++ = '.';
            std::memcpy(p, text + length - places_count, places_count);
            p += places_count;
        } else {
            *p++ = '0';
            *p++ = '.';
            std::memset(p, '0', places_count - length);
            p += places_count - length;
            std::memcpy(p, text, length);
            p += length;
        }
        return static_cast<std::size_t>(p - ap_buffer);
    }
    return 0;
}

// atof after making the decimal point the current locale's.
double locale_atof(const char *ap_text) {
    const char *p_point = std::localeconv()->decimal_point;
    if (!p_point || p_point[0] != ',')
        return std::atof(ap_text);
    std::size_t size = std::strlen(ap_text);
    char buffer[30];
    std::string long_text;
    char *p_copy = buffer;
    if (size >= sizeof buffer) {
        long_text.assign(ap_text, size);
        p_copy = &long_text[0];
    } else {
        std::memcpy(buffer, ap_text, size + 1);
    }
    for (char *p = p_copy; *p; ++p)
        if (*p == '.')
            *p = ',';
    return std::atof(p_copy);
}

} // namespace

// ---------------------------------------------------------------- scanning helpers

std::size_t skip_digits(const char *&ar_p) {
    const char *p_start = ar_p;
    while (is_digit(*ar_p))
        ++ar_p;
    return static_cast<std::size_t>(ar_p - p_start);
}

std::size_t get_digits(const char *&ar_p, unsigned long *ap_value) {
    unsigned long value = 0;
    const char *p_start = ar_p;
    while (is_digit(*ar_p))
        value = value * 10 + static_cast<unsigned long>(*ar_p++ - '0');
    if (ar_p != p_start)
        *ap_value = value;
    return static_cast<std::size_t>(ar_p - p_start);
}

std::size_t skip_decimal(const char *&ar_p) {
    std::size_t count = skip_digits(ar_p);
    if (*ar_p == '.') {
        ++ar_p;
        count += skip_digits(ar_p);
    }
    return count;
}

std::size_t get_decimal(const char *&ar_p, double *ap_value) {
    const char *p_start = ar_p;
    std::size_t count = skip_decimal(ar_p);
    if (count > 0)
        *ap_value = atofloat(std::string(p_start, ar_p));
    return count;
}

bool skip_const(const char *&ar_p, const char *ap_const) {
    std::size_t size = std::strlen(ap_const);
    if (std::strncmp(ar_p, ap_const, size) != 0)
        return false;
    ar_p += size;
    return true;
}

bool get_sign(const char *&ar_p, bool *ap_is_negative) {
    if (*ar_p != '+' && *ar_p != '-')
        return false;
    *ap_is_negative = *ar_p == '-';
    ++ar_p;
    return true;
}

bool skip_sign(const char *&ar_p) {
    bool is_negative;
    return get_sign(ar_p, &is_negative);
}

bool skip_opt_sign(const char *&ar_p) {
    bool is_negative = false;
    get_sign(ar_p, &is_negative);
    return is_negative;
}

// ---------------------------------------------------------------- lexical checks

bool is_valid_bool(const std::string &ar_text) {
    return ar_text == "true" || ar_text == "1" || ar_text == "false" || ar_text == "0";
}

bool is_valid_integer(const std::string &ar_text) {
    const char *p = ar_text.c_str();
    skip_opt_sign(p);
    return skip_digits(p) > 0 && is_at_end(ar_text, p);
}

bool is_valid_float(const std::string &ar_text) {
    // The three special forms, looked at only when the first byte allows.
    const char first = ar_text.empty() ? '\0' : ar_text[0];
    if ((first == 'I' || first == '-' || first == 'N') && (ar_text == "INF" || ar_text == "-INF" || ar_text == "NaN"))
        return true;
    const char *p = ar_text.c_str();
    skip_opt_sign(p);
    if (skip_decimal(p) == 0)
        return false;
    if (*p == 'e' || *p == 'E') {
        ++p;
        skip_opt_sign(p);
        if (skip_digits(p) == 0)
            return false;
    }
    return is_at_end(ar_text, p);
}

// ---------------------------------------------------------------- numbers as text

double atofloat(const char *ap_text) {
    const char first = ap_text[0];
    if (first == 'N' || first == 'I' || first == '-') {
        if (std::strcmp(ap_text, "NaN") == 0)
            return 0.0 / float_zero();
        if (std::strcmp(ap_text, "INF") == 0)
            return 1.0 / float_zero();
        if (std::strcmp(ap_text, "-INF") == 0)
            return -1.0 / float_zero();
    }
    // from_chars knows no locale and no leading "+". Where it reads the whole
    // text it gives what atof gives in the C locale; anything else (a hex
    // form, an overflow, trailing text) takes the slow road.
    const char *p = ap_text;
    if (*p == '+' && (is_digit(p[1]) || p[1] == '.'))
        ++p;
    const char *p_end = p + std::strlen(p);
    double value = 0.0;
    std::from_chars_result result = std::from_chars(p, p_end, value, std::chars_format::general);
    if (result.ec == std::errc() && result.ptr == p_end && p != p_end)
        return value;
    return locale_atof(ap_text);
}

double atofloat(const std::string &ar_text) { return atofloat(ar_text.c_str()); }

std::size_t to_xml_chars(char *ap_buffer, float a_value) { return float_to_chars(ap_buffer, a_value, 7); }

std::size_t to_xml_chars(char *ap_buffer, double a_value) {
    std::size_t length = short_decimal_to_chars(ap_buffer, a_value);
    return length ? length : float_to_chars(ap_buffer, a_value, 14);
}

std::ostream &output_convert_to_xml(std::ostream &ar_os, float a_value) {
    char buffer[k_float_text_size];
    return write_raw(ar_os, buffer, to_xml_chars(buffer, a_value));
}

std::ostream &output_convert_to_xml(std::ostream &ar_os, double a_value) {
    char buffer[k_float_text_size];
    return write_raw(ar_os, buffer, to_xml_chars(buffer, a_value));
}

std::ostream &output_convert_to_bool_digit(std::ostream &ar_os, bool a_value) {
    return write_raw(ar_os, a_value ? "1" : "0", 1);
}

// ---------------------------------------------------------------- v_to_o and o_to_v of numbers

template <> void v_to_o<bool>(bool &ar_o, const std::string &ar_v) { ar_o = ar_v == "true" || ar_v == "1"; }
template <> std::ostream &o_to_v<bool>(std::ostream &ar_os, const bool &ar_o) {
    return ar_o ? write_raw(ar_os, "true", 4) : write_raw(ar_os, "false", 5);
}

template <> void v_to_o<int>(int &ar_o, const std::string &ar_v) { read_integer(ar_o, ar_v); }
template <> std::ostream &o_to_v<int>(std::ostream &ar_os, const int &ar_o) { return write_integer(ar_os, ar_o); }

template <> void v_to_o<unsigned int>(unsigned int &ar_o, const std::string &ar_v) { read_integer(ar_o, ar_v); }
template <> std::ostream &o_to_v<unsigned int>(std::ostream &ar_os, const unsigned int &ar_o) {
    return write_integer(ar_os, ar_o);
}

template <> void v_to_o<short>(short &ar_o, const std::string &ar_v) { read_integer(ar_o, ar_v); }
template <> std::ostream &o_to_v<short>(std::ostream &ar_os, const short &ar_o) {
    return write_integer(ar_os, static_cast<int>(ar_o));
}

template <> void v_to_o<unsigned short>(unsigned short &ar_o, const std::string &ar_v) { read_integer(ar_o, ar_v); }
template <> std::ostream &o_to_v<unsigned short>(std::ostream &ar_os, const unsigned short &ar_o) {
    return write_integer(ar_os, static_cast<unsigned>(ar_o));
}

// The byte types are numbers in XML (xs:byte, xs:unsignedByte), never characters.
template <> void v_to_o<signed char>(signed char &ar_o, const std::string &ar_v) { read_integer(ar_o, ar_v); }
template <> std::ostream &o_to_v<signed char>(std::ostream &ar_os, const signed char &ar_o) {
    return write_integer(ar_os, static_cast<int>(ar_o));
}

template <> void v_to_o<unsigned char>(unsigned char &ar_o, const std::string &ar_v) { read_integer(ar_o, ar_v); }
template <> std::ostream &o_to_v<unsigned char>(std::ostream &ar_os, const unsigned char &ar_o) {
    return write_integer(ar_os, static_cast<unsigned>(ar_o));
}

template <> void v_to_o<float>(float &ar_o, const std::string &ar_v) {
    ar_o = static_cast<float>(atofloat(ar_v.c_str()));
}
template <> std::ostream &o_to_v<float>(std::ostream &ar_os, const float &ar_o) {
    return output_convert_to_xml(ar_os, ar_o);
}

template <> void v_to_o<double>(double &ar_o, const std::string &ar_v) { ar_o = atofloat(ar_v.c_str()); }
template <> std::ostream &o_to_v<double>(std::ostream &ar_os, const double &ar_o) {
    return output_convert_to_xml(ar_os, ar_o);
}

template <> void v_to_o<c_big_int>(c_big_int &ar_o, const std::string &ar_v) { ar_o = ar_v; }
template <> std::ostream &o_to_v<c_big_int>(std::ostream &ar_os, const c_big_int &ar_o) { return ar_os << ar_o; }

template <> void v_to_o<c_decimal>(c_decimal &ar_o, const std::string &ar_v) { ar_o = ar_v; }
template <> std::ostream &o_to_v<c_decimal>(std::ostream &ar_os, const c_decimal &ar_o) { return ar_os << ar_o; }

template <> void as_string<bool>(std::string &ar_out, const bool &ar_value) { ar_out = ar_value ? "true" : "false"; }
template <> void as_string<float>(std::string &ar_out, const float &ar_value) {
    char buffer[k_float_text_size];
    ar_out.assign(buffer, to_xml_chars(buffer, ar_value));
}
template <> void as_string<double>(std::string &ar_out, const double &ar_value) {
    char buffer[k_float_text_size];
    ar_out.assign(buffer, to_xml_chars(buffer, ar_value));
}
template <> void as_string<int>(std::string &ar_out, const int &ar_value) {
    char buffer[16];
    std::to_chars_result result = std::to_chars(buffer, buffer + sizeof buffer, ar_value);
    ar_out.assign(buffer, result.ptr);
}
template <> void as_string<unsigned int>(std::string &ar_out, const unsigned int &ar_value) {
    char buffer[16];
    std::to_chars_result result = std::to_chars(buffer, buffer + sizeof buffer, ar_value);
    ar_out.assign(buffer, result.ptr);
}

// ---------------------------------------------------------------- c_big_int

namespace {

// The parts of an integer text: sign and digits without leading zeros. Zero
// is never negative.
struct s_integer_text {
    bool is_negative = false;
    const char *p_digits = "0";
    std::size_t size = 1;
};

s_integer_text crack_integer(const char *ap_text) {
    s_integer_text parts;
    bool is_negative = skip_opt_sign(ap_text);
    while (*ap_text == '0')
        ++ap_text;
    const char *p_start = ap_text;
    std::size_t size = skip_digits(ap_text);
    if (size > 0) {
        parts.is_negative = is_negative;
        parts.p_digits = p_start;
        parts.size = size;
    }
    return parts;
}

// Folds the digits into 32 bits; the overflow rule of the two limits, and a
// wrapped result.
std::uint32_t fold_digits(const char *ap_digits, std::size_t a_size, std::uint32_t a_limit, bool *ap_overflow) {
    const std::uint32_t step_limit = a_limit / 10;
    std::uint32_t value = 0;
    bool is_overflow = false;
    for (std::size_t i = 0; i < a_size; ++i) {
        std::uint32_t digit = static_cast<std::uint32_t>(ap_digits[i] - '0');
        if (value > step_limit)
            is_overflow = true;
        value *= 10;
        if (value > a_limit - digit) // unsigned: value + digit would pass the limit or wrap
            is_overflow = true;
        value += digit;
    }
    if (ap_overflow)
        *ap_overflow = is_overflow;
    return value;
}

} // namespace

c_big_int::c_big_int(int a_value) {
    char buffer[16];
    std::to_chars_result result = std::to_chars(buffer, buffer + sizeof buffer, a_value);
    m_value.assign(buffer, result.ptr);
}

void c_big_int::p_init(const char *ap_text) {
    if (!ap_text) {
        m_value = "0";
        return;
    }
    s_integer_text parts = crack_integer(ap_text);
    m_value.clear();
    if (parts.is_negative)
        m_value += '-';
    m_value.append(parts.p_digits, parts.size);
}

long c_big_int::get(bool *ap_overflow) const {
    bool is_negative = this->is_negative();
    const char *p_digits = m_value.c_str() + (is_negative ? 1 : 0);
    std::uint32_t value = fold_digits(p_digits, m_value.size() - (is_negative ? 1 : 0), 2147483647u, ap_overflow);
    if (is_negative)
        value = 0u - value;
    return static_cast<long>(static_cast<std::int32_t>(value));
}

unsigned long c_big_int::get_unsigned(bool *ap_overflow) const {
    bool is_negative = this->is_negative();
    const char *p_digits = m_value.c_str() + (is_negative ? 1 : 0);
    std::uint32_t value = fold_digits(p_digits, m_value.size() - (is_negative ? 1 : 0), 4294967295u, ap_overflow);
    if (is_negative)
        value = 0u - value;
    return value;
}

double c_big_int::get_as_float() const {
    double value = 0.0;
    for (char c : m_value)
        if (is_digit(c))
            value = value * 10.0 + (c - '0');
    return is_negative() ? -value : value;
}

int c_big_int::compare(const char *ap_text) const {
    if (ap_text && *ap_text == '\0')
        return 1;
    s_integer_text other = crack_integer(ap_text ? ap_text : "0");
    bool is_negative = this->is_negative();
    if (is_negative != other.is_negative)
        return is_negative ? -1 : 1;
    const char *p_digits = m_value.c_str() + (is_negative ? 1 : 0);
    std::size_t size = m_value.size() - (is_negative ? 1 : 0);
    int magnitude;
    if (size != other.size)
        magnitude = size < other.size ? -1 : 1;
    else
        magnitude = std::memcmp(p_digits, other.p_digits, size);
    if (magnitude != 0)
        magnitude = magnitude < 0 ? -1 : 1;
    return is_negative ? -magnitude : magnitude;
}

std::ostream &operator<<(std::ostream &ar_os, const c_big_int &ar_value) {
    const std::string &text = ar_value.get_as_string();
    return write_raw(ar_os, text.data(), text.size());
}

// ---------------------------------------------------------------- c_decimal

c_decimal::c_decimal(int a_integral, int a_fractional) {
    m_is_negative = a_integral < 0 || (a_integral == 0 && a_fractional < 0);
    long long integral = a_integral;
    m_integral = std::to_string(integral < 0 ? -integral : integral);
    long long fractional = a_fractional;
    if (fractional != 0)
        m_fractional = std::to_string(fractional < 0 ? -fractional : fractional);
}

c_decimal::c_decimal(double a_value, int a_precision) {
    unsigned precision = a_precision < 0 ? 0u : (a_precision > 15 ? 15u : static_cast<unsigned>(a_precision));
    char format[16];
    std::snprintf(format, sizeof format, "%%.%uf", precision);
    int size = std::snprintf(nullptr, 0, format, a_value);
    std::string text(static_cast<std::size_t>(size > 0 ? size : 0) + 1, '\0');
    std::snprintf(&text[0], text.size(), format, a_value);
    // A locale with a decimal comma gives "," here.
    for (char &c : text)
        if (c == ',')
            c = '.';
    p_init(text.c_str());
}

void c_decimal::p_init(const char *ap_text) {
    m_is_negative = false;
    m_integral = "0";
    m_fractional.clear();
    if (!ap_text)
        return;
    const char *p = ap_text;
    m_is_negative = skip_opt_sign(p);
    const char *p_integral = p;
    std::size_t size = skip_digits(p);
    m_integral = std::string(p_integral, size);
    if (*p == '.') {
        ++p;
        const char *p_fraction = p;
        size = skip_digits(p);
        m_fractional.assign(p_fraction, size);
    }
}

bool c_decimal::is_valid(const std::string &ar_text) {
    const char *p = ar_text.c_str();
    skip_opt_sign(p);
    return skip_decimal(p) > 0 && is_at_end(ar_text, p);
}

long c_decimal::get_integral(bool *ap_overflow) const {
    long value = m_integral.get(ap_overflow);
    return m_is_negative ? static_cast<long>(static_cast<std::int32_t>(0u - static_cast<std::uint32_t>(value)))
                         : value;
}

void c_decimal::set_integral(long a_value) {
    m_is_negative = a_value < 0;
    unsigned long long magnitude =
        a_value < 0 ? 0ull - static_cast<unsigned long long>(a_value) : static_cast<unsigned long long>(a_value);
    m_integral = std::to_string(magnitude);
}

void c_decimal::set_integral(const c_big_int &ar_value) {
    m_is_negative = ar_value.is_negative();
    const std::string &text = ar_value.get_as_string();
    m_integral = m_is_negative ? text.substr(1) : text;
}

namespace {

std::string padded_fraction(const std::string &ar_fraction, unsigned a_digits) {
    std::string digits = ar_fraction.substr(0, a_digits);
    digits.append(a_digits - digits.size(), '0');
    return digits;
}

} // namespace

long c_decimal::get_fractional(unsigned a_digits, bool *ap_overflow) const {
    return c_big_int(padded_fraction(m_fractional, a_digits)).get(ap_overflow);
}

void c_decimal::set_fractional(unsigned long a_value, unsigned a_digits) {
    std::string digits = std::to_string(a_value);
    if (digits.size() < a_digits)
        digits.insert(0, a_digits - digits.size(), '0');
    m_fractional = digits;
}

long c_decimal::get_scaled(unsigned a_digits, bool *ap_overflow) const {
    std::string digits = m_integral.get_as_string() + padded_fraction(m_fractional, a_digits);
    if (m_is_negative)
        digits.insert(0, 1, '-');
    return c_big_int(digits).get(ap_overflow);
}

void c_decimal::set_scaled(long a_value, unsigned a_digits) {
    m_is_negative = a_value < 0;
    unsigned long long magnitude =
        a_value < 0 ? 0ull - static_cast<unsigned long long>(a_value) : static_cast<unsigned long long>(a_value);
    std::string digits = std::to_string(magnitude);
    if (digits.size() < a_digits + 1)
        digits.insert(0, a_digits + 1 - digits.size(), '0');
    m_integral = digits.substr(0, digits.size() - a_digits);
    m_fractional = digits.substr(digits.size() - a_digits);
}

double c_decimal::get_as_float() const { return atofloat(get_as_string()); }

std::string c_decimal::get_as_string() const {
    std::string text;
    if (m_is_negative)
        text += '-';
    if (!(m_integral == "0" && !m_fractional.empty()))
        text += m_integral.get_as_string();
    if (!m_fractional.empty()) {
        text += '.';
        text += m_fractional;
    }
    return text;
}

int c_decimal::p_fraction_comp(const std::string &ar_lhs, const std::string &ar_rhs) {
    std::size_t size = ar_lhs.size() > ar_rhs.size() ? ar_lhs.size() : ar_rhs.size();
    for (std::size_t i = 0; i < size; ++i) {
        char lhs = i < ar_lhs.size() ? ar_lhs[i] : '0';
        char rhs = i < ar_rhs.size() ? ar_rhs[i] : '0';
        if (lhs != rhs)
            return lhs < rhs ? -1 : 1;
    }
    return 0;
}

int c_decimal::compare(const c_decimal &ar_other) const {
    if (m_is_negative != ar_other.m_is_negative)
        return m_is_negative ? -1 : 1;
    int magnitude = m_integral.compare(ar_other.m_integral);
    if (magnitude == 0)
        magnitude = p_fraction_comp(m_fractional, ar_other.m_fractional);
    return m_is_negative ? -magnitude : magnitude;
}

bool c_decimal::operator==(const c_decimal &ar_other) const {
    return m_is_negative == ar_other.m_is_negative && m_integral == ar_other.m_integral &&
           p_fraction_comp(m_fractional, ar_other.m_fractional) == 0;
}

std::ostream &operator<<(std::ostream &ar_os, const c_decimal &ar_value) {
    std::string text = ar_value.get_as_string();
    return write_raw(ar_os, text.data(), text.size());
}

} // namespace lmx
