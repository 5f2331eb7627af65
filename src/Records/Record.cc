#include "Records/Record.h"

#include <google/protobuf/io/coded_stream.h>
#include <google/protobuf/io/zero_copy_stream_impl_lite.h>

#include "Records/RecordFactory.h"
#include "base/Console.h"
#include "base/Exception.h"

namespace bw {

const char* recordClassName(RecordClass c) {
  static const char* const kNames[] = {
#define BW_RECORD_NAME(name, ...) #name,
      BW_RECORD_CLASSES(BW_RECORD_NAME)
#undef BW_RECORD_NAME
  };
  return kNames[static_cast<int>(c)];
}

void appendDictionaryText(const Record& record, const RecordSchema& schema, std::string& out, int level) {
  out += "{\n";
  for (std::uint8_t index : schema.keyOrder) schema.fields[index].appendText(record, out, level + 1);
  appendDescribedIndent(out, level);
  out.push_back('}');
}

void Record::appendDictionaryText(std::string& out, int level) const {
  ::bw::appendDictionaryText(*this, recordSchema(recordClass()), out, level);
}

std::string Record::description() const {
  std::string text = format("<%s: %p> ", className(), static_cast<const void*>(this));
  appendDictionaryText(text);
  return text;
}

bool Record::appendPrettyPrint(std::string& out) const {
  std::optional<std::string> text = prettyPrint();
  if (!text) return false;
  out += *text;
  return true;
}

std::string Record::serialize() const {
  std::string bytes;
  {
    google::protobuf::io::StringOutputStream stream(&bytes);
    google::protobuf::io::CodedOutputStream output(&stream);
    writeTo(output);
  }
  return bytes;
}

}  // namespace bw
