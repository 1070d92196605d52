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
        {-3.99, -3, 4294967293u},
        {2147483648.0, INT_MIN, 2147483648u},
        {-2147483649.0, INT_MAX, 2147483647u},
        {4294967296.0, 0, 0},
        {6442450943.5, INT_MAX, 2147483647u},
        {9007199254740993.0, 0, 0},  // 2^53: the next odd number cannot be written
        {-1e300, 0, 0},
        {std::nan(""), 0, 0},
        {-INFINITY, 0, 0},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(ASToInt32(row.number), row.signedValue) << row.number;
        EXPECT_EQ(ASToUint32(row.number), row.unsignedValue) << row.number;
    }
}

// Each row: an expression, and what native code makes of its value.
using Rows = std::vector<std::pair<const char*, std::string>>;

class ValueTest : public RuntimeTest {
protected:
    void RunEach(const Rows& rows)
    {
        for (const auto& [pExpression, expected] : rows)
            EXPECT_EQ(Logged(std::string("probe.run(") + pExpression + ");"), Lines{expected}) << pExpression;
    }
};

TEST_F(ValueTest, ArgumentsKeepTypeAndContent)
{
    const Rows rows = {
        {"undefined", "undefined nan undefined"},
        {"null", "null 0 null"},
        {"false", "boolean 0 false"},
        {"-1.5", "number -1.5 -1.5"},
        {"4294967296.5", "number 4294967296.5 4294967296.5"},
        {"NaN", "number nan NaN"},
        {"''", "string 0 "},
        {"' 0x10 '", "string 16  0x10 "},
        {"'gr\\u00fc\\u20ac'", "string nan gr\xC3\xBC\xE2\x82\xAC"},
        {"'\\ud83d\\ude00\xF0\x9F\x98\x80'", "string nan \xF0\x9F\x98\x80\xF0\x9F\x98\x80"},
        {"'\\ud83db'",
         "string nan \xEF\xBF\xBD"
         "b"},
        {"'a\\ude00'", "string nan a\xEF\xBF\xBD"},
        {"'a\\u0000b'", std::string("string nan a\0b", 14)},
        {"{}", "object nan [object Object]"},
        {"[1, [2, 3]]", "object nan 1,2,3"},
        {"{valueOf: function() { return 9; }}", "object 9 [object Object]"},
    };
    Probe::s_run = [](const Invocation& call) {
        ASSERT_EQ(call.arguments.size(), 1u);
        AEString text;
        EXPECT_TRUE(call.object.ToText(call.arguments[0], text));
        const double number = call.object.ToNumber(call.arguments[0]);
        char digits[32] = "nan";  // whatever its sign
        if (!std::isnan(number)) snprintf(digits, sizeof digits, "%.12g", number);
        Probe::s_lines.push_back(std::string(TypeName(call.arguments[0])) + " " + digits + " " +
                                 std::string(text.c_str(), text.length()));
    };
    RunEach(rows);
}

TEST_F(ValueTest, PropertiesConvert)
{
    const Rows rows = {
        {"{}", "0 0 0 "},
        {"{v: null}", "0 0 0 "},
        {"{v: 2147483648}", "-2147483648 2147483648 1 2147483648"},
        {"{v: -1.9}", "-1 4294967295 1 -1.9"},
        {"{v: NaN}", "0 0 0 NaN"},
        {"{v: ''}", "0 0 0 "},
        {"{v: '0'}", "0 0 0 0"},
        {"{v: 'false'}", "0 0 0 false"},
        {"{v: 'False'}", "0 0 1 False"},
        {"{v: '12 monkeys'}", "0 0 1 12 monkeys"},
        {"{v: [8]}", "8 8 1 8"},
        {"{v: []}", "0 0 0 "},
        {"{v: {}}", "0 0 1 [object Object]"},
        {"{v: new Boolean(false)}", "0 0 0 false"},
        {"{v: new Boolean(true)}", "1 1 1 true"},
        {"{v: new Number(NaN)}", "0 0 0 NaN"},
        {"{v: new String('0')}", "0 0 0 0"},
        {"{v: {valueOf: function() { return 'no'; }}}", "0 0 1 [object Object]"},
        {"{v: {valueOf: function() { return null; }}}", "0 0 0 [object Object]"},
        {"Object.create({v: 5})", "5 5 1 5"},
        {"{get v() { return 6; }}", "6 6 1 6"},
    };
    Probe::s_run = [](const Invocation& call) {
        ASObject& object = *call.arguments[0].GetObject();
        Probe::s_lines.push_back(std::to_string(object.GetInt("v")) + " " + std::to_string(object.GetUint("v")) + " " +
                                 std::to_string(object.GetBoolean("v")) + " " + object.GetText("v").c_str());
        int32_t whole;
        bool flag;
        AEString text;
        EXPECT_TRUE(object.GetInt("v", whole) && object.GetBoolean("v", flag) && object.GetText("v", text));
    };
    RunEach(rows);
}

// Each row: a property, and of which kinds it can be read all the same: number, boolean, text.
TEST_F(ValueTest, PropertiesThatCannotBeReadAreTold)
{
    const Rows rows = {
        {"{get v() { throw 1; }}", "---"},
        {"{v: {valueOf: function() { throw 1; }}}", "--t"},
        {"{v: {toString: function() { throw 1; }}}", "---"},
        {"{v: {toString: function() { throw 1; }, valueOf: function() { return 1; }}}", "nb-"},
        {"{v: {toString: function() { return {}; }}}", "---"},
        {"{v: Object.create(null)}", "---"},
        {"{v: [{toString: function() { throw 1; }}]}", "---"},
        // Where the language has symbols.
        {"{v: typeof Symbol === 'function' ? Symbol('s') : Object.create(null)}", "---"},
        {"(function() { var v = {toString: function() { throw 1; }};"
         "if (typeof Symbol === 'function') v[Symbol.toPrimitive] = v.toString; return {v: v}; })()",
         "---"},
    };
    Probe::s_run = [](const Invocation& call) {
        ASObject& object = *call.arguments[0].GetObject();
        double number = 2;
        int32_t whole = 2;
        uint32_t natural = 2;
        bool flag = true;
        AEString text = "before";
        const bool asNumber = object.GetNumber("v", number);
        EXPECT_EQ(asNumber, object.GetInt("v", whole));
        EXPECT_EQ(asNumber, object.GetUint("v", natural));
        const bool asBoolean = object.GetBoolean("v", flag), asText = object.GetText("v", text);
        EXPECT_TRUE(asNumber || (number == 0 && whole == 0 && natural == 0));
        EXPECT_TRUE(asBoolean || !flag);
        EXPECT_TRUE(asText || text.empty());
        Probe::s_lines = {std::string(asNumber ? "n" : "-") + (asBoolean ? "b" : "-") + (asText ? "t" : "-")};
    };
    for (const auto& [pExpression, expected] : rows) {
        EXPECT_EQ(Play(std::string("probe.run(") + pExpression + ");").m_nErrorValue, AEError::OK);
        EXPECT_EQ(Probe::s_lines, Lines{expected}) << pExpression;
        EXPECT_NE(m_Errors.find("com.example.Probe.run"), std::string::npos) << m_Errors;
    }
}

// A value that is no number is one; each property is read once, each value converted once.
TEST_F(ValueTest, PropertiesAndValuesAreAskedOnce)
{
    Probe::s_run = [](const Invocation& call) {
        ASObject& object = *call.arguments[0].GetObject();
        double number = 2;
        bool flag = true;
        AEString text;
        EXPECT_TRUE(object.GetNumber("v", number) && std::isnan(number));
        Probe::s_lines.push_back("boolean");
        EXPECT_TRUE(object.GetBoolean("v", flag) && !flag);
        Probe::s_lines.push_back("text");
        EXPECT_TRUE(object.GetText("v", text));
    };
    EXPECT_EQ(Logged("probe.run({get v() { probe.log('read'); return {"
                     "    valueOf: function() { probe.log('valueOf'); return NaN; },"
                     "    toString: function() { probe.log('toString'); return ''; }}; }});"),
              (Lines{"read", "valueOf", "boolean", "read", "valueOf", "text", "read", "toString"}));
}

TEST_F(RuntimeTest, ResultsKeepTypeAndContent)
{
    const struct {
        ASValue value;
        const char* pCheck;  // true for the result `r`
    } rows[] = {
        {ASValue(), "r === undefined"},
        {ASValue::Null(), "r === null"},
        {ASValue::Object(nullptr), "r === null"},
        {ASValue::Boolean(false), "r === false"},
        {ASValue::Number(-0.0), "r === 0 && 1 / r === -Infinity"},
        {ASValue::Number(4294967296.5), "r === 4294967296.5"},
        {ASValue::Number(std::nan("")), "typeof r === 'number' && r !== r"},
        {ASValue::String(""), "r === ''"},
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
    const std::pair<std::vector<const char*>, const char*> rows[] = {
        // as JSON
        {{}, "{}"},
        {{"--bgalpha", "0", "--flashvars", "a=b&c=d"}, R"({"a":"b","c":"d"})"},
        {{"--flashvars", "path=/misc/x.xml&empty="}, R"({"path":"/misc/x.xml","empty":""})"},
        {{"--flashvars", "a%3D=%26b+c%20d"}, R"({"a=":"&b+c d"})"},
        {{"--flashvars", "u=%C3%BC&bad=%C3"}, "{\"u\":\"\xC3\xBC\",\"bad\":\"\xEF\xBF\xBD\"}"},
        {{"--flashvars", "a=%zz&b=%4&c=%"}, R"({"a":"%zz","b":"%4","c":"%"})"},
        {{"--flashvars", "&&=x&a&b=c=d&"}, R"({"a":"","b":"c=d"})"},
        {{"--flashvars"}, "{}"},  // its value would be the movie
    };
    for (const auto& [options, expected] : rows)
        EXPECT_EQ(Logged("probe.log(JSON.stringify(flashvars));", options), Lines{expected});
}

TEST_F(RuntimeTest, GlobalsReachOutputAndEnvironment)
{
    setenv("MOVIE_VARIABLE", "gr\xC3\xBC", 1);
    testing::internal::CaptureStdout();
    Logged("trace(getenv('MOVIE_VARIABLE')); trace(getenv('MOVIE_ABSENT') === null); trace(); trace({});");
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "gr\xC3\xBC\ntrue\nundefined\n[object Object]\n");
}

}  // namespace
