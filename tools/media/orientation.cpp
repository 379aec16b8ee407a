#include "media/orientation.h"

#include <cstdlib>

namespace dehaze {
namespace {

constexpr size_t kMatrixBytes = 9 * sizeof(int32_t);

// EXIF 2.3, tag 0x0112: where row 0 and column 0 of the stored pixels lie on display.
Orientation orientation_of_exif(int tag) {
  switch (tag) {
    case 2:  // top, right
      return {false, true, false};
    case 3:  // bottom, right
      return {false, true, true};
    case 4:  // bottom, left
      return {false, false, true};
    case 5:  // left, top
      return {true, false, false};
    case 6:  // right, top
      return {true, true, false};
    case 7:  // right, bottom
      return {true, true, true};
    case 8:  // left, bottom
      return {true, false, true};
    default:
      return {};
  }
}

}  // namespace

std::string Orientation::filter() const {
  std::string graph;
  // "cclock_flip" is the plain transposition: a quarter turn to the left, then top to bottom.
  if (transposed) graph += ",transpose=cclock_flip";
  if (flipped_x) graph += ",hflip";
  if (flipped_y) graph += ",vflip";
  return graph.empty() ? "null" : graph.substr(1);
}

// A pixel at (x, y) is shown at (m0 x + m3 y + m6, m1 x + m4 y + m7). Either the diagonal (no
// transposition) or the other two dominate; a negative factor mirrors its axis of the display.
Orientation orientation_of_matrix(const int32_t* m) {
  const auto magnitude = [](int32_t a, int32_t b) {
    return std::llabs(static_cast<long long>(a)) + std::llabs(static_cast<long long>(b));
  };
  if (magnitude(m[0], m[4]) >= magnitude(m[1], m[3])) return {false, m[0] < 0, m[4] < 0};
  return {true, m[3] < 0, m[1] < 0};
}

Orientation orientation_of_picture(const AVFrame& frame) {
  const AVFrameSideData* matrix = av_frame_get_side_data(&frame, AV_FRAME_DATA_DISPLAYMATRIX);
  if (matrix != nullptr && matrix->size >= kMatrixBytes) {
    return orientation_of_matrix(reinterpret_cast<const int32_t*>(matrix->data));
  }
  const AVDictionaryEntry* tag = av_dict_get(frame.metadata, "Orientation", nullptr, 0);
  return tag != nullptr ? orientation_of_exif(std::atoi(tag->value)) : Orientation();
}

Orientation orientation_of(const AVStream& stream, const AVFrame& frame) {
  const int32_t* matrix = display_matrix(stream);
  return matrix != nullptr ? orientation_of_matrix(matrix) : orientation_of_picture(frame);
}

const int32_t* display_matrix(const AVStream& stream) {
  size_t size = 0;
  const uint8_t* data = av_stream_get_side_data(&stream, AV_PKT_DATA_DISPLAYMATRIX, &size);
  return data != nullptr && size >= kMatrixBytes ? reinterpret_cast<const int32_t*>(data) : nullptr;
}

}  // namespace dehaze
