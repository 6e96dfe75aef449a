// The demo game's interface library: the engine loads it beside the UI library, named by
// "gameui_library" in the configuration. It announces itself in the log and adds one command.
#include "qor_commands.h"
#include "qor_interfaces.h"
#include "qor_log.h"

#include <string>

namespace {

ILogger *demo_logger(IInterfaceServer *_p_server) {
    ILogManager *p_log = static_cast<ILogManager *>(_p_server->query_interface(qor_uid::LOG_MANAGER, 1));
    return p_log ? p_log->create_logger("GameUI", "GameUI: ") : nullptr;
}

IInterfaceServer *gp_server = nullptr;

void cmd_gameui_demo(char const *_arguments, void *) {
    if (ILogger *p_logger = demo_logger(gp_server))
        p_logger->write((std::string("gameui_demo ") + (_arguments ? _arguments : "")).c_str(), 0);
}

} // namespace

extern "C" __attribute__((visibility("default"))) int RegisterInterface(IInterfaceServer *_p_server) {
    if (!_p_server) return -1;
    gp_server = _p_server;
    if (ILogger *p_logger = demo_logger(_p_server)) p_logger->write("Demo game interface library attached", 0);
    if (ICmdManagerBase *p_commands =
            static_cast<ICmdManagerBase *>(_p_server->query_interface(qor_uid::CMD_MANAGER, 1)))
        p_commands->register_command("gameui_demo", cmd_gameui_demo, nullptr);
    return 1;
}
