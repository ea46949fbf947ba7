// The text of the host side's errors.
#include "common/Error.h"

#include <utility>

namespace host {

namespace {

std::string Message(const std::string& file, const std::string& place, const std::string& problem) {
    if (place.empty())
        return file + ": " + problem;
    const bool isLine = place[0] >= '0' && place[0] <= '9';
    return file + (isLine ? ":" : ": ") + place + ": " + problem;
}

}  // namespace

Error::Error(std::string file, std::string place, const std::string& problem)
    : std::runtime_error(Message(file, place, problem)),
      m_file(std::move(file)),
      m_place(std::move(place)) {}

}  // namespace host
