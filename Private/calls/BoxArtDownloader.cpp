#include "BoxArtDownloader.h"

#include <algorithm>

#include "BoxArtNames.h"
#include "RawHttp.h"
#include "Url.h"
#include "ZVUtilities.h"

namespace {

// The largest size is below 100 KiB.
constexpr unsigned int kLargestImage = 4u << 20;

ZVString ImagePath(const ZVString& prefix, ZV_WS_BoxArtSize size)
{
    return ZVString("/images/boxart/") + ZVUtilities::BoxArtSize2FolderSize(size) + "/" + UrlEncode(prefix) +
           ZVUtilities::BoxArtSize2ImageSize(size) + ".jpg";
}

}  // namespace

// Takes an image's bytes: into memory, or into a file that becomes the image when it is whole.
class BoxArtDownloader::Sink {
public:
    /// In memory when there is no file.
    Sink(ImageFile* file, ZVString& target) : m_File(file), m_Target(target)
    {
        if (!file) target = ZVString();
    }

    ZV_WS_Status Open() { return !m_File || m_File->Create(m_Target) ? ZV_WS_Status_ok : ZV_WS_Status_net_error; }

    ZV_WS_Status Write(const char* bytes, size_t length)
    {
        if (!m_File) m_Target.append(bytes, length);
        return !m_File || m_File->Write(bytes, length) ? ZV_WS_Status_ok : ZV_WS_Status_file_operation_error;
    }

    ZV_WS_Status Commit() { return !m_File || m_File->Commit() ? ZV_WS_Status_ok : ZV_WS_Status_file_operation_error; }

private:
    ImageFile* m_File;
    ZVString& m_Target;
};

ZVString BoxArtDownloader::ImageURL(const Deployment& deployment, const ZVString& prefix, ZV_WS_BoxArtSize size)
{
    return ZVString("http://") + deployment.image_host + ImagePath(prefix, size);
}

ZV_WS_Status BoxArtDownloader::Download(const ZVString& prefix, ZV_WS_BoxArtSize size, const ZVString& ifModifiedSince,
                                        bool toFile, ZVString& target)
{
    m_LastModified = ZVString();
    m_ContentLength = 0;
    m_File = toFile ? std::make_unique<ImageFile>() : nullptr;
    Sink sink(m_File.get(), target);
    ZV_WS_Status status = Fetch(ImagePath(prefix, size), ifModifiedSince, sink);
    if (status == ZV_WS_Status_ok) status = sink.Commit();
    if (status != ZV_WS_Status_ok) m_File.reset();
    return status;
}

ZV_WS_Status BoxArtDownloader::Fetch(const ZVString& path, const ZVString& ifModifiedSince, Sink& sink)
{
    const ZVString& host = m_Transport.deployment().image_host;
    RawHttp http(m_Transport);
    if (!http.Connect(ZVString("http://") + host + path)) return ZV_WS_Status_connection_error;
    // What is kept of an older answer may be anything.
    const ZVString condition = IsHeaderText(ifModifiedSince.c_str()) ? ifModifiedSince : ZVString();
    if (!http.SendGet(path, host, RawHttp::Order::AgentFirst, condition) || !http.ReceiveHead()) {
        return ZV_WS_Status_net_error;
    }
    if (!http.StatusIs("HTTP/1.1 200 OK")) {
        if (http.Holds("HTTP/1.1 404 Not Found")) return ZV_WS_Status_file_not_found_on_server;
        if (http.Holds("HTTP/1.1 304 Not Modified")) return ZV_WS_Status_file_not_modified_on_server;
        return ZV_WS_Status_net_error;
    }
    http.Header("Last-Modified", m_LastModified);
    m_ContentLength = http.ContentLength();
    const char* body = nullptr;
    size_t received = 0;
    if (m_ContentLength < 1 || m_ContentLength > kLargestImage || !http.BodyStart(body, received)) {
        return ZV_WS_Status_net_error;
    }
    ZV_WS_Status status = sink.Open();
    char piece[RawHttp::kPiece];
    for (size_t rest = m_ContentLength; status == ZV_WS_Status_ok && rest > 0;) {
        received = std::min(received, rest);
        status = sink.Write(body, received);
        rest -= received;
        if (rest == 0 || status != ZV_WS_Status_ok) break;
        received = http.Receive(piece, std::min(rest, sizeof piece));
        if (received == 0) return ZV_WS_Status_net_error;
        body = piece;
    }
    return status;
}
