/* MAJOR, MINOR and PATCH are the project's version. */
#include "FpNavi.h"

static_assert(FPNAVI_VERSION_MAJOR == MAJOR, "major");
static_assert(FPNAVI_VERSION_MINOR == MINOR, "minor");
static_assert(FPNAVI_VERSION_PATCH == PATCH, "patch");
