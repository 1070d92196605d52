#include "Status.h"

#include <stdsoap2.h>
#include <string.h>

#include <algorithm>
#include <iterator>

namespace {

constexpr ZV_WS_Status kGeneral = ZV_WS_Status_general_error;

// How one function reads the service's response codes: entry n - 1 is the status of code n. The service numbers each
// operation on its own, gaps included.
struct ResponseCodes {
    const char* function;
    ZV_WS_Status statuses[22];  // 0 (ok) marks the end: codes from there on are general errors
};

// clang-format off
const ResponseCodes kResponseCodes[] = {
    {"ZV_WS_doPurchaseSavedBilling",
     {ZV_WS_Status_invalid_sku_purchase_id, ZV_WS_Status_invalid_user_id, ZV_WS_Status_invalid_user_address,
      ZV_WS_Status_invalid_cc_security_code, ZV_WS_Status_invalid_cc_number, ZV_WS_Status_cc_expired,
      ZV_WS_Status_trans_failed, ZV_WS_Status_reach_daily_spend_limit, ZV_WS_Status_reach_daily_trans_limit,
      ZV_WS_Status_avs_fail, ZV_WS_Status_cc_not_on_file, ZV_WS_Status_insufficent_prepaid_fund,
      kGeneral, kGeneral, kGeneral, kGeneral, kGeneral, kGeneral, kGeneral,
      ZV_WS_Status_product_not_available, ZV_WS_Status_discrepancy_in_total_amount,
      ZV_WS_Status_incompatible_products}},
    {"ZV_WS_authorizeDevice", {ZV_WS_Status_invalid_pin, ZV_WS_Status_device_locked_out}},
    {"ZV_WS_getBillingInfo",
     {ZV_WS_Status_invalid_user_id, ZV_WS_Status_cc_not_on_file, ZV_WS_Status_invalid_cc_number,
      ZV_WS_Status_cc_expired}},
    {"ZV_WS_assignGiftCertificateToUser", {ZV_WS_Status_verify_userid_gift_code, ZV_WS_Status_verify_inputs}},
    {"ZV_WS_sendDownloadStatus",
     {ZV_WS_Status_dqid_not_found, ZV_WS_Status_destination_not_found, ZV_WS_Status_invalid_dqid,
      ZV_WS_Status_invalid_downloadstatus, ZV_WS_Status_download_not_init, ZV_WS_Status_download_completed}},
    {"ZV_WS_setUserBillingInfo", {ZV_WS_Status_failed_to_add_user_billinginfo}},
    {"ZV_WS_calcOrderTax",
     {ZV_WS_Status_product_not_found, ZV_WS_Status_user_not_found, ZV_WS_Status_user_cant_transact,
      kGeneral, kGeneral, kGeneral, kGeneral, kGeneral, kGeneral, kGeneral,
      ZV_WS_Status_payment_details_not_found, ZV_WS_Status_payment_details_invalid,
      kGeneral, kGeneral, kGeneral, kGeneral, kGeneral, kGeneral, kGeneral,
      ZV_WS_Status_product_not_available}},
};
// clang-format on

// The SOAP runtime's errors that are about the message itself.
const int kSoapFamily[] = {SOAP_CLI_FAULT,      SOAP_SVR_FAULT,  SOAP_TAG_MISMATCH, SOAP_SYNTAX_ERROR,    SOAP_NO_TAG,
                           SOAP_MUSTUNDERSTAND, SOAP_NAMESPACE,  SOAP_FAULT,        SOAP_NO_METHOD,       SOAP_NULL,
                           SOAP_DUPLICATE_ID,   SOAP_MISSING_ID, SOAP_HREF,         SOAP_VERSIONMISMATCH, SOAP_REQUIRED,
                           SOAP_PROHIBITED,     SOAP_OCCURS,     SOAP_LENGTH};

constexpr bool IsHttpFamily(int e)
{
    return (e >= SOAP_GET_METHOD && e <= SOAP_HTTP_METHOD) || e == SOAP_HTTP_ERROR || e == SOAP_NO_DATA ||
           (e >= 100 && e <= 599);
}

}  // namespace

namespace ZVUtilities {

ZV_WS_Status To_ZV_WS_Status(int e)
{
    if (e == SOAP_OK) return ZV_WS_Status_ok;
    if (e == SOAP_TCP_ERROR) return ZV_WS_Status_connection_error;
    if (e == SOAP_EOF) return ZV_WS_Status_timeout_error;
    if (IsHttpFamily(e)) return static_cast<ZV_WS_Status>(ZV_WS_Status_http_error - e);
    if (e == SOAP_SSL_ERROR) return static_cast<ZV_WS_Status>(ZV_WS_Status_ssl_error - e);
    if (std::find(std::begin(kSoapFamily), std::end(kSoapFamily), e) != std::end(kSoapFamily)) {
        return static_cast<ZV_WS_Status>(ZV_WS_Status_soap_error - e);
    }
    return kGeneral;
}

ZV_WS_Status To_ZV_WS_Status(int soapError, int responseCode, const char* functionName)
{
    if (soapError != SOAP_OK) return To_ZV_WS_Status(soapError);
    if (responseCode == 0) return ZV_WS_Status_ok;
    if (!functionName || !*functionName) return kGeneral;
    for (const ResponseCodes& row : kResponseCodes) {
        if (strcmp(row.function, functionName) != 0) continue;
        if (responseCode < 1 || static_cast<size_t>(responseCode) > std::size(row.statuses)) return kGeneral;
        const ZV_WS_Status status = row.statuses[responseCode - 1];
        return status == ZV_WS_Status_ok ? kGeneral : status;
    }
    return kGeneral;
}

void print_soap_error(struct soap*) {}

}  // namespace ZVUtilities
