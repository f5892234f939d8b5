/// @file
/// QorVIO: virtual input/output cores in an FPGA, reached over JTAG.
///
/// Conventions
///
///  1. Every function takes the session first and the core's address second, and returns 0, or 0x80000000
///     after it has sent the session a message that says what is wrong: type 0x100 for an error, 0x8000 for
///     the notice of an abort. Nothing is ever thrown across this interface. QorVIO_isVIOCore may return
///     another status.
///  2. Every function but QorVIO_terminateCore holds the session's target lock meanwhile, and fails when that
///     is not free within 60 seconds; it is not recursive, so a message handler calls none of them. So
///     threads may share a session and a core. Removing a core (QorVIO_terminateCore, QorVIO_initCore on its
///     address, closing the session) must not overlap another call on that core.
///  3. A port is a row of bits, numbered from 0. In a byte array bit i is bit (i mod 8) of byte i / 8, and a
///     port of width W takes ceil(W / 8) bytes.
///  4. Names are told apart without regard to the case of A to Z. Inputs and outputs are two name spaces. The
///     names async_out_data, sync_out_data, async_in_data and sync_in_data stand for whole ports from the
///     start.
///  5. Port type codes: 0 synchronous output, 1 synchronous input, 2 asynchronous output, 3 asynchronous
///     input.
///  6. A map is passed as the address of the caller's variable that points to it.
///  7. A failed call to the target leaves the caller's arrays and maps as they were.
#pragma once

#include <string>

#include "QorVIO_Export.h"
#include "QorVIO_Records.h"

extern "C" {

/// Reads the core's status word afresh into `*coreInfo` (out). The core need not have been set up. On a
/// failure the record is all zero, or as it was if the lock could not be had.
QORVIO_API unsigned int QorVIO_getInfo(unsigned int session, QOR_CORE_REF coreRef,
                                       QORVIO_CORE_INFO* coreInfo);

/// Sets `*result` (out) to 1 when the core at the address says that it is a VIO core, else to 0. Returns 0; a
/// status that is neither 0 nor 0x80000000, without a message, when there is no core at the address; or
/// 0x80000000 when the link fails, with `*result` 0, or as it was if the lock could not be had.
QORVIO_API unsigned int QorVIO_isVIOCore(unsigned int session, QOR_CORE_REF coreRef, unsigned int* result);

/// Reads the core's status word afresh and sets twelve entries of the map (in, out), named like the fields of
/// QORVIO_CORE_INFO, to their decimal texts. Other entries stay. On a failure to read, the map is as it was.
QORVIO_API unsigned int QorVIO_getCoreInfo(unsigned int session, QOR_CORE_REF coreRef,
                                           QorRT::hash_map<std::string, std::string>** coreInfo);

/// Sets up the VIO core at the address, in the place of whatever is set up there. After a failure nothing is,
/// unless the lock, or memory to begin with, could not be had: then all is as it was.
QORVIO_API unsigned int QorVIO_initCore(unsigned int session, QOR_CORE_REF coreRef);

/// Undoes QorVIO_initCore, with all names of the core. Leaves an address without a VIO core alone, which is a
/// success.
QORVIO_API unsigned int QorVIO_terminateCore(unsigned int session, QOR_CORE_REF coreRef);

/// Names bit `bitIndex` of the port that `type` selects. Fails for an empty name, an unknown type, a bit
/// beyond the port, or a name already used in that direction; a failure changes nothing. Values are written
/// and sizes told under the whole name, but a map's keys end a name at the first dot: do without dots for
/// outputs.
QORVIO_API unsigned int QorVIO_defineSignal(unsigned int session, QOR_CORE_REF coreRef, const char* name,
                                            unsigned int type, unsigned int bitIndex);

/// Names an ordered list of port bits: element i of `bitIndexArray` (in, `arrayLen` elements) is the port bit
/// that carries bit i of the bus's value. Bits may repeat and overlap other names. Fails like
/// QorVIO_defineSignal, and for an empty list; a failure changes nothing.
QORVIO_API unsigned int QorVIO_defineBus(unsigned int session, QOR_CORE_REF coreRef, const char* name,
                                         unsigned int type, const unsigned int* bitIndexArray,
                                         unsigned int arrayLen);

/// Removes a name from the inputs when `type` is 1 or 3, from the outputs otherwise. Fails for a name that is
/// not there.
QORVIO_API unsigned int QorVIO_undefineName(unsigned int session, QOR_CORE_REF coreRef, const char* name,
                                            unsigned int type);

/// Widths in bits of `arrayLen` names (in), into `sizeArray` (out, as many elements); names are outputs when
/// `isOutput` is not 0, else inputs. Fails, writing nothing, for a null array, a count of 0 or a null name;
/// and at the first name that is not there, with the sizes before it written.
QORVIO_API unsigned int QorVIO_getSignalSizes(unsigned int session, QOR_CORE_REF coreRef,
                                              const char** nameArray, unsigned int* sizeArray,
                                              unsigned int arrayLen, unsigned int isOutput);

/// Writes every entry of the map (in): key a name, value a hexadecimal number, most significant digit first,
/// without a prefix. A text shorter than the name's width in whole bytes is extended to the left by its top
/// bit; of a longer one the rightmost digits count, and the others are not looked at. The key
/// NAME.pulsetrain, in small letters, gives a synchronous output 16 values of whole bytes, step 0 rightmost;
/// a short text is extended in the same way through all later steps. Any other suffix is ignored. All entries
/// go out in one exchange, and only bits that they name are driven anew; where entries overlap, the one that
/// the map lists last wins. Fails, sending nothing, for a name that is not an output, a pulse train on an
/// asynchronous output, or a text that is empty or no hexadecimal number. After a failed exchange it is not
/// known whether the core took the values.
QORVIO_API unsigned int QorVIO_writeValues(unsigned int session, QOR_CORE_REF coreRef,
                                           QorRT::hash_map<std::string, std::string>** outputHashMap);

/// Reads all inputs in one exchange and sets, for every input name as it was defined, the map's (in, out)
/// entries NAME and NAME.value, NAME.activity_up, NAME.activity_down, and for synchronous inputs
/// NAME.sync_activity_up and NAME.sync_activity_down: hexadecimal, ceil(width / 4) upper-case digits. An
/// activity flag says that its bit rose (up) or fell (down) since the read before, however short; a sync
/// activity flag, that the design's clock saw it. Other entries stay. Each entry is set wholly or not at all;
/// when memory runs out, some may be set and others not.
QORVIO_API unsigned int QorVIO_readValues(unsigned int session, QOR_CORE_REF coreRef,
                                          QorRT::hash_map<std::string, std::string>** inputHashMap);

/// Writes whole output ports in one exchange. For each port: the values, and a mask (all in, one port image
/// each) whose set bits are driven anew while the others keep what they have. `syncOutStepBits` holds 16 port
/// images, the values at steps 0 to 15. A count is the port's width in bits, or 0 to leave the port out (its
/// arrays may be null then). Fails, sending nothing, for any other count or a null array.
QORVIO_API unsigned int QorVIO_setPortBits(unsigned int session, QOR_CORE_REF coreRef,
                                           const unsigned char* asyncOutValueBits,
                                           const unsigned char* asyncOutMaskBits,
                                           unsigned int asyncOutDataBitCount,
                                           const unsigned char* syncOutStepBits,
                                           const unsigned char* syncOutMaskBits,
                                           unsigned int syncOutDataBitCount);

/// Reads all inputs in one exchange into port images (all out, any may be null). A count is the port's width
/// in bits, or 0 to leave the port out. Bits of the last byte above the width stay as they are. Fails,
/// reading nothing, for any other count.
QORVIO_API unsigned int QorVIO_getPortBits(
    unsigned int session, QOR_CORE_REF coreRef, unsigned char* asyncInValueBits,
    unsigned char* asyncInActivityUpBits, unsigned char* asyncInActivityDownBits,
    unsigned int asyncInDataBitCount, unsigned char* syncInValueBits, unsigned char* syncInActivityUpBits,
    unsigned char* syncInActivityDownBits, unsigned char* syncInSyncActivityUpBits,
    unsigned char* syncInSyncActivityDownBits, unsigned int syncInDataBitCount);
}
