// Raw output of the value types: plain bytes straight into the stream's
// buffer, without a sentry or formatting per piece.
#ifndef LMX_LMXOUTPUT_H
#define LMX_LMXOUTPUT_H

#include <cstddef>
#include <ios>
#include <ostream>
#include <streambuf>

namespace lmx {

// A short write marks the stream bad, as a formatted insertion would.
inline std::ostream &write_raw(std::ostream &ar_os, const char *ap_data, std::size_t a_size) {
    std::streambuf *p_buf = ar_os.rdbuf();
    if (!p_buf || p_buf->sputn(ap_data, static_cast<std::streamsize>(a_size)) != static_cast<std::streamsize>(a_size))
        ar_os.setstate(std::ios_base::badbit);
    return ar_os;
}

} // namespace lmx

#endif
