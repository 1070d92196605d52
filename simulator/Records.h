// The records of the services' answers, as the contract has them: what their children are, and which may be left out.
#pragma once

#include <map>
#include <string>
#include <vector>

namespace simulator {

struct Field {
    std::string name;
    std::string
        type;     ///< A record's, an enumeration's, or one of xsd's: int, short, boolean, string, decimal, anyType.
    char occurs;  ///< '1' always, '?' once at most, '*' any number of times, '@' an attribute.
};
using Fields = std::vector<Field>;

/// The children of every record, in order. An operation's answer is one without a name: "_getConfigResponse".
const std::map<std::string, Fields>& Records();

/// Null when the type is no record.
const Fields* FindRecord(const std::string& type);
/// A record whose children are all of one kind.
bool IsArray(const std::string& type);
bool IsXsdType(const std::string& type);
/// Neither a record nor of xsd's.
bool IsEnumeration(const std::string& type);

}  // namespace simulator
