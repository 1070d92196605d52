// Answers as other toolkits make them: a reader of XML and HTTP finds the right answer in each.
#include <gtest/gtest.h>
#include <libxml/parser.h>

#include <functional>

#include "RawClient.h"

namespace {

const char kInstance[] = "http://www.w3.org/2001/XMLSchema-instance";

const char* Text(const xmlChar* text)
{
    return text ? reinterpret_cast<const char*>(text) : "";
}

std::string Taken(xmlChar* text)
{
    const std::unique_ptr<xmlChar, void (*)(void*)> owned(text, xmlFree);
    return Text(owned.get());
}

// How a tree is written down to be compared.
struct Reading {
    bool empty = true;            // whether elements without content are
    size_t nils = 0, others = 0;  // what was met: nil elements, and nodes that a reader passes over
    std::string seen = {};        // the types, and the values that were left out of the comparison
    std::function<bool(const std::string& name, const std::string& value)> skip = {};
};

bool HasInstance(xmlNode* node, const char* name)
{
    return xmlHasNsProp(node, reinterpret_cast<const xmlChar*>(name), reinterpret_cast<const xmlChar*>(kInstance));
}

// The prefix of the type must be bound, and the one of the element's namespace to that of the schema or the service.
std::string TypeOf(xmlNode* node)
{
    const std::string type = Taken(
        xmlGetNsProp(node, reinterpret_cast<const xmlChar*>("type"), reinterpret_cast<const xmlChar*>(kInstance)));
    const std::string prefix = type.substr(0, type.find(':'));
    const xmlNs* space = xmlSearchNs(node->doc, node, reinterpret_cast<const xmlChar*>(prefix.c_str()));
    return (space ? Text(space->href) : "unbound") + type.substr(prefix.size());
}

std::string Dump(xmlNode* node, Reading& reading)
{
    if (HasInstance(node, "nil")) return ++reading.nils, "";
    if (HasInstance(node, "type")) reading.seen += TypeOf(node) + " " + Text(node->name) + "\n";
    std::string inside, text;
    bool leaf = true;
    for (const xmlAttr* attribute = node->properties; attribute; attribute = attribute->next) {
        if (attribute->ns) continue;
        const std::string value = Taken(xmlGetProp(node, attribute->name));
        const bool skipped = reading.skip && reading.skip(Text(attribute->name), value);
        if (skipped) reading.seen += value + "\n";
        inside += std::string("@") + Text(attribute->name) + "=" + (skipped ? "*" : value) + " ";
    }
    for (xmlNode* child = node->children; child; child = child->next) {
        if (child->type == XML_ELEMENT_NODE) {
            const std::string dump = Dump(child, reading);
            inside += dump;
            leaf = leaf && dump.empty();
        } else if (child->type == XML_TEXT_NODE || child->type == XML_CDATA_SECTION_NODE) {
            text += Text(child->content);
        }
        if (child->type == XML_CDATA_SECTION_NODE || child->type == XML_COMMENT_NODE ||
            (!leaf && xmlIsBlankNode(child)))
            ++reading.others;
    }
    if (!leaf && text.find_first_not_of(" \t\r\n") != std::string::npos) ++reading.others;
    if (!leaf) text.clear();
    const bool skipped = leaf && reading.skip && reading.skip(Text(node->name), text);
    if (skipped) reading.seen += text + "\n";
    if (!reading.empty && leaf && text.empty() && inside.empty()) return "";
    return std::string("<{") + Text(node->ns->href) + "}" + Text(node->name) + " " + inside + (skipped ? "*" : text) +
           ">";
}

std::string Dump(const Reply& reply, Reading& reading)
{
    const std::unique_ptr<xmlDoc, void (*)(xmlDoc*)> document(
        xmlReadMemory(reply.body.data(), static_cast<int>(reply.body.size()), nullptr, nullptr, XML_PARSE_NONET),
        xmlFreeDoc);
    return document ? Dump(xmlDocGetRootElement(document.get()), reading) : "no XML";
}

class AnswerShapeTest : public StorefrontTest {
protected:
    void SetUp() override { Begin(); }

    // Answers with everything there is in them: arrays and none, attributes, flags, enumerations, letters beyond ASCII.
    std::vector<Reply> Answers(const std::string& fault)
    {
        const std::string page = Children({{"CurrentPageNumber", "1"}, {"ItemsPerPage", "9"}});
        const std::string cafe = store->Query("SELECT MIN(id) FROM title WHERE name LIKE '%é%'");
        const std::string all =
            page + Children({{"PurchaseType", "any"}, {"TitleType", "any"}, {"WatchStatusFilter", "Undefined"}});
        const SoapRequest requests[] = {
            {"RealTimeBrowse", "getTitleListing", Children({{"TitleID", cafe}})},
            {"RealTimeBrowse", "getTitlesByNavigation",
             Children({{"GenreID", "1"}}) + page + Children({{"PurchaseType", "any"}})},
            {"RealTimeBrowse", "getFileType"},
            {"StreamAPI", "getMyStreamingVideos", all},
            {"StreamAPI", "getConfig"},
            {"StreamAPI", "checkAdultVerificationEnabled"},
            {"StreamAPI", "checkForPurchasedStream", Children({{"SkuID", "1"}})},
            {"StreamAPI", "getAudioDefaultProperty"},
            {"StreamAPI", "getTitleListingsPurchasedForPasses", "<z:Passes/>"},
        };
        std::vector<Reply> answers;
        for (const SoapRequest& request : requests) {
            if (!fault.empty()) Order(request.operation + "=" + fault);
            answers.push_back(Send(request));
            EXPECT_EQ(200, answers.back().status) << request.operation << " " << fault;
        }
        return answers;
    }
    // That all answers read as the right ones do; `met` gets what was met in all of them.
    void ExpectTheSame(const std::string& fault, Reading& met)
    {
        const std::vector<Reply> right = Answers("");
        const std::vector<Reply> shaped = Answers(fault);
        for (size_t i = 0; i < right.size(); ++i) {
            Reading plain = met;
            EXPECT_EQ(Dump(right[i], plain), Dump(shaped[i], met)) << fault;
        }
    }
};

TEST_F(AnswerShapeTest, XmlReadsTheSame)
{
    const auto read = [&](const char* fault, bool empty = true) {
        Reading reading;
        reading.empty = empty;
        ExpectTheSame(fault, reading);
        return reading;
    };
    EXPECT_GT(read("prefixes").others, 100u);
    EXPECT_GT(read("cdata").others, 100u);
    EXPECT_GT(read("text").others, 30u);
    EXPECT_GT(read("nil").nils, 3u);
    EXPECT_EQ(0u, read("absent-arrays", false).others);
    const Reading types = read("xsi-types");
    for (const char* type :
         {"http://www.w3.org/2001/XMLSchema:int TitleID", "http://www.w3.org/2001/XMLSchema:string TitleName",
          "http://www.w3.org/2001/XMLSchema:decimal Price",
          "http://www.w3.org/2001/XMLSchema:boolean IsAdultVerificationEnabled",
          "http://api.zorvane.example/api/:StreamAPIPurchaseType PurchaseType",
          "http://api.zorvane.example/api/:TitleListing TitleListing",
          "http://api.zorvane.example/api/:AudioProfile getAudioDefaultPropertyResult",
          "http://api.zorvane.example/api/:ArrayOfBonusAsset BonusAssets"})
        EXPECT_NE(std::string::npos, types.seen.find(type)) << type;
    EXPECT_EQ(std::string::npos, types.seen.find("unbound"));
    read("latin1");
    read("bom");
    EXPECT_EQ(0u, read("ok").others);
}

TEST_F(AnswerShapeTest, BytesAreAsTheySay)
{
    const std::vector<Reply> latin1 = Answers("latin1");
    EXPECT_EQ("text/xml; charset=ISO-8859-1", latin1[0].Header("Content-Type"));
    EXPECT_NE(std::string::npos, latin1[0].body.find('\xe9'));
    EXPECT_EQ(std::string::npos, latin1[0].body.find("\xc3\xa9"));
    EXPECT_EQ(0u, Answers("bom")[0].body.find("\xef\xbb\xbf<?xml"));
    for (const auto& [fault, count] : {std::pair<const char*, int>("", 1), {"absent-arrays", 0}}) {
        const std::vector<Reply> answers = Answers(fault);
        EXPECT_EQ(count, answers[0].body.find("<BonusAssets>") != std::string::npos) << fault;
        EXPECT_NE(std::string::npos, answers[8].body.find("PassesResult")) << fault;
    }
}

// What a fault puts in place of a value stands in every place of its kind, and nowhere else.
TEST_F(AnswerShapeTest, ValuesAreReplaced)
{
    const auto replaced = [&](const std::string& fault,
                              const std::function<bool(const std::string&, const std::string&)>& skip) {
        Reading reading;
        reading.skip = skip;
        ExpectTheSame(fault, reading);
        return reading.seen;
    };
    const auto flag = [](const std::string& name, const std::string&) {
        return name.rfind("Is", 0) == 0 || name == "ContainsVideo" || name.rfind("checkForPurchased", 0) == 0;
    };
    const auto enumeration = [](const std::string& name, const std::string&) {
        for (const char* one : {"PurchaseType", "FileProfile", "AudioAssetProfile", "Status", "PlayStatus", "Profile",
                                "BonusType", "getAudioDefaultPropertyResult"}) {
            if (name == one) return true;
        }
        return name.rfind("File_", 0) == 0;
    };
    const std::string on = replaced("boolean: true ", flag);
    EXPECT_EQ(std::string::npos, on.find("false"));
    EXPECT_NE(std::string::npos, on.find(" true \n"));
    EXPECT_EQ(std::string::npos, replaced("boolean:&#49;", flag).find_first_not_of("1\n"));
    EXPECT_EQ(std::string::npos, replaced("boolean", flag).find_first_not_of("01\n"));
    const std::string texts = replaced("enum:NEVER_HEARD_OF", enumeration);
    EXPECT_GT(texts.size(), 500u);
    for (size_t at = 0; at < texts.size(); at += strlen("NEVER_HEARD_OF\n"))
        ASSERT_EQ(0, texts.compare(at, strlen("NEVER_HEARD_OF\n"), "NEVER_HEARD_OF\n")) << texts;
    const auto counter = [](const std::string& name, const std::string&) { return name == "TotalItems"; };
    EXPECT_EQ("32768\n32768\n", replaced("counter:32768", counter));
}

TEST_F(AnswerShapeTest, HttpReadsTheSame)
{
    const auto answer = [&](const std::string& fault, const std::string& version = "1.1") {
        Order("getConfig=" + fault);
        std::string request = SoapRequest{"StreamAPI", "getConfig"}.Text(store->HttpsPort());
        request.replace(request.find("HTTP/1.1"), 8, "HTTP/" + version);
        return SendBytes(store->HttpsPort(), true, request);
    };
    const std::string right = answer("ok").body;
    for (const auto& [fault, size] :
         {std::pair<const char*, size_t>("chunked", 1000), {"chunked:1", 1}, {"chunked:99999", 99999}}) {
        const Reply reply = answer(fault);
        EXPECT_EQ("chunked", reply.Header("Transfer-Encoding"));
        EXPECT_EQ("", reply.Header("Content-Length"));
        std::string body;
        for (size_t at = 0, length = 1; length > 0; at += length + 2) {
            const size_t end = reply.body.find("\r\n", at);
            ASSERT_NE(std::string::npos, end);
            length = strtoul(reply.body.c_str() + at, nullptr, 16);
            EXPECT_LE(length, size);
            at = end + 2;
            body += reply.body.substr(at, length);
            ASSERT_EQ("\r\n", reply.body.substr(at + length, 2));
        }
        EXPECT_EQ(right, body) << fault;
    }
    EXPECT_EQ("HTTP/1.0 200 OK", answer("http10").head.substr(0, 15));
    EXPECT_EQ(right, answer("http10").body);
    const Reply twice = answer("continue");
    EXPECT_EQ(100, twice.status);
    EXPECT_EQ("HTTP/1.1 200 OK", twice.body.substr(0, 15));
    EXPECT_EQ(right, twice.body.substr(twice.body.size() - right.size()));

    Order("clock=connection-close");
    RawClient client(store->HttpPort(), false);
    ASSERT_TRUE(client.Send(TimeRequest()));
    EXPECT_EQ("close", client.Receive().Header("Connection")) << "and the end comes without being asked for";
}

}  // namespace
