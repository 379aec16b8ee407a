#include "media/metadata.h"

extern "C" {
#include <libavutil/avutil.h>
#include <libavutil/mem.h>
}

#include <algorithm>
#include <array>
#include <string_view>

#include "media/av_error.h"

namespace dehaze {
namespace {

bool begins_with(std::string_view text, std::string_view start) {
  return text.substr(0, start.size()) == start;
}

// Brands of the MP4 family, the encoder's name, rotation (which has a field of its own), and the
// statistics that MKV writers add ("BPS-eng", "_STATISTICS_TAGS").
bool describes_old_file(std::string_view key) {
  constexpr std::array<std::string_view, 6> kKeys = {
      "major_brand", "minor_version", "compatible_brands", "encoder", "rotate", "vendor_id"};
  constexpr std::array<std::string_view, 5> kPrefixes = {"BPS", "DURATION", "NUMBER_OF_", "ENCODER",
                                                         "_STATISTICS"};
  return std::find(kKeys.begin(), kKeys.end(), key) != kKeys.end() ||
         std::any_of(kPrefixes.begin(), kPrefixes.end(),
                     [&](std::string_view prefix) { return begins_with(key, prefix); });
}

void copy_metadata(const AVDictionary* from, AVDictionary** to) {
  const AVDictionaryEntry* entry = nullptr;
  while ((entry = av_dict_get(from, "", entry, AV_DICT_IGNORE_SUFFIX)) != nullptr) {
    if (!describes_old_file(entry->key)) av_dict_set(to, entry->key, entry->value, 0);
  }
}

}  // namespace

void copy_container_metadata(const AVFormatContext& from, AVFormatContext& to) {
  copy_metadata(from.metadata, &to.metadata);
}

void copy_stream_metadata(const AVStream& from, AVStream& to) {
  copy_metadata(from.metadata, &to.metadata);
}

void copy_chapters(const AVFormatContext& from, AVFormatContext& to, int64_t start,
                   int64_t length) {
  for (unsigned i = 0; i < from.nb_chapters; ++i) {
    const AVChapter& chapter = *from.chapters[i];
    const int64_t begin = av_rescale_q(chapter.start, chapter.time_base, AV_TIME_BASE_Q) - start;
    const int64_t end = av_rescale_q(chapter.end, chapter.time_base, AV_TIME_BASE_Q) - start;
    if (end <= 0 || begin >= length) continue;
    AVChapter* copy = static_cast<AVChapter*>(av_mallocz(sizeof(AVChapter)));
    if (copy == nullptr) throw std::bad_alloc();
    copy->id = chapter.id;
    copy->time_base = AV_TIME_BASE_Q;
    copy->start = std::max<int64_t>(begin, 0);
    copy->end = std::min(end, length);
    copy_metadata(chapter.metadata, &copy->metadata);
    // Owned, and freed, by the container.
    int count = static_cast<int>(to.nb_chapters);
    check(av_dynarray_add_nofree(&to.chapters, &count, copy), "cannot copy the chapters");
    to.nb_chapters = static_cast<unsigned>(count);
  }
}

}  // namespace dehaze
