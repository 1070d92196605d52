// docs/simulator.md against the code and the program.
#include <regex>
#include <sstream>

#include "Document.h"
#include "FaultKinds.h"
#include "Process.h"
#include "RawClient.h"

namespace {

const char kDocument[] = "docs/simulator.md";

// The simulator's help, one row an option: name, argument, and what it is for.
TEST(SimulatorDocument, Options)
{
    Process program({STOREFRONT_PROGRAM, "--help"}, {});
    ASSERT_EQ(0, program.WaitForEnd());
    const std::regex option("  (--\\S+) +(\\S*) +(.+)"), bare("  (--\\S+) {15,}()(.+)");  // in columns of 14
    std::string table = "| option | what it is for |\n|---|---|\n";
    for (const std::string& line : program.Output()) {
        std::smatch match;
        if (!std::regex_match(line, match, bare) && !std::regex_match(line, match, option)) continue;
        const std::string argument = match.str(2).empty() ? "" : " " + match.str(2);
        table += Row({Code(match.str(1) + argument), match.str(3)});
    }
    ExpectBlock(kDocument, "options", table);
}

TEST(SimulatorDocument, Kinds)
{
    static const std::pair<unsigned, const char*> kPlaces[] = {{simulator::kSoap, "SOAP"},
                                                               {simulator::kPlain, "plain"},
                                                               {simulator::kBoxArt, "box art"},
                                                               {simulator::kConnect, "connect"},
                                                               {simulator::kProxy, "proxy"}};
    std::string table = "| kind | happens to | the request is | what it is |\n|---|---|---|---|\n";
    for (const simulator::KindRow& row : simulator::FaultKinds()) {
        std::string places;
        for (const auto& [place, name] : kPlaces)
            places += row.places & place ? (places.empty() ? "" : ", ") + std::string(name) : "";
        const std::string value = *row.value ? std::string(":") + row.value : "";
        table += Row({Code(row.name + value), places, row.effect == simulator::kDone ? "done" : "not done", row.help});
    }
    ExpectBlock(kDocument, "kinds", table);
}

class SimulatorDocuments : public StorefrontTest {};

// The keys of an entry, in the order in which they stand.
TEST_F(SimulatorDocuments, Log)
{
    Begin();
    Ask("StreamAPI", "getConfig");
    const auto keys = [](const std::string& text, const char* pattern) {
        std::string found;
        const std::regex key(pattern);
        for (std::sregex_iterator at(text.begin(), text.end(), key), end; at != end; ++at)
            found += at->str(1) + " ";
        return found;
    };
    std::string first;
    std::istringstream lines(BlockOf(kDocument, "log"));
    for (std::string line; std::getline(lines, line);)
        first += line.substr(0, line.find('|', 1)) + "\n";
    EXPECT_EQ(keys(Plain("/control/log").body, "\"(\\w+)\": "), keys(first, "`(\\w+)`"));
}

}  // namespace
