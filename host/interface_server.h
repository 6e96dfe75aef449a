// The host's interface server: modules register their interfaces and find each other's by
// identifier and version; listeners hear of withdrawals; further modules load by file name.
#pragma once
#include "qor_interfaces.h"

#include <string>
#include <vector>

namespace qorhost {

class CInterfaceServer : public IInterfaceServer {
public:
    CInterfaceServer();
    virtual ~CInterfaceServer();

    IInterfaceBase *query_interface(SInterfaceUID _uid, int _version) override;
    int register_interface(IInterfaceBase *_p_interface) override;
    void load_module(int _flag, char const *_library_name) override;
    void add_listener(IInterfaceServerListener *_p_listener) override;
    void remove_listener(IInterfaceServerListener *_p_listener) override;
    void withdraw_interface(IInterfaceBase *_p_interface) override;

    // Where a module named without a folder is looked for, in this order, before the system's
    // library search.
    void set_modules_folders(std::vector<std::string> const &_folders) { m_modules_folders = _folders; }
    // Opens a module and calls its RegisterInterface with this server; null on failure, with a
    // warning that names the module.
    void *open_module(char const *_library_name);
    // Withdraws every interface, newest first.
    void withdraw_all();
    // Closes the loaded modules, newest first, while the server still stands: their statics end
    // now, and may still call the server as they go.
    void close_modules();

    unsigned get_interfaces_count() const { return static_cast<unsigned>(m_interfaces.size()); }
    unsigned get_listeners_count() const { return static_cast<unsigned>(m_listeners.size()); }

private:
    void notify(EInterfaceServerAction _action, IInterfaceBase *_p_interface);

    std::vector<IInterfaceBase *> m_interfaces;
    std::vector<IInterfaceServerListener *> m_listeners;
    std::vector<void *> m_modules;
    std::vector<std::string> m_modules_folders;
};

// The folder of the running executable.
std::string executable_folder();

} // namespace qorhost
