// Namespace numbering and namespace scopes.
//
// Every namespace URI a document or a binding uses gets a number; names are
// matched by number. Scopes map prefixes to numbers and chain to their parent.
#ifndef LMX_LMXNAMESPACES_H
#define LMX_LMXNAMESPACES_H

#include <string>
#include <vector>

#include "lmxrepository.h"

namespace lmx {

enum elxp_xml_known_namespaces {
    ns_not_found = 0, // a prefix with no declaration
    ns_none = 1,      // no namespace
    ns_xml = 2,       // the prefix "xml", always
    ns_xsi = 5        // the XML Schema instance namespace
};

extern const char *const k_xml_namespace_uri;
extern const char *const k_xsi_namespace_uri;

// Numbers namespace URIs; ids of URIs other than the fixed ones start at 1000.
class c_enumerated_namespaces {
public:
    c_enumerated_namespaces() { clear(); }

    // Back to the fixed entries only.
    void clear();
    // The id of a known URI, or the next free id.
    int add_namespace(const std::string &ar_uri);
    // Gives the URI this id if it is new.
    void add_namespace(const std::string &ar_uri, int a_id);
    // The id, or 0.
    int find_namespace(const std::string &ar_uri) const;
    // The URI of an id; id 1 gives the empty "URI" of names in no namespace.
    const char *find_namespace_from_id(int a_id) const;

private:
    int m_next_id = 1000;
    c_repository<int> m_namespaces;
};

struct s_namesapace_context_item {
    std::string prefix;
    std::string uri;
};

// The prefix declarations in force at a point of a document.
class c_namespace_context {
public:
    c_namespace_context() { m_items.reserve(6); }

    // Replaces the URI of a prefix already there, else appends.
    void add(const std::string &ar_prefix, const std::string &ar_uri);
    std::size_t size() const { return m_items.size(); }
    const std::string &get_ns_prefix(std::size_t a_index) const { return m_items[a_index].prefix; }
    const std::string &get_ns_uri(std::size_t a_index) const { return m_items[a_index].uri; }
    void swap(c_namespace_context &ar_other) { m_items.swap(ar_other.m_items); }
    bool operator==(const c_namespace_context &ar_other) const;

private:
    std::vector<s_namesapace_context_item> m_items;
};

class c_xml;

// One namespace scope: prefix declarations of one element.
class c_xml_local {
public:
    explicit c_xml_local(c_xml_local *ap_parent = nullptr)
        : p_parent(ap_parent), p_nearest(ap_parent ? ap_parent->p_nearest : nullptr) {}
    c_xml_local(const c_xml_local &) = delete;
    c_xml_local &operator=(const c_xml_local &) = delete;
    virtual ~c_xml_local() = default;

    void add_namespace(const std::string &ar_prefix, int a_id) {
        m_prefixes.set(ar_prefix.c_str(), a_id);
        p_nearest = this;
    }
    void clear() {
        if (!m_prefixes.empty())
            m_prefixes.clear();
    }
    c_xml_local *get_parent() const { return p_parent; }

    // The id a prefix stands for here: "xml" is 2; unknown: 1 for the empty
    // prefix, else 0.
    int find_namespace_id(const std::string &ar_prefix) const;
    // The innermost prefix declared for an id, or null.
    const char *find_namespace_prefix(int a_id) const;
    // The outermost prefix declared for an id, or null.
    const char *find_first_namespace_prefix(int a_id) const;
    // Adds every declaration in force here to the context, inner ones winning.
    void extract_namespace_context(c_namespace_context *ap_namespace_context, const c_xml *ap_xml) const;

private:
    const c_xml_local *p_next_declaring() const {
        return p_parent ? p_parent->p_nearest : nullptr;
    }

    c_xml_local *p_parent;
    c_xml_local *p_nearest;
    c_repository<int> m_prefixes;
};

// A tag or attribute name split into prefix, local name and namespace id.
class c_cracked_name {
public:
    void set(const c_xml_local &ar_scope, const std::string &ar_name);
    // As set, but an unprefixed attribute is in no namespace (id 1).
    void set_for_attribute(const c_xml_local &ar_scope, const std::string &ar_name);

    const std::string &get_full_name() const { return m_full_name; }
    bool has_prefix() const { return m_has_prefix; }
    int get_ns_id() const { return m_ns_id; }
    // The id of an element name: 1 for an unprefixed name that found nothing.
    int get_element_ns_id() const { return (m_ns_id == ns_not_found && !m_has_prefix) ? ns_none : m_ns_id; }
    // An unprefixed name is its own local name; it is not copied twice.
    const std::string &get_local_name() const { return m_has_prefix ? m_local_name : m_full_name; }
    const std::string &get_prefix() const { return m_prefix; }
    void set_ns_id(int a_id) { m_ns_id = a_id; }

private:
    void p_split(const std::string &ar_name);

    std::string m_full_name;
    bool m_has_prefix = false;
    int m_ns_id = ns_not_found;
    std::string m_local_name;
    std::string m_prefix;
};

} // namespace lmx

#endif
