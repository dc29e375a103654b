// The ink list of an XMP packet in the Esko ink schema (egGr:inks / rdf:Seq / rdf:li).
#pragma once

#include <string>
#include <vector>

class QPDF;

struct XMPInk {
    std::string name;   // egInk:name, as written (UTF-8)
    int type = 3;       // egInk:type: process 0, pantone 1, designer 2, anything else 3
    int attribute = 4;  // egInk:attribute: normal 0, opaque 1, varnish 2, technical 3, else 4
};

// Reads the ink list of the packet: the first egGr:inks element (depth first), the first
// rdf:Seq below it, whose first child must be rdf:li; that item and its following siblings are
// the inks. Items without egInk:name are dropped. Names compare ignoring case. True once at least
// one item was walked; false for a packet that is not well-formed or has no such list.
bool readXMPInks(const char* packet, std::vector<XMPInk>& inks);

// Varnish or technical inks switch off in the technical version; technical inks form the die.
inline bool isTechnicalVersionInk(const XMPInk& ink) { return ink.attribute == 2 || ink.attribute == 3; }
inline bool isDieInk(const XMPInk& ink) { return ink.attribute == 3; }

// Appends the technical-version and die ink names of the PDF's XMP ink list, in XMP order.
// A file that cannot be opened, or has no such list, appends nothing.
void collectEskoTechnicalInks(const char* pdfPath, std::vector<std::string>& technicalInks,
                              std::vector<std::string>& dieInks);

namespace vorlan::pdf {
// The same for an open document.
void documentEskoInks(QPDF& pdf, std::vector<std::string>& technicalInks, std::vector<std::string>& dieInks);
}  // namespace vorlan::pdf
