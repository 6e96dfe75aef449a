// The cache of engine interfaces: one query per interface, dropped pointers on withdrawal, and
// the library's one Lua state.
#include "engine_interfaces.h"

#include "input_system.h"
#include "interface_server.h"
#include "log_manager.h"
#include "qorscriptsystem.h"
#include "test_support.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

// The host's server, counting the queries that reach it.
class CCountingServer : public qorhost::CInterfaceServer {
public:
    IInterfaceBase *query_interface(SInterfaceUID _uid, int _version) override {
        ++m_queries;
        return CInterfaceServer::query_interface(_uid, _version);
    }
    int m_queries = 0;
};

} // namespace

// A registration drops nothing; a withdrawal drops only its own entry; a missing interface is
// critical only when asked so.
TEST(EngineInterfaces, AreQueriedOnceAndDroppedWhenWithdrawn) {
    CCountingServer server; // declared first: the cache goes first and leaves the server's listeners
    qorhost::CInputSystem input;
    qorhost::CLogManager log;
    server.register_interface(&input);
    server.register_interface(&log);
    CEngineInterfaces interfaces;
    interfaces.set_server(&server);
    qortest::CReportCapture capture;
    interfaces.get_input_system(true);
    EXPECT_EQ(&log, interfaces.get_log_manager(true));
    static_cast<IInterfaceServerListener &>(interfaces)._isv_action(ISA_REGISTERED, &input);
    EXPECT_EQ(&input, interfaces.get_input_system(true));
    EXPECT_EQ(2, server.m_queries);
    server.withdraw_interface(&input);
    EXPECT_EQ(1u, interfaces.get_cached_count());
    EXPECT_EQ(nullptr, interfaces.get_input_system(false)); // asks the server, which has none now
    EXPECT_EQ(3, server.m_queries);
    EXPECT_TRUE(capture.reports().empty());
    EXPECT_EQ(nullptr, interfaces.get_sound_system(true));
    EXPECT_EQ((std::vector<std::string>{"Can't get interface \"ISoundSystem\" version 1. Critical Error."}),
              capture.errors());
    EXPECT_EQ(0, lua_machine().DoString("qorui_probe = 41 + 1")); // the library's one Lua state
    EXPECT_EQ(42, lua_machine().GetGlobals().GetByName("qorui_probe").GetInteger());
}
