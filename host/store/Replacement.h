// A store that takes the place of another one when it is complete.
#ifndef FPNAVI_HOST_REPLACEMENT_H
#define FPNAVI_HOST_REPLACEMENT_H

#include <functional>
#include <memory>
#include <string>

#include "store/Store.h"

namespace host {

class NewFile;

// Until TakePlace the former store stays as it is; whatever ends the work before (an Error, a kill)
// leaves it. The new one is made in a file called path with -new at its end.
class Replacement {
  public:
    // Throws what speaks against giving up the former store.
    using Check = std::function<void(const Store& former)>;

    // path: a store, an empty file, or nothing yet; Error for anything else. check is called here
    // and again in TakePlace, when nobody can append any more, unless there is no former store.
    Replacement(std::string path, Check check);
    ~Replacement();
    Replacement(const Replacement&) = delete;
    Replacement& operator=(const Replacement&) = delete;

    // Where to append what is to be in it. A kill loses all of it.
    Store& Content() { return *m_store; }

    // Puts the new store in the place of the former one, whose permissions it keeps. Error, and
    // the former one stays, when another process is writing to it. Returns the new store, open for
    // appending. To be called once.
    Store TakePlace();

  private:
    std::string m_path;
    Check m_check;
    std::unique_ptr<NewFile> m_file;
    std::unique_ptr<Store> m_store;
};

}  // namespace host

#endif  // FPNAVI_HOST_REPLACEMENT_H
