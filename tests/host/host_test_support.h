// What the host's tests share: captured reports, a temporary folder for the files a test makes,
// little-endian byte writers for those files, WAV files, and a readable print of colours.
#pragma once
#include "qor_math.h"
#include "qordebug.h"

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <ostream>
#include <string>
#include <vector>

// gtest prints colours as their four bytes.
inline void PrintTo(rgba_t const &_c, std::ostream *_p_out) {
    *_p_out << "rgba(" << int(_c.r) << ", " << int(_c.g) << ", " << int(_c.b) << ", " << int(_c.a) << ")";
}

namespace hosttest {

// Captures every report of qordebug while it lives; reports don't reach stderr.
class CReportCapture {
public:
    struct SReport {
        qordebug::EReportKind m_kind;
        std::string m_text;
    };

    CReportCapture() {
        qordebug::set_report_handler(on_report, this, false, &mp_previous, &mp_previous_user);
    }
    ~CReportCapture() { qordebug::set_report_handler(mp_previous, mp_previous_user, mp_previous == nullptr); }
    CReportCapture(CReportCapture const &) = delete;
    CReportCapture &operator=(CReportCapture const &) = delete;

    std::vector<SReport> const &reports() const { return m_reports; }
    std::vector<std::string> texts(qordebug::EReportKind _kind) const {
        std::vector<std::string> result;
        for (SReport const &report : m_reports)
            if (report.m_kind == _kind) result.push_back(report.m_text);
        return result;
    }
    std::vector<std::string> warnings() const { return texts(qordebug::REPORT_WARNING); }
    void clear() { m_reports.clear(); }

private:
    static void on_report(qordebug::EReportKind _kind, char const *_text, void *_user) {
        static_cast<CReportCapture *>(_user)->m_reports.push_back(SReport{_kind, _text});
    }

    std::vector<SReport> m_reports;
    qordebug::report_handler_t mp_previous = nullptr;
    void *mp_previous_user = nullptr;
};

typedef std::vector<uint8_t> bytes_t;

// A new empty folder under /tmp, removed with everything in it when the object goes.
class CTempDir {
public:
    CTempDir() {
        char name[] = "/tmp/qorhost_test_XXXXXX";
        if (mkdtemp(name)) m_path = name;
    }
    ~CTempDir() {
        std::error_code ignored;
        if (!m_path.empty()) std::filesystem::remove_all(m_path, ignored);
    }
    CTempDir(CTempDir const &) = delete;
    CTempDir &operator=(CTempDir const &) = delete;

    std::string const &path() const { return m_path; }
    std::string file(std::string const &_name) const { return m_path + "/" + _name; }

    // Writes a file of the folder (sub folders are made); result its full path.
    std::string write(std::string const &_name, bytes_t const &_content) const {
        std::string const full = file(_name);
        std::filesystem::create_directories(std::filesystem::path(full).parent_path());
        if (FILE *p_file = fopen(full.c_str(), "wb")) {
            if (!_content.empty()) fwrite(_content.data(), 1, _content.size(), p_file);
            fclose(p_file);
        }
        return full;
    }

private:
    std::string m_path;
};

inline bytes_t read_bytes(std::string const &_path) {
    bytes_t content;
    if (FILE *p_file = fopen(_path.c_str(), "rb")) {
        int c;
        while ((c = fgetc(p_file)) != EOF)
            content.push_back(static_cast<uint8_t>(c));
        fclose(p_file);
    }
    return content;
}

inline void put_u16(bytes_t &_out, unsigned _value) {
    _out.push_back(static_cast<uint8_t>(_value & 0xFF));
    _out.push_back(static_cast<uint8_t>((_value >> 8) & 0xFF));
}

inline void put_u32(bytes_t &_out, uint32_t _value) {
    put_u16(_out, _value & 0xFFFF);
    put_u16(_out, _value >> 16);
}

inline void put_text(bytes_t &_out, char const *_text) {
    for (char const *p = _text; *p; ++p)
        _out.push_back(static_cast<uint8_t>(*p));
}

// A RIFF chunk, padded to an even size.
inline bytes_t chunk(char const *_id, bytes_t const &_payload) {
    bytes_t out;
    put_text(out, _id);
    put_u32(out, static_cast<uint32_t>(_payload.size()));
    out.insert(out.end(), _payload.begin(), _payload.end());
    if (_payload.size() & 1) out.push_back(0);
    return out;
}

// A WAV "fmt " chunk; format 1 is PCM.
inline bytes_t format_chunk(unsigned _format, unsigned _bits, unsigned _channels = 1,
                            unsigned _rate = 22050) {
    bytes_t payload;
    put_u16(payload, _format);
    put_u16(payload, _channels);
    put_u32(payload, _rate);
    put_u32(payload, _rate * _channels * _bits / 8);
    put_u16(payload, _channels * _bits / 8);
    put_u16(payload, _bits);
    return chunk("fmt ", payload);
}

inline bytes_t wave(std::vector<bytes_t> const &_chunks) {
    bytes_t body;
    put_text(body, "WAVE");
    for (bytes_t const &c : _chunks)
        body.insert(body.end(), c.begin(), c.end());
    bytes_t out;
    put_text(out, "RIFF");
    put_u32(out, static_cast<uint32_t>(body.size()));
    out.insert(out.end(), body.begin(), body.end());
    return out;
}

// A PCM WAV of 16-bit samples, interleaved when there are more channels.
inline bytes_t wave16(std::vector<int> const &_samples, unsigned _channels = 1, unsigned _rate = 22050) {
    bytes_t data;
    for (int sample : _samples)
        put_u16(data, static_cast<uint16_t>(static_cast<int16_t>(sample)));
    return wave({format_chunk(1, 16, _channels, _rate), chunk("data", data)});
}

} // namespace hosttest
