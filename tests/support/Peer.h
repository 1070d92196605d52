// The other end of SOAP contexts' connections, in memory, and a session that has it for its services.
#pragma once

#include <map>
#include <string>
#include <string_view>

#include "CacheMgr.h"
#include "SessionImpl.h"

/// Answers every connection with the same bytes and swallows what is sent. One exists at a time.
class Peer {
public:
    /// `answer` is borrowed. `piece`: the most bytes that one receive gets.
    explicit Peer(std::string_view answer, size_t piece = 65536);
    /// Every connection has been closed by then.
    ~Peer();
    Peer(const Peer&) = delete;
    Peer& operator=(const Peer&) = delete;

    /// From now on the context's connections lead to the peer that exists then.
    static void Attach(soap& context);

    /// How many further connections are accepted.
    void Accept(int connections) { m_Accepts = connections; }

private:
    static SOAP_SOCKET Open(soap* context, const char* endpoint, const char* host, int port);
    static size_t Receive(soap* context, char* buffer, size_t size);

    static Peer* s_Current;
    const std::string_view m_Answer;
    const size_t m_Piece;
    size_t m_At = 0;
    int m_Accepts = 4;  // a call that walks pages gets the same one each time
    int m_Open = 0;
};

/// What a session stored, by table and key. The rest is a cache that was never opened, which has nothing.
class MemoryCache : public CacheMgr {
public:
    /// Every table answers with `text`, a few times.
    void Preset(std::string_view text);
    bool empty() const { return m_Texts.empty(); }

    bool ReadMetaData(const ZVString& name, const ZVString& key, ZVString& value) override;
    bool WriteMetaData(const ZVString& name, const ZVString& key, const ZVString& value) override;
    bool ReadUserData(const ZVString& name, const ZVString& key, ZVString& value) override
    {
        return ReadMetaData(name, key, value);
    }
    bool WriteUserData(const ZVString& name, const ZVString& key, const ZVString& value) override
    {
        return WriteMetaData(name, key, value);
    }
    bool ReadWishlistFlag(int, bool&) override { return false; }
    bool WriteWishlistFlag(int, bool) override { return false; }
    bool Together(const std::function<bool()>& work) override { return work(); }
    bool Look(const std::function<bool()>& work) override { return work(); }
    unsigned int Generation() override { return 1; }
    bool PurgeUserData(const ZVString&) override { return true; }

private:
    std::map<std::string, ZVString> m_Texts;
    ZVString m_Preset;
    int m_PresetReads = 0;
};

/// A session as ZV_WS_initialize makes one, whose services are the current peer.
class PeerSession {
public:
    PeerSession();
    ~PeerSession() { ZV_WS_release(&m_Handle); }
    PeerSession(const PeerSession&) = delete;
    PeerSession& operator=(const PeerSession&) = delete;

    ZV_WS_Session* handle() { return &m_Handle; }
    SessionImpl& session() { return *m_Handle._pSessionImpl; }
    MemoryCache& cache() { return static_cast<MemoryCache&>(*session().m_Cache); }

private:
    ZV_WS_Session m_Handle;
};
