// The transceiver test slave classes as the slave factory knows them.
#pragma once

#include "slave/OrvNebu_SlaveFactory.h"

namespace OrvRT {

class OrvNebu_TransceiverClasses {
public:
    // The creation functions of every slave class: the four transceiver classes entered, the
    // default slave for the rest.
    static const OrvNebu_SlaveFactory::SlaveClasses& slaveClasses();
};

}  // namespace OrvRT
