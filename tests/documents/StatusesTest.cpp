// docs/statuses.md is made of what Public/ZV_WS_Status.h says; both against what the library gives.
#include <gtest/gtest.h>
#include <algorithm>
#include <filesystem>
#include <map>

#include "Document.h"
#include "PublicHeaders.h"
#include "Status.h"
#include "ZVUtilities.h"

namespace {

const char kDocument[] = "docs/statuses.md";
constexpr int kMostCodes = 30;  // more than any operation has

// What a call makes of the service's response codes, but for general errors.
std::set<std::string> RefusalsOf(const std::string& call)
{
    std::set<std::string> refusals;
    for (int code = 1; code <= kMostCodes; ++code) {
        const ZV_WS_Status status = ZVUtilities::To_ZV_WS_Status(0, code, call.c_str());
        const auto known = std::find_if(PublicStatuses().begin(), PublicStatuses().end(),
                                        [=](const PublicStatus& candidate) { return candidate.value == status; });
        if (status == ZV_WS_Status_general_error) continue;
        if (known == PublicStatuses().end()) {
            ADD_FAILURE() << call << ": " << status;
        } else {
            refusals.insert(known->name);
        }
    }
    return refusals;
}

// The library's sources, without the codes of calls that it does not have and the texts, which name all.
std::string LibrarySources()
{
    std::string text;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(SourceFile("Private"))) {
        const std::string name = entry.path().filename().string();
        if (entry.path().extension() != ".cpp" || name == "StatusText.cpp") continue;
        text += SourceText(std::filesystem::relative(entry.path(), SourceFile("")).string());
    }
    const size_t begin = text.find("kResponseCodes[] = {"), end = text.find("};\n", begin);
    EXPECT_NE(std::string::npos, begin);
    return text.erase(begin, end - begin);
}

TEST(Statuses, EachHasItsLines)
{
    static const std::set<std::string> kWho = {"Nobody", "Caller", "Service", "Network", "Device", "Unused"};
    EXPECT_GT(PublicStatuses().size(), 60u);
    for (const PublicStatus& status : PublicStatuses()) {
        EXPECT_EQ(1u, kWho.count(status.who)) << status.name;
        EXPECT_FALSE(status.cause.empty()) << status.name;
        EXPECT_EQ(status.who == "Unused", status.remedy.empty()) << status.name;
    }
}

TEST(Statuses, AreGivenUnlessTheyAreUnused)
{
    std::set<std::string> given = NamesIn(LibrarySources(), "ZV_WS_Status_");
    for (const PublicCall& call : PublicCalls("ZV_WS_"))
        given.merge(RefusalsOf(call.name));
    for (const PublicStatus& status : PublicStatuses())
        EXPECT_EQ(status.who != "Unused", given.count(status.name) == 1) << status.name;
}

// At the call and at the status.
TEST(Statuses, RefusalsAreSaidAtBothEnds)
{
    std::map<std::string, std::set<std::string>> callsOf;
    for (const PublicCall& call : PublicCalls("ZV_WS_")) {
        const std::set<std::string> refusals = RefusalsOf(call.name);
        for (const std::string& refusal : refusals)
            callsOf[refusal].insert(call.name.substr(sizeof "ZV_WS_" - 1));
        const size_t listed = call.comment.find("Refusals:");
        EXPECT_EQ(refusals, listed == std::string::npos ? std::set<std::string>()
                                                        : NamesIn(call.comment.substr(listed), "ZV_WS_Status_"))
            << call.name;
    }
    for (const PublicStatus& status : PublicStatuses())
        EXPECT_EQ(callsOf[status.name], status.calls) << status.name;
}

TEST(Statuses, AreInTheDocument)
{
    for (const char* who : {"Caller", "Service", "Network", "Device", "Unused"}) {
        const bool isUsed = std::string(who) != "Unused";
        std::string table =
            isUsed ? Head({"status", "what happened", "what to do"}) : Head({"status", "what it is for"});
        for (const PublicStatus& status : PublicStatuses()) {
            if (status.who != who) continue;
            const std::string name = Code(status.name) + " (" + std::to_string(status.value) + ")";
            std::string calls;
            for (const std::string& call : status.calls)
                calls += (calls.empty() ? ". Only from " : ", ") + Code(call);
            table += isUsed ? Row({name, status.cause + calls, status.remedy}) : Row({name, status.cause});
        }
        ExpectBlock(kDocument, who, table);
    }
}

}  // namespace
