// docs/logging.md against the log's areas, as a movie's set-up switches them.
#include <gtest/gtest.h>
#include <algorithm>
#include <regex>

#include "Document.h"
#include "ZVWSAELog.h"
#include "ZV_Log.h"

namespace {

TEST(LoggingDocument, Areas)
{
    const std::string header = SourceText("Public/ZV_Log.h");
    const std::regex row("((?:/// .*\n)+)#define \\w+_AREA_NAME \"(\\w+)\"");
    std::string table = Head({"bit", "area", "what it tells"});
    std::vector<int> ids;
    std::vector<std::string> names, tells;
    for (std::sregex_iterator at(header.begin(), header.end(), row), end; at != end; ++at) {
        names.push_back(at->str(2));
        tells.push_back(std::regex_replace(at->str(1), std::regex("\n?/// |\\.\n$"), ""));
        ids.push_back(-1);
        ZV_LogRegisterArea(names.back().c_str(), &ids.back());
    }
    for (int bit = 0; bit < 32; ++bit) {
        const unsigned int mask = 1u << bit;
        ASSERT_EQ(0, ZVWSAELog::InitWSLogs(mask, ZVWSAELog::kConsole));
        for (size_t i = 0; i < ids.size(); ++i) {
            if (!ZV_LogWouldOutput(ids[i], ZV_LOG_TRACE)) continue;
            char number[16];
            snprintf(number, sizeof number, "0x%X", mask);
            table += Row({Code(number), names[i], tells[i]});
        }
    }
    ZV_LogSetTarget(nullptr, nullptr);
    ExpectBlock("docs/logging.md", "areas", table);
    EXPECT_EQ(static_cast<long>(names.size()) + 2, std::count(table.begin(), table.end(), '\n'));  // each has one bit
}

}  // namespace
