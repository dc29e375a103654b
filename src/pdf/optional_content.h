// Optional-content groups in the catalog, kept by hand (qpdf has no helper for them): the
// /OCProperties dictionary with its /OCGs list and default configuration /D (/Order, /ON, /OFF).
#pragma once

#include <qpdf/QPDF.hh>
#include <qpdf/QPDFObjectHandle.hh>

#include <string>
#include <vector>

namespace vorlan::pdf {

// The groups listed in /OCProperties /OCGs, in order (indirect dictionaries only).
std::vector<QPDFObjectHandle> documentOCGs(QPDF& pdf);

// The name of a group (its /Name text as UTF-8).
std::string ocgName(QPDFObjectHandle ocg);

// The group whose name equals `name` byte for byte (the first in /OCGs order), or a new group of
// that name. Either way it gets /Intent [/View /Print], is set OFF in the default configuration
// and is listed at the end of its /Order (once: a group already listed at the top level of /Order
// stays where it is). A missing /OCProperties, /D or /Order is created; a new /Order lists the
// document's existing groups first. Null entries of /OCGs and of the top level of /Order (such as
// references to objects that no longer exist) are dropped. Null handle on failure; never throws.
QPDFObjectHandle findOrCreateOCG(QPDF& pdf, const std::string& name);

// Empties the /Order array of the default configuration when there is one.
void clearDefaultOrder(QPDF& pdf);

// True when a marked-content property list or an /OC entry makes content optional: a group, or a
// membership dictionary whose /OCGs names at least one group.
bool hasOptionalContentMembership(QPDFObjectHandle oc);

}  // namespace vorlan::pdf
