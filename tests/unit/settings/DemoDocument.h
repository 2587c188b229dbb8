// A description of no driver, small enough to look through.
#pragma once

#include <string>

namespace settings_test {

inline const std::string kDocument = R"(<?xml version="1.0" encoding="utf-8"?>
<protocol_cfg>
    <name>DEMO</name>
    <display>A demonstration</display>
    <code>7</code>
    <empty a="b"/>
    <parameters>
        <parameter display="Pause" type="prop_integer" default="5" defaultValue="6" isNodeProperty="true" isMandatory="false" group="none" min="1" max="9">pause</parameter>
        <parameter display="Frames" type="prop_list" default="long" isMandatory="true" listType="prop_string">frames
            <list_entry>short</list_entry>
            <list_entry>long</list_entry>
        </parameter>
        <parameter display="Size" type="prop_list" default="2" isMandatory="true" disable_list_id="frames" listType="prop_integer" disable_list_entry="1">size
            <list_entry>2</list_entry>
        </parameter>
    </parameters>
    <memtypes>
        <memtype canBitWrite="true" display="Words" mustBitRead="false" blockReadCount="10" blockWriteCount="8" icomTypes="0x21" naturalType="unsignedShort" canBitArrayWrite="false" min="1" max="99" isReadOnly="false">W</memtype>
    </memtypes>
    <tag_uri>
        <tag_field display="Node" default="1">node</tag_field>
    </tag_uri>
    <models>
        <model display="The only one">A
            <memtype_ref min="0" max="98">W</memtype_ref>
        </model>
    </models>
    <conversions display="Conversions">
        <conversion display="AB->BA" icomTypes="0x7fffffe">swap</conversion>
    </conversions>
</protocol_cfg>
)";

}  // namespace settings_test
