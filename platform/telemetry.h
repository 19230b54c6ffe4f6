// The host's telemetry library: the component reports numbered user actions.
#pragma once

#include <functional>

// Receives every reported action id.
using TelemetrySink = std::function<void(int actionId)>;

// Installs where reported actions go; an empty sink restores the default (an info log line).
void SetTelemetrySink(TelemetrySink sink);

// Reports one user action.
void SendTelemetryActionByID(int actionId);
