// Data streams: order and types, reads in place, move on copy, release and the pool, the two
// contracts, and the window stream with its own types.
#include "data_stream_base.h"

#include "qorMemoryManager.h"
#include "test_support.h"
#include "ui_geometry.h"
#include "ui_huid.h"

#include <gtest/gtest.h>

#include <string>

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

typedef Loki::TL::MakeTypelist<int, float, string, SCounted, double>::Result TTestTypes;
typedef TDataStreamBase<TTestTypes> CTestStream;

SFixedPool &node_pool() {
    return *CTestStream::CNode::m_pool.mp_pool;
}

CTestStream make_stream() {
    CTestStream stream;
    stream << 7 << 2.5f << string("abc") << -1;
    return stream;
}

bool starts_with(std::string const &_text, std::string const &_prefix) {
    return _text.compare(0, _prefix.size(), _prefix) == 0;
}

} // namespace

TEST(DataStream, EmptyUntilTheFirstAppend) {
    CTestStream stream;
    EXPECT_TRUE(stream.is_empty());
    EXPECT_TRUE(stream.end_of_stream());
    stream << 1;
    EXPECT_FALSE(stream.is_empty());
    EXPECT_FALSE(stream.end_of_stream());
}

TEST(DataStream, ReadsInWriteOrderWithTheWrittenTypes) {
    qortest::CReportCapture capture;
    CTestStream stream = make_stream();
    int first = 0;
    float second = 0.0f;
    string third;
    stream >> first >> second >> third;
    EXPECT_EQ(7, first);
    EXPECT_EQ(2.5f, second);
    EXPECT_EQ(string("abc"), third);
    EXPECT_EQ(-1, stream.get<int>());
    EXPECT_TRUE(stream.end_of_stream());
    EXPECT_FALSE(stream.is_empty());

    stream.rewind();
    EXPECT_EQ(7, stream.get<int>());
    EXPECT_TRUE(capture.reports().empty());
}

TEST(DataStream, AppendLeavesTheReadPositionWhereItIs) {
    CTestStream stream;
    stream << 1 << 2;
    EXPECT_EQ(1, stream.get<int>());
    stream << 3; // mid-stream: the next read is still 2
    EXPECT_EQ(2, stream.get<int>());
    EXPECT_EQ(3, stream.get<int>());
    EXPECT_TRUE(stream.end_of_stream());

    stream << 4; // at the end: stays at the end until rewind
    EXPECT_TRUE(stream.end_of_stream());
    stream.rewind();
    int values[4] = {};
    for (int &value : values)
        stream >> value;
    EXPECT_EQ(1, values[0]);
    EXPECT_EQ(4, values[3]);
}

TEST(DataStream, GetGivesTheValueInPlaceForTheWriterToReadBack) {
    CTestStream stream;
    stream << 640 << string("size");
    stream.get<int>() = 800; // as a resize handler corrects the size the sender reads back
    stream.get<string>() += "d";
    stream.rewind();
    EXPECT_EQ(800, stream.get<int>());
    EXPECT_EQ(string("sized"), stream.get<string>());
}

TEST(DataStreamCopy, MovesTheChainAndReadPositionAndEmptiesTheSource) {
    CTestStream source = make_stream();
    EXPECT_EQ(7, source.get<int>());
    CTestStream copy(source);
    EXPECT_TRUE(source.is_empty());
    EXPECT_TRUE(source.end_of_stream());
    EXPECT_EQ(2.5f, copy.get<float>()); // the read position came along
    copy.rewind();
    EXPECT_EQ(7, copy.get<int>());
}

TEST(DataStreamCopy, EmptiesAConstSource) {
    CTestStream const source = make_stream();
    CTestStream copy = source;
    EXPECT_TRUE(source.is_empty());
    EXPECT_EQ(7, copy.get<int>());
}

TEST(DataStreamCopy, AssignmentReleasesWhatTheTargetHeld) {
    int const alive = SCounted::s_alive;
    CTestStream target;
    target << SCounted(1) << SCounted(2);
    EXPECT_EQ(alive + 2, SCounted::s_alive);
    CTestStream source;
    source << SCounted(3);
    target = source;
    EXPECT_EQ(alive + 1, SCounted::s_alive);
    EXPECT_TRUE(source.is_empty());
    EXPECT_EQ(3, target.get<SCounted>().m_tag);

    target = target; // assigning a stream to itself keeps it
    target.rewind();
    EXPECT_EQ(3, target.get<SCounted>().m_tag);
}

TEST(DataStreamRelease, DestroysEveryValueOnceAndGivesEveryNodeBack) {
    int const alive = SCounted::s_alive;
    uint32_t const used = node_pool().m_used;
    {
        CTestStream stream;
        stream << SCounted(1) << 5 << SCounted(2) << string("a string longer than any small buffer");
        EXPECT_EQ(alive + 2, SCounted::s_alive);
        EXPECT_EQ(used + 4, node_pool().m_used);
        stream.release();
        EXPECT_TRUE(stream.is_empty());
        EXPECT_TRUE(stream.end_of_stream());
        EXPECT_EQ(alive, SCounted::s_alive);
        EXPECT_EQ(used, node_pool().m_used);

        stream << SCounted(3); // usable again; the destructor releases it
        EXPECT_EQ(alive + 1, SCounted::s_alive);
    }
    EXPECT_EQ(alive, SCounted::s_alive);
    EXPECT_EQ(used, node_pool().m_used);
}

TEST(DataStreamRelease, TheOldHeadIsThePoolsNextNode) {
    CTestStream stream;
    stream << 1 << 2 << 3;
    int *const p_head_value = &stream.get<int>();
    stream.release();
    stream << 9;
    EXPECT_EQ(p_head_value, &stream.get<int>());
}

// Kept for the sanitizer run too: a long chain is released without deep recursion.
TEST(DataStreamRelease, ReleasesALongStream) {
    uint32_t const used = node_pool().m_used;
    CTestStream stream;
    for (int i = 0; i < 200000; ++i)
        stream << i;
    EXPECT_EQ(used + 200000, node_pool().m_used);
    stream.release();
    EXPECT_EQ(used, node_pool().m_used);
}

TEST(DataStreamPool, NodesComeFromBlocksOf1024) {
    CTestStream stream;
    stream << 1;
    EXPECT_EQ(1024u, node_pool().m_block_elements);
    EXPECT_GE(node_pool().m_element_size, sizeof(CTestStream::CNode));
}

TEST(DataStreamContract, ReadingAnEmptyStreamIsReportedAndHarmless) {
    qortest::CReportCapture capture;
    CTestStream stream;
    int value = 5;
    stream >> value;
    EXPECT_EQ(5, value); // left as it was
    int &neutral = stream.get<int>();
    EXPECT_EQ(0, neutral);
    neutral = 42; // a caller writing through it harms nothing
    EXPECT_EQ(0, stream.get<int>());
    std::vector<std::string> const texts = capture.texts(qordebug::REPORT_ASSERT);
    ASSERT_EQ(3u, texts.size());
    EXPECT_TRUE(
        starts_with(texts[0], "Expression:   mp_curr != NULL\nDataStream Error: Empty data stream\nFile: "))
        << texts[0];
    EXPECT_NE(std::string::npos, texts[0].find("\nFunction take_current")) << texts[0];
}

TEST(DataStreamContract, ReadingPastTheEndIsReported) {
    qortest::CReportCapture capture;
    CTestStream stream;
    stream << 1;
    EXPECT_EQ(1, stream.get<int>());
    EXPECT_EQ(string(), stream.get<string>());
    ASSERT_EQ(1u, capture.texts(qordebug::REPORT_ASSERT).size());
    EXPECT_NE(std::string::npos, capture.texts(qordebug::REPORT_ASSERT)[0].find("Empty data stream"));
}

TEST(DataStreamContract, TypeMismatchIsReportedAndTheReadMovesOn) {
    qortest::CReportCapture capture;
    CTestStream stream;
    stream << 1.5f << 3 << string("kept");
    EXPECT_EQ(0, stream.get<int>()); // a float can't be read as an int
    int value = -7;
    stream >> value;
    EXPECT_EQ(3, value); // the mismatch consumed the float
    string text("before");
    double number = 9.0;
    stream >> number; // a string read as a double: number stays
    EXPECT_EQ(9.0, number);
    EXPECT_TRUE(stream.end_of_stream());
    stream.rewind();
    stream >> text;
    EXPECT_EQ(string("before"), text); // the float isn't a string either

    std::vector<std::string> const texts = capture.texts(qordebug::REPORT_ASSERT);
    ASSERT_EQ(3u, texts.size());
    EXPECT_TRUE(starts_with(texts[0], "Expression:   m_type == Type<T>::value\nDataStream Error: Types "
                                      "mismatch\nFile: "))
        << texts[0];
}

TEST(DataStreamWindow, TypesStandAtTheirPositions) {
    typedef CWindowDataStream::CNode CNode;
    EXPECT_EQ(0, CNode::Type<int>::value);
    EXPECT_EQ(1, CNode::Type<float>::value);
    EXPECT_EQ(2, CNode::Type<void *>::value);
    EXPECT_EQ(3, CNode::Type<vec2_t>::value);
    EXPECT_EQ(4, CNode::Type<CMaterial *>::value);
    EXPECT_EQ(5, CNode::Type<CFont *>::value);
    EXPECT_EQ(6, CNode::Type<point_t>::value);
    EXPECT_EQ(7, CNode::Type<string>::value);
    EXPECT_EQ(8, CNode::Type<wstring>::value);
    EXPECT_EQ(9, CNode::Type<HUID const *>::value);
    EXPECT_EQ(-1, CNode::Type<HUID *>::value);
}

TEST(DataStreamWindow, CarriesEventArguments) {
    qortest::CReportCapture capture;
    unsigned short const wide[] = {0x41F, 0x440, 0};
    CWindowDataStream stream;
    stream << point_t{12, -4} << vec2_t{0.5f, 2.0f} << string("OK") << wstring(wide) << &MAT_NAME_NORMAL
           << static_cast<CFont *>(nullptr);
    point_t const position = stream.get<point_t>();
    EXPECT_EQ(12, position.x);
    EXPECT_EQ(-4, position.y);
    EXPECT_EQ(2.0f, stream.get<vec2_t>().y);
    EXPECT_EQ(string("OK"), stream.get<string>());
    EXPECT_EQ(wstring(wide), stream.get<wstring>());
    EXPECT_EQ(&MAT_NAME_NORMAL, stream.get<HUID const *>());
    EXPECT_EQ(nullptr, stream.get<CFont *>());
    EXPECT_TRUE(stream.end_of_stream());
    EXPECT_TRUE(capture.reports().empty());
}

TEST(DataStreamCommon, TypesStandAtTheirPositions) {
    // Only positions: vec3_t and matr4_t aren't defined yet, so the stream itself can't be built.
    EXPECT_EQ(0, (Loki::TL::IndexOf<TCommonStreamTypes, int>::value));
    EXPECT_EQ(1, (Loki::TL::IndexOf<TCommonStreamTypes, long long>::value));
    EXPECT_EQ(3, (Loki::TL::IndexOf<TCommonStreamTypes, double>::value));
    EXPECT_EQ(5, (Loki::TL::IndexOf<TCommonStreamTypes, vec3_t>::value));
    EXPECT_EQ(6, (Loki::TL::IndexOf<TCommonStreamTypes, matr4_t>::value));
    EXPECT_EQ(7, (Loki::TL::IndexOf<TCommonStreamTypes, string>::value));
    EXPECT_EQ(8, (Loki::TL::IndexOf<TCommonStreamTypes, std::basic_string<unsigned short>>::value));
    EXPECT_EQ(-1, (Loki::TL::IndexOf<TCommonStreamTypes, wstring>::value)); // not the pooled one
    EXPECT_EQ(9, (Loki::TL::IndexOf<TCommonStreamTypes, LuaPlus::LuaObject>::value));
}
