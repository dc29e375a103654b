// Rendering helpers for judging converted and rewritten PDFs: pdftoppm grey images with chosen
// optional-content groups switched on.
#pragma once

#include <ostream>
#include <string>
#include <utility>
#include <vector>

namespace vorlan::test {

struct GreyImage {
    int width = 0, height = 0;
    std::vector<unsigned char> pixels;
    // Grey value at a point given in PDF units from the page's lower left corner.
    int at(double x, double y, int dpi) const;
    long inked() const;  // pixels darker than near-white
};

// Renders one page (1-based) with pdftoppm. When pdftoppm is missing or fails the image is empty
// and, unless the caller only probes (mustRender false), the calling test fails: no check can
// pass on an image that was never rendered.
GreyImage renderPage(const std::string& pdf, int page, int dpi = 36, bool mustRender = true);

struct Rgb {
    int r = -1, g = -1, b = -1;  // -1: outside the image
    bool operator==(const Rgb& o) const { return r == o.r && g == o.g && b == o.b; }
    friend std::ostream& operator<<(std::ostream& out, const Rgb& c) {
        return out << "rgb(" << c.r << ", " << c.g << ", " << c.b << ")";
    }
};
struct ColourImage {
    int width = 0, height = 0;
    std::vector<unsigned char> rgb;
    // Colour at a point given in PDF units from the page's lower left corner.
    Rgb at(double x, double y, int dpi) const;
    // Pixels close to the colour (each channel within a tolerance).
    long count(const Rgb& colour) const;
};
// Renders one page (1-based) in colour with pdftoppm; empty image when pdftoppm is missing or fails.
ColourImage renderColourPage(const std::string& pdf, int page, int dpi = 36);

// Writes a copy of `in` whose default configuration shows exactly the named groups (/ON) and
// hides every other group of the document (/OFF). False on failure.
bool showOnlyGroups(const std::string& in, const std::string& out, const std::vector<std::string>& names);

// The names of all groups of the document (/OCProperties /OCGs).
std::vector<std::string> allGroups(const std::string& pdf);

// The names of the groups listed at the top level of the default configuration's /Order.
std::vector<std::string> groupOrder(const std::string& pdf);

// Revision and permissions (R, P) of a file's encryption; {0, 0} when it is not encrypted or
// cannot be opened.
std::pair<int, int> encryptionOf(const std::string& pdf);

// `qpdf --check` exit status 0 (warnings count as failure).
bool qpdfCheckPasses(const std::string& pdf, std::string* output = nullptr);

}  // namespace vorlan::test
