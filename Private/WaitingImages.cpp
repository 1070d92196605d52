#include "WaitingImages.h"

#include <algorithm>
#include <map>
#include <string>

#include "ZVUtilities.h"

namespace {

constexpr size_t kBatch = 8;
constexpr uint64_t kPatience = 2000;  // milliseconds

struct Registry {
    ZVMutex mutex;
    std::map<std::string, std::weak_ptr<WaitingImages>> all ZV_GUARDED_BY(mutex);
};

Registry& TheRegistry()
{
    static auto* registry = new Registry;  // outlives threads that still end a session at exit
    return *registry;
}

}  // namespace

std::shared_ptr<WaitingImages> WaitingImages::Of(const ZVString& database)
{
    Registry& registry = TheRegistry();
    ZVMutexLock lock(registry.mutex);
    std::weak_ptr<WaitingImages>& known = registry.all[database.c_str()];
    std::shared_ptr<WaitingImages> images = known.lock();
    if (!images) known = images = std::make_shared<WaitingImages>();
    return images;
}

bool WaitingImages::Find(const ZVString& prefix, ZV_WS_BoxArtSize dim, ZV_BoxArtRow& row) const
{
    ZVMutexLock lock(m_Mutex);
    for (const auto& waiting : m_Waiting) {
        if (waiting->row.dim != dim || waiting->row.prefix != prefix) continue;
        row = waiting->row;
        return true;
    }
    return false;
}

void WaitingImages::Add(const ZV_BoxArtRow& row, std::unique_ptr<ImageFile> file)
{
    auto added = std::make_shared<Waiting>();
    added->row = row;
    added->file = std::move(file);
    added->since = ZVUtilities::MillisecondTime();
    ZVMutexLock lock(m_Mutex);
    const auto same = std::find_if(m_Waiting.begin(), m_Waiting.end(), [&](const auto& waiting) {
        return waiting->row.dim == row.dim && waiting->row.prefix == row.prefix;
    });
    if (same != m_Waiting.end()) {
        same->swap(added);
    } else {
        m_Waiting.push_back(std::move(added));
    }
}

bool WaitingImages::AreDue() const
{
    const uint64_t now = ZVUtilities::MillisecondTime();
    ZVMutexLock lock(m_Mutex);
    return m_Waiting.size() >= kBatch || (!m_Waiting.empty() && now - m_Waiting.front()->since > kPatience);
}

WaitingImages::Claim::Claim(WaitingImages* images) : m_Images(images)
{
    if (!images) return;
    ZVMutexLock lock(images->m_Mutex);
    for (const auto& waiting : images->m_Waiting) {
        if (waiting->isClaimed) continue;
        m_Claimed.push_back(waiting);
        // A file that was removed since is nothing to have a row for.
        if (!waiting->file || waiting->file->IsInPlace()) m_Rows.push_back(waiting->row);
    }
    for (const auto& waiting : m_Claimed)  // nothing is thrown from here on
        waiting->isClaimed = true;
}

WaitingImages::Claim::~Claim()
{
    if (m_Claimed.empty()) return;
    ZVMutexLock lock(m_Images->m_Mutex);
    for (const auto& waiting : m_Claimed)
        waiting->isClaimed = false;
}

void WaitingImages::Claim::Settle()
{
    if (m_Claimed.empty()) return;
    ZVMutexLock lock(m_Images->m_Mutex);
    auto& all = m_Images->m_Waiting;
    all.erase(std::remove_if(all.begin(), all.end(),
                             [&](const auto& waiting) {
                                 return std::find(m_Claimed.begin(), m_Claimed.end(), waiting) != m_Claimed.end();
                             }),
              all.end());
}
