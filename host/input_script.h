// Replayable input for the headless host: one step a line, '#' starts a comment.
//
//   move DX DY          the pointer moves by a delta (desktop pixels, may be fractions)
//   press [BUTTON]      a button goes down (0 unless given)
//   release [BUTTON]    and up
//   wheel ROTATION
//   key_down VK [EXTRA] a key as a Windows virtual-key code (0xC0 is the console key)
//   key_up VK
//   char CODE           a character code
//   type TEXT           one character a byte of TEXT, the rest of the line (no '#')
//   wait N              N frames (update, draw, present; the clock moves 16 ms each)
//   wait Nms            the host's clock moves N ms without a frame
//   screenshot FILE     the last presented frame as PNG, FILE relative to the output folder
//   command LINE        a line through the engine's command manager
//
// Numbers are decimal or 0x hexadecimal.
#pragma once
#include <string>
#include <vector>

namespace qorhost {

class CHost;

class CInputScript {
public:
    // False with a message naming the file and line for a missing file or a bad line; nothing is
    // kept of a script that doesn't load.
    bool load(std::string const &_path, std::string &_error);
    bool parse(std::string const &_text, std::string const &_name, std::string &_error);
    // Runs every step on the host, whose interface is initialised.
    void play(CHost &_host) const;
    size_t get_steps_count() const { return m_steps.size(); }
    // The frames that the waits of the script run.
    unsigned long get_frames_count() const;

private:
    struct SStep {
        std::string m_verb;
        std::vector<float> m_numbers;
        std::string m_text; // screenshot file, command line, typed text
        bool m_milliseconds = false;
        unsigned m_line = 0;
    };
    static bool parse_line(std::string const &_line, SStep &_step, std::string &_error);
    void play_step(CHost &_host, SStep const &_step) const;

    std::vector<SStep> m_steps;
};

} // namespace qorhost
