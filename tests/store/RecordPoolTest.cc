// The record pool keeps records back to back in chunks and finds them again
// by their classes' sizes; these tests mix classes of different sizes, with
// heap-owning strings and element vectors, so that a wrong walk or a missed
// destructor shows up as wrong values here or as a leak under the sanitizers.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Records/Cstates.h"
#include "Records/ProcessUsage.h"
#include "Records/UserIdle.h"
#include "store/RecordPool.h"

namespace bw {
namespace {

// Record i of a repeating mix of three classes; every field depends on i.
Record* addRecord(RecordPool& pool, int i) {
  switch (i % 3) {
    case 0: {
      auto* p = pool.create<ProcessUsage>();
      p->setName(std::string("a process name well beyond the inline string buffer #").append(std::to_string(i)));
      p->setPid(static_cast<std::uint64_t>(i));
      return p;
    }
    case 1: {
      auto* c = static_cast<Cstates*>(pool.create(RecordClass::Cstates));
      c->setAbsoluteTime(static_cast<std::uint64_t>(i));
      for (int k = 0; k < i % 5; ++k) c->addStates(Cstate());
      return c;
    }
    default: {
      auto* u = pool.create<UserIdle>();
      u->setAbsoluteTime(static_cast<std::uint64_t>(i));
      return u;
    }
  }
}

// Whether `r` is still record i as addRecord made it.
bool intact(const Record* r, int i) {
  const auto n = static_cast<std::uint64_t>(i);
  switch (i % 3) {
    case 0: {
      const auto* p = recordCast<ProcessUsage>(r);
      return p != nullptr && p->pid() == n && p->name().ends_with(std::string("#").append(std::to_string(i)));
    }
    case 1: {
      const auto* c = recordCast<Cstates>(r);
      return c != nullptr && c->absoluteTime() == n && c->statesCount() == static_cast<std::size_t>(i % 5);
    }
    default: {
      const auto* u = recordCast<UserIdle>(r);
      return u != nullptr && u->absoluteTime() == n;
    }
  }
}

std::vector<Record*> fill(RecordPool& pool, int from, int to) {
  std::vector<Record*> made;
  for (int i = from; i < to; ++i) made.push_back(addRecord(pool, i));
  return made;
}

void expectIntact(const std::vector<Record*>& records, int from) {
  for (std::size_t k = 0; k < records.size(); ++k) {
    ASSERT_TRUE(intact(records[k], from + static_cast<int>(k))) << "record " << from + static_cast<int>(k);
  }
}

// Enough records of the mix to fill several 1 MB chunks.
constexpr int kManyChunks = 20000;

TEST(RecordPool, RecordsOfMixedSizesStayIntactAcrossChunks) {
  RecordPool pool;
  const std::vector<Record*> records = fill(pool, 0, kManyChunks);
  EXPECT_EQ(pool.recordCount(), static_cast<std::size_t>(kManyChunks));
  EXPECT_GT(pool.bytesReserved(), std::size_t{2} << 20);
  expectIntact(records, 0);
}

TEST(RecordPool, RewindWithinAChunkKeepsEarlierRecordsAndReusesTheRest) {
  RecordPool pool;
  const std::vector<Record*> kept = fill(pool, 0, 10);
  const RecordPool::Mark mark = pool.mark();
  fill(pool, 10, 40);
  pool.rewind(mark);
  EXPECT_EQ(pool.recordCount(), 10u);
  expectIntact(kept, 0);

  const std::size_t reserved = pool.bytesReserved();
  const std::vector<Record*> again = fill(pool, 10, 40);
  EXPECT_EQ(pool.bytesReserved(), reserved);
  expectIntact(kept, 0);
  expectIntact(again, 10);
}

TEST(RecordPool, RewindAcrossChunksReusesTheFreedChunks) {
  RecordPool pool;
  const std::vector<Record*> kept = fill(pool, 0, 100);
  const RecordPool::Mark mark = pool.mark();
  fill(pool, 100, kManyChunks);
  const std::size_t reserved = pool.bytesReserved();
  pool.rewind(mark);
  EXPECT_EQ(pool.recordCount(), 100u);
  expectIntact(kept, 0);

  const std::vector<Record*> again = fill(pool, 100, kManyChunks);
  EXPECT_EQ(pool.bytesReserved(), reserved);
  expectIntact(kept, 0);
  expectIntact(again, 100);
}

TEST(RecordPool, RewindToAnEmptyPoolAndRewindingTwiceAreHarmless) {
  RecordPool pool;
  const RecordPool::Mark empty = pool.mark();
  fill(pool, 0, kManyChunks);
  pool.rewind(empty);
  EXPECT_EQ(pool.recordCount(), 0u);
  pool.rewind(empty);
  EXPECT_EQ(pool.recordCount(), 0u);
  expectIntact(fill(pool, 0, 50), 0);
}

TEST(RecordPool, MovingHandsOverEveryRecord) {
  RecordPool source;
  const std::vector<Record*> records = fill(source, 0, kManyChunks);
  RecordPool moved(std::move(source));
  EXPECT_EQ(moved.recordCount(), static_cast<std::size_t>(kManyChunks));
  expectIntact(records, 0);

  RecordPool assigned;
  fill(assigned, 0, 10);  // released by the assignment
  assigned = std::move(moved);
  EXPECT_EQ(assigned.recordCount(), static_cast<std::size_t>(kManyChunks));
  expectIntact(records, 0);
}

}  // namespace
}  // namespace bw
