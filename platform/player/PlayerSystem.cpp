// zv_player_system SOCKET: a small console for the player system's side of the queue.
//
// Listens on a UNIX SOCK_SEQPACKET socket of that path, serves one host after the other and prints what arrives, a line
// each. Input lines send messages; those that come before a host has connected wait for it. After the end of the input
// it goes on until the host has gone.
#include <errno.h>
#include <poll.h>
#include <stdio.h>
#include <stdlib.h>
#include <unistd.h>

#include <string>
#include <vector>

#include "Packet.h"

namespace {

const char kUsage[] =
    "usage: zv_player_system SOCKET\n"
    "Plays the player system for a zv_stagecraft that is started with ZV_IPC_SOCKET=SOCKET.\n"
    "Input lines: init (1), uninit (3), done (6), neterror (7), quit.\n";

struct Command {
    const char* word;
    uint32_t type;
};
const Command kCommands[] = {
    {"init", NETWORK_MSG_STUB_INIT},
    {"uninit", NETWORK_MSG_STUB_UNINIT},
    {"done", NETWORK_MSG_STUB_FINALIZE_DONE},
    {"neterror", NETWORK_MSG_STUB_FINALIZE_NETWORK_ERROR},
};

const char* NameOf(uint32_t type)
{
    switch (type) {
        case NETWORK_MSG_STUB_UNINIT_RET:
            return "NETWORK_MSG_STUB_UNINIT_RET";
        case NETWORK_MSG_STUB_FINALIZE:
            return "NETWORK_MSG_STUB_FINALIZE";
        default:
            return "unexpected";
    }
}

class PlayerSystem {
public:
    ~PlayerSystem()
    {
        if (m_Host != -1) close(m_Host);
        if (m_Listener == -1) return;
        close(m_Listener);
        unlink(m_Address.sun_path);
    }

    bool Listen(const char* path);
    void Run();

private:
    void Accept();
    void ReceiveFromHost();
    void ReadInput();
    void Obey(const std::string& line);
    void SendWaiting();

    sockaddr_un m_Address = {};
    int m_Listener = -1;
    int m_Host = -1;
    bool m_Quit = false;
    bool m_InputEnded = false;
    std::string m_Input;              // of a line that is not complete
    std::vector<uint32_t> m_Waiting;  // types to send
};

// A socket file whose owner has gone is replaced; anything else at that path stays.
bool PlayerSystem::Listen(const char* path)
{
    if (!ToAddress(path, m_Address)) {
        fprintf(stderr, "zv_player_system: %s: the path is longer than %zu bytes\n", path,
                sizeof(m_Address.sun_path) - 1);
        return false;
    }
    const sockaddr* address = reinterpret_cast<const sockaddr*>(&m_Address);
    const int descriptor = socket(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0);
    if (descriptor != -1 && connect(descriptor, address, sizeof(m_Address)) != 0 && errno == ECONNREFUSED) unlink(path);
    if (descriptor != -1) close(descriptor);

    const int listener = socket(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0);
    if (listener == -1 || bind(listener, address, sizeof(m_Address)) != 0 || listen(listener, 1) != 0) {
        fprintf(stderr, "zv_player_system: cannot listen at %s: %s\n", path, strerror(errno));
        if (listener != -1) close(listener);
        return false;
    }
    m_Listener = listener;
    printf("listening\n");
    return true;
}

void PlayerSystem::Run()
{
    while (!m_Quit && !(m_InputEnded && m_Host == -1 && m_Waiting.empty())) {
        pollfd watched[] = {{m_InputEnded ? -1 : STDIN_FILENO, POLLIN, 0},
                            {m_Host == -1 ? m_Listener : m_Host, POLLIN, 0}};
        if (poll(watched, 2, -1) == -1) {
            if (errno == EINTR) continue;
            perror("zv_player_system: poll");
            return;
        }
        if (watched[1].revents != 0) m_Host == -1 ? Accept() : ReceiveFromHost();
        if (watched[0].revents != 0) ReadInput();
        SendWaiting();
    }
}

void PlayerSystem::Accept()
{
    m_Host = accept4(m_Listener, nullptr, nullptr, SOCK_CLOEXEC);
    if (m_Host != -1) printf("connected\n");
}

void PlayerSystem::ReceiveFromHost()
{
    NETWORK_MSG_STUB_MESSAGE message;
    if (ReceivePacket(m_Host, message) == 0) {
        printf("received %u %s %u %u %u\n", message.type, NameOf(message.type), message.words[0], message.words[1],
               message.words[2]);
        return;
    }
    printf("disconnected\n");
    close(m_Host);
    m_Host = -1;
}

void PlayerSystem::ReadInput()
{
    char part[4096];
    const ssize_t got = read(STDIN_FILENO, part, sizeof(part));
    if (got == -1 && errno == EINTR) return;
    m_InputEnded = got <= 0;
    m_Input.append(part, got > 0 ? static_cast<size_t>(got) : 0);
    for (size_t end; !m_Quit && (end = m_Input.find('\n')) != std::string::npos; m_Input.erase(0, end + 1)) {
        Obey(m_Input.substr(0, end));
    }
}

void PlayerSystem::Obey(const std::string& line)
{
    if (line.empty()) return;
    if (line == "quit") {
        m_Quit = true;
        return;
    }
    for (const Command& command : kCommands) {
        if (line != command.word) continue;
        m_Waiting.push_back(command.type);
        return;
    }
    fprintf(stderr, "zv_player_system: unknown input \"%s\"; known are init, uninit, done, neterror, quit\n",
            line.c_str());
}

void PlayerSystem::SendWaiting()
{
    if (m_Host == -1) return;
    for (const uint32_t type : m_Waiting) {
        const int error = SendPacket(m_Host, {type, {0, 0, 0}});
        if (error != 0) fprintf(stderr, "zv_player_system: %u was not sent: %s\n", type, strerror(error));
    }
    m_Waiting.clear();
}

}  // namespace

int main(int argc, char** argv)
{
    if (argc == 2 && strcmp(argv[1], "--help") == 0) {
        fputs(kUsage, stdout);
        return 0;
    }
    if (argc != 2 || !*argv[1]) {
        fputs(kUsage, stderr);
        return 2;
    }
    setvbuf(stdout, nullptr, _IOLBF, 0);
    PlayerSystem system;
    if (!system.Listen(argv[1])) return 1;
    system.Run();
    return 0;
}
