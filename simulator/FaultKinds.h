// What a fault can be. The kinds are sorted by who carries them out: each enumeration has one place with a switch over
// all of it, which the compiler holds complete.
#pragma once

#include <variant>
#include <vector>

namespace simulator {

/// Instead of a TLS handshake or of an answer.
enum class Breaking { Reset, Stall, NoHttp };
/// Instead of a TLS handshake.
enum class Opening { Close, StallHandshake };
/// The answer is not written to its end.
enum class Cutting { Cut, CutHeader, CutBody, StallHeader, StallBody };
/// It is not written at once.
enum class Pacing { Drip, Hold, Split };
/// Where it ends, and what follows.
enum class Bounding { Short, Long, Stray, NoLength, ZeroLength, Chunked, ConnectionClose, Http10, Continue };
enum class Endless { Body, Header };
/// Its header lines.
enum class Heading { Headers, Date, BadDate, NoDate, Age };
/// Its body, whatever was in it.
enum class Content { Status, Body, Garbage, Empty, Bomb, DamagedGzip, WrongChecksum };
/// What the SOAP service says.
enum class Result { Code, Fault11, Fault12, Soap12, MissingResult, MustUnderstand, ExtraHeader, UnknownEnum };
/// How it writes that.
enum class Shape { Prefixes, Nil, AbsentArrays, Latin1, Bom, XsiTypes, Cdata, Text, Boolean, Enum, Counter };
enum class Picture { NotModified, Modified };
/// Of what comes back through the proxy.
enum class TunnelEnd { Cut, Stall };

/// std::monostate: nothing is wrong.
using FaultKind = std::variant<std::monostate, Breaking, Opening, Cutting, Pacing, Bounding, Endless, Heading, Content,
                               Result, Shape, Picture, TunnelEnd>;

/// Where a kind makes sense.
enum Place : unsigned { kSoap = 1, kPlain = 2, kBoxArt = 4, kConnect = 8, kProxy = 16 };
constexpr unsigned kAnswers = kSoap | kPlain | kBoxArt;
constexpr unsigned kEverywhere = kAnswers | kConnect | kProxy;

/// Whether what the request asks for is done with such an answer.
enum Effect { kDone, kUndone };

struct KindRow {
    FaultKind kind;
    const char* name;
    const char* value;  ///< What may stand behind its name: "N", "SECONDS" (a number with a sign), "TEXT", or "".
    unsigned places;
    Effect effect;
    const char* help;
};

/// All kinds, in the order in which people read of them.
const std::vector<KindRow>& FaultKinds();

}  // namespace simulator
