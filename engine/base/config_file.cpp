// The GDF format: parsing, values, writing back, and the file helpers that read and write it.
//
//   Values ........... parsing and formatting of the text of one key
//   Sections, files .. the lines in file order, and writing them back
//   File helpers ..... whole-file reads and atomic writes
#include "config_file.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

namespace qorbase {

namespace {

std::string trim(std::string const &_text) {
    size_t const first = _text.find_first_not_of(" \t\r\n");
    if (first == std::string::npos) return std::string();
    size_t const last = _text.find_last_not_of(" \t\r\n");
    return _text.substr(first, last - first + 1);
}

bool is_quoted(std::string const &_text) {
    return _text.size() >= 2 && _text.front() == '"' && _text.back() == '"';
}

std::string unquote(std::string const &_text) {
    return is_quoted(_text) ? _text.substr(1, _text.size() - 2) : _text;
}

bool is_comment_or_blank(std::string const &_trimmed) {
    return _trimmed.empty() || _trimmed[0] == ';' || _trimmed[0] == '#';
}

// The text of a value as it goes into a line: a line break can't stand in one, and quotes keep
// what trimming or unquoting on the next read would change.
std::string format_value(std::string const &_text, bool _quote) {
    std::string text = _text;
    for (char &c : text)
        if (c == '\n' || c == '\r') c = ' ';
    bool const needs_quotes = text != trim(text) || is_quoted(text);
    return _quote || needs_quotes ? "\"" + text + "\"" : text;
}

void make_folders(std::string const &_path) {
    for (size_t slash = _path.find('/', 1); slash != std::string::npos; slash = _path.find('/', slash + 1))
        mkdir(_path.substr(0, slash).c_str(), 0755);
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Values
// ---------------------------------------------------------------------------------------------

// "x, y" or "x y"; anything that doesn't give two numbers gives the default.
vec2_t CConfigValue::get_vec2(float _default_x, float _default_y) {
    vec2_t const fallback = {_default_x, _default_y};
    if (!has_content()) return fallback;
    char const *text = m_text.c_str();
    char *end = nullptr;
    float const x = strtof(text, &end);
    if (end == text) return fallback;
    text = end;
    while (*text == ' ' || *text == '\t')
        ++text;
    if (*text == ',') ++text;
    float const y = strtof(text, &end);
    if (end == text) return fallback;
    return vec2_t{x, y};
}

int CConfigValue::get_int(int _default_value) {
    if (!has_content()) return _default_value;
    char *end = nullptr;
    long const value = strtol(m_text.c_str(), &end, 10);
    return end == m_text.c_str() ? _default_value : static_cast<int>(value);
}

char const *CConfigValue::get_string(char const *_default_value) {
    return has_content() ? m_text.c_str() : _default_value;
}

void CConfigValue::set_vec2(float _x, float _y) {
    char text[96];
    snprintf(text, sizeof(text), "%.9g, %.9g", _x, _y); // 9 digits read back as the same float
    set_string(text);
}

void CConfigValue::set_string(char const *_value) {
    std::string const text = _value ? _value : "";
    if (text == m_text) return;
    m_text = text;
    m_changed = true;
    mp_file->mark_dirty();
}

// ---------------------------------------------------------------------------------------------
// Sections and files
// ---------------------------------------------------------------------------------------------

IConfigValue *CConfigSection::get_value(char const *_name, bool _create) {
    if (!_name) return nullptr;
    for (SEntry &entry : m_entries)
        if (entry.mp_value && entry.m_key == _name) return entry.mp_value.get();
    if (!_create) return nullptr;
    m_entries.push_back(SEntry{_name, std::string(), std::make_unique<CConfigValue>(mp_file, ""), false});
    return m_entries.back().mp_value.get();
}

void CConfigSection::add_key(std::string const &_key, std::string const &_line, std::string const &_value) {
    m_entries.push_back(SEntry{_key, _line, std::make_unique<CConfigValue>(mp_file, _value), true});
}

// Lines that stood in the file come out as read unless their value was set; keys added since go
// behind the section's last key, before the blank and comment lines that close the section.
void CConfigSection::write(std::string &_out, std::string const &_newline) const {
    size_t insert_at = 0;
    for (size_t i = 0; i < m_entries.size(); ++i)
        if (m_entries[i].mp_value && m_entries[i].m_from_file) insert_at = i + 1;

    auto write_new_keys = [&]() {
        for (SEntry const &entry : m_entries)
            if (!entry.m_from_file && entry.mp_value->has_content())
                _out += entry.m_key + " = " + format_value(entry.mp_value->text(), false) + _newline;
    };

    _out += m_header + _newline;
    for (size_t i = 0; i < m_entries.size(); ++i) {
        if (i == insert_at) write_new_keys();
        SEntry const &entry = m_entries[i];
        if (!entry.m_from_file) continue;
        if (!entry.mp_value || !entry.mp_value->is_changed()) {
            _out += entry.m_line + _newline;
            continue;
        }
        // The key's part of the line stays as written; the value follows one blank.
        size_t const equals = entry.m_line.find('=');
        bool const was_quoted = trim(entry.m_line.substr(equals + 1))[0] == '"';
        _out += entry.m_line.substr(0, equals + 1) + " " + format_value(entry.mp_value->text(), was_quoted) +
                _newline;
    }
    if (insert_at == m_entries.size()) write_new_keys();
}

IConfigSection *CConfigFile::get_section(char const *_name) {
    if (!_name) return nullptr;
    for (auto &p_section : m_sections)
        if (p_section->name() == _name) return p_section.get();
    return nullptr;
}

void CConfigFile::close(bool _destroy) {
    if (_destroy) delete this;
}

void CConfigFile::parse(std::string const &_text) {
    m_preamble.clear();
    m_sections.clear();
    size_t const first_break = _text.find('\n');
    m_newline =
        first_break != std::string::npos && first_break > 0 && _text[first_break - 1] == '\r' ? "\r\n" : "\n";
    m_final_newline = _text.empty() || _text.back() == '\n';

    CConfigSection *p_section = nullptr;
    size_t start = 0;
    while (start < _text.size()) {
        size_t end = _text.find('\n', start);
        if (end == std::string::npos) end = _text.size();
        std::string line = _text.substr(start, end - start);
        if (!line.empty() && line.back() == '\r') line.pop_back();
        start = end + 1;

        std::string const text = trim(line);
        size_t const equals = text.find('=');
        if (!is_comment_or_blank(text) && text.front() == '[' && text.back() == ']') {
            m_sections.push_back(
                std::make_unique<CConfigSection>(this, trim(text.substr(1, text.size() - 2)), line));
            p_section = m_sections.back().get();
        } else if (!p_section) {
            m_preamble.push_back(line);
        } else if (!is_comment_or_blank(text) && equals != std::string::npos && equals > 0) {
            p_section->add_key(trim(text.substr(0, equals)), line, unquote(trim(text.substr(equals + 1))));
        } else {
            p_section->add_line(line); // comments, blanks, and lines that are no key stay as they are
        }
    }
    m_dirty = false;
}

std::string CConfigFile::write() const {
    std::string out;
    for (std::string const &line : m_preamble)
        out += line + m_newline;
    for (auto const &p_section : m_sections)
        p_section->write(out, m_newline);
    if (!m_final_newline && out.size() >= m_newline.size()) out.resize(out.size() - m_newline.size());
    return out;
}

// ---------------------------------------------------------------------------------------------
// File helpers
// ---------------------------------------------------------------------------------------------

int open_regular_file(std::string const &_path, size_t *_p_size) {
    int const fd = open(_path.c_str(), O_RDONLY | O_CLOEXEC);
    if (fd < 0) return -1;
    struct stat info;
    if (fstat(fd, &info) != 0 || !S_ISREG(info.st_mode)) {
        close(fd);
        return -1;
    }
    *_p_size = static_cast<size_t>(info.st_size);
    return fd;
}

bool read_exactly(int _fd, void *_p_buffer, size_t _size) {
    char *p = static_cast<char *>(_p_buffer);
    while (_size > 0) {
        ssize_t const count = ::read(_fd, p, _size);
        if (count < 0 && errno == EINTR) continue;
        if (count <= 0) return false;
        p += count;
        _size -= static_cast<size_t>(count);
    }
    return true;
}

bool read_text_file(std::string const &_path, std::string &_text) {
    size_t size = 0;
    int const fd = open_regular_file(_path, &size);
    if (fd < 0) return false;
    _text.assign(size, '\0');
    bool const ok = read_exactly(fd, &_text[0], size);
    close(fd);
    return ok;
}

namespace {

// The whole buffer to _fd; false on a write error.
bool write_all(int _fd, void const *_p_data, size_t _size) {
    char const *p = static_cast<char const *>(_p_data);
    while (_size > 0) {
        ssize_t const written = ::write(_fd, p, _size);
        if (written < 0 && errno == EINTR) continue;
        if (written <= 0) return false;
        p += written;
        _size -= static_cast<size_t>(written);
    }
    return true;
}

// A new temporary file beside _path with the content, on the disk; its name in _temporary.
bool write_temporary(SFileContent const &_file, std::string &_temporary) {
    make_folders(_file.m_path);
    std::string name = _file.m_path + ".XXXXXX";
    int const fd = mkstemp(&name[0]);
    if (fd < 0) return false;
    _temporary = name;
    // The data reaches the disk before a rename makes it the file.
    bool const complete =
        fchmod(fd, 0644) == 0 && write_all(fd, _file.mp_data, _file.m_size) && fsync(fd) == 0;
    return close(fd) == 0 && complete;
}

} // namespace

bool write_files_atomically(SFileContent const *_p_files, size_t _count) {
    std::vector<std::string> temporaries(_count);
    bool complete = true;
    for (size_t i = 0; i < _count && complete; ++i)
        complete = write_temporary(_p_files[i], temporaries[i]);
    for (size_t i = 0; i < _count && complete; ++i)
        complete = rename(temporaries[i].c_str(), _p_files[i].m_path.c_str()) == 0;
    int const error = errno;
    for (std::string const &temporary : temporaries)
        if (!temporary.empty()) unlink(temporary.c_str()); // gone already after its rename
    errno = error;
    return complete;
}

bool write_file_atomically(std::string const &_path, void const *_p_data, size_t _size) {
    SFileContent const file = {_path, _p_data, _size};
    return write_files_atomically(&file, 1);
}

} // namespace qorbase
