// The pull reader that bound classes read from.
//
// c_xml_reader adds to the scanner: namespace scopes that follow the call
// frames of the reading code, resolution of tag names to a namespace id and a
// local name, tokenising of names against the tables a binding generates, the
// current event, the stack of open element names, and error capture.
#ifndef LMX_LMXREADER_H
#define LMX_LMXREADER_H

#include <string>
#include <vector>

#include "lmxscanner.h"

namespace lmx {

// A row of a binding's name table; a table ends with a row whose name is null.
struct s_event_map {
    int ns_id;
    const char *p_name;
    unsigned name_length;
    int event;
};

// A row of a table of elements to keep; ends like s_event_map.
struct s_known_elements {
    int ns_id;
    const char *p_name;
    unsigned name_length;
};

// A binding's namespace: the id it uses, a preferred prefix and the URI.
// A table ends with a row whose URI is null.
struct s_ns_map {
    int id;
    const char *p_prefix;
    const char *p_uri;
};

struct s_user_ns_prefix_map {
    std::string prefix;
    std::string uri;
};

enum elxp_attr_elem { ea_attribute = 0, ea_element = 1 };

// A foreign element or attribute kept as text, with the namespace
// declarations needed to read it again.
class c_any_info {
public:
    c_any_info() = default;
    c_any_info(const std::string &ar_namespace, const std::string &ar_name, const std::string &ar_value)
        : m_namespace(ar_namespace), m_name(ar_name), m_value(ar_value) {}

    const std::string &get_namespace() const { return m_namespace; }
    const std::string &get_name() const { return m_name; }
    const std::string &get_value() const { return m_value; }
    const c_namespace_context &get_namespace_context() const { return m_namespace_context; }
    void set_namespace(const std::string &ar_namespace) { m_namespace = ar_namespace; }
    void set_name(const std::string &ar_name) { m_name = ar_name; }
    void set_value(const std::string &ar_value) { m_value = ar_value; }
    void set_namespace_context(const c_namespace_context &ar_context) { m_namespace_context = ar_context; }
    bool operator==(const c_any_info &ar_other) const {
        return m_namespace == ar_other.m_namespace && m_name == ar_other.m_name && m_value == ar_other.m_value &&
               m_namespace_context == ar_other.m_namespace_context;
    }

private:
    std::string m_namespace;
    std::string m_name;
    std::string m_value;
    c_namespace_context m_namespace_context;
};

// Names of the open elements.
class c_string_stack {
public:
    void push(const std::string &ar_name) {
        m_starts.push_back(m_bytes.size());
        m_bytes.insert(m_bytes.end(), ar_name.begin(), ar_name.end());
        m_bytes.push_back('\0');
    }
    void pop() {
        if (m_starts.empty())
            return;
        m_bytes.resize(m_starts.back());
        m_starts.pop_back();
    }
    std::size_t size() const { return m_starts.size(); }
    bool empty() const { return m_starts.empty(); }
    const char *get(std::size_t a_index) const { return &m_bytes[m_starts[a_index]]; }
    std::size_t get_length(std::size_t a_index) const {
        std::size_t end = a_index + 1 < m_starts.size() ? m_starts[a_index + 1] : m_bytes.size();
        return end - m_starts[a_index] - 1;
    }

private:
    std::vector<char> m_bytes;
    std::vector<std::size_t> m_starts;
};

// Pushes a name for its lifetime.
class c_string_stack_node {
public:
    c_string_stack_node(c_string_stack &ar_stack, const std::string &ar_name)
        : ar_stack(ar_stack), m_index(ar_stack.size()) {
        ar_stack.push(ar_name);
    }
    c_string_stack_node(const c_string_stack_node &) = delete;
    c_string_stack_node &operator=(const c_string_stack_node &) = delete;
    ~c_string_stack_node() { ar_stack.pop(); }

    const char *get_str() const { return ar_stack.get(m_index); }
    bool operator==(const std::string &ar_s) const {
        return ar_stack.get_length(m_index) == ar_s.size() && ar_s.compare(0, ar_s.size(), get_str(), ar_s.size()) == 0;
    }
    bool operator!=(const std::string &ar_s) const { return !(*this == ar_s); }

private:
    c_string_stack &ar_stack;
    std::size_t m_index;
};

class c_xml_reader;
template <typename T> class ct_typed_validation_spec;

// Holds the reader's error record so that it is built before the scanner
// layers that report to it.
struct c_error_holder {
    c_error m_error;
};

// A namespace scope that lives for one call frame of the reading code.
class c_xml_reader_local : public c_xml_local {
public:
    // Makes a new scope inside the reader's current one, and current.
    explicit c_xml_reader_local(c_xml_reader &ar_reader);
    ~c_xml_reader_local() override;

private:
    friend class c_xml_reader;
    struct root_tag {};
    // The reader's outermost scope.
    c_xml_reader_local(c_xml_reader &ar_reader, root_tag);

    c_xml_reader &ar_reader;
    c_xml_reader_local *p_previous;
    bool m_is_root = false;
};

class c_xml_reader : private c_error_holder, public c_xml {
public:
    // Where in the reading code the reader stands, for error reports.
    struct s_code_location {
        const char *p_prog_file = "<unspecified>";
        int prog_line = -1;
    };

    explicit c_xml_reader(c_read &ar_reader);
    ~c_xml_reader() override = default;

    // Errors.
    virtual elmx_error user_handle_error(elmx_error a_error, const std::string &ar_item_name,
                                         const char *ap_prog_file, int a_prog_line);
    virtual elmx_error user_handle_error(elmx_error a_error);
    virtual void get_error_message(std::string *ap_message) const;
    std::string get_error_message() const {
        std::string message;
        get_error_message(&message);
        return message;
    }
    elmx_error get_error() const { return m_error.get_last_error(); }
    const s_debug_error &get_debug_error() const { return m_debug_error; }
    c_error &get_error_record() { return m_error; }
    elmx_error capture_error(elmx_error a_error, const std::string &ar_item_name, const char *ap_prog_file,
                             int a_prog_line);
    elmx_error handle_error(elmx_error a_error);
    elmx_error handle_error(elmx_error a_error, int a_prog_line);
    elmx_error handle_error(elmx_error a_error, const std::string &ar_item_name, const char *ap_prog_file,
                            int a_prog_line);
    elmx_error handle_attribute_error(elmx_error a_error);
    void set_code_file(const char *ap_prog_file) { m_code_location.p_prog_file = ap_prog_file; }
    void set_code_line(int a_prog_line) { m_code_location.prog_line = a_prog_line; }
    const s_code_location &get_code_location() const { return m_code_location; }

    // Namespaces.
    void set_ns_map(const s_ns_map *ap_ns_map);
    void add_namespace_mapping(const std::string &ar_ns_prefix, const std::string &ar_namespace);
    void get_namespace(const std::string &ar_name, std::string *ap_namespace_out) const;
    void get_namespace_prefix(const std::string &ar_name, std::string *ap_namespace_prefix_out) const {
        c_xml::get_namespace_prefix(ar_name, ap_namespace_prefix_out);
    }
    int get_element_ns_id() const { return m_cracked_name.get_element_ns_id(); }
    const std::string &get_local_name() const { return m_cracked_name.get_local_name(); }
    const c_cracked_name &get_cracked_name() const { return m_cracked_name; }
    bool is_xsi_attribute() const;
    bool is_valid_qname(const std::string &ar_value) const;
    void extract_namespace_context(c_namespace_context *ap_namespace_context) const {
        p_current_scope->extract_namespace_context(ap_namespace_context, this);
    }

    // Events.
    int get_element_event(elmx_error *ap_error, std::string *ap_name);
    int get_element_event(elmx_error *ap_error) { return get_element_event(ap_error, &m_name); }
    int get_element_event(const s_event_map *ac_event_map, elmx_error *ap_error) {
        return get_element_event(ac_event_map, ap_error, &m_name);
    }
    int get_element_event(const s_event_map *ac_event_map, std::string *ap_name) {
        elmx_error ignored;
        return get_element_event(ac_event_map, &ignored, ap_name);
    }
    int get_element_event(const s_event_map *ac_event_map, elmx_error *ap_error, std::string *ap_name);
    int get_known_element_event(const s_event_map *ac_event_map, elmx_error *ap_error, std::string *ap_name) {
        return get_element_event(ac_event_map, ap_error, ap_name);
    }
    bool get_attribute_event(const s_event_map *ac_event_map, elmx_error *ap_error, std::string *ap_name);
    int get_attribute_event(const s_event_map *ac_event_map, std::string *ap_name);
    void tokenise(const s_event_map *ac_event_map, elxp_attr_elem a_type);
    void tokenise(const s_event_map *ac_event_map, const std::string &ar_name, elxp_attr_elem a_type);
    int get_current_event() const { return m_current_event; }
    void restore_event(int a_event) { m_current_event = a_event; }
    bool is_current_event_tokenisable() const {
        return m_current_event == xe_name || m_current_event == xe_unknown || m_current_event >= xe_first_user_token;
    }
    bool skip_start_tag(bool *ap_is_end_of_element);
    bool is_element_end_tag();
    elmx_error ignore_element(const s_event_map *ac_event_map);
    bool get_end_tag(const s_event_map *ac_event_map, const std::string &ar_name, int *ap_event,
                     elmx_error *ap_error);

    // Values.
    bool get_element_value(std::string *ap_value, elmx_whitespace a_ws_mode);
    bool get_nested_element_value(std::string *ap_value, std::string *ap_end_tag_name, elmx_whitespace a_ws_mode,
                                  bool a_expand_entities);
    bool get_simple_type_value(const std::string &ar_name, elmx_whitespace a_ws_mode, std::string *ap_value,
                               elmx_error *ap_error, bool *ap_is_empty_element);
    bool get_element_ur_value(const std::string &ar_name, std::string *ap_value, elmx_error *ap_error,
                              bool *ap_is_empty_element);

    // State.
    int get_line_no() const { return get_line_num(); }
    c_xml_reader_local *get_reader_local() const { return p_current_scope; }
    void set_reader_local(c_xml_reader_local *ap_reader_local) { p_current_scope = ap_reader_local; }
    c_string_stack &get_element_name_stack() { return m_element_name_stack; }
    void set_known_elements(const s_known_elements *ap_known_elements) { p_known_elements = ap_known_elements; }
    const s_known_elements *get_known_elements() const { return p_known_elements; }
    bool is_auto_versioning() const { return m_auto_versioning; }
    void set_auto_versioning(bool a_auto_versioning) { m_auto_versioning = a_auto_versioning; }
    const std::string &get_name() const { return m_name; }
    std::string &get_name_buffer() { return m_name; }
    void set_name(const std::string &ar_name) { m_name = ar_name; }
    std::string &get_value_buffer() { return m_value; }

    // Typed values into the member containers of bound classes; defined in
    // lmxunmarshal.h. An Item is a ct_simple_* container of T.
    template <typename Item, typename T>
    elmx_error unmarshal_attribute_value(Item &ar_item, const ct_typed_validation_spec<T> &ar_spec);
    template <typename Item, typename T>
    elmx_error unmarshal_attribute_list_value(Item &ar_item, const ct_typed_validation_spec<T> &ar_spec);
    template <typename Item, typename T>
    elmx_error unmarshal_element_value(Item &ar_item, const ct_typed_validation_spec<T> &ar_spec);
    template <typename Item, typename T>
    elmx_error unmarshal_element_list_value(Item &ar_item, const ct_typed_validation_spec<T> &ar_spec);
    template <typename Item, typename T>
    elmx_error unmarshal_child_element(Item &ar_item, const ct_typed_validation_spec<T> &ar_spec,
                                       const s_event_map *ac_event_map);
    template <typename Item, typename T>
    elmx_error unmarshal_child_element_list(Item &ar_item, const ct_typed_validation_spec<T> &ar_spec,
                                            const s_event_map *ac_event_map);
    // The whole current element as text into a container of c_any_info.
    template <typename Item> elmx_error unmarshal_any_child_element(Item &ar_item, const s_event_map *ac_event_map);

private:
    void p_crack(const std::string &ar_name, elxp_attr_elem a_type);
    bool p_finish_start_tag(bool *ap_is_empty_element);
    bool p_stops(elmx_error a_error, const std::string &ar_name, elmx_error *ap_error);
    bool p_is_known_element() const;

    c_xml_reader_local *p_current_scope = nullptr;
    c_xml_reader_local m_root_scope;
    s_debug_error m_debug_error;
    c_string_stack m_element_name_stack;
    c_cracked_name m_cracked_name;
    int m_current_event = xe_end_of_input;
    std::vector<s_user_ns_prefix_map> m_user_ns_prefix_map;
    const s_known_elements *p_known_elements = nullptr;
    bool m_auto_versioning = false;
    s_code_location m_code_location;
    std::string m_name;
    std::string m_value;
    std::string m_end_tag_name;
};

// Swaps in a table of elements to keep for its lifetime.
class c_known_elements_selector {
public:
    c_known_elements_selector(c_xml_reader &ar_reader, const s_known_elements *ap_table)
        : ar_reader(ar_reader), p_old(ar_reader.get_known_elements()) {
        ar_reader.set_known_elements(ap_table);
    }
    ~c_known_elements_selector() { ar_reader.set_known_elements(p_old); }

private:
    c_xml_reader &ar_reader;
    const s_known_elements *p_old;
};

// Holds a byte source so that it is built before the reader that reads it.
template <typename Source> struct c_source_holder {
    template <typename... Args> explicit c_source_holder(Args &&...args) : m_source(args...) {}
    Source m_source;
};

// A reader over a file, by UTF-8 or wide (UTF-16) path.
class c_xml_reader_file : private c_source_holder<c_read_file>, public c_xml_reader {
public:
    explicit c_xml_reader_file(const char *ap_file)
        : c_source_holder<c_read_file>(ap_file), c_xml_reader(m_source) {}
    explicit c_xml_reader_file(const wchar_t *ap_file)
        : c_source_holder<c_read_file>(ap_file), c_xml_reader(m_source) {}
    bool is_open() const { return m_source.is_open(); }
};

// A reader over a caller's memory block, which it does not copy.
class c_xml_reader_memory : private c_source_holder<c_read_memory>, public c_xml_reader {
public:
    c_xml_reader_memory(const char *ap_data, std::size_t a_length)
        : c_source_holder<c_read_memory>(ap_data, a_length), c_xml_reader(m_source) {}
    explicit c_xml_reader_memory(const std::string &ar_data)
        : c_source_holder<c_read_memory>(ar_data.data(), ar_data.size()), c_xml_reader(m_source) {}
};

} // namespace lmx

#endif
