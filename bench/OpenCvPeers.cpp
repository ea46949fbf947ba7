// OpenCV's template matching and phase correlation on the same frames, 56 x 36 pixels.
#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "Peers.h"

namespace bench {
namespace {

constexpr int kWidth = kDefaultFp.width;
constexpr int kHeight = kDefaultFp.height;
const cv::Rect kCenter(8, 8, 40, 20);

// The frame as a matrix over the same bytes; nobody writes to it.
cv::Mat MatrixOf(const Frame& frame) {
    return {kHeight, kWidth, CV_8UC1, const_cast<uint8_t*>(frame.image.data())};
}

// The centre of the first frame searched in the whole second one.
Shift MatchTemplate(const FramePair& pair) {
    cv::Mat scores;
    cv::matchTemplate(MatrixOf(pair.second), MatrixOf(pair.first)(kCenter), scores, cv::TM_SQDIFF);
    cv::Point place;
    cv::minMaxLoc(scores, nullptr, nullptr, &place);
    return {static_cast<double>(place.x - kCenter.x), static_cast<double>(place.y - kCenter.y)};
}

Shift PhaseCorrelate(const FramePair& pair) {
    cv::Mat first;
    cv::Mat second;
    MatrixOf(pair.first).convertTo(first, CV_32F);
    MatrixOf(pair.second).convertTo(second, CV_32F);
    const cv::Point2d shift = cv::phaseCorrelate(first, second);
    return {shift.x, shift.y};
}

}  // namespace

std::vector<Peer> OpenCvPeers() {
    cv::setNumThreads(1);
    return {{"matchTemplate", MatchTemplate}, {"phaseCorrelate", PhaseCorrelate}};
}

}  // namespace bench
