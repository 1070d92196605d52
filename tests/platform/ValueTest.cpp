// Values across the border, in both directions.
#include <climits>

#include "RuntimeFixture.h"

namespace {

TEST(Conversion, IntegersWrapLikeTheScriptsOwn)
{
    const struct {
        double number;
        int32_t signedValue;
        uint32_t unsignedValue;
    } rows[] = {
        {0, 0, 0},
        {3.99, 3, 3},
        {-3.99, -3, 4294967293u},
        {-0.5, 0, 0},
        {2147483647, INT_MAX, 2147483647u},
        {2147483648.0, INT_MIN, 2147483648u},
        {-2147483648.0, INT_MIN, 2147483648u},
        {-2147483649.0, INT_MAX, 2147483647u},
        {4294967295.0, -1, 4294967295u},
        {4294967296.0, 0, 0},
        {6442450943.5, INT_MAX, 2147483647u},
        {9007199254740993.0, 0, 0},  // 2^53: the next odd number cannot be written
        {1e300, 0, 0},
        {-1e300, 0, 0},
        {std::nan(""), 0, 0},
        {INFINITY, 0, 0},
        {-INFINITY, 0, 0},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(ASToInt32(row.number), row.signedValue) << row.number;
        EXPECT_EQ(ASToUint32(row.number), row.unsignedValue) << row.number;
    }
}

TEST(Conversion, ErrorNamesAreCutAndTerminated)
{
    const AEError error("a name that has more than thirty-one bytes", 7);
    EXPECT_STREQ(error.m_errorName, "a name that has more than thirt");
    EXPECT_EQ(AEError().m_nErrorValue, 0xFFFFFFFFu);
    EXPECT_STREQ(AEError(nullptr, 1).m_errorName, "");
}

TEST_F(RuntimeTest, ArgumentsKeepTypeAndContent)
{
    const struct {
        const char* pExpression;
        const char* pType;
        double number;  // NaN: any
        std::string text;
    } rows[] = {
        {"undefined", "undefined", NAN, "undefined"},
        {"null", "null", 0, "null"},
        {"true", "boolean", 1, "true"},
        {"false", "boolean", 0, "false"},
        {"-1.5", "number", -1.5, "-1.5"},
        {"4294967296.5", "number", 4294967296.5, "4294967296.5"},
        {"Infinity", "number", INFINITY, "Infinity"},
        {"NaN", "number", NAN, "NaN"},
        {"1e21", "number", 1e21, "1e+21"},
        {"''", "string", 0, ""},
        {"' 0x10 '", "string", 16, " 0x10 "},
        {"'twelve'", "string", NAN, "twelve"},
        {"'gr\\u00fc\\u20ac'", "string", NAN, "gr\xC3\xBC\xE2\x82\xAC"},
        {"'gr\xC3\xBC'", "string", NAN, "gr\xC3\xBC"},
        {"'\\ud83d\\ude00'", "string", NAN, "\xF0\x9F\x98\x80"},
        {"'\xF0\x9F\x98\x80'", "string", NAN, "\xF0\x9F\x98\x80"},
        {"'a\\ud83db'", "string", NAN,
         "a\xEF\xBF\xBD"
         "b"},
        {"'a\\ude00'", "string", NAN, "a\xEF\xBF\xBD"},
        {"'a\\u0000b'", "string", NAN, std::string("a\0b", 3)},
        {"{}", "object", NAN, "[object Object]"},
        {"[1, [2, 3]]", "object", NAN, "1,2,3"},
        {"[7]", "object", 7, "7"},
        {"{valueOf: function() { return 9; }}", "object", 9, "[object Object]"},
        {"new Date(86400000)", "object", 86400000, ""},
    };
    for (const auto& row : rows) {
        bool called = false;
        Probe::s_run = [&](const Invocation& call) {
            called = true;
            ASSERT_EQ(call.arguments.size(), 1u);
            const ASValue& value = call.arguments[0];
            EXPECT_STREQ(TypeName(value), row.pType) << row.pExpression;
            const double number = call.object.ToNumber(value);
            if (std::isnan(row.number)) {
                EXPECT_TRUE(std::isnan(number)) << row.pExpression;
            } else {
                EXPECT_EQ(number, row.number) << row.pExpression;
            }
            AEString text;
            EXPECT_TRUE(call.object.ToText(value, text));
            if (!row.text.empty()) {
                EXPECT_EQ(std::string(text.c_str(), text.length()), row.text);
            }
        };
        Logged(std::string("probe.run(") + row.pExpression + ");");
        EXPECT_TRUE(called) << row.pExpression;
    }
}

TEST_F(RuntimeTest, PropertiesConvert)
{
    const struct {
        const char* pObject;
        int32_t integer;
        uint32_t unsignedInteger;
        bool truth;
        const char* pText;
    } rows[] = {
        {"{}", 0, 0, false, ""},
        {"{v: undefined}", 0, 0, false, ""},
        {"{v: null}", 0, 0, false, ""},
        {"{v: 2147483648}", INT_MIN, 2147483648u, true, "2147483648"},
        {"{v: -1.9}", -1, 4294967295u, true, "-1.9"},
        {"{v: 0}", 0, 0, false, "0"},
        {"{v: NaN}", 0, 0, false, "NaN"},
        {"{v: true}", 1, 1, true, "true"},
        {"{v: ''}", 0, 0, false, ""},
        {"{v: '0'}", 0, 0, true, "0"},
        {"{v: '42'}", 42, 42, true, "42"},
        {"{v: '12 monkeys'}", 0, 0, true, "12 monkeys"},
        {"{v: [8]}", 8, 8, true, "8"},
        {"Object.create({v: 5})", 5, 5, true, "5"},
        {"{get v() { return 6; }}", 6, 6, true, "6"},
    };
    for (const auto& row : rows) {
        bool called = false;
        Probe::s_run = [&](const Invocation& call) {
            called = true;
            ASSERT_TRUE(call.arguments[0].IsObject());
            ASObject& object = *call.arguments[0].GetObject();
            EXPECT_EQ(object.GetInt("v"), row.integer) << row.pObject;
            EXPECT_EQ(object.GetUint("v"), row.unsignedInteger) << row.pObject;
            EXPECT_EQ(object.GetBoolean("v"), row.truth) << row.pObject;
            EXPECT_STREQ(object.GetText("v").c_str(), row.pText) << row.pObject;
        };
        Logged(std::string("probe.run(") + row.pObject + ");");
        EXPECT_TRUE(called) << row.pObject;
    }
}

TEST_F(RuntimeTest, ResultsKeepTypeAndContent)
{
    const struct {
        ASValue value;
        const char* pCheck;  // true for the result `r`
    } rows[] = {
        {ASValue(), "r === undefined"},
        {ASValue::Null(), "r === null"},
        {ASValue::String(nullptr), "r === null"},
        {ASValue::Object(nullptr), "r === null"},
        {ASValue::Boolean(true), "r === true"},
        {ASValue::Boolean(false), "r === false"},
        {ASValue::Number(-0.0), "r === 0 && 1 / r === -Infinity"},
        {ASValue::Number(4294967296.5), "r === 4294967296.5"},
        {ASValue::Number(std::nan("")), "typeof r === 'number' && r !== r"},
        {ASValue::Number(-INFINITY), "r === -Infinity"},
        {ASValue::String(""), "r === ''"},
        {ASValue::String("12"), "r === '12'"},
        {ASValue::String("\xC3\xBC\xE2\x82\xAC"), "r === '\\u00fc\\u20ac'"},
        {ASValue::String("\xF0\x9F\x98\x80!"), "r === '\\ud83d\\ude00!' && r.length === 3"},
        {ASValue::String(AEString("a\0b", 3)), "r === 'a\\u0000b'"},
        {ASValue::String("a\xFF"
                         "b\xC3"),
         "r === 'a\\ufffdb\\ufffd'"},
        {ASValue::String("\xC0\xAF"), "r === '\\ufffd\\ufffd'"},                         // "/" written too long
        {ASValue::String("\xED\xA0\xBD"), "r.length > 0 && r.charAt(0) === '\\ufffd'"},  // half a pair
        {ASValue::String("\xF4\x90\x80\x80"), "r.length > 0 && r.charAt(0) === '\\ufffd'"},
    };
    for (const auto& row : rows) {
        Probe::s_run = [&](const Invocation& call) { call.result = row.value; };
        EXPECT_EQ(Logged(std::string("var r = probe.run(); probe.log(") + row.pCheck + ");"), Lines{"true"})
            << row.pCheck;
    }
}

TEST_F(RuntimeTest, FlashvarsAreDecoded)
{
    const struct {
        std::vector<const char*> options;
        const char* pExpected;  // as JSON
    } rows[] = {
        {{}, "{}"},
        {{"--flashvars", ""}, "{}"},
        {{"--bgalpha", "0", "--flashvars", "a=b&c=d"}, R"({"a":"b","c":"d"})"},
        {{"--flashvars", "path=/misc/x.xml&empty="}, R"({"path":"/misc/x.xml","empty":""})"},
        {{"--flashvars", "a%3D=%26b+c%20d"}, R"({"a=":"&b+c d"})"},
        {{"--flashvars", "u=%C3%BC&bad=%C3"}, "{\"u\":\"\xC3\xBC\",\"bad\":\"\xEF\xBF\xBD\"}"},
        {{"--flashvars", "a=%zz&b=%4&c=%"}, R"({"a":"%zz","b":"%4","c":"%"})"},
        {{"--flashvars", "&&=x&a&b=c=d&"}, R"({"a":"","b":"c=d"})"},
        {{"--flashvars", "a=1&a=2"}, R"({"a":"2"})"},
        {{"--flashvars"}, "{}"},  // its value would be the movie
    };
    for (const auto& row : rows) {
        EXPECT_EQ(Logged("probe.log(JSON.stringify(flashvars));", row.options), Lines{row.pExpected});
    }
}

TEST_F(RuntimeTest, GlobalsReachOutputAndEnvironment)
{
    const Environment variable("MOVIE_VARIABLE",
                               "gr\xC3\xBC"
                               "n");
    const Environment absent("MOVIE_ABSENT", nullptr);
    testing::internal::CaptureStdout();
    Logged("trace(getenv('MOVIE_VARIABLE')); trace(getenv('MOVIE_ABSENT') === null); trace(); trace({});");
    EXPECT_EQ(testing::internal::GetCapturedStdout(),
              "gr\xC3\xBC"
              "n\ntrue\nundefined\n[object Object]\n");
}

}  // namespace
