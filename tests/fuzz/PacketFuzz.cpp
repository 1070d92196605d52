// Packets from the player system: a byte with the length and that many bytes, and so on.
#include "Packet.h"

#include <errno.h>
#include <unistd.h>

#include <algorithm>
#include <vector>

#include "Target.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    int ends[2];
    Require(socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0, ends) == 0, "a pair of sockets can be had");
    std::vector<Packet> whole;
    const uint8_t* const end = data + size;
    while (data != end) {
        const size_t announced = *data++;
        const size_t length = std::min<size_t>(announced, end - data);
        if (send(ends[0], data, length, MSG_DONTWAIT | MSG_NOSIGNAL) == -1) break;  // the queue is full
        if (length == sizeof(Packet)) memcpy(whole.emplace_back().data(), data, length);
        data += length;
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
    return 0;
}
