// Stands in for RapidCheck where a cross build has no library of it: properties are compiled, as
// templates that nobody instantiates, and not run. The native builds run them.
#ifndef TESTS_CROSS_RAPIDCHECK_GTEST_H
#define TESTS_CROSS_RAPIDCHECK_GTEST_H

#include <gtest/gtest.h>

#include <cstddef>

namespace rc {

template <typename T>
struct Gen {
    T operator*() const;
};

namespace gen {

template <typename T>
Gen<T> inRange(T low, T high);
template <typename T>
Gen<T> arbitrary();
template <typename Container, typename T>
Gen<Container> container(Gen<T> element);
template <typename T>
Gen<T> resize(int size, Gen<T> generator);

}  // namespace gen
}  // namespace rc

#define RC_ASSERT(condition) static_cast<void>(condition)

#define RC_GTEST_PROP(suite, name, arguments) \
    template <typename>                       \
    void suite##name arguments

#define RC_GTEST_FIXTURE_PROP(fixture, name, arguments) \
    template <typename>                                 \
    struct fixture##name : fixture {                    \
        void Property arguments;                        \
    };                                                  \
    template <typename T>                               \
    void fixture##name<T>::Property arguments

#endif  // TESTS_CROSS_RAPIDCHECK_GTEST_H
