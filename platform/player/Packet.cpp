#include "Packet.h"

#include <errno.h>
#include <stdio.h>

int SendPacket(int descriptor, const NETWORK_MSG_STUB_MESSAGE& message)
{
    const Packet packet = ToPacket(message);
    const ssize_t sent = send(descriptor, packet.data(), sizeof(packet), MSG_NOSIGNAL | MSG_DONTWAIT);
    return sent == static_cast<ssize_t>(sizeof(packet)) ? 0 : errno;
}

// An empty packet and the end of the connection both read as 0 bytes. Only a packet carries its sender's credentials.
static ssize_t ReceiveBytes(int descriptor, Packet& packet, bool& ended)
{
    const int on = 1;
    if (setsockopt(descriptor, SOL_SOCKET, SO_PASSCRED, &on, sizeof(on)) != 0) return -1;
    iovec part = {packet.data(), sizeof(packet)};
    alignas(cmsghdr) char control[CMSG_SPACE(sizeof(ucred))];
    msghdr header = {};
    header.msg_iov = &part;
    header.msg_iovlen = 1;
    header.msg_control = control;
    header.msg_controllen = sizeof(control);
    ssize_t length;
    do {
        header.msg_controllen = sizeof(control);
        length = recvmsg(descriptor, &header, MSG_TRUNC | MSG_CMSG_CLOEXEC);
    } while (length == -1 && errno == EINTR);
    ended = length == 0 && header.msg_controllen == 0;
    return length;
}

int ReceivePacket(int descriptor, NETWORK_MSG_STUB_MESSAGE& message)
{
    for (;;) {
        Packet packet;
        bool ended = false;
        const ssize_t length = ReceiveBytes(descriptor, packet, ended);
        if (length == -1) return errno;
        if (ended) return ECONNRESET;
        if (length == static_cast<ssize_t>(sizeof(packet))) {
            message = FromPacket(packet);
            return 0;
        }
        fprintf(stderr, "player: dropped a packet of %zd bytes, a message has %zu\n", length, sizeof(packet));
    }
}
