// The kept hashes: a text file with a line for each set, as state_digest prints it.
#ifndef TESTS_DIGEST_EXPECTED_H
#define TESTS_DIGEST_EXPECTED_H

#include <optional>
#include <string>

#include "HashedCalls.h"

namespace fpnavi_test {

// "small gestures 400 pairs 1200 calibrations 200 log-lines 5000 hash 0123456789abcdef"
std::string ExpectedLine(const std::string& set, const Counts& counts, uint64_t hash);

// The line of the set in the file; empty when there is none. Lines that begin with # are skipped.
std::optional<std::string> ReadExpected(const std::string& path, const std::string& set);

}  // namespace fpnavi_test

#endif  // TESTS_DIGEST_EXPECTED_H
