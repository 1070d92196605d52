// The arguments of asynchronous methods: one record for each kind of call. A handler fills a record from the script's
// parameter object, the worker passes its fields to the library and deletes it.
//
// ZVWS_PROPERTIES lists a record's fields once: in the order in which the script's properties are read, which is also
// the order of the library call's arguments. The property has the field's name.
#pragma once

#include <tuple>
#include <type_traits>

#include "ZVWSLib.h"
#include "ZV_WS_Records.h"
#include "stagecraft/ASValue.h"

class ZVWSLibAE;

#define ZVWS_READ_PROPERTY(field) read(#field, field);
#define ZVWS_PROPERTIES(...)                        \
    template <class Reader>                         \
    void ReadWith(Reader&& read)                    \
    {                                               \
        ZV_WS_EACH(ZVWS_READ_PROPERTY, __VA_ARGS__) \
    }                                               \
    auto Arguments() const                          \
    {                                               \
        return std::tie(__VA_ARGS__);               \
    }

/// Also the record of calls without arguments.
struct Param_base {
    ZVWSLibAE* pZVWSLibAE = nullptr;

    template <class Reader>
    void ReadWith(Reader&&)
    {}
    std::tuple<> Arguments() const { return {}; }
};

struct Param_getTitles : Param_base {
    int genreid = 0;
    ZV_WS_Pagination page;
    ZV_WS_PurchaseType purchasetype = PURCHASE_TYPE_RENT;
    ZVWS_PROPERTIES(genreid, page, purchasetype)
};

struct Param_searchForTitle : Param_base {
    ZV_WS_Pagination page;
    ZV_WS_PurchaseType purchasetype = PURCHASE_TYPE_RENT;
    ZV_WS_TitleTypeFilter typefilter = TITLE_TYPE_FILTER_ANY;
    AEString query;
    ZVWS_PROPERTIES(page, purchasetype, typefilter, query)
};

struct Param_getMyVideos : Param_base {
    ZV_WS_Pagination page;
    ZV_WS_PurchaseType purchasetype = PURCHASE_TYPE_RENT;
    ZV_WS_TitleTypeFilter typefilter = TITLE_TYPE_FILTER_ANY;
    ZV_WS_WatchStatus watchstatus = WATCH_STATUS_WATCHNOW;
    ZVWS_PROPERTIES(page, purchasetype, typefilter, watchstatus)
};

struct Param_getWishlistItems : Param_base {
    ZV_WS_SortOrder sortorder = SORT_ORDER_DATEADDED;
    ZV_WS_Pagination page;
    ZV_WS_TitleTypeFilter typefilter = TITLE_TYPE_FILTER_ANY;
    ZVWS_PROPERTIES(sortorder, page, typefilter)
};

struct Param_getBoxArtImage : Param_base {
    ZV_WS_BoxArtSize boxartsize = BOX_ART_SIZE_95;
    AEString boxartprefix;
    ZVWS_PROPERTIES(boxartsize, boxartprefix)
};

struct Param_doPurchaseSavedbilling : Param_base {
    int skuid = 0;
    AEString ipaddress;
    bool useprepaidfund = false;
    ZVWS_PROPERTIES(skuid, ipaddress, useprepaidfund)
};

struct Param_assignGiftCertificateToUser : Param_base {
    AEString giftcertificatecode;
    ZVWS_PROPERTIES(giftcertificatecode)
};

struct Param_StreamingAssetLocation : Param_base {
    int passid = 0;
    ZV_WS_FileProfile fileprofile = FILE_PROFILE_UNKNOWN;
    ZVWS_PROPERTIES(passid, fileprofile)
};

struct Param_manageStreamingInstanceStatus : Param_base {
    AEString streamid;
    ZV_WS_StreamStatus streamstatus = STREAM_STATUS_PLAY;
    int stoptimeSeconds = 0;
    ZVWS_PROPERTIES(streamid, streamstatus, stoptimeSeconds)
};

struct Param_THXMediaDirector : Param_base {
    int passid = 0;
    ZV_WS_FileProfile fileprofile = FILE_PROFILE_UNKNOWN;
    ZV_WS_AudioProfile audioprofile = AUDIO_PROFILE_STEREO_STANDARD;
    ZVWS_PROPERTIES(passid, fileprofile, audioprofile)
};

struct Param_THXMediaDirectorBonusAsset : Param_base {
    int bonusassetid = 0;
    ZV_WS_FileProfile fileprofile = FILE_PROFILE_UNKNOWN;
    ZV_WS_BonusAssetType bonusassettype = BONUS_ASSET_TYPE_TRAILER;
    ZVWS_PROPERTIES(bonusassetid, fileprofile, bonusassettype)
};

struct Param_checkTitlesInWishlist : Param_base {
    AEArray<int> titleids;
    ZV_WS_TitleTypeFilter typefilter = TITLE_TYPE_FILTER_ANY;
    ZVWS_PROPERTIES(titleids, typefilter)
};

struct Param_AudioProfile : Param_base {
    ZV_WS_AudioProfile audioprofile = AUDIO_PROFILE_STEREO_STANDARD;
    ZVWS_PROPERTIES(audioprofile)
};

/// The calls with one argument: what the property is called differs from call to call.
template <class Value>
struct Param_One : Param_base {
    explicit Param_One(const char* propertyName) : property(propertyName) {}

    const char* property;  // static storage
    Value value{};

    template <class Reader>
    void ReadWith(Reader&& read)
    {
        read(property, value);
    }
    auto Arguments() const { return std::tie(value); }
};
using Param_OneInteger = Param_One<int>;
using Param_OneText = Param_One<AEString>;

struct Param_getAllTvEpisodeListings : Param_OneInteger {
    Param_getAllTvEpisodeListings() : Param_OneInteger("titleid") {}
};

/// Some properties are called otherwise than the fields they set.
struct Param_init : Param_base {
    AEString APIKey;
    AEString AuthToken;
    AEString DestinationUniqueID;
    int DestinationTypeID = 0;
    AEString UserName;
    AEString Password;
    AEString ServiceBaseURL;
    ContentType Type = ContentType_ZV;
    ::CacheType CacheType = CacheType_None;
    unsigned int CacheData = 0;
    unsigned int CacheLimit = 0;
    AEString CachePath;
    AEString ProxyHost;
    int ProxyPort = 0;
    AEString ProxyUserName;
    AEString ProxyPassword;
    ZV_WS_AccessType AccessType = ACCESS_TYPE_UNKNOWN;
    AEString ApplicationRevision;
    AEString FirmwareRevision;
    AEString ModelCode;
    ZV_WS_EnvNum EnvNum = ENVNUM_APISTG;

    template <class Reader>
    void ReadWith(Reader&& read)
    {
        ZV_WS_EACH(ZVWS_READ_PROPERTY, APIKey, UserName, Password, DestinationTypeID, AuthToken, DestinationUniqueID,
                   ServiceBaseURL, Type, CacheType, CacheData, CachePath, CacheLimit)
        ZV_WS_EACH(ZVWS_READ_PROPERTY, ProxyHost, ProxyUserName, ProxyPort, ProxyPassword, AccessType,
                   ApplicationRevision, EnvNum)
        read("firmwareVersion", FirmwareRevision);
        read("modelNumber", ModelCode);
    }
};

// ---- A record's fields as arguments of a library call. Worker thread.

namespace ZVWSLib {

template <class Field>
std::tuple<Field> Pass(const Field& field)
{
    return std::make_tuple(field);
}
inline std::tuple<const char*> Pass(const AEString& text)
{
    return std::make_tuple(text.c_str());
}
inline std::tuple<const ZV_WS_Pagination*> Pass(const ZV_WS_Pagination& page)
{
    return std::make_tuple(&page);
}
inline std::tuple<const int*, unsigned int> Pass(const AEArray<int>& numbers)
{
    return std::make_tuple(numbers.begin(), static_cast<unsigned int>(numbers.size()));
}

/// What a library call puts out: its last parameter points to one.
template <class... Parameters>
using OutputOf = std::remove_pointer_t<std::tuple_element_t<sizeof...(Parameters) - 1, std::tuple<Parameters...>>>;

/// Calls the library with the record's fields.
template <class Param, class... Parameters>
ZV_WS_Status CallLibrary(ZV_WS_Status (*call)(ZV_WS_Session*, Parameters...), ZV_WS_Session& session,
                         const Param& param, OutputOf<Parameters...>& output)
{
    const auto with = [&](const auto&... fields) {
        return std::apply(call, std::tuple_cat(std::make_tuple(&session), Pass(fields)..., std::make_tuple(&output)));
    };
    return std::apply(with, param.Arguments());
}

}  // namespace ZVWSLib

// ---- Reading them

/// Reads properties of a script object into fields of any type that occurs in a record. Main thread. Properties that
/// are missing, undefined or null read as 0, "" and false. One that cannot be read (its getter throws, or the
/// conversion of its value) is a failure; those after it are read all the same.
class PropertyReader {
public:
    explicit PropertyReader(ae::stagecraft::ASObject& object) : m_Object(object) {}

    /// Numbers of any size become integers as the script's own bit operations make them.
    template <class Number>
    void operator()(const char* name, Number& field)
    {
        int32_t number;
        Require(m_Object.GetInt(name, number));
        field = static_cast<Number>(number);
    }
    void operator()(const char* name, bool& field) { Require(m_Object.GetBoolean(name, field)); }
    void operator()(const char* name, AEString& field) { Require(m_Object.GetText(name, field)); }
    /// Must be there, and be an Array of at most 10000 elements, all of which can be read.
    void operator()(const char* name, AEArray<int>& field) { Require(ReadArray(name, field)); }

    /// Two properties, whatever the field is called.
    void operator()(const char* /*name*/, ZV_WS_Pagination& page)
    {
        (*this)("CurrentPageNumber", page.CurrentPageNumber);
        (*this)("ItemsPerPage", page.ItemsPerPage);
    }

    /// Whether all properties could be read.
    bool Succeeded() const { return m_Succeeded; }

private:
    void Require(bool succeeded) { m_Succeeded = m_Succeeded && succeeded; }
    bool ReadArray(const char* name, AEArray<int>& field);

    ae::stagecraft::ASObject& m_Object;
    bool m_Succeeded = true;
};
