// The PDF ink scan behind vorlan_scan_xmp: turns a PDF's inks into a version description file.
#pragma once

// dieLibrary false (Esko mode): the technical-version inks of the PDF's XMP ink list are switched
// off on every page, and its technical inks form a die cut; nothing is written when there are no
// such inks. dieLibrary true: the page inks that the die library lists as separations are both
// switched off and the die cut; nothing is written when there are none.
// Result: 2 after the die-library mode and 1 after the Esko mode, whatever happened inside.
int scanPdfInksToDescription(const char* pdfPath, char* outputPath, bool dieLibrary);
