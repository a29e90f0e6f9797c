#pragma once

#include <string>

/// What the port word of setCable stands for.
struct PortWord {
  /// The type that the device manager is given; null for a word that names no cable. For a file cable it is
  /// also the extension of the file, whose name is given in its place.
  const char* type = nullptr;
  bool fileCable = false;
  int index = -1;
  int baud = 9600;  ///< bits per second; -1 for automatic or not applicable
};

PortWord classifyPort(const std::string& word);
