#include "Store.h"

#include <stdio.h>
#include <stdlib.h>

#include <filesystem>

ZV_WS_Pagination FirstPage()
{
    ZV_WS_Pagination page;
    page.CurrentPageNumber = 1;
    page.ItemsPerPage = kItems;
    return page;
}

void Check(bool holds, const char* what)
{
    if (holds) return;
    fprintf(stderr, "zv_bench: failed: %s\n", what);
    exit(1);
}

Storefront& TheStore()
{
    static const std::unique_ptr<Storefront> store = [] {
        std::string error;
        std::unique_ptr<Storefront> started = Storefront::Start(StorefrontOptions(), error);
        Check(started != nullptr, error.c_str());
        setenv("ZV_DEPLOYMENT", started->DeploymentFile().c_str(), 1);
        return started;
    }();
    return *store;
}

BenchSession::BenchSession(const char* cacheFolder)
{
    TheStore();
    ZV_WS_SetupParams setup;
    setup.APIKey = StorefrontAccount::kApiKey;
    setup.DestinationUniqueID = "bench";
    setup.DestinationTypeID = 48;
    setup.UserName = StorefrontAccount::kUser;
    setup.Password = StorefrontAccount::kPassword;
    setup.AccessType = ACCESS_TYPE_STREAM;
    setup.EnvNum = ENVNUM_PRODUCTION;
    if (cacheFolder) {
        setup.CacheParam.Type = CacheType_File;
        setup.CacheParam.Data = ZV_WS_CacheParam::CacheData_Metadata;
        setup.CacheParam.Path = cacheFolder;
    }
    Check(ZV_WS_initialize(&m_Handle, &setup) == ZV_WS_Status_ok, "ZV_WS_initialize");
}

void BenchSession::GetTitles()
{
    const ZV_WS_Pagination page = FirstPage();
    ZV_WS_TitlesResponse titles;
    const ZV_WS_Status status = ZV_WS_getTitles(&m_Handle, 1, &page, PURCHASE_TYPE_RENT, &titles);
    Check(status == ZV_WS_Status_ok && titles.Titles.size == kItems, "ZV_WS_getTitles");
    ZV_WS_release(&titles);
}

TemporaryFolder::TemporaryFolder()
{
    Check(mkdtemp(m_Path) != nullptr, "a folder in /tmp");
}

TemporaryFolder::~TemporaryFolder()
{
    std::filesystem::remove_all(m_Path);
}
