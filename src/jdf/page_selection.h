// The page selection of the page-range text over a plain sequence of positions.
#pragma once

#include <cstddef>
#include <vector>

class LD_JDF;

// One bit per position 0 … count - 1, set for the positions the worker's page-range mode selects:
// every one ("All"), the 1st, 3rd, … ("Odd"), the 2nd, 4th, … ("Even"), or those the page list
// names (positions beyond count are ignored).
std::vector<bool> selectPositions(LD_JDF& worker, size_t count);
