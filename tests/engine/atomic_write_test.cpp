// Files that must never be seen half-written: a writer killed at any moment leaves the old file or
// the new one whole, and files written together are replaced together or not at all.
#include "qorbase.h"

#include "test_common.h"

#include <gtest/gtest.h>

#include <chrono>
#include <csignal>
#include <filesystem>
#include <random>
#include <string>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace {

// Four megabytes of one letter, with the letter and the size in front, so that any mix shows.
std::string content(char _letter) {
    std::string text = std::string(1, _letter) + ":4194304:";
    text.resize(4194304, _letter);
    return text;
}

} // namespace

TEST(AtomicWrite, AWriterKilledAtAnyMomentLeavesTheOldOrTheNewFileWhole) {
    std::string const dir = qortest::make_temp_dir();
    std::string const path = dir + "/big.bin";
    std::string const a = content('a'), b = content('b');
    ASSERT_TRUE(qorbase::write_file_atomically(path, a.data(), a.size()));
    std::mt19937 random(7);
    int completed_kills = 0;
    for (int round = 0; round < 40; ++round) {
        pid_t const child = fork();
        ASSERT_GE(child, 0);
        if (child == 0) {
            for (int i = 0;; ++i) { // until killed
                std::string const &text = i % 2 ? a : b;
                qorbase::write_file_atomically(path, text.data(), text.size());
            }
        }
        std::this_thread::sleep_for(
            std::chrono::microseconds(std::uniform_int_distribution<>(0, 40000)(random)));
        kill(child, SIGKILL);
        int status = 0;
        waitpid(child, &status, 0);
        completed_kills += WIFSIGNALED(status);
        std::string const found = qortest::read_file(path);
        ASSERT_TRUE(found == a || found == b) << "round " << round << ": " << found.size() << " bytes";
    }
    EXPECT_EQ(40, completed_kills);
}

// The second file can't be written: the first keeps its old content, and no temporary stays.
TEST(AtomicWrite, FilesWrittenTogetherAreReplacedTogetherOrNotAtAll) {
    std::string const dir = qortest::make_temp_dir();
    qortest::write_file(dir + "/one.txt", "old one");
    qortest::write_file(dir + "/blocked", "a file where a folder should be");
    qorbase::SFileContent const files[] = {{dir + "/one.txt", "new one", 7},
                                           {dir + "/blocked/two.txt", "two", 3}};
    EXPECT_FALSE(qorbase::write_files_atomically(files, 2));
    EXPECT_EQ("old one", qortest::read_file(dir + "/one.txt"));
    EXPECT_EQ(2,
              std::distance(std::filesystem::directory_iterator(dir), std::filesystem::directory_iterator()));
    qorbase::SFileContent const good[] = {{dir + "/one.txt", "new one", 7}, {dir + "/two.txt", "two", 3}};
    EXPECT_TRUE(qorbase::write_files_atomically(good, 2));
    EXPECT_EQ("new one", qortest::read_file(dir + "/one.txt"));
    EXPECT_EQ("two", qortest::read_file(dir + "/two.txt"));
}
