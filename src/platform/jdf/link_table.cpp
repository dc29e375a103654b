// Slot tables of the process types Imposition, Interpreting, Rendering and DigitalPrinting.
#include "platform/jdf/link_table.h"

#include "platform/jdf/enum_tables.h"

namespace JDF::detail {
namespace {

struct Entry {
    const wchar_t* type;
    const wchar_t* resource;
    const wchar_t* slots;  // blank-separated tokens: direction, cardinality, process usage
};

const Entry kTable[] = {
    {L"Imposition", L"Layout", L"i_"},
    {L"Imposition", L"RunList", L"o_ i?Marks i_Document"},
    {L"Interpreting", L"InterpretingParams", L"i_"},
    {L"Interpreting", L"RunList", L"o? i_"},
    {L"Rendering", L"Media", L"i?"},
    {L"Rendering", L"RenderingParams", L"i?"},
    {L"Rendering", L"RunList", L"o_ i?"},
    {L"DigitalPrinting", L"Component", L"o?Waste o_ i?Proof i*Input"},
    {L"DigitalPrinting", L"DigitalPrintingParams", L"i_"},
    {L"DigitalPrinting", L"Media", L"i*"},
    {L"DigitalPrinting", L"RunList", L"i_"},
    {L"DigitalPrinting", L"Layout", L"i?"},
};

}  // namespace

bool IsKnownProcessType(const WString& type) {
    for (const Entry& e : kTable)
        if (type == e.type) return true;
    return false;
}

std::vector<LinkSlot> MatchingSlots(const vWString& types, const WString& name, int processUsage) {
    std::vector<LinkSlot> out;
    WString usageToken = processUsage > 3 ? Tables::Token(Tables::ProcessUsage, processUsage) : WString();
    for (size_t t = 0; t < types.size(); ++t) {
        for (const Entry& e : kTable) {
            if (types[t] != e.type || name != e.resource) continue;
            for (const WString& tok : vWString(e.slots)) {
                if (tok.size() < 2) continue;
                LinkSlot s{tok[0], tok[1], WString(tok.substr(2)), static_cast<int>(t)};
                bool take = processUsage == 3 || (processUsage == 1 && s.direction == L'i') ||
                            (processUsage == 2 && s.direction == L'o') ||
                            (processUsage > 3 && s.processUsage == usageToken);
                if (take) out.push_back(s);
            }
        }
    }
    return out;
}

}  // namespace JDF::detail
