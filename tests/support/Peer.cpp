#include "Peer.h"

#include <string.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <iterator>

#include "Require.h"

// The peer's ends of the connections, from which nothing ever comes, by the context's descriptor. Memory may be short.
static int s_FarEnds[4096];

Peer* Peer::s_Current;

Peer::Peer(std::string_view answer, size_t piece) : m_Answer(answer), m_Piece(std::max<size_t>(piece, 1))
{
    s_Current = this;
}

Peer::~Peer()
{
    Require(m_Open == 0, "every connection was closed");
    s_Current = nullptr;
}

void Peer::Attach(soap& context)
{
    context.fopen = Open;
    context.fsend = [](soap*, const char*, size_t) { return SOAP_OK; };
    context.frecv = Receive;
    context.fclosesocket = [](soap*, SOAP_SOCKET socket) {
        --s_Current->m_Open;
        close(s_FarEnds[socket]);
        return close(socket);
    };
}

SOAP_SOCKET Peer::Open(soap* context, const char*, const char*, int)
{
    if (s_Current->m_Accepts == 0) {
        context->error = SOAP_TCP_ERROR;
        return SOAP_INVALID_SOCKET;
    }
    --s_Current->m_Accepts;
    ++s_Current->m_Open;
    s_Current->m_At = 0;
    context->error = SOAP_OK;
    int ends[2];
    Require(socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends) == 0, "a connection");
    Require(ends[0] < static_cast<int>(std::size(s_FarEnds)), "few descriptors");
    s_FarEnds[ends[0]] = ends[1];
    return ends[0];
}

size_t Peer::Receive(soap*, char* buffer, size_t size)
{
    Peer& self = *s_Current;
    const size_t count = std::min({size, self.m_Piece, self.m_Answer.size() - self.m_At});
    memcpy(buffer, self.m_Answer.data() + self.m_At, count);
    self.m_At += count;
    return count;
}

void MemoryCache::Preset(std::string_view text)
{
    m_Preset.assign(text.data(), text.size());
    m_PresetReads = 3;
}

bool MemoryCache::ReadMetaData(const ZVString& name, const ZVString& key, ZVString& value)
{
    if (m_PresetReads > 0) {
        --m_PresetReads;
        value = m_Preset;
        return true;
    }
    const auto found = m_Texts.find(std::string(name.c_str()) + '\n' + key.c_str());
    if (found == m_Texts.end()) return false;
    value = found->second;
    return true;
}

bool MemoryCache::WriteMetaData(const ZVString& name, const ZVString& key, const ZVString& value)
{
    m_Texts[std::string(name.c_str()) + '\n' + key.c_str()] = value;
    return true;
}

PeerSession::PeerSession()
{
    m_Handle._pImpl = new unsigned int(SessionImpl::kTag);
    m_Handle._pSessionImpl = new SessionImpl;
    SessionImpl& own = session();
    ZV_WS_SetupParams2& params = own.m_Params;
    params.APIKey = "desktop";
    params.Customer->ChangeToken("token");
    params.DestinationUniqueID = "device";
    params.UserName = "customer";
    params.Password = "secret";
    params.ServiceBaseURL = "http://127.0.0.1:1/api/";
    params.CacheKind = CacheType_Memory;
    params.CacheData = ZV_WS_CacheParam::CacheData_Metadata | ZV_WS_CacheParam::CacheData_Userdata;
    own.m_Browse.SetParams(&params);
    own.m_Stream.SetParams(&params);
    own.m_Download.SetParams(&params);
    own.m_Facade.Init(&own.m_Stream, &own.m_Download, ACCESS_TYPE_STREAM);
    Peer::Attach(own.m_Browse);
    Peer::Attach(own.m_Stream);
    Peer::Attach(own.m_Download);
    own.m_Cache = std::make_unique<MemoryCache>();
    own.m_IsSetUp = true;
}
