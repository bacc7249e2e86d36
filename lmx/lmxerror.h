// Error codes and error records of the lmx XML runtime.
//
// Nothing in the runtime throws: every operation that can fail returns an
// elmx_error. The low layers (decoding, scanning, DTD) record into a c_error,
// which freezes at the first fatal error; the reader and writer capture the
// failure a caller finally sees into an s_debug_error.
#ifndef LMX_LMXERROR_H
#define LMX_LMXERROR_H

#include <cstdint>
#include <ostream>
#include <string>

namespace lmx {

enum elmx_error : std::int32_t {
    elmx_ok = 0,
    elmx_unable_to_open_file = 1,
    elmx_all_cardinality = 2,
    elmx_attribute_already_read = 3,
    elmx_attributes_in_compositor = 4,
    elmx_xml_badly_formed = 5,
    elmx_encoding_not_supported = 6,
    elmx_bad_choice = 7,
    elmx_bad_comment = 8,
    elmx_bad_dtd = 9,
    elmx_bad_end_of_element = 10,
    elmx_bad_start_tag_end = 11,
    elmx_end_tag_syntax = 12,
    elmx_bad_xml_decl = 13,
    elmx_unsupported_xml_version = 14,
    elmx_encoding_mismatch = 15,
    elmx_element_not_found = 16,
    elmx_external_entity = 17,
    elmx_fraction_digits_exceeded = 18,
    elmx_length_too_long = 19,
    elmx_length_too_short = 20,
    elmx_mandatory_element_missing = 21,
    elmx_no_pattern_matched = 22,
    elmx_not_well_formed = 23,
    elmx_recursive_entity = 24,
    elmx_required_attribute_missing = 25,
    elmx_max_occurs_exceeded = 26,
    elmx_total_digits_exceeded = 27,
    elmx_unable_to_read_attribute = 28,
    elmx_unable_to_read_element = 29,
    elmx_unknown_element_in_all = 30,
    elmx_unknown_element_in_content = 31,
    elmx_unexpected_empty_element = 32,
    elmx_unexpected_entity = 33,
    elmx_unexpected_end_of_message = 34,
    elmx_invalid_value_format = 35,
    elmx_value_above_maximum = 36,
    elmx_value_below_minimum = 37,
    elmx_value_not_enumerated = 38,
    elmx_unexpected_attribute = 39,
    elmx_nil_body_not_empty = 40,
    elmx_entity_not_found = 41,
    elmx_undefined_error = 42,
    elmx_fixed_value_mismatch = 43,
    elmx_unknown_xsi_type = 44,
    elmx_type_not_set = 45,
    elmx_marshal_occurs_error = 46,
    // Applications may report their own failures in this range.
    elmx_user_defined_1 = 1000,
    elmx_user_defined_2 = 1001,
    elmx_user_defined_3 = 1002,
    elmx_user_defined_4 = 1003,
    elmx_user_defined_5 = 1004,
    elmx_user_defined_6 = 1005,
    elmx_user_defined_7 = 1006,
    elmx_user_defined_8 = 1007,
    elmx_user_defined_9 = 1008
};

enum elmx_error_type : std::int32_t {
    elmx_type_fatal = 0,
    elmx_type_error = 1,
    elmx_type_warning = 2,
    elmx_type_notice = 3,
    elmx_type_none = 4
};

struct s_error_description {
    elmx_error code;
    const char *p_text;
};

// The table text of a code; "" for a code that is not in the table, never null.
const char *get_error_description(elmx_error a_error_code);

// Identity functions: one place to set a breakpoint on every reported error.
inline elmx_error lmx_error(elmx_error a_error) { return a_error; }
inline elmx_error lmx_error(elmx_error a_error, const char * /*ap_name*/,
                            const char * /*a_prog_file*/, int /*a_prog_line*/) {
    return a_error;
}

class c_get_as_utf8;
class c_getter_error_binder;

// Record of the low layers' errors. Freezes at the first fatal error.
class c_error {
public:
    c_error() = default;
    c_error(const c_error &) = delete;
    c_error &operator=(const c_error &) = delete;

    // Called after the record has been updated; the only place where the
    // message words of the low layers are available. Discards them by default.
    virtual void report_error(elmx_error_type a_type, elmx_error a_code, const char *ap_file,
                              int a_line, const char *ap_msg);
    virtual ~c_error() = default;

    void error(elmx_error_type a_type, elmx_error a_code, const char *ap_file, int a_line,
               const char *ap_msg);
    // Takes source id and line from the bound getter.
    void error(elmx_error_type a_type, elmx_error a_code, const char *ap_msg);

    elmx_error get_last_error() const { return m_last_code; }
    bool is_fatal_errored() const { return m_fatal_count > 0; }
    bool get_error_info(elmx_error_type *ap_type, elmx_error *ap_code, int *ap_line) const;

    std::int32_t get_fatal_count() const { return m_fatal_count; }
    std::int32_t get_error_count() const { return m_error_count; }
    std::int32_t get_warning_count() const { return m_warning_count; }
    std::int32_t get_notice_count() const { return m_notice_count; }

    void register_getter(c_getter_error_binder *ap_binder);
    void unregister_getter(c_getter_error_binder *ap_binder);

private:
    friend class c_getter_error_binder;
    const c_get_as_utf8 *p_getter = nullptr;
    std::int32_t m_fatal_count = 0;
    std::int32_t m_error_count = 0;
    std::int32_t m_warning_count = 0;
    std::int32_t m_notice_count = 0;
    elmx_error_type m_last_type = elmx_type_none;
    elmx_error m_last_code = elmx_ok;
    std::int32_t m_last_line = -1;
};

// Ties a getter to a c_error for the binder's lifetime.
class c_getter_error_binder {
public:
    explicit c_getter_error_binder(c_error &ar_error) : m_error(ar_error) {}
    c_getter_error_binder(const c_getter_error_binder &) = delete;
    c_getter_error_binder &operator=(const c_getter_error_binder &) = delete;
    ~c_getter_error_binder();

    void bind(const c_get_as_utf8 *ap_getter);
    const c_get_as_utf8 *get_getter() const { return m_new_getter; }

private:
    friend class c_error;
    bool m_is_bound = false;
    c_error &m_error;
    const c_get_as_utf8 *m_new_getter = nullptr;
    const c_get_as_utf8 *m_old_getter = nullptr;
};

// The failure a caller sees: code, item, where in the program, where in the XML.
struct s_debug_error {
    elmx_error error = elmx_ok;
    std::string item_name;
    const char *p_prog_file = "(not set)";
    std::int32_t prog_line = -1;
    std::int32_t xml_line = -1;

    void clear();
    void set(elmx_error a_error, const std::string &ar_item_name, const char *ap_prog_file,
             int a_prog_line, int a_xml_line);
    std::ostream &to_stream(std::ostream &ar_os) const;
    std::string to_string() const;
};

std::ostream &operator<<(std::ostream &ar_os, const s_debug_error &ar_error);

} // namespace lmx

#endif
