#pragma once

#include "Writing/WrittenForm.h"

#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>
#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace ovrin_yaml {

/// Thrown where the fast reader isn't sure what a document means, and caught by WrittenFormReader::Read.
struct NotSure {};

// Scanning of blanks and plain texts, many bytes at a time. Whatever is scanned ends in a line end, and
// kScanAhead bytes behind it must be readable.

inline constexpr std::size_t kScanAhead = 16;

constexpr std::uint64_t EachByte(std::uint64_t byte) {
    return byte * 0x0101010101010101u;
}

/// Sixteen bytes that are compared at once; the result of a comparison has ff for true.
using ByteVector [[gnu::vector_size(16)]] = std::uint8_t;

#ifdef __SSE2__
/// The lowest bits of the results of a comparison, side by side.
inline unsigned BitOfEachByte(ByteVector results) {
    return static_cast<unsigned>(_mm_movemask_epi8(reinterpret_cast<__m128i>(results)));
}
#else
/// The same of eight bytes: the factor moves each bit to its place in the top byte.
///
///     bytes, the last one first    00 ff ff 00  00 00 00 00
///     & EachByte(1)                00 01 01 00  00 00 00 00
///     * factor >> 56                                     60    01100000: the bytes 5 and 6
inline unsigned BitOfEachByte(std::uint64_t bytes) {
    return static_cast<unsigned>((bytes & EachByte(1)) * 0x0102040810204080u >> 56);
}
inline unsigned BitOfEachByte(ByteVector results) {
    std::uint64_t halves[2];
    std::memcpy(halves, &results, sizeof halves);
    return BitOfEachByte(halves[0]) | BitOfEachByte(halves[1]) << 8;
}
#endif

/// The first byte that is no letter, digit or one of "-./_". These are most of what stands in a scene, and
/// plain in both styles wherever they don't begin a text.
///
///     text          m_Name: Box-2/b#
///     '-' to '9'    ...........111..    one range: "-./" and the digits
///     letters       1.1111..111...1.    of both cases, which differ in one bit
///     '_'           .1..............
///     others        ......11.......1    in none of them
///                         ^ the first of them ends the word
inline const char* SkipWord(const char* p) {
    constexpr std::uint8_t kFirst = '-', kSpan = '9' - '-', kLetter = 'a', kLetters = 'z' - 'a';
    constexpr std::uint8_t kCase = 0x20, kUnderscore = '_';
    static_assert(sizeof(ByteVector) <= kScanAhead);
    for (;; p += sizeof(ByteVector)) {
        ByteVector bytes;
        std::memcpy(&bytes, p, sizeof bytes);
        // Ranges begin at zero, so that one comparison tells what is in them.
        const auto ofWord =
            (bytes - kFirst <= kSpan) | ((bytes | kCase) - kLetter <= kLetters) | (bytes == kUnderscore);
        // Where a word ends is hard to foretell, so all are looked at without a branch.
        const unsigned others = BitOfEachByte(reinterpret_cast<ByteVector>(ofWord)) ^ 0xffffu;
        if (others) return p + std::countr_zero(others);
    }
}

/// The first byte that is no blank.
///
///     text                    · · · · m _ N a
///     ^ EachByte(' ')         0 0 0 0 x x x x    counted from the lowest byte, which is the first
inline const char* SkipBlanks(const char* p) {
    for (;; p += 8) {
        std::uint64_t bytes;
        std::memcpy(&bytes, p, sizeof bytes);
        if (const std::uint64_t others = bytes ^ EachByte(' ')) return p + std::countr_zero(others) / 8;
    }
}

/// The end of the text of a block style node on this line: the line end, or a colon that ends a key.
inline const char* ScanPlain(const char* from) {
    for (const char* p = SkipWord(from);; p = SkipWord(p + 1)) {
        switch (*p) {
        case '\n':
            return p;
        case ':':
            if (p[1] != ' ' && p[1] != '\n') break;
            if (p[-1] == ' ') throw NotSure();
            return p;
        case ' ': // not before a comment, and not at an end, where the parser would drop it
            if (p[1] == '#' || p[1] == '\n') throw NotSure();
            break;
        case '#':
            break;
        default:
            if (!IsPlain(*p)) throw NotSure();
        }
    }
}

/// The end of the text of a flow style node. A blank, a line end or a sign that has a meaning of its own is
/// met by the caller, who wants none of them.
inline const char* ScanPlainInFlow(const char* from) {
    if (!IsPlainStart(*from) && !(*from == '-' && IsPlainInFlow(from[1]))) throw NotSure();
    const char* p = SkipWord(from);
    while (IsPlainInFlow(*p) || (*p == ' ' && IsPlainInFlow(p[1]))) p = SkipWord(p + 1);
    return p;
}

} // namespace ovrin_yaml
