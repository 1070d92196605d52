// The text of a settings file: where each setting stands in it, and the text with one setting changed. Everything
// outside of the changed element stays byte for byte.
//
//     <ZVWSLib ...><ZV1:Configuration Key="name"><ZV1:Value>text</ZV1:Value></ZV1:Configuration>...</ZVWSLib>
//
// Settings are elements right under the root; what else stands there is passed over. Texts come from a disk that others
// write on: documents with a document type (and so with entities of their own), in another encoding than UTF-8 or deep
// without end are refused, and nothing is fetched.
#pragma once

#include <vector>

#include "ZVString.h"

class CfgXMLDocument {
public:
    /// Null until Parse; false for a text that is no such document. An empty text is a document without settings.
    bool Parse(const ZVString& text);

    /// The value of the first element with exactly that key, empty for one without a value; null when there is none.
    /// Valid until the next Parse.
    const ZVString* Find(const ZVString& key) const;

    /// The document with the first element of that key replaced, or a new one at the end. Key and value are not checked
    /// for characters that XML cannot hold: parse the result. "" when memory for a first document is short.
    ZVString With(const ZVString& key, const ZVString& value) const;

private:
    friend struct CfgXMLReader;

    struct Element {
        ZVString key;
        ZVString value;
        size_t begin;  ///< The offset of its "<".
        size_t end;    ///< The offset behind its ">".
    };

    const Element* FindElement(const ZVString& key) const;

    ZVString m_Text;
    std::vector<Element> m_Elements;
    ZVString m_RootName;            ///< As the document writes it.
    size_t m_RootEnd = 0;           ///< The offset behind the document element.
    bool m_PrefixDeclared = false;  ///< Whether the root binds "ZV1".
};
