// The graph profiler: a dialog that draws, as one line graph per band, how long named stretches of
// code take from frame to frame.
//
//   IGraphProfiler       what its user drives: enter_node and exit_node around a stretch of code,
//                        start and stop of measuring, reset of the open stretches, show
//   CGraphProfilerNode   one stretch: its place in the tree, the time gathered since the last
//                        update, and a ring of one sample per update, in microseconds
//   CGraphProfiler       the tree under a root that is timed from update to update (the frame
//                        time), the bands that draw the rings, and the drop-down list "unused
//                        nodes" of the stretches taken out of the display
//
// Nodes nest by the calls: a node entered while another is open becomes its child, so one name
// under two parents makes two nodes. Each update moves every node's gathered time into its ring,
// which holds as many samples as the window is pixels wide; the graphs scroll through the rings,
// one pixel of height a millisecond. A double click on a band takes its node out of the display,
// and choosing the node in the drop-down list brings it back.
//
// The profiler reads the platform's performance counter itself and shares only the counter's
// frequency with the time profiler. The library makes none: its user does, with
// new CGraphProfiler(desktop, name), attaches it and keeps the IGraphProfiler; the window tree owns
// it. It isn't in the windows factory, and persists what a dialog persists.
#pragma once
#include "qor_memory.h"
#include "ui_dialog.h"
#include "ui_huid.h"

#include <cstdint>

namespace qorui {

class CDropDownList;
class CGraphProfiler;
class CMaterial;

// ---------------------------------------------------------------------------------------------
// IGraphProfiler
// ---------------------------------------------------------------------------------------------

// Handed out to the code under measurement. The window tree owns the object: nobody deletes it
// through this interface.
class IGraphProfiler {
public:
    // Opens the child _id of the innermost open node, made at its first entry; nothing while
    // measuring is off.
    virtual void enter_node(HUID const &_id) = 0;
    // Closes the innermost open node and adds its time; nothing while measuring is off.
    virtual void exit_node() = 0;
    // Forgets the open stretches; nodes and their times stay.
    virtual void reset() = 0;
    // Measuring on. It belongs outside all stretches: no node may be open then.
    virtual void start() = 0;
    // Measuring off; the nodes keep their data, and open stretches stay open.
    virtual void stop() = 0;
    // Shows the window and makes it the active one, or hides it. A hidden profiler goes on measuring.
    virtual void show(bool _show) = 0;
    // The object itself.
    virtual CGraphProfiler *get_graph_profiler() = 0;
    // Called back on a click in the drop-down list; a hook that does nothing here.
    virtual void on_event_unused_click(CWndEvent const *_p_event) = 0;

protected:
    // Not deleted through the interface.
    ~IGraphProfiler() {}
};

// ---------------------------------------------------------------------------------------------
// CGraphProfilerNode
// ---------------------------------------------------------------------------------------------

class CGraphProfilerNode;
// Children by the hash of their id; a node keeps its address in the map, which the stack, the
// used nodes and the drop-down's rows rely on.
typedef qor_map<uint64_t, CGraphProfilerNode> CGraphProfilerNodes;

// One stretch of code in the profiler's tree. It owns its colour; nodes are never removed before
// the profiler goes.
class CGraphProfilerNode {
public:
    // Used, with no time and no colour yet. The first node reads the counter's frequency.
    explicit CGraphProfilerNode(HUID const &_id);
    // Deletes the colour; the children go with the map.
    ~CGraphProfilerNode();
    // A node keeps its address: never copied.
    // @{
    CGraphProfilerNode(CGraphProfilerNode const &) = delete;
    CGraphProfilerNode &operator=(CGraphProfilerNode const &) = delete;
    // @}

    HUID m_id;                      // the short name and its hash
    string m_full_name;             // the short names from the top down joined by "."; "root" alone
    int64_t m_start;                // performance counter at the last enter_node
    int64_t m_stop;                 // performance counter at the last exit_node
    uint64_t m_time;                // microseconds gathered since the last update
    bool m_is_used;                 // drawn as a graph; otherwise a row of the drop-down list
    CGraphProfilerNodes m_children; // in the order of their hashes
    qor_vector<uint64_t> m_history; // ring of samples, microseconds
    uint32_t m_history_pos;         // next slot to be written, which is also the oldest sample
    CMaterial *mp_material;         // the graph's colour; owned
};

// ---------------------------------------------------------------------------------------------
// CGraphProfiler
// ---------------------------------------------------------------------------------------------

// The dialog that draws the tree's per-frame times, one band per node shown.
class CGraphProfiler : public IGraphProfiler, public CDialog {
public:
    // Off, always on top, with the drop-down list "unused nodes" across its top.
    CGraphProfiler(CDesktop *_p_desktop, char const *_name);
    // The nodes and their colours go with the root; the drop-down list with the window tree.
    virtual ~CGraphProfiler();

    QOR_CLASS_ID(CGraphProfiler, CDialog, "GraphProfiler")

    // IGraphProfiler, on the same object as the window.
    // @{
    void enter_node(HUID const &_id) override;
    void exit_node() override;
    void reset() override;
    void start() override;
    void stop() override;
    void show(bool _show) override;
    CGraphProfiler *get_graph_profiler() override { return this; }
    void on_event_unused_click(CWndEvent const *) override {}
    // @}

    // The tree and the display, for the owner and for tests

    // Whether measuring is on.
    bool is_active() const { return m_active_mode; }
    // The root, timed from update to update, with the tree below it.
    CGraphProfilerNode &get_root() { return m_root; }
    // The nodes drawn, from the bottom band up, as the last update that rebuilt them found them.
    qor_vector<CGraphProfilerNode *> const &get_used_nodes() const { return m_used_nodes; }
    // The nodes entered and not yet left.
    unsigned int get_open_nodes_count() const { return static_cast<unsigned int>(m_stack.size()); }
    // Samples per node: the window's width at the last update, at least 1.
    unsigned int get_history_size() const { return m_history_size; }
    // The band under the pointer counted from the top; 0xFFFFFFFF for none.
    unsigned int get_pointed_idx() const { return m_pointed_idx; }
    // The drop-down list of the nodes taken out of the display.
    CDropDownList *get_unused_nodes() { return mp_unused_nodes; }

protected:
    // Measuring: the frame time into the root, a node chosen in the drop-down back into the
    // display, every node's time into its ring.
    virtual void on_event_update(CWndEvent const *_p_event) override;
    // The bands, the first used node at the bottom, each graph with its node's name at its foot.
    virtual void on_event_draw(CWndEvent const *_p_event) override;
    // Follows the band under the pointer, below the drop-down list.
    virtual void on_event_pointer_pos(CWndEvent const *_p_event) override;
    // Takes the node of the band under the pointer out of the display.
    virtual void on_event_double_click(CWndEvent const *_p_event) override;

private:
    void push(CGraphProfilerNode *_p_node) { m_stack.push_back(_p_node); }
    void pop();
    // The innermost open node, or the root when none is open.
    CGraphProfilerNode &top();
    // Moves the node's time into its ring and, when the tree has changed, lists it again; then
    // the same for its children.
    void update(CGraphProfilerNode &_node);
    // The node chosen in the drop-down list goes back into the display.
    void take_back_checked_node();
    // The bands share the height below the drop-down list.
    int get_drop_h() const;
    void draw_graph(CGraphProfilerNode const &_node, int _base);

    qor_vector<CGraphProfilerNode *> m_used_nodes; // shown, in the order of the last walk; not owned
    uint32_t m_history_size;                       // samples per node: the window's width, at least 1
    bool m_tree_changed;                           // the lists are rebuilt at the next update
    bool m_active_mode;                            // measuring is on
    CGraphProfilerNode m_root;                     // timed from update to update
    qor_vector<CGraphProfilerNode *> m_stack;      // entered and not yet left, innermost last
    CDropDownList *mp_unused_nodes;                // child "unused nodes"; owned by the window tree
    uint32_t m_pointed_idx;                        // band under the pointer from the top; 0xFFFFFFFF: none
};

} // namespace qorui
