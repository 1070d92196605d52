// The cache in an SQLite database: in memory from Open to Close, or in a file that every operation opens and closes, so
// that sessions and processes can share it.
#pragma once

#include "CacheInterface.h"

struct sqlite3;
struct sqlite3_stmt;

class CacheMgr : public CacheInterface {
public:
    CacheMgr() = default;
    ~CacheMgr() override;
    CacheMgr(const CacheMgr&) = delete;
    CacheMgr& operator=(const CacheMgr&) = delete;

    int Open(const ZV_WS_CacheParam2& param) override;
    int Close() override;

    bool ReadMetaData(const ZVString& name, const ZVString& key, ZVString& value) override;
    bool WriteMetaData(const ZVString& name, const ZVString& key, const ZVString& value) override;
    bool UpdateLastCacheLoadTime(const ZVString& time) override;

    bool WriteBoxArt(const ZVString& prefix, ZV_WS_BoxArtSize dim, unsigned int size, const ZVString& lastModified,
                     unsigned int needUpdate, const ZVString& data) override;
    bool ReadBoxArt(const ZVString& prefix, ZV_WS_BoxArtSize dim, unsigned int& size, ZVString& lastModified,
                    unsigned int& needUpdate, ZVString& data) override;
    bool SetBoxArtNeedUpdate() override;

    bool ReadUserData(const ZVString& name, const ZVString& key, ZVString& value) override;
    bool WriteUserData(const ZVString& name, const ZVString& key, const ZVString& value) override;
    bool PurgeUserData(const ZVString& name) override;

    bool ReadWishlistFlag(int titleId, bool& flag) override;
    bool WriteWishlistFlag(int titleId, bool flag) override;
    bool WriteWishlistFlags(const ZVWS_IntVector& titleIds, const ZVWS_BoolVector& flags) override;
    bool RemoveWishlistFlag(int titleId) override;
    bool RemoveAllWishlistFlags() override;

    /// Counts something that was dropped past this class: removed files.
    static void CountDrop();

private:
    /// Whether an operation on that kind of data may go to the database at all. `given`: its required texts are there.
    bool Allows(ZV_WS_CacheParam::CacheData kind, bool given = true) const;
    /// Runs `work` on the open database and closes as an operation does; its result, or false when `allowed` is false
    /// or the database does not open.
    template <class Work>
    bool Perform(bool allowed, Work work);

    void SplitBudget();
    int Open_Internal();
    /// Ends the statement; closes the connection of a file, and any connection when forced.
    int Close_Internal(bool force);
    int CreateDBSchema();

    /// Ends the statement before and prepares another.
    int Prepare(const char* sql);
    /// Prepares a statement, binds the values in their order and makes the first step; SQLite's code. Columns are read
    /// from m_Statement until the next statement or the end of the operation. The values must outlive the last step.
    template <class... Values>
    int Run(const char* sql, const Values&... values);
    /// The first column of the first row; empty or 0 without a row. 0, else SQLite's code.
    int ExecuteSQL(const ZVString& sql, ZVString& text);
    int ExecuteSQL(const ZVString& sql, unsigned int& number);
    bool Execute(const char* sql);

    /// Makes room when what is stored of that kind is over its budget.
    void LimitHandler(ZV_WS_CacheParam::CacheData kind);
    void EvictTitles();
    bool IsOver(unsigned int limit, const char* sumOfSizes);

    bool ReadValue(ZV_WS_CacheParam::CacheData kind, const char* sql, const ZVString& name, const ZVString& key,
                   ZVString& value);
    bool WriteValue(ZV_WS_CacheParam::CacheData kind, const char* sql, const ZVString& name, const ZVString& key,
                    const ZVString& value);

    ZV_WS_CacheParam2 m_Param;
    bool m_Opened = false;
    sqlite3* m_DB = nullptr;
    sqlite3_stmt* m_Statement = nullptr;
    unsigned int m_ServiceLimit = 0;  // bytes, like the others; 0 is no limit
    unsigned int m_BoxArtLimit = 0;
    unsigned int m_UserDataLimit = 0;
};
