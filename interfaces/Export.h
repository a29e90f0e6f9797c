#pragma once

/// Marks what a shared library shows to others; everything else is hidden.
#if defined(_WIN32)
#define TESSEL_EXPORT __declspec(dllexport)
#else
#define TESSEL_EXPORT __attribute__((visibility("default")))
#endif
