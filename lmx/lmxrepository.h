// A small associative store from text keys to values, searched linearly.
// Namespace scopes and entity tables hold a handful of entries each, for
// which a vector beats any tree or hash.
#ifndef LMX_LMXREPOSITORY_H
#define LMX_LMXREPOSITORY_H

#include <cstring>
#include <string>
#include <utility>
#include <vector>

namespace lmx {

// Value policy of a repository: how a value is stored, read, released and compared.
template <typename T> struct c_rep_ops {
    // Whether replaced values must outlive their replacement.
    static constexpr bool k_keeps_replaced = false;
    static T make(const T &ar_value) { return ar_value; }
    static const T &get(const T &ar_value) { return ar_value; }
    static void release(T &) {}
    static bool eq(const T &a, const T &b) { return a == b; }
};

// Text values are owned copies.
template <> struct c_rep_ops<const char *> {
    // Entity text may be being read while its entity is redefined or cleared.
    static constexpr bool k_keeps_replaced = true;
    static const char *make(const char *ap_value) {
        std::size_t length = std::strlen(ap_value);
        char *p_copy = new char[length + 1];
        std::memcpy(p_copy, ap_value, length + 1);
        return p_copy;
    }
    static const char *get(const char *ap_value) { return ap_value; }
    static void release(const char *&ap_value) {
        delete[] ap_value;
        ap_value = nullptr;
    }
    static bool eq(const char *a, const char *b) { return std::strcmp(a, b) == 0; }
};

template <typename T, typename Ops = c_rep_ops<T>> class c_repository {
public:
    using entry = std::pair<std::string, T>;
    using const_iterator = typename std::vector<entry>::const_iterator;

    c_repository() = default;
    c_repository(const c_repository &) = delete;
    c_repository &operator=(const c_repository &) = delete;
    virtual void clear() {
        for (entry &e : m_entries)
            p_retire(e.second);
        m_entries.clear();
    }
    virtual ~c_repository() {
        for (entry &e : m_entries)
            Ops::release(e.second);
        for (T &value : m_retired)
            Ops::release(value);
    }

    // Replaces the value of an existing key, or appends a new entry.
    void set(const char *ap_key, const T &ar_value) {
        for (entry &e : m_entries) {
            if (e.first == ap_key) {
                p_retire(e.second);
                e.second = Ops::make(ar_value);
                return;
            }
        }
        m_entries.emplace_back(ap_key, Ops::make(ar_value));
    }
    bool get(const char *ap_key, T *ap_out) const {
        for (const entry &e : m_entries) {
            if (e.first == ap_key) {
                *ap_out = Ops::get(e.second);
                return true;
            }
        }
        return false;
    }
    bool get(const std::string &ar_key, T *ap_out) const {
        for (const entry &e : m_entries) {
            if (e.first == ar_key) {
                *ap_out = Ops::get(e.second);
                return true;
            }
        }
        return false;
    }
    bool is_defined(const char *ap_key) const {
        T ignored;
        return get(ap_key, &ignored);
    }
    // The first key holding the value, or null.
    const char *reverse_lookup(const T &ar_value) const {
        for (const entry &e : m_entries)
            if (Ops::eq(e.second, ar_value))
                return e.first.c_str();
        return nullptr;
    }
    bool empty() const { return m_entries.empty(); }
    const_iterator begin() const { return m_entries.begin(); }
    const_iterator end() const { return m_entries.end(); }
    static const char *get_key(const_iterator a_it) { return a_it->first.c_str(); }
    static const T &get_value(const_iterator a_it) { return Ops::get(a_it->second); }

private:
    void p_retire(T &ar_value) {
        if (Ops::k_keeps_replaced)
            m_retired.push_back(ar_value);
        else
            Ops::release(ar_value);
    }

    std::vector<entry> m_entries;
    std::vector<T> m_retired;
};

} // namespace lmx

#endif
