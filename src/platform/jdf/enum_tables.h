// Enumeration numbers of the JDF layer and the XML tokens they stand for.
// A table is a comma-separated token list; number n is the n-th token (0 is always "Unknown").
// Writing 0 (unless allowed) or a number past the end throws JDFException; reading a missing
// attribute gives the getter's default, an unknown token gives 0. Tokens match case-sensitively.
#pragma once

#include "platform/jdf/wstring.h"

namespace JDF::Tables {

extern const wchar_t* const NodeActivation;   // 6 Active
extern const wchar_t* const NodeStatus;       // 3 Ready
extern const wchar_t* const ResourceStatus;   // 3 Unavailable, 7 Available
extern const wchar_t* const PartUsage;        // 3 Implicit
extern const wchar_t* const PartIDKey;        // 20 Run, 31 SheetName, 32 Side, 33 SignatureName
extern const wchar_t* const ResourceClass;    // 1 Parameter, 3 Consumable, 4 Quantity
extern const wchar_t* const LinkUsage;        // 1 Input, 2 Output
extern const wchar_t* const ProcessUsage;     // 1 AnyInput, 2 AnyOutput, 3 Any, 9 Marks, 10 Document
extern const wchar_t* const OCGDefault;       // 2 FromPDF
extern const wchar_t* const OCGProcess;       // 2 Print
extern const wchar_t* const MediaType;        // 12 Paper
extern const wchar_t* const GrainDirection;
extern const wchar_t* const MediaUnit;        // 3 Sheet (getter default)
extern const wchar_t* const Side;             // 1 Front, 2 Back
extern const wchar_t* const MetadataContext;  // 2 Document
extern const wchar_t* const MetadataDataType; // 8 PartIDKeys
extern const wchar_t* const StackRestrictions;     // 1 None
extern const wchar_t* const LogicalStackSequence;  // 1 SheetIndex
extern const wchar_t* const BaseOrdReset;          // 2 PagePoolList
extern const wchar_t* const RotatePolicy;          // 1 NoRotate, 3 RotateClockwise, 4 RotateCounterClockwise
extern const wchar_t* const SizePolicy;            // 1 ClipToMaxPage, 3 FitToPage
extern const wchar_t* const BandOrdering;

// The token of number n; throws JDFException when n is out of range, or 0 and !allowUnknown.
WString Token(const wchar_t* table, int n, bool allowUnknown = false);
// The number of token, or 0 when the table does not hold it.
int Number(const wchar_t* table, const WString& token);

}  // namespace JDF::Tables
