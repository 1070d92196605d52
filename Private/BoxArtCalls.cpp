// Title images, through the cache.
#include <string.h>

#include "BoxArtDownloader.h"
#include "BoxArtNames.h"
#include "CallGuard.h"
#include "Records.h"
#include "SessionImpl.h"
#include "ZVAssert.h"
#include "ZVFile.h"
#include "ZVUtilities.h"

namespace {

// Prefixes come from the network and become file names.
bool IsPlainName(const char* prefix)
{
    if (!prefix || !*prefix || strstr(prefix, "..")) return false;
    for (const char* c = prefix; *c; ++c) {
        if (static_cast<unsigned char>(*c) < 0x20 || *c == 0x7f || *c == '/' || *c == '\\') return false;
    }
    return true;
}

// An image's row in the cache.
struct Row {
    bool found = false;
    unsigned int size = 0;
    ZVString lastModified;
    unsigned int needUpdate = 0;
    ZVString data;
};

class BoxArt {
public:
    BoxArt(SessionImpl& session, ZV_WS_BoxArtSize size, const char* prefix)
        : m_Session(session), m_Size(size), m_Prefix(prefix), m_Downloader(session.m_Download.transport())
    {
        if (!session.Caches(ZV_WS_CacheParam::CacheData_BoxArtImage)) return;
        m_Kind = session.m_Params.CacheKind;
        m_Row.found =
            session.m_Cache->ReadBoxArt(m_Prefix, size, m_Row.size, m_Row.lastModified, m_Row.needUpdate, m_Row.data);
        if (m_Kind == CacheType_File) {
            m_FileName = ZVUtilities::GetBoxArtImageFileName(session.m_Params.CachePath.c_str(), prefix, size);
        }
    }

    /// The image in a file of a file cache: revalidated when it has to be, fetched when it is not there.
    ZV_WS_Status BringFile(ZVString& fileName)
    {
        fileName = m_FileName;
        if (!m_Row.found || !ZVFile::Exist(m_FileName.c_str())) return FetchFile();
        if (m_Row.needUpdate != 0) RevalidateFile();
        return ZV_WS_Status_ok;
    }

    ZV_WS_Status BringBytes(ZVString& bytes)
    {
        if (m_Kind == CacheType_File) {
            ZVString fileName;
            const ZV_WS_Status status = BringFile(fileName);
            if (status != ZV_WS_Status_ok) return status;
            return ReadFile(bytes) ? ZV_WS_Status_ok : ZV_WS_Status_file_operation_error;
        }
        if (m_Row.found && m_Row.needUpdate == 0) {
            bytes = m_Row.data;
            return ZV_WS_Status_ok;
        }
        return FetchBytes(bytes);
    }

    bool HasFile() const { return m_Kind == CacheType_File; }

private:
    ZV_WS_Status FetchFile()
    {
        const ZV_WS_Status status = m_Downloader.DownloadToFile(m_Prefix, m_Size, ZVString(), m_FileName);
        if (status == ZV_WS_Status_ok) WriteDownloaded(ZVString());
        return status;
    }

    // Whatever comes of it, the file stays one that can be used.
    void RevalidateFile()
    {
        const ZV_WS_Status status = m_Downloader.DownloadToFile(m_Prefix, m_Size, m_Row.lastModified, m_FileName);
        if (status == ZV_WS_Status_ok) WriteDownloaded(ZVString());
        if (status == ZV_WS_Status_file_not_modified_on_server) WriteUnchanged();
    }

    // From the host into a memory cache or none; what was cached before is used when the host has nothing better.
    ZV_WS_Status FetchBytes(ZVString& bytes)
    {
        const ZV_WS_Status status =
            m_Downloader.DownloadToBuffer(m_Prefix, m_Size, m_Row.found ? m_Row.lastModified : ZVString(), bytes);
        if (status == ZV_WS_Status_ok) {
            if (m_Kind == CacheType_Memory) WriteDownloaded(bytes);
            return status;
        }
        if (!m_Row.found) return status;
        bytes = m_Row.data;
        if (status == ZV_WS_Status_file_not_modified_on_server) WriteUnchanged();
        return ZV_WS_Status_ok;
    }

    void WriteDownloaded(const ZVString& data)
    {
        m_Session.m_Cache->WriteBoxArt(m_Prefix, m_Size, m_Downloader.GetContentLength(),
                                       m_Downloader.GetLastModified(), 0, data);
    }
    void WriteUnchanged()
    {
        m_Session.m_Cache->WriteBoxArt(m_Prefix, m_Size, m_Row.size, m_Row.lastModified, 0, m_Row.data);
    }

    bool ReadFile(ZVString& bytes) const
    {
        ZVFile file;
        if (!file.Open(m_FileName.c_str(), "rb")) return false;
        char piece[4096];
        for (zv_int64 count; (count = file.Read(piece, sizeof piece)) > 0;)
            bytes.append(piece, static_cast<size_t>(count));
        return !bytes.empty();
    }

    SessionImpl& m_Session;
    const ZV_WS_BoxArtSize m_Size;
    const ZVString m_Prefix;
    BoxArtDownloader m_Downloader;
    CacheType m_Kind = CacheType_None;  // of a cache that keeps images
    ZVString m_FileName;
    Row m_Row;
};

void SetImageByData(ZV_WS_Image& image, const ZVString& data)
{
    Records::Allocate(image.size, image.data, static_cast<unsigned int>(data.length()));
    if (image.size != 0) memcpy(image.data, data.c_str(), image.size);
}

}  // namespace

ZV_WS_Status ZV_WS_getBoxArtImageData(ZV_WS_Session* handle, ZV_WS_BoxArtSize size, const char* prefix,
                                      ZV_WS_Image* image)
{
    ZV_ASSERT(image != 0);
    return GuardCall([&] {
        Records::Tag(*image);
        if (!SessionOf(handle) || !IsPlainName(prefix)) return ZV_WS_Status_invalid_param;
        ZVString bytes;
        const ZV_WS_Status status = BoxArt(*handle->_pSessionImpl, size, prefix).BringBytes(bytes);
        if (status == ZV_WS_Status_ok) SetImageByData(*image, bytes);
        return status;
    });
}

ZV_WS_Status ZV_WS_getBoxArtImage(ZV_WS_Session* handle, ZV_WS_BoxArtSize size, const char* prefix, ZV_WS_String* place)
{
    ZV_ASSERT(place != 0);
    return GuardCall([&] {
        Records::Tag(*place);
        if (!SessionOf(handle) || !IsPlainName(prefix)) return ZV_WS_Status_invalid_param;
        SessionImpl& session = *handle->_pSessionImpl;
        BoxArt image(session, size, prefix);
        if (!image.HasFile()) {
            const Deployment& deployment = session.m_Download.transport().deployment();
            ZVUtilities::SetText(*place, BoxArtDownloader::ImageURL(deployment, prefix, size));
            return ZV_WS_Status_ok;
        }
        ZVString fileName;
        const ZV_WS_Status status = image.BringFile(fileName);
        if (status == ZV_WS_Status_ok) ZVUtilities::SetText(*place, fileName);
        return status;
    });
}
