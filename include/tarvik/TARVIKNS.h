#pragma once

/// The vocabulary of the constraints manager. Every enumeration rests on `int`, so that any value a caller
/// passes is well defined; what a value outside its list gives stands with each method.
namespace TARVIKNS {

/// Configuration modes.
enum class MODE_TYPE : int { BS, SS, SM, BSFILE, DP770, SPI, KITECF, KITEMPM, PFF };

/// Cables and output file types.
enum class OUTPUT_TYPE : int {
    PARALLEL,
    ZORVA,
    USB2,
    SVF,
    STAPL,
    QSVF,
    EXPRESSSVF,
    EXPRESSQSVF,
    NULLCABLE,
    NONE,
};

/// Device operations, in the order in which they are presented.
enum class OP_TYPE : int {
    PROGRAM,
    PROGRAMFLASH,
    PROGRAMFPGAONLY,
    VERIFY,
    ERASE,
    FUNCTIONTEST,
    BLANKCHECK,
    READBACKTOFILE,
    PROGRAMUES,
    READIDCODE,
    CHECKSUM,
    READUSERCODE,
    READCUSTOMERCODE,
    READUES,
    ACTIVATEOTF,
    VALIDATEUSERCODE,
    CHECKIDCODE,
    READSTATUSREGISTER,
    LOADCONFIGURATIONREVISION,
    BYPASS,
    HIGHZ,
    CLAMP,
    DOPRELOAD,
    ISPENABLE,
    CONLD,
    PROGRAMKEY,
    SECUREMODE,
    READTEMP,
    PROGRAMUSERCODE,
    PROGRAMCUSTOMERCODE,
    EXPRESSSVF,
    EXPRESSQSVF,
};

/// The value that an unknown operation name converts to.
inline constexpr OP_TYPE NO_OPERATION{32};

/// Programming options.
enum class PROGRAM_OPTION : int {
    ERASE,
    VERIFY,
    READPROTECT,
    WRITEPROTECT,
    FUNCTIONTEST,
    SKIPUSERARRAY,
    LOADFPGA,
    PARALLELMODE,
    USED4, ///< a reserved slot
    USERCODE,
    UES,
    SECUREMODE,
    PROGRAMKEY,
    OTF,
    PROG,
    SECTOR_PROTECT,
    SECTOR_LOCKDOWN,
    PROGRAM_ONLYFPGA,
    READ_PROTECT_NOBSCANTEST,
    OTP,
    ASSERT_INIT,
    DATA_WIDTH,
    RS_PIN1,
    RS_PIN0,
};

} // namespace TARVIKNS
