// Text: UTF-8 and UTF-16 both ways, escaping for XML output, the length and
// digit facets, list items, qualified names and the string conversions.
#include "lmxtypes.h"

#include <cstring>

#include "lmxoutput.h"

namespace lmx {

namespace {

bool is_high_surrogate(unsigned long a_unit) { return a_unit >= 0xD800 && a_unit <= 0xDBFF; }
bool is_low_surrogate(unsigned long a_unit) { return a_unit >= 0xDC00 && a_unit <= 0xDFFF; }

unsigned long join_surrogates(unsigned long a_high, unsigned long a_low) {
    return 0x10000 + ((a_high - 0xD800) << 10) + (a_low - 0xDC00);
}

// A wide unit as a number; wchar_t may be signed.
unsigned long unit(wchar_t a_c) { return static_cast<unsigned long>(static_cast<std::uint32_t>(a_c)); }

// What the escaping has to look at: the four characters always replaced, and
// ">" for its look-behind.
struct s_escape_table {
    bool is_special[256];
    s_escape_table() : is_special() {
        is_special[static_cast<unsigned char>('"')] = true;
        is_special[static_cast<unsigned char>('\'')] = true;
        is_special[static_cast<unsigned char>('&')] = true;
        is_special[static_cast<unsigned char>('<')] = true;
        is_special[static_cast<unsigned char>('>')] = true;
    }
};
const s_escape_table k_escape;

// Writes one code point as UTF-8 at ap_out; gives the number of bytes.
std::size_t put_utf8(char *ap_out, unsigned long a_code_point) {
    if (a_code_point < 0x80) {
        ap_out[0] = static_cast<char>(a_code_point);
        return 1;
    }
    if (a_code_point < 0x800) {
        ap_out[0] = static_cast<char>(0xC0 | (a_code_point >> 6));
        ap_out[1] = static_cast<char>(0x80 | (a_code_point & 0x3F));
        return 2;
    }
    if (a_code_point < 0x10000) {
        ap_out[0] = static_cast<char>(0xE0 | (a_code_point >> 12));
        ap_out[1] = static_cast<char>(0x80 | ((a_code_point >> 6) & 0x3F));
        ap_out[2] = static_cast<char>(0x80 | (a_code_point & 0x3F));
        return 3;
    }
    if (a_code_point <= 0x10FFFF) {
        ap_out[0] = static_cast<char>(0xF0 | (a_code_point >> 18));
        ap_out[1] = static_cast<char>(0x80 | ((a_code_point >> 12) & 0x3F));
        ap_out[2] = static_cast<char>(0x80 | ((a_code_point >> 6) & 0x3F));
        ap_out[3] = static_cast<char>(0x80 | (a_code_point & 0x3F));
        return 4;
    }
    return put_utf8(ap_out, 0xFFFD);
}

// The replacement of the character at a_index of ap_text, or null when it
// stays as it is.
template <typename C> const char *replacement(const C *ap_text, std::size_t a_index, std::size_t *ap_size) {
    switch (ap_text[a_index]) {
    case '"':
        *ap_size = 6;
        return "&quot;";
    case '\'':
        *ap_size = 6;
        return "&apos;";
    case '&':
        *ap_size = 5;
        return "&amp;";
    case '<':
        *ap_size = 4;
        return "&lt;";
    case '>':
        // Only the end of "]]>" must be escaped in XML; that is what this
        // looks for, and a "]>" at the very start is left alone.
        if (a_index >= 2 && ap_text[a_index - 1] == ']') {
            *ap_size = 4;
            return "&gt;";
        }
        return nullptr;
    default:
        return nullptr;
    }
}

// Escapes narrow text into a sink taking (data, size), one run at a time.
template <typename Sink> void escape_narrow(const char *ap_text, std::size_t a_size, Sink &&ar_sink) {
    std::size_t run = 0;
    for (std::size_t i = 0; i < a_size; ++i) {
        if (!k_escape.is_special[static_cast<unsigned char>(ap_text[i])])
            continue;
        std::size_t size;
        const char *p_replacement = replacement(ap_text, i, &size);
        if (!p_replacement)
            continue;
        if (i > run)
            ar_sink(ap_text + run, i - run);
        ar_sink(p_replacement, size);
        run = i + 1;
    }
    if (a_size > run)
        ar_sink(ap_text + run, a_size - run);
}

} // namespace

// ---------------------------------------------------------------- narrow and wide text

// A value above U+10FFFF is not a code point (a wide string can hold one only
// because wchar_t is wider than UTF-16 needs) and is written as U+FFFD.
void unicode_char_to_utf8(std::string &ar_out, unsigned long a_code_point) {
    char buffer[4];
    ar_out.append(buffer, put_utf8(buffer, a_code_point));
}

void vtostring(std::wstring &ar_out, const std::string &ar_in) {
    ar_out.clear();
    ar_out.reserve(ar_in.size());
    const unsigned char *p = reinterpret_cast<const unsigned char *>(ar_in.data());
    const unsigned char *p_end = p + ar_in.size();
    unsigned long pending_high = 0;
    while (p < p_end) {
        unsigned long code_point = *p;
        std::size_t size;
        if (code_point < 0x80)
            size = 1;
        else if (code_point >= 0xC0 && code_point < 0xE0)
            size = 2, code_point &= 0x1F;
        else if (code_point >= 0xE0 && code_point < 0xF0)
            size = 3, code_point &= 0x0F;
        else if (code_point >= 0xF0 && code_point < 0xF8)
            size = 4, code_point &= 0x07;
        else
            return;
        if (static_cast<std::size_t>(p_end - p) < size)
            return;
        for (std::size_t k = 1; k < size; ++k) {
            if ((p[k] & 0xC0) != 0x80)
                return;
            code_point = (code_point << 6) | (p[k] & 0x3F);
        }
        p += size;
        if (pending_high) {
            // An encoded surrogate pair: both halves go through as they are.
            if (!is_low_surrogate(code_point))
                return;
            ar_out += static_cast<wchar_t>(pending_high);
            ar_out += static_cast<wchar_t>(code_point);
            pending_high = 0;
        } else if (is_high_surrogate(code_point)) {
            pending_high = code_point;
        } else if (code_point < 0x10000) {
            ar_out += static_cast<wchar_t>(code_point);
        } else if (code_point <= 0x10FFFF) {
            code_point -= 0x10000;
            ar_out += static_cast<wchar_t>(0xD800 + (code_point >> 10));
            ar_out += static_cast<wchar_t>(0xDC00 + (code_point & 0x3FF));
        } else {
            return;
        }
    }
}

void vtostring(std::string &ar_out, const std::string &ar_in) { ar_out = ar_in; }

void convert(std::string &ar_out, const std::wstring &ar_in) {
    ar_out.clear();
    ar_out.reserve(ar_in.size());
    std::size_t size = ar_in.size();
    for (std::size_t i = 0; i < size; ++i) {
        unsigned long code_point = unit(ar_in[i]);
        if (code_point < 0x80) {
            ar_out += static_cast<char>(code_point);
            continue;
        }
        if (is_high_surrogate(code_point) && i + 1 < size && is_low_surrogate(unit(ar_in[i + 1])))
            code_point = join_surrogates(code_point, unit(ar_in[++i]));
        unicode_char_to_utf8(ar_out, code_point);
    }
}

void convert(std::wstring &ar_out, const std::string &ar_in) { vtostring(ar_out, ar_in); }
void convert(std::string &ar_out, const std::string &ar_in) { ar_out = ar_in; }
void convert(std::wstring &ar_out, const std::wstring &ar_in) { ar_out = ar_in; }

void inittowstring(std::wstring &ar_out, const char *ap_text) { vtostring(ar_out, ap_text ? ap_text : ""); }

std::wstring inittowstring(const char *ap_text) {
    std::wstring out;
    inittowstring(out, ap_text);
    return out;
}

// ---------------------------------------------------------------- length and digit facets

std::size_t length(const std::string &ar_text) {
    const unsigned char *p = reinterpret_cast<const unsigned char *>(ar_text.data());
    std::size_t size = ar_text.size();
    std::size_t count = 0;
    std::size_t i = 0;
    while (i < size) {
        unsigned char lead = p[i];
        if (lead < 0x80)
            i += 1;
        else if (lead >= 0xC0 && lead < 0xE0)
            i += 2;
        else if (lead == 0xED && i + 1 < size && (p[i + 1] & 0xE0) == 0xA0)
            i += 6; // an encoded surrogate pair is one character
        else if (lead >= 0xE0 && lead < 0xF0)
            i += 3;
        else if (lead >= 0xF0 && lead < 0xF8)
            i += 4;
        else
            break;
        ++count;
    }
    return count;
}

bool is_max_length_ok(const std::string &ar_text, std::size_t a_max) {
    // No character is longer than four bytes: the byte length settles most texts.
    if (ar_text.size() <= a_max)
        return true;
    if ((ar_text.size() + 3) / 4 > a_max) // more than 4 * a_max bytes
        return false;
    return length(ar_text) <= a_max;
}

bool is_min_length_ok(const std::string &ar_text, std::size_t a_min) {
    if (ar_text.size() / 4 >= a_min)
        return true;
    return length(ar_text) >= a_min;
}

std::size_t total_digits(const std::string &ar_text) {
    std::size_t count = 0;
    for (char c : ar_text)
        if (c >= '0' && c <= '9')
            ++count;
    return count;
}

std::size_t fraction_digits(const std::string &ar_text) {
    std::size_t point = ar_text.find('.');
    if (point == std::string::npos)
        return 0;
    std::size_t count = 0;
    for (std::size_t i = point + 1; i < ar_text.size(); ++i)
        if (ar_text[i] >= '0' && ar_text[i] <= '9')
            ++count;
    return count;
}

// ---------------------------------------------------------------- list values

bool c_xml_list_tokeniser::get(std::string *ap_out) {
    std::size_t size = m_text.size();
    while (m_position < size && is_white(static_cast<unsigned char>(m_text[m_position])))
        ++m_position;
    if (m_position >= size)
        return false;
    std::size_t start = m_position;
    while (m_position < size && !is_white(static_cast<unsigned char>(m_text[m_position])))
        ++m_position;
    ap_out->assign(m_text, start, m_position - start);
    return true;
}

// ---------------------------------------------------------------- qualified names

void make_qname(ct_qname<std::string> &ar_qname, const std::string &ar_namespace, const std::string &ar_local) {
    ar_qname.set_namespace(ar_namespace);
    ar_qname.set_name(ar_local);
}

void make_qname(ct_qname<std::wstring> &ar_qname, const std::string &ar_namespace, const std::string &ar_local) {
    ar_qname.set_namespace(ar_namespace);
    std::wstring name;
    vtostring(name, ar_local);
    ar_qname.set_name(name);
}

void make_qname(std::string &ar_qname, const std::string &, const std::string &ar_local) { ar_qname = ar_local; }

void make_qname(std::wstring &ar_qname, const std::string &, const std::string &ar_local) {
    vtostring(ar_qname, ar_local);
}

// ---------------------------------------------------------------- output

void append_escaped(std::string &ar_out, const char *ap_text, std::size_t a_size) {
    escape_narrow(ap_text, a_size, [&ar_out](const char *ap_run, std::size_t a_run) { ar_out.append(ap_run, a_run); });
}

std::ostream &output_convert_to_escaped(std::ostream &ar_os, const std::string &ar_text) {
    escape_narrow(ar_text.data(), ar_text.size(),
                  [&ar_os](const char *ap_run, std::size_t a_run) { write_raw(ar_os, ap_run, a_run); });
    return ar_os;
}

std::ostream &output_convert_to_escaped(std::ostream &ar_os, const std::wstring &ar_text) {
    // Built as UTF-8 in a buffer on the stack and written in runs.
    char buffer[512];
    std::size_t used = 0;
    std::size_t size = ar_text.size();
    for (std::size_t i = 0; i < size; ++i) {
        if (used + 8 > sizeof buffer) {
            write_raw(ar_os, buffer, used);
            used = 0;
        }
        unsigned long code_point = unit(ar_text[i]);
        if (code_point < 0x80) {
            std::size_t replacement_size = 0;
            const char *p_replacement =
                k_escape.is_special[code_point] ? replacement(ar_text.data(), i, &replacement_size) : nullptr;
            if (p_replacement) {
                std::memcpy(buffer + used, p_replacement, replacement_size);
                used += replacement_size;
            } else {
                buffer[used++] = static_cast<char>(code_point);
            }
            continue;
        }
        if (is_high_surrogate(code_point)) {
            // A broken pair ends the output of the string.
            if (i + 1 >= size || !is_low_surrogate(unit(ar_text[i + 1])))
                break;
            code_point = join_surrogates(code_point, unit(ar_text[++i]));
        }
        used += put_utf8(buffer + used, code_point);
    }
    return write_raw(ar_os, buffer, used);
}

std::ostream &output_convert_to_xml(std::ostream &ar_os, const std::string &ar_text) {
    return output_convert_to_escaped(ar_os, ar_text);
}

std::ostream &output_convert_to_xml(std::ostream &ar_os, const std::wstring &ar_text) {
    return output_convert_to_escaped(ar_os, ar_text);
}

std::ostream &output_convert_to_xml(std::ostream &ar_os, const char *ap_text) {
    escape_narrow(ap_text, std::strlen(ap_text),
                  [&ar_os](const char *ap_run, std::size_t a_run) { write_raw(ar_os, ap_run, a_run); });
    return ar_os;
}

std::ostream &output_convert_to_ascii(std::ostream &ar_os, const std::wstring &ar_text) {
    std::string text;
    text.reserve(ar_text.size());
    for (wchar_t c : ar_text)
        text += unit(c) > 127 ? '.' : static_cast<char>(unit(c));
    return write_raw(ar_os, text.data(), text.size());
}

// ---------------------------------------------------------------- strings as values

template <> void v_to_o<std::string>(std::string &ar_o, const std::string &ar_v) { ar_o = ar_v; }
template <> std::ostream &o_to_v<std::string>(std::ostream &ar_os, const std::string &ar_o) {
    return output_convert_to_escaped(ar_os, ar_o);
}

template <> void v_to_o<std::wstring>(std::wstring &ar_o, const std::string &ar_v) { vtostring(ar_o, ar_v); }
template <> std::ostream &o_to_v<std::wstring>(std::ostream &ar_os, const std::wstring &ar_o) {
    return output_convert_to_escaped(ar_os, ar_o);
}

template <> void as_string<std::string>(std::string &ar_out, const std::string &ar_value) { ar_out = ar_value; }
template <> void as_string<std::wstring>(std::string &ar_out, const std::wstring &ar_value) {
    convert(ar_out, ar_value);
}

} // namespace lmx
