// Esko XMP ink list reader on expat.
//
// The packet is read as a stream of events; the state below follows exactly the elements the
// list is made of, so nothing but the ink items is kept. Element text is gathered only inside
// the three ink properties.
#include "pdf/xmp_inks.h"

#include <expat.h>
#include <strings.h>

#include <climits>
#include <cstring>
#include <memory>

#include "pdf/pdf_document.h"
#include "pdf/pdf_session.h"

namespace {

bool named(const char* name, const char* wanted) { return strcasecmp(name, wanted) == 0; }

std::string trimmed(const std::string& text) {
    const char* blanks = " \t\r\n";
    size_t first = text.find_first_not_of(blanks);
    if (first == std::string::npos) return {};
    return text.substr(first, text.find_last_not_of(blanks) - first + 1);
}

int inkType(const std::string& text) {
    std::string t = trimmed(text);
    if (named(t.c_str(), "process")) return 0;
    if (named(t.c_str(), "pantone")) return 1;
    if (named(t.c_str(), "designer")) return 2;
    return 3;
}

int inkAttribute(const std::string& text) {
    std::string t = trimmed(text);
    if (named(t.c_str(), "normal")) return 0;
    if (named(t.c_str(), "opaque")) return 1;
    if (named(t.c_str(), "varnish")) return 2;
    if (named(t.c_str(), "technical")) return 3;
    return 4;
}

struct InkListReader {
    enum class Phase { SeekInks, SeekSeq, FirstItem, Items, Done };
    enum class Field { None, Name, Type, Attribute };

    std::vector<XMPInk>& out;
    Phase phase = Phase::SeekInks;
    int depth = 0;          // current element depth
    int inksDepth = -1;     // depth of egGr:inks
    int seqDepth = -1;      // depth of rdf:Seq
    int itemDepth = -1;     // depth of the item being read (seqDepth + 1)
    bool walked = false;
    // The item being read.
    XMPInk ink;
    bool hasName = false;
    Field field = Field::None;
    int fieldDepth = -1;
    std::string text;

    explicit InkListReader(std::vector<XMPInk>& list) : out(list) {}

    void start(const char* name) {
        const int d = depth++;
        switch (phase) {
            case Phase::SeekInks:
                if (named(name, "egGr:inks")) {
                    inksDepth = d;
                    phase = Phase::SeekSeq;
                }
                break;
            case Phase::SeekSeq:
                if (named(name, "rdf:seq")) {
                    seqDepth = d;
                    phase = Phase::FirstItem;
                }
                break;
            case Phase::FirstItem:
                if (d != seqDepth + 1) break;
                if (!named(name, "rdf:li")) {
                    phase = Phase::Done;
                    break;
                }
                phase = Phase::Items;
                [[fallthrough]];
            case Phase::Items:
                if (d == seqDepth + 1) {
                    // every child of the sequence from the first rdf:li on is an item
                    itemDepth = d;
                    walked = true;
                    ink = XMPInk{};
                    hasName = false;
                } else if (d == itemDepth + 1 && field == Field::None) {
                    field = named(name, "egInk:name")        ? Field::Name
                            : named(name, "egInk:type")      ? Field::Type
                            : named(name, "egInk:attribute") ? Field::Attribute
                                                             : Field::None;
                    if (field == Field::Name) hasName = true;
                    fieldDepth = d;
                    text.clear();
                }
                break;
            case Phase::Done:
                break;
        }
    }

    void end() {
        const int d = --depth;
        if (phase == Phase::Items || phase == Phase::FirstItem) {
            if (field != Field::None && d == fieldDepth) {
                if (field == Field::Name) ink.name = text;
                else if (field == Field::Type) ink.type = inkType(text);
                else ink.attribute = inkAttribute(text);
                field = Field::None;
            } else if (d == fieldDepth) {
                fieldDepth = -1;
            }
            if (phase == Phase::Items && d == itemDepth) {
                if (hasName) out.push_back(ink);
                fieldDepth = -1;
            }
            if (d == seqDepth) phase = Phase::Done;
        } else if (phase == Phase::SeekSeq && d == inksDepth) {
            phase = Phase::Done;  // egGr:inks without a sequence
        }
    }

    void characters(const char* s, int len) {
        if (field != Field::None && depth == fieldDepth + 1) text.append(s, static_cast<size_t>(len));
    }
};

void XMLCALL onStart(void* user, const XML_Char* name, const XML_Char**) {
    static_cast<InkListReader*>(user)->start(name);
}
void XMLCALL onEnd(void* user, const XML_Char*) { static_cast<InkListReader*>(user)->end(); }
void XMLCALL onText(void* user, const XML_Char* s, int len) {
    static_cast<InkListReader*>(user)->characters(s, len);
}

}  // namespace

bool readXMPInks(const char* packet, std::vector<XMPInk>& inks) {
    if (!packet) return false;
    std::unique_ptr<XML_ParserStruct, void (*)(XML_Parser)> parser(XML_ParserCreate(nullptr), XML_ParserFree);
    if (!parser) return false;
    std::vector<XMPInk> found;
    InkListReader reader(found);
    XML_SetUserData(parser.get(), &reader);
    XML_SetElementHandler(parser.get(), onStart, onEnd);
    XML_SetCharacterDataHandler(parser.get(), onText);
    const size_t length = std::strlen(packet);
    if (length > static_cast<size_t>(INT_MAX)) return false;
    // The list is complete once its sequence closed; what follows it cannot change the result.
    if (XML_Parse(parser.get(), packet, static_cast<int>(length), XML_TRUE) == XML_STATUS_ERROR &&
        reader.phase != InkListReader::Phase::Done)
        return false;
    inks.insert(inks.end(), found.begin(), found.end());
    return reader.walked;
}

void vorlan::pdf::documentEskoInks(QPDF& pdf, std::vector<std::string>& technicalInks,
                                   std::vector<std::string>& dieInks) {
    std::string xmp = documentXmp(pdf);
    std::vector<XMPInk> inks;
    if (xmp.empty() || !readXMPInks(xmp.c_str(), inks)) return;
    for (const XMPInk& ink : inks) {
        if (isTechnicalVersionInk(ink)) technicalInks.push_back(ink.name);
        if (isDieInk(ink)) dieInks.push_back(ink.name);
    }
}

void collectEskoTechnicalInks(const char* pdfPath, std::vector<std::string>& technicalInks,
                              std::vector<std::string>& dieInks) {
    vorlan::pdf::PdfSession session;
    std::unique_ptr<QPDF> pdf = vorlan::pdf::openDocument(pdfPath, false);
    if (pdf) vorlan::pdf::documentEskoInks(*pdf, technicalInks, dieInks);
}
