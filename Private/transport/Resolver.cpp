#include "Resolver.h"

#include <ares.h>
#include <netdb.h>
#include <string.h>

#include <algorithm>
#include <map>
#include <string>

#include "CallGuard.h"
#include "ZVMutex.h"
#include "ZVUtilities.h"

namespace {

constexpr int kLongest = 60;  // seconds that an answer is kept

struct Known {
    std::vector<Address> addresses;
    uint64_t until;  // by ZVUtilities::MillisecondTime
};

struct Cache {
    ZVMutex mutex;
    std::map<std::string, Known> names ZV_GUARDED_BY(mutex);
    std::string configuration ZV_GUARDED_BY(mutex);
    unsigned short port ZV_GUARDED_BY(mutex) = 0;
};

Cache& TheCache()
{
    static auto* cache = new Cache;  // outlives threads that still look up at exit
    return *cache;
}

// The library counts its users without a lock.
bool InitLibrary()
{
    static const bool done = ares_library_init(ARES_LIB_INIT_ALL) == ARES_SUCCESS;
    return done;
}

void SetPort(Address& address, int port)
{
    const auto number = htons(static_cast<uint16_t>(port));
    if (address.Family() == AF_INET6) {
        reinterpret_cast<sockaddr_in6&>(address.socket).sin6_port = number;
    } else {
        reinterpret_cast<sockaddr_in&>(address.socket).sin_port = number;
    }
}

void Append(std::vector<Address>& to, const sockaddr* from, socklen_t length)
{
    if (length > sizeof(sockaddr_storage)) return;
    Address address;
    memcpy(&address.socket, from, length);
    address.length = length;
    to.push_back(address);
}

}  // namespace

// One question to the name servers, with sockets of its own: an error on a shared one would reach the other's.
struct NameLookup::Question {
    Question(NameLookup& owner, int family) : owner(owner), family(family) {}
    ~Question()
    {
        if (channel) ares_destroy(channel);  // calls back
    }
    Question(const Question&) = delete;
    Question& operator=(const Question&) = delete;

    // Where the answer comes from: "f" the hosts file, "b" the name servers.
    void Ask(const char* lookups)
    {
        ares_options options = {};
        int given = ARES_OPT_LOOKUPS;
        options.lookups = const_cast<char*>(lookups);
        std::string configuration;
        {
            Cache& cache = TheCache();
            ZVMutexLock lock(cache.mutex);
            configuration = cache.configuration;
            options.udp_port = options.tcp_port = cache.port;
        }
        if (!configuration.empty()) {
            options.resolvconf_path = &configuration[0];
            given |= ARES_OPT_RESOLVCONF | ARES_OPT_UDP_PORT | ARES_OPT_TCP_PORT;
        }
        isDone = !InitLibrary() || ares_init_options(&channel, &options, given) != ARES_SUCCESS;
        if (isDone) return;
        ares_addrinfo_hints hints = {};
        hints.ai_family = family;
        hints.ai_socktype = SOCK_STREAM;
        const auto answered = [](void* self, int status, int, ares_addrinfo* found) {
            static_cast<Question*>(self)->Answer(status, found);
        };
        ares_getaddrinfo(channel, owner.m_Host.c_str(), std::to_string(owner.m_Port).c_str(), &hints, answered, this);
    }

    void Answer(int status, ares_addrinfo* found)
    {
        isDone = true;
        const ares_addrinfo_node* node = status == ARES_SUCCESS ? found->nodes : nullptr;
        // Nothing may be thrown through the library, which is C.
        WithinMemory([&] {
            for (; node; node = node->ai_next) {
                Append(owner.m_Found, node->ai_addr, node->ai_addrlen);
                owner.m_Seconds = std::min(owner.m_Seconds, node->ai_ttl);
            }
        });
        if (found) ares_freeaddrinfo(found);
    }

    NameLookup& owner;
    const int family;
    ares_channel channel = nullptr;
    bool isDone = false;
};

NameLookup::NameLookup(const ZVString& host, int port, WithoutAsking) : m_Host(host), m_Port(port), m_Seconds(kLongest)
{
    AddLocal();
    if (m_Found.empty()) AddKnown();
}

NameLookup::NameLookup(const ZVString& host, int port) : NameLookup(host, port, WithoutAsking())
{
    if (m_Found.empty()) Ask();
}

NameLookup::~NameLookup() = default;

// Addresses, and names of the hosts file: neither waits for anybody.
void NameLookup::AddLocal()
{
    addrinfo wanted = {};
    wanted.ai_socktype = SOCK_STREAM;
    wanted.ai_flags = AI_NUMERICHOST | AI_NUMERICSERV;
    addrinfo* found = nullptr;
    if (getaddrinfo(m_Host.c_str(), std::to_string(m_Port).c_str(), &wanted, &found) == 0) {
        for (const addrinfo* each = found; each; each = each->ai_next)
            Append(m_Found, each->ai_addr, each->ai_addrlen);
        freeaddrinfo(found);
        return;
    }
    Question hosts(*this, AF_UNSPEC);
    hosts.Ask("f");
}

std::vector<Address> NameLookup::Known(const ZVString& host, int port)
{
    return NameLookup(host, port, WithoutAsking()).Take();
}

void NameLookup::AddKnown()
{
    Cache& cache = TheCache();
    ZVMutexLock lock(cache.mutex);
    const auto known = cache.names.find(m_Host.c_str());
    if (known == cache.names.end() || ZVUtilities::MillisecondTime() >= known->second.until) return;
    m_Found = known->second.addresses;
    for (Address& address : m_Found)
        SetPort(address, m_Port);
}

void NameLookup::Ask()
{
    for (const int family : {AF_INET6, AF_INET}) {
        m_Questions.push_back(std::make_unique<Question>(*this, family));
        m_Questions.back()->Ask("b");
    }
}

bool NameLookup::IsDone(int family) const
{
    return std::all_of(m_Questions.begin(), m_Questions.end(),
                       [&](const auto& question) { return question->family != family || question->isDone; });
}

std::vector<Address> NameLookup::Take()
{
    m_All.insert(m_All.end(), m_Found.begin(), m_Found.end());
    if (!m_Questions.empty() && IsDone()) Keep();
    std::vector<Address> taken;
    taken.swap(m_Found);
    return taken;
}

void NameLookup::Keep()
{
    if (m_All.empty() || m_Seconds <= 0) return;
    Cache& cache = TheCache();
    ZVMutexLock lock(cache.mutex);
    cache.names[m_Host.c_str()] = {m_All,
                                   ZVUtilities::MillisecondTime() + 1000ull * static_cast<unsigned int>(m_Seconds)};
}

void NameLookup::Forget(const ZVString& host)
{
    Cache& cache = TheCache();
    ZVMutexLock lock(cache.mutex);
    cache.names.erase(host.c_str());
}

void NameLookup::UseConfiguration(const char* path, unsigned short port)
{
    Cache& cache = TheCache();
    ZVMutexLock lock(cache.mutex);
    cache.names.clear();
    cache.configuration = path ? path : "";
    cache.port = port;
}

// ---- Waiting

void NameLookup::AddTo(std::vector<pollfd>& waits, int& timeout) const
{
    for (const auto& question : m_Questions) {
        if (question->isDone) continue;
        ares_socket_t sockets[ARES_GETSOCK_MAXNUM];
        const int states = ares_getsock(question->channel, sockets, ARES_GETSOCK_MAXNUM);
        for (int i = 0; i < ARES_GETSOCK_MAXNUM; ++i) {
            const bool reads = ARES_GETSOCK_READABLE(states, i), writes = ARES_GETSOCK_WRITABLE(states, i);
            const int events = (reads ? POLLIN : 0) | (writes ? POLLOUT : 0);
            if (events != 0) waits.push_back({sockets[i], static_cast<short>(events), 0});
        }
        timeval until = {};
        if (ares_timeout(question->channel, nullptr, &until)) {
            timeout = std::min(timeout, static_cast<int>(until.tv_sec * 1000 + until.tv_usec / 1000 + 1));
        }
    }
}

// Each channel is shown every socket that is ready: it knows its own.
void NameLookup::Process(const std::vector<pollfd>& waited)
{
    for (const auto& question : m_Questions) {
        if (question->isDone) continue;
        for (const pollfd& wait : waited) {
            const bool reads = (wait.revents & (POLLIN | POLLERR | POLLHUP)) != 0;
            const bool writes = (wait.revents & POLLOUT) != 0;
            if (reads || writes) {
                ares_process_fd(question->channel, reads ? wait.fd : ARES_SOCKET_BAD,
                                writes ? wait.fd : ARES_SOCKET_BAD);
            }
        }
        ares_process_fd(question->channel, ARES_SOCKET_BAD, ARES_SOCKET_BAD);  // what has waited too long
    }
}
