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

std::string BlockOf(const std::string& document, const std::string& name)
{
    const std::string text = SourceText(document), begin = "<!-- " + name + " -->\n";
    const size_t start = text.find(begin);
    EXPECT_NE(std::string::npos, start) << name;
    const size_t content = start + begin.size();
    return start == std::string::npos ? "" : text.substr(content, text.find("<!-- end -->", content) - content);
}

void ExpectBlock(const std::string& document, const std::string& name, const std::string& content)
{
    const std::string before = BlockOf(document, name);
    if (!getenv("ZV_WRITE_DOCUMENTS")) {
        EXPECT_EQ(content, before) << "ZV_WRITE_DOCUMENTS=1 brings it up to date";
        return;
    }
    std::string text = SourceText(document);
    const std::string begin = "<!-- " + name + " -->\n";
    text.replace(text.find(begin) + begin.size(), before.size(), content);
    std::ofstream(SourceFile(document), std::ios::binary) << text;
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
