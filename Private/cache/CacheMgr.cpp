#include "CacheMgr.h"

#include <errno.h>
#include <fcntl.h>
#include <sqlite3.h>
#include <stdio.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>

#include "BoxArtNames.h"
#include "ZVFile.h"
#include "ZVUtilities.h"
#include "ZV_Log.h"

ZV_LOG_AREA(ZVWS_SoapProxyLOG_AREA_NAME)

typedef ZV_WS_CacheParam CacheParam;

namespace {

constexpr int kBusyWait = 10000;        // milliseconds
constexpr uint64_t kLeftAlone = 60000;  // milliseconds
constexpr unsigned int kGenerations = 0x7ffffffe;
constexpr mode_t kPrivate = 0600;  // it holds an e-mail address and the digits of a card

// SQLite keeps a number for its user in the file's header, which every change of the file writes anyway.
const char kGeneration[] = "PRAGMA user_version";

const char kWishlistFlag[] = "WishlistFlag";

const char* const kSchema[] = {
    "CREATE TABLE IF NOT EXISTS Service (Name TEXT NOT NULL, Key TEXT NOT NULL, Value TEXT NOT NULL, Size INTEGER, "
    "PRIMARY KEY (Name, Key));",
    "CREATE TABLE IF NOT EXISTS BoxArt (Prefix TEXT NOT NULL, Dim INTEGER NOT NULL, Size INTEGER, LastModified TEXT, "
    "NeedUpdate INTEGER NOT NULL, TS DATETIME DEFAULT CURRENT_TIMESTAMP, Data BLOB, PRIMARY KEY (Prefix, Dim));",
    "CREATE TABLE IF NOT EXISTS Cache (ID INTEGER, LastLoadTime TEXT NOT NULL, PRIMARY KEY (ID));",
    "CREATE TABLE IF NOT EXISTS Userdata (Name TEXT NOT NULL, Key TEXT NOT NULL, Value TEXT NOT NULL, Size INTEGER, "
    "PRIMARY KEY (Name, Key));",
};

// Statements over the answers that tell whether a title is in the wish list.
const char* const kPurgeWishlistAnswers[] = {
    "DELETE FROM Service WHERE Name = 'getTitleListing';",
    "DELETE FROM Service WHERE Name = 'getTvEpisodeListing';",
    "DELETE FROM Service WHERE Name = 'getAllTvEpisodeListings';",
};

struct Blob {
    const ZVString& bytes;
};

int Bind(sqlite3_stmt* statement, int index, const ZVString& text)
{
    return sqlite3_bind_text64(statement, index, text.c_str(), text.length(), SQLITE_STATIC, SQLITE_UTF8);
}

int Bind(sqlite3_stmt* statement, int index, const Blob& blob)
{
    return sqlite3_bind_blob64(statement, index, blob.bytes.c_str(), blob.bytes.length(), SQLITE_STATIC);
}

int Bind(sqlite3_stmt* statement, int index, sqlite3_int64 number)
{
    return sqlite3_bind_int64(statement, index, number);
}

// The column's bytes, of a text or a blob.
ZVString ColumnBytes(sqlite3_stmt* statement, int column)
{
    const void* bytes = sqlite3_column_blob(statement, column);
    return bytes ? ZVString(static_cast<const char*>(bytes), sqlite3_column_bytes(statement, column)) : ZVString();
}

ZVString WishlistKey(int titleId)
{
    char text[32];
    snprintf(text, sizeof text, "%d", titleId);
    return text;
}

// A file of ours before SQLite makes it, so that nobody else may ever read it. SQLite gives the journal the same mode.
void MakePrivateFile(const char* path)
{
    const int made = open(path, O_RDWR | O_CREAT | O_EXCL | O_CLOEXEC, kPrivate);
    if (made >= 0) close(made);
}

// Takes a file of an earlier version away from the others. By its name: to open and close it would end the locks that
// this process has on it.
void MakePrivate(const char* path)
{
    struct stat file;
    if (stat(path, &file) == 0 && (file.st_mode & 077) != 0) chmod(path, file.st_mode & kPrivate);
}

std::atomic<uint64_t> s_Drops{0};

}  // namespace

uint64_t CacheInterface::Drops()
{
    return s_Drops;
}

void CacheMgr::CountDrop()
{
    ++s_Drops;
}

bool CacheMgr::IsLocked(int code)
{
    return (code & 0xff) == SQLITE_BUSY || (code & 0xff) == SQLITE_PROTOCOL;
}

CacheMgr::~CacheMgr()
{
    CacheMgr::Close();
}

// ---- Opening and closing

int CacheMgr::Open(const ZV_WS_CacheParam2& param)
{
    Close();
    m_Param = param;
    m_Patience = kBusyWait;
    m_LeftAlone = 0;
    SplitBudget();
    if (m_Param.type == CacheType_File) MakePrivate(m_Param.path.c_str());
    int code = Open_Internal();
    if (code == SQLITE_OK && m_Param.type != CacheType_None) {
        m_Trouble = Trouble::None;
        code = MakeTables();
        if (m_Trouble == Trouble::Broken) code = Replace();
        m_Opened = code == SQLITE_OK;
    }
    Close_Internal(false);
    return code;
}

int CacheMgr::Close()
{
    m_Opened = false;
    m_ServiceLimit = m_BoxArtLimit = m_UserDataLimit = 0;
    return Close_Internal(true);
}

// 15 % for answers, 70 % for images, 15 % for the user's data. What is left over goes to the first kind there is in the
// order of the last three lines.
void CacheMgr::SplitBudget()
{
    const double share = m_Param.size / 10.0;
    unsigned int rest = m_Param.size;
    const auto take = [&](CacheParam::CacheData kind, double shares, unsigned int& limit) {
        if ((m_Param.flags & kind) == 0) return;
        limit = static_cast<unsigned int>(share * shares);
        rest -= limit;
    };
    take(CacheParam::CacheData_Service, 1.5, m_ServiceLimit);
    take(CacheParam::CacheData_BoxArt, 7.0, m_BoxArtLimit);
    take(CacheParam::CacheData_UserData, 1.5, m_UserDataLimit);
    if (m_Param.flags & CacheParam::CacheData_BoxArt) {
        m_BoxArtLimit += rest;
    } else if (m_Param.flags & CacheParam::CacheData_UserData) {
        m_UserDataLimit += rest;
    } else if (m_Param.flags & CacheParam::CacheData_Service) {
        m_ServiceLimit += rest;
    }
}

int CacheMgr::Open_Internal()
{
    if (m_Param.type == CacheType_None || m_DB) return SQLITE_OK;
    const bool isFile = m_Param.type != CacheType_Memory;
    if (isFile) MakePrivateFile(m_Param.path.c_str());
    int code = Checked(sqlite3_open_v2(isFile ? m_Param.path.c_str() : ":memory:", &m_DB,
                                       SQLITE_OPEN_READWRITE | (isFile ? SQLITE_OPEN_CREATE : 0), nullptr));
    if (code == SQLITE_OK) code = sqlite3_busy_timeout(m_DB, m_Patience);
    if (code != SQLITE_OK) Close_Internal(true);
    return code;
}

int CacheMgr::Close_Internal(bool force)
{
    if (!m_DB) return SQLITE_OK;
    sqlite3_finalize(m_Statement);
    m_Statement = nullptr;
    if (!force && m_Param.type != CacheType_File) return SQLITE_OK;
    const int code = sqlite3_close(m_DB);
    m_DB = nullptr;
    return code;
}

int CacheMgr::CreateDBSchema()
{
    ZVString none;
    for (const char* table : kSchema) {
        if (const int code = ExecuteSQL(table, none)) return code;
    }
    return SQLITE_OK;
}

// A database that has its generation has had its tables: no transaction is needed to look after them.
int CacheMgr::MakeTables()
{
    unsigned int generation = 0;
    int code = ExecuteSQL(kGeneration, generation);
    if (code != SQLITE_OK) return code;
    if (generation != 0) return CreateDBSchema();
    code = Run("BEGIN IMMEDIATE");
    if (code == SQLITE_DONE) code = CreateDBSchema();
    if (code == SQLITE_OK) code = ExecuteSQL(kGeneration, generation);
    // At random: a file made anew must not seem to be the one before. Another process may have made it meanwhile.
    if (code == SQLITE_OK && generation == 0) {
        sqlite3_randomness(sizeof generation, &generation);
        code = SetGeneration(generation % kGenerations + 1);
    }
    if (code == SQLITE_OK) code = Run("COMMIT");
    if (code == SQLITE_DONE) return SQLITE_OK;
    RollBack();
    return code;
}

// ---- The shape of every operation

bool CacheMgr::Allows(CacheParam::CacheData kind, bool given) const
{
    return m_Opened && given && (m_Param.flags & kind) != 0;
}

template <class Work>
bool CacheMgr::Perform(Access access, bool allowed, Work work)
{
    if (!allowed) return false;
    return m_IsPerforming ? work() : PerformWhole(access, work);
}

bool CacheMgr::PerformWhole(Access access, const std::function<bool()>& work)
{
    if (ZVUtilities::MillisecondTime() < m_LeftAlone) return false;
    for (const bool isFirst : {true, false}) {
        m_Trouble = Trouble::None;
        m_Evicted.clear();
        m_HasDropped = false;
        if (Attempt(access, work)) {
            if (m_HasDropped) CountDrop();
            RemoveEvictedFiles();
            return true;
        }
        if (m_Trouble != Trouble::NoTables) break;
        // Somebody has removed the file, and SQLite made an empty one in its place.
        if (!isFirst || Open_Internal() != SQLITE_OK || MakeTables() != SQLITE_OK) {
            m_Trouble = Trouble::Broken;
            break;
        }
        CountDrop();
    }
    if (m_Trouble == Trouble::Broken) Replace();
    if (m_Trouble == Trouble::Locked) LeaveAlone();
    Close_Internal(false);
    return false;
}

bool CacheMgr::Attempt(Access access, const std::function<bool()>& work)
{
    struct Ending {
        CacheMgr& cache;
        ~Ending()
        {
            cache.m_IsPerforming = false;
            cache.RollBack();
            cache.Close_Internal(false);
        }
    };
    if (Open_Internal() != SQLITE_OK) return false;
    const Ending ending{*this};
    RollBack();  // one that found no memory to be rolled back
    if (access == Access::Write && Run("BEGIN IMMEDIATE") != SQLITE_DONE) return false;
    m_IsPerforming = true;
    const bool done = work() && m_Trouble == Trouble::None;
    return done && (access == Access::Read || Execute("COMMIT"));
}

// What is not committed.
void CacheMgr::RollBack()
{
    if (!m_DB || sqlite3_get_autocommit(m_DB) != 0) return;
    sqlite3_finalize(m_Statement);
    m_Statement = nullptr;
    sqlite3_exec(m_DB, "ROLLBACK", nullptr, nullptr, nullptr);
}

// The journal goes first: left alone with a new file it would be played back into it.
int CacheMgr::Replace()
{
    const char* path = m_Param.path.c_str();
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_ERROR, "CacheMgr: the cache is broken (%s) and made anew: %s\n",
                 m_TroubleText.c_str(), path);
    Close_Internal(true);
    if (m_Param.type == CacheType_File) {
        unlink((m_Param.path + "-journal").c_str());
        unlink(path);
    }
    CountDrop();
    const int code = Open_Internal();
    return code == SQLITE_OK ? MakeTables() : code;
}

void CacheMgr::LeaveAlone()
{
    if (m_Patience != kBusyWait) return;
    m_LeftAlone = ZVUtilities::MillisecondTime() + kLeftAlone;
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_ERROR,
                 "CacheMgr: the cache is locked by another process and not used for a while: %s\n",
                 m_Param.path.c_str());
}

int CacheMgr::Checked(int code)
{
    const int kind = code & 0xff;
    const bool isBroken = kind == SQLITE_CORRUPT || kind == SQLITE_NOTADB;
    if (isBroken || IsLocked(code)) {
        m_Trouble = isBroken ? Trouble::Broken : Trouble::Locked;
        m_TroubleText = m_DB ? sqlite3_errmsg(m_DB) : "";
    }
    return code;
}

bool CacheMgr::Together(const std::function<bool()>& work)
{
    return Perform(Access::Write, m_Opened, work);
}

bool CacheMgr::Look(const std::function<bool()>& work)
{
    return Perform(Access::Read, m_Opened, work);
}

// ---- Statements

int CacheMgr::Prepare(const char* sql)
{
    ZV_ASSERT(m_DB != 0);
    sqlite3_finalize(m_Statement);
    m_Statement = nullptr;
    const int code = Checked(sqlite3_prepare_v2(m_DB, sql, -1, &m_Statement, nullptr));
    if (code == SQLITE_ERROR) {
        m_Trouble = Trouble::NoTables;
        m_TroubleText = sqlite3_errmsg(m_DB);
    }
    return code;
}

int CacheMgr::Step()
{
    return Checked(sqlite3_step(m_Statement));
}

template <class... Values>
int CacheMgr::Run(const char* sql, const Values&... values)
{
    int code = Prepare(sql);
    int index = 0;
    ((code = code == SQLITE_OK ? Bind(m_Statement, ++index, values) : code), ...);
    return code == SQLITE_OK ? Step() : code;
}

int CacheMgr::ExecuteSQL(const ZVString& sql, ZVString& text)
{
    ZV_ASSERT(m_DB != 0);
    text = ZVString();
    const int code = Run(sql.c_str());
    if (code == SQLITE_ROW) text = ColumnBytes(m_Statement, 0);
    return code == SQLITE_ROW || code == SQLITE_DONE ? SQLITE_OK : code;
}

int CacheMgr::ExecuteSQL(const ZVString& sql, unsigned int& number)
{
    ZV_ASSERT(m_DB != 0);
    number = 0;
    const int code = Run(sql.c_str());
    if (code == SQLITE_ROW) number = static_cast<unsigned int>(sqlite3_column_int64(m_Statement, 0));
    return code == SQLITE_ROW || code == SQLITE_DONE ? SQLITE_OK : code;
}

bool CacheMgr::Execute(const char* sql)
{
    return Run(sql) == SQLITE_DONE;
}

// ---- Generations

unsigned int CacheMgr::Generation()
{
    unsigned int generation = 0;
    Perform(Access::Read, m_Opened, [&] { return ExecuteSQL(kGeneration, generation) == SQLITE_OK; });
    return generation;
}

int CacheMgr::SetGeneration(unsigned int generation)
{
    char sql[64];
    snprintf(sql, sizeof sql, "%s = %u", kGeneration, generation);
    ZVString none;
    return ExecuteSQL(sql, none);
}

bool CacheMgr::RaiseGeneration()
{
    m_HasDropped = true;
    unsigned int generation = 0;
    return ExecuteSQL(kGeneration, generation) == SQLITE_OK &&
           SetGeneration(generation % kGenerations + 1) == SQLITE_OK;
}

// ---- Budgets

void CacheMgr::LimitHandler(CacheParam::CacheData kind)
{
    ZV_ASSERT(m_DB != 0);
    if (kind == CacheParam::CacheData_BoxArt) {
        if (IsOver(m_BoxArtLimit, "SELECT SUM(Size) FROM BoxArt")) EvictTitles();
        return;
    }
    const bool over = kind == CacheParam::CacheData_Service ? IsOver(m_ServiceLimit, "SELECT SUM(Size) FROM Service")
                                                            : IsOver(m_UserDataLimit, "SELECT SUM(Size) FROM Userdata");
    if (!over) return;
    // Answers and user data go together: an answer that outlives the flags behind it would contradict them.
    Execute("DELETE FROM Service");
    Execute("DELETE FROM Userdata");
    m_HasDropped = true;
}

bool CacheMgr::IsOver(unsigned int limit, const char* sumOfSizes)
{
    unsigned int sum;
    return limit != 0 && ExecuteSQL(sumOfSizes, sum) == SQLITE_OK && sum > limit;
}

void CacheMgr::EvictTitles()
{
    std::vector<Image> oldest;
    int code = Run("SELECT Prefix, Dim FROM BoxArt ORDER BY TS ASC LIMIT 10");
    for (; code == SQLITE_ROW; code = Step()) {
        oldest.emplace_back(ColumnBytes(m_Statement, 0),
                            static_cast<ZV_WS_BoxArtSize>(sqlite3_column_int(m_Statement, 1)));
    }
    // Every size of those titles, not only the rows selected.
    if (Execute("DELETE FROM BoxArt WHERE Prefix in (SELECT Prefix FROM BoxArt ORDER BY TS ASC LIMIT 10)"))
        m_Evicted.insert(m_Evicted.end(), oldest.begin(), oldest.end());
}

// Rows go before their files: a file without a row is replaced by the next download, a row without a file costs a miss.
void CacheMgr::RemoveEvictedFiles()
{
    if (m_Param.type != CacheType_File) return;
    for (const auto& [prefix, dim] : m_Evicted)
        ZVFile::Remove(ZVUtilities::GetBoxArtImageFileName(m_Param.path.c_str(), prefix.c_str(), dim).c_str());
}

// ---- Answers and user data

bool CacheMgr::ReadValue(CacheParam::CacheData kind, const char* sql, const ZVString& name, const ZVString& key,
                         ZVString& value)
{
    return Perform(Access::Read, Allows(kind, !name.empty()), [&] {
        if (Run(sql, name, key) != SQLITE_ROW) return false;
        value = ColumnBytes(m_Statement, 0);
        return true;
    });
}

bool CacheMgr::WriteValue(CacheParam::CacheData kind, const char* sql, const ZVString& name, const ZVString& key,
                          const ZVString& value)
{
    return Perform(Access::Write, Allows(kind, !name.empty() && !value.empty()), [&] {
        LimitHandler(kind);
        return Run(sql, name, key, value, static_cast<sqlite3_int64>(value.length())) == SQLITE_DONE;
    });
}

bool CacheMgr::ReadMetaData(const ZVString& name, const ZVString& key, ZVString& value)
{
    return ReadValue(CacheParam::CacheData_Service, "SELECT Value FROM Service WHERE Name = ? AND Key = ?", name, key,
                     value);
}

bool CacheMgr::WriteMetaData(const ZVString& name, const ZVString& key, const ZVString& value)
{
    return WriteValue(CacheParam::CacheData_Service,
                      "INSERT OR REPLACE INTO Service(Name, Key, Value, Size) VALUES (?, ?, ?, ?)", name, key, value);
}

bool CacheMgr::ReadUserData(const ZVString& name, const ZVString& key, ZVString& value)
{
    return ReadValue(CacheParam::CacheData_UserData, "SELECT Value FROM Userdata WHERE Name = ? AND Key = ?", name, key,
                     value);
}

bool CacheMgr::WriteUserData(const ZVString& name, const ZVString& key, const ZVString& value)
{
    return WriteValue(CacheParam::CacheData_UserData,
                      "INSERT OR REPLACE INTO Userdata(Name, Key, Value, Size) VALUES (?, ?, ?, ?)", name, key, value);
}

bool CacheMgr::UpdateLastCacheLoadTime(const ZVString& time)
{
    return Perform(Access::Write, Allows(CacheParam::CacheData_Service, !time.empty()), [&] {
        ZVString stored;
        if (ExecuteSQL("SELECT LastLoadTime FROM Cache WHERE ID = 1", stored) != SQLITE_OK) return false;
        if (stored == time) return true;
        return Run("INSERT OR REPLACE INTO Cache(ID, LastLoadTime) VALUES(1, ?)", time) == SQLITE_DONE &&
               Execute("DELETE FROM Service") && RaiseGeneration();
    });
}

bool CacheMgr::PurgeUserData(const ZVString& name)
{
    return Perform(Access::Write, Allows(CacheParam::CacheData_UserData), [&] {
        bool purged = name.empty() ? Execute("DELETE FROM Userdata")
                                   : Run("DELETE FROM Userdata WHERE Name = ?", name) == SQLITE_DONE;
        if (Allows(CacheParam::CacheData_Service, name.empty() || name == kWishlistFlag)) {
            for (const char* statement : kPurgeWishlistAnswers)
                purged = purged && Execute(statement);
        }
        return purged && RaiseGeneration();
    });
}

// ---- Box art

bool CacheMgr::InsertImage(const ZV_BoxArtRow& row, const ZVString& data)
{
    LimitHandler(CacheParam::CacheData_BoxArt);
    m_HasEvicted = m_HasEvicted || !m_Evicted.empty();
    // Its file is the one just written, not the one that was evicted.
    m_Evicted.erase(std::remove(m_Evicted.begin(), m_Evicted.end(), Image(row.prefix, row.dim)), m_Evicted.end());
    return Run("INSERT OR REPLACE INTO BoxArt(Prefix, Dim, Size, LastModified, NeedUpdate, Data) "
               "VALUES (?, ?, ?, ?, ?, ?)",
               row.prefix, row.dim, row.size, row.lastModified, row.needUpdate, Blob{data}) == SQLITE_DONE;
}

bool CacheMgr::WriteBoxArt(const ZVString& prefix, ZV_WS_BoxArtSize dim, unsigned int size,
                           const ZVString& lastModified, unsigned int needUpdate, const ZVString& data)
{
    return Perform(Access::Write, Allows(CacheParam::CacheData_BoxArt, !prefix.empty()), [&] {
        return InsertImage({prefix, dim, size, lastModified, needUpdate}, data);
    });
}

bool CacheMgr::WriteBoxArts(const std::vector<ZV_BoxArtRow>& rows, bool& evicted)
{
    m_HasEvicted = false;
    const bool written = Perform(Access::Write, Allows(CacheParam::CacheData_BoxArt), [&] {
        return std::all_of(rows.begin(), rows.end(),
                           [&](const ZV_BoxArtRow& row) { return InsertImage(row, ZVString()); });
    });
    evicted = written && m_HasEvicted;
    return written;
}

bool CacheMgr::ReadBoxArt(const ZVString& prefix, ZV_WS_BoxArtSize dim, unsigned int& size, ZVString& lastModified,
                          unsigned int& needUpdate, ZVString& data)
{
    size = needUpdate = 0;
    lastModified = data = ZVString();
    return Perform(Access::Read, Allows(CacheParam::CacheData_BoxArt, !prefix.empty()), [&] {
        const int code =
            Run("SELECT Size, LastModified, NeedUpdate, Data FROM BoxArt WHERE Prefix = ? AND Dim = ?", prefix, dim);
        if (code != SQLITE_ROW) return false;
        size = static_cast<unsigned int>(sqlite3_column_int64(m_Statement, 0));
        lastModified = ColumnBytes(m_Statement, 1);
        needUpdate = static_cast<unsigned int>(sqlite3_column_int64(m_Statement, 2));
        data = ColumnBytes(m_Statement, 3);
        return true;
    });
}

bool CacheMgr::SetBoxArtNeedUpdate()
{
    return Perform(Access::Write, Allows(CacheParam::CacheData_BoxArt),
                   [&] { return Execute("UPDATE BoxArt SET NeedUpdate = 1"); });
}

bool CacheMgr::ListImageFiles(const ZVString& path, std::set<std::string>& names)
{
    CacheMgr other;
    other.m_Param.type = CacheType_File;
    int code = sqlite3_open_v2(path.c_str(), &other.m_DB, SQLITE_OPEN_READWRITE, nullptr);
    if (code == SQLITE_OK) code = other.Run("SELECT Prefix, Dim FROM BoxArt");
    for (; code == SQLITE_ROW; code = other.Step()) {
        const auto dim = static_cast<ZV_WS_BoxArtSize>(sqlite3_column_int(other.m_Statement, 1));
        const ZVString prefix = ColumnBytes(other.m_Statement, 0);
        names.insert(ZVFile::GetFileName(ZVUtilities::GetBoxArtImageFileName(path.c_str(), prefix.c_str(), dim).c_str())
                         .c_str());
    }
    return code == SQLITE_DONE || other.m_Trouble == Trouble::Broken || other.m_Trouble == Trouble::NoTables;
}

// ---- Wish-list flags

bool CacheMgr::ReadWishlistFlag(int titleId, bool& flag)
{
    flag = false;
    ZVString value;
    const bool found = ReadUserData(kWishlistFlag, WishlistKey(titleId), value);
    if (found && !value.empty()) flag = value[0] == '1';
    return found;
}

bool CacheMgr::WriteWishlistFlag(int titleId, bool flag)
{
    return WriteUserData(kWishlistFlag, WishlistKey(titleId), flag ? "1" : "0");
}

bool CacheMgr::WriteWishlistFlags(const ZVWS_IntVector& titleIds, const ZVWS_BoolVector& flags)
{
    const bool given = !titleIds.empty() && titleIds.size() == flags.size();
    return Perform(Access::Write, Allows(CacheParam::CacheData_UserData, given), [&] {
        if (Prepare("INSERT OR REPLACE INTO Userdata(Name, Key, Value, Size) VALUES ('WishlistFlag', ?, ?, 1)") !=
            SQLITE_OK) {
            return false;
        }
        for (size_t i = titleIds.size(); i-- > 0;) {
            const ZVString key = WishlistKey(titleIds[i]), value = flags[i] ? "1" : "0";
            const bool written = Bind(m_Statement, 1, key) == SQLITE_OK && Bind(m_Statement, 2, value) == SQLITE_OK &&
                                 Step() == SQLITE_DONE;
            sqlite3_reset(m_Statement);
            if (!written) return false;
        }
        return true;
    });
}

bool CacheMgr::RemoveWishlistFlag(int titleId)
{
    return Perform(Access::Write, Allows(CacheParam::CacheData_UserData), [&] {
        return Run("DELETE FROM Userdata WHERE Name = 'WishlistFlag' AND Key = ?", WishlistKey(titleId)) == SQLITE_DONE;
    });
}

bool CacheMgr::RemoveAllWishlistFlags()
{
    return PurgeUserData(kWishlistFlag);
}
