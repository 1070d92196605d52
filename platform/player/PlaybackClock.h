// A movie that only passes time: position and state follow from a clock, which the caller reads. Not locked.
#pragma once

#include <stdint.h>

#include <algorithm>
#include <chrono>

#include "player/ZVPlayerLibAE.h"

class PlaybackClock {
public:
    typedef std::chrono::steady_clock::time_point Time;
    typedef ZVPlayerLibAE::PlaybackState State;

    void Open(int64_t duration)
    {
        m_duration = duration;
        m_state = ZVPlayerLibAE::kStopped;
        m_position = 0;
    }
    void Close() { *this = PlaybackClock(); }

    State StateAt(Time now) const
    {
        return m_state == ZVPlayerLibAE::kPlaying && PositionAt(now) == m_duration ? ZVPlayerLibAE::kEnded : m_state;
    }
    int64_t PositionAt(Time now) const
    {
        if (m_state != ZVPlayerLibAE::kPlaying) return m_position;
        const auto played = std::chrono::duration_cast<std::chrono::milliseconds>(now - m_since).count();
        return std::min(m_position + played, m_duration);
    }
    int64_t Duration() const { return m_duration; }

    // A movie is open for the rest.
    void PlayFrom(int64_t position, Time now)
    {
        m_position = position;
        m_since = now;
        m_state = ZVPlayerLibAE::kPlaying;
    }
    void Pause(Time now)
    {
        m_position = PositionAt(now);
        m_state = ZVPlayerLibAE::kPaused;
    }
    void Stop()
    {
        m_position = 0;
        m_state = ZVPlayerLibAE::kStopped;
    }

private:
    State m_state = ZVPlayerLibAE::kNoPlayer;
    int64_t m_duration = 0;
    int64_t m_position = 0;  // where it rests; while it plays, where it was at m_since
    Time m_since;
};
