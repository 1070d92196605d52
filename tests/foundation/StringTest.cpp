#include "ZVString.h"

#include <gtest/gtest.h>

#include <string>

namespace {

std::string Text(const ZVString& text)
{
    return std::string(text.c_str(), text.length());
}

TEST(StringTest, KeepsNulBytes)
{
    const std::string bytes("a\0b\0", 4);
    ZVString text(bytes.data(), bytes.size());
    EXPECT_EQ(4u, text.length());
    EXPECT_EQ('\0', text.c_str()[4]);
    EXPECT_EQ(3u, text.find('\0', 2));
    EXPECT_EQ(ZVString::npos, text.find('\0', 4));
    EXPECT_EQ(ZVString::npos, text.find('a', 99));
    text += text;
    text.append(text.c_str(), 1);
    EXPECT_EQ(bytes + bytes + "a", Text(text));
    EXPECT_EQ(bytes + "x", Text(ZVString(bytes.data(), 4) + "x"));
    text.assign(text.c_str() + 1, 2);
    EXPECT_EQ(std::string("\0b", 2), Text(text));
}

TEST(StringTest, ComparesUnsignedBytes)
{
    const ZVString cut("a\0b", 3), ascii("z"), high("\xc3\xa9"), empty;
    EXPECT_TRUE(cut != "a" && cut > "a" && "a" < cut);
    EXPECT_TRUE(ascii < high && high > "z" && high >= high && !(high < high));
    EXPECT_TRUE(empty == "" && empty < ascii && empty.empty());
    EXPECT_TRUE(cut != ZVString("a\0c", 3) && cut < ZVString("a\0c", 3));
}

TEST(StringTest, CutsParts)
{
    const ZVString text("abc");
    EXPECT_EQ("bc", Text(text.substr(1)));
    EXPECT_EQ("", Text(text.substr(3)));
    EXPECT_EQ("", Text(text.substr(4, 1)));
    const char* const trims[][2] = {{"", ""}, {" \t\r\n", ""}, {" a b\n", "a b"}, {"a", "a"}, {"\va", "\va"}};
    for (const auto& row : trims)
        EXPECT_EQ(row[1], Text(ZVString(row[0]).trim()));
}

TEST(StringDeathTest, MisuseStops)
{
    ZVString text("abc");
    const char* null = nullptr;
    EXPECT_DEATH(text[3], "ZVString.h.*\"idx < length\\(\\)\"");
    EXPECT_DEATH(ZVString{null}, "\"buf != 0\"");
}

}  // namespace
