#include "gesture/Gesture.h"

namespace fpnavi {

int32_t s_frameNum = 0;
int32_t s_lastFrameFlag = 0;
int32_t s_tuneOkFlag = 0;

}  // namespace fpnavi
