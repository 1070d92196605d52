// Memory that runs out at every single allocation of a call, and a disk that is full at every single write.
//
// The functions of the C library through which all memory and most writes go, those of shared libraries too, are this
// program's own: they count what the thread under test does, and let the n-th fail, or all from it on.
#include <errno.h>
#include <limits.h>
#include <openssl/crypto.h>
#include <signal.h>
#include <string.h>
#include <sys/fsuid.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <sys/wait.h>

#include <functional>
#include <regex>
#include <set>

#include "CacheFile.h"
#include "Calls.h"
#include "Peer.h"
#include "Records.h"
#include "SettingsFolder.h"
#include "Store.h"
#include "Text.h"
#include "Tls.h"

namespace {

struct Counter {
    int error;
    bool counts = false, all = false;
    long made = 0, failAt = 0;
    bool kills = false;  // the process dies in place of the failure

    bool Passes()
    {
        if (!counts || ++made < failAt || failAt == 0 || (made > failAt && !all)) return true;
        if (kills) _exit(0);
        errno = error;
        return false;
    }
};
thread_local Counter t_Memory = {ENOMEM}, t_Disk = {ENOSPC};
thread_local long t_Blocks = 0;  // made and not freed; on other threads than the one that tests it means nothing
thread_local std::vector<std::string>* t_Steps = nullptr;  // what is done to files, in order

// The result of `call`, in which memory or disk fails. With 0 nothing does.
template <class Call>
auto Failing(Counter& counter, long failAt, bool all, Call&& call)
{
    counter = {counter.error, true, all, 0, failAt, false};
    const auto result = call();
    counter.counts = false;
    return result;
}

void* Made(void* block)
{
    t_Blocks += block != nullptr;
    return block;
}

bool HasRoom(int file)
{
    struct stat entry;
    return !t_Disk.counts || fstat(file, &entry) != 0 || !S_ISREG(entry.st_mode) || t_Disk.Passes();
}

void Note(const char* step, const char* path)
{
    if (!t_Steps) return;
    const char* name = strrchr(path, '/') ? strrchr(path, '/') + 1 : path;
    t_Steps->push_back(std::string(step) + " " + (strncmp(name, "zvws", 4) == 0 ? "temporary" : name));
}

void NoteFile(const char* step, int file)
{
    char path[PATH_MAX] = "";
    const std::string link = t_Steps ? "/proc/self/fd/" + std::to_string(file) : std::string();
    if (t_Steps && readlink(link.c_str(), path, sizeof path - 1) > 0) Note(step, path);
}

}  // namespace

extern "C" {
void* __libc_malloc(size_t size);
void* __libc_calloc(size_t count, size_t size);
void* __libc_realloc(void* block, size_t size);
void __libc_free(void* block);

void* malloc(size_t size) noexcept
{
    return t_Memory.Passes() ? Made(__libc_malloc(size)) : nullptr;
}
void* calloc(size_t count, size_t size) noexcept
{
    return t_Memory.Passes() ? Made(__libc_calloc(count, size)) : nullptr;
}
void* realloc(void* block, size_t size) noexcept
{
    if (!t_Memory.Passes()) return nullptr;
    t_Blocks -= block != nullptr;
    return Made(__libc_realloc(block, size));
}
void free(void* block) noexcept
{
    t_Blocks -= block != nullptr;
    __libc_free(block);
}

ssize_t write(int file, const void* bytes, size_t size)
{
    NoteFile("write", file);
    return HasRoom(file) ? syscall(SYS_write, file, bytes, size) : -1;
}
ssize_t pwrite64(int file, const void* bytes, size_t size, off64_t offset)
{
    NoteFile("write", file);
    return HasRoom(file) ? syscall(SYS_pwrite64, file, bytes, size, offset) : -1;
}
int rename(const char* from, const char* to) noexcept
{
    Note("rename", from);
    return t_Disk.Passes() ? static_cast<int>(syscall(SYS_rename, from, to)) : -1;
}
// Nobody cuts the power here: what is written need not reach the disk.
int fsync(int file)
{
    NoteFile("flush", file);
    return HasRoom(file) ? 0 : -1;
}
int fdatasync(int file)
{
    return fsync(file);
}
int unlink(const char* path) noexcept
{
    if (t_Disk.kills) t_Disk.Passes();  // to remove a file takes no room
    return static_cast<int>(syscall(SYS_unlink, path));
}
}

namespace {

namespace fs = std::filesystem;

// A record as text, to compare whole results.
struct Text {
    std::string text;

    template <class T>
    void Member(const char*, T& value)
    {
        if constexpr (Records::kIsRecord<T>) {
            Records::detail::VisitAll(value, *this);
        } else if constexpr (std::is_same_v<T, char*>) {
            text += value ? value : "(null)";
        } else {
            text += std::to_string(value);
        }
        text += "|";
    }
    template <class T>
    void Elements(const char* name, unsigned int& size, T*& elements)
    {
        text += name + std::to_string(size) + ":";
        for (unsigned int i = 0; i < size; ++i)
            Member(name, elements[i]);
    }
};

size_t Files(const std::string& folder)
{
    return static_cast<size_t>(std::distance(fs::directory_iterator(folder), fs::directory_iterator()));
}

// A call that can be made again and again; only in `call` something fails.
struct Case {
    std::function<void()> prepare;
    std::function<ZV_WS_Status()> call;
    std::function<std::string(ZV_WS_Status)> take;  // its result as text, which is freed

    std::string Make() const
    {
        const ZV_WS_Status status = call();
        EXPECT_EQ(ZV_WS_Status_ok, status);
        return take(status);
    }
};

// Fails every allocation of the call up to the `dense`-th, then every `stride`-th; then every `allStride`-th with all
// that follow it. Whatever the call answers, a success is a whole one, nothing leaks, and the next call works.
void Exhaust(const Case& one, long dense, long stride, long allStride)
{
    one.prepare();
    std::string right;
    for (int i = 0; i < 3; ++i)  // fills what libraries keep for good
        right = one.Make();
    for (const bool all : {false, true}) {
        int growths = 0;
        bool came = true;
        const auto next = [&](long n) { return all ? allStride : n < dense ? 1 : stride; };
        for (long n = 1, blocks = t_Blocks; came; n += growths ? 0 : next(n)) {
            one.prepare();
            const ZV_WS_Status status = Failing(t_Memory, n, all, one.call);
            came = t_Memory.made >= n;
            const std::string result = one.take(status);
            ASSERT_EQ(status == ZV_WS_Status_ok ? right : result, result) << "allocation " << n;
            ASSERT_EQ(right, one.Make()) << "allocation " << n;
            OPENSSL_thread_stop();  // the thread's error texts and random numbers are no leak
            // Libraries also fill caches on the way, once: only what grows each time is a leak.
            growths = t_Blocks > blocks ? growths + 1 : 0;
            ASSERT_LT(growths, 4) << "leak after allocation " << n;
            blocks = t_Blocks;
        }
    }
}

// Calls attempt(n, all) with n = 1, 2, ... as long as it comes to that many writes.
void AtEachWrite(const std::function<void(long, bool)>& attempt)
{
    for (const bool all : {false, true}) {
        long n = 0;
        do {
            attempt(++n, all);
        } while (t_Disk.made >= n && !testing::Test::HasFailure());
        EXPECT_GT(n, 3) << "hardly anything was written";
    }
}

class Torture : public Store {
protected:
    void Begin(unsigned int data)
    {
        CacheWriter::SetPatience(3600000);  // on this thread alone something fails
        folder = store->DataFolder() + "/cache";
        ZV_WS_SetupParams setup = Setup();
        if (data) setup.CacheParam = {CacheType_File, data, 0, folder.c_str()};
        ASSERT_EQ(ZV_WS_Status_ok, Initialize(setup));
        ASSERT_EQ(ZV_WS_Status_ok, Titles(1));
        if (data) session._pSessionImpl->m_Writer->Flush();
        first = Take();
        ASSERT_NE(std::string::npos, first.find("TitleListing2:")) << first;
        store->ClearLog();
    }

    ZV_WS_Status Titles(unsigned int number)
    {
        const ZV_WS_Pagination page = Page(number, 2);
        return ZV_WS_getTitles(&session, 1, &page, PURCHASE_TYPE_ANY, &titles);
    }

    std::string Take()
    {
        Text text;
        text.Member("", static_cast<ZV_WS_TitlesResponse&>(titles));
        ZV_WS_release(&titles);
        return text.text;
    }

    Case FirstPage(const std::function<void()>& prepare)
    {
        return {prepare, [this] { return Titles(1); }, [this](ZV_WS_Status) { return Take(); }};
    }

    std::string Database() const { return session._pSessionImpl->m_Params.CachePath.c_str(); }

    std::string folder, first;
    Owned<ZV_WS_TitlesResponse> titles;
};

TEST_F(Torture, ACallWithoutMemory)
{
    for (const unsigned int cached : {unsigned(ZV_WS_CacheParam::CacheData_Metadata), 0u}) {
        Begin(cached);  // without a cache, over a kept connection
        Exhaust(FirstPage([] {}), LONG_MAX, 1, 1);
        ZV_WS_release(&session);
    }
}

// Asked from the service, and then what the cache knows beside its answers is written and read.
TEST_F(Torture, AWishListWithoutMemory)
{
    Begin(ZV_WS_CacheParam::CacheData_Userdata);
    CacheInterface& cache = *session._pSessionImpl->m_Cache;
    bool isWished = false;
    const Case check = {[&] { cache.RemoveWishlistFlag(12); },
                        [&] { return ZV_WS_checkTitleInWishlist(&session, 12, &isWished); },
                        [&](ZV_WS_Status) { return std::to_string(isWished); }};
    Exhaust(check, LONG_MAX, 1, 1);
    ZV_WS_StandardResponse answer;
    const Case clear = {[] {}, [&] { return ZV_WS_removeAllItemsFromWishlist(&session, &answer); },
                        [&](ZV_WS_Status) {
                            ZV_WS_release(&answer);
                            return std::string();
                        }};
    Exhaust(clear, LONG_MAX, 1, 1);
}

// The names of all calls that the library offers, as its header has them.
std::set<std::string> PublicCalls()
{
    std::set<std::string> names;
    const std::string header = ContentOf(ZV_PUBLIC_HEADER);
    const std::regex declaration("\nZV_WS_Status ZV_WS_([A-Za-z]+)\\(");
    for (std::sregex_iterator call(header.begin(), header.end(), declaration), end; call != end; ++call)
        names.insert((*call)[1]);
    return names;
}

// Every call that asks a service, against an answer in memory.
TEST(TortureCalls, NothingIsThrown)
{
    for (const std::string& name : CallNames()) {
        if (name == "checkBandwidth") continue;  // asks two hosts: see below
        SCOPED_TRACE(name);
        const std::string seed = std::string(ZV_ANSWERS) + "/" + name;
        const std::string kept = ContentOf(fs::exists(seed + "-full") ? seed + "-full" : seed);
        std::string_view answer = kept;
        ASSERT_EQ(name, TakeLine(answer));
        Peer peer(answer);
        PeerSession session;
        SessionImpl& own = session.session();
        CallResult result;
        const Case one = {[&] { own.m_Cache = std::make_unique<MemoryCache>(); },
                          [&] {
                              peer.Accept(INT_MAX);
                              own.m_Browse.transport().Close();
                              own.m_Stream.transport().Close();
                              own.m_Download.transport().Close();
                              MakeCall(name, session.handle(), result, [] { t_Memory.counts = false; });
                              return result.status;
                          },
                          [&](ZV_WS_Status) { return result.output; }};
        Exhaust(one, LONG_MAX, 1, 3);
    }
}

// The others, which ask nobody, or not by SOAP.
TEST_F(Torture, NothingIsThrownByOtherCalls)
{
    Begin(ZV_WS_CacheParam::CacheData_Metadata | ZV_WS_CacheParam::CacheData_BoxArtImage);
    const std::string inner = folder + "/a/b", file = inner + "/settings.xml", other = file + "2";
    ZV_WS_String text;
    ZV_WS_Image image;
    ZV_WS_VersionInfo version;
    ZV_WS_Session copy;
    bool flag = false;
    time_t now = 0;
    unsigned int bits = 0;
    ZV_WS_EnvironmentLists list;
    ZV_WS_EnvID env = {};
    const struct {
        const char* name;
        std::function<ZV_WS_Status()> call;
    } rows[] = {
        {"getAvailableEnvLists", [&] { return ZV_WS_getAvailableEnvLists(&list); }},
        {"getDeviceEnv", [&] { return ZV_WS_getDeviceEnv(&session, &env); }},
        {"getDefaultEnvID", [&] { return ZV_WS_getDefaultEnvID(&session, &env); }},
        {"getVersion", [&] { return ZV_WS_getVersion(&version); }},
        {"getUserAgent", [&] { return ZV_WS_getUserAgent(&session, &text); }},
        {"getDestinationUniqueID", [&] { return ZV_WS_getDestinationUniqueID(&session, &text); }},
        {"getBoxArtImage", [&] { return ZV_WS_getBoxArtImage(&session, BOX_ART_SIZE_95, "ZV00012", &text); }},
        {"getBoxArtImageData", [&] { return ZV_WS_getBoxArtImageData(&session, BOX_ART_SIZE_95, "ZV00012", &image); }},
        {"updateLocalCache", [&] { return ZV_WS_updateLocalCache(&session, 7); }},
        {"duplicate", [&] { return ZV_WS_duplicate(&copy, &session); }},
        {"checkBandwidth", [&] { return ZV_WS_checkBandwidth(&session, &bits); }},
        {"getServerTime", [&] { return ZV_WS_getServerTime(&now); }},
        {"getLocalIPAddr", [&] { return ZV_WS_getLocalIPAddr(&session, &text); }},
        {"createFolder", [&] { return ZV_WS_createFolder(inner.c_str()); }},
        {"folderExist", [&] { return ZV_WS_folderExist(folder.c_str(), &flag); }},
        {"getFolderName", [&] { return ZV_WS_getFolderName(file.c_str(), &text); }},
        {"createEnvXML", [&] { return ZV_WS_createEnvXML(file.c_str(), ENVNUM_PRODUCTION); }},
        {"writeSetting", [&] { return ZV_WS_writeSetting(file.c_str(), "k", "v", false); }},
        {"readSetting", [&] { return ZV_WS_readSetting(file.c_str(), "k", false, &text); }},
        {"fileExist", [&] { return ZV_WS_fileExist(file.c_str(), &flag); }},
        {"copyFile", [&] { return ZV_WS_copyFile(file.c_str(), other.c_str()); }},
        {"removeFile", [&] { return ZV_WS_removeFile(other.c_str()); }},
        {"deleteEnvXML", [&] { return ZV_WS_deleteEnvXML(file.c_str()); }},
        {"clearLocalCache", [&] { return ZV_WS_clearLocalCache(inner.c_str()); }},
    };
    std::set<std::string> missing = PublicCalls();
    for (const char* name : {"initialize", "release"})  // see ANewSessionWithoutMemory
        missing.erase(name);
    for (const std::string& name : CallNames())
        missing.erase(name);
    for (const auto& row : rows) {
        SCOPED_TRACE(row.name);
        missing.erase(row.name);
        // TLS contexts and connections are a thousand allocations each, which fail elsewhere.
        static const std::set<std::string> kLong = {"duplicate", "updateLocalCache", "getDefaultEnvID",
                                                    "getLocalIPAddr", "checkBandwidth"};
        const bool isLong = kLong.count(row.name) != 0;
        Exhaust(
            {[] {}, row.call,
             [&](ZV_WS_Status) {
                 for (ZV_WS_Object* record : {static_cast<ZV_WS_Object*>(&text), static_cast<ZV_WS_Object*>(&image),
                                              static_cast<ZV_WS_Object*>(&version), static_cast<ZV_WS_Object*>(&copy)})
                     ZV_WS_release(record);
                 return std::string();
             }},
            isLong ? 100 : LONG_MAX, 7, isLong ? 13 : 1);
    }
    EXPECT_EQ(std::set<std::string>(), missing) << "calls without a row";
}

// With a full handshake it is some 2600 allocations, and all of them would take half a minute. Those of the request and
// of opening the connection come first, each of them fails; those of the answer come last, and fail above.
TEST_F(Torture, ACallOverANewConnectionWithoutMemory)
{
    Begin(0);
    const Case one = FirstPage([this] {
        Transport& transport = session._pSessionImpl->m_Browse.transport();
        transport.Close();
        Tls::ForgetSession(transport.context().ctx);
    });
    Exhaust(one, 150, 3, 17);
}

// A session that is said to be there has to work. As many allocations as above.
TEST_F(Torture, ANewSessionWithoutMemory)
{
    Begin(0);
    const ZV_WS_SetupParams setup = Setup();
    const Case one = {[] {}, [&] { return Initialize(setup); },
                      [this](ZV_WS_Status status) {
                          EXPECT_EQ(status, status == ZV_WS_Status_ok ? Titles(1) : status);
                          ZV_WS_release(&session);
                          return Take();
                      }};
    ZV_WS_release(&session);
    Exhaust(one, 60, 11, 37);
}

TEST_F(Torture, AnAnswerThatTheDiskHasNoRoomFor)
{
    Begin(ZV_WS_CacheParam::CacheData_Metadata);
    unsigned int number = 1;
    AtEachWrite([&](long n, bool all) {
        ++number;
        EXPECT_EQ(ZV_WS_Status_ok, Failing(t_Disk, n, all, [&] {
                      const ZV_WS_Status status = Titles(number);
                      session._pSessionImpl->m_Writer->Flush();
                      return status;
                  }));
        const std::string answer = Take();
        store->ClearLog();
        EXPECT_EQ(ZV_WS_Status_ok, Titles(1));
        EXPECT_EQ(first, Take()) << n;
        EXPECT_TRUE(store->Log().empty()) << "the cache is lost after write " << n;
        for (int i = 0; i < 2; ++i) {
            EXPECT_EQ(ZV_WS_Status_ok, Titles(number));
            EXPECT_EQ(answer, Take()) << n;
        }
        EXPECT_LE(store->Log().size(), 1u) << "nothing is cached any more after write " << n;
        EXPECT_EQ(1u, Files(folder)) << n;
    });
}

class TortureImage : public Torture {
protected:
    void SetUp() override
    {
        Torture::SetUp();
        Begin(ZV_WS_CacheParam::CacheData_BoxArtImage | ZV_WS_CacheParam::CacheData_Metadata);
        ASSERT_EQ(ZV_WS_Status_ok, Image("ZV00012"));
        file = folder + "/ZV00012321.jpg";
        whole = ContentOf(file);
        ASSERT_GT(whole.size(), 8192u) << "more than stdio holds back";
    }

    // With its row, which would wait for others.
    ZV_WS_Status Image(const char* prefix)
    {
        Owned<ZV_WS_String> place;
        const ZV_WS_Status status = ZV_WS_getBoxArtImage(&session, BOX_ART_SIZE_321, prefix, &place);
        session._pSessionImpl->m_Writer->Flush();
        return status;
    }

    // No part of an image is left and no temporary file. The database's journal may be, which is the next call's.
    void Check(ZV_WS_Status status, const std::string& what)
    {
        EXPECT_TRUE(status == ZV_WS_Status_ok || status == ZV_WS_Status_file_operation_error) << what << status;
        EXPECT_EQ(status == ZV_WS_Status_ok ? whole : "", ContentOf(file)) << what;
        for (const auto& entry : fs::directory_iterator(folder))
            EXPECT_NE(0u, entry.path().filename().string().rfind("zvws", 0)) << what;
        EXPECT_EQ(ZV_WS_Status_ok, Image("ZV00012")) << what;
        EXPECT_EQ(whole, ContentOf(file)) << what;
        EXPECT_EQ(2u, Files(folder)) << what;
    }

    std::string file, whole;
};

TEST_F(TortureImage, TheDiskIsFullAtEachWrite)
{
    for (const bool isThere : {false, true}) {
        AtEachWrite([&](long n, bool all) {
            if (isThere) {
                ZV_WS_updateLocalCache(&session, ZV_WS_CacheParam::CacheData_BoxArtImage);
                Fault("boxart=modified");
            } else {
                fs::remove(file);
            }
            const ZV_WS_Status status = Failing(t_Disk, n, all, [&] { return Image("ZV00012"); });
            EXPECT_TRUE(status == ZV_WS_Status_ok || !isThere) << "the old image is lost";
            Check(status, "write " + std::to_string(n));
        });
    }
}

// What the power leaves after any of these steps is the old image, the new one or none.
TEST_F(TortureImage, IsOnTheDiskBeforeItHasItsName)
{
    std::vector<std::string> steps;
    t_Steps = &steps;
    const ZV_WS_Status status = Image("ZV00013");
    t_Steps = nullptr;
    EXPECT_EQ(ZV_WS_Status_ok, status);
    // stdio's writes are inside of the C library.
    ASSERT_LT(3u, steps.size());
    EXPECT_EQ("flush temporary", steps[0]);
    EXPECT_EQ("rename temporary", steps[1]);
    const std::string database = fs::path(Database()).filename().string();
    EXPECT_EQ("write " + database + "-journal", steps[2]) << "and then its row";
}

// A player that is switched off at each step of a change starts with what was before it or with all of it.
TEST(TortureCache, KilledAtEachWriteOfAChange)
{
    const struct {
        const char* name;
        bool (*change)(CacheMgr& cache);
        const char* content;  // after it: the load time, and the names in both tables
    } rows[] = {
        {"a refresh", [](CacheMgr& c) { return c.UpdateLastCacheLoadTime("2"); }, "2 WishlistFlag getMyVideos "},
        {"a purge", [](CacheMgr& c) { return c.PurgeUserData(""); }, "1 getTitles "},
        {"an eviction", [](CacheMgr& c) { return c.WriteMetaData("getTitles", "new", "v"); }, "1 getTitles "},
        {"flags",
         [](CacheMgr& c) {
             return c.WriteWishlistFlags({1, 2}, {true, true});
         },
         "1 WishlistFlag WishlistFlag WishlistFlag getMyVideos getTitleListing getTitles "},
    };
    const std::string before = "1 WishlistFlag getMyVideos getTitleListing getTitles ";
    for (const auto& row : rows) {
        long n = 0;
        for (bool wasKilled = true; wasKilled; ++n) {
            SCOPED_TRACE(row.name + std::to_string(n));
            const TempFolder folder;
            const std::string path = folder / "cache.zv";
            ZV_WS_CacheParam2 param;
            param.type = CacheType_File;
            param.flags = 7;
            param.size = 100000;
            param.path = path.c_str();
            CacheMgr cache;
            ASSERT_EQ(0, cache.Open(param));
            ASSERT_TRUE(cache.UpdateLastCacheLoadTime("1") && cache.WriteMetaData("getTitleListing", "k", "v") &&
                        cache.WriteUserData("getMyVideos", "k", "v") && cache.WriteWishlistFlag(7, true) &&
                        cache.WriteMetaData("getTitles", "k", std::string(20000, 'x').c_str()));
            const pid_t child = fork();
            if (child == 0) {
                t_Disk.kills = true;
                t_Disk.failAt = n + 1;
                t_Disk.made = 0;
                t_Disk.counts = true;
                _exit(row.change(cache) ? 1 : 2);
            }
            int status = 0;
            ASSERT_EQ(child, waitpid(child, &status, 0));
            wasKilled = WEXITSTATUS(status) == 0;
            ASSERT_NE(2, WEXITSTATUS(status)) << "the change failed";
            const std::string content = CacheFile(path).Query(
                "SELECT LastLoadTime FROM Cache UNION ALL SELECT * FROM (SELECT Name FROM Service UNION ALL "
                "SELECT Name FROM Userdata ORDER BY 1)");
            const std::string after = row.content;
            EXPECT_TRUE((wasKilled && content == before) || content == after) << content;
            CacheMgr next;
            EXPECT_EQ(0, next.Open(param));
            EXPECT_TRUE(next.WriteMetaData("n", "k", "v"));
        }
        EXPECT_GT(n, 5) << "hardly anything was written";
    }
}

// stdio's own writes are inside of the C library: here the system has no room from a size on.
TEST_F(TortureImage, TheDiskIsFullAtEachSize)
{
    const auto handler = signal(SIGXFSZ, SIG_IGN);
    rlimit before;
    getrlimit(RLIMIT_FSIZE, &before);
    for (const size_t size : {size_t(0), size_t(1), size_t(4095), size_t(4096), size_t(4097), whole.size() - 1}) {
        fs::remove(file);
        const rlimit full = {size, before.rlim_max};
        setrlimit(RLIMIT_FSIZE, &full);
        const ZV_WS_Status status = Image("ZV00012");
        setrlimit(RLIMIT_FSIZE, &before);
        EXPECT_NE(ZV_WS_Status_ok, status) << size;
        Check(status, "size " + std::to_string(size));
    }
    signal(SIGXFSZ, handler);
}

// As a user who may not write there: root may anywhere.
TEST_F(TortureImage, AFolderThatCanOnlyBeRead)
{
    const std::string settings = folder + "/settings.xml";
    ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_writeSetting(settings.c_str(), "k", "old", false));
    const std::string before = ContentOf(settings);
    for (const auto& [path, mode] :
         {std::pair(store->DataFolder(), 0755), {settings, 0644}, {file, 0644}, {Database(), 0644}, {folder, 0555}})
        fs::permissions(path, fs::perms(mode));
    const auto user = static_cast<uid_t>(setfsuid(65534));  // of this thread, for files
    EXPECT_FALSE(std::ofstream(folder + "/new")) << "this user can write anywhere";
    EXPECT_EQ(ZV_WS_Status_ok, Image("ZV00012"));
    EXPECT_EQ(ZV_WS_Status_ok, Titles(1));
    EXPECT_EQ(first, Take());
    EXPECT_EQ(1u, store->Log().size()) << "what is cached can be read";
    EXPECT_EQ(ZV_WS_Status_ok, Titles(2));
    EXPECT_EQ(ZV_WS_Status_net_error, Image("ZV00013"));
    EXPECT_EQ(ZV_WS_Status_file_operation_error, ZV_WS_writeSetting(settings.c_str(), "k", "new", false));
    setfsuid(user);
    EXPECT_EQ(before, ContentOf(settings));
    EXPECT_EQ(3u, Files(folder)) << "database, image, settings";
    fs::permissions(folder, fs::perms(0755));
    EXPECT_EQ(ZV_WS_Status_ok, Image("ZV00013"));
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_writeSetting(settings.c_str(), "k", "new", false));
}

class TortureSettings : public SettingsFolder {};

TEST_F(TortureSettings, AWriteWithoutMemory)
{
    for (const bool isProtected : {false, true}) {
        ASSERT_EQ(0u, Write("Beside", "stays", true));
        const Case one = {[&] { ASSERT_EQ(0u, Write("k", "old", isProtected)); },
                          [&] { return ZV_WS_writeSetting(file.c_str(), "k", "new", isProtected); },
                          [&](ZV_WS_Status status) {
                              EXPECT_EQ(3u, Files(folder)) << "settings, device key, deployment";
                              EXPECT_EQ("0:stays", Reading("Beside", true));
                              EXPECT_EQ(status == ZV_WS_Status_ok ? "0:new" : "0:old", Reading("k", isProtected));
                              return std::string();
                          }};
        Exhaust(one, LONG_MAX, 1, 1);
    }
}

TEST_F(TortureSettings, TheDiskIsFullAtEachWrite)
{
    for (const bool isProtected : {false, true}) {
        AtEachWrite([&](long n, bool all) {
            fs::remove(folder + "/device.key");  // the first protected value makes it
            ASSERT_EQ(0u, Write("k", "old"));
            const std::string before = ContentOf(file);
            const auto write = [&] { return ZV_WS_writeSetting(file.c_str(), "k", "new", isProtected); };
            const ZV_WS_Status status = Failing(t_Disk, n, all, write);
            EXPECT_EQ(t_Disk.made < n ? ZV_WS_Status_ok : ZV_WS_Status_file_operation_error, status) << n;
            EXPECT_EQ(status != ZV_WS_Status_ok, before == ContentOf(file)) << n;
            EXPECT_EQ(fs::exists(folder + "/device.key") ? 3u : 2u, Files(folder)) << n;
            EXPECT_EQ(ZV_WS_Status_ok, write()) << n;
            EXPECT_EQ("0:new", Reading("k", isProtected)) << n;
        });
    }
}

}  // namespace
