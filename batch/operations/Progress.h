#pragma once

class Callback;

/// The progress callback that sessions register: shows updates as a percentage that overwrites itself.
/// Runs on whatever thread the device manager calls it from. Always false.
bool progressCallback(Callback& progress);
