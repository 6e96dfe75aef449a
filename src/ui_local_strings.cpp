// The service's local strings and its build-version page.
//
//   reading the file   the file's name, its encoding, its lines
//   parsing a line     comment, key, quoted value
//   the table          read_local_strings, load_local_strings, the lookups
//   build version      the page read from "build_version.cfg", drawn after the desktop
#include "ui.h"
#include "ui_local_strings.h"

#include "engine_interfaces.h"
#include "qorbase.h"
#include "qordebug.h"
#include "ui_debug.h"
#include "ui_desktop.h"
#include "ui_font.h"
#include "ui_render.h"
#include "ui_stats_page.h"
#include "ui_text.h"

#include <algorithm>

namespace qorui {

namespace {

char const k_strings_key[] = "strings_filename";
char const k_default_strings_file[] = "russian.lang";
unsigned char const k_mark_low = 0xFF; // the byte-order mark 0xFEFF, little-endian
unsigned char const k_mark_high = 0xFE;
unsigned short const k_quote = '"';

char const k_build_version_file[] = "build_version.cfg";
unsigned const k_build_number = 203; // this library's build, shown below the version text
int const k_default_build_line = 47;
float const k_build_font_size = 300.0f;

// ---------------------------------------------------------------------------------------------
// Reading the file
// ---------------------------------------------------------------------------------------------

// Behind the mark, little-endian 16-bit units; a trailing odd byte is a unit of its own.
void read_wide_text(CCachedFileReader &_reader, unsigned _size, CText &_text) {
    size_t const rest = _size - 2;
    qor_vector<unsigned char> bytes(rest + 2, 0);
    _reader.read(bytes.data(), static_cast<unsigned>(rest));
    wstring units;
    units.reserve(rest / 2 + 1);
    for (size_t i = 0; i < rest; i += 2)
        units.push_back(static_cast<unsigned short>(bytes[i] | bytes[i + 1] << 8));
    _text.insert(units.c_str(), true, false);
}

// Without the mark every byte is a unit, the two already read included.
void read_narrow_text(CCachedFileReader &_reader, unsigned char const (&_first)[2], unsigned _size,
                      CText &_text) {
    qor_vector<char> bytes(size_t(_size) + 2, 0);
    std::copy(_first, _first + std::min(_size, 2u), bytes.begin());
    if (_size > 2) _reader.read(bytes.data() + 2, _size - 2);
    _text.insert(bytes.data(), true, false);
}

// The stream's lines, in the form its first two bytes announce. The reader closes the stream.
void read_lines(IFileReader *_p_stream, CText &_text) {
    unsigned const size = _p_stream->m_size;
    CCachedFileReader reader(_p_stream, true);
    unsigned char first[2] = {0, 0};
    bool const has_mark = reader.read(first, 2) && first[0] == k_mark_low && first[1] == k_mark_high;
    if (has_mark)
        read_wide_text(reader, size, _text);
    else
        read_narrow_text(reader, first, size, _text);
}

// ---------------------------------------------------------------------------------------------
// Parsing a line
// ---------------------------------------------------------------------------------------------

// Where the line's comment starts: the first "--" or "//" behind an even number of quotes.
size_t comment_start(wstring const &_line) {
    unsigned quotes = 0;
    for (size_t i = 0; i < _line.size(); ++i) {
        unsigned short const unit = _line[i];
        if (unit == k_quote)
            ++quotes;
        else if (quotes % 2 == 0 && (unit == '-' || unit == '/') && i + 1 < _line.size() &&
                 _line[i + 1] == unit)
            return i;
    }
    return _line.size();
}

// The most units that a narrow conversion takes.
size_t const k_max_key_units = 255;

// The line in a warning; cut so that its narrow form stays within what a conversion takes.
string line_for_report(wstring const &_line) {
    return CString(_line, static_cast<int>(std::min(_line.size(), k_max_key_units))).get_str_c();
}

} // namespace

// ---------------------------------------------------------------------------------------------
// The table
// ---------------------------------------------------------------------------------------------

// Lines of the form: key, a blank, the text in quotes.
void read_local_strings(IFileReader *_p_stream, char const *_file_name, local_strings_t &_table) {
    if (!QOR_CHECK(_p_stream)) return;
    CText text; // the default limit of 1024 lines: of a longer file, the last ones count
    read_lines(_p_stream, text);

    _table.clear();
    for (unsigned i = 0; i < text.get_num_strings(); ++i) {
        CString const *p_str = text.get_string(i);
        if (!QOR_CHECK(p_str)) continue;
        if (p_str->empty()) continue;
        wstring const line(*p_str, 0, comment_start(*p_str));

        size_t const end_key = std::min(line.find(' '), line.find('\t'));
        if (end_key == wstring::npos) continue; // no blank: no entry, and nothing to report
        if (end_key > k_max_key_units) {        // longer than a narrow conversion takes
            qordebug::warning("[init_local_strings('%s')]:\nCannot load string %u\n'%s'\nkey too long",
                              _file_name ? _file_name : "", i + 1, line_for_report(line).c_str());
            continue;
        }
        string const key = CString(line, static_cast<int>(end_key)).get_str_c();

        size_t const first_quote = line.find(k_quote, end_key);
        size_t const last_quote = line.rfind(k_quote);
        if (first_quote == wstring::npos || first_quote == last_quote) {
            qordebug::warning("[init_local_strings('%s')]:\nCannot load string %u\n'%s'\n\" expected",
                              _file_name ? _file_name : "", i + 1, line_for_report(line).c_str());
            continue;
        }
        _table[key] = CString(line.substr(first_quote + 1, last_quote - first_quote - 1));
    }
}

// A file that can't be opened leaves the table as it was.
void CUserInterface::load_local_strings() {
    string const file_name = config_string("ui", k_strings_key, k_default_strings_file, false);
    IFileSystem *p_files = GetFileSystem();
    IFileReader *p_stream =
        p_files ? p_files->open_file(qorbase::FILE_CATEGORY_UI, file_name.c_str()) : nullptr;
    if (!p_stream) {
        qordebug::warning(
            "Cannot open '%s'.\nPlease specify a valid file name as a value for '%s' parameter in GDF",
            file_name.c_str(), k_strings_key);
        return;
    }
    read_local_strings(p_stream, file_name.c_str(), m_local_strings);
}

unsigned short const *CUserInterface::get_local_string(char const *_key) {
    if (!_key) return nullptr;
    auto const found = m_local_strings.find(string(_key));
    return found == m_local_strings.end() ? nullptr : found->second.c_str();
}

CString local_string_or_key(char const *_p_key, bool _critical) {
    IUserInterface *p_ui = engine_interfaces().get_user_interface(_critical);
    unsigned short const *p_local = p_ui ? p_ui->get_local_string(_p_key) : nullptr;
    return p_local ? CString(p_local, -1) : CString(_p_key, -1);
}

// A linear search in key order: of two keys with the same text, the earlier one.
char const *CUserInterface::get_local_key(unsigned short const *_text) {
    if (!_text) return nullptr;
    for (auto const &entry : m_local_strings)
        if (entry.second.compare(_text) == 0) return entry.first.c_str();
    return nullptr;
}

// ---------------------------------------------------------------------------------------------
// Build version
// ---------------------------------------------------------------------------------------------

namespace {

// The version text on its line and the build number below it. A file that can't be read leaves
// the page empty, without a report.
void print_build_version(IStatsPage *_p_page) {
    IConfigFile *p_file = ReadConfigFile(qorbase::FILE_CATEGORY_CONFIG, k_build_version_file, 0);
    if (!p_file) return;
    IConfigSection *p_common = p_file->get_section("$$common$$");
    IConfigValue *p_text = p_common ? p_common->get_value("build_version", true) : nullptr;
    IConfigValue *p_line = p_common ? p_common->get_value("line", true) : nullptr;
    // Unsigned: a line out of the page's range is ignored by print, and the next one wraps safely.
    unsigned const line =
        static_cast<unsigned>(p_line ? p_line->get_int(k_default_build_line) : k_default_build_line);
    _p_page->print(line, "%s", p_text ? p_text->get_string("") : "");
    p_file->close(true); // the text belonged to the file
    _p_page->print(line + 1, "%u", k_build_number);
}

CStatsPage *make_build_version_page(CUserInterface &_service) {
    IStatsPage *p_page = _service.create_stats_page("build_version");
    if (p_page) print_build_version(p_page);
    return static_cast<CStatsPage *>(p_page);
}

} // namespace

// Made at the first drawn frame; drawn, when shown, on the desktop's canvas in the fixed font at a
// large size, in a 2D batch of its own.
void CUserInterface::draw_build_version() {
    if (!mp_build_version_page) mp_build_version_page = make_build_version_page(*this);
    CStatsPage *const p_page = mp_build_version_page;
    if (!p_page || !p_page->is_show() || !mp_desktop) return;
    IRender *p_render = mp_desktop->get_render();
    CFont *p_font = mp_desktop->get_font(FNT_NAME_FIXED);
    if (!QOR_CHECK(p_render) || !QOR_CHECK(p_font)) return;
    p_render->begin_draw();
    float const size = p_font->get_size();
    p_font->set_size(k_build_font_size);
    // The last window drawn left its own clip behind (the pointer's); the page spans the desktop.
    mp_desktop->get_canvas().set_clip_area_all();
    p_page->draw(&mp_desktop->get_canvas(), p_font);
    p_font->set_size(size);
    p_render->end_draw();
}

} // namespace qorui
