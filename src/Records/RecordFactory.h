#pragma once
// Empty records made from a class tag: what the record reader does per type
// number. Records can be made on the heap or placement-constructed into
// storage the caller owns (bulk allocation); `recordLayout` tells how much
// storage and which alignment a class needs.
#include <cstddef>
#include <memory>

#include "Records/Record.h"
#include "Records/RecordSchema.h"

namespace bw {

struct RecordLayout {
  std::size_t size;
  std::size_t alignment;
};

// A new empty record of class `c`.
std::unique_ptr<Record> makeRecord(RecordClass c);

// The size and alignment of class `c`'s objects.
RecordLayout recordLayout(RecordClass c);

// Constructs an empty record of class `c` in `storage`, which must hold
// recordLayout(c).size bytes at recordLayout(c).alignment. The caller ends
// it with `record->~Record()` before reusing or freeing the storage.
Record* constructRecord(RecordClass c, void* storage);

// The field table of class `c`.
const RecordSchema& recordSchema(RecordClass c);

}  // namespace bw
