#pragma once

/// Marks what the shared library shows to hosts and plugins; every other symbol stays inside it.
#define ZELMAR_EXPORT __attribute__((visibility("default")))
