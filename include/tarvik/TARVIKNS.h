#pragma once

// Applications and their platforms define short names as macros; here they are enumerators.
#pragma push_macro("BS")
#pragma push_macro("SS")
#pragma push_macro("SM")
#pragma push_macro("SPI")
#pragma push_macro("PFF")
#pragma push_macro("SVF")
#pragma push_macro("QSVF")
#pragma push_macro("NONE")
#pragma push_macro("PARALLEL")
#pragma push_macro("PROGRAM")
#pragma push_macro("VERIFY")
#pragma push_macro("ERASE")
#pragma push_macro("CHECKSUM")
#pragma push_macro("BYPASS")
#pragma push_macro("UES")
#pragma push_macro("OTF")
#pragma push_macro("OTP")
#pragma push_macro("PROG")
#undef BS
#undef SS
#undef SM
#undef SPI
#undef PFF
#undef SVF
#undef QSVF
#undef NONE
#undef PARALLEL
#undef PROGRAM
#undef VERIFY
#undef ERASE
#undef CHECKSUM
#undef BYPASS
#undef UES
#undef OTF
#undef OTP
#undef PROG

/// The vocabulary of the constraints manager. Every enumeration is based on `int`, so that every value a caller passes is
/// well defined; each method says what it does with a value that is not listed.
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

/// The value for unknown operation names.
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

#pragma pop_macro("BS")
#pragma pop_macro("SS")
#pragma pop_macro("SM")
#pragma pop_macro("SPI")
#pragma pop_macro("PFF")
#pragma pop_macro("SVF")
#pragma pop_macro("QSVF")
#pragma pop_macro("NONE")
#pragma pop_macro("PARALLEL")
#pragma pop_macro("PROGRAM")
#pragma pop_macro("VERIFY")
#pragma pop_macro("ERASE")
#pragma pop_macro("CHECKSUM")
#pragma pop_macro("BYPASS")
#pragma pop_macro("UES")
#pragma pop_macro("OTF")
#pragma pop_macro("OTP")
#pragma pop_macro("PROG")
