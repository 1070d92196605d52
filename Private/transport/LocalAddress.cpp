#include "LocalAddress.h"

#include <arpa/inet.h>
#include <string.h>
#include <sys/socket.h>
#include <unistd.h>

namespace {

// Addresses for documentation (RFC 5737, RFC 3849), which no network has: only a default route leads to them.
constexpr char kFar[] = "198.51.100.1";
constexpr char kFarSix[] = "2001:db8::1";
constexpr in_port_t kAnyPort = 443;

Address FarPeer(int family)
{
    Address peer;
    peer.socket.ss_family = static_cast<sa_family_t>(family);
    if (family == AF_INET6) {
        auto& six = reinterpret_cast<sockaddr_in6&>(peer.socket);
        inet_pton(family, kFarSix, &six.sin6_addr);
        six.sin6_port = htons(kAnyPort);
        peer.length = sizeof six;
    } else {
        auto& four = reinterpret_cast<sockaddr_in&>(peer.socket);
        inet_pton(family, kFar, &four.sin_addr);
        four.sin_port = htons(kAnyPort);
        peer.length = sizeof four;
    }
    return peer;
}

bool IsOfOthers(const in_addr& address)
{
    const uint32_t bits = ntohl(address.s_addr);
    return bits != INADDR_ANY && bits >> 24 != IN_LOOPBACKNET;
}

bool IsOfOthers(const in6_addr& address)
{
    return !IN6_IS_ADDR_LOOPBACK(&address) && !IN6_IS_ADDR_UNSPECIFIED(&address);
}

// Empty for an address that only this device can reach.
ZVString TextOf(const sockaddr_storage& own)
{
    char text[INET6_ADDRSTRLEN] = "";
    if (own.ss_family == AF_INET6) {
        const in6_addr& six = reinterpret_cast<const sockaddr_in6&>(own).sin6_addr;
        in_addr four;
        memcpy(&four, &six.s6_addr[12], sizeof four);
        if (IN6_IS_ADDR_V4MAPPED(&six)) {
            if (IsOfOthers(four)) inet_ntop(AF_INET, &four, text, sizeof text);
        } else if (IsOfOthers(six)) {
            inet_ntop(AF_INET6, &six, text, sizeof text);
        }
    } else if (own.ss_family == AF_INET) {
        const in_addr& four = reinterpret_cast<const sockaddr_in&>(own).sin_addr;
        if (IsOfOthers(four)) inet_ntop(AF_INET, &four, text, sizeof text);
    }
    return text;
}

// To connect a datagram socket is to choose its source address, and no more.
ZVString SourceTowards(const Address& peer)
{
    const int way = socket(peer.Family(), SOCK_DGRAM | SOCK_CLOEXEC, 0);
    if (way < 0) return ZVString();
    sockaddr_storage own = {};
    socklen_t size = sizeof own;
    const bool leads = connect(way, reinterpret_cast<const sockaddr*>(&peer.socket), peer.length) == 0 &&
                       getsockname(way, reinterpret_cast<sockaddr*>(&own), &size) == 0;
    close(way);
    return leads ? TextOf(own) : ZVString();
}

}  // namespace

ZVString LocalAddressTowards(std::vector<Address> peers)
{
    peers.push_back(FarPeer(AF_INET));
    peers.push_back(FarPeer(AF_INET6));
    for (const Address& peer : peers) {
        ZVString own = SourceTowards(peer);
        if (!own.empty()) return own;
    }
    return ZVString();
}
