// Token tables of the enumerations the layer writes and reads.
#include "platform/jdf/enum_tables.h"

#include <unordered_map>

#include "platform/jdf/exception.h"

namespace JDF::Tables {

const wchar_t* const NodeActivation = L"Unknown,Inactive,Informative,Held,TestRun,TestRunAndGo,Active";
const wchar_t* const NodeStatus =
    L"Unknown,Waiting,TestRunInProgress,Ready,FailedTestRun,Setup,InProgress,Cleanup,Spawned,"
    L"Suspended,Stopped,Completed,Aborted,Pool,Part";
const wchar_t* const ResourceStatus = L"Unknown,Incomplete,Rejected,Unavailable,InUse,Draft,Complete,Available";
const wchar_t* const PartUsage = L"Unknown,Explicit,Sparse,Implicit";
const wchar_t* const PartIDKey =
    L"Unknown,BinderySignatureName,BlockName,BundleItemIndex,CellIndex,Condition,DocCopies,DocIndex,"
    L"DocRunIndex,DocSheetIndex,ItemNames,FountainNumber,LayerIDs,Location,Option,PageNumber,PartVersion,"
    L"PreflightRule,PreviewType,RibbonName,Run,RunIndex,RunTags,RunPage,Separation,SectionIndex,"
    L"SetDocIndex,SetIndex,SetRunIndex,SetSheetIndex,SheetIndex,SheetName,Side,SignatureName,TileID,"
    L"WebName,DeliveryUnit0,DeliveryUnit1,DeliveryUnit2,DeliveryUnit3,DeliveryUnit4,DeliveryUnit5,"
    L"DeliveryUnit6,DeliveryUnit7,DeliveryUnit8,DeliveryUnit9,DocTags,Edition,EditionVersion,PageTags,"
    L"PlateLayout,RunSet,SetTags,SubRun,WebProduct,WebSetup";
const wchar_t* const ResourceClass = L"Unknown,Parameter,Handling,Consumable,Quantity,Implementation,PlaceHolder,Intent";
const wchar_t* const LinkUsage = L"Unknown,Input,Output";
const wchar_t* const ProcessUsage =
    L"Unknown,AnyInput,AnyOutput,Any,Jacket,Parent,Cover,Rejected,Accepted,Marks,Document,Surface,Waste,"
    L"Proof,Input,Plate,Good,BookBlock,Box,CoverMaterial,SpineBoard,CoverBoard,Case,FrontEndSheet,"
    L"BackEndSheet,Child,Mother,Book,Label,RingBinder";
const wchar_t* const OCGDefault = L"Unknown,Exclude,FromPDF,Include";
const wchar_t* const OCGProcess = L"Unknown,Export,Print,View";
const wchar_t* const MediaType =
    L"Unknown,CorrugatedBoard,Disc,EndBoard,EmbossingFoil,Film,Foil,GravureCylinder,ImagingCylinder,"
    L"LaminatingFoil,MountingTape,Other,Paper,Plate,SelfAdhesive,Sleeve,ShrinkFoil,Transparency";
const wchar_t* const GrainDirection = L"Unknown,LongEdge,ShortEdge,XDirection,YDirection";
const wchar_t* const MediaUnit = L"Unknown,Continuous,Roll,Sheet";
const wchar_t* const Side = L"Unknown,Front,Back";
const wchar_t* const MetadataContext =
    L"Unknown,Set,Document,SubDoc0,SubDoc1,SubDoc2,SubDoc3,SubDoc4,SubDoc5,SubDoc6,SubDoc7,SubDoc8,"
    L"SubDoc9,PagePool,Page,Object";
const wchar_t* const MetadataDataType = L"Unknown,string,integer,double,NMTOKEN,boolean,dateTime,duration,PartIDKeys";
const wchar_t* const StackRestrictions = L"Unknown,None,WithinImposedSheetSet,WithinLogicalStack";
const wchar_t* const LogicalStackSequence = L"Unknown,SheetIndex,DescendingSheetIndex";
const wchar_t* const BaseOrdReset = L"Unknown,PagePool,PagePoolList";
const wchar_t* const RotatePolicy = L"Unknown,NoRotate,RotateOrthogonal,RotateClockwise,RotateCounterClockwise";
const wchar_t* const SizePolicy = L"Unknown,ClipToMaxPage,Abort,FitToPage,ReduceToFit,Tile";
const wchar_t* const BandOrdering = L"Unknown,BandMajor,ColorMajor";

namespace {

// Every table split into its tokens, built once on first use and never changed afterwards, so
// threads read it without a lock.
const std::unordered_map<const wchar_t*, vWString>& splitTables() {
    static const std::unordered_map<const wchar_t*, vWString> split = [] {
        std::unordered_map<const wchar_t*, vWString> tables;
        for (const wchar_t* table :
             {NodeActivation, NodeStatus, ResourceStatus, PartUsage, PartIDKey, ResourceClass, LinkUsage,
              ProcessUsage, OCGDefault, OCGProcess, MediaType, GrainDirection, MediaUnit, Side, MetadataContext,
              MetadataDataType, StackRestrictions, LogicalStackSequence, BaseOrdReset, RotatePolicy, SizePolicy,
              BandOrdering})
            tables.emplace(table, vWString(table, L","));
        return tables;
    }();
    return split;
}

// The tokens of a table; a list that is not one of the tables above is split into `own`.
const vWString& tokensOf(const wchar_t* table, vWString& own) {
    const auto& split = splitTables();
    auto found = split.find(table);
    if (found != split.end()) return found->second;
    own = vWString(table, L",");
    return own;
}

}  // namespace

WString Token(const wchar_t* table, int n, bool allowUnknown) {
    if (n < 0 || (n == 0 && !allowUnknown))
        throw JDFException("enumeration value " + std::to_string(n) + " cannot be written");
    vWString own;
    const vWString& tokens = tokensOf(table, own);
    if (static_cast<size_t>(n) >= tokens.size())
        throw JDFException("enumeration value " + std::to_string(n) + " is out of range");
    return tokens[static_cast<size_t>(n)];
}

int Number(const wchar_t* table, const WString& token) {
    if (token.empty()) return 0;
    vWString own;
    int i = tokensOf(table, own).index(token);
    return i < 0 ? 0 : i;
}

}  // namespace JDF::Tables
