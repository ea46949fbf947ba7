// The tables of a recording store, and the test whether a file is one. Used by the store alone.
#ifndef FPNAVI_HOST_STORESCHEMA_H
#define FPNAVI_HOST_STORESCHEMA_H

#include <memory>
#include <string>

#include "recording/Recording.h"
#include "store/Sqlite.h"

namespace host {

// "FNav" as SQLite's application id.
inline constexpr int64_t kStoreApplicationId = 0x464E6176;

// Grows by one with every change of the tables that an older reader cannot read. 3 is the first
// that every later program opens.
inline constexpr int64_t kStoreSchemaVersion = 3;

// Longest image side in pixels, that of the library.
inline constexpr int64_t kMaxImageSide = 4096;

// Creates the tables in the new database.
void CreateSchema(Database& database);

// Sets up a connection for appending.
void PrepareForAppending(Database& database);

// Opens an existing store; Error that says why when the file is none.
std::unique_ptr<Database> OpenStoreFile(const std::string& path, bool forAppending);

// The parameter block as a JSON object in the order of the block, and back. Error at place of file
// for text that is no such object.
std::string ParamsToJson(const ParamBlock& params);
ParamBlock ParamsFromJson(const std::string& text, const std::string& file,
                          const std::string& place);

// "gesture 'id'", for errors.
std::string GesturePlace(const std::string& id);

}  // namespace host

#endif  // FPNAVI_HOST_STORESCHEMA_H
