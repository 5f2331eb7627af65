// Cross-checks the record classes against the published schema
// (src/Records/brindlewick.proto), compiled by protoc, with the protobuf
// library's own dynamic messages: the same fields, numbers and types, and
// the same bytes and values on many random records.
#include <google/protobuf/descriptor.pb.h>
#include <google/protobuf/dynamic_message.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "RecordTestSupport.h"
#include "Records/RecordSchema.h"
#include "store/RecordTypeTable.h"
#include "support/RunTool.h"

namespace bw {
namespace {

namespace pb = google::protobuf;
using pb::FieldDescriptor;

class SchemaCrossCheck : public ::testing::Test {
 protected:
  // Compiles the schema into a descriptor set on protoc's standard output
  // and builds the library's descriptors from it.
  static void SetUpTestSuite() {
    const auto dir = std::filesystem::path(BRINDLEWICK_SOURCE_DIR) / "src" / "Records";
    const test::ToolResult result =
        test::runBinary("/usr/bin/env", {"protoc", "--proto_path=" + dir.string(), "--descriptor_set_out=/dev/stdout",
                                         (dir / "brindlewick.proto").string()});
    pb::FileDescriptorSet set;
    if (result.status != 0 || !set.ParseFromString(result.out) || set.file_size() != 1) {
      problem_ = "protoc (from the PATH) failed: " + result.err;
      return;
    }
    file_ = pool_.BuildFile(set.file(0));
  }

  void SetUp() override { ASSERT_NE(file_, nullptr) << problem_; }

  static const pb::Descriptor* descriptorOf(const std::string& name) {
    return pool_.FindMessageTypeByName("brindlewick." + name);
  }

  static inline std::string problem_ = "descriptors do not build";
  static inline pb::DescriptorPool pool_;
  static inline const pb::FileDescriptor* file_ = nullptr;
};

// The library's name of each field kind's type, in FieldKind order.
const char* const kTypeNames[] = {"uint64", "sint64", "uint32", "int32",  "bool",
                                  "double", "string", "bytes",  "message"};

// The dynamic message in the dictionary form the records give, each value
// of the kind its declared type calls for.
Dictionary dictionaryOf(const pb::Message& m, const RecordSchema& schema) {
  const pb::Reflection* r = m.GetReflection();
  Dictionary d;
  for (const FieldInfo& f : schema.fields) {
    const FieldDescriptor* fd = m.GetDescriptor()->FindFieldByNumber(static_cast<int>(f.number));
    if (fd == nullptr || (fd->is_repeated() ? r->FieldSize(m, fd) == 0 : !r->HasField(m, fd))) continue;
    Value& v = d[f.key];
    switch (fd->type()) {
      case FieldDescriptor::TYPE_UINT64:
        v = Value(static_cast<unsigned long long>(r->GetUInt64(m, fd)));
        break;
      case FieldDescriptor::TYPE_UINT32:
        v = Value(static_cast<unsigned long long>(r->GetUInt32(m, fd)));
        break;
      case FieldDescriptor::TYPE_SINT64:
        v = Value(static_cast<long long>(r->GetInt64(m, fd)));
        break;
      case FieldDescriptor::TYPE_INT32:
        v = Value(static_cast<long long>(r->GetInt32(m, fd)));
        break;
      case FieldDescriptor::TYPE_BOOL:
        v = Value(r->GetBool(m, fd));
        break;
      case FieldDescriptor::TYPE_DOUBLE:
        v = Value(r->GetDouble(m, fd));
        break;
      case FieldDescriptor::TYPE_STRING:
        v = Value(r->GetString(m, fd));
        break;
      case FieldDescriptor::TYPE_BYTES: {
        const std::string b = r->GetString(m, fd);
        v = Value(Data(b.begin(), b.end()));
        break;
      }
      default: {
        Array elements;
        for (int i = 0; i < r->FieldSize(m, fd); ++i)
          elements.emplace_back(dictionaryOf(r->GetRepeatedMessage(m, fd, i), recordSchema(f.elementClass)));
        v = Value(std::move(elements));
      }
    }
  }
  return d;
}

TEST_F(SchemaCrossCheck, EveryClassHasAMessageWithTheSameFields) {
  EXPECT_EQ(file_->message_type_count(), kRecordClassCount + 1);  // and the file framing
  for (RecordClass c : test::allRecordClasses()) {
    const RecordSchema& schema = recordSchema(c);
    const pb::Descriptor* d = descriptorOf(schema.className);
    ASSERT_NE(d, nullptr) << schema.className;
    EXPECT_EQ(static_cast<std::size_t>(d->field_count()), schema.fields.size()) << schema.className;
    for (const FieldInfo& f : schema.fields) {
      SCOPED_TRACE(std::string(schema.className) + "." + f.name);
      const FieldDescriptor* fd = d->FindFieldByNumber(static_cast<int>(f.number));
      ASSERT_NE(fd, nullptr);
      EXPECT_EQ(fd->name(), f.name);
      EXPECT_STREQ(fd->type_name(), kTypeNames[static_cast<int>(f.kind)]);
      EXPECT_EQ(fd->is_required(), f.required);
      EXPECT_EQ(fd->is_repeated(), f.kind == FieldKind::Message);
      if (f.kind == FieldKind::Message) {
        EXPECT_EQ(fd->message_type()->name(), recordClassName(f.elementClass));
      }
    }
  }
}

TEST_F(SchemaCrossCheck, TheFileMessageHasARepeatedFieldForEveryTypeTheReaderKnows) {
  const pb::Descriptor* file = descriptorOf("StatsFile");
  ASSERT_NE(file, nullptr);
  int known = 0;
  for (std::uint64_t type = 0; type < kRecordTypeCount + 2; ++type) {
    const FieldDescriptor* fd = file->FindFieldByNumber(static_cast<int>(type));
    const std::optional<RecordClass> c = recordClassForType(type);
    ASSERT_EQ(fd != nullptr, c.has_value()) << type;
    if (c && ++known) {
      EXPECT_TRUE(fd->is_repeated());
      EXPECT_EQ(fd->message_type()->name(), recordClassName(*c)) << type;
    }
  }
  EXPECT_EQ(file->field_count(), known);
}

// The library parses our bytes to the same values and writes them back
// byte for byte; our round trips (in the codec tests) close the circle.
TEST_F(SchemaCrossCheck, OurBytesParseAsTheSameMessage) {
  pb::DynamicMessageFactory factory(&pool_);
  std::mt19937_64 random(2024);
  for (RecordClass c : test::allRecordClasses()) {
    for (int i = 0; i < 200; ++i) {
      std::unique_ptr<Record> record = makeRecord(c);
      test::fillRandomly(*record, random);
      const std::string bytes = record->serialize();
      std::unique_ptr<pb::Message> message(factory.GetPrototype(descriptorOf(recordClassName(c)))->New());
      ASSERT_TRUE(message->ParseFromString(bytes)) << record->description();
      EXPECT_EQ(dictionaryOf(*message, recordSchema(c)), record->dictionaryRepresentation()) << record->description();
      EXPECT_EQ(message->SerializeAsString(), bytes) << record->description();
    }
  }
}

}  // namespace
}  // namespace bw
