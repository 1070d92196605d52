// What the sessions of one movie instance cost before their first call, against reading the certificate authorities.
#include <openssl/ssl.h>
#include <stdlib.h>

#include <chrono>
#include <fstream>
#include <sstream>

#include "Store.h"

namespace {

using Clock = std::chrono::steady_clock;

const char kSystemBundle[] = "/etc/ssl/certs/ca-certificates.crt";

std::string TextOf(const std::string& file)
{
    std::ostringstream text;
    text << std::ifstream(file).rdbuf();
    return text.str();
}

// A device's bundle: the system's authorities, and the store's. Each is a new file, which the process has not read yet.
std::string NewBundle(const TemporaryFolder& folder)
{
    static int s_count = 0;
    std::string name = folder.Path() + std::string("/ca") + std::to_string(++s_count) + ".pem";
    std::ofstream(name) << TextOf(kSystemBundle) << TextOf(TheStore().DataFolder() + "/ca.pem");
    return name;
}

void LoadAuthorities(benchmark::State& state)
{
    const TemporaryFolder folder;
    const std::string bundle = NewBundle(folder);
    while (state.KeepRunning()) {
        X509_STORE* authorities = X509_STORE_new();
        Check(X509_STORE_load_file(authorities, bundle.c_str()) == 1, "the system's authorities");
        X509_STORE_free(authorities);
    }
}

// The first set-up of a process, and the three sessions that fetch ahead.
void FourSessions(benchmark::State& state)
{
    const TemporaryFolder folder;
    const std::string deployment = folder.Path() + std::string("/deployment.conf");
    while (state.KeepRunning()) {
        std::ofstream(deployment) << TextOf(TheStore().DeploymentFile()) << "ca_file = " << NewBundle(folder) << "\n";
        setenv("ZV_DEPLOYMENT", deployment.c_str(), 1);
        const Clock::time_point start = Clock::now();
        BenchSession session;
        ZV_WS_Session copies[3];
        for (ZV_WS_Session& copy : copies)
            Check(ZV_WS_duplicate(&copy, session.handle()) == ZV_WS_Status_ok, "ZV_WS_duplicate");
        state.SetIterationTime(std::chrono::duration<double>(Clock::now() - start).count());
        for (ZV_WS_Session& copy : copies)
            ZV_WS_release(&copy);
    }
    setenv("ZV_DEPLOYMENT", TheStore().DeploymentFile().c_str(), 1);
}

}  // namespace

BENCHMARK(LoadAuthorities)->Name("setup/authorities");
BENCHMARK(FourSessions)->Name("setup/sessions")->UseManualTime()->Iterations(3);
