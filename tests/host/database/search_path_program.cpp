#include <AcdReader.h>
#include <AcdStore.h>
#include <TarvikException.h>

#include <iostream>
#include <string_view>

#include <unistd.h>

// Prints the search path of a process that sets none; "open" opens the base database, "user" prints whose rights
// the process has, "elsewhere" changes the directory first.

int main(int count, char** arguments) {
    const std::string_view wish = count > 1 ? arguments[1] : "";
    if (wish == "user") {
        std::cout << geteuid() << '\n';
    } else if (wish == "open") {
        try {
            const AcdReader reader;
        } catch (const DataNotFoundException&) {
            return 1;
        }
    } else {
        if (wish == "elsewhere" && chdir("/") != 0) {
            return 1;
        }
        for (const std::string& directory : AcdStore::searchPath()) {
            std::cout << directory << '\n';
        }
    }
    return 0;
}
