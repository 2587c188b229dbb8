// The protocol description that the library carries for the configuration tools.
#pragma once

/// @return the block behind its marker line: the text "compressedXML=" and the length of the
/// compressed document in decimal, a zero byte, the document as a zlib stream, "<<ICOM_XML_END>>"
/// and a zero byte. Lives as long as the library.
const unsigned char* GetXml_MRTU();
