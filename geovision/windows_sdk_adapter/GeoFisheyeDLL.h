#pragma once

#include "IFishEye.h"

/// The only way to make an adapter: null when libgeofisheye is not open, or memory is short.
IFishEye* IFishEye_Create();
/// Deletes an adapter made by `IFishEye_Create`; null is accepted. Always true.
bool IFishEye_Release(IFishEye* fishEye);
