#!/usr/bin/env python3
"""Generates the bundled example jobs: a JDF ticket job and a bare-PDF job, each with a
layer-mode version description.

    examples/generate_example.py OUTDIR

writes
    OUTDIR/job1.0001          the data file the print server hands over (a marker)
    OUTDIR/job1D0001/         the job's data folder: brochure.jdf and brochure.pdf
    OUTDIR/job1.impinfo       its version description: an English and a German version, each on
                              its own sheet, and a die cut drawn on the layer "Die"
    OUTDIR/job2.pdf           a bare PDF (the same two pages)
    OUTDIR/job2.impinfo       its description: the same two versions, page by page

Everything is written by this script; no third-party file is used.
"""
import os
import sys
import zlib


def pdf_document(objects):
    """Serialises numbered objects (1-based list of bytes) into a PDF with a cross-reference table."""
    out = bytearray(b"%PDF-1.6\n%\xe2\xe3\xcf\xd3\n")
    offsets = []
    for number, body in enumerate(objects, start=1):
        offsets.append(len(out))
        out += b"%d 0 obj\n" % number + body + b"\nendobj\n"
    xref = len(out)
    out += b"xref\n0 %d\n0000000000 65535 f \n" % (len(objects) + 1)
    for offset in offsets:
        out += b"%010d 00000 n \n" % offset
    out += b"trailer\n<< /Size %d /Root 1 0 R >>\nstartxref\n%d\n%%%%EOF\n" % (len(objects) + 1, xref)
    return bytes(out)


def stream(data, extra=b""):
    packed = zlib.compress(data)
    return b"<< /Length %d /Filter /FlateDecode %s>>\nstream\n" % (len(packed), extra) + packed + b"\nendstream"


def brochure_pdf():
    """Two A5 pages: a CMYK background, an English and a German text layer, a die line on its
    own layer, and a spot varnish."""
    page_content = (
        b"q 0.1 0.2 0.6 0 k 20 20 380 555 re f Q\n"
        b"/OC /en BDC BT /F1 36 Tf 0 0 0 1 k 50 450 Td (Hello) Tj ET EMC\n"
        b"/OC /de BDC BT /F1 36 Tf 0 0 0 1 k 50 400 Td (Hallo) Tj ET EMC\n"
        b"q /Varnish cs 1 scn 40 40 340 120 re f Q\n"
        b"/OC /die BDC q 1 0 0 0 K 2 w 10 10 400 575 re S Q EMC\n"
    )
    objects = [
        b"<< /Type /Catalog /Pages 2 0 R /OCProperties << /OCGs [6 0 R 7 0 R 11 0 R] "
        b"/D << /Order [6 0 R 7 0 R 11 0 R] /ON [6 0 R 7 0 R] /OFF [11 0 R] >> >> >>",
        b"<< /Type /Pages /Kids [3 0 R 4 0 R] /Count 2 >>",
        b"<< /Type /Page /Parent 2 0 R /MediaBox [0 0 420 595] /Contents 5 0 R /Resources 8 0 R >>",
        b"<< /Type /Page /Parent 2 0 R /MediaBox [0 0 420 595] /Contents 5 0 R /Resources 8 0 R >>",
        stream(page_content),
        b"<< /Type /OCG /Name (English) >>",
        b"<< /Type /OCG /Name (German) >>",
        b"<< /Font << /F1 9 0 R >> /Properties << /en 6 0 R /de 7 0 R /die 11 0 R >> "
        b"/ColorSpace << /Varnish [/Separation /Varnish /DeviceCMYK 10 0 R] >> >>",
        b"<< /Type /Font /Subtype /Type1 /BaseFont /Helvetica >>",
        b"<< /FunctionType 2 /Domain [0 1] /C0 [0 0 0 0] /C1 [0 0 0.2 0] /N 1 >>",
        b"<< /Type /OCG /Name (Die) >>",
    ]
    return pdf_document(objects)


# Two sheets printed on both sides: sheet 1 carries the English version, sheet 2 the German one.
# Both show the PDF's two pages (Ord 0 and 1); the versions pick the language layer.
TICKET = """<?xml version="1.0" encoding="UTF-8"?>
<JDF xmlns="http://www.CIP4.org/JDFSchema_1_1" ID="n0001" JobPartID="n0001" JobID="Brochure-1"
     Type="Imposition" Status="Waiting" Version="1.3">
  <ResourcePool>
    <RunList ID="r0002" Class="Parameter" Status="Available" PartIDKeys="Run">
      <RunList Run="0" Pages="0 ~ 1">
        <LayoutElement>
          <FileSpec URL="brochure.pdf" MimeType="application/pdf"/>
        </LayoutElement>
      </RunList>
    </RunList>
    <Layout ID="r0003" Class="Parameter" Status="Available">
      <Signature Name="Sig1">
{sheets}      </Signature>
    </Layout>
  </ResourcePool>
  <ResourceLinkPool>
    <RunListLink rRef="r0002" Usage="Input" ProcessUsage="Document"/>
    <LayoutLink rRef="r0003" Usage="Input"/>
  </ResourceLinkPool>
</JDF>
"""

SHEET = """        <Sheet Name="{name}">
          <Media Dimension="420 595" MediaType="Paper"/>
          <Surface Side="Front" SurfaceContentsBox="0 0 420 595">
            <ContentObject CTM="1 0 0 1 0 0" Ord="0" TrimSize="420 595" ClipBox="0 0 420 595"/>
          </Surface>
          <Surface Side="Back" SurfaceContentsBox="0 0 420 595">
            <ContentObject CTM="1 0 0 1 0 0" Ord="1" TrimSize="420 595" ClipBox="0 0 420 595"/>
          </Surface>
        </Sheet>
"""

LAYERS = """  <OptionalLayer pdfIndex="0" OCGName="English" displayName="English" isSep="false" isNested="false" default="true"/>
  <OptionalLayer pdfIndex="0" OCGName="German" displayName="German" isSep="false" isNested="false" default="false"/>
  <OptionalLayer pdfIndex="0" OCGName="Die" displayName="Die line" isSep="false" isNested="false" default="false"/>
"""

VERSIONS = (("English", 500, "English", "German"), ("German", 300, "German", "English"))


def description(surfaces_of_version, die_cut=""):
    """A layer-mode description: version v switches its layer on for the surfaces in
    surfaces_of_version[v] (content object n sits on surface n)."""
    versions = ""
    for (name, copies, on, off), surfaces in zip(VERSIONS, surfaces_of_version):
        versions += '    <Version name="%s" enable="true" copies="%d">\n' % (name, copies)
        for n in surfaces:
            versions += ('      <Surface index="%d"><ContentObject index="%d" LayerNameOn="%s" LayerNameOff="%s"/>'
                         '</Surface>\n' % (n, n, on, off))
        versions += "    </Version>\n"
    return ('<?xml version="1.0" encoding="UTF-8"?>\n'
            '<OptionalContentGroupData DefaultLayerMode="true" export="true">\n'
            + LAYERS + "  <Versions>\n" + versions + "  </Versions>\n" + die_cut
            + "</OptionalContentGroupData>\n")


# Surfaces 0 and 1 (sheet 1) are English, 2 and 3 (sheet 2) German.
DESCRIPTION = description(((0, 1), (2, 3)), """  <DieCut name="Die" enable="true">
    <Surface index="0" dieLayerInternalNames="Die" dieSepInternalNames=""/>
  </DieCut>
""")

# The bare PDF: each version names the PDF's pages (surface n = page n).
BARE_DESCRIPTION = description(((0, 1), (0, 1)))


def main():
    if len(sys.argv) != 2:
        sys.exit(__doc__)
    out = sys.argv[1]
    folder = os.path.join(out, "job1D0001")
    os.makedirs(folder, exist_ok=True)
    with open(os.path.join(out, "job1.0001"), "w") as marker:
        marker.write("data file of example job 1; its data folder is job1D0001\n")
    for path in (os.path.join(folder, "brochure.pdf"), os.path.join(out, "job2.pdf")):
        with open(path, "wb") as pdf:
            pdf.write(brochure_pdf())
    sheets = SHEET.format(name="English") + SHEET.format(name="German")
    with open(os.path.join(folder, "brochure.jdf"), "w", newline="\n") as ticket:
        ticket.write(TICKET.replace("{sheets}", sheets))
    with open(os.path.join(out, "job1.impinfo"), "w", newline="\n") as description:
        description.write(DESCRIPTION)
    with open(os.path.join(out, "job2.impinfo"), "w", newline="\n") as description:
        description.write(BARE_DESCRIPTION)
    print("example job written to", out)


if __name__ == "__main__":
    main()
