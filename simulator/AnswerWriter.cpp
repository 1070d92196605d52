#include "AnswerWriter.h"

#include <algorithm>

#include "Chunked.h"

namespace simulator {

namespace {

// A header line of 1 KiB that means nothing.
std::string Filler()
{
    return "X-Filler: " + std::string(1012, 'x') + "\r\n";
}

}  // namespace

struct AnswerWriter::Answer {
    AnswerWriter& writer;
    Channel& channel;
    const HttpResponse& response;
    const Fault& fault;
    Framing framing;
    bool hasBody;

    std::string Head() const { return response.Head(framing); }
    std::string Whole() const { return Head() + response.body; }
    std::string Half() const { return response.body.substr(0, response.body.size() / 2); }
    /// Writes and ends the connection.
    bool Last(const std::string& bytes) const
    {
        channel.Write(bytes);
        channel.Close();
        return false;
    }
};

// How an answer with that fault is written; false when the connection has come to its end. The others' are written
// whole.
struct AnswerWriter::Way {
    const char* kind;
    bool (*write)(Answer& answer);
};

const AnswerWriter::Way AnswerWriter::kWays[] = {
    {"cut", [](Answer& a) { return a.Last(""); }},
    {"cut-header", [](Answer& a) { return a.Last(a.Head().substr(0, a.Head().size() / 2)); }},
    {"cut-body", [](Answer& a) { return a.Last(a.Head() + a.Half()); }},
    {"reset", [](Answer& a) { return a.channel.Reset(), false; }},
    {"stall", [](Answer& a) { return a.channel.Stall(), false; }},
    {"stall-header",
     [](Answer& a) {
         a.channel.Write(a.Head().substr(0, a.Head().size() / 2));
         return a.channel.Stall(), false;
     }},
    {"stall-body",
     [](Answer& a) {
         a.channel.Write(a.Head() + a.Half());
         return a.channel.Stall(), false;
     }},
    {"drip", [](Answer& a) { return a.writer.Drip(a.channel, a.Whole(), a.fault.Number(100)); }},
    {"hold", [](Answer& a) { return a.writer.m_Faults.WaitForClear(a.fault) && a.channel.Write(a.Whole()); }},
    {"split",
     [](Answer& a) {
         return a.channel.Write(a.Head()) && a.writer.m_Server.Pause(a.fault.Number(50)) &&
                a.channel.Write(a.response.body);
     }},
    {"no-http", [](Answer& a) { return a.Last("no protocol that anyone speaks\r\n\r\n"); }},
    {"short",
     [](Answer& a) {
         a.framing.announced += 100;
         return a.Last(a.Whole());
     }},
    {"long", [](Answer& a) { return a.channel.Write(a.Whole() + "left over"); }},
    {"stray", [](Answer& a) { return a.channel.Write(a.Whole() + kTimeoutAnswer); }},
    {"no-length",
     [](Answer& a) {
         a.framing.length = Framing::Unannounced;
         return a.Last(a.Whole());
     }},
    {"zero-length",
     [](Answer& a) {
         a.framing.length = Framing::Announced;
         a.framing.announced = 0;
         return a.channel.Write(a.Whole());
     }},
    {"chunked",
     [](Answer& a) {
         a.framing.length = Framing::Chunks;
         const auto size = static_cast<size_t>(std::max(a.fault.Number(1000), 1));
         return a.channel.Write(a.Head() + (a.hasBody ? Chunked(a.response.body, size) : ""));
     }},
    {"connection-close",
     [](Answer& a) {
         a.framing.keepAlive = false;
         return a.Last(a.Whole());
     }},
    {"http10",
     [](Answer& a) {
         a.framing = {Framing::Unannounced, 0, false, "HTTP/1.0"};
         return a.response.opensTunnel ? a.channel.Write(a.Head()) : a.Last(a.Whole());
     }},
    {"continue", [](Answer& a) { return a.channel.Write("HTTP/1.1 100 Continue\r\n\r\n" + a.Whole()); }},
    // Half of the right body, and text from there on.
    {"endless",
     [](Answer& a) {
         a.framing = {Framing::Unannounced, 0, false};
         const std::string piece(16384, 'x');
         bool more = a.channel.Write(a.Head() + a.Half());
         while (more)
             more = a.channel.Write(piece) && a.writer.m_Server.Pause(0);
         return false;
     }},
    {"endless-header",
     [](Answer& a) {
         bool more = a.channel.Write(a.Head().substr(0, a.Head().size() - 2));
         while (more)
             more = a.channel.Write(Filler()) && a.writer.m_Server.Pause(0);
         return false;
     }},
};

bool AnswerWriter::Send(Channel& channel, const HttpRequest& request, HttpResponse response, const Fault& fault)
{
    if (fault.Is("http")) {
        response.status = fault.Number(503);
        response.body.clear();
        response.opensTunnel = false;
    } else if (fault.Is("body")) {
        response.body = fault.value;
    } else if (fault.Is("garbage")) {
        response.body = "\x01\x02 this is no answer <<<";
    } else if (fault.Is("empty")) {
        response.body.clear();
    } else {
        Encode(response, request.AcceptsGzip(), fault);
    }
    AddHeaders(response, fault);
    const bool keepAlive = response.opensTunnel || request.KeepAlive();
    const size_t length = response.status == 304 ? 0 : response.body.size();
    const bool hasBody = request.method != "HEAD" && response.status != 304;
    if (!hasBody) response.body.clear();
    const Framing framing = {response.opensTunnel ? Framing::Unannounced : Framing::Announced, length, keepAlive};
    Answer answer = {*this, channel, response, fault, framing, hasBody && !response.opensTunnel};
    const auto way = std::find_if(std::begin(kWays), std::end(kWays), [&](const Way& w) { return fault.Is(w.kind); });
    if (!(way == std::end(kWays) ? channel.Write(answer.Whole()) : way->write(answer))) return false;
    if (!keepAlive) channel.Close();
    return keepAlive;
}

void AnswerWriter::AddHeaders(HttpResponse& response, const Fault& fault) const
{
    if (fault.Is("bad-date")) {
        response.headers.emplace_back("Date", "the day before yesterday");
    } else if (!fault.Is("no-date")) {
        const long long wrong = fault.Is("date") ? fault.Seconds(3600) : 0;
        response.headers.emplace_back("Date", HttpDate(m_Clock.Now() + static_cast<time_t>(wrong)));
    }
    if (fault.Is("age")) response.headers.emplace_back("Age", std::to_string(fault.Number(60)));
    if (fault.Is("http") && response.status == 302) {
        response.headers.emplace_back("Location", "https://localhost/elsewhere");
    }
    if (fault.retryAfter >= 0) response.headers.emplace_back("Retry-After", std::to_string(fault.retryAfter));
    for (int i = 0; fault.Is("headers") && i < fault.Number(64); ++i)
        response.headers.emplace_back("X-Filler", std::string(1012, 'x'));
}

void AnswerWriter::Encode(HttpResponse& response, bool accepted, const Fault& fault) const
{
    const bool bomb = fault.Is("bomb");
    if (!bomb && !fault.Is("damaged-gzip") && !fault.Is("wrong-checksum") && !(m_Gzip && accepted)) return;
    if (bomb) response.body += std::string(static_cast<size_t>(fault.Number(256)) << 20, ' ');
    response.headers.emplace_back("Content-Encoding", "gzip");
    response.body = Gzip(response.body);
    // The last eight bytes are the checksum and the length.
    if (fault.Is("wrong-checksum")) response.body[response.body.size() - 8] ^= 0x55;
    if (fault.Is("damaged-gzip")) {
        for (size_t i = response.body.size() / 2; i < response.body.size(); i += 3)
            response.body[i] ^= 0x55;
    }
}

bool AnswerWriter::Drip(Channel& channel, const std::string& bytes, int pause)
{
    for (const char byte : bytes) {
        if (!channel.Write(std::string(1, byte)) || !m_Server.Pause(pause)) return false;
    }
    return true;
}

}  // namespace simulator
