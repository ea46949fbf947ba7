// The one error type of the host side. The command maps it to exit code 3 (bad input).
#ifndef FPNAVI_HOST_ERROR_H
#define FPNAVI_HOST_ERROR_H

#include <stdexcept>
#include <string>

namespace host {

// what() reads "file: place: problem": the file as the user named it, the place in it (a byte
// offset, a gesture; may be empty) and what was found there and what was expected. A place that
// begins with a digit is a line or line:column and reads "file:12:3: problem", as editors expect.
class Error : public std::runtime_error {
  public:
    Error(std::string file, std::string place, const std::string& problem);

    const std::string& File() const { return m_file; }
    const std::string& Place() const { return m_place; }

  private:
    std::string m_file;
    std::string m_place;
};

}  // namespace host

#endif  // FPNAVI_HOST_ERROR_H
