// The connections of ZV_WS_getServerTime, which belong to no session.
#pragma once

#include "Transport.h"

/// Breaks off every one that is under way. Any thread.
void AbortClockQueries();

/// One of them, while it lives.
class ClockQuery {
public:
    /// `context` is borrowed. `timeout` in seconds, to connect and again for the answer.
    ClockQuery(soap& context, int timeout);
    ~ClockQuery();
    ClockQuery(const ClockQuery&) = delete;
    ClockQuery& operator=(const ClockQuery&) = delete;

    Transport& transport() { return m_Transport; }

private:
    Transport m_Transport;
};
