#!/usr/bin/env python3
"""Generates the bundled example job: a JDF ticket, its PDF and a version description.

    examples/generate_example.py OUTDIR

writes
    OUTDIR/job1.0001          the data file the print server hands over (a marker)
    OUTDIR/job1D0001/         the job's data folder: brochure.jdf and brochure.pdf
    OUTDIR/job1.impinfo       the version description (two language versions, a varnish)

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
    """Two A5 pages: a CMYK background, an English and a German text layer, and a spot varnish."""
    page_content = (
        b"q 0.1 0.2 0.6 0 k 20 20 380 555 re f Q\n"
        b"/OC /en BDC BT /F1 36 Tf 0 0 0 1 k 50 450 Td (Hello) Tj ET EMC\n"
        b"/OC /de BDC BT /F1 36 Tf 0 0 0 1 k 50 400 Td (Hallo) Tj ET EMC\n"
        b"q /Varnish cs 1 scn 40 40 340 120 re f Q\n"
    )
    objects = [
        b"<< /Type /Catalog /Pages 2 0 R /OCProperties << /OCGs [6 0 R 7 0 R] "
        b"/D << /Order [6 0 R 7 0 R] /ON [6 0 R 7 0 R] >> >> >>",
        b"<< /Type /Pages /Kids [3 0 R 4 0 R] /Count 2 >>",
        b"<< /Type /Page /Parent 2 0 R /MediaBox [0 0 420 595] /Contents 5 0 R /Resources 8 0 R >>",
        b"<< /Type /Page /Parent 2 0 R /MediaBox [0 0 420 595] /Contents 5 0 R /Resources 8 0 R >>",
        stream(page_content),
        b"<< /Type /OCG /Name (English) >>",
        b"<< /Type /OCG /Name (German) >>",
        b"<< /Font << /F1 9 0 R >> /Properties << /en 6 0 R /de 7 0 R >> "
        b"/ColorSpace << /Varnish [/Separation /Varnish /DeviceCMYK 10 0 R] >> >>",
        b"<< /Type /Font /Subtype /Type1 /BaseFont /Helvetica >>",
        b"<< /FunctionType 2 /Domain [0 1] /C0 [0 0 0 0] /C1 [0 0 0.2 0] /N 1 >>",
    ]
    return pdf_document(objects)


TICKET = """<?xml version="1.0" encoding="UTF-8"?>
<JDF xmlns="http://www.CIP4.org/JDFSchema_1_1" ID="n0001" JobPartID="n0001" JobID="Brochure-1"
     Type="Imposition" Status="Waiting" Version="1.3">
  <ResourcePool>
    <Media ID="r0001" Class="Consumable" Status="Available" Dimension="420 595" MediaUnit="Sheet"/>
    <RunList ID="r0002" Class="Parameter" Status="Available" NPage="2">
      <LayoutElement>
        <FileSpec URL="brochure.pdf" MimeType="application/pdf"/>
      </LayoutElement>
    </RunList>
    <Layout ID="r0003" Class="Parameter" Status="Available">
      <Signature Name="Sig1">
        <Sheet Name="Sheet1">
          <Surface Side="Front" SurfaceContentsBox="0 0 420 595">
            <ContentObject CTM="1 0 0 1 0 0" Ord="0" TrimSize="420 595" ClipBox="0 0 420 595"/>
          </Surface>
          <Surface Side="Back" SurfaceContentsBox="0 0 420 595">
            <ContentObject CTM="1 0 0 1 0 0" Ord="1" TrimSize="420 595" ClipBox="0 0 420 595"/>
          </Surface>
        </Sheet>
      </Signature>
    </Layout>
  </ResourcePool>
  <ResourceLinkPool>
    <MediaLink rRef="r0001" Usage="Input"/>
    <RunListLink rRef="r0002" Usage="Input" ProcessUsage="Document"/>
    <LayoutLink rRef="r0003" Usage="Input"/>
  </ResourceLinkPool>
</JDF>
"""

DESCRIPTION = """<?xml version="1.0" encoding="UTF-8"?>
<OptionalContentGroupData DefaultLayerMode="true" export="true">
  <OptionalLayer pdfIndex="0" OCGName="English" displayName="English" isSep="false" isNested="false" default="true"/>
  <OptionalLayer pdfIndex="0" OCGName="German" displayName="German" isSep="false" isNested="false" default="false"/>
  <OptionalLayer pdfIndex="0" OCGName="Varnish" displayName="Varnish" isSep="true" isNested="false" default="true"/>
  <Versions>
    <Version name="English" enable="true" copies="500">
      <Surface index="0"><ContentObject index="0" LayerNameOn="English" LayerNameOff="German" SepNameOn="Varnish"/></Surface>
      <Surface index="1"><ContentObject index="1" LayerNameOn="English" LayerNameOff="German" SepNameOn="Varnish"/></Surface>
    </Version>
    <Version name="German" enable="true" copies="300">
      <Surface index="0"><ContentObject index="0" LayerNameOn="German" LayerNameOff="English" SepNameOff="Varnish"/></Surface>
      <Surface index="1"><ContentObject index="1" LayerNameOn="German" LayerNameOff="English" SepNameOff="Varnish"/></Surface>
    </Version>
  </Versions>
</OptionalContentGroupData>
"""


def main():
    if len(sys.argv) != 2:
        sys.exit(__doc__)
    out = sys.argv[1]
    folder = os.path.join(out, "job1D0001")
    os.makedirs(folder, exist_ok=True)
    with open(os.path.join(out, "job1.0001"), "w") as marker:
        marker.write("data file of example job 1; its data folder is job1D0001\n")
    with open(os.path.join(folder, "brochure.pdf"), "wb") as pdf:
        pdf.write(brochure_pdf())
    with open(os.path.join(folder, "brochure.jdf"), "w", newline="\n") as ticket:
        ticket.write(TICKET)
    with open(os.path.join(out, "job1.impinfo"), "w", newline="\n") as description:
        description.write(DESCRIPTION)
    print("example job written to", out)


if __name__ == "__main__":
    main()
