#include "Process.h"

#include <errno.h>
#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <string.h>
#include <sys/resource.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>

namespace {

constexpr int kPatience = 60000;  // milliseconds

bool WaitReadable(std::initializer_list<int> descriptors)
{
    std::vector<pollfd> watched;
    for (const int descriptor : descriptors) {
        watched.push_back({descriptor, POLLIN, 0});
    }
    int ready;
    do {
        ready = poll(watched.data(), watched.size(), kPatience);
    } while (ready == -1 && errno == EINTR);
    EXPECT_GT(ready, 0) << "nothing happened for a minute";
    return ready > 0;
}

void CloseIfOpen(int& descriptor)
{
    if (descriptor != -1) close(descriptor);
    descriptor = -1;
}

// The variables of this process and those given here; what the client and its stand-ins read comes from the latter
// alone.
Lines Variables(const Environment& environment)
{
    const auto isTheirs = [](const std::string& variable) {
        return variable.compare(0, 3, "ZV_") == 0 || variable.compare(0, 11, "STAGECRAFT_") == 0;
    };
    Lines variables;
    for (char** own = environ; *own; ++own) {
        if (!isTheirs(*own)) variables.emplace_back(*own);
    }
    for (const auto& [name, value] : environment)
        variables.emplace_back(name).append("=").append(value);
    return variables;
}

std::vector<char*> Pointers(const Lines& texts)
{
    std::vector<char*> pointers;
    for (const std::string& text : texts)
        pointers.push_back(const_cast<char*>(text.c_str()));
    pointers.push_back(nullptr);
    return pointers;
}

// Child, between fork and exec: other threads of the test may have held any lock.
[[noreturn]] void Execute(char* const* arguments, char* const* variables, const int (&files)[3])
{
    for (int i = 0; i < 3; ++i) {
        dup2(files[i], i);
    }
    const rlimit none = {0, 0};
    setrlimit(RLIMIT_CORE, &none);
    execve(arguments[0], arguments, variables);
    _exit(127);
}

}  // namespace

Process::Process(const Lines& arguments, const Environment& environment)
{
    int input[2], output[2], errors[2];
    if (pipe2(input, O_CLOEXEC) != 0 || pipe2(output, O_CLOEXEC) != 0 || pipe2(errors, O_CLOEXEC) != 0) abort();
    const Lines variables = Variables(environment);
    const std::vector<char*> argumentVector = Pointers(arguments);
    const std::vector<char*> variableVector = Pointers(variables);
    m_Pid = fork();
    if (m_Pid == 0) Execute(argumentVector.data(), variableVector.data(), {input[0], output[1], errors[1]});
    close(input[0]);
    close(output[1]);
    close(errors[1]);
    m_Input = input[1];
    m_Pipes[0] = output[0];
    m_Pipes[1] = errors[0];
}

Process::~Process()
{
    if (m_Pid > 0) {
        kill(m_Pid, SIGKILL);
        waitpid(m_Pid, nullptr, 0);
    }
    CloseIfOpen(m_Input);
    CloseIfOpen(m_Pipes[0]);
    CloseIfOpen(m_Pipes[1]);
}

void Process::Type(const std::string& input) const
{
    EXPECT_EQ(static_cast<ssize_t>(input.size()), write(m_Input, input.data(), input.size()));
}

// false when both pipes have ended.
bool Process::ReadMore()
{
    if (m_Pipes[0] == -1 && m_Pipes[1] == -1) return false;
    if (!WaitReadable({m_Pipes[0], m_Pipes[1]})) return false;
    for (int i = 0; i < 2; ++i) {
        pollfd ready = {m_Pipes[i], POLLIN, 0};
        if (m_Pipes[i] == -1 || poll(&ready, 1, 0) <= 0) continue;
        char part[4096];
        const ssize_t got = read(m_Pipes[i], part, sizeof(part));
        if (got > 0) m_Text[i].append(part, static_cast<size_t>(got));
        if (got == 0) CloseIfOpen(m_Pipes[i]);
    }
    return true;
}

bool Process::WaitForLine(const std::string& beginning)
{
    const auto there = [&] {
        const Lines lines = Output();
        return std::any_of(lines.begin(), lines.end(),
                           [&](const std::string& line) { return line.compare(0, beginning.size(), beginning) == 0; });
    };
    while (!there()) {
        if (ReadMore()) continue;
        ADD_FAILURE() << "the output ended without \"" << beginning << "\":\n" << m_Text[0] << m_Text[1];
        return false;
    }
    return true;
}

int Process::WaitForEnd()
{
    while (ReadMore()) {
    }
    if (testing::Test::HasFailure()) kill(m_Pid, SIGKILL);
    int status = -1;
    waitpid(m_Pid, &status, 0);
    m_Pid = -1;
    return status;
}

Lines Process::Split(const std::string& text)
{
    Lines lines;
    for (size_t at = 0, end; (end = text.find('\n', at)) != std::string::npos; at = end + 1) {
        lines.push_back(text.substr(at, end - at));
    }
    return lines;
}

Player::Player(const std::string& path)
{
    sockaddr_un address = {};
    address.sun_family = AF_UNIX;
    path.copy(address.sun_path, sizeof(address.sun_path) - 1);
    m_Listener = socket(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0);
    if (bind(m_Listener, reinterpret_cast<const sockaddr*>(&address), sizeof(address)) != 0 ||
        listen(m_Listener, 1) != 0) {
        ADD_FAILURE() << path << ": " << strerror(errno);
    }
}

Player::~Player()
{
    Close();
    CloseIfOpen(m_Listener);
}

void Player::Accept()
{
    if (WaitReadable({m_Listener})) m_Host = accept4(m_Listener, nullptr, nullptr, SOCK_CLOEXEC);
}

bool Player::HasCaller() const
{
    pollfd caller = {m_Listener, POLLIN, 0};
    return poll(&caller, 1, 0) > 0;
}

void Player::SendBytes(const std::string& bytes) const
{
    EXPECT_EQ(static_cast<ssize_t>(bytes.size()), send(m_Host, bytes.data(), bytes.size(), MSG_NOSIGNAL));
}

std::string Player::Receive() const
{
    char part[64];
    if (!WaitReadable({m_Host})) return "nothing";
    const ssize_t got = recv(m_Host, part, sizeof(part), 0);
    return std::string(part, got > 0 ? static_cast<size_t>(got) : 0);
}

void Player::Close()
{
    CloseIfOpen(m_Host);
}

std::string Player::Message(uint32_t type)
{
    std::string message(16, '\0');
    for (size_t i = 0; i < 4; ++i) {
        message[i] = static_cast<char>(type >> (8 * i));
    }
    return message;
}

testing::AssertionResult IsMerge(const Lines& output, const Lines& one, const Lines& other)
{
    // reached[i]: the first lines of the output can be one's first i, and other's for the rest.
    std::vector<bool> reached(one.size() + 1, false);
    reached[0] = true;
    size_t best = 0;
    for (size_t n = 0; n < output.size(); ++n) {
        std::vector<bool> next(one.size() + 1, false);
        for (size_t i = 0; i <= one.size(); ++i) {
            if (!reached[i] || i > n) continue;
            if (i < one.size() && output[n] == one[i]) next[i + 1] = true;
            if (n - i < other.size() && output[n] == other[n - i]) next[i] = true;
        }
        reached = next;
        if (std::find(reached.begin(), reached.end(), true) == reached.end()) break;
        best = n + 1;
    }
    if (best == output.size() && best == one.size() + other.size() && reached[one.size()]) {
        return testing::AssertionSuccess();
    }
    return testing::AssertionFailure() << "expected from line " << best + 1
                                       << " on is something else: " << testing::PrintToString(output);
}
