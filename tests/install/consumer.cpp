#include <oecore/oecore.h>

#include <iostream>

int main() {
    OmbStringBuilder text;
    text << "Hello, " << OmbString::literal("OECore");
    std::cout << "consumer: " << text.str() << " " << OECORE_VERSION_STRING << "\n";
    return 0;
}
