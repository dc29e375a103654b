// The inks a page prints with, found by walking its content, its forms and its patterns.
#pragma once

#include <qpdf/QPDFObjectHandle.hh>

#include <string>
#include <vector>

#include "pdf/colour_space.h"

namespace vorlan::pdf {

// Inks of one page, each once, in the order the content first paints with them. Process inks
// appear as "Cyan", "Magenta", "Yellow", "Black"; Separation and DeviceN colorants by name, never
// "None" or "All". Forms, patterns and printable annotation appearances are included. Damaged
// content contributes what could be read before the damage. Throws nothing.
std::vector<std::string> pageInks(QPDFObjectHandle page, ColourSpaceResolver::SharedCache* cache);

}  // namespace vorlan::pdf
