// What the public headers say of the calls, against what these do.
#include <map>
#include <memory>
#include <regex>

#include "Calls.h"
#include "Document.h"
#include "Exchanges.h"
#include "PublicHeaders.h"

namespace {

std::map<std::string, PublicCall> CallsByName()
{
    std::map<std::string, PublicCall> calls;
    for (const PublicCall& call : PublicCalls("ZV_WS_"))
        calls[call.name.substr(sizeof "ZV_WS_" - 1)] = call;
    return calls;
}

bool Holds(const std::string& text, const std::string& part)
{
    return text.find(part) != std::string::npos;
}

TEST(HeaderLines, OfEveryCall)
{
    const std::vector<PublicCall> calls = PublicCalls("ZV_\\w+");
    EXPECT_GT(calls.size(), 80u);
    for (const PublicCall& call : calls)
        EXPECT_FALSE(call.comment.empty()) << call.name;
}

// The service of each call by the session's access type, and what it sends.
class Headers : public Exchanges {
protected:
    struct Sent {
        std::string operation;
        std::string stream, download;  ///< The service for devices of either kind.
    };

    std::map<std::string, Sent> All()
    {
        std::map<std::string, Sent> all;
        for (const ZV_WS_AccessType access : {ACCESS_TYPE_STREAM, ACCESS_TYPE_DOWNLOAD}) {
            Begin(access);
            for (const std::string& name : CallNames()) {
                CallResult result;
                MakeCall(name, &session, result);
                const std::vector<SoapExchange> exchanges = Take();
                if (exchanges.empty()) continue;
                Sent& sent = all[name];
                sent.operation = exchanges[0].operation;
                (access == ACCESS_TYPE_STREAM ? sent.stream : sent.download) = exchanges[0].service;
            }
        }
        return all;
    }
};

TEST_F(Headers, SayWhichServiceIsAsked)
{
    const std::map<std::string, PublicCall> calls = CallsByName();
    const std::map<std::string, Sent> all = All();
    EXPECT_GT(all.size(), 50u);
    for (const auto& [name, sent] : all) {
        ASSERT_EQ(1u, calls.count(name)) << name;
        const PublicCall& call = calls.at(name);
        std::string expected = "service that has the account";
        if (sent.stream == sent.download) expected = sent.stream == "browse" ? "browse service" : "stream service";
        if (name == "checkBandwidth") expected = "ZV_WS_getConfig";
        const bool isOfSection = Holds(call.section, expected) && !Holds(call.comment, "sks the ");
        EXPECT_TRUE(Holds(call.comment, expected) || isOfSection)
            << name << " asks " << sent.stream << " or " << sent.download;
    }
}

TEST_F(Headers, SayWhatIsSentOnce)
{
    std::map<std::string, bool> once;
    const std::string operations = SourceText("Private/services/Operations.h");
    const std::regex row("ZV_OPERATION\\(m_\\w+, +(\\w+), +(true|false)\\)");
    for (std::sregex_iterator at(operations.begin(), operations.end(), row), end; at != end; ++at)
        once[at->str(1)] = at->str(2) == "true";
    const std::map<std::string, PublicCall> calls = CallsByName();
    const std::map<std::string, Sent> all = All();
    EXPECT_GT(all.size(), 50u);
    for (const auto& [name, sent] : all)
        EXPECT_EQ(once.at(sent.operation), Holds(calls.at(name).comment, "Sent once")) << name;
}

}  // namespace
