// Byte sources and character decoding.
//
// A c_read delivers the bytes of a memory block or a file. c_get_as_utf8 works
// out the encoding from the first bytes and hands upward UTF-8 bytes with all
// line ends folded to one newline, counting lines as it goes. Everything above
// this layer sees int values: 0 to 255 for a byte, -1 for the end.
//
// The common path (plain ASCII in a UTF-8 document) is inline and takes bytes
// straight from the source's buffer; only refills go through a virtual call.
#ifndef LMX_LMXSOURCE_H
#define LMX_LMXSOURCE_H

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

#ifdef __SSE2__
#include <emmintrin.h>
#endif

#include "lmxerror.h"

namespace lmx {

// Abstract byte source. Derived classes expose a window of buffered bytes and
// refill it on demand.
class c_read {
public:
    c_read() = default;
    c_read(const c_read &) = delete;
    c_read &operator=(const c_read &) = delete;

    virtual bool is_open() const { return true; }
    // One byte as 0 to 255, or -1 at the end.
    int read() {
        if (p_next != p_end)
            return *p_next++;
        return refill() ? *p_next++ : -1;
    }
    virtual const char *get_source_id() const { return nullptr; }
    virtual void rewind() = 0;
    virtual ~c_read() = default;

    // Bulk access to the bytes already buffered, for the decoder's fast path.
    const unsigned char *buffered_begin() const { return p_next; }
    const unsigned char *buffered_end() const { return p_end; }
    void consume_to(const unsigned char *ap_next) { p_next = ap_next; }

protected:
    // Makes at least one more byte available in [p_next, p_end); false at the end.
    virtual bool refill() { return false; }
    void set_window(const unsigned char *ap_begin, const unsigned char *ap_end) {
        p_next = ap_begin;
        p_end = ap_end;
    }

private:
    const unsigned char *p_next = nullptr;
    const unsigned char *p_end = nullptr;
};

// Reads a caller's memory block without copying it; the block must outlive it.
class c_read_memory : public c_read {
public:
    c_read_memory(const char *ap_start, std::size_t a_length);
    void rewind() override;
    // An empty source id, as a memory block has no name.
    const char *get_source_id() const override { return m_source_id.c_str(); }

private:
    std::string m_source_id;
    const unsigned char *p_start;
    const unsigned char *p_end_of_data;
};

// The same as c_read_memory over a string the caller keeps alive.
class c_read_string : public c_read_memory {
public:
    explicit c_read_string(const std::string &ar_string)
        : c_read_memory(ar_string.data(), ar_string.size()) {}
};

// Reads a file in blocks. The wide path is UTF-16 in a std::wstring.
class c_read_file : public c_read {
public:
    static constexpr std::size_t k_block_size = 64 * 1024;

    explicit c_read_file(const char *ap_file);
    explicit c_read_file(const wchar_t *ap_file);
    ~c_read_file() override;

    bool is_open() const override { return p_file != nullptr; }
    const char *get_source_id() const override { return m_source_id.c_str(); }
    void rewind() override;

protected:
    bool refill() override;

private:
    void open(const char *ap_utf8_path);

    std::string m_source_id;
    std::FILE *p_file = nullptr;
    std::vector<unsigned char> m_buffer;
};

// A stack of at most three pushed-back values.
class c_unget_buffer {
public:
    void unget(int a_c) {
        if (m_count < k_slots) // a deeper push never happens; refuse rather than overrun
            m_slots[m_count++] = a_c;
    }
    int get() { return m_slots[--m_count]; }
    bool empty() const { return m_count == 0; }
    void clear() { m_count = 0; }

private:
    static constexpr int k_slots = 3;
    int m_slots[k_slots] = {};
    int m_count = 0;
};

enum e_encoding_mode {
    mode_unresolved = 0,
    mode_single_byte = 1, // ISO-8859-1 and US-ASCII alike
    mode_utf8 = 2,
    mode_utf16_be = 3,
    mode_utf16_le = 4,
    mode_ucs2_be = 5,
    mode_ucs2_le = 6
};

// Where a run of plain bytes taken in bulk ends. With is_name, at the first
// byte that is not an ASCII name character; with first set, at first or
// second; otherwise at every byte whose entry in p_table is not 0. Either way
// a run ends at NUL, at a line end and at bytes of 0x80 and up, which need
// the careful path for decoding, folding and counting: tables must say so.
struct s_run_stops {
    const unsigned char *p_table;
    unsigned char first;
    unsigned char second;
    bool is_name;
};

// Encodes one code point into a buffer of at least 5 bytes, NUL-terminated.
char *unicode_char_to_utf8(std::uint32_t a_c, char *ap_buffer);
// Decodes the 1 to 4 byte sequence at ap_sequence; false if it is malformed
// (an invalid lead byte also sets the value to -1).
bool utf8_to_unicode_char(const char *ap_sequence, std::int32_t *ap_value);
// Checks the lead byte and the byte after it.
bool is_valid_utf8_char_sequence(const char *ap_sequence);

// Decodes a c_read into UTF-8 with folded line ends and a line count.
class c_get_as_utf8 {
public:
    c_get_as_utf8(c_read &ar_reader, c_error &ar_error);
    c_get_as_utf8(const c_get_as_utf8 &) = delete;
    c_get_as_utf8 &operator=(const c_get_as_utf8 &) = delete;
    virtual ~c_get_as_utf8() = default;

    // Next UTF-8 byte with CR LF, CR, NEL and LINE SEPARATOR folded to "\n".
    int get() {
        int v = p_get();
        if (v == '\n' && m_prev == '\r')
            v = p_get();
        m_prev = static_cast<char>(v);
        if (v == '\r')
            v = '\n';
        if (v == '\n')
            ++m_line;
        return v;
    }
    void unget(int a_returned) { m_unget.unget(a_returned); }
    void rewind();
    int get_line_num() const { return m_line; }
    const char *get_source_id() const { return ar_reader.get_source_id(); }
    // Applies the encoding named in the XML declaration.
    bool set_encoding(const char *ap_encoding);

    void error(elmx_error_type a_type, elmx_error a_code, const char *ap_format);
    void error(elmx_error_type a_type, elmx_error a_code, const std::string &ar_s);

    c_error &get_error_record() const { return ar_error; }
    e_encoding_mode get_encoding_mode() const { return m_mode; }

protected:
    // Appends to ar_out the longest run of buffered bytes that ar_stops lets
    // through, as get() would deliver them, and returns its length. Takes
    // nothing unless the stream is in its plain UTF-8 state.
    std::size_t take_raw_run(const s_run_stops &ar_stops, std::string &ar_out);
    // Passes over buffered blanks, tabs and line feeds, as get() would.
    void skip_raw_white();
    // The next buffered byte if it is plain ASCII that get() would hand up
    // unchanged (no line end, no NUL), without taking it; otherwise -1.
    int peek_plain() const {
        if (!p_is_plain_state() || ar_reader.buffered_begin() == ar_reader.buffered_end())
            return -1;
        int c = *ar_reader.buffered_begin();
        return (c == 0 || c == '\r' || c == '\n' || c >= 0x80) ? -1 : c;
    }

private:
    bool p_is_plain_state() const {
        return m_mode == mode_utf8 && m_unget.empty() && !p_pending && m_prev != '\r' && !ar_error.is_fatal_errored();
    }
    int p_get() {
        if (ar_error.is_fatal_errored())
            return -1;
        if (!m_unget.empty())
            return m_unget.get();
        if (p_pending)
            return p_get_pending();
        int c = ar_reader.read();
        if (m_mode == mode_utf8 && c > 0 && c < 0x80)
            return c;
        return p_decode(c);
    }
    int p_get_pending();
    int p_decode(int a_c);
    int p_resolve_initial_character_encoding(int a_c);
    int p_read_utf8_compound_char_sequence(int a_lead);
    int p_complete_unit(int a_first, bool a_big_endian);
    int p_read_utf16_unit(bool a_big_endian);
    int p_map_unicode_to_utf8(std::uint32_t a_code_point);
    int p_fail_encoding();

    c_read &ar_reader;
    c_error &ar_error;
    c_getter_error_binder m_binder;
    e_encoding_mode m_mode = mode_unresolved;
    char m_prev = 0;
    c_unget_buffer m_unget;
    char m_sequence[8] = {};
    const char *p_pending = nullptr;
    std::int32_t m_line = 1;
};

// The first byte from ap_p on that is a or b, or that needs the careful path
// (NUL, a line end, 0x80 and up); ap_end if there is none. Sixteen bytes at a
// time where the processor allows.
inline const unsigned char *find_run_end(const unsigned char *ap_p, const unsigned char *ap_end, unsigned char a,
                                         unsigned char b) {
#ifdef __SSE2__
    const __m128i va = _mm_set1_epi8(static_cast<char>(a));
    const __m128i vb = _mm_set1_epi8(static_cast<char>(b));
    const __m128i vcr = _mm_set1_epi8('\r');
    const __m128i vlf = _mm_set1_epi8('\n');
    const __m128i vnul = _mm_setzero_si128();
    while (ap_end - ap_p >= 16) {
        __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(ap_p));
        __m128i hits = _mm_or_si128(_mm_or_si128(_mm_cmpeq_epi8(x, va), _mm_cmpeq_epi8(x, vb)),
                                    _mm_or_si128(_mm_cmpeq_epi8(x, vcr), _mm_cmpeq_epi8(x, vlf)));
        hits = _mm_or_si128(hits, _mm_cmpeq_epi8(x, vnul));
        // The sign bit of a byte is set for 0x80 and up.
        int mask = _mm_movemask_epi8(hits) | _mm_movemask_epi8(x);
        if (mask)
            return ap_p + __builtin_ctz(static_cast<unsigned>(mask));
        ap_p += 16;
    }
#endif
    while (ap_p != ap_end && *ap_p != a && *ap_p != b && *ap_p != '\r' && *ap_p != '\n' && *ap_p != 0 && *ap_p < 0x80)
        ++ap_p;
    return ap_p;
}

// The first byte from ap_p on that is not an ASCII letter, digit, "_", ":",
// "." or "-"; ap_end if there is none. Sixteen bytes at a time where the
// processor allows.
inline const unsigned char *find_name_end(const unsigned char *ap_p, const unsigned char *ap_end) {
#ifdef __SSE2__
    auto in_range = [](__m128i a_x, char a_low, char a_high) {
        // Signed comparison: bytes of 0x80 and up are negative and never in range.
        return _mm_and_si128(_mm_cmpgt_epi8(a_x, _mm_set1_epi8(static_cast<char>(a_low - 1))),
                             _mm_cmplt_epi8(a_x, _mm_set1_epi8(static_cast<char>(a_high + 1))));
    };
    while (ap_end - ap_p >= 16) {
        __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(ap_p));
        __m128i name = _mm_or_si128(in_range(_mm_or_si128(x, _mm_set1_epi8(0x20)), 'a', 'z'), in_range(x, '0', '9'));
        name = _mm_or_si128(name, in_range(x, '-', '.'));
        name = _mm_or_si128(name, _mm_or_si128(_mm_cmpeq_epi8(x, _mm_set1_epi8('_')),
                                               _mm_cmpeq_epi8(x, _mm_set1_epi8(':'))));
        int mask = ~_mm_movemask_epi8(name) & 0xFFFF;
        if (mask)
            return ap_p + __builtin_ctz(static_cast<unsigned>(mask));
        ap_p += 16;
    }
#endif
    auto is_name_byte = [](unsigned char c) {
        return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '_' || c == ':' ||
               c == '.' || c == '-';
    };
    while (ap_p != ap_end && is_name_byte(*ap_p))
        ++ap_p;
    return ap_p;
}

inline std::size_t c_get_as_utf8::take_raw_run(const s_run_stops &ar_stops, std::string &ar_out) {
    if (!p_is_plain_state())
        return 0;
    const unsigned char *begin = ar_reader.buffered_begin();
    const unsigned char *end = ar_reader.buffered_end();
    const unsigned char *p = begin;
    if (ar_stops.is_name) {
        p = find_name_end(p, end);
    } else if (ar_stops.first) {
        p = find_run_end(p, end, ar_stops.first, ar_stops.second);
    } else {
        const unsigned char *stop = ar_stops.p_table;
        while (end - p >= 8 &&
               !(stop[p[0]] | stop[p[1]] | stop[p[2]] | stop[p[3]] | stop[p[4]] | stop[p[5]] | stop[p[6]] | stop[p[7]]))
            p += 8;
        while (p != end && !stop[*p])
            ++p;
    }
    if (p == begin)
        return 0;
    std::size_t length = static_cast<std::size_t>(p - begin);
    ar_out.append(reinterpret_cast<const char *>(begin), length);
    m_prev = static_cast<char>(p[-1]);
    ar_reader.consume_to(p);
    return length;
}

inline void c_get_as_utf8::skip_raw_white() {
    const unsigned char *begin = ar_reader.buffered_begin();
    const unsigned char *end = ar_reader.buffered_end();
    auto is_plain_white = [](unsigned char c) { return c == ' ' || c == '\t' || c == '\n'; };
    if (begin == end || !is_plain_white(*begin) || !p_is_plain_state())
        return;
    const unsigned char *p = begin;
    std::int32_t lines = 0;
    do {
        lines += *p == '\n';
        ++p;
    } while (p != end && is_plain_white(*p));
    m_line += lines;
    m_prev = static_cast<char>(p[-1]);
    ar_reader.consume_to(p);
}

} // namespace lmx

#endif
