// Documents against the code: the parts of them that tests make. With ZV_WRITE_DOCUMENTS set in the environment they
// are brought up to date instead.
#pragma once

#include <gtest/gtest.h>
#include <stdlib.h>

#include <fstream>
#include <initializer_list>
#include <string>

#include "TempFolder.h"

/// A row of a table.
inline std::string Row(std::initializer_list<std::string> cells)
{
    std::string row = "|";
    for (const std::string& cell : cells)
        row.append(" ").append(cell).append(" |");
    return row + "\n";
}

inline std::string Code(const std::string& text)
{
    return "`" + text + "`";
}

/// What stands between the comments that name the block.
inline std::string BlockOf(const std::string& document, const std::string& name)
{
    const std::string text = ContentOf(document);
    const std::string begin = "<!-- " + name + " -->\n";
    const size_t start = text.find(begin);
    EXPECT_NE(std::string::npos, start) << name;
    return start == std::string::npos
               ? ""
               : text.substr(start + begin.size(), text.find("<!-- end -->", start) - start - begin.size());
}

inline void ExpectBlock(const std::string& document, const std::string& name, const std::string& content)
{
    const std::string before = BlockOf(document, name);
    if (getenv("ZV_WRITE_DOCUMENTS")) {
        std::string text = ContentOf(document);
        const std::string begin = "<!-- " + name + " -->\n";
        text.replace(text.find(begin) + begin.size(), before.size(), content);
        std::ofstream(document, std::ios::binary) << text;
    } else {
        EXPECT_EQ(content, before) << "ZV_WRITE_DOCUMENTS=1 brings it up to date";
    }
}
