// Owners for the objects of FFmpeg's libraries.
#pragma once

extern "C" {
#include <libavcodec/avcodec.h>
#include <libavfilter/avfilter.h>
#include <libavformat/avformat.h>
#include <libavutil/dict.h>
#include <libavutil/frame.h>
}

#include <memory>
#include <new>

namespace dehaze {

// Most of these libraries' functions that free an object take the address of the pointer to it.
template <typename Object, void (*free_object)(Object**)>
struct FreeByAddress {
  void operator()(Object* object) const { free_object(&object); }
};

struct CloseIo {
  void operator()(AVIOContext* io) const { avio_closep(&io); }
};

struct FreeOutput {
  void operator()(AVFormatContext* context) const {
    if (!(context->oformat->flags & AVFMT_NOFILE)) avio_closep(&context->pb);
    avformat_free_context(context);
  }
};

using FramePtr = std::unique_ptr<AVFrame, FreeByAddress<AVFrame, av_frame_free>>;
using PacketPtr = std::unique_ptr<AVPacket, FreeByAddress<AVPacket, av_packet_free>>;
using DecoderPtr =
    std::unique_ptr<AVCodecContext, FreeByAddress<AVCodecContext, avcodec_free_context>>;
using EncoderPtr = DecoderPtr;
using FilterGraphPtr =
    std::unique_ptr<AVFilterGraph, FreeByAddress<AVFilterGraph, avfilter_graph_free>>;
using InputPtr =
    std::unique_ptr<AVFormatContext, FreeByAddress<AVFormatContext, avformat_close_input>>;
using OutputPtr = std::unique_ptr<AVFormatContext, FreeOutput>;
using IoPtr = std::unique_ptr<AVIOContext, CloseIo>;

inline FramePtr make_frame() {
  FramePtr frame(av_frame_alloc());
  if (!frame) throw std::bad_alloc();
  return frame;
}

inline PacketPtr make_packet() {
  PacketPtr packet(av_packet_alloc());
  if (!packet) throw std::bad_alloc();
  return packet;
}

// Options of one call; entries that the call did not know stay in it.
class Dictionary {
 public:
  Dictionary() = default;
  ~Dictionary() { av_dict_free(&entries_); }
  Dictionary(const Dictionary&) = delete;
  Dictionary& operator=(const Dictionary&) = delete;

  void set(const char* key, const char* value) { av_dict_set(&entries_, key, value, 0); }
  AVDictionary** address() { return &entries_; }

 private:
  AVDictionary* entries_ = nullptr;
};

}  // namespace dehaze
