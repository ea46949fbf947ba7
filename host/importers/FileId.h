// The id that a gesture has from its file's name.
#ifndef FPNAVI_HOST_FILEID_H
#define FPNAVI_HOST_FILEID_H

#include <filesystem>
#include <string>

#include "common/Error.h"
#include "common/Text.h"

namespace host {

// The name of the file without directory and extension. Error when it is no UTF-8.
inline std::string IdOfFile(const std::string& path) {
    std::string id = std::filesystem::path(path).stem().string();
    if (!IsUtf8(id))
        throw Error(path, "", "the name is no UTF-8, expected one that can be the gesture's id");
    return id;
}

}  // namespace host

#endif  // FPNAVI_HOST_FILEID_H
