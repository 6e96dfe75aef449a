// The host's frame timer: a module that registers one on the interface server hears of the phases of
// every frame that the host runs ("renderer" for clearing the frame, "update", "draw", and
// "renderer" again for presenting it).
#pragma once
#include "qor_interfaces.h"

namespace qor_uid {
constexpr SInterfaceUID FRAME_TIMER = {{0x6F1D0A52, 0x4B7E93C1, 0xA2C45E07, 0x3D9B61F8}};
}

namespace qorhost {

class IFrameTimer : public IInterfaceBase {
public:
    SInterfaceUID get_uid() const override { return qor_uid::FRAME_TIMER; }
    int get_version() const override { return 1; }

    // Whether the next frame's phases are timed; asked once at the start of each frame. On the
    // manual clock a timed frame hands its 16 ms out to its phases, so the times repeat exactly.
    virtual bool is_timing() = 0;
    // Before and after each phase of a timed frame.
    virtual void enter(char const *_phase) = 0;
    virtual void exit() = 0;
};

} // namespace qorhost
