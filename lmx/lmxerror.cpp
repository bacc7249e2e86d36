#include "lmxerror.h"

#include <sstream>

#include "lmxsource.h"

namespace lmx {

namespace {

const s_error_description mc_error_description[] = {
    {elmx_ok, "No Error"},
    {elmx_unable_to_open_file, "Unable to open file"},
    {elmx_all_cardinality, "Violation of xs:all cardinality constraints"},
    {elmx_attribute_already_read, "Attribute has already been read"},
    {elmx_attributes_in_compositor, "Attributes found in anonymous compositor"},
    {elmx_xml_badly_formed, "XML badly formed"},
    {elmx_encoding_not_supported, "XML character encoding not supported"},
    {elmx_bad_choice, "Inappropriate choice option selected"},
    {elmx_bad_comment, "Badly formed comment"},
    {elmx_bad_dtd, "Badly formed DTD"},
    {elmx_bad_end_of_element, "Bad end of element"},
    {elmx_bad_start_tag_end, "Bad start tag end"},
    {elmx_end_tag_syntax, "Syntax error in end tag"},
    {elmx_bad_xml_decl, "Bad XML Decl spec"},
    {elmx_unsupported_xml_version, "Unsupported XML version"},
    {elmx_encoding_mismatch, "Mis-match between specified char encoding and read bytes"},
    {elmx_element_not_found, "Element not found"},
    {elmx_external_entity, "Reference to external entity"},
    {elmx_fraction_digits_exceeded, "Fraction digits exceeded"},
    {elmx_length_too_long, "Length too long"},
    {elmx_length_too_short, "Length too short"},
    {elmx_mandatory_element_missing, "Mandatory element missing"},
    {elmx_no_pattern_matched, "No pattern matched"},
    {elmx_not_well_formed, "Not well formed"},
    {elmx_recursive_entity, "Recursive entity definition"},
    {elmx_required_attribute_missing, "Required attribute(s) missing"},
    {elmx_max_occurs_exceeded, "Element instances exceeds maxOccurs"},
    {elmx_total_digits_exceeded, "Total digits exceeded"},
    {elmx_unable_to_read_attribute, "Unable to read attribute value"},
    {elmx_unable_to_read_element, "Unable to read element value"},
    {elmx_unknown_element_in_all, "Unknown element in xs:all"},
    {elmx_unknown_element_in_content, "Unknown element in complexContent"},
    {elmx_unexpected_empty_element, "Unexpected empty element"},
    {elmx_unexpected_entity, "Unexpected entity"},
    {elmx_unexpected_end_of_message, "Unexpected end of message"},
    {elmx_invalid_value_format, "Invalid value format for this type"},
    {elmx_value_above_maximum, "Value greater than specified maximum"},
    {elmx_value_below_minimum, "Value less than specified minimum"},
    {elmx_value_not_enumerated, "Value does not match enumerations"},
    {elmx_unexpected_attribute, "Unexpected attribute"},
    {elmx_nil_body_not_empty, "Nilled element body not empty"},
    {elmx_entity_not_found, "Entity not found"},
    {elmx_undefined_error, "Undefined error"},
    {elmx_fixed_value_mismatch, "Value does not match specified fixed constraint"},
    {elmx_unknown_xsi_type, "Unknown xsi:type"},
    {elmx_type_not_set, "Type not set"},
    {elmx_marshal_occurs_error, "min/max occurs error on marshaling"},
    {elmx_user_defined_1, "User defined error 1"},
    {elmx_user_defined_2, "User defined error 2"},
    {elmx_user_defined_3, "User defined error 3"},
    {elmx_user_defined_4, "User defined error 4"},
    {elmx_user_defined_5, "User defined error 5"},
    {elmx_user_defined_6, "User defined error 6"},
    {elmx_user_defined_7, "User defined error 7"},
    {elmx_user_defined_8, "User defined error 8"},
    {elmx_user_defined_9, "User defined error 9"},
};

} // namespace

const char *get_error_description(elmx_error a_error_code) {
    for (const s_error_description &row : mc_error_description)
        if (row.code == a_error_code)
            return row.p_text;
    return "";
}

void c_error::report_error(elmx_error_type, elmx_error, const char *, int, const char *) {}

void c_error::error(elmx_error_type a_type, elmx_error a_code, const char *ap_file, int a_line,
                    const char *ap_msg) {
    if (m_fatal_count > 0)
        return; // the first fatal error stays in the record for good
    m_last_line = a_line;
    m_last_code = a_code;
    m_last_type = a_type;
    switch (a_type) {
    case elmx_type_fatal:
        ++m_fatal_count;
        ++m_error_count;
        break;
    case elmx_type_error:
        ++m_error_count;
        break;
    case elmx_type_warning:
        ++m_warning_count;
        break;
    case elmx_type_notice:
        ++m_warning_count;
        ++m_notice_count;
        break;
    case elmx_type_none:
        break;
    }
    report_error(a_type, a_code, ap_file, a_line, ap_msg);
}

void c_error::error(elmx_error_type a_type, elmx_error a_code, const char *ap_msg) {
    if (p_getter)
        error(a_type, a_code, p_getter->get_source_id(), p_getter->get_line_num(), ap_msg);
    else
        error(a_type, a_code, nullptr, -1, ap_msg);
}

bool c_error::get_error_info(elmx_error_type *ap_type, elmx_error *ap_code, int *ap_line) const {
    if (m_last_code == elmx_ok)
        return false;
    *ap_type = m_last_type;
    *ap_code = m_last_code;
    *ap_line = m_last_line;
    return true;
}

void c_error::register_getter(c_getter_error_binder *ap_binder) {
    ap_binder->m_old_getter = p_getter;
    p_getter = ap_binder->m_new_getter;
}

void c_error::unregister_getter(c_getter_error_binder *ap_binder) { p_getter = ap_binder->m_old_getter; }

c_getter_error_binder::~c_getter_error_binder() {
    if (m_is_bound)
        m_error.unregister_getter(this);
}

void c_getter_error_binder::bind(const c_get_as_utf8 *ap_getter) {
    if (m_is_bound)
        return;
    m_new_getter = ap_getter;
    m_error.register_getter(this);
    m_is_bound = true;
}

void s_debug_error::clear() { *this = s_debug_error(); }

void s_debug_error::set(elmx_error a_error, const std::string &ar_item_name, const char *ap_prog_file,
                        int a_prog_line, int a_xml_line) {
    error = a_error;
    item_name = ar_item_name;
    p_prog_file = ap_prog_file;
    prog_line = a_prog_line;
    xml_line = a_xml_line;
}

std::ostream &s_debug_error::to_stream(std::ostream &ar_os) const {
    ar_os << "Error: " << get_error_description(error) << "\n";
    if (error == elmx_ok)
        return ar_os;
    ar_os << "Item: " << item_name << "\n";
    ar_os << "Program file: " << (p_prog_file ? p_prog_file : "") << "\n";
    ar_os << "Program line: " << prog_line << "\n";
    if (xml_line != -1)
        ar_os << "XML line: " << xml_line << "\n";
    return ar_os;
}

std::string s_debug_error::to_string() const {
    std::ostringstream os;
    to_stream(os);
    return os.str();
}

std::ostream &operator<<(std::ostream &ar_os, const s_debug_error &ar_error) { return ar_error.to_stream(ar_os); }

} // namespace lmx
