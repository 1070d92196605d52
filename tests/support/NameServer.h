// A name server on this machine, and the library's name lookups set to ask it while it lives. One exists at a time.
#pragma once

#include <map>
#include <mutex>
#include <set>
#include <string>
#include <thread>
#include <utility>
#include <vector>

#include "TempFolder.h"

class NameServer {
public:
    enum Kind { A = 1, AAAA = 28 };
    enum class Fault {
        None,
        Silent,    ///< No answer comes.
        Refused,   ///< Nobody is there: the system says so at once.
        Garbage,   ///< Bytes that are no answer.
        CutShort,  ///< An answer that ends inside of a record.
        Stranger,  ///< The answer to another question.
    };

    explicit NameServer(Fault fault = Fault::None);
    ~NameServer();
    NameServer(const NameServer&) = delete;
    NameServer& operator=(const NameServer&) = delete;

    /// The answer about a name, which has none of a kind that is not given. `seconds`: how long it may be kept.
    void Add(const std::string& name, Kind kind, const std::vector<std::string>& addresses, unsigned int seconds = 60);
    /// Questions of that kind get no answer.
    void Ignore(Kind kind);

    /// How many questions came about the name.
    int Asked(const std::string& name) const;

private:
    struct Record {
        std::vector<std::string> addresses;
        unsigned int seconds;
    };

    void Serve();
    std::string Answer(std::string question);

    const Fault m_Fault;
    TempFolder m_Folder;
    int m_Socket;
    int m_Stop[2];
    mutable std::mutex m_Mutex;
    std::map<std::pair<std::string, int>, Record> m_Records;
    std::map<std::string, int> m_Asked;
    std::set<int> m_Ignored;
    std::thread m_Thread;
};

/// Writes a deployment like that file's, with the name in place of "localhost", into the folder; returns its path.
std::string NamedDeployment(const std::string& file, const std::string& name, const TempFolder& folder);
