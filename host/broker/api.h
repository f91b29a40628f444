// What libvelkbroker.so shows to the programs that link it.
#pragma once

#define VELKBROKER_API __attribute__((visibility("default")))
