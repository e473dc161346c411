#include "EventJniHelper.h"

zemEventJniHelper::~zemEventJniHelper() = default;
