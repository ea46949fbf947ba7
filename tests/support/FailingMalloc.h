// Allocations that fail on demand, for the objects linked with the --wrap options of
// tests/unit/CMakeLists.txt: the module's and the tests' own calls of malloc and free, but not
// those of operator new or of shared libraries. Counting starts at a Fail or Count call and ends
// with Off; the test itself must not call malloc or free in between.
#ifndef TESTS_SUPPORT_FAILINGMALLOC_H
#define TESTS_SUPPORT_FAILINGMALLOC_H

namespace fpnavi_test {

class FailingMalloc {
  public:
    // Starts counting at 0; nothing fails.
    static void Count();
    // Starts counting at 0; allocation n alone fails (the first is 1).
    static void FailNth(int n);
    // Starts counting at 0; allocation n and all after it fail.
    static void FailFrom(int n);
    // Ends counting and failing; the numbers below keep their values.
    static void Off();

    // Since counting started: successful allocations, failed ones, frees of non-null pointers.
    static int Allocations();
    static int Failures();
    static int Frees();
    // Allocations made since counting started that have not been freed since.
    static int Live();
    // pointer was freed since counting started.
    static bool WasFreed(const void* pointer);
};

}  // namespace fpnavi_test

#endif  // TESTS_SUPPORT_FAILINGMALLOC_H
