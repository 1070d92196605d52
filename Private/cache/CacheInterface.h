// What the library needs of a local cache: service answers, box art, per-user data, and the time of the last cache
// load.
//
// A cache belongs to one session and, like it, to one thread at a time. Nothing here asks the network; an operation may
// wait up to 10 seconds for another process that holds the cache's file. Every operation is kept whole or not at all,
// and returns false, with nothing changed, when the cache is not open, when the name, prefix or written value is empty,
// when that kind of data is not cached, or when the database fails. A file that turns out to be broken is made anew:
// the operation that met it is a miss, those after it work. One that another process keeps locked is left alone for a
// minute, in which every operation returns false. Either is one line in the log. Texts are bytes: NUL bytes are kept.
#pragma once

#include <stdint.h>

#include <functional>
#include <vector>

#include "ZVString.h"
#include "ZVWSLib.h"

struct ZV_WS_CacheParam2 {
    int type = CacheType_None;  ///< A CacheType.
    int flags = 0;              ///< ZV_WS_CacheParam::CacheData bits: the kinds of data cached.
    unsigned int size = 0;      ///< Bytes for all kinds together; 0 is no limit.
    ZVString path;              ///< The database file of CacheType_File; box-art files lie in its folder.
};

/// An image's row: the image itself is in a file beside the database.
struct ZV_BoxArtRow {
    ZVString prefix;
    ZV_WS_BoxArtSize dim = BOX_ART_SIZE_95;
    unsigned int size = 0;  ///< Bytes of the file.
    ZVString lastModified;
    unsigned int needUpdate = 0;
};

typedef std::vector<int> ZVWS_IntVector;
typedef std::vector<bool> ZVWS_BoolVector;

class CacheInterface {
public:
    virtual ~CacheInterface() = default;

    /// How often answers or user data were dropped in this process (refreshed, purged, evicted, cleared, lost with a
    /// broken file), by whatever cache. What somebody remembers of a cache's content holds as long as this number. Any
    /// thread.
    static uint64_t Drops();

    /// Closes, then opens with a copy of the parameters. 0, else SQLite's result code and the cache stays closed. A
    /// cache of CacheType_None opens with 0 and refuses every operation.
    virtual int Open(const ZV_WS_CacheParam2& param) = 0;
    /// Forgets a memory cache's content; a file keeps its own. SQLite's result code.
    virtual int Close() = 0;

    // ---- Service answers, by the call's name and the key of its arguments. An answer that is not there reads as false
    // and leaves `value` as it was. A write to a table that has outgrown its budget first empties answers and user data
    // both.
    virtual bool ReadMetaData(const ZVString& name, const ZVString& key, ZVString& value) = 0;
    virtual bool WriteMetaData(const ZVString& name, const ZVString& key, const ZVString& value) = 0;
    /// Drops every answer when the time differs from the one stored last.
    virtual bool UpdateLastCacheLoadTime(const ZVString& time) = 0;

    // ---- Images. `size` is the image's, `data` its bytes, or empty when they are in a file next to the database. A
    // write to a table over its budget first evicts the oldest titles, all their sizes and, for a file cache, the
    // files.
    virtual bool WriteBoxArt(const ZVString& prefix, ZV_WS_BoxArtSize dim, unsigned int size,
                             const ZVString& lastModified, unsigned int needUpdate, const ZVString& data) = 0;
    /// The outputs are zero and empty when it returns false.
    virtual bool ReadBoxArt(const ZVString& prefix, ZV_WS_BoxArtSize dim, unsigned int& size, ZVString& lastModified,
                            unsigned int& needUpdate, ZVString& data) = 0;
    /// Marks every image for revalidation.
    virtual bool SetBoxArtNeedUpdate() = 0;

    // ---- Data of the user, by name and key; reads and writes as those of the answers.
    virtual bool ReadUserData(const ZVString& name, const ZVString& key, ZVString& value) = 0;
    virtual bool WriteUserData(const ZVString& name, const ZVString& key, const ZVString& value) = 0;
    /// Removes everything of the name, or everything when it is empty. Wish-list flags take with them the answers that
    /// show them. True when the user's data are gone, whatever became of the answers.
    virtual bool PurgeUserData(const ZVString& name) = 0;

    // ---- Whether titles are in the wish list.
    /// `flag` is false when it returns false.
    virtual bool ReadWishlistFlag(int titleId, bool& flag) = 0;
    virtual bool WriteWishlistFlag(int titleId, bool flag) = 0;
    /// A flag for each title, written from the last to the first; all of them or none. The vectors are equally long and
    /// not empty. The budget is not looked at.
    virtual bool WriteWishlistFlags(const ZVWS_IntVector& titleIds, const ZVWS_BoolVector& flags) = 0;
    virtual bool RemoveWishlistFlag(int titleId) = 0;
    virtual bool RemoveAllWishlistFlags() = 0;

    // ---- Several operations as one.
    /// What `work` does with this cache is kept when it returns true and nothing of it otherwise, under one lock and
    /// with the flushes of one operation. It may be called twice. False also when `work` never ran.
    virtual bool Together(const std::function<bool()>& work) = 0;
    /// The same for reads alone, which keep nobody out.
    virtual bool Look(const std::function<bool()>& work) = 0;

    /// A number that changes whenever answers or user data are dropped because they may be wrong from then on, by
    /// whichever process: what was asked before such a change must not be kept after it. 0 when it cannot be told.
    virtual unsigned int Generation() = 0;

    /// WriteBoxArt for several images of a file cache. `evicted` becomes true when others had to make room.
    virtual bool WriteBoxArts(const std::vector<ZV_BoxArtRow>& rows, bool& evicted) = 0;

    /// How long operations wait for another process from now on, in milliseconds; 10,000 after Open.
    virtual void SetPatience(int milliseconds) = 0;
};
