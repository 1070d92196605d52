#include "NameServer.h"

#include <arpa/inet.h>
#include <poll.h>
#include <string.h>
#include <sys/socket.h>
#include <unistd.h>

#include "Require.h"
#include "Resolver.h"

namespace {

void Put16(std::string& to, unsigned int number)
{
    to += static_cast<char>(number >> 8);
    to += static_cast<char>(number);
}

}  // namespace

NameServer::NameServer(Fault fault) : m_Fault(fault), m_Socket(socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC, 0))
{
    sockaddr_in own = {};
    socklen_t size = sizeof own;
    own.sin_family = AF_INET;
    own.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    Require(bind(m_Socket, reinterpret_cast<sockaddr*>(&own), size) == 0, "a socket of the name server");
    getsockname(m_Socket, reinterpret_cast<sockaddr*>(&own), &size);
    Require(pipe(m_Stop) == 0, "a pipe");
    if (fault == Fault::Refused) close(m_Socket);
    const std::string configuration = m_Folder / "resolv.conf";
    std::ofstream(configuration) << "nameserver 127.0.0.1\n";
    NameLookup::UseConfiguration(configuration.c_str(), ntohs(own.sin_port));
    m_Thread = std::thread([this] { Serve(); });
}

NameServer::~NameServer()
{
    NameLookup::UseConfiguration(nullptr, 0);
    close(m_Stop[1]);
    m_Thread.join();
    close(m_Stop[0]);
    if (m_Fault != Fault::Refused) close(m_Socket);
}

void NameServer::Add(const std::string& name, Kind kind, const std::vector<std::string>& addresses,
                     unsigned int seconds)
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    m_Records[{name, kind}] = {addresses, seconds};
}

void NameServer::Ignore(Kind kind)
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    m_Ignored.insert(kind);
}

int NameServer::Asked(const std::string& name) const
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    const auto found = m_Asked.find(name);
    return found == m_Asked.end() ? 0 : found->second;
}

void NameServer::Serve()
{
    for (;;) {
        pollfd waits[] = {{m_Stop[0], 0, 0}, {m_Fault == Fault::Refused ? -1 : m_Socket, POLLIN, 0}};
        poll(waits, 2, -1);
        if (waits[0].revents != 0) return;
        char packet[512];
        sockaddr_in from = {};
        socklen_t size = sizeof from;
        const ssize_t count = recvfrom(m_Socket, packet, sizeof packet, 0, reinterpret_cast<sockaddr*>(&from), &size);
        if (count < 17) continue;
        const std::string answer = Answer(std::string(packet, static_cast<size_t>(count)));
        if (!answer.empty()) {
            sendto(m_Socket, answer.data(), answer.size(), 0, reinterpret_cast<sockaddr*>(&from), size);
        }
    }
}

// The question with its records behind it (RFC 1035, 4).
std::string NameServer::Answer(std::string question)
{
    size_t at = 12;
    std::string name;
    while (question[at] != 0) {
        const auto length = static_cast<unsigned char>(question[at]);
        name += (name.empty() ? "" : ".") + question.substr(at + 1, length);
        at += 1 + length;
    }
    const int kind = static_cast<unsigned char>(question[at + 2]);
    question.resize(at + 5);  // without additional records
    const std::lock_guard<std::mutex> lock(m_Mutex);
    ++m_Asked[name];
    if (m_Fault == Fault::Silent || m_Ignored.count(kind) != 0) return {};
    if (m_Fault == Fault::Garbage) return question.substr(0, 2) + std::string(40, '\xc0');
    const auto found = m_Records.find({name, kind});
    const bool isKnown = found != m_Records.end() || m_Records.lower_bound({name, 0}) != m_Records.end();
    const size_t count = found == m_Records.end() ? 0 : found->second.addresses.size();
    std::string answer = question.substr(0, 2);
    if (m_Fault == Fault::Stranger) answer[0] = static_cast<char>(~answer[0]);
    Put16(answer, 0x8180 | (isKnown ? 0 : 3));
    Put16(answer, 1);
    Put16(answer, static_cast<unsigned int>(count));
    Put16(answer, 0);
    Put16(answer, 0);
    answer += question.substr(12);
    for (size_t i = 0; i < count; ++i) {
        unsigned char address[16];
        const int family = kind == A ? AF_INET : AF_INET6;
        const int length = kind == A ? 4 : 16;
        Require(inet_pton(family, found->second.addresses[i].c_str(), address) == 1, "an address");
        Put16(answer, 0xc00c);  // the question's name
        Put16(answer, static_cast<unsigned int>(kind));
        Put16(answer, 1);
        Put16(answer, 0);
        Put16(answer, found->second.seconds);
        Put16(answer, static_cast<unsigned int>(length));
        answer.append(reinterpret_cast<char*>(address), static_cast<size_t>(length));
    }
    if (m_Fault == Fault::CutShort) answer.resize(answer.size() - 3);
    return answer;
}

std::string NamedDeployment(const std::string& file, const std::string& name, const TempFolder& folder)
{
    static const std::string kLocal = "localhost";
    const std::string path = folder / "deployment.conf";
    std::ifstream from(file);
    std::ofstream to(path);
    for (std::string line; std::getline(from, line);) {
        const size_t host = line.find(kLocal);
        to << (host == std::string::npos ? line : line.replace(host, kLocal.size(), name)) << "\n";
    }
    to.close();
    Require(bool(to), "a deployment file");
    return path;
}
