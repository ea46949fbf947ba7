/* A service that links its own logging and finger-detect libraries. */
#include <stdio.h>

#include "FingerDetect.h"
#include "alog.h"
#include "gesture.h"

int tq_log_printf(int priority, const char* tag, const char* format, ...) {
    (void)priority;
    (void)tag;
    (void)format;
    return 0;
}

void FingerBLKTest(const uint8_t* image, int32_t width, int32_t height, int32_t* results,
                   int32_t mode) {
    (void)image;
    (void)width;
    (void)height;
    (void)results;
    (void)mode;
}

int main(void) {
    if (!RefusesEmptyGeometry())
        return 1;
    puts("own libraries: fine");
    return 0;
}
