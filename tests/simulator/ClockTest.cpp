// The clock that the simulator pretends, and when its certificates are valid.
#include <gtest/gtest.h>

#include "RawClient.h"

namespace {

constexpr long long kDay = 24 * 60 * 60;

class ClockTest : public StorefrontTest {
protected:
    void SetUp() override
    {
        StorefrontOptions options;
        options.proxyPort = 0;
        options.clock = -kDay;
        Begin(options);
    }

    static time_t ReadDate(const std::string& text)
    {
        tm parts = {};
        const char* end = strptime(text.c_str(), "%a, %d %b %Y %H:%M:%S GMT", &parts);
        return end && *end == '\0' ? timegm(&parts) : 0;
    }
    Reply Secure(const std::string& path)
    {
        const int port = store->HttpsPort();
        return SendBytes(
            port, true,
            "GET " + path + " HTTP/1.1\r\nHost: localhost:" + std::to_string(port) + "\r\nConnection: close\r\n\r\n");
    }
    Reply Titles(long long offset)
    {
        SoapRequest request = {"RealTimeBrowse", "getNavigation"};
        request.created_offset = offset;
        return Send(request);
    }
};

TEST_F(ClockTest, EveryAnswerHasItsTime)
{
    const auto check = [&](long long offset) {
        const time_t before = time(nullptr) + offset;
        const Reply replies[] = {
            Titles(offset),
            Titles(offset + 310),
            Secure("/device/env/?d=x&dt=48"),
            Plain("/device/time/"),
            Plain("/images/boxart/95/ZV0001295.jpg"),
            Plain("/nowhere"),
            Plain("/control/log"),
            SendBytes(store->ProxyPort(), false, "GET / HTTP/1.1\r\nConnection: close\r\n\r\n"),
        };
        const time_t after = time(nullptr) + offset;
        int status[std::size(replies)];
        for (size_t i = 0; i < std::size(replies); ++i) {
            status[i] = replies[i].status;
            const time_t date = ReadDate(replies[i].Header("Date"));
            EXPECT_TRUE(before <= date && date <= after) << replies[i].head;
        }
        const int wanted[] = {200, 500, 200, 200, 200, 404, 200, 400};
        EXPECT_TRUE(std::equal(std::begin(wanted), std::end(wanted), status));
        tm parts = {};
        strptime(replies[3].body.c_str(), "%m/%d/%Y %H:%M:%S", &parts);
        if (replies[3].body.substr(replies[3].body.size() - 2) == "PM" && parts.tm_hour < 12) parts.tm_hour += 12;
        const time_t served = timegm(&parts);
        EXPECT_TRUE(before <= served && served <= after) << replies[3].body;
    };
    check(-kDay);
    store->SetClock(7 * kDay + 5);
    check(7 * kDay + 5);
    EXPECT_EQ(200, Plain("/control/clock", "", "POST", "-3600").status);
    check(-3600);
    EXPECT_EQ(400, Plain("/control/clock", "", "POST", "noon").status);
    EXPECT_EQ("-3600\n", Plain("/control/clock").body);
}

TEST_F(ClockTest, DatesCanBeWrong)
{
    store->SetClock(0);
    const auto dateOf = [&](const char* fault) {
        Order(std::string("clock=") + fault);
        return Plain("/device/time/");
    };
    const time_t before = time(nullptr);
    for (const long long wrong : {-50000000LL, 4000LL}) {
        const time_t date = ReadDate(dateOf(("date:" + std::to_string(wrong)).c_str()).Header("Date"));
        EXPECT_TRUE(before + wrong <= date && date <= time(nullptr) + wrong) << date;
    }
    EXPECT_EQ(0, ReadDate(dateOf("bad-date").Header("Date")));
    EXPECT_EQ(std::string::npos, dateOf("no-date").head.find("\r\nDate:"));
    EXPECT_EQ("77", dateOf("age:77").Header("Age"));
}

TEST_F(ClockTest, CertificatesHaveTheirDates)
{
    const time_t now = time(nullptr);
    const time_t long_ago = now - 5000 * kDay;
    const struct {
        CertificateKind kind;
        CertificateDates dates;
        time_t when;
        bool valid;
    } rows[] = {
        {CertificateKind::Good, {}, now, true},
        {CertificateKind::Good, {}, long_ago, false},
        {CertificateKind::Expired, {}, now, false},
        {CertificateKind::Expired, {}, now - 15 * kDay, true},
        {CertificateKind::NotYetValid, {}, now, false},
        {CertificateKind::NotYetValid, {}, now + 15 * kDay, true},
        {CertificateKind::Good, {long_ago, 0}, now, true},
        {CertificateKind::Good, {long_ago, 0}, long_ago + 1, true},
        {CertificateKind::Good, {long_ago, long_ago + kDay}, now, false},
        {CertificateKind::Good, {long_ago, long_ago + kDay}, long_ago + kDay - 1, true},
        {CertificateKind::Good, {now + 3600, 0}, now, false},
        {CertificateKind::WrongName, {long_ago, 0}, now, false},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(&row - rows);
        store->SetCertificate(row.kind, row.dates);
        RawClient client(store->HttpsPort(), false);
        EXPECT_EQ(row.valid, client.StartTls("localhost", store->DataFolder() + "/ca.pem", row.when));
    }
}

}  // namespace
