// The library's binding to the engine: the cache of engine interfaces fetched from the server,
// and the library's one Lua state.
#pragma once
#include "qor_memory.h"

#include "qor_interfaces.h"

class IInputSystem;
class ICmdManagerBase;
class IVarManagerBase;
class IRenderQOR;
class ISoundSystem;
class ILevelDescription;
class ILogManager;
namespace LuaPlus {
class LuaState;
}

namespace qorui {

class IUserInterface;
class ITimeProfiler;

// Fetches engine interfaces by identifier, version 1, and keeps each pointer until the engine
// withdraws that interface. Fetch through a getter at each use; never store the result.
class CEngineInterfaces : public IInterfaceServerListener {
public:
    // Empty: no server, nothing cached.
    CEngineInterfaces();
    // Stops listening to the server.
    virtual ~CEngineInterfaces();
    CEngineInterfaces(CEngineInterfaces const &) = delete;
    CEngineInterfaces &operator=(CEngineInterfaces const &) = delete;

    // Subscribes to the server's withdrawals; called by each CUserInterface::init.
    void set_server(IInterfaceServer *_p_server);
    // The server given by set_server; null before.
    IInterfaceServer *get_server() const { return mp_server; }

    // The engine's interface of that kind, fetched at the first call and kept until the engine
    // withdraws it; null when the server has none. With _critical true a missing interface is
    // reported as a critical error.
    // @{
    ILoadProcessor *get_load_processor(bool _critical);
    IInputSystem *get_input_system(bool _critical);
    ISystemTimer *get_system_timer(bool _critical);
    IVarManagerBase *get_var_manager(bool _critical);
    ICmdManagerBase *get_cmd_manager(bool _critical);
    ICollisionSystemBase *get_collision_system_base(bool _critical);
    ICollisionSystem *get_collision_system(bool _critical);
    ISoundSystem *get_sound_system(bool _critical);
    IRenderQOR *get_render(bool _critical);
    IUserInterface *get_user_interface(bool _critical);
    ILevelDescription *get_level_description(bool _critical);
    IResourcesPrecacheManager *get_resources_precache_manager(bool _critical);
    IServerGameAPI *get_server_game_api(bool _critical);
    ITimeProfiler *get_time_profiler(bool _critical);
    ILogManager *get_log_manager(bool _critical);
    // @}

    // How many pointers are cached now.
    unsigned get_cached_count() const { return static_cast<unsigned>(m_cached.size()); }

private:
    // Drops every cached pointer to an interface that is being withdrawn (action 1).
    void _isv_action(EInterfaceServerAction _action, IInterfaceBase *_p_interface) override;

    template <class T>
    T *fetch(T *&_p_field, SInterfaceUID const &_uid, char const *_name, bool _critical);

    IInterfaceServer *mp_server;
    ILoadProcessor *mp_load_processor;
    IInputSystem *mp_input_system;
    ISystemTimer *mp_system_timer;
    IVarManagerBase *mp_var_manager;
    ICmdManagerBase *mp_cmd_manager;
    ICollisionSystemBase *mp_collision_system_base;
    ICollisionSystem *mp_collision_system;
    ISoundSystem *mp_sound_system;
    IRenderQOR *mp_render;
    IUserInterface *mp_user_interface;
    ILevelDescription *mp_level_description;
    IResourcesPrecacheManager *mp_resources_precache_manager;
    IServerGameAPI *mp_server_game_api;
    ITimeProfiler *mp_time_profiler;
    ILogManager *mp_log_manager;
    qor_vector<IInterfaceBase **> m_cached; // addresses of the filled fields, in order of first use
};

// The process's one cache, built at first use.
CEngineInterfaces &engine_interfaces();

// The library's one Lua state, created at the first call and never destroyed.
LuaPlus::LuaState &lua_machine();

} // namespace qorui
