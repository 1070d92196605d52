#include "ImageStore.h"

#include <sys/stat.h>

#include "BoxArtNames.h"
#include "ZVUtilities.h"

ImageStore::ImageStore(SessionImpl& session, ZV_WS_BoxArtSize size, const char* prefix)
    : m_Session(session), m_Size(size), m_Prefix(prefix), m_Downloader(session.m_Download.transport())
{
    if (!session.Caches(ZV_WS_CacheParam::CacheData_BoxArtImage)) return;
    m_Kind = session.m_Params.CacheKind;
    if (KeepsFiles())
        m_FileName = ZVUtilities::GetBoxArtImageFileName(session.m_Params.CachePath.c_str(), prefix, size);
}

bool ImageStore::FindRow()
{
    ZV_BoxArtRow waiting;
    if (KeepsFiles() && m_Session.m_Writer->Find(m_Prefix, m_Size, waiting)) {
        m_Row = {waiting.size, waiting.lastModified, waiting.needUpdate, ZVString()};
        return true;
    }
    return m_Kind != CacheType_None && m_Session.m_Cache->ReadBoxArt(m_Prefix, m_Size, m_Row.size, m_Row.lastModified,
                                                                     m_Row.needUpdate, m_Row.data);
}

// ---- In files

bool ImageStore::IsFileWhole() const
{
    struct stat file;
    return m_Row.size != 0 && stat(m_FileName.c_str(), &file) == 0 && S_ISREG(file.st_mode) &&
           file.st_size == static_cast<off_t>(m_Row.size);
}

ZV_WS_Status ImageStore::BringFile(ZVString& fileName)
{
    fileName = m_FileName;
    if (!FindRow() || !IsFileWhole()) return FetchFile(ZVString());
    if (m_Row.needUpdate == 0) return ZV_WS_Status_ok;
    // Whatever comes of it, the image that there is can be used; but another session may just have evicted it.
    FetchFile(m_Row.lastModified);
    return IsFileWhole() ? ZV_WS_Status_ok : FetchFile(ZVString());
}

ZV_WS_Status ImageStore::FetchFile(const ZVString& ifModifiedSince)
{
    const ZV_WS_Status status = m_Downloader.DownloadToFile(m_Prefix, m_Size, ifModifiedSince, m_FileName);
    if (status == ZV_WS_Status_ok)
        m_Row = {m_Downloader.GetContentLength(), m_Downloader.GetLastModified(), 0, ZVString()};
    else if (status == ZV_WS_Status_file_not_modified_on_server)
        m_Row.needUpdate = 0;
    else
        return status;
    m_Session.m_Writer->Add({m_Prefix, m_Size, m_Row.size, m_Row.lastModified, m_Row.needUpdate},
                            m_Downloader.TakeFile());
    return status;
}

bool ImageStore::ReadFile(ZVString& bytes) const
{
    ZVFile file;
    bytes = ZVString();
    if (!file.Open(m_FileName.c_str(), "rb")) return false;
    char piece[4096];
    for (zv_int64 count; (count = file.Read(piece, sizeof piece)) > 0;)
        bytes.append(piece, static_cast<size_t>(count));
    return m_Row.size != 0 && bytes.length() == m_Row.size;
}

// ---- In memory, or nowhere

ZV_WS_Status ImageStore::BringBytes(ZVString& bytes)
{
    if (!KeepsFiles()) {
        const bool isThere = FindRow() && m_Row.size != 0 && m_Row.data.length() == m_Row.size;
        if (!isThere) m_Row = Row();
        if (!isThere || m_Row.needUpdate != 0) return FetchBytes(bytes);
        bytes = m_Row.data;
        return ZV_WS_Status_ok;
    }
    ZVString fileName;
    ZV_WS_Status status = BringFile(fileName);
    if (status != ZV_WS_Status_ok || ReadFile(bytes)) return status;
    // It went while it was read.
    status = FetchFile(ZVString());
    return status != ZV_WS_Status_ok || ReadFile(bytes) ? status : ZV_WS_Status_file_operation_error;
}

// What was cached before is used when the host has nothing better.
ZV_WS_Status ImageStore::FetchBytes(ZVString& bytes)
{
    const ZV_WS_Status status = m_Downloader.DownloadToBuffer(m_Prefix, m_Size, m_Row.lastModified, bytes);
    if (status == ZV_WS_Status_ok) {
        m_Row = {m_Downloader.GetContentLength(), m_Downloader.GetLastModified(), 0, ZVString()};
        if (m_Kind == CacheType_Memory) WriteRow(bytes);
        return status;
    }
    if (m_Row.data.empty()) return status;
    bytes = m_Row.data;
    m_Row.needUpdate = 0;
    if (status == ZV_WS_Status_file_not_modified_on_server) WriteRow(bytes);
    return ZV_WS_Status_ok;
}

void ImageStore::WriteRow(const ZVString& data)
{
    m_Session.m_Cache->WriteBoxArt(m_Prefix, m_Size, m_Row.size, m_Row.lastModified, m_Row.needUpdate, data);
}
