#include "BoxArtNames.h"

#include "ZVFile.h"

namespace {

struct SizeNames {
    const char* folder;
    const char* image;
};

// By ZV_WS_BoxArtSize.
const SizeNames kSizes[] = {
    {"95", "95"},   {"175", "175"}, {"65", "65"},   {"77", "77"},   {"102", "102"}, {"126", "126"}, {"135s", "135"},
    {"137", "137"}, {"153", "153"}, {"177", "177"}, {"203", "203"}, {"269", "269"}, {"321", "321"},
};

SizeNames NamesOf(ZV_WS_BoxArtSize size)
{
    constexpr int count = sizeof kSizes / sizeof kSizes[0];
    return size >= 0 && size < count ? kSizes[size] : SizeNames{"", ""};
}

}  // namespace

namespace ZVUtilities {

const char* BoxArtSize2FolderSize(ZV_WS_BoxArtSize size)
{
    return NamesOf(size).folder;
}

const char* BoxArtSize2ImageSize(ZV_WS_BoxArtSize size)
{
    return NamesOf(size).image;
}

ZVString GetBoxArtImageFileName(const char* path, const char* boxartprefix, ZV_WS_BoxArtSize size)
{
    ZV_ASSERT((path != 0) && (boxartprefix != 0));
    return ZVFile::GetFolderName(path) + boxartprefix + BoxArtSize2ImageSize(size) + ".jpg";
}

}  // namespace ZVUtilities
