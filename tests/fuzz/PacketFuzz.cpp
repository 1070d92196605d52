// Packets from the player system: a byte with the length and that many bytes, and so on.
#include "Packet.h"

#include <errno.h>
#include <unistd.h>

#include <vector>

#include "Target.h"

void TestInput(std::string_view input)
{
    int ends[2];
    Require(socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0, ends) == 0, "a pair of sockets can be had");
    std::vector<Packet> whole;
    while (!input.empty()) {
        const std::string_view packet = input.substr(1, static_cast<unsigned char>(input.front()));
        input.remove_prefix(1 + packet.size());
        if (send(ends[0], packet.data(), packet.size(), MSG_DONTWAIT | MSG_NOSIGNAL) == -1) break;  // the queue is full
        if (packet.size() == sizeof(Packet)) memcpy(whole.emplace_back().data(), packet.data(), packet.size());
    }
    close(ends[0]);
    for (const Packet& packet : whole) {
        NETWORK_MSG_STUB_MESSAGE message;
        Require(ReceivePacket(ends[1], message) == 0, "no message is lost");
        Require(ToPacket(message) == packet, "nor changed");
    }
    NETWORK_MSG_STUB_MESSAGE message;
    Require(ReceivePacket(ends[1], message) == ECONNRESET, "the end is seen");
    close(ends[1]);
}
