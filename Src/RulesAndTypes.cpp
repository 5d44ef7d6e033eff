#include "RulesAndTypes.h"

#include "InputFiles.h"
#include "TimerStat.h"

RulesAndTypes SetupRulesAndTypes(TimerStat& root, TimerStat& reading, const std::string& rulesFile,
                                 const std::string& typeInfoFile) {
    RulesAndTypes read;
    {
        TimerStat timer(reading, "Reading unique keys");
        read.rules = SetupRules(rulesFile);
    }
    if (typeInfoFile == kDefaultTypeInfoFile) return read;
    TimerStat timer(root, "Read type info");
    read.types = SetupTypeInfo(typeInfoFile);
    return read;
}
