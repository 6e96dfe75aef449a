// The row model of lists, behind the list box, the selector box and the drop-down list. Neither
// class draws.
//
//   CItem     one row: a text per column (column 0 first), an optional icon, typed user data
//   CItems    the rows in display order, the selected and the checked row, stepping, sorting
//
// Both are kept in Lua as a list writes them under its key "items":
//   items = { item_0 = { icon = { ...a material... }, column_0 = "Name", column_1 = "12" }, item_1 = ... }
// Rows and columns are numbered from 0 with no count; the first missing number ends the list.
// Only the first line of a column is kept, and the marks aren't kept at all.
#pragma once
#include "data_stream_base.h"
#include "qor_memory.h"
#include "ui_text.h"

namespace LuaPlus {
class LuaObject;
}

namespace qorui {

class CMaterial;
class CWindowVisual;

// ---------------------------------------------------------------------------------------------
// CItem
// ---------------------------------------------------------------------------------------------

// The user data is the common stream the row derives from: append with <<, read with >>; it is
// released with the row.
class CItem : public CPooled<CItem, 256>, public CCommonDataStream {
public:
    // The row owns the icon it is given (null for none) and keeps copies of the texts; a vector
    // of texts that the caller gives up is taken over instead, without copies.
    // @{
    CItem();
    CItem(CText const &_text, CMaterial *_p_icon);
    CItem(qor_vector<CText> const &_texts, CMaterial *_p_icon);
    CItem(qor_vector<CText> &&_texts, CMaterial *_p_icon);
    // @}
    // Destroys the icon and the user data.
    ~CItem();
    CItem(CItem const &) = delete;
    CItem &operator=(CItem const &) = delete;

    // Columns and icon

    // The number of columns.
    unsigned int get_strings_number() const { return static_cast<unsigned int>(m_strings.size()); }
    // A column out of range reports and gives a text without lines.
    CText const &get_string(unsigned int _idx) const;
    // The icon, owned by the row; null for none.
    CMaterial *get_icon() const { return mp_icon; }

    // Persistence. _p_desktop reads and writes the texts, so local strings apply, and its desktop
    // makes the icons: the desktop itself, or the window of the list that holds the rows. The
    // keys are "icon" and "column_0", "column_1" and so on; loading replaces the columns.
    // @{
    void save_state(LuaPlus::LuaObject &_lo_table, CWindowVisual *_p_desktop);
    void load_state(LuaPlus::LuaObject &_lo_table, CWindowVisual *_p_desktop);
    // @}

private:
    void load_icon(LuaPlus::LuaObject const &_lo_icon, CWindowVisual *_p_desktop);
    void load_columns(LuaPlus::LuaObject &_lo_table, CWindowVisual *_p_desktop);

    qor_vector<CText> m_strings; // one text per column
    CMaterial *mp_icon;          // owned; null for none
};

// ---------------------------------------------------------------------------------------------
// CItems
// ---------------------------------------------------------------------------------------------

// The direction of CItems::sort_by_column.
enum ESortOrder {
    SORT_ASCENDING, // smallest first
    SORT_DESCENDING // largest first
};

// The two marks are indices, not links to rows, and the operations that change the rows treat
// them so; whoever reorders rows sets the marks again afterwards:
//
//   operation        selected index                  checked index
//   add              stays                           stays
//   insert           stays, naming whichever row     stays, naming whichever row now stands
//                    now stands there                there
//   remove           -1, whichever row goes          stays, naming another row or, past the
//                                                    end, none (get_checked reports that)
//   remove_all       -1                              -1
//   sort_by_column   -1, even if nothing moved       -1, even if nothing moved
//
// Contracts on indices report and leave the list as it was; reads give null.
class CItems {
public:
    // No rows, nothing selected or checked.
    CItems();
    // Deletes every row.
    virtual ~CItems();
    CItems(CItems const &) = delete;
    CItems &operator=(CItems const &) = delete;

    // Rows. The list owns every row given to it; a null row is refused.

    // The number of rows.
    unsigned int get_count() const { return static_cast<unsigned int>(m_items.size()); }
    // The row at _idx; null, with a report, when out of range.
    CItem *get(unsigned int _idx) const;
    // The new row's index; for a null row, which is refused, -1 as unsigned.
    unsigned int add(CItem *_p_item);
    // Before row _idx. An index past the rows reports, since insert doesn't append, and the row
    // is appended all the same: it is neither lost nor left to the caller.
    void insert(CItem *_p_item, unsigned int _idx);
    // Deletes the row at _idx; out of range it reports and does nothing.
    void remove(unsigned int _idx);
    // Last row first.
    void remove_all();

    // The selected row

    // Selects the row at _idx; out of range it reports and the selection stays.
    void select(int _idx);
    // Selects nothing.
    void deselect() { m_selected_idx = -1; }
    // Whether a row is selected, and its index (-1 for none).
    // @{
    bool is_selected() const { return m_selected_idx >= 0; }
    int get_selected_idx() const { return m_selected_idx; }
    // @}
    // The selected row; with none, or an index past the rows, a report and null: ask
    // is_selected first.
    CItem *get_selected() const;
    // Step by one row and stop at either end. With nothing selected, select_prev selects the last
    // row and select_next row 0; an empty list stays as it is.
    // @{
    void select_prev();
    void select_next();
    // @}

    // The checked row

    // Checks the row at _idx; out of range it reports and the mark stays.
    void check(int _idx);
    // Checks nothing.
    void uncheck() { m_checked_idx = -1; }
    // Whether a row is checked, and its index (-1 for none).
    // @{
    bool is_checked() const { return m_checked_idx >= 0; }
    int get_checked_idx() const { return m_checked_idx; }
    // @}
    // The checked row; with none, or an index past the rows, a report and null: ask is_checked
    // first.
    CItem *get_checked() const;

    // Order. Rows compare by the first line of the column, unit by unit: case counts, colour tags
    // are ordinary characters, there is no locale, and a shorter text that begins another comes
    // first. Rows that compare equal keep their order in either direction, so sorting by one
    // column and then by another orders by the second and, within it, by the first. A row
    // without that column or without a line in it reports and sorts as an empty text.
    void sort_by_column(unsigned int _col, ESortOrder _order = SORT_ASCENDING);

    // Grows with every change of the rows (added, inserted, removed, reordered, loaded), not with
    // the marks: a view that derives something from all rows, such as the height of the tallest,
    // works it out again only when this has moved. A row changed in place by its own load_state
    // isn't counted.
    unsigned int get_revision() const { return m_revision; }

    // Persistence, as CItem's. Loading replaces every row; a value that isn't a table reports
    // and leaves the rows as they are. The rows stand under "item_0", "item_1" and so on.
    // @{
    void save_state(LuaPlus::LuaObject &_lo_table, CWindowVisual *_p_desktop);
    void load_state(LuaPlus::LuaObject &_lo_table, CWindowVisual *_p_desktop);
    // @}

private:
    qor_vector<CItem *> m_items; // display order; owned
    int m_selected_idx;          // -1 for none
    int m_checked_idx;           // -1 for none
    unsigned int m_revision;     // changes of the rows so far; wraps around
};

} // namespace qorui
