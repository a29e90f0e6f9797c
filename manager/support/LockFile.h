#pragma once

#include <string>

/// The names of the files by which sessions and board servers of a user tell that they have a cable or a board.
namespace LockFile {

/// The file of all cables that have no name of their own, in the user's runtime directory.
std::string commonPath();
/// The file of the cable of that name, beside the common one; for the empty name the common one itself.
std::string path(const std::string& commonPath, const std::string& cable);

}  // namespace LockFile
