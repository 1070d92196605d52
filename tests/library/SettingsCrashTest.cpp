// Settings under processes that die and processes that write at once.
#include <limits.h>
#include <signal.h>
#include <time.h>

#include <algorithm>
#include <random>

#include "SettingsFolder.h"

namespace {

class SettingsCrash : public SettingsFolder {};

// Odd numbers are written to a plain setting, even ones to a protected one.
const char* KeyOf(int number)
{
    return number % 2 ? "Plain" : "Secret";
}

// Writes one number after the other, each reported to the pipe once its write is complete.
int WriteOn(const std::string& path, int from, int report)
{
    CfgXMLFile settings(ZVString(path.c_str()));
    for (int number = from;; ++number) {
        if (settings.Write(KeyOf(number), std::to_string(number).c_str(), number % 2 == 0) != 0) return 1;
        if (write(report, &number, sizeof number) != sizeof number) return 2;
    }
}

// Takes at most `count` reports; they end behind the last one of a dead writer.
void TakeReports(int reports, int count, int& completed)
{
    int number;
    while (count-- > 0 && read(reports, &number, sizeof number) == sizeof number)
        completed = number;
}

TEST_F(SettingsCrash, AKilledWriterLosesNoCompletedWrite)
{
    const int kRounds = 300;
    ASSERT_EQ(0u, Write("Beside", "stays", true));
    ASSERT_EQ(0u, Write("Plain", "0"));
    ASSERT_EQ(0u, Write("Secret", "0", true));
    std::mt19937 random(20110413);  // fixed: what varies from run to run is the disk
    std::uniform_int_distribution<long> delay(0, 20000000);
    int completed = 0;
    for (int round = 0; round < kRounds; ++round) {
        int ends[2];
        ASSERT_EQ(0, pipe(ends));
        const pid_t child = Fork([&] { return WriteOn(file, completed + 1, ends[1]); });
        close(ends[1]);
        TakeReports(ends[0], round % 4, completed);
        const timespec pause = {0, delay(random)};  // the moment of death, anywhere in the write that follows
        nanosleep(&pause, nullptr);
        kill(child, SIGKILL);
        EXPECT_EQ(-SIGKILL, Wait(child));
        TakeReports(ends[0], INT_MAX, completed);
        close(ends[0]);

        std::string plain, secret;
        ASSERT_EQ(0u, Read("Plain", plain)) << ContentOf(file);
        ASSERT_EQ(0u, Read("Secret", secret, true)) << ContentOf(file);
        ASSERT_EQ("0:stays", Reading("Beside", true)) << ContentOf(file);
        const int stored[] = {atoi(secret.c_str()), atoi(plain.c_str())};
        ASSERT_GE(stored[completed % 2], completed);
        ASSERT_GE(stored[(completed + 1) % 2], completed - 1);
        ASSERT_LE(std::max(stored[0], stored[1]), completed + 1) << "only the write under way may be there, too";
    }
    EXPECT_GE(completed, kRounds) << "the writers were killed before they did anything";
    // The folder holds nothing of the dead but what the next write takes away.
    ASSERT_EQ(0u, Write("Plain", "end"));
    using Entries = std::filesystem::directory_iterator;
    EXPECT_EQ(3, std::distance(Entries(folder), Entries())) << "settings, device key, deployment";
}

// Waiting for the lock is not in turn: a writer can be unlucky for so long on a slow disk that it is refused.
bool WriteInTheEnd(const std::string& path, const std::string& key, const std::string& value, bool isProtected)
{
    unsigned int result;
    do {
        result = CfgXMLFile(ZVString(path.c_str())).Write(key.c_str(), value.c_str(), isProtected);
    } while (result == CfgXMLFile::kUnwritable);
    return result == CfgXMLFile::kOk;
}

TEST_F(SettingsCrash, WritersAtOnceLoseNothingOfEachOther)
{
    const int kWriters = 4, kWrites = 40;
    std::vector<pid_t> writers;
    const auto own = [](int writer) { return "own " + std::to_string(writer); };
    const auto number = [](int writer, int i) { return std::to_string(writer) + "." + std::to_string(i); };
    for (int writer = 0; writer < kWriters; ++writer) {
        writers.push_back(Fork([&] {
            for (int i = 0; i < kWrites; ++i) {
                if (!WriteInTheEnd(file, number(writer, i), number(writer, i), true) ||
                    !WriteInTheEnd(file, own(writer), number(writer, i), false))
                    return 1;
            }
            return 0;
        }));
    }
    for (const pid_t writer : writers)
        EXPECT_EQ(0, Wait(writer));
    for (int writer = 0; writer < kWriters; ++writer) {
        for (int i = 0; i < kWrites; ++i)
            ASSERT_EQ("0:" + number(writer, i), Reading(number(writer, i), true));
        EXPECT_EQ("0:" + number(writer, kWrites - 1), Reading(own(writer)));
    }
}

TEST_F(SettingsCrash, ReadersNeverSeeAPartOfAWrite)
{
    const std::string small = "s", large(200000, 'l');
    ASSERT_EQ(0u, Write("k", small));
    const pid_t writer = Fork([&] {
        for (int i = 0; i < 50; ++i) {
            if (Write("k", i % 2 ? small : large) != 0) return 1;
        }
        return 0;
    });
    int status = 0;
    while (waitpid(writer, &status, WNOHANG) == 0) {
        std::string value;
        ASSERT_EQ(0u, Read("k", value));
        ASSERT_TRUE(value == small || value == large);
    }
    EXPECT_EQ(0, status);
}

}  // namespace
