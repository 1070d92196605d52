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
        m_Duration = duration;
        m_State = ZVPlayerLibAE::kStopped;
        m_Position = 0;
    }
    void Close() { *this = PlaybackClock(); }

    State StateAt(Time now) const
    {
        return m_State == ZVPlayerLibAE::kPlaying && PositionAt(now) == m_Duration ? ZVPlayerLibAE::kEnded : m_State;
    }
    int64_t PositionAt(Time now) const
    {
        if (m_State != ZVPlayerLibAE::kPlaying) return m_Position;
        const auto played = std::chrono::duration_cast<std::chrono::milliseconds>(now - m_Since).count();
        return std::min(m_Position + played, m_Duration);
    }
    int64_t Duration() const { return m_Duration; }

    // A movie is open for the rest.
    void PlayFrom(int64_t position, Time now)
    {
        m_Position = position;
        m_Since = now;
        m_State = ZVPlayerLibAE::kPlaying;
    }
    void Pause(Time now)
    {
        m_Position = PositionAt(now);
        m_State = ZVPlayerLibAE::kPaused;
    }
    void Stop()
    {
        m_Position = 0;
        m_State = ZVPlayerLibAE::kStopped;
    }

private:
    State m_State = ZVPlayerLibAE::kNoPlayer;
    int64_t m_Duration = 0;
    int64_t m_Position = 0;  // where it rests; while it plays, where it was at m_Since
    Time m_Since;
};
