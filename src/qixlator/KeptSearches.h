#pragma once

#include <cstddef>
#include <cstdint>
#include <mutex>

#include "qihtl/Array.h"
#include "qihtl/String.h"
#include "qisysq/FileIdentity.h"

namespace qixlator {

// The result of one search of a directory for a code, with the identities of everything that was
// looked at to find it. Constant once it is in the table.
struct Search {
    explicit Search(std::int32_t wanted) noexcept;

    bool isFor(const char* wantedDirectory, std::int32_t wantedCode) const;
    // Whether nothing has changed so recently that the next change could go unnoticed.
    bool isSettled() const;
    // Whether a search now would look at the same files with the same content.
    bool isUnchanged() const;
    // The memory that the search occupies, in bytes.
    std::size_t size() const;

    qihtl::String directory;
    std::int32_t code;
    timespec begin;
    // The directory, and then the entries in the order of the names, each of which ends with NUL.
    qihtl::Array<qisysq::FileIdentity> identities;
    qihtl::String names;
    qihtl::String text;

    // For the table.
    Search* next = nullptr;
    int users = 0;
    bool isListed = false;
};

// Records a search while it runs, for the table of this process. If memory runs out the search is
// not kept. Used by one thread.
class SearchRecording {
  public:
    // To be constructed before anything is looked at.
    SearchRecording(const char* directory, std::int32_t code) noexcept;
    ~SearchRecording();
    SearchRecording(const SearchRecording&) = delete;
    SearchRecording& operator=(const SearchRecording&) = delete;

    // The directory as it was before its entries were read; null if that is unknown.
    void addDirectory(const struct stat* info);
    // An entry of the directory, whether or not the search reads it.
    void addEntry(const char* name, const struct stat& info);
    // Ends the recording with the text that was found, "" if there is none.
    void keep(const qihtl::String& text);

  private:
    Search* search;
    qierr::Status status;
};

// A table of searches that are known to give the same result again. When it is full the oldest
// searches are removed. Any thread may use it; the lock is not held while files are looked at.
class KeptSearches {
  public:
    // The table of this process.
    static KeptSearches& ofProcess();

    // In bytes.
    static constexpr std::size_t maximumSize = 40 * 1024;

    KeptSearches() = default;
    ~KeptSearches();
    KeptSearches(const KeptSearches&) = delete;
    KeptSearches& operator=(const KeptSearches&) = delete;

    // Replaces `output` by the result of the search if it is in the table and nothing that it
    // looked at has changed. Returns false otherwise. qiapalerr_memoryFull if the text cannot be
    // stored.
    bool find(const char* directory, std::int32_t code, qihtl::String* output,
              qierr_Status* status);

    // Adds a search, whose memory belongs to the table from then on.
    void add(Search* search);

    // Removes all searches.
    void clear();
    // The memory that the searches occupy, in bytes.
    std::size_t size();

  private:
    Search* acquire(const char* directory, std::int32_t code);
    void release(Search* search);
    void remove(Search* search);
    void removeLocked(Search* search);

    std::mutex mutex;
    // The oldest is the first.
    Search* first = nullptr;
    Search* last = nullptr;
    std::size_t bytes = 0;
};

}  // namespace qixlator
