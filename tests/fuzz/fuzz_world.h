// What every fuzz target shares: the data of the source tree in a folder of the run, a desktop of
// its own for each input on a small software renderer, the reference host with a started service
// for the targets that go through it, Lua held within bounds, and reports that end the run where
// they show a fault.
//
// A broken contract aborts the run (bad data must be reported as bad data, not reach a contract),
// apart from the contracts that a layout meant for another window is documented to break.
// Warnings and errors are the expected answer to bad data and go nowhere.
#pragma once
#include "host.h"
#include "ui_desktop.h"

#include <cstddef>
#include <cstdint>
#include <string>

namespace qorfuzz {

// Once per process, before the first input: reports, clock, folders, the fonts factory.
void init();

// The interface data of the run: a copy of the source tree's data/ui, here a target writes its
// input as a file where the library reads it.
std::string const &ui_dir();
void write_ui_file(char const *_name, uint8_t const *_p_data, size_t _size);
// Puts a file of the source tree's data/ui back as it was.
void restore_ui_file(char const *_name);

// A shown desktop of 160 by 120 pixels with the default fonts; the caller deletes it.
qorui::CDesktop *new_desktop();
// An update and a draw of the desktop on the software renderer.
void frame(qorui::CDesktop *_p_desktop);

// The reference host on the run's data, its library loaded; shared by all inputs.
qorhost::CHost &host();
// The same host with its service started (init and the configuration's commands).
qorhost::CHost &started_host();
// The run's interface data as it was at the start, the output folder empty: what commands and
// scripts wrote is gone.
void clean_output();
// The categories of files back on the run's folders.
void restore_folders();

// Removes the Lua globals that inputs made since init, so that each input starts alike.
void reset_lua();

} // namespace qorfuzz
