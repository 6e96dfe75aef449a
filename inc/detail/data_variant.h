// One node of a data stream: a value of any type of a type list, its type's position in the list,
// the function that destroys it, and the link to the next node. Nodes come from a fixed pool of
// 1024 nodes a block, one pool per type list; a free node's first word, m_destroy, is the pool's
// link.
//
//   type positions      Type<T>::value, the size and alignment of the largest type
//   CDataVariantBase    construction with a copy of a value, typed access, destruction
// Internal to the library: reached through data_stream_base.h only, and may change between
// versions.
#pragma once
#include "qor_memory.h"
#include "ui_debug.h"

#include <loki/Typelist.h>

#include <cstddef>
#include <new>
#include <type_traits>

namespace qorui {

namespace data_variant_detail {

// The size and the alignment of the largest type of a type list.
template <class TList>
struct SLargest;

// The end of a list: one byte.
template <>
struct SLargest<Loki::NullType> {
    // In bytes.
    // @{
    static constexpr size_t size = 1;
    static constexpr size_t align = 1;
    // @}
};

// The larger of the head and the rest of the list.
template <class THead, class TTail>
struct SLargest<Loki::Typelist<THead, TTail>> {
    // In bytes.
    // @{
    static constexpr size_t size = sizeof(THead) > SLargest<TTail>::size ? sizeof(THead)
                                                                         : SLargest<TTail>::size;
    static constexpr size_t align = alignof(THead) > SLargest<TTail>::align ? alignof(THead)
                                                                            : SLargest<TTail>::align;
    // @}
};

// Destroys a T in place.
template <class T>
void destroy_value(void *_p_value) {
    static_cast<T *>(_p_value)->~T();
}

// The destruction of a trivially destructible value, or of one destroyed already.
inline void destroy_nothing(void *) {}

// What a read gives after a broken contract: a default value of T of its own, reset at each
// use, so that a caller that writes through the reference harms nothing.
template <class T>
T &neutral_value() {
    static T s_value;
    s_value = T();
    return s_value;
}

} // namespace data_variant_detail

// One node of a stream over the type list TL, holding a copy of one value of one of its types.
template <class TL>
class CDataVariantBase : public CPooled<CDataVariantBase<TL>, 1024> {
public:
    // The position of T in the type list, counting from 0; -1 if T isn't in it.
    template <class T>
    struct Type {
        enum { value = Loki::TL::IndexOf<TL, T>::value };
    };

    // A copy of _value, which must be of one of the list's types; not linked to any node.
    template <class T>
    explicit CDataVariantBase(T const &_value)
        : m_destroy(std::is_trivially_destructible<T>::value ? &data_variant_detail::destroy_nothing
                                                             : &data_variant_detail::destroy_value<T>),
          mp_next(nullptr), m_type(Type<T>::value) {
        static_assert(Type<T>::value >= 0, "the type isn't one of the stream's types");
        static_assert(data_variant_detail::SLargest<TL>::align <= alignof(void *),
                      "pool elements are aligned to a pointer");
        new (m_value) T(_value);
    }
    // Destroys the value, unless destroy_value did so already.
    ~CDataVariantBase() { m_destroy(m_value); }
    // Destroys the value ahead of the node; the node's own destruction then does nothing more.
    void destroy_value() {
        m_destroy(m_value);
        m_destroy = &data_variant_detail::destroy_nothing;
    }
    CDataVariantBase(CDataVariantBase const &) = delete;
    CDataVariantBase &operator=(CDataVariantBase const &) = delete;

    // The value in place. A value of another type is a broken contract: reported, and the result
    // is a neutral value instead.
    template <class T>
    T &get() {
        T *p_value = value_if<T>();
        return p_value ? *p_value : data_variant_detail::neutral_value<T>();
    }

    // Copies the value to _value; after a broken contract _value stays as it was.
    template <class T>
    void get(T &_value) {
        if (T *p_value = value_if<T>()) _value = *p_value;
    }

    // Destroys the value held in a node's buffer.
    typedef void (*destroy_t)(void *);

    destroy_t m_destroy;       // first: the pool's link while the node is free
    CDataVariantBase *mp_next; // the next node of the stream; null at the tail
    int m_type;                // the value's position in the type list
    // The value, in a buffer of the largest type's size and alignment.
    alignas(data_variant_detail::SLargest<
            TL>::align) unsigned char m_value[data_variant_detail::SLargest<TL>::size];

private:
    template <class T>
    T *value_if() {
        static_assert(Type<T>::value >= 0, "the type isn't one of the stream's types");
        if (!QOR_CHECK_MSG(m_type == Type<T>::value, "DataStream Error: Types mismatch")) return nullptr;
        return std::launder(reinterpret_cast<T *>(m_value));
    }
};

} // namespace qorui
