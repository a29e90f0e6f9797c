#pragma once

#include <string>
#include <string_view>
#include <vector>

/// Of the names, those that `wanted` may have been meant to be, the nearest first; at most three.
std::vector<std::string> nearNames(std::string_view wanted, const std::vector<std::string>& names);
