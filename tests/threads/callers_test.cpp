// Eight callers at once, as far as the library allows it.
#include <gtest/gtest.h>

#include <atomic>
#include <cstdint>
#include <memory>
#include <thread>
#include <vector>

#include "haze_preview.h"
#include "tests/support/effort.h"
#include "tests/support/moods.h"
#include "tests/support/session_pair.h"
#include "tests/surface/blocks.h"

namespace haze::test {
namespace {

constexpr int kCallers = 8;
constexpr int kRounds = effort(6, 1);
constexpr size_t kChoices = 100;

using Calls = std::vector<std::unique_ptr<Call>>;

// Runs all calls at the same time and holds each against its promise.
void run_at_once(Calls& calls, const char* name) {
  std::atomic<size_t> waiting{0};
  std::vector<std::thread> threads;
  for (const auto& call : calls) {
    call->prepare();
  }
  for (const auto& call : calls)
    threads.emplace_back([&calls, &call, &waiting] {
      ++waiting;
      while (waiting < calls.size()) std::this_thread::yield();
      call->run();
    });
  for (std::thread& thread : threads) thread.join();
  for (const auto& call : calls) EXPECT_EQ(call->difference(), "") << name;
}

// The same arguments in every caller, but for the slot and the contents.
Calls draw_for_all(const Block& block, const std::vector<uint8_t>& bytes) {
  Calls calls;
  for (int lane = 0; lane < kCallers; ++lane) {
    Choices choices(bytes.data(), bytes.size(), lane);
    calls.push_back(std::make_unique<Call>(Placement::kPageEnd));
    block.draw(choices, *calls.back());
  }
  return calls;
}

TEST(Callers, EightOfEachBlockWithEqualSizes) {
  Random random(test_seed());
  for (const Block& block : all_blocks()) {
    if (block.beside == Beside::kNone) continue;
    for (int round = 0; round < kRounds && !HasFailure(); ++round) {
      Calls calls = draw_for_all(block, draw_choices(random, kChoices));
      run_at_once(calls, block.name);
    }
  }
}

TEST(Callers, EightOfAnyReentrantBlocks) {
  Random random(test_seed());
  std::vector<Block> blocks;
  for (const Block& block : all_blocks())
    if (block.beside == Beside::kAny) blocks.push_back(block);
  for (int round = 0; round < effort(40, 4) && !HasFailure(); ++round) {
    Calls calls;
    for (int lane = 0; lane < kCallers; ++lane) {
      const std::vector<uint8_t> bytes = draw_choices(random, kChoices);
      Choices choices(bytes.data(), bytes.size(), lane);
      calls.push_back(std::make_unique<Call>(Placement::kPageEnd));
      const size_t which =
          static_cast<size_t>(random.between(0, static_cast<int>(blocks.size()) - 1));
      blocks[which].draw(choices, *calls.back());
    }
    run_at_once(calls, "reentrant blocks");
  }
}

// The session has one caller; that one does not mind what runs beside it.
TEST(Callers, ASessionBesideReentrantBlocks) {
  Random random(test_seed());
  std::vector<Block> blocks;
  for (const Block& block : all_blocks())
    if (block.beside == Beside::kAny) blocks.push_back(block);
  std::vector<std::vector<uint8_t>> choices;
  for (int i = 0; i < 7 * 10; ++i) choices.push_back(draw_choices(random, kChoices));
  std::vector<std::thread> threads;
  for (size_t lane = 0; lane < 7; ++lane)
    threads.emplace_back([&, lane] {
      for (size_t i = lane; i < choices.size(); i += 7) {
        const std::string difference =
            run_drawn_block(blocks, choices[i].data(), choices[i].size());
        EXPECT_EQ(difference, "");
      }
    });
  SessionPair sessions;
  sessions.init(3, 160, 128);
  for (int i = 0; i < 8; ++i)
    sessions.remove_haze(make_hazy_frame(random, 160, 128), 160, 128, 40 * i);
  for (std::thread& thread : threads) thread.join();
}

}  // namespace
}  // namespace haze::test
