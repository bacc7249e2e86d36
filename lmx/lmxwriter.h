// The XML writer that bound classes write themselves through.
//
// c_xml_writer writes UTF-8 to a narrow output stream as the generated classes
// walk themselves: it keeps the indentation, chooses between "/>" and an end
// tag, and declares the namespaces once, on the first element that asks.
// c_xml_writer_local is one open element; the generated code keeps one on the
// stack for each element it writes.
//
// Layout, with the default strings (a tab shown as four blanks):
//
//     <?xml version="1.0" encoding="UTF-8"?>
//     <p:r xmlns:p="urn:example"
//             xmlns:xsi="http://www.w3.org/2001/XMLSchema-instance"
//             a="1">
//         <p:e x="1"
//                 y="2"/>
//         <p:v>text</p:v>
//     </p:r>
//
// The first attribute stands on the tag's line, each further one on a line
// of its own two tabs deeper than the tag; a simple value stands between its
// tags on one line; an element with no content ends "/>". The namespace
// declarations come before the element's own attributes.
#ifndef LMX_LMXWRITER_H
#define LMX_LMXWRITER_H

#include <cstddef>
#include <cstdint>
#include <memory>
#include <ostream>
#include <string>
#include <vector>

#include "lmxerror.h"
#include "lmxreader.h"
#include "lmxtypes.h"
#include "lmxwritebuffer.h"

namespace lmx {

class c_xml_writer;

// One open element of a writer. Making one makes it the writer's current
// element; destroying it makes the parent current again.
class c_xml_writer_local {
public:
    explicit c_xml_writer_local(c_xml_writer &ar_writer);
    c_xml_writer_local(const c_xml_writer_local &) = delete;
    c_xml_writer_local &operator=(const c_xml_writer_local &) = delete;
    ~c_xml_writer_local();

    c_xml_writer_local *get_parent() const { return p_parent; }
    bool has_attributes() const { return m_has_attributes; }
    bool has_body() const { return m_has_body; }
    bool has_children() const { return m_has_children; }
    void set_has_attributes() { m_has_attributes = true; }
    void set_has_body() { m_has_body = true; }
    void set_has_children() { m_has_children = true; }
    // The start tag of the parent is closed: it has content, and that
    // content is elements.
    void set_parent_has_body() {
        if (p_parent) {
            p_parent->m_has_body = true;
            p_parent->m_has_children = true;
        }
    }

private:
    friend class c_xml_writer;
    struct root_tag {};
    // The writer's outermost level, which stands for the document itself: it
    // counts as having a body already, so the first element closes nothing.
    c_xml_writer_local(c_xml_writer &ar_writer, root_tag);

    c_xml_writer &ar_writer;
    c_xml_writer_local *p_parent;
    bool m_has_attributes = false;
    bool m_has_body = false;
    bool m_has_children = false;
    bool m_is_root = false;
};

// A pair of the xsi:schemaLocation attribute.
struct s_schema_location_item {
    std::string uri;
    std::string location;
};

class c_xml_writer {
public:
    // Options of the second constructor.
    enum {
        include_xml_decl = 1,           // the prolog
        include_standalone_xml_decl = 2 // the prolog with standalone="yes"
    };

    // A null string takes the process-wide default; a null attribute string
    // takes the element string given, if one was, before its own default.
    // Writes no prolog.
    explicit c_xml_writer(std::ostream &ar_os, const char *ap_tab = nullptr, const char *ap_nl = nullptr,
                          const char *ap_attribute_tab = nullptr, const char *ap_attribute_nl = nullptr);
    // The same, and writes the prolog if a_options has bit 0 or bit 1 set.
    c_xml_writer(std::ostream &ar_os, int a_options, const char *ap_tab = nullptr, const char *ap_nl = nullptr,
                 const char *ap_attribute_tab = nullptr, const char *ap_attribute_nl = nullptr);
    c_xml_writer(const c_xml_writer &) = delete;
    c_xml_writer &operator=(const c_xml_writer &) = delete;
    virtual ~c_xml_writer();

    // Errors. A writer's capture has no XML line.
    virtual elmx_error user_handle_error(elmx_error a_error, const std::string &ar_item_name,
                                         const char *ap_prog_file, int a_prog_line);
    virtual elmx_error user_handle_error(elmx_error a_error);
    virtual void get_error_message(std::string *ap_message) const;
    std::string get_error_message() const {
        std::string message;
        get_error_message(&message);
        return message;
    }
    elmx_error capture_error(elmx_error a_error, const std::string &ar_item_name, const char *ap_prog_file,
                             int a_prog_line);
    elmx_error handle_error(elmx_error a_error, const std::string &ar_item_name, const char *ap_prog_file,
                            int a_prog_line);
    const s_debug_error &get_debug_error() const { return m_debug_error; }
    c_error &get_error_record() { return m_error; }
    // Where in the writing code the writer stands, for the reports of values
    // refused by their validation spec.
    void set_code_file(const char *ap_prog_file) { p_code_file = ap_prog_file; }
    void set_code_line(int a_prog_line) { m_code_line = a_prog_line; }

    // Process-wide default strings. Changing the tab or the newline changes
    // the attribute string of the same kind too, as long as both attribute
    // strings still equal their element strings.
    static void set_default_tab(const char *ap_tab);
    static const char *get_default_tab();
    static void set_default_nl(const char *ap_nl);
    static const char *get_default_nl();
    static void set_default_attribute_tab(const char *ap_tab);
    static const char *get_default_attribute_tab();
    static void set_default_attribute_nl(const char *ap_nl);
    static const char *get_default_attribute_nl();

    // Namespaces and schema locations, declared on the first element.
    void add_namespace(const std::string &ar_ns_prefix, const std::string &ar_namespace);
    void add_schema_location(const std::string &ar_ns_uri, const std::string &ar_location);
    void conditionally_select_ns_map(const s_ns_map *ap_ns_map) {
        if (!p_ns_map)
            p_ns_map = ap_ns_map;
    }
    void conditionally_write_ns_attrs(bool a_needs_xsi);
    // The prefix of a URI in the selected table, else in the added ones; null
    // if neither has it.
    const char *get_namespace_prefix(const std::string &ar_namespace) const;

    // Structure.
    void start_element(const char *ac_name);
    void end_element(const char *ac_name);
    virtual void position_attribute();
    void prepare_for_simple_body_data();
    void indent() { ++m_indent; }
    void undent() {
        if (m_indent > 0)
            --m_indent;
    }
    c_xml_writer_local *get_xml_writer_local() const { return p_current; }
    void set_xml_writer_local(c_xml_writer_local *ap_local) { p_current = ap_local; }

    // Output. The writer collects its output in a block of its own and hands
    // it to the caller's stream when the block is full, when an outermost
    // element ends, after the prolog, and when the writer dies; drain_output
    // hands it over at once. Text written to the caller's stream directly
    // while the writer lives would come out of order: write through
    // get_stream(), which the value types write to as well.
    std::ostream &get_stream() { return m_os; }
    void drain_output() { m_buffer.drain(); }

    // Constant forms: "xsi:nil" with "true" and the like. The text is escaped.
    void marshal_attribute(const char *ac_name, const char *ac_text);
    void marshal_element(const char *ac_name, const char *ac_text);

    // Wildcards. A stored attribute's value is escaped; captured elements are
    // written as they were captured, one to a line.
    template <typename Store> void marshal_any_attribute(const Store &ar_store);
    template <typename Item> void marshal_any_element(const Item &ar_item);
    virtual void write_any_info(const c_any_info &ar_info);

    // Typed values. An Item is a member container of a bound class: it has
    // is_value_set(), count() and access_value(i); for the list forms
    // count() is the number of values in the one list it holds. A set value
    // is first checked by the spec's value validator; a refusal goes through
    // handle_error with the attribute's or element's name, and a verdict other
    // than elmx_ok is returned with nothing written for that value.
    template <typename Item, typename T>
    elmx_error marshal_attribute(const char *ac_name, const Item &ar_item, const ct_typed_validation_spec<T> &ar_spec);
    template <typename Item, typename T>
    elmx_error marshal_attribute_or_default(const char *ac_name, const Item &ar_item,
                                            const ct_typed_validation_spec<T> &ar_spec);
    template <typename Item, typename T>
    elmx_error marshal_attribute_list(const char *ac_name, const Item &ar_item,
                                      const ct_typed_validation_spec<T> &ar_spec);
    template <typename Item, typename T>
    elmx_error marshal_attribute_list_or_default(const char *ac_name, const Item &ar_item,
                                                 const ct_typed_validation_spec<T> &ar_spec);
    template <typename Item, typename T>
    elmx_error marshal_element(const char *ac_name, const Item &ar_item, const ct_typed_validation_spec<T> &ar_spec,
                               const s_ns_map *ap_ns_map);
    template <typename Item, typename T>
    elmx_error marshal_element_or_default(const char *ac_name, const Item &ar_item,
                                          const ct_typed_validation_spec<T> &ar_spec, const s_ns_map *ap_ns_map);
    template <typename Item, typename T>
    elmx_error marshal_element_list(const char *ac_name, const Item &ar_item,
                                    const ct_typed_validation_spec<T> &ar_spec, const s_ns_map *ap_ns_map);
    template <typename Item, typename T>
    elmx_error marshal_element_list_or_default(const char *ac_name, const Item &ar_item,
                                               const ct_typed_validation_spec<T> &ar_spec,
                                               const s_ns_map *ap_ns_map);
    // The body of a simple-content class; the name is the item name of a
    // refusal.
    template <typename Item, typename T>
    elmx_error marshal_element_body(const char *ac_name, const Item &ar_item,
                                    const ct_typed_validation_spec<T> &ar_spec);
    template <typename Item, typename T>
    elmx_error marshal_element_body_list(const char *ac_name, const Item &ar_item,
                                         const ct_typed_validation_spec<T> &ar_spec);
    // One value through its spec's o_to_v, with no markup.
    template <typename T> void output_value(const T &ar_value, const ct_typed_validation_spec<T> &ar_spec) {
        ar_spec.o_to_v(m_os, ar_value);
    }
    // True for a value whose text is empty: an empty string or binary.
    template <typename T> static bool is_value_empty(const T &) { return false; }
    static bool is_value_empty(const std::string &ar_value) { return ar_value.empty(); }
    static bool is_value_empty(const std::wstring &ar_value) { return ar_value.empty(); }
    static bool is_value_empty(const c_binary &ar_value) { return ar_value.empty(); }

private:
    friend class c_xml_writer_local;

    void p_init(int a_options, const char *ap_tab, const char *ap_nl, const char *ap_attribute_tab,
                const char *ap_attribute_nl);
    // The layout is all plain bytes, straight into the block.
    void p_write(const char *ap_data, std::size_t a_length) { m_buffer.put(ap_data, a_length); }
    void p_write(const std::string &ar_text) { m_buffer.put(ar_text.data(), ar_text.size()); }
    void p_write(char a_c) { m_buffer.put(a_c); }
    void p_write(const char *ap_text);
    void p_write_tabs(int a_count);
    void p_write_escaped(const std::string &ar_text);
    // Declares the prefix of a kept attribute of another namespace, unless
    // the writer's own tables give that prefix to that namespace.
    void p_declare_attribute_namespace(const c_any_info &ar_info);
    void p_open_attribute(const char *ac_name);
    void p_close_attribute() { p_write('"'); }
    template <typename T>
    elmx_error p_check_value(const char *ac_name, const T &ar_value, const ct_typed_validation_spec<T> &ar_spec);
    template <typename Item, typename T>
    elmx_error p_check_values(const char *ac_name, const Item &ar_item, const ct_typed_validation_spec<T> &ar_spec);
    template <typename Item, typename T>
    void p_write_list(const Item &ar_item, const ct_typed_validation_spec<T> &ar_spec);
    // The value of an item, or with a_is_list its one list of values: the
    // check of a set item, and its text with no markup.
    template <typename Item, typename T>
    elmx_error p_check_item(const char *ac_name, const Item &ar_item, const ct_typed_validation_spec<T> &ar_spec,
                            bool a_is_list);
    template <typename Item, typename T>
    void p_write_item(const Item &ar_item, const ct_typed_validation_spec<T> &ar_spec, bool a_is_list);
    // Nothing for an unset item; else the check, then a_frame(write) where
    // write() puts out the item's text inside the markup a_frame gives it.
    template <typename Item, typename T, typename Frame>
    elmx_error p_marshal_item(const char *ac_name, const Item &ar_item, const ct_typed_validation_spec<T> &ar_spec,
                              bool a_is_list, Frame a_frame);
    // The frames: an attribute, a simple element in a scope of its own, and
    // the body of the current element.
    template <typename Write> void p_write_attribute(const char *ac_name, Write a_write);
    template <typename Write> void p_write_simple_element(const char *ac_name, const s_ns_map *ap_ns_map, Write a_write);
    template <typename Write> void p_write_body(Write a_write) {
        prepare_for_simple_body_data();
        a_write();
    }
    // A simple element holding the spec's default text.
    template <typename T>
    void p_write_default_element(const char *ac_name, const ct_typed_validation_spec<T> &ar_spec,
                                 const s_ns_map *ap_ns_map);
    void p_start_simple_element(const char *ac_name, const s_ns_map *ap_ns_map);
    static const c_any_info &p_any(const c_any_info &ar_info) { return ar_info; }
    static const c_any_info &p_any(const c_any_info *ap_info) { return *ap_info; }
    c_xml_reader &p_get_validation_reader() {
        if (!p_validation_reader)
            p_make_validation_reader();
        return *p_validation_reader;
    }
    void p_make_validation_reader();

    std::ostream &ar_os;
    c_write_buffer m_buffer; // in front of ar_os's buffer
    std::ostream m_os;       // over m_buffer
    c_xml_writer_local *p_current;
    c_xml_writer_local m_root_local;
    std::int32_t m_indent = 0;
    std::string m_tab;
    std::string m_nl;
    std::string m_attribute_tab;
    std::string m_attribute_nl;
    bool m_ns_attributes_written = false;
    c_error m_error;
    s_debug_error m_debug_error;
    const s_ns_map *p_ns_map = nullptr;
    std::vector<s_user_ns_prefix_map> m_user_ns_prefix_maps;
    std::vector<s_schema_location_item> m_schema_locations;
    // The tab string repeated, grown on demand, so that an indent is one write.
    std::string m_tabs;
    std::string m_attribute_tabs;
    const char *p_code_file = "<unspecified>";
    int m_code_line = -1;
    // Validators report to a reader; the writer keeps a reader over no input
    // for them, made when the first value is checked.
    std::unique_ptr<c_xml_reader_memory> p_validation_reader;
};

// ---------------------------------------------------------------- member containers

// How the writer reads a member container: whether it holds a value, how
// many, and each one. The one seam between the writer and the containers.
template <typename Item> struct ct_marshal_item {
    static bool is_value_set(const Item &ar_item) { return ar_item.is_value_set(); }
    static std::size_t count(const Item &ar_item) { return static_cast<std::size_t>(ar_item.count()); }
    static decltype(auto) value(const Item &ar_item, std::size_t a_index) { return ar_item.access_value(a_index); }
};

// ---------------------------------------------------------------- typed values

template <typename T>
elmx_error c_xml_writer::p_check_value(const char *ac_name, const T &ar_value,
                                       const ct_typed_validation_spec<T> &ar_spec) {
    elmx_error error = ar_spec.is_value_valid(p_get_validation_reader(), ar_value);
    if (error == elmx_ok)
        return elmx_ok;
    return handle_error(error, ac_name, p_code_file, m_code_line);
}

template <typename Item, typename T>
elmx_error c_xml_writer::p_check_values(const char *ac_name, const Item &ar_item,
                                        const ct_typed_validation_spec<T> &ar_spec) {
    using item = ct_marshal_item<Item>;
    std::size_t count = item::count(ar_item);
    for (std::size_t i = 0; i < count; ++i)
        if (elmx_error error = p_check_value<T>(ac_name, item::value(ar_item, i), ar_spec))
            return error;
    return elmx_ok;
}

template <typename Item, typename T>
void c_xml_writer::p_write_list(const Item &ar_item, const ct_typed_validation_spec<T> &ar_spec) {
    using item = ct_marshal_item<Item>;
    std::size_t count = item::count(ar_item);
    for (std::size_t i = 0; i < count; ++i) {
        if (i)
            p_write(' ');
        output_value<T>(item::value(ar_item, i), ar_spec);
    }
}

template <typename Item, typename T>
elmx_error c_xml_writer::p_check_item(const char *ac_name, const Item &ar_item,
                                      const ct_typed_validation_spec<T> &ar_spec, bool a_is_list) {
    if (a_is_list)
        return p_check_values(ac_name, ar_item, ar_spec);
    return p_check_value<T>(ac_name, ct_marshal_item<Item>::value(ar_item, 0), ar_spec);
}

template <typename Item, typename T>
void c_xml_writer::p_write_item(const Item &ar_item, const ct_typed_validation_spec<T> &ar_spec, bool a_is_list) {
    if (a_is_list)
        p_write_list(ar_item, ar_spec);
    else
        output_value<T>(ct_marshal_item<Item>::value(ar_item, 0), ar_spec);
}

template <typename Item, typename T, typename Frame>
elmx_error c_xml_writer::p_marshal_item(const char *ac_name, const Item &ar_item,
                                        const ct_typed_validation_spec<T> &ar_spec, bool a_is_list,
                                        Frame a_frame) {
    if (!ct_marshal_item<Item>::is_value_set(ar_item))
        return elmx_ok;
    if (elmx_error error = p_check_item(ac_name, ar_item, ar_spec, a_is_list))
        return error;
    a_frame([&] { p_write_item(ar_item, ar_spec, a_is_list); });
    return elmx_ok;
}

template <typename Write>
void c_xml_writer::p_write_attribute(const char *ac_name, Write a_write) {
    p_open_attribute(ac_name);
    a_write();
    p_close_attribute();
}

template <typename Write>
void c_xml_writer::p_write_simple_element(const char *ac_name, const s_ns_map *ap_ns_map, Write a_write) {
    c_xml_writer_local local(*this);
    p_start_simple_element(ac_name, ap_ns_map);
    a_write();
    end_element(ac_name);
}

template <typename T>
void c_xml_writer::p_write_default_element(const char *ac_name, const ct_typed_validation_spec<T> &ar_spec,
                                           const s_ns_map *ap_ns_map) {
    p_write_simple_element(ac_name, ap_ns_map, [&] { p_write_escaped(ar_spec.get_default()); });
}

template <typename Item, typename T>
elmx_error c_xml_writer::marshal_attribute(const char *ac_name, const Item &ar_item,
                                           const ct_typed_validation_spec<T> &ar_spec) {
    return p_marshal_item(ac_name, ar_item, ar_spec, false,
                          [&](auto a_write) { p_write_attribute(ac_name, a_write); });
}

template <typename Item, typename T>
elmx_error c_xml_writer::marshal_attribute_or_default(const char *ac_name, const Item &ar_item,
                                                      const ct_typed_validation_spec<T> &ar_spec) {
    if (ct_marshal_item<Item>::is_value_set(ar_item))
        return marshal_attribute(ac_name, ar_item, ar_spec);
    marshal_attribute(ac_name, ar_spec.get_default().c_str());
    return elmx_ok;
}

template <typename Item, typename T>
elmx_error c_xml_writer::marshal_attribute_list(const char *ac_name, const Item &ar_item,
                                                const ct_typed_validation_spec<T> &ar_spec) {
    return p_marshal_item(ac_name, ar_item, ar_spec, true,
                          [&](auto a_write) { p_write_attribute(ac_name, a_write); });
}

template <typename Item, typename T>
elmx_error c_xml_writer::marshal_attribute_list_or_default(const char *ac_name, const Item &ar_item,
                                                           const ct_typed_validation_spec<T> &ar_spec) {
    if (ct_marshal_item<Item>::is_value_set(ar_item))
        return marshal_attribute_list(ac_name, ar_item, ar_spec);
    marshal_attribute(ac_name, ar_spec.get_default().c_str());
    return elmx_ok;
}

template <typename Item, typename T>
elmx_error c_xml_writer::marshal_element(const char *ac_name, const Item &ar_item,
                                         const ct_typed_validation_spec<T> &ar_spec, const s_ns_map *ap_ns_map) {
    using item = ct_marshal_item<Item>;
    std::size_t count = item::count(ar_item);
    for (std::size_t i = 0; i < count; ++i) {
        const T &value = item::value(ar_item, i);
        if (elmx_error error = p_check_value<T>(ac_name, value, ar_spec))
            return error;
        p_write_simple_element(ac_name, ap_ns_map, [&] { output_value<T>(value, ar_spec); });
    }
    return elmx_ok;
}

template <typename Item, typename T>
elmx_error c_xml_writer::marshal_element_or_default(const char *ac_name, const Item &ar_item,
                                                    const ct_typed_validation_spec<T> &ar_spec,
                                                    const s_ns_map *ap_ns_map) {
    if (ct_marshal_item<Item>::is_value_set(ar_item))
        return marshal_element(ac_name, ar_item, ar_spec, ap_ns_map);
    p_write_default_element(ac_name, ar_spec, ap_ns_map);
    return elmx_ok;
}

template <typename Item, typename T>
elmx_error c_xml_writer::marshal_element_list(const char *ac_name, const Item &ar_item,
                                              const ct_typed_validation_spec<T> &ar_spec,
                                              const s_ns_map *ap_ns_map) {
    return p_marshal_item(ac_name, ar_item, ar_spec, true,
                          [&](auto a_write) { p_write_simple_element(ac_name, ap_ns_map, a_write); });
}

template <typename Item, typename T>
elmx_error c_xml_writer::marshal_element_list_or_default(const char *ac_name, const Item &ar_item,
                                                         const ct_typed_validation_spec<T> &ar_spec,
                                                         const s_ns_map *ap_ns_map) {
    if (ct_marshal_item<Item>::is_value_set(ar_item))
        return marshal_element_list(ac_name, ar_item, ar_spec, ap_ns_map);
    p_write_default_element(ac_name, ar_spec, ap_ns_map);
    return elmx_ok;
}

template <typename Item, typename T>
elmx_error c_xml_writer::marshal_element_body(const char *ac_name, const Item &ar_item,
                                              const ct_typed_validation_spec<T> &ar_spec) {
    return p_marshal_item(ac_name, ar_item, ar_spec, false, [&](auto a_write) { p_write_body(a_write); });
}

template <typename Item, typename T>
elmx_error c_xml_writer::marshal_element_body_list(const char *ac_name, const Item &ar_item,
                                                   const ct_typed_validation_spec<T> &ar_spec) {
    return p_marshal_item(ac_name, ar_item, ar_spec, true, [&](auto a_write) { p_write_body(a_write); });
}

// ---------------------------------------------------------------- wildcards

template <typename Store> void c_xml_writer::marshal_any_attribute(const Store &ar_store) {
    for (std::size_t i = 0; i < ar_store.size(); ++i) {
        const c_any_info &info = p_any(ar_store[i]);
        p_declare_attribute_namespace(info);
        p_open_attribute(info.get_name().c_str());
        p_write_escaped(info.get_value());
        p_close_attribute();
    }
}

template <typename Item> void c_xml_writer::marshal_any_element(const Item &ar_item) {
    using item = ct_marshal_item<Item>;
    std::size_t count = item::count(ar_item);
    for (std::size_t i = 0; i < count; ++i) {
        prepare_for_simple_body_data();
        write_any_info(item::value(ar_item, i));
    }
}

// ---------------------------------------------------------------- whole documents

// What the free marshal functions need of a class, behind one function
// pointer, so that the stream, string and file handling is compiled once.
struct s_marshal_job {
    const void *p_object;
    const char *p_name; // null: the class's own element name
    elmx_error (*p_marshal)(const void *ap_object, const char *ap_name, c_xml_writer &ar_writer);
};

elmx_error marshal_job(const s_marshal_job &ar_job, std::ostream &ar_os, s_debug_error *ap_debug);
elmx_error marshal_job(const s_marshal_job &ar_job, std::string *ap_out, s_debug_error *ap_debug);
elmx_error marshal_job(const s_marshal_job &ar_job, const char *ap_file, s_debug_error *ap_debug);
elmx_error marshal_job(const s_marshal_job &ar_job, const wchar_t *ap_file, s_debug_error *ap_debug);

template <typename T> elmx_error marshal_as_own(const void *ap_object, const char *, c_xml_writer &ar_writer) {
    return static_cast<const T *>(ap_object)->marshal(ar_writer);
}
template <typename T> elmx_error marshal_as_named(const void *ap_object, const char *ap_name, c_xml_writer &ar_writer) {
    return static_cast<const T *>(ap_object)->marshal(ar_writer, ap_name);
}

// A whole document, with the prolog and the default strings, from a class
// that writes itself under its own element name by marshal(c_xml_writer&).
// A failed file is removed. The writer's debug record is copied to ap_debug,
// if given, once the writer has run; a file that cannot be opened gives
// elmx_unable_to_open_file and leaves ap_debug as it was. A string is only
// assigned on success.
template <typename T> elmx_error marshal(const T &ar_object, std::ostream &ar_os, s_debug_error *ap_debug = nullptr) {
    return marshal_job({&ar_object, nullptr, &marshal_as_own<T>}, ar_os, ap_debug);
}
template <typename T> elmx_error marshal(const T &ar_object, std::string &ar_out, s_debug_error *ap_debug = nullptr) {
    return marshal_job({&ar_object, nullptr, &marshal_as_own<T>}, &ar_out, ap_debug);
}
template <typename T> elmx_error marshal(const T &ar_object, const char *ap_file, s_debug_error *ap_debug = nullptr) {
    return marshal_job({&ar_object, nullptr, &marshal_as_own<T>}, ap_file, ap_debug);
}
template <typename T>
elmx_error marshal(const T &ar_object, const wchar_t *ap_file, s_debug_error *ap_debug = nullptr) {
    return marshal_job({&ar_object, nullptr, &marshal_as_own<T>}, ap_file, ap_debug);
}

// The same under an element name given by the caller, prefix included
// ("qc:QualityControl"), by marshal(c_xml_writer&, const char*).
template <typename T>
elmx_error marshal(const T &ar_object, const char *ac_name, std::ostream &ar_os, s_debug_error *ap_debug = nullptr) {
    return marshal_job({&ar_object, ac_name, &marshal_as_named<T>}, ar_os, ap_debug);
}
template <typename T>
elmx_error marshal(const T &ar_object, const char *ac_name, std::string &ar_out, s_debug_error *ap_debug = nullptr) {
    return marshal_job({&ar_object, ac_name, &marshal_as_named<T>}, &ar_out, ap_debug);
}
template <typename T>
elmx_error marshal(const T &ar_object, const char *ac_name, const char *ap_file, s_debug_error *ap_debug = nullptr) {
    return marshal_job({&ar_object, ac_name, &marshal_as_named<T>}, ap_file, ap_debug);
}
template <typename T>
elmx_error marshal(const T &ar_object, const char *ac_name, const wchar_t *ap_file,
                   s_debug_error *ap_debug = nullptr) {
    return marshal_job({&ar_object, ac_name, &marshal_as_named<T>}, ap_file, ap_debug);
}

} // namespace lmx

#endif
