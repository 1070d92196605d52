// What a proxy answers to CONNECT, until it has no more to say.
#include <sys/socket.h>
#include <unistd.h>

#include "Connector.h"
#include "Target.h"
#include "ZVUtilities.h"

void TestInput(std::string_view input)
{
    int ends[2];
    Require(socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0, ends) == 0, "a pair of sockets");
    const ssize_t sent = send(ends[1], input.data(), input.size(), MSG_NOSIGNAL);
    Require(sent == static_cast<ssize_t>(input.size()), "an input fits into a socket");
    shutdown(ends[1], SHUT_WR);
    const std::atomic<bool> aborted{false};
    const Patience patience = {ZVUtilities::MillisecondTime() + 60000, aborted};
    const int status = Connector::OpenTunnel(ends[0], "api.example", 443, Proxy(), patience);
    if (status == 0) {
        Require(input.substr(0, 7) == "HTTP/1." && input.find("\r\n\r\n") + 4 == input.size(),
                "a tunnel begins behind a head, with nothing between");
    }
    Require(status == -1 || status == 0 || (status >= 100 && status <= 599), "a status is one of HTTP's");
    close(ends[0]);
    close(ends[1]);
}
