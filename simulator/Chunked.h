// A body that comes in chunks.
#pragma once

#include <string>

namespace simulator {

/// Follows one, wherever its bytes are cut.
class ChunkReader {
public:
    /// Takes bytes up to the body's end and appends what they hold to `content`. How many it took.
    size_t Take(const std::string& bytes, std::string& content);
    bool Done() const { return m_State == State::Done; }
    /// What came is no such body.
    bool Failed() const { return m_State == State::Failed; }

private:
    enum class State { Size, Content, AfterContent, Trailer, Done, Failed };
    void TakeLine(const std::string& line);

    State m_State = State::Size;
    std::string m_Line;  // what has come of it
    size_t m_Left = 0;   // of the chunk
};

/// The content as such a body, `size` bytes a chunk.
std::string Chunked(const std::string& content, size_t size);

}  // namespace simulator
