#include "ZVWSLibAEParams.h"

using namespace ae::stagecraft;

bool PropertyReader::ReadArray(const char* name, AEArray<int>& field)
{
    const uint32_t kMost = 10000;  // a script array can claim four thousand million elements
    ASValue property;
    if (!m_Object.GetProperty(name, property) || !property.IsObject()) return false;
    ASObject& array = *property.GetObject();
    uint32_t length;
    if (!array.IsInstanceOf("Array") || !array.GetUint("length", length) || length > kMost) return false;
    for (uint32_t i = 0; i < length; ++i) {
        ASValue element;
        double number;
        if (!array.GetElement(i, element) || !array.ToNumber(element, number)) return false;
        field.Append(ASToInt32(number));
    }
    return true;
}
