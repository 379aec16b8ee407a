// Inputs of the dehaze tool through its own reader: raw frames, Y4M, anything else by its content.
//
// Raw frames and the Y4M made here have to come back byte by byte. Whatever else a file holds, the
// reader gives frames or throws an Error.
#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <optional>
#include <string>
#include <vector>

#include "errors.h"
#include "media/av_error.h"
#include "media/color_convert.h"
#include "media/reader.h"
#include "raw_format.h"
#include "tests/surface/choices.h"

namespace haze::fuzz {
namespace {

using dehaze::RawFormat;
using dehaze::RawLayout;
using test::Choices;
using Bytes = std::vector<uint8_t>;

constexpr size_t kMostFrames = 4;
constexpr int64_t kMostPixels = 1 << 18;

[[noreturn]] void fail(const char* what) {
  std::fprintf(stderr, "%s\n", what);
  std::abort();
}

// A file without a name, to be opened by its path.
class MemoryFile {
 public:
  explicit MemoryFile(const Bytes& content) : file_(memfd_create("input", 0)) {
    if (file_ < 0) fail("memfd_create");
    size_t written = 0;
    while (written < content.size()) {
      const ssize_t count = write(file_, content.data() + written, content.size() - written);
      if (count <= 0) fail("write");
      written += static_cast<size_t>(count);
    }
  }
  MemoryFile(const MemoryFile&) = delete;
  MemoryFile& operator=(const MemoryFile&) = delete;
  ~MemoryFile() { close(file_); }

  std::string path() const { return "/proc/self/fd/" + std::to_string(file_); }

 private:
  int file_;
};

void append_plane(const AVFrame& frame, int plane, int row_bytes, int rows, Bytes& to) {
  for (int y = 0; y < rows; ++y) {
    const uint8_t* const row =
        frame.data[plane] + static_cast<ptrdiff_t>(y) * frame.linesize[plane];
    to.insert(to.end(), row, row + row_bytes);
  }
}

// The samples of a 4:2:0 frame in the order in which files have them.
Bytes samples_of(const AVFrame& frame) {
  const int half_width = (frame.width + 1) / 2;
  const int half_height = (frame.height + 1) / 2;
  Bytes samples;
  append_plane(frame, 0, frame.width, frame.height, samples);
  if (frame.data[2] == nullptr) {
    append_plane(frame, 1, 2 * half_width, half_height, samples);
  } else {
    append_plane(frame, 1, half_width, half_height, samples);
    append_plane(frame, 2, half_width, half_height, samples);
  }
  return samples;
}

// Frames are small, so that inputs of a few bytes make some.
struct Dimensions {
  int width;
  int height;

  size_t frame_bytes() const {
    const int chroma = (width + 1) / 2 * ((height + 1) / 2);
    return static_cast<size_t>(width * height + 2 * chroma);
  }
};

Dimensions draw_dimensions(Choices& choices) {
  return {choices.between(1, 40), choices.between(1, 24)};
}

// To what the library takes, as the tool does with the first frame that it reads.
void convert(const dehaze::Reader& reader, const AVFrame& frame) {
  if (int64_t{frame.width} * frame.height > kMostPixels) return;
  const dehaze::FrameSize size = dehaze::whole_frame_size(frame.width, frame.height);
  dehaze::ToNv21 to_nv21(size, reader.is_picture(), AVCHROMA_LOC_LEFT);
  dehaze::Nv21Frame nv21(size.padded_width(), size.padded_height());
  to_nv21.convert(frame, nv21);
}

// Reads some frames and gives each to visit(frame). What is wrong with the input ends it early.
template <class Visit>
void read_frames(const Bytes& content, const std::optional<RawFormat>& raw, const Visit& visit) {
  const MemoryFile file(content);
  try {
    dehaze::Reader reader(file.path(), raw);
    reader.frame_rate();
    reader.has_constant_rate();
    reader.frame_count();
    const dehaze::FramePtr frame = dehaze::make_frame();
    for (size_t count = 0; count < kMostFrames && reader.read_frame(frame.get()); ++count) {
      reader.sample_aspect_ratio(*frame);
      visit(*frame);
      convert(reader, *frame);
    }
  } catch (const dehaze::Error&) {
  }
  dehaze::take_last_logged_error();
}

// `frames` holds whole frames of the given size: each has to come back.
void expect_frames(const Bytes& content, const std::optional<RawFormat>& raw, Dimensions size,
                   const Bytes& frames) {
  size_t position = 0;
  read_frames(content, raw, [&](const AVFrame& frame) {
    const Bytes samples = samples_of(frame);
    if (frame.width != size.width || frame.height != size.height) fail("a frame of another size");
    if (position + samples.size() > frames.size()) fail("more samples than there were");
    const auto from = frames.begin() + static_cast<ptrdiff_t>(position);
    if (!std::equal(samples.begin(), samples.end(), from)) fail("samples differ");
    position += samples.size();
  });
  // A frame that the conversion does not take ends the reading after it.
  const size_t whole = std::min(frames.size() / size.frame_bytes(), kMostFrames);
  const bool all = size.width >= dehaze::kMinPhotoSide && size.height >= dehaze::kMinPhotoSide;
  const size_t expected = all ? whole : std::min<size_t>(whole, 1);
  if (position != expected * size.frame_bytes()) fail("not all frames came back");
}

Bytes draw_samples(Choices& choices, size_t count) {
  const Bytes pattern = choices.rest(count);
  Bytes samples(count, 128);
  for (size_t i = 0; i < count && !pattern.empty(); ++i) samples[i] = pattern[i % pattern.size()];
  return samples;
}

void read_raw(Choices& choices) {
  const RawLayout layouts[] = {RawLayout::kI420, RawLayout::kYv12, RawLayout::kNv12,
                               RawLayout::kNv21};
  const Dimensions size = draw_dimensions(choices);
  RawFormat format;
  format.width = size.width;
  format.height = size.height;
  format.layout = choices.one_of(layouts);
  format.is_full_range = choices.one_in(2);
  format.rate_num = choices.between(1, 60000);
  format.rate_den = choices.between(1, 1001);
  const size_t frames = static_cast<size_t>(choices.between(1, 3));
  const Bytes samples = draw_samples(choices, frames * size.frame_bytes());
  // The reader gives YV12 with its planes in the order of the others.
  if (format.layout == RawLayout::kYv12)
    read_frames(samples, format, [](const AVFrame&) {});
  else
    expect_frames(samples, format, size, samples);
}

void read_y4m(Choices& choices) {
  const char* const tags[] = {"", " C420jpeg", " C420mpeg2", " C420paldv", " C420"};
  const char* const extras[] = {"", " Ip", " It", " A1:1", " F30000:1001", " XCOLORRANGE=FULL"};
  const Dimensions size = draw_dimensions(choices);
  std::string header = "YUV4MPEG2 W" + std::to_string(size.width) + " H" +
                       std::to_string(size.height) + choices.one_of(tags) + choices.one_of(extras);
  Bytes content(header.begin(), header.end());
  content.push_back('\n');
  const size_t frames = static_cast<size_t>(choices.between(1, 3));
  const Bytes samples = draw_samples(choices, frames * size.frame_bytes());
  const std::string mark = "FRAME\n";
  for (size_t i = 0; i < frames; ++i) {
    content.insert(content.end(), mark.begin(), mark.end());
    const auto from = samples.begin() + static_cast<ptrdiff_t>(i * size.frame_bytes());
    content.insert(content.end(), from, from + static_cast<ptrdiff_t>(size.frame_bytes()));
  }
  expect_frames(content, std::nullopt, size, samples);
}

// The WebP decoder of FFmpeg 5.1 ends the program, by an assertion, on some damaged files.
bool may_end_the_program(const Bytes& content) {
  const std::string mark = "WEBP";
  return std::search(content.begin(), content.end(), mark.begin(), mark.end()) != content.end();
}

void read_anything(Choices& choices, size_t count) {
  const Bytes content = choices.rest(count);
  if (!may_end_the_program(content)) read_frames(content, std::nullopt, [](const AVFrame&) {});
}

void parse_raw_format(Choices& choices, size_t count) {
  const Bytes text = choices.rest(count);
  try {
    const RawFormat format = dehaze::parse_raw_format(std::string(text.begin(), text.end()));
    if (format.width < 1 || format.height < 1 || format.rate_num < 1 || format.rate_den < 1)
      fail("a raw format that cannot be");
  } catch (const dehaze::Error&) {
  }
}

}  // namespace
}  // namespace haze::fuzz

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* bytes, size_t count) {
  static const bool captured = (dehaze::capture_av_log(), true);
  (void)captured;
  haze::test::Choices choices(bytes, count);
  switch (choices.between(0, 3)) {
    case 0:
      haze::fuzz::read_raw(choices);
      break;
    case 1:
      haze::fuzz::read_y4m(choices);
      break;
    case 2:
      haze::fuzz::read_anything(choices, count);
      break;
    default:
      haze::fuzz::parse_raw_format(choices, count);
      break;
  }
  return 0;
}
