#include "ImageFile.h"

ImageFile::~ImageFile()
{
    if (!m_Temporary.empty()) ZVFile::Remove(m_Temporary.c_str());
}

bool ImageFile::Create(const ZVString& target)
{
    m_Target = target;
    // Between its making and its lock somebody may have taken the file for one that was left over.
    for (int attempt = 0; attempt < 3; ++attempt) {
        if (!m_File.OpenTemporary(target.c_str(), m_Temporary)) return false;
        if (m_File.TryLock() && m_File.IsLinked()) return true;
    }
    return false;
}

bool ImageFile::Write(const char* bytes, size_t length)
{
    const auto size = static_cast<zv_int64>(length);
    return m_File.Write(bytes, size) == size;
}

bool ImageFile::Commit()
{
    if (!m_File.Sync() || !ZVFile::Rename(m_Temporary.c_str(), m_Target.c_str())) return false;
    m_Temporary = ZVString();
    return true;
}
