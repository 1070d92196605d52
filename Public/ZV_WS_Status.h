// The result of every ZV_WS_ call, and of every asynchronous script method (first argument of "onComplete").
//
// 0 is success, every failure is negative. -4000, -5000 and -6000 are bases of families: a transport failure with the
// transport's own number e is reported as base - e, so -4503 is HTTP status 503, -5030 a TLS failure and -6012 a SOAP
// fault. Numbers of a family have no names of their own.
//
// Each status says who is behind it, what happened and, after "Then:", what the caller does about it. Caller: the
// arguments. Service: its answer, understood or not. Network: whatever is between. Device: its files, its clock.
// Unused: no call of this version gives it; the number belongs to the service's contract and stays reserved. Calls in
// parentheses are the only ones to give it. docs/statuses.md is made of these lines.
#pragma once

enum ZV_WS_Status : int {
    /// Nobody: the call did what it was asked for. Then: go on.
    ZV_WS_Status_ok = 0,
    /// Caller: an argument that the call cannot take (ZVWSLib.h, "Arguments"), or a handle without a session; nothing
    /// was sent. Then: mend the caller.
    ZV_WS_Status_invalid_param = -1000,
    /// Network: an exchange by plain HTTP (box art, clock, bandwidth, discovery) broke off, or its answer makes no
    /// sense. Then: try again later.
    ZV_WS_Status_net_error = -1001,
    /// Service: a response code that the call does not tell apart (in the record), or an answer that cannot be
    /// understood. Also this library, when memory is exhausted. Then: with a record, show what was refused; without
    /// one, try again later.
    ZV_WS_Status_general_error = -1004,
    /// Service: the activation PIN is none that it gave out. Then: ask the customer for
    /// it again (ZV_WS_authorizeDevice).
    ZV_WS_Status_invalid_pin = -1005,
    /// Service: too many wrong PINs, or a device that was shut out. Then: send the customer to
    /// the service (ZV_WS_authorizeDevice).
    ZV_WS_Status_device_locked_out = -1006,
    /// Service: there is no such product to buy. Then: show the title anew (ZV_WS_doPurchaseSavedBilling).
    ZV_WS_Status_invalid_sku_purchase_id = -1007,
    /// Service: the device belongs to no customer that it knows. Then: activate the device
    /// again (ZV_WS_doPurchaseSavedBilling, ZV_WS_getBillingInfo).
    ZV_WS_Status_invalid_user_id = -1008,
    /// Service: the customer's address does not do for a bill. Then: let the customer mend it at
    /// the service (ZV_WS_doPurchaseSavedBilling).
    ZV_WS_Status_invalid_user_address = -1009,
    /// Service: the card's security code is wrong. Then: let the customer mend the card at
    /// the service (ZV_WS_doPurchaseSavedBilling).
    ZV_WS_Status_invalid_cc_security_code = -1010,
    /// Service: the card's number is wrong. Then: let the customer mend the card at the
    /// service (ZV_WS_doPurchaseSavedBilling, ZV_WS_getBillingInfo).
    ZV_WS_Status_invalid_cc_number = -1011,
    /// Service: the card has expired. Then: let the customer give another one at the
    /// service (ZV_WS_doPurchaseSavedBilling, ZV_WS_getBillingInfo).
    ZV_WS_Status_cc_expired = -1012,
    /// Service: the payment did not go through. Then: offer another way to pay (ZV_WS_doPurchaseSavedBilling).
    ZV_WS_Status_trans_failed = -1013,
    /// Service: the customer has spent what a day allows. Then: tell so; tomorrow it
    /// works again (ZV_WS_doPurchaseSavedBilling).
    ZV_WS_Status_reach_daily_spend_limit = -1014,
    /// Service: the customer has bought as often as a day allows. Then: tell so; tomorrow it
    /// works again (ZV_WS_doPurchaseSavedBilling).
    ZV_WS_Status_reach_daily_trans_limit = -1015,
    /// Service: the card's bank knows another address of the customer. Then: let the customer mend it at
    /// the service (ZV_WS_doPurchaseSavedBilling).
    ZV_WS_Status_avs_fail = -1016,
    /// Service: the customer has given no card. Then: let the customer give one at the
    /// service (ZV_WS_doPurchaseSavedBilling, ZV_WS_getBillingInfo).
    ZV_WS_Status_cc_not_on_file = -1017,
    /// Service: the prepaid money does not do. Then: offer the card, or a gift code (ZV_WS_doPurchaseSavedBilling).
    ZV_WS_Status_insufficent_prepaid_fund = -1018,
    /// Service: the gift code is none, was used, or is for somebody else. Then: ask for
    /// it again (ZV_WS_assignGiftCertificateToUser).
    ZV_WS_Status_verify_userid_gift_code = -1019,
    /// Service: what was typed cannot be a gift code. Then: ask for it again (ZV_WS_assignGiftCertificateToUser).
    ZV_WS_Status_verify_inputs = -1020,
    /// Service: the price is not the one that it reckons with. Then: ask for the price anew and show it, before the
    /// customer buys again (ZV_WS_doPurchaseSavedBilling).
    ZV_WS_Status_discrepancy_in_total_amount = -1021,
    /// Service: the product does not go with this device, or with what the customer has. Then: offer
    /// another one (ZV_WS_doPurchaseSavedBilling).
    ZV_WS_Status_incompatible_products = -1022,
    /// Service: there is no such product. Then: show the title anew (ZV_WS_calcOrderTax).
    ZV_WS_Status_product_not_found = -1023,
    /// Service: it does not know the customer. Then: activate the device again (ZV_WS_calcOrderTax).
    ZV_WS_Status_user_not_found = -1024,
    /// Service: the customer may not buy. Then: send the customer to the service (ZV_WS_calcOrderTax).
    ZV_WS_Status_user_cant_transact = -1025,
    /// Service: the customer has given no way to pay. Then: let the customer give one at
    /// the service (ZV_WS_calcOrderTax).
    ZV_WS_Status_payment_details_not_found = -1026,
    /// Service: the customer's way to pay does not do. Then: let the customer mend it at
    /// the service (ZV_WS_calcOrderTax).
    ZV_WS_Status_payment_details_invalid = -1027,
    /// Service: the product cannot be had now. Then: show the title
    /// anew (ZV_WS_calcOrderTax, ZV_WS_doPurchaseSavedBilling).
    ZV_WS_Status_product_not_available = -1028,
    /// Unused: of a download's progress reports: no such entry in the queue.
    ZV_WS_Status_dqid_not_found = -1051,
    /// Unused: likewise: no such device.
    ZV_WS_Status_destination_not_found = -1052,
    /// Unused: likewise: an entry's number that cannot be one.
    ZV_WS_Status_invalid_dqid = -1053,
    /// Unused: likewise: no such state of a download.
    ZV_WS_Status_invalid_downloadstatus = -1054,
    /// Unused: likewise: the download has not begun.
    ZV_WS_Status_download_not_init = -1055,
    /// Unused: likewise: the download is over.
    ZV_WS_Status_download_completed = -1056,
    /// Unused: of a customer's registration and sign-in: unknown name.
    ZV_WS_Status_user_or_pswd_not_exist = -1100,
    /// Unused: likewise: wrong password.
    ZV_WS_Status_user_exist_pswd_incorrect = -1101,
    /// Unused: likewise: a failure of the service's own.
    ZV_WS_Status_server_system_err = -1102,
    /// Unused: likewise: something is missing.
    ZV_WS_Status_provide_required_information = -1103,
    /// Unused: likewise: name or address is taken.
    ZV_WS_Status_username_email_already_exist = -1104,
    /// Unused: likewise: name or password of a form that is not allowed.
    ZV_WS_Status_username_password_syntax_error = -1105,
    /// Unused: likewise: the card could not be kept.
    ZV_WS_Status_failed_to_add_user_billinginfo = -1106,
    /// Unused: likewise: unknown address.
    ZV_WS_Status_email_not_found = -1107,
    /// Unused: likewise: no such customer.
    ZV_WS_Status_invalid_user = -1108,
    /// Unused: likewise: a failure of the service's own.
    ZV_WS_Status_failed_to_generate_salt_for_user = -1109,
    /// Unused: likewise: a failure of the service's own.
    ZV_WS_Status_failed_to_generate_random_pswd = -1110,
    /// Unused: likewise: the two passwords differ.
    ZV_WS_Status_pswd_not_match = -1111,
    /// Device: a file or folder cannot be read or written: of the files and settings calls, the cache folder, the
    /// deployment file. Then: look after path, rights, space and the device key.
    ZV_WS_Status_file_operation_error = -1900,
    /// Service: there is no such image, or no file to measure bandwidth with. Then: show a stand-in; do
    /// without the measurement.
    ZV_WS_Status_file_not_found_on_server = -1901,
    /// Service: the image host said "not modified" without having been asked. Then: show a stand-in, and have
    /// the host mended.
    ZV_WS_Status_file_not_modified_on_server = -1902,
    /// Device: the settings file has no such key, or is none. Then: use the default.
    ZV_WS_Status_setting_key_not_found = -1906,
    /// Device: a protected value cannot be deciphered, as one from another device; or the value to be kept cannot be.
    /// Then: write it anew; mend the value.
    ZV_WS_Status_setting_invalid_value = -1907,
    /// Device: the cache's file cannot be opened, not even made anew. Then: set up without a cache; look
    /// after the disk.
    ZV_WS_Status_local_cache_error = -1910,
    /// Device: there is no cache folder and it cannot be made. Then: set up without a cache; look after
    /// path and rights.
    ZV_WS_Status_failed_to_create_cache_folder = -1911,
    /// Service: its configuration has no address to measure bandwidth at. Then: do without the measurement.
    ZV_WS_Status_failed_to_get_bandwidth_check_url = -1920,
    /// Service: its configuration has an address for that which is none. Then: do without the measurement.
    ZV_WS_Status_invalid_bandwidth_check_url = -1921,
    /// Network: no connection to the service: no name, no route, nobody there, or ZV_WS_abort; nothing was sent. Then:
    /// look after the network; try again later.
    ZV_WS_Status_connection_error = -2011,
    /// Network: the answer never came, or ended too early, or ZV_WS_abort broke the call off. Then: try again later;
    /// ask first what became of a call that is sent once.
    ZV_WS_Status_timeout_error = -2012,
    /// Unused: a family for errors of TCP, which are connection_error.
    ZV_WS_Status_tcp_error = -3000,
    /// Service: family of HTTP: the status of the answer (or of the proxy's), or an answer that is no SOAP (-4200).
    /// -4503: the service wants relief. Then: try again later; -4401, -4403 and -4407: look after the credentials.
    ZV_WS_Status_http_error = -4000,
    /// Network: family of TLS: -5030 when a connection is not safe (wrong host, unknown or old certificate) and nothing
    /// was sent; -5000 itself when the device's certificate authorities cannot be loaded. Then: look who is on the
    /// line; mend the deployment.
    ZV_WS_Status_ssl_error = -5000,
    /// Service: family of SOAP: -6012 a fault, whose reason only the log tells; others when the answer breaks the
    /// contract or its limits (docs/contract.md). Then: tell the service's engineers.
    ZV_WS_Status_soap_error = -6000,
    /// Device: its clock is so wrong that no service accepts its requests, or no certificate is valid yet. Then: have
    /// the clock set; nothing works before.
    ZV_WS_Status_clock_wrong = -7001,
};

/// What the status says, in English and in a few words, for logs and consoles: "credit card expired". A number of a
/// family has the text of its base; "unknown status" for any other number without a name. Never null; a constant, of
/// which nothing is to be freed. Any thread.
const char* ZV_WS_statusText(ZV_WS_Status status);
