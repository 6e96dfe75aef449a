// Sizes under constraints, the point test, and alignment names.
#include "ui_geometry.h"

#include <gtest/gtest.h>

using namespace qorui;

TEST(Region, ConstraintsApplyMinimumThenMaximumThenZeroAndShrinkAtOnce) {
    CRegion region(300, 200);
    region.set_h(-5);
    EXPECT_EQ(0, region.get_h());
    region.set_constraints(SConstraints{0, 120, 250, 0}); // a maximum of 0 or less imposes nothing
    EXPECT_EQ(120, region.get_w());
    EXPECT_EQ(250, region.get_h());
    region.set_h(5000);
    EXPECT_EQ(5000, region.get_h());
    region.set_constraints(SConstraints{100, 50, 0, -3}); // minimum above maximum: maximum wins
    for (int w : {0, 75, 200}) {
        region.set_w(w);
        EXPECT_EQ(50, region.get_w()) << w;
    }
}

TEST(Region, RightAndBottomEdgesLieOutside) {
    CRegion const region(10, 4);
    EXPECT_TRUE(region.is_point_inside(point_t{0, 0}));
    EXPECT_TRUE(region.is_point_inside(point_t{9, 3}));
    for (point_t const outside : {point_t{10, 0}, point_t{0, 4}, point_t{-1, 0}})
        EXPECT_FALSE(region.is_point_inside(outside)) << outside.x << ", " << outside.y;
    EXPECT_FALSE(CRegion(0, 5).is_point_inside(point_t{0, 0}));
}

TEST(Alignment, NamesMatchExactly) {
    EAlignment alignment = ALIGNMENT_TOP;
    EXPECT_TRUE(find_alignment("ALIGNMENT_CLIENT", alignment));
    EXPECT_EQ(ALIGNMENT_CLIENT, alignment);
    for (char const *p_name :
         {"alignment_client", "ALIGNMENT_MIDDLE", "", static_cast<char const *>(nullptr)})
        EXPECT_FALSE(find_alignment(p_name, alignment));
    EXPECT_EQ(ALIGNMENT_CLIENT, alignment);
}
