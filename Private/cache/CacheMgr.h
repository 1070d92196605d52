// The cache in an SQLite database: in memory from Open to Close, or in a file that every operation opens and closes, so
// that sessions and processes can share it. The file and its journal are the owner's alone to read.
//
// Every operation has the same shape (Perform): open, begin when it writes, work, commit or roll back, close, and then
// what the database's results meant beyond that (Checked): tables that are missing are made and the operation is made
// again, a broken file is replaced, a locked one is left alone for a while.
#pragma once

#include <set>
#include <string>
#include <utility>

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

    bool Together(const std::function<bool()>& work) override;
    bool Look(const std::function<bool()>& work) override;
    unsigned int Generation() override;
    bool WriteBoxArts(const std::vector<ZV_BoxArtRow>& rows, bool& evicted) override;
    void SetPatience(int milliseconds) override { m_Patience = milliseconds; }

    /// Counts something that was dropped past this class: removed files.
    static void CountDrop();

    /// Whether Open's result says that another process keeps the file locked: no reason to replace it.
    static bool IsLocked(int code);

    /// Adds the names of the files of all images that the database at `path` has rows for. False when that cannot be
    /// told now; a file that is no database has none. Never waits, and changes nothing.
    static bool ListImageFiles(const ZVString& path, std::set<std::string>& names);

private:
    using Image = std::pair<ZVString, ZV_WS_BoxArtSize>;
    enum class Access { Read, Write };

    /// What a result of the database meant beyond the operation's failure.
    enum class Trouble { None, NoTables, Broken, Locked };

    /// Whether an operation on that kind of data may go to the database at all. `given`: its required texts are there.
    bool Allows(ZV_WS_CacheParam::CacheData kind, bool given = true) const;
    /// A whole operation; `work`'s result, or false when `allowed` is false or the database fails. Within another one
    /// it is a part of that.
    template <class Work>
    bool Perform(Access access, bool allowed, Work work);
    bool PerformWhole(Access access, const std::function<bool()>& work);
    /// The same once, without what comes after it.
    bool Attempt(Access access, const std::function<bool()>& work);
    void RollBack();
    /// Makes the file anew after saying why. SQLite's code.
    int Replace();
    /// Does nothing with a locked file for a while, after saying so.
    void LeaveAlone();

    /// Every result of the database passes here.
    int Checked(int code);

    void SplitBudget();
    int Open_Internal();
    /// Ends the statement; closes the connection of a file, and any connection when forced.
    int Close_Internal(bool force);
    /// Makes the tables that are missing. SQLite's code.
    int CreateDBSchema();
    /// The same and the first generation, as one.
    int MakeTables();

    /// Ends the statement before and prepares another.
    int Prepare(const char* sql);
    /// Prepares a statement, binds the values in their order and makes the first step; SQLite's code. Columns are read
    /// from m_Statement until the next statement or the end of the operation. The values must outlive the last step.
    template <class... Values>
    int Run(const char* sql, const Values&... values);
    int Step();
    /// The first column of the first row; empty or 0 without a row. 0, else SQLite's code.
    int ExecuteSQL(const ZVString& sql, ZVString& text);
    int ExecuteSQL(const ZVString& sql, unsigned int& number);
    bool Execute(const char* sql);
    /// Answers of before count no more.
    bool RaiseGeneration();
    int SetGeneration(unsigned int generation);

    /// Makes room when what is stored of that kind is over its budget.
    void LimitHandler(ZV_WS_CacheParam::CacheData kind);
    void EvictTitles();
    /// Removes the files of evicted rows, once they are gone for good.
    void RemoveEvictedFiles();
    bool IsOver(unsigned int limit, const char* sumOfSizes);

    bool ReadValue(ZV_WS_CacheParam::CacheData kind, const char* sql, const ZVString& name, const ZVString& key,
                   ZVString& value);
    bool WriteValue(ZV_WS_CacheParam::CacheData kind, const char* sql, const ZVString& name, const ZVString& key,
                    const ZVString& value);
    bool InsertImage(const ZV_BoxArtRow& row, const ZVString& data);

    ZV_WS_CacheParam2 m_Param;
    bool m_Opened = false;
    sqlite3* m_DB = nullptr;
    sqlite3_stmt* m_Statement = nullptr;
    unsigned int m_ServiceLimit = 0;  // bytes, like the others; 0 is no limit
    unsigned int m_BoxArtLimit = 0;
    unsigned int m_UserDataLimit = 0;

    int m_Patience = 0;        // milliseconds
    uint64_t m_LeftAlone = 0;  // until then, by ZVUtilities::MillisecondTime
    bool m_IsPerforming = false;
    Trouble m_Trouble = Trouble::None;  // of the operation under way
    std::string m_TroubleText;          // SQLite's own
    std::vector<Image> m_Evicted;       // in the operation under way, and not written again
    bool m_HasEvicted = false;
    bool m_HasDropped = false;
};
