// zv_outage PICTURE: what a million players ask of their service in an hour in which it fails for ten minutes, as they
// are and as they would without pauses. Writes the curves into the picture (SVG) and prints the table of
// docs/performance.md.
//
// Nothing is measured here. Players are simulated, one after the other: what one does has no bearing on another. Their
// pauses are the client's own (Backoff.h); the rest is a model of it, with the numbers of movies/pages.js as
// bench/evening-cost.sh counts them. Times are milliseconds. The seeds are fixed: every run gives the same numbers.
#include <math.h>
#include <stdio.h>

#include <algorithm>
#include <array>
#include <memory>
#include <numeric>
#include <random>
#include <string>
#include <thread>
#include <vector>

#include "Backoff.h"

namespace {

// ---- The hour

constexpr uint64_t kSecond = 1000;
constexpr uint64_t kMinute = 60 * kSecond;
constexpr uint64_t kWarmUp = 15 * kMinute;  // before the hour, until players are everywhere in what they do
constexpr uint64_t kEnd = kWarmUp + 60 * kMinute;
constexpr uint64_t kOutage = kWarmUp + 20 * kMinute;
constexpr uint64_t kRecovery = kOutage + 10 * kMinute;
constexpr size_t kSeconds = 3600;
constexpr size_t kOutageSecond = (kOutage - kWarmUp) / kSecond;
constexpr size_t kRecoverySecond = (kRecovery - kWarmUp) / kSecond;

constexpr unsigned int kPlayers = 1000000;
constexpr unsigned int kShards = 100;  // each with a seed of its own, so that threads change nothing

// ---- A player

constexpr double kLook = 30.0 * kSecond;  // the mean time for which a customer looks at a page
constexpr uint64_t kAnswer = 100;         // until an answer, also one that is an error
constexpr uint64_t kTick = 33;            // after which the next image is asked for
constexpr unsigned int kPages = 17;       // of a listing
constexpr unsigned int kImages = 4;       // of a page
constexpr unsigned int kAround = 4;       // pages fetched ahead in each direction
// The pages of a listing in the order in which movies/pages.js shows them; then the customer goes to another listing.
constexpr unsigned int kWalk[] = {15, 16, 17, 1, 2, 3, 4, 5, 6, 5, 4, 3, 2, 1, 17};

// How long a customer looks at a page: exponentially distributed, by a table of the quantiles.
uint64_t LookOf(uint64_t random)
{
    constexpr unsigned int kBits = 12;
    static const std::vector<uint64_t> quantiles = [] {
        std::vector<uint64_t> table(1u << kBits);
        for (size_t i = 0; i < table.size(); ++i)
            table[i] = static_cast<uint64_t>(-kLook * log1p(-(static_cast<double>(i) + 0.5) / (1u << kBits))) + 1;
        return table;
    }();
    return quantiles[random >> (64 - kBits)];
}

bool IsUp(uint64_t time)
{
    return time < kOutage || time >= kRecovery;
}

struct Behaviour {
    const char* name;
    bool pauses;
    unsigned int retryAfter;  // seconds, of the service's errors; 0: none
};

// Requests in each second of the hour.
struct Load {
    std::array<uint32_t, kSeconds> requests{};
    uint64_t failed = 0;
    uint64_t lost = 0;  // images that are not fetched ahead since they failed

    void Add(const Load& other)
    {
        for (size_t i = 0; i < kSeconds; ++i)
            requests[i] += other.requests[i];
        failed += other.failed;
        lost += other.lost;
    }
};

class Player {
public:
    Player(const Behaviour& behaviour, std::mt19937_64& random, Load& load)
        : m_Behaviour(behaviour), m_Random(random), m_Load(load)
    {}

    void Live()
    {
        m_Step = static_cast<unsigned int>(m_Random() % std::size(kWalk));
        for (uint64_t now = Look(); now < kEnd; now += Look()) {
            FetchAhead(now);
            TurnPage(now);
        }
        FetchAhead(kEnd);
    }

private:
    uint64_t Look() { return LookOf(m_Random()); }

    static uint32_t BitOf(unsigned int page) { return 1u << page; }

    // True when the service answers.
    bool Ask(uint64_t now)
    {
        const bool isUp = IsUp(now);
        if (now >= kWarmUp) ++m_Load.requests[std::min<size_t>((now - kWarmUp) / kSecond, kSeconds - 1)];
        if (!isUp) ++m_Load.failed;
        if (m_Behaviour.pauses) {
            // Without a pause an answer draws nothing.
            const uint32_t random = isUp && m_Backoff.IsOver(now) ? 0 : static_cast<uint32_t>(m_Random());
            if (isUp)
                m_Backoff.Answered(now, random);
            else
                m_Backoff.Failed(now, random, m_Behaviour.retryAfter);
        }
        return isUp;
    }

    // The customer's own call, when the page is not in the cache.
    void TurnPage(uint64_t now)
    {
        if (m_Step == std::size(kWalk)) {
            m_Step = 0;
            m_Cached = 0;
            m_Images = 0;
            m_Ahead.clear();
            m_PagesWait = false;
        }
        const unsigned int page = kWalk[m_Step];
        const bool isCached = (m_Cached & BitOf(page)) != 0;
        if (!isCached && !Ask(now)) return;  // and tries again
        m_Cached |= BitOf(page);
        m_Shown = page;
        ++m_Step;
        m_Free = std::max(m_Free, now + (isCached ? 0 : kAnswer));
        if (m_Ahead.empty()) m_PagesWait = true;
    }

    void LookAround()
    {
        m_PagesWait = false;
        for (unsigned int i = 1; i <= kAround; ++i) {
            for (const unsigned int page : {(m_Shown - 1 + i) % kPages + 1, (m_Shown - 1 + kPages - i) % kPages + 1}) {
                if ((m_Cached & BitOf(page)) == 0) m_Ahead.push_back(page);
            }
        }
        std::reverse(m_Ahead.begin(), m_Ahead.end());
    }

    void FetchAhead(uint64_t until)
    {
        while (m_Free < until && (m_PagesWait || !m_Ahead.empty() || m_Images > 0)) {
            if (!m_Backoff.IsOver(m_Free)) {
                m_PagesWait |= !m_Ahead.empty();
                m_Ahead.clear();
                m_Free = std::min(until, m_Free + m_Backoff.Remaining(m_Free));
            } else if (!m_Ahead.empty()) {
                FetchPage();
            } else if (m_PagesWait) {
                LookAround();
            } else {
                FetchImage();
            }
        }
    }

    void FetchPage()
    {
        if (Ask(m_Free)) {
            m_Cached |= BitOf(m_Ahead.back());
            m_Images += kImages;
            m_Ahead.pop_back();
        } else {
            m_Ahead.clear();
            m_PagesWait = m_Behaviour.pauses;
        }
        m_Free += kAnswer;
    }

    void FetchImage()
    {
        const bool isUp = Ask(m_Free);
        if (isUp || !m_Behaviour.pauses) --m_Images;
        if (!isUp && !m_Behaviour.pauses) ++m_Load.lost;
        m_Free += kAnswer + kTick;
    }

    const Behaviour& m_Behaviour;
    std::mt19937_64& m_Random;
    Load& m_Load;
    Backoff m_Backoff;
    unsigned int m_Step = 0;            // in kWalk: the page to be shown next
    unsigned int m_Shown = 1;           // page
    uint32_t m_Cached = 0;              // pages, as bits
    unsigned int m_Images = 0;          // that wait
    std::vector<unsigned int> m_Ahead;  // pages that are being fetched, the next one last
    bool m_PagesWait = false;           // those around the one shown are to be looked for
    uint64_t m_Free = 0;                // when the next request ahead can be made
};

Load Simulate(const Behaviour& behaviour)
{
    const unsigned int threads = std::max(1u, std::thread::hardware_concurrency());
    std::vector<Load> loads(threads);
    std::vector<std::thread> workers;
    for (unsigned int first = 0; first < threads; ++first) {
        workers.emplace_back([&, first] {
            for (unsigned int shard = first; shard < kShards; shard += threads) {
                std::mt19937_64 random(20261121 + shard);
                for (unsigned int i = 0; i < kPlayers / kShards; ++i)
                    Player(behaviour, random, loads[first]).Live();
            }
        });
    }
    for (std::thread& worker : workers)
        worker.join();
    Load sum;
    for (const Load& load : loads)
        sum.Add(load);
    return sum;
}

// ---- The table

const Behaviour kBehaviours[] = {{"Without pauses", false, 0},
                                 {"With pauses", true, 0},
                                 {"With pauses, service says `Retry-After: 120`", true, 120}};

// "1,080,739"
std::string Grouped(double number)
{
    std::string text = std::to_string(llround(number));
    for (size_t i = text.size(); i > 3; i -= 3)
        text.insert(i - 3, ",");
    return text;
}

// Of the seconds from one to before another: the load that a share of them stays below.
uint32_t Quantile(const Load& load, size_t from, size_t to, double share)
{
    std::vector<uint32_t> sorted(load.requests.begin() + from, load.requests.begin() + to);
    std::sort(sorted.begin(), sorted.end());
    return sorted[std::min(sorted.size() - 1, static_cast<size_t>(share * static_cast<double>(sorted.size())))];
}

double Mean(const Load& load, size_t from, size_t to)
{
    return std::accumulate(load.requests.begin() + from, load.requests.begin() + to, 0.0) /
           static_cast<double>(to - from);
}

void PrintTable(const std::vector<Load>& loads)
{
    constexpr size_t kAfter = kRecoverySecond + 600;
    printf(
        "| A million players | Before, mean | Outage, peak | Outage, 95 %% | After, peak | After, 95 %% | "
        "After, seconds above twice the mean before | Failed requests | Images given up |\n"
        "|---|---|---|---|---|---|---|---|---|\n");
    for (size_t i = 0; i < loads.size(); ++i) {
        const Load& load = loads[i];
        const double before = Mean(load, 0, kOutageSecond);
        const auto above = std::count_if(load.requests.begin() + kRecoverySecond, load.requests.begin() + kAfter,
                                         [&](uint32_t requests) { return requests > 2 * before; });
        printf("| %s |", kBehaviours[i].name);
        for (const double number :
             {before, double(Quantile(load, kOutageSecond, kRecoverySecond, 1)),
              double(Quantile(load, kOutageSecond, kRecoverySecond, 0.95)),
              double(Quantile(load, kRecoverySecond, kAfter, 1)), double(Quantile(load, kRecoverySecond, kAfter, 0.95)),
              double(above), double(load.failed), double(load.lost)})
            printf(" %s |", Grouped(number).c_str());
        printf("\n");
    }
}

// ---- The picture

// In pixels.
constexpr int kWidth = 960, kHeight = 420, kLeft = 92, kRight = 20, kTop = 20, kBottom = 54;
constexpr int kLegendLeft = 600, kLegendTop = 28, kLegendLine = 24;
constexpr double kMost = 1200000;  // requests a second, at the top
constexpr size_t kBin = 5;         // seconds that make a point

double X(double second)
{
    return kLeft + second / kSeconds * (kWidth - kLeft - kRight);
}

double Y(double requests)
{
    return kHeight - kBottom - requests / kMost * (kHeight - kTop - kBottom);
}

void DrawAxes(FILE* file)
{
    fprintf(file, "<rect class=\"outage\" x=\"%.1f\" y=\"%d\" width=\"%.1f\" height=\"%d\"/>\n", X(kOutageSecond), kTop,
            X(kRecoverySecond) - X(kOutageSecond), kHeight - kTop - kBottom);
    for (double requests = 0; requests <= kMost; requests += 200000) {
        fprintf(file, "<path class=\"grid\" d=\"M%d %.1fH%d\"/>\n", kLeft, Y(requests), kWidth - kRight);
        fprintf(file, "<text x=\"%d\" y=\"%.1f\" text-anchor=\"end\">%s</text>\n", kLeft - 8, Y(requests) + 5,
                Grouped(requests).c_str());
    }
    for (size_t minute = 0; minute <= 60; minute += 10) {
        const double x = X(static_cast<double>(minute) * 60);
        fprintf(file, "<path class=\"axis\" d=\"M%.1f %dv5\"/>\n", x, kHeight - kBottom);
        fprintf(file, "<text x=\"%.1f\" y=\"%d\" text-anchor=\"middle\">%zu</text>\n", x, kHeight - kBottom + 20,
                minute);
    }
    fprintf(file, "<path class=\"axis\" d=\"M%d %dH%d\"/>\n", kLeft, kHeight - kBottom, kWidth - kRight);
    fprintf(file, "<text x=\"%.1f\" y=\"%d\" text-anchor=\"middle\">time, minutes</text>\n", X(kSeconds / 2.0),
            kHeight - 12);
    fprintf(file,
            "<text transform=\"translate(16 %.1f) rotate(-90)\" text-anchor=\"middle\">requests a second</text>\n",
            Y(kMost / 2));
    fprintf(file, "<text x=\"%.1f\" y=\"%d\" text-anchor=\"middle\">the service fails</text>\n",
            X((kOutageSecond + kRecoverySecond) / 2.0), kTop + 20);
}

// And its line in the legend, with the highest second.
void DrawCurve(FILE* file, const Load& load, size_t number)
{
    fprintf(file, "<path class=\"curve c%zu\" d=\"", number);
    for (size_t second = 0; second < kSeconds; second += kBin) {
        fprintf(file, "%c%.1f %.1f", second == 0 ? 'M' : 'L', X(static_cast<double>(second) + kBin / 2.0),
                Y(Mean(load, second, second + kBin)));
    }
    const int y = kLegendTop + kLegendLine * static_cast<int>(number + 1) - 6;
    std::string name = kBehaviours[number].name;
    name.erase(std::remove(name.begin(), name.end(), '`'), name.end());
    fprintf(file, "\"/>\n<path class=\"curve c%zu\" d=\"M%d %dh28\"/>\n<text x=\"%d\" y=\"%d\">%s</text>\n", number,
            kLegendLeft, y - 5, kLegendLeft + 38, y, name.c_str());
}

// On a ground of its own: the page around it may be of the other kind.
const char kStyle[] = R"(<style>
text { font: 14px sans-serif; fill: #24292f }
.ground { fill: #ffffff }
.outage { fill: #d0d7de; opacity: 0.5 }
.grid { stroke: #d0d7de }
.axis { stroke: #57606a }
.grid, .axis, .curve { fill: none }
.curve { stroke-width: 2; stroke-linejoin: round }
.c0 { stroke: #cf222e }
.c1 { stroke: #0969da }
.c2 { stroke: #1a7f37; stroke-dasharray: 5 3 }
@media (prefers-color-scheme: dark) {
text { fill: #e6edf3 }
.ground { fill: #0d1117 }
.outage { fill: #30363d; opacity: 0.7 }
.grid { stroke: #30363d }
.axis { stroke: #8b949e }
.c0 { stroke: #ff7b72 }
.c1 { stroke: #58a6ff }
.c2 { stroke: #3fb950 }
}
</style>
)";

void Draw(FILE* file, const std::vector<Load>& loads)
{
    fprintf(file,
            "<svg xmlns=\"http://www.w3.org/2000/svg\" viewBox=\"0 0 %d %d\" width=\"%d\" height=\"%d\" role=\"img\">\n"
            "<title>Requests a second of a million players around an outage</title>\n%s"
            "<rect class=\"ground\" width=\"%d\" height=\"%d\" rx=\"6\"/>\n",
            kWidth, kHeight, kWidth, kHeight, kStyle, kWidth, kHeight);
    DrawAxes(file);
    fprintf(file, "<rect class=\"ground\" x=\"%d\" y=\"%d\" width=\"%d\" height=\"%zu\"/>\n", kLegendLeft - 8,
            kLegendTop, kWidth - kRight - kLegendLeft + 8, kLegendLine * loads.size() + 6);
    for (size_t i = 0; i < loads.size(); ++i)
        DrawCurve(file, loads[i], i);
    fprintf(file, "</svg>\n");
}

}  // namespace

int main(int argc, char** argv)
{
    FILE* const picture = argc == 2 ? fopen(argv[1], "w") : nullptr;
    if (!picture) {
        fprintf(stderr, "zv_outage: name a file for the picture that can be written\n");
        return 1;
    }
    std::vector<Load> loads;
    for (const Behaviour& behaviour : kBehaviours)
        loads.push_back(Simulate(behaviour));
    PrintTable(loads);
    Draw(picture, loads);
    if (fclose(picture) == 0) return 0;
    perror(argv[1]);
    return 1;
}
