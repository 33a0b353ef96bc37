# nebu
# How the console passes arguments and prints outputs: zero counts, the status word left out,
# words it cannot carry, dump initializing only what it has not, and quit.
> getSlaveHandles 0 1 0
message 256: OrvNebu_getSlaveHandles() argument checking failed:(slaveHandles != 0) && (count != 0)
rc=0x80000000
slaveHandles=
> getBusErrorStatus 0 1 0
message 256: OrvNebu_getBusErrorStatus() argument checking failed:(errorStatus != 0) && (errorStatusLen != 0)
rc=0x80000000
errorStatus=
# A burst of two words; an empty position read sets the bus error bit, which the next status
# and the error status of all eight positions show.
> burstSlaveWrite 0 1 1 0x0100 1 0x1111 0x2222
rc=0x00000000
status=0
> singleSlaveRead 0 1 7 0
rc=0x00000000
buffer=0x0000
status=1
> burstSlaveRead 0 1 0 0 1 1
rc=0x00000000
buffer=0x0001
status=1
> getBusErrorStatus 0 1 8
rc=0x00000000
errorStatus=1 1 1 1 1 1 1 1
> clearBusErrorStatus 0 1
rc=0x00000000
> burstSlaveRead 0 1 2 3 1 0
message 256: OrvNebu_burstSlaveRead() argument checking failed:(buffer != 0) && (numRead != 0)
rc=0x80000000
buffer=
status=0
> burstSlaveWrite 0 1 2 3 1
message 256: OrvNebu_burstSlaveWrite() argument checking failed:(buffer != 0) && (numWrite != 0)
rc=0x80000000
status=0
> status off
> singleSlaveRead 0 1 0 0x0003
rc=0x00000000
buffer=0x1234
> broadcastSingleWrite 0 1 0x20 7
rc=0x00000000
> status on
> singleSlaveWriteAndInspect 0 1 0 0x0020 0x1234
rc=0x00000000
rdBuf=0x1234
status=0
> getSlaveHandles 0 1 0x20001
nebu: COUNT 0x20001 is more than the console allows (131072)
> read 0 1 2 0 4294967295
nebu: SIZE 4294967295 is more than the console allows (131072)
> status maybe
nebu: usage: status on|off
> session
nebu: usage: session N
> frob	nicate
nebu: unknown command 'frob'
> dump 0 1 3
message 256: No OrvNebu register file specified for OrvNebu slave type: 0, orv driver version: 0
initialize: rc=0x80000000
> dump 0 1 2
initialize: rc=0x00000000
registers: rc=0x00000000
  GPIO_DIR=CA
  GPIO_IN=EF
  GPIO_IN_MIRRORED=F7
  GPIO_OUT=FE
  IRQ_MASK=00
  IRQ_PENDING=00
parameters: rc=0x00000000
> dump 0 1 2
registers: rc=0x00000000
  GPIO_DIR=CA
  GPIO_IN=EF
  GPIO_IN_MIRRORED=F7
  GPIO_OUT=FE
  IRQ_MASK=00
  IRQ_PENDING=00
parameters: rc=0x00000000
> endSession
> dump 0 1 2
initialize: rc=0x00000000
registers: rc=0x00000000
  GPIO_DIR=CA
  GPIO_IN=EF
  GPIO_IN_MIRRORED=F7
  GPIO_OUT=FE
  IRQ_MASK=00
  IRQ_PENDING=00
parameters: rc=0x00000000
>   quit  # done
# exit 2
