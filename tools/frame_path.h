// The way of every frame through an engine: to NV21, haze removal, NV21.
#pragma once

#include <memory>
#include <vector>

#include "console.h"
#include "engine.h"
#include "media/color_convert.h"
#include "media/ffmpeg_handles.h"
#include "media/frame_size.h"
#include "media/nv21.h"
#include "media/reader.h"

namespace dehaze {

// Of a video; 0 if unknown.
double frames_per_second(const Reader& reader);

Source source_of(const Reader& reader, const AVFrame& first);

class FramePath {
 public:
  // The first frame decides on the engine and on the size that all frames are brought to. Notes
  // what is lost on the way (size, bits, fields).
  FramePath(const AVFrame& first, const Source& source, const EngineOptions& options,
            Console& console);

  const FrameSize& size() const { return size_; }
  AVChromaLocation siting() const { return siting_; }
  const Engine& engine() const { return *engine_; }

  // From the next frame on there is an input().
  void keep_input() { keeps_input_ = true; }

  // The result, or what is to be shown instead of it; valid until the next call.
  const Nv21Frame& run(const AVFrame& frame);

  // Of the last frame.
  const Nv21Frame& input() const { return input_; }
  const Nv21Frame& result() const { return nv21_; }

  // True for pictures by the photo engine. What the preview engine makes is what a camera's screen
  // shows, and a map has nothing of the picture.
  bool has_detail() const;

  // How many times stronger than in the last frame its finest detail is in the result, for each
  // 2 x 2 pixels.
  std::vector<float> detail_gain() const;

 private:
  FramePath(EngineKind kind, const AVFrame& first, const Source& source,
            const EngineOptions& options, Console& console);

  EngineKind kind_;
  FrameSize size_;
  AVChromaLocation siting_;
  bool is_picture_;
  Show show_;
  Console& console_;
  ToNv21 to_nv21_;
  std::unique_ptr<Engine> engine_;
  Nv21Frame nv21_;
  bool keeps_input_;
  Nv21Frame input_ = {0, 0};
  bool change_noted_ = false;
};

}  // namespace dehaze
