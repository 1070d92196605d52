// What documents refer to is there.
#include <gtest/gtest.h>
#include <filesystem>
#include <functional>
#include <regex>

#include "Document.h"
#include "PublicHeaders.h"

namespace {

namespace fs = std::filesystem;

// Calls `check(found, document)` with the first part of every match in every document.
int ForEach(const std::regex& reference, const std::function<void(const std::smatch&, const std::string&)>& check)
{
    std::vector<std::string> documents = {"README.md", "CONTRIBUTING.md"};
    for (const auto& entry : fs::directory_iterator(SourceFile("docs")))
        documents.push_back("docs/" + entry.path().filename().string());
    int count = 0;
    for (const std::string& document : documents) {
        const std::string text = SourceText(document);
        for (std::sregex_iterator at(text.begin(), text.end(), reference), end; at != end; ++at, ++count)
            check(*at, document);
    }
    return count;
}

// What is said to be held by a test names one: `Suite.Name`.
TEST(References, TestsAreThere)
{
    std::string tests;
    for (const auto& entry : fs::recursive_directory_iterator(SourceFile("tests"))) {
        if (entry.path().extension() == ".cpp")
            tests += SourceText(fs::relative(entry.path(), SourceFile("")).string());
    }
    EXPECT_GT(ForEach(std::regex("`([A-Z]\\w+)\\.([A-Z]\\w+)`"),
                      [&](const std::smatch& name, const std::string& document) {
                          EXPECT_NE(std::string::npos, tests.find("(" + name.str(1) + ", " + name.str(2) + ")"))
                              << document << ": " << name.str();
                      }),
              30);
}

TEST(References, FilesAreThere)
{
    EXPECT_GT(
        ForEach(std::regex(
                    "`((?:Public|Private|Sample|platform|simulator|wire|contract|movies|tests|bench|cmake)/[^` *{]*)`"),
                [&](const std::smatch& path, const std::string& document) {
                    EXPECT_TRUE(fs::exists(SourceFile(path.str(1)))) << document << ": " << path.str(1);
                }),
        30);
    EXPECT_GT(ForEach(std::regex("\\]\\(([^)#:]+)(?:#[^)]*)?\\)"),
                      [&](const std::smatch& path, const std::string& document) {
                          EXPECT_TRUE(fs::exists(fs::path(SourceFile(document)).parent_path() / path.str(1)))
                              << document << ": " << path.str(1);
                      }),
              20);
}

// Statuses of the library and its calls, here and in the headers' own comments.
TEST(References, NamesAreThere)
{
    std::set<std::string> known;
    for (const PublicStatus& status : PublicStatuses())
        known.insert("Status_" + status.name);
    for (const PublicCall& call : PublicCalls("ZV_WS_"))
        known.insert(call.name.substr(sizeof "ZV_WS_" - 1));
    for (const PublicCall& call : PublicCalls("ZV_WS_")) {
        for (const std::string& name : NamesIn(call.comment + call.section, "ZV_WS_"))
            EXPECT_TRUE(known.count(name) == 1 || isupper(name[0])) << call.name << ": " << name;
        for (const std::string& name : NamesIn(call.comment + call.section, "ZV_WS_Status_"))
            EXPECT_EQ(1u, known.count("Status_" + name)) << call.name << ": " << name;
    }
}

}  // namespace
