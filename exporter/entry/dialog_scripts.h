// The two ExtendScript dialogs of an export.
#pragma once

namespace exporter
{

// Each is one line: statements with runs of tabs between them.

// Gives the path that the user typed or picked, or the empty text when the dialog was cancelled.
extern const char* const kOpenSaveDialogScript;

// Gives "true" or "false".
extern const char* const kAskOverwriteScript;

} // namespace exporter
