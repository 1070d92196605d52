// The customer's account: purchases, rentals, payment and parental control.
#include <stdio.h>

#include "ServiceCall.h"

namespace {

const char kVideosTable[] = "getMyVideos";

// Both services' page of purchases; the operations differ in name, and what is downloaded is never cached.
template <class Op, bool isCached>
ZV_WS_Status MyVideos(const char* function, ZV_WS_Session* handle, const ZV_WS_Pagination* page,
                      ZV_WS_PurchaseType purchaseType, ZV_WS_TitleTypeFilter typeFilter, int watchStatus,
                      ZV_WS_MyVideosResponse* videos)
{
    ServiceCall<Op> call(function, handle, videos);
    if (!call.Accepts(IsPage(page))) return call.Refusal();
    if (isCached) {
        call.CacheAs(ZV_WS_CacheParam::CacheData_Userdata, page->CurrentPageNumber, page->ItemsPerPage, purchaseType,
                     typeFilter, watchStatus);
    }
    SetPage(call, *page);
    call.SetEnum(call->PurchaseType, purchaseType);
    call.SetEnum(call->TitleType, typeFilter);
    call.SetEnum(call->WatchStatusFilter, watchStatus);
    return call.Into(videos);
}

template <class Op>
ZV_WS_Status IsTitlePurchased(const char* function, ZV_WS_Session* handle, int titleID, bool* isPurchased)
{
    return LogAnswer(function, AskAbout(&Op::Request::TitleID, titleID, function, handle, isPurchased), *isPurchased);
}

bool Downloads(const ZV_WS_Session* handle)
{
    return SessionOf(handle) && SessionOf(handle)->m_Params.AccessType == ACCESS_TYPE_DOWNLOAD;
}

}  // namespace

ZV_WS_Status ZV_WS_getMyVideos(ZV_WS_Session* handle, const ZV_WS_Pagination* page, ZV_WS_PurchaseType purchaseType,
                               ZV_WS_TitleTypeFilter typeFilter, int watchStatus, ZV_WS_MyVideosResponse* videos)
{
    const auto ask =
        Downloads(handle) ? MyVideos<Operation::getMyVideos, false> : MyVideos<Operation::getMyStreamingVideos, true>;
    return ask(__func__, handle, page, purchaseType, typeFilter, watchStatus, videos);
}

ZV_WS_Status ZV_WS_getTitleListingPurchaseds(ZV_WS_Session* handle, const int* passIDs, unsigned int count,
                                             ZV_WS_TitleListingPurchasedArray* titles)
{
    ServiceCall<Operation::getTitleListingsPurchasedForPasses> call(__func__, handle, titles);
    if (!call.Accepts(IsArray(passIDs, count))) return call.Refusal();
    ZV1__ArrayOfInt ids = BorrowedInts(passIDs, count);
    call->Passes = &ids;
    return call.Into(titles);
}

ZV_WS_Status ZV_WS_checkForPurchasedTitle(ZV_WS_Session* handle, int titleID, bool* isPurchased)
{
    const auto ask = Downloads(handle) ? IsTitlePurchased<Operation::checkForPurchasedTitle>
                                       : IsTitlePurchased<Operation::checkForPurchasedStreamByTitleID>;
    return ask(__func__, handle, titleID, isPurchased);
}

ZV_WS_Status ZV_WS_checkForPurchasedSku(ZV_WS_Session* handle, int skuID, bool* isPurchased)
{
    return LogAnswer(__func__, AskAbout(&_ZV1__checkForPurchasedStream::SkuID, skuID, __func__, handle, isPurchased),
                     *isPurchased);
}

ZV_WS_Status ZV_WS_checkRentalExpiration(ZV_WS_Session* handle, int passID, ZV_WS_RentalExpirationResponse* expiration)
{
    return AskAbout(&_ZV1__checkRentalExpiration::PassId, passID, __func__, handle, expiration);
}

ZV_WS_Status ZV_WS_removeAllMyPurchases(ZV_WS_Session* handle, const char* password, ZV_WS_StandardResponse* answer)
{
    ServiceCall<Operation::removeAllMyPurchases> call(__func__, handle, answer);
    if (!call.Accepts(password && *password)) return call.Refusal();
    call.SetText(call->password, password);
    const ZV_WS_Status status = call.Into(answer);
    DropStale(call, kVideosTable);
    return status;
}

ZV_WS_Status ZV_WS_checkAdultVerificationEnabled(ZV_WS_Session* handle,
                                                 ZV_WS_CheckAdultVerificationEnabledResponse* answer)
{
    using Op = Operation::checkAdultVerificationEnabled;
    ServiceCall<Op> call(__func__, handle, answer);
    // What cannot be read must not pass for "no check wanted".
    return call.Into([&](const ServiceCall<Op>::Answer* result) {
        bool isEnabled = false;
        if (!ZVUtilities::ReadFlag(result->IsAdultVerificationEnabled, isEnabled)) return false;
        ZVUtilities::Convert(result, *answer);
        answer->IsAdultVerificationEnabled = isEnabled;
        return true;
    });
}

ZV_WS_Status ZV_WS_checkAdultVerificationPin(ZV_WS_Session* handle, int pin,
                                             ZV_WS_CheckAdultVerificationPinResponse* answer)
{
    ServiceCall<Operation::checkAdultVerificationPin> call(__func__, handle, answer);
    char text[16];
    snprintf(text, sizeof text, "%04d", pin);
    call->Pin = text;
    return call.Into(answer);
}

ZV_WS_Status ZV_WS_getEmailAddress(ZV_WS_Session* handle, ZV_WS_EmailAddressResponse* address)
{
    return Ask<Operation::getEmailAddress>(__func__, handle, address, ZV_WS_CacheParam::CacheData_Userdata);
}

ZV_WS_Status ZV_WS_getBillingInfo(ZV_WS_Session* handle, ZV_WS_BillingInfoResponse* billing)
{
    return Ask<Operation::getBillingInfo>(__func__, handle, billing, ZV_WS_CacheParam::CacheData_Userdata);
}

ZV_WS_Status ZV_WS_getBillingInfoAndPPCBalance(ZV_WS_Session* handle, ZV_WS_BillingInfoAndPPCBalanceResponse* billing)
{
    return Ask<Operation::getBillingInfoAndPPCBalance>(__func__, handle, billing);
}

ZV_WS_Status ZV_WS_getPrePaidCardBalance(ZV_WS_Session* handle, ZV_WS_PPCardBalanceResponse* balance)
{
    return Ask<Operation::showPrePaidCardBalance>(__func__, handle, balance);
}

ZV_WS_Status ZV_WS_assignGiftCertificateToUser(ZV_WS_Session* handle, const char* code,
                                               ZV_WS_GiftCertificateResponse* answer)
{
    ServiceCall<Operation::assignGiftCertificateToUser> call(__func__, handle, answer);
    call.SetText(call->GiftCertificateCode, code);
    return call.Into(answer);
}

ZV_WS_Status ZV_WS_doPurchaseSavedBilling(ZV_WS_Session* handle, int skuID, const char* ipAddress, bool usePrepaidFund,
                                          ZV_WS_PurchaseResponse* purchase)
{
    ServiceCall<Operation::doPurchaseSavedbilling> call(__func__, handle, purchase);
    call->SkuID = skuID;
    call.SetText(call->IPAddress, ipAddress);
    call.SetText(call->UsePrePaidFunds, usePrepaidFund ? "yes" : "no");
    const ZV_WS_Status status = call.Into(purchase);
    DropStale(call, kVideosTable);
    return status;
}

ZV_WS_Status ZV_WS_calcOrderTax(ZV_WS_Session* handle, int skuID, ZV_WS_CalcOrderTaxResponse* tax)
{
    return AskAbout(&_ZV1__calcOrderTax::SKUID, skuID, __func__, handle, tax);
}
