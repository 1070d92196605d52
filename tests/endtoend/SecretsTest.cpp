// What a customer keeps secret stays out of all that the process prints, logs and leaves on the disk.
#include <signal.h>

#include <algorithm>
#include <filesystem>

#include "Movie.h"
#include "Storefront.h"
#include "TempFolder.h"

namespace {

namespace fs = std::filesystem;

// Before the evening: the log as ZV_LOG says, and the credentials among the settings, protected.
const char kPrelude[] = R"(
com.orvex.ZVWSLib.setLogAreaIDsAndTargetConfig({LogAreaIDs: 0, LogTarget: 0});
var settings = new com.orvex.ZVCfgLib();
settings.setFile(flashvars.folder + '/preference.xml');
trace('settings: ' + settings.write('Password', 'secret', true) + settings.write('UserName', 'customer', false));
)";

size_t Count(const std::string& all, const std::string& part)
{
    size_t count = 0;
    for (size_t at = 0; (at = all.find(part, at)) != std::string::npos; at += part.size())
        ++count;
    return count;
}

class Secrets : public testing::Test {
protected:
    void SetUp() override
    {
        std::string error;
        store = Storefront::Start(StorefrontOptions(), error);
        ASSERT_TRUE(store) << error;
    }

    // A customer's evening; what it leaves goes into `left`.
    Environment Variables(const std::string& target) const
    {
        const std::string folder = left / "";
        return {{"ZV_DEPLOYMENT", store->DeploymentFile()},
                {"STAGECRAFT_MOVIE", movies.Write("movie.js", kPrelude + ContentOf(ZV_MOVIES "/evening.js"))},
                {"STAGECRAFT_FPS", "1000"},
                {"ZV_LOG", "0x3F00," + target + "," + folder},
                {"ZV_FLASHVARS", "folder=" + folder + "&cache=" + folder + "cache"}};
    }

    std::string AllOf(const Process& ended) const
    {
        std::string all;
        for (const std::string& line : ended.Output() + ended.Errors())
            all += line + "\n";
        for (const auto& entry : fs::recursive_directory_iterator(left / "")) {
            if (entry.is_regular_file()) all += entry.path().string() + "\n" + ContentOf(entry.path()) + "\n";
        }
        return all;
    }

    // `least`: so many requests are to be in the log at least, or the test would prove nothing.
    void ExpectNone(const std::string& all, size_t least) const
    {
        EXPECT_LE(least, Count(all, "<wsse:Username>customer<"));
        EXPECT_EQ(Count(all, "#PasswordDigest\">"), Count(all, "#PasswordDigest\">***</wsse:Password>"));
        const Lines secrets = {StorefrontAccount::kPassword,
                               StorefrontAccount::kActivationPin,
                               "111111",
                               "GIFT1",
                               store->Query("SELECT text FROM token ORDER BY number DESC"),
                               ContentOf(store->DataFolder() + "/device.key")};
        for (const std::string& secret : secrets) {
            ASSERT_LE(5u, secret.size());
            const size_t at = all.find(secret);
            EXPECT_TRUE(at == std::string::npos) << all.substr(std::max<size_t>(at, 200) - 200, 400);
        }
    }

    const TempFolder movies, left;
    std::unique_ptr<Storefront> store;
};

TEST_F(Secrets, StayOutOfLogsAndFiles)
{
    for (const char* const target : {"1", "2"}) {  // console, file
        store->ClearLog();
        Process player({ZV_STAGECRAFT, "5"}, Variables(target));
        EXPECT_EQ(0, player.WaitForEnd());
        size_t sent = 0;
        for (const LoggedRequest& request : store->Log())
            sent += request.soap.empty() ? 0 : 1;
        EXPECT_LT(40u, sent);
        const std::string all = AllOf(player);
        ExpectNone(all, sent);
        for (const char* const trace : {"settings: 00\n", "Key=\"Password\"", "SQLite format 3", "JFIF", "ZV1:PIN>***<",
                                        "<AuthToken>***<", "GiftCertificateCode>***<"}) {
            EXPECT_NE(std::string::npos, all.find(trace)) << trace;
        }
    }
}

TEST_F(Secrets, StayOutOfTheReportOfACrash)
{
    Process player({ZV_STAGECRAFT, "5"}, Variables("1"));
    EXPECT_TRUE(player.WaitForLine("== Buy"));
    kill(player.Pid(), SIGSEGV);
    EXPECT_TRUE(player.WaitForLine("sp :"));
    kill(player.Pid(), SIGKILL);
    player.WaitForEnd();
    ExpectNone(AllOf(player), 10);
}

}  // namespace
