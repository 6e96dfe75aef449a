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

TEST(EngineInterfaces, AreQueriedOnceAndDroppedWhenWithdrawn) {
    CCountingServer server; // declared first: the cache goes first and leaves the server's listeners
    qorhost::CInputSystem input;
    qorhost::CLogManager log;
    server.register_interface(&input);
    server.register_interface(&log);
    CEngineInterfaces interfaces;
    interfaces.set_server(&server);
    qortest::CReportCapture capture;
    EXPECT_EQ(&input, interfaces.get_input_system(true));
    EXPECT_EQ(&input, interfaces.get_input_system(true));
    EXPECT_EQ(&log, interfaces.get_log_manager(true));
    EXPECT_EQ(2, server.m_queries);

    IInterfaceServerListener &listener = interfaces;
    listener._isv_action(ISA_REGISTERED, &input); // not a withdrawal
    EXPECT_EQ(&input, interfaces.get_input_system(true));
    EXPECT_EQ(2, server.m_queries);
    server.withdraw_interface(&input);
    EXPECT_EQ(1u, interfaces.get_cached_count());
    EXPECT_EQ(&log, interfaces.get_log_manager(true));      // the other entry stays
    EXPECT_EQ(nullptr, interfaces.get_input_system(false)); // asks the server, which has none now
    server.register_interface(&input);
    EXPECT_EQ(&input, interfaces.get_input_system(true));
    EXPECT_EQ(4, server.m_queries);
    server.withdraw_interface(&log);
    EXPECT_EQ(nullptr, interfaces.get_log_manager(false));
    EXPECT_TRUE(capture.reports().empty());

    // A missing interface is critical only when asked so.
    EXPECT_EQ(nullptr, interfaces.get_sound_system(true));
    EXPECT_EQ((std::vector<std::string>{"Can't get interface \"ISoundSystem\" version 1. Critical Error."}),
              capture.errors());
}

TEST(EngineInterfaces, TheLibraryHasOneLuaState) {
    EXPECT_EQ(&lua_machine(), &lua_machine());
    EXPECT_EQ(0, lua_machine().DoString("qorui_probe = 41 + 1"));
    EXPECT_EQ(42, lua_machine().GetGlobals().GetByName("qorui_probe").GetInteger());
}
