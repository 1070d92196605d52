// The result of every ZV_WS_ call, and of every asynchronous script method (first argument of "onComplete").
//
// 0 is success, every failure is negative. The last three values are bases of families: a transport failure with the
// transport's own number e is reported as base - e, so -4503 is HTTP status 503, -5030 a TLS failure and -6012 a SOAP
// fault. Numbers of a family have no names of their own.
#pragma once

enum ZV_WS_Status : int {
    ZV_WS_Status_ok = 0,
    ZV_WS_Status_invalid_param = -1000,
    ZV_WS_Status_net_error = -1001,
    ZV_WS_Status_general_error = -1004,
    ZV_WS_Status_invalid_pin = -1005,
    ZV_WS_Status_device_locked_out = -1006,
    ZV_WS_Status_invalid_sku_purchase_id = -1007,
    ZV_WS_Status_invalid_user_id = -1008,
    ZV_WS_Status_invalid_user_address = -1009,
    ZV_WS_Status_invalid_cc_security_code = -1010,
    ZV_WS_Status_invalid_cc_number = -1011,
    ZV_WS_Status_cc_expired = -1012,
    ZV_WS_Status_trans_failed = -1013,
    ZV_WS_Status_reach_daily_spend_limit = -1014,
    ZV_WS_Status_reach_daily_trans_limit = -1015,
    ZV_WS_Status_avs_fail = -1016,
    ZV_WS_Status_cc_not_on_file = -1017,
    ZV_WS_Status_insufficent_prepaid_fund = -1018,
    ZV_WS_Status_verify_userid_gift_code = -1019,
    ZV_WS_Status_verify_inputs = -1020,
    ZV_WS_Status_discrepancy_in_total_amount = -1021,
    ZV_WS_Status_incompatible_products = -1022,
    ZV_WS_Status_product_not_found = -1023,
    ZV_WS_Status_user_not_found = -1024,
    ZV_WS_Status_user_cant_transact = -1025,
    ZV_WS_Status_payment_details_not_found = -1026,
    ZV_WS_Status_payment_details_invalid = -1027,
    ZV_WS_Status_product_not_available = -1028,
    ZV_WS_Status_dqid_not_found = -1051,
    ZV_WS_Status_destination_not_found = -1052,
    ZV_WS_Status_invalid_dqid = -1053,
    ZV_WS_Status_invalid_downloadstatus = -1054,
    ZV_WS_Status_download_not_init = -1055,
    ZV_WS_Status_download_completed = -1056,
    ZV_WS_Status_user_or_pswd_not_exist = -1100,
    ZV_WS_Status_user_exist_pswd_incorrect = -1101,
    ZV_WS_Status_server_system_err = -1102,
    ZV_WS_Status_provide_required_information = -1103,
    ZV_WS_Status_username_email_already_exist = -1104,
    ZV_WS_Status_username_password_syntax_error = -1105,
    ZV_WS_Status_failed_to_add_user_billinginfo = -1106,
    ZV_WS_Status_email_not_found = -1107,
    ZV_WS_Status_invalid_user = -1108,
    ZV_WS_Status_failed_to_generate_salt_for_user = -1109,
    ZV_WS_Status_failed_to_generate_random_pswd = -1110,
    ZV_WS_Status_pswd_not_match = -1111,
    ZV_WS_Status_file_operation_error = -1900,
    ZV_WS_Status_file_not_found_on_server = -1901,
    ZV_WS_Status_file_not_modified_on_server = -1902,
    ZV_WS_Status_setting_key_not_found = -1906,
    ZV_WS_Status_setting_invalid_value = -1907,
    ZV_WS_Status_local_cache_error = -1910,
    ZV_WS_Status_failed_to_create_cache_folder = -1911,
    ZV_WS_Status_failed_to_get_bandwidth_check_url = -1920,
    ZV_WS_Status_invalid_bandwidth_check_url = -1921,
    ZV_WS_Status_connection_error = -2011,
    ZV_WS_Status_timeout_error = -2012,
    ZV_WS_Status_tcp_error = -3000,
    ZV_WS_Status_http_error = -4000,
    ZV_WS_Status_ssl_error = -5000,
    ZV_WS_Status_soap_error = -6000,
    /// The device's clock is so wrong that no service accepts its requests, or no certificate is valid yet.
    ZV_WS_Status_clock_wrong = -7001,
};

/// What the status says, in English and in a few words, for logs and consoles: "credit card expired". A number of a
/// family has the text of its base; "unknown status" for any other number without a name. Never null; a constant, of
/// which nothing is to be freed. Any thread.
const char* ZV_WS_statusText(ZV_WS_Status status);
