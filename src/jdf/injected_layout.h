// The synthetic layout given to tickets without one: one sheet per logical page of the node's
// run lists, each showing that page unscaled on the front of its sheet. The reader injects it
// into the ticket it reads; the layout-injection job injects it into the ticket it writes.
#pragma once

#include "platform/jdf/jdf.h"

namespace vorlan::jdf {

// More logical pages than this get no sheets (and no rows): a ticket claiming billions of pages
// would otherwise exhaust memory. Injection then fails.
constexpr int kMaxInjectedSheets = 1'000'000;

// Which kind of sheets are made. Written sheets also carry a Media of their own with the
// media's Dimension, and their Side takes the KAV_tkt:VersContentType of the run-list part whose
// page it shows (when the part has one).
enum class InjectedSheets { Read, Written };

// Appends a Layout (linked as input, status Available, partitioned by SignatureName, SheetName
// and Side) to the node and gives it the sheets of every RunList of the node's pool, in order,
// with the pool's first Media. False when the Layout cannot be made or the pages exceed
// kMaxInjectedSheets; exceptions of the JDF layer pass through.
bool injectLayout(const JDF::JDFNode& node, JDF::JDFLayout& layout, InjectedSheets kind);

// The sheets of one run list, numbered on from pageCounter: one per page of each partition
// (NPage, else the number of Pages, else 1, which is then written as its NPage). A partition
// that is partitioned further stands for its whole level. False past kMaxInjectedSheets.
bool appendInjectedSheets(const JDF::JDFRunList& runList, JDF::JDFLayout& signature, int& pageCounter,
                          const JDF::JDFMedia& media, InjectedSheets kind);

}  // namespace vorlan::jdf
