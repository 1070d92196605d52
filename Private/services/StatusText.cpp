#include <initializer_list>

#include "ZV_WS_Status.h"

static constexpr int kFamilySize = 1000;

// Without a default: the compiler names the enumerators that have no text.
#pragma GCC diagnostic push
#pragma GCC diagnostic error "-Wswitch"

// clang-format off
const char* ZV_WS_statusText(ZV_WS_Status status)
{
    switch (status) {
        case ZV_WS_Status_ok: return "success";
        case ZV_WS_Status_invalid_param: return "invalid parameter";
        case ZV_WS_Status_net_error: return "network error";
        case ZV_WS_Status_general_error: return "general error";
        case ZV_WS_Status_invalid_pin: return "wrong PIN";
        case ZV_WS_Status_device_locked_out: return "device locked out";
        case ZV_WS_Status_invalid_sku_purchase_id: return "no such product";
        case ZV_WS_Status_invalid_user_id: return "no such user";
        case ZV_WS_Status_invalid_user_address: return "invalid address of the user";
        case ZV_WS_Status_invalid_cc_security_code: return "wrong security code of the credit card";
        case ZV_WS_Status_invalid_cc_number: return "invalid credit card number";
        case ZV_WS_Status_cc_expired: return "credit card expired";
        case ZV_WS_Status_trans_failed: return "transaction failed";
        case ZV_WS_Status_reach_daily_spend_limit: return "daily spending limit reached";
        case ZV_WS_Status_reach_daily_trans_limit: return "daily limit of transactions reached";
        case ZV_WS_Status_avs_fail: return "address verification failed";
        case ZV_WS_Status_cc_not_on_file: return "no credit card on file";
        case ZV_WS_Status_insufficent_prepaid_fund: return "not enough prepaid money";
        case ZV_WS_Status_verify_userid_gift_code: return "user or gift code to be verified";
        case ZV_WS_Status_verify_inputs: return "inputs to be verified";
        case ZV_WS_Status_discrepancy_in_total_amount: return "total amount differs";
        case ZV_WS_Status_incompatible_products: return "incompatible products";
        case ZV_WS_Status_product_not_found: return "product not found";
        case ZV_WS_Status_user_not_found: return "user not found";
        case ZV_WS_Status_user_cant_transact: return "user cannot make transactions";
        case ZV_WS_Status_payment_details_not_found: return "payment details not found";
        case ZV_WS_Status_payment_details_invalid: return "invalid payment details";
        case ZV_WS_Status_product_not_available: return "product not available";
        case ZV_WS_Status_dqid_not_found: return "download not found";
        case ZV_WS_Status_destination_not_found: return "destination device not found";
        case ZV_WS_Status_invalid_dqid: return "invalid download";
        case ZV_WS_Status_invalid_downloadstatus: return "invalid download status";
        case ZV_WS_Status_download_not_init: return "download not started";
        case ZV_WS_Status_download_completed: return "download already complete";
        case ZV_WS_Status_user_or_pswd_not_exist: return "no such user or password";
        case ZV_WS_Status_user_exist_pswd_incorrect: return "wrong password";
        case ZV_WS_Status_server_system_err: return "server system error";
        case ZV_WS_Status_provide_required_information: return "required information missing";
        case ZV_WS_Status_username_email_already_exist: return "user name or e-mail address already taken";
        case ZV_WS_Status_username_password_syntax_error: return "malformed user name or password";
        case ZV_WS_Status_failed_to_add_user_billinginfo: return "billing information not added";
        case ZV_WS_Status_email_not_found: return "e-mail address not found";
        case ZV_WS_Status_invalid_user: return "invalid user";
        case ZV_WS_Status_failed_to_generate_salt_for_user: return "no salt generated for the user";
        case ZV_WS_Status_failed_to_generate_random_pswd: return "no random password generated";
        case ZV_WS_Status_pswd_not_match: return "passwords do not match";
        case ZV_WS_Status_file_operation_error: return "file operation failed";
        case ZV_WS_Status_file_not_found_on_server: return "file not found on the server";
        case ZV_WS_Status_file_not_modified_on_server: return "file not modified on the server";
        case ZV_WS_Status_setting_key_not_found: return "setting not found";
        case ZV_WS_Status_setting_invalid_value: return "invalid value of a setting";
        case ZV_WS_Status_local_cache_error: return "local cache cannot be opened";
        case ZV_WS_Status_failed_to_create_cache_folder: return "cache folder cannot be made";
        case ZV_WS_Status_failed_to_get_bandwidth_check_url: return "no address to measure the bandwidth with";
        case ZV_WS_Status_invalid_bandwidth_check_url: return "invalid address to measure the bandwidth with";
        case ZV_WS_Status_connection_error: return "connection failed";
        case ZV_WS_Status_timeout_error: return "timeout";
        case ZV_WS_Status_tcp_error: return "TCP failure";
        case ZV_WS_Status_http_error: return "HTTP failure";
        case ZV_WS_Status_ssl_error: return "TLS failure";
        case ZV_WS_Status_soap_error: return "SOAP failure";
        case ZV_WS_Status_clock_wrong: return "device's clock is wrong";
    }
    for (const ZV_WS_Status family : {ZV_WS_Status_tcp_error, ZV_WS_Status_http_error, ZV_WS_Status_ssl_error,
                                      ZV_WS_Status_soap_error}) {
        if (status < family && status > family - kFamilySize) return ZV_WS_statusText(family);
    }
    return "unknown status";
}
// clang-format on

#pragma GCC diagnostic pop
