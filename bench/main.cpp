// zv_bench: runs the measurements and writes one table of them, with what each is compared with, to standard output.
// Options are those of the benchmark library.
#include <benchmark/benchmark.h>
#include <curl/curl.h>
#include <libxml/xmlversion.h>
#include <openssl/crypto.h>
#include <sqlite3.h>
#include <stdio.h>
#include <stdlib.h>
#include <stdsoap2.h>
#include <string.h>
#include <sys/utsname.h>
#include <time.h>
#include <unistd.h>
#include <pugixml.hpp>

#include <algorithm>
#include <fstream>
#include <map>
#include <string>
#include <thread>
#include <vector>

namespace {

struct Times {
    double real = 0;  // microseconds
    double cpu = 0;   // of the measuring thread
};

double Median(std::vector<double> values)
{
    std::sort(values.begin(), values.end());
    return values[values.size() / 2];
}

// Keeps every repetition; progress goes to the error stream.
class Keeper : public benchmark::BenchmarkReporter {
public:
    bool ReportContext(const Context&) override { return true; }
    void ReportRuns(const std::vector<Run>& runs) override
    {
        for (const Run& run : runs) {
            if (run.run_type != Run::RT_Iteration) continue;
            const double microseconds = 1e6 / benchmark::GetTimeUnitMultiplier(run.time_unit);
            m_Real[run.run_name.function_name].push_back(run.GetAdjustedRealTime() * microseconds);
            m_Cpu[run.run_name.function_name].push_back(run.GetAdjustedCPUTime() * microseconds);
            fprintf(stderr, "%s\n", run.benchmark_name().c_str());
        }
    }

    // The medians; of "a+b" their sum; "=N" is N microseconds. False when one was not measured.
    bool Find(const std::string& names, Times& times) const
    {
        times = Times();
        if (names[0] == '=') times.real = strtod(names.c_str() + 1, nullptr);
        for (size_t at = names[0] == '=' ? names.size() : 0; at < names.size();) {
            const size_t end = std::min(names.find('+', at), names.size());
            const std::string name = names.substr(at, end - at);
            at = end + 1;
            const auto found = m_Real.find(name);
            if (found == m_Real.end()) return false;
            times.real += Median(found->second);
            times.cpu += Median(m_Cpu.at(name));
        }
        return true;
    }

private:
    std::map<std::string, std::vector<double>> m_Real;
    std::map<std::string, std::vector<double>> m_Cpu;
};

const struct {
    const char* what;
    const char* measured;
    const char* floorName;
    const char* floor;
    double goal;     // 0: none
    bool hasThread;  // the measuring thread does the work
} kRows[] = {
    {"Warm `ZV_WS_getTitles`, 20 titles", "warm/library", "bare SOAP toolkit, connection kept", "warm/toolkit", 1.3,
     true},
    {"Warm `ZV_WS_getTitles`, 20 titles", "warm/library", "libcurl with libxml2, connection kept", "warm/curl", 1.2,
     true},
    {"Warm `ZV_WS_getTitles`, 20 titles", "warm/library", "libcurl with pugixml, connection kept", "warm/curl-pugixml",
     0, true},
    {"Bare SOAP toolkit, connection kept", "warm/toolkit", "libcurl with libxml2, connection kept", "warm/curl", 0,
     true},
    {"The simulator's page of 20 titles, unread", "simulator/page", "its answer of one text, unread", "simulator/text",
     0, false},
    {"Cached `ZV_WS_getTitles`, 20 titles", "cached/library", "open, select, close + inflate + parse + convert",
     "cached/database+cached/inflate+cached/parse+cached/convert", 1.3, true},
    {"of which open, select, close", "cached/database", "the cached call", "cached/library", 0, true},
    {"of which inflate", "cached/inflate", "the cached call", "cached/library", 0, true},
    {"of which parse", "cached/parse", "the cached call", "cached/library", 0, true},
    {"of which convert and release", "cached/convert", "the cached call", "cached/library", 0, true},
    {"Store in a cache of 500 pages", "store/full", "store in a cache of one page", "store/first", 0, true},
    {"Box art to memory, a connection each", "boxart/library", "libcurl, a connection each", "boxart/curl", 0, true},
    {"Box art to memory, a connection each", "boxart/library", "libcurl, connection kept", "boxart/curl-kept", 0, true},
    {"Set-up of a session, and three duplicates", "setup/sessions", "two loads of the authorities",
     "setup/authorities+setup/authorities", 1, false},
    {"Tick while box art is fetched, median", "tick/median", "the limit", "=1000", 1, false},
    {"Tick while box art is fetched, longest", "tick/longest", "the limit", "=1000", 1, false},
    {"First page from process start", "start/page", "process start alone", "start/nothing", 0, false},
    {"New session and its first page", "start/session", "warm `ZV_WS_getTitles`", "warm/library", 0, true},
    {"The same with a cache, the service 100 ms away", "start/far", "a way there and back", "=200000", 4.5, false},
};

std::string Processor()
{
    std::ifstream file("/proc/cpuinfo");
    for (std::string line; std::getline(file, line);) {
        if (line.compare(0, 10, "model name") == 0) return line.substr(line.find(':') + 2);
    }
    return "unknown processor";
}

void PrintMachine()
{
    utsname system = {};
    uname(&system);
    char date[32];
    const time_t now = time(nullptr);
    tm parts;
    strftime(date, sizeof date, "%Y-%m-%d", gmtime_r(&now, &parts));
    double load[1] = {0};
    if (getloadavg(load, 1) != 1) load[0] = -1;
    printf("Measured %s on %s, %u cores, %s %s, load average %.1f at the end.\n", date, Processor().c_str(),
           std::thread::hardware_concurrency(), system.sysname, system.machine, load[0]);
    printf(
        "Compiler %s; gSOAP %s, %s, SQLite %s, zlib %s, libcurl %s, libxml2 %s, "
        "pugixml %d.%d.\n\n",
        __VERSION__, GSOAP_RELEASE, OpenSSL_version(OPENSSL_VERSION), sqlite3_libversion(), zlibVersion(),
        curl_version_info(CURLVERSION_NOW)->version, LIBXML_DOTTED_VERSION, PUGIXML_VERSION / 1000,
        PUGIXML_VERSION / 10 % 100);
}

void PrintTable(const Keeper& keeper)
{
    printf(
        "| What | Time, us | Against | Time, us | Ratio | Ratio of CPU time | Goal |\n|---|---|---|---|---|---|---|\n");
    for (const auto& row : kRows) {
        Times measured, floor;
        if (!keeper.Find(row.measured, measured) || !keeper.Find(row.floor, floor)) continue;
        char goal[16] = "", cpu[16] = "";
        if (row.goal > 0) snprintf(goal, sizeof goal, "%.1f", row.goal);
        if (row.hasThread) snprintf(cpu, sizeof cpu, "%.2f", measured.cpu / floor.cpu);
        printf("| %s | %.0f | %s | %.0f | %.2f | %s | %s |\n", row.what, measured.real, row.floorName, floor.real,
               measured.real / floor.real, cpu, goal);
    }
}

}  // namespace

int main(int argc, char** argv)
{
    // The client prints its endpoints to standard output, which is the table's.
    const int table = dup(STDOUT_FILENO);
    dup2(STDERR_FILENO, STDOUT_FILENO);
    curl_global_init(CURL_GLOBAL_DEFAULT);
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
    Keeper keeper;
    benchmark::RunSpecifiedBenchmarks(&keeper);
    fflush(stdout);
    dup2(table, STDOUT_FILENO);
    PrintMachine();
    PrintTable(keeper);
    return 0;
}
