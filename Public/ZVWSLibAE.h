// ZVWSLibAE: the extension class "com.orvex.ZVWSLib", through which a movie reaches the web-service library.
//
// A host registers it with IStagecraft::RegisterExtensionClass<ZVWSLibAE>() and does nothing else with it: the script
// owns the instances, the runtime constructs, calls and destructs them. The kernel must be initialised before the first
// instance and stay so until the last is gone.
//
// Threads. Everything here runs on the runtime's main thread. An asynchronous method starts one worker thread, which
// uses the instance's library session alone; its result is handed over on a later update tick. Destructing an instance
// breaks off the call that its worker makes, and waits for the worker.
//
// Calling convention of the asynchronous methods: one argument, an Array of the callback object and the parameter
// object. They return a code at once, and only after ReturnCode::kStarted the callback's "onComplete"(status, result)
// is called, once. The status is a ZV_WS_Status; the result is built also when it is a failure. "init" on an instance
// that is initialised returns kStarted, too, and does nothing: no "onComplete" follows.
//
// Their parameters are properties of the parameter object, each read once. One that is missing, undefined or null is 0,
// "" or false. Numbers become integers as the script's own bit operations make them. "useprepaidfund" is false for
// false, 0, NaN and the texts "", "0" and "false", else true; an object counts as what its valueOf returns, or as its
// text. "titleids" has to be an Array, of at most 10000 elements. A property that cannot be read refuses the call with
// kWrongArguments, and nothing is sent: its getter throws, or its value or an element of it cannot be converted
// (valueOf or toString throws, a symbol).
//
// What they mean and answer is said at the library's call of that name (ZVWSLib.h); the properties, in the order in
// which they are read:
//   init                         APIKey, UserName, Password, DestinationTypeID, AuthToken, DestinationUniqueID,
//                                ServiceBaseURL, Type, CacheType, CacheData, CachePath, CacheLimit, ProxyHost,
//                                ProxyUserName, ProxyPort, ProxyPassword, AccessType, ApplicationRevision, EnvNum,
//                                firmwareVersion, modelNumber: set-up (ZV_WS_initialize)
//   getTitles                    genreid, CurrentPageNumber, ItemsPerPage, purchasetype
//   searchForTitle               CurrentPageNumber, ItemsPerPage, purchasetype, typefilter, query
//   getMyVideos                  CurrentPageNumber, ItemsPerPage, purchasetype, typefilter, watchstatus
//   getWishlistItems             sortorder, CurrentPageNumber, ItemsPerPage, typefilter
//   getBoxArtImage               boxartsize, boxartprefix
//   doPurchaseSavedBilling       skuid, ipaddress, useprepaidfund
//   assignGiftCertificateToUser  giftcertificatecode
//   manageStreamingInstanceStatus   streamid, streamstatus, stoptimeSeconds
//   getTHXMediaDirector          passid, fileprofile, audioprofile
//   getTHXMediaDirectorBonusAsset   bonusassetid, fileprofile, bonusassettype
//   checkTitlesInWishlist        titleids, typefilter
//   setAudioDefaultProperty      audioprofile
//   updateLocalCache             operations
//   authorizeDevice, checkAdultVerificationPin                         pin
//   getStreamingAssetLocation, loadLastStreamingAssetLocation          passid, fileprofile
//   getStreamingBonusAssetLocation                                     bonusassetid
//   checkRentalExpiration                                              passid
//   getTvEpisodeListing                                                episodeid
//   translateSkuID, calcOrderTax, checkForPurchasedSku                 skuid
//   getTitleListing, getRecommendedTitles, getTvEpisodeListByTitleID, getAllTvEpisodeListings, addItemToWishlist,
//   removeItemFromWishlist, checkTitleInWishlist, checkForPurchasedTitle   titleid
//   all others                   none
//
// A result is what the call hands out: a record is an object with its members by name, an array record an Array, a text
// a String or null, a number or a flag itself; "init" and "updateLocalCache" answer whether they succeeded. ExpireDate
// is a Date in local time, null when it cannot be read, and a file profile in an Array an object {FileProfile}.
//
// Methods that answer at once, with arguments of their own. None of them waits for the network; those that take a path
// and "clone", which opens the cache, block on the disk.
//   clone(instance)             a session like that of another instance, which may have a call under way; ReturnCode
//   idle()                      0; updates go on until the next result or "quitFlash"
//   quitFlash()                 0; ends the movie
//   getUserAgent()              text, empty before "init"
//   getDeviceEnv()              environment number, -1 before "init"
//   getAvailableEnvLists()      Array of {endpoint, envNum}; isDefault is true for the one that the service assigned to
//                               the device, which is known after an "init" with the EnvNum 3 ("default")
//   getSysInfo(value)           the value's text
//   fileExist(path)             boolean
//   clearLocalCache(folder)     ZV_WS_Status
//   checkZVSWFmd5sum(path, sum) boolean: whether the file has that MD5 sum, in hexadecimal digits
//   setLogAreaIDsAndTargetConfig({LogAreaIDs, LogTarget, SettingsFile, PreferenceFile})
//                               bits of areas and target, as numbers or texts in any base of C; the log file stands
//                               beside the first file given with a folder. ZV_LOG ("areas,target,folder")
//                               in the environment overrides. 0; 1 no target, 2 file cannot be opened, -3 no object,
//                               or a property that cannot be read: the log stays as it is
//   trace(value)                prints the value's text
#pragma once

#include <memory>

#include "stagecraft/ASExtensionClass.h"

/// Every script method in the order of the table: M for member functions, S for static ones. Movies rest on order and
/// kinds.
#define ZVWSLIBAE_METHODS(M, S)       \
    M(init)                           \
    M(clone)                          \
    M(idle)                           \
    M(getNavigation)                  \
    M(getTitles)                      \
    M(getTitleListing)                \
    M(searchForTitle)                 \
    M(getRecommendedTitles)           \
    M(translateSkuID)                 \
    M(getTvEpisodeListing)            \
    M(getTvEpisodeListByTitleID)      \
    M(getAllTvEpisodeListings)        \
    M(authorizeDevice)                \
    M(deactivateDevice)               \
    M(checkAuthToken)                 \
    M(getBoxArtImage)                 \
    M(getMyVideos)                    \
    M(getWishlistItems)               \
    M(addItemToWishlist)              \
    M(removeItemFromWishlist)         \
    M(removeAllItemsFromWishlist)     \
    M(checkTitleInWishlist)           \
    M(checkTitlesInWishlist)          \
    M(doPurchaseSavedBilling)         \
    M(checkForPurchasedTitle)         \
    M(checkForPurchasedSku)           \
    M(checkAdultVerificationEnabled)  \
    M(checkAdultVerificationPin)      \
    M(assignGiftCertificateToUser)    \
    M(checkRentalExpiration)          \
    M(getStreamingAssetLocation)      \
    M(getStreamingBonusAssetLocation) \
    M(loadLastStreamingAssetLocation) \
    M(manageStreamingInstanceStatus)  \
    M(getTHXMediaDirector)            \
    M(getTHXMediaDirectorBonusAsset)  \
    M(getEmailAddress)                \
    M(getBillingInfo)                 \
    M(getPrePaidCardBalance)          \
    M(getConfig)                      \
    M(getSettingsPageInfo)            \
    M(getCountryID)                   \
    M(getFileType)                    \
    M(updateLocalCache)               \
    M(checkBandwidth)                 \
    M(calcOrderTax)                   \
    M(quitFlash)                      \
    M(getLocalIPAddr)                 \
    M(getSysInfo)                     \
    M(setAudioDefaultProperty)        \
    M(getAudioDefaultProperty)        \
    M(getUserAgent)                   \
    S(setLogAreaIDsAndTargetConfig)   \
    S(fileExist)                      \
    M(getAvailableEnvLists)           \
    S(clearLocalCache)                \
    M(getDeviceEnv)                   \
    S(checkZVSWFmd5sum)               \
    S(trace)

class ZVWSLibAE : public ae::stagecraft::ASExtensionClass {
public:
    /// What script methods return at once.
    enum ReturnCode : int {
        kStarted = 0,              ///< The worker runs ("clone": the instance is ready).
        kNotInitialized = -1,      ///< "init" has not succeeded.
        kBusy = -2,                ///< A call of this instance has not been delivered yet; it goes on undisturbed.
        kWrongArguments = -3,      ///< Not one Array of two objects ("clone": not another, initialised instance), or a
                                   ///< property that cannot be read.
        kAlreadyInitialized = -4,  ///< "clone" only.
        kDuplicateFailed = -5,     ///< "clone" only: a session of its own could not be made.
    };

    // What the runtime asks of a class (stagecraft/ASExtensionClass.h).
    static const char* GetClassName();
    static bool FiresEvents();
    static void GetMethods(AEArray<ae::stagecraft::ASExtensionClass::Method>& methodArrayToFill);
    static ae::stagecraft::ASExtensionClass* ConstructInstance(ae::stagecraft::StageWindow* window,
                                                               ae::stagecraft::ASObject& object,
                                                               ae::stagecraft::ASValueArray& arguments);
    static void DestructInstance(ae::stagecraft::StageWindow* window, ae::stagecraft::ASObject& object);

    ZVWSLibAE(ae::stagecraft::StageWindow* window, ae::stagecraft::ASObject& object,
              ae::stagecraft::ASValueArray& arguments);
    ~ZVWSLibAE() override;
    ZVWSLibAE(const ZVWSLibAE&) = delete;
    ZVWSLibAE& operator=(const ZVWSLibAE&) = delete;

    /// Delivers a result that waits.
    void OnUpdate(ae::stagecraft::StageWindow* window, ae::stagecraft::ASObject& object) override;

    /// The instance's insides, for its handlers and workers.
    class ForegroundCall;
    class Prefetcher;
    class PrefetchMgr;
    ForegroundCall& GetCall() { return *m_Call; }
    Prefetcher& GetPrefetcher() { return *m_Prefetcher; }

private:
#define ZVWSLIBAE_DECLARE(name)                                                      \
    void name(ae::stagecraft::StageWindow* window, ae::stagecraft::ASObject& object, \
              ae::stagecraft::ASValueArray& arguments, ae::stagecraft::ASValue& returnValue);
    ZVWSLIBAE_METHODS(ZVWSLIBAE_DECLARE, ZVWSLIBAE_DECLARE)
#undef ZVWSLIBAE_DECLARE

    // The call's worker may use the prefetcher: the call goes first.
    std::unique_ptr<Prefetcher> m_Prefetcher;
    std::unique_ptr<ForegroundCall> m_Call;
};
