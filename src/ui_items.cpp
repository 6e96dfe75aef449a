// The row model of lists.
//
//   CItem                columns, icon, the Lua form of one row
//   CItems: rows         add, insert, remove
//   CItems: marks        the selected and the checked row, stepping
//   CItems: order        sorting by a column
//   CItems: persistence  the numbered rows of a list's "items"
#include "ui_items.h"

#include "qorscriptsystem.h"
#include "ui_debug.h"
#include "ui_material.h"
#include "ui_window_visual.h"
#include "ui_desktop.h"

#include <algorithm>
#include <cstdio>
#include <utility>

namespace qorui {

namespace {

// A key of a numbered list, "item_%u" or "column_%u" with the number.
class CNumberedKey {
public:
    CNumberedKey(char const *_p_format, unsigned int _n) {
        std::snprintf(m_text, sizeof m_text, _p_format, _n);
    }
    char const *c_str() const { return m_text; }

private:
    char m_text[128];
};

// A new table stored in _lo_table under _key, for the caller to fill.
LuaPlus::LuaObject new_table_under(LuaPlus::LuaObject &_lo_table, char const *_key) {
    LuaPlus::LuaObject table;
    table.AssignNewTable(_lo_table.GetState());
    _lo_table.SetObject(_key, table);
    return table;
}

} // namespace

// ---------------------------------------------------------------------------------------------
// CItem
// ---------------------------------------------------------------------------------------------

CItem::CItem() : mp_icon(nullptr) {}

CItem::CItem(CText const &_text, CMaterial *_p_icon) : m_strings(1, _text), mp_icon(_p_icon) {}

CItem::CItem(qor_vector<CText> const &_texts, CMaterial *_p_icon) : m_strings(_texts), mp_icon(_p_icon) {}

CItem::CItem(qor_vector<CText> &&_texts, CMaterial *_p_icon)
    : m_strings(std::move(_texts)), mp_icon(_p_icon) {}

CItem::~CItem() {
    delete mp_icon;
}

CText const &CItem::get_string(unsigned int _idx) const {
    static CText const no_text;
    if (!QOR_CHECK(m_strings.size() > _idx)) return no_text;
    return m_strings[_idx];
}

// The icon's table, then the first line of each column. A column without lines is left out, and
// the next load ends the row there.
void CItem::save_state(LuaPlus::LuaObject &_lo_table, CWindowVisual *_p_desktop) {
    if (mp_icon) mp_icon->save_state(new_table_under(_lo_table, "icon"));
    if (!QOR_CHECK(_p_desktop)) return;
    for (unsigned int c = 0; c < get_strings_number(); ++c) {
        CString const *p_line = m_strings[c].get_string();
        if (p_line) _p_desktop->save_string(_lo_table, CNumberedKey("column_%u", c).c_str(), *p_line);
    }
}

void CItem::load_state(LuaPlus::LuaObject &_lo_table, CWindowVisual *_p_desktop) {
    if (!QOR_CHECK(_p_desktop)) return;
    LuaPlus::LuaObject const icon = _lo_table.GetByName("icon");
    if (icon.IsTable()) load_icon(icon, _p_desktop);
    load_columns(_lo_table, _p_desktop);
}

// The new icon is made before the old one goes, so that a desktop that can't make one leaves the
// row as it was.
void CItem::load_icon(LuaPlus::LuaObject const &_lo_icon, CWindowVisual *_p_desktop) {
    CDesktop *p_source = _p_desktop->get_desktop();
    CMaterial *p_icon = p_source ? p_source->create_material() : nullptr;
    if (!QOR_CHECK_AS(p_icon, "mp_icon")) return;
    delete mp_icon;
    mp_icon = p_icon;
    mp_icon->load_state(_lo_icon);
}

// Each column goes through the desktop's load_string, so local strings apply, and into a text in
// its default state: multi-line and editable, with a backslash and 'n' breaking the line. An empty
// string still makes one empty line: a column without lines wouldn't be saved again and would end
// the row, and the columns behind it would be lost at the next round.
void CItem::load_columns(LuaPlus::LuaObject &_lo_table, CWindowVisual *_p_desktop) {
    m_strings.clear();
    for (unsigned int c = 0;; ++c) {
        CNumberedKey const key("column_%u", c);
        if (!_lo_table.GetByName(key.c_str()).IsString()) return;
        CString string;
        _p_desktop->load_string(_lo_table, key.c_str(), string);
        m_strings.emplace_back();
        CText &text = m_strings.back();
        text.insert(string.c_str(), false, true);
        if (text.get_num_strings() > 0) continue;
        text.insert(10, false); // a line break in an empty text leaves two empty lines,
        text.on_back_space();   // and a back space joins them
    }
}

// ---------------------------------------------------------------------------------------------
// CItems: rows
// ---------------------------------------------------------------------------------------------

CItems::CItems() : m_selected_idx(-1), m_checked_idx(-1), m_revision(0) {}

CItems::~CItems() {
    remove_all();
}

CItem *CItems::get(unsigned int _idx) const {
    if (!QOR_CHECK(_idx < m_items.size())) return nullptr;
    return m_items[_idx];
}

unsigned int CItems::add(CItem *_p_item) {
    if (!QOR_CHECK(_p_item)) return static_cast<unsigned int>(-1);
    m_items.push_back(_p_item);
    ++m_revision;
    return get_count() - 1;
}

void CItems::insert(CItem *_p_item, unsigned int _idx) {
    if (!QOR_CHECK(_p_item)) return;
    if (!QOR_CHECK(_idx < m_items.size())) _idx = get_count();
    m_items.insert(m_items.begin() + _idx, _p_item);
    ++m_revision;
}

void CItems::remove(unsigned int _idx) {
    if (!QOR_CHECK(_idx < m_items.size())) return;
    m_selected_idx = -1;
    delete m_items[_idx];
    m_items.erase(m_items.begin() + _idx);
    ++m_revision;
}

void CItems::remove_all() {
    m_selected_idx = -1;
    m_checked_idx = -1;
    ++m_revision;
    while (!m_items.empty()) {
        delete m_items.back();
        m_items.pop_back();
    }
}

// ---------------------------------------------------------------------------------------------
// CItems: marks
// ---------------------------------------------------------------------------------------------

void CItems::select(int _idx) {
    if (QOR_CHECK(_idx >= 0 && _idx < (int)m_items.size())) m_selected_idx = _idx;
}

void CItems::check(int _idx) {
    if (QOR_CHECK(_idx >= 0 && _idx < (int)m_items.size())) m_checked_idx = _idx;
}

CItem *CItems::get_selected() const {
    if (!QOR_CHECK(is_selected()) || !QOR_CHECK(m_selected_idx < (int)m_items.size())) return nullptr;
    return m_items[m_selected_idx];
}

CItem *CItems::get_checked() const {
    if (!QOR_CHECK(is_checked()) || !QOR_CHECK(m_checked_idx < (int)m_items.size())) return nullptr;
    return m_items[m_checked_idx];
}

void CItems::select_prev() {
    if (m_items.empty()) return;
    if (!is_selected())
        m_selected_idx = static_cast<int>(get_count()) - 1;
    else if (m_selected_idx > 0)
        --m_selected_idx;
}

void CItems::select_next() {
    if (m_items.empty()) return;
    if (!is_selected())
        m_selected_idx = 0;
    else if (m_selected_idx + 1 < static_cast<int>(get_count()))
        ++m_selected_idx;
}

// ---------------------------------------------------------------------------------------------
// CItems: order
// ---------------------------------------------------------------------------------------------

namespace {

// A row with the text it is ordered by. The first four units, packed most significant first,
// decide most comparisons without a look into the text: zeros fill a shorter text, which orders
// it before a longer one that it begins, and equal prefixes fall back to the whole texts.
struct SSortEntry {
    unsigned long long m_prefix;
    CString const *mp_key;
    CItem *mp_item;
};

CString const &sort_key(CItem const &_item, unsigned int _col) {
    static CString const empty;
    CString const *p_line = _item.get_string(_col).get_string();
    return QOR_CHECK_AS(p_line, "p_str1 && p_str2") ? *p_line : empty;
}

SSortEntry sort_entry(CItem *_p_item, unsigned int _col) {
    CString const &key = sort_key(*_p_item, _col);
    unsigned long long prefix = 0;
    for (size_t i = 0; i < 4; ++i)
        prefix = prefix << 16 | (i < key.size() ? key[i] : 0u);
    return SSortEntry{prefix, &key, _p_item};
}

bool key_less(SSortEntry const &_a, SSortEntry const &_b) {
    if (_a.m_prefix != _b.m_prefix) return _a.m_prefix < _b.m_prefix;
    return _a.mp_key->compare(*_b.mp_key) < 0;
}

bool key_greater(SSortEntry const &_a, SSortEntry const &_b) {
    return key_less(_b, _a);
}

} // namespace

// A stable sort: an order an unstable sort could also give, made repeatable for rows that tie.
void CItems::sort_by_column(unsigned int _col, ESortOrder _order) {
    qor_vector<SSortEntry> entries;
    entries.reserve(m_items.size());
    for (CItem *p_item : m_items)
        entries.push_back(sort_entry(p_item, _col));
    std::stable_sort(entries.begin(), entries.end(), _order == SORT_DESCENDING ? key_greater : key_less);
    for (size_t i = 0; i < entries.size(); ++i)
        m_items[i] = entries[i].mp_item;
    ++m_revision;
    m_selected_idx = -1;
    m_checked_idx = -1;
}

// ---------------------------------------------------------------------------------------------
// CItems: persistence
// ---------------------------------------------------------------------------------------------

void CItems::save_state(LuaPlus::LuaObject &_lo_table, CWindowVisual *_p_desktop) {
    if (!QOR_CHECK(_p_desktop)) return;
    for (unsigned int i = 0; i < get_count(); ++i) {
        LuaPlus::LuaObject row = new_table_under(_lo_table, CNumberedKey("item_%u", i).c_str());
        m_items[i]->save_state(row, _p_desktop);
    }
}

void CItems::load_state(LuaPlus::LuaObject &_lo_table, CWindowVisual *_p_desktop) {
    if (!QOR_CHECK_AS(_lo_table.IsTable(), "_lo_table.IsTable()") || !QOR_CHECK(_p_desktop)) return;
    remove_all();
    for (unsigned int i = 0;; ++i) {
        LuaPlus::LuaObject row = _lo_table.GetByName(CNumberedKey("item_%u", i).c_str());
        if (!row.IsTable()) return;
        CItem *p_item = new CItem;
        p_item->load_state(row, _p_desktop);
        add(p_item);
    }
}

} // namespace qorui
