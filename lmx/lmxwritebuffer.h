// The writer's output buffer.
//
// A document is written as a great many short pieces: a tab, "<", a name, a
// quote. Handing each to the caller's stream costs a virtual call and the
// stream's own bookkeeping; copying them into one block of the writer's and
// handing the block on when it is full costs a memcpy. The buffer is a
// streambuf, so that the value types' output functions, which take a
// std::ostream, write into the same block in the same order.
#ifndef LMX_LMXWRITEBUFFER_H
#define LMX_LMXWRITEBUFFER_H

#include <cstddef>
#include <cstring>
#include <memory>
#include <streambuf>

namespace lmx {

class c_write_buffer : public std::streambuf {
public:
    static constexpr std::size_t k_block_size = 32 * 1024;

    // Hands its bytes on to ap_target; a null target drops them.
    explicit c_write_buffer(std::streambuf *ap_target);
    c_write_buffer(const c_write_buffer &) = delete;
    c_write_buffer &operator=(const c_write_buffer &) = delete;
    ~c_write_buffer() override { drain(); }

    void put(const char *ap_data, std::size_t a_length) {
        if (static_cast<std::size_t>(epptr() - pptr()) >= a_length) {
            std::memcpy(pptr(), ap_data, a_length);
            pbump(static_cast<int>(a_length));
        } else {
            xsputn(ap_data, static_cast<std::streamsize>(a_length));
        }
    }
    void put(char a_c) {
        if (pptr() == epptr())
            drain();
        *pptr() = a_c;
        pbump(1);
    }
    // Hands what is held to the target. The target itself is not flushed.
    void drain();

protected:
    int_type overflow(int_type a_c) override;
    std::streamsize xsputn(const char *ap_data, std::streamsize a_count) override;
    // A flush of a stream over this buffer reaches the target.
    int sync() override;

private:
    std::streambuf *p_target;
    std::unique_ptr<char[]> p_block;
};

} // namespace lmx

#endif
