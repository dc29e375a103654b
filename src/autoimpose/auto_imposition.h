// Auto-imposition: turns a ticket that an imposition tool made from a template into one the print
// engine runs (automated layout, template marks and labels as mark objects, fit policies, trim
// sizes, stacking, delivery options, sheet ranges), driven by an auto-impose settings file.
#pragma once

#include "settings.h"

namespace vorlan::autoimpose {

// What one rewrite changed in the ticket.
struct ImpositionChanges {
    bool renderingParamsAdded = false;  // the ticket had none
    bool deliveryOptions = false;       // reverse delivery written on the document run list
    int markPages = 0;                  // template pages that are marks ...
    int labelPages = 0;                 // ... and sheet labels, their run partitions removed
    bool marksRunList = false;          // a Marks run list now names the mark file
    int documentRuns = 0;               // document run partitions given all pages and a run tag
    int markObjects = 0;                // content objects turned into marks
    int labelObjects = 0;               // ... and into sheet labels
    int renumberedObjects = 0;          // job content objects whose Ord moved past the template pages
    int sidesSet = 0;                   // side partitions turned for reverse delivery
    int trimSizes = 0;                  // content objects given a TrimSize
    int fitPolicies = 0;                // ... and a FitPolicy
    int stacks = 0;                     // logical stacks written
    int stackedObjects = 0;             // content objects placed on a stack
    int sheetRangeParts = 0;            // link parts selecting sheets or sets
};

// Reads the settings (defaults where the file is missing or unreadable), marks a variable-data
// job's progress as not to be recorded in the job store (failures ignored), and rewrites the
// ticket at settings.jdfPath in place. True when the rewritten ticket was written; on false the
// ticket file is untouched. changes may be null. Never throws.
bool imposeTicket(AutoImpositionSettings& settings, ImpositionChanges* changes);

// The rewrite alone, for settings already read and derived: parses the ticket, rewrites it and
// replaces the file atomically (temporary file, fsync, rename). False, file untouched, when the
// ticket cannot be parsed, is not a valid JDF node, lacks rendering parameters that can be
// added, a Layout or a signature layout, when the JDF layer refuses an edit, or when writing
// fails. Never throws.
bool rewriteTicket(AutoImpositionSettings& settings, ImpositionChanges& changes);

}  // namespace vorlan::autoimpose
