// A session against a storefront of its own.
#pragma once

#include <gtest/gtest.h>
#include <stdlib.h>

#include <algorithm>
#include <functional>
#include <tuple>

#include "Storefront.h"
#include "ZVWSLib.h"

/// Frees the record at the end of its scope.
template <class Record>
struct Owned : Record {
    ~Owned() { ZV_WS_release(this); }
};

/// A call without its output, which is freed.
using AnyCall = std::function<ZV_WS_Status(ZV_WS_Session*)>;

template <class... Parameters, class... Arguments>
AnyCall Asking(ZV_WS_Status (*call)(ZV_WS_Session*, Parameters...), Arguments... arguments)
{
    using Output = std::remove_pointer_t<std::tuple_element_t<sizeof...(Arguments), std::tuple<Parameters...>>>;
    return [=](ZV_WS_Session* session) {
        Owned<Output> record;
        return call(session, arguments..., &record);
    };
}

class Store : public testing::Test {
protected:
    void SetUp() override { Open(StorefrontOptions()); }
    void TearDown() override { ZV_WS_release(&session); }

    void Open(const StorefrontOptions& options)
    {
        std::string error;
        store = Storefront::Start(options, error);
        ASSERT_TRUE(store) << error;
        setenv("ZV_DEPLOYMENT", store->DeploymentFile().c_str(), 1);
    }

    static ZV_WS_SetupParams Setup(ZV_WS_AccessType accessType = ACCESS_TYPE_STREAM)
    {
        ZV_WS_SetupParams setup;
        setup.APIKey = StorefrontAccount::kApiKey;
        setup.DestinationUniqueID = "test/device 1";
        setup.DestinationTypeID = 48;
        setup.UserName = StorefrontAccount::kUser;
        setup.Password = StorefrontAccount::kPassword;
        setup.AccessType = accessType;
        return setup;
    }

    ZV_WS_Status Initialize(const ZV_WS_SetupParams& setup = Setup()) { return ZV_WS_initialize(&session, &setup); }

    void Fault(const std::string& text)
    {
        std::string error;
        ASSERT_TRUE(store->AddFault(text, error)) << error;
    }

    /// The operations asked since the log was cleared, without discovery; with "!" behind what was refused.
    std::vector<std::string> Asked() const
    {
        std::vector<std::string> asked;
        for (const LoggedRequest& request : store->Log()) {
            if (request.service != "discovery")
                asked.push_back(request.operation + (request.violation.empty() ? "" : "!"));
        }
        return asked;
    }

    static std::string Header(const LoggedRequest& request, const std::string& name)
    {
        for (const auto& header : request.headers) {
            if (header.first == name) return header.second;
        }
        return "";
    }

    int Number(const std::string& sql) const { return atoi(store->Query(sql).c_str()); }

    std::unique_ptr<Storefront> store;
    ZV_WS_Session session;
};

inline ZV_WS_Pagination Page(unsigned int number, unsigned int items)
{
    ZV_WS_Pagination page;
    page.CurrentPageNumber = number;
    page.ItemsPerPage = items;
    return page;
}
