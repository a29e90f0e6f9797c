# A first session. It needs no hardware: port null is a cable that goes nowhere.
# Run it with: tessel examples/quickstart.cmd

// What kind of work follows, and how patient to be when another session has the cable.
setMode -bscan
setPreference -pref cableLockTries:3

// Open the cable and take its lock, then ask what is there.
setCable -port null
info

// Operations with -target work on this device of the chain; counting starts at 1.
setTargetDevice -position 1

// The lines of a loop run once it ends.
repeatStart -loop 2
  info
repeatEnd

// The environment of the session, and of what it starts.
setEnv -env LAB_BENCH -value 7

// Every command tells how to use it.
help -m setCableSpeed
help -c cable

// Give the cable back. A file that does not quit goes on at the prompt.
closeCable
info
quit
