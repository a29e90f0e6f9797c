#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace fuzz {

/// A directory of its own for everything that sessions write, with the files that their commands name.
class Scratch {
 public:
  Scratch();
  ~Scratch();
  Scratch(const Scratch&) = delete;
  Scratch& operator=(const Scratch&) = delete;

  /// While it lives, the directory is the current one. At its end the working directory and the environment
  /// are as before and the directory holds the named files only, as they were.
  class Visit {
   public:
    /// `description` becomes the content of board.pdr.
    Visit(const Scratch& scratch, std::string_view description);
    ~Visit();
    Visit(const Visit&) = delete;
    Visit& operator=(const Visit&) = delete;

   private:
    const Scratch& scratch_;
  };

  const std::string& path() const { return path_; }

 private:
  void tidy() const;

  std::string path_;
  int home_;  ///< the directory that was the current one before
  std::vector<std::string> environment_;
};

}  // namespace fuzz
