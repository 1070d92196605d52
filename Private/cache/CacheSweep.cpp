#include "CacheSweep.h"

#include <dirent.h>
#include <fcntl.h>
#include <string.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <memory>
#include <set>

#include "BoxArtNames.h"
#include "CacheMgr.h"
#include "ZVFile.h"
#include "ZVUtilities.h"

namespace {

constexpr uint64_t kMostTime = 50;  // milliseconds
constexpr size_t kAtOnce = 32;      // files locked together
constexpr time_t kDay = 24 * 60 * 60;
constexpr time_t kGivenUp = 30 * kDay;

// Weeks since 1970, from Monday on.
time_t WeekOf(time_t time)
{
    return (time / kDay + 3) / 7;
}

bool EndsIn(const std::string& name, const std::string& end)
{
    return name.size() > end.size() && name.compare(name.size() - end.size(), end.size(), end) == 0;
}

// A name that an image of some size can have.
bool IsImage(const std::string& name)
{
    if (!EndsIn(name, ".jpg")) return false;
    for (int size = BOX_ART_SIZE_95; size <= BOX_ART_SIZE_321; ++size) {
        if (EndsIn(name, ZVUtilities::BoxArtSize2ImageSize(static_cast<ZV_WS_BoxArtSize>(size)) + std::string(".jpg")))
            return true;
    }
    return false;
}

bool IsDatabase(const std::string& name)
{
    return EndsIn(name, ".zv") && name.find_first_not_of("0123456789_-") == name.size() - strlen(".zv");
}

// What ZVFile::CreateTempFileName makes.
bool IsTemporary(const std::string& name)
{
    return name.size() == strlen("zvwsXXXXXX") && name.compare(0, strlen("zvws"), "zvws") == 0;
}

// An open file that nobody else keeps.
class Locked {
public:
    explicit Locked(const std::string& path)
        : m_Path(path), m_File(open(path.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC))
    {
        struct stat file;
        m_Held =
            m_File >= 0 && fstat(m_File, &file) == 0 && S_ISREG(file.st_mode) && flock(m_File, LOCK_EX | LOCK_NB) == 0;
    }
    ~Locked()
    {
        if (m_File >= 0) close(m_File);
    }
    Locked(const Locked&) = delete;
    Locked& operator=(const Locked&) = delete;

    // Unless another file has taken its name.
    bool Remove() const
    {
        struct stat own, named;
        return m_Held && fstat(m_File, &own) == 0 && stat(m_Path.c_str(), &named) == 0 && own.st_ino == named.st_ino &&
               unlink(m_Path.c_str()) == 0;
    }

private:
    const std::string m_Path;
    const int m_File;
    bool m_Held;
};

}  // namespace

CacheSweep::CacheSweep(const ZVString& database)
    : m_Database(database),
      m_FolderName(ZVFile::GetFolderName(database.c_str()).c_str()),
      m_End(ZVUtilities::MillisecondTime() + kMostTime)
{
    struct stat file;
    if (stat(database.c_str(), &file) == 0) m_LastUse = file.st_mtime;
}

void CacheSweep::AfterOpening()
{
    m_End = ZVUtilities::MillisecondTime() + kMostTime;
    utimensat(AT_FDCWD, m_Database.c_str(), nullptr, 0);
    const Folder files = List();
    for (const std::string& name : files.temporaries)
        RemoveUnlocked(name);
    if (WeekOf(m_LastUse) != WeekOf(time(nullptr))) SweepDatabases(files);
    SweepImages(List());
}

void CacheSweep::AfterEviction()
{
    SweepImages(List());
}

CacheSweep::Folder CacheSweep::List() const
{
    Folder files;
    const std::unique_ptr<DIR, int (*)(DIR*)> entries(opendir(m_FolderName.c_str()), closedir);
    while (const dirent* entry = entries ? readdir(entries.get()) : nullptr) {
        const std::string name = entry->d_name;
        if (IsImage(name)) files.images.push_back(name);
        if (IsTemporary(name)) files.temporaries.push_back(name);
        if (IsDatabase(name)) files.databases.push_back(name);
    }
    return files;
}

bool CacheSweep::HasTime() const
{
    return ZVUtilities::MillisecondTime() < m_End;
}

bool CacheSweep::RemoveUnlocked(const std::string& name) const
{
    return HasTime() && Locked(m_FolderName + name).Remove();
}

// Who fetches an image keeps its file until the row is written. So once a file is locked here, and has no row then, it
// never gets one.
void CacheSweep::SweepImages(const Folder& files) const
{
    const auto listRows = [&](std::set<std::string>& names) {
        return std::all_of(files.databases.begin(), files.databases.end(), [&](const std::string& database) {
            return CacheMgr::ListImageFiles((m_FolderName + database).c_str(), names);
        });
    };
    std::set<std::string> wanted;
    if (!listRows(wanted)) return;
    std::vector<std::string> unwanted;
    std::copy_if(files.images.begin(), files.images.end(), std::back_inserter(unwanted),
                 [&](const std::string& name) { return wanted.count(name) == 0; });
    for (size_t first = 0; first < unwanted.size() && HasTime(); first += kAtOnce) {
        const size_t end = std::min(unwanted.size(), first + kAtOnce);
        std::vector<std::unique_ptr<Locked>> locked;
        for (size_t i = first; i < end; ++i)
            locked.push_back(std::make_unique<Locked>(m_FolderName + unwanted[i]));
        if (!listRows(wanted)) return;
        for (size_t i = first; i < end; ++i) {
            if (wanted.count(unwanted[i]) == 0) locked[i - first]->Remove();
        }
    }
}

void CacheSweep::SweepDatabases(const Folder& files) const
{
    const time_t now = time(nullptr);
    for (const std::string& name : files.databases) {
        const std::string path = m_FolderName + name;
        struct stat file;
        if (!HasTime() || path == m_Database.c_str() || stat(path.c_str(), &file) != 0) continue;
        if (now - file.st_mtime < kGivenUp) continue;
        unlink((path + "-journal").c_str());
        unlink(path.c_str());
    }
}
