// The graph profiler.
//
//   nodes         a stretch of code with its ring of samples and its colour
//   construction  the root, the materials, the drop-down list of unused nodes
//   measuring     start, stop, reset, enter_node and exit_node on the stack of open nodes
//   frames        the frame time into the root, every node's time into its ring, the lists
//   pointer       the band under the pointer and the double click that takes its node out
//   drawing       one line graph per band with the node's name at its foot
#include "ui_graph_profiler.h"
#include "qor_platform.h"
#include "qorscriptsystem.h"
#include "ui_debug.h"
#include "ui_desktop.h"
#include "ui_drop_down_list.h"
#include "ui_font.h"
#include "ui_items.h"
#include "ui_list_box.h"
#include "ui_material.h"
#include "ui_time_profiler.h"

#include <cstdlib>

namespace qorui {

namespace {

uint32_t const k_no_band = 0xFFFFFFFF;
int const k_unused_nodes_h = 20;
float const k_label_font_size = 280.0f;
unsigned char const k_graph_alpha = 150;

// Counter ticks as whole microseconds: ticks * 1000000 / frequency, cut toward zero, worked out
// in two parts so that a counter of nanoseconds since boot doesn't overflow the product.
uint64_t to_microseconds(uint64_t _ticks) {
    uint64_t const frequency = static_cast<uint64_t>(profiler_frequency());
    if (frequency == 0) return 0;
    return _ticks / frequency * 1000000 + _ticks % frequency * 1000000 / frequency;
}

// A graph's colour: the C library's rand for blue, green and red, in this order.
rgba_t random_graph_colour() {
    unsigned char const b = static_cast<unsigned char>(rand() % 255);
    unsigned char const g = static_cast<unsigned char>(rand() % 255);
    unsigned char const r = static_cast<unsigned char>(rand() % 255);
    return rgba_t(r, g, b, k_graph_alpha);
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Nodes
// ---------------------------------------------------------------------------------------------

CGraphProfilerNode::CGraphProfilerNode(HUID const &_id)
    : m_id(_id), m_start(0), m_stop(0), m_time(0), m_is_used(true), m_history_pos(0), mp_material(nullptr) {
    profiler_frequency();
}

CGraphProfilerNode::~CGraphProfilerNode() {
    delete mp_material;
}

// ---------------------------------------------------------------------------------------------
// Construction
// ---------------------------------------------------------------------------------------------

CGraphProfiler::CGraphProfiler(CDesktop *_p_desktop, char const *_name)
    : CDialog(_p_desktop, _name), m_history_size(1024), m_tree_changed(false), m_active_mode(false),
      m_root(HUID("root")), mp_unused_nodes(nullptr), m_pointed_idx(k_no_band) {
    m_root.m_full_name = "root";
    set_always_on_top(true);
    m_root.mp_material = create_color_material(mp_desktop, rgba_t(255, 255, 255, k_graph_alpha));
    add_material(MAT_NAME_NORMAL, create_color_material(mp_desktop, rgba_t(0, 0, 0, 30)));
    add_material(MAT_NAME_CHECKED, create_color_material(mp_desktop, rgba_t(250, 250, 250, 30)));

    mp_unused_nodes = new CDropDownList(mp_desktop, "unused nodes");
    attach_child(mp_unused_nodes);
    mp_unused_nodes->add_material(MAT_NAME_NORMAL,
                                  create_color_material(mp_desktop, rgba_t(200, 200, 200, 120)));
    mp_unused_nodes->set_alignment(ALIGNMENT_TOP);
    mp_unused_nodes->set_size(mp_unused_nodes->get_w(), k_unused_nodes_h);
    mp_unused_nodes->set_text(CText("unused nodes"));
    mp_unused_nodes->register_callback(EVENT_CLICK,
                                       CEventCallback(this, &CGraphProfiler::on_event_unused_click));
}

// Destructors stay in the library, so that a program that builds these windows can't lend them
// its own deletion.
CGraphProfiler::~CGraphProfiler() {}

// ---------------------------------------------------------------------------------------------
// Measuring
// ---------------------------------------------------------------------------------------------

void CGraphProfiler::start() {
    if (m_active_mode) return;
    m_active_mode = true;
    QOR_CHECK_AS(m_stack.empty(), "m_stack.empty()");
}

// The nodes keep their data, and open stretches stay open.
void CGraphProfiler::stop() {
    m_active_mode = false;
}

void CGraphProfiler::reset() {
    qor_vector<CGraphProfilerNode *>().swap(m_stack);
}

void CGraphProfiler::show(bool _show) {
    send_event(this, _show ? EVENT_SHOW : EVENT_HIDE, CWndEvent::DISPATCH_NONE);
    if (_show && mp_desktop) mp_desktop->set_active_window(this);
}

// A node's full name is its parent's with its own behind a ".", which is the short names of the
// open nodes from the outermost in; the root's own name isn't part of it.
void CGraphProfiler::enter_node(HUID const &_id) {
    if (!m_active_mode) return;
    CGraphProfilerNode &parent = top();
    auto found = parent.m_children.find(_id.get_hash());
    if (found == parent.m_children.end()) {
        found = parent.m_children
                    .emplace(std::piecewise_construct, std::forward_as_tuple(_id.get_hash()),
                             std::forward_as_tuple(_id))
                    .first;
        CGraphProfilerNode &node = found->second;
        if (&parent != &m_root) node.m_full_name = parent.m_full_name + ".";
        node.m_full_name += _id.GetName();
        node.mp_material = create_color_material(mp_desktop, random_graph_colour());
        m_tree_changed = true;
    }
    CGraphProfilerNode &node = found->second;
    node.m_start = qorplatform::query_performance_counter();
    push(&node);
}

// A node entered several times before an update gathers all its times, and a parent's time
// includes its children's. Without an open node the root is taken, and the stack's contract fails.
void CGraphProfiler::exit_node() {
    if (!m_active_mode) return;
    CGraphProfilerNode &node = top();
    node.m_stop = qorplatform::query_performance_counter();
    node.m_time += static_cast<int32_t>(to_microseconds(static_cast<uint64_t>(node.m_stop - node.m_start)));
    pop();
}

void CGraphProfiler::pop() {
    if (!QOR_CHECK_AS(!m_stack.empty(), "!m_stack.empty()")) return;
    m_stack.pop_back();
}

CGraphProfilerNode &CGraphProfiler::top() {
    return m_stack.empty() ? m_root : *m_stack.back();
}

// ---------------------------------------------------------------------------------------------
// Frames
// ---------------------------------------------------------------------------------------------

// Hidden, the window still takes its updates, so it goes on measuring. The time since the last
// update of any profiler is the root's: the frame time.
void CGraphProfiler::on_event_update(CWndEvent const *_p_event) {
    CDialog::on_event_update(_p_event);
    if (!m_active_mode) return;

    uint64_t const now = static_cast<uint64_t>(qorplatform::query_performance_counter());
    static uint64_t s_last_update = now;
    m_root.m_time += to_microseconds(now - s_last_update);
    s_last_update = now;

    take_back_checked_node();
    if (m_tree_changed) {
        m_used_nodes.clear();
        mp_unused_nodes->get_items().remove_all();
    }
    m_history_size = get_w() > 1 ? static_cast<uint32_t>(get_w()) : 1;
    update(m_root);
    m_tree_changed = false;
}

// The chosen row stays checked until the rows are rebuilt, which this sets off.
void CGraphProfiler::take_back_checked_node() {
    if (!QOR_CHECK_AS(mp_unused_nodes->get_list_box(), "mp_list_box")) return;
    CItems &items = mp_unused_nodes->get_items();
    if (!items.is_checked()) return;
    CItem *p_item = items.get_checked();
    void *p = nullptr;
    if (p_item && !p_item->is_empty()) {
        p_item->rewind();
        *p_item >> p;
    }
    // A row without a node, which only a layout can give, is let go so that it is reported once.
    if (!QOR_CHECK_AS(p, "p")) {
        items.uncheck();
        return;
    }
    static_cast<CGraphProfilerNode *>(p)->m_is_used = true;
    m_tree_changed = true;
}

// A narrower window drops the newest end of the ring's storage, a wider one adds empty samples.
void CGraphProfiler::update(CGraphProfilerNode &_node) {
    if (!QOR_CHECK_AS(m_active_mode, "m_active_mode")) return;
    _node.m_history.resize(m_history_size, 0);
    if (_node.m_history_pos >= m_history_size) _node.m_history_pos = 0;
    _node.m_history[_node.m_history_pos] = _node.m_time;
    if (++_node.m_history_pos >= m_history_size) _node.m_history_pos = 0;
    _node.m_time = 0;

    if (m_tree_changed) {
        if (_node.m_is_used) {
            m_used_nodes.push_back(&_node);
        } else {
            CItem *p_item = new CItem(CText(_node.m_full_name), nullptr);
            *p_item << static_cast<void *>(&_node);
            mp_unused_nodes->get_items().add(p_item);
        }
    }
    for (auto &child : _node.m_children)
        update(child.second);
}

// ---------------------------------------------------------------------------------------------
// Pointer
// ---------------------------------------------------------------------------------------------

int CGraphProfiler::get_drop_h() const {
    return mp_unused_nodes->get_h();
}

// More bands than pixels of height leave no band to point at.
void CGraphProfiler::on_event_pointer_pos(CWndEvent const *_p_event) {
    CDialog::on_event_pointer_pos(_p_event);
    if (m_used_nodes.empty()) return;
    _p_event->rewind();
    point_t const pos = convert_to_local(_p_event->get<point_t>());
    int const drop_h = get_drop_h(), h = get_h();
    int const band_h = (h - drop_h) / static_cast<int>(m_used_nodes.size());
    if (band_h <= 0) return;
    if (pos.x >= 0 && pos.x < get_w() && pos.y >= drop_h && pos.y < h)
        m_pointed_idx = static_cast<uint32_t>((pos.y - drop_h) / band_h);
}

// The bands count from the top and the used nodes from the bottom band up.
void CGraphProfiler::on_event_double_click(CWndEvent const *_p_event) {
    CDialog::on_event_double_click(_p_event);
    size_t const n = m_used_nodes.size();
    if (m_pointed_idx >= n) return;
    m_used_nodes[n - 1 - m_pointed_idx]->m_is_used = false;
    m_tree_changed = true;
}

// ---------------------------------------------------------------------------------------------
// Drawing
// ---------------------------------------------------------------------------------------------

// The graphs aren't clipped to their bands: a spike of a lower node runs up through the bands
// above it, up to the window's top.
void CGraphProfiler::on_event_draw(CWndEvent const *_p_event) {
    CDialog::on_event_draw(_p_event);
    if (!m_active_mode || m_used_nodes.empty()) return;
    CFont *p_font = mp_desktop ? mp_desktop->get_font(FNT_NAME_FIXED) : nullptr;
    if (!QOR_CHECK(p_font)) return;
    float const font_size = p_font->get_size();
    p_font->set_size(k_label_font_size);
    int const text_h = m_canvas.get_text_height(p_font);

    int const w = get_w(), h = get_h(), drop_h = get_drop_h();
    int const band_h = (h - drop_h) / static_cast<int>(m_used_nodes.size());
    if (m_pointed_idx < m_used_nodes.size())
        m_canvas.draw_rect(0, static_cast<int>(m_pointed_idx) * band_h + drop_h, w, band_h,
                           get_material(MAT_NAME_CHECKED));

    int base = h, label_y = h - text_h;
    for (CGraphProfilerNode *p_node : m_used_nodes) {
        if (QOR_CHECK_AS(p_node, "p_node")) {
            draw_graph(*p_node, base);
            m_canvas.text_out(0, label_y, CString(p_node->m_full_name.c_str()), p_font);
        }
        base -= band_h;
        label_y -= band_h;
    }
    p_font->set_size(font_size);
}

// Oldest sample at the left, one pixel of width an update and one of height a millisecond, from
// the band's foot at _base; a sample above the window stops at its top.
void CGraphProfiler::draw_graph(CGraphProfilerNode const &_node, int _base) {
    size_t const size = _node.m_history.size();
    size_t idx = _node.m_history_pos;
    point_t last{0, _base};
    for (size_t x = 0; x < size; ++x, ++idx) {
        if (idx >= size) idx = 0;
        int64_t y = _base - static_cast<int64_t>(_node.m_history[idx] / 1000);
        if (y < 0) y = 0;
        point_t const next{static_cast<int>(x), static_cast<int>(y)};
        m_canvas.draw_line(last.x, last.y, next.x, next.y, _node.mp_material);
        last = next;
    }
}

} // namespace qorui
