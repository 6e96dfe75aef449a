// Events: the vocabulary, the event object that carries a type, a dispatch type, two window links
// and a typed data stream, the names that layouts use, and the per-object table of callbacks.
// Events are plain synchronous calls; there is no queue.
#pragma once
#include "data_stream_base.h"
#include "ui_geometry.h"
#include "ui_huid.h"

#include <loki/Functor.h>
#include <loki/Threads.h>
#include <list>

namespace qorui {

class CWindow;
class CEventDispatcher;

// The data each event carries stands beside it.
enum EEventType : int {
    EVENT_UPDATE = 0,               // once a frame; int: the value given to the desktop's update
    EVENT_DRAW = 1,                 // once a frame, back to front
    EVENT_HIDE = 2,                 // hide the window
    EVENT_SHOW = 3,                 // show the window
    EVENT_SHOW_MAXIMIZED = 4,       // show it filling its parent
    EVENT_SHOW_NORMAL = 5,          // show it at its size before maximising
    EVENT_ACTIVATE = 6,             // the window became the active one
    EVENT_DEACTIVATE = 7,           // the window stopped being the active one
    EVENT_LOST_FOCUS = 8,           // the application lost the input focus
    EVENT_ENABLE = 9,               // enable the window
    EVENT_DISABLE = 10,             // disable the window
    EVENT_RESIZE = 11,              // int width, int height, which handlers may overwrite in place
    EVENT_RESIZED = 12,             // position, size or layout changed: lay out again
    EVENT_DRAG_BEGIN = 13,          // a drag starts on the window
    EVENT_DRAG = 14,                // point_t: the pointer's movement
    EVENT_DRAG_END = 15,            // the drag ends
    EVENT_REPORT_POINT_INSIDE = 16, // point_t: a position on the desktop
    EVENT_POINTER_ENTER = 17,       // the pointer came over the window
    EVENT_POINTER_EXIT = 18,        // the pointer left the window
    EVENT_POINTER_MOVE = 19,        // vec2_t: the movement as the engine gave it
    EVENT_POINTER_POS = 20,         // point_t: the new pointer position
    EVENT_POINTER_DOWN = 21,        // int: the button
    EVENT_POINTER_UP = 22,          // int: the button
    EVENT_WHEEL_ROTATED = 23,       // float: the rotation
    EVENT_CLICK = 24,               // press and release over the same window
    EVENT_DOUBLE_CLICK = 25,        // a second click soon after the first
    EVENT_CHANGED = 26,             // a control's value changed
    EVENT_SET_TEXT = 27,            // wstring: the new text
    EVENT_SET_STR = 28,             // string: the new text, narrow
    // 29 and 30 are gaps that the values below depend on.

    EVENT_KEY_DOWN = 31,           // int: the key code; int: a second value of the engine
    EVENT_KEY_UP = 32,             // int: the key code
    EVENT_CHAR = 33,               // int: the character code
    EVENT_LINE_UP = 34,            // caret one line up (edit boxes)
    EVENT_LINE_DOWN = 35,          // caret one line down (edit boxes)
    EVENT_PAGE_UP = 36,            // caret one page up (edit boxes)
    EVENT_PAGE_DOWN = 37,          // caret one page down (edit boxes)
    EVENT_SCROLL_SMALL_STEP = 38,  // int: direction, -1 or +1
    EVENT_SCROLL_LARGE_STEP = 39,  // int: direction, -1 or +1
    EVENT_CHECKED = 40,            // a check box or list item was checked
    EVENT_UNCHECKED = 41,          // a check box was unchecked
    EVENT_HIGHLIGHTED = 42,        // the item under the pointer changed (list boxes)
    EVENT_RESOURCE_INVALIDATE = 43 // look materials and fonts up again (spreads through the subtree)
};

// One event: its type, how it is dispatched, the windows that sent it, and its typed data.
class CWndEvent : public CWindowDataStream {
public:
    // Where an event goes behind its receiver.
    enum EDispatchType : int {
        DISPATCH_NONE = 0,     // only the receiver
        DISPATCH_CHILDREN = 1, // then each child, back to front, and so on down as handlers leave it
        DISPATCH_PARENT = 2    // then the parent, and its parent, to the root
    };

    // An empty stream, dispatch type none, no receiver, no activator.
    explicit CWndEvent(EEventType _id);
    // Copying moves the stream: the source is left empty. Type, dispatch type and links are copied.
    // @{
    CWndEvent(CWndEvent const &_o) = default;
    CWndEvent &operator=(CWndEvent const &_o) = default;
    // @}
    // Releases what the stream holds.
    virtual ~CWndEvent() {}

    // The type.
    EEventType get_id() const { return m_id; }
    // The window whose callback is running: a parent listening to a child's click finds the
    // child here.
    CWindow *get_receiver() const;
    // The window that last sent the event.
    CWindow *get_activator() const { return mp_activator; }
    // Handlers hold the event as const and still redirect it.
    void set_activator(CWindow *_p_activator) const { mp_activator = _p_activator; }
    // Where the event goes behind the window that holds it; handlers change it, though they
    // hold the event as const.
    // @{
    EDispatchType get_dispatch_type() const { return m_dispatch_type; }
    void set_dispatch_type(EDispatchType _type) const { m_dispatch_type = _type; }
    // @}

    // The names of layouts, one table for the library. A name is registered once; a later
    // registration changes nothing and gives false.
    static bool register_event_name(string const &_name, EEventType _id);
    // Whether the name, compared exactly, is known; _id is filled only then.
    static bool get_id_by_name(string const &_name, EEventType &_id);
    // The first name in sort order with that value; false, _name untouched, when none has it.
    static bool get_name_by_id(EEventType _id, string &_name);

private:
    friend class CEventDispatcher;

    mutable EDispatchType m_dispatch_type;
    EEventType m_id;
    mutable CEventDispatcher *mp_receiver; // the dispatcher whose callback is running
    mutable CWindow *mp_activator;         // the window that last sent the event
};

// A callback of an event, most often bound to an object and a member function.
typedef Loki::Functor<void, LOKI_TYPELIST_1(CWndEvent const *), Loki::SingleThreaded> CEventCallback;

// Per event type, callbacks in order of registration. A callback lives as long as its dispatcher;
// the object it is bound to isn't owned.
class CEventDispatcher {
public:
    // No callbacks; the destructor releases the dispatcher's copies of them.
    // @{
    CEventDispatcher() {}
    virtual ~CEventDispatcher() {}
    // @}

    // Takes an event: filters it, runs the callbacks and passes it on by its dispatch type.
    virtual void on_event(CWndEvent const *_p_event) = 0;
    // Makes this object the event's activator, stores _type unless it is DISPATCH_NONE, and
    // hands the event to the receiver's on_event at once: there is no queue.
    virtual void send_event(CWindow *_p_receiver, CWndEvent const *_p_event,
                            CWndEvent::EDispatchType _type) = 0;

    // Appends a copy of the callback to those of the event type; there is no way to take one
    // away. The same functor registered twice runs twice.
    void register_callback(EEventType const &_id, CEventCallback const &_callback);

protected:
    // Each callback reads the stream from its head and sees what earlier ones overwrote; one
    // registered during the pass runs in the same pass. The receiver is this dispatcher.
    void dispatch_event(CWndEvent const *_p_event);
    // What every callback starts with: the stream at its head, this dispatcher as the receiver.
    void begin_callback(CWndEvent const *_p_event) {
        _p_event->rewind();
        _p_event->mp_receiver = this;
    }
    // Whether anything registered a callback for the type.
    // Whether anything registered a callback for the type.
    bool has_callbacks(EEventType _id) const { return !m_callbacks.empty() && m_callbacks.count(_id) > 0; }

private:
    typedef std::list<CEventCallback, qor_allocator<CEventCallback>> CCallbacks;
    qor_map<EEventType, CCallbacks> m_callbacks;
};

} // namespace qorui
