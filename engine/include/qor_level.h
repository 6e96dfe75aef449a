// The engine's description of the running level.
#pragma once
#include "qor_interfaces.h"

// Four strings; the second is the level's name. Pointers owned by the engine, may be null.
struct SLevelDescription {
    char const *mp_file;    // the level file
    char const *mp_name;    // the level's name, used in stats dump file names
    char const *mp_title;   // the title shown to the player
    char const *mp_comment; // the author's note
};

// The running level, as the engine describes it. Optional: without it the level name is empty.
class ILevelDescription : public IInterfaceBase {
public:
    // Fills _out with the four strings of the current level.
    virtual void get_description(SLevelDescription &_out) = 0;
};
