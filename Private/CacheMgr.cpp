#include "CacheMgr.h"

#include <sqlite3.h>
#include <stdio.h>

#include <atomic>

#include "BoxArtNames.h"
#include "ZVFile.h"

typedef ZV_WS_CacheParam CacheParam;

namespace {

constexpr int kBusyWait = 10000;  // milliseconds

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

CacheMgr::~CacheMgr()
{
    CacheMgr::Close();
}

// ---- Opening and closing

int CacheMgr::Open(const ZV_WS_CacheParam2& param)
{
    Close();
    m_Param = param;
    SplitBudget();
    int code = Open_Internal();
    if (code == SQLITE_OK && m_Param.type != CacheType_None) {
        code = CreateDBSchema();
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
    int code = m_Param.type == CacheType_Memory
                   ? sqlite3_open_v2(":memory:", &m_DB, SQLITE_OPEN_READWRITE, nullptr)
                   : sqlite3_open_v2(m_Param.path.c_str(), &m_DB, SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE, nullptr);
    if (code == SQLITE_OK) code = sqlite3_busy_timeout(m_DB, kBusyWait);
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

// ---- The shape of every operation

bool CacheMgr::Allows(CacheParam::CacheData kind, bool given) const
{
    return m_Opened && given && (m_Param.flags & kind) != 0;
}

template <class Work>
bool CacheMgr::Perform(bool allowed, Work work)
{
    struct Closing {
        CacheMgr& cache;
        ~Closing() { cache.Close_Internal(false); }
    };
    if (!allowed || Open_Internal() != SQLITE_OK) return false;
    const Closing closing{*this};
    return work();
}

int CacheMgr::Prepare(const char* sql)
{
    ZV_ASSERT(m_DB != 0);
    sqlite3_finalize(m_Statement);
    m_Statement = nullptr;
    return sqlite3_prepare_v2(m_DB, sql, -1, &m_Statement, nullptr);
}

template <class... Values>
int CacheMgr::Run(const char* sql, const Values&... values)
{
    int code = Prepare(sql);
    int index = 0;
    ((code = code == SQLITE_OK ? Bind(m_Statement, ++index, values) : code), ...);
    return code == SQLITE_OK ? sqlite3_step(m_Statement) : code;
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
    CountDrop();
}

bool CacheMgr::IsOver(unsigned int limit, const char* sumOfSizes)
{
    unsigned int sum;
    return limit != 0 && ExecuteSQL(sumOfSizes, sum) == SQLITE_OK && sum > limit;
}

// Rows go before their files: a file without a row is replaced by the next download, a row without a file costs a miss.
void CacheMgr::EvictTitles()
{
    std::vector<ZVString> files;
    int code = Run("SELECT Prefix, Dim FROM BoxArt ORDER BY TS ASC LIMIT 10");
    for (; code == SQLITE_ROW; code = sqlite3_step(m_Statement)) {
        const auto dim = static_cast<ZV_WS_BoxArtSize>(sqlite3_column_int(m_Statement, 1));
        files.push_back(
            ZVUtilities::GetBoxArtImageFileName(m_Param.path.c_str(), ColumnBytes(m_Statement, 0).c_str(), dim));
    }
    // Every size of those titles, not only the rows selected.
    const bool deleted =
        Execute("DELETE FROM BoxArt WHERE Prefix in (SELECT Prefix FROM BoxArt ORDER BY TS ASC LIMIT 10)");
    if (!deleted || m_Param.type != CacheType_File) return;
    for (const ZVString& file : files)
        ZVFile::Remove(file.c_str());
}

// ---- Answers and user data

bool CacheMgr::ReadValue(CacheParam::CacheData kind, const char* sql, const ZVString& name, const ZVString& key,
                         ZVString& value)
{
    return Perform(Allows(kind, !name.empty()), [&] {
        if (Run(sql, name, key) != SQLITE_ROW) return false;
        value = ColumnBytes(m_Statement, 0);
        return true;
    });
}

bool CacheMgr::WriteValue(CacheParam::CacheData kind, const char* sql, const ZVString& name, const ZVString& key,
                          const ZVString& value)
{
    return Perform(Allows(kind, !name.empty() && !value.empty()), [&] {
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
    return Perform(Allows(CacheParam::CacheData_Service, !time.empty()), [&] {
        ZVString stored;
        if (ExecuteSQL("SELECT LastLoadTime FROM Cache WHERE ID = 1", stored) != SQLITE_OK) return false;
        if (stored == time) return true;
        CountDrop();
        return Run("INSERT OR REPLACE INTO Cache(ID, LastLoadTime) VALUES(1, ?)", time) == SQLITE_DONE &&
               Execute("DELETE FROM Service");
    });
}

bool CacheMgr::PurgeUserData(const ZVString& name)
{
    return Perform(Allows(CacheParam::CacheData_UserData), [&] {
        CountDrop();
        const bool purged = name.empty() ? Execute("DELETE FROM Userdata")
                                         : Run("DELETE FROM Userdata WHERE Name = ?", name) == SQLITE_DONE;
        if (Allows(CacheParam::CacheData_Service, name.empty() || name == kWishlistFlag)) {
            for (const char* statement : kPurgeWishlistAnswers)
                Execute(statement);
        }
        return purged;
    });
}

// ---- Box art

bool CacheMgr::WriteBoxArt(const ZVString& prefix, ZV_WS_BoxArtSize dim, unsigned int size,
                           const ZVString& lastModified, unsigned int needUpdate, const ZVString& data)
{
    return Perform(Allows(CacheParam::CacheData_BoxArt, !prefix.empty()), [&] {
        LimitHandler(CacheParam::CacheData_BoxArt);
        return Run("INSERT OR REPLACE INTO BoxArt(Prefix, Dim, Size, LastModified, NeedUpdate, Data) "
                   "VALUES (?, ?, ?, ?, ?, ?)",
                   prefix, dim, size, lastModified, needUpdate, Blob{data}) == SQLITE_DONE;
    });
}

bool CacheMgr::ReadBoxArt(const ZVString& prefix, ZV_WS_BoxArtSize dim, unsigned int& size, ZVString& lastModified,
                          unsigned int& needUpdate, ZVString& data)
{
    size = needUpdate = 0;
    lastModified = data = ZVString();
    return Perform(Allows(CacheParam::CacheData_BoxArt, !prefix.empty()), [&] {
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
    return Perform(Allows(CacheParam::CacheData_BoxArt), [&] { return Execute("UPDATE BoxArt SET NeedUpdate = 1"); });
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
    return Perform(Allows(CacheParam::CacheData_UserData, given), [&] {
        if (Prepare("INSERT OR REPLACE INTO Userdata(Name, Key, Value, Size) VALUES ('WishlistFlag', ?, ?, 1)") !=
            SQLITE_OK) {
            return false;
        }
        for (size_t i = titleIds.size(); i-- > 0;) {
            const ZVString key = WishlistKey(titleIds[i]), value = flags[i] ? "1" : "0";
            const bool written = Bind(m_Statement, 1, key) == SQLITE_OK && Bind(m_Statement, 2, value) == SQLITE_OK &&
                                 sqlite3_step(m_Statement) == SQLITE_DONE;
            sqlite3_reset(m_Statement);
            if (!written) return false;
        }
        return true;
    });
}

bool CacheMgr::RemoveWishlistFlag(int titleId)
{
    return Perform(Allows(CacheParam::CacheData_UserData), [&] {
        return Run("DELETE FROM Userdata WHERE Name = 'WishlistFlag' AND Key = ?", WishlistKey(titleId)) == SQLITE_DONE;
    });
}

bool CacheMgr::RemoveAllWishlistFlags()
{
    return PurgeUserData(kWishlistFlag);
}
