// The process's log while the object lives.
#pragma once

#include <algorithm>
#include <mutex>
#include <string>
#include <vector>

#include "ZV_Log.h"

class LogLines {
public:
    LogLines()
    {
        ZV_LogSetTarget(
            [](const char* text, unsigned int, void* self) {
                auto& lines = *static_cast<LogLines*>(self);
                const std::lock_guard<std::mutex> lock(lines.m_Mutex);
                lines.m_Lines.push_back(text);
            },
            this);
    }
    ~LogLines() { ZV_LogSetTarget(nullptr, nullptr); }
    LogLines(const LogLines&) = delete;
    LogLines& operator=(const LogLines&) = delete;

    void Clear()
    {
        const std::lock_guard<std::mutex> lock(m_Mutex);
        m_Lines.clear();
    }

    /// How many hold the text.
    int Count(const std::string& text) const
    {
        const std::lock_guard<std::mutex> lock(m_Mutex);
        return static_cast<int>(std::count_if(m_Lines.begin(), m_Lines.end(), [&](const std::string& line) {
            return line.find(text) != std::string::npos;
        }));
    }

private:
    mutable std::mutex m_Mutex;
    std::vector<std::string> m_Lines;
};
