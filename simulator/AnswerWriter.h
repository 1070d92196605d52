// Writes answers: as they are, or as a fault spoils them.
#pragma once

#include "Channel.h"
#include "Faults.h"
#include "Http.h"
#include "Server.h"
#include "SimulatedClock.h"

namespace simulator {

class AnswerWriter {
public:
    /// `gzip`: answers are compressed for clients that accept it.
    AnswerWriter(Server& server, Faults& faults, const SimulatedClock& clock, bool gzip)
        : m_Server(server), m_Faults(faults), m_Clock(clock), m_Gzip(gzip)
    {}

    /// False when no further request may follow on the connection.
    bool Send(Channel& channel, const HttpRequest& request, HttpResponse response, const Fault& fault);

private:
    struct Answer;

    void AddHeaders(HttpResponse& response, const Fault& fault) const;
    static void Fill(HttpResponse& response, bool packed, const Fault& fault);
    bool Drip(Channel& channel, const std::string& bytes, int pause);

    Server& m_Server;
    Faults& m_Faults;
    const SimulatedClock& m_Clock;
    const bool m_Gzip;
};

}  // namespace simulator
