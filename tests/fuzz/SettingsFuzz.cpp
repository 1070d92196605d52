// The settings document. The input's first line is a key, the second a value, the rest is the document.
#include "CfgXMLDocument.h"
#include "Target.h"

namespace {

ZVString Bytes(std::string_view text)
{
    return ZVString(text.data(), text.size());
}

// What every document can hold, whatever it is like.
ZVString Printable(std::string text)
{
    for (char& c : text) {
        if (c < 0x20 || c == 0x7f) c = '_';
    }
    return Bytes(text);
}

// The document with the setting changed; it must read back.
ZVString Changed(const ZVString& text, const ZVString& key, const ZVString& value)
{
    CfgXMLDocument document;
    Require(document.Parse(text), "a changed document is one");
    ZVString changed = document.With(key, value);
    CfgXMLDocument reread;
    Require(reread.Parse(changed), "and so is the next");
    const ZVString* found = reread.Find(key);
    Require(found && *found == value, "a setting reads back");
    return changed;
}

}  // namespace

void TestInput(std::string_view input)
{
    const std::string key = TakeLine(input);
    const std::string value = TakeLine(input);
    const ZVString text = Bytes(input);
    CfgXMLDocument document;
    if (!document.Parse(text)) return;
    const ZVString* before = document.Find("name");
    const ZVString name = before ? *before : ZVString();

    CfgXMLDocument any;
    any.Parse(document.With(Bytes(key), Bytes(value)));  // may be no document: writing looks at it

    const ZVString plainKey = Printable("k" + key);
    const ZVString first = Changed(text, plainKey, Printable(value));
    const ZVString second = Changed(first, plainKey, "another");
    Require(Changed(second, plainKey, Printable(value)) == first, "nothing else changes");
    Require(document.Parse(first), "the document stays one");
    const ZVString* after = document.Find("name");
    Require((after != nullptr) == (before != nullptr) && (!after || *after == name), "other settings stay");
}
