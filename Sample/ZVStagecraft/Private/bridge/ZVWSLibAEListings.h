// The calls that are listings, each described once: what their answers show makes it worth fetching more ahead.
#pragma once

#include <array>
#include <variant>

#include "ZVWSLibAEParams.h"

/// Listings in pages, whose neighbours are fetched ahead by the same call with the same request, all but the number of
/// the page. A row: the call; the kind of cached data that its answers are; the numbers of a request that tell one
/// listing of this call from another, beside the size of a page.
#define ZVWS_PAGED_LISTINGS(DO)                                                              \
    DO(getTitles, Metadata, request.genreid, request.purchasetype, 0)                        \
    DO(getMyVideos, Userdata, request.purchasetype, request.typefilter, request.watchstatus) \
    DO(getWishlistItems, Userdata, request.sortorder, request.typefilter, 0)

/// One row. `Request` is the call's record, `Ahead` that of the worker kWorker, which fetches pages ahead and owns it.
template <class Request>
struct Listing;

#define ZVWS_DESCRIBE_LISTING(call, data, number1, number2, number3)                                             \
    struct Param_prefetch_##call : Param_##call {                                                                \
        explicit Param_prefetch_##call(const Param_##call& request) : Param_##call(request), prefetchpages(8) {} \
        AEArray<unsigned int> prefetchpages;                                                                     \
    };                                                                                                           \
    namespace ZVWSLib {                                                                                          \
    void prefetch_##call(void* param);                                                                           \
    }                                                                                                            \
    template <>                                                                                                  \
    struct Listing<Param_##call> {                                                                               \
        using Ahead = Param_prefetch_##call;                                                                     \
        static constexpr auto kData = ZV_WS_CacheParam::CacheData_##data;                                        \
        static constexpr auto kCall = ZV_WS_##call;                                                              \
        static constexpr auto kWorker = ZVWSLib::prefetch_##call;                                                \
        static std::array<int, 3> Identity(const Param_##call& request) { return {number1, number2, number3}; }  \
    };
ZVWS_PAGED_LISTINGS(ZVWS_DESCRIBE_LISTING)

/// A listing's request, whole. getAllTvEpisodeListings has no pages: it is a listing for the box art of what it shows.
#define ZVWS_LISTING_REQUEST(call, ...) , Param_##call
using ListingRequest =
    std::variant<std::monostate, Param_getAllTvEpisodeListings ZVWS_PAGED_LISTINGS(ZVWS_LISTING_REQUEST)>;

/// Whether calls with that record are listings.
template <class Param>
inline constexpr bool kIsListing = std::is_constructible_v<ListingRequest, std::in_place_type_t<Param>, const Param&>;
