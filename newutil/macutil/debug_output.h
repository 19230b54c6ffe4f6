// Where the support library's assertion messages go: a trace level and a debug-output sink.
// Assertions never stop the program; by default their text is discarded.
#pragma once

#include <functional>

// Receives one finished assertion message.
using DebugOutputSink = std::function<void(const char* text)>;

// The level assertions are reported at; always 1 in this component.
int GetTraceLevel();

// Hands the text to the current sink (by default it is discarded). A null text is ignored.
void OutputDebugString(const char* text);

// Installs a sink for every later message; an empty sink restores the discarding default.
void SetDebugOutputSink(DebugOutputSink sink);

// Reports a failed precondition of a support-library operation as
// "Assert -- <expression> in <function> of <module>\n" when the trace level is at least 1.
void ReportAssertion(const char* expression, const char* function, const char* module);
