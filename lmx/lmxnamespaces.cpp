#include "lmxnamespaces.h"

#include <cstring>

#include "lmxscanner.h"

namespace lmx {

const char *const k_xml_namespace_uri = "http://www.w3.org/XML/1998/namespace";
const char *const k_xsi_namespace_uri = "http://www.w3.org/2001/XMLSchema-instance";

void c_enumerated_namespaces::clear() {
    m_namespaces.clear();
    m_next_id = 1000;
    m_namespaces.set(k_xsi_namespace_uri, ns_xsi);
    m_namespaces.set(k_xml_namespace_uri, ns_xml);
}

int c_enumerated_namespaces::add_namespace(const std::string &ar_uri) {
    int id;
    if (m_namespaces.get(ar_uri, &id))
        return id;
    id = m_next_id++;
    m_namespaces.set(ar_uri.c_str(), id);
    return id;
}

void c_enumerated_namespaces::add_namespace(const std::string &ar_uri, int a_id) {
    if (!m_namespaces.is_defined(ar_uri.c_str()))
        m_namespaces.set(ar_uri.c_str(), a_id);
    if (a_id >= m_next_id)
        m_next_id = a_id + 1;
}

int c_enumerated_namespaces::find_namespace(const std::string &ar_uri) const {
    int id = 0;
    return m_namespaces.get(ar_uri, &id) ? id : 0;
}

const char *c_enumerated_namespaces::find_namespace_from_id(int a_id) const {
    if (a_id == ns_none)
        return c_xml::k_non_namespace.c_str();
    return m_namespaces.reverse_lookup(a_id);
}

void c_namespace_context::add(const std::string &ar_prefix, const std::string &ar_uri) {
    for (s_namesapace_context_item &item : m_items) {
        if (item.prefix == ar_prefix) {
            item.uri = ar_uri;
            return;
        }
    }
    m_items.push_back({ar_prefix, ar_uri});
}

bool c_namespace_context::operator==(const c_namespace_context &ar_other) const {
    if (m_items.size() != ar_other.m_items.size())
        return false;
    for (std::size_t i = 0; i < m_items.size(); ++i)
        if (m_items[i].prefix != ar_other.m_items[i].prefix || m_items[i].uri != ar_other.m_items[i].uri)
            return false;
    return true;
}

int c_xml_local::find_namespace_id(const std::string &ar_prefix) const {
    if (ar_prefix == "xml")
        return ns_xml;
    for (const c_xml_local *p_scope = p_nearest; p_scope; p_scope = p_scope->p_next_declaring()) {
        int id;
        if (p_scope->m_prefixes.get(ar_prefix, &id))
            return id;
    }
    return ar_prefix.empty() ? ns_none : ns_not_found;
}

const char *c_xml_local::find_namespace_prefix(int a_id) const {
    if (a_id == ns_xml)
        return "xml";
    for (const c_xml_local *p_scope = p_nearest; p_scope; p_scope = p_scope->p_next_declaring())
        if (const char *p_prefix = p_scope->m_prefixes.reverse_lookup(a_id))
            return p_prefix;
    return nullptr;
}

const char *c_xml_local::find_first_namespace_prefix(int a_id) const {
    if (a_id == ns_xml)
        return "xml";
    const char *p_found = nullptr;
    for (const c_xml_local *p_scope = p_nearest; p_scope; p_scope = p_scope->p_next_declaring())
        if (const char *p_prefix = p_scope->m_prefixes.reverse_lookup(a_id))
            p_found = p_prefix;
    return p_found;
}

void c_xml_local::extract_namespace_context(c_namespace_context *ap_namespace_context, const c_xml *ap_xml) const {
    // Outermost first, so that inner declarations replace outer ones.
    if (const c_xml_local *p_outer = p_nearest ? p_nearest->p_next_declaring() : nullptr)
        p_outer->extract_namespace_context(ap_namespace_context, ap_xml);
    if (!p_nearest)
        return;
    for (auto it = p_nearest->m_prefixes.begin(); it != p_nearest->m_prefixes.end(); ++it) {
        const char *p_uri = ap_xml->find_namespace_from_id(it->second);
        ap_namespace_context->add(it->first, p_uri ? p_uri : "");
    }
}

void c_cracked_name::p_split(const std::string &ar_name) {
    const char *p_name = ar_name.data();
    const std::size_t length = ar_name.size();
    m_full_name.assign(p_name, length);
    const char *p_colon = static_cast<const char *>(std::memchr(p_name, ':', length));
    m_has_prefix = p_colon != nullptr;
    if (m_has_prefix) {
        std::size_t prefix_length = static_cast<std::size_t>(p_colon - p_name);
        // Documents use one or two prefixes throughout: most names keep it.
        if (m_prefix.size() != prefix_length || std::memcmp(m_prefix.data(), p_name, prefix_length) != 0)
            m_prefix.assign(p_name, prefix_length);
        m_local_name.assign(p_colon + 1, length - prefix_length - 1);
    } else {
        m_prefix.clear();
    }
}

void c_cracked_name::set(const c_xml_local &ar_scope, const std::string &ar_name) {
    p_split(ar_name);
    m_ns_id = ar_scope.find_namespace_id(m_prefix);
}

void c_cracked_name::set_for_attribute(const c_xml_local &ar_scope, const std::string &ar_name) {
    p_split(ar_name);
    m_ns_id = m_has_prefix ? ar_scope.find_namespace_id(m_prefix) : ns_none;
}

} // namespace lmx
