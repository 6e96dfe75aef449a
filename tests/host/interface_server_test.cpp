// The host's interface server: registration and its results, queries by identifier and version,
// listeners told of registrations and withdrawals (also while they change the listener list),
// withdrawal of everything newest first, and modules loaded by file name.
#include "commands.h"
#include "host_test_support.h"
#include "interface_server.h"
#include "log_manager.h"

#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <utility>
#include <vector>

using namespace qorhost;
using hosttest::CReportCapture;

namespace {

constexpr SInterfaceUID k_uid_a = {{1, 2, 3, 4}};
constexpr SInterfaceUID k_uid_b = {{1, 2, 3, 5}};

// An interface of a module, with the identifier and version it is made with.
class CTestInterface : public IInterfaceBase {
public:
    CTestInterface(SInterfaceUID _uid, int _version) : m_uid(_uid), m_version(_version) {}
    SInterfaceUID get_uid() const override { return m_uid; }
    int get_version() const override { return m_version; }

private:
    SInterfaceUID m_uid;
    int m_version;
};

typedef std::vector<std::pair<std::string, IInterfaceBase *>> notice_list_t;

// Writes each notice, with its name, into a list shared by the listeners of a test, and then runs
// its action.
class CListener : public IInterfaceServerListener {
public:
    CListener(std::string const &_name, notice_list_t &_notices) : m_name(_name), m_notices(_notices) {}
    ~CListener() override {}

    void _isv_action(EInterfaceServerAction _action, IInterfaceBase *_p_interface) override {
        m_notices.emplace_back(m_name + (_action == ISA_WITHDRAWN ? " withdrawn" : " registered"),
                               _p_interface);
        if (m_action) m_action(_action, _p_interface);
    }

    std::function<void(EInterfaceServerAction, IInterfaceBase *)> m_action;

private:
    std::string m_name;
    notice_list_t &m_notices;
};

} // namespace

// A registration is new once and tells the listeners (each added once); a query finds the
// interface by every word of its identifier and its version.
TEST(InterfaceServer, RegistrationIsNewOnceAndQueriesFindItByIdentifierAndVersion) {
    CInterfaceServer server;
    notice_list_t notices;
    CListener listener("L", notices);
    server.add_listener(&listener);
    server.add_listener(&listener);
    CTestInterface a1(k_uid_a, 1), a2(k_uid_a, 2), b1(k_uid_b, 1);
    EXPECT_EQ(1, server.register_interface(&a1));
    EXPECT_EQ(0, server.register_interface(&a1));
    EXPECT_EQ(-1, server.register_interface(nullptr));
    EXPECT_EQ(1u, server.get_listeners_count());
    EXPECT_EQ((notice_list_t{{"L registered", &a1}}), notices);
    server.register_interface(&a2);
    server.register_interface(&b1);
    CLogManager log;
    server.register_interface(&log);
    EXPECT_EQ(4u, server.get_interfaces_count());

    struct {
        SInterfaceUID m_uid;
        int m_version;
        IInterfaceBase *mp_found;
    } const rows[] = {{k_uid_a, 1, &a1},
                      {k_uid_a, 2, &a2},
                      {k_uid_b, 1, &b1},
                      {qor_uid::LOG_MANAGER, 1, &log},
                      {k_uid_b, 2, nullptr},
                      {SInterfaceUID{{1, 2, 3, 6}}, 1, nullptr},
                      {SInterfaceUID{{0, 2, 3, 4}}, 1, nullptr}, // a word in any place makes another one
                      {qor_uid::INPUT_SYSTEM, 1, nullptr}};
    for (size_t i = 0; i < sizeof(rows) / sizeof(rows[0]); ++i)
        EXPECT_EQ(rows[i].mp_found, server.query_interface(rows[i].m_uid, rows[i].m_version)) << "row " << i;
}

TEST(InterfaceServer, WithdrawalTellsListenersWhileTheInterfaceIsStillThereNewestFirst) {
    CInterfaceServer server;
    CTestInterface a(k_uid_a, 1), b(k_uid_b, 1);
    server.register_interface(&a);
    server.register_interface(&b);
    notice_list_t notices;
    CListener first("first", notices), second("second", notices);
    std::vector<IInterfaceBase *> seen;
    first.m_action = [&](EInterfaceServerAction, IInterfaceBase *) {
        seen.push_back(server.query_interface(k_uid_a, 1));
    };
    server.add_listener(&first);
    server.add_listener(&second);

    server.withdraw_interface(&a);
    EXPECT_EQ((notice_list_t{{"first withdrawn", &a}, {"second withdrawn", &a}}), notices);
    EXPECT_EQ(std::vector<IInterfaceBase *>{&a}, seen);
    EXPECT_EQ(nullptr, server.query_interface(k_uid_a, 1));
    EXPECT_EQ(&b, server.query_interface(k_uid_b, 1));

    // What isn't there (any more) tells nobody.
    notices.clear();
    server.withdraw_interface(&a);
    server.withdraw_interface(nullptr);
    EXPECT_TRUE(notices.empty());
    // A removed listener hears nothing.
    server.remove_listener(&first);
    server.withdraw_interface(&b);
    EXPECT_EQ((notice_list_t{{"second withdrawn", &b}}), notices);
    EXPECT_EQ(0u, server.get_interfaces_count());

    // Withdrawing everything goes newest first.
    CTestInterface c(k_uid_b, 2);
    for (IInterfaceBase *p : std::vector<IInterfaceBase *>{&a, &b, &c})
        server.register_interface(p);
    notices.clear();
    server.withdraw_all();
    EXPECT_EQ((notice_list_t{{"second withdrawn", &c}, {"second withdrawn", &b}, {"second withdrawn", &a}}),
              notices);
    EXPECT_EQ(0u, server.get_interfaces_count());
}

TEST(InterfaceServer, ListenerRemovedDuringANoticeHearsNothingMore) {
    CInterfaceServer server;
    CTestInterface a(k_uid_a, 1);
    notice_list_t notices;
    CListener remover("remover", notices), removed("removed", notices), last("last", notices);
    // The first listener takes itself and the next one off the list at the first notice.
    remover.m_action = [&](EInterfaceServerAction, IInterfaceBase *) {
        server.remove_listener(&remover);
        server.remove_listener(&removed);
    };
    server.add_listener(&remover);
    server.add_listener(&removed);
    server.add_listener(&last);

    server.register_interface(&a);
    server.withdraw_interface(&a);
    EXPECT_EQ((notice_list_t{{"remover registered", &a}, {"last registered", &a}, {"last withdrawn", &a}}),
              notices);

    EXPECT_EQ(1u, server.get_listeners_count());
}

TEST(InterfaceServerModules, LoadedModuleRegistersThroughItsEntryPointAndMissingOnesAreReported) {
    // The demo game library, built beside the tests, finds the log and the commands on the server.
    CReportCapture reports;
    CLogManager log;
    log.set_quiet(true);
    CVarManager vars;
    CCmdManager commands(&vars);
    CInterfaceServer server;
    server.set_modules_folders({executable_folder()});
    server.register_interface(&log);
    server.register_interface(&commands);

    server.load_module(1, "libgameui_demo.so");
    EXPECT_TRUE(reports.reports().empty());
    // A library that is missing is reported by its name; no name loads nothing.
    unsigned const interfaces = server.get_interfaces_count();
    server.load_module(1, "libqorhost_no_such_module.so");
    EXPECT_EQ(nullptr, server.open_module("/nowhere/libqorhost_no_such_module.so"));
    server.load_module(1, nullptr);
    server.load_module(1, "");
    std::vector<std::string> const warnings = reports.warnings();
    ASSERT_EQ(2u, warnings.size());
    EXPECT_EQ(0u, warnings[0].find("Cannot load module 'libqorhost_no_such_module.so': ")) << warnings[0];
    EXPECT_NE(std::string::npos,
              warnings[0].find("libqorhost_no_such_module.so: cannot open shared object file"))
        << warnings[0];
    EXPECT_EQ(0u, warnings[1].find("Cannot load module '/nowhere/libqorhost_no_such_module.so': "))
        << warnings[1];
    EXPECT_EQ(interfaces, server.get_interfaces_count());
    ILogger *p_logger = log.find_logger("GameUI");
    ASSERT_NE(nullptr, p_logger);
    ASSERT_EQ(1u, log.get_next_index());
    EXPECT_EQ("Demo game interface library attached", log.get_message_text(0));
    ASSERT_TRUE(commands.has_command("gameui_demo"));
    EXPECT_TRUE(commands.execute("gameui_demo", "hello", false));
    EXPECT_EQ("gameui_demo hello", log.get_message_text(1));
    commands.unregister_command("gameui_demo");
    server.withdraw_all();
    server.close_modules();
}
