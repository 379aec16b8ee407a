#include "media/av_error.h"

extern "C" {
#include <libavutil/error.h>
#include <libavutil/log.h>
}

#include <signal.h>

#include <atomic>
#include <cstdarg>
#include <cstdio>
#include <mutex>

#include "errors.h"
#include "interrupt.h"

namespace dehaze {
namespace {

// Codecs log from threads of their own.
std::mutex log_mutex;
std::string last_logged_error;
std::atomic<int64_t> demuxer_errors{0};

bool is_from_demuxer(void* sender) {
  if (sender == nullptr) return false;
  const AVClass* av_class = *static_cast<AVClass**>(sender);
  if (av_class == nullptr || av_class->get_category == nullptr) return false;
  return av_class->get_category(sender) == AV_CLASS_CATEGORY_DEMUXER;
}

void keep_log_line(void* sender, int level, const char* format, va_list arguments) {
  if (level > AV_LOG_ERROR) return;
  char line[256];
  std::vsnprintf(line, sizeof(line), format, arguments);
  std::string text(line);
  while (!text.empty() && (text.back() == '\n' || text.back() == ' ' || text.back() == '.')) {
    text.pop_back();
  }
  if (text.empty()) return;
  if (is_from_demuxer(sender)) ++demuxer_errors;
  const std::lock_guard<std::mutex> lock(log_mutex);
  last_logged_error = text;
}

}  // namespace

void capture_av_log() { av_log_set_callback(keep_log_line); }

int64_t demuxer_errors_logged() { return demuxer_errors; }

std::string take_last_logged_error() {
  const std::lock_guard<std::mutex> lock(log_mutex);
  std::string line;
  line.swap(last_logged_error);
  return line;
}

int check(int result, const std::string& what) {
  if (result >= 0) return result;
  throw_if_interrupted();
  if (result == AVERROR(EPIPE)) throw Interrupted(SIGPIPE);
  char reason[AV_ERROR_MAX_STRING_SIZE] = {};
  av_strerror(result, reason, sizeof(reason));
  const std::string logged = take_last_logged_error();
  throw Error(what + ": " + reason + (logged.empty() ? "" : " (" + logged + ")"));
}

}  // namespace dehaze
