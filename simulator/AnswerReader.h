// Follows an answer of HTTP/1.1, wherever its bytes are cut: where it ends, and what it holds.
#pragma once

#include "Chunked.h"
#include "Http.h"

namespace simulator {

class AnswerReader {
public:
    /// `bodiless`: of a request whose answer has no body (HEAD).
    explicit AnswerReader(bool bodiless) : m_Bodiless(bodiless) {}

    void Take(const std::string& bytes);
    /// The connection has ended.
    void End() { m_Done = m_HeadDone && m_End == BodyEnd::Connection; }

    /// The whole answer has come; never without End when only the connection's end tells.
    bool Done() const { return m_Done; }
    /// Another request may follow on its connection.
    bool KeepAlive() const { return m_Done && m_End != BodyEnd::Connection && m_KeepAlive; }

    /// What has come of the answer, without the headers that concern its connection.
    const HttpResponse& Response() const { return m_Response; }
    void DropBody() { m_Response.body.clear(); }

private:
    enum class BodyEnd { Length, Chunks, Connection };
    bool TakeHead();
    void TakeBody();

    const bool m_Bodiless;
    std::string m_Bytes;  // not looked at yet
    bool m_HeadDone = false;
    bool m_Done = false;
    bool m_KeepAlive = false;
    BodyEnd m_End = BodyEnd::Connection;
    size_t m_Left = 0;
    ChunkReader m_Chunks;
    HttpResponse m_Response;
};

}  // namespace simulator
