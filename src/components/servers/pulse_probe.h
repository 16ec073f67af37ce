#pragma once

// True when a PulseAudio server (or PipeWire's pulse server) answers on its socket. Only looks
// at the socket, so it never starts a server and prints nothing. A server given by network
// address is taken as answering; the connection itself tells otherwise.
bool PulseServerAnswers();
