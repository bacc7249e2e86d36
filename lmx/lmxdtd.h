// The internal DTD subset: only entity declarations are read, everything
// else in a DOCTYPE is skipped. External entities are never fetched.
#ifndef LMX_LMXDTD_H
#define LMX_LMXDTD_H

#include <string>

#include "lmxxmlinput.h"

namespace lmx {

class c_dtd_util {
public:
    explicit c_dtd_util(c_get_for_xml &ar_getter) : ar_getter(ar_getter) {}

    int get() { return ar_getter.get(); }
    void unget(int a_c) { ar_getter.unget(a_c); }
    c_get_for_xml &getter() { return ar_getter; }

    // Reads a name up to white space or ">", expanding parameter entities.
    bool get_entity_value(std::string *ap_value);
    // Reads a quoted entity text; character references are expanded now,
    // general references are kept for when the entity is used.
    bool get_quoted_entity_value(int a_quote, std::string *ap_value);
    // Expands the parameter reference whose "%" has just been read.
    bool select_parameter_entity();

protected:
    bool p_skip_ws_get(int *ap_c);

private:
    c_get_for_xml &ar_getter;
};

class c_internal_dtd : public c_dtd_util {
public:
    explicit c_internal_dtd(c_get_for_xml &ar_getter) : c_dtd_util(ar_getter) {}

    // Reads the rest of a DOCTYPE after "<!DOCTYPE".
    bool read_doctype_decl();
    void reset() {}

private:
    bool p_get_markupdecl_name(std::string *ap_name);
    bool p_read_dtd_entity();
    bool p_skip_to_end_of_markupdecl();
};

} // namespace lmx

#endif
