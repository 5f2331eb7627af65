// Cross-checks the record classes against the published schema
// (src/Records/brindlewick.proto), compiled by protoc, with the protobuf
// library's own dynamic messages: the same fields, numbers and types, and the same bytes both
// ways on many random records.
#include <google/protobuf/descriptor.pb.h>
#include <google/protobuf/dynamic_message.h>
#include <google/protobuf/io/coded_stream.h>
#include <google/protobuf/io/zero_copy_stream_impl_lite.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>

#include "RecordTestSupport.h"
#include "Records/RecordSchema.h"
#include "support/RunTool.h"
#include "support/TempDir.h"

namespace bw {
namespace {

namespace pb = google::protobuf;
using pb::FieldDescriptor;

std::string findOnPath(const std::string& program) {
  std::stringstream path(std::getenv("PATH") != nullptr ? std::getenv("PATH") : "/usr/bin");
  for (std::string dir; std::getline(path, dir, ':');) {
    std::filesystem::path candidate = std::filesystem::path(dir) / program;
    if (std::filesystem::exists(candidate)) return candidate.string();
  }
  return std::string();
}

// Compiles the schema with the protocol compiler into a descriptor set and
// builds the library's descriptors from it.
class SchemaCrossCheck : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    const std::filesystem::path dir =
        std::filesystem::path(__FILE__).parent_path().parent_path().parent_path() / "src" / "Records";
    const std::string protoc = findOnPath("protoc");
    if (protoc.empty()) {
      problem_ = "protoc is not on the PATH";
      return;
    }
    test::TempDir temp;
    const std::string output = temp / "schema.pb";
    test::ToolResult result =
        test::runBinary(protoc, {"--proto_path=" + dir.string(), "--descriptor_set_out=" + output,
                                 (dir / "brindlewick.proto").string()});
    if (result.status != 0) {
      problem_ = "protoc failed: " + result.err;
      return;
    }
    std::ifstream in(output, std::ios::binary);
    std::stringstream bytes;
    bytes << in.rdbuf();
    pb::FileDescriptorSet set;
    if (!set.ParseFromString(bytes.str()) || set.file_size() != 1) {
      problem_ = "unreadable descriptor set";
      return;
    }
    pool_ = new pb::DescriptorPool();
    file_ = pool_->BuildFile(set.file(0));
    factory_ = new pb::DynamicMessageFactory(pool_);
    if (file_ == nullptr) problem_ = "descriptors do not build";
  }
  static void TearDownTestSuite() {
    delete factory_;
    delete pool_;
  }

  void SetUp() override { ASSERT_NE(file_, nullptr) << problem_; }

  static const pb::Descriptor* descriptorOf(const std::string& name) {
    return pool_->FindMessageTypeByName("brindlewick." + name);
  }
  static std::unique_ptr<pb::Message> newMessage(RecordClass c) {
    const pb::Descriptor* d = descriptorOf(recordClassName(c));
    return d == nullptr ? nullptr : std::unique_ptr<pb::Message>(factory_->GetPrototype(d)->New());
  }

  static inline std::string problem_;
  static inline pb::DescriptorPool* pool_ = nullptr;
  static inline const pb::FileDescriptor* file_ = nullptr;
  static inline pb::DynamicMessageFactory* factory_ = nullptr;
};

FieldDescriptor::Type wireTypeOf(FieldKind kind) {
  switch (kind) {
    case FieldKind::UInt64: return FieldDescriptor::TYPE_UINT64;
    case FieldKind::SInt64: return FieldDescriptor::TYPE_SINT64;
    case FieldKind::UInt32: return FieldDescriptor::TYPE_UINT32;
    case FieldKind::Int32: return FieldDescriptor::TYPE_INT32;
    case FieldKind::Bool: return FieldDescriptor::TYPE_BOOL;
    case FieldKind::Double: return FieldDescriptor::TYPE_DOUBLE;
    case FieldKind::String: return FieldDescriptor::TYPE_STRING;
    case FieldKind::Bytes: return FieldDescriptor::TYPE_BYTES;
    case FieldKind::Message: return FieldDescriptor::TYPE_MESSAGE;
  }
  return FieldDescriptor::TYPE_GROUP;
}

// The dynamic message in the same dictionary form as the records give.
Dictionary dictionaryOf(const pb::Message& m, const RecordSchema& schema) {
  const pb::Reflection* r = m.GetReflection();
  Dictionary d;
  for (const FieldInfo& f : schema.fields) {
    const FieldDescriptor* fd = m.GetDescriptor()->FindFieldByNumber(static_cast<int>(f.number));
    if (fd == nullptr) continue;
    if (fd->is_repeated()) {
      int n = r->FieldSize(m, fd);
      if (n == 0) continue;
      Array elements;
      for (int i = 0; i < n; ++i)
        elements.emplace_back(dictionaryOf(r->GetRepeatedMessage(m, fd, i), recordSchema(f.elementClass)));
      d.emplace(f.key, Value(std::move(elements)));
      continue;
    }
    if (!r->HasField(m, fd)) continue;
    Value v;
    switch (fd->type()) {
      case FieldDescriptor::TYPE_UINT64:
        v = Value(static_cast<unsigned long long>(r->GetUInt64(m, fd)));
        break;
      case FieldDescriptor::TYPE_UINT32:
        v = Value(static_cast<unsigned long long>(r->GetUInt32(m, fd)));
        break;
      case FieldDescriptor::TYPE_SINT64: v = Value(static_cast<long long>(r->GetInt64(m, fd))); break;
      case FieldDescriptor::TYPE_INT32: v = Value(static_cast<long long>(r->GetInt32(m, fd))); break;
      case FieldDescriptor::TYPE_BOOL: v = Value(r->GetBool(m, fd)); break;
      case FieldDescriptor::TYPE_DOUBLE: v = Value(r->GetDouble(m, fd)); break;
      case FieldDescriptor::TYPE_STRING: v = Value(r->GetString(m, fd)); break;
      case FieldDescriptor::TYPE_BYTES: {
        std::string b = r->GetString(m, fd);
        v = Value(Data(b.begin(), b.end()));
        break;
      }
      default: ADD_FAILURE() << "unexpected type of " << fd->full_name();
    }
    d.emplace(f.key, std::move(v));
  }
  return d;
}

void fillDynamically(pb::Message& m, std::mt19937_64& random) {
  const pb::Reflection* r = m.GetReflection();
  const pb::Descriptor* d = m.GetDescriptor();
  for (int i = 0; i < d->field_count(); ++i) {
    const FieldDescriptor* fd = d->field(i);
    if (fd->is_repeated()) {
      for (std::uint64_t n = random() % 4; n > 0; --n) fillDynamically(*r->AddMessage(&m, fd), random);
      continue;
    }
    if (!fd->is_required() && random() % 3 == 0) continue;
    switch (fd->type()) {
      case FieldDescriptor::TYPE_UINT64: r->SetUInt64(&m, fd, test::randomUnsigned(random)); break;
      case FieldDescriptor::TYPE_UINT32:
        r->SetUInt32(&m, fd, static_cast<std::uint32_t>(test::randomUnsigned(random)));
        break;
      case FieldDescriptor::TYPE_SINT64: r->SetInt64(&m, fd, test::randomSigned(random)); break;
      case FieldDescriptor::TYPE_INT32:
        r->SetInt32(&m, fd, static_cast<std::int32_t>(test::randomSigned(random)));
        break;
      case FieldDescriptor::TYPE_BOOL: r->SetBool(&m, fd, random() % 2 == 0); break;
      case FieldDescriptor::TYPE_DOUBLE: r->SetDouble(&m, fd, test::randomDouble(random)); break;
      case FieldDescriptor::TYPE_STRING: r->SetString(&m, fd, test::randomText(random)); break;
      case FieldDescriptor::TYPE_BYTES: r->SetString(&m, fd, test::randomBytes(random)); break;
      default: ADD_FAILURE() << "unexpected type of " << fd->full_name();
    }
  }
}

TEST_F(SchemaCrossCheck, EveryClassHasAMessageWithTheSameFields) {
  EXPECT_EQ(file_->message_type_count(), kRecordClassCount + 1);  // and the file framing
  for (RecordClass c : test::allRecordClasses()) {
    const RecordSchema& schema = recordSchema(c);
    const pb::Descriptor* d = descriptorOf(schema.className);
    ASSERT_NE(d, nullptr) << schema.className;
    EXPECT_EQ(static_cast<std::size_t>(d->field_count()), schema.fields.size()) << schema.className;
    for (const FieldInfo& f : schema.fields) {
      const FieldDescriptor* fd = d->FindFieldByNumber(static_cast<int>(f.number));
      ASSERT_NE(fd, nullptr) << schema.className << "." << f.name;
      EXPECT_EQ(fd->name(), f.name) << schema.className;
      EXPECT_EQ(fd->type(), wireTypeOf(f.kind)) << schema.className << "." << f.name;
      if (f.kind == FieldKind::Message) {
        EXPECT_TRUE(fd->is_repeated()) << schema.className << "." << f.name;
        EXPECT_EQ(fd->message_type()->name(), recordClassName(f.elementClass));
      } else {
        EXPECT_EQ(fd->is_required(), f.required) << schema.className << "." << f.name;
        EXPECT_TRUE(fd->is_required() || fd->is_optional());
      }
    }
  }
}

TEST_F(SchemaCrossCheck, TheFileMessageHasOneRepeatedFieldPerTypeNumber) {
  const std::map<int, std::string> types = {
      {1, "LogStartsV0"},  {2, "BatteryChargeLevel"}, {3, "PackageEnergyStatistics"},
      {4, "ProcessUsage"}, {6, "PowerStateChange"},   {7, "SleepWake"},
      {8, "SleepWake"},    {9, "TimeChange"},         {10, "DateChange"},
      {11, "UserIdle"},    {12, "LogStartsV1"},       {13, "DeviceChange"},
      {14, "Interrupts"},  {15, "SystemMemory"},      {16, "BluetoothPowerResidency"},
      {17, "SystemIO"},    {18, "Cstates"},           {19, "DisplayBrightness"},
      {20, "FanState"},    {21, "SmcKeys"},           {22, "PanelSelfRefresh"}};
  const pb::Descriptor* file = descriptorOf("StatsFile");
  ASSERT_NE(file, nullptr);
  EXPECT_EQ(static_cast<std::size_t>(file->field_count()), types.size());
  for (const auto& [number, name] : types) {
    const FieldDescriptor* fd = file->FindFieldByNumber(number);
    ASSERT_NE(fd, nullptr) << number;
    EXPECT_TRUE(fd->is_repeated());
    EXPECT_EQ(fd->message_type()->name(), name) << number;
  }
}

TEST_F(SchemaCrossCheck, OurBytesParseAsTheSameMessage) {
  std::mt19937_64 random(2024);
  for (RecordClass c : test::allRecordClasses()) {
    for (int i = 0; i < 200; ++i) {
      std::unique_ptr<Record> record = makeRecord(c);
      test::fillRandomly(*record, random);
      const std::string bytes = record->serialize();
      std::unique_ptr<pb::Message> message = newMessage(c);
      ASSERT_NE(message, nullptr);
      ASSERT_TRUE(message->ParseFromString(bytes)) << record->description();
      EXPECT_EQ(dictionaryOf(*message, recordSchema(c)), record->dictionaryRepresentation())
          << record->description();
      EXPECT_EQ(message->SerializeAsString(), bytes) << record->description();
    }
  }
}

TEST_F(SchemaCrossCheck, TheLibrarysBytesDecodeToTheSameRecord) {
  std::mt19937_64 random(4202);
  for (RecordClass c : test::allRecordClasses()) {
    for (int i = 0; i < 200; ++i) {
      std::unique_ptr<pb::Message> message = newMessage(c);
      ASSERT_NE(message, nullptr);
      fillDynamically(*message, random);
      const std::string bytes = message->SerializeAsString();
      std::unique_ptr<Record> record = test::decode(c, bytes);
      ASSERT_NE(record, nullptr) << message->DebugString();
      EXPECT_EQ(record->dictionaryRepresentation(), dictionaryOf(*message, recordSchema(c)))
          << message->DebugString();
      EXPECT_EQ(record->serialize(), bytes) << message->DebugString();
    }
  }
}

TEST_F(SchemaCrossCheck, AFramedStreamOfRecordsParsesAsTheFileMessage) {
  std::mt19937_64 random(7);
  const std::vector<std::pair<int, RecordClass>> records = {
      {12, RecordClass::LogStartsV1}, {7, RecordClass::SleepWake},    {8, RecordClass::SleepWake},
      {14, RecordClass::Interrupts},  {4, RecordClass::ProcessUsage}, {14, RecordClass::Interrupts}};
  std::string stream;
  std::vector<std::unique_ptr<Record>> written;
  {
    pb::io::StringOutputStream out(&stream);
    pb::io::CodedOutputStream coded(&out);
    for (const auto& [type, c] : records) {
      written.push_back(makeRecord(c));
      test::fillRandomly(*written.back(), random);
      coded.WriteVarint32(static_cast<std::uint32_t>(type) << 3 | 2);
      coded.WriteVarint32(static_cast<std::uint32_t>(written.back()->byteSize()));
      written.back()->writeTo(coded);
    }
  }
  const pb::Descriptor* fileType = descriptorOf("StatsFile");
  ASSERT_NE(fileType, nullptr);
  std::unique_ptr<pb::Message> file(factory_->GetPrototype(fileType)->New());
  ASSERT_TRUE(file->ParseFromString(stream));
  const pb::Reflection* r = file->GetReflection();
  EXPECT_EQ(r->FieldSize(*file, fileType->FindFieldByNumber(12)), 1);
  EXPECT_EQ(r->FieldSize(*file, fileType->FindFieldByNumber(7)), 1);
  EXPECT_EQ(r->FieldSize(*file, fileType->FindFieldByNumber(8)), 1);
  EXPECT_EQ(r->FieldSize(*file, fileType->FindFieldByNumber(4)), 1);
  ASSERT_EQ(r->FieldSize(*file, fileType->FindFieldByNumber(14)), 2);
  EXPECT_EQ(dictionaryOf(r->GetRepeatedMessage(*file, fileType->FindFieldByNumber(14), 1),
                         recordSchema(RecordClass::Interrupts)),
            written[5]->dictionaryRepresentation());
}

}  // namespace
}  // namespace bw
