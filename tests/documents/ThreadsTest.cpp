// docs/threads.md names every thread and every lock that there is.
#include <gtest/gtest.h>
#include <filesystem>
#include <regex>
#include <set>

#include "Document.h"

namespace {

namespace fs = std::filesystem;

// The matches' first part, each behind its file's name.
std::set<std::string> Find(const std::regex& pattern)
{
    std::set<std::string> found;
    for (const char* folder : {"Private", "Sample", "platform"}) {
        for (const auto& entry : fs::recursive_directory_iterator(SourceFile(folder))) {
            if (entry.path().extension() != ".cpp" && entry.path().extension() != ".h") continue;
            const std::string text = SourceText(fs::relative(entry.path(), SourceFile("")).string());
            for (std::sregex_iterator at(text.begin(), text.end(), pattern), end; at != end; ++at)
                found.insert(entry.path().filename().string() + " " + at->str(1));
        }
    }
    return found;
}

// The first cells of a table's rows, without their quotes.
std::set<std::string> Rows(const std::string& title)
{
    const std::string document = SourceText("docs/threads.md");
    const size_t begin = document.find("\n## " + title + "\n");
    EXPECT_NE(std::string::npos, begin) << title;
    const std::string section = document.substr(begin, document.find("\n## ", begin + 1) - begin);
    const std::regex row("\n\\| `([^|]*)` \\|");
    std::set<std::string> rows;
    for (std::sregex_iterator at(section.begin(), section.end(), row), end; at != end; ++at)
        rows.insert(std::regex_replace(at->str(1), std::regex("`"), ""));
    return rows;
}

TEST(ThreadsDocument, HasEveryLock)
{
    const std::regex declaration("\n *(?:mutable )?(?:ZVMutex|KernelMutex|std::mutex|pthread_mutex_t) (\\w+)[; ]");
    std::set<std::string> locks = Find(declaration);
    locks.merge(Find(std::regex("\nZVMutex& (\\w+)\\(\\)\n")));
    // What the classes of locks are made of.
    for (const char* own : {"ZVMutex.h m_Mutex", "Kernel.cpp m_Mutex"})
        EXPECT_EQ(1u, locks.erase(own)) << own;
    EXPECT_EQ(locks, Rows("Locks"));
}

TEST(ThreadsDocument, HasEveryThread)
{
    std::set<std::string> files;
    for (const std::string& found : Find(std::regex("(pthread_create\\(&|ZVThread::CreateThread\\(\\);|std::thread )")))
        files.insert(found.substr(0, found.find(' ')));
    EXPECT_EQ(1u, files.erase("ZVThread.cpp"));  // makes them for others
    EXPECT_EQ(files, Rows("Threads"));
}

}  // namespace
