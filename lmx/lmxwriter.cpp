#include "lmxwriter.h"

#include <cstdio>
#include <cstring>
#include <fstream>
#include <locale>

#include "lmxnamespaces.h"

namespace lmx {

namespace {

// The process-wide defaults. Function statics, so that a writer made by
// another translation unit's static initialiser finds them built.
std::string &default_tab() {
    static std::string s_tab("\t");
    return s_tab;
}
std::string &default_nl() {
    static std::string s_nl("\n");
    return s_nl;
}
std::string &default_attribute_tab() {
    static std::string s_tab("\t");
    return s_tab;
}
std::string &default_attribute_nl() {
    static std::string s_nl("\n");
    return s_nl;
}

// Appends to a string of its own, so that a document marshalled to a string
// is built in place and not copied out of a string stream at the end.
class c_string_buffer : public std::streambuf {
public:
    explicit c_string_buffer(std::string *ap_text) : p_text(ap_text) {}

protected:
    int_type overflow(int_type a_c) override {
        if (!traits_type::eq_int_type(a_c, traits_type::eof()))
            p_text->push_back(traits_type::to_char_type(a_c));
        return traits_type::not_eof(a_c);
    }
    std::streamsize xsputn(const char *ap_data, std::streamsize a_count) override {
        p_text->append(ap_data, static_cast<std::size_t>(a_count));
        return a_count;
    }

private:
    std::string *p_text;
};

} // namespace

// ---------------------------------------------------------------- locals

c_xml_writer_local::c_xml_writer_local(c_xml_writer &ar_writer)
    : ar_writer(ar_writer), p_parent(ar_writer.p_current) {
    ar_writer.p_current = this;
}

c_xml_writer_local::c_xml_writer_local(c_xml_writer &ar_writer, root_tag)
    : ar_writer(ar_writer), p_parent(nullptr), m_has_body(true), m_is_root(true) {}

c_xml_writer_local::~c_xml_writer_local() {
    if (!m_is_root)
        ar_writer.p_current = p_parent;
}

// ---------------------------------------------------------------- writer

c_xml_writer::c_xml_writer(std::ostream &ar_os, const char *ap_tab, const char *ap_nl,
                           const char *ap_attribute_tab, const char *ap_attribute_nl)
    : ar_os(ar_os), m_buffer(ar_os.rdbuf()), m_os(&m_buffer), p_current(&m_root_local),
      m_root_local(*this, c_xml_writer_local::root_tag()) {
    p_init(0, ap_tab, ap_nl, ap_attribute_tab, ap_attribute_nl);
}

c_xml_writer::c_xml_writer(std::ostream &ar_os, int a_options, const char *ap_tab, const char *ap_nl,
                           const char *ap_attribute_tab, const char *ap_attribute_nl)
    : ar_os(ar_os), m_buffer(ar_os.rdbuf()), m_os(&m_buffer), p_current(&m_root_local),
      m_root_local(*this, c_xml_writer_local::root_tag()) {
    p_init(a_options, ap_tab, ap_nl, ap_attribute_tab, ap_attribute_nl);
}

c_xml_writer::~c_xml_writer() = default;

void c_xml_writer::p_init(int a_options, const char *ap_tab, const char *ap_nl, const char *ap_attribute_tab,
                          const char *ap_attribute_nl) {
    // Numbers must never take the machine's decimal comma.
    ar_os.imbue(std::locale::classic());
    m_os.imbue(std::locale::classic());
    m_tab = ap_tab ? ap_tab : default_tab();
    m_nl = ap_nl ? ap_nl : default_nl();
    m_attribute_tab = ap_attribute_tab ? ap_attribute_tab : ap_tab ? ap_tab : default_attribute_tab();
    m_attribute_nl = ap_attribute_nl ? ap_attribute_nl : ap_nl ? ap_nl : default_attribute_nl();
    if (a_options & (include_xml_decl | include_standalone_xml_decl)) {
        p_write("<?xml version=\"1.0\" encoding=\"UTF-8\"");
        if (a_options & include_standalone_xml_decl)
            p_write(" standalone=\"yes\"");
        p_write("?>");
        p_write(m_nl);
        m_buffer.drain();
    }
}

void c_xml_writer::p_write(const char *ap_text) { p_write(ap_text, std::strlen(ap_text)); }

void c_xml_writer::p_write_tabs(int a_count) {
    if (a_count <= 0 || m_tab.empty())
        return;
    std::size_t length = m_tab.size() * static_cast<std::size_t>(a_count);
    while (m_tabs.size() < length)
        m_tabs += m_tab;
    p_write(m_tabs.data(), length);
}

// ---------------------------------------------------------------- errors

elmx_error c_xml_writer::user_handle_error(elmx_error a_error, const std::string &, const char *, int) {
    return user_handle_error(a_error);
}

elmx_error c_xml_writer::user_handle_error(elmx_error a_error) { return a_error; }

void c_xml_writer::get_error_message(std::string *ap_message) const { *ap_message = m_debug_error.to_string(); }

elmx_error c_xml_writer::capture_error(elmx_error a_error, const std::string &ar_item_name,
                                       const char *ap_prog_file, int a_prog_line) {
    m_debug_error.set(a_error, ar_item_name, ap_prog_file, a_prog_line, -1);
    return a_error;
}

elmx_error c_xml_writer::handle_error(elmx_error a_error, const std::string &ar_item_name,
                                      const char *ap_prog_file, int a_prog_line) {
    capture_error(a_error, ar_item_name, ap_prog_file, a_prog_line);
    return user_handle_error(a_error, ar_item_name, ap_prog_file, a_prog_line);
}

void c_xml_writer::p_make_validation_reader() { p_validation_reader.reset(new c_xml_reader_memory("", 0)); }

// ---------------------------------------------------------------- defaults

void c_xml_writer::set_default_tab(const char *ap_tab) {
    bool is_paired = default_attribute_tab() == default_tab() && default_attribute_nl() == default_nl();
    default_tab() = ap_tab ? ap_tab : "";
    if (is_paired)
        default_attribute_tab() = default_tab();
}

const char *c_xml_writer::get_default_tab() { return default_tab().c_str(); }

void c_xml_writer::set_default_nl(const char *ap_nl) {
    bool is_paired = default_attribute_tab() == default_tab() && default_attribute_nl() == default_nl();
    default_nl() = ap_nl ? ap_nl : "";
    if (is_paired)
        default_attribute_nl() = default_nl();
}

const char *c_xml_writer::get_default_nl() { return default_nl().c_str(); }

void c_xml_writer::set_default_attribute_tab(const char *ap_tab) { default_attribute_tab() = ap_tab ? ap_tab : ""; }

const char *c_xml_writer::get_default_attribute_tab() { return default_attribute_tab().c_str(); }

void c_xml_writer::set_default_attribute_nl(const char *ap_nl) { default_attribute_nl() = ap_nl ? ap_nl : ""; }

const char *c_xml_writer::get_default_attribute_nl() { return default_attribute_nl().c_str(); }

// ---------------------------------------------------------------- namespaces

void c_xml_writer::add_namespace(const std::string &ar_ns_prefix, const std::string &ar_namespace) {
    m_user_ns_prefix_maps.push_back({ar_ns_prefix, ar_namespace});
}

void c_xml_writer::add_schema_location(const std::string &ar_ns_uri, const std::string &ar_location) {
    m_schema_locations.push_back({ar_ns_uri, ar_location});
}

const char *c_xml_writer::get_namespace_prefix(const std::string &ar_namespace) const {
    if (p_ns_map)
        for (const s_ns_map *p_row = p_ns_map; p_row->p_uri; ++p_row)
            if (ar_namespace == p_row->p_uri)
                return p_row->p_prefix;
    for (const s_user_ns_prefix_map &map : m_user_ns_prefix_maps)
        if (map.uri == ar_namespace)
            return map.prefix.c_str();
    return nullptr;
}

void c_xml_writer::conditionally_write_ns_attrs(bool a_needs_xsi) {
    if (m_ns_attributes_written)
        return;
    auto write_declaration = [this](const char *ap_prefix, std::size_t a_prefix_length, const char *ap_uri,
                                    std::size_t a_uri_length) {
        position_attribute();
        p_write("xmlns", 5);
        if (a_prefix_length) {
            p_write(':');
            p_write(ap_prefix, a_prefix_length);
        }
        p_write("=\"", 2);
        p_write(ap_uri, a_uri_length);
        p_write('"');
    };
    if (p_ns_map) {
        for (const s_ns_map *p_row = p_ns_map; p_row->p_uri; ++p_row) {
            const char *p_prefix = p_row->p_prefix ? p_row->p_prefix : "";
            write_declaration(p_prefix, std::char_traits<char>::length(p_prefix), p_row->p_uri,
                              std::char_traits<char>::length(p_row->p_uri));
        }
    }
    for (const s_user_ns_prefix_map &map : m_user_ns_prefix_maps)
        write_declaration(map.prefix.data(), map.prefix.size(), map.uri.data(), map.uri.size());
    if (a_needs_xsi || !m_schema_locations.empty()) {
        position_attribute();
        p_write("xmlns:xsi=\"");
        p_write(k_xsi_namespace_uri);
        p_write('"');
    }
    if (!m_schema_locations.empty()) {
        position_attribute();
        if (m_schema_locations.front().uri.empty()) {
            // Only one schema can be without a namespace; the others are not
            // written.
            p_write("xsi:noNamespaceSchemaLocation=\"");
            p_write(m_schema_locations.front().location);
        } else {
            p_write("xsi:schemaLocation=\"");
            for (std::size_t i = 0; i < m_schema_locations.size(); ++i) {
                if (i)
                    p_write(' ');
                p_write(m_schema_locations[i].uri);
                p_write(' ');
                p_write(m_schema_locations[i].location);
            }
        }
        p_write('"');
    }
    m_ns_attributes_written = true;
}

// ---------------------------------------------------------------- structure

void c_xml_writer::start_element(const char *ac_name) {
    c_xml_writer_local *p_parent = p_current->get_parent();
    if (p_parent && !p_parent->has_body()) {
        p_write('>');
        p_write(m_nl);
        p_current->set_parent_has_body();
    }
    p_write_tabs(m_indent);
    p_write('<');
    p_write(ac_name);
    ++m_indent;
}

void c_xml_writer::end_element(const char *ac_name) {
    if (m_indent > 0)
        --m_indent;
    if (p_current->has_body()) {
        if (p_current->has_children())
            p_write_tabs(m_indent);
        p_write("</", 2);
        p_write(ac_name);
        p_write('>');
    } else {
        p_write("/>", 2);
    }
    p_write(m_nl);
    // A whole document, or a whole top-level piece of one, is done.
    if (p_current->get_parent() == &m_root_local)
        m_buffer.drain();
}

void c_xml_writer::position_attribute() {
    if (p_current->has_attributes() && !(m_attribute_nl.empty() && m_attribute_tab.empty())) {
        if (!m_attribute_nl.empty()) {
            p_write(m_attribute_nl);
            std::size_t length = m_attribute_tab.size() * static_cast<std::size_t>(m_indent + 1);
            while (m_attribute_tabs.size() < length)
                m_attribute_tabs += m_attribute_tab;
            p_write(m_attribute_tabs.data(), length);
        } else {
            p_write(m_attribute_tab);
        }
    } else {
        p_write(' ');
        p_current->set_has_attributes();
    }
}

void c_xml_writer::prepare_for_simple_body_data() {
    if (!p_current->has_body()) {
        p_write('>');
        p_current->set_has_body();
    }
}

void c_xml_writer::p_write_escaped(const std::string &ar_text) { output_convert_to_escaped(m_os, ar_text); }

void c_xml_writer::p_open_attribute(const char *ac_name) {
    position_attribute();
    p_write(ac_name);
    p_write("=\"", 2);
}

void c_xml_writer::p_start_simple_element(const char *ac_name, const s_ns_map *ap_ns_map) {
    start_element(ac_name);
    if (ap_ns_map) {
        conditionally_select_ns_map(ap_ns_map);
        conditionally_write_ns_attrs(false);
    }
    prepare_for_simple_body_data();
}

// ---------------------------------------------------------------- constant forms and wildcards

void c_xml_writer::marshal_attribute(const char *ac_name, const char *ac_text) {
    p_open_attribute(ac_name);
    p_write_escaped(ac_text ? ac_text : "");
    p_close_attribute();
}

void c_xml_writer::marshal_element(const char *ac_name, const char *ac_text) {
    c_xml_writer_local local(*this);
    p_start_simple_element(ac_name, nullptr);
    p_write_escaped(ac_text ? ac_text : "");
    end_element(ac_name);
}

namespace {

bool is_xml_space(char a_c) { return a_c == ' ' || a_c == '\t' || a_c == '\n' || a_c == '\r'; }

// Does the start tag declare this attribute (xmlns or xmlns:p) itself.
bool declares(const std::string &ar_start_tag, const std::string &ar_attribute) {
    for (std::size_t at = ar_start_tag.find(ar_attribute); at != std::string::npos;
         at = ar_start_tag.find(ar_attribute, at + 1)) {
        std::size_t end = at + ar_attribute.size();
        while (end < ar_start_tag.size() && is_xml_space(ar_start_tag[end]))
            ++end;
        if (at > 0 && is_xml_space(ar_start_tag[at - 1]) && end < ar_start_tag.size() && ar_start_tag[end] == '=')
            return true;
    }
    return false;
}

} // namespace

void c_xml_writer::p_declare_attribute_namespace(const c_any_info &ar_info) {
    const std::string &name = ar_info.get_name();
    const std::size_t colon = name.find(':');
    const std::string &ns = ar_info.get_namespace();
    if (colon == std::string::npos || ns.empty() || ns == c_xml::k_non_namespace || name.compare(0, colon, "xmlns") == 0)
        return;
    const std::string prefix = name.substr(0, colon);
    const char *p_known = get_namespace_prefix(ns);
    if (p_known && prefix == p_known)
        return;
    position_attribute();
    p_write("xmlns:", 6);
    p_write(prefix);
    p_write("=\"", 2);
    p_write_escaped(ns);
    p_write('"');
}

void c_xml_writer::write_any_info(const c_any_info &ar_info) {
    p_write_tabs(m_indent);
    const std::string &value = ar_info.get_value();
    const c_namespace_context &context = ar_info.get_namespace_context();
    std::size_t name_end = 1;
    while (name_end < value.size() && !is_xml_space(value[name_end]) && value[name_end] != '/' &&
           value[name_end] != '>')
        ++name_end;
    if (value.empty() || value[0] != '<' || context.size() == 0) {
        p_write(value);
        p_write(m_nl);
        return;
    }
    // The element was captured with the prefixes in scope where it stood;
    // those it uses and does not declare itself are declared on its start
    // tag, so that it means here what it meant there.
    const std::string start_tag = value.substr(0, value.find('>'));
    const bool has_prefix = value.find(':') < name_end;
    p_write(value.data(), name_end);
    for (std::size_t i = 0; i < context.size(); ++i) {
        const std::string &prefix = context.get_ns_prefix(i);
        const bool is_used = prefix.empty() ? !has_prefix : value.find(prefix + ":") != std::string::npos;
        const std::string attribute = prefix.empty() ? "xmlns" : "xmlns:" + prefix;
        if (!is_used || declares(start_tag, attribute))
            continue;
        p_write(' ');
        p_write(attribute);
        p_write("=\"", 2);
        p_write_escaped(context.get_ns_uri(i));
        p_write('"');
    }
    p_write(value.data() + name_end, value.size() - name_end);
    p_write(m_nl);
}

// ---------------------------------------------------------------- whole documents

elmx_error marshal_job(const s_marshal_job &ar_job, std::ostream &ar_os, s_debug_error *ap_debug) {
    c_xml_writer writer(ar_os, c_xml_writer::include_xml_decl);
    elmx_error error = ar_job.p_marshal(ar_job.p_object, ar_job.p_name, writer);
    if (ap_debug)
        *ap_debug = writer.get_debug_error();
    return error;
}

elmx_error marshal_job(const s_marshal_job &ar_job, std::string *ap_out, s_debug_error *ap_debug) {
    std::string text;
    c_string_buffer buffer(&text);
    std::ostream os(&buffer);
    elmx_error error = marshal_job(ar_job, os, ap_debug);
    if (error == elmx_ok)
        ap_out->swap(text);
    return error;
}

elmx_error marshal_job(const s_marshal_job &ar_job, const char *ap_file, s_debug_error *ap_debug) {
    elmx_error error;
    {
        // Text mode, truncating: where lines end in CR LF, every newline
        // string is translated on the way out.
        std::ofstream file(ap_file, std::ios_base::out);
        if (!file.is_open())
            return elmx_unable_to_open_file;
        error = marshal_job(ar_job, file, ap_debug);
    }
    if (error != elmx_ok)
        std::remove(ap_file);
    return error;
}

elmx_error marshal_job(const s_marshal_job &ar_job, const wchar_t *ap_file, s_debug_error *ap_debug) {
    std::string path;
    convert(path, std::wstring(ap_file));
    return marshal_job(ar_job, path.c_str(), ap_debug);
}

} // namespace lmx
