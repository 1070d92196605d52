// The pauses of a player whose service fails, and of many players, with a clock and a fixed source of random numbers.
#include "Backoff.h"

#include <gtest/gtest.h>

#include <random>
#include <vector>

namespace {

constexpr uint64_t kSecond = 1000, kMinute = 60 * kSecond;
constexpr uint32_t kMost = 0xffffffff;  // draws the longest pause

// Fails as soon as a pause is over; the last pause's length.
uint64_t FailTimes(Backoff& backoff, uint64_t& now, int times, uint32_t random = kMost)
{
    uint64_t pause = 0;
    for (int i = 0; i < times; ++i) {
        now += pause;
        backoff.Failed(now, random);
        pause = backoff.Remaining(now);
    }
    return pause;
}

TEST(Backoff, PausesDoubleUpToTheLongest)
{
    Backoff backoff;
    uint64_t now = 5 * kMinute;
    EXPECT_TRUE(backoff.IsOver(now));
    for (const uint64_t seconds : {30, 60, 120, 240, 480, 900, 900}) {
        backoff.Failed(now, kMost);
        EXPECT_EQ(seconds * kSecond, backoff.Remaining(now));
        now += seconds * kSecond - 1;
        EXPECT_FALSE(backoff.IsOver(now));
        EXPECT_TRUE(backoff.IsOver(++now));
    }
    FailTimes(backoff, now, 1000);
    EXPECT_EQ(Backoff::kCap, backoff.Remaining(now));
}

// A hundred thousand players that fail in the same moment: in each twentieth of the time as many return as an even
// spread brings, within 8 %, more than five times the deviation that chance makes.
TEST(Backoff, PlayersReturnEvenlySpread)
{
    constexpr int kPlayers = 100000, kParts = 20;
    std::mt19937 random(20261121);
    for (const int failures : {1, 3, 9}) {
        Backoff longest;
        uint64_t start = 0;
        const uint64_t window = FailTimes(longest, start, failures);
        std::vector<int> returning(kParts);
        double sum = 0;
        for (int player = 0; player < kPlayers; ++player) {
            Backoff backoff;
            uint64_t now = 0;
            FailTimes(backoff, now, failures - 1);
            const uint64_t pause = FailTimes(backoff, now = start, 1, random());
            ASSERT_LE(pause, window);
            ++returning[pause * kParts / (window + 1)];
            sum += static_cast<double>(pause);
        }
        EXPECT_NEAR(static_cast<double>(window) / 2, sum / kPlayers, static_cast<double>(window) / 200);
        for (const int count : returning)
            EXPECT_NEAR(kPlayers / kParts, count, 0.08 * kPlayers / kParts);
    }
}

TEST(Backoff, ARetryAfterComesFirst)
{
    Backoff backoff;
    backoff.Failed(0, 0, 120);
    EXPECT_EQ(120 * kSecond, backoff.Remaining(0));
    uint64_t now = 120 * kSecond;
    backoff.Failed(now, kMost, 7);
    EXPECT_EQ(67 * kSecond, backoff.Remaining(now));
    backoff.Failed(now += 67 * kSecond, kMost, 300);
    EXPECT_EQ(10 * kMinute, backoff.Remaining(now)) << "what all are told is spread over as long";
    backoff.Failed(now += 10 * kMinute, kMost, 4000000000u);
    EXPECT_EQ(24 * 60 * kMinute + Backoff::kCap, backoff.Remaining(now));
}

TEST(Backoff, AFailureInAPauseOnlyLengthensItToItsRetryAfter)
{
    Backoff backoff;
    backoff.Failed(0, kMost);
    for (int i = 0; i < 9; ++i)
        backoff.Failed(kSecond, kMost);
    EXPECT_EQ(29 * kSecond, backoff.Remaining(kSecond));
    backoff.Failed(kSecond, 0, 10);
    EXPECT_EQ(29 * kSecond, backoff.Remaining(kSecond));
    backoff.Failed(kSecond, 0, 60);
    EXPECT_EQ(60 * kSecond, backoff.Remaining(kSecond));
    backoff.Failed(61 * kSecond, kMost);
    EXPECT_EQ(kMinute, backoff.Remaining(61 * kSecond)) << "the second";
}

TEST(Backoff, AnAnswerBringsTheEndForwardOnce)
{
    Backoff backoff;
    uint64_t now = 0;
    FailTimes(backoff, now, 6);
    backoff.Answered(now, kMost);
    EXPECT_EQ(Backoff::kReturn, backoff.Remaining(now));
    backoff.Answered(now, 0);
    EXPECT_EQ(Backoff::kReturn, backoff.Remaining(now));
    now += Backoff::kReturn;
    backoff.Failed(now, kMost);
    backoff.Answered(now, kMost / 2);
    EXPECT_NEAR(Backoff::kReturn / 2, backoff.Remaining(now), 1);
    backoff.Failed(now += Backoff::kReturn, 0, 600);
    backoff.Answered(now, 0);
    EXPECT_EQ(10 * kMinute, backoff.Remaining(now)) << "not before what the service asked for";
}

TEST(Backoff, AnswersInARowMakePausesShortAgain)
{
    Backoff backoff;
    uint64_t now = 0;
    FailTimes(backoff, now, 3);
    now += 2 * kMinute;
    for (unsigned int i = 0; i < Backoff::kAnswersToRecover - 1; ++i)
        backoff.Answered(now, 0);
    EXPECT_EQ(4 * kMinute, FailTimes(backoff, now, 1));
    now += 4 * kMinute;
    backoff.Answered(now, 0);
    EXPECT_EQ(8 * kMinute, FailTimes(backoff, now, 1)) << "not in a row";
    now += 8 * kMinute;
    for (unsigned int i = 0; i < Backoff::kAnswersToRecover; ++i)
        backoff.Answered(now, 0);
    EXPECT_EQ(30 * kSecond, FailTimes(backoff, now, 1));
}

}  // namespace
