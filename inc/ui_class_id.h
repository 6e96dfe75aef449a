// The run-time identity of window classes: a type check that needs no table of classes, and the
// persistent class name under which the factory registers a class and layouts name it.
//
//   class_id()             static; the address of a function-local static char, the class's identity
//   find_class_by_id(id)   virtual; the object seen as the class of that id, if the id is the class's
//                          own or one of its chain, otherwise null
//   get_class_id()         virtual; a function-local static HUID of the class's name
//   class_cast<T>(p)       the check itself: null stays null
//
// How a window class uses it: one line in its declaration, naming the class, the class next in
// its chain and its persistent name. The line opens a public section.
//
//     class CWindow : public CEventDispatcher {
//         ...send_event...
//         QOR_CLASS_ID_ROOT(CWindow, "Window") // the root: no chain below it
//         ...attach_child...
//     };
//
//     class CButton : public CWindowVisual {
//         QOR_CLASS_ID(CButton, CWindowVisual, "Button")
//         ...
//     };
//
// The chain is what the check accepts, not all of a class's bases: CWindow's chain is empty
// although it derives from CEventDispatcher, and a class with an interface in front of its window
// base names the window base (QOR_CLASS_ID(CConsole, CDialog, "Console")). In the root the line
// declares the two virtual operations, so it stands where their slots belong; in derived classes
// it overrides them, and says so.
#pragma once
#include "ui_huid.h"

#include <type_traits>

namespace qorui {

namespace class_id_detail {

// The rest of the chain: the class next in it answers for itself and everything below it, with
// the object converted to that class, so that the result is the address of the right subobject.
template <class TNext, class TClass>
void *find_in_chain([[maybe_unused]] TClass *_p_object, [[maybe_unused]] char *_id) {
    if constexpr (std::is_void<TNext>::value)
        return nullptr;
    else
        return _p_object->TNext::find_class_by_id(_id);
}

} // namespace class_id_detail

// The members of a class's identity, as above: class_id, find_class_by_id and get_class_id, the
// virtual ones marked by _overrides (empty in the root, override elsewhere).
#define QOR_CLASS_ID_MEMBERS(_class, _next, _name, _overrides)                                               \
public:                                                                                                      \
    static char *class_id() {                                                                                \
        static char s_id;                                                                                    \
        return &s_id;                                                                                        \
    }                                                                                                        \
    virtual void *find_class_by_id(char *_id) _overrides {                                                   \
        if (_id == class_id()) return static_cast<_class *>(this);                                           \
        return ::qorui::class_id_detail::find_in_chain<_next>(this, _id);                                    \
    }                                                                                                        \
    virtual ::qorui::HUID const &get_class_id() _overrides {                                                 \
        static ::qorui::HUID const s_name(_name);                                                            \
        return s_name;                                                                                       \
    }
// The identity of the root of the chain, which declares the virtual operations.
#define QOR_CLASS_ID_ROOT(_class, _name) QOR_CLASS_ID_MEMBERS(_class, void, _name, )
// The identity of a class whose chain goes on with _next, which overrides them.
#define QOR_CLASS_ID(_class, _next, _name) QOR_CLASS_ID_MEMBERS(_class, _next, _name, override)

// The object seen as T if T is its class or in its chain; otherwise, and for null, null.
template <class T, class TObject>
T *class_cast(TObject *_p_object) {
    return _p_object ? static_cast<T *>(_p_object->find_class_by_id(T::class_id())) : nullptr;
}

} // namespace qorui
