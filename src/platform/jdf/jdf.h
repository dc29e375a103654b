// Umbrella header of the JDF object layer (namespace JDF) on pugixml.
//
// The layer parses, navigates, creates and writes JDF documents through value handles:
//   KElement (kelement.h)        any element; null handle = isNull(); keeps its document alive
//   JDFElement, JDFNode          JDF elements, process nodes (jdf_element.h, jdf_node.h)
//   JDFResource, JDFResourceLink, JDFResourcePool, JDFResourceLinkPool, JDFPart (jdf_resource.h)
//   JDFResourceScope: the pools a node resolves its links in (resource_scope.h)
//   JDFRunList, JDFLayoutElement, JDFFileSpec, JDFMetadataMap (run_list.h)
//   JDFLayout, JDFSignature, JDFSheet, JDFSurface, JDFContentObject, JDFMarkObject, … (layout.h)
//   JDFMedia (media.h); JDFRenderingParams, JDFInterpretingParams, … (params.h)
//   XMLDoc, JDFDoc (jdf_doc.h); JDFParser (parser.h); PlatformUtils (platform_utils.h)
//   WString, vWString (wstring.h); JDFIntegerRangeList (integer_range_list.h);
//   JDFXYPair, JDFRectangle, JDFMatrix (geometry.h); JDFException (exception.h)
// Typical reading: JDFParser p; if (p.Parse(path)) { JDFNode root = JDFDoc(p.GetDocument()).GetJDFRoot(); … }
// Handles convert implicitly from KElement (JDFRunList rl = someElement;) without a type check.
// Behaviour worth knowing:
//  - Parse never throws; a missing or malformed file returns false.
//  - Partition attributes (and a run list's LayoutElement) are inherited from enclosing
//    partitions when read through JDFResource and its subclasses, not through KElement.
//  - GetChildElementVector follows ref elements (MediaRef → Media) by default;
//    GetChildrenByTagName returns them as written.
//  - Setters of enumerations throw JDFException for 0 or out-of-range numbers;
//    AppendMatchingResource throws when the node's process types have no free slot left.
//  - New IDs are deterministic (prefix + six-digit counter), so the same construction writes the
//    same bytes; Write2File replaces its target atomically and returns false on any failure.
//  - Not thread-safe: one document is used from one thread at a time.
// Enumeration numbers and their tokens: enum_tables.h. Schema-declared attribute and element
// lists per element kind (for descriptive listings): element_info.h.
#pragma once

#include "platform/jdf/attribute_map.h"
#include "platform/jdf/element_info.h"
#include "platform/jdf/enum_tables.h"
#include "platform/jdf/exception.h"
#include "platform/jdf/geometry.h"
#include "platform/jdf/integer_range_list.h"
#include "platform/jdf/jdf_doc.h"
#include "platform/jdf/jdf_element.h"
#include "platform/jdf/jdf_node.h"
#include "platform/jdf/jdf_resource.h"
#include "platform/jdf/kelement.h"
#include "platform/jdf/layout.h"
#include "platform/jdf/media.h"
#include "platform/jdf/params.h"
#include "platform/jdf/parser.h"
#include "platform/jdf/platform_utils.h"
#include "platform/jdf/resource_scope.h"
#include "platform/jdf/run_list.h"
#include "platform/jdf/wstring.h"
