// Data streams: order and types, reads in place, move on copy, release and the pool, the two
// contracts, and the window stream with the types of event arguments.
#include "data_stream_base.h"

#include "qorMemoryManager.h"
#include "test_support.h"
#include "ui_geometry.h"
#include "ui_huid.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

// Counts its live copies, so that a test sees every value destroyed exactly once.
struct SCounted {
    static int s_alive;
    int m_tag;
    SCounted(int _tag = 0) : m_tag(_tag) { ++s_alive; }
    SCounted(SCounted const &_o) : m_tag(_o.m_tag) { ++s_alive; }
    SCounted &operator=(SCounted const &_o) = default;
    ~SCounted() { --s_alive; }
};
int SCounted::s_alive = 0;

typedef TDataStreamBase<Loki::TL::MakeTypelist<int, float, string, SCounted, double>::Result> CTestStream;

} // namespace

// Appends leave the read position alone, even at the end; copies move the chain and the position.
TEST(DataStream, ReadsInWriteOrderInPlaceAndCopiesMoveTheChain) {
    qortest::CReportCapture capture;
    CTestStream stream;
    stream << 7 << 2.5f << string("abc");
    int first = 0;
    stream >> first;
    EXPECT_EQ(7, first);
    EXPECT_EQ(2.5f, stream.get<float>());
    stream << -1;
    stream.get<string>() += "d"; // in place, as a resize handler corrects the size its sender reads
    EXPECT_EQ(-1, stream.get<int>());
    stream << 4;
    EXPECT_TRUE(stream.end_of_stream());
    CTestStream const copy(stream);
    EXPECT_TRUE(stream.is_empty() && stream.end_of_stream());
    copy.rewind();
    copy.get<int>();
    copy.get<float>();
    EXPECT_EQ(string("abcd"), copy.get<string>());
    CTestStream const moved_again = copy; // a const source is emptied too
    EXPECT_TRUE(copy.is_empty());
    int const alive = SCounted::s_alive;
    CTestStream target, other;
    target << SCounted(1) << SCounted(2);
    other << SCounted(3);
    target = other; // what the target held is released
    EXPECT_EQ(alive + 1, SCounted::s_alive);
    target = target; // kept
    EXPECT_EQ(3, target.get<SCounted>().m_tag);
    EXPECT_TRUE(capture.reports().empty());
}

// Kept for the sanitizer run too: a long chain is released without deep recursion.
TEST(DataStream, ReleaseDestroysEveryValueOnceAndGivesTheNodesBack) {
    SFixedPool &pool = *CTestStream::CNode::m_pool.mp_pool;
    int const alive = SCounted::s_alive;
    uint32_t const used = pool.m_used;
    {
        CTestStream stream;
        stream << SCounted(1) << 5 << SCounted(2) << string("a string longer than any small buffer");
        EXPECT_EQ(used + 4, pool.m_used);
        SCounted *const p_head = &stream.get<SCounted>();
        stream.release();
        EXPECT_TRUE(stream.is_empty() && stream.end_of_stream());
        EXPECT_EQ(alive, SCounted::s_alive);
        EXPECT_EQ(used, pool.m_used);
        stream << SCounted(4); // the old head is the pool's next node
        EXPECT_EQ(p_head, &stream.get<SCounted>());
        for (int i = 0; i < 200000; ++i)
            stream << i;
    } // the destructor releases the rest
    EXPECT_EQ(alive, SCounted::s_alive);
    EXPECT_EQ(used, pool.m_used);
}

TEST(DataStream, ReadsOfNothingOrOfAnotherTypeAreReportedAndHarmless) {
    qortest::CReportCapture capture;
    CTestStream stream;
    int value = 5;
    stream >> value;
    EXPECT_EQ(5, value);    // left as it was
    stream.get<int>() = 42; // a caller writing through the neutral value harms nothing
    EXPECT_EQ(0, stream.get<int>());
    stream << 1.5f << 3;
    EXPECT_EQ(0, stream.get<int>()); // a float isn't an int, and the read moves on
    stream >> value;
    EXPECT_EQ(3, value);
    std::vector<std::string> const texts = capture.asserts();
    ASSERT_EQ(4u, texts.size());
    EXPECT_EQ(0u,
              texts[0].find("Expression:   mp_curr != NULL\nDataStream Error: Empty data stream\nFile: "));
    EXPECT_EQ(0u, texts[3].find(
                      "Expression:   m_type == Type<T>::value\nDataStream Error: Types mismatch\nFile: "));
}

TEST(DataStream, TheWindowStreamCarriesEventArguments) {
    unsigned short const wide[] = {0x41F, 0x440, 0};
    CWindowDataStream stream;
    stream << point_t{12, -4} << vec2_t{0.5f, 2.0f} << wstring(wide) << &MAT_NAME_NORMAL;
    EXPECT_EQ(-4, stream.get<point_t>().y);
    EXPECT_EQ(2.0f, stream.get<vec2_t>().y);
    EXPECT_EQ(wstring(wide), stream.get<wstring>());
    EXPECT_EQ(&MAT_NAME_NORMAL, stream.get<HUID const *>());
}
