#include "bench/goals.h"

#include <cstdio>

namespace haze::bench {
namespace {

struct Goal {
  const char* operation;
  Bounds avx512;
  Bounds avx2;
};

// Copies, recoveries, peer, portable.
constexpr Goal kGoals[] = {
    {"estimate frame", {4.5, 0, 7, 0}, {9, 0, 4, 0}},
    {"estimate frame, classic peer", {0, 0, 60, 0}, {0, 0, 60, 0}},
    {"reuse frame", {2, 0, 8, 0}, {4, 0, 4, 0}},
    {"half-resolution min/max channels", {0.7, 0, 4, 0}, {1.7, 0, 1.7, 0}},
    {"half-resolution BGR from NV21", {0, 0, 1, 0}, {0, 0, 1, 0}},
    {"BGR to YCrCb", {0, 0, 1, 0}, {0, 0, 1, 0}},
    {"YCrCb to BGR", {0, 0, 1, 0}, {0, 0, 1, 0}},
    {"min and max maps of BGR", {0, 0, 1, 0}, {0, 0, 1, 0}},
    {"64 x 64 mean", {0, 0, 2.2, 0}, {0, 0, 1.75, 0}},
    {"mean, radius 30", {0, 0, 2, 0}, {0, 0, 2, 0}},
    {"float mean, radius 8", {0, 0, 2.5, 0}, {0, 0, 2.5, 0}},
    {"float mean, radius 20", {0, 0, 2.5, 0}, {0, 0, 2.5, 0}},
    {"float mean of squares, radius 8", {0, 0, 2.5, 0}, {0, 0, 2.5, 0}},
    {"float mean of squares, radius 20", {0, 0, 2.5, 0}, {0, 0, 2.5, 0}},
    {"four float means, radius 8", {0, 0, 2, 0}, {0, 0, 2, 0}},
    {"four float means, radius 20", {0, 0, 2, 0}, {0, 0, 2, 0}},
    {"guided filter, radius 20", {0, 0, 2.5, 0}, {0, 0, 2.5, 0}},
    {"transmission map", {0, 0, 4, 0}, {0, 0, 2.2, 0}},
    {"dark channel, radius 7", {0, 0, 1, 0}, {0, 0, 1, 0}},
    {"dark channel, radius 15", {0, 0, 1, 0}, {0, 0, 1, 0}},
    {"float transmission, 15 x 15 maximum", {0, 0, 3, 0}, {0, 0, 3, 0}},
    {"frame recovery, NV21", {1.8, 0, 0, 0}, {3.6, 0, 0, 0}},
    {"frame recovery, planar", {1.8, 0, 0, 0}, {3.6, 0, 0, 0}},
    {"slot-table recovery, 8 threads", {0, 3, 0, 0}, {0, 3, 0, 0}},
    {"float-map recovery", {0, 0, 0, 3}, {0, 0, 0, 3}},
    {"reciprocal recovery, averaged", {0, 2, 0, 0}, {0, 2, 0, 0}},
    {"reciprocal recovery, every pixel", {0, 2, 0, 0}, {0, 2, 0, 0}},
    {"reciprocal recovery, float", {0, 0, 0, 3}, {0, 0, 0, 3}},
    {"packed recovery", {0, 2, 0, 0}, {0, 2, 0, 0}},
    {"brightness lift", {0, 2, 0, 0}, {0, 2, 0, 0}},
    {"float zoom 2 x", {0, 0, 1, 0}, {0, 0, 1, 0}},
};

void append(std::string& text, const char* format, double bound) {
  if (bound == 0) return;
  char part[64];
  std::snprintf(part, sizeof part, format, bound);
  text += (text.empty() ? "" : ", ") + std::string(part);
}

bool at_most(double bound, double value) { return bound == 0 || value <= bound; }
bool at_least(double bound, double value) { return bound == 0 || value >= bound; }

}  // namespace

Bounds bounds_of(const std::string& operation, bool avx512) {
  for (const Goal& goal : kGoals)
    if (operation == goal.operation) return avx512 ? goal.avx512 : goal.avx2;
  return {};
}

std::string describe(const Bounds& bounds) {
  std::string text;
  append(text, "<= %g copies", bounds.most_copies);
  append(text, "<= %g recoveries", bounds.most_recoveries);
  append(text, ">= %g x peer", bounds.least_peer);
  append(text, ">= %g x portable", bounds.least_portable);
  return text.empty() ? "-" : text;
}

bool reached(const Bounds& bounds, const Ratios& ratios) {
  return at_most(bounds.most_copies, ratios.copies) &&
         at_most(bounds.most_recoveries, ratios.recoveries) &&
         at_least(bounds.least_peer, ratios.peer) &&
         at_least(bounds.least_portable, ratios.portable);
}

}  // namespace haze::bench
