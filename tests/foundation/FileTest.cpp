#include <gtest/gtest.h>
#include <unistd.h>

#include <atomic>
#include <string>
#include <thread>
#include <vector>

#include "TempFolder.h"
#include "ZVFile.h"

namespace {

TEST(FileTest, ReadsAndWritesWholeBuffers)
{
    const TempFolder folder;
    const std::string name = folder / "f";
    const std::string content(100000, '\0');
    ZVFile file;
    EXPECT_FALSE(file.Open("/none/file", "r"));
    EXPECT_EQ(-1, file.Position());
    ASSERT_TRUE(file.Open(name.c_str(), "w+b"));
    EXPECT_EQ(100000, file.Write(content.data(), content.size()));
    EXPECT_TRUE(file.Seek(-10, SEEK_END));
    EXPECT_EQ(100000, file.GetSize());
    EXPECT_EQ(99990, file.Position()) << "asking the size leaves the position";
    std::string read(100, 'x');
    EXPECT_EQ(10, file.Read(&read[0], 100)) << "the file ends";
    ASSERT_TRUE(file.Open(name.c_str(), "r"));
    EXPECT_EQ(0, file.Write("x", 1)) << "opened for reading";
    ASSERT_TRUE(file.Open("/dev/full", "w"));
    file.Write("x", 1);
    EXPECT_FALSE(file.Flush());
}

TEST(FileTest, SplitsPaths)
{
    const char* const rows[][3] = {
        {"/a/b.txt", "/a/", "b.txt"}, {"b.txt", "b.txt/", "b.txt"}, {"", "./", ""}, {"/a/", "/a/", ""}, {"/", "/", ""},
        {"a//b", "a//", "b"},
    };
    for (const auto& row : rows) {
        EXPECT_STREQ(row[1], ZVFile::GetFolderName(row[0]).c_str()) << row[0];
        EXPECT_STREQ(row[2], ZVFile::GetFileName(row[0]).c_str()) << row[0];
    }
}

TEST(FileTest, MakesEveryFolderOfAPath)
{
    const TempFolder folder;
    folder.Write("file", "content");
    const struct {
        const char* path;
        bool made;
    } rows[] = {
        {"x/y/z", true},   {"x/y/z", true},     {"x/new/", true},
        {"d//e", true},    {"file", true},  // whatever is there counts
        {"file/x", false}, {"file/x/y", false},
    };
    for (const auto& row : rows) {
        const std::string path = folder / row.path;
        EXPECT_EQ(row.made, ZVFile::CreateFolder(path.c_str())) << row.path;
        EXPECT_EQ(row.made && std::string(row.path) != "file", ZVFile::FolderExist(path.c_str())) << row.path;
    }
    EXPECT_FALSE(ZVFile::CreateFolder(""));
}

// Instances that start at once on a folder that none of them finds.
TEST(FileTest, MakesAFolderThatOthersMakeAtTheSameTime)
{
    const TempFolder folder;
    const int kTogether = 4;
    for (int round = 0; round < 200; ++round) {
        const std::string path = folder / (std::to_string(round) + "/a/b/c");
        std::atomic<int> ready{0}, made{0};
        std::vector<std::thread> threads;
        threads.reserve(kTogether);
        for (int i = 0; i < kTogether; ++i) {
            threads.emplace_back([&] {
                for (++ready; ready < kTogether;)
                    std::this_thread::yield();
                made += ZVFile::CreateFolder(path.c_str()) ? 1 : 0;
            });
        }
        for (std::thread& thread : threads)
            thread.join();
        ASSERT_EQ(kTogether, made) << round;
    }
}

TEST(FileTest, RemovesByWildcard)
{
    const TempFolder folder;
    const auto remove = [&](const char* pattern) { return ZVFile::RemoveWithWildcard((folder / pattern).c_str()); };
    for (const char* name : {"a.jpg", "c.zv", ".jpg", "[d].jpg"})
        folder.Write(name, "");
    EXPECT_TRUE(remove("none*"));
    EXPECT_TRUE(remove("?.jpg"));
    EXPECT_FALSE(folder.Has("a.jpg"));
    EXPECT_TRUE(folder.Has(".jpg") && folder.Has("[d].jpg") && folder.Has("c.zv"));
    EXPECT_TRUE(remove("*"));
    EXPECT_FALSE(folder.Has(".jpg") || folder.Has("[d].jpg") || folder.Has("c.zv"));

    EXPECT_TRUE(ZVFile::CreateFolder((folder / "full/inner").c_str()));
    EXPECT_FALSE(remove("ful?")) << "a folder that is not empty";
    EXPECT_FALSE(remove("none/*"));
    EXPECT_FALSE(ZVFile::RemoveWithWildcard("*.zvnone")) << "a bare name counts as a folder";
}

TEST(FileTest, CopiesAndRenames)
{
    const TempFolder folder;
    for (const size_t size : {0, 1023, 1024, 1025, 4096}) {
        const std::string content(size, 'c');
        folder.Write("from", content);
        folder.Write("to", std::string(5000, 'o'));
        EXPECT_TRUE(ZVFile::CopyFile((folder / "from").c_str(), (folder / "to").c_str()));
        EXPECT_EQ(content, folder.Read("to"));
    }
    EXPECT_FALSE(ZVFile::CopyFile((folder / "none").c_str(), (folder / "to").c_str()));
    EXPECT_EQ(4096u, folder.Read("to").size()) << "a missing source leaves the target";
    EXPECT_TRUE(ZVFile::CopyFile((folder / "from").c_str(), "/dev/full")) << "write errors go unreported";
    EXPECT_TRUE(ZVFile::Rename((folder / "from").c_str(), (folder / "to").c_str()));
    EXPECT_FALSE(ZVFile::Rename((folder / "from").c_str(), (folder / "to").c_str()));
}

TEST(FileTest, AFileCopiedOntoItselfStays)
{
    const TempFolder folder;
    const std::string file = folder.Write("file", "content");
    ASSERT_EQ(0, symlink("file", (folder / "link").c_str()));
    ASSERT_EQ(0, link(file.c_str(), (folder / "name").c_str()));
    for (const std::string from : {"file", "link", "name"}) {
        for (const std::string to : {"file", "link", "name", "./file"}) {
            EXPECT_TRUE(ZVFile::CopyFile((folder / from).c_str(), (folder / to).c_str())) << from << " " << to;
            EXPECT_EQ("content", ContentOf(file)) << from << " " << to;
        }
    }
}

// An image on its way into the cache.
TEST(FileTest, ATemporaryFileIsWrittenWhateverItsNameBecomes)
{
    const TempFolder folder;
    const std::string other = folder.Write("other", "untouched");
    ZVFile file;
    ZVString name;
    ASSERT_TRUE(file.OpenTemporary((folder / "target").c_str(), name));
    EXPECT_EQ(0600, static_cast<int>(std::filesystem::status(name.c_str()).permissions()));
    ASSERT_EQ(0, unlink(name.c_str()));
    ASSERT_EQ(0, symlink("other", name.c_str()));
    EXPECT_EQ(3, file.Write("new", 3));
    EXPECT_TRUE(file.Flush());
    EXPECT_EQ("untouched", ContentOf(other));
    EXPECT_FALSE(file.OpenTemporary((folder / "none/target").c_str(), name));
    EXPECT_TRUE(name.empty());
}

TEST(FileDeathTest, NullsAndPatternsWithoutWildcardStop)
{
    EXPECT_DEATH(ZVFile().Open(nullptr, "r"), "\\./Private/ZVFile.cpp.*\"filename != 0\"");
    EXPECT_DEATH(ZVFile::RemoveWithWildcard("/none/x"), "strchr\\(filename, '\\?'\\) != 0");
}

}  // namespace
