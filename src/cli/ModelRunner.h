#pragma once
// The per-model runner of the dashboard, the battery plot and the event
// listing: for each model, feed it with the options' domain (and the
// post-install domain with -I), narrow the domain's ranges to the -S states,
// cut out the post-install hour, and hand what remains to the action.
#include <functional>
#include <vector>

#include "base/Range.h"

namespace bw {

class Model;
class Options;

using ModelAction = std::function<void(const Model& model, const std::vector<Range>& ranges)>;

// The -S state names are checked first, before anything is read. When no
// model reaches the action, a person at a terminal is told why.
void runPerModel(const Options& options, const ModelAction& action);

// Ends the run with "no such summarizer: NAME" (an invalid-argument
// exception) for a -S state name that no model could have.
void checkMaskStates(const Options& options);

}  // namespace bw
