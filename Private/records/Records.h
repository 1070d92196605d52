// What the library does with every record alike: empty and tag it, fill an array, free it. All of it follows from the
// description of the records in ZV_WS_Records.h.
#pragma once

#include <new>
#include <type_traits>

#include "CallGuard.h"
#include "ZV_WS_Records.h"

namespace Records {

template <class T>
constexpr bool kIsRecord = std::is_base_of_v<ZV_WS_Object, T>;

template <class R>
void Tag(R& record);

namespace detail {

// Zeroes every member, of embedded records too.
struct Emptier {
    template <class T>
    void Member(const char*, T& value)
    {
        value = T();
    }
    template <class T>
    void Elements(const char*, unsigned int& size, T*& elements)
    {
        size = 0;
        elements = nullptr;
    }
};

// Tags the embedded records.
struct Tagger {
    template <class T>
    void Member(const char*, T& value)
    {
        if constexpr (kIsRecord<T>) Tag(value);
    }
    template <class T>
    void Elements(const char*, unsigned int&, T*&)
    {}
};

struct Freer {
    template <class T>
    void Member(const char*, T& value)
    {
        if constexpr (kIsRecord<T>) {
            ZV_WS_release(&value);
        } else if constexpr (std::is_same_v<T, char*>) {
            delete[] value;
        }
        value = T();
    }
    template <class T>
    void Elements(const char*, unsigned int& size, T*& elements)
    {
        if constexpr (kIsRecord<T>) {
            for (unsigned int i = 0; i < size; ++i)
                ZV_WS_release(&elements[i]);
        }
        delete[] elements;
        size = 0;
        elements = nullptr;
    }
};

template <class R, class Visitor>
void VisitAll(R& record, Visitor& visitor)
{
    if constexpr (!std::is_same_v<R, ZV_WS_Object>) {
        VisitAll<typename ZV_WS_RecordTraits<R>::Base>(record, visitor);
        ZV_WS_RecordTraits<R>::Visit(record, visitor);
    }
}

}  // namespace detail

/// Frees what the members own and zeroes them; the tag stays.
template <class R>
void FreeMembers(R& record)
{
    detail::Freer freer;
    detail::VisitAll(record, freer);
}

/// Empties the record without looking at what it held, and tags it and the records embedded in it. When memory runs out
/// in the middle the record is left empty.
template <class R>
void Tag(R& record)
{
    record._pImpl = nullptr;
    detail::Emptier emptier;
    detail::VisitAll(record, emptier);
    try {
        detail::Tagger tagger;
        detail::VisitAll(record, tagger);
        record._pImpl = new unsigned int(ZV_WS_RecordTraits<R>::kTag);
    } catch (const std::bad_alloc&) {
        FreeMembers(record);
        throw;
    }
}

/// Gives an array record `count` zeroed elements; records among them get their tags. The record can be released at any
/// moment.
template <class T>
void Allocate(unsigned int& size, T*& elements, unsigned int count)
{
    if (count == 0) return;
    elements = new T[count]();
    size = count;
    if constexpr (kIsRecord<T>) {
        for (unsigned int i = 0; i < count; ++i)
            Tag(elements[i]);
    }
}

/// Any output before it is filled: a record is emptied and tagged, a plain value becomes zero.
template <class Output>
void Empty(Output& output)
{
    if constexpr (kIsRecord<Output>) {
        Tag(output);
    } else {
        output = Output();
    }
}

/// The result of `call()`, before which the output is emptied; ZV_WS_Status_general_error when memory was
/// exhausted in either. However it ends, a record can be released.
template <class Output, class Call>
ZV_WS_Status Fill(Output& output, Call&& call)
{
    return GuardCall([&] {
        Empty(output);
        return call();
    });
}

}  // namespace Records
