// The version descriptions made from inks (by the ink scan and by jobs that come without one):
// separation layers per PDF, one version that switches inks off per content object, and
// optionally a die cut made of die inks.
#pragma once

#include <string>
#include <vector>

struct InkDescription {
    struct Layer {
        int pdfIndex = 0;
        std::string ink;
    };
    struct ContentObject {
        int index = 0;
        const std::vector<std::string>* sepNameOff = nullptr;  // inks switched off (not owned); null: none
    };

    std::vector<Layer> layers;           // one OptionalLayer (isSep) each, in order
    std::string versionName;             // "EskoTechnicalVersion" or "KAVDieLibrary"
    std::vector<std::vector<ContentObject>> surfaces;  // Surface elements, indexed by position
    bool writeDieCut = false;
    std::vector<std::string> dieInks;    // dieSepInternalNames of the die cut
};

// Text of an XML attribute value: & < > " and the white-space characters that attribute
// normalisation would fold (tab, line feed, carriage return) become references, so a reader
// gets the value back unchanged.
std::string escapeXmlAttribute(const std::string& value);

// The description as written to disk: every line ends in CR LF; surface n is written with the
// index text " n ". Ink names are escaped.
std::string formatInkDescription(const InkDescription& description);

// Writes the description to path in one piece (temporary file renamed over it): false, and
// nothing written, when the file cannot be created.
bool writeInkDescription(const char* path, const InkDescription& description);
