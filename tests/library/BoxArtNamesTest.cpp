#include "BoxArtNames.h"

#include <gtest/gtest.h>

namespace {

TEST(BoxArtNamesTest, OneSizeHasAFolderOfAnotherName)
{
    const struct {
        int size;
        const char* folder;
        const char* image;
    } rows[] = {
        {BOX_ART_SIZE_95, "95", "95"},
        {BOX_ART_SIZE_126, "126", "126"},
        {BOX_ART_SIZE_135S, "135s", "135"},
        {BOX_ART_SIZE_137, "137", "137"},
        {BOX_ART_SIZE_321, "321", "321"},
        {13, "", ""},
        {-1, "", ""},
    };
    for (const auto& row : rows) {
        EXPECT_STREQ(row.folder, ZVUtilities::BoxArtSize2FolderSize(static_cast<ZV_WS_BoxArtSize>(row.size)));
        EXPECT_STREQ(row.image, ZVUtilities::BoxArtSize2ImageSize(static_cast<ZV_WS_BoxArtSize>(row.size)));
    }
}

}  // namespace
