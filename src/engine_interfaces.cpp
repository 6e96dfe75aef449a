// The cache of engine interfaces and the library's Lua state.
#include "engine_interfaces.h"

#include "qor_commands.h"
#include "qor_input.h"
#include "qor_level.h"
#include "qor_log.h"
#include "qor_render.h"
#include "qor_sound.h"
#include "qordebug.h"
#include "qorscriptsystem.h"
#include "ui_interfaces.h"

namespace qorui {

CEngineInterfaces::CEngineInterfaces()
    : mp_server(nullptr), mp_load_processor(nullptr), mp_input_system(nullptr), mp_system_timer(nullptr),
      mp_var_manager(nullptr), mp_cmd_manager(nullptr), mp_collision_system_base(nullptr),
      mp_collision_system(nullptr), mp_sound_system(nullptr), mp_render(nullptr), mp_user_interface(nullptr),
      mp_level_description(nullptr), mp_resources_precache_manager(nullptr), mp_server_game_api(nullptr),
      mp_time_profiler(nullptr), mp_log_manager(nullptr) {}

CEngineInterfaces::~CEngineInterfaces() {
    if (mp_server) mp_server->remove_listener(this);
}

// Another server drops everything fetched from the old one.
void CEngineInterfaces::set_server(IInterfaceServer *_p_server) {
    if (mp_server && mp_server != _p_server) {
        mp_server->remove_listener(this);
        for (IInterfaceBase **pp_cached : m_cached)
            *pp_cached = nullptr;
        m_cached.clear();
    }
    mp_server = _p_server;
    if (mp_server) mp_server->add_listener(this);
}

template <class T>
T *CEngineInterfaces::fetch(T *&_p_field, SInterfaceUID const &_uid, char const *_name, bool _critical) {
    if (_p_field) return _p_field;
    if (mp_server) _p_field = static_cast<T *>(mp_server->query_interface(_uid, 1));
    if (!_p_field && _critical)
        qordebug::error("Can't get interface \"%s\" version %i. Critical Error.", _name, 1);
    // Every interface derives from IInterfaceBase alone, so the field's address holds one.
    if (_p_field) m_cached.push_back(reinterpret_cast<IInterfaceBase **>(&_p_field));
    return _p_field;
}

void CEngineInterfaces::_isv_action(EInterfaceServerAction _action, IInterfaceBase *_p_interface) {
    if (_action != ISA_WITHDRAWN) return;
    for (size_t i = 0; i < m_cached.size();) {
        if (*m_cached[i] == _p_interface) {
            *m_cached[i] = nullptr;
            m_cached[i] = m_cached.back();
            m_cached.pop_back();
            // the entry moved here is looked at next
        } else {
            ++i;
        }
    }
}

ILoadProcessor *CEngineInterfaces::get_load_processor(bool _critical) {
    return fetch(mp_load_processor, qor_uid::LOAD_PROCESSOR, "ILoadProcessor", _critical);
}
IInputSystem *CEngineInterfaces::get_input_system(bool _critical) {
    return fetch(mp_input_system, qor_uid::INPUT_SYSTEM, "IInputSystem", _critical);
}
ISystemTimer *CEngineInterfaces::get_system_timer(bool _critical) {
    return fetch(mp_system_timer, qor_uid::SYSTEM_TIMER, "ISystemTimer", _critical);
}
IVarManagerBase *CEngineInterfaces::get_var_manager(bool _critical) {
    return fetch(mp_var_manager, qor_uid::VAR_MANAGER, "IVarManagerBase", _critical);
}
ICmdManagerBase *CEngineInterfaces::get_cmd_manager(bool _critical) {
    return fetch(mp_cmd_manager, qor_uid::CMD_MANAGER, "ICmdManagerBase", _critical);
}
ICollisionSystemBase *CEngineInterfaces::get_collision_system_base(bool _critical) {
    return fetch(mp_collision_system_base, qor_uid::COLLISION_SYSTEM_BASE, "ICollisionSystemBase", _critical);
}
ICollisionSystem *CEngineInterfaces::get_collision_system(bool _critical) {
    return fetch(mp_collision_system, qor_uid::COLLISION_SYSTEM, "ICollisionSystem", _critical);
}
ISoundSystem *CEngineInterfaces::get_sound_system(bool _critical) {
    return fetch(mp_sound_system, qor_uid::SOUND_SYSTEM, "ISoundSystem", _critical);
}
IRenderQOR *CEngineInterfaces::get_render(bool _critical) {
    return fetch(mp_render, qor_uid::RENDER, "IRenderQOR", _critical);
}
IUserInterface *CEngineInterfaces::get_user_interface(bool _critical) {
    return fetch(mp_user_interface, qor_uid::USER_INTERFACE, "IUserInterface", _critical);
}
ILevelDescription *CEngineInterfaces::get_level_description(bool _critical) {
    return fetch(mp_level_description, qor_uid::LEVEL_DESCRIPTION, "ILevelDescription", _critical);
}
IResourcesPrecacheManager *CEngineInterfaces::get_resources_precache_manager(bool _critical) {
    return fetch(mp_resources_precache_manager, qor_uid::RESOURCES_PRECACHE_MANAGER,
                 "IResourcesPrecacheManager", _critical);
}
IServerGameAPI *CEngineInterfaces::get_server_game_api(bool _critical) {
    return fetch(mp_server_game_api, qor_uid::SERVER_GAME_API, "IServerGameAPI", _critical);
}
ITimeProfiler *CEngineInterfaces::get_time_profiler(bool _critical) {
    return fetch(mp_time_profiler, qor_uid::TIME_PROFILER, "ITimeProfiler", _critical);
}
ILogManager *CEngineInterfaces::get_log_manager(bool _critical) {
    return fetch(mp_log_manager, qor_uid::LOG_MANAGER, "ILogManager", _critical);
}

CEngineInterfaces &engine_interfaces() {
    static CEngineInterfaces s_interfaces;
    return s_interfaces;
}

LuaPlus::LuaState &lua_machine() {
    static LuaPlus::LuaState *sp_state = LuaPlus::LuaState::Create(true, true);
    return *sp_state;
}

} // namespace qorui
