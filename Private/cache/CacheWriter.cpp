#include "CacheWriter.h"

#include <algorithm>
#include <atomic>
#include <chrono>
#include <map>
#include <string>
#include <utility>

#include "CacheSweep.h"
#include "CallGuard.h"
#include "ZVThread.h"
#include "ZVUtilities.h"

namespace {

constexpr long kMostWaiting = 32;
constexpr unsigned int kMostBytes = 256 * 1024;
constexpr int kLastPatience = 200;  // milliseconds, for another process at the end

std::atomic<uint64_t> s_Patience{2000};  // milliseconds

struct Registry {
    ZVMutex mutex;
    std::map<std::string, std::weak_ptr<CacheWriter>> all ZV_GUARDED_BY(mutex);
};

Registry& TheRegistry()
{
    static auto* registry = new Registry;  // outlives threads that still end a session at exit
    return *registry;
}

}  // namespace

/// An answer or an image.
struct CacheWriter::Waiting {
    Answer answer;
    ZV_BoxArtRow row;                 // of an image when it has a prefix
    std::unique_ptr<ImageFile> file;  // keeps it locked; null when the file was there before
    uint64_t since = ZVUtilities::MillisecondTime();
    bool isTaken = false;  // in a batch

    bool IsImage() const { return !row.prefix.empty(); }
};

bool CacheWriter::Stamp::Holds(ZV_WS_CacheParam::CacheData kind, unsigned int storedNow) const
{
    if (stored == 0 || stored != storedNow) return false;
    return kind != ZV_WS_CacheParam::CacheData_Userdata || account->Generation() == generation;
}

bool CacheWriter::Answer::Write(CacheInterface& cache) const
{
    return kind == ZV_WS_CacheParam::CacheData_Userdata ? cache.WriteUserData(table, key, text)
                                                        : cache.WriteMetaData(table, key, text);
}

std::shared_ptr<CacheWriter> CacheWriter::Of(const ZV_WS_CacheParam2& param)
{
    Registry& registry = TheRegistry();
    ZVMutexLock lock(registry.mutex);
    std::weak_ptr<CacheWriter>& known = registry.all[param.path.c_str()];
    std::shared_ptr<CacheWriter> writer = known.lock();
    if (!writer) known = writer = std::make_shared<CacheWriter>(param);
    return writer;
}

// What waits counts in no budget yet: a small one is not to be left behind by far.
CacheWriter::CacheWriter(const ZV_WS_CacheParam2& param)
    : m_Path(param.path), m_MostBytes(param.size == 0 ? kMostBytes : std::min(kMostBytes, param.size / 20))
{
    ZVMutexLock lock(m_CacheMutex);
    m_Cache.Open(param);  // what cannot be opened refuses everything
}

CacheWriter::~CacheWriter()
{
    ZVThread* thread = nullptr;
    {
        ZVMutexLock lock(m_Mutex);
        m_Ends = true;
        m_Changed.NotifyAll();
        std::swap(thread, m_Thread);
    }
    ZVThread::SafeDestroyThread(thread);
    {
        ZVMutexLock lock(m_CacheMutex);
        m_Cache.SetPatience(kLastPatience);
    }
    Flush();
}

void CacheWriter::SetPatience(uint64_t milliseconds)
{
    s_Patience = milliseconds;
}

// ---- What waits

template <class IsSame>
void CacheWriter::Add(std::shared_ptr<Waiting> added, IsSame isSame)
{
    bool isTooMuch = false;
    {
        ZVMutexLock lock(m_Mutex);
        const auto same =
            std::find_if(m_Waiting.begin(), m_Waiting.end(), [&](const auto& waiting) { return isSame(*waiting); });
        if (same != m_Waiting.end()) {
            same->swap(added);
        } else {
            m_Waiting.push_back(std::move(added));
        }
        if (IsDue()) m_Changed.NotifyAll();
        isTooMuch = !EnsureThread() || BytesWaiting() > 2 * m_MostBytes;
    }
    if (isTooMuch) Flush();  // the thread cannot follow, or there is none
}

void CacheWriter::Add(const Answer& answer)
{
    auto added = std::make_shared<Waiting>();
    added->answer = answer;
    Add(std::move(added), [&](const Waiting& other) {
        return !other.IsImage() && other.answer.key == answer.key && other.answer.table == answer.table &&
               other.answer.kind == answer.kind;
    });
}

void CacheWriter::Add(const ZV_BoxArtRow& row, std::unique_ptr<ImageFile> file)
{
    auto added = std::make_shared<Waiting>();
    added->row = row;
    added->file = std::move(file);
    Add(std::move(added),
        [&](const Waiting& other) { return other.row.prefix == row.prefix && other.row.dim == row.dim; });
}

bool CacheWriter::Find(ZV_WS_CacheParam::CacheData kind, const char* table, const ZVString& key, Answer& answer) const
{
    ZVMutexLock lock(m_Mutex);
    for (const auto& waiting : m_Waiting) {
        const Answer& other = waiting->answer;
        if (waiting->IsImage() || other.kind != kind || other.key != key || other.table != table) continue;
        answer = other;
        return true;
    }
    return false;
}

bool CacheWriter::Find(const ZVString& prefix, ZV_WS_BoxArtSize dim, ZV_BoxArtRow& row) const
{
    ZVMutexLock lock(m_Mutex);
    for (const auto& waiting : m_Waiting) {
        if (waiting->row.dim != dim || waiting->row.prefix != prefix) continue;
        row = waiting->row;
        return true;
    }
    return false;
}

// ---- Batches

CacheWriter::Batch::Batch(CacheWriter* writer) : m_Writer(writer)
{
    if (!writer) return;
    ZVMutexLock lock(writer->m_Mutex);
    for (const auto& waiting : writer->m_Waiting) {
        if (!waiting->isTaken) m_Taken.push_back(waiting);
    }
    for (const auto& waiting : m_Taken)  // nothing is thrown from here on
        waiting->isTaken = true;
}

CacheWriter::Batch::~Batch()
{
    if (m_Taken.empty()) return;
    ZVMutexLock lock(m_Writer->m_Mutex);
    for (const auto& waiting : m_Taken)
        waiting->isTaken = false;
}

bool CacheWriter::Batch::Write(CacheInterface& cache)
{
    if (m_Taken.empty()) return true;
    const unsigned int generation = cache.Generation();
    std::vector<ZV_BoxArtRow> images;
    for (const auto& waiting : m_Taken) {
        if (!waiting->IsImage()) {
            const Answer& answer = waiting->answer;
            if (answer.stamp.Holds(answer.kind, generation) && !answer.Write(cache)) return false;
        } else if (!waiting->file || waiting->file->IsInPlace()) {
            images.push_back(waiting->row);  // a file that was removed since is nothing to have a row for
        }
    }
    return images.empty() || cache.WriteBoxArts(images, m_HasEvicted);
}

void CacheWriter::Batch::Settle()
{
    if (m_Taken.empty()) return;
    {
        ZVMutexLock lock(m_Writer->m_Mutex);
        auto& all = m_Writer->m_Waiting;
        all.erase(std::remove_if(all.begin(), all.end(),
                                 [&](const auto& waiting) {
                                     return std::find(m_Taken.begin(), m_Taken.end(), waiting) != m_Taken.end();
                                 }),
                  all.end());
    }
    if (m_HasEvicted) CacheSweep(m_Writer->m_Path).AfterEviction();
}

static void WriteAlone(CacheWriter::Batch& batch, CacheInterface& cache)
{
    cache.Together([&] { return batch.Write(cache); });
}

void CacheWriter::Flush()
{
    WithinMemory([&] {
        ZVMutexLock lock(m_CacheMutex);
        Batch batch(this);
        if (batch.empty()) return;
        WriteAlone(batch, m_Cache);
        batch.Settle();  // also what could not be written: the database will not want it later either
    });
}

// ---- The thread

size_t CacheWriter::BytesWaiting() const
{
    size_t bytes = 0;
    for (const auto& waiting : m_Waiting)
        bytes += waiting->isTaken ? 0 : waiting->answer.text.length() + waiting->row.size;
    return bytes;
}

bool CacheWriter::IsDue() const
{
    const auto isFree = [](const auto& waiting) { return !waiting->isTaken; };
    return m_Ends || BytesWaiting() >= m_MostBytes ||
           std::count_if(m_Waiting.begin(), m_Waiting.end(), isFree) >= kMostWaiting;
}

bool CacheWriter::EnsureThread()
{
    if (m_IsRunning) return true;
    ZVThread::SafeDestroyThread(std::exchange(m_Thread, nullptr));  // it has ended
    const auto run = [](void* self) { static_cast<CacheWriter*>(self)->WriteWhenDue(); };
    ZVThread* thread = nullptr;
    bool isRunning = false;
    WithinMemory([&] {
        thread = ZVThread::CreateThread();
        isRunning = thread->Run("cache writer", run, this);
    });
    m_Thread = thread;
    return m_IsRunning = isRunning;
}

void CacheWriter::WriteWhenDue()
{
    for (;;) {
        {
            ZVMutexLock lock(m_Mutex);
            if (m_Ends || m_Waiting.empty()) {
                m_IsRunning = false;
                return;
            }
            const auto due = std::chrono::steady_clock::now() + std::chrono::milliseconds(s_Patience.load());
            while (!IsDue() && m_Changed.WaitUntil(m_Mutex, due)) {
            }
        }
        Flush();
    }
}
