// What takes the haze out of frames. There are two: PreviewEngine calls the frame path of the
// library exactly as a camera pipeline does, PhotoEngine chains the library's building blocks at
// full resolution.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "console.h"
#include "engine_options.h"
#include "media/frame_size.h"
#include "media/nv21.h"
#include "media/orientation.h"

namespace dehaze {

// Milliseconds that the haze removal took, one entry per frame, conversions excluded. The preview
// engine estimates the haze on every second frame and reuses that estimate on the frame between, at
// very different cost.
struct FrameTimes {
  std::vector<double> estimate_ms;
  std::vector<double> reuse_ms;
};

// "estimate 0.61 ms median, 0.58 ms minimum, 150 frames; reuse ..." for the kinds that occurred.
std::string describe(const FrameTimes& times);

// What an engine found out about the haze of its last frame.
struct HazeFindings {
  double light_red = 255;  // atmospheric light, 0 ... 255
  double light_green = 255;
  double light_blue = 255;
  double strength = 0;  // in use, 0 ... 100, whether given or found
};

struct RunReport {
  FrameTimes times;
  HazeFindings findings;
};

// Where the frames come from.
struct Source {
  bool is_picture = false;
  double frames_per_second = 0;  // 0 for a picture or if unknown
  Orientation orientation;       // of the frames as they are stored
};

class Engine {
 public:
  Engine() = default;
  virtual ~Engine() = default;
  Engine(const Engine&) = delete;
  Engine& operator=(const Engine&) = delete;

  // Dehazes in place a frame of the size that the engine was made for.
  virtual void process(Nv21Frame& frame) = 0;

  virtual HazeFindings findings() const = 0;

  // Of the last frame: (width / 2) x (height / 2) transmissions in [0, 1].
  virtual std::vector<float> transmission() const = 0;

  RunReport report() const { return {times_, findings()}; }

 protected:
  FrameTimes times_;
};

// The part of a frame of that size that the engine works on. Throws Error for sizes that the engine
// cannot take.
FrameSize engine_frame_size(EngineKind kind, int width, int height);

// kind: as chosen by choose_engine.
std::unique_ptr<Engine> make_engine(EngineKind kind, const EngineOptions& options, int width,
                                    int height, const Source& source, Console& console);

}  // namespace dehaze
