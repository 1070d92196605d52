#include "FaultKinds.h"

#include <iterator>

namespace simulator {

namespace {

constexpr KindRow kKinds[] = {
    {std::monostate(), "ok", "", kEverywhere, kDone,
     "no fault: the request passes (to let some requests through first)"},
    {Result::Code, "code", "N", kSoap, kUndone, "the service refuses with response code N (answers that have one)"},
    {Result::Fault11, "fault11", "", kSoap, kUndone, "a SOAP 1.1 fault"},
    {Result::Fault12, "fault12", "", kSoap, kUndone, "a SOAP 1.2 fault"},
    {Result::Soap12, "soap12", "", kSoap, kDone, "the right answer in a SOAP 1.2 envelope"},
    {Content::Status, "http", "N", kAnswers | kProxy, kUndone,
     "HTTP status N (302 with a Location; retry=SECONDS adds a Retry-After)"},
    {Cutting::Cut, "cut", "", kAnswers | kProxy, kUndone, "the connection is closed before the answer"},
    {Cutting::CutHeader, "cut-header", "", kAnswers | kProxy, kUndone, "closed in the middle of the HTTP header"},
    {Cutting::CutBody, "cut-body", "", kAnswers, kUndone, "closed in the middle of the body"},
    {Breaking::Reset, "reset", "", kEverywhere, kUndone, "the connection is reset"},
    {Breaking::Stall, "stall", "", kEverywhere, kUndone,
     "no answer (connect: no handshake), as long as the client waits"},
    {Cutting::StallHeader, "stall-header", "", kAnswers | kProxy, kUndone, "half of the HTTP header, and then nothing"},
    {Cutting::StallBody, "stall-body", "", kAnswers, kDone, "half of the body, and then nothing"},
    {Opening::StallHandshake, "stall-handshake", "", kConnect, kUndone,
     "the beginning of a handshake record, and then nothing"},
    {Pacing::Drip, "drip", "N", kAnswers | kProxy, kDone, "the answer in single bytes, N milliseconds (100) apart"},
    {Pacing::Hold, "hold", "", kAnswers | kProxy, kDone,
     "the right answer, made now and kept back until the faults are cleared"},
    {Pacing::Split, "split", "N", kAnswers, kDone, "header and body in two writes, N milliseconds (50) apart"},
    {Content::Garbage, "garbage", "", kAnswers | kProxy, kUndone, "200, and a body that is no XML"},
    {Breaking::NoHttp, "no-http", "", kEverywhere, kUndone, "bytes that are no HTTP (connect: no TLS)"},
    {Bounding::Short, "short", "", kAnswers, kUndone, "less body than its length announces"},
    {Bounding::Long, "long", "", kAnswers | kProxy, kDone, "bytes left over behind the announced length"},
    {Bounding::Stray, "stray", "", kAnswers, kDone,
     "a whole answer of 408 behind the right one, which nobody has asked for"},
    {Bounding::NoLength, "no-length", "", kAnswers, kUndone, "no Content-Length"},
    {Bounding::ZeroLength, "zero-length", "", kAnswers | kProxy, kUndone, "Content-Length 0"},
    {Bounding::Chunked, "chunked", "N", kAnswers | kProxy, kDone, "in chunks of N (1000) bytes"},
    {Bounding::ConnectionClose, "connection-close", "", kAnswers | kProxy, kDone,
     "closed behind the answer, which says so"},
    {Bounding::Http10, "http10", "", kAnswers | kProxy, kDone,
     "an answer of HTTP/1.0, which the connection's end ends"},
    {Bounding::Continue, "continue", "", kAnswers | kProxy, kDone, "a 100 Continue before the answer"},
    {Content::Empty, "empty", "", kAnswers, kUndone, "200 with an empty body"},
    {Endless::Body, "endless", "", kAnswers | kProxy, kUndone, "a body that never ends"},
    {Endless::Header, "endless-header", "", kAnswers | kProxy, kUndone, "header lines that never end"},
    {Heading::Headers, "headers", "N", kAnswers | kProxy, kDone, "N KiB (64) of further header lines"},
    {Heading::Date, "date", "SECONDS", kAnswers | kProxy, kDone, "a Date that is SECONDS (3600) ahead of the clock"},
    {Heading::BadDate, "bad-date", "", kAnswers | kProxy, kDone, "a Date that is none"},
    {Heading::NoDate, "no-date", "", kAnswers | kProxy, kDone, "no Date"},
    {Heading::Age, "age", "N", kAnswers | kProxy, kDone,
     "an Age of N seconds (60), as of an answer that was kept somewhere"},
    {Content::Bomb, "bomb", "N", kAnswers, kUndone, "a compressed body of N MiB (256) of blanks"},
    {Content::DamagedGzip, "damaged-gzip", "", kAnswers, kUndone, "a compressed body with wrong bytes in it"},
    {Content::WrongChecksum, "wrong-checksum", "", kAnswers, kUndone, "a compressed body whose checksum is wrong"},
    {Result::MissingResult, "missing-result", "", kSoap, kUndone, "an answer without its result element"},
    {Result::MustUnderstand, "must-understand", "", kSoap, kDone, "an unknown header block that must be understood"},
    {Result::ExtraHeader, "extra-header", "", kSoap, kDone, "an unknown header block that need not be"},
    {Result::UnknownEnum, "unknown-enum", "", kSoap, kDone,
     "an enumeration text that no contract knows (in answers that hold one)"},
    {Shape::Prefixes, "prefixes", "", kSoap, kDone,
     "other prefixes, and comments, white space and quotes where XML has a choice"},
    {Shape::Nil, "nil", "", kSoap, kDone, "children that are left out else, with xsi:nil"},
    {Shape::AbsentArrays, "absent-arrays", "", kSoap, kDone, "empty arrays left out"},
    {Shape::Latin1, "latin1", "", kSoap, kDone, "in ISO-8859-1"},
    {Shape::Bom, "bom", "", kSoap, kDone, "with a byte order mark"},
    {Shape::XsiTypes, "xsi-types", "", kSoap, kDone, "each element with its xsi:type"},
    {Shape::Cdata, "cdata", "", kSoap, kDone, "texts in CDATA sections"},
    {Shape::Text, "text", "", kSoap, kDone, "text between the children of records"},
    {Shape::Boolean, "boolean", "TEXT", kSoap, kDone,
     "TEXT in each boolean, as it stands in XML (1 and 0 for true and false)"},
    {Shape::Enum, "enum", "TEXT", kSoap, kDone, "TEXT (NEW_TEXT) in each enumeration, elements and attributes"},
    {Shape::Counter, "counter", "N", kSoap, kDone, "N (40000) as TotalItems"},
    {Picture::NotModified, "not-modified", "", kBoxArt, kDone, "304"},
    {Picture::Modified, "modified", "", kBoxArt, kDone, "box art that is newer than the client's"},
    {Content::Body, "body", "TEXT", kPlain, kUndone, "another body"},
    {Opening::Close, "close", "", kConnect, kUndone, "closed before the TLS handshake"},
    {TunnelEnd::Cut, "cut-tunnel", "N", kProxy, kDone, "closed when N bytes (0) have come back through the proxy"},
    {TunnelEnd::Stall, "stall-tunnel", "N", kProxy, kDone, "nothing more passes when N bytes (0) have come back"},
};

// Whether the kinds of an enumeration have a row each: none twice, and none of those before the last one is missing.
template <class Kind>
constexpr bool HaveARowEach()
{
    unsigned seen = 0;
    for (const KindRow& row : kKinds) {
        const Kind* kind = std::get_if<Kind>(&row.kind);
        if (!kind) continue;
        const unsigned bit = 1u << static_cast<unsigned>(*kind);
        if (seen & bit) return false;
        seen |= bit;
    }
    return seen != 0 && (seen & (seen + 1)) == 0;
}

template <class... Kinds>
constexpr bool AllHaveARow(const std::variant<std::monostate, Kinds...>*)
{
    return (HaveARowEach<Kinds>() && ...);
}
static_assert(AllHaveARow(static_cast<const FaultKind*>(nullptr)));

}  // namespace

const std::vector<KindRow>& FaultKinds()
{
    static const std::vector<KindRow> rows(std::begin(kKinds), std::end(kKinds));
    return rows;
}

}  // namespace simulator
