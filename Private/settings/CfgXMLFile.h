// The settings file of a device: key/value pairs in a small XML document, some of the values enciphered.
//
// A write replaces the whole file in one step, under a lock against other writers of the folder (SafeFile.h): after a
// crash the file is the old document or the new one, and a write that has returned 0 is on the disk. What stands beside
// the written setting stays as it was, comments and layout too. A file that is ruined, no settings document or larger
// than one, is kept as "<path>.bad" by the next write, which begins a new document.
//
// Any thread, any number of objects and processes on the same file. Nothing is logged but a ruined file. Both calls
// block on the disk, a write also for up to 5 s on other writers.
#pragma once

#include "ZVString.h"

class CfgXMLFile {
public:
    /// No settings file is larger; a larger one is not read.
    static constexpr size_t kMaxSize = 1u << 20;

    enum Result : unsigned int {
        kOk = 0,
        kEmptyKey = 1,
        kUnreadable = 2,    ///< The file could not be read in full, or is larger than kMaxSize.
        kNotFound = 3,      ///< The file is empty, is no settings document, or holds no element with the key.
        kUnwritable = 4,    ///< The new document is too large, or cannot be written; the old one stays.
        kUnopened = 5,      ///< The file cannot be opened for reading.
        kInvalidValue = 6,  ///< Read: the value was tampered with, or never enciphered. Write: XML cannot hold it.
        kNoDeviceKey = 7,   ///< A protected value, and the device key is missing or unusable.
    };

    explicit CfgXMLFile(const ZVString& path) : m_Path(path) {}

    /// The value of the first element with exactly that key; "" for an element without one, and on every failure.
    unsigned int Read(const ZVString& key, ZVString& value, bool protectedValue);

    /// Changes the first element with that key where it stands, or adds one at the end; makes the file (mode 0600) when
    /// there is none, but no folder.
    unsigned int Write(const ZVString& key, const ZVString& value, bool protectedValue);

private:
    ZVString m_Path;
};
