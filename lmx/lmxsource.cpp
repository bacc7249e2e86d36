#include "lmxsource.h"

#include <cstring>
#include <strings.h>

namespace lmx {

namespace {

// UTF-16 code units to UTF-8; surrogate pairs are combined.
std::string wide_path_to_utf8(const wchar_t *ap_path) {
    std::string out;
    char buffer[8];
    for (const wchar_t *p = ap_path; *p; ++p) {
        std::uint32_t unit = static_cast<std::uint32_t>(*p) & 0xFFFF;
        if (unit >= 0xD800 && unit <= 0xDBFF && p[1]) {
            std::uint32_t low = static_cast<std::uint32_t>(p[1]) & 0xFFFF;
            if (low >= 0xDC00 && low <= 0xDFFF) {
                unit = 0x10000 + ((unit - 0xD800) << 10) + (low - 0xDC00);
                ++p;
            }
        }
        out += unicode_char_to_utf8(unit, buffer);
    }
    return out;
}

bool is_continuation(unsigned char a_c) { return (a_c & 0xC0) == 0x80; }

bool is_white_byte(int a_c) { return a_c == ' ' || (a_c >= '\t' && a_c <= '\r'); }

} // namespace

// ---------------------------------------------------------------- sources

c_read_memory::c_read_memory(const char *ap_start, std::size_t a_length)
    : p_start(reinterpret_cast<const unsigned char *>(ap_start)), p_end_of_data(p_start + a_length) {
    set_window(p_start, p_end_of_data);
}

void c_read_memory::rewind() { set_window(p_start, p_end_of_data); }

c_read_file::c_read_file(const char *ap_file) { open(ap_file); }

c_read_file::c_read_file(const wchar_t *ap_file) { open(wide_path_to_utf8(ap_file).c_str()); }

void c_read_file::open(const char *ap_utf8_path) {
    m_source_id = ap_utf8_path;
    p_file = std::fopen(ap_utf8_path, "rb");
    if (p_file)
        m_buffer.resize(k_block_size);
}

c_read_file::~c_read_file() {
    if (p_file)
        std::fclose(p_file);
}

bool c_read_file::refill() {
    if (!p_file)
        return false;
    std::size_t count = std::fread(m_buffer.data(), 1, m_buffer.size(), p_file);
    if (count == 0)
        return false;
    set_window(m_buffer.data(), m_buffer.data() + count);
    return true;
}

void c_read_file::rewind() {
    if (p_file)
        std::fseek(p_file, 0, SEEK_SET);
    set_window(nullptr, nullptr);
}

// ---------------------------------------------------------------- UTF-8 helpers

char *unicode_char_to_utf8(std::uint32_t a_c, char *ap_buffer) {
    unsigned char *p = reinterpret_cast<unsigned char *>(ap_buffer);
    if (a_c <= 0x7F) {
        *p++ = static_cast<unsigned char>(a_c);
    } else if (a_c <= 0x7FF) {
        *p++ = static_cast<unsigned char>(0xC0 | (a_c >> 6));
        *p++ = static_cast<unsigned char>(0x80 | (a_c & 0x3F));
    } else if (a_c <= 0xFFFF) {
        *p++ = static_cast<unsigned char>(0xE0 | (a_c >> 12));
        *p++ = static_cast<unsigned char>(0x80 | ((a_c >> 6) & 0x3F));
        *p++ = static_cast<unsigned char>(0x80 | (a_c & 0x3F));
    } else {
        *p++ = static_cast<unsigned char>(0xF0 | ((a_c >> 18) & 0x07));
        *p++ = static_cast<unsigned char>(0x80 | ((a_c >> 12) & 0x3F));
        *p++ = static_cast<unsigned char>(0x80 | ((a_c >> 6) & 0x3F));
        *p++ = static_cast<unsigned char>(0x80 | (a_c & 0x3F));
    }
    *p = '\0';
    return ap_buffer;
}

bool utf8_to_unicode_char(const char *ap_sequence, std::int32_t *ap_value) {
    const unsigned char *p = reinterpret_cast<const unsigned char *>(ap_sequence);
    unsigned char lead = p[0];
    int length;
    std::int32_t value;
    if (lead < 0x80) {
        *ap_value = lead;
        return true;
    } else if (lead >= 0xC0 && lead <= 0xDF) {
        length = 2;
        value = lead & 0x1F;
    } else if (lead >= 0xE0 && lead <= 0xEF) {
        length = 3;
        value = lead & 0x0F;
    } else if (lead >= 0xF0 && lead <= 0xF7) {
        length = 4;
        value = lead & 0x07;
    } else {
        *ap_value = -1;
        return false;
    }
    for (int i = 1; i < length; ++i) {
        if (!is_continuation(p[i]))
            return false;
        value = (value << 6) | (p[i] & 0x3F);
    }
    *ap_value = value;
    return true;
}

bool is_valid_utf8_char_sequence(const char *ap_sequence) {
    const unsigned char *p = reinterpret_cast<const unsigned char *>(ap_sequence);
    unsigned char lead = p[0], second = p[1];
    if (lead <= 0x7F)
        return true;
    if (lead >= 0xC2 && lead <= 0xDF)
        return true;
    if (lead == 0xE0)
        return second >= 0xA0 && second <= 0xBF;
    if (lead >= 0xE1 && lead <= 0xEC)
        return true;
    if (lead == 0xED)
        return second >= 0x80 && second <= 0x9F;
    if (lead == 0xEE || lead == 0xEF)
        return true;
    if (lead == 0xF0)
        return second >= 0x90 && second <= 0xBF;
    if (lead >= 0xF1 && lead <= 0xF3)
        return true;
    if (lead == 0xF4)
        return second >= 0x80 && second <= 0x8F;
    return false;
}

// ---------------------------------------------------------------- decoder

c_get_as_utf8::c_get_as_utf8(c_read &ar_reader, c_error &ar_error)
    : ar_reader(ar_reader), ar_error(ar_error), m_binder(ar_error) {
    m_binder.bind(this);
}

void c_get_as_utf8::rewind() {
    m_mode = mode_unresolved;
    m_prev = 0;
    m_unget.clear();
    p_pending = nullptr;
    m_line = 1;
    ar_reader.rewind();
}

void c_get_as_utf8::error(elmx_error_type a_type, elmx_error a_code, const char *ap_format) {
    ar_error.error(a_type, a_code, get_source_id(), m_line, ap_format);
}

void c_get_as_utf8::error(elmx_error_type a_type, elmx_error a_code, const std::string &ar_s) {
    error(a_type, a_code, ar_s.c_str());
}

int c_get_as_utf8::p_get_pending() {
    int c = static_cast<unsigned char>(*p_pending++);
    if (*p_pending == '\0')
        p_pending = nullptr;
    return c;
}

int c_get_as_utf8::p_fail_encoding() {
    error(elmx_type_fatal, elmx_encoding_not_supported, "Unrecognised character encoding");
    return -1;
}

int c_get_as_utf8::p_decode(int a_c) {
    if (a_c == -1)
        return -1;
    switch (m_mode) {
    case mode_unresolved:
        return p_resolve_initial_character_encoding(a_c);
    case mode_single_byte:
        if (a_c == 0)
            return -1; // NUL is no XML character: it reads like the end
        return a_c <= 126 ? a_c : p_map_unicode_to_utf8(static_cast<std::uint32_t>(a_c));
    case mode_utf8:
        if (a_c == 0)
            return -1;
        return p_read_utf8_compound_char_sequence(a_c);
    case mode_utf16_be:
    case mode_utf16_le: {
        bool big_endian = m_mode == mode_utf16_be;
        int unit = p_complete_unit(a_c, big_endian);
        if (unit >= 0xD800 && unit <= 0xDBFF) {
            int low = p_read_utf16_unit(big_endian);
            if (low == -1)
                return -1;
            if (low < 0xDC00 || low > 0xDFFF)
                return p_fail_encoding();
            unit = ((unit & 0x3FF) + 64) * 1024 + (low & 0x3FF);
        }
        return unit == -1 ? -1 : p_map_unicode_to_utf8(static_cast<std::uint32_t>(unit));
    }
    case mode_ucs2_be:
    case mode_ucs2_le: {
        int unit = p_complete_unit(a_c, m_mode == mode_ucs2_be);
        return unit == -1 ? -1 : p_map_unicode_to_utf8(static_cast<std::uint32_t>(unit));
    }
    }
    return -1;
}

int c_get_as_utf8::p_complete_unit(int a_first, bool a_big_endian) {
    int second = ar_reader.read();
    if (second == -1)
        return -1;
    return a_big_endian ? (a_first << 8) | second : (second << 8) | a_first;
}

int c_get_as_utf8::p_read_utf16_unit(bool a_big_endian) {
    int first = ar_reader.read();
    if (first == -1)
        return -1;
    return p_complete_unit(first, a_big_endian);
}

int c_get_as_utf8::p_map_unicode_to_utf8(std::uint32_t a_code_point) {
    if (a_code_point == 0x85 || a_code_point == 0x2028)
        return '\n';
    if (a_code_point == 0)
        return -1; // NUL is no XML character: it reads like the end
    unicode_char_to_utf8(a_code_point, m_sequence);
    if (m_sequence[1] != '\0')
        p_pending = m_sequence + 1;
    return static_cast<unsigned char>(m_sequence[0]);
}

int c_get_as_utf8::p_read_utf8_compound_char_sequence(int a_lead) {
    int length = a_lead >= 0xFC ? 6 : a_lead >= 0xF8 ? 5 : a_lead >= 0xF0 ? 4 : a_lead >= 0xE0 ? 3 : a_lead >= 0xC0 ? 2 : 1;
    m_sequence[0] = static_cast<char>(a_lead);
    bool is_void = false;
    for (int i = 1; i < length; ++i) {
        int c = ar_reader.read();
        if (c == -1) {
            m_sequence[i] = '\0';
            return -1;
        }
        // Every trailing byte must be a continuation byte; anything else would
        // let malformed text through into values.
        if (!is_continuation(static_cast<unsigned char>(c)))
            is_void = true;
        m_sequence[i] = static_cast<char>(c);
    }
    m_sequence[length] = '\0';
    const unsigned char *p = reinterpret_cast<const unsigned char *>(m_sequence);
    if ((length == 2 && p[0] == 0xC2 && p[1] == 0x85) || (length == 3 && p[0] == 0xE2 && p[1] == 0x80 && p[2] == 0xA8))
        return '\n';
    if (is_void || length > 4 || !is_valid_utf8_char_sequence(m_sequence))
        return -1;
    if (length > 1)
        p_pending = m_sequence + 1;
    return p[0];
}

int c_get_as_utf8::p_resolve_initial_character_encoding(int a_c) {
    if (a_c == 0xFF) {
        if (ar_reader.read() != 0xFE)
            return p_fail_encoding();
        int a = ar_reader.read(), b = ar_reader.read();
        if (a < 1 || a > 127 || b != 0)
            return p_fail_encoding();
        m_mode = mode_utf16_le;
        return a;
    }
    if (a_c == 0xFE) {
        if (ar_reader.read() != 0xFF)
            return p_fail_encoding();
        int a = ar_reader.read(), b = ar_reader.read();
        if (a != 0 || b < 1 || b > 127)
            return p_fail_encoding();
        m_mode = mode_utf16_be;
        return b;
    }
    if (a_c == 0xEF) {
        if (ar_reader.read() != 0xBB || ar_reader.read() != 0xBF)
            return p_fail_encoding();
        m_mode = mode_utf8;
        int next = ar_reader.read(); // delivered raw
        return next == 0 ? -1 : next;
    }
    if (a_c == '<' || is_white_byte(a_c)) {
        int next = ar_reader.read();
        if (next == 0) {
            m_mode = mode_utf16_le;
            return a_c;
        }
        m_mode = mode_utf8;
        if (next == -1)
            return a_c;
        if (next < 0x80) {
            m_sequence[0] = static_cast<char>(next);
            m_sequence[1] = '\0';
            p_pending = m_sequence;
        } else {
            int first = p_read_utf8_compound_char_sequence(next);
            if (first == -1) {
                m_unget.unget(-1); // the malformed character reads as the end, right after c
            } else {
                if (first == '\n') { // a folded NEL or LINE SEPARATOR
                    m_sequence[0] = '\n';
                    m_sequence[1] = '\0';
                }
                p_pending = m_sequence;
            }
        }
        return a_c;
    }
    if (a_c == 0) {
        int next = ar_reader.read();
        if (next != '<' && !is_white_byte(next))
            return p_fail_encoding();
        m_mode = mode_utf16_be;
        return next;
    }
    return p_fail_encoding();
}

bool c_get_as_utf8::set_encoding(const char *ap_encoding) {
    auto is = [ap_encoding](const char *ap_name) { return strcasecmp(ap_encoding, ap_name) == 0; };
    e_encoding_mode previous = m_mode;
    bool accepted;
    if (is("ISO-10646-UCS-2")) {
        accepted = previous == mode_utf16_be || previous == mode_utf16_le;
        if (accepted)
            m_mode = previous == mode_utf16_be ? mode_ucs2_be : mode_ucs2_le;
    } else if (is("ISO-8859-1") || is("US-ASCII")) {
        m_mode = mode_single_byte;
        accepted = previous == mode_utf8;
    } else if (is("UTF-8")) {
        accepted = previous == mode_utf8;
    } else if (is("UTF-16")) {
        accepted = previous == mode_utf16_be || previous == mode_utf16_le;
    } else {
        error(elmx_type_fatal, elmx_encoding_not_supported, "Unknown character encoding specified");
        return false;
    }
    if (!accepted)
        error(elmx_type_fatal, elmx_encoding_mismatch, "Mis-match between specfied encoding and byte format");
    return accepted;
}

} // namespace lmx
