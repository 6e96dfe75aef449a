// Events: their names, the event object, and the dispatch of callbacks.
#include "ui_event.h"
#include "ui_window.h"

namespace qorui {

namespace {

// The names that layouts give events, in sort order.
qor_map<string, EEventType> &event_names() {
    static qor_map<string, EEventType> s_names;
    return s_names;
}
// The callbacks' allocator is made at the library's load, before any static that owns windows, so
// that it is destroyed after all of them.
bool const s_allocator_ready = [] {
    CEventCallback const first([](CWndEvent const *) {});
    return true;
}();
} // namespace

CWndEvent::CWndEvent(EEventType _id)
    : m_dispatch_type(DISPATCH_NONE), m_id(_id), mp_receiver(nullptr), mp_activator(nullptr) {}

CWindow *CWndEvent::get_receiver() const {
    return static_cast<CWindow *>(mp_receiver);
}

bool CWndEvent::register_event_name(string const &_name, EEventType _id) {
    return event_names().insert(std::make_pair(_name, _id)).second;
}

bool CWndEvent::get_id_by_name(string const &_name, EEventType &_id) {
    auto const found = event_names().find(_name);
    if (found == event_names().end()) return false;
    _id = found->second;
    return true;
}

bool CWndEvent::get_name_by_id(EEventType _id, string &_name) {
    for (auto const &entry : event_names()) {
        if (entry.second == _id) {
            _name = entry.first;
            return true;
        }
    }
    return false;
}

void CEventDispatcher::register_callback(EEventType const &_id, CEventCallback const &_callback) {
    m_callbacks[_id].push_back(_callback);
}

void CEventDispatcher::dispatch_event(CWndEvent const *_p_event) {
    if (m_callbacks.empty()) return;
    auto const found = m_callbacks.find(_p_event->get_id());
    if (found == m_callbacks.end()) return;
    // A list's links stay valid when callbacks are appended during the walk.
    for (CEventCallback &callback : found->second) {
        begin_callback(_p_event);
        callback(_p_event);
    }
}

} // namespace qorui
