// The one owner of a title's image in the cache: its row in the database and, for a file cache, its file beside it.
//
// An image of a file cache is there when its row is and its file has the row's size; everything else is fetched anew. A
// fetched image is written as a whole file first and gets its row then, together with others (CacheWriter.h); an
// evicted one loses the row first. So the two never disagree for longer than until the next look at them.
//
// A local object of one call on one thread.
#pragma once

#include "BoxArtDownloader.h"
#include "SessionImpl.h"

class ImageStore {
public:
    ImageStore(SessionImpl& session, ZV_WS_BoxArtSize size, const char* prefix);

    /// Whether the session keeps images in files.
    bool KeepsFiles() const { return m_Kind == CacheType_File; }

    /// The image in its file: revalidated when it has to be, fetched when it is not there. Only with KeepsFiles.
    ZV_WS_Status BringFile(ZVString& fileName);

    /// The image's bytes, from whatever the session keeps images in, or the image host.
    ZV_WS_Status BringBytes(ZVString& bytes);

private:
    /// An image's row in the cache.
    struct Row {
        unsigned int size = 0;
        ZVString lastModified;
        unsigned int needUpdate = 0;
        ZVString data;  ///< In a memory cache.
    };

    bool FindRow();
    bool IsFileWhole() const;
    ZV_WS_Status FetchFile(const ZVString& ifModifiedSince);
    ZV_WS_Status FetchBytes(ZVString& bytes);
    bool ReadFile(ZVString& bytes) const;
    void WriteRow(const ZVString& data);

    SessionImpl& m_Session;
    const ZV_WS_BoxArtSize m_Size;
    const ZVString m_Prefix;
    BoxArtDownloader m_Downloader;
    CacheType m_Kind = CacheType_None;  // of a cache that keeps images
    ZVString m_FileName;
    Row m_Row;
};
