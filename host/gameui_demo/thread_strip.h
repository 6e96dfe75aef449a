// The demo's thread strip: the activity of the host's own threads over the last four seconds, a
// bar and a busy share for each, drawn over the scene by the thread monitor. Two commands:
// "gameui_threads" shows it on the machine's live sampler, "gameui_threads FILE" on the rings of a
// recording file (a replay, the same picture on every machine), and "gameui_threads_save FILE"
// writes the live rings and the threads' names to a recording file. A second "gameui_threads"
// without a file hides the strip.
#pragma once

class ICmdManagerBase;
class IInterfaceServer;

namespace gameui_demo {

void register_thread_strip_commands(IInterfaceServer *_p_server, ICmdManagerBase *_p_commands);

} // namespace gameui_demo
