// Rewrite stages on the ticket's layout: template marks and labels, trim sizes and fit policies,
// logical stacks.
#include <algorithm>
#include <cstdint>

#include "autoimpose/rewrite_stages.h"
#include "autoimpose/sheet_labels.h"

namespace vorlan::autoimpose {
namespace {

JDF::vElement contentObjects(const JDF::KElement& side) { return side.GetChildrenByTagName(L"ContentObject"); }

// A mark object placed where the content object was.
JDF::JDFMarkObject markInPlaceOf(JDF::JDFLayout& side, const JDF::JDFContentObject& object) {
    JDF::JDFMarkObject mark = side.AppendMarkObject();
    mark.SetCTM(object.GetCTM());
    mark.SetClipBox(object.GetClipBox());
    return mark;
}

// The number of stacks row × col, 0 when not positive; kept within the sheet-range bound so that a
// settings file cannot ask for billions of elements.
int stackCount(const AutoImpositionSettings& s) {
    const int64_t count = int64_t{s.row} * s.col;
    return count <= 0 ? 0 : static_cast<int>(std::min<int64_t>(count, kMaxSheetRanges));
}

}  // namespace

JDF::vElement TicketRewrite::sides() const {
    return sheetLayout.isNull() ? JDF::vElement() : sheetLayout.GetChildrenByTagName(L"Layout");
}

void convertMarksAndLabels(TicketRewrite& t) {
    const SheetLabelText label = sheetLabelText(t.settings);
    const int templatePages = t.markCount + t.labelCount;
    const JDF::vElement sides = t.sides();
    for (size_t i = 0; i < sides.size(); ++i) {
        JDF::JDFLayout side(sides[i]);
        if (t.settings.reverseDelivery() && sides.size() > 1) {
            side.SetSide(i == 0 ? 2 : 1);
            ++t.changes.sidesSet;
        }
        for (const JDF::KElement& element : contentObjects(side)) {
            JDF::JDFContentObject object(element);
            const int ord = object.GetOrd();
            if (ord < t.markCount) {
                markInPlaceOf(side, object).SetOrd(ord);
                object.DeleteNode();
                ++t.changes.markObjects;
            } else if (ord < templatePages) {
                JDF::JDFMarkObject mark = markInPlaceOf(side, object);
                JDF::JDFJobField field = mark.AppendJobField();
                if (label.complete()) {
                    field.SetJobFormat(label.format);
                    field.SetJobTemplate(JDF::WString(label.jobTemplate));
                }
                JDF::JDFDeviceMark device = mark.AppendDeviceMark();
                device.SetFont(L"Times-Roman");
                device.SetFontSize(9);
                object.DeleteNode();
                ++t.changes.labelObjects;
            } else {
                object.SetOrd(ord - templatePages);
                ++t.changes.renumberedObjects;
            }
        }
    }
}

void setTrimSizesAndFitPolicies(TicketRewrite& t) {
    AutoImpositionSettings& s = t.settings;
    JDF::JDFXYPair trim;  // the layer's default pair when the settings give none
    if (s.SizePolicy == 7 || s.SizePolicy == 8) {
        trim = JDF::JDFXYPair(s.BleedSize.first, s.BleedSize.second);
    } else if (auto finish = s.FinishSize.find(0); finish != s.FinishSize.end()) {
        trim = JDF::JDFXYPair(finish->second.first, finish->second.second);
    }
    if (s.ImpositionMode) s.sizePolicy = 0;  // in imposition mode only a rotate policy is written
    const bool fit = s.rotatePolicy != 1 || s.sizePolicy != 0;
    for (const JDF::KElement& side : t.sides()) {
        for (const JDF::KElement& element : contentObjects(side)) {
            JDF::JDFContentObject object(element);
            object.SetTrimSize(trim);
            ++t.changes.trimSizes;
            if (!fit) continue;
            JDF::JDFFitPolicy policy = object.GetCreateFitPolicy();
            if (s.sizePolicy != 0) policy.SetSizePolicy(s.sizePolicy);
            if (s.rotatePolicy != 0) policy.SetRotatePolicy(s.rotatePolicy);
            ++t.changes.fitPolicies;
        }
    }
}

void writeStacking(TicketRewrite& t) {
    const AutoImpositionSettings& s = t.settings;
    const int stacks = stackCount(s);
    if (t.rootLayout.GetLogicalStackParams().isNull()) {
        int depth = 0;  // none
        if (s.MaxStackDepth < 0) depth = static_cast<int>(std::min<int64_t>(-int64_t{s.MaxStackDepth}, INT32_MAX));
        if (s.BindingType == 17 && s.variableData()) depth = 1;
        JDF::JDFLogicalStackParams params = t.rootLayout.AppendLogicalStackParams();
        params.SetRestrictions(1);
        if (depth) params.SetMaxStackDepth(depth);
        for (int i = 0; i < stacks; ++i) {
            JDF::JDFStack stack = params.AppendStack();
            stack.SetLogicalStackOrd(i);
            stack.SetLogicalStackSequence(1);
        }
        t.changes.stacks = stacks;
    }
    // Front objects take the stacks in order; back objects mirror them for binding 10.
    const JDF::vElement sides = t.sides();
    for (size_t i = 0; i < sides.size() && i < 2; ++i) {
        const JDF::vElement objects = contentObjects(sides[i]);
        for (size_t j = 0; j < objects.size() && j < static_cast<size_t>(stacks); ++j) {
            JDF::JDFContentObject object(objects[j]);
            const int position = static_cast<int>(j);
            object.SetOrd(static_cast<int>(i));
            object.SetLogicalStackOrd(i == 1 && s.BindingType == 10 ? stacks - position - 1 : position);
            ++t.changes.stackedObjects;
        }
    }
}

}  // namespace vorlan::autoimpose
