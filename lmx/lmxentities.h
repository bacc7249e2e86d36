// Entity references and the stream that expands them.
//
// c_get_with_entities sits between the UTF-8 stream and the scanner. It keeps
// a stack of entity texts being read, so that an entity holding markup is
// scanned like the document, and applies the whitespace modes to the values
// built from the stream.
#ifndef LMX_LMXENTITIES_H
#define LMX_LMXENTITIES_H

#include <cstddef>
#include <string>
#include <vector>

#include "lmxrepository.h"
#include "lmxsource.h"

namespace lmx {

enum elmx_whitespace { ws_preserve = 0, ws_replace = 1, ws_collapse = 2 };

// White space as the standard library's isspace sees it, for byte values.
inline bool is_white(int a_c) {
    return a_c == ' ' || (a_c >= '\t' && a_c <= '\r');
}

// The captured attributes of one start tag: NUL-terminated segments read back
// through an index. Per attribute: name, NUL, opening quote, value, NUL.
class c_attribute_data {
public:
    c_attribute_data() { m_bytes.reserve(150); }

    void put(char a_c) { m_bytes.push_back(a_c); }
    void append(const std::string &ar_s) { m_bytes.append(ar_s); }
    void mark_segment_end() { m_bytes.push_back('\0'); }

    // The byte at the index, or -1 at a NUL or past the end; does not move.
    int peek() const {
        if (m_index >= m_bytes.size() || m_bytes[m_index] == '\0')
            return -1;
        return static_cast<unsigned char>(m_bytes[m_index]);
    }
    // Like peek, and moves past a byte that is not a NUL.
    int get() {
        int c = peek();
        if (c != -1)
            ++m_index;
        return c;
    }
    void next() {
        if (m_index < m_bytes.size())
            ++m_index;
    }
    void unget() {
        if (m_index > 0)
            --m_index;
    }
    // Moves to the end of the current segment and past it, if that stays inside.
    void next_segment() {
        while (m_index < m_bytes.size() && m_bytes[m_index] != '\0')
            ++m_index;
        if (m_index + 1 < m_bytes.size())
            ++m_index;
    }
    // The current segment from the index on.
    const char *get_str() const { return m_index < m_bytes.size() ? &m_bytes[m_index] : ""; }
    bool is_eof() const {
        return m_bytes.empty() || m_index >= m_bytes.size() ||
               (m_bytes[m_index] == '\0' && m_index + 1 >= m_bytes.size());
    }
    void rewind() { m_index = 0; }
    void clear() {
        m_bytes.clear();
        m_index = 0;
    }
    bool empty() const { return m_bytes.empty(); }
    std::size_t size() const { return m_bytes.size(); }
    std::size_t get_index() const { return m_index; }
    void set_index(std::size_t a_index) { m_index = a_index; }
    // The whole buffer, for appending in bulk and reading values in bulk.
    std::string &bytes() { return m_bytes; }

private:
    std::string m_bytes;
    std::size_t m_index = 0;
};

// An entity's text being read as input.
class c_dtd_active_entity {
public:
    explicit c_dtd_active_entity(const char *ap_text) : p_current(ap_text), p_start(ap_text) {}

    // Bytes of entity text come out as signed chars.
    int get() {
        if (!m_unget.empty())
            return m_unget.get();
        if (*p_current == '\0')
            return -1;
        return static_cast<signed char>(*p_current++);
    }
    void unget(int a_c) { m_unget.unget(a_c); }
    bool empty() const { return m_unget.empty() && *p_current == '\0'; }
    const char *get_start() const { return p_start; }

private:
    const char *p_current;
    const char *p_start;
    c_unget_buffer m_unget;
};

// Source of the characters that follow "&" or "%".
class c_entity_name_reader {
public:
    virtual ~c_entity_name_reader() = default;
    virtual int get() = 0;
    virtual void unget(int a_c) = 0;

    bool get_is_markup_possible_in_entity() const { return is_markup_possible_in_entity; }
    void set_is_markup_possible_in_entity(bool a_possible) { is_markup_possible_in_entity = a_possible; }

private:
    bool is_markup_possible_in_entity = false;
};

// Reads a captured attribute value; -1 at its NUL.
class c_entity_name_reader_for_attribute_data : public c_entity_name_reader {
public:
    explicit c_entity_name_reader_for_attribute_data(c_attribute_data &ar_data) : ar_data(ar_data) {}
    int get() override { return ar_data.get(); }
    void unget(int a_c) override {
        if (a_c != -1)
            ar_data.unget();
    }

private:
    c_attribute_data &ar_data;
};

// Reads entity text through the caller's own pointer, which it advances.
class c_entity_name_reader_for_entity : public c_entity_name_reader {
public:
    explicit c_entity_name_reader_for_entity(const char *&arp_text) : arp_text(arp_text), p_start(arp_text) {}
    int get() override {
        if (*arp_text == '\0')
            return -1;
        return static_cast<unsigned char>(*arp_text++);
    }
    void unget(int a_c) override {
        if (a_c != -1 && arp_text != p_start)
            --arp_text;
    }

private:
    const char *&arp_text;
    const char *p_start;
};

// Reads a NUL-terminated text by index.
class c_entity_name_reader_for_c_str : public c_entity_name_reader {
public:
    explicit c_entity_name_reader_for_c_str(const char *ap_text) : p_text(ap_text) {}
    int get() override {
        if (p_text[m_index] == '\0')
            return -1;
        return static_cast<unsigned char>(p_text[m_index++]);
    }
    void unget(int a_c) override {
        if (a_c != -1 && m_index > 0)
            --m_index;
    }
    std::size_t get_index() const { return m_index; }

private:
    const char *p_text;
    std::size_t m_index = 0;
};

// The UTF-8 stream with entity expansion and whitespace handling.
class c_get_with_entities : public c_get_as_utf8 {
public:
    // Entity expansion is bounded so that a hostile document cannot exhaust
    // memory or stack: in total bytes of replacement text, and in nesting.
    static constexpr std::size_t k_max_expansion_bytes = 10 * 1024 * 1024;
    static constexpr std::size_t k_max_entity_depth = 64;

    c_get_with_entities(c_read &ar_reader, c_error &ar_error, bool a_is_reading_xsd);

    int get() {
        if (m_entity_stack.empty())
            return c_get_as_utf8::get();
        return p_get_from_entities();
    }
    void unget(int a_returned) {
        if (m_entity_stack.empty())
            c_get_as_utf8::unget(a_returned);
        else
            m_entity_stack.back().unget(a_returned);
    }
    std::size_t get_entity_stack_depth() const { return m_entity_stack.size(); }

    void add_general_entity(const char *ap_entity_tag, const char *ap_value);
    bool get_general_entity(const char *ap_entity_tag, const char **app_entity_value_out) const;
    void add_parameter_entity(const char *ap_entity_tag, const char *ap_value);
    bool get_parameter_entity(const char *ap_entity_tag, const char **app_entity_value_out) const;

    // Pushes entity text as input; false (and a fatal error) on recursion or
    // when the expansion limits are exceeded.
    bool set_input_entity_value(const char *ap_input_text);
    // Expands the reference whose "&" has just been read.
    bool select_general_entity(c_entity_name_reader &ar_entity_tag_reader, std::string *ap_value);
    // Expands the character reference whose "&#" has just been read.
    bool insert_character_entity(c_entity_name_reader &ar_entity_tag_reader, std::string *ap_value);

    void set_ws_mode(elmx_whitespace a_mode) {
        m_ws_mode = a_mode;
        pending_whitespace = false;
    }
    void reset_ws_mode() { pending_whitespace = false; }
    elmx_whitespace get_ws_mode() const { return m_ws_mode; }

    // Appends one character under the current whitespace mode.
    void add_char_wsp(std::string *ap_value, int a_c, bool a_is_from_char_entity = false) {
        switch (m_ws_mode) {
        case ws_preserve:
            break;
        case ws_replace:
            if (is_white(a_c) && !(a_is_from_char_entity && !a_is_reading_xsd))
                a_c = ' ';
            break;
        case ws_collapse:
            if (a_is_from_char_entity && !a_is_reading_xsd ? a_c == ' ' : is_white(a_c)) {
                pending_whitespace = true;
                return;
            }
            if (pending_whitespace && !ap_value->empty())
                ap_value->push_back(' ');
            pending_whitespace = false;
            break;
        }
        ap_value->push_back(static_cast<char>(a_c));
    }

    void rewind();

protected:
    // Appends a run of plain bytes straight from the source, under the current
    // whitespace mode, stopping where ap_stop says or at anything that needs
    // the careful path. Returns the number of bytes taken.
    std::size_t take_text_run(const s_run_stops &ar_stops, std::string *ap_value);
    void skip_white_run() {
        if (m_entity_stack.empty())
            skip_raw_white();
    }
    std::size_t take_name_run(const s_run_stops &ar_stops, std::string *ap_name) {
        return m_entity_stack.empty() ? take_raw_run(ar_stops, *ap_name) : 0;
    }
    int peek_plain_input() const { return m_entity_stack.empty() ? peek_plain() : -1; }

    const bool a_is_reading_xsd;
    bool pending_whitespace = false;

private:
    int p_get_from_entities();
    bool p_append_entity(const char *ap_text, std::string *ap_value);
    bool p_check_expansion(const char *ap_text);

    std::vector<c_dtd_active_entity> m_entity_stack;
    std::vector<const char *> m_appending; // texts being appended as values, innermost last
    std::size_t m_expanded_bytes = 0;
    c_repository<const char *> m_general_entities;
    c_repository<const char *> m_parameter_entities;
    std::string m_entity_name;
    elmx_whitespace m_ws_mode = ws_preserve;
};

} // namespace lmx

#endif
