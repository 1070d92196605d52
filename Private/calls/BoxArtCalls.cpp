// Title images, through the cache.
#include <string.h>

#include "CallGuard.h"
#include "ImageStore.h"
#include "Records.h"
#include "ZVAssert.h"
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
    return Records::Fill(*image, [&] {
        if (!SessionOf(handle) || !IsPlainName(prefix)) return ZV_WS_Status_invalid_param;
        ZVString bytes;
        const ZV_WS_Status status = ImageStore(*handle->_pSessionImpl, size, prefix).BringBytes(bytes);
        if (status == ZV_WS_Status_ok) SetImageByData(*image, bytes);
        return status;
    });
}

ZV_WS_Status ZV_WS_getBoxArtImage(ZV_WS_Session* handle, ZV_WS_BoxArtSize size, const char* prefix, ZV_WS_String* place)
{
    ZV_ASSERT(place != 0);
    return Records::Fill(*place, [&] {
        if (!SessionOf(handle) || !IsPlainName(prefix)) return ZV_WS_Status_invalid_param;
        SessionImpl& session = *handle->_pSessionImpl;
        ImageStore image(session, size, prefix);
        if (!image.KeepsFiles()) {
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
