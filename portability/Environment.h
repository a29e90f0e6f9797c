#pragma once

/// Both give 0 or the system's error number.
int setVariable(const char* name, const char* value);
int unsetVariable(const char* name);
