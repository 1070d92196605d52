#include "Calls.h"

#include <iterator>

#include "Records.h"

namespace {

// Writes all that a record holds, so that all of it is read.
struct Writer {
    std::string& text;

    template <class T>
    void Value(T& value)
    {
        if constexpr (Records::kIsRecord<T>) {
            Records::detail::VisitAll(value, *this);
        } else if constexpr (std::is_same_v<T, char*>) {
            text += value ? std::string("'") + value + "'" : "null";
        } else {
            text += std::to_string(static_cast<long long>(value));
        }
        text += ',';
    }
    template <class T>
    void Member(const char*, T& value)
    {
        Value(value);
    }
    template <class T>
    void Elements(const char*, unsigned int size, T* elements)
    {
        text += '[';
        for (unsigned int i = 0; i < size; ++i)
            Value(elements[i]);
        text += ']';
    }
};

// The argument of each type.
template <class T>
T Argument()
{
    static const int kNumber = 7;  // and arrays have the length 1
    static ZV_WS_Pagination page;
    page.CurrentPageNumber = 1;
    page.ItemsPerPage = 2;
    if constexpr (std::is_same_v<T, const char*>) {
        return "0042";
    } else if constexpr (std::is_same_v<T, const ZV_WS_Pagination*>) {
        return &page;
    } else if constexpr (std::is_same_v<T, const int*>) {
        return &kNumber;
    } else if constexpr (std::is_same_v<T, ZV_WS_BonusAssetType>) {
        return BONUS_ASSET_TYPE_TRAILER;  // there is no other
    } else {
        return static_cast<T>(1);
    }
}

template <class... Parameters>
CallResult Make(ZV_WS_Status (*call)(ZV_WS_Session*, Parameters...), ZV_WS_Session* session, void (*after)())
{
    using Output = std::remove_pointer_t<std::tuple_element_t<sizeof...(Parameters) - 1, std::tuple<Parameters...>>>;
    CallResult result;
    Output output{};
    const auto argument = [&](auto* parameter) {
        using Parameter = std::remove_pointer_t<decltype(parameter)>;
        if constexpr (std::is_same_v<Parameter, Output*>) {
            return &output;
        } else {
            return Argument<Parameter>();
        }
    };
    result.status = call(session, argument(static_cast<Parameters*>(nullptr))...);
    if (after) after();
    Writer{result.output}.Value(output);
    if constexpr (Records::kIsRecord<Output>) ZV_WS_release(&output);
    return result;
}

struct Row {
    const char* name;
    CallResult (*make)(ZV_WS_Session* session, void (*after)());
};

#define ROW(call) {#call, [](ZV_WS_Session* session, void (*after)()) { return Make(ZV_WS_##call, session, after); }},

const Row kRows[] = {
    // clang-format off
    ZV_WS_EACH(ROW, getNavigation, getGenreLabel, getTitles, getTitlesByGenreIDs, getTitleListing, getTvEpisodeListing,
               getTvEpisodeListByTitleID, getAllTvEpisodeListings, translateSkuID, translateTivoExternalID,
               searchForTitle, searchForTitleDetail, getRecommendedTitles)
    ZV_WS_EACH(ROW, getFileType, authorizeDevice, deactivateDevice, checkAuthToken, getConfig, getSettingsPageInfo,
               getCountryID, setAudioDefaultProperty, getAudioDefaultProperty, shouldUpdateCache,
               getLastCacheLoadTimeUTC, checkBandwidth)
    ZV_WS_EACH(ROW, getMyVideos, getTitleListingPurchaseds, checkForPurchasedTitle, checkForPurchasedSku,
               checkRentalExpiration, removeAllMyPurchases, getWishlistItems, addItemToWishlist,
               removeItemFromWishlist, removeAllItemsFromWishlist, checkTitleInWishlist, checkTitlesInWishlist)
    ZV_WS_EACH(ROW, checkAdultVerificationEnabled, checkAdultVerificationPin, getEmailAddress, getBillingInfo,
               getBillingInfoAndPPCBalance, getPrePaidCardBalance, assignGiftCertificateToUser, doPurchaseSavedBilling,
               calcOrderTax)
    ZV_WS_EACH(ROW, getStreamingAssetLocation, getStreamingBonusAssetLocation, loadLastStreamingAssetLocation,
               manageStreamingInstanceStatus, getTHXMediaDirector, getTHXMediaDirectorBonusAsset, returnTimeout,
               returnError)
    // clang-format on
};

}  // namespace

std::vector<std::string> CallNames()
{
    std::vector<std::string> names;
    for (const Row& row : kRows)
        names.emplace_back(row.name);
    return names;
}

bool MakeCall(const std::string& name, ZV_WS_Session* session, CallResult& result, void (*after)())
{
    for (const Row& row : kRows) {
        if (name != row.name) continue;
        result = row.make(session, after);
        return true;
    }
    return false;
}
