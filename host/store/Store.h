// Recordings in a SQLite file: one gesture or a million. docs/recordings.md has the tables.
//
// The frames are pictures of fingerprints: biometric data. Whoever stores them keeps them safe;
// recording/Redact.h takes the fingerprint out.
#ifndef FPNAVI_HOST_STORE_H
#define FPNAVI_HOST_STORE_H

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "recording/Recording.h"

namespace host {

class Database;
class StoreReader;
class Transaction;

// What a list of a store shows of a gesture, its frames not read. What is not sound in its row is
// empty here; reading the gesture says what is wrong.
struct GestureHead {
    int64_t seq = 0;  // in the order of appending
    std::string id;
    std::optional<Mode> mode;
    std::optional<int32_t> label;
    std::string tier;
    int32_t frameCount = 0;
};

struct StoreExtent {
    int64_t count = 0;      // gestures
    int64_t longestId = 0;  // bytes
};

// One open store. Every member function throws Error with the file's name; an Append that throws
// leaves the store as it was. Use one Store from one thread; several processes may open the same
// file, also for appending.
class Store {
  public:
    // A new store, open for appending, for its owner alone to read (0600). A file of that name is
    // an Error (store/Replacement.h replaces one). A kill at any moment leaves nothing of that name
    // or the new store.
    static Store Create(const std::string& path);

    // An existing one. Error for a file that is missing, empty, truncated, no SQLite file, another
    // program's database or of another schema version.
    static Store OpenForReading(const std::string& path);
    static Store OpenForAppending(const std::string& path);

    Store(Store&& other) noexcept;
    Store& operator=(Store&& other) noexcept;
    ~Store();

    // Adds gesture with all its frames in one transaction: after a kill at any moment it is there
    // completely or not at all, and once Append has returned it stays. Error for an id that is
    // taken and for a gesture that CheckGesture refuses.
    void Append(const Gesture& gesture);

    // Gestures that go in together: what is appended while it lives is there after its Commit, or
    // not at all. Other processes that append wait for it.
    class Batch {
      public:
        explicit Batch(Store& store);  // store must outlive it
        ~Batch();
        Batch(const Batch&) = delete;
        Batch& operator=(const Batch&) = delete;

        void Commit();

      private:
        std::unique_ptr<Transaction> m_transaction;
    };

    int64_t Count() const;

    // Gestures that do not have this tag.
    int64_t CountWithoutTag(const std::string& tag) const;

    // Error when the index of the ids has another number of gestures.
    StoreExtent Extent() const;

    // In the order of appending; Error as Extent.
    std::vector<std::string> Ids() const;

    // At most limit gestures in the order of appending, of those with seq above after. What is
    // asked for first comes after INT64_MIN.
    std::vector<GestureHead> Heads(int64_t after, int64_t limit) const;

    // Calls visit with each parameter block and the id of a gesture that has it. Leaves out blocks
    // that are not sound; reading their gestures says what is wrong.
    void ForEachParams(
        const std::function<void(const ParamBlock& params, const std::string& id)>& visit) const;

    bool Contains(const std::string& id) const;

    // The gesture called id; Error when there is none or its rows are not sound.
    Gesture Read(const std::string& id) const;

    // The same for the seq of a head.
    Gesture ReadRow(int64_t seq) const;

    // Calls visit with each gesture in the order of appending, one in memory at a time. What visit
    // throws ends it.
    void ForEach(const std::function<void(const Gesture&)>& visit) const;

    const std::string& Path() const;

  private:
    friend class Replacement;

    Store(std::unique_ptr<Database> database, bool appending);
    // The tables in an empty file that nobody else knows yet; nothing guards it against a kill.
    static Store MakeNew(const std::string& path);

    StoreReader& Reader() const;

    std::unique_ptr<Database> m_database;
    mutable std::unique_ptr<StoreReader> m_reader;  // made by the first reading
    bool m_appending = false;
};

// What every stored gesture fulfils: a non-empty id, mode and geometry as params give them, image
// sides of 1 to 4096 pixels, every frame of the geometry's size, known keys, end and presence.
// Error at "gesture 'id'" of file otherwise.
void CheckGesture(const Gesture& gesture, const std::string& file);

}  // namespace host

#endif  // FPNAVI_HOST_STORE_H
