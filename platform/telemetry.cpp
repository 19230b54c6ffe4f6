#include "platform/telemetry.h"

#include <utility>

#include "platform/trace.h"

namespace {

TelemetrySink& Sink() {
    static TelemetrySink sink;
    return sink;
}

}  // namespace

void SetTelemetrySink(TelemetrySink sink) {
    Sink() = std::move(sink);
}

void SendTelemetryActionByID(int actionId) {
    if (Sink()) {
        Sink()(actionId);
    } else {
        MacInfoTrace2("Telemetry", "action %d", actionId);
    }
}
