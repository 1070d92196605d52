#include "AnswerWriter.h"

#include <algorithm>

#include "Chunked.h"

namespace simulator {

namespace {

// A header line of 1 KiB that means nothing.
const std::pair<std::string, std::string> kFiller = {"X-Filler", std::string(1012, 'x')};

void Pack(HttpResponse& response)
{
    response.headers.emplace_back("Content-Encoding", "gzip");
    response.body = Gzip(response.body);
}

}  // namespace

// How an answer is written with each kind of fault; false when the connection has come to its end.
struct AnswerWriter::Answer {
    AnswerWriter& writer;
    Channel& channel;
    const HttpResponse& response;
    const Fault& fault;
    Framing framing;
    bool hasBody;

    bool operator()(Breaking kind);
    bool operator()(Cutting kind);
    bool operator()(Pacing kind);
    bool operator()(Bounding kind);
    bool operator()(Endless kind);
    // Whole, when nothing is wrong, or with what has been done to it before; some happen to a connection alone.
    bool operator()(std::monostate) { return Write(Whole()); }
    bool operator()(Heading) { return Write(Whole()); }
    bool operator()(Content) { return Write(Whole()); }
    bool operator()(Result) { return Write(Whole()); }
    bool operator()(Shape) { return Write(Whole()); }
    bool operator()(Picture) { return Write(Whole()); }
    bool operator()(TunnelEnd) { return Write(Whole()); }
    bool operator()(Opening) { return Write(Whole()); }

private:
    std::string Head() const { return response.Head(framing); }
    std::string Whole() const { return Head() + response.body; }
    std::string HalfHead() const { return Head().substr(0, Head().size() / 2); }
    std::string HalfBody() const { return response.body.substr(0, response.body.size() / 2); }
    bool Write(const std::string& bytes) const { return channel.Write(bytes); }
    // Writes and ends the connection.
    bool Last(const std::string& bytes) const
    {
        channel.Write(bytes);
        channel.Close();
        return false;
    }
    // Writes, and then nothing more.
    bool Stall(const std::string& bytes) const
    {
        channel.Write(bytes);
        channel.Stall();
        return false;
    }
};

bool AnswerWriter::Answer::operator()(Breaking kind)
{
    switch (kind) {
        case Breaking::Reset:
            channel.Reset();
            return false;
        case Breaking::Stall:
            return Stall("");
        case Breaking::NoHttp:
            return Last("no protocol that anyone speaks\r\n\r\n");
    }
    return false;
}

bool AnswerWriter::Answer::operator()(Cutting kind)
{
    switch (kind) {
        case Cutting::Cut:
            return Last("");
        case Cutting::CutHeader:
            return Last(HalfHead());
        case Cutting::CutBody:
            return Last(Head() + HalfBody());
        case Cutting::StallHeader:
            return Stall(HalfHead());
        case Cutting::StallBody:
            return Stall(Head() + HalfBody());
    }
    return false;
}

bool AnswerWriter::Answer::operator()(Pacing kind)
{
    switch (kind) {
        case Pacing::Drip:
            return writer.Drip(channel, Whole(), fault.Number(100));
        case Pacing::Hold:
            return writer.m_Faults.WaitForClear(fault) && Write(Whole());
        case Pacing::Split:
            return Write(Head()) && writer.m_Server.Pause(fault.Number(50)) && Write(response.body);
    }
    return false;
}

bool AnswerWriter::Answer::operator()(Bounding kind)
{
    switch (kind) {
        case Bounding::Short:
            framing.announced += 100;
            return Last(Whole());
        case Bounding::Long:
            return Write(Whole() + "left over");
        case Bounding::Stray:
            return Write(Whole() + kTimeoutAnswer);
        case Bounding::NoLength:
            framing.length = Framing::Unannounced;
            return Last(Whole());
        case Bounding::ZeroLength:
            framing.length = Framing::Announced;
            framing.announced = 0;
            return Write(Whole());
        case Bounding::Chunked: {
            framing.length = Framing::Chunks;
            const auto size = static_cast<size_t>(std::max(fault.Number(1000), 1));
            return Write(Head() + (hasBody ? Chunked(response.body, size) : ""));
        }
        case Bounding::ConnectionClose:
            framing.keepAlive = false;
            return Last(Whole());
        case Bounding::Http10:
            framing = {Framing::Unannounced, 0, false, "HTTP/1.0"};
            return response.opensTunnel ? Write(Head()) : Last(Whole());
        case Bounding::Continue:
            return Write("HTTP/1.1 100 Continue\r\n\r\n" + Whole());
    }
    return false;
}

bool AnswerWriter::Answer::operator()(Endless kind)
{
    std::string piece(16384, 'x');
    switch (kind) {
        case Endless::Body:
            // Half of the right one, and text from there on.
            framing = {Framing::Unannounced, 0, false};
            channel.Write(Head() + HalfBody());
            break;
        case Endless::Header:
            channel.Write(Head().substr(0, Head().size() - 2));
            piece = kFiller.first + ": " + kFiller.second + "\r\n";
            break;
    }
    while (channel.Write(piece) && writer.m_Server.Pause(0)) {
    }
    return false;
}

bool AnswerWriter::Send(Channel& channel, const HttpRequest& request, HttpResponse response, const Fault& fault)
{
    Fill(response, m_Gzip && request.AcceptsGzip(), fault);
    AddHeaders(response, fault);
    const bool keepAlive = response.opensTunnel || request.KeepAlive();
    const size_t length = response.status == 304 ? 0 : response.body.size();
    const bool hasBody = request.method != "HEAD" && response.status != 304;
    if (!hasBody) response.body.clear();
    const Framing framing = {response.opensTunnel ? Framing::Unannounced : Framing::Announced, length, keepAlive};
    Answer answer = {*this, channel, response, fault, framing, hasBody && !response.opensTunnel};
    if (!std::visit(answer, fault.Kind())) return false;
    if (!keepAlive) channel.Close();
    return keepAlive;
}

// The body as the fault has it, compressed when the client may have it so.
void AnswerWriter::Fill(HttpResponse& response, bool packed, const Fault& fault)
{
    const Content* kind = fault.As<Content>();
    if (!kind) return packed ? Pack(response) : void();
    switch (*kind) {
        case Content::Status:
            response.status = fault.Number(503);
            response.body.clear();
            response.opensTunnel = false;
            return;
        case Content::Body:
            response.body = fault.value;
            return;
        case Content::Garbage:
            response.body = "\x01\x02 this is no answer <<<";
            return;
        case Content::Empty:
            response.body.clear();
            return;
        case Content::Bomb:
            response.body += std::string(static_cast<size_t>(fault.Number(256)) << 20, ' ');
            return Pack(response);
        case Content::DamagedGzip:
            Pack(response);
            for (size_t i = response.body.size() / 2; i < response.body.size(); i += 3)
                response.body[i] ^= 0x55;
            return;
        case Content::WrongChecksum:
            // The last eight bytes are the checksum and the length.
            Pack(response);
            response.body[response.body.size() - 8] ^= 0x55;
            return;
    }
}

void AnswerWriter::AddHeaders(HttpResponse& response, const Fault& fault) const
{
    std::string date = HttpDate(m_Clock.Now());
    if (const Heading* kind = fault.As<Heading>()) {
        switch (*kind) {
            case Heading::Date:
                date = HttpDate(m_Clock.Now() + static_cast<time_t>(fault.Seconds(3600)));
                break;
            case Heading::BadDate:
                date = "the day before yesterday";
                break;
            case Heading::NoDate:
                date.clear();
                break;
            case Heading::Age:
                response.headers.emplace_back("Age", std::to_string(fault.Number(60)));
                break;
            case Heading::Headers:
                response.headers.insert(response.headers.end(), static_cast<size_t>(fault.Number(64)), kFiller);
                break;
        }
    }
    if (!date.empty()) response.headers.emplace_back("Date", date);
    if (fault.Is(Content::Status) && response.status == 302) {
        response.headers.emplace_back("Location", "https://localhost/elsewhere");
    }
    if (fault.retryAfter >= 0) response.headers.emplace_back("Retry-After", std::to_string(fault.retryAfter));
}

bool AnswerWriter::Drip(Channel& channel, const std::string& bytes, int pause)
{
    for (const char byte : bytes) {
        if (!channel.Write(std::string(1, byte)) || !m_Server.Pause(pause)) return false;
    }
    return true;
}

}  // namespace simulator
