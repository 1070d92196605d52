// An image's file on its way into the cache folder: written beside its place, and moved there when it is whole and on
// the disk. So what a power cut leaves is a whole image or none.
//
// As long as the object lives the file is locked, wherever it is: who looks for files that nobody needs any more
// (CacheSweep.h), in this process or another, leaves it alone. One thread at a time.
#pragma once

#include "ZVFile.h"

class ImageFile {
public:
    ImageFile() = default;
    /// Removes what has not been moved into its place.
    ~ImageFile();

    /// Begins a temporary file in the folder of `target`.
    bool Create(const ZVString& target);
    bool Write(const char* bytes, size_t length);
    /// Flushes the file and moves it to its place. False leaves there what was there.
    bool Commit();

    /// Whether it has not been removed or replaced since.
    bool IsInPlace() const { return m_File.IsLinked(); }

private:
    ZVString m_Target;
    ZVString m_Temporary;  // empty when there is none
    ZVFile m_File;
};
