// What the measurements share: one storefront for the process, and sessions with it.
#pragma once

#include <benchmark/benchmark.h>

#include <string>

#include "Storefront.h"
#include "ZVWSLib.h"

/// The page that is asked for everywhere: twenty titles.
constexpr unsigned int kItems = 20;
ZV_WS_Pagination FirstPage();

/// Started at first use; stays until the process ends.
Storefront& TheStore();

/// Exits with a line on the error stream when it does not hold: a measurement of something that failed is worthless.
void Check(bool holds, const char* what);

/// Runs the client's process with the movie, which must end well; the seconds until it wrote a line that ends in the
/// text.
double RunClient(const char* movie, const char* text);

class BenchSession {
public:
    /// `cacheFolder`: of a file cache for `kinds` of answers; null for none.
    explicit BenchSession(const char* cacheFolder = nullptr, unsigned int kinds = ZV_WS_CacheParam::CacheData_Metadata);
    ~BenchSession() { ZV_WS_release(&m_Handle); }
    BenchSession(const BenchSession&) = delete;
    BenchSession& operator=(const BenchSession&) = delete;

    ZV_WS_Session* handle() { return &m_Handle; }
    void GetTitles();

private:
    ZV_WS_Session m_Handle;
};

class TemporaryFolder {
public:
    TemporaryFolder();
    ~TemporaryFolder();
    TemporaryFolder(const TemporaryFolder&) = delete;
    TemporaryFolder& operator=(const TemporaryFolder&) = delete;

    const char* Path() const { return m_Path; }

private:
    char m_Path[32] = "/tmp/zvbenchXXXXXX";
};
