// The settings file: what is read from documents of every kind, what a write keeps, and what no one may change.
#include <sys/stat.h>

#include <functional>

#include "EVPCipher.h"
#include "LogLines.h"
#include "SafeFile.h"
#include "Serializer.h"
#include "SettingsFolder.h"
#include "ZVWSLib.h"
#include "soapStub.h"

namespace {

const std::string kNs = " xmlns:ZV1=\"http://api.zorvane.example/api/\"";

std::string Document(const std::string& inside)
{
    return "<ZVWSLib" + kNs + ">" + inside + "</ZVWSLib>";
}

std::string Setting(const std::string& key, const std::string& value)
{
    return "<ZV1:Configuration Key=\"" + key + "\"><ZV1:Value>" + value + "</ZV1:Value></ZV1:Configuration>";
}

std::string Repeated(const std::string& text, size_t count)
{
    std::string all;
    while (count-- > 0)
        all += text;
    return all;
}

class Settings : public SettingsFolder {};

TEST_F(Settings, AreReadFromDocuments)
{
    const std::string item = "<ZV1:Configuration Key=\"k\"";
    const struct {
        const char* what;
        std::string document;
        const char* reading;
    } rows[] = {
        {"plain", Document(Setting("k", "v")), "0:v"},
        {"the first of two", Document(Setting("j", "u") + Setting("k", "v") + Setting("k", "w")), "0:v"},
        {"no value", Document(item + "/>" + Setting("k", "w")), "0:"},
        {"empty value", Document(item + "><ZV1:Value/></ZV1:Configuration>"), "0:"},
        {"case differs", Document(Setting("K", "v")), "3:"},
        {"longer key", Document(Setting("kk", "v")), "3:"},
        {"no key", Document("<ZV1:Configuration><ZV1:Value>a</ZV1:Value></ZV1:Configuration>" + Setting("k", "v")),
         "0:v"},
        {"references", Document(Setting("k", "&lt;&amp;&#228;&#x20ac;&quot;")), "0:<&ä€\""},
        {"character data", Document(Setting("k", "a<![CDATA[<b>]]>c")), "0:a<b>c"},
        {"blanks stay", Document(Setting("k", " \n v\t")), "0: \n v\t"},
        {"reference in the key", Document(Setting("&#107;", "v")), "0:v"},
        {"other prefix",
         "<ZVWSLib xmlns:a=\"http://api.zorvane.example/api/\"><a:Configuration Key=\"k\"><a:Value>v"
         "</a:Value></a:Configuration></ZVWSLib>",
         "0:v"},
        {"other namespace", Document("<x:Configuration xmlns:x=\"urn:x\" Key=\"k\"/>"), "3:"},
        {"attribute of another namespace", Document("<ZV1:Configuration ZV1:Key=\"k\"/>"), "3:"},
        {"no namespace", "<ZVWSLib><Configuration Key=\"k\"><Value>v</Value></Configuration></ZVWSLib>", "0:v"},
        {"deeper", Document("<ZV1:Group>" + Setting("k", "v") + "</ZV1:Group>"), "3:"},
        {"first value only",
         Document(item + "><ZV1:Value>v<x>y</x></ZV1:Value><ZV1:Value>w</ZV1:Value>"
                         "</ZV1:Configuration>"),
         "0:v"},
        {"byte order mark and declaration",
         "\xEF\xBB\xBF<?xml version=\"1.0\" encoding=\"UTF-8\"?>" + Document(Setting("k", "ä")), "0:ä"},
        {"empty file", "", "3:"},
    };
    for (const auto& row : rows) {
        Put(file, row.document);
        EXPECT_EQ(row.reading, Reading("k")) << row.what;
    }
    EXPECT_EQ("1:", Reading(""));
}

// None of these may be read, or be lost by the write that begins anew.
TEST_F(Settings, RuinedDocumentsAreKeptAside)
{
    const std::string setting = Setting("k", "v");
    const auto entity = [](const std::string& type, const std::string& value) {
        return "<!DOCTYPE ZVWSLib " + type + ">" + Document(Setting("k", value));
    };
    const struct {
        const char* what;
        std::string document;
        unsigned int result = 3;
    } rows[] = {
        {"text", "hello"},
        {"blank", " \n"},
        {"zero bytes", std::string(100, '\0')},
        {"cut short", Document(setting).substr(0, Document(setting).size() - 3)},
        {"something behind", Document(setting) + "x"},
        {"other root", "<Other" + kNs + ">" + setting + "</Other>"},
        {"tags crossed", Document("<a><b></a></b>" + setting)},
        {"undeclared prefix", "<ZVWSLib><ZV1:Configuration Key=\"k\"><ZV1:Value>"},
        {"ill-formed UTF-8", Document(setting + "\xC3(")},
        {"unknown entity", Document(Setting("k", "&v;"))},
        {"entity", entity("[<!ENTITY v \"w\">]", "&v;")},
        {"entities of entities", entity("[<!ENTITY a \"" + Repeated("x", 1000) + "\"><!ENTITY b \"" +
                                            Repeated("&a;", 1000) + "\"><!ENTITY c \"" + Repeated("&b;", 1000) + "\">]",
                                        Repeated("&c;", 1000))},
        {"file as entity", entity("[<!ENTITY v SYSTEM \"file:///etc/passwd\">]", "&v;")},
        {"document type elsewhere", entity("SYSTEM \"http://127.0.0.1:1/x.dtd\"", "v")},
        {"deep", Document(Repeated("<a>", 100000) + Repeated("</a>", 100000) + setting)},
        {"other encoding", "<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?>" + Document(setting + "<!--\xE4-->")},
        {"too large", Document(setting + "<!--" + std::string(CfgXMLFile::kMaxSize, ' ') + "-->"), 2},
    };
    LogLines log;
    for (const auto& row : rows) {
        Put(file, row.document);
        log.Clear();
        EXPECT_EQ(std::to_string(row.result) + ":", Reading("k")) << row.what;
        EXPECT_TRUE(row.document == ContentOf(file)) << row.what << ": a read changes nothing";
        EXPECT_EQ(0, log.Count("")) << row.what;
        EXPECT_EQ(0u, Write("k", "w")) << row.what;
        EXPECT_TRUE(row.document == ContentOf(file + ".bad")) << row.what;
        EXPECT_EQ(1, log.Count(file)) << row.what;
        EXPECT_EQ("0:w", Reading("k")) << row.what;
        EXPECT_EQ(0u, Write("k", "x")) << row.what;
        EXPECT_EQ(1, log.Count("")) << row.what;
    }
    // What cannot be kept is not replaced.
    ASSERT_EQ(0, unlink((file + ".bad").c_str()));
    ASSERT_EQ(0, mkdir((file + ".bad").c_str(), 0700));
    Put(file, "hello");
    EXPECT_EQ(4u, Write("k", "w"));
    EXPECT_EQ("hello", ContentOf(file));
}

TEST_F(Settings, FilesThatAreNoneAreRefusedAtOnce)
{
    EXPECT_EQ("5:", Reading("k"));
    Put(file, "");
    ASSERT_EQ(0, truncate(file.c_str(), 100 << 20));
    EXPECT_EQ("2:", Reading("k"));
    EXPECT_EQ(0u, Write("k", "v"));
    EXPECT_EQ(100u << 20, std::filesystem::file_size(file + ".bad"));

    const std::string below = file + "/below.xml", pipe = folder + "pipe";
    ASSERT_EQ(0, mkfifo(pipe.c_str(), 0600));
    const struct {
        std::string path;
        const char* reading;
        unsigned int written;
    } rows[] = {{below, "5:", 4}, {pipe, "2:", 2}, {folder + ".", "2:", 2}, {folder + "no/folder.xml", "5:", 4}};
    for (const auto& row : rows) {
        file = row.path;
        EXPECT_EQ(row.reading, Reading("k")) << row.path;
        EXPECT_EQ(row.written, Write("k", "v")) << row.path;
    }
}

TEST_F(Settings, AWriteChangesItsElementAndNothingElse)
{
    const std::string head = "\xEF\xBB\xBF<?xml version='1.0'?>\r\n<!-- a <ZVWSLib> -->\n";
    const std::string odd =
        "\n  <ZV1:Configuration  Key = 'a&gt;b' note='>' ><ZV1:Value></ZV1:Value><x/>"
        "</ZV1:Configuration >\n<?pi <?><![CDATA[ ]]> &#65; <other Key=\"k\"/>";
    const std::string anew = "<ZV1:Configuration" + kNs + " Key=\"k\"><ZV1:Value>v</ZV1:Value></ZV1:Configuration>";
    const struct {
        const char* what;
        std::string before, after;
    } rows[] = {
        {"replaced where it stands", head + Document(odd + Setting("k", "old") + odd + Setting("z", "1")) + "\n<!---->",
         head + Document(odd + Setting("k", "v") + odd + Setting("z", "1")) + "\n<!---->"},
        {"the first of two", Document(Setting("k", "1") + Setting("k", "2")),
         Document(Setting("k", "v") + Setting("k", "2"))},
        {"without a value", Document("<ZV1:Configuration Key='k'/>" + odd), Document(Setting("k", "v") + odd)},
        {"added at the end", head + Document(odd) + " ", head + Document(odd + Setting("k", "v")) + " "},
        {"first one", "<ZVWSLib" + kNs + " />\n", "<ZVWSLib" + kNs + " >" + Setting("k", "v") + "</ZVWSLib>\n"},
        {"empty root", Document(""), Document(Setting("k", "v"))},
        {"no prefix", "<ZVWSLib></ZVWSLib\n>", "<ZVWSLib>" + anew + "</ZVWSLib\n>"},
        {"prefix of others", "<ZVWSLib xmlns:ZV1='urn:x'/>", "<ZVWSLib xmlns:ZV1='urn:x'>" + anew + "</ZVWSLib>"},
        {"root with prefix", "<p:ZVWSLib xmlns:p='urn:p'/>", "<p:ZVWSLib xmlns:p='urn:p'>" + anew + "</p:ZVWSLib>"},
    };
    for (const auto& row : rows) {
        Put(file, row.before);
        EXPECT_EQ(0u, Write("k", "v")) << row.what;
        EXPECT_EQ(row.after, ContentOf(file)) << row.what;
        EXPECT_EQ("0:v", Reading("k")) << row.what;
    }
}

TEST_F(Settings, ValuesAndKeysComeBackAsTheyWere)
{
    std::vector<std::string> texts = {"a",   "",      " ",    "\t\r\n\r",   "<&>\"'",
                                      "]]>", "&amp;", "0040", "</ZVWSLib>", "xmlns:ZV1=\"\""};
    texts.insert(texts.end(), {"äöü€\xF0\x9F\x8E\xAC", std::string(300000, 'x')});
    for (const bool isProtected : {false, true}) {
        for (const std::string& text : texts) {
            const std::string what = text.substr(0, 40) + (isProtected ? " protected" : "");
            EXPECT_EQ(0u, Write("value", text, isProtected)) << what;
            EXPECT_TRUE(Reading("value", isProtected) == "0:" + text) << what;
            if (text.empty()) continue;
            EXPECT_EQ(0u, Write(text, "by key", isProtected)) << what;
            EXPECT_EQ("0:by key", Reading(text, isProtected)) << what;
            EXPECT_TRUE(Reading("value", isProtected) == "0:" + text) << what;
            unlink(file.c_str());
        }
    }
}

TEST_F(Settings, WhatXmlCannotHoldIsRefusedUnlessProtected)
{
    ASSERT_EQ(0u, Write("k", "before"));
    const std::string before = ContentOf(file);
    const std::string texts[] = {std::string("a\0b", 3), "\x01",        "\x1B[0m", "\xFF", "\xC3",
                                 "\xED\xA0\x80",         "\xEF\xBF\xBF"};
    for (const std::string& text : texts) {
        EXPECT_EQ(6u, Write("k", text));
        EXPECT_EQ(6u, Write("key" + text, "v"));
        EXPECT_EQ(before, ContentOf(file));
        EXPECT_EQ(0u, Write("secret", text, true));
        EXPECT_EQ("0:" + text, Reading("secret", true));
        Put(file, before);
    }
    EXPECT_EQ(1u, Write("", "v"));
    EXPECT_EQ(4u, Write("k", std::string(CfgXMLFile::kMaxSize, 'x')));
    EXPECT_EQ(4u, Write("k", std::string(CfgXMLFile::kMaxSize + 1, 'x'), true));
    EXPECT_EQ(before, ContentOf(file));
}

TEST_F(Settings, ALargestFileIsReadAndCanBeChanged)
{
    const std::string value(CfgXMLFile::kMaxSize - Document(Setting("k", "")).size(), 'x');
    Put(file, Document(Setting("k", value)));
    EXPECT_EQ(4u, Write("j", "v"));
    EXPECT_TRUE(Reading("k") == "0:" + value);
    EXPECT_EQ(0u, Write("k", "small"));
    EXPECT_EQ(0u, Write("j", "v"));
}

// The document is a record of the service's schema, so the SOAP runtime can read it, too.
TEST_F(Settings, ADocumentIsASerializedRecord)
{
    ASSERT_EQ(0u, Write("a", "1 < 2"));
    ASSERT_EQ(0u, Write("b&", "2"));
    ASSERT_EQ(0u, Write("a", "3\n"));
    Serializer serializer(false, false);
    ZV1__ArrayOfConfigurationItemOfString record;
    ASSERT_TRUE(serializer.Read(Bytes(ContentOf(file)), record));
    std::string items;
    for (int i = 0; i < record.__sizeConfiguration; ++i)
        items += std::string(record.Configuration[i]->Key) + "=" + record.Configuration[i]->Value + ";";
    EXPECT_EQ("a=3\n;b&=2;", items);

    ZVString text;
    ASSERT_TRUE(Serializer(false, false).Write(record, text));
    Put(file, text.c_str());
    EXPECT_EQ("0:3\n", Reading("a"));
    EXPECT_EQ("0:2", Reading("b&"));
}

TEST_F(Settings, ModeAndLinkOfAFileStay)
{
    namespace fs = std::filesystem;
    const auto modeOf = [](const std::string& path) { return static_cast<int>(fs::status(path).permissions()); };
    ASSERT_EQ(0u, Write("k", "1", true));
    EXPECT_EQ(0600, modeOf(file));
    EXPECT_EQ(0600, modeOf(folder + "device.key"));

    const std::string real = file;
    chmod(real.c_str(), 0644);
    file = folder + "link.xml";
    ASSERT_EQ(0, symlink("settings.xml", file.c_str()));
    EXPECT_EQ(0u, Write("k", "2"));
    EXPECT_TRUE(fs::is_symlink(file));
    EXPECT_EQ(0644, modeOf(real));
    file = real;
    EXPECT_EQ("0:2", Reading("k"));
}

// ---- Protected values

TEST_F(Settings, AProtectedValueShowsNothingAndIsNeverTheSameTwice)
{
    ASSERT_EQ(0u, Write("k", "a secret token", true));
    const std::string first = Reading("k");
    EXPECT_EQ(std::string::npos, ContentOf(file).find("secret"));
    EXPECT_EQ("0:0040", first.substr(0, 6));
    ASSERT_EQ(0u, Write("k", "a secret token", true));
    EXPECT_NE(first, Reading("k"));
    EXPECT_EQ(Reading("k").size(), first.size());
    EXPECT_EQ("0:a secret token", Reading("k", true));
}

TEST_F(Settings, ATamperedValueReadsAsEmpty)
{
    ASSERT_EQ(0u, Write("k", "a secret", true));
    const std::string packed = Reading("k").substr(2);
    std::vector<std::string> tampered = {"plain", "0", "0000", "0040", "00400", packed + " ", " " + packed};
    tampered.insert(tampered.end(), {"9999" + packed.substr(4), packed + packed.substr(4), "0000" + packed});
    for (size_t i = 0; i < packed.size(); ++i) {
        std::string changed = packed;
        changed[i] = changed[i] == 'A' ? 'B' : 'A';
        tampered.push_back(changed);
        tampered.push_back(packed.substr(0, i));
        tampered.push_back(packed.substr(0, i) + packed.substr(i + 1));
    }
    for (const std::string& text : tampered) {
        if (text.empty()) continue;
        Put(file, Document(Setting("k", text)));
        EXPECT_EQ("6:", Reading("k", true)) << text;
    }
    Put(file, Document(Setting("k", packed) + Setting("shown", packed)));
    EXPECT_EQ("0:a secret", Reading("k", true));
    EXPECT_EQ("6:", Reading("shown", true));
}

TEST_F(Settings, AProtectedValueNeedsItsDevicesKey)
{
    ASSERT_EQ(0u, Write("k", "v", true));
    const std::string key = folder + "device.key";
    const std::string right = ContentOf(key);
    EXPECT_EQ(EVPCipher::kDeviceKeySize, right.size());
    const struct {
        std::string key;
        const char* reading;
        unsigned int written;
    } rows[] = {{std::string(32, 'x'), "6:", 0},
                {"", "7:", 7},
                {right.substr(1), "7:", 7},
                {right + "x", "7:", 7},
                {right, "0:v", 0}};
    for (const auto& row : rows) {
        Put(key, row.key);
        EXPECT_EQ(row.reading, Reading("k", true));
        EXPECT_EQ(row.written, Write("other", "v", true));
        EXPECT_EQ(row.key, ContentOf(key));
    }
    ASSERT_EQ(0, unlink(key.c_str()));
    EXPECT_EQ("7:", Reading("k", true));
    EXPECT_FALSE(std::filesystem::exists(key)) << "a read must not make a key";

    UseKeyFile(file + "/below.key");
    EXPECT_EQ(7u, Write("k", "w", true));
    UseKeyFile("");
    EXPECT_EQ(7u, Write("k", "w", true));
    EXPECT_EQ(0u, Write("k", "", true)) << "an empty value is not enciphered";
    EXPECT_EQ("0:", Reading("k", true));
}

TEST_F(Settings, PackedTextsCarryBothParts)
{
    ZVString packed, seal, cipherText;
    ASSERT_TRUE(PackEncryptedValue(ZVString("a\0b", 3), ZVString("four"), packed));
    EXPECT_STREQ("0004YQBiZm91cg==", packed.c_str());
    ASSERT_TRUE(UnPackEncryptedValue(packed, seal, cipherText));
    EXPECT_TRUE(seal == ZVString("a\0b", 3));
    EXPECT_STREQ("four", cipherText.c_str());
    EXPECT_TRUE(PackEncryptedValue(Bytes(std::string(7497, 's')), ZVString(), packed));
    EXPECT_EQ(4u + 9996, packed.length());
    EXPECT_FALSE(PackEncryptedValue(Bytes(std::string(7500, 's')), ZVString(), packed));
    for (const char* text : {"", "000", "+004YQBi", " 4  YQBi", "0005YQBi", "0003YQBi", "0004YQ=i", "0004YQB!",
                             "0004====", "0004YQBiZ", "0004YQBiZm91ch==", "0004YQBi Zm91cg=="}) {
        EXPECT_FALSE(UnPackEncryptedValue(ZVString(text), seal, cipherText)) << text;
        EXPECT_TRUE(seal.empty() && cipherText.empty()) << text;
    }
}

// ---- Disks and other writers

// Whoever may write in the folder could read a device key, or have others' files overwritten.
TEST_F(Settings, WhatStandsInPlaceOfATemporaryFileIsNotUsed)
{
    const std::string other = folder + "other";
    const struct {
        const char* what;
        std::function<int(const char*)> make;
    } rows[] = {
        {"open to all", [&](const char* path) { return Put(path, "old"), chmod(path, 0666); }},
        {"a pipe", [&](const char* path) { return mkfifo(path, 0666); }},
        {"a link", [&](const char* path) { return symlink(other.c_str(), path); }},
        {"a link to nothing", [&](const char* path) { return symlink("nothing", path); }},
        {"another name of a file", [&](const char* path) { return link(other.c_str(), path); }},
        {"a folder", [&](const char* path) { return mkdir(path, 0777); }},
    };
    for (const auto& row : rows) {
        Put(other, "untouched");
        chmod(other.c_str(), 0666);
        for (const std::string& path : {file, folder + "device.key"}) {
            unlink(path.c_str());
            ASSERT_EQ(0, row.make((path + ".new").c_str())) << row.what;
        }
        EXPECT_EQ(0u, Write("k", "v", true)) << row.what;
        EXPECT_EQ("0:v", Reading("k", true)) << row.what;
        EXPECT_EQ("untouched", ContentOf(other)) << row.what;
        EXPECT_FALSE(std::filesystem::exists(folder + "nothing")) << row.what;
        for (const std::string& path : {file, folder + "device.key"}) {
            struct stat made;
            ASSERT_EQ(0, lstat(path.c_str(), &made)) << row.what;
            EXPECT_EQ(S_IFREG | 0600u, made.st_mode) << row.what << " " << path;
            EXPECT_EQ(1u, made.st_nlink) << row.what << " " << path;
        }
    }
}

TEST_F(Settings, AWriterThatNeverEndsStopsTheOthersForATimeOnly)
{
    const SafeFile::FolderLock lock(Bytes(file));
    ASSERT_TRUE(lock.Held());
    EXPECT_EQ(4u, Write("k", "v"));
    EXPECT_FALSE(std::filesystem::exists(file));
}

// ---- The library's calls

TEST_F(Settings, StatusesOfTheCalls)
{
    const auto read = [](const std::string& path, const char* key, bool isProtected) {
        ZV_WS_String value;
        const ZV_WS_Status status = ZV_WS_readSetting(path.c_str(), key, isProtected, &value);
        EXPECT_EQ(status == ZV_WS_Status_ok, value.data != nullptr);
        const std::string text = std::to_string(status) + ":" + (value.data ? value.data : "");
        ZV_WS_release(&value);
        return text;
    };
    const char* path = file.c_str();
    const std::string deployment = folder + "deployment";
    const char* const refused[][3] = {
        {nullptr, "k", "v"}, {"", "k", "v"}, {path, nullptr, "v"}, {path, "", "v"}, {path, "k", nullptr}};
    for (const auto& row : refused)
        EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_writeSetting(row[0], row[1], row[2], false));
    EXPECT_EQ(ZV_WS_Status_setting_invalid_value, ZV_WS_writeSetting(path, "k", "\x01", false));
    EXPECT_EQ(ZV_WS_Status_file_operation_error, ZV_WS_writeSetting(folder.c_str(), "k", "v", false));
    EXPECT_EQ(ZV_WS_Status_setting_invalid_value, ZV_WS_createEnvXML(path, static_cast<ZV_WS_EnvNum>(-1)));
    EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_deleteEnvXML(nullptr));
    EXPECT_EQ("-1906:", read(deployment, "k", false));
    EXPECT_EQ(std::to_string(ZV_WS_Status_file_operation_error) + ":", read(path, "k", false));
    const struct {
        const char* value;
        bool isProtected;
        const char* reading;
    } rows[] = {{"", true, "0:"}, {"v", true, "0:v"}, {"v", false, "-1907:"}};
    for (const auto& row : rows) {
        EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_writeSetting(path, "k", row.value, row.isProtected));
        EXPECT_EQ(row.reading, read(path, "k", true));
    }
    EXPECT_EQ("-1906:", read(path, "K", true));
    EXPECT_EQ(std::to_string(ZV_WS_Status_invalid_param) + ":", read(path, "", true));
}

}  // namespace
