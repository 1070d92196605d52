// A call that the file cache answers, and the pieces that it is made of, over the same data.
#include <sqlite3.h>
#include <zlib.h>

#include <filesystem>
#include <map>

#include "CacheMgr.h"
#include "Conversion.h"
#include "Records.h"
#include "Serializer.h"
#include "Store.h"

namespace {

using Response = _ZV1__getTitlesByNavigationResponse;

// A cache that holds the page, made once.
class CachedPage {
public:
    static CachedPage& Get()
    {
        static CachedPage page;
        return page;
    }

    BenchSession& session() { return m_Session; }
    const std::string& File() const { return m_File; }

    // What is stored: opens, reads and closes as each call does.
    std::string Select() const
    {
        sqlite3* database = nullptr;
        sqlite3_stmt* statement = nullptr;
        Check(sqlite3_open_v2(m_File.c_str(), &database, SQLITE_OPEN_READWRITE, nullptr) == SQLITE_OK, "open");
        sqlite3_prepare_v2(database, "SELECT Value FROM Service WHERE Name = ? AND Key = ?", -1, &statement, nullptr);
        sqlite3_bind_text(statement, 1, "getTitles", -1, SQLITE_STATIC);
        sqlite3_bind_text(statement, 2, "1,1,20,0", -1, SQLITE_STATIC);
        Check(sqlite3_step(statement) == SQLITE_ROW, "the page is cached");
        std::string value(static_cast<const char*>(sqlite3_column_blob(statement, 0)),
                          static_cast<size_t>(sqlite3_column_bytes(statement, 0)));
        sqlite3_finalize(statement);
        sqlite3_close(database);
        return value;
    }

private:
    CachedPage() : m_Session(m_Folder.Path())
    {
        m_Session.GetTitles();
        for (const auto& entry : std::filesystem::directory_iterator(m_Folder.Path())) {
            if (entry.path().extension() == ".zv") m_File = entry.path();
        }
        Check(!m_File.empty(), "a cache file");
    }

    TemporaryFolder m_Folder;
    BenchSession m_Session;
    std::string m_File;
};

std::string Inflated(const std::string& packed)
{
    z_stream stream = {};
    inflateInit2(&stream, 15 + 16);
    std::string text(200000, '\0');
    stream.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(packed.data()));
    stream.avail_in = static_cast<uInt>(packed.size());
    stream.next_out = reinterpret_cast<Bytef*>(&text[0]);
    stream.avail_out = static_cast<uInt>(text.size());
    Check(inflate(&stream, Z_FINISH) == Z_STREAM_END, "inflate");
    text.resize(stream.total_out);
    inflateEnd(&stream);
    return text;
}

void Library(benchmark::State& state)
{
    BenchSession& session = CachedPage::Get().session();
    const size_t before = TheStore().Log().size();
    while (state.KeepRunning())
        session.GetTitles();
    Check(TheStore().Log().size() == before, "nothing was asked from the service");
}

void Database(benchmark::State& state)
{
    const CachedPage& page = CachedPage::Get();
    while (state.KeepRunning())
        benchmark::DoNotOptimize(page.Select());
}

void Inflate(benchmark::State& state)
{
    const std::string packed = CachedPage::Get().Select();
    while (state.KeepRunning())
        benchmark::DoNotOptimize(Inflated(packed));
}

void Parse(benchmark::State& state)
{
    const std::string text = Inflated(CachedPage::Get().Select());
    const ZVString xml(text.data(), text.size());
    while (state.KeepRunning()) {
        Serializer serializer(false, false);
        Response response;
        Check(serializer.Read(xml, response), "parse");
    }
}

void Convert(benchmark::State& state)
{
    const std::string text = Inflated(CachedPage::Get().Select());
    Serializer serializer(false, false);
    Response response;
    Check(serializer.Read(ZVString(text.data(), text.size()), response), "parse");
    while (state.KeepRunning()) {
        ZV_WS_TitlesResponse titles;
        Records::Tag(titles);
        ZVUtilities::Convert(response.getTitlesByNavigationResult, titles);
        Check(titles.Titles.size == kItems, "convert");
        ZV_WS_release(&titles);
    }
}

// ---- Storing

constexpr int kPages = 500;

ZV_WS_CacheParam2 FileCache(const TemporaryFolder& folder)
{
    ZV_WS_CacheParam2 param;
    param.type = CacheType_File;
    param.flags = ZV_WS_CacheParam::CacheData_Metadata;
    param.size = 64u << 20;
    param.path = ZVString(folder.Path()) + "/bench.zv";
    return param;
}

// Writes one of `pages` pages anew each time, so that the cache stays as full as it is.
void Store(benchmark::State& state, int pages)
{
    const std::string packed = CachedPage::Get().Select();
    const ZVString value(packed.data(), packed.size());
    static std::map<int, TemporaryFolder> s_folders;  // filled once: that takes longer than the measurement
    const bool isNew = s_folders.count(pages) == 0;
    CacheMgr cache;
    Check(cache.Open(FileCache(s_folders[pages])) == 0, "a cache");
    const auto write = [&](int page) {
        Check(cache.WriteMetaData("getTitles", std::to_string(page % pages).c_str(), value), "a store");
    };
    for (int page = 0; isNew && page < pages; ++page)
        write(page);
    int page = 0;
    while (state.KeepRunning())
        write(page++);
}

}  // namespace

BENCHMARK(Library)->Name("cached/library");
BENCHMARK(Database)->Name("cached/database");
BENCHMARK(Inflate)->Name("cached/inflate");
BENCHMARK(Parse)->Name("cached/parse");
BENCHMARK(Convert)->Name("cached/convert");
BENCHMARK_CAPTURE(Store, full, kPages)->Name("store/full");
BENCHMARK_CAPTURE(Store, first, 1)->Name("store/first");
