// HUID: a name with a 64-bit hash of it. Materials, fonts, window classes and window names are
// keyed by HUIDs; two HUIDs are the same thing exactly when their hashes are equal, and the text is
// kept only for people and for saved layouts.
//
//   HUID                 construction (hashes once), comparison by hash
//   static names         MAT_NAME_* (28 materials) and FNT_NAME_* (7 fonts)
#pragma once
#include <cstddef>
#include <cstdint>

namespace qorui {

// A name with a 64-bit hash of it; equal exactly when the hashes are.
class HUID {
public:
    // Copies the name with its terminator and hashes it. A name of 120 bytes or more breaks the
    // contract: it is reported, its first 119 bytes are kept and the whole name is hashed.
    HUID(char const *_name);
    // The longest name kept whole, in bytes.
    static size_t const k_max_name = 119;

    // Compared by hash only, so "Window" == "WINDOW". The order is that of the unsigned hash.
    // @{
    bool operator==(HUID const &_o) const { return m_hash == _o.m_hash; }
    bool operator!=(HUID const &_o) const { return m_hash != _o.m_hash; }
    bool operator<(HUID const &_o) const { return m_hash < _o.m_hash; }
    // @}

    // The name as given (at most k_max_name bytes), zero-terminated.
    char const *GetName() const { return m_name; }
    // The 64-bit hash of the whole name, with A to Z folded to lower case.
    uint64_t get_hash() const { return m_hash; }

private:
    // The static names are hashed by the compiler (see src/ui_huid.cpp).
    struct SConstant {};
    constexpr HUID(char const *_name, SConstant);
    friend struct SStaticHuids;
    static char const *checked_name(char const *_name);

    char m_name[k_max_name + 1]; // zero-terminated
    uint64_t m_hash;
};

// The static names, each the HUID of its own identifier: MAT_NAME_NORMAL is HUID("MAT_NAME_NORMAL").
#define QOR_STATIC_HUIDS(X)                                                                                  \
    X(MAT_NAME_NORMAL)                                                                                       \
    X(MAT_NAME_HIGHLIGHTED)                                                                                  \
    X(MAT_NAME_PUSHED)                                                                                       \
    X(MAT_NAME_CHECKED)                                                                                      \
    X(MAT_NAME_DISABLED)                                                                                     \
    X(MAT_NAME_SELECTION)                                                                                    \
    X(MAT_NAME_PROGRESS)                                                                                     \
    X(MAT_NAME_CHECKER_ON)                                                                                   \
    X(MAT_NAME_CHECKER_OFF)                                                                                  \
    X(MAT_NAME_CHECKER_ON_DISABLED)                                                                          \
    X(MAT_NAME_CHECKER_OFF_DISABLED)                                                                         \
    X(MAT_NAME_BUTTON_UP)                                                                                    \
    X(MAT_NAME_BUTTON_UP_HIGHLIGHTED)                                                                        \
    X(MAT_NAME_BUTTON_UP_PUSHED)                                                                             \
    X(MAT_NAME_BUTTON_DOWN)                                                                                  \
    X(MAT_NAME_BUTTON_DOWN_HIGHLIGHTED)                                                                      \
    X(MAT_NAME_BUTTON_DOWN_PUSHED)                                                                           \
    X(MAT_NAME_BUTTON_LEFT)                                                                                  \
    X(MAT_NAME_BUTTON_LEFT_HIGHLIGHTED)                                                                      \
    X(MAT_NAME_BUTTON_LEFT_PUSHED)                                                                           \
    X(MAT_NAME_BUTTON_RIGHT)                                                                                 \
    X(MAT_NAME_BUTTON_RIGHT_HIGHLIGHTED)                                                                     \
    X(MAT_NAME_BUTTON_RIGHT_PUSHED)                                                                          \
    X(MAT_NAME_BUTTON_SCROLLER)                                                                              \
    X(MAT_NAME_BUTTON_SCROLLER_HIGHLIGHTED)                                                                  \
    X(MAT_NAME_BUTTON_SCROLLER_PUSHED)                                                                       \
    X(MAT_NAME_TILED)                                                                                        \
    X(MAT_NAME_LISTBOX_HEADER)                                                                               \
    X(FNT_NAME_DEFAULT)                                                                                      \
    X(FNT_NAME_FIXED)                                                                                        \
    X(FNT_NAME_DISABLED)                                                                                     \
    X(FNT_NAME_CHECKED)                                                                                      \
    X(FNT_NAME_BUTTON)                                                                                       \
    X(FNT_NAME_BUTTON_PUSHED)                                                                                \
    X(FNT_NAME_BUTTON_CHECKED)

// Declares one static name; undefined again below.
#define QOR_DECLARE_STATIC_HUID(_id) extern HUID const _id;
QOR_STATIC_HUIDS(QOR_DECLARE_STATIC_HUID)
#undef QOR_DECLARE_STATIC_HUID

} // namespace qorui
