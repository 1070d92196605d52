// What is on its way into the database of a file cache: answers, and rows of images whose files are in their places
// already. Flash is slow to write and wears out, so they are written together: some at once, after at most two seconds,
// on a thread that lives as long as something waits; or with a change that is written anyway. A power cut costs what
// waits.
//
// All sessions of the process on one database share them, so that what one has fetched is there for all. Any thread.
#pragma once

#include <memory>
#include <vector>

#include "Account.h"
#include "CacheMgr.h"
#include "ImageFile.h"
#include "ZVMutex.h"

class ZVThread;

class CacheWriter {
    struct Waiting;

public:
    /// What must still hold when an answer is kept: nothing was dropped since before its request was sent.
    struct Stamp {
        std::shared_ptr<Account> account;
        uint64_t generation = 0;  ///< The account's, which concerns the customer's data alone.
        unsigned int stored = 0;  ///< The cache's; 0 is none.

        /// `storedNow`: the cache's generation now.
        bool Holds(ZV_WS_CacheParam::CacheData kind, unsigned int storedNow) const;
    };

    struct Answer {
        ZV_WS_CacheParam::CacheData kind = {};
        ZVString table, key, text;
        Stamp stamp;

        bool Write(CacheInterface& cache) const;
    };

    /// The writer for that cache. Ends, after it has written everything, with the last session that has it.
    static std::shared_ptr<CacheWriter> Of(const ZV_WS_CacheParam2& param);

    explicit CacheWriter(const ZV_WS_CacheParam2& param);
    ~CacheWriter();
    CacheWriter(const CacheWriter&) = delete;
    CacheWriter& operator=(const CacheWriter&) = delete;

    /// Each in place of what waited for the same answer or image.
    void Add(const Answer& answer) ZV_EXCLUDES(m_Mutex);
    void Add(const ZV_BoxArtRow& row, std::unique_ptr<ImageFile> file) ZV_EXCLUDES(m_Mutex);

    bool Find(ZV_WS_CacheParam::CacheData kind, const char* table, const ZVString& key, Answer& answer) const
        ZV_EXCLUDES(m_Mutex);
    bool Find(const ZVString& prefix, ZV_WS_BoxArtSize dim, ZV_BoxArtRow& row) const ZV_EXCLUDES(m_Mutex);

    /// Writes what waits, on the calling thread.
    void Flush() ZV_EXCLUDES(m_Mutex, m_CacheMutex);

    /// Takes what waits, to be written with a change. What is not settled waits again after the batch's end.
    class Batch {
    public:
        /// Null writers have none.
        explicit Batch(CacheWriter* writer);
        ~Batch();
        Batch(const Batch&) = delete;
        Batch& operator=(const Batch&) = delete;

        bool empty() const { return m_Taken.empty(); }
        /// Within one transaction; may be done again. Answers that have become stale are left out.
        bool Write(CacheInterface& cache);
        /// It was written, or never can be.
        void Settle();

    private:
        CacheWriter* m_Writer;
        std::vector<std::shared_ptr<Waiting>> m_Taken;
        bool m_HasEvicted = false;
    };

    /// How long something waits, in milliseconds. Tests let it wait for ever.
    static void SetPatience(uint64_t milliseconds);

private:
    template <class IsSame>
    void Add(std::shared_ptr<Waiting> added, IsSame isSame) ZV_EXCLUDES(m_Mutex);
    bool EnsureThread() ZV_REQUIRES(m_Mutex);
    void WriteWhenDue() ZV_EXCLUDES(m_Mutex, m_CacheMutex);
    size_t BytesWaiting() const ZV_REQUIRES(m_Mutex);
    /// Whether there is enough to write that is not in a batch already.
    bool IsDue() const ZV_REQUIRES(m_Mutex);

    mutable ZVMutex m_Mutex;
    ZVCondition m_Changed;
    std::vector<std::shared_ptr<Waiting>> m_Waiting ZV_GUARDED_BY(m_Mutex);
    ZVThread* m_Thread ZV_GUARDED_BY(m_Mutex) = nullptr;
    bool m_IsRunning ZV_GUARDED_BY(m_Mutex) = false;
    bool m_Ends ZV_GUARDED_BY(m_Mutex) = false;

    ZVMutex m_CacheMutex;  // taken before m_Mutex
    CacheMgr m_Cache ZV_GUARDED_BY(m_CacheMutex);
    const ZVString m_Path;
    const size_t m_MostBytes;  // that wait
};
