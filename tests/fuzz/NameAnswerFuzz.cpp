// What a name server answers. The input's first line is "whole", and the rest an answer of which only the question's
// number is put right, or "records", and the rest what stands behind the question: counts of records and these.
#include <arpa/inet.h>
#include <sys/socket.h>

#include <algorithm>

#include "MemoryFile.h"
#include "Resolver.h"
#include "Target.h"

namespace {

constexpr int kPort = 443;
constexpr size_t kHead = 12;

class NameHost {
public:
    NameHost() : m_Socket(socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0))
    {
        sockaddr_in address = {};
        address.sin_family = AF_INET;
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        socklen_t size = sizeof address;
        auto* own = reinterpret_cast<sockaddr*>(&address);
        Require(bind(m_Socket, own, size) == 0 && getsockname(m_Socket, own, &size) == 0, "a port is free");
        NameLookup::UseConfiguration(m_Configuration.Path(), ntohs(address.sin_port));
    }

    // Whether there was a question.
    bool Answer(bool isWhole, std::string_view input) const
    {
        char question[512];
        sockaddr_in from = {};
        socklen_t size = sizeof from;
        auto* whom = reinterpret_cast<sockaddr*>(&from);
        const ssize_t length = recvfrom(m_Socket, question, sizeof question, 0, whom, &size);
        if (length < static_cast<ssize_t>(kHead)) return false;
        std::string answer(question, 2);
        if (isWhole) {
            answer += input.substr(std::min<size_t>(2, input.size()));
        } else {
            std::string counts(input.substr(0, 6));
            counts.resize(6);
            answer += std::string("\x81\x80\0\1", 4) + counts;
            answer += std::string(question + kHead, static_cast<size_t>(length) - kHead);
            answer += input.substr(std::min<size_t>(6, input.size()));
        }
        sendto(m_Socket, answer.data(), answer.size(), 0, whom, size);
        return true;
    }

private:
    const MemoryFile m_Configuration{"nameserver 127.0.0.1\n"};
    const int m_Socket;
};

void Look(NameLookup& lookup)
{
    for (const Address& address : lookup.Take()) {
        const bool isSix = address.Family() == AF_INET6;
        Require(isSix || address.Family() == AF_INET, "an address is one of two kinds");
        Require(address.length == (isSix ? sizeof(sockaddr_in6) : sizeof(sockaddr_in)), "and as long as its kind");
        const auto port = isSix ? reinterpret_cast<const sockaddr_in6&>(address.socket).sin6_port
                                : reinterpret_cast<const sockaddr_in&>(address.socket).sin_port;
        Require(ntohs(port) == kPort, "and has the port that was asked for");
    }
}

}  // namespace

void TestInput(std::string_view input)
{
    static const NameHost host;
    const bool isWhole = TakeLine(input) == "whole";
    NameLookup::Forget("name.example");
    NameLookup lookup("name.example", kPort);
    // What is sent here is there at once: nothing more comes when nothing is ready. What does not convince is asked
    // anew.
    for (int round = 0; round < 8 && !lookup.IsDone(); ++round) {
        while (host.Answer(isWhole, input)) {
        }
        std::vector<pollfd> waits;
        int timeout = 0;
        lookup.AddTo(waits, timeout);
        if (poll(waits.data(), waits.size(), 0) <= 0) break;
        lookup.Process(waits);
        Look(lookup);
    }
}
