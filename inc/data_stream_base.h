// A typed first-in-first-out list of values over a Loki type list: the arguments of an event
// (CWndEvent) and the user data of a list item. Values are read back in the order and with the
// types in which they were written; nothing converts.
//
//   TDataStreamBase      append, read, rewind, release; copying moves
//   the two streams      the window stream and the common stream, with their type lists
#pragma once
#include "detail/data_variant.h"
#include "qor_math.h"

#include <cstddef>
#include <string>

namespace qorui {

// A typed first-in-first-out list of values of the types of TL, read back in order and type.
template <class TL>
class TDataStreamBase {
public:
    // One value of the stream, from the pool of its type list.
    typedef CDataVariantBase<TL> CNode;

    // An empty stream.
    TDataStreamBase() : mp_head(nullptr), mp_tail(nullptr), mp_curr(nullptr) {}

    // Copying moves: the target takes the chain and the read position, the source is left empty,
    // also when it is const (the pointers are mutable for that).
    TDataStreamBase(TDataStreamBase const &_o)
        : mp_head(_o.mp_head), mp_tail(_o.mp_tail), mp_curr(_o.mp_curr) {
        _o.forget();
    }
    // What the target held is released first, so that nothing leaks.
    TDataStreamBase &operator=(TDataStreamBase const &_o) {
        if (&_o == this) return *this;
        release();
        mp_head = _o.mp_head;
        mp_tail = _o.mp_tail;
        mp_curr = _o.mp_curr;
        _o.forget();
        return *this;
    }
    // Releases the values.
    virtual ~TDataStreamBase() { release(); }

    // Appends a copy of the value. The first node of an empty stream is also the read position;
    // later appends leave the read position where it is, even at the end of the stream.
    template <class T>
    TDataStreamBase &operator<<(T const &_value) {
        CNode *p_node = new CNode(_value);
        if (mp_head)
            mp_tail->mp_next = p_node;
        else
            mp_head = mp_curr = p_node;
        mp_tail = p_node;
        return *this;
    }

    // Copies the value at the read position and moves on. After a broken contract (end of stream,
    // another type) _value stays as it was.
    template <class T>
    TDataStreamBase const &operator>>(T &_value) const {
        if (CNode *p_node = take_current()) p_node->get(_value);
        return *this;
    }

    // The value in place at the read position, and moves on. The reference stays good until the
    // stream is released, and a handler may write through it for the sender to read back. After a
    // broken contract it refers to a neutral value.
    template <class T>
    T &get() const {
        CNode *p_node = take_current();
        return p_node ? p_node->template get<T>() : data_variant_detail::neutral_value<T>();
    }

    // Moves the read position back to the first value.
    void rewind() const { mp_curr = mp_head; }
    // Whether the stream holds no value.
    bool is_empty() const { return mp_head == nullptr; }
    // Whether every value has been read.
    bool end_of_stream() const { return mp_curr == nullptr; }

    // Destroys the values from the head on and gives the nodes back from the tail on, as a
    // recursive release would, so that the old head is the pool's next node; a loop, so that a
    // long stream can't exhaust the stack.
    void release() {
        CNode *p_reversed = nullptr;
        for (CNode *p_node = mp_head; p_node;) {
            CNode *p_next = p_node->mp_next;
            p_node->destroy_value();
            p_node->mp_next = p_reversed;
            p_reversed = p_node;
            p_node = p_next;
        }
        while (p_reversed) {
            CNode *p_next = p_reversed->mp_next;
            delete p_reversed;
            p_reversed = p_next;
        }
        forget();
    }

private:
    CNode *take_current() const {
        if (!QOR_CHECK_MSG(mp_curr != NULL, "DataStream Error: Empty data stream")) return nullptr;
        CNode *p_node = mp_curr;
        mp_curr = p_node->mp_next;
        return p_node;
    }

    void forget() const { mp_head = mp_tail = mp_curr = nullptr; }

    mutable CNode *mp_head; // the stream owns the chain
    mutable CNode *mp_tail;
    mutable CNode *mp_curr; // the next node to be read; null at the end of the stream
};

// ---------------------------------------------------------------------------------------------
// The two streams
// ---------------------------------------------------------------------------------------------
//
// A stream's nodes are as large as its largest type, so instantiating one needs all of its types
// complete: include their headers where a stream is made or read (ui_geometry.h for point_t).
// The positions in the lists are the m_type values of the nodes.

struct point_t;
class CMaterial;
class CFont;
class HUID;

// The arguments of events.
typedef Loki::TL::MakeTypelist<int, float, void *, vec2_t, CMaterial *, CFont *, point_t, string, wstring,
                               HUID const *>::Result TWindowStreamTypes;
// The stream of events.
typedef TDataStreamBase<TWindowStreamTypes> CWindowDataStream;

} // namespace qorui

// The engine's vector and 4x4 matrix (64 bytes, the largest type of the common stream).
struct vec3_t;
struct matr4_t;
namespace LuaPlus {
class LuaObject;
}

namespace qorui {

// The user data of list items and the pointers of the graph profiler. long long is the 64-bit
// integer; the wide string here has the standard allocator.
typedef Loki::TL::MakeTypelist<
    int, long long, float, double, void *, vec3_t, matr4_t, string,
    std::basic_string<unsigned short, std::char_traits<unsigned short>, std::allocator<unsigned short>>,
    LuaPlus::LuaObject>::Result TCommonStreamTypes;
// The stream of list items' user data.
typedef TDataStreamBase<TCommonStreamTypes> CCommonDataStream;

} // namespace qorui
