// One exchange of a service wrapper with a peer that is two ends of a socket pair: the answer is laid ready, the
// request is read afterwards. Both are texts written by hand.
#pragma once

#include <gtest/gtest.h>
#include <sys/socket.h>
#include <unistd.h>

#include <string>

#include "SessionImpl.h"

inline ZV_WS_SetupParams2 TestParams()
{
    ZV_WS_SetupParams2 params;
    params.APIKey = "key<&>1";
    params.Customer->ChangeToken("token-1");
    params.DestinationUniqueID = "device-1";
    params.DestinationTypeID = 48;
    params.UserName = "customer";
    params.Password = "secret";
    params.ServiceBaseURL = "http://127.0.0.1:1/api/";
    params.UserAgent = "ZVSDK: F|A";
    return params;
}

inline std::string HttpAnswer(const std::string& body, const std::string& status = "200 OK")
{
    return "HTTP/1.1 " + status +
           "\r\nContent-Type: text/xml; charset=utf-8\r\nContent-Length: " + std::to_string(body.size()) +
           "\r\nConnection: close\r\n\r\n" + body;
}

template <class Service>
class Exchange {
public:
    Exchange()
    {
        m_Service.SetParams(&m_Params);
        m_Service.fopen = Open;
    }

    // Sends one request by `call(service)` against the answer (a whole HTTP message); the SOAP runtime's result.
    template <class Call>
    int Run(const std::string& operation, const std::string& answer, Call call)
    {
        int ends[2];
        EXPECT_EQ(0, socketpair(AF_UNIX, SOCK_STREAM, 0, ends));
        s_Client = ends[0];
        EXPECT_EQ(static_cast<ssize_t>(answer.size()), write(ends[1], answer.data(), answer.size()));
        shutdown(ends[1], SHUT_WR);
        m_Service.transport().BeginExchange();
        EXPECT_EQ(SOAP_OK, m_Service.Setup(operation.c_str()));
        const int result = call(m_Service);
        m_Service.transport().Close();
        m_Request.clear();
        char piece[4096];
        for (ssize_t count; (count = recv(ends[1], piece, sizeof piece, MSG_DONTWAIT)) > 0;) {
            m_Request.append(piece, count);
        }
        close(ends[1]);
        return result;
    }

    const std::string& Request() const { return m_Request; }

    // What stands between the first `start` and the next `end`.
    std::string Between(const std::string& start, const std::string& end) const
    {
        const size_t from = m_Request.find(start);
        if (from == std::string::npos) return "(no " + start + ")";
        const size_t to = m_Request.find(end, from + start.size());
        return m_Request.substr(from + start.size(), to - from - start.size());
    }
    std::string Body() const { return Between("<SOAP-ENV:Body>", "</SOAP-ENV:Body>"); }

private:
    static SOAP_SOCKET Open(soap*, const char*, const char*, int) { return s_Client; }

    static inline int s_Client = -1;
    ZV_WS_SetupParams2 m_Params = TestParams();
    Service m_Service;
    std::string m_Request;
};
