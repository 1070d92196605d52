#include "Conversion.h"

#include "Records.h"
#include "ZVAssert.h"
#include "ZVUtilities.h"

namespace {

// One member: texts are copied to the heap, numbers, booleans and enumerations keep their number.
void Copy(const char* from, char*& to) { to = ZVUtilities::StrDup(from); }

template <class From, class To>
void Copy(const From& from, To& to)
{
    to = static_cast<To>(from);
}

// The elements of an array; `convert` gets each one that is there: the service may send an element marked as nil.
template <class From, class To, class Convert>
void CopyElements(int count, From* from, unsigned int& size, To*& to, Convert convert)
{
    Records::Allocate(size, to, from && count > 0 ? count : 0);
    for (unsigned int i = 0; i < size; ++i) {
        if constexpr (std::is_pointer_v<From>) {
            if (!from[i]) continue;
        }
        convert(from[i], to[i]);
    }
}

}  // namespace

// Members of the same name on both sides, in the order of the record.
#define ZV_COPY_MEMBER(name) Copy(t->name, to.name);
#define ZV_COPY(...) ZV_WS_EACH(ZV_COPY_MEMBER, __VA_ARGS__)

// An array that is a member, through the conversion of its elements; null is an empty one.
#define ZV_COPY_ARRAY(member, element, convert) \
    if (t->member) CopyElements(t->member->__size##element, t->member->element, to.member.size, to.member.element, convert)

namespace ZVUtilities {

namespace {

template <class From, class To>
void CopyNumber(const From& from, To& to)
{
    to = static_cast<To>(from);
}

void BonusAsset(const ZV1__BonusAsset* t, ZV_WS_BonusAsset& to) { ZV_COPY(BonusAssetID, Profile, BonusType) }

void AudioFile(const ZV1__AudioFile* t, ZV_WS_AudioFile& to)
{
    ZV_COPY(AssetAudioID, FileLocation, ContainsVideo, AudioAssetProfile)
}

void ProductListing(const ZV1__ProductListing* t, ZV_WS_ProductListing& to)
{
    ZV_COPY(SkuID, PurchaseType, Price, ExpireDate, RentalPeriod)
    ZV_COPY_ARRAY(AvailableAssets, FileProfile, (CopyNumber<ZV1__FileProfile, ZV_WS_FileProfile>));
    ZV_COPY_ARRAY(AvailableAudioProfiles, AudioFile, AudioFile);
}

void Genre(const ZV1__Genre* t, ZV_WS_Genre& to)
{
    ZV_COPY(ID, Name, Visible)
    to.ParentID = t->ParentId;
}

}  // namespace

void ZV1__StandardResponse2ZV_WS_StandardResponse(const ZV1__StandardResponse* t, ZV_WS_StandardResponse& to)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(ResponseCode, ResponseMessage)
}

void ZV1__TitleListing2ZV_WS_TitleListing(const ZV1__TitleListing* t, ZV_WS_TitleListing& to)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(TitleID, TitleName, BoxArtPrefix, TitlePosition, EpisodeNumber, IsTvListing, MPAARating)
    ZV_COPY_ARRAY(BonusAssets, BonusAsset, BonusAsset);
    ZV_COPY_ARRAY(AvailableProducts, ProductListing, ProductListing);
    ZV_COPY(IsTHXMediaDirectorEnabled, IsTHXMediaDirectorEnabledForTrailer, CHVRSRating, LoyaltyPointsForBuy,
            LoyaltyPointsForRent)
}

void ZV1__ArrayOfTitleListing2ZV_WS_TitleListingArray(const ZV1__ArrayOfTitleListing* t, ZV_WS_TitleListingArray& to)
{
    ZV_ASSERT(t != 0);
    CopyElements(t->__sizeTitleListing, t->TitleListing, to.size, to.TitleListing, ZV1__TitleListing2ZV_WS_TitleListing);
}

void ZV1__TitleListingResponse2ZV_WS_TitleListingResponse(const ZV1__TitleListingResponse* t,
                                                          ZV_WS_TitleListingResponse& to)
{
    ZV_ASSERT(t != 0);
    ZV1__TitleListing2ZV_WS_TitleListing(t, to);
    Copy(t->Synopsys, to.Synopsis);
    ZV_COPY(ResponseCode, ResponseMessage, UserRating, Directors, Actors, Writers, Producers, Copyright, RunTime,
            RatingReason)
}

void ZV1__GetTitlesResponse2ZV_WS_TitlesResponse(const ZV1__GetTitlesResponse* t, ZV_WS_TitlesResponse& to)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(ResponseCode, ResponseMessage, GenreID, CurrentPageNumber, ItemsPerPage, TotalPages, TotalItems)
    if (t->Titles) ZV1__ArrayOfTitleListing2ZV_WS_TitleListingArray(t->Titles, to.Titles);
}

void ZV1__ArrayOfGenre2ZV_WS_GenreArray(const ZV1__ArrayOfGenre* t, ZV_WS_GenreArray& to)
{
    ZV_ASSERT(t != 0);
    CopyElements(t->__sizeGenre, t->Genre, to.size, to.Genre, Genre);
}

void ZV1__FileType2ZV_WS_FileType(const ZV1__FileType* t, ZV_WS_FileType& to)
{
    ZV_ASSERT(t != 0);
    to.DRMProvider = static_cast<ZV_WS_DRMProvider>(t->File_USCOREDRMProvider);
    to.AccessType = static_cast<ZV_WS_AccessType>(t->File_USCOREAccessType);
    to.FileProfile = static_cast<ZV_WS_FileProfile>(t->File_USCOREFileProfile);
    to.VideoFormat = static_cast<ZV_WS_VideoFormat>(t->File_USCOREVideoFormat);
    to.FileExtension = static_cast<ZV_WS_FileExtension>(t->File_USCOREFileExtension);
}

}  // namespace ZVUtilities
