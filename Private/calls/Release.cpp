#include <array>

#include "Records.h"
#include "SessionImpl.h"

namespace {

using FreeFunction = void (*)(ZV_WS_Object*);

template <class R>
void FreeRecord(ZV_WS_Object* record)
{
    Records::FreeMembers(*static_cast<R*>(record));
}

template <class... R>
constexpr std::array<FreeFunction, ZV_WS_kTagCount> MakeTable(std::tuple<R...>*)
{
    std::array<FreeFunction, ZV_WS_kTagCount> table{};
    table[SessionImpl::kTag] = ReleaseSession;
    ((table[ZV_WS_RecordTraits<R>::kTag] = FreeRecord<R>), ...);
    return table;
}

// By tag; tags that no record has own nothing.
constexpr auto kFree = MakeTable(static_cast<ZV_WS_AllRecords*>(nullptr));

}  // namespace

ZV_WS_Status ZV_WS_release(ZV_WS_Object* any)
{
    if (!any || !any->_pImpl) return ZV_WS_Status_ok;
    const unsigned int tag = *any->_pImpl;
    if (tag < ZV_WS_kTagCount && kFree[tag]) kFree[tag](any);
    delete any->_pImpl;
    any->_pImpl = nullptr;
    return ZV_WS_Status_ok;
}
