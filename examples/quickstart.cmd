# A first session. It needs no hardware: port null is a simulated board, with an FPGA that has an SPI flash behind
# it, a PROM and a CPLD. It wants a bitstream beside it, which this makes:
#   tessel-board --bitstream marlin3-4 top.bit --usercode C0FFEE01
# Run it with: tessel quickstart.cmd

setMode -bscan
setCable -port null

// What is on the chain? Counting starts at 1, behind TDI.
identify

// Say what goes where: the FPGA, the PROM, and the flash memory behind the FPGA.
assignFile -position 1 -file top.bit
assignFile -position 2 -file top.bit
attachFlash -position 1 -spi w25q64
assignFileToAttachedFlash -position 1 -file top.bit

// Erase, program and verify all three.
program -p 1 2 -e -v -showprogress
program -p 1 -spionly -e -v -showprogress

// The FPGA has started up with its new user code.
readusercode -p 1

// Read half a megabyte of the flash back into a hex file.
readbacktofile -p 1 -spionly -size 524288 -file flash.mcs

// Give the cable back. A file that does not quit goes on at the prompt.
closeCable
quit
