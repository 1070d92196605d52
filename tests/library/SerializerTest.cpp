#include "Serializer.h"

#include <gtest/gtest.h>
#include <soapH.h>

#include <string>

#include "Http.h"

namespace {

using simulator::Gzip;

typedef _ZV1__getTitleListingResponse Response;

ZVString Bytes(const std::string& text)
{
    return ZVString(text.data(), text.size());
}
std::string Text(const ZVString& text)
{
    return std::string(text.c_str(), text.length());
}

// An answer with texts, numbers, empty and absent members, nested arrays and one record in two places.
class Answer {
public:
    Answer()
    {
        m_Product.SkuID = 17;
        m_Product.Price = m_Price;
        m_ProductPointers[0] = m_ProductPointers[1] = &m_Product;
        m_Products.__sizeProductListing = 2;
        m_Products.ProductListing = m_ProductPointers;
        m_Title.TitleID = -4;
        m_Title.TitleName = m_Name;
        m_Title.BoxArtPrefix = m_Empty;
        m_Title.TitlePosition = -32768;
        m_Title.IsTvListing = true;
        m_Title.AvailableProducts = &m_Products;
        m_Response.getTitleListingResult = &m_Title;
    }
    const Response& response() const { return m_Response; }

private:
    char m_Price[5] = "4.99";
    char m_Name[64] = "<Caf\xc3\xa9> & \"\xe2\x82\xac\xf0\x9f\x8e\xac\"\t\n ]]>";
    char m_Empty[1] = "";
    ZV1__ProductListing m_Product;
    ZV1__ProductListing* m_ProductPointers[2];
    ZV1__ArrayOfProductListing m_Products;
    ZV1__TitleListingResponse m_Title;
    Response m_Response;
};

ZVString Written(bool compress, bool indent = false)
{
    Serializer serializer(compress, indent);
    ZVString text;
    EXPECT_TRUE(serializer.Write(Answer().response(), text));
    return text;
}

// What a text that must not be accepted leaves behind: nothing.
void ExpectRefused(const ZVString& text, const std::string& what)
{
    Serializer serializer(true, false);
    Response response;
    ZV1__TitleListingResponse stale;
    response.getTitleListingResult = &stale;
    EXPECT_FALSE(serializer.Read(text, response)) << what;
    EXPECT_EQ(nullptr, response.getTitleListingResult) << what;
}

// A text written by hand, with an answer's result of that content.
std::string Around(const std::string& content)
{
    return "<ZVWSLib xmlns:ZV1=\"http://api.zorvane.example/api/\"><ZV1:getTitleListingResult>" + content +
           "</ZV1:getTitleListingResult></ZVWSLib>";
}

TEST(SerializerTest, ReadsBackWhatItWrote)
{
    Serializer serializer(true, false);  // serves all texts, refused ones in between
    Response response;
    for (const bool compress : {true, false}) {
        for (const bool indent : {true, false}) {
            SCOPED_TRACE(testing::Message() << "compress " << compress << ", indent " << indent);
            const ZVString text = Written(compress, indent);
            EXPECT_EQ(compress, text.length() > 2 && Text(text).compare(0, 2, "\x1f\x8b") == 0);
            EXPECT_FALSE(serializer.Read(text.substr(0, text.length() / 2), response));
            ASSERT_TRUE(serializer.Read(text, response));
            ZVString again;
            EXPECT_TRUE(Serializer(compress, indent).Write(response, again));
            EXPECT_TRUE(again == text);
            EXPECT_TRUE(serializer.Write(response, again));
            EXPECT_TRUE(again == Written(true));
        }
    }
}

TEST(SerializerTest, WritesOneElementWithoutReferences)
{
    const std::string product =
        "<ZV1:ProductListing><ZV1:SkuID>17</ZV1:SkuID><ZV1:PurchaseType>rent</ZV1:PurchaseType>"
        "<ZV1:Price>4.99</ZV1:Price><ZV1:RentalPeriod>0</ZV1:RentalPeriod></ZV1:ProductListing>";
    const std::string result =
        "><ZV1:getTitleListingResult><ZV1:TitleID>-4</ZV1:TitleID>"
        "<ZV1:TitleName>&lt;Café&gt; &amp; \"€🎬\"\t\n ]]&gt;</ZV1:TitleName><ZV1:BoxArtPrefix/>"
        "<ZV1:TitlePosition>-32768</ZV1:TitlePosition><ZV1:EpisodeNumber>0</ZV1:EpisodeNumber>"
        "<ZV1:IsTvListing>true</ZV1:IsTvListing><ZV1:AvailableProducts>" +
        product + product + "</ZV1:AvailableProducts><ZV1:IsTHX";
    const std::string text = Text(Written(false));
    EXPECT_EQ(0u, text.find("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<ZVWSLib xmlns"));
    EXPECT_EQ(text.find("><"), text.find(result)) << text;
    EXPECT_EQ("</ZV1:getTitleListingResult></ZVWSLib>", text.substr(text.find("</ZV1:getT")).substr(0, 38));
}

// ---- Texts that are no answers

TEST(SerializerTest, RefusesEveryTextCutShort)
{
    for (const bool compress : {true, false}) {
        const ZVString text = Written(compress);
        const size_t element = compress ? text.length() : Text(text).find_last_of('>') + 1;
        for (size_t length = 0; length < element; ++length)
            ExpectRefused(text.substr(0, length), "cut at " + std::to_string(length));
    }
}

TEST(SerializerTest, RefusesDamagedTexts)
{
    const std::string packed = Text(Written(true));
    // The checksum stands in the last eight bytes together with the length.
    for (const size_t fromEnd : {8u, 5u, 4u, 1u}) {
        std::string damaged = packed;
        damaged[damaged.size() - fromEnd] ^= 1;
        ExpectRefused(Bytes(damaged), "wrong checksum or length");
    }
    const struct {
        const char* what;
        std::string text;
    } rows[] = {
        {"no XML", "no XML"},
        {"zeros", std::string(1000, '\0')},
        {"another element", "<Other><getTitleListingResult/></Other>"},
        {"a number that is none", Around("<ZV1:TitleID>x</ZV1:TitleID>")},
        {"only the magic bytes of gzip", "\x1f\x8b"},
        {"a gzip header", packed.substr(0, 10)},
        {"gzip of garbage", Gzip("garbage")},
        {"too long a string", Around("<ZV1:TitleName>" + std::string(2 << 20, 'x') + "</ZV1:TitleName>")},
    };
    for (const auto& row : rows)
        ExpectRefused(Bytes(row.text), row.what);

    // Whatever a single byte is changed to, reading ends; what it yields, if anything, is a whole answer.
    for (size_t i = 0; i < packed.size(); ++i) {
        std::string damaged = packed;
        damaged[i] ^= 0xff;
        Serializer serializer(true, false);
        Response response;
        const bool read = serializer.Read(Bytes(damaged), response);
        EXPECT_EQ(read, response.getTitleListingResult != nullptr) << "byte " << i;
    }
}

TEST(SerializerTest, RefusesWhatGrowsWithoutEnd)
{
    const auto repeated = [](const std::string& text, size_t count) {
        std::string all;
        for (size_t i = 0; i < count; ++i)
            all += text;
        return all;
    };
    const std::string useless = "<a>" + std::string(1020, 'x') + "</a>";
    const auto products = [&](size_t count) {
        return "<ZV1:AvailableProducts>" + repeated("<ZV1:ProductListing/>", count) + "</ZV1:AvailableProducts>";
    };
    const struct {
        const char* what;
        std::string content;
        bool reads;
    } rows[] = {
        {"as many products as an array may have", products(4096), true},
        {"one more", products(4097), false},
        {"elements deep in each other", repeated("<a>", 100000) + repeated("</a>", 100000), true},
        {"3 MiB of elements without use", repeated(useless, 3 << 10), true},
        {"5 MiB of elements without use", repeated(useless, 5 << 10), false},
        {"3 MiB of blanks", std::string(3 << 20, ' '), true},
        {"5 MiB of blanks", std::string(5 << 20, ' '), false},
    };
    for (const auto& row : rows) {
        const std::string plain = Around(row.content);
        for (const std::string& text : {plain, Gzip(plain)}) {
            Serializer serializer(true, false);
            Response response;
            EXPECT_EQ(row.reads, serializer.Read(Bytes(text), response)) << row.what << ", " << text.size() << " bytes";
            EXPECT_EQ(row.reads, response.getTitleListingResult != nullptr) << row.what;
        }
    }
}

}  // namespace
