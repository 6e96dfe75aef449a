// The engine's interface server: modules register interfaces on it and fetch each other's by a
// 128-bit identifier and a version.
#pragma once
#include <cstdint>

// Four 32-bit words, compared as a whole. Travels by value.
struct SInterfaceUID {
    uint32_t m_words[4]; // as the identifier tables write them

    // Equal when all four words are.
    // @{
    bool operator==(SInterfaceUID const &_o) const {
        return m_words[0] == _o.m_words[0] && m_words[1] == _o.m_words[1] &&
               m_words[2] == _o.m_words[2] && m_words[3] == _o.m_words[3];
    }
    bool operator!=(SInterfaceUID const &_o) const { return !(*this == _o); }
    // @}
};

// What every interface on the server is: an identifier and a version.
class IInterfaceBase {
public:
    // Interfaces are owned by the module that registers them.
    virtual ~IInterfaceBase() {}
    // The identifier under which the server files the interface (one of qor_uid).
    virtual SInterfaceUID get_uid() const = 0;
    // The version asked for by query_interface; 1 for all of the engine's interfaces.
    virtual int get_version() const = 0;
};

// What a server listener is told.
enum EInterfaceServerAction : int32_t {
    ISA_REGISTERED = 0, // an interface has been registered
    ISA_WITHDRAWN = 1,  // the interface is being withdrawn; drop every pointer to it
};

// Hears of interfaces registered on the server and withdrawn from it.
class IInterfaceServerListener {
public:
    // Called for each registration and withdrawal, with the interface concerned.
    virtual void _isv_action(EInterfaceServerAction _action, IInterfaceBase *_p_interface) = 0;

protected:
    virtual ~IInterfaceServerListener() {}
};

// The engine's registry of interfaces, and its loader of modules.
class IInterfaceServer {
public:
    // The live interface with that identifier and version, or null.
    virtual IInterfaceBase *query_interface(SInterfaceUID _uid, int _version) = 0;
    // Adds (or re-adds) the interface; result 1 when it was new, 0 when it was there already,
    // -1 for null.
    virtual int register_interface(IInterfaceBase *_p_interface) = 0;
    // Loads a further engine module by file name (dlopen, from the modules folder first).
    virtual void load_module(int _flag, char const *_library_name) = 0;
    // Adds or removes a listener; the caller keeps ownership.
    // @{
    virtual void add_listener(IInterfaceServerListener *_p_listener) = 0;
    virtual void remove_listener(IInterfaceServerListener *_p_listener) = 0;
    // @}
    // Removes the interface and tells every listener (action 1) before it goes.
    virtual void withdraw_interface(IInterfaceBase *_p_interface) = 0;

protected:
    virtual ~IInterfaceServer() {}
};

// The entry point every engine module with interfaces exports, with C linkage:
//   extern "C" int RegisterInterface(IInterfaceServer *);
typedef int (*register_interface_fn)(IInterfaceServer *_p_server);

// The identifiers of the engine's interfaces, each word as it lies in memory.
namespace qor_uid {
// One identifier for each interface the engine or the library registers.
// @{
constexpr SInterfaceUID LOAD_PROCESSOR = {{0x8A73F013, 0x191DC71F, 0xB13EF2B3, 0x5134D278}};
constexpr SInterfaceUID CMD_MANAGER = {{0xC58A117C, 0x42C66E10, 0x937BFB88, 0xD5C1DECE}};
constexpr SInterfaceUID SYSTEM_TIMER = {{0x8A73F039, 0x491DC72F, 0xB13EF4B3, 0x5134D278}};
constexpr SInterfaceUID VAR_MANAGER = {{0xF495F8C1, 0x461A99EB, 0xD9DB36B3, 0x68B81C0C}};
constexpr SInterfaceUID INPUT_SYSTEM = {{0x5C27881E, 0x4A7FA497, 0x5A540CBF, 0x92EF196E}};
constexpr SInterfaceUID COLLISION_SYSTEM_BASE = {{0x742E42C3, 0x42F2585A, 0x8C8959B5, 0x320C6C40}};
constexpr SInterfaceUID COLLISION_SYSTEM = {{0x5248CD1F, 0x49729C91, 0x214D2DAB, 0x6F805882}};
constexpr SInterfaceUID RENDER = {{0xE1000494, 0x4EE6AAE6, 0xDCA670A9, 0x19FF341A}};
constexpr SInterfaceUID SOUND_SYSTEM = {{0x1CCF0547, 0x4AD6C996, 0xEC5764B3, 0xE112F23E}};
constexpr SInterfaceUID USER_INTERFACE = {{0x92222A72, 0x43DF1E36, 0x5F73E6A7, 0x5BC7B3BF}};
constexpr SInterfaceUID LEVEL_DESCRIPTION = {{0x0A839914, 0x41FF9F72, 0x57F04EA5, 0x16E41D5F}};
constexpr SInterfaceUID RESOURCES_PRECACHE_MANAGER = {{0xAE3EE2F1, 0x12D1E1C9, 0xEA366884, 0xE0EFA96E}};
constexpr SInterfaceUID SERVER_GAME_API = {{0xAE3EE2F1, 0x42D2E5C9, 0xEA366884, 0xE0EFA96E}};
constexpr SInterfaceUID TIME_PROFILER = {{0xEB41FDF7, 0x4265C557, 0x783D73A7, 0x527D9782}};
constexpr SInterfaceUID LOG_MANAGER = {{0x14F4A6F2, 0x4ECE2F66, 0x5BDC3CBA, 0xF9F4BA0F}};
// @}
} // namespace qor_uid

// Interfaces the UI library fetches but never calls: declared so the cache can hold them.
class ILoadProcessor : public IInterfaceBase {};
class ISystemTimer : public IInterfaceBase {};
class ICollisionSystemBase : public IInterfaceBase {};
class ICollisionSystem : public IInterfaceBase {};
class IResourcesPrecacheManager : public IInterfaceBase {};
class IServerGameAPI : public IInterfaceBase {};
