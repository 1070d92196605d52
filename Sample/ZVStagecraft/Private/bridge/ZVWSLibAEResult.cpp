#include "ZVWSLibAEResult.h"

#include <stdio.h>

#include "ZV_WS_Records.h"

using namespace ae::stagecraft;

namespace ZVWSLib {

namespace {

// An array record and nothing else: it becomes the Array itself, not an object that holds one.
template <class Record, class = void>
struct IsArray : std::false_type {};
template <class Record>
struct IsArray<Record, std::void_t<decltype(std::declval<Record>().size)>>
    : std::is_same<typename ZV_WS_RecordTraits<Record>::Base, ZV_WS_Object> {};

// A service date as a Date in local time; null for anything else.
ASValue DateOf(const char* text, ASObject& maker)
{
    int year = 0, month = 0, day = 0, hours = 0, minutes = 0, seconds = 0;
    const bool isDate =
        text && sscanf(text, "%04d/%02d/%02d %02d:%02d:%02d", &year, &month, &day, &hours, &minutes, &seconds) == 6 &&
        year >= 0 && month >= 1 && month <= 12 && day >= 1 && day <= 31 && hours >= 0 && hours < 24 && minutes >= 0 &&
        minutes < 60 && seconds >= 0 && seconds <= 60;
    if (!isDate) return ASValue::Null();
    ASValueArray parts;
    for (const int part : {year, month - 1, day, hours, minutes, seconds})
        parts.Append(ASValue::Number(part));
    ASValue date;
    maker.Construct("Date", parts, date);
    if (year < 100 && date.IsObject()) {
        // Date takes such years as of the twentieth century, setFullYear takes them as they are.
        ASValueArray day0;
        for (const int part : {year, month - 1, day})
            day0.Append(ASValue::Number(part));
        ASValue time;
        date.GetObject()->Call("setFullYear", day0, time);
    }
    return date;
}

// Sets members of a record as properties of an object.
class Writer {
public:
    explicit Writer(ASObject& object) : m_Object(object) {}

    ASObject& Object() { return m_Object; }

    template <class Field>
    void Member(const char* name, const Field& field)
    {
        m_Object.SetProperty(name, Of(field));
    }

    template <class Element>
    void Elements(const char* name, unsigned int size, const Element* elements)
    {
        m_Object.SetProperty(name, ArrayOf(size, elements));
    }

    void Date(const char* name, const char* text) { m_Object.SetProperty(name, DateOf(text, m_Object)); }

    ASValue Of(bool field) { return ASValue::Boolean(field); }
    ASValue Of(const char* field) { return ASValue::String(field); }
    ASValue Of(char* field) { return ASValue::String(field); }
    ASValue Of(const ZV_WS_String& field) { return ASValue::String(field.data); }

    template <class Field>
    ASValue Of(const Field& field)
    {
        if constexpr (!std::is_class_v<Field>) {
            return ASValue::Number(static_cast<double>(field));
        } else if constexpr (IsArray<Field>::value) {
            ArrayMaker maker{*this, ASValue()};
            ZV_WS_RecordTraits<Field>::Visit(field, maker);
            return maker.array;
        } else {
            return ObjectOf(field);
        }
    }

private:
    struct ArrayMaker {
        template <class Element>
        void Elements(const char*, unsigned int size, const Element* elements)
        {
            array = writer.ArrayOf(size, elements);
        }

        Writer& writer;
        ASValue array;
    };

    template <class Record>
    ASValue ObjectOf(const Record& record);

    template <class Element>
    ASValue ArrayOf(unsigned int size, const Element* elements)
    {
        ASValue array;
        if (!m_Object.Construct("Array", ASValueArray(), array) || !array.IsObject()) return array;
        for (unsigned int i = 0; i < size; ++i) {
            ASValueArray arguments;
            arguments.Append(ElementOf(elements[i]));
            ASValue length;
            array.GetObject()->Call("push", arguments, length);
        }
        return array;
    }

    template <class Element>
    ASValue ElementOf(const Element& element)
    {
        return Of(element);
    }
    // In arrays a file profile is an object of its own.
    ASValue ElementOf(const ZV_WS_FileProfile& element)
    {
        ASValue object;
        if (m_Object.Construct("Object", ASValueArray(), object) && object.IsObject())
            object.GetObject()->SetProperty("FileProfile", Of(element));
        return object;
    }

    ASObject& m_Object;
};

// ---- The properties of each record: its base's members, then its own, except where scripts know another order.

#define ZVWS_SET(name) writer.Member(#name, record.name);

void Set(Writer& writer, const ZV_WS_ProductListing& record)
{
    ZV_WS_EACH(ZVWS_SET, SkuID, PurchaseType, Price, RentalPeriod, AvailableAssets, AvailableAudioProfiles)
    writer.Date("ExpireDate", record.ExpireDate);
}

void Set(Writer& writer, const ZV_WS_TitleListing& record)
{
    ZV_WS_TitleListing2ASObject(record, writer.Object());
}

void Set(Writer& writer, const ZV_WS_TitlesResponse& record)
{
    ZV_WS_EACH(ZVWS_SET, GenreID, CurrentPageNumber, ItemsPerPage, TotalPages, TotalItems, ResponseCode,
               ResponseMessage, Titles)
}

void Set(Writer& writer, const ZV_WS_MyVideosResponse& record)
{
    ZV_WS_MyVideosResponse2ASObject(record, writer.Object());
}

void Set(Writer& writer, const ZV_WS_ConfigResponse& record)
{
    ZVWS_SET(ResponseCode)
    writer.Elements("ConfigurationItem", record.size, record.ConfigurationItem);
    ZVWS_SET(ResponseMessage)
}

void Set(Writer& writer, const ZV_WS_StreamingAssetLocationResponse& record)
{
    ZV_WS_EACH(ZVWS_SET, StreamingAssetLocation, AssetID, StreamID, DRMServerURL, DRMACKServerURL, Status,
               StartTimeSeconds, HeartbeatURL, HeartbeatPollInSeconds, ResponseCode, ResponseMessage)
}

template <class Record>
void Set(Writer& writer, const Record& record)
{
    using Traits = ZV_WS_RecordTraits<Record>;
    if constexpr (!std::is_same_v<typename Traits::Base, ZV_WS_Object>)
        Set(writer, static_cast<const typename Traits::Base&>(record));
    Traits::Visit(record, writer);
}

template <class Record>
ASValue Writer::ObjectOf(const Record& record)
{
    ASValue object;
    if (!m_Object.Construct("Object", ASValueArray(), object) || !object.IsObject()) return object;
    Writer writer(*object.GetObject());
    Set(writer, record);
    return object;
}

}  // namespace

void ZV_WS_TitleListing2ASObject(const ZV_WS_TitleListing& record, ASObject& object)
{
    Writer writer(object);
    ZV_WS_EACH(ZVWS_SET, TitleID, TitleName, BoxArtPrefix, TitlePosition, EpisodeNumber, CHVRSRating,
               LoyaltyPointsForBuy, LoyaltyPointsForRent, BonusAssets, IsTvListing, MPAARating,
               IsTHXMediaDirectorEnabled, IsTHXMediaDirectorEnabledForTrailer, AvailableProducts)
}

void ZV_WS_TitleListingResponse2ASObject(const ZV_WS_TitleListingResponse& record, ASObject& object)
{
    Writer writer(object);
    Set(writer, record);
}

void ZV_WS_MyVideosResponse2ASObject(const ZV_WS_MyVideosResponse& record, ASObject& object)
{
    Writer writer(object);
    ZV_WS_EACH(ZVWS_SET, CurrentPageNumber, ItemsPerPage, TotalPages, TotalItems, ResponseCode, ResponseMessage, Titles)
}

void SetResult(const Result& result, ASValue& value, ASObject& callback)
{
    value = std::visit(
        [&](const auto& field) {
            if constexpr (std::is_same_v<decltype(field), const std::monostate&>) {
                return ASValue();
            } else {
                return Writer(callback).Of(field);
            }
        },
        result.value);
}

}  // namespace ZVWSLib

void Result::Release()
{
    std::visit(
        [](auto& field) {
            if constexpr (std::is_base_of_v<ZV_WS_Object, std::decay_t<decltype(field)>>) ZV_WS_release(&field);
        },
        value);
    value = std::monostate();
}
