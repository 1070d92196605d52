#include "ZVWSLibAEPrefetchMgr.h"

#include <algorithm>
#include <tuple>

#include "ZVWSAELog.h"
#include "ZV_Log.h"

ZV_LOG_AREA(ZVWSAELOG_AREA_NAME)

void ZVWSLibAE::PrefetchMgr::SetMutex(KernelMutex* mutex)
{
    AE_USAGE_CHECK(mutex != nullptr);
    m_Mutex = mutex;
}

bool ZVWSLibAE::PrefetchMgr::IsPageAlreadyPrefetched(unsigned int page) const
{
    return m_Drops == CacheInterface::Drops() &&
           std::find(m_PrefetchedPages.begin(), m_PrefetchedPages.end(), page) != m_PrefetchedPages.end();
}

void ZVWSLibAE::PrefetchMgr::Update(AEArray<AEString>& waitingBoxArts, Result_Type type, unsigned int totalPages,
                                    unsigned int totalItems, unsigned int itemsPerPage, int userdata1, int userdata2,
                                    int userdata3)
{
    AE_USAGE_CHECK(m_Mutex != nullptr);
    const auto identity = [this] {
        return std::tie(m_type, m_TotalPages, m_TotalItems, m_ItemsPerPage, m_userdata1, m_userdata2, m_userdata3);
    };
    const auto shown = std::make_tuple(type, totalPages, totalItems, itemsPerPage, userdata1, userdata2, userdata3);
    if (identity() == shown) return;
    const KernelLock lock(*m_Mutex);
    identity() = shown;
    m_PrefetchedPages.RemoveAll();
    waitingBoxArts.RemoveAll();
    m_LastPageNumber = 0;
}

void ZVWSLibAE::PrefetchMgr::MarkPagePrefetched(unsigned int page, uint64_t drops)
{
    const KernelLock lock(*m_Mutex);
    if (drops != CacheInterface::Drops()) return;
    if (drops != m_Drops) m_PrefetchedPages.RemoveAll();
    m_Drops = drops;
    m_PrefetchedPages.Append(page);
}

ZVWSLibAE::PrefetchMgr::Pages ZVWSLibAE::PrefetchMgr::Scan(unsigned int current, unsigned int count, bool forward) const
{
    const char* const direction = forward ? " pageForNext" : ",pageForPre";
    Pages pages(m_kPrefetchPages);
    for (unsigned int i = 1; i <= count; ++i) {
        const unsigned int rest = (forward ? current + i : current + m_TotalPages - i) % m_TotalPages;
        const unsigned int page = rest == 0 ? m_TotalPages : rest;
        if (IsPageAlreadyPrefetched(page)) continue;
        ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "ZVWSLibAE::PrefetchMgr::GetPagesForPrefetch,%s[%d]:%d \n",
                     direction, static_cast<int>(pages.size()), static_cast<int>(page));
        pages.Append(page);
    }
    // Both directions are counted under this name.
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "ZVWSLibAE::PrefetchMgr::GetPagesForPrefetch, pageNumsForNext:%d \n",
                 static_cast<int>(pages.size()));
    return pages;
}

void ZVWSLibAE::PrefetchMgr::GetPagesForPrefetch(unsigned int current, unsigned int count, unsigned int* pages,
                                                 unsigned int& found)
{
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE,
                 "ZVWSLibAE::PrefetchMgr::GetPagesForPrefetch enter,CurrentPageNumber:%d, pageNumsToRequest:%d,\n",
                 static_cast<int>(current), static_cast<int>(count));
    const KernelLock lock(*m_Mutex);
    found = 0;
    if (!pages || m_TotalPages == 0 || count == 0 || current == 0 || current > m_TotalPages) return;
    const unsigned int n = std::min({count, m_TotalPages, m_kPrefetchPages});
    const Pages next = Scan(current, (n + 1) / 2, true);
    Pages previous = Scan(current, n / 2, false);
    // Where both directions meet, forward has the page. The hole that it leaves ends the way back.
    for (unsigned int& page : previous) {
        if (std::find(next.begin(), next.end(), page) != next.end()) page = 0;
    }
    size_t taken[2] = {0, 0};
    for (unsigned int slot = 0; slot < n; ++slot) {
        const Pages& list = slot % 2 == 0 ? next : previous;
        size_t& at = taken[slot % 2];
        if (at == list.size() || list[at] == 0) continue;
        ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "ZVWSLibAE::PrefetchMgr::GetPagesForPrefetch,,pageNum[%d]:%d \n",
                     static_cast<int>(found), static_cast<int>(list[at]));
        pages[found++] = list[at++];
    }
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE,
                 "ZVWSLibAE::PrefetchMgr::GetPagesForPrefetch left,pageNumsFound:%d \n", static_cast<int>(found));
}
