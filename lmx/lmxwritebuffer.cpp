#include "lmxwritebuffer.h"

namespace lmx {

c_write_buffer::c_write_buffer(std::streambuf *ap_target)
    : p_target(ap_target), p_block(new char[k_block_size]) {
    setp(p_block.get(), p_block.get() + k_block_size);
}

void c_write_buffer::drain() {
    std::ptrdiff_t length = pptr() - pbase();
    if (length > 0 && p_target)
        p_target->sputn(pbase(), length);
    setp(p_block.get(), p_block.get() + k_block_size);
}

c_write_buffer::int_type c_write_buffer::overflow(int_type a_c) {
    drain();
    if (!traits_type::eq_int_type(a_c, traits_type::eof())) {
        *pptr() = traits_type::to_char_type(a_c);
        pbump(1);
    }
    return traits_type::not_eof(a_c);
}

std::streamsize c_write_buffer::xsputn(const char *ap_data, std::streamsize a_count) {
    if (a_count <= 0)
        return 0;
    std::size_t length = static_cast<std::size_t>(a_count);
    if (static_cast<std::size_t>(epptr() - pptr()) < length) {
        drain();
        // A piece as large as the block gains nothing from a copy.
        if (length >= k_block_size) {
            if (p_target)
                p_target->sputn(ap_data, a_count);
            return a_count;
        }
    }
    std::memcpy(pptr(), ap_data, length);
    pbump(static_cast<int>(length));
    return a_count;
}

int c_write_buffer::sync() {
    drain();
    return p_target ? p_target->pubsync() : 0;
}

} // namespace lmx
