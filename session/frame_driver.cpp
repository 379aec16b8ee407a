#include "session/frame_driver.h"

#include <string.h>

#include "core/numeric.h"
#include "recover/frame_recovery.h"

namespace haze::session {
namespace {

bool is_accepted(const StreamState& stream, int width, int height) {
  return stream.block != nullptr && width % 2 == 0 && height % 2 == 0 && width >= kLeastSide &&
         height >= kLeastSide && width <= kMostWidth && height <= kMostHeight &&
         stream.block_bytes >= WorkingMemory::bytes(width, height);
}

// Maximum of samples 0, 2, 4 ... below `end`. One map at a time, which compilers vectorise.
uint8_t most_of_even(const uint8_t* samples, int end) {
  uint8_t most = 0;
  for (int x = 0; x < end; x += 2) most = max(most, samples[x]);
  return most;
}

// The mean of the brightest maximum and the brightest smoothed minimum on every second row and
// column.
//
// Each row is read from where the scan of the row before ended. That position is two rows further
// down for an even width and one byte more for an odd one, so the scan drifts to the right, and
// over the end of its map into the region behind it by less than half_height / 2 bytes.
uint8_t scan_light(const WorkingMemory& memory) {
  const ptrdiff_t row_step = 2 * ((memory.half_width + 1) / 2) + memory.half_width;
  uint8_t most_of_max = 0;
  uint8_t most_of_mean = 0;
  ptrdiff_t start = 0;
  for (int y = 0; y < memory.half_height; y += 2) {
    most_of_max = max(most_of_max, most_of_even(memory.max_map + start, memory.half_width));
    most_of_mean = max(most_of_mean, most_of_even(memory.mean_map + start, memory.half_width));
    start += row_step;
  }
  return static_cast<uint8_t>((most_of_max + most_of_mean) >> 1);
}

void copy_rows(const uint8_t* source, int source_row_bytes, uint8_t* destination,
               int destination_row_bytes, int width, int height) {
  for (int y = 0; y < height; ++y) {
    memcpy(destination + static_cast<ptrdiff_t>(y) * destination_row_bytes,
           source + static_cast<ptrdiff_t>(y) * source_row_bytes, static_cast<size_t>(width));
  }
}

// Leaves the frame's transmission map and light in the stream's cache.
void estimate(StreamState& stream, uint8_t* frame, int width, int height, int level) {
  const WorkingMemory memory(stream.block, width, height);
  // Chroma is read as NV21 whatever the format. The radius has no effect on the 64 x 64 mean.
  xYCrCb2BGRMaxMinPreviewNeon_NV21(frame, frame + static_cast<ptrdiff_t>(width) * height,
                                   memory.min_map, memory.max_map, width, height);
  AverageFilterShort64_u8(memory.min_map, memory.mean_map, memory.half_width, memory.half_height,
                          30, memory.box_scratch);
  const uint8_t light = scan_light(memory);
  const float strength = static_cast<float>(level) * 7.0f / 117.0f;
  const float inv_a = 1.0f / static_cast<float>(light);  // a light of 0 gives +infinity
  uint8_t* const codes = memory.max_map;
  CalculateTChannelPreviewNeonFloat(memory.mean_map, memory.min_map, codes, memory.half_width,
                                    memory.half_height, strength, inv_a);
  copy_rows(codes, memory.half_width, stream.cached_codes, kCacheRowBytes, memory.half_width,
            memory.half_height);
  memset(stream.cached_light, light, 3);
}

void recover_cached(StreamState& stream, uint8_t* frame, int width, int height,
                    recover::ChromaLayout layout) {
  const recover::LightAnchor anchor = recover::light_anchor(stream.cached_light);
  recover::recover_frame(frame, {stream.cached_codes, kCacheRowBytes}, width, height, layout,
                         anchor, stream.tables);
}

}  // namespace

void process_frame(StreamState& stream, uint8_t* frame, int width, int height, int level) {
  if (!is_accepted(stream, width, height)) return;
  int& parity = *stream.parity;
  // A reuse frame is recovered in the NV21 layout whatever the format.
  recover::ChromaLayout layout = recover::ChromaLayout::kInterleavedVu;
  if (parity == 0) {
    parity = 1;
    estimate(stream, frame, width, height, level);
    if (stream.format == kInputFormatPlanar) layout = recover::ChromaLayout::kPlanarUv;
  } else {
    // A signed remainder; the sum wraps for the largest parity that a host may have set.
    parity = static_cast<int>(static_cast<unsigned>(parity) + 1u) % 2;
  }
  recover_cached(stream, frame, width, height, layout);
}

}  // namespace haze::session
