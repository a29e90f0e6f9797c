#pragma once

/// True when the file can be opened for reading; else issues the error that names it.
bool probeFile(const char* path);
