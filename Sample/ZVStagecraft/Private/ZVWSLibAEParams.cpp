#include "ZVWSLibAEParams.h"

using namespace ae::stagecraft;

void PropertyReader::operator()(const char* name, AEArray<int>& field)
{
    const uint32_t kMost = 10000;  // a script array can claim four thousand million elements
    ASValue array;
    m_Succeeded = m_Object.GetProperty(name, array) && array.IsObject() && array.GetObject()->IsInstanceOf("Array") &&
                  array.GetObject()->GetLength() <= kMost;
    if (!m_Succeeded) return;
    const uint32_t length = array.GetObject()->GetLength();
    for (uint32_t i = 0; i < length && i < kMost; ++i) {
        ASValue element;
        if (!array.GetObject()->GetElement(i, element)) return;
        field.Append(ASToInt32(m_Object.ToNumber(element)));
    }
}
