#include "Records/Record.h"

#include <google/protobuf/io/coded_stream.h>
#include <google/protobuf/io/zero_copy_stream_impl_lite.h>

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

std::string Record::description() const {
  return format("<%s: %p> ", className(), static_cast<const void*>(this)) +
         describeValue(Value(dictionaryRepresentation()));
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
