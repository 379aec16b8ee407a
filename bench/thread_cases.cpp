// Stages that run one thread per stripe, beside the same work on one thread.
#include <pthread.h>

#include "bench/images.h"
#include "haze_preview.h"

namespace haze::bench {
namespace {

void* do_nothing(void*) { return nullptr; }

// What a threaded stage of no work would cost.
void start_and_join(int count) {
  pthread_t threads[8];
  for (int k = 0; k < count; ++k) pthread_create(&threads[k], nullptr, do_nothing, nullptr);
  for (int k = 0; k < count; ++k) pthread_join(threads[k], nullptr);
}

void add_starts(int count, std::vector<Case>& cases) {
  cases.push_back({"start and join " + std::to_string(count) + " threads",
                   {0, 0},
                   [=] { start_and_join(count); },
                   [] { return Bytes(); },
                   "",
                   {}});
}

void add_maps(Size size, std::vector<Case>& cases) {
  const auto image = shared(hazy_image(size, 3));
  const auto least = shared(Bytes(area(size)));
  const auto most = shared(Bytes(area(size)));
  const auto run = [=] {
    CalculateMaxMinChannelPreview(image->data(), least->data(), most->data(), size.width,
                                  size.height, 0);
  };
  cases.push_back({"min and max maps, 8 threads", size, run,
                   [=] {
                     run();
                     Bytes both = *least;
                     both.insert(both.end(), most->begin(), most->end());
                     return both;
                   },
                   "one thread",
                   [=] {
                     CalculateMaxMinChannel(image->data(), least->data(), most->data(), size.width,
                                            size.height);
                   }});
}

void add_transmission(Size size, std::vector<Case>& cases) {
  const auto mean = shared(hazy_image(size, 1));
  const auto minimum = shared(hazy_image(size, 1));
  const auto codes = shared(Bytes(area(size)));
  const auto run = [=] {
    CalculateTChannelPreview(mean->data(), minimum->data(), codes->data(), size.width, size.height,
                             768, 210, 0);
  };
  cases.push_back({"transmission map, 8 threads", size, run,
                   [=] {
                     run();
                     return *codes;
                   },
                   "the stripes on one thread",
                   [=] {
                     gCalTSrcPreview[0] = mean->data();
                     gCalTSrc1Preview[0] = minimum->data();
                     gCalTDstPreview[0] = codes->data();
                     gCalTWPreview = size.width;
                     gCalTHPreview = size.height;
                     for (int stripe = 0; stripe < 8; ++stripe) CalTThreadPreview(&stripe);
                   }});
}

void add_dark_channel(Size size, std::vector<Case>& cases) {
  const auto image = shared(hazy_image(size, 1));
  const auto dark = shared(Bytes(area(size)));
  const auto histogram = shared(std::vector<int>(256));
  const auto run = [=] {
    CalculateDarkChannel_MultiThreadPreview(image->data(), dark->data(), histogram->data(),
                                            size.width, size.height, 7, 0);
  };
  cases.push_back({"dark channel, radius 7, 4 + 4 threads", size, run,
                   [=] {
                     run();
                     return *dark;
                   },
                   "one thread",
                   [=] {
                     histogram->assign(256, 0);
                     CalculateDarkChannelPreview(image->data(), dark->data(), histogram->data(),
                                                 size.width, size.height, 7);
                   }});
}

}  // namespace

void add_thread_cases(std::vector<Case>& cases) {
  add_starts(4, cases);
  add_starts(8, cases);
  constexpr Size kSizes[] = {{640, 360}, {1280, 720}, {1920, 1080}, {3840, 2160}};
  for (const Size size : kSizes) add_maps(size, cases);
  for (const Size size : kSizes) add_transmission(size, cases);
  for (const Size size : kSizes) add_dark_channel(size, cases);
}

}  // namespace haze::bench
