// The golden gestures through the module, for the memory sanitizer.
#ifndef TESTS_RELIABILITY_MSANGESTURES_H
#define TESTS_RELIABILITY_MSANGESTURES_H

// Replays the gestures of a file in the form of GoldenGestureFile.h; key and record must be those
// that the file holds. Says on stderr what is wrong, and gives false then; a file without a
// gesture is wrong too.
bool ReplayGoldenGestures(const char* path);

#endif  // TESTS_RELIABILITY_MSANGESTURES_H
