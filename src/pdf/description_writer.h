// The version descriptions the ink scan writes: one version that switches inks off on every page,
// their layers, and optionally a die cut made of die inks.
#pragma once

#include <string>
#include <vector>

struct ScanDescription {
    std::vector<std::string> layerInks;  // one OptionalLayer (isSep) each, in order
    std::string versionName;             // "EskoTechnicalVersion" or "KAVDieLibrary"
    std::vector<std::string> offInks;    // SepNameOff of every page's content object 0
    int pageCount = 0;                   // one Surface per page
    bool writeDieCut = false;
    std::vector<std::string> dieInks;    // dieSepInternalNames of the die cut
};

// Text of an XML attribute value: & < > " and the white-space characters that attribute
// normalisation would fold (tab, line feed, carriage return) become references.
std::string escapeXmlAttribute(const std::string& value);

// The description as written to disk: every line ends in CR LF.
std::string formatScanDescription(const ScanDescription& description);

// Writes the description to path in one piece (temporary file renamed over it): false, and
// nothing written, when the file cannot be created.
bool writeScanDescription(const char* path, const ScanDescription& description);
