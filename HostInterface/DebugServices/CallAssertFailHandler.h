#pragma once

namespace DebugServices
{

/// Receives a failed assertion: the expression's text, and where it stands.
using AssertFailHandler = void (*)(const char* expression, const char* file, unsigned line);

/// Replaces the handler; null restores the first one, which logs and goes on. [any]
void SetAssertFailHandler(AssertFailHandler handler);

/// Reports a failed assertion to the host's handler. [any]
void CallAssertFailHandler(const char* expression, const char* file, unsigned line);

}
