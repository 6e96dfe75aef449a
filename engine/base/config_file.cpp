// The GDF format: parsing, values, and writing back.
#include "config_file.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace qorbase {

namespace {

std::string trim(std::string const &_text) {
    size_t const first = _text.find_first_not_of(" \t\r\n");
    if (first == std::string::npos) return std::string();
    size_t const last = _text.find_last_not_of(" \t\r\n");
    return _text.substr(first, last - first + 1);
}

std::string unquote(std::string const &_text) {
    if (_text.size() >= 2 && _text.front() == '"' && _text.back() == '"') return _text.substr(1, _text.size() - 2);
    return _text;
}

bool is_comment_or_blank(std::string const &_line) {
    std::string const text = trim(_line);
    return text.empty() || text[0] == ';' || text[0] == '#';
}

void make_folders(std::string const &_path) {
    for (size_t slash = _path.find('/', 1); slash != std::string::npos; slash = _path.find('/', slash + 1))
        mkdir(_path.substr(0, slash).c_str(), 0755);
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Values
// ---------------------------------------------------------------------------------------------

vec2_t CConfigValue::get_vec2(float _default_x, float _default_y) {
    vec2_t const fallback = {_default_x, _default_y};
    if (!m_has_content) return fallback;
    char const *text = m_text.c_str();
    char *end = nullptr;
    float const x = strtof(text, &end);
    if (end == text) return fallback;
    text = end;
    while (*text == ' ' || *text == '\t' || *text == ',') ++text;
    float const y = strtof(text, &end);
    if (end == text) return fallback;
    return vec2_t{x, y};
}

int CConfigValue::get_int(int _default_value) {
    if (!m_has_content) return _default_value;
    char *end = nullptr;
    long const value = strtol(m_text.c_str(), &end, 0);
    return end == m_text.c_str() ? _default_value : static_cast<int>(value);
}

char const *CConfigValue::get_string(char const *_default_value) {
    return m_has_content ? m_text.c_str() : _default_value;
}

void CConfigValue::set_vec2(float _x, float _y) {
    char text[96];
    snprintf(text, sizeof(text), "%.9g, %.9g", _x, _y); // enough digits to read back the same floats
    set_string(text);
}

void CConfigValue::set_string(char const *_value) {
    m_text = _value ? _value : "";
    m_has_content = true;
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
    m_entries.push_back(SEntry{_name, std::string(), std::make_unique<CConfigValue>(mp_file, "", false), false});
    return m_entries.back().mp_value.get();
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
    CConfigSection *p_section = nullptr;
    size_t start = 0;
    while (start < _text.size()) {
        size_t end = _text.find('\n', start);
        if (end == std::string::npos) end = _text.size();
        std::string line = _text.substr(start, end - start);
        if (!line.empty() && line.back() == '\r') line.pop_back();
        start = end + 1;

        std::string const text = trim(line);
        if (!is_comment_or_blank(line) && text.front() == '[' && text.back() == ']') {
            m_sections.push_back(std::make_unique<CConfigSection>(this, trim(text.substr(1, text.size() - 2))));
            p_section = m_sections.back().get();
            continue;
        }
        size_t const equals = text.find('=');
        bool const is_key = !is_comment_or_blank(line) && equals != std::string::npos && p_section;
        if (!p_section) {
            m_preamble.push_back(line);
        } else if (is_key) {
            std::string const value = unquote(trim(text.substr(equals + 1)));
            p_section->entries().push_back(CConfigSection::SEntry{
                trim(text.substr(0, equals)), line, std::make_unique<CConfigValue>(this, value, true), true});
        } else {
            p_section->entries().push_back(CConfigSection::SEntry{std::string(), line, nullptr, true});
        }
    }
    m_dirty = false;
}

std::string CConfigFile::write() const {
    std::string out;
    for (std::string const &line : m_preamble) out += line + "\n";
    for (auto const &p_section : m_sections) {
        out += "[" + p_section->name() + "]\n";
        // New keys go behind the section's last key, before its trailing blank and comment lines.
        std::vector<CConfigSection::SEntry> &entries = const_cast<CConfigSection &>(*p_section).entries();
        size_t insert_at = entries.size();
        while (insert_at > 0 && !entries[insert_at - 1].mp_value) --insert_at;
        auto write_new_keys = [&]() {
            for (auto const &entry : entries)
                if (entry.mp_value && !entry.m_from_file && entry.mp_value->has_content())
                    out += entry.m_key + " = " + entry.mp_value->text() + "\n";
        };
        for (size_t i = 0; i < entries.size(); ++i) {
            if (i == insert_at) write_new_keys();
            auto const &entry = entries[i];
            if (!entry.m_from_file) continue;
            out += entry.mp_value ? entry.m_key + " = " + entry.mp_value->text() + "\n" : entry.m_line + "\n";
        }
        if (insert_at == entries.size()) write_new_keys();
    }
    return out;
}

bool read_text_file(std::string const &_path, std::string &_text) {
    FILE *in = fopen(_path.c_str(), "rb");
    if (!in) return false;
    _text.clear();
    char buffer[8192];
    size_t count;
    while ((count = fread(buffer, 1, sizeof(buffer), in)) > 0) _text.append(buffer, count);
    fclose(in);
    return true;
}

bool write_file_atomically(std::string const &_path, void const *_p_data, size_t _size) {
    make_folders(_path);
    std::string const temporary = _path + ".tmp";
    int const fd = open(temporary.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0644);
    if (fd < 0) return false;
    char const *p = static_cast<char const *>(_p_data);
    size_t left = _size;
    while (left > 0) {
        ssize_t const written = ::write(fd, p, left);
        if (written < 0 && errno == EINTR) continue;
        if (written <= 0) {
            close(fd);
            unlink(temporary.c_str());
            return false;
        }
        p += written;
        left -= static_cast<size_t>(written);
    }
    bool const synced = fsync(fd) == 0;
    close(fd);
    if (!synced || rename(temporary.c_str(), _path.c_str()) != 0) {
        unlink(temporary.c_str());
        return false;
    }
    return true;
}

} // namespace qorbase
