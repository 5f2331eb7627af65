// Making records from class tags, in place or on the heap, and the schema
// each class publishes.
#include <gtest/gtest.h>

#include <set>
#include <vector>

#include "RecordTestSupport.h"
#include "Records/Cstates.h"
#include "Records/Interrupts.h"
#include "Records/ProcessUsage.h"
#include "Records/SleepWake.h"
#include "Records/SmcKeys.h"
#include "Records/UserIdle.h"

namespace bw {
namespace {

TEST(RecordFactory, MakesAnEmptyRecordOfEveryClass) {
  for (RecordClass c : test::allRecordClasses()) {
    std::unique_ptr<Record> record = makeRecord(c);
    ASSERT_NE(record, nullptr);
    EXPECT_EQ(record->recordClass(), c);
    EXPECT_STREQ(record->className(), recordClassName(c));
    EXPECT_STREQ(recordSchema(c).className, recordClassName(c));
    EXPECT_EQ(recordSchema(c).recordClass, c);
  }
}

TEST(RecordFactory, ConstructsRecordsInPlaceOneAfterAnother) {
  std::size_t total = 0;
  for (RecordClass c : test::allRecordClasses()) {
    RecordLayout layout = recordLayout(c);
    total = (total + layout.alignment - 1) / layout.alignment * layout.alignment + layout.size;
  }
  alignas(std::max_align_t) static std::byte storage[1 << 14];
  ASSERT_LE(total, sizeof storage);
  std::vector<Record*> records;
  std::size_t used = 0;
  std::mt19937_64 random(3);
  for (RecordClass c : test::allRecordClasses()) {
    RecordLayout layout = recordLayout(c);
    used = (used + layout.alignment - 1) / layout.alignment * layout.alignment;
    Record* record = constructRecord(c, storage + used);
    used += layout.size;
    test::fillRandomly(*record, random);
    records.push_back(record);
  }
  for (Record* record : records) {
    std::unique_ptr<Record> decoded = test::decode(record->recordClass(), record->serialize());
    ASSERT_NE(decoded, nullptr);
    EXPECT_TRUE(decoded->isEqual(*record)) << record->className();
    record->~Record();
  }
}

TEST(RecordFactory, RecordsStayCompact) {
  // Has-flags and small fields share the base's padding; no per-field heap.
  EXPECT_EQ(sizeof(UserIdle), 24u);
  EXPECT_EQ(sizeof(Cstate), 32u);
  EXPECT_LE(sizeof(SleepWake), 16u + 8 * 12 + 2 * 32);
  EXPECT_LE(sizeof(ProcessUsage), 16u + 8 * 31 + 3 * 32);
}

TEST(RecordFactory, RecordCastChecksTheTag) {
  std::unique_ptr<Record> idle = makeRecord(RecordClass::UserIdle);
  EXPECT_NE(recordCast<UserIdle>(idle.get()), nullptr);
  EXPECT_EQ(recordCast<SleepWake>(idle.get()), nullptr);
  EXPECT_EQ(recordCast<UserIdle>(static_cast<Record*>(nullptr)), nullptr);
}

TEST(RecordSchema, FieldsAscendAndKeysAreUniquePerClass) {
  for (RecordClass c : test::allRecordClasses()) {
    const RecordSchema& schema = recordSchema(c);
    ASSERT_FALSE(schema.fields.empty());
    std::set<std::string> keys;
    for (std::size_t i = 0; i < schema.fields.size(); ++i) {
      if (i > 0) {
        EXPECT_LT(schema.fields[i - 1].number, schema.fields[i].number);
      }
      EXPECT_TRUE(keys.insert(schema.fields[i].key).second) << schema.className;
      EXPECT_EQ(schema.field(schema.fields[i].number), &schema.fields[i]);
    }
    EXPECT_EQ(schema.field(1000), nullptr);
  }
}

TEST(RecordSchema, RepeatedFieldsNameTheirElementClass) {
  EXPECT_EQ(Cstates::schema().field(65)->elementClass, RecordClass::Cstate);
  EXPECT_EQ(SmcKeys::schema().field(66)->elementClass, RecordClass::SmcKey);
  EXPECT_EQ(Interrupts::schema().field(64)->elementClass, RecordClass::InterruptVector);
  EXPECT_EQ(Interrupts::schema().field(64)->kind, FieldKind::Message);
}

TEST(RecordSchema, GenericAccessSetsAndReadsFields) {
  UserIdle idle;
  const FieldInfo* change = UserIdle::schema().field(2);
  ASSERT_NE(change, nullptr);
  change->set(idle, Value(7u));
  EXPECT_EQ(idle.change(), 7u);
  EXPECT_EQ(change->get(idle), Value(7u));

  Cstates states;
  const FieldInfo* list = Cstates::schema().field(65);
  EXPECT_TRUE(list->get(states).isNull());
  Cstate element;
  element.setLevel(2);
  list->add(states, element);
  list->add(states, idle);  // not an element: ignored
  EXPECT_EQ(states.statesCount(), 1u);
}

}  // namespace
}  // namespace bw
