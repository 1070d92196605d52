// What native code does with script objects.
#include <time.h>

#include "RuntimeFixture.h"

namespace {

ASValueArray Values(std::initializer_list<ASValue> values)
{
    ASValueArray result;
    for (const ASValue& value : values) {
        result.Append(value);
    }
    return result;
}

TEST_F(RuntimeTest, ObjectsAndArraysAreBuilt)
{
    Probe::s_run = [](const Invocation& call) {
        ASValue array, element, unused;
        ASSERT_TRUE(call.object.Construct("Array", {}, array));
        for (const char* pName : {"first", "second"}) {
            ASSERT_TRUE(call.object.Construct("Object", {}, element));
            // Neither alphabetical nor by kind: the order is the one of setting.
            EXPECT_TRUE(element.GetObject()->SetProperty("zebra", ASValue::String(pName)));
            EXPECT_TRUE(element.GetObject()->SetProperty("Apple", ASValue::Number(1)));
            EXPECT_TRUE(element.GetObject()->SetProperty("nothing", ASValue::String(nullptr)));
            EXPECT_TRUE(element.GetObject()->SetProperty("zebra", ASValue::String(pName)));
            EXPECT_TRUE(array.GetObject()->Call("push", Values({element}), unused));
        }
        EXPECT_EQ(unused.GetNumber(), 2);
        EXPECT_EQ(array.GetObject()->GetLength(), 2u);
        EXPECT_TRUE(array.GetObject()->GetElement(1, element));
        EXPECT_STREQ(element.GetObject()->GetText("zebra").c_str(), "second");
        EXPECT_TRUE(array.GetObject()->GetElement(2, element));
        EXPECT_STREQ(TypeName(element), "undefined");
        ASValueArray parts;
        for (const double part : {2011, 0, 31, 23, 59, 58})
            parts.Append(ASValue::Number(part));
        EXPECT_TRUE(call.object.Construct("Date", parts, element));  // of local time
        EXPECT_TRUE(array.GetObject()->Call("push", Values({element}), unused));
        call.result = array;
    };
    setenv("TZ", "XXX-05:30", 1);
    tzset();
    EXPECT_EQ(Logged("var r = probe.run(); probe.log(JSON.stringify(r), r instanceof Array, r[0] instanceof Object);"),
              Lines{R"([{"zebra":"first","Apple":1,"nothing":null},{"zebra":"second","Apple":1,"nothing":null},)"
                    R"("2011-01-31T18:29:58.000Z"] true true)"});
}

TEST_F(RuntimeTest, ClassesAndLengthsAreTold)
{
    Probe::s_run = [](const Invocation& call) {
        ASObject& object = *call.arguments[0].GetObject();
        const bool told = object.IsInstanceOf(call.arguments[1].GetString().c_str());
        call.result = ASValue::String(((told ? "yes " : "no ") + std::to_string(object.GetLength())).c_str());
    };
    EXPECT_EQ(Logged("function told(object, name) { probe.log(probe.run(object, name)); }"
                     "told([], 'Array'); told([5], 'Object'); told({length: 'two'}, 'Array'); told(probe, 'Date');"
                     "told(probe, 'com.example.Probe'); told({length: NaN}, 'com.example.Probe');"
                     "told({}, 'absent.altogether.Probe'); told({}, 'Math.PI'); told({}, '');"
                     "told(new (function() { this.constructor = Array; })(), 'Array');"),
              (Lines{"yes 0", "yes 1", "no 0", "no 0", "yes 0", "no 0", "no 0", "no 0", "no 0", "no 0"}));
}

TEST_F(RuntimeTest, NativeInstancesAndIdentity)
{
    Probe::s_run = [](const Invocation& call) {
        ASObject& object = *call.arguments[0].GetObject();
        const ASExtensionClass* pInstance = object.GetExtensionInstance();
        const bool isOwn = pInstance == call.object.GetExtensionInstance();
        Probe::s_lines.push_back(!pInstance ? "none" : isOwn ? "own" : "other");
        EXPECT_EQ(&object == &call.object, isOwn);
        ASValue again;
        EXPECT_TRUE(object.GetProperty("self", again));
        EXPECT_EQ(again.GetObject(), &object);
    };
    // An object that merely inherits from an instance is none.
    EXPECT_EQ(
        Logged("[probe, new Probe(), {}, Object.create(probe)].forEach(function(o) { o.self = o; probe.run(o); });"),
        (Lines{"own", "other", "none", "none"}));
}

TEST_F(RuntimeTest, CallsPassThisArgumentsAndResult)
{
    Probe::s_run = [](const Invocation& call) {
        ASObject& object = *call.arguments[0].GetObject();
        ASValue result;
        EXPECT_TRUE(object.Call("add", Values({ASValue::Number(2), ASValue::String("x")}), result));
        EXPECT_STREQ(result.GetString().c_str(), "40 2 x 2");
        // Into a handler that runs already.
        Probe::s_run = [](const Invocation& inner) { inner.result = ASValue::String("inner"); };
        EXPECT_TRUE(object.Call("reenter", {}, result));
        EXPECT_STREQ(result.GetString().c_str(), "inner");
        call.result = ASValue::String("outer");
    };
    EXPECT_EQ(Logged("var o = Object.create({add: function(a, b) {"
                     "    return [this.base, a, b, arguments.length].join(' '); }}); o.base = 40;"
                     "o.reenter = function() { return probe.run(); };"
                     "probe.log(probe.run(o));"),
              Lines{"outer"});
}

// Each row fails in the script: reported with the place and the native method; native code and the movie go on.
TEST_F(RuntimeTest, FailingOperationsReportAndReturn)
{
    using Operation = bool (*)(ASObject&, ASValue&);
    const Operation get = [](ASObject& object, ASValue& value) { return object.GetProperty("v", value); };
    const Operation set = [](ASObject& object, ASValue& value) { return object.SetProperty("v", value); };
    const Operation call = [](ASObject& object, ASValue& value) { return object.Call("f", {}, value); };
    const Operation construct = [](ASObject& object, ASValue& value) {
        return object.Construct("com.absent.Thing", {}, value);
    };
    const Operation convert = [](ASObject& object, ASValue&) {
        ASValue property;
        AEString text("before");
        EXPECT_TRUE(object.GetProperty("v", property));
        const bool converted = object.ToText(property, text);
        EXPECT_STREQ(text.c_str(), "");
        return converted;
    };
    const struct {
        const char* pObject;
        Operation operation;
        std::vector<const char*> reported;
    } rows[] = {
        {"{get v() { throw new Error('no v'); }}", get, {"no v", "movie.js:2"}},
        {"Object.freeze({v: 1})", set, {}},
        {"{}", call, {"f"}},
        {"{f: function() { throw new RangeError('too far'); }}", call, {"RangeError: too far", "movie.js:2"}},
        {"{}", construct, {"com.absent.Thing"}},
        {"{v: {toString: function() { throw new Error('no text'); }}}", convert, {"no text", "movie.js:2"}},
    };
    for (const auto& row : rows) {
        Probe::s_run = [&](const Invocation& invocation) {
            ASValue value = ASValue::Number(2);
            EXPECT_FALSE(row.operation(*invocation.arguments[0].GetObject(), value)) << row.pObject;
            const bool keepsValue = row.operation == set || row.operation == convert;
            EXPECT_STREQ(TypeName(value), keepsValue ? "number" : "undefined") << row.pObject;
            Probe::s_lines = {"native code goes on"};
        };
        EXPECT_EQ(Play(std::string("probe.run(") + row.pObject + "); probe.log('on');").m_nErrorValue, AEError::OK);
        EXPECT_EQ(Probe::s_lines, (Lines{"native code goes on", "on"})) << row.pObject;
        EXPECT_EQ(m_Errors.rfind("script error: ", 0), 0u) << m_Errors;
        EXPECT_NE(m_Errors.find("com.example.Probe.run"), std::string::npos) << m_Errors;
        for (const char* pPart : row.reported)
            EXPECT_NE(m_Errors.find(pPart), std::string::npos) << pPart << " in " << m_Errors;
    }
}

// ---- Lifetime

// Garbage for collectors that run when memory is used.
const char* const kCollect = "function collect() { for (var i = 0; i < 20000; i++) { var o = {}; o.self = o; } }\n";

TEST_F(RuntimeTest, HeldObjectsOutliveTheScriptsInterest)
{
    ASValue held;
    Probe::s_run = [&](const Invocation& call) { held = call.arguments[0]; };
    Probe::s_onUpdate = [&](const Invocation& call) {
        ASValue unused;
        EXPECT_NE(held.GetObject()->GetExtensionInstance(), nullptr);
        EXPECT_TRUE(held.GetObject()->Call("onComplete", Values({ASValue::Number(-7)}), unused));
        held = ASValue();
        call.object.StopUpdates();
    };
    // The one that updates is registered only, and is kept as well.
    EXPECT_EQ(Logged(std::string(kCollect) + "(function() {"
                                             "   var p = new Probe('held');"
                                             "   p.onComplete = function(status) { probe.log(status, p.name()); };"
                                             "   probe.run(p);"
                                             "})();"
                                             "new Probe().startUpdates(); collect();"),
              (Lines{"constructed held", "-7 held", "destructed held"}));
}

TEST_F(RuntimeTest, CollectedInstancesAreDestructedWhileTheMovieRuns)
{
    ASValue held;
    Probe::s_run = [&](const Invocation& call) {
        held = ASValue();
        if (!call.arguments.empty()) held = call.arguments[0];
        call.result = ASValue::Number(Probe::s_deleted);
    };
    Probe::s_onUpdate = [](const Invocation& call) { call.object.StopUpdates(); };
    EXPECT_EQ(Logged(std::string(kCollect) +
                     "new Probe(); new Probe().startUpdates(); probe.run(new Probe());"
                     "var ticks = 0, timer = setInterval(function() {"
                     "    collect();"
                     "    if (probe.run() === 3) { probe.log('all'); clearInterval(timer); }"
                     "    else if (++ticks === 500) { probe.log(probe.run()); clearInterval(timer); } }, 0);"),
              Lines{"all"});
}

TEST_F(RuntimeTest, ReferencesOutliveMovieAndSet)
{
    ASValue object, instance;
    Probe::s_run = [&](const Invocation& call) {
        object = call.arguments[0];
        instance = ASValue::Object(&call.object);
    };
    WriteMovie("probe.run({v: 5, f: function() { probe.log('never'); }});");
    ASSERT_EQ(Create().m_nErrorValue, AEError::OK);
    ASSERT_EQ(Run().m_nErrorValue, AEError::OK);
    ASValue value;
    EXPECT_FALSE(object.GetObject()->Call("f", {}, value)) << "the movie has ended";
    EXPECT_EQ(object.GetObject()->GetInt("v"), 5);
    EXPECT_EQ(Probe::s_lines, Lines{});
    EXPECT_EQ(Destroy().m_nErrorValue, AEError::OK);
    EXPECT_EQ(instance.GetObject()->GetExtensionInstance(), nullptr);
    value = ASValue::Number(1);
    EXPECT_FALSE(object.GetObject()->GetProperty("v", value));
    EXPECT_STREQ(TypeName(value), "undefined");
    EXPECT_FALSE(object.GetObject()->SetProperty("v", object));
    EXPECT_FALSE(object.GetObject()->Call("f", {}, value));
    EXPECT_FALSE(object.GetObject()->Construct("Object", {}, value));
    EXPECT_FALSE(object.GetObject()->IsInstanceOf("Object"));
    EXPECT_EQ(object.GetObject()->GetLength(), 0u);
    EXPECT_TRUE(std::isnan(object.GetObject()->ToNumber(ASValue::Number(1))));
    instance.GetObject()->StartUpdates();
    instance.GetObject()->StopUpdates();
}

}  // namespace
