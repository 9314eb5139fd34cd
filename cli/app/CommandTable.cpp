// The table of the tool's commands.
#include "commands/Command.h"

#include "commands/Commands.h"

const std::vector<Command>& commands() {
    static const std::vector<Command> all{
        {"devices", "List devices: name, family, IDCODE",
         "tarvik devices --family kestrel\n"
         "tarvik devices 'ks*'",
         declareDevices},
        {"families", "List part families and their modes", "tarvik families", declareFamilies},
        {"vocabulary", "List modes, outputs, operations and options", "tarvik vocabulary", declareVocabulary},
        {"show", "Show everything about a device", "tarvik show KS50", declareShow},
        {"operations", "List the operations that a device offers",
         "tarvik operations KS50 --mode BS --output USB2", declareOperations},
        {"options", "List the programming options that a device offers",
         "tarvik options KS50 --mode BS --output USB2 --package TQ144", declareOptions},
        {"bsdl", "List the boundary-scan operations that a device offers", "tarvik bsdl KS50 --output SVF",
         declareBsdl},
        {"operation-options", "List the options that an operation of a device carries",
         "tarvik operation-options KS50 PROGRAM --mode BS", declareOperationOptions},
        {"check", "Tell whether something may be done",
         "tarvik check --mode BS --output USB2\n"
         "tarvik check KS50 --mode SS --package TQ144\n"
         "tarvik check KS50 --mode BS --output USB2 --operation VERIFY",
         declareCheck},
        {"why", "Tell which records lead to an answer, or stand in the way",
         "tarvik why KS50 --mode BS --output USB2 --operation VERIFY\n"
         "tarvik why KS50 --mode SM --package TQ144\n"
         "tarvik why KS50 --mode BS --output USB2 --option PROG --package PQ208\n"
         "tarvik why KS50 --output STAPL --bsdl DOPRELOAD\n"
         "tarvik why KS50 --property FLASH --value TRUE",
         declareWhy},
        {"which", "List the devices that allow an operation or have a property",
         "tarvik which --operation ERASE --mode BS --output USB2\n"
         "tarvik which --property VENDOR=Korvel",
         declareWhich},
        {"property", "Tell the values of a device's property", "tarvik property KS50 VENDOR",
         declareProperty},
        {"spi", "List SPI and BPI flashes, or tell their properties",
         "tarvik spi\n"
         "tarvik spi OVD16 DENSITY",
         declareSpi},
        {"multiboot", "Tell whether a device supports a multiboot arrangement",
         "tarvik multiboot OVD16 --type MB_SPI --width NONE --lead", declareMultiboot},
        {"dump", "Write a table of the manager as smoke tests record it",
         "tarvik dump multiboot\n"
         "tarvik dump operations KS50",
         declareDump},
        {"report", "Write a page about all devices, to look at in a browser", "tarvik report -o report.html",
         declareReport},
        {"lint", "Tell what is wrong with a database",
         "tarvik lint database\n"
         "tarvik lint site company --strict --format sarif\n"
         "tarvik lint --explain T105",
         declareLint},
        {"diff", "Tell which answers two databases give differently",
         "tarvik diff database changed\n"
         "tarvik diff company site:company --json\n"
         "tarvik diff released database --format markdown",
         declareDiff},
        {"batch", "Answer requests for the whole interface, JSON line by line",
         R"(echo '{"id": 1, "call": "getPartFamily", "args": ["KS50"]}' | tarvik batch)", declareBatch},
    };
    return all;
}
