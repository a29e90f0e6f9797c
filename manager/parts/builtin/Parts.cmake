# The built-in parts. A row: name, family (the files FAMILY.bsd.in and FAMILY.json.in), part number of the IDCODE in
# hex, bits of a page, pages, revisions. An FPGA's configuration memory has as many bits as its pages together.
set(BUILT_IN_PARTS
  #  name          family     number  page  pages  revisions
  "marlin3-1     marlin3    3001    2048   512  0"
  "marlin3-4     marlin3    3004    2048  2048  0"
  "marlin3-16    marlin3    3010    2048  8192  0"
  "marlin3an-1   marlin3an  3A01    2048   512  0"
  "marlin3an-4   marlin3an  3A04    2048  2048  0"
  "marlin3an-16  marlin3an  3A10    2048  8192  0"
  "zp18v01       zp18v      5101    2048   512  0"
  "zp18v02       zp18v      5102    2048  1024  0"
  "zp18v04       zp18v      5104    2048  2048  0"
  "zp20s08       zp20s      5208    4096  2048  4"
  "zp20s16       zp20s      5210    4096  4096  4"
  "zp20s32       zp20s      5220    4096  8192  4"
  "mullet-32     mullet     6020     128    48  0"
  "mullet-128    mullet     6080     256    96  0"
  "herring-1     herring    7001    4096  4096  8"
  "herring-2     herring    7002    4096  8192  8"
)
