/* A host that takes the logging and finger-detect libraries that come with the package. */
#include <stdio.h>

#include "gesture.h"

int main(void) {
    if (!RefusesEmptyGeometry())
        return 1;
    puts("given libraries: fine");
    return 0;
}
