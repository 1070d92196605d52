// The pieces of a host test: a process whose output is read as it comes, a player system's socket.
// Every wait ends with an event, or fails the test after a minute.
#pragma once

#include <gtest/gtest.h>
#include <stdint.h>
#include <sys/types.h>

#include <string>
#include <utility>
#include <vector>

typedef std::vector<std::string> Lines;
typedef std::vector<std::pair<std::string, std::string>> Environment;

// Killed at the end when it still runs.
class Process {
public:
    // Variables that the client and its stand-ins read are set by the environment given here alone.
    Process(const Lines& arguments, const Environment& environment);
    ~Process();
    Process(const Process&) = delete;
    Process& operator=(const Process&) = delete;

    pid_t Pid() const { return m_Pid; }
    void Type(const std::string& input) const;
    // Until a line of the standard output that begins so is there; false when the output ended without it.
    bool WaitForLine(const std::string& beginning);
    // Until the output ended and the process with it; the status is waitpid's.
    int WaitForEnd();
    // So far; a last line without its end does not count.
    Lines Output() const { return Split(m_Text[0]); }
    Lines Errors() const { return Split(m_Text[1]); }

private:
    static Lines Split(const std::string& text);
    bool ReadMore();

    pid_t m_Pid = -1;
    int m_Input = -1;
    int m_Pipes[2] = {-1, -1};
    std::string m_Text[2];
};

// The player system's side of the queue.
class Player {
public:
    explicit Player(const std::string& path);
    ~Player();
    Player(const Player&) = delete;
    Player& operator=(const Player&) = delete;

    void Accept();
    bool HasCaller() const;
    void Send(uint32_t type) const { SendBytes(Message(type)); }
    void SendBytes(const std::string& bytes) const;
    // The next packet; "" when the host has closed.
    std::string Receive() const;
    void Close();

    static std::string Message(uint32_t type);

private:
    int m_Listener = -1;
    int m_Host = -1;
};

// Whether the output is made of exactly these two sequences, each in its order.
testing::AssertionResult IsMerge(const Lines& output, const Lines& one, const Lines& other);

inline Lines operator+(Lines lines, const Lines& more)
{
    lines.insert(lines.end(), more.begin(), more.end());
    return lines;
}
