// What a script passes to the methods of com.orvex.ZVWSLib. The input decides over the values, step by step.
#include "ScriptRun.h"
#include "Target.h"
#include "ZVWSLibAE.h"
#include "ZVWSLibAEDispatch.h"

using namespace ae::stagecraft;

namespace {

// ---- The records into which arguments are read

template <class Param>
void Read(ASObject& object, Param param)
{
    PropertyReader reader(object);
    param.ReadWith(reader);
    param.ReadWith([](const char*, const auto& value) {
        using Value = std::decay_t<decltype(value)>;
        if constexpr (std::is_same_v<Value, AEString>)
            Require(value.c_str()[value.length()] == '\0', "texts are terminated");
        if constexpr (std::is_same_v<Value, AEArray<int>>) Require(value.size() <= 10000, "arrays have a bound");
    });
}

#define RECORDS(DO)                                                                                           \
    ZV_WS_EACH(DO, Param_getTitles, Param_searchForTitle, Param_getMyVideos, Param_getWishlistItems,          \
               Param_getBoxArtImage, Param_doPurchaseSavedbilling, Param_assignGiftCertificateToUser)         \
    ZV_WS_EACH(DO, Param_StreamingAssetLocation, Param_manageStreamingInstanceStatus, Param_THXMediaDirector, \
               Param_THXMediaDirectorBonusAsset, Param_checkTitlesInWishlist, Param_AudioProfile, Param_init)

using ReadFunction = void (*)(ASObject& object);
#define READER(record) [](ASObject& object) { Read(object, record()); },
const ReadFunction kReaders[] = {RECORDS(READER)};

// The properties' names, a line each.
const std::string& Names()
{
    static const std::string* const all = [] {
        auto* names = new std::string("length\n0\n1\nonComplete\nCurrentPageNumber\nItemsPerPage\n");
#define NAMER(record) record().ReadWith([names](const char* name, auto&) { names->append(name).append("\n"); });
        RECORDS(NAMER)
        return names;
    }();
    return *all;
}

// ---- The class through which the script calls

class Probe : public ASExtensionClass {
public:
    static const char* GetClassName() { return "fuzz.Probe"; }
    static bool FiresEvents() { return false; }
    static void GetMethods(AEArray<Method>& methods)
    {
        methods.Append(MakeMethod("read", Method::kStaticFunction, &Probe::ReadAll));
    }
    static ASExtensionClass* ConstructInstance(StageWindow*, ASObject&, ASValueArray&) { return nullptr; }
    static void DestructInstance(StageWindow*, ASObject&) {}

private:
    void ReadAll(StageWindow*, ASObject&, ASValueArray& arguments, ASValue&)
    {
        ASValue callback, parameters;
        if (!ZVWSLib::ReadArguments(arguments, callback, parameters)) return;
        for (const ReadFunction read : kReaders)
            read(*parameters.GetObject());
    }
};

// ---- The script

class Script {
public:
    explicit Script(std::string_view input) : m_Input(input) {}

    std::string Make()
    {
        std::string text = "var ws = new com.orvex.ZVWSLib();\n";
        for (int calls = 0; calls < 6 && !m_Input.empty(); ++calls) {
            static const char* const kCalls[] = {
                "fuzz.Probe.read([{}, ", "fuzz.Probe.read([", "fuzz.Probe.read(", "ws.getTitles([{}, ",    "ws.clone(",
                "ws.getSysInfo(",        "ws.fileExist(",     "ws.trace(",        "new com.orvex.ZVWSLib("};
            const std::string call = kCalls[Next() % std::size(kCalls)];
            const bool isArray = call.find('[') != std::string::npos;
            const bool isMore = Next() % 4 == 0;
            text.append("try { ").append(call).append(Value(0));
            if (isMore) text.append(", ").append(Value(0));
            text.append(isArray ? "]" : "").append("); } catch (e) {}\n");
        }
        return text;
    }

private:
    unsigned int Next()
    {
        if (m_Input.empty()) return 0;
        const auto byte = static_cast<unsigned char>(m_Input.front());
        m_Input.remove_prefix(1);
        return byte;
    }

    std::string Name()
    {
        std::string_view names = Names();
        std::string name = TakeLine(names);
        for (unsigned int skip = Next() % 64; skip > 0 && !names.empty(); --skip)
            name = TakeLine(names);
        return "'" + name + "'";
    }

    std::string Text()
    {
        std::string text = "'";
        for (unsigned int length = Next() % 32; length > 0; --length) {
            char escape[8];
            const unsigned int high = Next();
            snprintf(escape, sizeof escape, "\\u%02x%02x", high, Next());
            text += escape;
        }
        return text + "'";
    }

    std::string Number()
    {
        char text[40];
        int64_t digits = 0;
        for (int i = 0; i < 4; ++i)
            digits = digits * 256 + Next();
        snprintf(text, sizeof text, "%lldE%d", static_cast<long long>(digits) - (1ll << 31), int(Next() % 64) - 20);
        return text;
    }

    std::string Items(int depth, bool isArray)
    {
        std::string text;
        for (unsigned int count = Next() % (isArray ? 6 : 12); count > 0; --count) {
            if (!isArray) text.append(Name()).append(": ");
            text.append(Value(depth + 1)).append(",");
        }
        return isArray ? "[" + text + "]" : "{" + text + "}";
    }

    std::string Getter(int depth)
    {
        const std::string name = Name();
        return "Object.defineProperty({}, " + name + ", {get: function () { return " + Value(depth + 1) + "; }})";
    }

    // One step after the other: every compiler makes the same script of an input.
    std::string Value(int depth)
    {
        // Its text would take the engine minutes, which is the script's own fault.
        static const char kEndless[] =
            "(function () { var a = new Array(4294967295); a.toString = function () { return 'endless'; }; return a; "
            "})()";
        // clang-format off
        static const char* const kPlain[] = {
            "null", "undefined", "true", "false", "NaN", "-Infinity", "-0", "2147483648", "-2147483649", "4294967296",
            "''", "'12'", "'0x10'", "new Date(NaN)", "/x/", "function () {}", "ws", "com", "fuzz.Probe", "[,,]",
            "Object.create(null)", kEndless, "{valueOf: function () { throw 1; }}",
            "{toString: function () { return {}; }, valueOf: null}", "{get genreid() { throw 2; }}",
            "{get titleids() { return [1, 2]; }}", "new Proxy([], {get: function (t, name) { return name; }})"};
        // clang-format on
        const unsigned int kind = Next();
        if (depth > 3 || kind < 96) return std::string("(") + kPlain[kind % std::size(kPlain)] + ")";
        if (kind < 120) return Text();
        if (kind < 144) return Number();
        if (kind >= 176 && kind < 184) return Getter(depth);
        return Items(depth, kind < 176);
    }

    std::string_view m_Input;
};

}  // namespace

void TestInput(std::string_view input)
{
    RunScript(Script(input).Make(), "", [](IStagecraft& runtime) {
        runtime.RegisterExtensionClass<ZVWSLibAE>();
        runtime.RegisterExtensionClass<Probe>();
    });
}
