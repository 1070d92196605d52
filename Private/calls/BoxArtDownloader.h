// Fetches title images from the image host, over the socket of a SOAP context.
#pragma once

#include <memory>

#include "ImageFile.h"
#include "Transport.h"
#include "ZVWSLib.h"

class BoxArtDownloader {
public:
    /// `transport` is borrowed; its kept connection is closed.
    explicit BoxArtDownloader(Transport& transport) : m_Transport(transport) {}
    virtual ~BoxArtDownloader() = default;

    /// Both ask for the image only if it has changed since `ifModifiedSince` (a Last-Modified of before; empty: at any
    /// rate): ZV_WS_Status_file_not_modified_on_server. The file is replaced only by a whole image.
    ZV_WS_Status DownloadToBuffer(const ZVString& prefix, ZV_WS_BoxArtSize size, const ZVString& ifModifiedSince,
                                  ZVString& data)
    {
        return Download(prefix, size, ifModifiedSince, false, data);
    }
    ZV_WS_Status DownloadToFile(const ZVString& prefix, ZV_WS_BoxArtSize size, const ZVString& ifModifiedSince,
                                const ZVString& fileName)
    {
        ZVString target = fileName;
        return Download(prefix, size, ifModifiedSince, true, target);
    }

    /// Of the last image that was downloaded.
    ZVString GetLastModified() const { return m_LastModified; }
    unsigned int GetContentLength() const { return m_ContentLength; }
    /// Its file, in its place and locked as long as the caller keeps it. Null for an image in memory.
    std::unique_ptr<ImageFile> TakeFile() { return std::move(m_File); }

    /// The image's address.
    static ZVString ImageURL(const Deployment& deployment, const ZVString& prefix, ZV_WS_BoxArtSize size);

private:
    class Sink;

    /// `target` is the name of the file, or takes the bytes.
    ZV_WS_Status Download(const ZVString& prefix, ZV_WS_BoxArtSize size, const ZVString& ifModifiedSince, bool toFile,
                          ZVString& target);
    ZV_WS_Status Fetch(const ZVString& path, const ZVString& ifModifiedSince, Sink& sink);

    Transport& m_Transport;
    unsigned int m_ContentLength = 0;
    ZVString m_LastModified;
    std::unique_ptr<ImageFile> m_File;
};
