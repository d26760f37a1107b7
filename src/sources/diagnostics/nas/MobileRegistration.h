// What messages about registration in 2G and 3G change in the picture (24.008, clauses 4.4 and
// 4.7).
#pragma once

#include "sources/diagnostics/Told.h"
#include "sources/diagnostics/nas/MobileMessages.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

void takeLocationRequest(Picture& picture, Told& told);
void takeLocationAccept(const LocationAccept& accept, Picture& picture, Told& told);
void takeLocationReject(std::uint8_t cause, Picture& picture, Told& told);
void takeNewTmsi(const LocationAccept& given, Picture& picture, Told& told);
void takeImsiDetach(Picture& picture, Told& told);
void takeAuthenticationReject(Picture& picture, Told& told);

void takeAttachRequest(std::uint8_t type, Picture& picture, Told& told);
void takeAttachAccept(const PacketAccept& accept, Picture& picture, Told& told);
void takeUpdateRequest(std::uint8_t type, Picture& picture, Told& told);
void takeUpdateAccept(const PacketAccept& accept, Picture& picture, Told& told);
void takePacketReject(std::uint8_t cause, Picture& picture, Told& told);
void takePhonesDetach(std::uint8_t type, Picture& picture, Told& told);
void takeNetworksDetach(std::uint8_t type, Picture& picture, Told& told);
void takeServiceRequest(Picture& picture, Told& told);
void takeServiceAccept(Picture& picture, Told& told);
void takePacketAuthenticationReject(Picture& picture, Told& told);

}  // namespace qel::diagnostics
