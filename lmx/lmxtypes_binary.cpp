// c_binary: hex and base64, both ways.
#include "lmxtypes.h"

#include <ios>

#include "lmxoutput.h"

namespace lmx {

namespace {

const char k_base64_digits[] = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
const char k_hex_digits[] = "0123456789ABCDEF";

bool is_base64_char(char a_c) {
    return (a_c >= 'A' && a_c <= 'Z') || (a_c >= 'a' && a_c <= 'z') || (a_c >= '0' && a_c <= '9') || a_c == '+' ||
           a_c == '/';
}

// The 6-bit value of a base64 character, -1 for anything else.
int base64_value(char a_c) {
    if (a_c >= 'A' && a_c <= 'Z')
        return a_c - 'A';
    if (a_c >= 'a' && a_c <= 'z')
        return a_c - 'a' + 26;
    if (a_c >= '0' && a_c <= '9')
        return a_c - '0' + 52;
    if (a_c == '+')
        return 62;
    if (a_c == '/')
        return 63;
    return -1;
}

int hex_value(char a_c) {
    if (a_c >= '0' && a_c <= '9')
        return a_c - '0';
    if (a_c >= 'a' && a_c <= 'f')
        return a_c - 'a' + 10;
    if (a_c >= 'A' && a_c <= 'F')
        return a_c - 'A' + 10;
    return -1;
}

} // namespace

bool c_binary::is_valid_hex(const std::string &ar_text) {
    if (ar_text.size() % 2 != 0)
        return false;
    for (char c : ar_text)
        if (hex_value(c) < 0)
            return false;
    return true;
}

// Characters of the alphabet are counted, white space is passed over. At the
// first other character (where the padding starts) that character must stand
// at index 2 or later and within two of the end, the padding must complete
// the count to a multiple of four, and it must be "=" up to any white space.
bool c_binary::is_valid_base64(const std::string &ar_text) {
    std::size_t count = 0;
    std::size_t size = ar_text.size();
    for (std::size_t i = 0; i < size; ++i) {
        char c = ar_text[i];
        if (is_base64_char(c)) {
            ++count;
            continue;
        }
        if (is_white(static_cast<unsigned char>(c)))
            continue;
        std::size_t rest = size - i;
        if (i < 2 || rest > 2 || (rest + count) % 4 != 0)
            return false;
        for (; i < size && !is_white(static_cast<unsigned char>(ar_text[i])); ++i)
            if (ar_text[i] != '=')
                return false;
        return true;
    }
    return count % 4 == 0;
}

void c_binary::from_hex(const std::string &ar_text) {
    m_data.clear();
    m_data.reserve(ar_text.size() / 2);
    for (std::size_t i = 0; i + 1 < ar_text.size(); i += 2) {
        int high = hex_value(ar_text[i]);
        int low = hex_value(ar_text[i + 1]);
        m_data.push_back(static_cast<unsigned char>(((high < 0 ? 0 : high) << 4) | (low < 0 ? 0 : low)));
    }
}

void c_binary::from_base64(const std::string &ar_text) {
    m_data.clear();
    m_data.reserve(ar_text.size() / 4 * 3 + 2);
    unsigned long group = 0;
    int count = 0;
    for (char c : ar_text) {
        int value = base64_value(c);
        if (value < 0)
            continue;
        group = (group << 6) | static_cast<unsigned long>(value);
        if (++count == 4) {
            m_data.push_back(static_cast<unsigned char>(group >> 16));
            m_data.push_back(static_cast<unsigned char>(group >> 8));
            m_data.push_back(static_cast<unsigned char>(group));
            group = 0;
            count = 0;
        }
    }
    // Two characters carry one byte, three carry two; one alone carries nothing.
    if (count == 2) {
        m_data.push_back(static_cast<unsigned char>(group >> 4));
    } else if (count == 3) {
        m_data.push_back(static_cast<unsigned char>(group >> 10));
        m_data.push_back(static_cast<unsigned char>(group >> 2));
    }
}

std::ostream &c_binary::out_hex(std::ostream &ar_os) const {
    // Digits are built by table into a buffer; the stream's flags are not
    // touched, so there is nothing to restore.
    char buffer[512];
    std::size_t used = 0;
    for (unsigned char byte : m_data) {
        if (used + 2 > sizeof buffer) {
            write_raw(ar_os, buffer, used);
            used = 0;
        }
        buffer[used++] = k_hex_digits[byte >> 4];
        buffer[used++] = k_hex_digits[byte & 0x0f];
    }
    return write_raw(ar_os, buffer, used);
}

namespace {

// Encodes in runs of a buffer's size, handing each run to ar_sink.
template <typename Sink> void encode_base64(const std::vector<unsigned char> &ar_data, Sink &&ar_sink) {
    char buffer[1024];
    std::size_t used = 0;
    std::size_t size = ar_data.size();
    std::size_t i = 0;
    for (; i + 3 <= size; i += 3) {
        if (used + 4 > sizeof buffer) {
            ar_sink(buffer, used);
            used = 0;
        }
        unsigned long group = (static_cast<unsigned long>(ar_data[i]) << 16) |
                              (static_cast<unsigned long>(ar_data[i + 1]) << 8) | ar_data[i + 2];
        buffer[used++] = k_base64_digits[(group >> 18) & 0x3f];
        buffer[used++] = k_base64_digits[(group >> 12) & 0x3f];
        buffer[used++] = k_base64_digits[(group >> 6) & 0x3f];
        buffer[used++] = k_base64_digits[group & 0x3f];
    }
    if (used + 4 > sizeof buffer) {
        ar_sink(buffer, used);
        used = 0;
    }
    std::size_t rest = size - i;
    if (rest > 0) {
        unsigned long group = static_cast<unsigned long>(ar_data[i]) << 16;
        if (rest == 2)
            group |= static_cast<unsigned long>(ar_data[i + 1]) << 8;
        buffer[used++] = k_base64_digits[(group >> 18) & 0x3f];
        buffer[used++] = k_base64_digits[(group >> 12) & 0x3f];
        buffer[used++] = rest == 2 ? k_base64_digits[(group >> 6) & 0x3f] : '=';
        buffer[used++] = '=';
    }
    if (used > 0)
        ar_sink(buffer, used);
}

} // namespace

std::ostream &c_binary::out_base64(std::ostream &ar_os) const {
    // One unbroken run of groups of four: base64 in XML needs no line breaks.
    encode_base64(m_data, [&ar_os](const char *ap_text, std::size_t a_size) { write_raw(ar_os, ap_text, a_size); });
    return ar_os;
}

std::string c_binary::get_as_string() const {
    std::string text;
    text.reserve((m_data.size() + 2) / 3 * 4);
    encode_base64(m_data, [&text](const char *ap_text, std::size_t a_size) { text.append(ap_text, a_size); });
    return text;
}

std::ostream &output_convert_to_hex(std::ostream &ar_os, const c_binary &ar_value) { return ar_value.out_hex(ar_os); }

std::ostream &o_to_v_base64(std::ostream &ar_os, const c_binary &ar_value) { return ar_value.out_base64(ar_os); }

// base64Binary is the binary type the CxF schemas use; hexBinary has its own pair.
template <> void v_to_o<c_binary>(c_binary &ar_o, const std::string &ar_v) { ar_o.from_base64(ar_v); }
template <> std::ostream &o_to_v<c_binary>(std::ostream &ar_os, const c_binary &ar_o) { return ar_o.out_base64(ar_os); }

void v_to_o_hex(c_binary &ar_o, const std::string &ar_v) { ar_o.from_hex(ar_v); }
std::ostream &o_to_v_hex(std::ostream &ar_os, const c_binary &ar_o) { return ar_o.out_hex(ar_os); }
void v_to_o_base64(c_binary &ar_o, const std::string &ar_v) { ar_o.from_base64(ar_v); }

} // namespace lmx
