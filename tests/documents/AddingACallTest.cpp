// docs/adding-a-call.md: its example is the code's, is as short as it says, and leaves no list out.
#include <gtest/gtest.h>
#include <filesystem>
#include <regex>
#include <sstream>

#include "Document.h"

namespace {

namespace fs = std::filesystem;

const char kDocument[] = "docs/adding-a-call.md";
const char kExample[] = "getRecommendedTitles";

std::string Trimmed(const std::string& line)
{
    const size_t begin = line.find_first_not_of(' ');
    return begin == std::string::npos ? "" : line.substr(begin);
}

TEST(AddingACallDocument, ExampleIsTheCodes)
{
    constexpr int kMostLines = 15;
    const std::string text = SourceText(kDocument);
    std::string code;
    for (const char* file :
         {"wire/browse.h", "Private/services/Operations.h", "Public/ZVWSLib.h", "Private/calls/CatalogCalls.cpp"})
        code += SourceText(file) + "\n";
    std::istringstream lines(text);
    int count = 0;
    bool isCode = false;
    for (std::string line; std::getline(lines, line);) {
        const std::string own = Trimmed(line);
        if (own.rfind("```", 0) == 0) {
            isCode = !isCode;
        } else if (isCode) {
            ++count;
            EXPECT_NE(std::string::npos, code.find(own + "\n")) << own;
        }
    }
    EXPECT_GT(count, 5);
    EXPECT_LE(count, kMostLines);
}

TEST(AddingACallDocument, NamesEveryList)
{
    const std::string text = SourceText(kDocument);
    int count = 0;
    for (const char* folder : {"wire", "Public", "Private", "Sample", "simulator", "tests", "docs"}) {
        for (const auto& entry : fs::recursive_directory_iterator(SourceFile(folder))) {
            const std::string path = fs::relative(entry.path(), SourceFile("")).string();
            // Fuzz inputs of other targets, and tests that have it as an example.
            const bool isExample = path.find("seeds/") != std::string::npos ||
                                   path.find("/documents/") != std::string::npos ||
                                   path == "tests/library/CacheWriterTest.cpp" || path == kDocument;
            if (!entry.is_regular_file() || isExample) continue;
            const std::string content = SourceText(path);
            if (!std::regex_search(content, std::regex(std::string("\\b(ZV_WS_)?") + kExample + "\\b"))) continue;
            ++count;
            EXPECT_NE(std::string::npos, text.find(entry.path().filename().string())) << path;
        }
    }
    EXPECT_GT(count, 10);
}

}  // namespace
