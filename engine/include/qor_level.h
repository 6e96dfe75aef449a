// The engine's description of the running level.
#pragma once
#include "qor_interfaces.h"

// Four strings; the second is the level's name. Pointers owned by the engine, may be null.
struct SLevelDescription {
    char const *mp_file;
    char const *mp_name;
    char const *mp_title;
    char const *mp_comment;
};

class ILevelDescription : public IInterfaceBase {
public:
    virtual void get_description(SLevelDescription &_out) = 0;
};
