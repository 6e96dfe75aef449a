// The host's interface server: registration, queries by identifier and version, listeners told of
// registrations and withdrawals, and modules loaded by file name.
#include "interface_server.h"

#include "qor_platform.h"
#include "qordebug.h"

#include <algorithm>
#include <unistd.h>

namespace qorhost {

CInterfaceServer::CInterfaceServer() {}

CInterfaceServer::~CInterfaceServer() {
    close_modules();
}

void CInterfaceServer::close_modules() {
    while (!m_modules.empty()) {
        qorplatform::free_library(m_modules.back());
        m_modules.pop_back();
    }
}

IInterfaceBase *CInterfaceServer::query_interface(SInterfaceUID _uid, int _version) {
    for (IInterfaceBase *p_interface : m_interfaces)
        if (p_interface->get_uid() == _uid && p_interface->get_version() == _version) return p_interface;
    return nullptr;
}

int CInterfaceServer::register_interface(IInterfaceBase *_p_interface) {
    if (!_p_interface) return -1;
    if (std::find(m_interfaces.begin(), m_interfaces.end(), _p_interface) != m_interfaces.end()) return 0;
    m_interfaces.push_back(_p_interface);
    notify(ISA_REGISTERED, _p_interface);
    return 1;
}

void CInterfaceServer::load_module(int, char const *_library_name) {
    open_module(_library_name);
}

void *CInterfaceServer::open_module(char const *_library_name) {
    if (!_library_name || !*_library_name) return nullptr;
    void *module = nullptr;
    std::string const name = _library_name;
    if (name.find('/') == std::string::npos)
        for (size_t i = 0; !module && i < m_modules_folders.size(); ++i)
            module = qorplatform::load_library((m_modules_folders[i] + "/" + name).c_str());
    if (!module) module = qorplatform::load_library(_library_name);
    if (!module) {
        qordebug::warning("Cannot load module '%s': %s", _library_name, qorplatform::last_module_error());
        return nullptr;
    }
    m_modules.push_back(module);
    if (void *entry = qorplatform::get_proc_address(module, "RegisterInterface"))
        reinterpret_cast<register_interface_fn>(entry)(this);
    return module;
}

// Walks a copy: a listener may remove itself, or others, while it is told; one that left the
// live list on the way hears nothing more.
void CInterfaceServer::notify(EInterfaceServerAction _action, IInterfaceBase *_p_interface) {
    std::vector<IInterfaceServerListener *> const listeners = m_listeners;
    for (IInterfaceServerListener *p_listener : listeners)
        if (std::find(m_listeners.begin(), m_listeners.end(), p_listener) != m_listeners.end())
            p_listener->_isv_action(_action, _p_interface);
}

void CInterfaceServer::add_listener(IInterfaceServerListener *_p_listener) {
    if (_p_listener && std::find(m_listeners.begin(), m_listeners.end(), _p_listener) == m_listeners.end())
        m_listeners.push_back(_p_listener);
}

void CInterfaceServer::remove_listener(IInterfaceServerListener *_p_listener) {
    m_listeners.erase(std::remove(m_listeners.begin(), m_listeners.end(), _p_listener), m_listeners.end());
}

// Listeners hear of the withdrawal while the interface is still there.
void CInterfaceServer::withdraw_interface(IInterfaceBase *_p_interface) {
    auto found = std::find(m_interfaces.begin(), m_interfaces.end(), _p_interface);
    if (found == m_interfaces.end()) return;
    notify(ISA_WITHDRAWN, _p_interface);
    m_interfaces.erase(std::find(m_interfaces.begin(), m_interfaces.end(), _p_interface));
}

void CInterfaceServer::withdraw_all() {
    while (!m_interfaces.empty())
        withdraw_interface(m_interfaces.back());
}

std::string executable_folder() {
    char path[4096];
    ssize_t const length = readlink("/proc/self/exe", path, sizeof(path) - 1);
    if (length <= 0) return ".";
    std::string const exe(path, static_cast<size_t>(length));
    return exe.substr(0, exe.rfind('/'));
}

} // namespace qorhost
