#include <array>

#include "Records.h"
#include "SessionImpl.h"

namespace {

using FreeFunction = void (*)(ZV_WS_Object*);

constexpr unsigned int kTagCount = 56;

template <class R>
void FreeRecord(ZV_WS_Object* record)
{
    Records::FreeMembers(*static_cast<R*>(record));
}

template <class... R>
constexpr std::array<FreeFunction, kTagCount> MakeTable(std::tuple<R...>*)
{
    std::array<FreeFunction, kTagCount> table{};
    table[SessionImpl::kTag] = ReleaseSession;
    ((table[ZV_WS_RecordTraits<R>::kTag] = FreeRecord<R>), ...);
    return table;
}

// By tag; tags that no record has own nothing.
constexpr auto kFree = MakeTable(static_cast<ZV_WS_AllRecords*>(nullptr));

template <class... R>
constexpr bool HasUniqueTags(std::tuple<R...>*)
{
    bool used[kTagCount] = {};
    used[SessionImpl::kTag] = true;
    for (const unsigned int tag : {ZV_WS_RecordTraits<R>::kTag...}) {
        if (used[tag]) return false;
        used[tag] = true;
    }
    return true;
}
static_assert(HasUniqueTags(static_cast<ZV_WS_AllRecords*>(nullptr)), "two records share a tag");

}  // namespace

ZV_WS_Status ZV_WS_release(ZV_WS_Object* any)
{
    if (!any || !any->_pImpl) return ZV_WS_Status_ok;
    const unsigned int tag = *any->_pImpl;
    if (tag < kTagCount && kFree[tag]) kFree[tag](any);
    delete any->_pImpl;
    any->_pImpl = nullptr;
    return ZV_WS_Status_ok;
}
