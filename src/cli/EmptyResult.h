#pragma once
// Why a mode printed nothing, told to a person at a terminal (standard error
// only): no records at all, no records in the sample range, no time in the
// -S states, or only post-install time. The note names the range asked for
// and the span the data covers, so the next try can aim right.
#include <memory>
#include <string>
#include <vector>

namespace bw {

class Model;
class Options;

// How far a run got before running out of things to print; later stages
// win when models differ.
enum class EmptyStage {
  kNoRecords = 0,        // no model: nothing read, or everything filtered out
  kNoRange = 1,          // the sample range holds none of the data
  kNoStateTime = 2,      // the -S states never held within the sample range
  kOnlyPostInstall = 3,  // -I cut out all that was left
};

// The note's text, without the "brindlewick: " prefix.
std::string emptyResultText(const Options& options, const std::vector<std::unique_ptr<Model>>& models,
                            EmptyStage stage);
// Writes that text as a terminal note.
void noteEmptyResult(const Options& options, const std::vector<std::unique_ptr<Model>>& models, EmptyStage stage);

}  // namespace bw
