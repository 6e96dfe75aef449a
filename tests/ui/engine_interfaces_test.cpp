// The cache of engine interfaces: one query per interface, and dropped pointers on withdrawal.
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

class EngineInterfacesTest : public ::testing::Test {
protected:
    void SetUp() override {
        m_server.register_interface(&m_input);
        m_server.register_interface(&m_log);
        m_interfaces.set_server(&m_server);
    }

    // Declared last, the cache goes first and leaves the server's listeners itself.
    CCountingServer m_server;
    qorhost::CInputSystem m_input;
    qorhost::CLogManager m_log;
    CEngineInterfaces m_interfaces;
};

} // namespace

TEST_F(EngineInterfacesTest, SecondGetIsServedFromTheCache) {
    EXPECT_EQ(&m_input, m_interfaces.get_input_system(true));
    EXPECT_EQ(&m_input, m_interfaces.get_input_system(true));
    EXPECT_EQ(1, m_server.m_queries);
    EXPECT_EQ(1u, m_interfaces.get_cached_count());
}

TEST_F(EngineInterfacesTest, WithdrawalDropsThePointerAndTheNextGetAsksAgain) {
    m_interfaces.get_input_system(true);
    m_interfaces.get_log_manager(true);
    ASSERT_EQ(2u, m_interfaces.get_cached_count());

    m_server.withdraw_interface(&m_input);
    EXPECT_EQ(1u, m_interfaces.get_cached_count());
    EXPECT_EQ(&m_log, m_interfaces.get_log_manager(true)); // the other entry stays

    qortest::CReportCapture capture;
    EXPECT_EQ(nullptr, m_interfaces.get_input_system(false)); // asks the server, which has none now
    EXPECT_EQ(3, m_server.m_queries);
    m_server.register_interface(&m_input);
    EXPECT_EQ(&m_input, m_interfaces.get_input_system(true));
    EXPECT_EQ(2u, m_interfaces.get_cached_count());
    EXPECT_TRUE(capture.reports().empty());
}

TEST_F(EngineInterfacesTest, OnlyActionOneForACachedPointerChangesAnything) {
    IInterfaceServerListener &listener = m_interfaces;
    m_interfaces.get_input_system(true);

    listener._isv_action(ISA_REGISTERED, &m_input);
    listener._isv_action(static_cast<EInterfaceServerAction>(7), &m_input);
    listener._isv_action(ISA_WITHDRAWN, &m_log); // not cached
    EXPECT_EQ(1u, m_interfaces.get_cached_count());
    EXPECT_EQ(&m_input, m_interfaces.get_input_system(true));
    EXPECT_EQ(1, m_server.m_queries);
}

TEST_F(EngineInterfacesTest, MissingInterfaceIsCriticalOnlyWhenAskedSo) {
    qortest::CReportCapture capture;
    EXPECT_EQ(nullptr, m_interfaces.get_sound_system(false));
    EXPECT_TRUE(capture.reports().empty());
    EXPECT_EQ(0u, m_interfaces.get_cached_count());

    EXPECT_EQ(nullptr, m_interfaces.get_sound_system(true));
    ASSERT_EQ(1u, capture.reports().size());
    EXPECT_EQ(qordebug::REPORT_ERROR, capture.reports()[0].m_kind);
    EXPECT_EQ("Can't get interface \"ISoundSystem\" version 1. Critical Error.", capture.reports()[0].m_text);
    EXPECT_EQ(0u, m_interfaces.get_cached_count());
}

TEST(LuaMachine, IsOneStateForTheLibrary) {
    LuaPlus::LuaState &state = lua_machine();
    EXPECT_EQ(&state, &lua_machine());
    EXPECT_EQ(0, state.DoString("qorui_probe = 41 + 1"));
    EXPECT_EQ(42, lua_machine().GetGlobals().GetByName("qorui_probe").GetInteger());
}
