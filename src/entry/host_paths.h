// Output files named by the host: the worker asks the host's FilePathCallback for every new file.
#pragma once

#include <string>

class LD_JDF;

// Asks the host for a new output file path (a 2048-byte buffer, cut at its end). Empty when the
// worker has no callback or the host left the buffer empty.
std::string askHostForFilePath(LD_JDF& worker);
