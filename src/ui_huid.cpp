// HUID: the hash of a name and the static names.
//
//   the hash         Tiger's compression over the name in zero-padded 64-byte blocks, A-Z folded
//   construction     the checked run-time constructor, the compile-time one of the static names
//   static names     MAT_NAME_*, FNT_NAME_*
#include "ui_huid.h"

#include "ui_debug.h"
#include "ui_huid_sboxes.h"

#include <cstddef>
#include <cstring>

namespace qorui {

// ---------------------------------------------------------------------------------------------
// The hash
// ---------------------------------------------------------------------------------------------
//
// Tiger's compression function with its S-boxes and initial state, but none of its padding: the
// last block of a name is filled with zeros only, there is no length field, and the hash is the
// word a. An empty name compresses nothing and gives the initial a. Everything is constexpr so
// that the static names are hashed by the compiler; at run time the same code runs on the stack.
namespace {

using huid_detail::k_tiger_sboxes;

size_t const k_block_bytes = 64;

struct STigerState {
    uint64_t a, b, c;
};

constexpr STigerState k_tiger_initial = {0x0123456789ABCDEFULL, 0xFEDCBA9876543210ULL, 0xF096A5B4C3B2E187ULL};

constexpr uint64_t sbox(int _table, uint64_t _word, int _byte) {
    return k_tiger_sboxes[_table][(_word >> (8 * _byte)) & 0xFF];
}

// One round: c takes the message word, a and b are stirred by the even and odd bytes of c.
constexpr void tiger_round(uint64_t &_a, uint64_t &_b, uint64_t &_c, uint64_t _x, uint64_t _mul) {
    _c ^= _x;
    _a -= sbox(0, _c, 0) ^ sbox(1, _c, 2) ^ sbox(2, _c, 4) ^ sbox(3, _c, 6);
    _b += sbox(3, _c, 1) ^ sbox(2, _c, 3) ^ sbox(1, _c, 5) ^ sbox(0, _c, 7);
    _b *= _mul;
}

// Eight rounds, the roles of a, b and c rotating each round.
constexpr void tiger_pass(uint64_t &_a, uint64_t &_b, uint64_t &_c, uint64_t const (&_x)[8], uint64_t _mul) {
    tiger_round(_a, _b, _c, _x[0], _mul);
    tiger_round(_b, _c, _a, _x[1], _mul);
    tiger_round(_c, _a, _b, _x[2], _mul);
    tiger_round(_a, _b, _c, _x[3], _mul);
    tiger_round(_b, _c, _a, _x[4], _mul);
    tiger_round(_c, _a, _b, _x[5], _mul);
    tiger_round(_a, _b, _c, _x[6], _mul);
    tiger_round(_b, _c, _a, _x[7], _mul);
}

constexpr void tiger_key_schedule(uint64_t (&_x)[8]) {
    _x[0] -= _x[7] ^ 0xA5A5A5A5A5A5A5A5ULL;
    _x[1] ^= _x[0];
    _x[2] += _x[1];
    _x[3] -= _x[2] ^ (~_x[1] << 19);
    _x[4] ^= _x[3];
    _x[5] += _x[4];
    _x[6] -= _x[5] ^ (~_x[4] >> 23);
    _x[7] ^= _x[6];
    _x[0] += _x[7];
    _x[1] -= _x[0] ^ (~_x[7] << 19);
    _x[2] ^= _x[1];
    _x[3] += _x[2];
    _x[4] -= _x[3] ^ (~_x[2] >> 23);
    _x[5] ^= _x[4];
    _x[6] += _x[5];
    _x[7] -= _x[6] ^ 0x0123456789ABCDEFULL;
}

// Three passes with the multipliers 5, 7, 9, the key schedule between them, then the feed-forward.
constexpr void tiger_compress(STigerState &_s, uint64_t (&_x)[8]) {
    uint64_t a = _s.a, b = _s.b, c = _s.c;
    tiger_pass(a, b, c, _x, 5);
    tiger_key_schedule(_x);
    tiger_pass(c, a, b, _x, 7);
    tiger_key_schedule(_x);
    tiger_pass(b, c, a, _x, 9);
    _s.a = a ^ _s.a;
    _s.b = b - _s.b;
    _s.c = c + _s.c;
}

// Only ASCII letters fold; every other byte stays as it is.
constexpr uint8_t fold(char _c) {
    uint8_t const byte = static_cast<uint8_t>(_c);
    return byte >= 'A' && byte <= 'Z' ? static_cast<uint8_t>(byte - 'A' + 'a') : byte;
}

constexpr size_t name_length(char const *_name) {
    size_t n = 0;
    while (_name[n])
        ++n;
    return n;
}

constexpr uint64_t hash_name(char const *_name) {
    STigerState state = k_tiger_initial;
    size_t const length = name_length(_name);
    for (size_t start = 0; start < length; start += k_block_bytes) {
        uint64_t block[8] = {}; // eight little-endian words; zero beyond the name
        for (size_t i = 0; i < k_block_bytes && start + i < length; ++i)
            block[i / 8] |= static_cast<uint64_t>(fold(_name[start + i])) << (8 * (i % 8));
        tiger_compress(state, block);
    }
    return state.a;
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Construction
// ---------------------------------------------------------------------------------------------

// The copy stops at the last byte that leaves room for the terminator; m_name starts zeroed.
constexpr HUID::HUID(char const *_name, SConstant) : m_name(), m_hash(hash_name(_name)) {
    for (size_t i = 0; i + 1 < sizeof(m_name) && _name[i]; ++i)
        m_name[i] = _name[i];
}

HUID::HUID(char const *_name) : HUID(checked_name(_name), SConstant()) {}

char const *HUID::checked_name(char const *_name) {
    if (!QOR_CHECK(_name != nullptr)) return "";
    QOR_CHECK(strlen(_name) < sizeof(m_name));
    return _name;
}

// ---------------------------------------------------------------------------------------------
// Static names
// ---------------------------------------------------------------------------------------------
//
// Constant-initialised: the compiler hashes them, so they hold their values before the first
// constructor of the process runs, and static constructors in any other file (registrars,
// pools, the service) may use them whatever the order of dynamic initialisation. A function-local
// static would be safe as well, but would turn every use into a call.

struct SStaticHuids {
    static constexpr HUID make(char const *_name) { return HUID(_name, HUID::SConstant()); }
};

#define QOR_DEFINE_STATIC_HUID(_id) constexpr HUID _id = SStaticHuids::make(#_id);
QOR_STATIC_HUIDS(QOR_DEFINE_STATIC_HUID)
#undef QOR_DEFINE_STATIC_HUID

} // namespace qorui
