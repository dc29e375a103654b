// The parsed ticket's handles that the worker keeps between the reader and the writer.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "jdf/model_indexes.h"
#include "platform/jdf/jdf.h"

struct LD_JDFHandles {
    std::unique_ptr<JDF::JDFParser> parser;  // owned by the reader while it reads
    JDF::JDFNode rootNode;
    JDF::JDFNode processNode;
    JDF::KElement layoutElement;
    JDF::KElement interpretingParamsElement;
    JDF::KElement renderingParamsElement;
    JDF::KElement digitalPrintingParamsElement;
    JDF::KElement runListElement;
    // Whether the ticket as read had a Layout of its own; one the reader injected does not count.
    bool ticketHasLayout = false;
    // Whether there is a layout to read: the ticket's own or an injected one. Unlike
    // layoutElement, it still answers once the tree is dropped.
    bool hasLayout() const { return !layoutElement.isNull() || droppedLayout; }
    bool droppedLayout = false;  // layoutElement was set when the tree was dropped

    // Look-up indexes over the model's lists; rebuilt on demand, so copies may share nothing.
    vorlan::jdf::ModelIndexes indexes;
    // Texts handed out by the node queries; valid until the next such query.
    std::vector<std::wstring> queryTexts;
    // Surfaces a later surface of the same side pushed out of their sheet's slot: they stay in
    // the surface list, and are owned here (the sheet owns only its front and back). Records, so
    // copies of a worker share them; the layout's release frees them.
    std::shared_ptr<std::vector<std::unique_ptr<LD_Surface>>> displacedSurfaces =
        std::make_shared<std::vector<std::unique_ptr<LD_Surface>>>();
    // The element each surface of the surface list was read from, in that list's order (what the
    // reader does not keep in the records, such as version tags, is read from there). Not copied.
    std::vector<JDF::KElement> surfaceElements;

    LD_JDFHandles() = default;
    // Copies share the document; the parser stays with the original.
    LD_JDFHandles(const LD_JDFHandles& other)
        : rootNode(other.rootNode), processNode(other.processNode), layoutElement(other.layoutElement),
          interpretingParamsElement(other.interpretingParamsElement),
          renderingParamsElement(other.renderingParamsElement),
          digitalPrintingParamsElement(other.digitalPrintingParamsElement),
          runListElement(other.runListElement), ticketHasLayout(other.ticketHasLayout), droppedLayout(other.droppedLayout),
          displacedSurfaces(other.displacedSurfaces) {}

    // Lets go of the parsed ticket (the document lives while any handle does), once nothing
    // will read it again: the node queries then find nothing.
    void dropTree() {
        droppedLayout = hasLayout();
        parser.reset();
        rootNode = JDF::JDFNode();
        processNode = JDF::JDFNode();
        layoutElement = interpretingParamsElement = renderingParamsElement = JDF::KElement();
        digitalPrintingParamsElement = runListElement = JDF::KElement();
        std::vector<JDF::KElement>().swap(surfaceElements);
    }
};
