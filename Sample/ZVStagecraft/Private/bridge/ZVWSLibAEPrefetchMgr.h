// The bookkeeping of fetching ahead: which pages of a listing are in the cache, and which to fetch next.
#pragma once

#include <stdint.h>

#include "CacheInterface.h"
#include "KernelMutex.h"
#include "ZVWSLibAE.h"
#include "ZVWSLibAEResult.h"

/// Which pages of the listing shown last are in the cache, and which are to be fetched next. The owner's mutex guards
/// the pages; any thread may mark one, all else is the main thread's.
///
/// A page is marked when it has been put into the cache. Marks hold as long as CacheInterface::Drops() has the value
/// that it had before the first of them was asked for: when something was dropped from a cache, whatever it was and
/// whoever did it, no page counts as being there.
class ZVWSLibAE::PrefetchMgr {
public:
    /// At most so many pages are asked for at once.
    static constexpr unsigned int m_kPrefetchPages = 8;

    /// The owner's mutex, before anything else. Null is a usage fault.
    void SetMutex(KernelMutex* mutex);

    /// Tells which listing is shown. Another one than before starts afresh: its pages and the box art that waits are
    /// forgotten. `itemsPerPage` is what was asked for, as the cache knows pages by their requests; the totals are the
    /// answer's. The numbers at the end are the listing's own (genre, filters).
    void Update(AEArray<AEString>& waitingBoxArts, Result_Type type, unsigned int totalPages, unsigned int totalItems,
                unsigned int itemsPerPage, int userdata1, int userdata2, int userdata3);

    /// Marks a page, by the number that it was asked for with. `drops` is CacheInterface::Drops() before it was asked
    /// for; when it has changed, the page may be gone again and is not marked.
    void MarkPagePrefetched(unsigned int page, uint64_t drops);

    /// The pages around `current` that are not there yet, nearest first: next, previous, the one after next... The
    /// listing closes to a circle. `pages` has room for `count`; null finds nothing.
    void GetPagesForPrefetch(unsigned int current, unsigned int count, unsigned int* pages, unsigned int& found);

    unsigned int NextPage(unsigned int page) const { return page + 1 > m_TotalPages ? 1 : page + 1; }
    unsigned int PrevPage(unsigned int page) const { return page == 1 ? m_TotalPages : page - 1; }

private:
    typedef AEArray<unsigned int> Pages;

    bool IsPageAlreadyPrefetched(unsigned int page) const ZV_REQUIRES(*m_Mutex);
    /// The pages `count` steps on from `current` (or back), those that are there left out.
    Pages Scan(unsigned int current, unsigned int count, bool forward) const ZV_REQUIRES(*m_Mutex);

    KernelMutex* m_Mutex = nullptr;
    Result_Type m_type = eVoid;
    unsigned int m_TotalPages = 0;
    unsigned int m_TotalItems = 0;
    unsigned int m_ItemsPerPage = 0;
    int m_userdata1 = 0;
    int m_userdata2 = 0;
    int m_userdata3 = 0;
    unsigned int m_LastPageNumber = 0;
    Pages m_PrefetchedPages ZV_GUARDED_BY(*m_Mutex);
    uint64_t m_Drops ZV_GUARDED_BY(*m_Mutex) = 0;  // under which they are marked
};
