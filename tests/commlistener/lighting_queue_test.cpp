#include "commlistener/lighting_queue.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace tendril::test {
namespace {

Bytes Filled(const LightingQueue& queue) {
  const auto filled = queue.buffer().first(queue.fill());
  return {filled.begin(), filled.end()};
}

TEST(LightingQueue, Records_ArePaddedToFourBytesAndLaidEndToEnd) {
  LightingQueue queue;
  queue.Append(LightingRecordType::kAllOff, {});
  queue.Append(LightingRecordType::kDMXIntensities, Bytes{9});
  queue.Append(LightingRecordType::kNyxIntensities, Bytes{1, 2, 3, 4});
  EXPECT_EQ(Filled(queue), (Bytes{1, 0, 0, 0, 3, 0, 1, 0, 9, 0, 0, 0, 4, 0, 4, 0, 1, 2, 3, 4}));
  EXPECT_EQ(queue.buffer().size(), 31u);  // 0, 1, 3, 7, 15, 31

  // What was there before does not shine through in the padding.
  queue.ClearBuffer();
  queue.Append(LightingRecordType::kDMXIntensities, Bytes{7});
  EXPECT_EQ(Filled(queue), (Bytes{3, 0, 1, 0, 7, 0, 0, 0}));
}

TEST(LightingQueue, FullBuffer_BecomesABatchAndTheOldestAreDropped) {
  LightingQueue queue;
  const Bytes data(32756);  // a record of 32760: three of them fit into a message, the fourth does not
  const auto fill_a_batch = [&](std::uint8_t mark) {
    Bytes marked = data;
    marked[0] = mark;
    for (int record = 0; record < 3; ++record) queue.Append(LightingRecordType::kDMXIntensities, marked);
  };
  fill_a_batch(0);
  EXPECT_FALSE(queue.TakeBatch());
  for (int batch = 1; batch <= 200; ++batch) fill_a_batch(static_cast<std::uint8_t>(batch));
  EXPECT_EQ(queue.batches(), 199u);
  for (int batch = 1; batch <= 199; ++batch) {
    const auto taken = queue.TakeBatch();
    ASSERT_TRUE(taken);
    EXPECT_EQ(taken->size(), 3u * 32760u);
    EXPECT_EQ((*taken)[4], batch);
  }
  EXPECT_FALSE(queue.TakeBatch());
  EXPECT_EQ(queue.fill(), 3u * 32760u);
  EXPECT_EQ(queue.buffer()[4], 200);
}

}  // namespace
}  // namespace tendril::test
