// Resource ids of the directory chooser (4006).
#pragma once
