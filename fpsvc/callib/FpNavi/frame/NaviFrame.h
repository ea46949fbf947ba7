// The navigation frame: its buffers and the operations on it. Owns the four frames of a gesture.
// Besides NaviFrame.cpp, pre-processing writes class map, greys and range of s_imageCurr, the
// centroid method its cvr, xc, yc (and those of s_imagePrev), and FullImage.cpp the full images.
#ifndef FPNAVI_NAVIFRAME_H
#define FPNAVI_NAVIFRAME_H

#include <cstdint>

#include "FpNavi.h"

namespace fpnavi {

extern NaviFrame_t s_imageCurr;      // the frame just received
extern NaviFrame_t s_imagePrev;      // the accepted frame before it
extern NaviFrame_t s_fullImageCurr;  // s_imageCurr with its tiles spread apart
extern NaviFrame_t s_fullImagePrev;  // s_imagePrev with its tiles spread apart

// Fills img with rows i_start..i_end - 1 and columns j_start..j_end - 1 of data, an image of
// s_imageHeight rows of s_imageWidth bytes; class map and measures become 0. Returns 0; -1 for a
// null pointer or a window that is empty or not inside the image (img stays as it is) or for a
// failed allocation (img keeps its sizes but has no buffers).
int32_t ImgInit(NaviFrame_t* img, int32_t i_start, int32_t i_end, int32_t j_start, int32_t j_end,
                const uint8_t* data);

// Frees the buffers of img and zeroes it. A null img is left alone.
void ImgClear(NaviFrame_t* img);

// Makes img_dst an independent copy of img_src. Returns 0; -1 when the source is empty (img_dst
// stays as it is) or an allocation failed (img_dst has the new sizes but no buffers).
int32_t ImgCopy(NaviFrame_t* img_dst, const NaviFrame_t* img_src);

// Spreads img into full_img: its nine tiles at the distances that the sensor's unread gaps put
// between them; gap pixels have class 255 and grey 0. Replaces the buffers of full_img and does not
// write its measures. Returns 0; -1 for null pointers, a source without buffers or not of the
// tiles' size, or tiles and gaps that make no usable full image (full_img stays as it is), and for
// a failed allocation (full_img has the new sizes but no buffers).
int32_t GetFullImg(const NaviFrame_t* img, NaviFrame_t* full_img);

// Replaces both buffers of img by fresh ones of bytes each, whose content is undefined. Returns
// false, with both pointers null, when an allocation fails; sizes and measures are the caller's to
// set.
bool ReplaceBuffers(NaviFrame_t* img, int32_t bytes);

// Both buffers of a navigation frame (not of a full image) have space behind the pixels for what
// steps derive from them: pData for the bit rows of the finger fill, pType for the mask of LayOut,
// width * height bytes. A step fills the space before it reads it: nothing is kept from call to
// call. The space has at least 16 bytes more than the mask, so that a step of sixteen bytes may
// read past the last pixel, and past the last byte of the mask.

// Bytes of each buffer of a frame of these sides, 1..4096: below 2^26.
int32_t FrameBytes(int32_t width, int32_t height);

// Index of the first byte of that space: a multiple of 16.
int32_t RoomStart(int32_t width, int32_t height);

// img has both buffers and at least one pixel.
bool HasPixels(const NaviFrame_t* img);

}  // namespace fpnavi

#endif  // FPNAVI_NAVIFRAME_H
