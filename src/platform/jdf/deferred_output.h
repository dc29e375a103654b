// Writing a document: the whole tree, with the children deferred by KElement::DeferChildren made
// and written batch by batch where their marker comment stands.
//
// A marker is a comment "<!--vorlan-deferred:N-->" (N indexes DocumentState::deferred) on a line
// of its own when the output is indented. The writer holds back only what may begin a marker, so
// memory stays at one batch of children whatever the document's size.
#pragma once

#include <string>

#include <pugixml.hpp>

#include "platform/jdf/document_state.h"

namespace JDF::detail {

// The text of the marker comment of deferred children number index.
std::string deferredMarkerText(size_t index);

// Saves the document to out with pugixml's format flags and tab indentation, writing every
// deferred batch in place of its marker. Throws what a batch maker throws, and JDFException for a
// marker that names no deferred children.
void saveDocument(const DocumentState& state, pugi::xml_writer& out, unsigned flags);

}  // namespace JDF::detail
