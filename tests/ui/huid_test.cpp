// HUID: the hash's check values, folding, comparison by hash, names too long, the static names.
#include "ui_huid.h"

#include "test_support.h"

#include <gtest/gtest.h>

#include <cstring>
#include <map>
#include <string>

using namespace qorui;

namespace {

struct SCheckValue {
    std::string m_name;
    uint64_t m_hash;
};

std::string const k_two_blocks = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789_-+";

} // namespace

TEST(HuidHash, MatchesTheCheckValues) {
    SCheckValue const rows[] = {
        {"", 0x0123456789ABCDEFULL},
        {"Window", 0x8A3DD37E84E20F89ULL},
        {"window", 0x8A3DD37E84E20F89ULL},
        {"WindowVisual", 0x1DE224C9EA8E222DULL},
        {"Button", 0xD399AC11C440D4DFULL},
        {"Desktop", 0xF65C8D8795B66618ULL},
        {"MAT_NAME_NORMAL", 0x06BA127EF640D8DFULL},
        {"FNT_NAME_DEFAULT", 0xC33E132FEBD24BEBULL},
        {std::string(64, 'A'), 0xD3B7D1760D8AC029ULL}, // exactly one block
        {std::string(64, 'a'), 0xD3B7D1760D8AC029ULL},
        {k_two_blocks, 0x6E6CED92A8D030A9ULL}, // 65 bytes: the second block holds "+" and zeros
    };
    for (size_t i = 0; i < sizeof(rows) / sizeof(rows[0]); ++i)
        EXPECT_EQ(rows[i].m_hash, HUID(rows[i].m_name.c_str()).get_hash())
            << "row " << i << ": " << rows[i].m_name;
}

TEST(HuidHash, FoldsOnlyAsciiLetters) {
    EXPECT_EQ(HUID("abcdefghijklmnopqrstuvwxyz"), HUID("ABCDEFGHIJKLMNOPQRSTUVWXYZ"));
    // Pairs 0x20 apart that aren't letters A to Z stay apart.
    EXPECT_NE(HUID("@"), HUID("`"));
    EXPECT_NE(HUID("["), HUID("{"));
    EXPECT_NE(HUID("\xC4"), HUID("\xE4")); // Latin-1 A and a with diaeresis
    // A letter beyond the first block folds too.
    EXPECT_EQ(HUID((std::string(64, 'x') + "Q").c_str()), HUID((std::string(64, 'x') + "q").c_str()));
}

TEST(HuidCompare, EqualByHashWhileNamesDiffer) {
    HUID const lower("Window");
    HUID const upper("WINDOW");
    EXPECT_TRUE(lower == upper);
    EXPECT_FALSE(lower != upper);
    EXPECT_STRNE(lower.GetName(), upper.GetName());
    EXPECT_STREQ("WINDOW", upper.GetName());
    EXPECT_FALSE(lower < upper);
    EXPECT_FALSE(upper < lower);
}

TEST(HuidCompare, OrdersByUnsignedHash) {
    HUID const high_bit("Window");          // 0x8A3D...
    HUID const no_high_bit("WindowVisual"); // 0x1DE2...
    EXPECT_TRUE(no_high_bit < high_bit);
    EXPECT_FALSE(high_bit < no_high_bit);

    std::map<HUID, int> by_name;
    by_name[HUID("Window")] = 1;
    by_name[HUID("WINDOW")] = 2; // the same key
    by_name[HUID("Desktop")] = 3;
    by_name[HUID("WindowVisual")] = 4;
    ASSERT_EQ(3u, by_name.size());
    EXPECT_EQ(2, by_name[HUID("window")]);
    EXPECT_STREQ("WindowVisual", by_name.begin()->first.GetName()); // 0x1DE2... is the smallest
    EXPECT_STREQ("Desktop", by_name.rbegin()->first.GetName());     // 0xF65C... the largest
}

TEST(HuidCopy, CopiesNameAndHash) {
    HUID const original("EditBox");
    HUID copy(original);
    EXPECT_STREQ("EditBox", copy.GetName());
    EXPECT_EQ(original.get_hash(), copy.get_hash());

    copy = HUID("ListBox");
    EXPECT_STREQ("ListBox", copy.GetName());
    EXPECT_EQ(HUID("listbox").get_hash(), copy.get_hash());
}

TEST(HuidName, Keeps119CharactersWithoutReport) {
    qortest::CReportCapture capture;
    std::string const longest(119, 'n');
    HUID const id(longest.c_str());
    EXPECT_EQ(longest, id.GetName());
    EXPECT_TRUE(capture.reports().empty());
}

TEST(HuidName, TooLongIsReportedCutAndHashedWhole) {
    qortest::CReportCapture capture;
    std::string const name = std::string(119, 'n') + "-and-more";
    HUID const id(name.c_str());
    ASSERT_EQ(1u, capture.texts(qordebug::REPORT_ASSERT).size());
    EXPECT_NE(std::string::npos,
              capture.texts(qordebug::REPORT_ASSERT)[0].find("strlen(_name) < sizeof(m_name)"));
    EXPECT_EQ(std::string(119, 'n'), id.GetName());
    // Two long names that share their first 119 bytes stay apart.
    EXPECT_NE(HUID(std::string(119, 'n').c_str()), id);
    EXPECT_EQ(HUID((std::string(119, 'N') + "-AND-MORE").c_str()), id);
}

TEST(HuidName, NullIsReportedAndEmpty) {
    qortest::CReportCapture capture;
    HUID const id(nullptr);
    EXPECT_EQ(1u, capture.texts(qordebug::REPORT_ASSERT).size());
    EXPECT_STREQ("", id.GetName());
    EXPECT_EQ(0x0123456789ABCDEFULL, id.get_hash());
}

TEST(HuidStatic, EachIsTheHuidOfItsOwnIdentifier) {
    // Hashed by the compiler; the run-time hash of the same text must agree.
    int materials = 0, fonts = 0;
    std::map<HUID, std::string> seen;
#define QOR_CHECK_STATIC_HUID(_id)                                                                           \
    EXPECT_STREQ(#_id, _id.GetName());                                                                       \
    EXPECT_EQ(HUID(#_id).get_hash(), _id.get_hash()) << #_id;                                                \
    (strncmp(#_id, "MAT_NAME_", 9) == 0 ? materials : fonts) += 1;                                           \
    EXPECT_TRUE(seen.emplace(_id, #_id).second) << #_id << " collides with " << seen[_id];
    QOR_STATIC_HUIDS(QOR_CHECK_STATIC_HUID)
#undef QOR_CHECK_STATIC_HUID
    EXPECT_EQ(28, materials);
    EXPECT_EQ(7, fonts);
    EXPECT_EQ(0x06BA127EF640D8DFULL, MAT_NAME_NORMAL.get_hash());
    EXPECT_EQ(0xC33E132FEBD24BEBULL, FNT_NAME_DEFAULT.get_hash());
}
