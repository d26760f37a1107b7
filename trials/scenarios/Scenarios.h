// Everything that can be tried.
#pragma once

#include "harness/Trial.h"

namespace qel::trials {

void killService(Trial& trial);
void killBus(Trial& trial);
void killViewer(Trial& trial);
void killRecorder(Trial& trial);

void killBroker(Trial& trial);
void killPublisher(Trial& trial);
void fullQueueDisk(Trial& trial);

// kill -9 of who stores what was sent, and of the database.
void killCollector(Trial& trial);
void killBrokerOfCollectors(Trial& trial);
void killDatabase(Trial& trial);

void stopService(Trial& trial);
void stopBus(Trial& trial);
void stopWatchers(Trial& trial);

void floodOfDelivery(Trial& trial);
void floodOfDeliveryByThree(Trial& trial);
void floodOfNames(Trial& trial);
void floodOfConfigurations(Trial& trial);
void floodOfApplications(Trial& trial);
void floodOfAlternation(Trial& trial);
void floodOfTags(Trial& trial);
void silentClients(Trial& trial);

void floodOfRecording(Trial& trial);
void floodOfDrive(Trial& trial);

void lyingServices(Trial& trial);

void fullDisk(Trial& trial);
void shortFiles(Trial& trial);

void jumpingClock(Trial& trial);
void movingZone(Trial& trial);

}  // namespace qel::trials
