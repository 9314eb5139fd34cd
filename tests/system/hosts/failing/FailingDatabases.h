#pragma once

#include <MemoryDatabases.h>

/// Small databases in which everything that the manager reads has a value. No name holds a "1".
inline memory_host::Databases failingDatabases() {
    const memory_host::Database spi = {
        "spi",
        {{"DEVICE_FAMILY", "AT,ST"},
         {"AT_DEVICES", "FLASH,FLUSH"},
         {"ST_DEVICES", "SLASH"},
         {"AT_PROPERTY", "VENDOR,Some vendor of flashes"},
         {"FLASH_PROPERTY", "DENSITY,4096:FAST,true"},
         {"AT1_DEVICES", "FLASH"},
         {"ST1_DEVICES", "SLASH"},
         {"ST2_DEVICES", "FLUSH,FLASH"},
         {"BPI1_DEVICES", "BPIA"},
         {"BPI2_DEVICES", "BPIB"},
         {"BPI3_DEVICES", "BPIC"},
         // An operation that nobody knows makes the start-up speak.
         {"OPERATION", "ERASE,SPI,PARALLEL:NOSUCH,SPI,PARALLEL:VERIFY,SPI,USB2,NOSUCH"},
         {"BSDL_OPERATION", "BYPASS,PARALLEL"},
         {"PROGRAM_OPTION", "VERIFY,SPI,PARALLEL"},
         {"PROPERTY", "TABLE,ordinary"},
         {"TYPE_BPI_SERIAL_LEAD", "BPIA,BPIB"},
         {"TYPE_MB_SPI_NONE_LEAD", "FLASH"}}};
    return {{"base",
             {"base",
              {{"DEVICE_SUPPORTED", "fam,spi,base"},
               {"PROGRAM_OPTION_PACKAGE", "devpq,fam,spi,base"},
               {"BS", "outs,PARALLEL,USB2:fams,fam"},
               {"SS", "outs,PARALLEL:fams,fam,spi"},
               {"SM", "outs,SVF:fams,fam"},
               {"BSFILE", "outs,SVF:fams,fam"},
               {"DP770", "outs,ZORVA:fams,fam"},
               {"SPI", "outs,STAPL:fams,spi"},
               {"KITECF", "outs,EXPRESSSVF:fams,fam"},
               {"KITEMPM", "outs,EXPRESSQSVF:fams,fam"},
               {"PFF", "outs,NOSUCH:fams,fam"},
               {"IDCODE", "dev,0x00000093:another device,0x00000094"},
               {"NOT_SUPPORTED_PART_IN_MODE", "SS_dev_pkg,a part with a longer name"}}}},
            {"spi.acd", spi},
            {"spi", spi},
            {"fam",
             {"fam",
              {{"OPERATION", "PROGRAM,Bscan,PARALLEL,USB2:VERIFY,SS,PARALLEL"},
               {"BSDL_OPERATION", "BYPASS,PARALLEL:HIGHZ,PARALLEL,USB2"},
               {"PROGRAM_OPTION", "ERASE,Bscan,PARALLEL:VERIFY,Bscan,PARALLEL"},
               {"PROPERTY", "VENDOR,a vendor with a longer name:ERASE,BS"},
               {"PROPERTIES", "OP_ERASE,2,quick,slow:FLAGS,2,FALSE,TRUE"}}}},
            {"dev",
             {"fam",
              {{"PROGRAM_OPTION", "READPROTECT,Bscan,PARALLEL"},
               {"PROPERTY", "PINS,144:NAME,a device with a longer name"},
               {"PROPERTIES", "PACKAGES,3,pq,tq,bg"}}}}};
}
