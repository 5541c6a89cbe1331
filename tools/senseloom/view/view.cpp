#include "view/view.h"

#include <memory>
#include <utility>

#include "explain/log_capture.h"
#include "plot/replay_plot.h"
#include "replay/replay_progress.h"
#include "terminal/interrupt.h"
#include "terminal/output_sink.h"
#include "trace/replayer.h"
#include "trace/trace_reader.h"
#include "view/page.h"
#include "view/page_data.h"

namespace senseloom::tool {

void view(std::FILE* out, const ViewArguments& arguments) {
  const InterruptMark mark;
  TraceReader trace(arguments.trace);
  OutputSink sink(out, arguments.page, arguments.trace);
  LogCapture log;
  CallFilter filter(arguments.filter, trace);
  auto data = std::make_unique<PageData>(log, filter);
  const PageData& gathered = *data;
  const auto output = withProgress(std::move(data), trace, out, false);
  Replayer(*output).replay(trace);
  const auto unit = arguments.filter.unit();
  writePage(sink, gathered,
            {.title = traceTitle(arguments.trace),
             .timeUnit = unit ? unit : trace.timeUnit(),
             .classNames = classNamesOf(arguments.classNames, trace)});
  sink.commit();
}

}  // namespace senseloom::tool
