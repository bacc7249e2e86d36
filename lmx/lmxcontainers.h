// The member containers that bound classes are made of.
//
// A bound class holds nothing but these: one per attribute, child element or
// simple body. Each records whether it holds a value, so that the reader can
// refuse a repeated attribute, the class can answer is_occurs_ok and the
// writer can leave out what was never set. Containers of objects own them:
// what they hold is deleted with them and copied deeply with them.
#ifndef LMX_LMXCONTAINERS_H
#define LMX_LMXCONTAINERS_H

#include <cstddef>
#include <memory>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "lmxpool.h"

namespace lmx {

// ---------------------------------------------------------------- deleter policies
// The containers keep the address of their policy's static deleter, so that
// an element is always destroyed by the code that knows its type.

template <typename T> struct ct_grin_or_happy_ptr_deleter {
    typedef void (*t_deleter)(T *);
    static void deleter(T *ap) { delete ap; }
    // Gives up ownership: the pointer is returned and the holder cleared.
    static T *release(T *&arp) {
        T *p = arp;
        arp = nullptr;
        return p;
    }
};

// For bound classes: copies are made through the virtual clone, so that an
// element of a derived class keeps its class.
template <typename T> struct ct_grin_ptr_deleter : ct_grin_or_happy_ptr_deleter<T> {
    static T *clone(const T &ar_item) { return static_cast<T *>(ar_item.clone()); }
};

// For plain values such as c_any_info: copies are made by copy construction.
template <typename T> struct ct_happy_ptr_deleter : ct_grin_or_happy_ptr_deleter<T> {
    static T *clone(const T &ar_item) { return new T(ar_item); }
};

// ---------------------------------------------------------------- containers of owned pointers

// A vector C of owning pointers to T, deleted by D::deleter. Copies copy
// every element by construction.
template <typename T, typename C = std::vector<T *>, typename D = ct_happy_ptr_deleter<T>>
class ct_non_pod_container {
public:
    typedef T value_type;
    typedef C container_type;
    typedef typename D::t_deleter t_deleter;

    ct_non_pod_container() = default;
    ct_non_pod_container(const ct_non_pod_container &ar_other) { p_copy_from(ar_other, &p_copy_item); }
    ct_non_pod_container &operator=(const ct_non_pod_container &ar_other) {
        ct_non_pod_container copy(ar_other);
        swap(copy);
        return *this;
    }
    ~ct_non_pod_container() { clear(); }

    // Takes ownership of ap_item; it is deleted if it cannot be stored.
    void push_back(T *ap_item) {
        std::unique_ptr<T, t_deleter> owner(ap_item, p_deleter);
        m_items.push_back(owner.get());
        owner.release();
    }
    // Takes ownership from the smart pointer, also when storing fails.
    template <typename P> void push_back_w_autop(P &ar_item) {
        std::unique_ptr<T, t_deleter> owner(ar_item.release(), p_deleter);
        m_items.push_back(owner.get());
        owner.release();
    }
    template <typename P> void push_back_w_autop(P &&ar_item) { push_back_w_autop(ar_item); }
    void insert(std::size_t a_index, T *ap_item) {
        std::unique_ptr<T, t_deleter> owner(ap_item, p_deleter);
        if (a_index > m_items.size())
            throw std::out_of_range("lmx container index out of range");
        m_items.insert(m_items.begin() + static_cast<std::ptrdiff_t>(a_index), owner.get());
        owner.release();
    }
    // Deletes the element at a_index and closes the gap.
    void erase(std::size_t a_index) {
        T *p_item = m_items.at(a_index);
        m_items.erase(m_items.begin() + static_cast<std::ptrdiff_t>(a_index));
        p_deleter(p_item);
    }
    // Replaces the element at a_index, deleting the old one.
    void replace(std::size_t a_index, T *ap_item) {
        std::unique_ptr<T, t_deleter> owner(ap_item, p_deleter);
        T *&ar_slot = m_items.at(a_index);
        T *p_old = ar_slot;
        ar_slot = owner.release();
        p_deleter(p_old);
    }

    T &at(std::size_t a_index) { return *m_items.at(a_index); }
    const T &at(std::size_t a_index) const { return *m_items.at(a_index); }
    T &operator[](std::size_t a_index) { return *m_items[a_index]; }
    const T &operator[](std::size_t a_index) const { return *m_items[a_index]; }
    T &back() { return *m_items.back(); }
    const T &back() const { return *m_items.back(); }
    C &raw_container() { return m_items; }
    const C &raw_container() const { return m_items; }
    std::size_t size() const { return m_items.size(); }
    bool empty() const { return m_items.empty(); }
    void clear() {
        for (T *p_item : m_items)
            p_deleter(p_item);
        m_items.clear();
    }
    void swap(ct_non_pod_container &ar_other) {
        m_items.swap(ar_other.m_items);
        std::swap(p_deleter, ar_other.p_deleter);
    }

protected:
    typedef T *(*t_copier)(const T &);
    static T *p_copy_item(const T &ar_item) { return new T(ar_item); }
    void p_copy_from(const ct_non_pod_container &ar_other, t_copier ap_copier) {
        m_items.reserve(ar_other.m_items.size());
        for (const T *p_item : ar_other.m_items)
            push_back(ap_copier(*p_item));
    }

    C m_items;
    t_deleter p_deleter = &D::deleter;
};

// The same, copying each element by its clone.
template <typename T, typename C = std::vector<T *>, typename D = ct_grin_ptr_deleter<T>>
class ct_clonable_container : public ct_non_pod_container<T, C, D> {
    typedef ct_non_pod_container<T, C, D> t_base;

public:
    ct_clonable_container() = default;
    ct_clonable_container(const ct_clonable_container &ar_other) : t_base() {
        this->p_copy_from(ar_other, &D::clone);
    }
    ct_clonable_container &operator=(const ct_clonable_container &ar_other) {
        ct_clonable_container copy(ar_other);
        this->swap(copy);
        return *this;
    }
};

// A vector of plain values.
template <typename T> class ct_pod_container {
public:
    typedef T value_type;

    void push_back(const T &ar_value) { m_items.push_back(ar_value); }
    void insert(std::size_t a_index, const T &ar_value) {
        if (a_index > m_items.size())
            throw std::out_of_range("lmx container index out of range");
        m_items.insert(m_items.begin() + static_cast<std::ptrdiff_t>(a_index), ar_value);
    }
    void erase(std::size_t a_index) {
        m_items.at(a_index);
        m_items.erase(m_items.begin() + static_cast<std::ptrdiff_t>(a_index));
    }
    T &at(std::size_t a_index) { return m_items.at(a_index); }
    const T &at(std::size_t a_index) const { return m_items.at(a_index); }
    T &operator[](std::size_t a_index) { return m_items[a_index]; }
    const T &operator[](std::size_t a_index) const { return m_items[a_index]; }
    T &back() { return m_items.back(); }
    const T &back() const { return m_items.back(); }
    std::vector<T> &raw_container() { return m_items; }
    const std::vector<T> &raw_container() const { return m_items; }
    std::size_t size() const { return m_items.size(); }
    bool empty() const { return m_items.empty(); }
    void clear() { m_items.clear(); }
    void swap(ct_pod_container &ar_other) { m_items.swap(ar_other.m_items); }

private:
    std::vector<T> m_items;
};

// ---------------------------------------------------------------- simple members: interfaces

// Storage policy of a member outside mixed content: it keeps no text beside
// its value, and the text hooks all lead to one string that nothing reads.
template <typename T> class ct_non_mixed {
public:
    static bool is_in_mixed() { return false; }
    static std::string &unused_text() {
        static std::string s_unused;
        return s_unused;
    }
};

// The two shapes of a simple member, as tags. The reader and the writer
// reach a member through templates on its concrete type, so the members
// below are not virtual: a bound object carries no table pointer per value.
//
// A member holding values of T read as V (the same type, or c_any_info for
// wildcards) has is_in_mixed, is_value_set, mk_new_space (room for one more
// value, marking the member set), get_new_space_text_ref,
// get_new_space_value_ref, count, access_text and access_value.
//
// A member holding one list of values in one text has the same, and
// start_new_list (empties the list and marks the member set),
// new_list_size and list_count (lists held: one, or none); count and
// access_value are about the values in the list.
class c_marshalable {};

class c_marshalable_simple : public c_marshalable {};

template <typename T, typename V = T> class cit_marshalable_simple : public c_marshalable_simple {};

template <typename T, typename V = T> class cit_marshalable_simple_list : public c_marshalable_simple {};

// ---------------------------------------------------------------- simple members

// One value of a required attribute or element, and whether it is set.
template <typename T, typename V = T, typename M = ct_non_mixed<T>>
class ct_simple_pod_single : public cit_marshalable_simple<T, V> {
public:
    typedef T value_type;

    ct_simple_pod_single() : m_value(), m_is_set(false) {}
    ct_simple_pod_single(const ct_simple_pod_single &) = default;
    ct_simple_pod_single &operator=(const ct_simple_pod_single &) = default;

    const T &get() const { return m_value; }
    // Access for changing in place; marks the member as set.
    T &get_for_update() {
        m_is_set = true;
        return m_value;
    }
    void set(const T &ar_value) {
        m_value = ar_value;
        m_is_set = true;
    }
    void unset() {
        m_value = T();
        m_is_set = false;
    }
    bool is_occurs_ok() const { return m_is_set; }
    void swap(ct_simple_pod_single &ar_other) {
        using std::swap;
        swap(m_value, ar_other.m_value);
        swap(m_is_set, ar_other.m_is_set);
    }

    bool is_in_mixed() const { return M::is_in_mixed(); }
    bool is_value_set() const { return m_is_set; }
    void mk_new_space() { m_is_set = true; }
    std::string &get_new_space_text_ref() { return M::unused_text(); }
    T &get_new_space_value_ref() { return m_value; }
    std::size_t count() const { return m_is_set ? 1 : 0; }
    const std::string &access_text(std::size_t) const { return M::unused_text(); }
    const T &access_value(std::size_t) const { return m_value; }

private:
    T m_value;
    bool m_is_set;
};

// A member kind over the storage of Base under a name of its own, which
// generated code chooses by: swap takes the kind itself, and an optional
// kind is never missing.
template <typename Self, typename Base, bool Optional> class ct_simple_kind : public Base {
public:
    bool is_occurs_ok() const { return Optional || Base::is_occurs_ok(); }
    void swap(Self &ar_other) { Base::swap(ar_other); }
};

// An optional one: never missing, left out by the writer while unset.
template <typename T, typename V = T, typename M = ct_non_mixed<T>>
class ct_simple_pod_optional
    : public ct_simple_kind<ct_simple_pod_optional<T, V, M>, ct_simple_pod_single<T, V, M>, true> {};

// Values that are expensive to copy (strings, dates, binaries) have the
// same shape; the names tell the generated code which to use.
template <typename T, typename V = T, typename M = ct_non_mixed<T>>
class ct_simple_non_pod_single
    : public ct_simple_kind<ct_simple_non_pod_single<T, V, M>, ct_simple_pod_single<T, V, M>, false> {};

template <typename T, typename V = T, typename M = ct_non_mixed<T>>
class ct_simple_non_pod_optional
    : public ct_simple_kind<ct_simple_non_pod_optional<T, V, M>, ct_simple_pod_single<T, V, M>, true> {};

// A list of values held in one text of a required element or attribute. It
// counts as set once read, or once a value has been put in.
template <typename T, typename V = T, typename M = ct_non_mixed<T>>
class ct_simple_pod_list_single : public cit_marshalable_simple_list<T, V> {
public:
    typedef T value_type;

    const T &get(std::size_t a_index) const { return m_values.at(a_index); }
    void set(std::size_t a_index, const T &ar_value) {
        m_values.at(a_index) = ar_value;
        m_is_set = true;
    }
    void append(const T &ar_value) {
        m_values.push_back(ar_value);
        m_is_set = true;
    }
    void insert(std::size_t a_index, const T &ar_value) {
        m_values.insert(a_index, ar_value);
        m_is_set = true;
    }
    void erase(std::size_t a_index) { m_values.erase(a_index); }
    void clear() { m_values.clear(); }
    std::size_t size() const { return m_values.size(); }
    bool empty() const { return m_values.empty(); }
    // Room for a_count values, so that a list read item by item is held
    // without spare capacity.
    void reserve(std::size_t a_count) { m_values.raw_container().reserve(a_count); }
    void unset() {
        m_values.clear();
        m_is_set = false;
    }
    bool is_occurs_ok() const { return m_is_set; }
    const ct_pod_container<T> &get_container() const { return m_values; }
    void swap(ct_simple_pod_list_single &ar_other) {
        m_values.swap(ar_other.m_values);
        std::swap(m_is_set, ar_other.m_is_set);
    }

    bool is_in_mixed() const { return M::is_in_mixed(); }
    bool is_value_set() const { return m_is_set; }
    void start_new_list() {
        m_values.clear();
        m_is_set = true;
    }
    std::string &get_new_space_text_ref() { return M::unused_text(); }
    void mk_new_space() {
        m_values.push_back(T());
        m_is_set = true;
    }
    T &get_new_space_value_ref() { return m_values.back(); }
    std::size_t new_list_size() const { return m_values.size(); }
    std::size_t list_count() const { return m_is_set ? 1 : 0; }
    const std::string &access_text(std::size_t) const { return M::unused_text(); }
    std::size_t count() const { return m_values.size(); }
    const T &access_value(std::size_t a_index) const { return m_values[a_index]; }

protected:
    ct_pod_container<T> m_values;
    bool m_is_set = false;
};

// An optional list: never missing; an empty list is not written.
template <typename T, typename V = T, typename M = ct_non_mixed<T>>
class ct_simple_pod_list_optional
    : public ct_simple_kind<ct_simple_pod_list_optional<T, V, M>, ct_simple_pod_list_single<T, V, M>, true> {
public:
    bool is_value_set() const { return !this->m_values.empty(); }
    std::size_t list_count() const { return this->m_values.empty() ? 0 : 1; }
};

// ---------------------------------------------------------------- complex members

// An optional child object, owned, with the address of its deleter.
template <typename T, typename D = ct_grin_ptr_deleter<T>> class ct_complex_optional {
public:
    typedef T value_type;

    ct_complex_optional() : p_item(nullptr, &D::deleter) {}
    ct_complex_optional(const ct_complex_optional &ar_other) : p_item(nullptr, &D::deleter) {
        if (ar_other.p_item)
            p_item.reset(D::clone(*ar_other.p_item));
    }
    ct_complex_optional &operator=(const ct_complex_optional &ar_other) {
        ct_complex_optional copy(ar_other);
        swap(copy);
        return *this;
    }

    // Makes a default object on first use.
    T &get() {
        if (!p_item)
            p_item.reset(new T());
        return *p_item;
    }
    // The object as it is: null while unset.
    const T *get() const { return p_item.get(); }
    bool is_value_set() const { return static_cast<bool>(p_item); }
    bool is_occurs_ok() const { return true; }
    // Stores a deep copy.
    void assign(const T &ar_item) { p_item.reset(D::clone(ar_item)); }
    // Takes ownership.
    void assign(T *ap_item) { p_item.reset(ap_item); }
    void unset() { p_item.reset(); }
    void swap(ct_complex_optional &ar_other) { p_item.swap(ar_other.p_item); }

private:
    std::unique_ptr<T, typename D::t_deleter> p_item;
};

// A required child: missing until set.
template <typename T, typename D = ct_grin_ptr_deleter<T>>
class ct_complex_single : public ct_complex_optional<T, D> {
public:
    bool is_occurs_ok() const { return this->is_value_set(); }
    void swap(ct_complex_single &ar_other) { ct_complex_optional<T, D>::swap(ar_other); }
};

// A repeated child: owned objects in document order. Most such runs are short
// (one or two items), so their vectors of pointers come from the pool, as
// does the container itself when a choice holds a run as its alternative.
template <typename T, typename D = ct_grin_ptr_deleter<T>>
class ct_complex_multi : public ct_clonable_container<T, std::vector<T *, ct_pool_allocator<T *>>, D> {
    typedef ct_clonable_container<T, std::vector<T *, ct_pool_allocator<T *>>, D> t_base;

public:
    LMX_POOLED_OBJECT

    // Adds a default object at the end and gives it.
    T &append() {
        this->push_back(new T());
        return this->back();
    }
    // Adds a deep copy at the end.
    T &append(const T &ar_item) {
        this->push_back(D::clone(ar_item));
        return this->back();
    }
    T &get(std::size_t a_index) { return this->at(a_index); }
    const T &get(std::size_t a_index) const { return this->at(a_index); }
    T &insert(std::size_t a_index) {
        t_base::insert(a_index, new T());
        return this->at(a_index);
    }
    T &insert(std::size_t a_index, const T &ar_item) {
        t_base::insert(a_index, D::clone(ar_item));
        return this->at(a_index);
    }
    // Replaces item a_index by a deep copy.
    void assign(std::size_t a_index, const T &ar_item) {
        this->at(a_index);
        this->replace(a_index, D::clone(ar_item));
    }
    bool is_occurs_ok(std::size_t a_min) const { return this->size() >= a_min; }
    bool is_occurs_ok(std::size_t a_min, std::size_t a_max) const {
        return this->size() >= a_min && this->size() <= a_max;
    }
    void swap(ct_complex_multi &ar_other) { t_base::swap(ar_other); }
};

} // namespace lmx

#endif
