// The device's own address, on networks that the tests make for themselves, and what asks nobody for it.
#include "LocalAddress.h"

#include <arpa/inet.h>
#include <net/if.h>
#include <net/route.h>
#include <sched.h>
#include <stdio.h>
#include <sys/ioctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <fstream>
#include <regex>

#include "NameServer.h"
#include "SessionImpl.h"
#include "Store.h"
#include "TempFolder.h"

namespace {

constexpr int kNoNetwork = 77;

// The network of a process of its own, which has nothing but a loopback device that is down. What is added to that
// device are addresses like those of any other.
class Network {
public:
    bool Add(const char* device, const char* address, const char* mask)
    {
        ifreq request = {};
        snprintf(request.ifr_name, sizeof request.ifr_name, "%s", device);
        return Set(request.ifr_addr, address) && ioctl(m_Socket, SIOCSIFADDR, &request) == 0 &&
               Set(request.ifr_netmask, mask) && ioctl(m_Socket, SIOCSIFNETMASK, &request) == 0 &&
               ioctl(m_Socket, SIOCGIFFLAGS, &request) == 0 && (request.ifr_flags |= IFF_UP) != 0 &&
               ioctl(m_Socket, SIOCSIFFLAGS, &request) == 0;
    }

    bool AddDefaultRoute()
    {
        static char device[] = "lo";
        rtentry route = {};
        route.rt_dev = device;
        route.rt_flags = RTF_UP;
        return Set(route.rt_dst, "0.0.0.0") && Set(route.rt_genmask, "0.0.0.0") &&
               ioctl(m_Socket, SIOCADDRT, &route) == 0;
    }

    // The kernel may take a moment until the address can be used.
    bool AddSix(const char* address)
    {
        struct {  // in6_ifreq, whose header does not go with the others
            in6_addr address;
            uint32_t prefixLength;
            int device;
        } request = {{}, 64, static_cast<int>(if_nametoindex("lo"))};
        const int six = socket(AF_INET6, SOCK_DGRAM, 0);
        sockaddr_in6 own = {};
        own.sin6_family = AF_INET6;
        inet_pton(AF_INET6, address, &own.sin6_addr);
        request.address = own.sin6_addr;
        const bool added = ioctl(six, SIOCSIFADDR, &request) == 0;
        bool isUsable = false;
        for (int patience = 5000; added && !isUsable && patience > 0; --patience) {
            isUsable = bind(six, reinterpret_cast<const sockaddr*>(&own), sizeof own) == 0;
            if (!isUsable) usleep(1000);
        }
        close(six);
        return isUsable;
    }

private:
    static bool Set(sockaddr& to, const char* address)
    {
        to.sa_family = AF_INET;
        return inet_pton(AF_INET, address, &reinterpret_cast<sockaddr_in&>(to).sin_addr) == 1;
    }

    const int m_Socket = socket(AF_INET, SOCK_DGRAM, 0);  // configures the network in which it was made
};

std::string Towards(std::initializer_list<const char*> peers)
{
    std::vector<Address> addresses;
    for (const char* peer : peers)
        addresses.push_back(NameLookup::Known(peer, 443).at(0));
    return LocalAddressTowards(addresses).c_str();
}

// Ends the process with the number of the expectation that was not met, which stands on the error stream; 0: none.
int LookAround()
{
    if (unshare(CLONE_NEWUSER | CLONE_NEWNET) != 0 && unshare(CLONE_NEWNET) != 0) return kNoNetwork;
    Network network;
    int failures = 0;
    const auto expect = [&](const char* what, const std::string& expected, const std::string& got) {
        if (expected == got) return;
        fprintf(stderr, "%s: \"%s\" expected, not \"%s\"\n", what, expected.c_str(), got.c_str());
        ++failures;
    };
    expect("no device", "", Towards({"127.0.0.1", "10.9.8.1", "fd00:9::1"}));
    if (!network.Add("lo", "127.0.0.1", "255.0.0.0")) return kNoNetwork;
    expect("loopback alone", "", Towards({"127.0.0.1", "::1", "10.9.8.1"}));
    if (!network.Add("lo:1", "10.9.8.7", "255.255.255.0")) return kNoNetwork;
    expect("a neighbour", "10.9.8.7", Towards({"10.9.8.1"}));
    expect("a service on this device, then a neighbour", "10.9.8.7", Towards({"127.0.0.1", "10.9.8.1"}));
    expect("no way there", "", Towards({"10.1.1.1"}));
    expect("nothing known, no default route", "", Towards({}));
    if (!network.AddDefaultRoute()) return kNoNetwork;
    expect("nothing known", "10.9.8.7", Towards({}));
    expect("a service on this device", "10.9.8.7", Towards({"127.0.0.1"}));
    if (!network.AddSix("fd00:9::7")) return kNoNetwork;
    expect("an IPv6 neighbour", "fd00:9::7", Towards({"fd00:9::1"}));
    expect("a mapped one", "10.9.8.7", Towards({"::ffff:10.9.8.1"}));
    expect("a mapped loopback, then IPv6", "fd00:9::7", Towards({"::ffff:127.0.0.1", "fd00:9::1"}));
    return failures;
}

TEST(LocalAddress, LeadsToThePeerAndIsNeverLoopback)
{
    const pid_t child = fork();
    if (child == 0) _exit(LookAround());
    int status = 0;
    ASSERT_EQ(child, waitpid(child, &status, 0));
    ASSERT_TRUE(WIFEXITED(status));
    if (WEXITSTATUS(status) == kNoNetwork) GTEST_SKIP() << "this user can make no network";
    EXPECT_EQ(0, WEXITSTATUS(status));
}

class LocalAddressCall : public Store {
protected:
    // Set up without a single request to the service, which is called "store.test".
    ZV_WS_Status InitializeUnasked()
    {
        const std::regex host("production_host = [^:\n]*");
        std::ofstream(folder / "deployment")
            << std::regex_replace(ContentOf(store->DeploymentFile()), host, "production_host = store.test");
        setenv("ZV_DEPLOYMENT", (folder / "deployment").c_str(), 1);
        ZV_WS_SetupParams setup = Setup();
        setup.EnvNum = ENVNUM_PRODUCTION;
        return Initialize(setup);
    }

    const TempFolder folder;
};

// Whatever the machine has: an address that is not loopback, or word that it has none.
TEST_F(LocalAddressCall, AsksNobodyAndWaitsForNobody)
{
    const NameServer server(NameServer::Fault::Silent);
    ASSERT_EQ(ZV_WS_Status_ok, InitializeUnasked());
    Owned<ZV_WS_String> address;
    const auto started = std::chrono::steady_clock::now();
    const ZV_WS_Status status = ZV_WS_getLocalIPAddr(&session, &address);
    EXPECT_LT(std::chrono::steady_clock::now() - started, std::chrono::seconds(1));
    EXPECT_EQ(0, server.Asked("store.test"));
    EXPECT_EQ(0u, store->Log().size());
    const std::string expected = LocalAddressTowards({}).c_str();
    EXPECT_EQ(expected.empty() ? ZV_WS_Status_net_error : ZV_WS_Status_ok, status);
    EXPECT_EQ(expected, address.data ? address.data : "");
}

TEST_F(LocalAddressCall, KnowsTheServiceFromItsNameAndFromTheConnection)
{
    NameServer server;
    server.Add("store.test", NameServer::A, {"127.0.0.1"});
    ASSERT_EQ(ZV_WS_Status_ok, InitializeUnasked());
    EXPECT_EQ(0u, NameLookup::Known("store.test", 443).size());
    Owned<ZV_WS_GenreArray> genres;
    EXPECT_EQ(-5030, ZV_WS_getNavigation(&session, &genres)) << "no certificate for that name, but a connection";
    EXPECT_EQ(1u, NameLookup::Known("store.test", 443).size());
    EXPECT_EQ(AF_INET, session._pSessionImpl->m_Browse.transport().peer().Family());
}

}  // namespace
