#include "cli/Run.h"

#include <cstdio>

#include "base/Console.h"
#include "base/Exception.h"
#include "base/Terminal.h"
#include "cli/DailyRun.h"
#include "cli/ModelLoader.h"
#include "cli/ModelRunner.h"
#include "cli/OptionParser.h"
#include "cli/Options.h"
#include "cli/RecordModes.h"
#include "cli/StoreWatch.h"
#include "reports/Dashboard.h"
#include "reports/JournalDailyReports.h"
#include "reports/JournalSink.h"
#include "service/AnalysisService.h"

namespace bw {

namespace {

void listFiles(const Options& options) {
  StoreQuery query = storeQuery(options);
  query.periodicCutoff = Date::distantPast();
  const char separator = options.listfileswithnull() ? '\0' : '\n';
  std::ostream& o = out();
  StoreWatch watch;  // tells a person at a terminal of folders it could not list
  for (const std::string& path : runFileList(query, &watch)) {
    o << path;
    o.put(separator);
  }
}

void runDashboard(const Options& options) {
  const DashboardSettings settings{options.show_all(), options.includingSubjobs()};
  runPerModel(options, [&](const Model& model, const std::vector<Range>& ranges) {
    printDashboard(out(), settings, model, ranges);
  });
}

[[noreturn]] void notAvailableYet() { exitWithMessage(69, "this mode is not available yet"); }

}  // namespace

void dispatch(const Options& options) {
  switch (options.mode()) {
    case kModeNone:
    case kModeDashboard:
      runDashboard(options);
      break;
    case kModeListFiles:
      listFiles(options);
      break;
    case kModeDump:
      runRecordDump(options);
      break;
    case kModeShowEvents:
      runEventListing(options);
      break;
    case kModeShowBattery:
      runBatteryPlot(options);
      break;
    case kModeService:
      runAnalysisService(ServiceSettings{options.from_path()});
      break;
    case kModeServiceDebug:
      runServiceDebug(storeQuery(options));
      break;
    case kModeDaily: {
      JournalSink journal;
      JournalDailyReports reports(journal);
      runDaily(options, reports);
      break;
    }
    default:
      notAvailableYet();
  }
}

namespace {

// The end of a run: standard output flushed, the store's damage summed up
// for a person at a terminal.
int finishRun(int status) {
  out().flush();
  printRunDamage();
  return status;
}

}  // namespace

int runMain(int argc, char** argv) {
  try {
    Options options = parseOptions(argc, argv);
    dispatch(options);
    return finishRun(0);
  } catch (const ProcessExit& e) {
    return finishRun(e.status);
  } catch (const Exception& e) {
    out().flush();
    clearTransientLine();
    err() << "brindlewick: *** uncaught exception " << e.name() << ": " << e.reason() << "\n";
    err().flush();
    return finishRun(70);
  }
}

}  // namespace bw
