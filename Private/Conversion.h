// From the services' records to the library's, each function named after both.
//
// The first argument is borrowed and must not be null, the second is a tagged, empty record. What the service left out becomes 0,
// false, null or an empty array. Memory exhaustion is thrown (std::bad_alloc) and leaves a record that can be released.
#pragma once

#include "ZVWSLib.h"
#include "soapStub.h"

namespace ZVUtilities {

void ZV1__StandardResponse2ZV_WS_StandardResponse(const ZV1__StandardResponse* t, ZV_WS_StandardResponse& to);
void ZV1__TitleListing2ZV_WS_TitleListing(const ZV1__TitleListing* t, ZV_WS_TitleListing& to);
void ZV1__ArrayOfTitleListing2ZV_WS_TitleListingArray(const ZV1__ArrayOfTitleListing* t, ZV_WS_TitleListingArray& to);
void ZV1__TitleListingResponse2ZV_WS_TitleListingResponse(const ZV1__TitleListingResponse* t,
                                                          ZV_WS_TitleListingResponse& to);
void ZV1__GetTitlesResponse2ZV_WS_TitlesResponse(const ZV1__GetTitlesResponse* t, ZV_WS_TitlesResponse& to);
void ZV1__ArrayOfGenre2ZV_WS_GenreArray(const ZV1__ArrayOfGenre* t, ZV_WS_GenreArray& to);
void ZV1__FileType2ZV_WS_FileType(const ZV1__FileType* t, ZV_WS_FileType& to);

}  // namespace ZVUtilities
