// HUID: the hash's check values, folding, comparison by hash, names too long, the static names.
#include "ui_huid.h"

#include "test_support.h"

#include <gtest/gtest.h>

#include <map>

using namespace qorui;

TEST(Huid, HashesMatchTheCheckValuesFoldingAsciiLettersOnly) {
    struct {
        std::string m_name;
        uint64_t m_hash;
    } const rows[] = {
        {"", 0x0123456789ABCDEFULL},
        {"window", 0x8A3DD37E84E20F89ULL},
        {"WindowVisual", 0x1DE224C9EA8E222DULL},
        {std::string(64, 'A'), 0xD3B7D1760D8AC029ULL}, // exactly one block
        {std::string(64, 'a'), 0xD3B7D1760D8AC029ULL},
        // 65 bytes: the second block holds "+" and zeros
        {"ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789_-+", 0x6E6CED92A8D030A9ULL},
    };
    for (auto const &row : rows)
        EXPECT_EQ(row.m_hash, HUID(row.m_name.c_str()).get_hash()) << row.m_name;
    // Pairs 0x20 apart that aren't letters A to Z stay apart; a letter beyond the first block folds.
    for (auto const &pair :
         {std::make_pair("@", "`"), std::make_pair("[", "{"), std::make_pair("\xC4", "\xE4")})
        EXPECT_NE(HUID(pair.first), HUID(pair.second)) << pair.first;
    EXPECT_EQ(HUID((std::string(64, 'x') + "Z").c_str()), HUID((std::string(64, 'x') + "z").c_str()));
    // Equal and ordered by the unsigned hash while the names differ.
    std::map<HUID, int> by_name = {{HUID("Window"), 1}, {HUID("WindowVisual"), 4}};
    by_name[HUID("WINDOW")] = 2; // the same key
    EXPECT_EQ(2, by_name[HUID("window")]);
    EXPECT_STREQ("Window", by_name.rbegin()->first.GetName()); // 0x8A3D... above 0x1DE2...
}

TEST(Huid, NamesAreKeptTo119CharactersAndHashedWhole) {
    qortest::CReportCapture capture;
    std::string const longest(119, 'n');
    EXPECT_EQ(longest, HUID(longest.c_str()).GetName());
    EXPECT_TRUE(capture.reports().empty());
    HUID const id((longest + "-and-more").c_str());
    EXPECT_EQ(longest, id.GetName());
    EXPECT_NE(HUID(longest.c_str()), id);
    EXPECT_EQ(HUID(""), HUID(nullptr));
    ASSERT_EQ(2u, capture.asserts().size()); // the long name and the null one
    EXPECT_NE(std::string::npos, capture.asserts()[0].find("strlen(_name) < sizeof(m_name)"));
}

// Hashed by the compiler; the run-time hash of the same text must agree, and no two collide.
TEST(Huid, EachStaticNameIsTheHuidOfItsOwnIdentifier) {
    std::map<HUID, std::string> seen;
#define QOR_CHECK_STATIC_HUID(_id)                                                                           \
    EXPECT_EQ(HUID(#_id).get_hash(), _id.get_hash()) << #_id;                                                \
    EXPECT_TRUE(seen.emplace(_id, #_id).second) << #_id << " collides with " << seen[_id];
    QOR_STATIC_HUIDS(QOR_CHECK_STATIC_HUID)
#undef QOR_CHECK_STATIC_HUID
    EXPECT_EQ(35u, seen.size());
}
