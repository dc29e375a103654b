// Ghostscript's tiffsep device as a judge: which colorant plates of a page carry ink.
#pragma once

#include <map>
#include <string>

namespace vorlan::test {

// Inked pixel count per colorant plate of one page (1-based), rendered at `dpi` with the crop
// box. Colorants gs makes no plate for are absent. Empty map when gs is missing or fails.
std::map<std::string, long> platePixels(const std::string& pdf, int page, int dpi = 20);

// The plates that carry ink, so that a blank plate and a missing one compare equal.
std::map<std::string, long> inkedPlates(const std::map<std::string, long>& plates);
// The inked plates of one page of a file; a failure of the calling test when gs renders nothing.
std::map<std::string, long> inkedPlates(const std::string& pdf, int page);

}  // namespace vorlan::test
