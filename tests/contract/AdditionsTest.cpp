#include "Additions.h"

#include <gtest/gtest.h>

#include "Calls.h"
#include "Peer.h"

namespace {

const char kAnswer[] =
    "<?xml version=\"1.0\" encoding=\"utf-8\"?>"
    "<s:Envelope xmlns:s=\"http://schemas.xmlsoap.org/soap/envelope/\" "
    "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\"><s:Body>"
    "<getTitleListingResponse xmlns=\"http://api.zorvane.example/api/\"><getTitleListingResult>"
    "<TitleID>42</TitleID><TitleName>Caf\xC3\xA9</TitleName><TitlePosition>3</TitlePosition>"
    "<EpisodeNumber>0</EpisodeNumber>"
    "<BonusAssets><BonusAsset BonusAssetID=\"9\" Profile=\"STANDARD\" BonusType=\"Trailer\"/></BonusAssets>"
    "<IsTvListing>true</IsTvListing><AvailableProducts>"
    "<ProductListing><SkuID>5</SkuID><PurchaseType>buy</PurchaseType><Price>4.90</Price><RentalPeriod>48</RentalPeriod>"
    "</ProductListing></AvailableProducts>"
    "<IsTHXMediaDirectorEnabled>false</IsTHXMediaDirectorEnabled>"
    "<IsTHXMediaDirectorEnabledForTrailer>false</IsTHXMediaDirectorEnabledForTrailer>"
    "<ResponseCode>0</ResponseCode><ResponseMessage>OK</ResponseMessage><UserRating>4</UserRating>"
    "<IsAvailInUserWishList>false</IsAvailInUserWishList></getTitleListingResult></getTitleListingResponse></s:Body>"
    "</s:Envelope>";

CallResult Read(const std::string& body)
{
    const std::string message =
        "HTTP/1.1 200 OK\r\nContent-Type: text/xml; charset=utf-8\r\nConnection: close\r\nContent-Length: " +
        std::to_string(body.size()) + "\r\n\r\n" + body;
    const Peer peer(message);
    PeerSession session;
    CallResult result;
    MakeCall("getTitleListing", session.handle(), result);
    return result;
}

bool Replace(std::string& text, const std::string& from, const std::string& to)
{
    const size_t at = text.find(from);
    if (from.empty() || at == std::string::npos) return false;
    text.replace(at, from.size(), to);
    return true;
}

// Each row's change to a good answer has the effect that it tells, and no other.
TEST(Additions, DoWhatTheDocumentSays)
{
    const CallResult good = Read(kAnswer);
    ASSERT_EQ(ZV_WS_Status_ok, good.status);
    for (const Addition& row : Additions()) {
        SCOPED_TRACE(row.change);
        std::string answer = kAnswer, output = good.output;
        ASSERT_TRUE(Replace(answer, row.from, row.to));
        for (const char* again = row.from; row.everywhere && Replace(answer, again, row.to);) {
        }
        const CallResult result = Read(answer);
        EXPECT_EQ(row.status, result.status);
        if (row.status != ZV_WS_Status_ok) continue;
        if (*row.was) {
            ASSERT_TRUE(Replace(output, row.was, row.is)) << output;
        }
        EXPECT_EQ(output, result.output);
    }
}

}  // namespace

const std::vector<Addition>& Additions()
{
    static const std::string kManyProducts = [] {
        std::string products = "<AvailableProducts>";
        for (int i = 0; i < 4096; ++i)
            products += "<ProductListing/>";
        return products;
    }();
    const char* const kAsBefore = "reads the answer as before";
    const char* const kFails = "";
    static const std::vector<Addition> rows = {
        {"a further element in a record", kAsBefore, ZV_WS_Status_ok, "<IsTvListing>",
         "<New><A>1</A></New><IsTvListing>"},
        {"a further element in an array", kAsBefore, ZV_WS_Status_ok, "<AvailableProducts>",
         "<AvailableProducts><New/>"},
        {"a further attribute", kAsBefore, ZV_WS_Status_ok, "<TitleID>", "<TitleID kind=\"new\">"},
        {"a further header block that need not be understood", kAsBefore, ZV_WS_Status_ok, "<s:Body>",
         "<s:Header><x:New xmlns:x=\"urn:x\">1</x:New></s:Header><s:Body>"},
        {"a header block that must be understood", kFails, ZV_WS_Status(-6008), "<s:Body>",
         "<s:Header><x:New xmlns:x=\"urn:x\" s:mustUnderstand=\"1\">1</x:New></s:Header><s:Body>"},
        {"children in another order", kAsBefore, ZV_WS_Status_ok,
         "<TitleID>42</TitleID><TitleName>Caf\xC3\xA9</TitleName>",
         "<TitleName>Caf\xC3\xA9</TitleName><TitleID>42</TitleID>"},
        {"the SOAP 1.2 envelope", kAsBefore, ZV_WS_Status_ok, "http://schemas.xmlsoap.org/soap/envelope/",
         "http://www.w3.org/2003/05/soap-envelope"},
        {"booleans as `1` and `0`", kAsBefore, ZV_WS_Status_ok, "<IsTvListing>true", "<IsTvListing>1"},
        {"booleans in any other form", kFails, ZV_WS_Status_general_error, "<IsTvListing>true", "<IsTvListing>yes"},
        {"`xsi:nil` where there is no value", "reads no value", ZV_WS_Status_ok, "<TitleName>Caf\xC3\xA9</TitleName>",
         "<TitleName xsi:nil=\"true\"/>", "'Caf\xC3\xA9'", "null"},
        {"a number, boolean or enumeration left out", "reads 0, false or the enumeration's first text", ZV_WS_Status_ok,
         "<PurchaseType>buy</PurchaseType>", "", "5,1,'4.90'", "5,0,'4.90'"},
        {"a price of another form", "shows it as it came", ZV_WS_Status_ok, "4.90", "4.9", "4.90", "4.9"},
        {"a new text in an enumeration", kFails, ZV_WS_Status_general_error, "<PurchaseType>buy", "<PurchaseType>lend"},
        {"a number in place of an enumeration's text", kFails, ZV_WS_Status_general_error, "<PurchaseType>buy",
         "<PurchaseType>1"},
        {"a new text in an attribute's enumeration", kFails, ZV_WS_Status_general_error, "Profile=\"STANDARD\"",
         "Profile=\"ULTRA\""},
        {"a counter or position above 32,767", kFails, ZV_WS_Status_general_error, "<TitlePosition>3",
         "<TitlePosition>32768"},
        {"a number above 2,147,483,647", kFails, ZV_WS_Status_general_error, "<TitleID>42", "<TitleID>2147483648"},
        {"an array of more than 4,096 elements", kFails, ZV_WS_Status(-6044), "<AvailableProducts>",
         kManyProducts.c_str()},
        {"text between the children of a record", kAsBefore, ZV_WS_Status_ok, "<Price>", "new<Price>"},
        {"another name for the result element", kFails, ZV_WS_Status_general_error, "getTitleListingResult>",
         "getTitleListingAnswer>", "", "", true},
        {"another name for the response element", kFails, ZV_WS_Status(-4200), "getTitleListingResponse",
         "getTitleListingAnswer", "", "", true},
        {"another namespace for the answers", kFails, ZV_WS_Status(-4200), "http://api.zorvane.example/api/",
         "http://api.zorvane.example/api2/"},
    };
    return rows;
}
