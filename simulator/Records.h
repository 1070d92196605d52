// The records of the services' answers, as the contract's schema has them: what their children are, and which may be
// left out.
#pragma once

#include <string>
#include <vector>

namespace simulator {

struct Field {
    std::string name;
    std::string type;  ///< A record's, an enumeration's, or one of xsd's with its prefix: "xsd:int".
    char occurs;       ///< '1' always, '?' once at most, '*' any number of times, '@' an attribute.
};
using Fields = std::vector<Field>;

/// A record's children, in order; null when the type is none. What stands in an operation's answer has a type with a
/// line before its name: "_getConfigResponse".
const Fields* FindRecord(const std::string& type);
/// A record whose children are all of one kind.
bool IsArray(const std::string& type);
/// Neither a record nor of xsd's.
bool IsEnumeration(const std::string& type);

}  // namespace simulator
