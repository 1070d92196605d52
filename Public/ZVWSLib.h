// The web-service library: a flat interface over the storefront's browse, account and stream services. Its types are in
// ZV_WS_Types.h, its statuses in ZV_WS_Status.h.
//
// What holds for many calls is said here once; a call's own lines hold only what is its own. "Asks the service", "Sent
// once", "Refusals" and "Cached" are the words by which they refer to it.
//
// Sessions and threads. ZV_WS_initialize makes a session, ZV_WS_duplicate makes a further one with the same settings,
// ZV_WS_release ends either. A session serves one thread at a time, whichever it is; threads that work at once take a
// session each. ZV_WS_abort alone comes from beside. Calls without a session may be made from any thread, any number at
// once. No call leaves a thread behind but for the one that writes a file cache, which ends by itself or with the last
// session on that file (docs/threads.md).
//
// Outputs. Every call empties its output before anything else, without looking at what it held, and tags it: release a
// record before using it for another call. Whatever the status, the caller owns the output afterwards and frees it with
// ZV_WS_release, which also takes records that a failed call left empty, and records released before. Outputs that are
// no records (bool, int, enumerations) are 0 and false until the call knows better; what they hold means something only
// with ZV_WS_Status_ok. An output pointer must not be null: that is an assertion.
//
// Arguments. Pointers are borrowed for the call. Texts are UTF-8. A text may be null unless "required" is said: the
// request then has none. ZV_WS_Status_invalid_param, with nothing sent and nothing changed, is said to
//  - a null handle, one without a session, one whose set-up failed;
//  - a required text that is null or empty; a null page; a null array whose count is not 0;
//  - a text that XML cannot hold (control characters, bytes that are no UTF-8); an enumeration's number that is not in
//    its list; a count, page or number of items above 2,147,483,647.
// Ids that nobody has are for the service to refuse.
//
// Results. Every call returns a ZV_WS_Status and throws nothing; memory exhaustion is ZV_WS_Status_general_error.
// docs/statuses.md tells of every status who says it and what to do about it.
//
// "Asks the service": the call blocks on the network, at most 30 s to connect, 30 s for each piece it sends, 88 s for
// each it receives, and 118 s for the whole exchange. A kept connection that turns out dead, and a clock that the
// service found wrong and that can be set right by it, make it exchange a second time. What can come of it:
//  - ZV_WS_Status_connection_error, ZV_WS_Status_timeout_error, a status of the families of HTTP, TLS and SOAP: the
//    exchange failed, and the output is empty. A later call may succeed.
//  - ZV_WS_Status_clock_wrong: likewise, and no later call will succeed before somebody sets the device's clock.
//  - ZV_WS_Status_general_error: the service refused with a response code that is no "Refusal" of this call, or
//    its answer could not be understood. A refusal is in the record (ResponseCode, ResponseMessage); else the
//    record is empty.
//  - the statuses listed as "Refusals": the service's response codes that this call tells apart. The record is filled.
//
// "Sent once": the call changes something at the service, or counts there. Of itself it is sent a second time only when
// the service refused the first for its time alone. After connection_error and TLS's -5030 nothing was sent; after any
// other failure without a record the service may have done it all the same, and the caller finds out by asking for what
// it changes. Calls without this word can be repeated without harm.
//
// "Cached": with a cache for that kind of data (ZV_WS_CacheParam::Data) the call looks there first, and answers from it
// without asking the service. What the service answers with success is kept there. Answers have no age: they stay until
// something drops them. An answer that was asked for before such a moment is not kept after it.
//  - catalogue (CacheData_Metadata): until ZV_WS_updateLocalCache, as set-up does by itself, finds that the service
//    has loaded a new catalogue; until they outgrow their share of the limit, when the customer's answers go with
//    them; until ZV_WS_clearLocalCache.
//  - catalogue and wishes (CacheData_Metadata): answers that tell of the wish list, too. Like the
//    catalogue's; where CacheData_Userdata is cached, too, also dropped with all of the customer's
//    and by ZV_WS_removeAllItemsFromWishlist.
//  - customer (CacheData_Userdata): until set-up, ZV_WS_updateLocalCache with CacheData_Userdata, ZV_WS_authorizeDevice
//    or ZV_WS_deactivateDevice drop all of them; until they or the catalogue's outgrow their share; until a change that
//    is named at the call, also one whose answer was lost; until ZV_WS_clearLocalCache.
//  - wish-list flags (CacheData_Userdata): what is known of single titles, from changes and checks. Dropped
//    with the customer's.
//  - images (CacheData_BoxArtImage): until ZV_WS_updateLocalCache with CacheData_BoxArtImage marks them, after which
//    the next call asks the host whether it has another one, and keeps the old one when the host cannot be asked; until
//    the oldest titles make room in a share that was outgrown; until ZV_WS_clearLocalCache.
// Calls without this word ask the service each time. A cache that fails never fails a call: a broken file is made anew,
// one that was removed comes back, and one that another process keeps locked for 10 s, which the call waits, is not
// used for a minute, or by a session that is just set up not at all. docs/cache.md tells the rest.
#pragma once

#include <time.h>

#include "ZV_WS_Status.h"
#include "ZV_WS_Types.h"

// ---- Session

/// Makes a session. In this order: checks `params`, which must not be null; reads the deployment file
/// (docs/deployment.md) and the certificate authorities; discovers the environment unless EnvNum names one; asks for
/// the access type unless AccessType tells it; opens the cache, sweeps its folder for at most 50 ms, drops what it
/// holds of the customer, and asks whether the catalogue is still the same. Environment, access type and catalogue ask
/// the service: up to three exchanges. A service that cannot tell the access type leaves it unknown, which works like
/// ACCESS_TYPE_STREAM. Prints one line of the environment and one of the user agent on standard output.
///
/// Makes the proxy of `params` (none, too) that of ZV_WS_getServerTime. The handle's former content is overwritten
/// unseen. After a failure it is empty, except after ssl_error, when it has still to be released:
///  - ZV_WS_Status_invalid_param: a required text is missing; the identifier is too long; a file cache has no path; the
///    limit is neither 0 nor at least 358400; a text cannot stand in a request. Mend the caller.
///  - ZV_WS_Status_file_operation_error: the deployment file cannot be used; one line on the error stream says why.
///  - ZV_WS_Status_failed_to_create_cache_folder: the disk, or the folder's own place.
///  - ZV_WS_Status_ssl_error: the certificate authorities cannot be loaded.
///  - ZV_WS_Status_connection_error: discovery could not reach the service. Try again when there is a network.
///  - ZV_WS_Status_clock_wrong: nor can it before somebody sets the device's clock.
///  - ZV_WS_Status_local_cache_error: the cache's file cannot be opened, not even made anew. Set up without a cache.
///  - ZV_WS_Status_general_error: memory is exhausted.
ZV_WS_Status ZV_WS_initialize(ZV_WS_Session* handle, const ZV_WS_SetupParams* params);

/// Makes a session with the settings of `source`, for another thread; the thread of `source` may be in the middle of a
/// call. Both share what they know of the customer: the authorisation token, what a change has made stale, and where
/// bandwidth is measured. A file cache is shared; a memory cache is not: the new session works without. Nothing is
/// asked from the network.
///
/// ZV_WS_Status_invalid_param without a source session. After ZV_WS_Status_ssl_error (authorities),
/// ZV_WS_Status_local_cache_error (the file cannot be opened; it is not made anew here) and ZV_WS_Status_general_error
/// the new handle has to be released.
ZV_WS_Status ZV_WS_duplicate(ZV_WS_Session* newHandle, const ZV_WS_Session* source);

/// Frees whatever the record owns and empties it; ends a session. The last session on a file cache writes what waits
/// for it before it returns; as long as another process holds the file, that takes 200 ms, or what is left of 10 s when
/// the writing has begun. Always ZV_WS_Status_ok; null and empty records are fine. A session must not be in a call:
/// ZV_WS_abort ends that first.
ZV_WS_Status ZV_WS_release(ZV_WS_Object* any);

/// Breaks off what another thread's call with the session does in the network, and lets no further one reach it: the
/// call returns within 200 ms as after a failed exchange, later only if it waits for the disk or the system's name
/// lookup. For ending a session that may hang; ZV_WS_release has to follow, after that call has returned. Any thread.
/// An empty handle is fine. A null one breaks off every ZV_WS_getServerTime under way, and lets others begin.
void ZV_WS_abort(const ZV_WS_Session* handle);

/// The library's version, 1.3.1. Always ZV_WS_Status_ok but for memory exhaustion.
ZV_WS_Status ZV_WS_getVersion(ZV_WS_VersionInfo* version);

/// The environments to choose from at set-up. Needs no session. Always ZV_WS_Status_ok.
ZV_WS_Status ZV_WS_getAvailableEnvLists(ZV_WS_EnvironmentLists* list);

/// The environment that the service has for the device now, for the general catalogue. The session keeps the one that
/// it has. Asks the service over HTTP: ZV_WS_Status_net_error when it cannot be reached; an answer that is none means
/// ENVID_PRODUCTION. Prints a line on standard output.
ZV_WS_Status ZV_WS_getDefaultEnvID(ZV_WS_Session* handle, ZV_WS_EnvID* env);

/// The environment found at set-up. From memory.
ZV_WS_Status ZV_WS_getDeviceEnv(ZV_WS_Session* handle, ZV_WS_EnvID* env);

/// The text that every request carries as its user agent: "ZVSDK: FIRMWARE|APPLICATION ZVMODEL:MODEL" of what set-up
/// was given of the three; empty when that was nothing. From memory.
ZV_WS_Status ZV_WS_getUserAgent(ZV_WS_Session* handle, ZV_WS_String* userAgent);

/// The device's identifier as given at set-up. From memory.
ZV_WS_Status ZV_WS_getDestinationUniqueID(ZV_WS_Session* handle, ZV_WS_String* id);

// ---- Catalogue. All of it asks the browse service.

/// Every genre, as a flat list in which each names the one above it. Cached: catalogue.
ZV_WS_Status ZV_WS_getNavigation(ZV_WS_Session* handle, ZV_WS_GenreArray* genres);

/// The text that labels a genre, and the one that explains it.
ZV_WS_Status ZV_WS_getGenreLabel(ZV_WS_Session* handle, int genreID, ZV_WS_GenreLabelResponse* label);

/// A page of a genre's titles. `purchaseType` is a ZV_WS_PurchaseType. Cached: catalogue.
ZV_WS_Status ZV_WS_getTitles(ZV_WS_Session* handle, int genreID, const ZV_WS_Pagination* page, int purchaseType,
                             ZV_WS_TitlesResponse* titles);

/// The same page of each of `count` genres, in the order asked; what the service refuses of one is in that one's
/// record, and the status stays ok.
ZV_WS_Status ZV_WS_getTitlesByGenreIDs(ZV_WS_Session* handle, const int* genreIDs, unsigned int count,
                                       const ZV_WS_Pagination* page, ZV_WS_PurchaseType purchaseType,
                                       ZV_WS_TitlesResponseArray* titles);

/// All details of one title. Cached: catalogue and wishes.
ZV_WS_Status ZV_WS_getTitleListing(ZV_WS_Session* handle, int titleID, ZV_WS_TitleListingResponse* listing);

/// All details of one episode. Cached: catalogue and wishes.
ZV_WS_Status ZV_WS_getTvEpisodeListing(ZV_WS_Session* handle, int episodeID, ZV_WS_TitleListingResponse* listing);

/// The episodes of a season by name and number. Cached: catalogue.
ZV_WS_Status ZV_WS_getTvEpisodeListByTitleID(ZV_WS_Session* handle, int titleID, ZV_WS_TvEpisodeListResponse* episodes);

/// Every episode of a season with all its details, in the order of their numbers. What is no season has none. Cached:
/// catalogue and wishes.
ZV_WS_Status ZV_WS_getAllTvEpisodeListings(ZV_WS_Session* handle, int titleID,
                                           ZV_WS_TitleListingResponseArray* listings);

/// The title that a product belongs to. Cached: catalogue.
ZV_WS_Status ZV_WS_translateSkuID(ZV_WS_Session* handle, int skuID, ZV_WS_TranslateSkuIDResponse* title);

/// The title that another guide knows by that identifier. Cached: catalogue.
ZV_WS_Status ZV_WS_translateTivoExternalID(ZV_WS_Session* handle, const char* externalID,
                                           ZV_WS_TranslateTivoExternalIDResponse* title);

/// A page of the titles whose names hold the text. Cached: catalogue.
ZV_WS_Status ZV_WS_searchForTitle(ZV_WS_Session* handle, const ZV_WS_Pagination* page, ZV_WS_PurchaseType purchaseType,
                                  ZV_WS_TitleTypeFilter typeFilter, const char* query, ZV_WS_TitlesResponse* titles);

/// A page of the titles with the text in their names or among the people who made them. Cached: catalogue.
ZV_WS_Status ZV_WS_searchForTitleDetail(ZV_WS_Session* handle, const ZV_WS_Pagination* page,
                                        ZV_WS_PurchaseType purchaseType, ZV_WS_TitleTypeFilter typeFilter,
                                        const char* query, ZV_WS_TitlesResponse* titles);

/// Titles like that one. Cached: catalogue.
ZV_WS_Status ZV_WS_getRecommendedTitles(ZV_WS_Session* handle, int titleID, ZV_WS_RecommendedTitlesResponse* titles);

// ---- The device at the service. Asks the service that has the account (ZV_WS_AccessType), unless another
// one is named.

/// The form in which the service has films for this type of device. Asks the browse service. The record has
/// no response code.
ZV_WS_Status ZV_WS_getFileType(ZV_WS_Session* handle, ZV_WS_FileType* fileType);

/// Ties the device to the customer who was shown the PIN, which is required. On success the next requests of the
/// session, its duplicates and the session that it is a duplicate of carry the new token, and all that is cached of the
/// customer before is dropped. The caller keeps the token of the answer for the next set-up. Sent once. Refusals:
///  - ZV_WS_Status_invalid_pin: ask for the PIN again.
///  - ZV_WS_Status_device_locked_out: there were too many wrong ones; only the service can help.
ZV_WS_Status ZV_WS_authorizeDevice(ZV_WS_Session* handle, const char* pin, ZV_WS_AuthorizeDeviceResponse* answer);

/// Unties the device: on success likewise, and the requests carry no token. Sent once.
ZV_WS_Status ZV_WS_deactivateDevice(ZV_WS_Session* handle, ZV_WS_StandardResponse* answer);

/// Whether the service still takes the session's token; one without asks about an empty one. When it does not, the
/// device has to be activated again.
ZV_WS_Status ZV_WS_checkAuthToken(ZV_WS_Session* handle, bool* isValid);

/// Values that the service gives its players, by key.
ZV_WS_Status ZV_WS_getConfig(ZV_WS_Session* handle, ZV_WS_ConfigResponse* config);

/// What a settings page shows of the account and the device. Cached: customer.
ZV_WS_Status ZV_WS_getSettingsPageInfo(ZV_WS_Session* handle, ZV_WS_SettingsPageInfoResponse* info);

/// The number of the country whose store the customer uses.
ZV_WS_Status ZV_WS_getCountryID(ZV_WS_Session* handle, int* countryID);

/// Keeps the sound that the customer prefers, at the stream service. Sent once; sending it again does no harm.
ZV_WS_Status ZV_WS_setAudioDefaultProperty(ZV_WS_Session* handle, ZV_WS_AudioProfile profile,
                                           ZV_WS_StandardResponse* answer);

/// The sound that the customer prefers. Asks the stream service.
ZV_WS_Status ZV_WS_getAudioDefaultProperty(ZV_WS_Session* handle, ZV_WS_AudioProfile* profile);

// ---- The customer's account. Asks the service that has the account (ZV_WS_AccessType), unless another one is named.
// What a device without a token may do is for the service to decide.

/// A page of what the customer bought or rented. `watchStatus` is a ZV_WS_WatchStatus. Cached: customer, dropped by a
/// purchase and by ZV_WS_removeAllMyPurchases; never cached for devices that download.
ZV_WS_Status ZV_WS_getMyVideos(ZV_WS_Session* handle, const ZV_WS_Pagination* page, ZV_WS_PurchaseType purchaseType,
                               ZV_WS_TitleTypeFilter typeFilter, int watchStatus, ZV_WS_MyVideosResponse* videos);

/// The purchased titles behind `count` passes. Asks the stream service. The record has no response code.
ZV_WS_Status ZV_WS_getTitleListingPurchaseds(ZV_WS_Session* handle, const int* passIDs, unsigned int count,
                                             ZV_WS_TitleListingPurchasedArray* titles);

/// Whether the customer has bought or rented the title.
ZV_WS_Status ZV_WS_checkForPurchasedTitle(ZV_WS_Session* handle, int titleID, bool* isPurchased);

/// Whether the customer has bought or rented the product. Asks the stream service.
ZV_WS_Status ZV_WS_checkForPurchasedSku(ZV_WS_Session* handle, int skuID, bool* isPurchased);

/// How many hours are left of a rental, and whether to warn the customer.
ZV_WS_Status ZV_WS_checkRentalExpiration(ZV_WS_Session* handle, int passID, ZV_WS_RentalExpirationResponse* expiration);

/// Forgets every purchase of the account, whose password is required. Asks the stream service. Sent once.
ZV_WS_Status ZV_WS_removeAllMyPurchases(ZV_WS_Session* handle, const char* password, ZV_WS_StandardResponse* answer);

/// A page of the wish list. Cached: customer, dropped by every change of the list.
ZV_WS_Status ZV_WS_getWishlistItems(ZV_WS_Session* handle, ZV_WS_SortOrder sortOrder, const ZV_WS_Pagination* page,
                                    ZV_WS_TitleTypeFilter typeFilter, ZV_WS_WishlistItemsResponse* items);

/// Puts a title into the wish list, and notes its wish-list flag. One that is already there is no failure. Sent once;
/// sending it again does no harm.
ZV_WS_Status ZV_WS_addItemToWishlist(ZV_WS_Session* handle, int titleID, ZV_WS_StandardResponse* answer);

/// Takes a title out of the wish list, and notes its wish-list flag. Sent once; sending it again does no harm.
ZV_WS_Status ZV_WS_removeItemFromWishlist(ZV_WS_Session* handle, int titleID, ZV_WS_StandardResponse* answer);

/// Empties the wish list, and forgets every wish-list flag and listing that tells of it. Sent once; sending it again
/// does no harm.
ZV_WS_Status ZV_WS_removeAllItemsFromWishlist(ZV_WS_Session* handle, ZV_WS_StandardResponse* answer);

/// Whether a title is in the wish list. Asks the browse service for the title's listing, anew. Cached: wish-list flags.
ZV_WS_Status ZV_WS_checkTitleInWishlist(ZV_WS_Session* handle, int titleID, bool* isInWishlist);

/// One answer for each of `count` titles; none is asked for none. Answers from the flags when those tell of all the
/// titles, else from the wish list (ZV_WS_getWishlistItems), of which as many pages are asked for as it has, 50 items
/// each and at most 1,000: each can block like a call. `typeFilter` narrows that list. The first page that fails ends
/// it, with its status and an empty record. Cached: wish-list flags.
ZV_WS_Status ZV_WS_checkTitlesInWishlist(ZV_WS_Session* handle, const int* titleIDs, unsigned int count,
                                         ZV_WS_TitleTypeFilter typeFilter, ZV_WS_TitlesInWishlist* answers);

/// Whether the customer wants a PIN asked before adult titles. An answer that says neither yes nor no is
/// ZV_WS_Status_general_error: after any failure treat it as wanted.
ZV_WS_Status ZV_WS_checkAdultVerificationEnabled(ZV_WS_Session* handle,
                                                 ZV_WS_CheckAdultVerificationEnabledResponse* answer);

/// Whether that is the customer's PIN for adult titles, sent with at least four digits (7 is "0007"). A wrong one is no
/// failure: the record says so. Sent once: the service may count wrong ones.
ZV_WS_Status ZV_WS_checkAdultVerificationPin(ZV_WS_Session* handle, int pin,
                                             ZV_WS_CheckAdultVerificationPinResponse* answer);

/// The customer's e-mail address. Cached: customer.
ZV_WS_Status ZV_WS_getEmailAddress(ZV_WS_Session* handle, ZV_WS_EmailAddressResponse* address);

/// The kind and the last four digits of the card on file. Cached: customer. Refusals:
///  - ZV_WS_Status_invalid_user_id: the device belongs to nobody any more; activate it again.
///  - ZV_WS_Status_cc_not_on_file, ZV_WS_Status_invalid_cc_number, ZV_WS_Status_cc_expired: the customer has to give a
///    card at the service's own pages.
ZV_WS_Status ZV_WS_getBillingInfo(ZV_WS_Session* handle, ZV_WS_BillingInfoResponse* billing);

/// The card on file and the prepaid money in one answer, each with a response code of its own; the status is that of
/// the exchange. Asks the stream service.
ZV_WS_Status ZV_WS_getBillingInfoAndPPCBalance(ZV_WS_Session* handle, ZV_WS_BillingInfoAndPPCBalanceResponse* billing);

/// The customer's prepaid money.
ZV_WS_Status ZV_WS_getPrePaidCardBalance(ZV_WS_Session* handle, ZV_WS_PPCardBalanceResponse* balance);

/// Adds the worth of a gift code to the customer's prepaid money. Sent once: after a lost answer ask for
/// the balance. Refusals:
///  - ZV_WS_Status_verify_userid_gift_code: no such code, or not for this customer, or used before.
///  - ZV_WS_Status_verify_inputs: the code has not the form of one.
ZV_WS_Status ZV_WS_assignGiftCertificateToUser(ZV_WS_Session* handle, const char* code,
                                               ZV_WS_GiftCertificateResponse* answer);

/// Buys or rents a product, with the card on file, or with prepaid money when `usePrepaidFund`. `ipAddress` is the
/// customer's address, in digits. Sent once: after a lost answer ask whether the product is the customer's
/// (ZV_WS_checkForPurchasedSku) before you buy again. Refusals:
///  - ZV_WS_Status_invalid_sku_purchase_id, ZV_WS_Status_product_not_available, ZV_WS_Status_incompatible_products: the
///    product cannot be had, or not on this device.
///  - ZV_WS_Status_invalid_user_id: activate the device again.
///  - ZV_WS_Status_invalid_user_address, ZV_WS_Status_invalid_cc_security_code,
///    ZV_WS_Status_invalid_cc_number, ZV_WS_Status_cc_expired, ZV_WS_Status_avs_fail,
///    ZV_WS_Status_cc_not_on_file: the customer has to mend the card's data.
///  - ZV_WS_Status_trans_failed, ZV_WS_Status_insufficent_prepaid_fund: another way to pay may do.
///  - ZV_WS_Status_reach_daily_spend_limit, ZV_WS_Status_reach_daily_trans_limit: tomorrow.
///  - ZV_WS_Status_discrepancy_in_total_amount: the price has changed; show the new one first.
ZV_WS_Status ZV_WS_doPurchaseSavedBilling(ZV_WS_Session* handle, int skuID, const char* ipAddress, bool usePrepaidFund,
                                          ZV_WS_PurchaseResponse* purchase);

/// What a product costs, without and with tax. Asks the stream service. Refusals:
///  - ZV_WS_Status_product_not_found, ZV_WS_Status_product_not_available: it cannot be had.
///  - ZV_WS_Status_user_not_found, ZV_WS_Status_user_cant_transact: this customer cannot buy.
///  - ZV_WS_Status_payment_details_not_found, ZV_WS_Status_payment_details_invalid: the customer has to mend
///    the card's data.
ZV_WS_Status ZV_WS_calcOrderTax(ZV_WS_Session* handle, int skuID, ZV_WS_CalcOrderTaxResponse* tax);

// ---- Playback. All of it asks the stream service, whatever the access type. The calls for a location are sent once
// since each opens a stream there, which the service may count.

/// Where to start playing what a pass stands for: a new stream, its licence servers and its heartbeat. Sent once.
ZV_WS_Status ZV_WS_getStreamingAssetLocation(ZV_WS_Session* handle, int passID, ZV_WS_FileProfile fileProfile,
                                             ZV_WS_StreamingAssetLocationResponse* location);

/// Where a trailer plays from. Sent once.
ZV_WS_Status ZV_WS_getStreamingBonusAssetLocation(ZV_WS_Session* handle, int bonusAssetID,
                                                  ZV_WS_StreamingAssetLocationResponse* location);

/// Where to go on playing what a pass stands for: the stream that was played last, and the second at which it
/// stopped. Sent once.
ZV_WS_Status ZV_WS_loadLastStreamingAssetLocation(ZV_WS_Session* handle, int passID, ZV_WS_FileProfile fileProfile,
                                                  ZV_WS_StreamingAssetLocationResponse* location);

/// Reports what became of a playback. `streamID` is that of its location and required; `stopTime` is its position in
/// seconds. Sent once; a later report makes up for a lost one.
ZV_WS_Status ZV_WS_manageStreamingInstanceStatus(ZV_WS_Session* handle, const char* streamID, ZV_WS_StreamStatus status,
                                                 int stopTime, ZV_WS_StandardResponse* answer);

/// The set-up texts for what a pass plays. A refusal by the service leaves the status at ok: it is in the record only.
ZV_WS_Status ZV_WS_getTHXMediaDirector(ZV_WS_Session* handle, int passID, ZV_WS_FileProfile fileProfile,
                                       ZV_WS_AudioProfile audioProfile, ZV_WS_THXMediaDirectorResponse* data);

/// The same for a trailer, with refusals in the record only, too.
ZV_WS_Status ZV_WS_getTHXMediaDirectorBonusAsset(ZV_WS_Session* handle, int bonusAssetID, ZV_WS_FileProfile fileProfile,
                                                 ZV_WS_BonusAssetType bonusAssetType,
                                                 ZV_WS_THXMediaDirectorResponse* data);

/// Diagnostic: asks the stream service for an operation that it may let time out, to see a client's own way with
/// it. Sent once.
ZV_WS_Status ZV_WS_returnTimeout(ZV_WS_Session* handle, ZV_WS_StandardResponse* answer);

/// Diagnostic: likewise for an operation that it answers with an error. Sent once.
ZV_WS_Status ZV_WS_returnError(ZV_WS_Session* handle, ZV_WS_StandardResponse* answer);

// ---- Local cache

/// Whether the catalogue has changed since that time, by the service's opinion. The time is required: a text as
/// ZV_WS_getLastCacheLoadTimeUTC gives it, handed back unread. Asks the browse service, and leaves the cache alone.
ZV_WS_Status ZV_WS_shouldUpdateCache(ZV_WS_Session* handle, const char* utcTime, bool* should);

/// When the service last loaded its catalogue. Asks the browse service, and leaves the cache alone.
ZV_WS_Status ZV_WS_getLastCacheLoadTimeUTC(ZV_WS_Session* handle, ZV_WS_String* utcTime);

/// Refreshes the session's cache. `operations` are CacheData bits: with CacheData_Metadata the browse service is
/// asked, and the catalogue's answers are dropped when it has loaded a new one; with CacheData_BoxArtImage the images
/// are marked, to be asked for anew when they are used next; with CacheData_Userdata the customer's answers and
/// wish-list flags are dropped. Bits that the session does not cache do nothing. ZV_WS_Status_ok also when nothing is
/// cached, and when a step fails: what cannot be dropped of the customer is not shown either, a catalogue whose time
/// cannot be learnt stays.
ZV_WS_Status ZV_WS_updateLocalCache(ZV_WS_Session* handle, unsigned int operations);

/// Removes images ("*.jpg"), databases ("*.zv") and temporary files ("zvws*") of a cache folder, whoever's they are.
/// The folder is required, with or without its "/". Sessions that use it go on, and make it anew. Needs no session.
/// ZV_WS_Status_file_operation_error when the folder cannot be read, or at the first file that cannot be removed; those
/// before it are gone then.
ZV_WS_Status ZV_WS_clearLocalCache(const char* folder);

// ---- Box art. Asks the image host over HTTP, for at most as long as an exchange with a service. `prefix` is a title's
// BoxArtPrefix and required; one that is no plain file name (it holds "..", "/", "\" or control characters) is
// ZV_WS_Status_invalid_param, since it comes from the network and becomes a file's name. Others:
//  - ZV_WS_Status_connection_error, ZV_WS_Status_net_error: no answer, or none that makes sense (larger than 4 MiB,
//    too); net_error also when the cache folder takes no new file. A later call may succeed.
//  - ZV_WS_Status_file_not_found_on_server: there is no such image. Show a stand-in.
//  - ZV_WS_Status_file_operation_error: the image cannot be written whole, or not be read.
//  - ZV_WS_Status_file_not_modified_on_server: the host said so although it was not asked. Never otherwise.
// An image that is to be asked for anew, and cannot be, is answered as it is cached.

/// An image's bytes, from the cache or the image host. Cached: images.
ZV_WS_Status ZV_WS_getBoxArtImageData(ZV_WS_Session* handle, ZV_WS_BoxArtSize size, const char* prefix,
                                      ZV_WS_Image* image);

/// Where an image is. With a file cache that keeps images: its file, fetched when it is not there whole. The file stays
/// as long as the cache keeps the image; read it soon, and ask again when it is gone. For other sessions: its address
/// at the image host, and nothing is fetched. Cached: images.
ZV_WS_Status ZV_WS_getBoxArtImage(ZV_WS_Session* handle, ZV_WS_BoxArtSize size, const char* prefix,
                                  ZV_WS_String* place);

// ---- Clock, bandwidth, address

/// The service's clock in seconds since 1970 UTC; -1 on failure. Between 12 and 1 o'clock, by night and by day, it is
/// twelve hours ahead. Nothing is set by it. Needs no session, and goes through the proxy of the one that was last set
/// up. Asks the service over HTTP, for at most 60 s: ZV_WS_Status_connection_error, ZV_WS_Status_net_error, or
/// ZV_WS_Status_general_error for an answer that is no time.
ZV_WS_Status ZV_WS_getServerTime(time_t* serverTime);

/// The download rate in bits per second, measured on at most 200 KiB; 0 on failure. The file's address is asked for
/// once (ZV_WS_getConfig, whose failures are returned) and then known to the session and its duplicates. Others:
///  - ZV_WS_Status_failed_to_get_bandwidth_check_url, ZV_WS_Status_invalid_bandwidth_check_url: the service gives no
///    address, or one that is none.
///  - ZV_WS_Status_file_not_found_on_server: there is nothing at that address.
///  - ZV_WS_Status_connection_error, ZV_WS_Status_net_error: the file could not be fetched.
ZV_WS_Status ZV_WS_checkBandwidth(ZV_WS_Session* handle, unsigned int* bitsPerSecond);

/// The device's address as text, IPv4 or IPv6, on its way to the service or, where there is one, to the proxy; never a
/// loopback address. Asks neither the network nor a name server and does not block: the way is that of the session's
/// last connection, else that to the addresses already known of the service's name, else, as long as nothing is known
/// of it or when it is on this device, the default route. ZV_WS_Status_net_error when no way leaves the device.
ZV_WS_Status ZV_WS_getLocalIPAddr(ZV_WS_Session* handle, ZV_WS_String* address);

// ---- Files. No session, any thread; they block on the disk only. Paths are the system's own, relative ones
// from the current folder. ZV_WS_Status_invalid_param for a null path, ZV_WS_Status_file_operation_error when
// the operation fails.

/// Removes a file or an empty folder. What is not there, or cannot be read, counts as removed.
ZV_WS_Status ZV_WS_removeFile(const char* path);

/// Copies a file over another, or to a new one; onto itself (the same path, a link, another name of it) it changes
/// nothing. Fails when either cannot be opened; a disk that fills up is not noticed.
ZV_WS_Status ZV_WS_copyFile(const char* source, const char* target);

/// The path up to and including its last "/"; a bare name is taken for a folder ("b" is "b/"), and "" is "./". Looks at
/// the text alone.
ZV_WS_Status ZV_WS_getFolderName(const char* path, ZV_WS_String* folder);

/// Whether there is a folder at that path.
ZV_WS_Status ZV_WS_folderExist(const char* path, bool* exists);

/// Makes a folder, for everybody to read, and the missing ones above it. One that is there is no failure.
ZV_WS_Status ZV_WS_createFolder(const char* path);

/// Whether the path can be opened for reading; folders can.
ZV_WS_Status ZV_WS_fileExist(const char* path, bool* exists);

// ---- Settings: key/value pairs in a small XML file, some of the values enciphered with the device's own key. No
// session; any thread, any number of processes on one file. The calls block on the disk only, writers of one folder
// also on each other (at most 5 s).
//
//  - ZV_WS_Status_invalid_param: a null argument, an empty path, an empty key.
//  - ZV_WS_Status_setting_invalid_value: as said for each call.
//  - ZV_WS_Status_file_operation_error: the file is not there to be read, cannot be read or written, to read also when
//    it is larger than 1 MiB, or, for a protected value, the device key (docs/deployment.md) is missing. Also when
//    another writer takes longer than 5 s.

/// The value of a key, never null on success; "" when the key has no value. Others:
///  - ZV_WS_Status_setting_key_not_found: no such key; the file is empty or no settings file.
///  - ZV_WS_Status_setting_invalid_value: a protected value was changed from outside, was stored under another key or
///    by another device, or was never protected. Write it anew.
ZV_WS_Status ZV_WS_readSetting(const char* path, const char* key, bool protectedValue, ZV_WS_String* value);

/// Changes the key's value or adds it; makes the file when there is none, for the owner alone, but no folder. Once it
/// has succeeded the value is on the disk; when it fails, or the process dies in it, the file is what it was or is
/// whole with the new value. A file that is ruined, so that it is no settings file or is larger than 1 MiB, is kept as
/// "<path>.bad", in the place of an earlier one and with a line in the log, and a new one is begun; what is no file is
/// left alone (ZV_WS_Status_file_operation_error). Key and value are UTF-8: ZV_WS_Status_setting_invalid_value for
/// characters that XML cannot hold; a protected value may be any bytes.
ZV_WS_Status ZV_WS_writeSetting(const char* path, const char* key, const char* value, bool protectedValue);

/// Keeps the environment that a device is set to in a file of its own, of the same format, under the key "EnvNum" in
/// decimal. The library never reads it: a movie passes the value to the set-up where it would pass ENVNUM_DEFAULT.
/// ZV_WS_Status_setting_invalid_value for a number outside of ZV_WS_EnvNum.
ZV_WS_Status ZV_WS_createEnvXML(const char* path, ZV_WS_EnvNum envNum);

/// Removes the file that ZV_WS_createEnvXML made. One that is not there counts as deleted.
ZV_WS_Status ZV_WS_deleteEnvXML(const char* path);
