// A forward proxy for HTTP/1.1: tunnels to wherever CONNECT asks for, and plain requests with their whole address. The
// hosts that the simulator plays are found by it under their own names.
#pragma once

#include <map>
#include <mutex>

#include "AnswerReader.h"
#include "AnswerWriter.h"
#include "Hosts.h"
#include "RequestLoop.h"

namespace simulator {

class Proxy {
public:
    /// What a request asks for.
    struct Goal {
        bool isTunnel = false;
        Address address;
        std::string authority;  ///< As it was asked for.
        std::string path;       ///< And query; none for a tunnel.
    };

    /// `user` empty: no credentials are asked for. All that is handed in outlives it.
    Proxy(Server& server, AnswerWriter& writer, Faults& faults, RequestLog& log, const Hosts& hosts,
          const std::string& user, const std::string& password);

    /// Serves one connection of a client to its end.
    void Serve(Connection& client);

    /// The client's connection that goes on in one from this port of the machine; 0: none.
    unsigned long Behind(int port) const;

private:
    class FarSide;

    std::string Standing(const HttpRequest& request) const;
    HttpResponse Check(const Connection& client, const HttpRequest& request, const Fault& fault, Goal& goal);
    bool ServeOne(Connection& client, const HttpRequest& request, const std::string& early,
                  std::unique_ptr<FarSide>& kept);
    void Tunnel(Channel& client, Channel& far, const std::string& early, const Fault& fault);
    bool Forward(Connection& client, const HttpRequest& request, const Goal& goal, std::unique_ptr<FarSide>& kept,
                 const Fault& fault);
    bool Fetch(Channel& client, Channel& far, AnswerReader& answer, bool passes, const Fault& fault);

    Server& m_Server;
    AnswerWriter& m_Writer;
    Faults& m_Faults;
    RequestLog& m_Log;
    const Hosts& m_Hosts;
    const std::string m_Credentials;  // as they stand in a header

    mutable std::mutex m_Mutex;
    std::map<int, unsigned long> m_Ports;  // of the far sides: the client's connection
};

}  // namespace simulator
