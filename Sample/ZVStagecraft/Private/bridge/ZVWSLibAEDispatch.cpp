#include "ZVWSLibAEDispatch.h"

#include "ZV_Log.h"

using namespace ae::stagecraft;

ZV_LOG_AREA(ZVWSAELOG_AREA_NAME)

namespace ZVWSLib {

int LogAreaID()
{
    return GetZV_LogAreaID();
}

void LogParameters(const Param_getTitles& param)
{
    // Log readers search for this text: the misspelled word and the pointer are part of it.
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_VERBOSE,
                 "ZVWSLibAE::getTitles, parameters geneeid:%d, currentPageNo:%d,itemsPerPage:%d, purchaseType:%p \n",
                 param.genreid, static_cast<int>(param.page.CurrentPageNumber),
                 static_cast<int>(param.page.ItemsPerPage),
                 reinterpret_cast<void*>(static_cast<intptr_t>(param.purchasetype)));
}

void LogStatus(const char* name, ZV_WS_Status status)
{
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "ZVWSLib::%s, ret:%d\n", name, static_cast<int>(status));
}

bool ReadArguments(ASValueArray& arguments, ASValue& callback, ASValue& parameters)
{
    if (arguments.size() != 1 || !arguments[0].IsObject()) return false;
    ASObject& array = *arguments[0].GetObject();
    return array.IsInstanceOf("Array") && array.GetLength() == 2 && array.GetElement(0, callback) &&
           callback.IsObject() && array.GetElement(1, parameters) && parameters.IsObject();
}

}  // namespace ZVWSLib
