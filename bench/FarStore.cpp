// A service 100 ms away: how often the client waits for it until it has its first page, as a time that the way there
// and back divides.
#include "DelayLine.h"
#include "NameServer.h"
#include "Store.h"

namespace {

constexpr int kOneWay = 100;  // milliseconds
constexpr char kName[] = "api.zorvane.example";

// The store by a name, at the far end of the line.
class FarStore {
public:
    FarStore() : m_Line("127.0.0.2", TheStore().HttpsPort(), kOneWay)
    {
        setenv("ZV_DEPLOYMENT", NamedDeployment(TheStore().DeploymentFile(), kName, m_Folder).c_str(), 1);
    }
    ~FarStore() { setenv("ZV_DEPLOYMENT", TheStore().DeploymentFile().c_str(), 1); }
    FarStore(const FarStore&) = delete;
    FarStore& operator=(const FarStore&) = delete;

private:
    TempFolder m_Folder;
    DelayLine m_Line;
};

void FirstPageFromAfar(benchmark::State& state)
{
    const FarStore store;
    const TemporaryFolder cache;
    while (state.KeepRunning()) {
        NameServer names;
        names.Add(kName, NameServer::A, {"127.0.0.2"});
        BenchSession(cache.Path()).GetTitles();
        Check(names.Asked(kName) == 2, "one lookup, a question for each family");
    }
}

}  // namespace

BENCHMARK(FirstPageFromAfar)->Name("start/far")->Iterations(1);
