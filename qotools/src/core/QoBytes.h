// QoBytes: copying field values, a few bytes each, in the filters' hot paths
// (internal).
//
// A block of up to kInline bytes is copied with fixed-size loads and stores
// inline, not by the C runtime: the runtime under Wine copies a block's last
// bytes with string instructions, several nanoseconds for a value of a few
// bytes, and even the native C library's call costs more than the copy for
// the values of a record. Appending to a std::string takes the inline copy in
// the Windows build only: natively std::string's own append is as fast.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>

namespace qobytes {

constexpr std::size_t kInline = 256; // longer blocks go to the runtime

// Copies `n` bytes (meant for up to kInline); the fixed-size memcpy calls
// become plain moves.
inline void CopyInline(char *to, char const *from, std::size_t n)
{
    if (n >= 16) {
        // 16-byte steps, the last one ending at the block's end.
        std::uint64_t a, b;
        for (std::size_t i = 0; i + 16 < n; i += 16) {
            std::memcpy(&a, from + i, 8);
            std::memcpy(&b, from + i + 8, 8);
            std::memcpy(to + i, &a, 8);
            std::memcpy(to + i + 8, &b, 8);
        }
        std::memcpy(&a, from + n - 16, 8);
        std::memcpy(&b, from + n - 8, 8);
        std::memcpy(to + n - 16, &a, 8);
        std::memcpy(to + n - 8, &b, 8);
    } else if (n >= 8) {
        std::uint64_t head, tail;
        std::memcpy(&head, from, 8);
        std::memcpy(&tail, from + n - 8, 8);
        std::memcpy(to, &head, 8);
        std::memcpy(to + n - 8, &tail, 8);
    } else if (n >= 4) {
        std::uint32_t head, tail;
        std::memcpy(&head, from, 4);
        std::memcpy(&tail, from + n - 4, 4);
        std::memcpy(to, &head, 4);
        std::memcpy(to + n - 4, &tail, 4);
    } else if (n > 0) {
        to[0] = from[0];
        to[n / 2] = from[n / 2];
        to[n - 1] = from[n - 1];
    }
}

// memcpy of `n` bytes; the blocks must not overlap.
inline void Copy(void *to, void const *from, std::size_t n)
{
    if (n <= kInline) {
        CopyInline(static_cast<char *>(to), static_cast<char const *>(from), n);
        return;
    }
    std::memcpy(to, from, n);
}

// out.append(from, n); `from` must not point into `out`.
inline void Append(std::string &out, char const *from, std::size_t n)
{
#if defined(_WIN32)
    if (n <= kInline) {
        // Lengthening fills with the runtime's memset, which uses plain
        // stores; then the bytes are written over the fill.
        std::size_t const at = out.size();
        out.resize(at + n);
        CopyInline(&out[at], from, n);
        return;
    }
#endif
    out.append(from, n);
}

} // namespace qobytes
