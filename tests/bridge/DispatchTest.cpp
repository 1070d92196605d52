// Return codes, delivery and the end of instances, as far as they need no service: a set-up that the library refuses
// at once goes the whole way through worker and delivery.
#include <gtest/gtest.h>
#include <sstream>

#include "MovieRun.h"
#include "TempFolder.h"
#include "ZVWSLibAE.h"

namespace {

const char kListener[] =
    "var ws = new com.orvex.ZVWSLib();\n"
    "function listener(name) { return {onComplete: function (status, result) {\n"
    "    report(name + ' ' + status + ' ' + JSON.stringify(result)); } }; }\n";

std::string Report(const std::string& script)
{
    const MovieRun run = RunMovie(kListener + script);
    EXPECT_TRUE(run.succeeded);
    return run.Text();
}

TEST(Dispatch, CallsBeforeInitAreRefused)
{
    EXPECT_EQ("-1\n-1\n-1\n[]-1\n", Report("report(ws.getNavigation([listener('a'), {}]));\n"
                                           "report(ws.getTitles({genreid: 1}));\n"
                                           "report(ws.getTitleListing());\n"
                                           "report('[' + ws.getUserAgent() + ']' + ws.getDeviceEnv());\n"));
}

TEST(Dispatch, ArgumentsMustBeOneArrayOfTwoObjects)
{
    std::istringstream wrong(
        ";{};null;listener('a'), {};[listener('a')];[listener('a'), {}, {}];[listener('a'), 5];[null, {}];['text', {}];"
        "[listener('a'), {}], 1;{length: 2, 0: listener('a'), 1: {}};"
        "new Proxy([listener('a'), {}], {get: function () { throw new Error('on purpose') }});"
        "Object.defineProperty([listener('a'), {}], 1, {get: function () { throw new Error('on purpose') }})");
    for (std::string arguments; std::getline(wrong, arguments, ';');)
        EXPECT_EQ("-3\n", Report("report(ws.init(" + arguments + "));\n")) << arguments;
}

TEST(Dispatch, AResultComesOnceAndNeverDuringTheCall)
{
    EXPECT_EQ("0\nafter\na -1000 false\n", Report("report(ws.init([listener('a'), {}])); report('after');\n"));
}

TEST(Dispatch, ASecondCallIsRefusedUntilTheFirstIsDelivered)
{
    EXPECT_EQ("0\n-2\na -1000 false\n0\nc -1000 false\n",
              Report("report(ws.init([{onComplete: function (status, result) {\n"
                     "    listener('a').onComplete(status, result);\n"
                     "    report(ws.init([listener('c'), {}])); } }, {}]));\n"
                     "report(ws.init([listener('b'), {}]));\n"));
}

TEST(Dispatch, ACallMadeByAGetterWins)
{
    EXPECT_EQ("inner 0\nouter -2\ninner -1000 false\n",
              Report("var parameters = {get APIKey() {\n"
                     "    report('inner ' + ws.init([listener('inner'), {}])); return ''; } };\n"
                     "report('outer ' + ws.init([listener('outer'), parameters]));\n"));
}

TEST(Dispatch, AListenerWithoutOnCompleteOrOneThatThrowsDoesNotBlockTheInstance)
{
    EXPECT_EQ("0\n0\nb -1000 false\n", Report("report(ws.init([{}, {}]));\n"
                                              "var timer = setInterval(function () {\n"
                                              "    var code = ws.init([listener('b'), {}]);\n"
                                              "    if (code === -2) return;\n"
                                              "    report(code); clearInterval(timer); }, 1);\n"));
    EXPECT_EQ("0\nb -1000 false\n", Report("ws.init([{onComplete: function () {\n"
                                           "    report(ws.init([listener('b'), {}])); throw new Error('expected');\n"
                                           "} }, {}]);\n"));
}

TEST(Dispatch, CloneNeedsAnotherInitialisedInstance)
{
    EXPECT_EQ("-3\n-3\n-3\n-3\n-3\n-2\n",
              Report("var other = new com.orvex.ZVWSLib();\n"
                     "report(ws.clone()); report(ws.clone(ws)); report(ws.clone(other)); report(ws.clone({}));\n"
                     "report(ws.clone(new test.Native()));\n"
                     "ws.init([{}, {}]); report(ws.clone(other));\n"));
}

TEST(Dispatch, InstancesEndWhileTheirWorkersDo)
{
    for (int i = 0; i < 20; ++i) {
        EXPECT_EQ("", Report("for (var i = 0; i < 3; ++i) new com.orvex.ZVWSLib().init([{}, {}]);\n"
                             "for (var end = Date.now() + " +
                             std::to_string(i % 4) + "; Date.now() < end;) {} quit();\n"));
    }
}

TEST(Dispatch, IdleKeepsTheMovieUntilQuitFlash)
{
    EXPECT_EQ("0\n0\n", Report("report(ws.idle()); setTimeout(function () { report(ws.quitFlash()); }, 50);\n"));
}

TEST(Methods, StandInTheOrderAndKindsThatMoviesRestOn)
{
    // The kinds: + for static functions.
    const char kTable[] =
        "init clone idle getNavigation getTitles getTitleListing searchForTitle getRecommendedTitles translateSkuID "
        "getTvEpisodeListing getTvEpisodeListByTitleID getAllTvEpisodeListings authorizeDevice deactivateDevice "
        "checkAuthToken getBoxArtImage getMyVideos getWishlistItems addItemToWishlist removeItemFromWishlist "
        "removeAllItemsFromWishlist checkTitleInWishlist checkTitlesInWishlist doPurchaseSavedBilling "
        "checkForPurchasedTitle checkForPurchasedSku checkAdultVerificationEnabled checkAdultVerificationPin "
        "assignGiftCertificateToUser checkRentalExpiration getStreamingAssetLocation getStreamingBonusAssetLocation "
        "loadLastStreamingAssetLocation manageStreamingInstanceStatus getTHXMediaDirector "
        "getTHXMediaDirectorBonusAsset getEmailAddress getBillingInfo getPrePaidCardBalance getConfig "
        "getSettingsPageInfo getCountryID getFileType updateLocalCache checkBandwidth calcOrderTax quitFlash "
        "getLocalIPAddr getSysInfo setAudioDefaultProperty getAudioDefaultProperty getUserAgent "
        "+setLogAreaIDsAndTargetConfig +fileExist getAvailableEnvLists +clearLocalCache getDeviceEnv "
        "+checkZVSWFmd5sum +trace ";
    AEArray<ae::stagecraft::ASExtensionClass::Method> methods;
    ZVWSLibAE::GetMethods(methods);
    std::string table;
    for (const auto& method : methods)
        table += std::string(method.m_type == method.kStaticFunction ? "+" : "") + method.m_pName + " ";
    EXPECT_EQ(kTable, table);
    EXPECT_EQ(59u, methods.size());
    EXPECT_FALSE(ZVWSLibAE::FiresEvents());
}

TEST(Methods, PrintAndLookAtFiles)
{
    testing::internal::CaptureStdout();
    Report("com.orvex.ZVWSLib.trace('é ' + 1); ws.trace(null); ws.trace();\n");
    EXPECT_EQ("FLASH TRACE == é 1\nFLASH TRACE == null\nFLASH TRACE == \n", testing::internal::GetCapturedStdout());
    const TempFolder folder;
    const std::string name = folder.Write("file", "abc");
    EXPECT_EQ(
        "true,false,false,false\ntrue,true,false,false,false,false\n",
        Report("var lib = com.orvex.ZVWSLib, path = '" + name +
               "';\n"
               "report([lib.fileExist(path), lib.fileExist(path + 'x'), lib.fileExist(), lib.fileExist(path, 1)]);\n"
               "report([lib.checkZVSWFmd5sum(path, '900150983cd24fb0d6963f7d28e17f72'),\n"
               "    lib.checkZVSWFmd5sum(path, '900150983CD24FB0D6963F7D28E17F72'),\n"
               "    lib.checkZVSWFmd5sum(path, '900150983cd24fb0d6963f7d28e17f73'), lib.checkZVSWFmd5sum(path),\n"
               "    lib.checkZVSWFmd5sum(path + 'x', ''), lib.checkZVSWFmd5sum('/tmp', '')]);\n"));
}

}  // namespace
