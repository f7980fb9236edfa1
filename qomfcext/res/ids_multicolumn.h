// Resource ids of the combination field page (4038).
#pragma once
