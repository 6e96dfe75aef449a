// Sizes under constraints and alignment names.
#include "ui_geometry.h"

#include <gtest/gtest.h>

using namespace qorui;

// A negative size is 0, a maximum of 0 or less imposes nothing, and a minimum above the maximum
// gives way to it; new constraints apply at once.
TEST(Region, ConstraintsApplyMinimumThenMaximumThenZeroAndShrinkAtOnce) {
    CRegion region(300, 200);
    region.set_h(-5);
    EXPECT_EQ(0, region.get_h());
    region.set_constraints(SConstraints{0, 120, 250, 0});
    EXPECT_EQ(120, region.get_w());
    EXPECT_EQ(250, region.get_h());
    region.set_h(5000);
    EXPECT_EQ(5000, region.get_h());
    region.set_constraints(SConstraints{100, 50, 0, -3});
    region.set_w(75);
    EXPECT_EQ(50, region.get_w());
}

TEST(Alignment, NamesMatchExactly) {
    EAlignment alignment = ALIGNMENT_TOP;
    EXPECT_TRUE(find_alignment("ALIGNMENT_CLIENT", alignment));
    EXPECT_EQ(ALIGNMENT_CLIENT, alignment);
    for (char const *p_name : {"alignment_client", "ALIGNMENT_MIDDLE", static_cast<char const *>(nullptr)})
        EXPECT_FALSE(find_alignment(p_name, alignment));
    EXPECT_EQ(ALIGNMENT_CLIENT, alignment);
}
