#pragma once
// The models of one read of the store: the boots sequenced and chained, one
// model per system version, each keeping the records' storage alive.
#include <memory>
#include <vector>

#include "model/Model.h"
#include "store/RecordReader.h"

namespace bw {

std::vector<std::unique_ptr<Model>> modelsFromRecords(RecordsByBoot read);

}  // namespace bw
