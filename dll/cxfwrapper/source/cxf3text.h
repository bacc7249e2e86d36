// Crossings between the public narrow strings (UTF-8) and the binding's wide
// strings (UTF-16 code units), the current time as the files record it, and
// the check that a handle refers to something.
#ifndef TESSARINE_CXF3TEXT_H
#define TESSARINE_CXF3TEXT_H

#include <lmx/lmxtypes.h>

#include <boost/shared_ptr.hpp>

#include <stdexcept>
#include <string>

// The text up to its first NUL, as UTF-16.
std::wstring ToWide(const std::string &ar_text);
// The text up to its first NUL, as UTF-8; "" when it cannot be converted.
std::string ToNarrow(const std::wstring &ar_text);

// The current time in UTC, whole seconds, with the UTC marker.
lmx::c_datetime CurrentUtcDateTime();

// The object a handle refers to. Handles made for unknown ids refer to
// nothing; using one throws std::logic_error naming the class.
template <typename T> T &RequireTarget(const boost::shared_ptr<T> &ar_target, const char *ap_class_name) {
    if (!ar_target)
        throw std::logic_error(std::string(ap_class_name) + ": the handle refers to nothing (unknown id)");
    return *ar_target;
}

#endif // TESSARINE_CXF3TEXT_H
