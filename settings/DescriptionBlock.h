// The compressed block in which a driver carries its description.
#pragma once

#include <string>

namespace settings {

/// Inflates the document of a block.
/// @param block  What IProtocol::GetXml() returns: "compressedXML=" and a decimal length, a zero
/// byte, that many bytes of a zlib stream, "<<ICOM_XML_END>>" and a zero byte. Null is refused.
/// Errors: DescriptionError when the block is anything else. At most 16 MiB are inflated.
std::string inflateDescription(const unsigned char* block);

}  // namespace settings
