// What the log shows of the traffic, and what it never shows.
#include "TrafficLog.h"

#include <gtest/gtest.h>

namespace {

TEST(SecretFilter, LeavesSecretsOutWhereverThePiecesEnd)
{
    const struct {
        const char* message;
        const char* logged;
    } rows[] = {
        {"GET / HTTP/1.1\r\nHost: a\r\nproxy-authorization: Basic c2VjcmV0\r\nX: 1\r\n\r\n<a>1</a>",
         "GET / HTTP/1.1\r\nHost: a\r\nproxy-authorization: ***\r\nX: 1\r\n\r\n<a>1</a>"},
        {"HTTP/1.1 200 OK\r\n\r\n<ns:AuthToken x=\"1\">secret</ns:AuthToken><AuthTokens>open</AuthTokens>",
         "HTTP/1.1 200 OK\r\n\r\n<ns:AuthToken x=\"1\">***</ns:AuthToken><AuthTokens>open</AuthTokens>"},
        {"HTTP/1.1 200 OK\r\n\r\n<Password><![CDATA[secret]]></Password><PIN/>x<PIN></PIN>",
         "HTTP/1.1 200 OK\r\n\r\n<Password>***</Password><PIN/>x<PIN>***</PIN>"},
        {"HTTP/1.1 200 OK\r\nTransfer-Encoding: chunked\r\n\r\n5\r\n<Auth\r\n14\r\nToken>secret</AuthToken>",
         "HTTP/1.1 200 OK\r\nTransfer-Encoding: chunked\r\n\r\n"},
    };
    for (const auto& row : rows) {
        const std::string message = row.message;
        for (size_t cut = 0; cut <= message.size(); ++cut) {
            SecretFilter filter;
            ZVString logged = filter.Filter(message.data(), cut);
            logged += filter.Filter(message.data() + cut, message.size() - cut);
            ASSERT_STREQ(row.logged, logged.c_str()) << cut;
        }
    }
}

}  // namespace
