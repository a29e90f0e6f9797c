#pragma once

/// The longest name of a SystemOBA CF collection or design, in characters: its file system has short names.
inline constexpr int longestCfName = 8;

/// The last argument of every addDesign call; the device manager interprets it.
inline constexpr int designKind = 27;
