/// @file
/// QorVIO: read and drive the ports of virtual input/output (VIO) cores inside an FPGA, over JTAG.
///
/// Conventions
///
///  1. Every function takes the session first and the address of the core second. It returns 0, or 0x80000000
///     after it has sent the session a message that says what is wrong: type 0x100 for an error, 0x8000 for
///     the notice of an abort. No exception leaves a function. QorVIO_isVIOCore may return another status. A
///     thread may be cancelled (pthread_cancel) inside a function: the lock is released.
///  2. Every function except QorVIO_terminateCore takes the session's target lock for the whole call, and
///     fails if the lock is not free within 60 seconds. So threads may share a session and a core. The lock
///     is not recursive: a message handler must not call these functions. A call that removes a core
///     (QorVIO_terminateCore, QorVIO_initCore on its address, closing the session) must not overlap another
///     call on that core.
///  3. A port is a row of bits, numbered from 0. In a byte array bit i is bit (i mod 8) of byte i / 8. A port
///     of width W needs ceil(W / 8) bytes: a port image.
///  4. Names are compared without regard to the case of A to Z. Inputs and outputs are two name spaces. The
///     names async_out_data, sync_out_data, async_in_data and sync_in_data are defined from the start, each
///     for a whole port, unless the port has no bits.
///  5. Port type codes: 0 synchronous output, 1 synchronous input, 2 asynchronous output, 3 asynchronous
///     input.
///  6. A map is passed as the address of the caller's variable that points to it. Neither may be null.
///  7. If an exchange with the target fails, the caller's arrays and maps are as they were.
#pragma once

#include <string>

#include "QorVIO_Export.h"
#include "QorVIO_Records.h"

extern "C" {

/// Reads the core's status word from the target and decodes it into `*coreInfo` (out). The core need not be
/// set up. After a failure the record is all zero, or as it was if the lock was not obtained.
QORVIO_API unsigned int QorVIO_getInfo(unsigned int session, QOR_CORE_REF coreRef,
                                       QORVIO_CORE_INFO* coreInfo);

/// Sets `*result` (out) to 1 if the status word at the address is that of a VIO core, else to 0. Returns 0;
/// or a status that is neither 0 nor 0x80000000, without a message, if there is no core at the address; or
/// 0x80000000 if the link fails. After a failure `*result` is 0, or as it was if the lock was not obtained.
QORVIO_API unsigned int QorVIO_isVIOCore(unsigned int session, QOR_CORE_REF coreRef, unsigned int* result);

/// Reads the core's status word from the target and sets twelve entries of the map (in, out): keys are the
/// field names of QORVIO_CORE_INFO, values are decimal texts. Other entries stay. If the read fails, the
/// map is as it was.
QORVIO_API unsigned int QorVIO_getCoreInfo(unsigned int session, QOR_CORE_REF coreRef,
                                           QorRT::hash_map<std::string, std::string>** coreInfo);

/// Sets up the VIO core at the address: reads its status word, and defines the four whole-port names. A core
/// that is set up there already is removed first, with its names. After a failure no core is set up at the
/// address; but if the lock or the first memory was not obtained, nothing has changed.
QORVIO_API unsigned int QorVIO_initCore(unsigned int session, QOR_CORE_REF coreRef);

/// Removes the core that QorVIO_initCore set up, with all its names. At an address without a VIO core it does
/// nothing and returns 0.
QORVIO_API unsigned int QorVIO_terminateCore(unsigned int session, QOR_CORE_REF coreRef);

/// Gives a name to bit `bitIndex` of the port that `type` selects. Fails for a null or empty name, an unknown
/// type, a bit beyond the port, or a name that is already used in that direction. A failure changes nothing.
/// An output's name should contain no dot: in the keys of QorVIO_writeValues a name ends at the first dot.
QORVIO_API unsigned int QorVIO_defineSignal(unsigned int session, QOR_CORE_REF coreRef, const char* name,
                                            unsigned int type, unsigned int bitIndex);

/// Gives a name to an ordered list of port bits: element i of `bitIndexArray` (in, `arrayLen` elements) is
/// the port bit of bit i of the value. Bits may repeat, and other names may use them too. Fails like
/// QorVIO_defineSignal, and for a null or empty list. A failure changes nothing.
QORVIO_API unsigned int QorVIO_defineBus(unsigned int session, QOR_CORE_REF coreRef, const char* name,
                                         unsigned int type, const unsigned int* bitIndexArray,
                                         unsigned int arrayLen);

/// Removes a name from the inputs if `type` is 1 or 3, from the outputs otherwise. Fails, changing nothing,
/// for a name that is null, empty or not defined.
QORVIO_API unsigned int QorVIO_undefineName(unsigned int session, QOR_CORE_REF coreRef, const char* name,
                                            unsigned int type);

/// Writes the widths in bits of `arrayLen` names (in) to `sizeArray` (out, `arrayLen` elements). The names
/// are outputs if `isOutput` is not 0, else inputs. Fails, writing nothing, for a null array, a count of 0
/// or a null name. Fails at the first name that is not defined; the sizes before it are written.
QORVIO_API unsigned int QorVIO_getSignalSizes(unsigned int session, QOR_CORE_REF coreRef,
                                              const char** nameArray, unsigned int* sizeArray,
                                              unsigned int arrayLen, unsigned int isOutput);

/// Writes every entry of the map (in) in one exchange with the target. A key is the name of an output. A
/// value is a hexadecimal number, most significant digit first, without a prefix. A text that is shorter
/// than the name's width in whole bytes is extended to the left by its top bit. Of a longer text only the
/// rightmost digits are used and checked. The key NAME.pulsetrain (lower case) writes 16 steps of a
/// synchronous output: a value of whole bytes per step, step 0 rightmost; a short text is extended in the
/// same way over all later steps. Any other suffix is ignored. Only bits that an entry names are driven; if
/// entries overlap, the one that the map lists last is used. Fails, sending nothing, for a name that is not
/// an output, a pulse train of an asynchronous output, or a text that is empty or not hexadecimal. After a
/// failed exchange it is not known whether the core took the values.
QORVIO_API unsigned int QorVIO_writeValues(unsigned int session, QOR_CORE_REF coreRef,
                                           QorRT::hash_map<std::string, std::string>** outputHashMap);

/// Reads all inputs in one exchange with the target. For every input name, spelled as it was defined, sets
/// the entries of the map (in, out) NAME, NAME.value, NAME.activity_up and NAME.activity_down, and for
/// synchronous inputs also NAME.sync_activity_up and NAME.sync_activity_down: ceil(width / 4) upper-case
/// hexadecimal digits. An activity flag is 1 if its bit rose (up) or fell (down) since the last read,
/// however shortly. A sync activity flag is 1 if the clock of the design sampled the change. Other entries
/// stay. If the exchange fails, the map is as it was. If memory runs out after it, some entries may be set,
/// each completely; the next read then reports these activity flags again.
QORVIO_API unsigned int QorVIO_readValues(unsigned int session, QOR_CORE_REF coreRef,
                                          QorRT::hash_map<std::string, std::string>** inputHashMap);

/// Writes whole output ports in one exchange with the target. A mask (in, one port image) selects the bits
/// that are driven; the other outputs keep their values. `asyncOutValueBits` (in) is one port image,
/// `syncOutStepBits` (in) 16 port images, one after another: the values at steps 0 to 15. A count is the
/// port's width in bits, or 0 to leave the port out; its arrays may be null then. Fails, sending nothing,
/// for any other count or a null array. After a failed exchange it is not known whether the core took the
/// values.
QORVIO_API unsigned int QorVIO_setPortBits(unsigned int session, QOR_CORE_REF coreRef,
                                           const unsigned char* asyncOutValueBits,
                                           const unsigned char* asyncOutMaskBits,
                                           unsigned int asyncOutDataBitCount,
                                           const unsigned char* syncOutStepBits,
                                           const unsigned char* syncOutMaskBits,
                                           unsigned int syncOutDataBitCount);

/// Reads all inputs in one exchange with the target into port images (all out; each may be null). A count is
/// the port's width in bits, or 0 to leave the port out. Bits of the last byte above the width stay as they
/// are. Fails, reading nothing, for any other count. After a failure all arrays are as they were.
QORVIO_API unsigned int QorVIO_getPortBits(
    unsigned int session, QOR_CORE_REF coreRef, unsigned char* asyncInValueBits,
    unsigned char* asyncInActivityUpBits, unsigned char* asyncInActivityDownBits,
    unsigned int asyncInDataBitCount, unsigned char* syncInValueBits, unsigned char* syncInActivityUpBits,
    unsigned char* syncInActivityDownBits, unsigned char* syncInSyncActivityUpBits,
    unsigned char* syncInSyncActivityDownBits, unsigned int syncInDataBitCount);
}
