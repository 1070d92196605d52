// A message of the queue as a packet: four little-endian words. And the address of the socket that carries it.
#pragma once

#include <endian.h>
#include <string.h>
#include <sys/socket.h>
#include <sys/un.h>

#include <array>

#include "player/NetworkStub.h"

typedef std::array<uint32_t, 4> Packet;

inline Packet ToPacket(const NETWORK_MSG_STUB_MESSAGE& message)
{
    return {htole32(message.type), htole32(message.words[0]), htole32(message.words[1]), htole32(message.words[2])};
}

inline NETWORK_MSG_STUB_MESSAGE FromPacket(const Packet& packet)
{
    return {le32toh(packet[0]), {le32toh(packet[1]), le32toh(packet[2]), le32toh(packet[3])}};
}

// false when the path does not fit.
inline bool ToAddress(const char* path, sockaddr_un& address)
{
    address = {};
    address.sun_family = AF_UNIX;
    if (strlen(path) >= sizeof(address.sun_path)) return false;
    strcpy(address.sun_path, path);
    return true;
}

// 0 or the error number. Never blocks, never raises SIGPIPE.
int SendPacket(int descriptor, const NETWORK_MSG_STUB_MESSAGE& message);

// Blocks. 0 or the error number; ECONNRESET when the other side has gone. Packets of a wrong length are dropped with a
// line on the error stream.
int ReceivePacket(int descriptor, NETWORK_MSG_STUB_MESSAGE& message);
