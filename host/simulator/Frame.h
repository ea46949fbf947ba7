// One frame of the simulated sensor, in two steps: what touches (contact and skin height at each
// pixel), and what grey levels the sensor makes of it.
//
// Pictures are row by row, row 0 on top. Positions are in 1/16 pixel, x right, y downwards.
#ifndef FPNAVI_HOST_FRAME_H
#define FPNAVI_HOST_FRAME_H

#include <vector>

#include "recording/Recording.h"
#include "simulator/Arithmetic.h"
#include "simulator/Skin.h"

namespace host {

// Which pixel of the sensor's physical window each column and row of the frame shows.
struct SensorWindow {
    std::vector<int32_t> columns;
    std::vector<int32_t> rows;
    int32_t width = 0;  // of the physical window, unread gaps included
    int32_t height = 0;

    // The window that params describe: nine tiles with unread gaps, or one contiguous area in hg
    // mode, without multi-block and with gaps of 0.
    static SensorWindow Of(const ParamBlock& params);
};

// The part of a finger that can touch: an ellipse with a soft, rough edge, fixed to the finger.
struct ContactPatch {
    int32_t semiX16 = 0;  // half axes at full pressure
    int32_t semiY16 = 0;
    int32_t edge16 = 48;  // width of the soft edge
    uint64_t roughSeed = 0;
};

// Where the finger is and how hard it presses.
struct FingerState {
    int32_t x16 = 0;  // centre of the finger from the centre of the window
    int32_t y16 = 0;
    int32_t pressure = 0;  // 0 in the air .. 256 full
    int32_t stretchX = 0;  // stretch of the skin along each axis in 1/1024
    int32_t stretchY = 0;
};

// What one pixel of the sensor feels; the input of any model of the sensor's electronics.
struct SkinPoint {
    uint8_t contact = 0;  // 0 air .. 255 touching
    uint8_t height = 0;   // of the skin, 0 valley .. 255 ridge; 0 without contact
};

// A contact patch at one pressure.
class PressedPatch {
  public:
    PressedPatch(const ContactPatch& patch, int32_t pressure);

    // Contact, 0 .. 255, at (x16, y16) from the finger's centre, |x16|, |y16| < 2^20.
    int32_t At(int32_t x16, int32_t y16) const;

  private:
    // Depth in 1/16 pixel at a radius in 1/1024 of the ellipse, without the roughness of the edge.
    int32_t SmoothDepth(int32_t radius) const { return (1024 - radius) * m_semi / 1024; }

    ContactPatch m_patch;
    int32_t m_semiX;  // half axes at this pressure
    int32_t m_semiY;
    int32_t m_semi;           // the smaller one
    int64_t m_fullBelow = 0;  // square of the radius below which contact is full
    int64_t m_noneFrom = 0;   // and from which there is none, whatever the roughness
};

// What the pixels of the window feel, row by row.
std::vector<SkinPoint> SenseSkin(Skin& skin, const ContactPatch& patch, const FingerState& finger,
                                 const SensorWindow& window);

// Grey levels and disturbances of one sensor; all but the white noise are fixed for a gesture.
struct GreyModel {
    int32_t background = 240;  // without contact
    int32_t ridge = 60;        // at the top of a ridge
    int32_t valley = 190;
    int32_t gain256 = 256;  // contrast around middle grey, in 1/256
    int32_t pattern = 3;    // amplitude of the fixed row, column and block pattern
    int32_t noise16 = 32;   // standard deviation of the white noise, in 1/16 grey
    uint64_t patternSeed = 0;
};

// Grey of one point before disturbances.
int32_t GreyOf(const GreyModel& model, SkinPoint point);

// The frame of points (width to the row): grey levels, offset, fixed pattern, noise from random.
std::vector<uint8_t> MakeGreys(const GreyModel& model, const std::vector<SkinPoint>& points,
                               int32_t width, int32_t offset, SimRandom& random);

// The picture in sensor order: block after block, left to right, then down.
std::vector<uint8_t> ToBlockOrder(const std::vector<uint8_t>& picture, const Geometry& geometry);

// The inverse of ToBlockOrder.
std::vector<uint8_t> FromBlockOrder(const std::vector<uint8_t>& raw, const Geometry& geometry);

// The two double-scan registers.
struct ZoneRegisters {
    uint32_t reg24 = 0;
    uint32_t reg28 = 0;
};

// A bit for each of 8 x 8 cells of the physical window that is more than half in contact; cells
// that are about half covered flip now and then.
ZoneRegisters SenseZones(const ContactPatch& patch, const FingerState& finger,
                         const SensorWindow& window, SimRandom& random);

}  // namespace host

#endif  // FPNAVI_HOST_FRAME_H
