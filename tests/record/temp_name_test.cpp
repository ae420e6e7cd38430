#include "record/temp_name.h"

#include <gtest/gtest.h>

#include "support/temp_dir.h"

namespace ondrel::test {
namespace {

TEST(NewTempName, TakesTheNextFreeNumberAndGivesUpAfterTwentySix) {
    TempDir dir;
    dir.write("NewSound:2", {1, 2, 3});
    int counter = 0;
    std::string path;
    ASSERT_EQ(NewTempName(dir.path(), counter, path), 0);
    EXPECT_EQ(path, dir.file("NewSound:1"));
    EXPECT_TRUE(read_all(path).empty()) << "created, empty, and kept";
    ASSERT_EQ(NewTempName(dir.path(), counter, path), 0);
    EXPECT_EQ(path, dir.file("NewSound:3")) << "2 was taken";
    EXPECT_EQ(read_all(dir.file("NewSound:2")).size(), 3u) << "a taken name is left alone";
    for (int i = 4; i <= 29; ++i) dir.write("NewSound:" + std::to_string(i), {});
    EXPECT_EQ(NewTempName(dir.path(), counter, path), -1);
    EXPECT_EQ(counter, 29);
    EXPECT_EQ(NewTempName(dir.path(), counter, path), 0);
    EXPECT_EQ(path, dir.file("NewSound:30"));
    EXPECT_EQ(NewTempName(dir.path() / "missing", counter, path), ENOENT) << "the directory's error";
}

}  // namespace
}  // namespace ondrel::test
