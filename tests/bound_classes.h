// Bound classes written by hand the way the binding's classes are made, to
// exercise the unmarshal driver and the member containers with real
// elements of the core CxF3 group: cc:Tag (empty content), cc:FileInformation
// (optional children, a repeated complex child), cc:ColorCIELab (required
// double children, one bounded), cc:ReflectanceSpectrum (a list of doubles as
// text content) and cc:Node, a recursive element that exists only here, for
// the nesting limit.
#ifndef TESSARINE_TESTS_BOUND_CLASSES_H
#define TESSARINE_TESTS_BOUND_CLASSES_H

#include <string>
#include <type_traits>

#include <lmx/lmxparse.h>

namespace tessarine_test {
namespace cc {

const char *const k_source_stem = "cxf3";
const char *const k_core_uri = "http://colorexchangeformat.com/CxF3-core";

inline const lmx::s_ns_map *ns_map_reader() {
    static const lmx::s_ns_map s_map[] = {{1000, "cc", k_core_uri}, {0, nullptr, nullptr}};
    return s_map;
}
inline const lmx::s_ns_map *ns_map_writer_1() {
    static const lmx::s_ns_map s_map[] = {{1000, "cc", k_core_uri}, {0, nullptr, nullptr}};
    return s_map;
}

// One number per local name across the group.
enum {
    e_Creator = 12,
    e_CreationDate,
    e_Description,
    e_Comment,
    e_Tag,
    e_Name,
    e_Value,
    e_L,
    e_A,
    e_B,
    e_ColorSpecification,
    e_StartWL,
    e_Node
};

// ---------------------------------------------------------------- value specs

inline lmx::elmx_error lexical_validator_none(lmx::c_xml_reader &ar_reader, const std::string &ar_text) {
    return lmx::lexical_validator_none(ar_reader, ar_text);
}
inline lmx::elmx_error value_validator_double_ge_0(lmx::c_xml_reader &ar_reader, const double &ar_value) {
    return lmx::check_min_inclusive(ar_reader, ar_value, 0.0);
}
inline lmx::elmx_error lexical_validator_ushort_360_400(lmx::c_xml_reader &ar_reader, const std::string &ar_text) {
    return lmx::check_integer(ar_reader, ar_text, "360", "400");
}

inline const lmx::ct_typed_validation_spec<std::wstring> &spec_string() {
    static const lmx::ct_typed_validation_spec<std::wstring> s_spec(
        lmx::ws_preserve, "", &lexical_validator_none, &lmx::value_validator_none<std::wstring>,
        &lmx::v_to_o<std::wstring>, &lmx::o_to_v<std::wstring>);
    return s_spec;
}
inline const lmx::ct_typed_validation_spec<lmx::c_datetime> &spec_datetime() {
    static const lmx::ct_typed_validation_spec<lmx::c_datetime> s_spec(
        lmx::ws_collapse, "", &lmx::lexical_validator_datetime, &lmx::value_validator_none<lmx::c_datetime>,
        &lmx::v_to_o<lmx::c_datetime>, &lmx::o_to_v<lmx::c_datetime>);
    return s_spec;
}
inline const lmx::ct_typed_validation_spec<double> &spec_double() {
    static const lmx::ct_typed_validation_spec<double> s_spec(lmx::ws_collapse, "", &lmx::lexical_validator_float,
                                                              &lmx::value_validator_none<double>,
                                                              &lmx::v_to_o<double>, &lmx::o_to_v<double>);
    return s_spec;
}
inline const lmx::ct_typed_validation_spec<double> &spec_double_ge_0() {
    static const lmx::ct_typed_validation_spec<double> s_spec(lmx::ws_collapse, "", &lmx::lexical_validator_float,
                                                              &value_validator_double_ge_0, &lmx::v_to_o<double>,
                                                              &lmx::o_to_v<double>);
    return s_spec;
}
// Items of a list of double: whitespace is left to the list reader.
inline const lmx::ct_typed_validation_spec<double> &spec_double_list() {
    static const lmx::ct_typed_validation_spec<double> s_spec(lmx::ws_preserve, "", &lmx::lexical_validator_float,
                                                              &lmx::value_validator_none<double>,
                                                              &lmx::v_to_o<double>, &lmx::o_to_v<double>);
    return s_spec;
}
inline const lmx::ct_typed_validation_spec<unsigned short> &spec_ushort_360_400() {
    static const lmx::ct_typed_validation_spec<unsigned short> s_spec(
        lmx::ws_collapse, "", &lexical_validator_ushort_360_400, &lmx::value_validator_none<unsigned short>,
        &lmx::v_to_o<unsigned short>, &lmx::o_to_v<unsigned short>);
    return s_spec;
}

// ---------------------------------------------------------------- common reading steps

// Step 1 of reading any class: the first element must be ac_local_name in
// the core namespace; its name goes to *ap_name.
inline lmx::elmx_error unmarshal_root_event(lmx::c_xml_reader &ar_reader, const char *ac_local_name,
                                            std::string *ap_name) {
    lmx::elmx_error error;
    ar_reader.set_code_line(1);
    ar_reader.get_element_event(&error, ap_name);
    if (error != lmx::elmx_ok && (error = ar_reader.handle_error(error, *ap_name, k_source_stem, 1)) != lmx::elmx_ok)
        return error;
    if (ar_reader.get_current_event() != lmx::xe_name || ar_reader.get_element_ns_id() != 1000 ||
        ar_reader.get_local_name() != ac_local_name)
        return ar_reader.handle_error(lmx::elmx_element_not_found, *ap_name, k_source_stem, 2);
    return lmx::elmx_ok;
}

// After a complex child: the next event against the rest of the table.
inline bool unmarshal_next_event(lmx::c_xml_reader &ar_reader, const lmx::s_event_map *ac_tail,
                                 lmx::elmx_error *ap_error) {
    ar_reader.get_element_event(ac_tail, ap_error, &ar_reader.get_name_buffer());
    if (*ap_error != lmx::elmx_ok && (*ap_error = ar_reader.handle_error(*ap_error)) != lmx::elmx_ok)
        return false;
    return true;
}

// The reading steps of class X for c_unmarshal_helper, each going to X's own
// member where X has one: unmarshal_attributes and unmarshal_attributes_check
// for attributes, unmarshal_body for a simple (SimpleContent) or complex body.
template <typename X, typename = void> struct has_attribute_steps : std::false_type {};
template <typename X>
struct has_attribute_steps<X, std::void_t<decltype(&X::unmarshal_attributes_check)>> : std::true_type {};
template <typename X, typename = void> struct has_body_step : std::false_type {};
template <typename X> struct has_body_step<X, std::void_t<decltype(&X::unmarshal_body)>> : std::true_type {};

template <typename X, bool SimpleContent = false> class class_helper : public lmx::c_unmarshal_helper {
public:
    class_helper(X *ap_object, lmx::c_xml_reader &ar_reader) : c_unmarshal_helper(ar_reader), p_object(ap_object) {}
    bool unmarshal_attribute(lmx::elmx_error *ap_error) override {
        if constexpr (has_attribute_steps<X>::value) {
            *ap_error = lmx::elmx_ok;
            return p_object->unmarshal_attributes(ar_reader, ap_error);
        } else {
            return c_unmarshal_helper::unmarshal_attribute(ap_error);
        }
    }
    lmx::elmx_error unmarshal_attributes_check() override {
        if constexpr (has_attribute_steps<X>::value)
            return p_object->unmarshal_attributes_check(ar_reader);
        else
            return c_unmarshal_helper::unmarshal_attributes_check();
    }
    bool unmarshal_simple_body(lmx::elmx_error *ap_error) override {
        if constexpr (SimpleContent)
            return p_object->unmarshal_body(ar_reader, ap_error);
        else
            return c_unmarshal_helper::unmarshal_simple_body(ap_error);
    }
    bool unmarshal_complex_body(lmx::elmx_error *ap_error) override {
        if constexpr (!SimpleContent && has_body_step<X>::value)
            return p_object->unmarshal_body(ar_reader, ap_error);
        else
            return c_unmarshal_helper::unmarshal_complex_body(ap_error);
    }

private:
    X *p_object;
};

// How a class's content is read.
enum e_content { content_empty, content_simple, content_complex };

// The start of reading class X once its element is found: the element's
// name becomes the reader's item name, then the content by its kind, with
// a_line the code line of its reports.
template <e_content Content, typename X>
lmx::elmx_error unmarshal_class(X *ap_object, lmx::c_xml_reader &ar_reader, const std::string &ar_name, int a_line,
                                bool a_body_can_be_empty = false) {
    ar_reader.set_name(ar_name);
    class_helper<X, Content == content_simple> h(ap_object, ar_reader);
    if (a_body_can_be_empty)
        h.set_body_can_be_empty();
    if constexpr (Content == content_empty)
        return h.unmarshal_empty_content(k_source_stem, a_line);
    else if constexpr (Content == content_simple)
        return h.unmarshal_simple_content(k_source_stem, a_line);
    else
        return h.unmarshal_complex_content(k_source_stem, a_line);
}

// One case of the attribute switch: the attribute is X's, read it.
template <typename Item, typename T>
bool read_attribute(lmx::c_xml_reader &ar_reader, int a_line, Item &ar_item,
                    const lmx::ct_typed_validation_spec<T> &ar_spec, lmx::elmx_error *ap_error) {
    ar_reader.set_code_line(a_line);
    *ap_error = ar_reader.unmarshal_attribute_value(ar_item, ar_spec);
    return true;
}

// A plain child that may be left out: read it if it is the current event.
// False, with the verdict in *ap_error, when reading stops.
template <typename Item, typename T>
bool read_optional_child(lmx::c_xml_reader &ar_reader, int a_event, Item &ar_item,
                         const lmx::ct_typed_validation_spec<T> &ar_spec, const lmx::s_event_map *ac_tail,
                         int a_line, lmx::elmx_error *ap_error) {
    if (ar_reader.get_current_event() != a_event)
        return true;
    ar_reader.set_code_line(a_line);
    *ap_error = ar_reader.unmarshal_child_element(ar_item, ar_spec, ac_tail);
    return *ap_error == lmx::elmx_ok;
}

// A required plain child: read it if it is the current event, else report
// it missing; a cleared report goes on with the next child.
template <typename Item, typename T>
bool read_required_child(lmx::c_xml_reader &ar_reader, int a_event, Item &ar_item,
                         const lmx::ct_typed_validation_spec<T> &ar_spec, const lmx::s_event_map *ac_tail,
                         const char *ac_name, int a_line, lmx::elmx_error *ap_error) {
    ar_reader.set_code_line(a_line);
    if (ar_reader.get_current_event() == a_event)
        *ap_error = ar_reader.unmarshal_child_element(ar_item, ar_spec, ac_tail);
    else
        *ap_error = ar_reader.handle_error(lmx::elmx_mandatory_element_missing, ac_name, k_source_stem, a_line);
    return *ap_error == lmx::elmx_ok;
}

// Writing any class: nothing at all if a required member is missing; the
// namespace declarations go on the outermost element only.
template <typename X>
lmx::elmx_error marshal_class(const X &ar_object, lmx::c_xml_writer &ar_writer, const char *ac_name,
                              bool a_has_required) {
    if (a_has_required && !ar_object.is_occurs_ok())
        return lmx::elmx_marshal_occurs_error;
    lmx::c_xml_writer_local local(ar_writer);
    ar_writer.start_element(ac_name);
    ar_writer.conditionally_select_ns_map(ns_map_writer_1());
    ar_writer.conditionally_write_ns_attrs(true);
    if (lmx::elmx_error error = ar_object.marshal_attributes(ar_writer))
        return error;
    if (lmx::elmx_error error = ar_object.marshal_child_elements(ar_writer))
        return error;
    ar_writer.end_element(ac_name);
    return lmx::elmx_ok;
}

// The source forms every class has, forwarding to lmx::unmarshal<X>.
#define TESSARINE_TEST_SOURCE_FORMS(X)                                                                             \
    X(lmx::c_xml_reader &ar_reader, lmx::elmx_error *ap_error) {                                                   \
        init();                                                                                                    \
        *ap_error = unmarshal(ar_reader);                                                                          \
    }                                                                                                              \
    X(const char *ap_file, lmx::elmx_error *ap_error, lmx::s_debug_error *ap_debug = nullptr) {                    \
        init();                                                                                                    \
        *ap_error = unmarshal(ap_file, ap_debug);                                                                  \
    }                                                                                                              \
    X(const char *ap_memory, std::size_t a_size, lmx::elmx_error *ap_error,                                        \
      lmx::s_debug_error *ap_debug = nullptr) {                                                                    \
        init();                                                                                                    \
        *ap_error = unmarshal(ap_memory, a_size, ap_debug);                                                        \
    }                                                                                                              \
    X(const std::string &ar_text, lmx::elmx_error *ap_error, lmx::s_debug_error *ap_debug = nullptr) {             \
        init();                                                                                                    \
        *ap_error = lmx::unmarshal(*this, ar_text, ap_debug);                                                      \
    }                                                                                                              \
    X(const lmx::c_any_info &ar_any, lmx::elmx_error *ap_error, lmx::s_debug_error *ap_debug = nullptr) {          \
        init();                                                                                                    \
        *ap_error = unmarshal(ar_any, ap_debug);                                                                   \
    }                                                                                                              \
    lmx::elmx_error unmarshal(const char *ap_file, lmx::s_debug_error *ap_debug = nullptr) {                       \
        return lmx::unmarshal(*this, ap_file, ap_debug);                                                           \
    }                                                                                                              \
    lmx::elmx_error unmarshal(const wchar_t *ap_file, lmx::s_debug_error *ap_debug = nullptr) {                    \
        return lmx::unmarshal(*this, ap_file, ap_debug);                                                           \
    }                                                                                                              \
    lmx::elmx_error unmarshal(const char *ap_memory, std::size_t a_size, lmx::s_debug_error *ap_debug = nullptr) { \
        return lmx::unmarshal(*this, ap_memory, a_size, ap_debug);                                                 \
    }                                                                                                              \
    lmx::elmx_error unmarshal(const lmx::c_any_info &ar_any, lmx::s_debug_error *ap_debug = nullptr) {             \
        return lmx::unmarshal(*this, ar_any, ap_debug);                                                            \
    }                                                                                                              \
    lmx::elmx_error unmarshal(lmx::c_xml_reader &ar_reader) {                                                      \
        ar_reader.set_code_file(k_source_stem);                                                                    \
        ar_reader.set_ns_map(ns_map_reader());                                                                     \
        lmx::c_xml_reader_local local(ar_reader);                                                                  \
        std::string name;                                                                                          \
        if (lmx::elmx_error error = unmarshal_root_event(ar_reader, k_local_name, &name))                          \
            return error;                                                                                          \
        return unmarshal(ar_reader, name);                                                                         \
    }                                                                                                              \
    lmx::elmx_error marshal(lmx::c_xml_writer &ar_writer) const { return marshal(ar_writer, k_element_name); }     \
    lmx::elmx_error marshal(const char *ap_file, lmx::s_debug_error *ap_debug = nullptr) const {                   \
        return lmx::marshal(*this, ap_file, ap_debug);                                                             \
    }                                                                                                              \
    lmx::elmx_error marshal(const wchar_t *ap_file, lmx::s_debug_error *ap_debug = nullptr) const {                \
        return lmx::marshal(*this, ap_file, ap_debug);                                                             \
    }                                                                                                              \
    lmx::elmx_error marshal(std::string &ar_out, lmx::s_debug_error *ap_debug = nullptr) const {                   \
        return lmx::marshal(*this, ar_out, ap_debug);                                                              \
    }                                                                                                              \
    lmx::elmx_error marshal(std::ostream &ar_os, lmx::s_debug_error *ap_debug = nullptr) const {                   \
        return lmx::marshal(*this, ar_os, ap_debug);                                                               \
    }                                                                                                              \
    X(const X &) = default;                                                                                        \
    X &operator=(const X &ar_other) {                                                                              \
        X copy(ar_other);                                                                                          \
        swap(copy);                                                                                                \
        return *this;                                                                                              \
    }                                                                                                              \
    virtual X *clone() const { return new X(*this); }                                                              \
    virtual ~X() = default;                                                                                        \
    void reset() {                                                                                                 \
        X fresh;                                                                                                   \
        swap(fresh);                                                                                               \
    }

// ---------------------------------------------------------------- cc::Tag

class Tag {
public:
    static constexpr const char *k_local_name = "Tag";
    static constexpr const char *k_element_name = "cc:Tag";
    Tag() { init(); }
    TESSARINE_TEST_SOURCE_FORMS(Tag)

    void init() {}
    void swap(Tag &ar_other) {
        m_Name.swap(ar_other.m_Name);
        m_Value.swap(ar_other.m_Value);
    }
    bool is_occurs_ok() const { return m_Name.is_occurs_ok() && m_Value.is_occurs_ok(); }

    const std::wstring &get_Name() const { return m_Name.get(); }
    lmx::elmx_error set_Name(const std::wstring &ar_value) {
        m_Name.set(ar_value);
        return lmx::elmx_ok;
    }
    const std::wstring &get_Value() const { return m_Value.get(); }
    lmx::elmx_error set_Value(const std::wstring &ar_value) {
        m_Value.set(ar_value);
        return lmx::elmx_ok;
    }

    lmx::elmx_error marshal(lmx::c_xml_writer &ar_writer, const char *ac_name) const {
        return marshal_class(*this, ar_writer, ac_name, true);
    }
    lmx::elmx_error marshal_attributes(lmx::c_xml_writer &ar_writer) const {
        ar_writer.set_code_file(k_source_stem);
        if (lmx::elmx_error error = ar_writer.marshal_attribute("Name", m_Name, spec_string()))
            return error;
        if (lmx::elmx_error error = ar_writer.marshal_attribute("Value", m_Value, spec_string()))
            return error;
        return lmx::elmx_ok;
    }
    lmx::elmx_error marshal_child_elements(lmx::c_xml_writer &ar_writer) const {
        (void)ar_writer;
        return lmx::elmx_ok;
    }

    lmx::elmx_error unmarshal(lmx::c_xml_reader &ar_reader, const std::string &ar_name) {
        return unmarshal_class<content_empty>(this, ar_reader, ar_name, 100);
    }
    bool unmarshal_attributes(lmx::c_xml_reader &ar_reader, lmx::elmx_error *ap_error) {
        ar_reader.tokenise(attr_event_map(), lmx::ea_attribute);
        switch (ar_reader.get_current_event()) {
        case e_Name:
            return read_attribute(ar_reader, 101, m_Name, spec_string(), ap_error);
        case e_Value:
            return read_attribute(ar_reader, 102, m_Value, spec_string(), ap_error);
        }
        return false;
    }
    lmx::elmx_error unmarshal_attributes_check(lmx::c_xml_reader &ar_reader) {
        if (!m_Name.is_value_set() || !m_Value.is_value_set())
            return ar_reader.handle_error(lmx::elmx_required_attribute_missing, "Tag", k_source_stem, 103);
        return lmx::elmx_ok;
    }

    static const lmx::s_event_map *attr_event_map() {
        static const lmx::s_event_map s_map[] = {
            {1, "Name", 4, e_Name}, {1, "Value", 5, e_Value}, {0, nullptr, 0, 1}};
        return s_map;
    }
    static const lmx::s_event_map *elem_event_map() {
        static const lmx::s_event_map s_map[] = {{0, nullptr, 0, 1}};
        return s_map;
    }

private:
    lmx::ct_simple_non_pod_single<std::wstring> m_Name;
    lmx::ct_simple_non_pod_single<std::wstring> m_Value;
};

// ---------------------------------------------------------------- cc::FileInformation

class FileInformation {
public:
    static constexpr const char *k_local_name = "FileInformation";
    static constexpr const char *k_element_name = "cc:FileInformation";
    FileInformation() { init(); }
    TESSARINE_TEST_SOURCE_FORMS(FileInformation)

    void init() {}
    void swap(FileInformation &ar_other) {
        m_Creator.swap(ar_other.m_Creator);
        m_CreationDate.swap(ar_other.m_CreationDate);
        m_Description.swap(ar_other.m_Description);
        m_Comment.swap(ar_other.m_Comment);
        m_Tag.swap(ar_other.m_Tag);
    }
    bool is_occurs_ok() const { return true; }

    const std::wstring &get_Creator() const { return m_Creator.get(); }
    lmx::elmx_error set_Creator(const std::wstring &ar_value) {
        m_Creator.set(ar_value);
        return lmx::elmx_ok;
    }
    bool isset_Creator() const { return m_Creator.is_value_set(); }
    void unset_Creator() { m_Creator.unset(); }
    const lmx::c_datetime &get_CreationDate() const { return m_CreationDate.get(); }
    bool isset_CreationDate() const { return m_CreationDate.is_value_set(); }
    const std::wstring &get_Description() const { return m_Description.get(); }
    bool isset_Description() const { return m_Description.is_value_set(); }
    const std::wstring &get_Comment() const { return m_Comment.get(); }
    bool isset_Comment() const { return m_Comment.is_value_set(); }
    Tag &get_Tag(std::size_t a_index) { return m_Tag.get(a_index); }
    const Tag &get_Tag(std::size_t a_index) const { return m_Tag.get(a_index); }
    Tag &append_Tag() { return m_Tag.append(); }
    Tag &append_Tag(const Tag &ar_item) { return m_Tag.append(ar_item); }
    Tag &back_Tag() { return m_Tag.back(); }
    Tag &insert_Tag(std::size_t a_index) { return m_Tag.insert(a_index); }
    Tag &insert_Tag(std::size_t a_index, const Tag &ar_item) { return m_Tag.insert(a_index, ar_item); }
    void delete_Tag(std::size_t a_index) { m_Tag.erase(a_index); }
    void clear_Tag() { m_Tag.clear(); }
    void assign_Tag(std::size_t a_index, const Tag &ar_item) { m_Tag.assign(a_index, ar_item); }
    std::size_t size_Tag() const { return m_Tag.size(); }

    lmx::elmx_error marshal(lmx::c_xml_writer &ar_writer, const char *ac_name) const {
        return marshal_class(*this, ar_writer, ac_name, false);
    }
    lmx::elmx_error marshal_attributes(lmx::c_xml_writer &ar_writer) const {
        ar_writer.set_code_file(k_source_stem);
        return lmx::elmx_ok;
    }
    lmx::elmx_error marshal_child_elements(lmx::c_xml_writer &ar_writer) const {
        if (lmx::elmx_error error = ar_writer.marshal_element("cc:Creator", m_Creator, spec_string(), nullptr))
            return error;
        if (lmx::elmx_error error = ar_writer.marshal_element("cc:CreationDate", m_CreationDate, spec_datetime(), nullptr))
            return error;
        if (lmx::elmx_error error = ar_writer.marshal_element("cc:Description", m_Description, spec_string(), nullptr))
            return error;
        if (lmx::elmx_error error = ar_writer.marshal_element("cc:Comment", m_Comment, spec_string(), nullptr))
            return error;
        for (std::size_t i = 0; i < m_Tag.size(); ++i)
            if (lmx::elmx_error error = m_Tag.get(i).marshal(ar_writer, "cc:Tag"))
                return error;
        return lmx::elmx_ok;
    }

    lmx::elmx_error unmarshal(lmx::c_xml_reader &ar_reader, const std::string &ar_name) {
        return unmarshal_class<content_complex>(this, ar_reader, ar_name, 200, true);
    }
    bool unmarshal_attributes(lmx::c_xml_reader &, lmx::elmx_error *) { return false; }
    lmx::elmx_error unmarshal_attributes_check(lmx::c_xml_reader &) { return lmx::elmx_ok; }
    bool unmarshal_body(lmx::c_xml_reader &ar_reader, lmx::elmx_error *ap_error) {
        const lmx::s_event_map *map = elem_event_map();
        *ap_error = lmx::elmx_ok;
        ar_reader.tokenise(map, lmx::ea_element);
        if (!read_optional_child(ar_reader, e_Creator, m_Creator, spec_string(), map + 0, 201, ap_error))
            return false;
        if (!read_optional_child(ar_reader, e_CreationDate, m_CreationDate, spec_datetime(), map + 1, 202, ap_error))
            return false;
        if (!read_optional_child(ar_reader, e_Description, m_Description, spec_string(), map + 2, 203, ap_error))
            return false;
        if (!read_optional_child(ar_reader, e_Comment, m_Comment, spec_string(), map + 3, 204, ap_error))
            return false;
        while (ar_reader.get_current_event() == e_Tag) {
            ar_reader.set_code_line(205);
            if ((*ap_error = m_Tag.append().unmarshal(ar_reader, ar_reader.get_name())) != lmx::elmx_ok)
                return false;
            if (!unmarshal_next_event(ar_reader, map + 4, ap_error))
                return false;
        }
        return true;
    }

    static const lmx::s_event_map *attr_event_map() {
        static const lmx::s_event_map s_map[] = {{0, nullptr, 0, 1}};
        return s_map;
    }
    static const lmx::s_event_map *elem_event_map() {
        static const lmx::s_event_map s_map[] = {{1000, "Creator", 7, e_Creator},
                                                 {1000, "CreationDate", 12, e_CreationDate},
                                                 {1000, "Description", 11, e_Description},
                                                 {1000, "Comment", 7, e_Comment},
                                                 {1000, "Tag", 3, e_Tag},
                                                 {0, nullptr, 0, 1}};
        return s_map;
    }

private:
    lmx::ct_simple_non_pod_optional<std::wstring> m_Creator;
    lmx::ct_simple_non_pod_optional<lmx::c_datetime> m_CreationDate;
    lmx::ct_simple_non_pod_optional<std::wstring> m_Description;
    lmx::ct_simple_non_pod_optional<std::wstring> m_Comment;
    lmx::ct_complex_multi<Tag> m_Tag;
};

// ---------------------------------------------------------------- cc::ColorCIELab

class ColorCIELab {
public:
    static constexpr const char *k_local_name = "ColorCIELab";
    static constexpr const char *k_element_name = "cc:ColorCIELab";
    ColorCIELab() { init(); }
    TESSARINE_TEST_SOURCE_FORMS(ColorCIELab)

    void init() {}
    void swap(ColorCIELab &ar_other) {
        m_Name.swap(ar_other.m_Name);
        m_ColorSpecification.swap(ar_other.m_ColorSpecification);
        m_L.swap(ar_other.m_L);
        m_A.swap(ar_other.m_A);
        m_B.swap(ar_other.m_B);
    }
    bool is_occurs_ok() const {
        return m_ColorSpecification.is_occurs_ok() && m_L.is_occurs_ok() && m_A.is_occurs_ok() &&
               m_B.is_occurs_ok();
    }

    const std::wstring &get_Name() const { return m_Name.get(); }
    bool isset_Name() const { return m_Name.is_value_set(); }
    const std::wstring &get_ColorSpecification() const { return m_ColorSpecification.get(); }
    double get_L() const { return m_L.get(); }
    lmx::elmx_error set_L(double a_value) {
        m_L.set(a_value);
        return lmx::elmx_ok;
    }
    lmx::elmx_error set_ColorSpecification(const std::wstring &ar_value) {
        m_ColorSpecification.set(ar_value);
        return lmx::elmx_ok;
    }
    double get_A() const { return m_A.get(); }
    lmx::elmx_error set_A(double a_value) {
        m_A.set(a_value);
        return lmx::elmx_ok;
    }
    double get_B() const { return m_B.get(); }
    lmx::elmx_error set_B(double a_value) {
        m_B.set(a_value);
        return lmx::elmx_ok;
    }

    lmx::elmx_error marshal(lmx::c_xml_writer &ar_writer, const char *ac_name) const {
        return marshal_class(*this, ar_writer, ac_name, true);
    }
    lmx::elmx_error marshal_attributes(lmx::c_xml_writer &ar_writer) const {
        ar_writer.set_code_file(k_source_stem);
        if (lmx::elmx_error error = ar_writer.marshal_attribute("Name", m_Name, spec_string()))
            return error;
        if (lmx::elmx_error error = ar_writer.marshal_attribute("ColorSpecification", m_ColorSpecification, spec_string()))
            return error;
        return lmx::elmx_ok;
    }
    lmx::elmx_error marshal_child_elements(lmx::c_xml_writer &ar_writer) const {
        if (lmx::elmx_error error = ar_writer.marshal_element("cc:L", m_L, spec_double_ge_0(), nullptr))
            return error;
        if (lmx::elmx_error error = ar_writer.marshal_element("cc:A", m_A, spec_double(), nullptr))
            return error;
        if (lmx::elmx_error error = ar_writer.marshal_element("cc:B", m_B, spec_double(), nullptr))
            return error;
        return lmx::elmx_ok;
    }

    lmx::elmx_error unmarshal(lmx::c_xml_reader &ar_reader, const std::string &ar_name) {
        return unmarshal_class<content_complex>(this, ar_reader, ar_name, 300);
    }
    bool unmarshal_attributes(lmx::c_xml_reader &ar_reader, lmx::elmx_error *ap_error) {
        ar_reader.tokenise(attr_event_map(), lmx::ea_attribute);
        switch (ar_reader.get_current_event()) {
        case e_Name:
            return read_attribute(ar_reader, 301, m_Name, spec_string(), ap_error);
        case e_ColorSpecification:
            return read_attribute(ar_reader, 302, m_ColorSpecification, spec_string(), ap_error);
        }
        return false;
    }
    lmx::elmx_error unmarshal_attributes_check(lmx::c_xml_reader &ar_reader) {
        if (!m_ColorSpecification.is_value_set())
            return ar_reader.handle_error(lmx::elmx_required_attribute_missing, "ColorCIELab", k_source_stem, 303);
        return lmx::elmx_ok;
    }
    bool unmarshal_body(lmx::c_xml_reader &ar_reader, lmx::elmx_error *ap_error) {
        const lmx::s_event_map *map = elem_event_map();
        *ap_error = lmx::elmx_ok;
        ar_reader.tokenise(map, lmx::ea_element);
        if (!read_required_child(ar_reader, e_L, m_L, spec_double_ge_0(), map + 0, "cc:L", 304, ap_error) ||
            !read_required_child(ar_reader, e_A, m_A, spec_double(), map + 1, "cc:A", 305, ap_error) ||
            !read_required_child(ar_reader, e_B, m_B, spec_double(), map + 2, "cc:B", 306, ap_error))
            return false;
        return true;
    }

    static const lmx::s_event_map *attr_event_map() {
        static const lmx::s_event_map s_map[] = {{1, "Name", 4, e_Name},
                                                 {1, "ColorSpecification", 18, e_ColorSpecification},
                                                 {0, nullptr, 0, 1}};
        return s_map;
    }
    static const lmx::s_event_map *elem_event_map() {
        static const lmx::s_event_map s_map[] = {
            {1000, "L", 1, e_L}, {1000, "A", 1, e_A}, {1000, "B", 1, e_B}, {0, nullptr, 0, 1}};
        return s_map;
    }

private:
    lmx::ct_simple_non_pod_optional<std::wstring> m_Name;
    lmx::ct_simple_non_pod_single<std::wstring> m_ColorSpecification;
    lmx::ct_simple_pod_single<double> m_L;
    lmx::ct_simple_pod_single<double> m_A;
    lmx::ct_simple_pod_single<double> m_B;
};

// ---------------------------------------------------------------- cc::ReflectanceSpectrum

class ReflectanceSpectrum {
public:
    static constexpr const char *k_local_name = "ReflectanceSpectrum";
    static constexpr const char *k_element_name = "cc:ReflectanceSpectrum";
    ReflectanceSpectrum() { init(); }
    TESSARINE_TEST_SOURCE_FORMS(ReflectanceSpectrum)

    void init() {}
    void swap(ReflectanceSpectrum &ar_other) {
        m_StartWL.swap(ar_other.m_StartWL);
        m_ColorSpecification.swap(ar_other.m_ColorSpecification);
        m_value.swap(ar_other.m_value);
    }
    bool is_occurs_ok() const { return m_ColorSpecification.is_occurs_ok() && m_value.is_occurs_ok(); }

    unsigned short get_StartWL() const { return m_StartWL.get(); }
    bool isset_StartWL() const { return m_StartWL.is_value_set(); }
    const std::wstring &get_ColorSpecification() const { return m_ColorSpecification.get(); }
    double get_value(std::size_t a_index) const { return m_value.get(a_index); }
    void append_value(double a_value) { m_value.append(a_value); }
    std::size_t size_value() const { return m_value.size(); }

    lmx::elmx_error marshal(lmx::c_xml_writer &ar_writer, const char *ac_name) const {
        return marshal_class(*this, ar_writer, ac_name, true);
    }
    lmx::elmx_error marshal_attributes(lmx::c_xml_writer &ar_writer) const {
        ar_writer.set_code_file(k_source_stem);
        if (lmx::elmx_error error = ar_writer.marshal_attribute("StartWL", m_StartWL, spec_ushort_360_400()))
            return error;
        if (lmx::elmx_error error = ar_writer.marshal_attribute("ColorSpecification", m_ColorSpecification, spec_string()))
            return error;
        return lmx::elmx_ok;
    }
    lmx::elmx_error marshal_child_elements(lmx::c_xml_writer &ar_writer) const {
        if (lmx::elmx_error error = ar_writer.marshal_element_body_list(k_element_name, m_value, spec_double_list()))
            return error;
        return lmx::elmx_ok;
    }

    lmx::elmx_error unmarshal(lmx::c_xml_reader &ar_reader, const std::string &ar_name) {
        return unmarshal_class<content_simple>(this, ar_reader, ar_name, 400);
    }
    bool unmarshal_attributes(lmx::c_xml_reader &ar_reader, lmx::elmx_error *ap_error) {
        ar_reader.tokenise(attr_event_map(), lmx::ea_attribute);
        switch (ar_reader.get_current_event()) {
        case e_StartWL:
            return read_attribute(ar_reader, 401, m_StartWL, spec_ushort_360_400(), ap_error);
        case e_ColorSpecification:
            return read_attribute(ar_reader, 402, m_ColorSpecification, spec_string(), ap_error);
        }
        return false;
    }
    lmx::elmx_error unmarshal_attributes_check(lmx::c_xml_reader &ar_reader) {
        if (!m_ColorSpecification.is_value_set())
            return ar_reader.handle_error(lmx::elmx_required_attribute_missing, "ReflectanceSpectrum", k_source_stem,
                                          403);
        return lmx::elmx_ok;
    }
    bool unmarshal_body(lmx::c_xml_reader &ar_reader, lmx::elmx_error *ap_error) {
        ar_reader.set_code_line(404);
        *ap_error = ar_reader.unmarshal_element_list_value(m_value, spec_double_list());
        return *ap_error == lmx::elmx_ok;
    }

    static const lmx::s_event_map *attr_event_map() {
        static const lmx::s_event_map s_map[] = {{1, "StartWL", 7, e_StartWL},
                                                 {1, "ColorSpecification", 18, e_ColorSpecification},
                                                 {0, nullptr, 0, 1}};
        return s_map;
    }

private:
    lmx::ct_simple_pod_optional<unsigned short> m_StartWL;
    lmx::ct_simple_non_pod_single<std::wstring> m_ColorSpecification;
    lmx::ct_simple_pod_list_single<double> m_value;
};

// ---------------------------------------------------------------- cc:Node (tests only)

// An element that may hold one more of itself, nested without end.
class Node {
public:
    static constexpr const char *k_local_name = "Node";
    static constexpr const char *k_element_name = "cc:Node";
    Node() { init(); }
    TESSARINE_TEST_SOURCE_FORMS(Node)

    void init() {}
    void swap(Node &ar_other) { m_Node.swap(ar_other.m_Node); }
    bool is_occurs_ok() const { return true; }
    bool isset_Node() const { return m_Node.is_value_set(); }
    const Node *get_Node() const { return m_Node.get(); }
    Node &get_Node() { return m_Node.get(); }
    std::size_t depth() const {
        std::size_t n = 1;
        for (const Node *p = m_Node.get(); p; p = p->m_Node.get())
            ++n;
        return n;
    }

    lmx::elmx_error marshal(lmx::c_xml_writer &ar_writer, const char *ac_name) const {
        return marshal_class(*this, ar_writer, ac_name, false);
    }
    lmx::elmx_error marshal_attributes(lmx::c_xml_writer &ar_writer) const {
        ar_writer.set_code_file(k_source_stem);
        return lmx::elmx_ok;
    }
    lmx::elmx_error marshal_child_elements(lmx::c_xml_writer &ar_writer) const {
        if (const Node *p_node = m_Node.get())
            if (lmx::elmx_error error = p_node->marshal(ar_writer, "cc:Node"))
                return error;
        return lmx::elmx_ok;
    }

    lmx::elmx_error unmarshal(lmx::c_xml_reader &ar_reader, const std::string &ar_name) {
        return unmarshal_class<content_complex>(this, ar_reader, ar_name, 500, true);
    }
    bool unmarshal_body(lmx::c_xml_reader &ar_reader, lmx::elmx_error *ap_error) {
        const lmx::s_event_map *map = elem_event_map();
        *ap_error = lmx::elmx_ok;
        ar_reader.tokenise(map, lmx::ea_element);
        if (ar_reader.get_current_event() == e_Node) {
            ar_reader.set_code_line(501);
            if ((*ap_error = m_Node.get().unmarshal(ar_reader, ar_reader.get_name())) != lmx::elmx_ok)
                return false;
            if (!unmarshal_next_event(ar_reader, map + 0, ap_error))
                return false;
        }
        return true;
    }
    static const lmx::s_event_map *elem_event_map() {
        static const lmx::s_event_map s_map[] = {{1000, "Node", 4, e_Node}, {0, nullptr, 0, 1}};
        return s_map;
    }

private:
    lmx::ct_complex_optional<Node> m_Node;
};

#undef TESSARINE_TEST_SOURCE_FORMS

} // namespace cc
} // namespace tessarine_test

#endif
