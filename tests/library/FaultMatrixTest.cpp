// Every fault of a connection or an answer.
#include "FaultMatrix.h"

#include <fstream>

#include "Process.h"
#include "TempFolder.h"

namespace {

const struct {
    const char* fault;
    int statuses[5];  // by column
} kRows[] = {
    // clang-format off
    //                    SOAP   discovery    clock    bandwidth  box art
    {"http:302",        {-4302,  kProduction, -1001,   -1001,     -1001}},
    {"http:404",        {-4404,  kProduction, -1001,   -1901,     -1901}},
    {"http:503",        {-4503,  kProduction, -1001,   -1001,     -1001}},
    {"cut",             {-2012,  kProduction, -1001,   -1001,     -1001}},
    {"cut-header",      {kFails, kProduction, -1001,   -1001,     -1001}},
    {"cut-body",        {kFails, kProduction, -1004,   0,         -1001}},  // bandwidth: half is enough to measure
    {"reset",           {-2012,  kProduction, -1001,   -1001,     -1001}},
    {"no-http",         {-2012,  kProduction, -1001,   -1001,     -1001}},
    {"garbage",         {-4200,  kProduction, -1004,   0,         0}},      // bytes are bytes
    {"empty",           {-4200,  kProduction, -1001,   -1001,     -1001}},
    {"zero-length",     {-4200,  kProduction, -1001,   -1001,     -1001}},
    {"no-length",       {0,      kProduction, -1001,   -1001,     -1001}},
    {"short",           {0,      kProduction, -1004,   0,         -1001}},
    {"long",            {0,      0,           0,       0,         0}},
    {"split",           {0,      kCannot,     kCannot, 0,         0}},      // one receive takes one part or both
    {"endless",         {kFails, kProduction, -1001,   -1001,     -1001}},
    {"bomb:8",          {kFails, kProduction, -1004,   0,         0}},
    {"damaged-gzip",    {kFails, kProduction, -1004,   0,         0}},
    {"wrong-checksum",  {kFails, kProduction, -1004,   0,         0}},
    {"stall",           {-2012,  kProduction, -1001,   -1001,     -1001}},
    {"stall-body",      {kFails, kProduction, -1004,   0,         -1001}},
    {"drip:100",        {kFails, kProduction, -1001,   -1001,     -1001}},
    {"fault11",         {-6012,  kCannot,     kCannot, kCannot,   kCannot}},
    {"fault12",         {-6012,  kCannot,     kCannot, kCannot,   kCannot}},
    {"soap12",          {0,      kCannot,     kCannot, kCannot,   kCannot}},
    {"code:3",          {-1004,  kCannot,     kCannot, kCannot,   kCannot}},
    {"missing-result",  {-1004,  kCannot,     kCannot, kCannot,   kCannot}},
    {"unknown-enum",    {-1004,  kCannot,     kCannot, kCannot,   kCannot}},
    {"must-understand", {-6008,  kCannot,     kCannot, kCannot,   kCannot}},
    {"extra-header",    {0,      kCannot,     kCannot, kCannot,   kCannot}},
    {"prefixes",        {0,      kCannot,     kCannot, kCannot,   kCannot}},  // as other toolkits write
    {"nil",             {0,      kCannot,     kCannot, kCannot,   kCannot}},
    {"latin1",          {0,      kCannot,     kCannot, kCannot,   kCannot}},
    {"bom",             {0,      kCannot,     kCannot, kCannot,   kCannot}},
    {"xsi-types",       {0,      kCannot,     kCannot, kCannot,   kCannot}},
    {"cdata",           {0,      kCannot,     kCannot, kCannot,   kCannot}},
    {"text",            {0,      kCannot,     kCannot, kCannot,   kCannot}},
    {"boolean",         {0,      kCannot,     kCannot, kCannot,   kCannot}},
    {"enum",            {-1004,  kCannot,     kCannot, kCannot,   kCannot}},
    {"stray",           {0,      0,           0,       0,         0}},
    {"connection-close", {0,     0,           0,       0,         0}},
    {"http10",          {0,      kProduction, -1001,   -1001,     -1001}},  // their forms are fixed
    {"continue",        {0,      kCannot,     -1004,   0,         0}},
    {"chunked:7",       {0,      kProduction, -1001,   -1001,     -1001}},
    {"headers:64",      {0,      kProduction, -1001,   -1001,     -1001}},
    {"endless-header",  {kFails, kProduction, -1001,   -1001,     -1001}},
    {"stall-header",    {kFails, kProduction, -1001,   -1001,     -1001}},
    {"not-modified",    {kCannot, kCannot,    kCannot, kCannot,   -1902}},
    {"modified",        {kCannot, kCannot,    kCannot, kCannot,   0}},
    // clang-format on
};

TEST_P(FaultMatrix, OfAnswers)
{
    const Kind& kind = GetParam();
    for (const auto& row : kRows) {
        if (row.statuses[kind.column] == kCannot) continue;
        SCOPED_TRACE(row.fault);
        // Twice: a read is sent again when a kept connection turns out dead.
        Fault(std::string(kind.operation) + "=" + row.fault + ",count=2");
        ExpectOutcome(row.statuses[kind.column]);
    }
}

TEST_P(FaultMatrix, OfConnections)
{
    const Kind& kind = GetParam();
    if (IsTls(kind)) {
        const int refused = kind.column == kDiscovery ? -1001 : -5030;
        for (const char* fault : {"stall", "stall-handshake", "close", "no-http", "reset"}) {
            SCOPED_TRACE(fault);
            ReconnectNext();
            Fault(std::string("connect=") + fault);
            ExpectOutcome(strcmp(fault, "reset") == 0 ? kFails : refused);
        }
        for (const CertificateKind certificate :
             {CertificateKind::Untrusted, CertificateKind::Expired, CertificateKind::WrongName,
              CertificateKind::WideWildcard, CertificateKind::NameOnly}) {
            SCOPED_TRACE(static_cast<int>(certificate));
            ReconnectNext();
            store->SetCertificate(certificate);
            store->ClearLog();
            EXPECT_EQ(refused, kind.call(session, ++m_Row).status);
            EXPECT_TRUE(store->Log().empty());
            store->SetCertificate(CertificateKind::Good);
            ExpectCached(false);
        }
    }
    ReconnectNext();
    store.reset();
    const Outcome outcome = kind.call(session, ++m_Row);
    EXPECT_EQ(kind.column == kDiscovery ? -1001 : -2011, outcome.status);
    EXPECT_TRUE(outcome.isEmpty);
}

// Sanitizers keep what is freed, and shadows of all.
#ifndef ZV_SANITIZED

long KilobytesOf(const char* name)
{
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind(name, 0) == 0) return atol(line.c_str() + strlen(name));
    }
    return -1;
}

// The store is another process here, since it makes what is too large.
class HugeAnswers : public FaultMatrix {
protected:
    void SetUp() override
    {
        m_Store = std::make_unique<Process>(Faults(), Environment());
        ASSERT_TRUE(m_Store->WaitForLine("ready"));
        setenv("ZV_DEPLOYMENT", (m_Folder / "deployment.conf").c_str(), 1);
        ASSERT_NO_FATAL_FAILURE(Begin(m_Folder / "cache"));
    }

    Lines Faults() const
    {
        Lines arguments = {ZV_STOREFRONT, "--data", m_Folder / ""};
        for (const char* fault : {"=ok", "=bomb:64", "=endless"})
            arguments = arguments + Lines{"--fault", std::string(GetParam().operation) + fault};
        return arguments + Lines{"--environment", std::to_string(kEnvironment)};
    }

    TempFolder m_Folder;
    std::unique_ptr<Process> m_Store;
};

TEST_P(HugeAnswers, TakeLittleMemory)
{
    for (int n = 10; n < 13; ++n) {
        std::ofstream("/proc/self/clear_refs") << 5;  // starts the peak anew
        const long before = KilobytesOf("VmRSS:");
        GetParam().call(session, n);
        EXPECT_LT(KilobytesOf("VmHWM:") - before, 32 << 10) << n;
    }
    EXPECT_EQ(0, GetParam().call(session, 12).status);
}

INSTANTIATE_TEST_SUITE_P(Kinds, HugeAnswers, testing::ValuesIn(kKinds),
                         [](const auto& info) { return std::string(info.param.name); });

#endif

INSTANTIATE_TEST_SUITE_P(Kinds, FaultMatrix, testing::ValuesIn(kKinds),
                         [](const auto& info) { return std::string(info.param.name); });

}  // namespace
