// Desktop stand-in for the queue.
//
// ZV_IPC_SOCKET names the UNIX SOCK_SEQPACKET socket of a player system, one packet a message. Without it this file
// plays the player system over a pair of sockets: it sends INIT at the start and answers FINALIZE.
#include "player/NetworkStub.h"

#include <errno.h>
#include <stdio.h>
#include <stdlib.h>
#include <unistd.h>

#include <memory>
#include <mutex>

#include "Packet.h"

namespace {

// Closed when the last user of it has left, so that no thread ever works on a number that was given to another file.
class Queue {
public:
    Queue(int host, int player) : m_Host(host), m_Player(player) {}
    ~Queue()
    {
        close(m_Host);
        if (m_Player != -1) close(m_Player);
    }
    Queue(const Queue&) = delete;
    Queue& operator=(const Queue&) = delete;

    int Receive(NETWORK_MSG_STUB_MESSAGE& message) const { return ReceivePacket(m_Host, message); }

    int Send(const NETWORK_MSG_STUB_MESSAGE& message) const
    {
        if (m_Player == -1) return SendPacket(m_Host, message);
        if (message.type != NETWORK_MSG_STUB_FINALIZE) return 0;
        return PlayerSends(NETWORK_MSG_STUB_FINALIZE_DONE);
    }

    int PlayerSends(uint32_t type) const { return SendPacket(m_Player, {type, {0, 0, 0}}); }

    void Shutdown() const { shutdown(m_Host, SHUT_RDWR); }

private:
    const int m_Host;
    const int m_Player;  // the player system's side when it is played here, else -1
};

struct State {
    std::mutex mutex;
    std::shared_ptr<const Queue> queue;
};

// Never destructed: a thread can still block in a receive when the process exits.
State& TheState()
{
    static State& state = *new State;
    return state;
}

std::shared_ptr<const Queue> OpenQueue()
{
    const std::lock_guard<std::mutex> lock(TheState().mutex);
    return TheState().queue;
}

// The error number, or 0 and the queue.
int Connect(const char* path, std::shared_ptr<const Queue>& queue)
{
    sockaddr_un address;
    if (!ToAddress(path, address)) return ENAMETOOLONG;
    const int descriptor = socket(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0);
    if (descriptor == -1) return errno;
    queue = std::make_shared<const Queue>(descriptor, -1);
    return connect(descriptor, reinterpret_cast<const sockaddr*>(&address), sizeof(address)) == 0 ? 0 : errno;
}

int PlayPlayer(std::shared_ptr<const Queue>& queue)
{
    int pair[2];
    if (socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0, pair) != 0) return errno;
    queue = std::make_shared<const Queue>(pair[0], pair[1]);
    return queue->PlayerSends(NETWORK_MSG_STUB_INIT);
}

}  // namespace

int init_network_msg_queue(void)
{
    const std::lock_guard<std::mutex> lock(TheState().mutex);
    if (TheState().queue) return EALREADY;
    const char* path = getenv("ZV_IPC_SOCKET");
    const bool named = path && *path;
    std::shared_ptr<const Queue> queue;
    const int error = named ? Connect(path, queue) : PlayPlayer(queue);
    if (error != 0) {
        fprintf(stderr, "player: no queue to the player system%s%s: %s\n", named ? " at " : "", named ? path : "",
                strerror(error));
        return error;
    }
    TheState().queue = queue;
    return 0;
}

void uninit_network_msg_queue(void)
{
    std::shared_ptr<const Queue> queue;
    {
        const std::lock_guard<std::mutex> lock(TheState().mutex);
        queue.swap(TheState().queue);
    }
    if (queue) queue->Shutdown();
}

int network_stub_recv_ipc_msg(NETWORK_MSG_STUB_MESSAGE* message)
{
    const std::shared_ptr<const Queue> queue = OpenQueue();
    if (!queue) return ENOTCONN;
    const int error = queue->Receive(*message);
    return error != 0 && OpenQueue() != queue ? ENOTCONN : error;
}

int network_stub_send_ipc_msg(const NETWORK_MSG_STUB_MESSAGE* message)
{
    const std::shared_ptr<const Queue> queue = OpenQueue();
    return queue ? queue->Send(*message) : ENOTCONN;
}
