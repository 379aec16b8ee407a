// What a report tells.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "engine.h"
#include "report/jpeg.h"
#include "report/quality.h"
#include "report/tones.h"

namespace dehaze {

// A frame that is shown.
struct View {
  int64_t frame = 0;   // counted from 0
  double seconds = 0;  // from the start
  Jpeg before;
  Jpeg after;
  Jpeg map;
  std::optional<Jpeg> clear;  // the reference
  Tones tones_before;
  Tones tones_after;
  double mean_transmission = 0;
  HazeFindings findings;
  std::optional<Quality> quality_before;  // with a reference
  std::optional<Quality> quality_after;
};

// What is kept of every frame.
struct Moment {
  double seconds = 0;
  HazeFindings findings;
  double luma_before = 0;  // mean
  double luma_after = 0;
};

struct ReportData {
  std::string input_name;
  std::string reference_name;  // empty: none
  bool is_picture = true;
  bool has_times = true;  // false: `seconds` are numbers of frames
  FrameSize size{};       // before it was turned upright
  EngineKind engine = EngineKind::kPhoto;
  EngineOptions options;
  int64_t frames = 0;
  RunReport run;
  std::vector<View> views;  // at least one
  std::vector<Moment> moments;
  std::vector<std::string> notes;
};

}  // namespace dehaze
