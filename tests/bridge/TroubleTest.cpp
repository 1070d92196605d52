// Fetching ahead while the service is in trouble, seen from the store, by a clock of the test's own: what stops it, for
// how long, and what comes then.
#include <atomic>

#include "PrefetchMovie.h"

namespace {

std::atomic<uint64_t> s_Now;
std::atomic<uint32_t> s_Random;
constexpr uint32_t kMost = 0xffffffff;  // draws the longest pause

class Trouble : public Prefetch {
protected:
    void SetUp() override
    {
        Prefetch::SetUp();
        Calm();
    }

    void Calm()
    {
        s_Random = kMost;
        pause = std::make_shared<PrefetchPause>([] { return s_Now.load(); }, [] { return s_Random.load(); });
    }

    // The script has paused(then), which waits for a pause; stays(then), which shows over some ticks, and by a call
    // that goes through, that nothing is fetched; pass(milliseconds), the clock.
    std::string RunInTrouble(int data, size_t requests, const std::string& script)
    {
        return Run(data, requests, PerPage(10) + R"(
function pass(time) { answer('pass ' + time); }
function ticks(count, then) { setTimeout(count > 0 ? ticks.bind(null, count - 1, then) : then, 0); }
function paused(then) {
    if (answer('paused') === 'yes') return then();
    setTimeout(paused.bind(null, then), 0);
}
var title = 10;
function stays(then) {
    ws.idle();
    ticks(20, function () { ask('getTitleListing', {titleid: ++title}, function () { ws.idle(); then(); }); });
})" + script);
    }

    std::string AnswerTo(const std::string& question) override
    {
        if (question == "paused") return pause->IsOver() ? "no" : "yes";
        if (question == "draw nothing") s_Random = 0;
        if (question.rfind("pass ", 0) == 0) s_Now += static_cast<uint64_t>(atoi(question.c_str() + 5));
        return Prefetch::AnswerTo(question);
    }

    Strings Images() const
    {
        Strings prefixes;
        for (const LoggedRequest& request : store->Log()) {
            if (request.service == "boxart") prefixes.push_back(request.operation);
        }
        return prefixes;
    }
};

// The load time and page 1 come first. What fails is page 2.
TEST_F(Trouble, TheFirstFailureStopsAllUntilThePauseIsOver)
{
    const struct {
        const char* let;
        const char* fault;
        int milliseconds;
    } rows[] = {
        {"getTitlesByNavigation=ok", "getTitlesByNavigation=http:503", 30000},
        {"getTitlesByNavigation=ok", "getTitlesByNavigation=http:503,retry=120", 240000},
        {"getTitlesByNavigation=ok", "getTitlesByNavigation=http:404", 30000},
        {"getTitlesByNavigation=ok", "getTitlesByNavigation=cut", 30000},
        {"getTitlesByNavigation=ok", "getTitlesByNavigation=fault11", 30000},
        {"getTitlesByNavigation=ok", "getTitlesByNavigation=garbage", 30000},
        {"connect=ok", "connect=close", 30000},
    };
    for (const auto& row : rows) {
        Calm();
        Fault(row.let);
        Fault(row.fault);
        EXPECT_EQ("",
                  RunInTrouble(1, 13,
                               "titles(1, function () { ws.idle(); paused(function () { pass(" +
                                   std::to_string(row.milliseconds - 1) +
                                   "); stays(function () { stays(function () { pass(1); until(quit); }); }); }); });"));
        const Strings asked = Asked();
        ASSERT_EQ(13u, asked.size()) << row.fault;
        EXPECT_NE("", store->Log()[2].fault);
        EXPECT_EQ((Strings{"getTitleListing", "getTitleListing"}), Strings(asked.begin() + 3, asked.begin() + 5));
        const Strings pages = Pages("getTitlesByNavigation");
        EXPECT_EQ((Strings{"2", "10", "3", "9", "4", "8", "5", "7"}), Strings(pages.end() - 8, pages.end()));
    }
}

TEST_F(Trouble, ARefusalStopsNothing)
{
    Fault("getTitlesByNavigation=ok");
    Fault("getTitlesByNavigation=code:3,count=2");
    EXPECT_EQ("", RunInTrouble(1, 10, "titles(1, function () { until(quit); });"));
    EXPECT_EQ((Strings{"1", "2", "10", "3", "9", "4", "8", "5", "7"}), Pages("getTitlesByNavigation"));
    EXPECT_TRUE(pause->IsOver());
}

// Only the service's own answer to a customer's call brings the end of a pause forward, and never before what the
// service asked for. What comes then is around the page that is shown then.
TEST_F(Trouble, TheServicesAnswerToACustomersCallShortensAPause)
{
    const struct {
        const char* fault;
        const char* wait;
    } rows[] = {
        {"getTitlesByNavigation=http:503", "until(quit);"},
        {"getTitlesByNavigation=http:503,retry=120",
         "ws.idle(); pass(119999); stays(function () { pass(1); until(quit); });"},
    };
    for (const auto& row : rows) {
        Calm();
        Fault("getTitlesByNavigation=ok");
        Fault(row.fault);
        const bool isAsked = strstr(row.fault, "retry");
        EXPECT_EQ("", RunInTrouble(1, isAsked ? 14 : 13, std::string(R"(
titles(1, function () { paused(function () {
    answer('draw nothing');
    titles(1, function () { stays(function () {  // from the cache
        titles(6, function () { )") + row.wait + " }); }); }); }); });"));
        const Strings pages = Pages("getTitlesByNavigation");
        EXPECT_EQ((Strings{"1", "2", "6", "7", "5", "8", "4", "9", "3", "10", "2"}), pages) << row.fault;
    }
}

TEST_F(Trouble, ImagesThatFailWaitBehindTheOthers)
{
    const std::string season =
        store->Query("SELECT season FROM title WHERE season > 0 GROUP BY season ORDER BY season LIMIT 1");
    const std::string show = "ask('getAllTvEpisodeListings', {titleid: " + season + "}, function () { ";
    const struct {
        const char* fault;
        int milliseconds;
    } rows[] = {{"boxart=http:503", 30000}, {"boxart=http:503,retry=60", 120000}, {"boxart=cut", 30000}};
    const size_t images = static_cast<size_t>(Number("SELECT COUNT(*) FROM title WHERE season = " + season)) - 1;
    for (const auto& row : rows) {
        Calm();
        Fault(row.fault);
        EXPECT_EQ("",
                  RunInTrouble(7, 2 + 1 + 1 + images,
                               show + "ws.idle(); paused(function () { pass(" + std::to_string(row.milliseconds - 1) +
                                   "); stays(function () { pass(1); until(quit); }); }); });"));
        const Strings asked = Images();
        ASSERT_EQ(images + 1, asked.size()) << row.fault;
        EXPECT_EQ("getTitleListing", Asked()[3]);
        EXPECT_EQ(asked.front(), asked.back());
        EXPECT_EQ(images, std::set<std::string>(asked.begin(), asked.end()).size());
    }

    // One that the service cannot give although it gives others is given up.
    Calm();
    Fault("boxart=http:500");
    Fault("boxart=ok,count=" + std::to_string(images - 1));
    Fault("boxart=http:500,count=9");
    EXPECT_EQ("", RunInTrouble(7, 2 + images + 1,
                               show + "ws.idle(); paused(function () { pass(30000); until(function () {"
                                      "stays(function () { stays(quit); }); }); }); });"));
    EXPECT_EQ(images + 1, Images().size());
    EXPECT_TRUE(pause->IsOver());

    // The customer's own call fails: images need not.
    Calm();
    Fault("getTitlesByNavigation=http:503");
    EXPECT_EQ("getTitles -4503\n",
              RunInTrouble(7, 4 + images,
                           show + "titles(1, function () { stays(function () { pass(30000); until(quit); }); "
                                  "}); });"));
    EXPECT_EQ("getTitleListing", Asked()[3]);
}

TEST_F(Trouble, AClonePausesToo)
{
    Fault("getTitlesByNavigation=ok");
    Fault("getTitlesByNavigation=http:503");
    EXPECT_EQ("", RunInTrouble(1, 0, R"(
var other = new com.orvex.ZVWSLib();
titles(1, function () { paused(function () {
    if (other.clone(ws) !== 0) report('no clone');
    call(other, 'getTitles', {genreid: 100, CurrentPageNumber: 6, ItemsPerPage: perPage, purchasetype: 2}, function () {
        other.idle(); stays(quit);
    });
}); });)"));
    EXPECT_EQ((Strings{"1", "2", "6"}), Pages("getTitlesByNavigation"));
}

}  // namespace
