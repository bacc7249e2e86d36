// Durations, dates and times: their lexical checks, assignment from text,
// output and comparison.
#include "lmxtypes.h"

#include <charconv>
#include <cmath>
#include <cstdlib>
#include <sstream>

#include "lmxoutput.h"

namespace lmx {

namespace {

bool is_digit(char a_c) { return a_c >= '0' && a_c <= '9'; }

// atoi on the digits at ap_text, as an unsigned field; out-of-range values wrap.
std::uint32_t atoi_field(const char *ap_text) {
    return static_cast<std::uint32_t>(static_cast<int>(std::strtol(ap_text, nullptr, 10)));
}

// Seconds as a stream in its default state writes them (six significant
// digits), except that a value below 0.001 is written in fixed notation, so
// that no exponent appears.
std::size_t seconds_to_chars(char *ap_buffer, std::size_t a_size, float a_seconds) {
    std::to_chars_result result;
    if (a_seconds < 0.001f && a_seconds != 0.0f)
        result = std::to_chars(ap_buffer, ap_buffer + a_size, a_seconds, std::chars_format::fixed, 6);
    else
        result = std::to_chars(ap_buffer, ap_buffer + a_size, a_seconds, std::chars_format::general, 6);
    return static_cast<std::size_t>(result.ptr - ap_buffer);
}

void append_unsigned(std::string &ar_out, unsigned long a_value, std::size_t a_width) {
    char buffer[24];
    std::to_chars_result result = std::to_chars(buffer, buffer + sizeof buffer, a_value);
    std::size_t size = static_cast<std::size_t>(result.ptr - buffer);
    if (size < a_width)
        ar_out.append(a_width - size, '0');
    ar_out.append(buffer, size);
}

// Days in the first n months of a year, shortest and longest.
const unsigned k_day_mons_mins[12] = {0, 28, 59, 89, 120, 150, 181, 212, 242, 273, 303, 334};
const unsigned k_day_mons_maxs[12] = {0, 31, 62, 92, 123, 153, 184, 215, 245, 276, 306, 337};

} // namespace

// ---------------------------------------------------------------- c_duration

namespace {

// Reads "digits letter" into *ap_field if that is what stands at the cursor.
bool scan_duration_field(const char *&ar_p, char a_letter, std::uint32_t *ap_field) {
    const char *p = ar_p;
    if (skip_digits(p) == 0 || *p != a_letter)
        return false;
    *ap_field = atoi_field(ar_p);
    ar_p = p + 1;
    return true;
}

bool scan_duration_seconds(const char *&ar_p, float *ap_seconds) {
    const char *p = ar_p;
    if (skip_decimal(p) == 0 || *p != 'S')
        return false;
    *ap_seconds = static_cast<float>(atofloat(std::string(ar_p, p)));
    ar_p = p + 1;
    return true;
}

} // namespace

// The one scanner behind is_valid and assignment: fields are stored as they
// are read, and the result tells whether the whole text matched.
static bool scan_duration(const char *ap_text, std::size_t a_size, bool *ap_is_negative, std::uint32_t *ap_fields,
                          float *ap_seconds) {
    const char *p = ap_text;
    *ap_is_negative = skip_opt_sign(p);
    if (*p != 'P')
        return false;
    ++p;
    scan_duration_field(p, 'Y', &ap_fields[0]);
    scan_duration_field(p, 'M', &ap_fields[1]);
    scan_duration_field(p, 'D', &ap_fields[2]);
    if (*p == 'T') {
        ++p;
        scan_duration_field(p, 'H', &ap_fields[3]);
        scan_duration_field(p, 'M', &ap_fields[4]);
        scan_duration_seconds(p, ap_seconds);
    }
    return p == ap_text + a_size;
}

bool c_duration::is_valid(const std::string &ar_text) {
    bool is_negative;
    std::uint32_t fields[5];
    float seconds;
    return scan_duration(ar_text.c_str(), ar_text.size(), &is_negative, fields, &seconds);
}

void c_duration::p_init(const char *ap_text) {
    *this = c_duration();
    if (!ap_text)
        return;
    std::uint32_t fields[5] = {0, 0, 0, 0, 0};
    float seconds = 0.0f;
    bool is_negative = false;
    scan_duration(ap_text, std::char_traits<char>::length(ap_text), &is_negative, fields, &seconds);
    m_is_negative = is_negative;
    m_years = fields[0];
    m_months = fields[1];
    m_days = fields[2];
    m_hours = fields[3];
    m_minutes = fields[4];
    m_seconds = seconds;
}

void c_duration::normalize() {
    if (m_seconds >= 60.0f) {
        float carry = std::floor(m_seconds / 60.0f);
        m_minutes += static_cast<std::uint32_t>(carry);
        m_seconds -= carry * 60.0f;
    }
    m_hours += m_minutes / 60;
    m_minutes %= 60;
    m_days += m_hours / 24;
    m_hours %= 24;
    m_years += m_months / 12;
    m_months %= 12;
}

std::string c_duration::get_as_string() const {
    std::string text;
    if (m_is_negative)
        text += '-';
    text += 'P';
    if (m_years) {
        append_unsigned(text, m_years, 0);
        text += 'Y';
    }
    if (m_months) {
        append_unsigned(text, m_months, 0);
        text += 'M';
    }
    if (m_days) {
        append_unsigned(text, m_days, 0);
        text += 'D';
    }
    if (m_hours || m_minutes || m_seconds != 0.0f) {
        text += 'T';
        if (m_hours) {
            append_unsigned(text, m_hours, 0);
            text += 'H';
        }
        if (m_minutes) {
            append_unsigned(text, m_minutes, 0);
            text += 'M';
        }
        if (m_seconds != 0.0f) {
            char buffer[64];
            text.append(buffer, seconds_to_chars(buffer, sizeof buffer, m_seconds));
            text += 'S';
        }
    }
    return text;
}

std::ostream &operator<<(std::ostream &ar_os, const c_duration &ar_value) {
    std::string text = ar_value.get_as_string();
    return write_raw(ar_os, text.data(), text.size());
}

namespace {

struct s_duration_range {
    bool is_negative;
    std::uint64_t min_days;
    std::uint64_t max_days;
    c_duration normal;
};

bool is_zero(const c_duration &ar_d) {
    return ar_d.get_years() == 0 && ar_d.get_months() == 0 && ar_d.get_days() == 0 && ar_d.get_hours() == 0 &&
           ar_d.get_minutes() == 0 && ar_d.get_seconds() == 0.0f;
}

// The shortest and longest length in days of the date part of a, counting
// only the years a has beyond b. A zero duration has no sign.
s_duration_range day_range(const c_duration &ar_a, const c_duration &ar_b) {
    s_duration_range range;
    range.normal = ar_a;
    range.normal.normalize();
    c_duration other = ar_b;
    other.normalize();
    std::uint64_t excess = range.normal.get_years() > other.get_years()
                               ? std::uint64_t(range.normal.get_years()) - other.get_years()
                               : 0;
    range.is_negative = range.normal.is_negative() && !is_zero(range.normal);
    range.min_days = k_day_mons_mins[range.normal.get_months()] + std::uint64_t(range.normal.get_days()) + excess * 365;
    range.max_days = k_day_mons_maxs[range.normal.get_months()] + std::uint64_t(range.normal.get_days()) + excess * 366;
    return range;
}

template <typename T> int three_way(T a_lhs, T a_rhs) { return a_lhs < a_rhs ? -1 : (a_rhs < a_lhs ? 1 : 0); }

} // namespace

bool c_duration::is_indeterminate(const c_duration &ar_other) const {
    s_duration_range a = day_range(*this, ar_other);
    s_duration_range b = day_range(ar_other, *this);
    if (a.is_negative != b.is_negative || a.normal.get_months() == b.normal.get_months())
        return false;
    return a.max_days > b.min_days && a.min_days < b.max_days;
}

int c_duration::p_compare(const c_duration &ar_other) const {
    s_duration_range a = day_range(*this, ar_other);
    s_duration_range b = day_range(ar_other, *this);
    if (a.is_negative != b.is_negative)
        return a.is_negative ? -1 : 1;
    int magnitude = three_way(a.min_days, b.min_days);
    if (!magnitude)
        magnitude = three_way(a.max_days, b.max_days);
    if (!magnitude)
        magnitude = three_way(a.normal.get_hours(), b.normal.get_hours());
    if (!magnitude)
        magnitude = three_way(a.normal.get_minutes(), b.normal.get_minutes());
    if (!magnitude)
        magnitude = three_way(a.normal.get_seconds(), b.normal.get_seconds());
    return a.is_negative ? -magnitude : magnitude;
}

bool c_duration::operator==(const c_duration &ar_other) const {
    return !is_indeterminate(ar_other) && p_compare(ar_other) == 0;
}

bool c_duration::operator<(const c_duration &ar_other) const {
    return !is_indeterminate(ar_other) && p_compare(ar_other) < 0;
}

template <> void v_to_o<c_duration>(c_duration &ar_o, const std::string &ar_v) { ar_o = ar_v; }
template <> std::ostream &o_to_v<c_duration>(std::ostream &ar_os, const c_duration &ar_o) { return ar_os << ar_o; }

// ---------------------------------------------------------------- dates and times

namespace {

// Reads the fields of a form. In check mode the whole text must match; in
// assignment mode each field is stored as soon as it is read and the scan
// stops at the first mismatch.
class c_datetime_scanner {
public:
    c_datetime_scanner(const char *ap_text, std::size_t a_size) : p(ap_text), p_end(ap_text + a_size) {}

    // yyyy: an optional sign and at least four digits.
    bool year(std::int32_t *ap_year) {
        const char *q = p;
        bool is_negative = skip_opt_sign(q);
        const char *p_digits = q;
        if (skip_digits(q) < 4)
            return false;
        std::uint32_t value = atoi_field(p_digits);
        *ap_year = static_cast<std::int32_t>(is_negative ? 0u - value : value);
        p = q;
        return true;
    }
    // dd: exactly two digits.
    bool two_digits(std::uint32_t *ap_value) {
        if (!is_digit(p[0]) || !is_digit(p[1]) || is_digit(p[2]))
            return false;
        *ap_value = static_cast<std::uint32_t>((p[0] - '0') * 10 + (p[1] - '0'));
        p += 2;
        return true;
    }
    // ss with an optional "." and at least one digit.
    bool seconds(float *ap_seconds) {
        if (!is_digit(p[0]) || !is_digit(p[1]))
            return false;
        const char *q = p + 2;
        if (*q == '.') {
            ++q;
            if (skip_digits(q) == 0)
                return false;
        } else if (is_digit(*q)) {
            return false;
        }
        *ap_seconds = static_cast<float>(atofloat(std::string(p, q)));
        p = q;
        return true;
    }
    bool literal(const char *ap_text) { return skip_const(p, ap_text); }
    // Nothing, "Z", or "+hh:mm" / "-hh:mm", and then the end of the text.
    bool zone(bool *ap_is_utc, std::int32_t *ap_offset) {
        if (p == p_end) {
            *ap_is_utc = false;
            *ap_offset = 0;
            return true;
        }
        if (*p == 'Z') {
            if (p + 1 != p_end)
                return false;
            ++p;
            *ap_is_utc = true;
            *ap_offset = 0;
            return true;
        }
        bool is_negative;
        const char *q = p;
        if (!get_sign(q, &is_negative))
            return false;
        std::uint32_t hours, minutes;
        const char *p_save = p;
        p = q;
        if (!two_digits(&hours) || !literal(":") || !two_digits(&minutes) || p != p_end) {
            p = p_save;
            return false;
        }
        std::int32_t offset = static_cast<std::int32_t>(hours * 60 + minutes);
        *ap_is_utc = false;
        *ap_offset = is_negative ? -offset : offset;
        return true;
    }
    void skip_opt_sign_here() { skip_opt_sign(p); }

private:
    const char *p;
    const char *p_end;
};

} // namespace

// The fields as a plain record, so that the scanner can fill either the
// object itself or a scratch copy.
struct s_datetime_fields {
    std::int32_t year;
    std::uint32_t month, day, hours, minutes;
    float seconds;
    std::int32_t tz_offset;
    bool is_utc;
};

static bool scan_datetime(c_datetime_base::e_form a_form, const char *ap_text, std::size_t a_size,
                          bool a_is_check, s_datetime_fields &ar_f) {
    c_datetime_scanner s(ap_text, a_size);
    switch (a_form) {
    case c_datetime_base::f_datetime:
        return s.year(&ar_f.year) && s.literal("-") && s.two_digits(&ar_f.month) && s.literal("-") &&
               s.two_digits(&ar_f.day) && s.literal("T") && s.two_digits(&ar_f.hours) && s.literal(":") &&
               s.two_digits(&ar_f.minutes) && s.literal(":") && s.seconds(&ar_f.seconds) &&
               s.zone(&ar_f.is_utc, &ar_f.tz_offset);
    case c_datetime_base::f_date:
        return s.year(&ar_f.year) && s.literal("-") && s.two_digits(&ar_f.month) && s.literal("-") &&
               s.two_digits(&ar_f.day) && s.zone(&ar_f.is_utc, &ar_f.tz_offset);
    case c_datetime_base::f_time:
        // The check lets a sign pass; assignment does not read one.
        if (a_is_check)
            s.skip_opt_sign_here();
        return s.two_digits(&ar_f.hours) && s.literal(":") && s.two_digits(&ar_f.minutes) && s.literal(":") &&
               s.seconds(&ar_f.seconds) && s.zone(&ar_f.is_utc, &ar_f.tz_offset);
    case c_datetime_base::f_gyearmonth:
        return s.year(&ar_f.year) && s.literal("-") && s.two_digits(&ar_f.month) &&
               s.zone(&ar_f.is_utc, &ar_f.tz_offset);
    case c_datetime_base::f_gyear:
        return s.year(&ar_f.year) && s.zone(&ar_f.is_utc, &ar_f.tz_offset);
    case c_datetime_base::f_gmonthday:
        return s.literal("--") && s.two_digits(&ar_f.month) && s.literal("-") && s.two_digits(&ar_f.day) &&
               s.zone(&ar_f.is_utc, &ar_f.tz_offset);
    case c_datetime_base::f_gday:
        return s.literal("---") && s.two_digits(&ar_f.day) && s.zone(&ar_f.is_utc, &ar_f.tz_offset);
    case c_datetime_base::f_gmonth:
        return s.literal("--") && s.two_digits(&ar_f.month) && s.literal("--") &&
               s.zone(&ar_f.is_utc, &ar_f.tz_offset);
    }
    return false;
}

bool c_datetime_base::p_is_valid(e_form a_form, const char *ap_text) {
    s_datetime_fields scratch{};
    return scan_datetime(a_form, ap_text, std::char_traits<char>::length(ap_text), true, scratch);
}

void c_datetime_base::p_init(e_form a_form, const char *ap_text) {
    if (!ap_text)
        return;
    s_datetime_fields f{m_year, m_month, m_day, m_hours, m_minutes, m_seconds, m_tz_offset, m_is_utc};
    scan_datetime(a_form, ap_text, std::char_traits<char>::length(ap_text), false, f);
    m_year = f.year;
    m_month = f.month;
    m_day = f.day;
    m_hours = f.hours;
    m_minutes = f.minutes;
    m_seconds = f.seconds;
    m_tz_offset = f.tz_offset;
    m_is_utc = f.is_utc;
}

namespace {

void append_year(std::string &ar_out, std::int32_t a_year) {
    std::uint32_t magnitude = static_cast<std::uint32_t>(a_year);
    if (a_year < 0) {
        ar_out += '-';
        magnitude = 0u - magnitude;
    }
    append_unsigned(ar_out, magnitude, 4);
}

void append_seconds(std::string &ar_out, float a_seconds) {
    char buffer[64];
    std::size_t size = seconds_to_chars(buffer, sizeof buffer, a_seconds);
    // Two digits before the point: "05.5", "00".
    if (size == 1 || !is_digit(buffer[1]))
        ar_out += '0';
    ar_out.append(buffer, size);
}

void append_zone(std::string &ar_out, bool a_is_utc, std::int32_t a_offset) {
    if (a_is_utc) {
        ar_out += 'Z';
        return;
    }
    if (a_offset == 0)
        return;
    std::uint32_t magnitude = static_cast<std::uint32_t>(a_offset);
    if (a_offset < 0) {
        ar_out += '-';
        magnitude = 0u - magnitude;
    } else {
        ar_out += '+';
    }
    append_unsigned(ar_out, magnitude / 60, 2);
    ar_out += ':';
    append_unsigned(ar_out, magnitude % 60, 2);
}

} // namespace

std::string c_datetime_base::p_get_as_string(e_form a_form) const {
    std::string text;
    // The fields in the order the forms share: year-month[-day], hh:mm:ss.
    auto year_month = [&] {
        append_year(text, m_year);
        text += '-';
        append_unsigned(text, m_month, 2);
    };
    auto date = [&] {
        year_month();
        text += '-';
        append_unsigned(text, m_day, 2);
    };
    auto time = [&] {
        append_unsigned(text, m_hours, 2);
        text += ':';
        append_unsigned(text, m_minutes, 2);
        text += ':';
        append_seconds(text, m_seconds);
    };
    switch (a_form) {
    case f_datetime:
        date();
        text += 'T';
        time();
        break;
    case f_date:
        date();
        break;
    case f_time:
        time();
        break;
    case f_gyearmonth:
        year_month();
        break;
    case f_gyear:
        append_year(text, m_year);
        break;
    case f_gmonthday:
        text += "--";
        append_unsigned(text, m_month, 2);
        text += '-';
        append_unsigned(text, m_day, 2);
        break;
    case f_gday:
        text += "---";
        append_unsigned(text, m_day, 2);
        break;
    case f_gmonth:
        text += "--";
        append_unsigned(text, m_month, 2);
        text += "--";
        break;
    }
    append_zone(text, m_is_utc, m_tz_offset);
    return text;
}

std::ostream &c_datetime_base::p_output(e_form a_form, std::ostream &ar_os) const {
    std::string text = p_get_as_string(a_form);
    return write_raw(ar_os, text.data(), text.size());
}

int c_datetime_base::compare(const c_datetime_base &ar_other) const {
    int result = three_way(m_year, ar_other.m_year);
    if (!result)
        result = three_way(m_month, ar_other.m_month);
    if (!result)
        result = three_way(m_day, ar_other.m_day);
    if (!result)
        result = three_way(m_hours, ar_other.m_hours);
    if (!result)
        result = three_way(m_minutes, ar_other.m_minutes);
    if (!result)
        result = three_way(m_seconds, ar_other.m_seconds);
    return result;
}

#define LMX_DATETIME_CONVERSIONS(type)                                                                             \
    template <> void v_to_o<type>(type & ar_o, const std::string &ar_v) { ar_o = ar_v; }                           \
    template <> std::ostream &o_to_v<type>(std::ostream & ar_os, const type &ar_o) { return ar_o.output(ar_os); }
LMX_DATETIME_CONVERSIONS(c_datetime)
LMX_DATETIME_CONVERSIONS(c_date)
LMX_DATETIME_CONVERSIONS(c_time)
LMX_DATETIME_CONVERSIONS(c_gyearmonth)
LMX_DATETIME_CONVERSIONS(c_gyear)
LMX_DATETIME_CONVERSIONS(c_gmonthday)
LMX_DATETIME_CONVERSIONS(c_gday)
LMX_DATETIME_CONVERSIONS(c_gmonth)
#undef LMX_DATETIME_CONVERSIONS

} // namespace lmx
