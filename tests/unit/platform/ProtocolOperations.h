// The operations of the protocol interface family in table order, behind the destructor.
#pragma once

#include <vector>

#include "platform/IProtocol.h"
#include "tests/unit/platform/Slots.h"

namespace slots {

inline std::vector<Operation> protocolOperations() {
    using Text = const char*;
    using Tag = const ITag*;
    using Tags = const ITag* const*;
    using Out = unsigned char*;
    using In = const unsigned char*;
    using Stamp = unsigned long long*;
    using Moment = unsigned long long;
    using Status = idal_error_t*;
    return {
        {"ConvertTo", zeroes<void*, Text>()},
        {"GetImpName", zeroes<Text>()},
        {"GetImpVersion", zeroes<int>()},

        {"Config", zeroes<int, Text>()},
        {"CreateTag", zeroes<ITag*, Text>()},
        {"FreeTag", zeroes<void, ITag*>()},
        {"CanBeOptimized", zeroes<bool, Tag, Tag, bool>()},
        {"Start", zeroes<int>()},
        {"Stop", zeroes<int>()},
        {"Read", zeroes<int, Tag, Out>()},
        {"Write", zeroes<int, Tag, In>()},
        {"ReadBlock", zeroes<int, Tag, Out, int>()},
        {"WriteBlock", zeroes<int, Tag, In, int>()},
        {"MaxDatagramItems", zeroes<int, Tag>()},
        {"MaxDatagramLength", zeroes<int, Tag>()},
        {"CanCoexistInDatagram", zeroes<bool, Tag, Tag>()},
        {"ReadDatagram", zeroes<int, Tags, int, Out>()},
        {"GetName", zeroes<Text>()},
        {"GetNextInstanceName", zeroes<Text>()},
        {"GetLastError", zeroes<int>()},
        {"GetLastErrorString", zeroes<Text>()},
        {"GetProtocolVersion", zeroes<int>()},
        {"GetProtocolType", zeroes<int>()},
        {"GetProtocolName", zeroes<Text>()},
        {"GetInfo", zeroes<int, char*, int>()},
        {"GetXml", zeroes<In>()},
        {"IsConverted", zeroes<bool>()},
        {"GetIdent", zeroes<Text>()},
        {"SetIdent", zeroes<void, Text>()},

        {"DoCommand", zeroes<int, Text, char*, int>()},
        {"Extend", zeroes<int, int, void*>()},

        {"CanAddToDatagram", zeroes<bool, Tags, int, Tag>()},
        {"ReadDatagramWithStatus", zeroes<int, Tags, int, Out, Status>()},
        {"MultipleReadSupported", zeroes<bool>()},
        {"MultipleRead", zeroes<int, IMultiRead*>()},
        {"MultipleWriteSupported", zeroes<bool>()},
        {"MultipleWrite", zeroes<int, IMultiWrite*>()},

        {"GetNodeID", zeroes<int, Tag>()},
        {"CanReadBitBlock", zeroes<bool, Tag>()},
        {"ReadBitBlock", zeroes<int, Tag, Out, int>()},
        {"GetInterface", zeroes<void*, Text>()},
        {"MaxUnusedGap", zeroes<int, Tag>()},
        {"IsBefore", zeroes<bool, Tag, Tag>()},
        {"IsAdjacent", zeroes<bool, Tag, Tag>()},
        {"NeedsReadBeforeWrite", zeroes<bool, Tag>()},

        {"CanWriteDatagrams", zeroes<bool, Tag>()},
        {"CanAddToWriteDatagram", zeroes<bool, Tags, int, Tag>()},
        {"WriteDatagramWithStatus", zeroes<int, Tags, int, In, Status>()},
        {"CanWriteBitBlock", zeroes<bool, Tag>()},
        {"WriteBitBlock", zeroes<int, Tag, In, int>()},
        {"readObject", zeroes<int, Tag, IObjectString*>()},
        {"writeObject", zeroes<int, Tag, const IObjectString*>()},

        {"vcsGetCapability", zeroes<int>()},
        {"vcsGetComParams", zeroes<int, char*, int>()},
        {"vcsActivateInterleaved", zeroes<int, unsigned short>()},
        {"createEventChannel(int)", zeroes<IEventChannel*, int>()},
        {"createEventChannel(IEventProcessor*)", zeroes<IEventChannel*, IEventProcessor*>()},
        {"deleteEventChannel", zeroes<void, IEventChannel*>()},
        {"addEventSource", zeroes<int, IEventChannel*, Text>()},
        {"addAlarmEvents", zeroes<int, IEventChannel*, IAlarm*>()},
        {"frontEvent", zeroes<void*, IEventChannel*>()},
        {"popEvent", zeroes<void, IEventChannel*>()},
        {"createAlarm", zeroes<IAlarm*, Text>()},
        {"deleteAlarm", zeroes<void, IAlarm*>()},
        {"listAlarms", zeroes<int, IAlarmProcessor*>()},
        {"quitAlarm", zeroes<int, IAlarm*>()},
        {"createTrend", zeroes<ITrend*, Text>()},
        {"deleteTrend", zeroes<void, ITrend*>()},
        {"readTrend",
         zeroes<int, ITrend*, Moment, Moment, Stamp, unsigned, bool, ITrendProcessor*>()},

        {"hasPlcTimestamp", zeroes<bool, Tag>()},
        {"readWithTimestamp", zeroes<int, Tag, Out, Stamp>()},
        {"readBlockWithTimestamp", zeroes<int, Tag, Out, int, Stamp>()},
        {"readDatagramWithTimestamp", zeroes<int, Tags, int, Out, Status, Stamp>()},
        {"getTagUriFieldCount", zeroes<int>()},
        {"getTagUriFieldName", zeroes<Text, int>()},
        {"getTagUriFieldPosition", zeroes<int, Text>()},
        {"getTagUriField", zeroes<Text, Tag, int, int*>()},
        {"readArrayItem", zeroes<int, Tag, int, Out>()},
        {"writeArrayItem", zeroes<int, Tag, int, In>()},
        {"readBitBlockWithTimestamp", zeroes<int, Tag, Out, int, Stamp>()},
    };
}

/// The hooks that follow: three of the framework's base, then the engine's.
inline std::vector<std::string> hookNames() {
    return {"CreateTagBase",  "GetMaxTm",       "tagUriNames",   "getMaxItemCount",
            "getMaxBitCount", "arrayItemByTag", "doWrite",       "doReadBlock",
            "doWriteBits",    "doReadBits",     "doReadDatagram"};
}

/// The entry of an operation in the table of a protocol object.
inline std::size_t protocolSlot(const std::string& name) {
    std::size_t slot = kDestructors;
    for (const Operation& operation : protocolOperations()) {
        if (operation.name == name) return slot;
        ++slot;
    }
    for (const std::string& hook : hookNames()) {
        if (hook == name) return slot;
        ++slot;
    }
    return static_cast<std::size_t>(-1);
}

}  // namespace slots
