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

void FreeSession(ZV_WS_Object* record)
{
    auto* session = static_cast<ZV_WS_Session*>(record);
    delete session->_pSessionImpl;
    session->_pSessionImpl = nullptr;
}

template <class... R>
constexpr std::array<FreeFunction, kTagCount> MakeTable(std::tuple<R...>*)
{
    std::array<FreeFunction, kTagCount> table{};
    table[SessionImpl::kTag] = FreeSession;
    ((table[ZV_WS_RecordTraits<R>::kTag] = FreeRecord<R>), ...);
    return table;
}

// By tag; tags that no record has own nothing.
constexpr auto kFree = MakeTable(static_cast<ZV_WS_AllRecords*>(nullptr));

// Flags, since addresses of functions are no constants to compare when a sanitizer watches.
template <class... R>
constexpr unsigned int CountTags(std::tuple<R...>*)
{
    std::array<bool, kTagCount> taken{};
    taken[SessionImpl::kTag] = true;
    ((taken[ZV_WS_RecordTraits<R>::kTag] = true), ...);
    unsigned int count = 0;
    for (const bool tag : taken)
        count += tag;
    return count;
}
static_assert(CountTags(static_cast<ZV_WS_AllRecords*>(nullptr)) == std::tuple_size_v<ZV_WS_AllRecords> + 1,
              "two records share a tag");

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
