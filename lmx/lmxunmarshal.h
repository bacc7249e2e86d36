// The unmarshal driver: how a bound class reads one element, from its
// attributes to its end tag.
//
// A bound class supplies its callbacks through a subclass of
// c_unmarshal_helper and picks one of the three drivers by its content (empty,
// simple or complex); the control flow and every error report around those
// callbacks lives here, once. The typed value readers declared on
// c_xml_reader move one value from the XML into a member container through
// its validation spec. The free unmarshal templates read a whole document
// from a file, a memory block or a captured c_any_info.
#ifndef LMX_LMXUNMARSHAL_H
#define LMX_LMXUNMARSHAL_H

#include <string>
#include <vector>

#include "lmxcontainers.h"
#include "lmxerror.h"
#include "lmxreader.h"
#include "lmxtypes.h"
#include "lmxvalidation.h"

namespace lmx {

// Foreign attributes kept whole by an element that has a wildcard for them.
typedef ct_non_pod_container<c_any_info, std::vector<c_any_info *>, ct_happy_ptr_deleter<c_any_info>>
    c_any_attribute_store;

class c_unmarshal_helper {
public:
    explicit c_unmarshal_helper(c_xml_reader &ar_reader);
    c_unmarshal_helper(const c_unmarshal_helper &) = delete;
    c_unmarshal_helper &operator=(const c_unmarshal_helper &) = delete;
    virtual ~c_unmarshal_helper() = default;

    // The callbacks of a bound class.
    // True if the current attribute was taken.
    virtual bool unmarshal_attribute(elmx_error *ap_error) {
        *ap_error = elmx_ok;
        return false;
    }
    // After the last attribute: are the required ones there.
    virtual elmx_error unmarshal_attributes_check() { return elmx_ok; }
    virtual bool unmarshal_simple_body(elmx_error *ap_error) {
        *ap_error = elmx_ok;
        return false;
    }
    virtual bool unmarshal_complex_body(elmx_error *ap_error) {
        *ap_error = elmx_ok;
        return false;
    }
    // xsi:nil was given as true.
    virtual bool is_nil() const { return false; }
    virtual bool is_not_choice_or_choice_is_not_set() const { return true; }

    // For content in which no child is required: an element with no content
    // at all is then accepted.
    void set_body_can_be_empty() { m_body_can_be_empty = true; }
    // Attributes nobody takes go here instead of being refused.
    void set_anyattributes_store(c_any_attribute_store *ap_store) { p_any_attributes = ap_store; }

    // The three drivers: attributes, then the content. a_prog_file and
    // a_prog_line say where in the reading code the element is read; they
    // go into every error report of the element.
    elmx_error unmarshal_empty_content(const char *ap_prog_file, int a_prog_line);
    elmx_error unmarshal_simple_content(const char *ap_prog_file, int a_prog_line);
    elmx_error unmarshal_complex_content(const char *ap_prog_file, int a_prog_line);

    const char *get_element_name() const { return m_name.get_str(); }

protected:
    elmx_error unmarshal_attributes();
    elmx_error unmarshal_empty_content_case();
    elmx_error unmarshal_simple_content_case();
    elmx_error unmarshal_complex_content_case();
    // The current event must be the element's end tag; fetches it first if
    // it is not yet the current one.
    elmx_error verify_element_end();
    // Reports against the element, with the helper's location.
    elmx_error p_handle_error(elmx_error a_error);
    elmx_error p_start(const char *ap_prog_file, int a_prog_line);
    bool p_is_own_end_tag() const;
    elmx_error p_skip_unknown_elements();

    c_xml_reader &ar_reader;
    // The element's name, kept for reports when the reader has moved on.
    c_string_stack_node m_name;
    const char *p_prog_file = "<unspecified>";
    int m_prog_line = -1;
    c_any_attribute_store *p_any_attributes = nullptr;
    bool m_body_can_be_empty = false;
};

// ---------------------------------------------------------------- documents

// Reads the document in the named file (UTF-8 or wide path) as T, by
// T::unmarshal(c_xml_reader&). The reader's debug record is copied to
// ap_debug once T has read; a file that cannot be opened gives
// elmx_unable_to_open_file and leaves ap_debug as it was.
template <typename T> elmx_error unmarshal(T &ar_object, const char *ap_file, s_debug_error *ap_debug = nullptr) {
    c_xml_reader_file reader(ap_file);
    if (!reader.is_open())
        return elmx_unable_to_open_file;
    elmx_error error = ar_object.unmarshal(reader);
    if (ap_debug)
        *ap_debug = reader.get_debug_error();
    return error;
}

template <typename T>
elmx_error unmarshal(T &ar_object, const wchar_t *ap_file, s_debug_error *ap_debug = nullptr) {
    c_xml_reader_file reader(ap_file);
    if (!reader.is_open())
        return elmx_unable_to_open_file;
    elmx_error error = ar_object.unmarshal(reader);
    if (ap_debug)
        *ap_debug = reader.get_debug_error();
    return error;
}

// A block of XML in memory, not copied.
template <typename T>
elmx_error unmarshal(T &ar_object, const char *ap_data, std::size_t a_length, s_debug_error *ap_debug = nullptr) {
    c_xml_reader_memory reader(ap_data, a_length);
    elmx_error error = ar_object.unmarshal(reader);
    if (ap_debug)
        *ap_debug = reader.get_debug_error();
    return error;
}

template <typename T>
elmx_error unmarshal(T &ar_object, const std::string &ar_text, s_debug_error *ap_debug = nullptr) {
    return unmarshal(ar_object, ar_text.data(), ar_text.size(), ap_debug);
}

// A captured element, with the namespace declarations it was captured under,
// so that prefixes declared outside it still resolve.
template <typename T>
elmx_error unmarshal(T &ar_object, const c_any_info &ar_any, s_debug_error *ap_debug = nullptr) {
    const std::string &value = ar_any.get_value();
    c_xml_reader_memory reader(value.data(), value.size());
    const c_namespace_context &context = ar_any.get_namespace_context();
    for (std::size_t i = 0; i < context.size(); ++i)
        reader.add_namespace_mapping(context.get_ns_prefix(i), context.get_ns_uri(i));
    elmx_error error = ar_object.unmarshal(reader);
    if (ap_debug)
        *ap_debug = reader.get_debug_error();
    return error;
}

// ---------------------------------------------------------------- looking ahead

// The namespace URI of the document's root element; false, with ap_ns
// untouched, if there is no root element or its prefix is undeclared. The
// reader is rewound afterwards.
bool get_instance_namespace(c_xml_reader &ar_reader, std::string *ap_ns);

enum elmx_must_understand { mu_no = 0, mu_unknown = 1, mu_yes = 2 };
typedef elmx_must_understand (*t_must_understand_test)(const std::string &ar_value);

// Looks through the whole document for attributes of namespace URI ar_ns and
// local name ar_name, and passes each value to a_test: the first answer other
// than mu_no is the result. mu_unknown when the document cannot be read to
// its end. Where the reader stands afterwards is not defined.
elmx_must_understand has_must_understand(c_xml_reader &ar_reader, const std::string &ar_ns,
                                         const std::string &ar_name, t_must_understand_test a_test);
// "1" and "true" mu_yes, "0" and "false" mu_no, anything else mu_unknown.
elmx_must_understand bool_must_understand(const std::string &ar_value);

// ---------------------------------------------------------------- typed values

namespace detail {

// Validates one text and stores it as the next value of ar_item.
template <typename Item, typename T>
elmx_error unmarshal_one_value(c_xml_reader &ar_reader, Item &ar_item, const ct_typed_validation_spec<T> &ar_spec,
                               const std::string &ar_text) {
    if (elmx_error error = ar_spec.is_lexical_valid(ar_reader, ar_text))
        return error;
    ar_item.mk_new_space();
    T &value = ar_item.get_new_space_value_ref();
    ar_spec.v_to_o(value, ar_text);
    return ar_spec.is_value_valid(ar_reader, value);
}

// The number of whitespace-separated items of a list text.
inline std::size_t count_list_items(const std::string &ar_text) {
    std::size_t count = 0;
    bool in_item = false;
    for (char c : ar_text) {
        const bool is_space = c == ' ' || c == '\t' || c == '\n' || c == '\r';
        count += !is_space && !in_item;
        in_item = !is_space;
    }
    return count;
}

template <typename Item, typename T>
elmx_error unmarshal_list_values(c_xml_reader &ar_reader, Item &ar_item, const ct_typed_validation_spec<T> &ar_spec,
                                 const std::string &ar_text) {
    ar_item.start_new_list();
    ar_item.reserve(count_list_items(ar_text));
    c_xml_list_tokeniser tokens(ar_text);
    std::string token;
    while (tokens.get(&token))
        if (elmx_error error = unmarshal_one_value(ar_reader, ar_item, ar_spec, token))
            return error;
    return elmx_ok;
}

// A default is taken as it is, without validation.
template <typename Item, typename T>
void unmarshal_default_list(Item &ar_item, const ct_typed_validation_spec<T> &ar_spec) {
    ar_item.start_new_list();
    c_xml_list_tokeniser tokens(ar_spec.get_default());
    std::string token;
    while (tokens.get(&token)) {
        ar_item.mk_new_space();
        ar_spec.v_to_o(ar_item.get_new_space_value_ref(), token);
    }
}

// Reads the element's text up to its end tag; elmx_ok with ap_value set, or
// the handler's verdict.
inline elmx_error unmarshal_element_text(c_xml_reader &ar_reader, elmx_whitespace a_ws_mode,
                                         std::string *ap_value) {
    if (!ar_reader.get_element_value(ap_value, a_ws_mode))
        if (elmx_error error = ar_reader.handle_error(elmx_unable_to_read_element))
            return error;
    bool is_end = ar_reader.is_element_end_tag();
    ar_reader.restore_event(xe_end_tag);
    if (!is_end)
        return ar_reader.handle_error(elmx_bad_end_of_element);
    return elmx_ok;
}

// Finishes the start tag of a child element read as a plain value.
inline elmx_error unmarshal_child_start_tag(c_xml_reader &ar_reader) {
    bool is_empty;
    if (!ar_reader.skip_start_tag(&is_empty))
        return ar_reader.handle_error(elmx_bad_start_tag_end);
    return elmx_ok;
}

// After a child: the next element event, tokenised with ac_event_map.
inline elmx_error unmarshal_next_child(c_xml_reader &ar_reader, const s_event_map *ac_event_map) {
    if (!ac_event_map)
        return elmx_ok;
    elmx_error error;
    ar_reader.get_element_event(ac_event_map, &error, &ar_reader.get_name_buffer());
    if (error)
        return ar_reader.handle_error(error);
    return elmx_ok;
}

// One value, or with IsList a list of values, from a text or from the
// spec's default.
template <bool IsList, typename Item, typename T>
elmx_error unmarshal_text_values(c_xml_reader &ar_reader, Item &ar_item, const ct_typed_validation_spec<T> &ar_spec,
                                 const std::string &ar_text) {
    if constexpr (IsList)
        return unmarshal_list_values(ar_reader, ar_item, ar_spec, ar_text);
    return unmarshal_one_value(ar_reader, ar_item, ar_spec, ar_text);
}

template <bool IsList, typename Item, typename T>
void unmarshal_default_values(Item &ar_item, const ct_typed_validation_spec<T> &ar_spec) {
    if constexpr (IsList) {
        unmarshal_default_list(ar_item, ar_spec);
    } else {
        ar_item.mk_new_space();
        ar_spec.v_to_o(ar_item.get_new_space_value_ref(), ar_spec.get_default());
    }
}

// The current attribute's text, read into ar_buffer, as the item's values.
template <bool IsList, typename Item, typename T>
elmx_error unmarshal_attribute(c_xml_reader &ar_reader, Item &ar_item, const ct_typed_validation_spec<T> &ar_spec,
                               std::string &ar_buffer) {
    if (ar_item.is_value_set())
        if (elmx_error error = ar_reader.handle_attribute_error(elmx_attribute_already_read))
            return error;
    if (!ar_reader.get_attribute_value(&ar_buffer, ar_spec.get_whitespace_handling()))
        return ar_reader.handle_attribute_error(elmx_unable_to_read_attribute);
    return unmarshal_text_values<IsList>(ar_reader, ar_item, ar_spec, ar_buffer);
}

// The current element's text, read into ar_buffer, as the item's values; an
// empty text takes the spec's default, if it has one.
template <bool IsList, typename Item, typename T>
elmx_error unmarshal_element(c_xml_reader &ar_reader, Item &ar_item, const ct_typed_validation_spec<T> &ar_spec,
                             std::string &ar_buffer) {
    if (elmx_error error = unmarshal_element_text(ar_reader, ar_spec.get_whitespace_handling(), &ar_buffer))
        return error;
    if (ar_buffer.empty() && !ar_spec.get_default().empty()) {
        unmarshal_default_values<IsList>(ar_item, ar_spec);
        return elmx_ok;
    }
    return unmarshal_text_values<IsList>(ar_reader, ar_item, ar_spec, ar_buffer);
}

// A whole child element read as the item's values, then the next event.
template <bool IsList, typename Item, typename T>
elmx_error unmarshal_child(c_xml_reader &ar_reader, Item &ar_item, const ct_typed_validation_spec<T> &ar_spec,
                           const s_event_map *ac_event_map) {
    if (elmx_error error = unmarshal_child_start_tag(ar_reader))
        return error;
    if (elmx_error error = unmarshal_element<IsList>(ar_reader, ar_item, ar_spec, ar_reader.get_value_buffer()))
        return error;
    return unmarshal_next_child(ar_reader, ac_event_map);
}

} // namespace detail

template <typename Item, typename T>
elmx_error c_xml_reader::unmarshal_attribute_value(Item &ar_item, const ct_typed_validation_spec<T> &ar_spec) {
    return detail::unmarshal_attribute<false>(*this, ar_item, ar_spec, m_value);
}

template <typename Item, typename T>
elmx_error c_xml_reader::unmarshal_attribute_list_value(Item &ar_item, const ct_typed_validation_spec<T> &ar_spec) {
    return detail::unmarshal_attribute<true>(*this, ar_item, ar_spec, m_value);
}

template <typename Item, typename T>
elmx_error c_xml_reader::unmarshal_element_value(Item &ar_item, const ct_typed_validation_spec<T> &ar_spec) {
    return detail::unmarshal_element<false>(*this, ar_item, ar_spec, m_value);
}

template <typename Item, typename T>
elmx_error c_xml_reader::unmarshal_element_list_value(Item &ar_item, const ct_typed_validation_spec<T> &ar_spec) {
    return detail::unmarshal_element<true>(*this, ar_item, ar_spec, m_value);
}

template <typename Item, typename T>
elmx_error c_xml_reader::unmarshal_child_element(Item &ar_item, const ct_typed_validation_spec<T> &ar_spec,
                                                 const s_event_map *ac_event_map) {
    return detail::unmarshal_child<false>(*this, ar_item, ar_spec, ac_event_map);
}

template <typename Item, typename T>
elmx_error c_xml_reader::unmarshal_child_element_list(Item &ar_item, const ct_typed_validation_spec<T> &ar_spec,
                                                      const s_event_map *ac_event_map) {
    return detail::unmarshal_child<true>(*this, ar_item, ar_spec, ac_event_map);
}

template <typename Item>
elmx_error c_xml_reader::unmarshal_any_child_element(Item &ar_item, const s_event_map *ac_event_map) {
    // Markup and references stay as they were written, so that the text can
    // be read again as a document of its own.
    if (!get_any_element(m_name, &m_value, ws_preserve, false))
        if (elmx_error error = handle_error(elmx_unable_to_read_element))
            return error;
    ar_item.mk_new_space();
    c_any_info &info = ar_item.get_new_space_value_ref();
    std::string ns;
    get_namespace(m_name, &ns);
    info.set_namespace(ns);
    info.set_name(m_name);
    info.set_value(m_value);
    c_namespace_context context;
    extract_namespace_context(&context);
    info.set_namespace_context(context);
    m_current_event = xe_end_tag;
    return detail::unmarshal_next_child(*this, ac_event_map);
}

} // namespace lmx

#endif
