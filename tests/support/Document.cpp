#include "Document.h"

#include <gtest/gtest.h>
#include <stdlib.h>

#include <fstream>

#include "TempFolder.h"

std::string SourceFile(const std::string& path)
{
    return ZV_SOURCES + path;
}

std::string SourceText(const std::string& path)
{
    return ContentOf(SourceFile(path));
}

void ExpectBlock(const std::string& document, const std::string& name, const std::string& content)
{
    std::string text = SourceText(document);
    const std::string begin = "<!-- " + name + " -->\n", end = "<!-- end -->";
    size_t start = text.find(begin);
    ASSERT_NE(std::string::npos, start) << name;
    start += begin.size();
    const size_t size = text.find(end, start) - start;
    if (getenv("ZV_WRITE_DOCUMENTS")) {
        std::ofstream(SourceFile(document), std::ios::binary) << text.replace(start, size, content);
    } else {
        EXPECT_EQ(content, text.substr(start, size)) << "ZV_WRITE_DOCUMENTS=1 brings it up to date";
    }
}

std::string Row(std::initializer_list<std::string> cells)
{
    std::string row = "|";
    for (const std::string& cell : cells)
        row.append(" ").append(cell).append(" |");
    return row + "\n";
}

std::string Head(std::initializer_list<std::string> cells)
{
    std::string rule = "|";
    for (size_t i = 0; i < cells.size(); ++i)
        rule += "---|";
    return Row(cells) + rule + "\n";
}

std::string Code(const std::string& text)
{
    return "`" + text + "`";
}
