// The GDF format: "[section]" lines and "key = value" lines; lines starting with ';' or '#' are
// comments. A file keeps its lines as read, so writing it back changes only the values set: every
// other line, comments and blanks included, comes out byte for byte as it went in.
#pragma once
#include "qorbase.h"

#include <memory>
#include <string>
#include <vector>

namespace qorbase {

class CConfigFile;

class CConfigValue : public IConfigValue {
public:
    CConfigValue(CConfigFile *_p_file, std::string const &_text) : mp_file(_p_file), m_text(_text) {}

    vec2_t get_vec2(float _default_x, float _default_y) override;
    int get_int(int _default_value) override;
    char const *get_string(char const *_default_value) override;
    void set_vec2(float _x, float _y) override;
    void set_string(char const *_value) override;
    // An empty value, in the file or made by get_value, has no content.
    bool has_content() const override { return !m_text.empty(); }

    std::string const &text() const { return m_text; }
    bool is_changed() const { return m_changed; }

private:
    CConfigFile *mp_file;
    std::string m_text;
    bool m_changed = false; // set since the file was read: its line is written anew
};

class CConfigSection : public IConfigSection {
public:
    CConfigSection(CConfigFile *_p_file, std::string const &_name, std::string const &_header)
        : mp_file(_p_file), m_name(_name), m_header(_header) {}

    IConfigValue *get_value(char const *_name, bool _create) override;

    // One line of the section in file order; keys added later have no line of their own yet.
    struct SEntry {
        std::string m_key;                      // empty for a comment or blank line
        std::string m_line;                     // the line as read, without its line break
        std::unique_ptr<CConfigValue> mp_value; // null for a comment or blank line
        bool m_from_file;                       // the entry stood in the file
    };

    void add_line(std::string const &_line) { m_entries.push_back(SEntry{"", _line, nullptr, true}); }
    void add_key(std::string const &_key, std::string const &_line, std::string const &_value);
    // The section's lines as they are to be written, each followed by _newline.
    void write(std::string &_out, std::string const &_newline) const;

    std::string const &name() const { return m_name; }

private:
    CConfigFile *mp_file;
    std::string m_name;
    std::string m_header; // the "[section]" line as read
    std::vector<SEntry> m_entries;
};

class CConfigFile : public IConfigFile {
public:
    CConfigFile() {}
    virtual ~CConfigFile() {}

    IConfigSection *get_section(char const *_name) override;
    void close(bool _destroy) override;

    // Parses text of the GDF format; the previous content goes.
    void parse(std::string const &_text);
    // The file's text: lines as read, with the values that were set in place.
    std::string write() const;

    void mark_dirty() { m_dirty = true; }
    bool is_dirty() const { return m_dirty; }
    void clear_dirty() { m_dirty = false; }

private:
    std::vector<std::string> m_preamble; // lines before the first section
    std::vector<std::unique_ptr<CConfigSection>> m_sections;
    std::string m_newline = "\n"; // the line break of the file's first line
    bool m_final_newline = true;  // the file's last line ended with a line break
    bool m_dirty = false;
};

// Opens a regular file for reading; -1 when it can't. *_p_size takes its size.
int open_regular_file(std::string const &_path, size_t *_p_size);
// Reads _size bytes from _fd; false on a read error or a short file.
bool read_exactly(int _fd, void *_p_buffer, size_t _size);
// Reads a whole regular file; false when it can't be read.
bool read_text_file(std::string const &_path, std::string &_text);

} // namespace qorbase
