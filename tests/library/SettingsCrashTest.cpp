// Settings under processes that die and processes that write at once.
#include <signal.h>
#include <time.h>

#include <random>

#include "SettingsFolder.h"

namespace {

class SettingsCrash : public SettingsFolder {};

// Writes one number after the other, each reported to the pipe once its write is complete.
int WriteOn(const std::string& path, int from, int report)
{
    CfgXMLFile settings(ZVString(path.c_str()));
    for (int number = from;; ++number) {
        const std::string text = std::to_string(number);
        if (settings.Write("Plain", text.c_str(), false) != 0 || settings.Write("Secret", text.c_str(), true) != 0)
            return 1;
        if (write(report, &number, sizeof number) != sizeof number) return 2;
    }
}

// The pipe's writer is dead, so that it ends behind the last report.
int LastReport(int reports, int before)
{
    int number = before;
    while (read(reports, &number, sizeof number) == sizeof number) {
    }
    return number;
}

TEST_F(SettingsCrash, AKilledWriterLosesNoCompletedWrite)
{
    ASSERT_EQ(0u, Write("Beside", "stays", true));
    std::mt19937 random(20110413);  // fixed: what varies from run to run is the disk
    std::uniform_int_distribution<long> delay(0, 8000000);
    int last = 0;
    int advanced = 0;
    for (int round = 0; round < 500; ++round) {
        int ends[2];
        ASSERT_EQ(0, pipe(ends));
        const pid_t child = Fork([&] { return WriteOn(file, last + 1, ends[1]); });
        close(ends[1]);
        const timespec pause = {0, delay(random)};  // the moment of death, anywhere in a write
        nanosleep(&pause, nullptr);
        kill(child, SIGKILL);
        EXPECT_EQ(-SIGKILL, Wait(child));
        const int completed = LastReport(ends[0], last);
        close(ends[0]);

        std::string plain = "0", secret = "0", beside;
        const unsigned int results[] = {Read("Plain", plain), Read("Secret", secret, true)};
        if (completed > 0) {
            ASSERT_EQ(0u, results[0]) << Get(file);
            ASSERT_EQ(0u, results[1]) << Get(file);
        }
        EXPECT_EQ(0u, Read("Beside", beside, true));
        ASSERT_EQ("stays", beside);
        ASSERT_GE(atoi(plain.c_str()), completed);
        ASSERT_GE(atoi(secret.c_str()), completed);
        ASSERT_LE(atoi(plain.c_str()), completed + 1) << "only the write under way may be there, too";
        if (completed > last) ++advanced;
        last = completed;
    }
    EXPECT_GT(advanced, 50) << "the writers were killed before they did anything";
    // The folder holds nothing of the dead but what the next write takes away.
    ASSERT_EQ(0u, Write("Plain", "end"));
    size_t files = 0;
    for ([[maybe_unused]] const auto& entry : std::filesystem::directory_iterator(folder))
        ++files;
    EXPECT_EQ(3u, files) << "settings, device key, deployment";
}

TEST_F(SettingsCrash, WritersAtOnceLoseNothingOfEachOther)
{
    const int kWriters = 4, kWrites = 40;
    std::vector<pid_t> writers;
    for (int writer = 0; writer < kWriters; ++writer) {
        writers.push_back(Fork([&] {
            for (int i = 0; i < kWrites; ++i) {
                const std::string number = std::to_string(writer) + "." + std::to_string(i);
                if (Write("key " + number, number, true) != 0 || Write("own " + std::to_string(writer), number) != 0)
                    return 1;
            }
            return 0;
        }));
    }
    for (const pid_t writer : writers)
        EXPECT_EQ(0, Wait(writer));
    for (int writer = 0; writer < kWriters; ++writer) {
        for (int i = 0; i < kWrites; ++i) {
            const std::string number = std::to_string(writer) + "." + std::to_string(i);
            ASSERT_EQ("0:" + number, Reading("key " + number, true));
        }
        const std::string own = std::to_string(writer);
        EXPECT_EQ("0:" + own + "." + std::to_string(kWrites - 1), Reading("own " + own));
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
