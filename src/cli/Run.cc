#include "cli/Run.h"

#include <cstdio>

#include "base/Console.h"
#include "base/Exception.h"
#include "cli/DailyRun.h"
#include "cli/ModelLoader.h"
#include "cli/OptionParser.h"
#include "cli/Options.h"
#include "cli/RecordModes.h"
#include "reports/JournalDailyReports.h"
#include "reports/JournalSink.h"

namespace bw {

namespace {

void listFiles(const Options& options) {
  StoreQuery query = storeQuery(options);
  query.periodicCutoff = Date::distantPast();
  const char separator = options.listfileswithnull() ? '\0' : '\n';
  std::ostream& o = out();
  for (const std::string& path : runFileList(query)) {
    o << path;
    o.put(separator);
  }
}

[[noreturn]] void notAvailableYet() { exitWithMessage(69, "this mode is not available yet"); }

}  // namespace

void dispatch(const Options& options) {
  switch (options.mode()) {
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

int runMain(int argc, char** argv) {
  try {
    Options options = parseOptions(argc, argv);
    dispatch(options);
    out().flush();
    return 0;
  } catch (const ProcessExit& e) {
    out().flush();
    return e.status;
  } catch (const Exception& e) {
    out().flush();
    err() << "brindlewick: *** uncaught exception " << e.name() << ": " << e.reason() << "\n";
    err().flush();
    return 70;
  }
}

}  // namespace bw
