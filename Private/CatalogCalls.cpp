// The catalogue: genres, titles and their details.
#include "Conversion.h"
#include "ServiceCall.h"

ZV_WS_Status ZV_WS_getNavigation(ZV_WS_Session* handle, ZV_WS_GenreArray* genres)
{
    ServiceCall<Operation::getNavigation> call("ZV_WS_getNavigation", handle, genres);
    if (!call.Accepts()) return call.Refusal();
    return call.Into(genres, [](const ZV1__GenreRequest* t, ZV_WS_GenreArray& to) {
        if (t->Genres) ZVUtilities::ZV1__ArrayOfGenre2ZV_WS_GenreArray(t->Genres, to);
    });
}

ZV_WS_Status ZV_WS_getTitles(ZV_WS_Session* handle, int genreID, const ZV_WS_Pagination* page, int purchaseType,
                             ZV_WS_TitlesResponse* titles)
{
    ServiceCall<Operation::getTitlesByNavigation> call("ZV_WS_getTitles", handle, titles);
    if (!call.Accepts(page)) return call.Refusal();
    call->GenreID = genreID;
    call->CurrentPageNumber = page->CurrentPageNumber;
    call->ItemsPerPage = page->ItemsPerPage;
    call->PurchaseType = static_cast<ZV1__StreamAPIPurchaseType>(purchaseType);
    return call.Into(titles, ZVUtilities::ZV1__GetTitlesResponse2ZV_WS_TitlesResponse);
}

ZV_WS_Status ZV_WS_getTitleListing(ZV_WS_Session* handle, int titleID, ZV_WS_TitleListingResponse* listing)
{
    ServiceCall<Operation::getTitleListing> call("ZV_WS_getTitleListing", handle, listing);
    if (!call.Accepts()) return call.Refusal();
    call->TitleID = titleID;
    return call.Into(listing, ZVUtilities::ZV1__TitleListingResponse2ZV_WS_TitleListingResponse);
}
