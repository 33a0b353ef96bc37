// Enters the transceiver classes' creation functions for the factory.
#include "transceiver/OrvNebu_TransceiverClasses.h"

#include "transceiver/OrvNebu_VanduM3Qrc.h"
#include "transceiver/OrvNebu_VanduR2Qra.h"
#include "transceiver/OrvNebu_VanduR3Qra.h"
#include "transceiver/OrvNebu_VanduR3Qrb.h"

namespace OrvRT {

const OrvNebu_SlaveFactory::SlaveClasses& OrvNebu_TransceiverClasses::slaveClasses() {
    static const OrvNebu_SlaveFactory::SlaveClasses classes = [] {
        OrvNebu_SlaveFactory::SlaveClasses c;
        c.create[OrvNebu_SlaveClassTable::VANDU_M3QRC] = &OrvNebu_VanduM3Qrc::create;
        c.create[OrvNebu_SlaveClassTable::VANDU_R2QRA] = &OrvNebu_VanduR2Qra::create;
        c.create[OrvNebu_SlaveClassTable::VANDU_R3QRA] = &OrvNebu_VanduR3Qra::create;
        c.create[OrvNebu_SlaveClassTable::VANDU_R3QRB] = &OrvNebu_VanduR3Qrb::create;
        return c;
    }();
    return classes;
}

}  // namespace OrvRT
