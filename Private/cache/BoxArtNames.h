// How the images of a title are named, at the image host and next to the cache database. May be called from any thread.
#pragma once

#include "ZVString.h"
#include "ZVWSLib.h"

namespace ZVUtilities {

/// The size's part of an image's folder and of its file name ("135s" and "135" for BOX_ART_SIZE_135S, else the same
/// text twice); "" for a number that is no size.
const char* BoxArtSize2FolderSize(ZV_WS_BoxArtSize size);
const char* BoxArtSize2ImageSize(ZV_WS_BoxArtSize size);

/// The image's file: in the folder of `path`, the cache database. Nothing is checked here: prefixes come from the
/// network.
ZVString GetBoxArtImageFileName(const char* path, const char* boxartprefix, ZV_WS_BoxArtSize size);

}  // namespace ZVUtilities
