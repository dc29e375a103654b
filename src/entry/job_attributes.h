// Job attributes on the print server, for code outside the worker.
#pragma once

namespace vorlan {

// Sets one attribute of job jobNumber through its own connection and session (all closed again);
// true exactly when the server accepted the value.
bool setJobAttributeOf(int jobNumber, const char* name, const char* value);

}  // namespace vorlan
